// Reads the files of names that --names-from gives.
#ifndef KESTREL_CLI_NAMES_H
#define KESTREL_CLI_NAMES_H

#include <string>
#include <vector>

/// Appends the names in a file, one per line; "-" is standard input. Returns an empty text, or what
/// is wrong.
std::string read_names(const std::string& file, std::vector<std::string>& names);

#endif
