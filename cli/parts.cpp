#include "cli/parts.h"

#include <algorithm>
#include <set>
#include <vector>

#include "cli/console.h"
#include "cli/nearest.h"
#include "host/pm_pic.h"

namespace {

/// All names of parts of as many pieces as this one has, which may leave out the last ones.
std::set<std::string> names_like(const std::string& part) {
  const auto dashes = std::count(part.begin(), part.end(), '-');
  std::set<std::string> names;
  for (const std::string& known : PM_PIC::all_parts()) {
    std::size_t end = known.find('-');
    for (auto i = dashes; i > 0 && end != known.npos; --i) end = known.find('-', end + 1);
    names.insert(known.substr(0, end));
  }
  return names;
}

/// The piece that is not known, as far as the table of its device tells.
std::string unknown_piece(const std::string& part, const PM_PIC& device) {
  if (device.get_device() == nullptr) return "there is no device of this name";
  const std::string name = device.get_device();
  std::string rest = part.substr(name.size());
  for (const auto& [known, what] :
       {std::pair(device.get_package(), "package"), std::pair(device.get_speed(), "speed grade")}) {
    const std::size_t end = std::min(rest.find('-', 1), rest.size());
    if (known == nullptr && end > 0) {
      return "device " + name + " has no " + what + " \"" + rest.substr(1, end - 1) + "\"";
    }
    rest.erase(0, end);
  }
  return rest.empty() ? "" : "\"" + rest + "\" stands behind the speed grade";
}

}  // namespace

std::string wrong_with_part(const std::string& part) {
  // What is wrong with the tables has been said. Whether a damaged one lists the part is not known.
  bool is_damaged = false;
  const diversion silence([&](const Port_Msg& message) {
    is_damaged = is_damaged || message.level == PORT_MSG_ERROR;
    return true;
  });
  PM_PIC device(part.c_str(), 1, PM_BIND_DEFAULT);
  const std::string piece =
      is_damaged || device.is_valid(1, 0) != 0 ? "" : unknown_piece(part, device);
  if (piece.empty()) return "";
  const std::string meant = did_you_mean(nearest_few(part, names_like(part)));
  return "part " + part + ": " + piece + meant + (meant.empty() ? "; " : " ") +
         "--list-parts prints all parts";
}
