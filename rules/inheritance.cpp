#include "rules/inheritance.h"

#include <algorithm>

#include "host/hash_index.h"

namespace {

constexpr la_text LA_RULE::*TEXTS[] = {&LA_RULE::netlister, &LA_RULE::netlister_top_options,
                                       &LA_RULE::netlister_options, &LA_RULE::checker,
                                       &LA_RULE::checker_options};
/// The texts that "NONE" clears: all but the netlister.
constexpr la_text LA_RULE::*CLEARED_TEXTS[] = {&LA_RULE::netlister_top_options,
                                               &LA_RULE::netlister_options, &LA_RULE::checker,
                                               &LA_RULE::checker_options};

/// Adds, of each level that the rule's list lacks, the first entry of the other list.
/// Returns whether there was one.
template <DARRAY_LA_STATUS_PTR LA_RULE::*list, void (LA_RULE::*add)(const LA_STATUS&)>
bool complete_statuses(LA_RULE& rule, const LA_RULE& from) {
  const int count = (rule.*list).count;
  for (const LA_STATUS* entry : from.*list) {
    const auto has_level = [entry](const LA_STATUS* own) { return own->level == entry->level; };
    if (std::none_of((rule.*list).begin(), (rule.*list).end(), has_level)) (rule.*add)(*entry);
  }
  return (rule.*list).count > count;
}

/// Fills what the rule leaves open from another. Returns whether that had anything to give.
bool complete(LA_RULE& rule, const LA_RULE& from) {
  bool has_taken = false;
  if (!rule.has_dependency_files() && from.has_dependency_files()) {
    rule.copy_dependency_files(from);
    has_taken = true;
  }
  for (la_text LA_RULE::*text : TEXTS) {
    if (rule.*text != nullptr || from.*text == nullptr) continue;
    rule.*text = from.*text;
    has_taken = true;
  }
  if (rule.netlister_dir_flag == DIR_UNSET && from.netlister_dir_flag != DIR_UNSET) {
    rule.set_netlister_dir(from.netlister_dir.get(), from.netlister_dir_flag);
    has_taken = true;
  }
  if (rule.checker_dir_flag == DIR_UNSET && from.checker_dir_flag != DIR_UNSET) {
    rule.set_checker_dir(from.checker_dir.get(), from.checker_dir_flag);
    has_taken = true;
  }
  has_taken |=
      complete_statuses<&LA_RULE::netlister_status, &LA_RULE::add_netlister_status>(rule, from);
  has_taken |=
      complete_statuses<&LA_RULE::checker_status, &LA_RULE::add_checker_status>(rule, from);
  return has_taken;
}

void clear_none(LA_RULE& rule) {
  for (la_text LA_RULE::*text : CLEARED_TEXTS) {
    if (rule.*text != nullptr && UT_STR::ICompare(rule.*text, "NONE") == 0) rule.*text = la_text();
  }
}

}  // namespace

void inherit_from_later_rules(const DARRAY_LA_RULE_PTR& rules) {
  // From the last rule to the first: the next one for the same extensions is complete by then. What
  // it lacks has no later one either, or it is kept out.
  la_hash_index next(rules.count);
  for (int i = rules.count - 1; i >= 0; --i) {
    LA_RULE& rule = *rules.elements[i];
    const char* from = rule.netlist_file->get_ext();
    const char* to = rule.target->get_ext();
    // A missing extension matches none.
    if (from != nullptr && to != nullptr) {
      int& later = next.place(la_hash(to, la_hash(from)), [&](int other) {
        return rules.elements[other]->netlist_file->match_ext(from) &&
               rules.elements[other]->target->match_ext(to);
      });
      if (later != la_hash_index::NONE && complete(rule, *rules.elements[later])) {
        rules.elements[later]->is_inherited_from = true;
      }
      later = i;
    }
    clear_none(rule);
  }
}
