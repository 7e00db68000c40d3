#include "launcher/planner.h"

#include <algorithm>

#include "host/port_interrupt.h"
#include "rules/baslarules.h"

namespace {

/// One plan in the making.
///
/// Failed inputs are memoised. This is safe because the attempt has gone through every rule from
/// which the input's extension can be reached, and has met none of the rules on its path, or it
/// would have ended in a loop. So none of those rules leads to it, wherever it is wanted next, and
/// it fails again. Only another spelling of the extension is another file.
class planner {
 public:
  planner(const la_rule_index& rules, const char* name, const la_find_input& find_input,
          std::vector<LA_EXPLANATION::CONSIDERED>* considered, la_plan& result)
      : rules_(rules),
        name_(name),
        find_input_(find_input),
        considered_(considered),
        result_(result),
        visited_(static_cast<std::size_t>(rules.count())),
        failed_(rules.num_spellings()) {
    path_.reserve(8);  // Few chains are longer.
  }

  void plan(const char* wanted) {
    path_.push_back(rules_.first_producer(wanted));
    do {
      if (Port_Interrupt::Requested() != 0) {
        result_.outcome = la_plan::INTERRUPTED;
      } else if (path_.back() != la_rule_index::NONE) {
        descend();
      } else if (path_.size() == 1) {
        break;
      } else {
        climb();
      }
    } while (result_.outcome == la_plan::NOTHING);
  }

 private:
  /// Tries the last rule of the path: goes on with the rules that produce its input.
  void descend() {
    const int tried = path_.back();
    if (la_at(visited_, tried)) {
      result_.outcome = la_plan::LOOP;
      result_.loop = path_;
      for (std::size_t i = 0; i + 1 < path_.size(); ++i) note(path_[i], LA_EXPLANATION::IN_A_LOOP);
      return;
    }
    const char* only_name = rules_[tried].netlist_file->get_name();
    if (only_name != nullptr && UT_STR::ICompare(only_name, name_) != 0) {
      note(tried, LA_EXPLANATION::FOR_ANOTHER_NAME);
      try_next();
    } else if (failed_[rules_.spelling(tried)]) {
      note(tried, LA_EXPLANATION::NO_SOURCE);
      try_next();
    } else {
      la_at(visited_, tried) = true;
      path_.push_back(rules_.first_producer_for(tried));
    }
  }

  /// No rule produces the input of the rule one level up: perhaps it is there.
  void climb() {
    path_.pop_back();
    const int needing = path_.back();
    if (find_input_(rules_[needing].netlist_file->get_ext(), result_.source)) {
      result_.outcome = la_plan::CHAIN;
      std::for_each(path_.rbegin(), path_.rend(),
                    [&](int used) { result_.chain.append(&rules_[used]); });
      for (const int used : path_) note_taken(used);
      return;
    }
    la_at(visited_, needing) = false;
    note(needing, LA_EXPLANATION::NO_SOURCE);
    failed_[rules_.spelling(needing)] = true;
    try_next();
  }

  void try_next() { path_.back() = rules_.next_producer(path_.back()); }

  void note(int rule, LA_EXPLANATION::VERDICT verdict) const {
    if (considered_ != nullptr) considered_->push_back({&rules_[rule], verdict});
  }

  /// A rule of the chain makes those behind it superfluous.
  void note_taken(int rule) const {
    if (considered_ == nullptr) return;
    note(rule, LA_EXPLANATION::TAKEN);
    while ((rule = rules_.next_producer(rule)) != la_rule_index::NONE) {
      note(rule, LA_EXPLANATION::NOT_NEEDED);
    }
  }

  const la_rule_index& rules_;
  const char* const name_;
  const la_find_input& find_input_;
  std::vector<LA_EXPLANATION::CONSIDERED>* const considered_;
  la_plan& result_;
  /// The rule that is being tried on each level; NONE after the last that produces what is needed.
  std::vector<int> path_;
  std::vector<char> visited_;  ///< by rule: whether it lies on the path
  std::vector<char>
      failed_;  ///< by spelling of an extension: whether it can be neither made nor found
};

}  // namespace

void plan_chain(const la_rule_index& rules, const char* name, const char* wanted,
                const la_find_input& find_input,
                std::vector<LA_EXPLANATION::CONSIDERED>* considered, la_plan& plan) {
  planner(rules, name, find_input, considered, plan).plan(wanted);
}
