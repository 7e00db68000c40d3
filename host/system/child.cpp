#include "host/system/child.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "host/system/child_signal.h"
#include "host/system/descriptor.h"
#include "host/system/running_child.h"
#include "host/system/spawn.h"

namespace {

/// A pipe whose ends are above 2, so that none stands where the child's own streams go.
struct pipe_ends {
  la_descriptor read;
  la_descriptor write;
};

/// Moves an end of a pipe out of the way of the standard streams. Returns 0, or the error number.
int lift(la_descriptor& end) {
  if (end.get() > STDERR_FILENO) return 0;
  end = la_descriptor(::fcntl(end.get(), F_DUPFD_CLOEXEC, STDERR_FILENO + 1));
  return end.get() < 0 ? errno : 0;
}

/// Returns 0, or the error number.
int open_pipe(pipe_ends& ends) {
  int numbers[2];
  if (::pipe2(numbers, O_CLOEXEC) != 0) return errno;
  ends.read = la_descriptor(numbers[0]);
  ends.write = la_descriptor(numbers[1]);
  if (const int error = lift(ends.read)) return error;
  if (const int error = lift(ends.write)) return error;
  return ::fcntl(ends.read.get(), F_SETFL, O_NONBLOCK) == 0 ? 0 : errno;
}

/// A child that was started, and is reaped at the end at the latest.
class child_process {
 public:
  /// pipe: the end from which the child's output is read, if it is.
  child_process(pid_t number, la_descriptor pipe) : number_(number), pipe_(std::move(pipe)) {
    la_running_child::started(number);
  }
  child_process(const child_process&) = delete;
  child_process& operator=(const child_process&) = delete;
  ~child_process() {
    if (number_ != 0) reap();
  }

  /// Hands on what the child writes until it closes its output or ends, whichever comes first. Some
  /// other process may hold the pipe longer: what is in the pipe when the child has ended is read,
  /// and no more is waited for. Returns 0, or the error number.
  int pass_output(const la_take_output& take) const {
    // A descriptor that becomes readable when the child ends. A kernel without it has to be asked
    // from time to time.
    const la_descriptor end_of_child(static_cast<int>(::syscall(SYS_pidfd_open, number_, 0)));
    const int wait = end_of_child.get() < 0 ? 50 : -1;
    pollfd events[] = {{pipe_.get(), POLLIN, 0}, {end_of_child.get(), POLLIN, 0}};
    for (;;) {
      const int ready = ::poll(events, 2, wait);
      if (ready < 0 && errno != EINTR) return errno;
      const bool may_have_ended = end_of_child.get() < 0 || events[1].revents != 0;
      if (ready >= 0 && may_have_ended && has_ended(WNOHANG)) return read_rest(take);
      if (ready <= 0 || events[0].revents == 0) continue;
      const ssize_t length = read_once(LA_OUTPUT_BLOCK, take);
      if (length == 0) return 0;
      if (length < 0 && errno != EAGAIN && errno != EINTR) return errno;
    }
  }

  /// Waits for the end of the child and reaps it. A child that still writes then is told that
  /// nobody reads. Returns its status as waitpid has it, or minus the error number.
  int reap() {
    pipe_.close();
    has_ended(0);
    la_running_child::ended();
    const pid_t child = std::exchange(number_, 0);
    int status = 0;
    int error = 0;
    do {
      error = ::waitpid(child, &status, 0) < 0 ? errno : 0;
    } while (error == EINTR);
    la_running_child::reaped(child);
    return error != 0 ? -error : status;
  }

 private:
  /// Whether the child has ended. It stays to be reaped. option: 0 to wait until it has, or
  /// WNOHANG.
  bool has_ended(int option) const {
    siginfo_t information = {};
    int result = 0;
    do {
      const auto number = static_cast<id_t>(number_);
      result = ::waitid(P_PID, number, &information, WEXITED | WNOWAIT | option);
    } while (result != 0 && errno == EINTR);
    return result != 0 || information.si_pid != 0;
  }
  /// Reads at most limit bytes, once. Returns how many; 0 at the end of the output, -1 on failure.
  ssize_t read_once(std::size_t limit, const la_take_output& take) const {
    char block[LA_OUTPUT_BLOCK + 1];
    const ssize_t length = ::read(pipe_.get(), block, std::min(limit, LA_OUTPUT_BLOCK));
    if (length > 0) take(block, static_cast<std::size_t>(length));
    return length;
  }
  /// Reads what is in the pipe at this moment, and no more: its writer may never stop. Returns 0,
  /// or the error number.
  int read_rest(const la_take_output& take) const {
    int rest = 0;
    ::ioctl(pipe_.get(), FIONREAD, &rest);
    while (rest > 0) {
      const ssize_t length = read_once(static_cast<std::size_t>(rest), take);
      if (length == 0) return 0;
      if (length < 0 && errno != EINTR) return errno;
      rest -= static_cast<int>(std::max<ssize_t>(length, 0));
    }
    return 0;
  }

  pid_t number_;
  la_descriptor pipe_;
};

la_child_end failed(const char* what, int error) {
  return {what + std::string(std::strerror(error)), 0};
}

}  // namespace

la_child_end la_run_child(std::vector<std::string>& words, const la_take_output& take,
                          bool& was_started) {
  pipe_ends ends;
  if (take != nullptr) {
    if (const int error = open_pipe(ends)) return failed("", error);
  }
  const la_child_signal while_it_runs;
  pid_t number = 0;
  const bool own_group = la_running_child::leads_group();
  if (const int error = la_spawn(words, ends.write.get(), own_group, number)) {
    return failed("", error);
  }
  child_process child(number, std::move(ends.read));
  was_started = true;
  ends.write.close();
  int read_error = 0;
  if (take != nullptr) {
    read_error = child.pass_output(take);
    take(nullptr, 0);
  }
  const int status = child.reap();
  if (status < 0) return failed("its exit code could not be learnt: ", -status);
  if (read_error != 0) return failed("its output could not be read: ", read_error);
  return {"", WIFSIGNALED(status) ? 128 + WTERMSIG(status) : WEXITSTATUS(status)};
}
