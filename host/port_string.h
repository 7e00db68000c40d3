// The string class of the portability layer.
#ifndef KESTREL_HOST_PORT_STRING_H
#define KESTREL_HOST_PORT_STRING_H

#include <cstddef>
#include <string>
#include <utility>

#include "host/ut_str.h"

namespace Port {

/// A string that owns its characters.
template <class Char>
class StringBase {
 public:
  /// How two strings are compared: character by character, or ignoring the case of letters.
  enum CompareType { EXACT = 0, IGNORE_CASE = 1 };

  /// What GetIndexOfString returns when there is no occurrence.
  static constexpr unsigned int NOT_FOUND = 0xFFFFFFFF;

  /// An empty string, or a copy of text.
  StringBase() = default;
  StringBase(const Char* text) : text_(text) {}
  explicit StringBase(std::basic_string<Char> text) : text_(std::move(text)) {}

  /// Append text.
  StringBase& operator+=(const Char* text) {
    text_ += text;
    return *this;
  }
  StringBase& operator+=(const StringBase& other) {
    text_ += other.text_;
    return *this;
  }

  /// 0 when this string and text are equal under kind, else the sign of their order.
  int Compare(const Char* text, CompareType kind) const {
    return kind == EXACT ? text_.compare(text) : UT_STR::ICompare(c_str(), text);
  }
  /// Position of the first occurrence of text, or NOT_FOUND.
  unsigned int GetIndexOfString(const StringBase& text, CompareType kind) const {
    const std::size_t at =
        kind == EXACT ? text_.find(text.text_) : lower().text_.find(text.lower().text_);
    return at == text_.npos ? NOT_FOUND : static_cast<unsigned int>(at);
  }

  /// The characters, with a terminator; good until the string is changed or destroyed.
  const Char* c_str() const noexcept { return text_.c_str(); }
  /// The number of characters, and whether it is 0.
  std::size_t length() const noexcept { return text_.length(); }
  bool empty() const noexcept { return text_.empty(); }

  /// Whether both have the same characters, case included.
  friend bool operator==(const StringBase& a, const StringBase& b) { return a.text_ == b.text_; }

 private:
  StringBase lower() const {
    StringBase copy(*this);
    UT_STR::Lower(copy.text_.data());
    return copy;
  }

  std::basic_string<Char> text_;
};

}  // namespace Port

#endif
