#include "host/base/line_cutter.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace {

/// How many bytes at the end of the text are the start of a UTF-8 character that goes on.
std::size_t cut_character(std::string_view text) {
  for (std::size_t bytes = 1; bytes <= std::min<std::size_t>(text.size(), 3); ++bytes) {
    const auto first = static_cast<unsigned char>(text[text.size() - bytes]);
    if ((first & 0xC0) == 0x80) continue;
    const std::size_t all = first < 0xC0 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
    return all > bytes ? bytes : 0;
  }
  return 0;
}

char* after_line(char* text, const char* end) {
  void* const found = std::memchr(text, '\n', static_cast<std::size_t>(end - text));
  return found != nullptr ? static_cast<char*>(found) + 1 : nullptr;
}

}  // namespace

la_line_cutter::la_line_cutter(std::function<void(const char* line)> hand_out)
    : hand_out_(std::move(hand_out)) {}

void la_line_cutter::add(char* text, std::size_t length) {
  char* const end = text + length;
  const bool has_zero = std::memchr(text, '\0', length) != nullptr;
  for (char* next = after_line(text, end); next != nullptr;) {
    // Looked for first: to search right behind a byte that was just written is slow.
    char* const after_next = after_line(next, end);
    if (has_zero || !line_.empty()) {
      collect({text, static_cast<std::size_t>(next - text)});
    } else {
      const char after = std::exchange(*next, '\0');
      hand_out_(text);
      *next = after;
    }
    text = std::exchange(next, after_next);
  }
  collect({text, static_cast<std::size_t>(end - text)});
}

/// Adds text that ends where the line does, if not before.
void la_line_cutter::collect(std::string_view text) {
  while (!text.empty()) {
    const bool ends = text.back() == '\n';
    const std::size_t length = std::min(text.size() - (ends ? 1 : 0), LONGEST - length_);
    append(text.substr(0, length));
    text.remove_prefix(length);
    if (text == "\n") {
      line_ += '\n';
      return flush();
    }
    if (!text.empty()) hand_out(line_.size() - cut_character(line_));
  }
}

void la_line_cutter::append(std::string_view text) {
  length_ += text.size();
  for (std::size_t zero = text.find('\0'); zero != text.npos; zero = text.find('\0')) {
    line_.append(text.substr(0, zero)).append("\u2400");
    text.remove_prefix(zero + 1);
  }
  line_ += text;
}

/// Hands out the start of the line and keeps the rest.
void la_line_cutter::hand_out(std::size_t length) {
  const std::string rest = line_.substr(length);
  line_.resize(length);
  if (!line_.empty()) hand_out_(line_.c_str());
  line_ = rest;
  length_ = rest.size();
}
