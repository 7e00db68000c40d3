// Where the data files of a device are.
#ifndef KESTREL_HOST_PM_DEVKEY_H
#define KESTREL_HOST_PM_DEVKEY_H

#include <string>

#include "host/pm_pic.h"

/// The data file of a given name for a device: data/FAMILY/NAME in the first installation root
/// that holds it; data/NAME for a device without family.
class PM_DEVKEY {
 public:
  /// device is read during the call only. The flags are not used.
  PM_DEVKEY(const char* file_name, PM_PIC* device, unsigned char, unsigned char, unsigned char);

  /// The path of the file, good as long as this object; the empty string when no root holds it.
  const char* getlocation() const { return location_.c_str(); }

 private:
  std::string location_;
};

#endif
