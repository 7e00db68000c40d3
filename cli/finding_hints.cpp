#include "cli/finding_hints.h"

#include <cstdlib>
#include <fstream>
#include <string_view>
#include <utility>

#include "cli/nearest.h"
#include "file/baslafile.h"
#include "host/base/blanks.h"
#include "launcher/command_options.h"
#include "rules/rule_fields.h"

namespace {

std::string meant(std::string_view word, const std::vector<const char*>& keywords) {
  const std::string found = nearest(word, keywords);
  return found.empty() ? "" : std::string(word) + ": did you mean " + found + "?";
}

std::string rule_keyword(std::string_view word, const line_of_rules& /*unused*/) {
  return meant(word, rule_keywords());
}

std::string option_keyword(std::string_view word, const line_of_rules& /*unused*/) {
  return meant(word, {LA_OPTION_KEYWORDS.begin(), LA_OPTION_KEYWORDS.end()});
}

std::string exit_code(std::string_view /*unused*/, const line_of_rules& /*unused*/) {
  return "an exit code is a number, perhaps behind =, !, < or >: 0, !0, \"< 4\"";
}

std::string comma(std::string_view /*unused*/, const line_of_rules& /*unused*/) {
  return "a comma ends a field: no option can hold one";
}

std::string comment(std::string_view /*unused*/, const line_of_rules& line) {
  return la_trimmed(line.text()).starts_with('#') ? "here comments begin with //" : "";
}

std::string comment_in_data(std::string_view /*unused*/, const line_of_rules& line) {
  return la_trimmed(line.text()).starts_with("//") ? "here comments begin with #" : "";
}

/// A line of a user rules file without its comment, and without blanks around it.
std::string_view statements_of(std::string_view line) {
  return la_trimmed(line.substr(0, line.find("//")));
}

/// A value stands at the end of the line, but nothing ends it.
std::string end_of_value(std::string_view /*unused*/, const line_of_rules& line) {
  const std::string_view text = statements_of(line.text());
  const std::string_view value = la_trimmed(text.substr(text.rfind('=') + 1));
  return value.empty() ? "" : "a \";\" is missing behind " + std::string(value);
}

/// Whether a keyword with its "=" stands at the front of the text.
bool begins_statement(std::string_view text, std::string_view keyword) {
  return text.size() > keyword.size() &&
         UT_STR::INCompare(text.data(), keyword.data(), keyword.size()) == 0 &&
         la_trimmed(text.substr(keyword.size())).starts_with('=');
}

/// Whether the text in front of a statement ends as it should.
bool is_ended(std::string_view before, const line_of_rules& line) {
  for (int number = line.number; la_trimmed(before).empty() && number > 1;) {
    before = statements_of(line.text(--number));
  }
  return la_trimmed(before).empty() || la_trimmed(before).ends_with(';');
}

/// The next statement stands where the end of one is expected.
std::string end_of_statement(std::string_view /*unused*/, const line_of_rules& line) {
  const std::string_view text = statements_of(line.text());
  for (std::size_t at = 0; at < text.size(); ++at) {
    if (at > 0 && std::string_view("; \t\"").find(text[at - 1]) == text.npos) continue;
    for (const char* keyword : rule_keywords()) {
      if (!begins_statement(text.substr(at), keyword) || is_ended(text.substr(0, at), line))
        continue;
      return std::string("a \";\" is missing before ") + keyword;
    }
  }
  return "a value with blanks stands in double quotes";
}

/// What a message may say, with the word between its two parts. The first hint that fits is given.
constexpr struct {
  std::string_view before;
  std::string_view after;
  std::string (*hint)(std::string_view word, const line_of_rules& line);
} KINDS[] = {
    {": Expecting keyword", "\n", comment},
    {": Expecting \"=\"", "\n", comment},
    {": Unexpected key word #", "\n", comment},
    {": Expecting KEY = VALUE", "\n", comment_in_data},
    {": Expecting value", "\n", end_of_value},
    {": Expecting \";\"", "\n", end_of_statement},
    {": Unexpected key word ", "\n", rule_keyword},
    {"Undefined keyword \"", "\" in", option_keyword},
    {"Invalid exit code for ", ".\n", exit_code},
    {" - Only the first ", " fields", comma},
};

}  // namespace

const std::string& line_of_rules::text(int of) const {
  static const std::string none;
  const auto at = static_cast<std::size_t>(of) - 1;
  return at < lines.size() ? lines[at] : none;
}

void finding_hints::read(const std::string& file) {
  if (file == file_) return;
  file_ = file;
  lines_.clear();
  // A user rules file is named as the user names it.
  LA_FULLFILE full(file.c_str());
  if (full.get_ext() == nullptr) full.set_ext("urf");
  const char* path = full.get_fullfile();
  std::ifstream in(path != nullptr ? path : "");
  for (std::string line; std::getline(in, line);) lines_.push_back(line);
}

void finding_hints::add(const std::string& error) {
  constexpr std::string_view START = "Launcher: \"";
  constexpr std::string_view LINE = "\", line ";
  const std::size_t end = error.find(LINE);
  const bool has_line = error.starts_with(START) && end != error.npos;
  const std::string file = has_line ? error.substr(START.size(), end - START.size()) : "";
  const int number = has_line ? std::atoi(error.c_str() + end + LINE.size()) : 0;
  for (const auto& [before, after, hint_of] : KINDS) {
    const std::size_t at = error.find(before);
    if (at == error.npos) continue;
    const std::size_t start = at + before.size();
    if (has_line) read(file);
    std::string hint =
        hint_of(error.substr(start, error.find(after, start) - start), {lines_, number});
    if (hint.empty()) continue;
    if (!given_.insert(hint).second) return;
    if (has_line) hint.insert(0, "\"" + file + "\", line " + std::to_string(number) + ": ");
    hints_.push_back(std::move(hint));
    return;
  }
}
