// Numbers for texts.
#ifndef KESTREL_HOST_TEXT_NUMBERS_H
#define KESTREL_HOST_TEXT_NUMBERS_H

#include <vector>

#include "host/hash_index.h"

/// Numbers texts from 0 on, in the order in which they come. Those for which compare gives 0 have
/// the same number; an absent text is an empty one. The texts must outlive this object.
template <int (*compare)(const char*, const char*)>
class la_text_numbers {
 public:
  /// The number of text, which is added if it is new.
  std::size_t number_of(const char* text) {
    if (text == nullptr) text = "";
    int& number = index_.place(la_hash(text), is_text(text));
    if (number == la_hash_index::NONE) {
      number = static_cast<int>(count());
      texts_.push_back(text);
    }
    return static_cast<std::size_t>(number);
  }
  /// The number of text; count() when it has none.
  std::size_t find(const char* text) const {
    const int number = index_.find(la_hash(text), is_text(text));
    return number != la_hash_index::NONE ? static_cast<std::size_t>(number) : count();
  }
  std::size_t count() const { return texts_.size(); }

 private:
  auto is_text(const char* text) const {
    return [this, text](int number) { return compare(la_at(texts_, number), text) == 0; };
  }

  std::vector<const char*> texts_;
  la_hash_index index_;
};

#endif
