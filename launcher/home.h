// The directory that is current when a find begins.
#ifndef KESTREL_LAUNCHER_HOME_H
#define KESTREL_LAUNCHER_HOME_H

#include <string>

#include "file/baslafile.h"
#include "host/port_file.h"

/// Home: where relative names count from, and where the process is again when a find ends. Files
/// below it are asked for by relative names, which spares the file system the way down to it.
class la_home {
 public:
  /// Makes the current directory home.
  void settle();
  /// Forgets that its name leads to it: something has run that may have moved it.
  void doubt() { is_sure_ = false; }

  /// The directory; empty when it is gone, or its name is too long or holds a backslash.
  const LA_DIR& dir() const { return dir_; }
  /// The shortest name for path while home is the current directory.
  const char* relative(const char* path) const;
  /// What is known of a file, asked for from home; path may be null.
  Port::FileStatus status(const char* path) const;

 private:
  std::string cwd_;  ///< the directory as the system names it
  LA_DIR dir_;
  std::string prefix_;  ///< its name, with "/" at its end; empty when that does not lead to it
  bool is_sure_ = false;
};

/// What is known of a file, wherever the process is; path may be null.
Port::FileStatus la_status_of(const char* path);

#endif
