#include "rules/inheritance.h"

#include <algorithm>
#include <tuple>
#include <unordered_map>
#include <vector>

namespace {

constexpr la_text LA_RULE::*TEXTS[] = {&LA_RULE::netlister, &LA_RULE::netlister_top_options,
                                       &LA_RULE::netlister_options, &LA_RULE::checker,
                                       &LA_RULE::checker_options};
/// The texts that "NONE" clears: all but the netlister.
constexpr la_text LA_RULE::*CLEARED_TEXTS[] = {&LA_RULE::netlister_top_options,
                                               &LA_RULE::netlister_options, &LA_RULE::checker,
                                               &LA_RULE::checker_options};

/// The entry of one level that rules without that level take.
struct status_donor {
  int rule;
  int place;
  LA_STATUS entry;
};

/// The donors of one list of status entries, one for each level.
class status_donors {
 public:
  /// Gives the list what it lacks; what it has of its own, the rules before it take.
  void serve(DARRAY_LA_STATUS_PTR& list, int rule) {
    std::vector<status_donor> own;
    for (int i = 0; i < list.count; ++i) {
      if (!has_level(own, *list.elements[i])) own.push_back({rule, i, *list.elements[i]});
    }
    // As if the later rules were visited one after the other, each from its first entry on.
    std::sort(donors_.begin(), donors_.end(), [](const status_donor& a, const status_donor& b) {
      return std::tie(a.rule, a.place) < std::tie(b.rule, b.place);
    });
    for (const status_donor& donor : donors_) {
      if (has_level(own, donor.entry)) continue;
      list.append(new LA_STATUS(donor.entry));
      own.push_back(donor);
    }
    donors_ = std::move(own);
  }

 private:
  static bool has_level(const std::vector<status_donor>& donors, const LA_STATUS& entry) {
    return std::any_of(donors.begin(), donors.end(), [&entry](const status_donor& donor) {
      return donor.entry.level == entry.level;
    });
  }

  std::vector<status_donor> donors_;
};

/// For one pair of extensions: for each field, the nearest of the rules visited that has it.
struct donors {
  const LA_RULE* dependency_files = nullptr;
  const LA_RULE* texts[std::size(TEXTS)] = {};
  const LA_RULE* netlister_dir = nullptr;
  const LA_RULE* checker_dir = nullptr;
  status_donors netlister_status;
  status_donors checker_status;
};

/// Rules are visited from the last to the first. One that has a field becomes its donor; one that
/// lacks it takes it from the donor. So each takes from the nearest later rule that had the field
/// from its loader: where a donor's own "NONE" is already cleared, the taker's would be as well.
void serve(LA_RULE& rule, int index, donors& from) {
  if (rule.has_dependency_files()) {
    from.dependency_files = &rule;
  } else if (from.dependency_files != nullptr) {
    rule.copy_dependency_files(*from.dependency_files);
  }

  for (std::size_t i = 0; i < std::size(TEXTS); ++i) {
    la_text& text = rule.*TEXTS[i];
    if (text != nullptr) {
      from.texts[i] = &rule;
    } else if (from.texts[i] != nullptr) {
      text = from.texts[i]->*TEXTS[i];
    }
  }

  if (rule.netlister_dir_flag != DIR_UNSET) {
    from.netlister_dir = &rule;
  } else if (from.netlister_dir != nullptr) {
    rule.set_netlister_dir(from.netlister_dir->netlister_dir.get(),
                           from.netlister_dir->netlister_dir_flag);
  }
  if (rule.checker_dir_flag != DIR_UNSET) {
    from.checker_dir = &rule;
  } else if (from.checker_dir != nullptr) {
    rule.set_checker_dir(from.checker_dir->checker_dir.get(), from.checker_dir->checker_dir_flag);
  }

  from.netlister_status.serve(rule.netlister_status, index);
  from.checker_status.serve(rule.checker_status, index);
}

void clear_none(LA_RULE& rule) {
  for (la_text LA_RULE::*text : CLEARED_TEXTS) {
    if (rule.*text != nullptr && UT_STR::ICompare(rule.*text, "NONE") == 0) rule.*text = la_text();
  }
}

}  // namespace

std::string key_of(const char* first, const char* second) {
  std::string key(first != nullptr ? first : "");
  key += '/';
  key += second != nullptr ? second : "";
  UT_STR::Lower(key.data());
  return key;
}

void inherit_from_later_rules(const DARRAY_LA_RULE_PTR& rules) {
  std::unordered_map<std::string, donors> by_extensions;
  for (int i = rules.count - 1; i >= 0; --i) {
    LA_RULE& rule = *rules.elements[i];
    const char* from = rule.netlist_file->get_ext();
    const char* to = rule.target->get_ext();
    // A missing extension matches none.
    if (from != nullptr && to != nullptr) serve(rule, i, by_extensions[key_of(from, to)]);
    clear_none(rule);
  }
}
