// The message manager: every text that the library shows goes through it, to one sink.
#ifndef KESTREL_HOST_PORT_MSGMAN_H
#define KESTREL_HOST_PORT_MSGMAN_H

#include <cstdarg>

/// What kind of message a text is.
enum Port_MsgLevel {
  PORT_MSG_STATUS,   ///< a progress note, a line of a netlister's output or a dump
  PORT_MSG_INFO,     ///< a report that asks for nothing
  PORT_MSG_WARNING,  ///< something was passed over
  PORT_MSG_ERROR,    ///< a check failed
  PORT_MSG_DEBUG     ///< a trace; only for a sink that asks for them
};

/// One message. The texts are good during the call of the sink only.
struct Port_Msg {
  Port_MsgLevel level;
  const char* program;   ///< the host program; null for a debug trace, like the next three
  const char* file;      ///< the source file that issues the message
  int line;              ///< the line in it; 0 for a debug trace
  const char* revision;  ///< the revision of that source file
  const char* text;      ///< the formatted text, with its own line end if it has one
};

/// Where messages go: a function and the context that it is handed with each message.
struct Port_MsgSink {
  void (*function)(void* context, const Port_Msg& message);
  void* context;
  bool debug;  ///< whether debug traces are wanted
};

/// The message manager. Texts are formatted like printf: "%s" (a string; null prints as nothing),
/// "%d" (an int), "%c" (a character), "%z" (a wchar_t string, shown as UTF-8), "%%". Messages are
/// handed to the sink in the order of the calls, on the caller's thread.
class Port_MsgManData {
 public:
  /// Makes sink the one that gets every message from now on, and returns the one before it. A null
  /// function restores the sink of the start: it writes to standard error, a status text as it
  /// stands, the others behind "INFO: ", "WARNING: " or "ERROR: ".
  static Port_MsgSink setSink(const Port_MsgSink& sink);

  /// Makes flush the function that is called, with context, when no message follows at once: before
  /// a netlister starts, and when it has written nothing more for the moment. It is for a sink that
  /// collects texts. Null for none, as at the start.
  static void setFlush(void (*flush)(void* context), void* context);
  /// Calls that function.
  static void flush();

  /// The manager, prepared for one message that comes from the given place. The texts must stay
  /// until that message has been issued.
  static Port_MsgManData& createObject(const char* program, const char* file, int line,
                                       const char* revision);
  /// Issue the message, at the level of their name.
  void issueStatus(const char* format, ...);
  void issueInfo(const char* format, ...);
  void issueWarning(const char* format, ...);
  void issueError(const char* format, ...);

  /// Issues a status message whose text is no format and is handed on as it stands, not copied.
  void issueStatusText(const char* text);

  /// Issues a debug trace, without origin.
  static void debugStub(const char* format, ...);

 private:
  void issue(Port_MsgLevel level, const char* format, va_list arguments) const;
  void hand_on(Port_MsgLevel level, const char* text) const;

  const char* program_ = nullptr;
  const char* file_ = nullptr;
  int line_ = 0;
  const char* revision_ = nullptr;
};

#endif
