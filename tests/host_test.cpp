// The services of the host layer.
#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <unistd.h>

#include <filesystem>

#include "host/base/line_cutter.h"
#include "host/base/utf8.h"
#include "host/pm_devkey.h"
#include "host/port_file.h"
#include "host/port_pathlist.h"
#include "host/port_process.h"
#include "host/static_acd.h"
#include "host/ut_darray.h"
#include "support.h"

static bool poll_fails = false;
// NOLINTBEGIN(bugprone-reserved-identifier): The linker gives these names.
extern "C" {
int __real_poll(pollfd* events, nfds_t count, int timeout);
int __wrap_poll(pollfd* events, nfds_t count, int timeout) {
  if (!poll_fails) return __real_poll(events, count, timeout);
  errno = EIO;
  return -1;
}
}
// NOLINTEND(bugprone-reserved-identifier)

struct Host : testing::Test {
  Tree tree;
};

TEST_F(Host, StringsAndArrays) {
  std::string numbers;
  for (const char* text : {"+7", "-08", "9223372036854775807", "-9223372036854775808", "", "+", "-",
                           "+-1", "-+1", "--1", "1x", " 1", "1 ", "0x1", "9223372036854775808"}) {
    long value = 0;
    numbers += UT_STR::StrToL(text, value) ? std::to_string(value) + " " : "-";
  }
  EXPECT_EQ(numbers, "7 -8 9223372036854775807 -9223372036854775808 -----------");
  // Only letters have two cases.
  EXPECT_TRUE(UT_STR::ICompare("aZ", "Az") == 0 && UT_STR::ICompare("[", "{") != 0);
  char letters[] = "abcdefg";
  DARRAY_NAME array(2);
  for (int i = 0; i < 7; ++i) array.append(letters + i);
  for (int i = 0; i < 7; ++i) EXPECT_EQ(array.elements[i], letters + i);
  array.a_resetnum(0);
  EXPECT_TRUE(*static_cast<char**>(array.getaddr(9)) == nullptr && array.elements[0] == nullptr);
}

TEST_F(Host, SortedArrays) {
  struct Sorted : DARRAY_NAME {
    Sorted() : DARRAY_NAME(2) {
      char letters[] = "dacb";
      for (char* letter = letters; *letter != 'b'; ++letter) a_sortadd(&letter, compare);
      char* const c = elements[1];
      char* b = letters + 3;
      EXPECT_EQ(all() + std::to_string(a_bsearch(&c, compare)), "acd1");
      EXPECT_TRUE(a_bsearch(&b, compare) == -1 && intgetindex(c) == 1 && intgetindex(b) == -1);
      a_shift(1, 2);
      EXPECT_TRUE(count == 5 && elements[1] == nullptr && elements[2] == nullptr);
      elements[1] = elements[2] = b;
      a_shift(2, -1);
      std::swap(elements[0], elements[3]);
      a_sort(compare, 1, 3);
      EXPECT_EQ(all(), "dabc");
    }
    std::string all() const {
      std::string text;
      for (const char* letter : *this) text += *letter;
      return text;
    }
    static int compare(const void* a, const void* b) {
      return **static_cast<char* const*>(a) - **static_cast<char* const*>(b);
    }
  } sorted;
}

// A cell is delimiters, then a line; the result is token, delimiter and rest, between "/".
TEST_F(Host, Tokens) {
  const auto token_of = [](const std::string& cell) {
    char line[LA_MAX_PATH], token[LA_MAX_PATH];
    UT_STR::Copy(line, cell.substr(cell.find('/') + 1).c_str());
    const char end = UT_STR::GetToken(line, token, cell.substr(0, cell.find('/')).c_str());
    return std::string(token) + "/" + (end != '\0' ? std::string(1, end) : "0") + "/" + line;
  };
  expect_table(token_of, R"(
; =/RuleName = r1 ; | RuleName/ /= r1 ;
; =/= r1 ;          | /=/ r1 ;
; ;/\t a\tb        | a/ /b
;/ a\tb;;           | a\tb/;/;
;/                  | /0/)");
}

TEST_F(Host, LinesAcrossBlocks) {
  const std::string block(16384, 'x');
  const std::string lines[] = {block.substr(4),
                               block.substr(0, LA_MAX_PATH - 1),
                               block.substr(0, LA_MAX_PATH),
                               "",
                               "\xEF\xBB\xBF\r",
                               block + block,
                               "a\r"};
  tree.write("f", "\xEF\xBB\xBF");
  for (const auto& l : lines) tree.write("f", tree.read("f") + l + (l == "a\r" ? "" : "\r\n"));
  const std::unique_ptr<Port::Stream> stream(Port::File::open("f", Port::Stream::READ, true));
  for (const std::string& line : lines) {
    char buffer[LA_MAX_PATH];
    EXPECT_EQ(stream->readline(buffer, sizeof buffer), static_cast<int>(line.size()));
    EXPECT_EQ(buffer, line.substr(0, LA_MAX_PATH - 1));
  }
  EXPECT_TRUE(stream->geteof() && !stream->failed());
}

TEST_F(Host, CurrentDirectory) {
  const auto named = [](std::size_t size) {
    char buffer[LA_MAX_PATH];
    Port::File::getcwd(buffer, static_cast<short>(size));
    return std::string(buffer);
  };
  EXPECT_EQ(named(tree.home.size() + 1) + named(tree.home.size()), tree.home);
  EXPECT_TRUE(Port::File::chdir("/"));
  EXPECT_EQ(named(2) + named(1), "/");
}

TEST_F(Host, TimeStamps) {
  tree.make("f g");
  const Port::FileStatus before = Port::File::status("f");
  EXPECT_TRUE(before == Port::File::status("f") && !(before == Port::File::status("g")));
  for (const __int64 time : {1'500'000'001, 0, -1, -1'000'000'000, -1'000'000'001}) {
    EXPECT_TRUE(Port::File::settime("f", time));
    EXPECT_EQ(Port::File::status("f").time, time);
  }
  Port::File::settime("f", before.time);
  EXPECT_FALSE(before == Port::File::status("f"));  // It was touched.
  EXPECT_FALSE(Port::File::status("f").is_left_by_failed_run());
  EXPECT_TRUE(Port::File::setoldest("f") && Port::File::status("f").is_left_by_failed_run());
  EXPECT_FALSE(Port::File::settime("missing", 0) || Port::FileStatus().is_left_by_failed_run());
}

TEST_F(Host, Messages) {
  Messages outer;
  {
    Messages inner;
    Port_MsgManData::createObject("Kestrel", "f.cpp", 12, "r1")
        .issueInfo("%s|%s|%d|%c|%%|%z", "a%d", nullptr, -5, 'x', L"\x7FF\x800\xFFFF\x10FFFF");
    EXPECT_EQ(inner.records.at(0).origin, "f.cpp:12 r1");
    Port_MsgManData::debugStub("%s", "trace");
    EXPECT_EQ(inner.take(), "I a%d||-5|x|%|\u07FF\u0800\uFFFF\U0010FFFFD trace");
  }
  Port_MsgSink quiet = Port_MsgManData::setSink({nullptr, nullptr, false});
  quiet.debug = false;
  testing::internal::CaptureStderr();
  Port_MsgManData::createObject("Kestrel", "f.cpp", 1, "r1").issueInfo("a\n");
  Port_MsgManData::createObject("Kestrel", "f.cpp", 1, "r1").issueStatus("b");
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "INFO: a\nb\n");
  EXPECT_NE(Port_MsgManData::setSink(quiet).function, nullptr);
  Port_MsgManData::debugStub("nobody asked");
  Port_MsgManData::createObject("Kestrel", "f.cpp", 1, "r1").issueWarning("100%");
  EXPECT_EQ(outer.take(), "W 100%");
  // Stray, overlong, cut off, overlong, surrogate, beyond the last character.
  for (const std::string bad :
       {"\x80", "\xC0\xAF", "\xC3", "\xE0\x80\x80", "\xED\xA0\x80", "\xF5"}) {
    const std::string marks = replaced(std::string(bad.size(), '?'), "?", "\uFFFD");
    EXPECT_EQ(to_utf8(from_utf8(bad + "\u07FF")), marks + "\u07FF") << bad.size();
  }
}

TEST_F(Host, InstallationRoots) {
  const auto roots = [](const char* mine, const char* common) {
    const Variable first("MYCORVANE", mine);
    const Variable second("CORVANE", common);
    std::string all;
    for (const auto& root : Port::CvnenvPath::GetInstance()) all += shown({root.c_str(), ""});
    return all;
  };
  EXPECT_EQ(roots("/m:/n//", "/c") + roots("", nullptr), "/m /n /c ");
  EXPECT_EQ(roots(nullptr, "::/c/::d:") + roots("/", nullptr), "/c d / ");
  EXPECT_EQ(roots(nullptr, nullptr),
            replaced(KESTREL_LAUNCH, "bin/kestrel-launch", "share/kestrel-launcher "));
}

TEST_F(Host, StaticData) {
  // The first three fields of k.
  const auto fields = [this](const std::string& content) {
    tree.write("f", "\xEF\xBB\xBF" + content);
    Messages messages;
    const StaticAcdRead file("f", nullptr, nullptr, 1, 0, 1);
    EXPECT_EQ(file.valid(), messages.records.empty());
    std::string all[3];
    for (const int i : {2, 0, 1, 2, 0}) {
      all[i] = file.GetStringByKey("k", ",", static_cast<short>(i), nullptr, 0).c_str();
      if (i == 1) file.GetStringByKey("k", "|", 1, nullptr, 0);
    }
    const std::string said = replaced(messages.take(), "E Launcher: \"f\", line ", "");
    return all[0] + "/" + all[1] + "/" + all[2] + "/" + said;
  };
  expect_table(fields, R"(
k =,\t,x y\t\nl = x                      | //x y/
k = a,\r\n  b\n\n# c\r\n\tc#d #e\n  # f  | a/b c#d//
k =\n a,\n b = c, e\nk = 2,\n 3\nK = 4\n | a/b = c/e/
x\nk = 1\n= 2\n                          | 1///1: Expecting KEY = VALUE\n3: Expecting KEY = VALUE\n
# c\n\n c\nk = \0\n                      | ///3: Expecting KEY = VALUE\n4: Expecting KEY = VALUE\n)");
}

TEST_F(Host, PartNamesAndTheirData) {
  tree.write("share/data/devices.acd", "LF=one,T\nLF-12=two,T|b 9,6|7\nbare=three\nNoFamily=\n");
  tree.write("share2/data/devices.acd", "bare = four, T\nSecond = five, T\n");
  tree.make("share/data/d.acd share2/data/d.acd share/data/two/d.acd share2/data/five/d.acd");
  const Variable roots("CORVANE", tree.expand("~/share:~/share2").c_str());
  const auto device = [this](const std::string& part) {
    PM_PIC p(part.c_str(), 1, PM_PARTNAME_BINDING(0));
    if (!p.is_valid(1, 0)) return std::string("invalid");
    const std::string all = shown({p.get_family(), p.get_device(), p.get_package(), p.get_speed()});
    return all + ";" + tree.shorten(PM_DEVKEY("d.acd", &p, 0, 1, 1).getlocation());
  };
  expect_table(device, R"(
lf-t        | one LF T -;
lf-12-B 9-7 | two LF-12 b 9 7;~/share/data/two/d.acd
second-t    | five Second T -;~/share2/data/five/d.acd
NOFAMILY    | - NoFamily - -;~/share/data/d.acd)");
  for (const char* part : {"LF-12-T-8", "LF-12-6", "LF-12-T-6-x", "LF-12-T-", "LF-12-", "LF-12--6",
                           "LF-12X", "LF-T-6", "L", "bare-T", "-T", ""}) {
    EXPECT_EQ(device(part), "invalid") << part;
  }
}

/// Runs a command, "$" standing for the test netlister. Tells the exit code and what each call of
/// Output got, or why it failed.
static std::string ran(const std::string& command) {
  struct recorder : Port_Process {
    recorder() : Port_Process(2) {}
    void Output(const char* text) override { output += text + std::string("/"); }
    std::string output;
  } process;
  const int failed = process.Run(replaced(command, "$", TEST_NETLISTER).c_str());
  if (failed) return to_utf8(process.GetProcessErrmsg());
  return std::to_string(process.GetChildRetcode()) + ": " + process.output;
}

TEST_F(Host, Processes) {
  const auto descriptors = [] {
    return std::distance(std::filesystem::directory_iterator("/proc/self/fd"), {});
  };
  tree.make("plain");
  for (const int number : {SIGCHLD, SIGTERM}) ::signal(number, SIG_IGN);
  EXPECT_NE(std::freopen("plain", "r", stdin), nullptr);
  const auto before = descriptors();
  expect_table(ran, R"(
$ say=a err=b say=c exit=3     | 3: a\n/b\n/c\n/
$ args\ta\  it's '' "" # *;|<\t | 0: [args][a\][it's][][][#][*;|<]\n/
$ args "a b"c"d e" 'x "y"' 'z' | 0: [args][a bcd e][x "y"][z]\n/
$ args 'a'"b c"'d' e" '"' f'g  | 0: [args][ab c'd'][e ''][f'g]\n/
$ say=a kill=15                | 143: a\n/
$ say=a close sleep=50 exit=4  | 4: a\n/
sh -c "cat; printf 'a\nb'"     | 0: a\n/b/
printf a\x00\x00b\n\x00        | 0: a␀␀b\n/␀/
'' $ say=a                     | "": the name of the program is empty
x "y                           | x "y: a quote is without its partner
x 'y                           | x 'y: a quote is without its partner)");
  EXPECT_EQ(ran("") + ran(" $ say=a"), ran("''") + ran("''"));
  // Whichever of the standard streams this process has.
  for (int closed = 0; closed < 8; ++closed) {
    int kept[3];
    for (int i = 0; i < 3; ++i) {
      kept[i] = ::fcntl(i, F_DUPFD_CLOEXEC, 10);
      if ((closed >> i & 1) != 0) ::close(i);
    }
    const std::string said = ran("$ say=a err=b");
    for (int i = 0; i < 3; ++i) ::dup2(kept[i], i), ::close(kept[i]);
    EXPECT_EQ(said, "0: a\n/b\n/") << closed;
  }
  poll_fails = true;
  EXPECT_EQ(ran("printf %0131072d 0"), "printf: its output could not be read: Input/output error");
  poll_fails = false;
  EXPECT_EQ(descriptors(), before);
  for (const int number : {SIGCHLD, SIGTERM}) ::signal(number, SIG_DFL);
}

// A piece is as long as it may be, but for a character that it would cut.
TEST_F(Host, LongLinesInPieces) {
  constexpr std::size_t LONGEST = la_line_cutter::LONGEST;
  for (const std::string character : {"0", "\u07FF", "\u20AC", "\U0001F600"}) {
    for (std::size_t before = LONGEST - 5; before <= LONGEST + 1; ++before) {
      for (const std::string end : {"", "\n", "xyz\n"}) {
        std::string rest = std::string(before, '0') + character + end + "next\n",
                    block = rest + "?";
        std::vector<std::string> pieces, expected;
        la_line_cutter cutter([&](const char* piece) { pieces.emplace_back(piece); });
        for (std::size_t at = 0; at < rest.size(); at += 40'000)
          cutter.add(block.data() + at, std::min<std::size_t>(40'000, rest.size() - at));
        cutter.flush();
        while (!rest.empty()) {
          std::size_t length = std::min(LONGEST, rest.find('\n'));
          while ((rest[length] & 0xC0) == 0x80) --length;
          if (rest[length] == '\n') ++length;
          expected.push_back(rest.substr(0, length));
          rest.erase(0, length);
        }
        EXPECT_TRUE(pieces == expected) << before << character << end;
      }
    }
  }
}
