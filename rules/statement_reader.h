// The user rules file as a sequence of statements: keyword "=" value ";".
#ifndef KESTREL_RULES_STATEMENT_READER_H
#define KESTREL_RULES_STATEMENT_READER_H

#include <optional>
#include <string>
#include <string_view>

#include "host/port_file.h"
#include "host/ut_str.h"

/// Reads statements one by one. After something wrong it drops the rest of the statement, up to
/// its ";", and goes on with the next. It issues no message.
class la_statement_reader {
 public:
  /// The most lines that a file may have.
  static constexpr int MAX_LINES = 32767;

  enum item_kind {
    STATEMENT,
    END,
    // Findings.
    EXPECTING_KEYWORD,
    EXPECTING_EQUALS,
    EXPECTING_VALUE,
    EXPECTING_SEMICOLON,
    LONG_LINE,       ///< the line is passed over
    ZERO_BYTE,       ///< the line is passed over
    LONG_VALUE,      ///< the statement is passed over
    MANY_LINES,      ///< the rest of the file is passed over
    READ_FAILED,     ///< the rest of the file could not be read
    UNEXPECTED_END,  ///< the file ends inside a statement, or while one is being dropped
  };

  /// The caller keeps the stream, and keeps it open as long as this object is used.
  explicit la_statement_reader(Port::Stream& stream) : stream_(stream) {}

  /// The next statement or finding; END after the last one.
  item_kind next();
  /// Keyword and value of the statement that next() gave, until the next call.
  const char* keyword() const { return keyword_.c_str(); }
  const char* value() const { return value_.c_str(); }
  /// The line that was read last, from 1.
  int line() const { return line_number_; }
  /// The line where the last statement began, be it complete, unfinished or dropped.
  int statement_line() const { return statement_line_; }

 private:
  /// What is expected next. TOO_LONG is the rest of a quoted value that does not fit; SKIP drops
  /// everything up to ";".
  enum state { KEYWORD, EQUALS, VALUE, QUOTED, TOO_LONG, SEMICOLON, SKIP };
  using maybe_item = std::optional<item_kind>;

  maybe_item read_line();
  item_kind end_of_file();
  maybe_item step();
  maybe_item step_keyword();
  maybe_item step_value();
  maybe_item step_quoted();
  maybe_item go(state next_state, maybe_item result = {});

  Port::Stream& stream_;
  state state_ = KEYWORD;
  bool ended_ = false;
  int line_number_ = 0;
  int statement_line_ = 0;
  char line_[LA_MAX_PATH] = "";
  std::string_view rest_;  ///< the part of the line that has not been taken yet
  std::string keyword_;
  std::string value_;
};

#endif
