// Rules: their records, both kinds of rules files, validation and inheritance.

#include <algorithm>
#include <random>
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
  return replaced(replaced(all, " status", ""), ",.a,.k,,,,0,,,,0,,success = 0\n", "@;");
}

struct Rules : testing::Test {
  /// Writes the user rules file. "@r" is a rule r from .a to .k with one status.
  void write_rules(const std::string& text) {
    const char* rule = "RuleName=$1;NetlistFile=.a;TargetExtension=.k;NetlisterSuccessStatus=0;";
    tree.write("u.urf", std::regex_replace(text, std::regex("@(\\w)"), rule));
  }
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
    for (const char* word : {"Launcher: ", "Rule: ", "\"u\", line "}) all = replaced(all, word, "");
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
2147483648   | no)");
}

TEST_F(Rules, Dumps) {
  const auto dump = [this](const std::string& text) {
    write_rules(text);
    Messages messages;
    LA_RULE_SET(nullptr, "u").dump(false);
    LA_RULE_SET(nullptr, "u").dump(true);
    return tree.shorten(messages.take());
  };
  expect_table(dump, R"(
@r Netlister=nl;NetlisterDirectory=d;CheckerFatalStatus=!0; | S Rule r: .a => .k  nl \nS \nS Rule: r\nS Netlist File: .a\nS Target: .k\nS Netlister: nl\nS Netlister Options: \nS Netlister Top Options: \nS Netlister Directory Flag: 4  Dir: ~/d/\nS Checker: \nS Checker Options:\nS Checker Directory Flag: 0  Dir: \nS success status = 0\nS fatal status ! 0\n)");
}

TEST_F(Rules, UserFiles) {
  const auto load_all_variants = [this](const std::string& text) {
    write_rules(text);
    const std::string result = loaded(nullptr, "u");
    std::string lower = tree.read("u.urf");
    UT_STR::Lower(lower.data());
    for (const std::string& other : {text + "\n", replaced(text, "\n", "\r\n") + "\r\n",
                                     "\xEF\xBB\xBF" + text, replaced(text, " ", "\t"), lower}) {
      write_rules(other);
      EXPECT_EQ(replaced(loaded(nullptr, "u"), "\t", " "), result) << other;
    }
    return result;
  };
  expect_table(load_all_variants, R"(
// c\n\t\n //                                           |
@r Netlister =\nn ; NetlisterOptions\t\n = "a; "\n;     | r,.a,.k,n,a; ,,0,,,,0,,success = 0\n
@r Netlister = "-p \n\n // c\n  x" ;                    | r,.a,.k,-p   x,,,0,,,,0,,success = 0\n
@r Netlister = x ; Netlister = a/b"c" ; Checker = ;     | r,.a,.k,a/bc,,,0,,,,0,,success = 0\n
@r @s NetlistFile = b.a ;                               | s,b.a,.k,,,,0,,,,0,,success = 0\nr@;
RuleName\n= r ;\n@r ; x ;                               | 1: Expecting keyword\n3: Expecting keyword\n(1)
a b=; a b = ; c ;\nd ; @r                               | 1: Expecting "="\n1: Expecting "="\n1: Expecting "="\n(1)
@r Netlister = a//b ;\n                                 | 1: Expecting value\nUnexpected end of file\n(1)
@r Netlister = a b ;\n@s Checker = "a" b;               | 1: Expecting ";"\n2: Expecting ";"\nUnexpected end of file\n(2)
1=b; @r\n1 = b ; a = "b                                 | 1: Rule does not have a RuleName\n2: Unexpected key word 1\nUnexpected end of file\n(1)
@r NetlisterSuccessStatus=x;NetlisterWarningStatus=x;NetlisterFatalStatus=x;\nCheckerSuccessStatus=x;CheckerWarningStatus=x;CheckerFatalStatus=x; | 1: Invalid exit code for NetlisterSuccessStatus.\n1: Invalid exit code for NetlisterWarningStatus.\n1: Invalid exit code for NetlisterFatalStatus.\n2: Invalid exit code for CheckerSuccesStatus.\n2: Invalid exit code for CheckerWarningStatus.\n2: Invalid exit code for CheckerFatalStatus.\n(1)
@r TargetExtension=x.k;                                 | Rule r only extension is used. Ignoring name x\nr,.a,x.k,,,,0,,,,0,,success = 0\n
RuleName=r; NetlistFile=none;                           | Rule r does not define a NetlistFile\nRule r does not define a TargetExtension\n(1)
@r NetlistFile=d/; Netlister=None; TargetExtension=NONE; | Rule r does not define a NetlistFile\nRule r does not define a TargetExtension\nRule r can not set Netlister to NONE\n(1)
@r NetlisterOptions="[$part][$family][$device][$pkg][$speed]$infile";\nNetlisterTopOptions="[$aul$ignore_locs$add_pads$quiet]{$libraries}$outfile$output"; | r,.a,.k,,[$part][$family][$device][$pkg][$speed]$infile,[$aul$ignore_locs$add_pads$quiet]{$libraries}$outfile$output,0,,,,0,,success = 0\n
@r NetlisterTopOptions=$part; NetlisterOptions=$outfile]; | Keyword "part" is not optional\nError parsing NetlisterTopOptions "$part" for rule r\nMissing '[' in options string\nError parsing NetlisterOptions "junk]" for rule r\n(1)
@r @s TargetExtension=.K; @t NetlistFile=.A;            | Rule r redefines rule s\nRule r redefines rule t\nRule s redefines rule t\n(3)
@r NetlistFile=x.a; @s TargetExtension=.l;\n@t          | r,x.a,.k,,,,0,,,,0,,success = 0\ns,.a,.l,,,,0,,,,0,,success = 0\nt@;)");
}

TEST_F(Rules, UserFileLimits) {
  const auto reads = [this](const std::string& text) {
    write_rules(text);
    return loaded(nullptr, "u");
  };
  EXPECT_EQ(reads("//" + std::string(257, 'x') + "\n@r"), "r@;");
  EXPECT_EQ(reads("//" + std::string(258, 'x')), "1: Line is longer than 259 characters\n(0)");
  const auto value = "@r Netlister=\"" + std::string(150, 'x') + "\n" + std::string(109, 'x');
  EXPECT_EQ(reads(value + "\";").substr(0, 268), "r,.a,.k," + std::string(259, 'x') + ",");
  EXPECT_EQ(reads(replaced(value, "Netlister", "RuleName") + "x\nx\"; @s"),
            "2: Value is longer than 259 characters\n(2)");
  EXPECT_EQ(reads("@r\n" + std::string(2, '\0') + "\n@s"), "2: Line holds a zero byte\n(2)");
}

TEST_F(Rules, UserFileNames) {
  write_rules("@r");
  tree.write("a.txt", tree.read("u.urf"));
  expect_table([this](const std::string& name) { return loaded(nullptr, name.c_str()); }, R"(
u     | r@;
a.txt | r@;)");
  const std::string name(260, 'x');
  EXPECT_EQ(loaded(nullptr, name.c_str()).find(name + "\" is longer than 259 characters"), 22);
}

TEST_F(Rules, SystemFiles) {
  const auto load = [this](const std::string& content) {
    tree.write("share/data/larules.acd", "RULES=" + content);
    return loaded(nullptr, nullptr);
  };
  expect_table(load, R"(
r\nr=.a,.k,t.x|.y||z,n,[$aul],o,$output,ck,d,=1,> 2,!0,<3,4,5 | r,.a,.k,n,o,[$aul],3,,ck,,4,~/d/,success = 1,warning > 2,fatal ! 0,success < 3,warning = 4,fatal = 5+t.x+.y\n
r,,s\nr=.a,.k,|y,n,none,None,NONE,NONE,NONE,NONE,0 | r,.a,.k,n,,,0,,,,0,,warning = 0\n
r\nr=.a,.k,d/x|s/,n,,,,,,0,,,,,,x        | r - Dependency file d/x is not a plain file name.\nr - Dependency file s/ is not a plain file name.\nr - Only the first 15 fields are used.\nr,.a,.k,n,,,0,,,,0,,success = 0+d/x+-\n
r,s\nr=.b,.k,,n,,,,,,0\ns=,none          | 594 s - NetlistFile is required.\n605 s - TargetExtension is required.\n632 s - Netlister is required.\n703 s - There must be at least one of the following: NetlisterSuccessStatus, NetlisterWarningStatus, or NetlisterFatalStatus.\n(0)
r\nr=.a,.k,,n,,,,c,,x,!,1x,1 2,=,-       | 670 r - Invalid exit code for NetlisterSuccessStatus.\n682 r - Invalid exit code for NetlisterWarningStatus.\n694 r - Invalid exit code for NetlisterFatalStatus.\n703 r - There must be at least one of the following: NetlisterSuccessStatus, NetlisterWarningStatus, or NetlisterFatalStatus.\n715 r - Invalid exit code for CheckerSuccessStatus.\n727 r - Invalid exit code for CheckerWarningStatus.\n739 r - Invalid exit code for CheckerFatalStatus.\n749 r - There myst be at least one of the following: CheckerSuccessStatus, CheckerWarningStatus, or CheckerFatalStatus.\n(0)
r,s\nr=.a,.k,,n,,,,,,0\ns=.A,.K,,n,,,,,,0 | Rule r redefines rule s\n(0)
r\n= x\nr=.a,.k,,n,,,,,,0                | "~/share/data/larules.acd", line 2: Expecting KEY = VALUE\n(0))");
  const std::string value(260, 'x');
  const std::string found = load("r\nr=.a,.k,," + value + ",,,,,,0") + load(value);
  EXPECT_LT(found.find("r - Netlister is longer than 259 characters.\n(0)"), found.size());
  EXPECT_LT(found.find("x - The name is longer than 259 characters.\n"), found.size());
}

TEST_F(Rules, ManyAndLong) {
  // Each user rule takes a netlister, as long as its number, from a system rule.
  std::string user, records, names, completed, redefined;
  for (int i = 0; i < 200; ++i) {
    const std::string n = std::to_string(i), netlister(static_cast<std::size_t>(i) + 1, 'n');
    const std::string kind = n + std::string(static_cast<std::size_t>(i) / 8, 'e');
    user += "RuleName=u" + n + ";NetlistFile=." + kind + ";TargetExtension=.k;\n";
    names += "r" + n + (i < 199 ? "," : "\n");
    records += "r" + n + "=." + kind + ",.K,," + netlister + ",,,,,,0\n";
    completed += "u" + n + ",." + kind + ",.k," + netlister + ",,,0,,,,0,,success = 0\n";
    redefined += "Rule r" + n + " redefines rule s" + n + "\n";
  }
  tree.write("u.urf", user);
  tree.write("share/data/larules.acd", "RULES=" + names + records);
  EXPECT_EQ(loaded(nullptr, "u").substr(0, completed.size()), completed);
  const std::string more = replaced("," + replaced(names, "\n", ""), ",r", ",\n s");
  tree.write("share/data/larules.acd", "RULES=" + replaced(names, "\n", "") + more + "\n" +
                                           records + replaced("\n" + records, "\nr", "\ns"));
  EXPECT_EQ(loaded(nullptr, nullptr), redefined + "(0)");
}

TEST_F(Rules, FamilyDefaultAndReplacement) {
  const Variable roots("CORVANE", tree.expand("~/share:~/share2:~/share3").c_str());
  tree.write("share/data/devices.acd", "D = fam, P, 1\n");
  tree.write("share2/data/fam/larules.acd", "RULES=f\nf=.A,.K,e.x|.z,n,,,,,,NONE,2\n");
  tree.write("share3/data/larules.acd", "RULES=d\nd=.a,.k,.y,m,top,opt,$OUTPUT,c,d,9,8,!0,7\n");
  write_rules("@u NetlisterOptions=NONE;NetlisterFatalStatus=none;");
  EXPECT_EQ(loaded("d-p", "u"),
            R"(u,.a,.k,n,,top,3,,c,,4,~/d/,success = 0,fatal NONE 0,warning = 2,success = 7+e.x+.z
f,.A,.K,n,opt,top,3,,c,,4,~/d/,warning = 2,success = 9,fatal ! 0,success = 7+e.x+.z
d,.a,.k,m,opt,top,3,,c,,4,~/d/,success = 9,warning = 8,fatal ! 0,success = 7+.y
)");
  Messages messages;
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

static constexpr la_text LA_RULE::*TEXTS[] = {&LA_RULE::netlister, &LA_RULE::netlister_top_options,
                                              &LA_RULE::netlister_options, &LA_RULE::checker};

/// What a rule r takes from a later one l.
static void complete(LA_RULE& r, const LA_RULE& l) {
  if (!r.netlist_file->match_ext(l.netlist_file->get_ext())) return;
  if (!r.target->match_ext(l.target->get_ext())) return;
  if (!r.has_dependency_files()) r.copy_dependency_files(l);
  if (!r.netlister_dir_flag) r.set_netlister_dir(l.netlister_dir.get(), l.netlister_dir_flag);
  if (!r.checker_dir_flag) r.set_checker_dir(l.checker_dir.get(), l.checker_dir_flag);
  for (const auto text : TEXTS) {
    if (r.*text == nullptr) r.*text = l.*text;
  }
  for (const auto list : {&LA_RULE::netlister_status, &LA_RULE::checker_status}) {
    for (const LA_STATUS* entry : l.*list) {
      const auto same = [entry](const LA_STATUS* own) { return own->level == entry->level; };
      if (std::any_of((r.*list).begin(), (r.*list).end(), same)) continue;
      (r.*list).append(new LA_STATUS(*entry));
    }
  }
}

TEST_F(Rules, AreCompletedFromLaterOnes) {
  // Each statement of a rule in its variants.
  const auto rows = table(R"(
NetlistFile=#.a; | NetlistFile=#.A; | NetlistFile=#.b; | NetlistFile=#;
TargetExtension=.k; | TargetExtension=.K; | TargetExtension=.l; | TargetExtension=l;
Netlister=m; | Netlister=n; | // none
NetlisterTopOptions=x; | NetlisterTopOptions=NONE; | // none | // none
NetlisterOptions=y; | NetlisterOptions=none; | // none
NetlisterDirectory=NONE; | NetlisterDirectory=x; | // none | // none
Checker=c; CheckerFatalStatus=6; | Checker=None; CheckerFatalStatus=none; | // none
CheckerDirectory=none; | CheckerDirectory=$SOURCE; | CheckerDirectory=y; | // none
NetlisterWarningStatus=1; | NetlisterWarningStatus=NONE; | // none
NetlisterFatalStatus=2; NetlisterFatalStatus=3; | NetlisterFatalStatus=4; | // none
CheckerSuccessStatus=4; CheckerWarningStatus=5; | CheckerWarningStatus=7; | // none)");
  std::mt19937 random(1);
  for (int round = 0; round < 50; ++round) {
    std::string text;
    for (char name = 'a'; name <= 't'; ++name) {
      text += std::string("RuleName=") + name + "; NetlisterSuccessStatus=0;\n";
      for (const auto& row : rows) text += replaced(row[random() % row.size()], "#", {name}) + "\n";
    }
    tree.write("u.urf", text);
    Messages messages;
    const LA_RULE_SET completed(nullptr, "u");
    // An invalid part leaves the rules as they were read.
    LA_RULE_SET set("no part", "u");
    for (LA_RULE** rule = set.rules.begin(); rule != set.rules.end(); ++rule) {
      for (LA_RULE** later = rule + 1; later != set.rules.end(); ++later) complete(**rule, **later);
      for (const auto text : TEXTS) {
        if (shown({(*rule)->*text}).size() == 4) (*rule)->*text = nullptr;  // "NONE"
      }
    }
    ASSERT_EQ(set.rules.count, 20);
    ASSERT_EQ(listed(completed), listed(set)) << text;
  }
}
