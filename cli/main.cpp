// kestrel-launch: the launcher as a command. Reads the command line and does the task that it
// names.
#include <signal.h>

#include <algorithm>
#include <cstdlib>
#include <exception>
#include <iterator>
#include <string>

#include "cli/console.h"
#include "cli/launching.h"
#include "cli/names.h"
#include "cli/settings.h"
#include "cli/tasks.h"
#include "host/port_interrupt.h"

namespace {

struct action {
  task what;
  int (*act)(const settings& set);
};
constexpr action ACTIONS[] = {
    {task::RESOLVE, resolve},
    {task::EXPLAIN, explain},
    {task::CHECK, check},
    {task::LIST_RULES, list_rules},
    {task::LIST_PARTS, list_parts},
    {task::GRAPH, draw_graph},
    {task::COMPLETION, print_completion},
    {task::HELP, print_help},
    {task::VERSION, print_version},
};

int act(const settings& set) {
  // The library's switches.
  if (set.dry_run || set.what == task::EXPLAIN) ::setenv("LA_TEST", "1", 1);
  if (set.detail) ::setenv("LAUNCHER_DETAIL", "1", 1);
  const console shown(set.debug);
  return std::find_if(std::begin(ACTIONS), std::end(ACTIONS),
                      [&](const action& a) { return a.what == set.what; })
      ->act(set);
}

/// What is to be done before names can be resolved. Returns an empty text, or what is wrong.
std::string prepare(settings& set) {
  std::string wrong = complete_directories(set);
  for (const char* file : set.names_files) {
    if (wrong.empty()) wrong = read_names(file, set.names);
  }
  return wrong;
}

int run(int count, const char* const* words) {
  settings set;
  std::string wrong = read_command_line(count, words, set);
  if (wrong.empty() && takes_names(set.what)) wrong = prepare(set);
  if (!wrong.empty()) {
    complain(wrong);
    console::say("Try 'kestrel-launch --help'.\n");
    console::flush();
    return FAILED;
  }
  const int status = act(set);
  if (console::has_lost_results()) {
    complain("could not write to standard output");
    return FAILED;
  }
  return status;
}

}  // namespace

int main(int count, char** words) {
  try {
    const int status = run(count - 1, words + 1);
    // Whoever interrupts the command is to see that it has ended so.
    if (const int signal = Port_Interrupt::Requested()) ::raise(signal);
    return status;
  } catch (const std::exception& failure) {
    complain(failure.what());
    return FAILED;
  }
}
