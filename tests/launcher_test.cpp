// The launcher: what find hands back, what it says, and what it runs.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <sstream>

#include "cli/settings.h"
#include "launcher/baslauncher.h"
#include "support.h"

// The questions to the system, counted: the linker puts these in the way.
static int status_calls = 0;
static int directory_calls = 0;
// NOLINTBEGIN(bugprone-reserved-identifier)
extern "C" {
int __real_stat(const char* path, struct stat* status);
int __wrap_stat(const char* path, struct stat* status) {
  ++status_calls;
  return __real_stat(path, status);
}
char* __real_getcwd(char* buffer, std::size_t size);
char* __wrap_getcwd(char* buffer, std::size_t size) {
  ++directory_calls;
  return __real_getcwd(buffer, size);
}
}
// NOLINTEND(bugprone-reserved-identifier)

namespace {

/// Messages with the long ones in short, and ", " between lines.
std::string in_short(std::string text) {
  const char* const known[][2] = {
      {"S Launcher: ", ""},
      {"Executing nl ", "run "},
      {"Environment inherited by nl will be:\n   MYCORVANE is unset\n", "+ "},
      {"   CORVANE is ~/share\n   PATH is ~/bin\n", "+ "},
      {"NOT compiling d.kbo because its source was not found", "no source of d.kbo"},
      {"I Found resolution for 'd.kbc' using the search path (-sd switches):\n\t", "I d.kbc is "},
      {"\nOther matching files found later in the search path will not be used:\n\t", ", not "},
      {"\nEnsure that the correct file is used by modifying the search path order.", ""},
      {"The name of a file or directory, or a library entry, would change the arguments of ", ""},
      {"\n\t", ", "},
      {"\n", ", "}};
  for (const auto& [from, to] : known) text = replaced(text, from, to);
  return text;
}

/// A tree with rules, the netlister "nl" on PATH, and what a launcher does in it.
struct World {
  /// rules: default rules, with "; " for line ends.
  explicit World(const std::string& rules) {
    tree.write("share/data/larules.acd", replaced(rules, "; ", "\n"));
    tree.write("share/data/devices.acd", "D-1 = fam, P1|P2, 3");
    std::filesystem::create_directory("bin");
    std::filesystem::create_symlink(TEST_NETLISTER, "bin/nl");
  }

  /// Constructs a launcher from a command line and resolves its names. Tells all that is said, and
  /// for each name "RESULT SOURCE NETLIST" with the counts that are not 0.
  std::string find(const std::vector<std::string>& words) {
    const auto chars_of = [](const std::vector<std::string>& strings) {
      std::vector<const char*> chars;
      for (const std::string& string : strings) chars.push_back(string.c_str());
      return chars;
    };
    const std::vector<const char*> texts = chars_of(words);
    settings set;
    EXPECT_EQ(read_command_line(static_cast<int>(texts.size()), texts.data(), set), "");
    const Variable path("PATH", tree.full("bin").c_str());
    const Variable test("LA_TEST", set.dry_run ? "" : nullptr);
    const Variable detail("LAUNCHER_DETAIL", set.detail ? "" : nullptr);
    LA_LAUNCHER launcher(set.part, chars_of(set.search_dirs).data(),
                         static_cast<short>(set.search_dirs.size()), set.libraries.data(),
                         static_cast<short>(set.libraries.size()), set.output_dir, set.user_rules,
                         set.force, set.ignore_timestamps, set.ignore_locs, set.add_pads, set.quiet,
                         set.aul);
    std::string text = messages.take() + (launcher.ok ? "" : "not ok\n");
    for (const std::string& name : set.names) {
      char source[LA_MAX_PATH] = "?", netlist[LA_MAX_PATH] = "?";
      const short result = launcher.find(name.c_str(), source, netlist, set.top);
      text += messages.take() + std::to_string(result);
      if (*source || *netlist) text += std::string(" ") + source + " " + netlist;
      if (launcher.errors > 0) text += " E" + std::to_string(launcher.errors);
      if (launcher.warnings > 0) text += " W" + std::to_string(launcher.warnings);
      text += std::filesystem::current_path() == tree.home ? "\n" : " elsewhere\n";
    }
    return in_short(tree.shorten(text.substr(0, text.size() - 1)));
  }
  std::string find(const std::string& command) {
    std::vector<std::string> words;
    EXPECT_TRUE(Port_Process::Split(tree.expand(command), words));
    return find(words);
  }

  Tree tree;
  Messages messages;
};

/// Rows "FILES | COMMAND LINE | WHAT find SAYS", each in a world of its own. A cell in front of
/// them, and a line of one cell, sets the rules from there on.
void check(const std::string& rows) {
  std::string rules;
  for (const std::vector<std::string>& row : table(rows)) {
    if (row.size() == 1 || row.size() == 4) rules = row[0];
    if (row.size() == 1) continue;
    ASSERT_TRUE(row.size() == 3 || row.size() == 4) << "A cell is missing: " << row[0];
    World world(rules);
    const auto cell = row.end() - 3;
    world.tree.make(world.tree.expand(cell[0]));
    EXPECT_EQ(world.find(cell[1]), cell[2]) << rules << " | " << cell[0] << " | " << cell[1];
  }
}

std::string search_dirs(int count) {
  return count > 0 ? search_dirs(count - 1) + "-sd s" + std::to_string(count) + " " : "";
}

}  // namespace

TEST(Find, LooksForTheNameAsItIsGiven) {
  check(R"(
RULES=a,b; a=.edf,.kbo,,nl,,$infile $outfile,,,,0; b=.sch,.edf,,nl,,$infile $outfile,,,,0
d.edf d.sch       | -n d.edf       | run "d.edf" "d.kbo", 0 ~/d.edf ~/d.kbo
s/d.edf d.sch     | -n -sd s d.edf | run "s/d.edf" "d.kbo", 0 ~/s/d.edf ~/d.kbo
d.edf/ s/d.edf    | -n -sd s d     | run "s/d.edf" "d.kbo", 0 ~/s/d.edf ~/d.kbo
s/x/d.edf         | -n -sd s x/d   | run "s/x/d.edf" "d.kbo", 0 ~/s/x/d.edf ~/d.kbo
x/d.edf s/d.edf s/e.edf | -n -sd s ~/x/d ~/x/e | run "x/d.edf" "d.kbo", 0 ~/x/d.edf ~/d.kbo, run "s/e.edf" "e.kbo", 0 ~/s/e.edf ~/e.kbo
d.edf x/          | -n x/.././d    | run "d.edf" "d.kbo", 0 ~/d.edf ~/d.kbo
a.b.EDF           | -n a.b.EDF     | run "a.b.EDF" "a.b.kbo", 0 ~/a.b.EDF ~/a.b.kbo
d.sch             | -n d.KBO       | run "d.sch" "d.edf", run "d.edf" "d.kbo", 0 ~/d.sch ~/d.kbo
d.kbo             | d.edf          | W Launcher: Could not find file ~/d with extension edf in the search path. Ignoring extension., no source of d.kbo, 0 ~/d.kbo ~/d.kbo W1
d.txt d.edf d.kbo | d.txt d        | no source of d.kbo, 0 ~/d.kbo ~/d.kbo, d.kbo is up to date, 0 ~/d.edf ~/d.kbo
d.kbo d.kbc       | d d.kbc        | no source of d.kbo, 0 ~/d.kbo ~/d.kbo, 0 ~/d.kbc ~/d.kbc
d.kbc s/d.kbo     | -sd s d.kbo    | no source of d.kbo, 0 ~/s/d.kbo ~/s/d.kbo
d.kbc s/d.kbc s/e.kbc | -sd s d e.kbc | 0 ~/d.kbc ~/d.kbc, 0 ~/s/e.kbc ~/s/e.kbc
d.kbo             | d.kbc e        | W Launcher: Could not find file ~/d with extension kbc in the search path. Ignoring extension., 1 W1, 1 W1
                  | "" x/          | E No base name given in netlist specification ""., -1 E1, E No base name given in netlist specification "x/"., -1 E2
                  | .kbo           | E No base name given in netlist specification ".kbo"., -1 E1
RULES=t,u,v,w,x,y; t=top.edf,.kbo,,nl,,1,,,,0; u=.edf,.KBO,,nl,,2,,,,0; v=d.,.V,,nl,,$infile $outfile,,,,0; w=.v,.kbo,,nl,,$infile,,,,0; x=.sch,.v,,nl,,$infile,,,,0; y=e..,.kbo,,nl,,$infile $outfile,,,,0
d.edf TOP.edf     | -n d TOP       | run 2, 0 ~/d.edf ~/d.KBO, run 1, 0 ~/TOP.edf ~/TOP.kbo
d.sch d           | -n d           | run "d" "d.V", run "d.V", 0 ~/d ~/d.kbo
e.                | -n e..         | run "e." "e.kbo", 0 ~/e. ~/e.kbo
)");
}

TEST(Find, LooksOnlyForTheLowerCaseNameWhenDisabled) {
  const Variable disable("LA_DISABLE", "");
  check(R"(
RULES=a; a=.edf,.kbo,,nl,,,,,,0
d.edf                       | D.EDF d ""        | 0  d.edf, 1, 1
d.edf a/ b/e.edf            | -sd a -sd b E.edf d.edf | 0  ~/b/e.edf, 1
s1/d.edf s150/e.edf s3/e.edf | )" +
        search_dirs(150) + "d.edf e.edf | 0  ~/s1/d.edf, 0  ~/s3/e.edf");
}

TEST(Find, ReportsFilesThatTheSearchPassesOver) {
  check(R"(
a/d.kbc c/d.kbc            | -sd b -sd a -sd c d         | I d.kbc is ~/a/d.kbc, not ~/c/d.kbc, 0 ~/a/d.kbc ~/a/d.kbc
a/d.kbc b/d.kbc c/d.kbc    | -sd a -sd b -sd c -sd ./b d | I d.kbc is ~/a/d.kbc, not ~/b/d.kbc, ~/c/d.kbc, 0 ~/a/d.kbc ~/a/d.kbc
a/d.kbc a~/b/d.kbc b/d.kbc | -sd a -sd ~/a~/b -sd b d    | I d.kbc is ~/a/d.kbc, not ~/a~/b/d.kbc, 0 ~/a/d.kbc ~/a/d.kbc
a/d.kbc                    | -sd a -sd ~/x/../a -sd "" d | 0 ~/a/d.kbc ~/a/d.kbc
)");
}

TEST(Find, KeepsTheDirectoriesOfTheMomentTheyWereGiven) {
  World world("");
  world.tree.make("a/x/d.kbc w/a/x/d.kbc w/b/x/d.kbc");
  LA_LAUNCHER launcher(nullptr, nullptr, 0, nullptr, 0, nullptr, nullptr, 0, 0, 0, 0, 0, 0);
  const char* names[] = {"a", "c", "b"};
  launcher.add_searchpaths(names, 1);
  std::filesystem::current_path("w");
  launcher.add_searchpaths(names + 1, 2);
  char source[LA_MAX_PATH], netlist[LA_MAX_PATH];
  EXPECT_EQ(launcher.find("x/d", source, netlist, 1), LA_FOUND);
  EXPECT_EQ(in_short(world.tree.shorten(world.messages.take())),
            "I Found resolution for 'x/d.kbc' using the search path (-sd switches):, ~/a/x/d.kbc, "
            "not ~/w/b/x/d.kbc, ");
}

// Of each name: the result, whether the file to read was seen, and how often the system was asked
// for files and for the current directory. Four places are searched.
TEST(Plan, AsksForEachFileOnce) {
  World world(
      "RULES=a,b; a=.edf,.kbo,.x,nl,,out=$outfile $infile,,,,0; "
      "b=.sch,.edf,,nl,,out=$outfile,,,,0");
  world.tree.make(
      "r/ s/up.sch@1 up.edf@2 up.kbo@3 s/one.edf@2 s/one.x@1 one.kbo@1 s/two.sch e.kbc");
  const Variable path("PATH", world.tree.full("bin").c_str());
  const char* dirs[] = {"r", "s", "t"};
  LA_LAUNCHER launcher(nullptr, dirs, 3, nullptr, 0, nullptr, nullptr, 0, 0, 0, 0, 0, 0);
  for (const auto& row : table(R"(
up     | 0 1 9 1   | the current directory 2, once; source 4, outputs 2, dependency 1
up.sch | 0 1 7 1   | the same
one    | 0 0 15 3  | sources 8; output 1, and before and after its run; source and dependency likewise; names in the command 2
two    | 0 0 17 5  | the current directory 2, after a run; source 4, output 1; before and after each run input and output, and the dependency of the second; names in the commands 4
e      | 0 1 15 1  | the current directory 2, after a run; sources 8, .kbo 4, .kbc 1
no     | 1 0 16 1  | sources 8, .kbo 4, .kbc 4
no.edf | 1 0 20 1  | the name 4, and as before
/no    | 1 0 16 1  | as for no)")) {
    status_calls = directory_calls = 0;
    char source[LA_MAX_PATH], netlist[LA_MAX_PATH];
    const short result = launcher.find(row[0].c_str(), source, netlist, 1);
    std::ostringstream counts;
    counts << result << ' ' << launcher.saw_netlist() << ' ' << status_calls << ' '
           << directory_calls;
    EXPECT_EQ(counts.str(), row[1]) << row[0] << ": " << row[2];
  }
}

TEST(Build, RunsWhatFollowsAStepThatRan) {
  check(R"(
RULES=a,b,c; a=.edf,.kbo,,nl,,1,,,,0; b=.v,.edf,,nl,,2,,,,0; c=.sch,.v,,nl,,3,,,,0
d.sch@1 d.v@1 d.edf@2 d.kbo@2 | -n d    | d.v is up to date, d.edf is up to date, d.kbo is up to date, 0 ~/d.sch ~/d.kbo
d.sch@1 d.v@3 d.edf@2 d.kbo@4 | -n d    | d.v is up to date, run 2, run 1, 0 ~/d.sch ~/d.kbo
d.sch@5 d.v@1 d.edf@2 d.kbo@3 | -n -i d | NOT compiling d.v because of ignore timestamp flag, NOT compiling d.edf because of ignore timestamp flag, NOT compiling d.kbo because of ignore timestamp flag, 0 ~/d.sch ~/d.kbo
d.sch@5 d.v@1 d.kbo@3         | -n -i d | NOT compiling d.v because of ignore timestamp flag, run 2, run 1, 0 ~/d.sch ~/d.kbo
d.sch@1 d.v@2 d.edf@3 d.kbo@4 | -n -d -f d.v | Using rule b, d.edf being compiled because of force flag, Running nl from ~/, + + run 2, Using rule a, d.kbo being compiled because it is out of date, Running nl from ~/, + + run 1, 0 ~/d.v ~/d.kbo
)");
}

TEST(Build, LooksForDependencyFilesAndRefusesOldFormats) {
  check(R"(
RULES=a,b; a=.edf,.kbo,.x|lib.y|cfg.,nl,,$infile,,,,0; b=.sch,.edf,,nl,,$infile,,,,0
s/d.sch d.edf@1 d.kbo@2 d.x@3 s/d.y@3 s/lib.x@3 | -n -sd s d | d.edf is up to date, d.kbo is up to date, 0 ~/s/d.sch ~/d.kbo
s/d.edf d.kbo@1 s/d.x s/lib.y@2         | -n -sd s d | run "s/d.edf", 0 ~/s/d.edf ~/d.kbo
s/d.edf d.kbo@1 s/cfg.edf@2             | -n -sd s d | run "s/d.edf", 0 ~/s/d.edf ~/d.kbo
RULES=a,b,c; a=.edf,.kbo,.x,NOT_SUPPORTED,,,,,,0; b=.sch,.edf,,nl,,$infile,,,,0; c=.x,.kbo,,nl,,,,,,0
d.sch                 | -n d          | run "d.sch", E Launcher: Netlist format of ~/d.edf is no longer supported, could not create d.kbo, -1 E1
d.edf d.kbo@2 d.x     | -n -d -f -i d | Using rule a, E Launcher: Netlist format of ~/d.edf is no longer supported, could not create d.kbo, -1 E1
)");
}

TEST(Run, GoesToTheDirectoryOfTheRule) {
  // The directory; where the first step runs, and its input; the same of the second step.
  for (const auto& row : table(R"(
        | ~   | s/d.sch   | ~   | o/d.edf
$source | ~/s | d.sch     | ~/o | d.edf
$OUTPUT | ~/o | ~/s/d.sch | ~/o | d.edf
w       | ~/w | ~/s/d.sch | ~/w | ~/o/d.edf
nowhere | ~   | s/d.sch   | ~   | o/d.edf
)")) {
    const std::string rest = ",,nl,,dir $infile," + row[0] + ",,,0";
    check("RULES=a,b; a=.edf,.kbo" + rest + "; b=.sch,.edf" + rest +
          " | s/d.sch o/ w/ | -sd s -o o d | run dir \"" + row[2] + "\", S " + row[1] +
          ", run dir \"" + row[4] + "\", S " + row[3] + ", 0 ~/s/d.sch ~/o/d.kbo");
  }
}

TEST(Run, MakesTheCommandAndJudgesTheEnd) {
  check(R"(
RULES=a; a=.edf,.kbo,,nl,top $infile,[-p $part] [-f $family] [$device] [$pkg] [$speed] [$ignore_locs] [$add_pads] [$quiet] [$aul] {-l $libraries }$OUTPUT,,,,0
d.edf | -n -p d-1-p2-3 d             | run top "d.edf", 0 ~/d.edf ~/d.kbo
d.edf | -n -p d-1-p2-3 --not-top d   | run -p d-1-p2-3 -f fam D-1 P2 3 ~/, 0 ~/d.edf ~/d.kbo
d.edf | -n --not-top -r -a -q --aul -l x -l y d | run -r -a -quiet -aul -l x -l y ~/, 0 ~/d.edf ~/d.kbo
d.edf | -n --not-top d               | run ~/, 0 ~/d.edf ~/d.kbo
RULES=a; a=.edf,.kbo,,nl,,out=$outfile exit=1,w,,,0 | d.edf w/ | d d | run out="~/d.kbo" exit=1, E nl exited with errors (return code 1)., -1 E1, run out="~/d.kbo" exit=1, E nl exited with errors (return code 1)., -1 E2
RULES=a; a=.edf,.kbo,,nl,,exit=3,w,,,0,>2,3     | d.edf w/ | d | run exit=3, 0 ~/d.edf ~/d.kbo
RULES=a; a=.edf,.kbo,,nl,,kill=9,w,,,<129       | d.edf w/ | d | run kill=9, E nl exited with errors (return code 137)., -1 E1
RULES=a; a=.edf,.kbo,,no/nl,,x,w,,,0            | d.edf w/ | d | Executing no/nl x, E Failed to launch program no/nl: No such file or directory, -1 E1
RULES=a,b; a=.edf,.kbo,,nl,,,NONE,,,0; b=.sch,.edf,,nl,,say=1%s%n err=b close exit=4,w,,,4 | d.sch w/ | -d d | Using rule b, d.edf being compiled because it does not exist, Running nl from ~/w/, + + run say=1%s%n err=b close exit=4, S 1%s%n, S b, nl exited with an exit code of 4, Using rule a, d.kbo being compiled because it does not exist, Running nl from ~/, + + run , nl exited with an exit code of 0, 0 ~/d.sch ~/d.kbo
RULES=a; a=.edf,.kbo,,nl,,-o$OUTPUT {'-l=$libraries' }{$libraries },,,,0 | d.edf | -n -o a -l "a;b" -l "" -l " c" d | run -o~/a/ '-l=a;b' '-l=' '-l= c' a;b c , 0 ~/d.edf ~/a/d.kbo
RULES=a; a=.edf,.kbo,,nl,,'[$part] $infile;map',,,,0 | d;x.edf e$.edf | -n -p d-1-p2 d;x e$ | run 'd-1-p2 "d;x.edf";map', 0 ~/d;x.edf ~/d;x.kbo, E Launcher: "e$.edf" cannot stand between the quotes of the options of nl, which is therefore not run: it holds the character $, -1 E1
RULES=a; a=.edf,.kbo,,nl,,-o$OUTPUT {-l$libraries },,,,0 | d.edf | -n -o a -l "a b" d | E Launcher: nl, which is therefore not run: nl -o~/a/ -la b , -1 E1
RULES=a; a=.edf,.kbo,,nl,,-o$OUTPUT,,,,0        | d.edf    | -o "a b" d  | E Launcher: nl, which is therefore not run: nl -o~/a b/, -1 E1
RULES=a; a=.edf,.kbo,,nl,,args 'x -o $OUTPUT y,,,,0 | d.edf | -o "it's" d  | E Launcher: nl, which is therefore not run: nl args 'x -o ~/it's/ y, -1 E1
)");
}

TEST(Run, TakesAFileNameForOneArgument) {
  std::istringstream names(
      "a b/ a/a /a  ' b/'/'a'/%/%s%n%d/$/$part/[/[$part/{/{-l $libraries/;/a;b/$(nl)/`nl`/|/>x/&/*/"
      "#/\n/a\n b/\t/\1\2\3/\x7f/\xc3\xa4/\xff\xfe/-/--/-f x/a]/}/\"/a\"b/\" \"/a\" b \"c/a\" 'b");
  for (std::string name; std::getline(names, name, '/');) {
    for (const std::string& start : {name, name + "/d"}) {
      World world("RULES=a; a=.edf,.kbo,,nl,,args $infile out=$outfile,,,,0");
      world.tree.write(start + ".edf", "");
      const std::string path = (name[0] == '-' ? "./" : "") + start;
      const std::string call = "args \"" + path + ".edf\" out=\"" + path + ".kbo\"";
      const std::string shown = replaced(path, "\n", "\nS ");
      std::string expected = "run " + call + "\nS [args][" + shown + ".edf][out=" + shown +
                             ".kbo]\n0 ~/" + start + ".edf ~/" + start + ".kbo";
      if (name.find('"') != name.npos)
        expected = "E Launcher: nl, which is therefore not run: nl " + call + "\n-1 E1";
      const auto stray = name.find_first_of("]}");
      if (stray != name.npos) {
        expected = std::string("E Missing '") + (name[stray] == ']' ? '[' : '{') +
                   "' in options string\nE Could not expand option string \"" + call + "\"\n-1 E2";
      }
      std::vector<std::string> words = {"--", name};
      if (start != name) words = {"-o", name, "-sd", name, "d"};
      EXPECT_EQ(world.find(words), replaced(expected, "\n", ", ")) << start;
    }
  }
}

TEST(Run, LetsAValueHoldWhatIsSafeWhereItStands) {
  std::string controls;
  for (char c = 1; c < ' '; ++c) controls += c;
  // The template; the characters of a library entry that would change the arguments, and those
  // that could end the text of a quoted one.
  const std::string rows[][3] = {
      {"{-l $libraries }$infile", "\t \"", ""},
      {"{'-l=$libraries' }$infile", "'", "\""},
      {"{'-l \"$libraries\"' }$infile", "'", controls + "\"$[\\`\x7f"},
      {"'{$libraries };' $infile", "'", controls + " !\"#$&()*;<>?[\\^`{|\x7f"},
      {"{\"-l '$libraries'\" }$infile", "\"", controls + "$'[\\`\x7f"}};
  for (const auto& [options, changing, unsafe] : rows) {
    World world("RULES=a; a=.edf,.kbo,,nl,," + options + ",,,,0");
    world.tree.write("d.edf", "");
    std::string seen_changing, seen_unsafe;
    for (int c = 1; c < 256; ++c) {
      const std::string entry = std::string("x") + static_cast<char>(c) + "y";
      const std::string said = world.find({"-n", "-l", entry, "d"});
      if (said.starts_with("E Launcher: nl, which")) seen_changing += entry[1];
      if (said.find("y\" cannot stand between") != said.npos) seen_unsafe += entry[1];
      EXPECT_TRUE(said.starts_with("run ") || said.find(", -1 E") != said.npos) << said;
    }
    EXPECT_EQ(seen_changing + " | " + seen_unsafe, changing + " | " + unsafe) << options;
  }
}

TEST(Limits, NamesAreUsedWholeOrRefused) {
  std::string rows = R"(
RULES=a,b; a=.edf,.kbo,,nl,,$infile,,,,0; b=.verilog,.kbo,,nl,,$infile,w,,,0
<255>.edf        | -n <255>.edf  | run "<255>.edf", 0 ~/<255>.edf ~/<255>.kbo
                 | <256>.edf <999> | E Launcher: The full name of netlist "<256>.edf" is longer than 259 characters., -1 E1, E Launcher: The full name of netlist "<999>" is longer than 259 characters., -1 E2
<256>.edf s/     | -n -sd s <256> | 1
<255>.edf o/     | -n -o o <255> | E Launcher: The output of rule a for <255>.edf has no name of at most 259 characters in the output directory, or there is none., -1 E1
<251>.verilog w/ | <251>         | E Launcher: The name of <251>.verilog is too long for a command line., -1 E1
d.kbc            | -u <999> -sd <259> -sd <260> -sd // d | E Launcher: User rules file name "<999>" is longer than 259 characters., not ok, 0 ~/d.kbc ~/d.kbc
)";
  for (const std::size_t length : {251u, 255u, 256u, 259u, 260u, 999u}) {
    const std::string name(length - Tree().home.size() - 1, 'x');
    rows = replaced(rows, "<" + std::to_string(length) + ">", name);
  }
  check(rows);
}
