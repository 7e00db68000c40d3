// The user rules file as a sequence of statements: keyword "=" value ";".
#ifndef KESTREL_RULES_STATEMENT_READER_H
#define KESTREL_RULES_STATEMENT_READER_H

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

  /// stream stays the caller's, and open as long as this object is used.
  explicit la_statement_reader(Port::Stream& stream) : stream_(stream) {}

  /// The next statement or finding; END after the last one.
  item_kind next();
  /// Keyword and value of the statement that next() gave, until the next call.
  const char* keyword() const { return keyword_; }
  const char* value() const { return value_; }
  /// The line that was read last, from 1.
  int line() const { return line_number_; }
  /// The line where the last statement began, whether it is complete, unfinished or being dropped.
  int statement_line() const { return statement_line_; }

 private:
  enum state { KEYWORD, EQUALS, VALUE, QUOTED, SEMICOLON, SKIP };
  /// What step() and read_line() return when there is nothing to tell.
  static constexpr item_kind NOTHING = END;

  item_kind read_line();
  item_kind end_of_file();
  item_kind step();
  item_kind go(state next_state, item_kind result = NOTHING);
  item_kind step_value();
  item_kind step_quoted();
  item_kind append_to_value(const char* text);

  Port::Stream& stream_;
  state state_ = KEYWORD;
  int line_number_ = 0;
  int statement_line_ = 0;
  bool value_refused_ = false;
  bool ended_ = false;
  char line_[LA_MAX_PATH] = "";
  char* rest_ = line_;  ///< what has not been taken of the line
  char keyword_[LA_MAX_PATH] = "";
  char value_[LA_MAX_PATH] = "";
};

#endif
