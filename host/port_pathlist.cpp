#include "host/port_pathlist.h"

#include <dlfcn.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
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

/// The directory at path with its links resolved; empty when there is none.
std::string resolved(const std::string& path) {
  const std::unique_ptr<char, decltype(&::free)> full(::realpath(path.c_str(), nullptr), ::free);
  return full ? full.get() : "";
}

std::string directory_of(const std::string& path) {
  return path.substr(0, path.rfind('/') + 1);
}

/// The data beside the program, or beside this library where that is shared, so that both may be
/// moved; else where the build was told to install it.
std::string installed_root() {
  Dl_info library = {};
  ::dladdr(reinterpret_cast<void*>(&installed_root), &library);
  const std::string bin = directory_of(resolved("/proc/self/exe"));
  const std::string lib = directory_of(resolved(library.dli_fname ? library.dli_fname : ""));
  // Libraries may lie one level deeper, in a directory for the kind of machine.
  for (const std::string& place : {bin + "..", lib + "..", lib + "../.."}) {
    std::string root = resolved(place + "/share/kestrel-launcher");
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
