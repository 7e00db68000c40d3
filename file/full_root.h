// Full names that differ in little, for when many of them are asked for.
#ifndef KESTREL_FILE_FULL_ROOT_H
#define KESTREL_FILE_FULL_ROOT_H

#include "file/baslafile.h"
#include "file/path_text.h"

/// Puts full names together from a directory, a root and an extension, each set once for all that
/// follow.
class LA_FULLROOT {
 public:
  /// Of files in the directory, which must outlive this object.
  explicit LA_FULLROOT(const LA_DIR& directory);
  /// Of files that differ from this one in their extensions; it is complete, and outlives this
  /// object.
  explicit LA_FULLROOT(const LA_FULLFILE& file);

  const LA_DIR& directory() const { return directory_; }
  /// From now on names files with this head and name, as LA_FILE::get_root gives them; null for
  /// none.
  void set_root(const char* root);
  /// LA_FULLFILE::get_fullfile of the file with this extension, which has no "/"; null when there
  /// is none. Good until the next call of either.
  const char* with_ext(const char* ext);

 private:
  const LA_DIR& directory_;
  std::size_t directory_length_ = 0;  ///< as it is written; 0 when there is none
  la_path_text normal_directory_;
  la_path_text text_;
  std::size_t root_length_ = 0;  ///< of the text, without extension
  /// For dot, extension and terminator: less than the text has left where its normal form is the
  /// shorter one.
  std::size_t room_ = 0;
};

#endif
