// The sessions in data/*.txt show what the command really does.
#include <sstream>

#include "support.h"

/// Plays the sessions of a file again, each in a new tree. A line "> " goes on with the line
/// before.
static void expect_sessions(const std::string& file) {
  const std::string all = slurp(KESTREL_SOURCE_DIR "/tests/data/" + file);
  const std::size_t rows = all.find("\n\n== ") + 2;
  const std::string before = all.substr(0, rows);
  std::istringstream titles(replaced(all.substr(rows), "\n\n== ", "\n\f== "));
  std::string skipped;
  for (std::string row; std::getline(titles, row, '\f');) {
    const Tree tree;
    std::istringstream lines(replaced(row, "\n>", "\v>"));
    std::string seen;
    for (std::string line; std::getline(lines, line);) {
      if (line[0] == '=') seen += line + "\n";
      if (line[0] != '$') continue;
      const std::string command = replaced(replaced(line, "\v> ", "\n"), "\v>", "\n");
      seen += replaced(line, "\v", "\n") + "\n" + tree.shell(before + command.substr(1));
    }
    tree.shell("chmod -R u+rwx .");
    if (seen.find("\ncannot be set up: ") == seen.npos) {
      EXPECT_EQ(seen, row);
    } else {
      skipped += row.substr(0, row.find('\n')) + "\n";
    }
  }
  if (!skipped.empty()) GTEST_SKIP() << "These cannot be set up here:\n" << skipped;
}

TEST(Sessions, Command) {
  expect_sessions("command.txt");
}

TEST(Sessions, UserRules) {
  expect_sessions("user_rules.txt");
}

TEST(Sessions, Faults) {
  expect_sessions("faults.txt");
}

TEST(Sessions, Explanations) {
  expect_sessions("explanations.txt");
}
