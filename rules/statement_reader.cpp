#include "rules/statement_reader.h"

#include <array>
#include <cstring>
#include <string_view>

#include "host/blanks.h"

namespace {

/// The characters that end a token: the end of the line, blanks and delimiters.
using token_ends = std::array<bool, 256>;

constexpr token_ends with_delimiters(std::string_view delimiters) {
  token_ends ends = {};
  for (const char c : {'\0', ' ', '\t'}) ends[static_cast<unsigned char>(c)] = true;
  for (const char c : delimiters) ends[static_cast<unsigned char>(c)] = true;
  return ends;
}

constexpr token_ends KEYWORD_ENDS = with_delimiters("=;");
constexpr token_ends VALUE_ENDS = with_delimiters("\";");
constexpr token_ends STATEMENT_ENDS = with_delimiters(";");

struct token {
  std::string_view text;
  char end;  ///< the character that ends it, a blank as a space; 0 for the end of the line

  /// Copies the text into a buffer that has room for it.
  void copy_to(char* buffer) const { buffer[text.copy(buffer, text.size())] = '\0'; }
};

/// Takes the token at the front of line, and what ends it.
token take_token(char*& line, const token_ends& ends) {
  char* at = line;
  while (!ends[static_cast<unsigned char>(*at)]) ++at;
  const std::string_view text(line, at);
  line = *at != '\0' ? at + 1 : at;
  return {text, *at == '\t' ? ' ' : *at};
}

}  // namespace

la_statement_reader::item_kind la_statement_reader::next() {
  while (!ended_) {
    item_kind item = NOTHING;
    char* start = la_skip_blanks(rest_);
    if (*start != '\0') {
      // Only in quotes the blanks count.
      if (state_ != QUOTED) rest_ = start;
      item = step();
    } else if (stream_.geteof()) {
      item = end_of_file();
    } else {
      item = read_line();
    }
    if (item != NOTHING) return item;
  }
  return END;
}

la_statement_reader::item_kind la_statement_reader::read_line() {
  if (line_number_ == MAX_LINES) {
    ended_ = true;
    return MANY_LINES;
  }
  const int length = stream_.readline(line_, sizeof line_);
  rest_ = line_;
  ++line_number_;
  const auto kept = static_cast<int>(UT_STR::Len(line_));
  if (kept != length) {
    // What stood on the line is not known. As a rule it ended a statement, and the next is read.
    line_[0] = '\0';
    state_ = KEYWORD;
    return kept == LA_MAX_PATH - 1 ? LONG_LINE : ZERO_BYTE;
  }
  if (char* comment = std::strstr(line_, "//")) *comment = '\0';
  return NOTHING;
}

la_statement_reader::item_kind la_statement_reader::end_of_file() {
  ended_ = true;
  if (stream_.failed()) return READ_FAILED;
  return state_ == KEYWORD ? END : UNEXPECTED_END;
}

la_statement_reader::item_kind la_statement_reader::go(state next_state, item_kind result) {
  state_ = next_state;
  return result;
}

/// One step on the rest of the line, which is not blank, nor begins with a blank but in quotes.
inline la_statement_reader::item_kind la_statement_reader::step() {
  switch (state_) {
    case KEYWORD: {
      statement_line_ = line_number_;
      const token keyword = take_token(rest_, KEYWORD_ENDS);
      keyword.copy_to(keyword_);
      if (keyword.end == ' ') return go(EQUALS);
      return keyword.end == '=' ? go(VALUE) : go(SKIP, EXPECTING_KEYWORD);
    }
    case EQUALS: {
      const auto [text, end] = take_token(rest_, KEYWORD_ENDS);
      return end == '=' && text.empty() ? go(VALUE) : go(SKIP, EXPECTING_EQUALS);
    }
    case VALUE:
      return step_value();
    case QUOTED:
      return step_quoted();
    case SEMICOLON: {
      const auto [text, end] = take_token(rest_, STATEMENT_ENDS);
      return end == ';' && text.empty() ? go(KEYWORD, STATEMENT) : go(SKIP, EXPECTING_SEMICOLON);
    }
    case SKIP:
      return take_token(rest_, STATEMENT_ENDS).end == ';' ? go(KEYWORD) : NOTHING;
  }
  return NOTHING;
}

la_statement_reader::item_kind la_statement_reader::step_value() {
  value_refused_ = false;
  const token value = take_token(rest_, VALUE_ENDS);
  value.copy_to(value_);
  switch (value.end) {
    case ' ':
      return go(SEMICOLON);
    case '"':
      return go(QUOTED);
    case ';':
      return go(KEYWORD, STATEMENT);
    default:
      return go(SKIP, EXPECTING_VALUE);
  }
}

la_statement_reader::item_kind la_statement_reader::step_quoted() {
  char* quote = UT_STR::FindChar(rest_, '"');
  if (quote != nullptr) *quote = '\0';
  const item_kind result = append_to_value(rest_);
  if (quote == nullptr) {
    *rest_ = '\0';
  } else {
    rest_ = quote + 1;
    state_ = value_refused_ ? SKIP : SEMICOLON;
  }
  return result;
}

/// A value that does not fit is refused once, and its quotes are still read to their end.
la_statement_reader::item_kind la_statement_reader::append_to_value(const char* text) {
  if (value_refused_ || UT_STR::Cat(value_, text) != nullptr) return NOTHING;
  value_refused_ = true;
  return LONG_VALUE;
}
