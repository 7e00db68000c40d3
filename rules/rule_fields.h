// The fields of a rule, as both kinds of rules file write them.
#ifndef KESTREL_RULES_RULE_FIELDS_H
#define KESTREL_RULES_RULE_FIELDS_H

#include <span>
#include <vector>

#include "rules/rule.h"

struct la_rule_field {
  /// Its name in a user rules file, and in messages.
  const char* keyword;
  /// Stores text in the rule. False when it is not a valid status value. Null for the dependency
  /// files, of which only records of system rules hold a list.
  bool (*store)(LA_RULE& rule, const char* text);
  /// The origin line of the system rules loader's finding on this field: it is required, or its
  /// status value is not valid.
  int line = 0;
  bool is_required = false;
  /// The keyword in the message on a status value of a user rules file, where it is another one.
  const char* name_in_message = keyword;
  /// The program whose exit-status entries end with this field.
  const la_program* completes = nullptr;
};

/// All fields, in the order of a record of system rules.
std::span<const la_rule_field> la_rule_fields();

/// The keywords of a user rules file.
std::vector<const char*> rule_keywords();

#endif
