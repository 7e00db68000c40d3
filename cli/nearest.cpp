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
  const auto closer = [word](const char* a, const char* b) {
    return distance(word, a) < distance(word, b);
  };
  const auto best = std::min_element(list.begin(), list.end(), closer);
  return best != list.end() && distance(word, *best) * 2 < word.size() ? *best : "";
}
