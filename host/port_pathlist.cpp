#include "host/port_pathlist.h"

#include <unistd.h>

#include <algorithm>
#include <climits>
#include <cstdlib>
#include <optional>
#include <string>
#include <string_view>

#include "host/port_env.h"
#include "host/port_file.h"

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

std::string installed_root() {
  char program[PATH_MAX];
  const ssize_t length = ::readlink("/proc/self/exe", program, sizeof program);
  if (length > 0 && length < static_cast<ssize_t>(sizeof program)) {
    const std::string path(program, static_cast<std::size_t>(length));
    const std::string beside = path.substr(0, path.rfind('/')) + "/../share/kestrel-launcher";
    char* resolved = ::realpath(beside.c_str(), nullptr);
    if (resolved != nullptr) {
      std::string root(resolved);
      ::free(resolved);
      return root;
    }
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
