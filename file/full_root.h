// Full names that differ in their extensions only, for when many of them are asked for.
#ifndef KESTREL_FILE_FULL_ROOT_H
#define KESTREL_FILE_FULL_ROOT_H

#include <cstddef>

#include "file/baslafile.h"
#include "file/path_text.h"

/// A full name that lacks its extension.
class LA_FULLROOT {
 public:
  /// Of the files with this head and name (LA_FILE::get_root) in the directory.
  LA_FULLROOT(const LA_DIR& directory, const char* root);
  /// Of the files that differ from this one, which has a name and is complete.
  explicit LA_FULLROOT(const LA_FULLFILE& file);

  /// LA_FULLFILE::get_fullfile of the file with this extension, which has no "/"; null stands for
  /// no extension. Null when there is none or it does not fit. Good until the next call.
  const char* with_ext(const char* ext);

 private:
  la_path_text text_;       ///< the root, and behind it the extension of the last call
  std::size_t length_ = 0;  ///< of the root
  /// For dot, extension and terminator. They have to fit behind the name as it was before it was
  /// brought into its normal form, as in LA_FULLFILE.
  std::size_t room_ = 0;
};

#endif
