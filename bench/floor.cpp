// What the workloads cost at least: the system calls and the work on bytes that nobody gets around,
// and nothing else.
//
//   probe NAMES OUTPUT-DIRECTORY DIRECTORY...  finds up-to-date chains of three steps, prints them
//   plan LAYERS WIDTH TIMES DIRECTORY...       plans over rules between layers of extensions
//   split acd|urf FILE                         reads a rules file, splits it into its fields
//   spawn|fork MEGABYTES TIMES PROGRAM         starts a program over and over from a big process
//   print MEGABYTES                            prints lines of 32 bytes
//   read MEGABYTES                             splits its input into lines
//   run PROGRAM ARGUMENT...                    prints the kilobytes that a program took at most
#include <fcntl.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <string>
#include <string_view>

#include "bench/measure.h"

namespace {

/// The words of the command line from some word on.
using words = char**;

/// Time stamp of the file of this name in nanoseconds, or -1.
long time_of(std::string_view directory, std::string_view name, std::string_view ext) {
  static std::string path;
  path.assign(directory).append(name).append(ext);
  struct stat found = {};
  if (::stat(path.c_str(), &found) != 0 || S_ISDIR(found.st_mode)) return -1;
  return found.st_mtim.tv_sec * 1'000'000'000 + found.st_mtim.tv_nsec;
}

std::string content_of(const char* file) {
  const int descriptor = ::open(file, O_RDONLY);
  struct stat opened = {};
  require(descriptor >= 0 && ::fstat(descriptor, &opened) == 0, file);
  std::string content(static_cast<std::size_t>(opened.st_size), '\0');
  require(::read(descriptor, content.data(), content.size()) == opened.st_size, file);
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
  split(content_of(rest[0]), '\n', [rest](std::string_view name) {
    long before = -1;
    for (words dir = rest + 2; *dir != nullptr; ++dir) {
      before = std::max(before, time_of(*dir, name, ".a"));
    }
    for (const char* ext : {".b", ".c", ".kbo"}) {
      const long time = time_of(rest[1], name, ext);
      require(before >= 0 && time >= before, "a chain is not up to date");
      before = time;
    }
    std::printf("%s%.*s.kbo\n", rest[1], static_cast<int>(name.size()), name.data());
  });
}

/// Rules from each of width extensions to each of width more, layer upon layer; the last lead to
/// the wanted file. Extensions are numbers, the wanted one comes last. What has failed once is not
/// tried again.
class planner {
 public:
  planner(int layers, int width, words dirs) : dirs_(dirs) {
    for (int layer = 0; layer <= layers; ++layer) {
      for (int i = 0; i < width; ++i) {
        names_.push_back(".e" + std::to_string(layer) + "_" + std::to_string(i));
        producers_.emplace_back();
        for (int from = 0; layer > 0 && from < width; ++from) {
          producers_.back().push_back((layer - 1) * width + from);
        }
      }
    }
    producers_.emplace_back();
    for (int from = 0; from < width; ++from) producers_.back().push_back(layers * width + from);
  }

  bool plan() {
    failed_.assign(names_.size(), false);
    chain_.clear();
    return make(names_.size()) || exists(".kbo") || exists(".kbc");
  }

 private:
  bool make(std::size_t wanted) {
    for (const int needed : producers_[wanted]) {
      const auto i = static_cast<std::size_t>(needed);
      if (failed_[i]) continue;
      chain_.push_back(needed);
      if (make(i) || exists(names_[i])) return true;
      chain_.pop_back();
      failed_[i] = true;
    }
    return false;
  }
  bool exists(std::string_view ext) const {
    words dir = dirs_;
    while (*dir != nullptr && time_of(*dir, "top", ext) < 0) ++dir;
    return *dir != nullptr;
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

/// A data file has a key and fields on a line, a user rules file keywords and values.
void split_rules(words rest) {
  const bool is_data = std::string_view(rest[0]) == "acd";
  std::size_t fields = 0;
  std::size_t bytes = 0;
  const auto take = [&](std::string_view field) {
    while (!field.empty() && field.front() == ' ') field.remove_prefix(1);
    while (!field.empty() && field.back() == ' ') field.remove_suffix(1);
    ++fields;
    bytes += field.size();
  };
  measure(1, [&] {
    split(content_of(rest[1]), is_data ? '\n' : ';', [&](std::string_view record) {
      const std::size_t equals = std::min(record.find('='), record.size() - 1);
      take(record.substr(0, equals));
      split(record.substr(equals + 1), is_data ? ',' : '\n', take);
    });
  });
  require(fields > 100 && bytes > fields, "there are no fields");
}

void spawn(words command) {
  pid_t child = 0;
  require(::posix_spawnp(&child, *command, nullptr, nullptr, command, environ) == 0, *command);
}

void spawn_by_fork(words command) {
  if (::fork() != 0) return;
  ::execvp(*command, command);
  ::_exit(127);
}

void run(void (*start)(words), words command) {
  int status = 0;
  start(command);
  require(::wait(&status) > 0 && status == 0, *command);
}

void print_lines(int megabytes) {
  static char block[65536];
  for (std::size_t at = 0; at < sizeof block; ++at) block[at] = at % 32 == 31 ? '\n' : 'x';
  for (long left = megabytes * 1048576L; left > 0;) {
    const ssize_t length = ::write(STDOUT_FILENO, block + (-left & 31), sizeof block / 2);
    require(length > 0, "nobody reads");
    left -= length;
  }
}

void read_lines(long megabytes) {
  long lines = 0;
  measure(1, [&lines] {
    static char block[65536];
    for (ssize_t length = 0; (length = ::read(STDIN_FILENO, block, sizeof block)) > 0;) {
      split({block, static_cast<std::size_t>(length)}, '\n', [&](std::string_view) { ++lines; });
    }
  });
  require(lines >= megabytes * 32768, "lines are missing");
}

}  // namespace

int main(int count, char** arguments) {
  require(count > 2, "floor: what?");
  const std::string_view what = arguments[1];
  words rest = arguments + 2;
  const int number = std::atoi(rest[0]);
  if (what == "probe") probe(rest);
  if (what == "plan") plan(rest);
  if (what == "split") split_rules(rest);
  if (what == "print") print_lines(number);
  if (what == "read") read_lines(number);
  if (what == "spawn" || what == "fork") {
    grow(number);
    measure(std::atoi(rest[1]), [&] { run(what == "fork" ? spawn_by_fork : spawn, rest + 2); });
  }
  if (what == "run") {
    run(spawn, rest);
    rusage used = {};
    ::getrusage(RUSAGE_CHILDREN, &used);
    std::fprintf(stderr, "\n%ld\n", used.ru_maxrss);
  }
}
