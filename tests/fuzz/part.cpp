// Part names. The first line of an input is a name; the others are a table of devices.
#include "fuzz.h"
#include "host/pm_pic.h"
#include "host/static_acd.h"

/// The name of a part in the spelling of the table; nothing for one that is not valid.
static std::string spelled(const char* name) {
  PM_PIC part(name, 1, PM_BIND_DEFAULT);
  if (!part.is_valid(1, 0)) return "";
  std::string text = part.get_device();
  for (const char* field : {part.get_package(), part.get_speed()}) {
    if (field != nullptr) text.append("-").append(field);
  }
  EXPECT_EQ(lower(text), lower(name));
  return text;
}

void examine(const std::string& input, Tree& tree) {
  const std::string name = input.substr(0, input.find('\n'));
  tree.write("share/data/devices.acd", input.substr(name.size()));
  EXPECT_EQ(spelled(lower(name).c_str()), spelled(name.c_str()));
  const StaticAcdRead table("share/data/devices.acd", nullptr, nullptr, 1, 0, 1);
  for (const auto& [key, value, line] : table.entries()) {
    EXPECT_EQ(spelled(std::string(key).c_str()).empty(), !table.valid()) << key;
  }
}
