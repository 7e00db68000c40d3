// The command: whole runs of it.
#include <gtest/gtest.h>

#include <filesystem>

#include "cli/settings.h"
#include "host/port_process.h"
#include "support.h"

namespace {

/// A tree with rules and files, and runs of the command in it.
class Command : public testing::Test {
 protected:
  Command() : path_("PATH", tree_.full("bin").c_str()) {
    tree_.make("bin/ out/ d.edf g.v e.kbc -x.kbc s/f.kbc");
    std::filesystem::create_symlink(TEST_NETLISTER, "bin/nl");
    tree_.write("share/data/larules.acd", R"(RULES = a, b, c
a = .edf,.kbo,.x,nl,args out=$outfile,out=ran [$ignore_locs] [$add_pads] [$quiet] [$aul] {$libraries }$infile,$OUTPUT,chk,/w,0,,!0,<2
b = top.vhd,.edf,,nl,,,,,,>1
c = .v,.edf,,nl,,exit=1,,,,0)");
    tree_.write("own.urf", R"(RuleName = u; NetlistFile = .edf; TargetExtension = .kbo;
NetlisterOptions = mine; NetlisterFatalStatus = >1; CheckerDirectory = NONE;)");
    tree_.write("bad.urf", "RuleName = r;\nNonsense = 1;");
    tree_.write("names", "e\r\n\nnone\r\n-x");
    tree_.write("zero", std::string("e\n\0", 3));
  }

  /// Rows "COMMAND LINE | STATUS | STANDARD OUTPUT | STANDARD ERROR", with "\n" for line ends.
  void check(const std::string& rows, const std::string& input = "") const {
    for (const std::vector<std::string>& row : table(rows)) {
      std::vector<std::string> words;
      Port_Process::Split(std::string(KESTREL_LAUNCH) + " " + row[0], words);
      const Ran ran = run(words, input);
      const std::string all = std::to_string(ran.status) + " | " + ran.out + " | " + ran.err;
      EXPECT_EQ(table(row[0] + " | " + replaced(tree_.shorten(all), "\n", "\\n"))[0], row);
    }
  }

  Tree tree_;
  Variable path_;
};

}  // namespace

TEST_F(Command, PrintsWhatItFinds) {
  check(R"(
e -- -x                     | 0 | ~/e.kbc\n~/-x.kbc\n |
-sd x --search-dir=s -q f   | 0 | ~/s/f.kbc\n |
none "" e                   | 2 | ~/e.kbc\n | kestrel-launch: not found: none\nERROR: No base name given in netlist specification "".\n
g.v none                    | 2 |  | Launcher: Executing nl exit=1\nERROR: nl exited with errors (return code 1).\nkestrel-launch: not found: none\n
--names-from names e        | 1 | ~/e.kbc\n~/e.kbc\n~/-x.kbc\n | kestrel-launch: not found: none\n
e.x             | 0 | ~/e.kbc\n | WARNING: Launcher: Could not find file ~/e with extension x in the search path. Ignoring extension.\n
-n -d -i --not-top -o out -l x -l y d.edf | 0 | ~/out/d.kbo\n | Launcher: Using rule a\nLauncher: d.kbo being compiled because it does not exist\nLauncher: Running nl from ~/out/\nLauncher: Environment inherited by nl will be:\nLauncher:    MYCORVANE is unset\nLauncher:    CORVANE is ~/share\nLauncher:    PATH is ~/bin\nLauncher: Executing nl out=ran x y "~/d.edf"\n
)");
  check("--names-from - | 0 | ~/e.kbc\\n~/-x.kbc\\n |", "e\n\n-x.kbc\r\n");
  EXPECT_FALSE(std::filesystem::exists("out/ran"));
  check(R"(
--json --not-top -r -q -o out d.edf | 2 | {"name":"d.edf","result":-1,"source":"","netlist":""}\n{"ok":true,"errors":0,"warnings":0}\n | Launcher: Executing nl out=ran -r -quiet "~/d.edf"\nkestrel-launch: no netlister has written ~/out/d.kbo\n)");
  EXPECT_TRUE(std::filesystem::exists("out/ran"));
}

TEST_F(Command, PrintsJson) {
  check(R"(
--json e none   | 1 | {"name":"e","result":0,"source":"~/e.kbc","netlist":"~/e.kbc"}\n{"name":"none","result":1,"source":"","netlist":""}\n{"ok":true,"errors":0,"warnings":0}\n | kestrel-launch: not found: none\n
--json g.v e.x  | 2 | {"name":"g.v","result":-1,"source":"","netlist":""}\n{"name":"e.x","result":0,"source":"~/e.kbc","netlist":"~/e.kbc"}\n{"ok":true,"errors":1,"warnings":1}\n | Launcher: Executing nl exit=1\nERROR: nl exited with errors (return code 1).\nWARNING: Launcher: Could not find file ~/e with extension x in the search path. Ignoring extension.\n
--json -u bad e | 2 | {"ok":false,"errors":0,"warnings":0}\n | ERROR: Launcher: "bad", line 2: Unexpected key word Nonsense\n
)");
  const char* name = "\"\\\n\x01\x7f \xc3\xa4\xf0\x9f\x98\x80\xff\xc3 \xed\xa0\x80\xc0\xaf";
  EXPECT_EQ(run({KESTREL_LAUNCH, "--json", name}).out,
            "{\"name\":\"\\\"\\\\\\u000a\\u0001\\u007f \xc3\xa4\xf0\x9f\x98\x80\\udcff\\udcc3 "
            "\\udced\\udca0\\udc80\\udcc0\\udcaf\",\"result\":1,\"source\":\"\",\"netlist\":\"\"}\n"
            "{\"ok\":true,\"errors\":0,\"warnings\":0}\n");
}

TEST_F(Command, ChecksAndShowsTheRules) {
  check(R"(
--check             | 0 | Rules checked: 3, all good\n | kestrel-launch: hint: rule b: its options name neither $infile nor $outfile\nkestrel-launch: hint: rule c: its options name neither $infile nor $outfile\n
--check --json e    | 0 | {"ok":true,"errors":0,"warnings":0}\n | kestrel-launch: hint: rule b: its options name neither $infile nor $outfile\nkestrel-launch: hint: rule c: its options name neither $infile nor $outfile\n
--check --json -u x | 2 | {"ok":false,"errors":0,"warnings":0}\n | ERROR: Launcher: User rules file "~/x.urf" does not exist.\n
--check -p NX9      | 2 |  | ERROR: Launcher: NX9 is not a valid PM name.\n
-u bad e            | 2 |  | ERROR: Launcher: "bad", line 2: Unexpected key word Nonsense\n
--graph             | 0 | digraph rules {\n  rankdir=LR;\n  node [shape=box, style=rounded, fontname="Helvetica"];\n  edge [fontname="Helvetica", fontsize=10];\n  graph [fontname="Helvetica", fontsize=10, label="solid: data/larules.acd\n"];\n  ".edf" -> ".kbo" [label="a\nnl", style=solid];\n  ".vhd" -> ".edf" [label="b for top\nnl", style=solid];\n  ".v" -> ".edf" [label="c\nnl", style=solid];\n}\n |
--list-rules -u own | 0 | Rule u: .edf => .kbo  nl mine\nRule a: .edf => .kbo  nl out=ran [$ignore_locs] [$add_pads] [$quiet] [$aul] {$libraries }$infile\nRule b: top.vhd => .edf  nl \nRule c: .v => .edf  nl exit=1\n |
)");
  // A user rule keeps what it says, and has the rest from the rule that it stands before.
  const std::string all = run({KESTREL_LAUNCH, "--list-rules", "-d", "-u", "own"}).out;
  EXPECT_EQ(
      replaced(all.substr(0, all.find("\n\n")), "\n", "; "),
      "; Rule: u; Netlist File: .edf; Target: .kbo; Netlister: nl; Netlister Options: mine; "
      "Netlister Top Options: args out=$outfile; Netlister Directory Flag: 3  Dir: ; Checker: "
      "chk; Checker Options:; Checker Directory Flag: 1  Dir: ; fatal status > 1; success "
      "status = 0; success status < 2");
}

TEST_F(Command, RefusesAWrongCommandLine) {
  for (const auto& row : table(R"(
                    | no netlist is named
--forse e           | unknown option --forse; did you mean --force?
--xyz e             | unknown option --xyz
--quiet=1 e         | --quiet takes no argument
e -l                | -l needs an argument: TEXT
-o nowhere e        | --output-dir: there is no directory "nowhere"
-sd "" e            | --search-dir: not the name of a directory: ""
--names-from x e    | --names-from: could not read x
--names-from s e    | --names-from: could not read s
--names-from zero e | --names-from: zero, line 2 holds a zero byte
)")) {
    check(row[0] + " | 2 |  | kestrel-launch: " + row[1] + "\\nTry 'kestrel-launch --help'.\\n");
  }
}

TEST_F(Command, HelpsWithEveryOption) {
  const std::string help = run({KESTREL_LAUNCH, "--help"}).out;
  for (const option& o : all_options()) {
    std::string line = o.short_name != nullptr ? std::string("  ") + o.short_name + "," : "";
    line.resize(7, ' ');
    line += o.long_name + (o.argument != nullptr ? std::string(" ") + o.argument : "");
    const auto at = help.find(line + "  ");
    EXPECT_LT(at, help.find(std::string("  ") + o.help + "\n", at)) << line;
  }
  EXPECT_EQ(run({KESTREL_LAUNCH, "e", "-h"}).out, help);
  EXPECT_TRUE(run({KESTREL_LAUNCH, "-V"}).out.starts_with("kestrel-launch 1.0.0"));
}

TEST_F(Command, FailsWhereItCannotWrite) {
  for (const std::string target : {">&-", ">/dev/full"}) {
    for (const std::string word : {"e", "-h", "-V", "--list-rules", "--graph", "-f d.edf"}) {
      const Ran ran = run({"/bin/sh", "-c", "$0 $1 " + target, KESTREL_LAUNCH, word});
      const std::string before =
          word[1] != 'f' ? "" : "Launcher: Executing nl args out=\"d.kbo\"\n[args][out=d.kbo]\n";
      EXPECT_EQ(std::to_string(ran.status) + ran.err,
                "2" + before + "kestrel-launch: could not write to standard output\n")
          << word << target;
    }
  }
}
