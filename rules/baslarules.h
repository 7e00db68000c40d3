// The set of rules that a launcher works with.
#ifndef KESTREL_RULES_BASLARULES_H
#define KESTREL_RULES_BASLARULES_H

#include <string>
#include <vector>

#include "rules/rule.h"

/// A file that rules come from.
struct LA_RULES_FILE {
  std::string path;
  int num_rules;
};

/// The rules of a launcher, in the order of precedence: those of the user rules file (rules for
/// named files first), those of the device's family, the default ones. It owns them.
class LA_RULE_SET {
 public:
  /// Loads, completes and checks the rules. part_name and user_rules_file may be null. Findings
  /// are issued as messages; the outcome is is_valid.
  LA_RULE_SET(const char* part_name, const char* user_rules_file);
  LA_RULE_SET(const LA_RULE_SET&) = delete;
  LA_RULE_SET& operator=(const LA_RULE_SET&) = delete;

  /// Dumps every rule, in order.
  void dump(bool detail) const;

  /// 1 when every load step and the check succeeded. When it is 0 the rules may be incomplete.
  unsigned char is_valid = 0;
  DARRAY_LA_RULE_PTR rules{11};
  /// Where the rules come from, in their order.
  std::vector<LA_RULES_FILE> files;
  /// After "Unexpected end of file", the start of the statement that is cut off; else line 0.
  LA_ORIGIN unfinished_statement;

 private:
  bool load(const char* part_name, const char* user_rules_file);
  bool load_user_rules(const char* file_name);
  bool load_system_rules(const char* part_name);
  bool check_rules();
};

#endif
