// Option strings: templates and what they expand to.
#include <strings.h>

#include <algorithm>
#include <random>

#include "optparse/baslaoptparse.h"
#include "support.h"

/// How often memory was allocated; a build with the address sanitizer counts it.
static long allocations = 0;
// NOLINTNEXTLINE(bugprone-reserved-identifier)
extern "C" void __sanitizer_malloc_hook(const volatile void* /*memory*/, std::size_t /*size*/) {
  ++allocations;
}

static const std::vector<std::pair<std::string, std::vector<const char*>>> KEYWORDS = {
    {"part", {"dev1"}},  {"quiet", {nullptr}}, {"libraries", {"/a", "/b"}},
    {"in", {"top.edf"}}, {"lead", {"  v  "}},  {"empty", {""}},
    {"round", {"a]"}},   {"curly", {"a}"}},    {"partial", {"never"}}};

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

/// The rules of templates once more, with texts of any length. A failure is thrown as its message.
struct Naive {
  static void join(std::string& output, std::string piece) {
    if (piece.starts_with(' ') && (output.empty() || output.ends_with(' '))) {
      output.erase(output.find_last_not_of(' ') + 1);
      if (!output.empty()) output += ' ';
      piece.erase(0, piece.find_first_not_of(' '));
    }
    output += piece;
  }

  static const std::vector<const char*>& values(const std::string& name) {
    for (const auto& [known, values] : KEYWORDS) {
      if (::strncasecmp(name.c_str(), known.c_str(), known.size()) == 0) return values;
    }
    throw "217 Undefined keyword \"" + name + "\" in option string\n";
  }

  /// group: '[', '{' or, for the template itself, ' '.
  std::string part(const std::string& in, char group, std::size_t position, bool& kept) {
    kept = false;
    if (++steps > 100) throw std::string();
    std::string out;
    for (std::size_t i = 0, end = 0; i < in.size(); i = end) {
      if (in[i] == '$') {
        end = i + 2;
        while (end < in.size() && (std::isalpha(in[end]) || in[end] == '_')) ++end;
        const std::string name = in.substr(i + 1, end - i - 1);
        const auto& known = values(name);
        const std::size_t at = group == '{' ? position : 0;
        if (!known[0] && group == ' ') throw "226 Keyword \"" + name + "\" is not optional\n";
        if (!known[0] || at >= known.size()) return kept = false, "";
        join(out, known[at]);
        kept = true;
      } else if (in[i] == '{' || in[i] == '[') {
        const bool repeat = in[i] == '{';
        if (repeat && group == '{') throw std::string("267 Cannot nest {'s in option string\n");
        int depth = 0;
        for (end = i + 1; end < in.size() && (in[end] != (repeat ? '}' : ']') || depth > 0);
             ++end) {
          depth += repeat ? 0 : (in[end] == '[') - (in[end] == ']');
        }
        const std::string missing = repeat ? "274 Missing '}'" : "332 Missing ']'";
        if (end == in.size()) throw missing + " in option string\n";
        const std::string body = in.substr(i + 1, end++ - i - 1);
        bool inner = true;
        for (std::size_t n = 0; inner && (repeat || n == 0); ++n) {
          const std::string copy = part(body, in[i], n, inner);
          if (inner) join(out, copy), kept = true;
        }
      } else {
        end = std::min(in.find_first_of("$[{", i), in.size());
        join(out, in.substr(i, end - i));
      }
    }
    return out;
  }

  static std::string expanded(const std::string& text) try {
    bool kept = false;
    const std::string all = "<" + Naive().part(text, ' ', 0, kept) + ">";
    if (all.find('}') != all.npos) return "157 Missing '{' in options string\n" + all;
    if (all.find(']') != all.npos) return "163 Missing '[' in options string\n" + all;
    return all;
  } catch (const std::string& message) {
    return message;
  }

  int steps = 0;
};

TEST(Templates, Expand) {
  expect_table([](const std::string& text) { return Table().expanded(text); }, R"(
-p $part {-l $libraries } [$quiet] [$empty] $in | <-p dev1 -l /a -l /b top.edf>
[ $quiet]  -p   $part   $lead  x$lead$lead      | <-p   dev1 v x  v v  >
$PART$part2{-$empty }$infile$partial[x]{x}      | <dev1dev12- top.edfdev1>
-[a $part [b $quiet]]{c[ $quiet$lead]$part}     | <-a dev1 cdev1>
[$part $other_1]                                | 217 Undefined keyword "other_" in option string\n)");
}

TEST(Templates, AgreeWithTheRules) {
  // "_" is a blank.
  const auto pieces = table(
      R"($part | $quiet | $libraries | $lead | $empty | $round | $ | $x | $curly | x | -_ | _y | _ | __ | [ | [ | [ | ] | ] | ] | { | { | } | })")
      [0];
  const Table keywords;
  std::mt19937 random(1);
  for (int i = 0; i < 20'000 && !HasFailure(); ++i) {
    std::string text;
    for (std::size_t n = random() % 16; n > 0; --n) text += pieces[random() % pieces.size()];
    text = replaced(text, "_", " ");
    EXPECT_EQ(keywords.expanded(text, 4096), Naive::expanded(text)) << text;
  }
}

TEST(Templates, LimitsAndDump) {
  const std::string longest(259, 'x');
  const std::string text = "[$long$long$quiet][$long[$long$quiet]]$long";
  Table keywords;
  keywords.set_keyword("long", longest.c_str());
  EXPECT_EQ(keywords.expanded(text, 519), "<" + longest + longest + ">");
  EXPECT_EQ(keywords.expanded(longest), "<" + longest + ">");
  const std::string said = keywords.expanded(text, 518) + keywords.expanded(longest + "y", 1000);
  EXPECT_NE(said.find("of option string \"" + text + "\" is longer than 517 ch"), said.npos);
  EXPECT_NE(said.find("Option string \"" + longest + "y\" is longer than 259 ch"), said.npos);
  keywords.set_keyword("libraries", "c");
  for (int i = 2; i <= 98; ++i) keywords.add_keyword("libraries", "c");
  EXPECT_EQ(keywords.expanded("{$libraries}"), "<" + std::string(98, 'c') + ">");
  keywords.add_keyword("libraries", "c");
  EXPECT_EQ(keywords.expanded("{$libraries}"), "");
  Messages messages;
  keywords.dump();
  EXPECT_EQ(messages.records.at(0).origin, "optparse/baslaoptparse.cpp:84 $Revision: 1.6 $");
  EXPECT_EQ(messages.take().substr(0, 44), "S part = dev1S quiet = S libraries = cS libr");
}
