#include "file/path_parts.h"

#include <utility>

static la_text la_text_of(std::string_view text) {
  return text.empty() ? la_text() : la_text(text.data(), text.size());
}

std::optional<la_path_parts> la_split_dir(la_path_text dirname) {
  la_path_parts parts;
  std::string_view rest = dirname.view();
  if (rest.empty()) return std::nullopt;
  if (rest.starts_with("//")) {
    rest.remove_prefix(2);
    const std::string_view host = rest.substr(0, rest.find('/'));
    if (host.empty()) return std::nullopt;
    parts.unc_host = la_text_of(host);
    rest.remove_prefix(host.size());
  } else if (rest.size() > 1 && UT_STR::IsAlpha(rest[0]) && rest[1] == ':') {
    parts.drive = la_text_of(rest.substr(0, 1));
    rest.remove_prefix(2);
  }
  if (!rest.empty()) {
    const std::size_t start = dirname.length() - rest.size();
    parts.dir = dirname.add_slash().chars() + start;
  }
  if (!dirname.fits()) return std::nullopt;
  return parts;
}

void la_split_tail(std::string_view tail, la_path_parts& parts) {
  const std::size_t dot = tail.rfind('.');
  if (dot != tail.npos) parts.ext = la_text_of(tail.substr(dot + 1));
  parts.name = la_text_of(tail.substr(0, dot));
}

std::optional<la_path_parts> la_split_path(const char* path) {
  if (path == nullptr || *path == '\0') return std::nullopt;
  const la_path_text text(path);
  if (!text.fits()) return std::nullopt;
  la_path_parts parts;
  const std::size_t tail = text.view().rfind('/') + 1;
  if (tail > 0) {
    la_path_text dirname = text;
    dirname.cut(tail);
    std::optional<la_path_parts> split = la_split_dir(dirname);
    if (!split) return std::nullopt;
    parts = std::move(*split);
  }
  la_split_tail(text.view().substr(tail), parts);
  return parts;
}
