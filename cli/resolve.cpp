// Resolving names.
#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "cli/console.h"
#include "cli/launching.h"
#include "cli/results.h"
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

/// Whether netlisters that say that they have done their work have written the file to read.
bool is_written(const resolution& found) {
  const char* netlist = found.netlist.c_str();
  const Port::FileStatus status = Port::File::status(netlist);
  if (!status.exists) {
    complain(PORT_MSG_ERROR, Port::File::isdirectory(netlist)
                                 ? found.netlist + " is a directory"
                                 : "no netlister has written " + found.netlist);
  } else if (status.time < Port::File::status(found.source.c_str()).time) {
    complain(PORT_MSG_WARNING,
             found.netlist + " is older than its source: the next call makes it again");
  }
  return status.exists;
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
  const int runs_before = launcher.runs;
  found.result = launcher.find(name.c_str(), source, netlist, top);
  reap_orphans();
  found.is_built = launcher.runs > runs_before;
  found.source = source;
  found.netlist = full_name(netlist);
  if (found.result == LA_FOUND && !launcher.saw_netlist() && !is_dry_run() && !is_written(found)) {
    found.result = LA_FAILED;
  }
  if (found.result == LA_FAILED) {
    found.source.clear();
    found.netlist.clear();
    found.is_built = false;
  }
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
  const signal_handling while_it_resolves;
  const auto goes_on = [] {
    return Port_Interrupt::Requested() == 0 && !console::has_lost_results();
  };
  for (std::size_t i = 0; launcher.ok && i < set.names.size() && goes_on(); ++i) {
    show_progress(i, set.names);
    const resolution found = resolved(launcher, set.names[i], set.top);
    print_result(set, found);
    if (found.result == LA_NOT_FOUND) complain("not found: " + found.name);
    counted.add(found);
    status = worse(status, found.result);
  }
  counted.tell(set.names.size(), is_dry_run());
  if (set.json) print_totals(launcher.ok);
  // While signals are still handled: whoever reads may have left.
  console::flush();
  return status;
}
