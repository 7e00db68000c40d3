// Blanks: the space and the tab.
#ifndef KESTREL_HOST_BASE_BLANKS_H
#define KESTREL_HOST_BASE_BLANKS_H

#include <string_view>

constexpr bool la_is_blank(char c) {
  return c == ' ' || c == '\t';
}

/// s behind the blanks at its front.
template <class Char>
constexpr Char* la_skip_blanks(Char* s) {
  while (la_is_blank(*s)) ++s;
  return s;
}

/// text without the blanks at both ends.
constexpr std::string_view la_trimmed(std::string_view text) {
  const char* start = text.data();
  const char* end = start + text.size();
  while (start != end && la_is_blank(*start)) ++start;
  while (start != end && la_is_blank(end[-1])) --end;
  return {start, end};
}

#endif
