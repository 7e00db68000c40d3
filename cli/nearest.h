// Words that look alike.
#ifndef KESTREL_CLI_NEAREST_H
#define KESTREL_CLI_NEAREST_H

#include <string>
#include <string_view>
#include <vector>

/// The word of the list that is nearest to the given one, whatever the case of letters; empty when
/// none comes near.
std::string nearest(std::string_view word, const std::vector<const char*>& list);

#endif
