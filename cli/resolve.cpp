// Resolving names.
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "cli/conflicts.h"
#include "cli/console.h"
#include "cli/launching.h"
#include "cli/loading.h"
#include "cli/not_found.h"
#include "cli/results.h"
#include "cli/runs.h"
#include "cli/signals.h"
#include "cli/tasks.h"
#include "host/port_file.h"
#include "host/port_interrupt.h"
#include "launcher/baslauncher.h"

namespace {

/// Whether the library starts no netlisters, so that what it names need not be there.
bool is_dry_run() {
  return std::getenv("LA_TEST") != nullptr;
}

/// Says so when the file to read, which is there, is older than its source.
void tell_if_older(const resolution& found) {
  const __int64 time = Port::File::status(found.netlist.c_str()).time;
  if (time >= Port::File::status(found.source.c_str()).time) return;
  complain(PORT_MSG_WARNING,
           found.netlist + " is older than its source: the next call makes it again");
}

/// What the clock says, in nanoseconds since 1970.
__int64 now() {
  const auto time = std::chrono::system_clock::now().time_since_epoch();
  return std::chrono::duration_cast<std::chrono::nanoseconds>(time).count();
}

/// A name as it is seen from everywhere. Without rules, the library leaves relative ones as they
/// are.
std::string full_name(const char* path) {
  if (*path == '/' || *path == '\0') return path;
  std::error_code failure;
  const std::filesystem::path full = std::filesystem::absolute(path, failure);
  return failure ? path : full.string();
}

/// Resolves one name.
resolution resolved(LA_LAUNCHER& launcher, const std::string& name, bool top) {
  resolution found = {name, LA_FAILED, "", "", false, 0, ""};
  const diversion watching([&found](const Port_Msg& message) {
    if (message.level == PORT_MSG_WARNING) ++found.warnings;
    if (message.level == PORT_MSG_ERROR && found.error.empty()) {
      found.error = message.text;
      if (found.error.ends_with('\n')) found.error.pop_back();
    }
    return false;
  });
  char source[LA_MAX_PATH];
  char netlist[LA_MAX_PATH];
  const __int64 start = now();
  found.result = launcher.find(name.c_str(), source, netlist, top);
  if (!launcher.last_runs().empty()) reap_orphans();
  const bool is_all_written = tell_of_runs(name, launcher.last_runs(), start);
  if (found.result != LA_FOUND || !is_all_written) {
    if (found.result == LA_FOUND) found.result = LA_FAILED;
    return found;
  }
  found.is_built = !launcher.last_runs().empty();
  found.source = source;
  found.netlist = full_name(netlist);
  if (!launcher.saw_netlist() && !is_dry_run()) tell_if_older(found);
  return found;
}

/// Shows a person which of many names is resolved.
void show_progress(std::size_t i, const std::vector<std::string>& names) {
  if (!console::is_terminal() || names.size() < 2) return;
  std::string number = std::to_string(i + 1) + "/" + std::to_string(names.size());
  console::say(number.insert(0, 1, '[') + "] " + names[i] + "\n");
  console::flush();
}

}  // namespace

int resolve(const settings& set) {
  LA_LAUNCHER launcher = launcher_of(set);
  int status = launcher.ok ? ALL_FOUND : FAILED;
  tally counted;
  not_found missing(launcher.rule_set(), set.search_dirs);
  conflicts between_names(launcher, set.names);
  const signal_handling while_it_resolves;
  const auto goes_on = [] {
    return Port_Interrupt::Requested() == 0 && !console::has_lost_results();
  };
  for (std::size_t i = 0; launcher.ok && i < set.names.size() && goes_on(); ++i) {
    show_progress(i, set.names);
    between_names.begin(set.names[i]);
    const resolution found = resolved(launcher, set.names[i], set.top);
    between_names.end(found.result == LA_FOUND);
    print_result(set, found);
    if (found.result == LA_NOT_FOUND) missing.tell(found.name);
    counted.add(found);
    status = worse(status, found.result);
  }
  if (status != ALL_FOUND) tell_of_loading(launcher.rule_set(), set, PORT_MSG_WARNING);
  counted.tell(set.names.size(), is_dry_run());
  if (set.json) print_totals(launcher.ok);
  // While signals are still handled: whoever reads may have left.
  console::flush();
  return status;
}
