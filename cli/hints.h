// Hints for those who write rules.
#ifndef KESTREL_CLI_HINTS_H
#define KESTREL_CLI_HINTS_H

#include <string>
#include <vector>

#include "rules/baslarules.h"

/// What is allowed and yet hardly meant in a valid set of rules, in its order.
std::vector<std::string> hints_on(const LA_RULE_SET& set);

/// A hint on an error message, or an empty text: the nearest keyword for one that is unknown.
std::string hint_on(const std::string& error);

#endif
