#include "cli/launching.h"

#include <algorithm>
#include <vector>

#include "cli/tasks.h"
#include "host/port_file.h"

std::string complete_directories(settings& set) {
  for (std::string& dir : set.search_dirs) {
    const char* full_name = LA_DIR(dir.c_str()).get_dir();
    if (full_name == nullptr) return "--search-dir: not the name of a directory: \"" + dir + "\"";
    dir = full_name;
  }
  if (set.output_dir == nullptr) return {};
  const char* output_dir = LA_DIR(set.output_dir).get_dir();
  if (output_dir != nullptr && Port::File::isdirectory(output_dir)) return {};
  return std::string("--output-dir: there is no directory \"") + set.output_dir + "\"";
}

LA_LAUNCHER launcher_of(const settings& set) {
  std::vector<const char*> search_dirs;
  for (const std::string& dir : set.search_dirs) search_dirs.push_back(dir.c_str());
  std::vector<const char*> libraries = set.libraries;
  return {set.part,
          search_dirs.data(),
          static_cast<short>(search_dirs.size()),
          libraries.data(),
          static_cast<short>(libraries.size()),
          set.output_dir,
          set.user_rules,
          set.force,
          set.ignore_timestamps,
          set.ignore_locs,
          set.add_pads,
          set.quiet,
          set.aul};
}

int worse(int status, short result) {
  return std::max(status, result == LA_FAILED      ? int{FAILED}
                          : result == LA_NOT_FOUND ? int{NOT_ALL_FOUND}
                                                   : int{ALL_FOUND});
}
