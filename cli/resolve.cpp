// Resolving names.
#include <algorithm>
#include <cstdlib>
#include <string>
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
bool is_written(const char* source, const char* netlist) {
  const Port::FileStatus status = Port::File::status(netlist);
  if (!status.exists) {
    const bool is_directory = Port::File::isdirectory(netlist);
    complain(is_directory ? std::string(netlist) + " is a directory"
                          : std::string("no netlister has written ") + netlist);
  } else if (status.time < Port::File::status(source).time) {
    complain(std::string(netlist) + " is older than its source: the next call makes it again");
  }
  return status.exists;
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
    const std::string& name = set.names[i];
    show_progress(i, set.names);
    char source[LA_MAX_PATH];
    char netlist[LA_MAX_PATH];
    const int runs_before = launcher.runs;
    short result = launcher.find(name.c_str(), source, netlist, set.top);
    const bool is_built = launcher.runs > runs_before;
    if (result == LA_FOUND && !launcher.saw_netlist() && !is_dry_run() &&
        !is_written(source, netlist)) {
      result = LA_FAILED;
      source[0] = '\0';
      netlist[0] = '\0';
    }
    print_result(set, name, result, source, netlist);
    if (result == LA_NOT_FOUND) complain("not found: " + name);
    counted.add(result, is_built);
    status = worse(status, result);
  }
  counted.tell(set.names.size(), is_dry_run());
  if (set.json) print_totals(launcher.ok, launcher.errors, launcher.warnings);
  // While signals are still handled: whoever reads may have left.
  console::flush();
  return status;
}
