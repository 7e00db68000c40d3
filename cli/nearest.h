// Words that look alike.
#ifndef KESTREL_CLI_NEAREST_H
#define KESTREL_CLI_NEAREST_H

#include <set>
#include <string>
#include <string_view>
#include <vector>

/// The word of the list that is nearest to the given one, whatever the case of letters; empty when
/// none comes near.
std::string nearest(std::string_view word, const std::vector<const char*>& list);

/// Those words, three at most, that are equally near.
std::vector<std::string> nearest_few(std::string_view word, const std::set<std::string>& list);

/// "; did you mean a, b or c?", or an empty text where there are no words.
std::string did_you_mean(const std::vector<std::string>& words);

#endif
