// The checks on the rules of one file.
#ifndef KESTREL_RULES_VALIDATION_H
#define KESTREL_RULES_VALIDATION_H

#include "rules/rule.h"

/// Checks the rules of one batch on their own and against each other, and issues what it finds.
/// Returns whether there was no error. Changes nothing. Takes time in proportion to the number of
/// rules.
bool validate_rules(const DARRAY_LA_RULE_PTR& batch);

#endif
