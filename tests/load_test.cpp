// A launcher that is called very often holds no more than at first.
#include <malloc.h>
#include <sys/wait.h>

#include <filesystem>

#include "launcher/baslauncher.h"
#include "support.h"

/// How many files are open, and more than that where there are children.
static long files_and_children() {
  const long children = ::waitpid(-1, nullptr, WNOHANG) >= 0 ? 1'000 : 0;
  return children + std::distance(std::filesystem::directory_iterator("/proc/self/fd"), {});
}

TEST(Load, ManyCallsHoldNoMoreThanFew) {
  Tree tree;
  const Variable path("PATH", tree.full("bin").c_str());
  std::filesystem::create_directory("bin");
  std::filesystem::create_symlink(TEST_NETLISTER, "bin/nl");
  tree.write("share/data/larules.acd", R"(RULES = a, b, c
a = .in, .kbo, NONE, nl, NONE, NONE, NONE, NONE, NONE, 0
b = .do, .kbo, NONE, nl, NONE, say=a, NONE, NONE, NONE, 0
c = .no, .kbo, NONE, nl, NONE, out=$outfile exit=1, NONE, NONE, NONE, 0)");
  tree.make("d.in d.kbo@1 ran.do failed.no s/");
  const char* dirs[] = {"s"};
  Messages messages;
  LA_LAUNCHER launcher(nullptr, dirs, 1, nullptr, 0, nullptr, nullptr, 0, 0, 0, 0, 0, 0);
  const long before = files_and_children();
  std::size_t memory = 0;
  for (int i = 0; i < 300; ++i) {
    if (i == 50) memory = ::mallinfo2().uordblks;
    std::string results;
    for (const char* name : {"d", "ran", "failed", "none", ""}) {
      char source[LA_MAX_PATH], netlist[LA_MAX_PATH];
      results += std::to_string(launcher.find(name, source, netlist, 1)) + " ";
    }
    ASSERT_EQ(results, "0 0 -1 1 -1 ");
    messages.take();
  }
  EXPECT_EQ(launcher.errors, 600);
  EXPECT_EQ(files_and_children(), before);
  // Less than the smallest piece of memory for each time around.
  EXPECT_LT(::mallinfo2().uordblks, memory + 6000);
}
