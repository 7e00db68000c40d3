// Device part names: DEVICE[-PACKAGE[-SPEED]], in any case of letters.
#ifndef KESTREL_HOST_PM_PIC_H
#define KESTREL_HOST_PM_PIC_H

#include <string>
#include <vector>

#include "host/ut_str.h"

/// How a part name is bound to a device; the one way there is.
enum PM_PARTNAME_BINDING { PM_BIND_DEFAULT = 0 };

/// The device that a part name names, as the device tables of the installation know it: in each
/// installation root data/devices.acd, with records DEVICE = FAMILY, PACKAGE|PACKAGE, SPEED|SPEED.
/// The first root whose table lists the device counts. A device may have "-" in its own name: the
/// longest one that the part name begins with is taken.
class PM_PIC {
 public:
  /// The device named by part_name. The other arguments are not used.
  PM_PIC(const char* part_name, unsigned char, PM_PARTNAME_BINDING binding);
  /// A device from its fields, any of which may be null; three null pointers name no device.
  PM_PIC(const char* family, const char* device, const char* package);
  virtual ~PM_PIC() = default;

  /// 1 when the device is known and has the package and the speed grade that the part name
  /// names, else 0; also 0 when a device table on the way to it is damaged. The arguments are not
  /// used.
  virtual unsigned char is_valid(unsigned char, int);

  /// The fields in the spelling of the device table; null for what the part name does not name or
  /// the table does not list. The texts belong to this object.
  char* get_family() const { return field(family_); }
  char* get_device() const { return field(device_); }
  char* get_package() const { return field(package_); }
  char* get_speed() const { return field(speed_); }

  /// All parts of the device tables, as precisely as they can be named, in the order of the tables.
  static std::vector<std::string> all_parts();

 private:
  static char* field(const la_text& text) { return const_cast<char*>(text.get()); }

  la_text family_;
  la_text device_;
  la_text package_;
  la_text speed_;
  bool valid_ = false;
};

#endif
