// The user rules file.
#include "fuzz.h"

void examine(const std::string& input, Tree& tree) {
  const std::string rules = rules_from(tree, "f.urf", input);
  // A line that is blank, or only a comment, changes nothing but the numbers of lines.
  const std::string again = rules_from(tree, "f.urf", replaced(input, "\n", "\n //\n\t\n"));
  EXPECT_TRUE(again == rules || rules.find("\", line ") != rules.npos) << rules << again;
}
