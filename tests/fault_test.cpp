// What goes wrong around the launcher: the sessions in data/faults.txt show what really happens.
#include <sstream>

#include "support.h"

TEST(Faults, AreReportedAndLeaveNothingWrongBehind) {
  const std::string all = slurp(KESTREL_SOURCE_DIR "/tests/data/faults.txt");
  const std::size_t rows = all.find("\n\n== ") + 2;
  const std::string before = all.substr(0, rows);
  std::istringstream titles(replaced(all.substr(rows), "\n\n== ", "\n\f== "));
  std::string skipped;
  for (std::string row; std::getline(titles, row, '\f');) {
    const Tree tree;
    std::istringstream lines(row);
    std::string seen;
    for (std::string line; std::getline(lines, line);) {
      if (line.empty() || line[0] == '=') seen += line + "\n";
      if (line[0] == '$') seen += line + "\n" + tree.shell(before + line.substr(1));
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
