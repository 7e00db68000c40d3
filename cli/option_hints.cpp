#include "cli/option_hints.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "host/port_process.h"
#include "launcher/command_options.h"

namespace {

/// Whether the rule is one of a data file, where a comma ends a field, whatever was meant.
bool is_record(const LA_RULE& rule) {
  return rule.origin.file.ends_with(".acd");
}

bool names_keyword(std::string text) {
  UT_STR::Lower(text.data());
  return std::any_of(LA_OPTION_KEYWORDS.begin(), LA_OPTION_KEYWORDS.end(), [&](std::string word) {
    UT_STR::Lower(word.data());
    return text.find("$" + word) != text.npos;
  });
}

bool names(std::string_view lower_text, std::string_view keyword) {
  return lower_text.find(keyword) != lower_text.npos;
}

std::string on_files(const LA_RULE& /*unused*/, const std::string& options) {
  std::string text = options;
  UT_STR::Lower(text.data());
  const bool has_input = names(text, "$infile");
  const bool has_output = names(text, "$outfile");
  if (!has_input && !has_output) return "name neither $infile nor $outfile";
  if (!has_input) return "do not name $infile";
  return has_output || names(text, "$output") ? "" : "do not name $outfile";
}

std::string on_quotes(const LA_RULE& rule, const std::string& options) {
  std::vector<std::string> words;
  if (options.find_first_of("\"'") == options.npos) return {};
  if (Port_Process::Split(rule.netlister.get() + (" " + options), words)) return {};
  return std::string("hold a quote without its partner") +
         (is_record(rule) ? ": a comma ends a field" : "");
}

std::string on_shell_operators(const LA_RULE& /*unused*/, const std::string& options) {
  std::vector<std::string> words;
  if (options.find_first_of("<>|&;") == options.npos) return {};
  Port_Process::Split(options, words);
  const auto is_operator = [](std::string_view word) {
    if (word.starts_with("1>") || word.starts_with("2>")) word.remove_prefix(1);
    return word.starts_with('>') || word.starts_with('<') || word == "|" || word == "||" ||
           word == "&&" || word == "&" || word == ";";
  };
  const auto found = std::find_if(words.begin(), words.end(), is_operator);
  if (found == words.end()) return {};
  return "hold " + *found + ", and no shell reads them: put the command into a script";
}

/// The text that a shell is to read: the word behind its -c; empty if there is none.
std::string text_for_shell(const std::string& command) {
  std::vector<std::string> words;
  if (command.find("sh") == command.npos || !Port_Process::Split(command, words)) return {};
  const auto is_shell = [](const std::string& word) {
    constexpr std::array SHELLS = {"sh", "bash", "dash", "ksh", "zsh"};
    const std::string name = word.substr(word.rfind('/') + 1);
    return std::find(SHELLS.begin(), SHELLS.end(), name) != SHELLS.end();
  };
  auto word = std::find_if(words.begin(), words.end(), is_shell);
  while (word != words.end() && ++word != words.end() && word->starts_with('-')) {
    const bool is_c = !word->starts_with("--") && word->ends_with('c');
    if (is_c) return ++word != words.end() ? *word : "";
  }
  return {};
}

std::string on_shell_text(const LA_RULE& rule, const std::string& options) {
  std::string text = text_for_shell(std::string(rule.netlister.get()) + " " + options);
  UT_STR::Lower(text.data());
  for (const char* name : {"$infile", "$outfile", "$output", "$libraries", "$part"}) {
    if (!names(text, name)) continue;
    return "make a shell obey what stands in " +
           std::string(name == std::string_view("$output") ? "$OUTPUT" : name) +
           ": put the command into a script, and give it names as arguments";
  }
  return {};
}

constexpr std::string (*KINDS[])(const LA_RULE& rule, const std::string& options) = {
    on_files, on_quotes, on_shell_operators, on_shell_text};

}  // namespace

bool is_rest_of_options(const LA_RULE& rule, const std::string& field) {
  return is_record(rule) && names_keyword(field);
}

std::vector<std::string> hints_on_options(const LA_RULE& rule) {
  std::vector<std::string> hints;
  const auto give = [&hints](const char* what, const std::string& hint) {
    if (!hint.empty()) hints.push_back(what + hint);
  };
  const char* options = rule.netlister_options;
  const char* top_options = rule.netlister_top_options;
  for (const auto hint_on : KINDS) {
    give("its options ", hint_on(rule, options != nullptr ? options : ""));
    if (top_options != nullptr) give("its top options ", hint_on(rule, top_options));
  }
  return hints;
}
