#include "cli/hints.h"

#include <unistd.h>

#include <sstream>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "cli/nearest.h"
#include "cli/relations.h"
#include "host/port_env.h"
#include "host/port_process.h"
#include "launcher/command_options.h"

namespace {

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

std::string hint_on_netlister(const LA_RULE& rule) {
  std::vector<std::string> words;
  const bool is_whole = Port_Process::Split(rule.netlister.get(), words);
  if (!is_whole || words.empty() || can_be_started(words[0])) return {};
  const bool is_path = words[0][0] == '/';
  return "its netlister " + words[0] + (is_path ? " cannot be started" : " is not on PATH");
}

std::string hint_on_directory(const LA_RULE& rule) {
  const char* directory = rule.netlister_dir ? rule.netlister_dir->get_dir() : nullptr;
  if (rule.netlister_dir_flag != DIR_GIVEN || directory == nullptr) return {};
  if (Port::File::isdirectory(directory)) return {};
  return std::string("its netlister directory ") + directory + " is not there";
}

std::string hint_on_relation(const LA_RULE& rule, const relation& to_others) {
  if (to_others.overridden_by != nullptr) {
    return std::string("it is never used: rule ") + to_others.overridden_by->rule_name.get() +
           " before it serves whenever it could";
  }
  if (!to_others.is_useful) {
    return "it is never used: no rule leads from " + kind_of(*rule.target) + " to .kbo";
  }
  return to_others.is_in_loop ? "it leads back to itself: names that need it end with an error"
                              : "";
}

std::string hint_on_options(const char* options) {
  const std::string_view text(options != nullptr ? options : "");
  const bool has_file = text.find("$infile") != text.npos || text.find("$outfile") != text.npos;
  return has_file ? "" : "its options name neither $infile nor $outfile";
}

}  // namespace

std::vector<std::string> hints_on(const LA_RULE_SET& set) {
  std::vector<std::string> hints;
  std::unordered_set<std::string> given;
  const auto give = [&](const LA_RULE& rule, const std::string& hint) {
    if (hint.empty()) return;
    std::string line = std::string("rule ") + rule.rule_name.get() + ": " + hint;
    if (given.insert(line).second) hints.push_back(std::move(line));
  };
  // PATH is searched once for each.
  std::unordered_map<std::string_view, std::string> on_netlisters;
  const std::vector<relation> relations = relations_of(set);
  for (int i = 0; i < set.rules.count; ++i) {
    const LA_RULE& rule = *set.rules.elements[i];
    give(rule, hint_on_relation(rule, relations[static_cast<std::size_t>(i)]));
    const char* netlister = rule.netlister;
    if (netlister == nullptr || UT_STR::_Compare(netlister, "NOT_SUPPORTED") == 0) continue;
    const auto [known, is_new] = on_netlisters.try_emplace(netlister);
    if (is_new) known->second = hint_on_netlister(rule);
    give(rule, known->second);
    give(rule, hint_on_directory(rule));
    give(rule, hint_on_options(rule.netlister_options));
    if (rule.netlister_top_options) give(rule, hint_on_options(rule.netlister_top_options));
  }
  return hints;
}

std::string hint_on(const std::string& error) {
  const struct {
    std::string_view before;
    std::string_view after;
    std::vector<const char*> keywords;
  } findings[] = {
      {": Unexpected key word ", "\n", rule_keywords()},
      {"Undefined keyword \"", "\" in", {LA_OPTION_KEYWORDS.begin(), LA_OPTION_KEYWORDS.end()}},
  };
  for (const auto& [before, after, keywords] : findings) {
    const std::size_t at = error.find(before);
    if (at == error.npos) continue;
    const std::size_t start = at + before.size();
    std::string word = error.substr(start, error.find(after, start) - start);
    const std::string meant = nearest(word, keywords);
    return meant.empty() ? "" : word.append(": did you mean ").append(meant).append("?");
  }
  return {};
}
