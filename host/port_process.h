// Child processes.
#ifndef KESTREL_HOST_PORT_PROCESS_H
#define KESTREL_HOST_PORT_PROCESS_H

#include <string>
#include <vector>

/// Runs a program and waits for it.
///
/// No shell is involved. The command line is split at blanks (space and tab). A pair of double
/// quotes groups characters and is dropped; so does a single quote that begins a word, up to the
/// next single quote. Elsewhere a single quote is a character like any other, and nothing else
/// has a meaning. The program is the first word; one without "/" is looked for in the directories
/// of PATH.
class Port_Process {
 public:
  /// What Run returns.
  enum PROCESS_STATUS {
    PROCESS_ENDED = 0,   ///< the program was started and has ended
    PROCESS_FAILED = 1,  ///< it could not be started
    PROCESS_LOST = 2,    ///< it was started, but could not be followed to its end
  };

  /// mode 2: what the program writes to its standard output and error goes to Output, line by
  /// line. mode 0: the program writes to where this process does.
  explicit Port_Process(int mode) : mode_(mode) {}
  Port_Process(const Port_Process&) = delete;
  Port_Process& operator=(const Port_Process&) = delete;

  /// Gets each line that the program writes, in order, with its line end if it has one. A line
  /// of more than 65536 bytes comes in pieces of that length, or up to 3 bytes less where it would
  /// end inside a UTF-8 character; a zero byte comes as the character U+2400. The text is good
  /// during the call only.
  virtual void Output(const char* text) = 0;
  virtual ~Port_Process() = default;
  /// Called when there will be no Output for the moment: before the program starts, and when what
  /// it has written so far has been handed out.
  virtual void Pause() {}

  /// Starts the command line in the current directory, with the environment of the process and
  /// standard input from /dev/null, and returns when the program has ended, even if something
  /// that it left behind still holds its output open.
  ///
  /// While it waits, SIGCHLD has its default action, so that a host that ignores it, or collects
  /// every child, does not take the exit code away. Where that was not so already, the host has
  /// afterwards what it would have had: its handler is called once, as it may have missed a child
  /// of its own, and where children are to leave no trace, those that have ended are reaped.
  ///
  /// The program has been waited for whatever happens, also when Output throws. Memory that runs
  /// out is a failure like others.
  PROCESS_STATUS Run(const char* command);
  /// The exit code of the program that Run waited for; 128 + N when signal N ended it.
  int GetChildRetcode() const { return exit_code_; }
  /// Why Run failed. The text belongs to this object.
  wchar_t* GetProcessErrmsg() const;

  /// Splits a command line into the program and its arguments. False when a quote is without its
  /// partner.
  static bool Split(const std::string& command, std::vector<std::string>& words);

 private:
  bool run(const std::string& command, bool& was_started);
  bool fail(const std::string& program, const std::string& reason);

  int mode_;
  int exit_code_ = 0;
  std::wstring error_;
};

#endif
