#include "rules/baslarules.h"

#include <exception>

#include "host/port_init.h"
#include "rules/inheritance.h"
#include "rules/message.h"
#include "rules/system_rules.h"
#include "rules/user_rules.h"

namespace {

const Port::FileInit file_init;
const Port::PathListInit path_list_init;
const CitP::InstanceTableInit instance_table_init;
const CitP::FactoryInit factory_init;
const Port_MsgManInit message_manager_init;

char revision[] = "$Revision: 1.12 $";

}  // namespace

Port_MsgManData& la_rules_message(int line) {
  return Port_MsgManData::createObject("Kestrel", "rules/baslarules.cpp", line, revision);
}

LA_RULE_SET::LA_RULE_SET(const char* part_name, const char* user_rules_file) {
  try {
    is_valid = load(part_name, user_rules_file);
  } catch (const std::exception& failure) {
    la_rules_message().issueError("Launcher: Could not load the rules: %s\n", failure.what());
  }
}

bool LA_RULE_SET::load(const char* part_name, const char* user_rules_file) {
  if (user_rules_file != nullptr && !load_user_rules(user_rules_file)) return false;
  if (!load_system_rules(part_name)) return false;
  if (part_name != nullptr && !load_system_rules(nullptr)) return false;
  return check_rules();
}

/// The rules that were read belong to the set, also after an error.
bool LA_RULE_SET::load_user_rules(const char* file_name) {
  la_user_rules loaded;
  const bool good = loaded.load(file_name);
  unfinished_statement = loaded.unfinished_statement;
  rules.take(loaded.for_named_files);
  rules.take(loaded.for_extensions);
  if (!loaded.path.empty()) files.push_back({loaded.path, rules.count});
  return good;
}

bool LA_RULE_SET::load_system_rules(const char* part_name) {
  DARRAY_LA_RULE_PTR batch(10);
  std::string path;
  if (!la_load_system_rules(part_name, batch, path)) return false;
  files.push_back({path, batch.count});
  rules.take(batch);
  return true;
}

bool LA_RULE_SET::check_rules() {
  inherit_from_later_rules(rules);
  bool good = true;
  for (const LA_RULE* rule : rules) {
    if (rule->netlister_status.count > 0) continue;
    la_rules_message().issueError(
        "Launcher: Rule: %s - There must be at least one of the following: "
        "NetlisterSuccessStatus, NetlisterWarningStatus, or NetlisterFatalStatus.\n",
        rule->rule_name.get());
    good = false;
  }
  return good;
}

void LA_RULE_SET::dump(bool detail) const {
  for (const LA_RULE* rule : rules) rule->dump(detail);
}
