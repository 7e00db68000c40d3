// Where this program has been installed.
#ifndef KESTREL_HOST_SYSTEM_PROGRAM_PLACE_H
#define KESTREL_HOST_SYSTEM_PROGRAM_PLACE_H

#include <string>
#include <vector>

/// The directories that share/ may lie in: that above the running program's, and those above this
/// library's where that is shared.
std::vector<std::string> la_program_places();

/// The full name of path with its links resolved; empty when nothing is there.
std::string la_resolved(const std::string& path);

#endif
