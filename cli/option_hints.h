// Hints on the options that a rule gives its netlister.
#ifndef KESTREL_CLI_OPTION_HINTS_H
#define KESTREL_CLI_OPTION_HINTS_H

#include <string>
#include <vector>

#include "rules/baslarules.h"

/// The hints on both templates of a rule that has a netlister.
std::vector<std::string> hints_on_options(const LA_RULE& rule);

/// Whether a field of a record looks like a part of its options that a comma has cut off.
bool is_rest_of_options(const LA_RULE& rule, const std::string& field);

#endif
