// Says what is wrong with a part name that is not valid.
#ifndef KESTREL_CLI_PARTS_H
#define KESTREL_CLI_PARTS_H

#include <string>

/// Which piece of a part name is not known, and the names that are nearest; an empty text for a
/// part that is valid.
std::string wrong_with_part(const std::string& part);

#endif
