// What the workloads cost at least: the system calls and the work on bytes that nobody gets around,
// and nothing else.
//
//   probe NAMES OUTPUT-DIRECTORY DIRECTORY...  finds up-to-date chains of three steps, prints them
//   plan LAYERS WIDTH TIMES DIRECTORY...       plans over rules between layers of extensions
//   split acd|urf FILE                         reads a rules file, splits it into its fields
//   spawn|fork MEGABYTES TIMES PROGRAM         starts a program over and over from a big process
//   print MEGABYTES                            prints short lines
//   read MEGABYTES                             splits into lines what a child prints
//   run PROGRAM ARGUMENT...                    tells the memory that a program took
#include <fcntl.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <climits>
#include <string>
#include <string_view>
#include <vector>

#include "bench/measure.h"

namespace {

/// The words of the command line from some word on.
using words = char**;

/// Time stamp of a file in nanoseconds, or -1.
long time_of(const char* path) {
  struct stat found = {};
  if (::stat(path, &found) != 0 || S_ISDIR(found.st_mode)) return -1;
  return found.st_mtim.tv_sec * 1'000'000'000 + found.st_mtim.tv_nsec;
}

/// A path made of pieces, without a memory of its own to be allocated.
struct path_buffer {
  char chars[PATH_MAX];
  std::size_t length = 0;

  void add(std::string_view piece) {
    std::memcpy(chars + length, piece.data(), piece.size());
    length += piece.size();
    chars[length] = '\0';
  }
  void cut(std::size_t new_length) { length = new_length; }
};

std::string content_of(const char* file) {
  std::string content;
  const int descriptor = ::open(file, O_RDONLY);
  struct stat opened = {};
  require(descriptor >= 0 && ::fstat(descriptor, &opened) == 0, file);
  content.resize(static_cast<std::size_t>(opened.st_size));
  require(::read(descriptor, content.data(), content.size()) == opened.st_size, file);
  ::close(descriptor);
  return content;
}

/// Calls take with each piece of text that ends with the separator, and the rest if there is one.
template <class Take>
void split(std::string_view text, char separator, Take take) {
  while (!text.empty()) {
    const std::size_t end = std::min(text.find(separator), text.size());
    take(text.substr(0, end));
    text.remove_prefix(std::min(end + 1, text.size()));
  }
}

void probe(words rest) {
  const std::string names = content_of(*rest++);
  const std::string_view output_dir = *rest++;
  split(names, '\n', [&](std::string_view name) {
    long source = -1;
    for (words dir = rest; *dir != nullptr; ++dir) {
      path_buffer path;
      path.add(*dir);
      path.add(name);
      path.add(".a");
      const long time = time_of(path.chars);
      if (source < 0) source = time;
    }
    path_buffer output;
    output.add(output_dir);
    output.add(name);
    const std::size_t root = output.length;
    long before = source;
    for (const char* ext : {".b", ".c", ".kbo"}) {
      output.cut(root);
      output.add(ext);
      const long time = time_of(output.chars);
      require(before >= 0 && time >= before, "a chain is not up to date");
      before = time;
    }
    std::puts(output.chars);
  });
}

/// Rules from each of width extensions to each of width more, layer upon layer; the last lead to
/// the wanted file. Extensions are numbers, the wanted one comes last. What has failed once is not
/// tried again.
class planner {
 public:
  planner(int layers, int width, words dirs) : dirs_(dirs) {
    const int wanted = layers * width + width;
    producers_.resize(static_cast<std::size_t>(wanted) + 1);
    for (int layer = 0; layer <= layers; ++layer) {
      for (int from = 0; from < width; ++from) {
        names_.push_back(".e" + std::to_string(layer) + "_" + std::to_string(from));
        for (int to = 0; to < (layer < layers ? width : 1); ++to) {
          const int made = layer < layers ? (layer + 1) * width + to : wanted;
          producers_[static_cast<std::size_t>(made)].push_back(layer * width + from);
        }
      }
    }
  }

  bool plan() {
    failed_.assign(names_.size(), false);
    chain_.clear();
    return make(static_cast<int>(names_.size())) || exists(".kbo") || exists(".kbc");
  }

 private:
  bool make(int wanted) {
    for (const int needed : producers_[static_cast<std::size_t>(wanted)]) {
      const auto i = static_cast<std::size_t>(needed);
      if (failed_[i]) continue;
      chain_.push_back(needed);
      if (make(needed) || exists(names_[i])) return true;
      chain_.pop_back();
      failed_[i] = true;
    }
    return false;
  }
  bool exists(std::string_view ext) const {
    for (words dir = dirs_; *dir != nullptr; ++dir) {
      path_buffer path;
      path.add(*dir);
      path.add("top");
      path.add(ext);
      if (time_of(path.chars) >= 0) return true;
    }
    return false;
  }

  words dirs_;
  std::vector<std::string> names_;
  std::vector<std::vector<int>> producers_;
  std::vector<bool> failed_;
  std::vector<int> chain_;
};

void plan(words rest) {
  planner rules(std::atoi(rest[0]), std::atoi(rest[1]), rest + 3);
  measure(std::atoi(rest[2]), [&rules] { rules.plan(); });
}

std::string_view trimmed(std::string_view text) {
  const std::size_t start = text.find_first_not_of(" \t");
  if (start == text.npos) return {};
  return text.substr(start, text.find_last_not_of(" \t") - start + 1);
}

/// A data file has a key and fields on a line, a user rules file keywords and values.
void split_rules(words rest) {
  const bool is_data = std::string_view(rest[0]) == "acd";
  std::vector<std::string_view> fields;
  measure(1, [&] {
    static std::string content;
    content = content_of(rest[1]);
    split(content, is_data ? '\n' : ';', [&](std::string_view record) {
      const std::size_t equals = std::min(record.find('='), record.size() - 1);
      fields.push_back(trimmed(record.substr(0, equals)));
      const std::string_view value = record.substr(equals + 1);
      if (!is_data) fields.push_back(trimmed(value));
      if (is_data) split(value, ',', [&](std::string_view f) { fields.push_back(trimmed(f)); });
    });
  });
  require(fields.size() > 100, "there are no fields");
}

void wait_for(pid_t child) {
  int status = 0;
  require(::waitpid(child, &status, 0) == child && status == 0, "a child failed");
}

pid_t start(words command, const posix_spawn_file_actions_t* actions) {
  pid_t child = 0;
  require(::posix_spawnp(&child, *command, actions, nullptr, command, environ) == 0, *command);
  return child;
}

void start_often(words rest, bool by_fork) {
  grow(std::atoi(rest[0]));
  measure(std::atoi(rest[1]), [&] {
    const pid_t child = by_fork ? ::fork() : start(rest + 2, nullptr);
    if (by_fork && child == 0) {
      ::execvp(rest[2], rest + 2);
      ::_exit(127);
    }
    wait_for(child);
  });
}

void print_lines(words rest) {
  static char block[65536];
  for (std::size_t at = 0; at < sizeof block; ++at) block[at] = at % 32 == 31 ? '\n' : 'x';
  for (int blocks = std::atoi(rest[0]) * 16; blocks > 0; --blocks) {
    for (std::size_t done = 0; done < sizeof block;) {
      const ssize_t length = ::write(STDOUT_FILENO, block + done, sizeof block - done);
      if (length <= 0) std::exit(1);
      done += static_cast<std::size_t>(length);
    }
  }
}

void read_lines(words rest, const char* self) {
  long lines = 0;
  measure(1, [&] {
    int ends[2];
    require(::pipe2(ends, O_CLOEXEC) == 0, "no pipe");
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_adddup2(&actions, ends[1], STDOUT_FILENO);
    std::string command[] = {self, "print", rest[0]};
    char* arguments[] = {command[0].data(), command[1].data(), command[2].data(), nullptr};
    const pid_t child = start(arguments, &actions);
    ::close(ends[1]);
    static char block[65536];
    for (ssize_t length = 0; (length = ::read(ends[0], block, sizeof block)) > 0;) {
      split({block, static_cast<std::size_t>(length)}, '\n', [&](std::string_view) { ++lines; });
    }
    wait_for(child);
  });
  require(lines >= std::atoi(rest[0]) * 32768L, "lines are missing");
}

void run_program(words command) {
  wait_for(start(command, nullptr));
  rusage used = {};
  ::getrusage(RUSAGE_CHILDREN, &used);
  std::fprintf(stderr, "\nkilobytes %ld\n", used.ru_maxrss);
}

}  // namespace

int main(int count, char** arguments) {
  require(count > 2, "floor: what?");
  const std::string_view what = arguments[1];
  const words rest = arguments + 2;
  if (what == "probe") probe(rest);
  if (what == "plan") plan(rest);
  if (what == "split") split_rules(rest);
  if (what == "spawn" || what == "fork") start_often(rest, what == "fork");
  if (what == "print") print_lines(rest);
  if (what == "read") read_lines(rest, arguments[0]);
  if (what == "run") run_program(rest);
}
