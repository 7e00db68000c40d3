#include "cli/nearest.h"

#include <algorithm>
#include <numeric>

#include "host/ut_str.h"

namespace {

/// How many characters must be changed, added or left out to make b of a.
std::size_t distance(std::string_view a, std::string_view b) {
  std::vector<std::size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t(0));
  for (std::size_t i = 0; i < a.size(); ++i) {
    std::size_t diagonal = row[0]++;
    for (std::size_t j = 0; j < b.size(); ++j) {
      const std::size_t replaced =
          diagonal + (UT_STR::INCompare(&a[i], &b[j], 1) != 0 ? std::size_t(1) : 0);
      diagonal = row[j + 1];
      row[j + 1] = std::min({replaced, diagonal + 1, row[j] + 1});
    }
  }
  return row.back();
}

}  // namespace

std::string nearest(std::string_view word, const std::vector<const char*>& list) {
  std::string_view best;
  std::size_t least = (word.size() + 1) / 2;  // Of a word that is meant, more than half is right.
  for (const std::string_view known : list) {
    const auto [shorter, longer] = std::minmax({word.size(), known.size()});
    if (longer - shorter >= least) continue;
    const std::size_t found = distance(word, known);
    if (found < least) best = known;
    least = std::min(least, found);
  }
  return std::string(best);
}
