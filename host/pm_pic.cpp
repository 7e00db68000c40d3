#include "host/pm_pic.h"

#include <algorithm>
#include <set>
#include <string>
#include <utility>

#include "host/port_pathlist.h"
#include "host/static_acd.h"

namespace {

enum : short { FAMILY_FIELD, PACKAGE_FIELD, SPEED_FIELD };

/// Part number index of a field of a device's record; absent past the last one.
la_text entry(const StaticAcdRead& table, const char* device, short field, short index) {
  const Port::StringBase<char> text = table.GetStringByKey(device, ",", field, "|", index);
  return text.empty() ? la_text() : la_text(text.c_str());
}

/// The device of the table that name begins with, as a whole or up to a "-"; the longest of them.
std::string device_of(const StaticAcdRead& table, const std::string& name) {
  std::string longest;
  for (const auto& [device, value, line] : table.entries()) {
    const char after = name.c_str()[std::min(device.size(), name.size())];
    if (device.size() > longest.size() && (after == '\0' || after == '-') &&
        UT_STR::INCompare(name.c_str(), device.data(), device.size()) == 0) {
      longest = device;
    }
  }
  return longest;
}

/// Takes the text up to the next "-" from the front of rest, which begins with a "-" itself, and
/// stores the entry of the field that it names. False when there is no such entry.
bool take_entry(std::string& rest, const StaticAcdRead& table, const char* device, short field,
                la_text& stored) {
  if (rest.empty()) return true;
  const std::size_t stop = std::min(rest.find('-', 1), rest.size());
  const std::string name = rest.substr(1, stop - 1);
  rest.erase(0, stop);
  for (short i = 0;; ++i) {
    la_text listed = entry(table, device, field, i);
    if (listed == nullptr) return false;
    if (UT_STR::ICompare(listed, name.c_str()) == 0) {
      stored = std::move(listed);
      return true;
    }
  }
}

/// Each name with "-" and each entry of the field behind it; the names as they are where the field
/// lists nothing.
std::vector<std::string> extended(const std::vector<std::string>& names, const StaticAcdRead& table,
                                  const char* device, short field) {
  std::vector<std::string> longer;
  for (const std::string& name : names) {
    for (short i = 0; entry(table, device, field, i) != nullptr; ++i) {
      longer.push_back(name + "-" + entry(table, device, field, i).get());
    }
  }
  return longer.empty() ? names : longer;
}

}  // namespace

std::vector<std::string> PM_PIC::all_parts() {
  std::vector<std::string> parts;
  std::set<std::string> known;
  for (const Port::StringBase<char>& root : Port::CvnenvPath::GetInstance()) {
    const std::string path = std::string(root.c_str()) + "/data/devices.acd";
    const StaticAcdRead table(path.c_str(), nullptr, nullptr, 1, 0, 1);
    for (const auto& [key, value, line] : table.entries()) {
      const std::string device(key);
      if (!known.insert(device).second) continue;
      const auto packaged = extended({device}, table, device.c_str(), PACKAGE_FIELD);
      for (std::string& part : extended(packaged, table, device.c_str(), SPEED_FIELD)) {
        parts.push_back(std::move(part));
      }
    }
  }
  return parts;
}

PM_PIC::PM_PIC(const char* part_name, unsigned char /*unused*/, PM_PARTNAME_BINDING /*binding*/) {
  bool readable = true;
  for (const Port::StringBase<char>& root : Port::CvnenvPath::GetInstance()) {
    const std::string path = std::string(root.c_str()) + "/data/devices.acd";
    const StaticAcdRead table(path.c_str(), nullptr, nullptr, 1, 0, 1);
    readable = readable && table.valid();
    const std::string device = device_of(table, part_name);
    if (device.empty()) continue;
    std::string rest = part_name + device.size();
    device_ = device.c_str();
    family_ = entry(table, device_, FAMILY_FIELD, 0);
    valid_ = readable && take_entry(rest, table, device_, PACKAGE_FIELD, package_) &&
             take_entry(rest, table, device_, SPEED_FIELD, speed_) && rest.empty();
    return;
  }
}

PM_PIC::PM_PIC(const char* family, const char* device, const char* package)
    : family_(family), device_(device), package_(package) {}

unsigned char PM_PIC::is_valid(unsigned char /*unused*/, int /*unused*/) {
  return valid_;
}
