#include "file/normal_form.h"

/// Takes the last directory off path, which ends with "/". False if there is none.
static bool leave_directory(la_path_text& path) {
  for (int slashes = 0; slashes < 2; ++slashes) {
    const std::size_t slash = path.view().rfind('/');
    if (slash == std::string_view::npos) return false;
    path.cut(slash);
  }
  path.add("/");
  return true;
}

bool la_is_normal(std::string_view path) {
  return path.find("./") == path.npos && path.find('\\') == path.npos;
}

void la_normalise(la_path_text& path) {
  if (la_is_normal(path.view()) || !path.fits()) return;
  const la_path_text internal(path.chars());
  la_path_text normal;
  for (std::string_view rest = internal.view(); !rest.empty();) {
    if (rest.starts_with("../")) {
      if (!leave_directory(normal)) return;
      rest.remove_prefix(3);
    } else if (rest.starts_with("./")) {
      rest.remove_prefix(2);
    } else {
      normal.add(rest.substr(0, 1));
      rest.remove_prefix(1);
    }
  }
  path = normal;
}
