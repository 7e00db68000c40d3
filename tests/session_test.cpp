// The sessions in data/*.txt show what the command really does. With KESTREL_SESSION=TEXT only
// those are played whose titles hold TEXT; with KESTREL_WRITE=1 what is seen is written into the
// files.
#include <cstdlib>
#include <fstream>
#include <sstream>

#include "support.h"

/// Plays a session again in a new tree, each "$" line as a shell of its own, behind the lines
/// before. A line "> " goes on with the line above. Tells what is seen, as it stands in the file.
static std::string played(const std::string& row, const std::string& before) {
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
  return seen;
}

static void expect_sessions(const std::string& file) {
  const std::string path = KESTREL_SOURCE_DIR "/tests/data/" + file, all = slurp(path);
  const std::size_t rows = all.find("\n\n== ") + 2;
  const char* only = std::getenv("KESTREL_SESSION");
  std::istringstream titles(replaced(all.substr(rows), "\n\n== ", "\n\f== "));
  std::string written = all.substr(0, rows - 1), skipped;
  for (std::string row; std::getline(titles, row, '\f');) {
    const std::string title = row.substr(0, row.find('\n') + 1);
    std::string seen = row;
    if (only == nullptr || title.find(only) != title.npos) seen = played(row, all.substr(0, rows));
    if (seen.find("\ncannot be set up: ") != seen.npos) {
      skipped += title;
      seen = row;
    }
    if (seen != row) ADD_FAILURE() << file << " expects\n\n" << row << "\nbut seen is\n\n" << seen;
    written += "\n" + seen;
  }
  if (std::getenv("KESTREL_WRITE") != nullptr) std::ofstream(path, std::ios::binary) << written;
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
