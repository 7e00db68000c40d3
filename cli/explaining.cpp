// Explaining what would be done for names.
#include <string>

#include "cli/conflicts.h"
#include "cli/console.h"
#include "cli/explain.h"
#include "cli/launching.h"
#include "cli/loading.h"
#include "cli/tasks.h"
#include "launcher/baslauncher.h"

int explain(const settings& set) {
  LA_LAUNCHER launcher = launcher_of(set);
  tell_of_loading(launcher.rule_set(), set, PORT_MSG_WARNING);
  conflicts between_names(launcher, set.names);
  int status = launcher.ok ? ALL_FOUND : FAILED;
  std::string error;
  // The explanation says what the messages say, and the errors are its answers.
  const diversion diverted([&error](const Port_Msg& message) {
    if (message.level == PORT_MSG_ERROR) error += message.text;
    return message.level != PORT_MSG_WARNING && message.level != PORT_MSG_DEBUG;
  });
  for (std::size_t i = 0; launcher.ok && i < set.names.size(); ++i) {
    if (i > 0) console::print("\n");
    LA_EXPLANATION why;
    launcher.explain_to(&why);
    char source[LA_MAX_PATH];
    char netlist[LA_MAX_PATH];
    error.clear();
    between_names.begin(set.names[i]);
    const short result = launcher.find(set.names[i].c_str(), source, netlist, set.top);
    between_names.end(result == LA_FOUND);
    console::print(explained({set.names[i], result, netlist, error}, why));
    console::flush();
    status = worse(status, result);
  }
  return status;
}
