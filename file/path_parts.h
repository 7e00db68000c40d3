// Splits a path into its parts.
#ifndef KESTREL_FILE_PATH_PARTS_H
#define KESTREL_FILE_PATH_PARTS_H

#include <optional>
#include <string_view>

#include "file/path_text.h"
#include "host/ut_str.h"

/// The parts of a path; what it does not have is null. There is a host or a drive, not both.
struct la_path_parts {
  la_text unc_host;  ///< without slashes
  la_text drive;     ///< the letter
  la_text dir;       ///< with "/" at its end
  la_text name;
  la_text ext;  ///< without dot

  bool is_absolute() const { return dir != nullptr && dir[0] == '/'; }
};

/// Host, drive and directory of a directory name in the internal form. Nothing for an empty name, a
/// UNC name without host, and one that does not fit.
std::optional<la_path_parts> la_split_dir(la_path_text dirname);
/// Splits a file name without directory at its last dot, into name and ext of parts.
void la_split_tail(std::string_view tail, la_path_parts& parts);
/// All parts of a path. Nothing for null, an empty path, one that does not fit, and one whose
/// directory cannot be split.
std::optional<la_path_parts> la_split_path(const char* path);

#endif
