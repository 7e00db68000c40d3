#include "rules/statement_reader.h"

#include <algorithm>

namespace {

// What ends a token, beside the end of the line.
constexpr const char* BLANKS = " \t";
constexpr const char* KEYWORD_ENDS = " \t=;";
constexpr const char* VALUE_ENDS = " \t\";";
constexpr const char* STATEMENT_ENDS = " \t;";

struct token {
  std::string_view text;
  char end;  ///< the character that ends it, a blank as a space; 0 for the end of the line
};

/// Takes the token at the front of line, and what ends it.
token take_token(std::string_view& line, const char* ends) {
  const std::string_view text = line.substr(0, line.find_first_of(ends));
  line.remove_prefix(text.size());
  if (line.empty()) return {text, '\0'};
  const char end = line.front() == '\t' ? ' ' : line.front();
  line.remove_prefix(1);
  return {text, end};
}

}  // namespace

la_statement_reader::item_kind la_statement_reader::next() {
  while (!ended_) {
    maybe_item item;
    const std::size_t blanks = rest_.find_first_not_of(BLANKS);
    if (blanks != rest_.npos) {
      // Leading blanks count inside quotes only.
      if (state_ != QUOTED) rest_.remove_prefix(blanks);
      item = step();
    } else if (stream_.geteof()) {
      item = end_of_file();
    } else {
      item = read_line();
    }
    if (item) return *item;
  }
  return END;
}

la_statement_reader::maybe_item la_statement_reader::read_line() {
  if (line_number_ == MAX_LINES) {
    ended_ = true;
    return MANY_LINES;
  }
  const int length = stream_.readline(line_, sizeof line_);
  rest_ = line_;
  ++line_number_;
  const auto kept = static_cast<int>(rest_.size());
  if (kept != length) {
    // The line's text is lost. Most likely it ended a statement, so a keyword comes next.
    rest_ = {};
    return go(KEYWORD, kept == LA_MAX_PATH - 1 ? LONG_LINE : ZERO_BYTE);
  }
  rest_ = rest_.substr(0, rest_.find("//"));
  return {};
}

la_statement_reader::item_kind la_statement_reader::end_of_file() {
  ended_ = true;
  if (stream_.failed()) return READ_FAILED;
  return state_ == KEYWORD ? END : UNEXPECTED_END;
}

la_statement_reader::maybe_item la_statement_reader::go(state next_state, maybe_item result) {
  state_ = next_state;
  return result;
}

/// Takes one step on the rest of the line, which is not blank and, outside quotes, begins with no
/// blank.
la_statement_reader::maybe_item la_statement_reader::step() {
  switch (state_) {
    case KEYWORD:
      return step_keyword();
    case EQUALS: {
      const auto [text, end] = take_token(rest_, KEYWORD_ENDS);
      return end == '=' && text.empty() ? go(VALUE) : go(SKIP, EXPECTING_EQUALS);
    }
    case VALUE:
      return step_value();
    case QUOTED:
    case TOO_LONG:
      return step_quoted();
    case SEMICOLON: {
      const auto [text, end] = take_token(rest_, STATEMENT_ENDS);
      return end == ';' && text.empty() ? go(KEYWORD, STATEMENT) : go(SKIP, EXPECTING_SEMICOLON);
    }
    case SKIP:
      return take_token(rest_, STATEMENT_ENDS).end == ';' ? go(KEYWORD) : maybe_item();
  }
  return {};
}

la_statement_reader::maybe_item la_statement_reader::step_keyword() {
  statement_line_ = line_number_;
  const auto [text, end] = take_token(rest_, KEYWORD_ENDS);
  keyword_ = text;
  if (end == ' ') return go(EQUALS);
  return end == '=' ? go(VALUE) : go(SKIP, EXPECTING_KEYWORD);
}

la_statement_reader::maybe_item la_statement_reader::step_value() {
  const auto [text, end] = take_token(rest_, VALUE_ENDS);
  value_ = text;
  switch (end) {
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

/// A value that is too long is reported once, and read to its closing quote.
la_statement_reader::maybe_item la_statement_reader::step_quoted() {
  const std::size_t quote = rest_.find('"');
  const std::string_view piece = rest_.substr(0, quote);
  rest_.remove_prefix(quote != rest_.npos ? quote + 1 : rest_.size());
  maybe_item finding;
  if (state_ == QUOTED && value_.size() + piece.size() >= LA_MAX_PATH) {
    finding = go(TOO_LONG, LONG_VALUE);
  } else if (state_ == QUOTED) {
    value_ += piece;
  }
  if (quote == rest_.npos) return finding;
  return go(state_ == QUOTED ? SEMICOLON : SKIP, finding);
}
