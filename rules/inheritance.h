// What rules take from later ones.
#ifndef KESTREL_RULES_INHERITANCE_H
#define KESTREL_RULES_INHERITANCE_H

#include "rules/rule.h"

/// Completes every rule from the later ones for the same pair of extensions: each field that it
/// leaves open comes from the nearest of them that has it; status entries of a level that it
/// lacks, from the nearest that has the level, which gives its first. Options and checkers of
/// "NONE" are then cleared. Takes time in proportion to the number of rules.
void inherit_from_later_rules(const DARRAY_LA_RULE_PTR& rules);

#endif
