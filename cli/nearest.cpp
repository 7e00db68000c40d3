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

/// The words of the list, so many at most, that are nearest to the given one.
std::vector<std::string_view> nearest_of(std::string_view word, const auto& list,
                                         std::size_t most) {
  std::vector<std::string_view> best;
  // Of a word that is meant, more than half is right.
  std::size_t limit = (word.size() + 1) / 2;
  for (const std::string_view known : list) {
    const auto [shorter, longer] = std::minmax({word.size(), known.size()});
    if (longer - shorter >= limit) continue;
    const std::size_t found = distance(word, known);
    if (found >= limit) continue;
    if (best.empty() || found + 1 < limit) best.clear();
    if (best.size() < most) best.push_back(known);
    limit = found + 1;
  }
  return best;
}

}  // namespace

std::string nearest(std::string_view word, const std::vector<const char*>& list) {
  const std::vector<std::string_view> words = nearest_of(word, list, 1);
  return words.empty() ? "" : std::string(words.front());
}

std::vector<std::string> nearest_few(std::string_view word, const std::set<std::string>& list) {
  const std::vector<std::string_view> words = nearest_of(word, list, 3);
  return {words.begin(), words.end()};
}

std::string did_you_mean(const std::vector<std::string>& words) {
  std::string text;
  for (std::size_t i = 0; i < words.size(); ++i) {
    text += i == 0 ? "; did you mean " : i + 1 < words.size() ? ", " : " or ";
    text += words[i];
  }
  return text.empty() ? text : text + "?";
}
