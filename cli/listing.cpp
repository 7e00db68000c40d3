// Tasks that print what there is: rules, parts, completions, help.
#include <string>

#include "cli/completion.h"
#include "cli/console.h"
#include "cli/graph.h"
#include "cli/loading.h"
#include "cli/place.h"
#include "cli/settings.h"
#include "cli/tasks.h"
#include "host/pm_pic.h"
#include "rules/baslarules.h"

namespace {

/// What the dump of a rule leaves out.
std::string rest_of(const LA_RULE& rule, const place_names& places, bool detail) {
  const std::string place = places.line(rule.origin);
  if (!detail) return "    from " + place + "\n";
  std::string files;
  if (rule.has_dependency_files()) {
    for (const LA_FILE* file : *rule.dependency_files) files.append(" ").append(file->get_file());
  }
  return "Dependency Files:" + files + "\nFrom: " + place + "\n";
}

}  // namespace

int list_rules(const settings& set) {
  const LA_RULE_SET rules(set.part, set.user_rules);
  tell_of_loading(&rules, set, PORT_MSG_WARNING);
  const diversion to_output([](const Port_Msg& message) {
    const bool is_listed = message.level == PORT_MSG_STATUS;
    if (is_listed) console::print(message.text);
    return is_listed;
  });
  if (!rules.is_valid) return FAILED;
  const place_names places;
  for (const LA_RULE* rule : rules.rules) {
    rule->dump(set.detail);
    console::print(rest_of(*rule, places, set.detail));
  }
  return ALL_FOUND;
}

int draw_graph(const settings& set) {
  const LA_RULE_SET rules(set.part, set.user_rules);
  tell_of_loading(&rules, set, PORT_MSG_WARNING);
  if (rules.is_valid) console::print(graph_of(rules));
  return rules.is_valid ? ALL_FOUND : FAILED;
}

int list_parts(const settings& /*set*/) {
  tell_of_device_tables();
  bool good = true;
  const diversion noting([&good](const Port_Msg& message) {
    good = good && message.level != PORT_MSG_ERROR;
    return false;
  });
  for (const std::string& part : PM_PIC::all_parts()) console::print(part + "\n");
  return good ? ALL_FOUND : FAILED;
}

int print_completion(const settings& set) {
  const std::string script = completion_for(set.shell);
  if (script.empty())
    complain(std::string("--completion: there is none for \"") + set.shell + "\"");
  console::print(script);
  return script.empty() ? FAILED : ALL_FOUND;
}

int print_help(const settings& /*set*/) {
  console::print(help_text());
  return ALL_FOUND;
}

int print_version(const settings& /*set*/) {
  console::print("kestrel-launch " KESTREL_VERSION "\n");
  return ALL_FOUND;
}
