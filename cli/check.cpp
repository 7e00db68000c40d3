// Checking rules.
#include <optional>
#include <string>
#include <unordered_set>
#include <vector>

#include "cli/console.h"
#include "cli/hints.h"
#include "cli/results.h"
#include "cli/roots.h"
#include "cli/tasks.h"
#include "rules/baslarules.h"

int check(const settings& set) {
  std::vector<std::string> hints;
  std::unordered_set<std::string> given;
  std::optional<diversion> reading([&](const Port_Msg& message) {
    const std::string hint = hint_on(message.text);
    if (!hint.empty() && given.insert(hint).second) hints.push_back(hint);
    return false;
  });
  const LA_RULE_SET rules(set.part, set.user_rules);
  reading.reset();
  tell_if_empty(rules);
  if (rules.is_valid) hints = hints_on(rules);
  for (std::string& hint : hints) hint.insert(0, "hint: ");
  complain(hints);
  if (set.json) print_totals(rules.is_valid);
  if (!set.json && rules.is_valid) {
    console::print("Rules checked: " + std::to_string(rules.rules.count) + ", all good\n");
  }
  return rules.is_valid ? ALL_FOUND : FAILED;
}
