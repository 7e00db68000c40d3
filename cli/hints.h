// Hints for those who write rules: what is allowed in a set of rules, and yet hardly meant.
#ifndef KESTREL_CLI_HINTS_H
#define KESTREL_CLI_HINTS_H

#include <string>
#include <vector>

#include "rules/baslarules.h"

/// The hints on a valid set, in its order, each with the rule that it is about. Takes time in
/// proportion to the number of rules; each program is looked for once.
std::vector<std::string> hints_on(const LA_RULE_SET& set);

#endif
