#include "cli/loading.h"

#include <string>
#include <vector>

#include "cli/console.h"
#include "cli/parts.h"
#include "cli/place.h"
#include "host/port_file.h"
#include "host/port_pathlist.h"

namespace {

/// Where a file may lie: a line for each installation root.
std::vector<std::string> places_of(const std::string& file) {
  std::vector<std::string> places;
  for (const Port::StringBase<char>& root : Port::CvnenvPath::GetInstance()) {
    const std::string path = root.c_str() + ("/data/" + file);
    places.push_back("  " + path + (Port::File::missing(path.c_str()) ? " (not there)" : ""));
  }
  if (places.empty()) places.emplace_back("  nothing: MYCORVANE and CORVANE name no directory");
  places.emplace_back("set CORVANE to the installation root, the directory that holds data");
  return places;
}

}  // namespace

bool tell_of_device_tables() {
  for (const Port::StringBase<char>& root : Port::CvnenvPath::GetInstance()) {
    if (!Port::File::missing((root.c_str() + std::string("/data/devices.acd")).c_str()))
      return true;
  }
  complain("there is no device table; looked for");
  complain(places_of("devices.acd"));
  return false;
}

void tell_of_loading(const LA_RULE_SET* rules, const settings& set, Port_MsgLevel level) {
  if (rules == nullptr) return;
  if (!rules->is_valid && set.part != nullptr && tell_of_device_tables()) {
    const std::string wrong = wrong_with_part(set.part);
    if (!wrong.empty()) complain(wrong);
  }
  if (rules->unfinished_statement.line > 0) {
    const std::string place = place_names().line(rules->unfinished_statement);
    complain(place + ": the statement that begins here has no end");
  }
  if (rules->is_valid && rules->rules.count == 0) {
    complain(level, "there are no rules; looked for");
    complain(places_of("larules.acd"));
  }
}
