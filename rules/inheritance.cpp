#include "rules/inheritance.h"

#include <algorithm>
#include <unordered_map>

#include "rules/conversion.h"

namespace {

constexpr const la_program* PROGRAMS[] = {&LA_RULE::NETLISTER, &LA_RULE::CHECKER};

constexpr la_text LA_RULE::*TEXTS[] = {&LA_RULE::netlister, &LA_RULE::netlister_top_options,
                                       &LA_RULE::netlister_options, &LA_RULE::checker,
                                       &LA_RULE::checker_options};
/// "NONE" clears all of them but the first.
constexpr la_text LA_RULE::*NEVER_CLEARED = &LA_RULE::netlister;

/// Adds, of each level that the rule's list lacks, the first entry of the other rule's list.
/// Returns whether there was one.
bool complete_statuses(LA_RULE& rule, const LA_RULE& from, const la_program& program) {
  const DARRAY_LA_STATUS_PTR& own = rule.*program.status;
  const int count = own.count;
  for (const LA_STATUS* entry : from.*program.status) {
    const auto has_level = [entry](const LA_STATUS* each) { return each->level == entry->level; };
    if (std::none_of(own.begin(), own.end(), has_level)) rule.add_status(program, *entry);
  }
  return own.count > count;
}

/// Fills what the rule leaves open from another. Returns whether that had anything to give.
bool complete(LA_RULE& rule, const LA_RULE& from) {
  bool has_taken = !rule.has_dependency_files() && from.has_dependency_files();
  if (has_taken) rule.copy_dependency_files(from);
  for (la_text LA_RULE::*text : TEXTS) {
    if (rule.*text != nullptr || from.*text == nullptr) continue;
    rule.*text = from.*text;
    has_taken = true;
  }
  for (const la_program* program : PROGRAMS) {
    if (rule.*program->dir_flag == DIR_UNSET && from.*program->dir_flag != DIR_UNSET) {
      rule.set_dir(*program, (from.*program->dir).get(), from.*program->dir_flag);
      rule.*program->dir_text = from.*program->dir_text;
      has_taken = true;
    }
    if (complete_statuses(rule, from, *program)) has_taken = true;
  }
  return has_taken;
}

void clear_none(LA_RULE& rule) {
  for (la_text LA_RULE::*text : TEXTS) {
    if (text == NEVER_CLEARED || rule.*text == nullptr) continue;
    if (UT_STR::ICompare(rule.*text, "NONE") == 0) rule.*text = nullptr;
  }
}

}  // namespace

void inherit_from_later_rules(const DARRAY_LA_RULE_PTR& rules) {
  // From the last rule to the first, the nearest later rule is complete already: what it lacks, no
  // rule after it has, or its "NONE" keeps it out.
  std::unordered_map<std::string, LA_RULE*> nearest;
  for (int i = rules.count - 1; i >= 0; --i) {
    LA_RULE& rule = *rules.elements[i];
    const char* from = rule.netlist_file->get_ext();
    const char* to = rule.target->get_ext();
    // A missing extension matches none.
    if (from != nullptr && to != nullptr) {
      const auto [later, is_last] = nearest.try_emplace(la_conversion(from, to), &rule);
      if (!is_last && complete(rule, *later->second)) later->second->is_inherited_from = true;
      later->second = &rule;
    }
    clear_none(rule);
  }
}
