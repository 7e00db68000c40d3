// Wide text and UTF-8.
#ifndef KESTREL_HOST_BASE_UTF8_H
#define KESTREL_HOST_BASE_UTF8_H

#include <string>
#include <string_view>

/// One character taken from the front of UTF-8 text.
struct utf8_character {
  char32_t code;      ///< the character; REPLACEMENT when the bytes are not UTF-8
  std::size_t bytes;  ///< how many bytes it takes; 1 when they are not UTF-8, 0 at the end
  bool valid;
};

/// What stands for bytes that are not UTF-8.
inline constexpr char32_t UTF8_REPLACEMENT = 0xFFFD;

/// The first character of text.
utf8_character first_character(std::string_view text);

/// Between wide text and UTF-8. What is not valid becomes UTF8_REPLACEMENT.
std::string to_utf8(std::wstring_view text);
std::wstring from_utf8(std::string_view text);

#endif
