#include "host/system/process_group.h"

#include <dirent.h>
#include <fcntl.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cctype>
#include <cstdio>
#include <cstring>
#include <memory>

#include "host/system/descriptor.h"

namespace {

/// What is known of a process: whether it has ended, and its group; 0 when it is not known.
struct process {
  bool has_ended = false;
  int group = 0;
};

struct close_directory {
  void operator()(DIR* directory) const { ::closedir(directory); }
};

/// number: of a process, as the system spells it.
process process_of(const char* number) {
  char path[sizeof "/proc//stat" + sizeof dirent::d_name];
  std::snprintf(path, sizeof path, "/proc/%s/stat", number);
  char text[512];
  const la_descriptor file(::open(path, O_RDONLY | O_CLOEXEC));
  const ssize_t length = file.get() < 0 ? 0 : ::read(file.get(), text, sizeof text - 1);
  text[length > 0 ? length : 0] = '\0';
  // The name of the program, in parentheses, may hold anything. Behind it stand the state, the
  // parent, the group, 14 numbers more, and how many threads there are, of which the first may have
  // ended alone.
  const char* const after_name = std::strrchr(text, ')');
  constexpr const char* FORMAT =
      ") %c %*s %d %*s %*s %*s %*s %*s %*s %*s %*s %*s %*s %*s %*s %*s %*s %d";
  char state = '\0';
  int threads = 0;
  process found;
  if (after_name != nullptr &&
      std::sscanf(after_name, FORMAT, &state, &found.group, &threads) == 3) {
    found.has_ended = (state == 'Z' || state == 'X') && threads <= 1;
  }
  return found;
}

}  // namespace

bool la_group_lives(pid_t group) {
  while (::waitpid(-group, nullptr, WNOHANG) > 0) {
  }
  if (::kill(-group, 0) != 0) return false;
  // Whoever has to reap the rest may be slow.
  const std::unique_ptr<DIR, close_directory> all(::opendir("/proc"));
  bool has_members = false;
  while (const dirent* entry = all ? ::readdir(all.get()) : nullptr) {
    if (std::isdigit(static_cast<unsigned char>(entry->d_name[0])) == 0) continue;
    const process found = process_of(entry->d_name);
    if (found.group != group) continue;
    if (!found.has_ended) return true;
    has_members = true;
  }
  return !has_members;
}
