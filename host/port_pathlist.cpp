#include "host/port_pathlist.h"

#include <algorithm>
#include <optional>
#include <string>
#include <string_view>

#include "host/port_env.h"
#include "host/system/program_place.h"

#ifndef KESTREL_DATA_DIR
#define KESTREL_DATA_DIR "/usr/share/kestrel-launcher"
#endif

namespace Port {

namespace {

using Roots = std::vector<StringBase<char>>;
using Setting = std::optional<std::string>;

Setting setting(const char* variable) {
  const char* value = Port_Env::GetEnv(variable);
  return value != nullptr ? Setting(value) : std::nullopt;
}

void add_roots(Roots& roots, const Setting& list) {
  std::string_view rest = list ? *list : std::string_view();
  while (!rest.empty()) {
    const std::size_t stop = std::min(rest.find(':'), rest.size());
    std::string_view entry = rest.substr(0, stop);
    while (entry.size() > 1 && entry.ends_with('/')) entry.remove_suffix(1);
    if (!entry.empty()) roots.emplace_back(std::string(entry));
    rest.remove_prefix(std::min(stop + 1, rest.size()));
  }
}

/// The data beside the program, or beside this library where that is shared, so that both may be
/// moved; else where the build was told to install it.
std::string installed_root() {
  for (const std::string& place : la_program_places()) {
    std::string root = la_resolved(place + "/share/kestrel-launcher");
    if (!root.empty()) return root;
  }
  return KESTREL_DATA_DIR;
}

}  // namespace

const PathList& CvnenvPath::GetInstance() {
  static PathList list;
  static Setting known[2];
  static bool made = false;

  const Setting now[2] = {setting("MYCORVANE"), setting("CORVANE")};
  if (made && known[0] == now[0] && known[1] == now[1]) return list;
  known[0] = now[0];
  known[1] = now[1];

  Roots roots;
  add_roots(roots, now[0]);
  add_roots(roots, now[1]);
  if (!now[0] && !now[1]) roots.emplace_back(installed_root());
  list = PathList(std::move(roots));
  made = true;
  return list;
}

}  // namespace Port
