// The guides hold to what the system does: docs/rules.md shows what its samples really give, and
// the man pages name the options and the keywords that there are.
#include <gtest/gtest.h>

#include <filesystem>
#include <regex>
#include <sstream>
#include <utility>

#include "cli/settings.h"
#include "launcher/command_options.h"
#include "optparse/baslaoptparse.h"
#include "rules/rule_fields.h"
#include "support.h"

namespace {

std::string guide(const std::string& name) {
  return slurp(KESTREL_SOURCE_DIR "/docs/" + name);
}

/// Runs the samples of a guide one after the other; each finds what those before it have left.
struct Samples {
  Samples() { tree.write("sample.urf", ""); }

  /// What a sample of this kind is to read. What is found on loading one is to be in a sample of
  /// the kind "messages" right behind it.
  std::string again(const std::string& kind, const std::string& text) {
    std::string result = std::exchange(findings, "");
    if (kind.starts_with("rules")) return result + load("sample.urf", kind, text);
    if (kind.starts_with("acd")) return result + load("share/data/larules.acd", kind, text);
    if (kind == "devices") return result + load("share/data/devices.acd", kind, text);
    std::istringstream lines(kind == "messages" ? "" : text);
    for (std::string line; std::getline(lines, line);) {
      if (kind == "templates") result += expand(line);
      if (kind == "console" && line[0] == '$') result += line + "\n" + tree.shell(line.substr(1));
    }
    return result;
  }
  std::string load(const std::string& path, const std::string& kind, const std::string& text) {
    const std::string before = tree.read(path);
    tree.write(path, text);
    findings = tree.shell("kestrel-launch --check -u sample.urf 2>&1 >/dev/null | grep -v hint:");
    EXPECT_EQ(!findings.empty(), kind.ends_with("-error")) << text;
    if (!findings.empty()) tree.write(path, before);
    return text;
  }
  /// A line that is the value of a keyword, or a template and what it expands to.
  std::string expand(const std::string& line) {
    const std::size_t arrow = line.find(" => ");
    const std::size_t equals = line.find(" = ");
    if (arrow == line.npos) {
      const char* value = equals == line.npos ? nullptr : line.c_str() + equals + 3;
      table.add_keyword(line.substr(0, equals).c_str(), value);
      return line + "\n";
    }
    char options[LA_MAX_PATH] = "";
    line.copy(options, line.rfind('"', arrow) - 1, 1);
    if (table.expand(options)) return line.substr(0, arrow + 4) + "\"" + options + "\"\n";
    return line.substr(0, arrow + 4) + "error: " + messages.take().erase(0, 2);
  }

  Tree tree;
  Messages messages;
  LA_KEYWORD_TABLE table;
  std::string findings;
};

TEST(Docs, SamplesGiveWhatTheGuideShows) {
  const std::string text = guide("rules.md");
  const std::regex fence("```([^\n]*)\n([^`]*)```\n");
  Samples samples;
  for (std::sregex_iterator m(text.begin(), text.end(), fence), end; m != end; ++m) {
    EXPECT_EQ(m->prefix().str().find("```"), text.npos) << m->prefix();
    EXPECT_EQ(samples.again(m->str(1), m->str(2)), m->str(2));
  }
  EXPECT_EQ(samples.findings, "");
}

/// A list of the page has an item like this regular expression.
void expect_item(const std::string& page, const std::string& item) {
  EXPECT_TRUE(std::regex_search(page, std::regex("\n\\.T[PQ]\n" + item + "[\\\\\n]"))) << item;
}

TEST(Docs, ManPageNamesTheOptionsThatThereAre) {
  const std::string page =
      std::regex_replace(guide("kestrel-launch.1"), std::regex("\\\\(f.|(?=-))"), "");
  const std::string help = help_text();
  for (const option& o : all_options()) {
    std::string item = o.short_name != nullptr ? o.short_name + std::string(", ") : "";
    item.append(o.long_name).append(o.argument != nullptr ? " " : "");
    if (o.argument != nullptr) item += o.argument;
    expect_item(page, item);
  }
  const std::regex long_name("--[a-z-]+");
  for (std::sregex_iterator at(page.begin(), page.end(), long_name), end; at != end; ++at) {
    EXPECT_NE(help.find(at->str() + " "), help.npos) << at->str();
  }
}

/// The longest run of words in the literals of C++ code; empty when none has two words.
std::string longest_clause(const std::string& literals) {
  static const std::regex END(R"re("\s+"|%[a-z]|\\.|[^-A-Za-z' ]|\B[-' ]|[-' ]\B)re");
  const std::string joined = std::regex_replace(literals, std::regex("\"\\s+\""), "");
  std::string longest;
  for (std::sregex_token_iterator at(joined.begin(), joined.end(), END, -1), end; at != end; ++at) {
    if (at->length() > static_cast<int>(longest.size())) longest = *at;
  }
  return longest.find(' ') != longest.npos ? longest : "";
}

TEST(Docs, GuideHasARowForEveryMessage) {
  std::string rows = guide("rules.md");
  rows.erase(0, rows.find("\n## Messages\n"));
  // A comment, a character, or literals perhaps behind the name of a function.
  const std::regex token(R"re(//.*|'\\?.'|(\w*\()?((?:"(?:[^"\\]|\\.)*"\s*)+))re");
  for (const char* folder : {"file", "host", "launcher", "optparse", "rules"}) {
    const std::string path = KESTREL_SOURCE_DIR "/" + std::string(folder);
    for (const auto& file : std::filesystem::recursive_directory_iterator(path)) {
      if (file.is_directory()) continue;
      const std::string code = slurp(file.path());
      for (std::sregex_iterator at(code.begin(), code.end(), token), end; at != end; ++at) {
        const std::string literals = at->str(2);
        if (at->str(1) == "issueStatus(" && literals.find("Launcher") != 1) continue;  // A dump.
        EXPECT_NE(rows.find(longest_clause(literals)), rows.npos) << literals;
      }
    }
  }
}

TEST(Docs, ManPageOfRulesNamesTheKeywordsThatThereAre) {
  const std::string page = guide("kestrel-rules.5");
  for (const char* word : rule_keywords()) expect_item(page, R"(.*\\fB)" + std::string(word));
  for (const char* word : LA_OPTION_KEYWORDS) expect_item(page, R"(.*\\fB\$)" + std::string(word));
}

}  // namespace
