// Checking rules.
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "cli/console.h"
#include "cli/finding_hints.h"
#include "cli/hints.h"
#include "cli/loading.h"
#include "cli/results.h"
#include "cli/tasks.h"
#include "rules/baslarules.h"

int check(const settings& set) {
  finding_hints on_findings;
  std::optional<diversion> reading([&](const Port_Msg& message) {
    on_findings.add(message.text);
    return false;
  });
  const LA_RULE_SET rules(set.part, set.user_rules);
  reading.reset();
  tell_of_loading(&rules, set, PORT_MSG_ERROR);
  std::vector<std::string> hints = on_findings.all();
  if (rules.is_valid) {
    for (std::string& hint : hints_on(rules)) hints.push_back(std::move(hint));
  }
  for (std::string& hint : hints) hint.insert(0, "hint: ");
  complain(hints);
  const bool has_rules = rules.is_valid && rules.rules.count > 0;
  const bool good = has_rules && (hints.empty() || !set.strict);
  if (set.json) print_totals(has_rules);
  if (!set.json && has_rules) {
    console::print("Rules checked: " + std::to_string(rules.rules.count) +
                   (good ? ", all good\n" : "\n"));
  }
  return good ? ALL_FOUND : FAILED;
}
