#include "launcher/home.h"

#include <string_view>

void la_home::settle() {
  char cwd[LA_MAX_PATH];
  Port::File::getcwd(cwd, sizeof cwd);
  if (is_sure_ && cwd_ == cwd) return;
  is_sure_ = false;  // If memory runs out here, the next find tries again.
  cwd_ = cwd;
  dir_.set_dir(cwd);
  const char* name = dir_.get_dir();
  // A netlister may have put another directory in its place.
  prefix_ = name != nullptr && Port::File::same(name, ".") ? name : "";
  is_sure_ = true;
}

const char* la_home::relative(const char* path) const {
  const bool is_below =
      path != nullptr && std::string_view(path).starts_with(prefix_) && path[prefix_.size()] != '/';
  return is_below ? path + prefix_.size() : path;
}

Port::FileStatus la_home::status(const char* path) const {
  return la_status_of(relative(path));
}

Port::FileStatus la_status_of(const char* path) {
  const bool is_name = path != nullptr && *path != '\0';
  return is_name ? Port::File::status(path) : Port::FileStatus();
}
