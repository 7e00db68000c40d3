// Rules: exit codes, system rules files, and which files are read.
#include <regex>

#include "rules/baslarules.h"
#include "support.h"

/// Rules, one a line: the values of their dumps, in that order, and behind "+" dependency files.
static std::string listed(const LA_RULE_SET& set) {
  static const std::regex LABEL("\nS ([A-Z][^:\n]*: ?)?|  Dir: ?");
  std::string all;
  for (const LA_RULE* rule : set.rules) {
    Messages messages;
    rule->dump(true);
    all += std::regex_replace("\n" + messages.take().substr(3), LABEL, ",").substr(1);
    for (int i = 0; i < rule->num_dependency_files(); ++i) {
      all.insert(all.size() - 1, "+" + shown({rule->dependency_files->elements[i]->get_file()}));
    }
  }
  return replaced(all, " status", "");
}

struct Rules : testing::Test {
  /// What loading says, errors of system rules with their lines, and the rules when they are valid,
  /// else their number.
  std::string loaded(const char* part, const char* user) const {
    Messages messages;
    const LA_RULE_SET set(part, user);
    std::string all;
    for (const auto& [level, origin, text] : messages.records) {
      const bool has_line = level == PORT_MSG_ERROR && text.starts_with("Launcher: Rule: ");
      if (has_line) all += replaced(origin, "rules/baslarules.cpp:", "").substr(0, 4);
      all += text;
    }
    all = replaced(replaced(all, "Launcher: ", ""), "Rule: ", "");
    all += set.is_valid ? listed(set) : "(" + std::to_string(set.rules.count) + ")";
    return tree.shorten(all);
  }

  Tree tree;
};

TEST_F(Rules, StatusValues) {
  // Operator and code of a value, and those of six exit codes that it matches.
  const auto matches = [](const std::string& value) {
    LA_RULE rule("r");
    rule.add_checker_status(LA_FATAL, "5");
    if (!rule.add_checker_status(LA_WARNING, value.c_str())) return std::string("no");
    const LA_STATUS& entry = *rule.checker_status.elements[1];
    std::string all = std::to_string(entry.op) + " " + std::to_string(entry.code) + ":";
    for (const int code : {-9, -1, 0, 1, 5, 9}) {
      if (rule.checker_result(code) == LA_WARNING) all += " " + std::to_string(code);
    }
    return all;
  };
  expect_table(matches, R"(
0            | 0 0: 0
!0           | 1 0: -9 -1 1 9
\t< +1\t     | 2 1: -9 -1 0
>  0         | 3 0: 1 9
=-2147483648 | 0 -2147483648:
nOnE         | 5 0:
NONE1        | no
2147483648   | no
-2147483649  | no)");
}

TEST_F(Rules, SystemFiles) {
  const auto load = [this](const std::string& content) {
    tree.write("share/data/larules.acd", "RULES=" + content);
    return loaded(nullptr, nullptr);
  };
  expect_table(load, R"(
r\nr=.a,.k,t.x|.y||z,n,[$aul],o,$output,ck,d,=1,> 2,!0,<3,4,5 | r,.a,.k,n,o,[$aul],3,,ck,,4,~/d/,success = 1,warning > 2,fatal ! 0,success < 3,warning = 4,fatal = 5+t.x+.y\n
r,,s\nr=.a,.k,|y,n,none,None,NONE,NONE,NONE,NONE,0 | r,.a,.k,n,,,0,,,,0,,warning = 0\n
r\nr=.a,.k,d/x|/s,n,,,,,,0,,,,,,x        | r - Dependency file d/x is not a plain file name.\nr - Dependency file /s is not a plain file name.\nr - Only the first 15 fields are used.\nr,.a,.k,n,,,0,,,,0,,success = 0+d/x+-\n
r,s\nr=.b,.k,,n,,,,,,0\ns=,none          | 594 s - NetlistFile is required.\n605 s - TargetExtension is required.\n632 s - Netlister is required.\n703 s - There must be at least one of the following: NetlisterSuccessStatus, NetlisterWarningStatus, or NetlisterFatalStatus.\n(0)
r\nr=.a,.k,,n,,,,c,,x,!,1x,1 2,=,-       | 670 r - Invalid exit code for NetlisterSuccessStatus.\n682 r - Invalid exit code for NetlisterWarningStatus.\n694 r - Invalid exit code for NetlisterFatalStatus.\n703 r - There must be at least one of the following: NetlisterSuccessStatus, NetlisterWarningStatus, or NetlisterFatalStatus.\n715 r - Invalid exit code for CheckerSuccessStatus.\n727 r - Invalid exit code for CheckerWarningStatus.\n739 r - Invalid exit code for CheckerFatalStatus.\n749 r - There myst be at least one of the following: CheckerSuccessStatus, CheckerWarningStatus, or CheckerFatalStatus.\n(0)
r,s\nr=.a,.k,,n,,,,,,0\ns=.A,.K,,n,,,,,,0 | Rule r redefines rule s\n(0)
r,s\nr=t.a.,.k,,n,,,,,,0\ns=t.A,.k,,n,,,,,,0 | Rule r redefines rule s\n(0)
r\n= x\nr=.a,.k,,n,,,,,,0                | "~/share/data/larules.acd", line 2: Expecting KEY = VALUE\n(0))");
  const std::string value(260, 'x');
  const std::string found = load("r\nr=.a,.k,," + value + ",,,,,,0") + load(value);
  EXPECT_LT(found.find("r - Netlister is longer than 259 characters.\n(0)"), found.size());
  EXPECT_LT(found.find("x - The name is longer than 259 characters.\n"), found.size());
}

TEST_F(Rules, FamilyDefaultAndReplacement) {
  const Variable roots("CORVANE", tree.expand("~/share:~/share2:~/share3").c_str());
  tree.write("share/data/devices.acd", "D = fam, P, 1\n");
  tree.write("share2/data/fam/larules.acd", "RULES=f\nf=.A,.K,e.x|.z,n,,,,,,NONE,2\n");
  tree.write("share3/data/larules.acd", "RULES=d\nd=.a,.k,.y,m,top,opt,$OUTPUT,c,d,9,8,!0,7\n");
  tree.write("u.urf", R"(RuleName=u; NetlistFile=.a; TargetExtension=.k; NetlisterOptions=NONE;
NetlisterSuccessStatus=0; NetlisterFatalStatus=none;)");
  tree.write("bad.urf", "RuleName=\nr; x\n;\ny\n");
  EXPECT_EQ(loaded("d-p", "u"),
            R"(u,.a,.k,n,,top,3,,c,,4,~/d/,success = 0,fatal NONE 0,warning = 2,success = 7+e.x+.z
f,.A,.K,n,opt,top,3,,c,,4,~/d/,warning = 2,success = 9,fatal ! 0,success = 7+e.x+.z
d,.a,.k,m,opt,top,3,,c,,4,~/d/,success = 9,warning = 8,fatal ! 0,success = 7+.y
)");
  EXPECT_EQ(loaded("d-p", "bad"),
            "\"bad\", line 2: Expecting keyword\n\"bad\", line 4: Expecting keyword\n"
            "Unexpected end of file\n(1)");
  Messages messages;
  const LA_RULE_SET bad(nullptr, "bad");
  EXPECT_EQ(bad.rules.elements[0]->origin.line * 10 + bad.unfinished_statement.line, 14);
  EXPECT_EQ(tree.shorten(bad.unfinished_statement.file), "~/bad.urf");
  messages.take();
  EXPECT_EQ(LA_RULE_SET("x", "u").rules.count, 1);
  EXPECT_EQ(messages.records.at(0).origin, "rules/baslarules.cpp:549 $Revision: 1.12 $");
  EXPECT_EQ(messages.take(), "E Launcher: x is not a valid PM name.\n");
  const Variable allowed("CVN_KESTREL_ALLOW_PLF", "");
  EXPECT_EQ(loaded(nullptr, nullptr).substr(0, 6), "d,.a,.");
  tree.write("share2/data/laplfrules.acd", "RULES=p\np=.a,.k,,n,,,,,,0\n");
  tree.write("share3/data/laplfrules.acd", "RULES=q\n");
  const std::string trace = "CVN_KESTREL_ALLOW_PLF is set. Using rules file for plf2kdb.\n";
  EXPECT_EQ(replaced(loaded("D", nullptr), trace, "T"),
            replaced("TTpp", "p", "p,.a,.k,n,,,0,,,,0,,success = 0\n"));
}
