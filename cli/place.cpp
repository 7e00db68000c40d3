#include "cli/place.h"

#include "file/baslafile.h"

place_names::place_names() {
  const char* here = LA_DIR(static_cast<const char*>(nullptr)).get_dir();
  here_ = here != nullptr ? here : "";
}

std::string place_names::file(const std::string& path) const {
  const bool is_below = !here_.empty() && path.starts_with(here_);
  return is_below ? path.substr(here_.size()) : path;
}

std::string place_names::line(const LA_ORIGIN& origin) const {
  return origin.line == 0 ? "" : file(origin.file) + ":" + std::to_string(origin.line);
}
