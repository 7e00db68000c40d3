#include "host/ut_str.h"

#include <charconv>
#include <cstring>
#include <string_view>

#include "host/base/blanks.h"

namespace {

constexpr int lower(char c) {
  const auto byte = static_cast<unsigned char>(c);
  return byte >= 'A' && byte <= 'Z' ? byte + ('a' - 'A') : byte;
}

}  // namespace

char* UT_STR::Copy(char* dest, const char* src, std::size_t size) {
  *dest = '\0';
  return Cat(dest, src, size);
}

char* UT_STR::Cat(char* dest, const char* src, std::size_t size) {
  const std::size_t used = Len(dest);
  const std::size_t added = Len(src);
  if (used + added >= size) return nullptr;
  std::memcpy(dest + used, src, added + 1);
  return dest;
}

char* UT_STR::Dup(const char* s) {
  const std::size_t size = Len(s) + 1;
  return static_cast<char*>(std::memcpy(new char[size], s, size));
}

int UT_STR::Compare(const char* a, const char* b) {
  return std::strcmp(a, b);
}

int UT_STR::ICompare(const char* a, const char* b) {
  return INCompare(a, b, static_cast<std::size_t>(-1));
}

int UT_STR::NCompare(const char* a, const char* b, std::size_t n) {
  return std::strncmp(a, b, n);
}

int UT_STR::INCompare(const char* a, const char* b, std::size_t n) {
  for (std::size_t i = 0; i < n; ++i) {
    if (a[i] != b[i]) {
      const int difference = lower(a[i]) - lower(b[i]);
      if (difference != 0) return difference;
    }
    if (a[i] == '\0') return 0;
  }
  return 0;
}

int UT_STR::_Compare(const char* a, const char* b) {
  return Compare(a, b);
}

char* UT_STR::FindChar(char* s, int c) {
  return std::strchr(s, c);
}

char* UT_STR::RFindChar(char* s, int c) {
  return std::strrchr(s, c);
}

void UT_STR::Trim(char* s) {
  const std::string_view trimmed = la_trimmed(s);
  std::memmove(s, trimmed.data(), trimmed.size());
  s[trimmed.size()] = '\0';
}

unsigned char UT_STR::AllBlank(const char* s) {
  return *la_skip_blanks(s) == '\0';
}

char UT_STR::GetToken(char* line, char* token, const char* delimiters) {
  const bool blanks_end = std::strchr(delimiters, ' ') != nullptr;
  const char* start = la_skip_blanks(line);
  const char* end = start + std::strcspn(start, delimiters);
  if (blanks_end) {
    const char* tab =
        static_cast<const char*>(std::memchr(start, '\t', static_cast<std::size_t>(end - start)));
    if (tab != nullptr) end = tab;
  }
  const auto length = static_cast<std::size_t>(end - start);
  std::memcpy(token, start, length);
  token[length] = '\0';

  const char delimiter = *end == '\t' ? ' ' : *end;
  const char* rest = *end == '\0' ? end : end + 1;
  std::memmove(line, rest, Len(rest) + 1);
  return delimiter;
}

unsigned char UT_STR::StrToL(const char* s, long& value) {
  return StrToL(s, Len(s), value);
}

unsigned char UT_STR::StrToL(const char* s, std::size_t length, long& value) {
  const char* end = s + length;
  if (length > 1 && s[0] == '+' && s[1] != '-') ++s;
  long number = 0;
  const auto [stop, error] = std::from_chars(s, end, number);
  if (error != std::errc() || stop != end) return 0;
  value = number;
  return 1;
}

void UT_STR::Lower(char* s) {
  for (; *s != '\0'; ++s) *s = static_cast<char>(lower(*s));
}

la_text::la_text(const char* chars, std::size_t length) : chars_(new char[length + 1]) {
  std::memcpy(chars_.get(), chars, length);
  chars_[length] = '\0';
}
