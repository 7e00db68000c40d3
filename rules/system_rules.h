// The system rules data files: their records, made into rules.
#ifndef KESTREL_RULES_SYSTEM_RULES_H
#define KESTREL_RULES_SYSTEM_RULES_H

#include <string>

#include "rules/rule.h"

/// Finds the system rules of a device's family, or for null the default ones, and reads and
/// validates them; issues what it finds. Adds the rules to batch, and gives the path of their file;
/// a family may be without one, and then has no rules. Returns whether there was no error; after
/// one, the batch is not to be used.
bool la_load_system_rules(const char* part_name, DARRAY_LA_RULE_PTR& batch, std::string& path);

#endif
