// The launcher as a guest of its process: what it leaves as it was, and how it is interrupted.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <signal.h>
#include <sys/ioctl.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <clocale>
#include <filesystem>
#include <set>

#include "host/port_interrupt.h"
#include "launcher/baslauncher.h"
#include "support.h"

namespace fs = std::filesystem;

namespace failing_memory {
long left = -1;      ///< allocations that succeed before one fails; -1 for all
bool lasts = false;  ///< those after it fail, too
bool has_failed = false;
}  // namespace failing_memory

// Out of line: g++ takes free for a mismatch where it sees it inlined.
[[gnu::noinline]] void* operator new(std::size_t size) {
  using namespace failing_memory;
  if (left == 0) {
    has_failed = true;
    if (!lasts) left = -1;
    throw std::bad_alloc();
  }
  if (left > 0) --left;
  return std::malloc(size);
}
[[gnu::noinline]] void operator delete(void* memory) noexcept {
  std::free(memory);
}
[[gnu::noinline]] void operator delete(void* memory, std::size_t) noexcept {
  std::free(memory);
}

namespace {

/// What a guest must leave as it is.
std::string process_state() {
  std::string state = fs::current_path().string() + " " + std::setlocale(LC_ALL, nullptr);
  for (char** variable = environ; *variable != nullptr; ++variable)
    state += "\n" + std::string(*variable);
  sigset_t mask;
  ::sigprocmask(SIG_BLOCK, nullptr, &mask);
  for (int number = 1; number < NSIG; ++number) {
    struct sigaction action = {};
    ::sigaction(number, nullptr, &action);
    state += "\n" + testing::PrintToString(action.sa_handler) +
             std::to_string(::sigismember(&mask, number));
  }
  std::set<std::string> files;
  for (const auto& file : fs::directory_iterator("/proc/self/fd")) {
    std::error_code gone;  // the descriptor of the iteration itself has no place that is the same
    const fs::path target = fs::read_symlink(file, gone);
    if (target.string().find("/proc/") == std::string::npos) files.insert(file.path() / target);
  }
  const mode_t creation = ::umask(0);
  ::umask(creation);
  return state + testing::PrintToString(files) + std::to_string(creation) +
         std::to_string(::waitpid(-1, nullptr, WNOHANG));
}

/// A tree whose netlisters do what the library entries say, the last one with its output in place.
class Guest : public testing::Test {
 protected:
  Guest() {
    fs::create_directory("bin");
    fs::create_symlink(TEST_NETLISTER, "bin/nl");
    tree.write("share/data/larules.acd", R"(RULES = a, b, c
a = .edf,.kbo,,nl,{$libraries }out=$outfile sleep=60000,{$libraries }out=$outfile,,,,0
b = .sch,.edf,,nl,,out=$outfile,,,,0
c = .v,.kbo,,missing,,,bin,,,0)");
    tree.make("d.sch e.v");
  }

  /// Resolves a name, whatever the time stamps say. Tells all that is said, and the result.
  std::string find(const char* name, const char* library, bool top = false) {
    LA_LAUNCHER launcher(nullptr, nullptr, 0, &library, 1, nullptr, nullptr, 1, 0, 0, 0, 0, 0);
    char source[LA_MAX_PATH];
    char netlist[LA_MAX_PATH];
    const short result = launcher.ok ? launcher.find(name, source, netlist, top) : short{-1};
    return tree.shorten(messages.take()) + std::to_string(result);
  }

  Tree tree;
  Variable path = {"PATH", tree.full("bin").c_str()};
  Messages messages;
};

void interrupt(void* self, const Port_Msg& message) {
  static_cast<Messages*>(self)->records.push_back({message.level, "", message.text});
  if (std::string(message.text) == "now\n") Port_Interrupt::Request(SIGTERM);
}

}  // namespace

TEST_F(Guest, LeavesItsProcessAsItWas) {
  const std::string first = "S Launcher: Executing nl out=\"d.edf\"\nS Launcher: Executing nl ";
  const std::string failed = "E Failed to launch program ";
  const std::string none = "0000000000000000\n";
  sigset_t all, before;
  ::sigfillset(&all);
  for (const auto& handler : {SIG_DFL, SIG_IGN, +[](int) {}}) {
    for (const int number : {SIGCHLD, SIGUSR1, SIGPIPE}) ::signal(number, handler);
    ::sigprocmask(SIG_SETMASK, &all, &before);
    const std::string state = process_state();
    EXPECT_EQ(find("d", "signals"),
              first + "signals out=\"d.kbo\"\nS SigBlk:\t" + none + "S SigIgn:\t" + none + "0");
    EXPECT_EQ(find("d", "exit=3"),
              first + "exit=3 out=\"d.kbo\"\nE nl exited with errors (return code 3).\n-1");
    EXPECT_EQ(find("e", ""), "S Launcher: Executing missing \n" + failed +
                                 "missing: No such file or directory\n-1");
    EXPECT_EQ(find("f", ""), "1");
    EXPECT_EQ(process_state(), state);
    ::sigprocmask(SIG_SETMASK, &before, nullptr);
    for (const int number : {SIGCHLD, SIGUSR1, SIGPIPE}) ::signal(number, SIG_DFL);
  }
}

// A child of the host's own ends while a netlister runs: is it left to be reaped, how often was the
// handler called, is the signal pending?
TEST_F(Guest, LeavesTheHostItsChildren) {
  static int calls;
  const auto handler = [](int) { ++calls; };
  struct {
    void (*action)(int);
    int flags, how;
    const char* left;
  } const rows[] = {{SIG_DFL, 0, SIG_UNBLOCK, "100"},          {SIG_DFL, 0, SIG_BLOCK, "101"},
                    {SIG_IGN, 0, SIG_UNBLOCK, "000"},          {handler, 0, SIG_UNBLOCK, "110"},
                    {SIG_DFL, SA_NOCLDWAIT, SIG_BLOCK, "001"}, {handler, 0, SIG_BLOCK, "101"}};
  sigset_t signals, pending;
  ::sigemptyset(&signals);
  ::sigaddset(&signals, SIGCHLD);
  for (const auto& [action, flags, how, left] : rows) {
    struct sigaction now = {};
    now.sa_handler = action;
    now.sa_flags = flags;
    ::sigaction(SIGCHLD, &now, nullptr);
    ::sigprocmask(how, &signals, nullptr);
    calls = 0;
    if (::fork() == 0) ::usleep(10'000), ::_exit(0);
    find("d", "sleep=100");
    ::sigpending(&pending);
    const int is_left = ::waitpid(-1, nullptr, WNOHANG) > 0;
    EXPECT_EQ(std::to_string(is_left) + std::to_string(calls > 0) +
                  std::to_string(::sigismember(&pending, SIGCHLD)),
              left);
    ::signal(SIGCHLD, SIG_DFL);
    ::sigprocmask(SIG_UNBLOCK, &signals, nullptr);
  }
}

TEST_F(Guest, BearsThatMemoryRunsOut) {
  int errors = 0;
  const auto count = [](void* sum, const Port_Msg& message) {
    *static_cast<int*>(sum) += message.level == PORT_MSG_ERROR;
  };
  const Port_MsgSink before = Port_MsgManData::setSink({count, &errors, false});
  const char* words[] = {"say=a"};
  for (failing_memory::lasts = false;; failing_memory::lasts = true) {
    for (long number = 0; number == 0 || failing_memory::has_failed; number += 1 + number / 20) {
      char source[LA_MAX_PATH], netlist[LA_MAX_PATH];
      errors = 0;
      failing_memory::has_failed = false;
      failing_memory::left = number;
      LA_LAUNCHER launcher("hx", words, 1, words, 1, "", nullptr, 1, 0, 1, 1, 1, 1);
      launcher.add_searchpaths(words, 1);
      short result = LA_FAILED;
      if (errors == 0) result = launcher.find("d", source, netlist, 0);
      failing_memory::left = -1;
      EXPECT_EQ(result == LA_FOUND, errors == 0) << number;
      EXPECT_EQ(::waitpid(-1, nullptr, WNOHANG), -1) << number;
    }
    if (failing_memory::lasts) break;
  }
  Port_MsgManData::setSink(before);
}

// Each netlister tells how many children its parent has, and leaves one to it that ends.
TEST_F(Guest, ACommandReapsWhatNetlistersLeave) {
  tree.remove("bin/nl");
  tree.write("bin/nl",
             "#!/bin/sh\nPATH=/bin\nwc -w </proc/$PPID/task/$PPID/children; (true &); sleep 0.1");
  ::chmod("bin/nl", 0700);
  const std::string command = KESTREL_LAUNCH;
  const Ran ran = run({"/bin/sh", "-c", command + " -f d d 2>&1 | /bin/grep '^[0-9]'"});
  EXPECT_EQ(ran.out, "1\n2\n1\n2\n");
}

TEST_F(Guest, FailsCleanlyWithoutDescriptors) {
  const std::string good = find("d", "");
  rlimit limit;
  ::getrlimit(RLIMIT_NOFILE, &limit);
  const std::string state = process_state();
  const int next = ::dup(0);
  ::close(next);
  std::string found;
  for (unsigned free = 0; found != good && free < 20; ++free) {
    const rlimit few = {static_cast<rlim_t>(next) + free, limit.rlim_max};
    ::setrlimit(RLIMIT_NOFILE, &few);
    found = find("d", "");
    ::setrlimit(RLIMIT_NOFILE, &limit);
    EXPECT_TRUE(found == good || found.find(" open ") != found.npos) << found;
    EXPECT_EQ(process_state(), state) << free;
  }
  EXPECT_EQ(found, good);
}

TEST_F(Guest, IsInterruptedByItsHost) {
  const std::string start =
      "S Launcher: Executing nl out=\"d.edf\"\nE Launcher: nl was interrupted.\n-1";
  const Port_MsgSink before = Port_MsgManData::setSink({interrupt, &messages, false});
  const std::string state = process_state();
  const std::string interrupted = replaced(
      start, "E ", "S Launcher: Executing nl say=now out=\"d.kbo\" sleep=60000\nS now\nE ");
  EXPECT_EQ(find("d", "say=now", true), interrupted);
  EXPECT_EQ(find("d", ""), "E Launcher: The work on d was interrupted.\n-1");
  EXPECT_EQ(Port_Interrupt::Requested(), SIGTERM);
  Port_Interrupt::Clear();
  EXPECT_TRUE(find("d", "").ends_with("0"));
  EXPECT_EQ(process_state(), state);
  Port_MsgManData::setSink(before);
}

// Messages and results go to one file here. The second command says "now" and sleeps.
TEST_F(Guest, ACommandShowsMessagesInOrderAndAtOnce) {
  const std::string command = KESTREL_LAUNCH, again = "Launcher: d.edf is up to date\n";
  run({"/bin/sh", "-c", command + " --not-top -l say=a d d >log 2>&1"});
  EXPECT_EQ(tree.shorten(tree.read("log")),
            "Launcher: Executing nl out=\"d.edf\"\nLauncher: Executing nl say=a out=\"d.kbo\"\n"
            "a\n~/d.kbo\n" +
                again +
                "Launcher: d.kbo is up to date\n~/d.kbo\n"
                "kestrel-launch: 2 names: 1 built, 1 up to date\n");
  tree.remove("d.kbo");
  std::string seen;
  run({"/bin/sh", "-c", "exec " + command + " -l say=now d >log 2>&1"}, [&](pid_t launch) {
    for (int i = 0; i < 20'000 && !seen.ends_with("now\n"); ++i, ::usleep(1000))
      seen = tree.read("log");
    ::kill(launch, SIGTERM);
  });
  EXPECT_EQ(seen, again + "Launcher: Executing nl say=now out=\"d.kbo\" sleep=60000\nnow\n");
}

// Whoever shares its standard error or output may have asked not to wait there, and reads late,
// also after signals, or never: then a signal ends it all the same.
TEST_F(Guest, ACommandLosesNothingToLateReadersAndDoesNotWaitForever) {
  ::signal(SIGTERM, SIG_DFL);
  sigset_t inherited;
  ::sigemptyset(&inherited);
  ::sigaddset(&inherited, SIGALRM);
  ::sigprocmask(SIG_BLOCK, &inherited, nullptr);
  std::string names;
  for (int i = 0; i < 5000; ++i) names += "nowhere\n";
  tree.write("names", names);
  for (const auto& row : table(R"(
2>              | nonblock | read      | 1   | kestrel-launch: 5000 names: 5000 not found
--json 2>log 1> | nonblock | read      | 1   | {"ok":true,"errors":0,"warnings":0}
2>              | block    | kill      | 143 |
--json 2>log 1> | block    | kill      | 143 |
--json 2>log 1> | nonblock | kill      | 143 |
2>              | block    | kill read | 143 | kestrel-launch: 5000 names:
--json 2>log 1> | nonblock | kill read | 143 | {"ok":true,
)")) {
    int ends[2];
    ASSERT_EQ(::pipe(ends), 0);
    ASSERT_LT(ends[1], 10);  // The shell takes one digit.
    if (row[1] == "nonblock") ::fcntl(ends[1], F_SETFL, O_NONBLOCK);
    std::string said;
    const auto reader = [&](pid_t launch) {
      ::close(ends[1]);
      int waiting = 0;
      for (int i = 0; i < 20'000 && waiting < 60'000; ++i, ::usleep(1000)) {
        ::ioctl(ends[0], FIONREAD, &waiting);
      }
      // A second signal is no reason to lose something, either.
      for (int i = 0; i < 2 && row[2] != "read"; ++i, ::usleep(20'000)) ::kill(launch, SIGTERM);
      if (row[2] == "kill") return;
      char block[4096];
      for (ssize_t length; (length = ::read(ends[0], block, sizeof block)) > 0;) {
        said.append(block, static_cast<std::size_t>(length));
      }
    };
    const std::string command = KESTREL_LAUNCH, place = row[0] + "&" + std::to_string(ends[1]);
    const Ran ran =
        run({"/bin/sh", "-c", "exec " + command + " --names-from names " + place}, reader);
    ::close(ends[0]);
    EXPECT_EQ(ran.status, std::stoi(row[3])) << row[0];
    const auto lines = std::count(said.begin(), said.end(), '\n');
    EXPECT_TRUE(row[2] != "read" || lines == 5001) << row[0] << lines;
    const std::string last = said.substr(said.rfind('\n', said.size() - 2) + 1);
    EXPECT_EQ(last.substr(0, row[4].size()), row[4]) << row[0];
  }
}

// The signals come when the last netlister of a chain has begun to write its output.
TEST_F(Guest, AnInterruptedCommandEndsWhatItStarted) {
  for (const int number : {SIGINT, SIGTERM, SIGHUP, SIGQUIT}) ::signal(number, SIG_DFL);
  for (const auto& row : table(R"(
2    | group | quiet
15   | alone | quiet
1    | alone | trap=1
3    | alone | quiet
2 15 | alone | defy=2
)")) {
    tree.remove("d.kbo");
    int held[2];
    ASSERT_EQ(::pipe(held), 0);
    const auto interrupted = [&](pid_t command) {
      ::close(held[1]);
      std::istringstream numbers(row[0]);
      std::string sign = "d.kbo";
      for (int number; numbers >> number; sign = "defied") {
        for (int i = 0; i < 20'000 && !tree.exists(sign); ++i) ::usleep(1000);
        ::kill(row[1] == "group" ? -command : command, number);
      }
    };
    const Ran ran = run({KESTREL_LAUNCH, "-f", "-l", row[2], "-l", "leave=60", "d"}, interrupted);
    EXPECT_EQ(ran.status, 128 + std::stoi(row[0]));
    EXPECT_EQ(ran.err,
              "Launcher: Executing nl out=\"d.edf\"\nLauncher: Executing nl " + row[2] +
                  " leave=60 out=\"d.kbo\" sleep=60000\nERROR: Launcher: nl was interrupted.\n");
    // Nobody is left who holds the other end.
    pollfd event = {held[0], POLLIN, 0};
    EXPECT_EQ(::poll(&event, 1, 0), 1) << row[0];
    ::close(held[0]);
    EXPECT_EQ(run({KESTREL_LAUNCH, "--not-top", "d"}).err,
              "Launcher: d.edf is up to date\nLauncher: Executing nl out=\"d.kbo\"\n");
  }
}
