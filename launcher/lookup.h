// Where a netlist is looked for, and which files are passed over.
#ifndef KESTREL_LAUNCHER_LOOKUP_H
#define KESTREL_LAUNCHER_LOOKUP_H

#include <set>
#include <span>
#include <string>

#include "file/baslafile.h"
#include "file/full_root.h"
#include "host/port_file.h"
#include "launcher/explanation.h"
#include "launcher/home.h"

/// A file, and what was known of it when it was found.
struct la_found_file {
  LA_FULLFILE file;
  Port::FileStatus status;
};

/// Looks for the files of one name: where the name says, then in the search directories. What a
/// failed run has left counts as missing.
class la_lookup {
 public:
  /// All that it is given must outlive it. searchpaths: the search directories; their roots are set
  /// here. home is the current directory. why may be null; else it gets every place that is looked
  /// at.
  la_lookup(const LA_FULLFILE& given, std::span<LA_FULLROOT> searchpaths, const la_home& home,
            LA_EXPLANATION* why);

  /// Looks for the file with this extension, and writes it into found if there is one.
  bool find_file(const char* ext, la_found_file& found);

 private:
  bool find_in_searchpaths(const char* ext, la_found_file& found);
  Port::FileStatus look_at(const char* path);
  void note(LA_EXPLANATION::SIGHTING sighting, const char* path) const;
  std::string name_with(const char* ext) const;

  const LA_FULLFILE& given_;
  const std::span<LA_FULLROOT> searchpaths_;
  const la_home& home_;
  LA_EXPLANATION* const why_;
  const std::string root_;      ///< head and name
  LA_FULLROOT beside_;          ///< where the name says
  bool has_searched_ = false;   ///< the roots of the search directories are set
  std::set<std::string> told_;  ///< what the user knows to be left by a failed run
};

/// Tells that a file which a failed run has left is passed over.
void report_left_by_failure(const char* path);

#endif
