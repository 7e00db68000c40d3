#include "rules/statement_reader.h"

#include <cstring>

la_statement_reader::item_kind la_statement_reader::next() {
  while (!ended_) {
    item_kind item = NOTHING;
    if (!UT_STR::AllBlank(line_)) {
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

/// One step on the rest of the line, which is not blank.
la_statement_reader::item_kind la_statement_reader::step() {
  switch (state_) {
    case KEYWORD: {
      const char end = UT_STR::GetToken(line_, keyword_, " =;");
      if (end == ' ') return go(EQUALS);
      return end == '=' ? go(VALUE) : go(SKIP, EXPECTING_KEYWORD);
    }
    case EQUALS: {
      const char end = UT_STR::GetToken(line_, token_, " =;");
      return end == '=' && *token_ == '\0' ? go(VALUE) : go(SKIP, EXPECTING_EQUALS);
    }
    case VALUE:
      return step_value();
    case QUOTED:
      return step_quoted();
    case SEMICOLON: {
      const char end = UT_STR::GetToken(line_, token_, " ;");
      return end == ';' && *token_ == '\0' ? go(KEYWORD, STATEMENT) : go(SKIP, EXPECTING_SEMICOLON);
    }
    case SKIP:
      return UT_STR::GetToken(line_, token_, " ;") == ';' ? go(KEYWORD) : NOTHING;
  }
  return NOTHING;
}

la_statement_reader::item_kind la_statement_reader::step_value() {
  value_refused_ = false;
  switch (UT_STR::GetToken(line_, value_, " \";")) {
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
  char* quote = UT_STR::FindChar(line_, '"');
  if (quote != nullptr) *quote = '\0';
  const item_kind result = append_to_value(line_);
  if (quote == nullptr) {
    line_[0] = '\0';
  } else {
    std::memmove(line_, quote + 1, UT_STR::Len(quote + 1) + 1);
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
