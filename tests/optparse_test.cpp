// Option strings: templates and what they expand to.
#include <algorithm>

#include "optparse/baslaoptparse.h"
#include "support.h"

/// How often memory was allocated; a build with the address sanitizer counts it.
static long allocations = 0;
// NOLINTNEXTLINE(bugprone-reserved-identifier)
extern "C" void __sanitizer_malloc_hook(const volatile void* /*memory*/, std::size_t /*size*/) {
  ++allocations;
}

static const std::vector<std::pair<std::string, std::vector<const char*>>> KEYWORDS = {
    {"part", {"dev1"}},      {"quiet", {nullptr}}, {"libraries", {"/a", "/b"}},
    {"in", {"top.edf"}},     {"lead", {"  v  "}},  {"empty", {""}},
    {"round", {"a]"}},       {"curly", {"a}"}},    {"partial", {"never"}},
    {"gap", {"1", nullptr}}, {"x2", {"never"}}};

struct Table : LA_KEYWORD_TABLE {
  Table() {
    for (const auto& [name, values] : KEYWORDS) {
      for (const char* value : values) add_keyword(name.c_str(), value);
    }
  }

  /// What becomes of a template, between "<" and ">", behind the messages with their lines.
  std::string expanded(const std::string& text, std::size_t size = LA_MAX_PATH) const {
    std::vector<char> buffer(text.begin(), text.end());
    buffer.resize(std::max(text.size() + 1, size));
    Messages messages;
    const long before = allocations;
    const bool good = expand(buffer.data(), static_cast<int>(size));
    EXPECT_TRUE(!good || allocations == before) << text;
    std::string found;
    for (const auto& [level, origin, message] : messages.records) {
      found += replaced(origin, "optparse/baslaoptparse.cpp:", "").substr(0, 4) + message;
    }
    if (good || found.ends_with("options string\n")) return found + "<" + buffer.data() + ">";
    EXPECT_EQ(buffer.data(), text);
    return found;
  }
};

TEST(Templates, Expand) {
  expect_table([](const std::string& text) { return Table().expanded(text); }, R"(
-p $part {-l $libraries } [$quiet] [$empty] $in | <-p dev1 -l /a -l /b top.edf>
[ $quiet]  -p   $part   $lead  x$lead$lead      | <-p   dev1 v x  v v  >
$PART$part2{-$empty }$infile$partial[x]{x}      | <dev1dev12- top.edfdev1>
-[a $part [b $quiet]]{c[ $quiet$lead]$part}     | <-a dev1 cdev1>
{$gap }                                         | <1 >
[$part $other_1]                                | 217 Undefined keyword "other_" in option string\n)");
}

TEST(Templates, ExpandInEveryNesting) {
  const std::string all = slurp(KESTREL_SOURCE_DIR "/tests/data/templates.txt");
  const auto expanded = [](const std::string& text) {
    return replaced(Table().expanded(replaced(text, "_", " ")), " ", "_");
  };
  expect_table(expanded, all.substr(all.find("\n\n")));
}

TEST(Templates, LimitsAndDump) {
  const std::string longest(259, 'x');
  const std::string text = "[$long$long$long $quiet][$long[$long$quiet]]$long";
  Table keywords;
  keywords.set_keyword("long", longest.c_str());
  EXPECT_EQ(keywords.expanded(text, 519), "<" + longest + longest + ">");
  EXPECT_EQ(keywords.expanded(longest), "<" + longest + ">");
  EXPECT_EQ(keywords.expanded(longest, 300), "<" + longest + ">");
  EXPECT_EQ(keywords.expanded("$long      $lead", 264), "<" + longest + " v  >");
  const std::string said = keywords.expanded(text, 518) + keywords.expanded(longest + "y", 1000);
  EXPECT_NE(keywords.expanded("$long$long", 300).find("is longer than 299 ch"), said.npos);
  EXPECT_NE(said.find("of option string \"" + text + "\" is longer than 517 ch"), said.npos);
  EXPECT_NE(said.find("Option string \"" + longest + "y\" is longer than 259 ch"), said.npos);
  keywords.set_keyword("libraries", "c");
  for (int i = 2; i <= 98; ++i) keywords.add_keyword("libraries", "c");
  EXPECT_EQ(keywords.expanded("{$libraries}"), "<" + std::string(98, 'c') + ">");
  keywords.add_keyword("libraries", "c");
  EXPECT_EQ(keywords.expanded("{$libraries}"), "");
  const std::string open = replaced(std::string(100, '.'), ".", "[]") + "[";
  EXPECT_EQ(keywords.expanded("[" + open), "332 Missing ']' in option string\n");
  // An empty name begins every reference.
  keywords.set_keyword("", "e");
  keywords.set_keyword("other", "never");
  EXPECT_EQ(keywords.expanded("$part$other$-$"), "<dev1eee>");
  Messages messages;
  keywords.dump();
  EXPECT_EQ(messages.records.at(0).origin, "optparse/baslaoptparse.cpp:84 $Revision: 1.6 $");
  EXPECT_EQ(messages.take().substr(0, 44), "S part = dev1S quiet = S libraries = cS libr");
}
