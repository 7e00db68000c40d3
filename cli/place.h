// How the command names files, and places in them.
#ifndef KESTREL_CLI_PLACE_H
#define KESTREL_CLI_PLACE_H

#include <string>

#include "rules/baslarules.h"

/// Names files from the directory that is current when this is made.
class place_names {
 public:
  place_names();

  /// A full name; a relative one if the file lies below the directory.
  std::string file(const std::string& path) const;
  /// "FILE:LINE"; empty if the origin has no line.
  std::string line(const LA_ORIGIN& origin) const;

 private:
  std::string here_;  ///< with "/" at its end
};

#endif
