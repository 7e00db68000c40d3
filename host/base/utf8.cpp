#include "host/base/utf8.h"

#include <algorithm>

namespace {

/// The forms of a character: how many bytes, what the first byte looks like, the smallest code.
struct form {
  std::size_t bytes;
  unsigned int mask;
  unsigned int lead;
  char32_t least;
};
constexpr form FORMS[] = {
    {1, 0x80, 0x00, 0}, {2, 0xE0, 0xC0, 0x80}, {3, 0xF0, 0xE0, 0x800}, {4, 0xF8, 0xF0, 0x10000}};

constexpr bool is_character(char32_t code) {
  return code <= 0x10FFFF && !(code >= 0xD800 && code <= 0xDFFF);
}

void append(std::string& text, char32_t code) {
  if (!is_character(code)) code = UTF8_REPLACEMENT;
  const form* f = std::find_if(std::rbegin(FORMS), std::rend(FORMS) - 1,
                               [code](const form& one) { return code >= one.least; })
                      .base() -
                  1;
  text += static_cast<char>(f->lead | (code >> (6 * (f->bytes - 1))));
  for (std::size_t i = f->bytes - 1; i > 0; --i) {
    text += static_cast<char>(0x80 | ((code >> (6 * (i - 1))) & 0x3F));
  }
}

}  // namespace

utf8_character first_character(std::string_view text) {
  const utf8_character invalid = {UTF8_REPLACEMENT, std::min<std::size_t>(text.size(), 1), false};
  if (text.empty()) return invalid;
  const auto lead = static_cast<unsigned char>(text[0]);
  for (const form& f : FORMS) {
    if ((lead & f.mask) != f.lead) continue;
    if (text.size() < f.bytes) return invalid;
    char32_t code = lead & ~f.mask;
    for (std::size_t i = 1; i < f.bytes; ++i) {
      const auto byte = static_cast<unsigned char>(text[i]);
      if ((byte & 0xC0) != 0x80) return invalid;
      code = code << 6 | (byte & 0x3F);
    }
    return code >= f.least && is_character(code) ? utf8_character{code, f.bytes, true} : invalid;
  }
  return invalid;
}

std::string to_utf8(std::wstring_view text) {
  std::string result;
  for (const wchar_t c : text) append(result, static_cast<char32_t>(c));
  return result;
}

std::wstring from_utf8(std::string_view text) {
  std::wstring result;
  while (!text.empty()) {
    const utf8_character c = first_character(text);
    result += static_cast<wchar_t>(c.code);
    text.remove_prefix(c.bytes);
  }
  return result;
}
