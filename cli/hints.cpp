#include "cli/hints.h"

#include <unistd.h>

#include <sstream>
#include <string_view>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "cli/option_hints.h"
#include "cli/place.h"
#include "cli/relations.h"
#include "host/port_env.h"
#include "host/port_process.h"

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

std::string on_netlister(const LA_RULE& rule) {
  std::vector<std::string> words;
  const bool is_whole = Port_Process::Split(rule.netlister.get(), words);
  if (!is_whole || words.empty() || can_be_started(words[0])) return {};
  const bool is_path = words[0][0] == '/';
  return "its netlister " + words[0] + (is_path ? " cannot be started" : " is not on PATH");
}

std::string on_directory(const LA_RULE& rule) {
  const char* directory = rule.netlister_dir ? rule.netlister_dir->get_dir() : nullptr;
  if (rule.netlister_dir_flag != DIR_GIVEN || directory == nullptr) return {};
  const std::string text = rule.netlister_dir_text.get();
  if (is_rest_of_options(rule, text)) {
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

}  // namespace

std::vector<std::string> hints_on(const LA_RULE_SET& set) {
  const place_names places;
  std::vector<std::string> hints;
  std::unordered_set<std::string> given;
  const auto give = [&](const LA_RULE& rule, const std::string& hint) {
    if (hint.empty()) return;
    std::string line = places.line(rule.origin) + ": rule " + rule.rule_name.get() + ": " + hint;
    if (given.insert(line).second) hints.push_back(std::move(line));
  };
  std::unordered_map<std::string_view, std::string> on_netlisters;
  const std::vector<relation> relations = relations_of(set);
  for (int i = 0; i < set.rules.count; ++i) {
    const LA_RULE& rule = *set.rules.elements[i];
    give(rule, on_relation(rule, relations[static_cast<std::size_t>(i)]));
    const char* netlister = rule.netlister;
    if (netlister == nullptr || UT_STR::_Compare(netlister, "NOT_SUPPORTED") == 0) continue;
    const auto [known, is_new] = on_netlisters.try_emplace(netlister);
    if (is_new) known->second = on_netlister(rule);
    give(rule, known->second);
    give(rule, on_directory(rule));
    for (const std::string& hint : hints_on_options(rule)) give(rule, hint);
  }
  return hints;
}
