#include "host/port_process.h"

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/ioctl.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

#include "host/port_interrupt.h"
#include "host/utf8.h"

namespace {

/// An open file descriptor, or none (-1).
class descriptor {
 public:
  explicit descriptor(int number = -1) : number_(number) {}
  descriptor(descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
  descriptor& operator=(descriptor&& other) noexcept {
    std::swap(number_, other.number_);
    return *this;
  }
  ~descriptor() { close(); }

  void close() {
    if (number_ >= 0) ::close(std::exchange(number_, -1));
  }
  int get() const { return number_; }

 private:
  int number_;
};

/// A pipe whose ends are above 2, so that none stands where the child's own streams go.
struct pipe_ends {
  descriptor read;
  descriptor write;
};

/// Moves an end of a pipe out of the way of the standard streams. Returns 0, or the error number.
int lift(descriptor& end) {
  if (end.get() > STDERR_FILENO) return 0;
  end = descriptor(::fcntl(end.get(), F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
  return end.get() < 0 ? errno : 0;
}

/// Returns 0, or the error number.
int open_pipe(pipe_ends& ends) {
  int numbers[2];
  if (::pipe2(numbers, O_CLOEXEC) != 0) return errno;
  ends.read = descriptor(numbers[0]);
  ends.write = descriptor(numbers[1]);
  if (const int error = lift(ends.read)) return error;
  if (const int error = lift(ends.write)) return error;
  return ::fcntl(ends.read.get(), F_SETFL, O_NONBLOCK) == 0 ? 0 : errno;
}

/// What a child starts with: the files of its standard streams, no signal blocked, every signal at
/// its default, its process group.
class child_start {
 public:
  /// output: the descriptor for standard output and error, or -1 to share those of this process.
  child_start(int output, bool own_group) {
    ::posix_spawn_file_actions_init(&actions_);
    ::posix_spawn_file_actions_addopen(&actions_, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    if (output >= 0) {
      ::posix_spawn_file_actions_adddup2(&actions_, output, STDOUT_FILENO);
      ::posix_spawn_file_actions_adddup2(&actions_, output, STDERR_FILENO);
    }
    ::posix_spawnattr_init(&attributes_);
    const int group = own_group ? POSIX_SPAWN_SETPGROUP : 0;
    ::posix_spawnattr_setflags(
        &attributes_, static_cast<short>(POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF | group));
    sigset_t signals;
    ::sigemptyset(&signals);
    ::posix_spawnattr_setsigmask(&attributes_, &signals);
    // sigfillset leaves out the signals of the C library, and the child would ignore them.
    std::memset(&signals, 0xFF, sizeof signals);
    ::posix_spawnattr_setsigdefault(&attributes_, &signals);
  }
  child_start(const child_start&) = delete;
  child_start& operator=(const child_start&) = delete;
  ~child_start() {
    ::posix_spawn_file_actions_destroy(&actions_);
    ::posix_spawnattr_destroy(&attributes_);
  }

  /// Returns 0, or the error number.
  int spawn(std::vector<std::string>& words, pid_t& child) const {
    std::vector<char*> arguments;
    arguments.reserve(words.size() + 1);
    for (std::string& word : words) arguments.push_back(word.data());
    arguments.push_back(nullptr);
    // posix_spawn neither copies the memory of this process nor its page tables.
    return ::posix_spawnp(&child, arguments[0], &actions_, &attributes_, arguments.data(), environ);
  }

 private:
  posix_spawn_file_actions_t actions_;
  posix_spawnattr_t attributes_;
};

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

/// Cuts what a child writes into lines.
class line_cutter {
 public:
  /// The longest line, and the most that is added at once: a line that lies in it as a whole is
  /// not too long.
  static constexpr std::size_t LONGEST = 65536;

  explicit line_cutter(Port_Process& process) : process_(process) {}

  /// Adds a block, behind which there is room for one character more. Lines that lie in it as they
  /// are to be shown are handed out from where they are.
  void add(char* text, std::size_t length) {
    char* const end = text + length;
    const bool has_zero = std::memchr(text, '\0', length) != nullptr;
    for (char* next = after_line(text, end); next != nullptr;) {
      // Looked for first: to search right behind a byte that was just written is slow.
      char* const after_next = after_line(next, end);
      if (has_zero || !line_.empty()) {
        collect({text, static_cast<std::size_t>(next - text)});
      } else {
        const char after = std::exchange(*next, '\0');
        process_.Output(text);
        *next = after;
      }
      text = std::exchange(next, after_next);
    }
    collect({text, static_cast<std::size_t>(end - text)});
  }
  /// Hands out what there is of a line.
  void flush() { hand_out(line_.size()); }

 private:
  static char* after_line(char* text, const char* end) {
    void* const found = std::memchr(text, '\n', static_cast<std::size_t>(end - text));
    return found != nullptr ? static_cast<char*>(found) + 1 : nullptr;
  }
  /// Adds text that ends where the line does, if not before.
  void collect(std::string_view text) {
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
  void append(std::string_view text) {
    length_ += text.size();
    for (std::size_t zero = text.find('\0'); zero != text.npos; zero = text.find('\0')) {
      line_.append(text.substr(0, zero)).append("\u2400");
      text.remove_prefix(zero + 1);
    }
    line_ += text;
  }
  /// Hands out the start of the line and keeps the rest.
  void hand_out(std::size_t length) {
    const std::string rest = line_.substr(length);
    line_.resize(length);
    if (!line_.empty()) process_.Output(line_.c_str());
    line_ = rest;
    length_ = rest.size();
  }

  Port_Process& process_;
  std::string line_;
  std::size_t length_ = 0;  ///< of the line, as the child wrote it
};

/// What is read from a child.
class child_output {
 public:
  child_output(int pipe, Port_Process& process) : pipe_(pipe), process_(process), lines_(process) {}

  /// Reads at most limit bytes, once, and hands out the lines. Returns how many; 0 at the end of
  /// the output, -1 on failure.
  ssize_t read_once(std::size_t limit) {
    char block[line_cutter::LONGEST + 1];
    const ssize_t length = ::read(pipe_, block, std::min(limit, line_cutter::LONGEST));
    if (length > 0) {
      lines_.add(block, static_cast<std::size_t>(length));
      process_.Pause();
    }
    return length;
  }
  /// Reads what is in the pipe at this moment, and no more: its writer may never stop.
  void read_rest() {
    int rest = 0;
    ::ioctl(pipe_, FIONREAD, &rest);
    while (rest > 0) {
      const ssize_t length = read_once(static_cast<std::size_t>(rest));
      if (length == 0 || (length < 0 && errno != EINTR)) return;
      rest -= static_cast<int>(std::max<ssize_t>(length, 0));
    }
  }
  /// Hands out a last line without a line end.
  void finish() {
    lines_.flush();
    process_.Pause();
  }

 private:
  int pipe_;
  Port_Process& process_;
  line_cutter lines_;
};

/// Whether the child has ended. It stays to be reaped. option: 0 to wait until it has, or WNOHANG.
bool has_ended(pid_t child, int option) {
  siginfo_t information = {};
  int result = 0;
  do {
    result = ::waitid(P_PID, static_cast<id_t>(child), &information, WEXITED | WNOWAIT | option);
  } while (result != 0 && errno == EINTR);
  return result != 0 || information.si_pid != 0;
}

/// Hands on what the child writes until it closes its output or ends, whichever comes first. Some
/// other process may hold the pipe longer: what is in the pipe when the child has ended is read,
/// and no more is waited for.
void pass_output(pid_t child, int pipe, Port_Process& process) {
  child_output output(pipe, process);
  // A descriptor that becomes readable when the child ends. A kernel without it has to be asked
  // from time to time.
  const descriptor end_of_child(static_cast<int>(::syscall(SYS_pidfd_open, child, 0)));
  const int wait = end_of_child.get() < 0 ? 50 : -1;
  pollfd events[] = {{pipe, POLLIN, 0}, {end_of_child.get(), POLLIN, 0}};
  for (;;) {
    const int ready = ::poll(events, 2, wait);
    if (ready < 0 && errno != EINTR) break;
    const bool may_have_ended = end_of_child.get() < 0 || events[1].revents != 0;
    if (ready >= 0 && may_have_ended && has_ended(child, WNOHANG)) {
      output.read_rest();
      break;
    }
    if (ready <= 0 || events[0].revents == 0) continue;
    const ssize_t length = output.read_once(SIZE_MAX);
    if (length == 0 || (length < 0 && errno != EAGAIN && errno != EINTR)) break;
  }
  output.finish();
}

/// Keeps SIGCHLD at its default action: one that is ignored, or handled by collecting whichever
/// child there is, would take the exit code away.
class default_child_signal {
 public:
  default_child_signal() {
    struct sigaction action = {};
    action.sa_handler = SIG_DFL;
    ::sigaction(SIGCHLD, &action, &before_);
  }
  default_child_signal(const default_child_signal&) = delete;
  default_child_signal& operator=(const default_child_signal&) = delete;
  ~default_child_signal() {
    ::sigaction(SIGCHLD, &before_, nullptr);
    // It may have missed the end of another child.
    if (before_.sa_handler != SIG_DFL && before_.sa_handler != SIG_IGN) ::raise(SIGCHLD);
  }

 private:
  struct sigaction before_ = {};
};

/// Reaps the child once it has ended. Returns 0 and sets its exit code, or returns the error
/// number.
int reap(pid_t child, int& exit_code) {
  int status = 0;
  while (::waitpid(child, &status, 0) < 0) {
    if (errno != EINTR) return errno;
  }
  exit_code = WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status);
  return 0;
}

}  // namespace

bool Port_Process::Split(const std::string& command, std::vector<std::string>& words) {
  words.clear();
  bool in_word = false;
  for (std::size_t i = 0; i < command.size(); ++i) {
    const char c = command[i];
    if (c == ' ' || c == '\t') {
      in_word = false;
      continue;
    }
    const bool quote = c == '"' || (c == '\'' && !in_word);
    if (!in_word) words.emplace_back();
    in_word = true;
    if (!quote) {
      words.back() += c;
      continue;
    }
    const std::size_t partner = command.find(c, i + 1);
    if (partner == command.npos) return false;
    words.back().append(command, i + 1, partner - i - 1);
    i = partner;
  }
  return true;
}

Port_Process::PROCESS_STATUS Port_Process::fail(const std::string& program,
                                                const std::string& reason) {
  error_ = from_utf8(program) + L": " + from_utf8(reason);
  return PROCESS_FAILED;
}

Port_Process::PROCESS_STATUS Port_Process::Run(const char* command) {
  std::vector<std::string> words;
  if (!Split(command, words)) return fail(command, "a quote is without its partner");
  // The program's name ends at the first blank: one that is missing is not made up for by the
  // argument that follows.
  if (words.empty() || words[0].empty() || command[0] == ' ' || command[0] == '\t') {
    return fail("\"\"", "the name of the program is empty");
  }

  if (Port_Interrupt::Requested() != 0) return fail(words[0], "interrupted");

  pipe_ends ends;
  if (mode_ == 2) {
    if (const int error = open_pipe(ends)) return fail(words[0], std::strerror(error));
  }
  const default_child_signal while_it_runs;
  const child_start start(ends.write.get(), Port_Interrupt::own_groups());
  Pause();
  pid_t child = 0;
  if (const int error = start.spawn(words, child)) return fail(words[0], std::strerror(error));
  Port_Interrupt::child_started(child);
  ends.write.close();
  if (mode_ == 2) pass_output(child, ends.read.get(), *this);
  has_ended(child, 0);
  Port_Interrupt::child_ended();
  const int error = reap(child, exit_code_);
  Port_Interrupt::child_reaped(child);
  if (error == 0) return PROCESS_ENDED;
  fail(words[0], std::string("its exit code could not be learnt: ") + std::strerror(error));
  return PROCESS_LOST;
}
