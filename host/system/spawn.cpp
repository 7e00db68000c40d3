#include "host/system/spawn.h"

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <unistd.h>

#include <cstring>

namespace {

/// The files of a child's standard streams.
struct standard_streams {
  standard_streams() { ::posix_spawn_file_actions_init(&actions); }
  standard_streams(const standard_streams&) = delete;
  standard_streams& operator=(const standard_streams&) = delete;
  ~standard_streams() { ::posix_spawn_file_actions_destroy(&actions); }

  /// Returns 0, or the error number.
  int set(int output) {
    int error =
        ::posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    for (const int stream : {STDOUT_FILENO, STDERR_FILENO}) {
      if (error != 0 || output < 0) break;
      error = ::posix_spawn_file_actions_adddup2(&actions, output, stream);
    }
    return error;
  }

  posix_spawn_file_actions_t actions;
};

/// The signals and the process group of a child.
struct attributes {
  explicit attributes(bool own_group) {
    ::posix_spawnattr_init(&value);
    const int group = own_group ? POSIX_SPAWN_SETPGROUP : 0;
    ::posix_spawnattr_setflags(
        &value, static_cast<short>(POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF | group));
    sigset_t signals;
    ::sigemptyset(&signals);
    ::posix_spawnattr_setsigmask(&value, &signals);
    // sigfillset leaves out the signals of the C library, and the child would ignore them.
    std::memset(&signals, 0xFF, sizeof signals);
    ::posix_spawnattr_setsigdefault(&value, &signals);
  }
  attributes(const attributes&) = delete;
  attributes& operator=(const attributes&) = delete;
  ~attributes() { ::posix_spawnattr_destroy(&value); }

  posix_spawnattr_t value;
};

}  // namespace

int la_spawn(std::vector<std::string>& words, int output, bool own_group, pid_t& child) {
  standard_streams streams;
  if (const int error = streams.set(output)) return error;
  const attributes start(own_group);
  std::vector<char*> arguments;
  arguments.reserve(words.size() + 1);
  for (std::string& word : words) arguments.push_back(word.data());
  arguments.push_back(nullptr);
  // posix_spawn neither copies the memory of this process nor its page tables.
  return ::posix_spawnp(&child, arguments[0], &streams.actions, &start.value, arguments.data(),
                        environ);
}
