// What the command shows: messages on standard error, results on standard output.
#ifndef KESTREL_CLI_CONSOLE_H
#define KESTREL_CLI_CONSOLE_H

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "host/port_msgman.h"

/// Shows messages on standard error, in colour on a terminal that wants it, until it is destroyed.
/// A terminal shows each message at once; all other texts wait for flush, for a text for the other
/// descriptor, for a netlister to start or to pause, or for the end.
class console {
 public:
  explicit console(bool debug);
  console(const console&) = delete;
  console& operator=(const console&) = delete;
  ~console();

  /// Adds to what waits for standard error.
  static void say(std::string_view text);
  /// Adds to what waits for standard output.
  static void print(std::string_view text);
  /// Writes what waits, and waits for its readers until hurry was called twice meanwhile.
  static void flush();
  /// For a signal handler without SA_RESTART, once a second when this process is to end.
  static void hurry();
  /// Whether a text for standard output is lost.
  static bool has_lost_results();
  /// How many messages of this level have been shown.
  static int count(Port_MsgLevel level);
  /// Whether standard error is a terminal.
  static bool is_terminal();

 private:
  static void show(void* self, const Port_Msg& message);

  bool is_terminal_;
  bool colour_;
  Port_MsgSink before_;
};

/// Takes messages away, until it is destroyed. Those that take says no to are shown as before.
/// Debug traces come if they came before.
class diversion {
 public:
  explicit diversion(std::function<bool(const Port_Msg&)> take);
  diversion(const diversion&) = delete;
  diversion& operator=(const diversion&) = delete;
  ~diversion();

 private:
  static void show(void* self, const Port_Msg& message);

  std::function<bool(const Port_Msg&)> take_;
  Port_MsgSink before_;
};

/// Says on standard error, at once, what the command itself has to say: a line for each text.
void complain(const std::string& text);
void complain(const std::vector<std::string>& texts);
/// Says what is to count as a message of this level, and to go where those of the library go.
void complain(Port_MsgLevel level, const std::string& text);

/// text as a JSON string. A byte that is not UTF-8 becomes the lone surrogate U+DC00 + byte.
std::string json_string(std::string_view text);

#endif
