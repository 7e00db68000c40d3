#include "cli/hints.h"

#include <unistd.h>

#include <algorithm>
#include <sstream>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "cli/place.h"
#include "cli/relations.h"
#include "host/port_env.h"
#include "host/port_process.h"
#include "launcher/command_options.h"

namespace {

// ---- A rule and its netlister ----

/// Whether a program of this name can be started. One with "/" that is not a full name depends on
/// the directory in which it runs, and is believed to be there.
bool can_be_started(const std::string& program) {
  if (program.find('/') != program.npos) {
    return program[0] != '/' || ::access(program.c_str(), X_OK) == 0;
  }
  const char* path = Port_Env::GetEnv("PATH");
  std::istringstream directories(path != nullptr ? path : "/bin:/usr/bin");
  for (std::string directory; std::getline(directories, directory, ':');) {
    const std::string file = (directory.empty() ? "." : directory) + "/" + program;
    if (::access(file.c_str(), X_OK) == 0) return true;
  }
  return false;
}

std::string on_netlister(const LA_RULE& rule) {
  std::vector<std::string> words;
  const bool is_whole = Port_Process::Split(rule.netlister.get(), words);
  if (!is_whole || words.empty() || can_be_started(words[0])) return {};
  const bool is_path = words[0][0] == '/';
  return "its netlister " + words[0] + (is_path ? " cannot be started" : " is not on PATH");
}

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

std::string on_directory(const LA_RULE& rule) {
  const char* directory = rule.netlister_dir ? rule.netlister_dir->get_dir() : nullptr;
  if (rule.netlister_dir_flag != DIR_GIVEN || directory == nullptr) return {};
  const std::string text = rule.netlister_dir_text.get();
  if (is_record(rule) && names_keyword(text)) {
    return "its netlister directory looks like the rest of its options: a comma ends a field";
  }
  const std::string start = "its netlister directory \"" + text + "\" ";
  if (text.starts_with('$')) return start + "is neither $SOURCE nor $OUTPUT, and taken as a name";
  const bool is_full = text.starts_with('/') || text.starts_with('\\') || text[1] == ':';
  const std::string counts = "counts from the directory of the call";
  if (Port::File::isdirectory(directory)) return is_full ? "" : start + counts;
  return start + "is not there" + (is_full ? "" : "; it " + counts);
}

std::string on_relation(const LA_RULE& rule, const relation& to_others) {
  // A rule that never runs may be there to complete an earlier one.
  if (to_others.overridden_by != nullptr && !rule.is_inherited_from) {
    return std::string("it is never used: rule ") + to_others.overridden_by->rule_name.get() +
           " before it serves whenever it could";
  }
  if (!to_others.is_useful) {
    return "it is never used: no rule leads from " + kind_of(*rule.target) + " to .kbo";
  }
  return to_others.is_in_loop ? "it leads back to itself: names that need it end with an error"
                              : "";
}

// ---- One template of a rule ----

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

/// The text that a shell is to read: the word behind its -c; empty if there is no shell.
std::string text_for_shell(const std::string& command) {
  std::vector<std::string> words;
  if (command.find("sh") == command.npos || !Port_Process::Split(command, words)) return {};
  const auto is_shell = [](const std::string& word) {
    return (word.size() <= 4 || word.rfind('/') != word.npos) && word.ends_with("sh");
  };
  const auto has_c = [](const std::string& word) {
    return word.size() > 1 && word[0] == '-' && word[1] != '-' && word.ends_with('c');
  };
  auto word = std::find_if(words.begin(), words.end(), is_shell);
  word = std::find_if(word, words.end(), has_c);
  return word == words.end() || ++word == words.end() ? std::string() : *word;
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

constexpr std::string (*ON_TEMPLATES[])(const LA_RULE& rule, const std::string& options) = {
    on_files, on_quotes, on_shell_operators, on_shell_text};

}  // namespace

std::vector<std::string> hints_on(const LA_RULE_SET& set) {
  const place_names places;
  std::vector<std::string> hints;
  std::unordered_set<std::string> given;
  const auto give = [&](const LA_RULE& rule, const char* what, const std::string& hint) {
    if (hint.empty()) return;
    std::string line =
        places.line(rule.origin) + ": rule " + rule.rule_name.get() + ": " + what + hint;
    if (given.insert(line).second) hints.push_back(std::move(line));
  };
  std::unordered_map<std::string_view, std::string> on_netlisters;
  const std::vector<relation> relations = relations_of(set);
  for (int i = 0; i < set.rules.count; ++i) {
    const LA_RULE& rule = *set.rules.elements[i];
    give(rule, "", on_relation(rule, relations[static_cast<std::size_t>(i)]));
    const char* netlister = rule.netlister;
    if (netlister == nullptr || UT_STR::_Compare(netlister, "NOT_SUPPORTED") == 0) continue;
    const auto [known, is_new] = on_netlisters.try_emplace(netlister);
    if (is_new) known->second = on_netlister(rule);
    give(rule, "", known->second);
    give(rule, "", on_directory(rule));
    const char* options = rule.netlister_options;
    const char* top_options = rule.netlister_top_options;
    for (const auto hint_on : ON_TEMPLATES) {
      give(rule, "its options ", hint_on(rule, options != nullptr ? options : ""));
      if (top_options != nullptr) give(rule, "its top options ", hint_on(rule, top_options));
    }
  }
  return hints;
}
