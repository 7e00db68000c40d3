// The system rules data files: their records, made into rules.
#ifndef KESTREL_RULES_SYSTEM_RULES_H
#define KESTREL_RULES_SYSTEM_RULES_H

#include <string>

#include "rules/rule.h"

/// Reads and validates the system rules of a device's family, or for a null part_name the default
/// ones, and issues what it finds. Adds the rules to batch and sets path to their file; a family
/// without a file has no rules. Returns whether there was no error; after one, batch is of no use.
bool la_load_system_rules(const char* part_name, DARRAY_LA_RULE_PTR& batch, std::string& path);

#endif
