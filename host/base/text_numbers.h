// Gives texts numbers, the same for equal ones, so that they can be compared and listed by number.
#ifndef KESTREL_HOST_BASE_TEXT_NUMBERS_H
#define KESTREL_HOST_BASE_TEXT_NUMBERS_H

#include <cstddef>
#include <functional>
#include <string>
#include <unordered_map>

#include "host/ut_str.h"

/// The element of this number.
template <class Table>
auto& la_at(Table& table, int number) {
  return table[static_cast<std::size_t>(number)];
}

/// Numbers texts from 0 on, in the order in which they come. Those for which compare gives 0 have
/// the same number; it may ignore the case of letters, nothing else. An absent text is an empty
/// one. The texts must outlive this object.
template <int (*compare)(const char*, const char*)>
class la_text_numbers {
 public:
  /// The number of text, which is added if it is new.
  std::size_t number_of(const char* text) {
    return numbers_.try_emplace(present(text), count()).first->second;
  }
  /// The number of text; count() when it has none.
  std::size_t find(const char* text) const {
    const auto found = numbers_.find(present(text));
    return found != numbers_.end() ? found->second : count();
  }
  std::size_t count() const { return numbers_.size(); }

 private:
  struct hash {
    std::size_t operator()(std::string text) const {
      UT_STR::Lower(text.data());
      return std::hash<std::string>()(text);
    }
  };
  struct are_equal {
    bool operator()(const char* a, const char* b) const { return compare(a, b) == 0; }
  };

  static const char* present(const char* text) { return text != nullptr ? text : ""; }

  std::unordered_map<const char*, std::size_t, hash, are_equal> numbers_;
};

#endif
