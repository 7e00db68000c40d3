// kestrel-launch: the launcher as a command.
//
//   settings   reads the command line; holds the table of options
//   console    shows messages, prints results and makes JSON
//   completion completes command lines in a shell
//   explain    tells why
//   graph      draws the rules
//   signals    ends the netlister when the command is to end
//   main       does what the command line asks for
#include <fcntl.h>
#include <signal.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <exception>
#include <optional>
#include <string>
#include <unordered_set>
#include <vector>

#include "cli/completion.h"
#include "cli/console.h"
#include "cli/explain.h"
#include "cli/graph.h"
#include "cli/hints.h"
#include "cli/settings.h"
#include "cli/signals.h"
#include "host/pm_pic.h"
#include "host/port_file.h"
#include "host/port_interrupt.h"
#include "launcher/baslauncher.h"
#include "rules/baslarules.h"

namespace {

enum exit_status { ALL_FOUND = 0, NOT_ALL_FOUND = 1, FAILED = 2 };

/// Appends the names in a file, one per line. Returns an empty text, or what is wrong.
std::string read_names(const std::string& file, std::vector<std::string>& names) {
  const int descriptor =
      file == "-" ? ::dup(STDIN_FILENO) : ::open(file.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) return "--names-from: could not read " + file;
  Port::Stream in(descriptor);
  char line[4096];
  for (int number = 1; !in.geteof(); ++number) {
    const auto length = static_cast<std::size_t>(in.readline(line, sizeof line));
    if (length >= sizeof line) return "--names-from: " + file + " holds a line that is too long";
    std::string name = line;
    if (name.size() != length) {
      return "--names-from: " + file + ", line " + std::to_string(number) + " holds a zero byte";
    }
    if (name.ends_with('\r')) name.pop_back();
    if (!name.empty()) names.push_back(std::move(name));
  }
  return in.failed() ? "--names-from: could not read " + file : "";
}

/// Whether the directories that the settings name can be used. Completes the names of those to
/// search, so that nobody needs to ask for the current directory again.
std::string check_directories(settings& set) {
  for (std::string& dir : set.search_dirs) {
    const char* full_name = LA_DIR(dir.c_str()).get_dir();
    if (full_name == nullptr) return "--search-dir: not the name of a directory: \"" + dir + "\"";
    dir = full_name;
  }
  if (set.output_dir != nullptr && !Port::File::isdirectory(set.output_dir)) {
    return std::string("--output-dir: there is no directory \"") + set.output_dir + "\"";
  }
  return {};
}

/// What is to be done before names can be resolved. Returns an empty text, or what is wrong.
std::string complete(settings& set) {
  std::string wrong = check_directories(set);
  for (const char* file : set.names_files) {
    if (wrong.empty()) wrong = read_names(file, set.names);
  }
  return wrong;
}

void print_totals(bool ok, int errors, int warnings) {
  console::print(std::string("{\"ok\":") + (ok ? "true" : "false") + ",\"errors\":" +
                 std::to_string(errors) + ",\"warnings\":" + std::to_string(warnings) + "}\n");
}

void print_result(const settings& set, const std::string& name, short result, const char* source,
                  const char* netlist) {
  if (set.json) {
    console::print("{\"name\":" + json_string(name) + ",\"result\":" + std::to_string(result) +
                   ",\"source\":" + json_string(source) + ",\"netlist\":" + json_string(netlist) +
                   "}\n");
  } else if (result == LA_FOUND) {
    console::print(netlist);
    console::print("\n");
  }
  // Whoever reads the results need not wait for the last of them.
  console::flush();
}

/// Whether the library starts no netlisters, so that what it names need not be there.
bool is_dry_run() {
  return std::getenv("LA_TEST") != nullptr;
}

LA_LAUNCHER launcher_of(settings& set) {
  std::vector<const char*> search_dirs;
  for (const std::string& dir : set.search_dirs) search_dirs.push_back(dir.c_str());
  return {set.part,
          search_dirs.data(),
          static_cast<short>(search_dirs.size()),
          set.libraries.data(),
          static_cast<short>(set.libraries.size()),
          set.output_dir,
          set.user_rules,
          set.force,
          set.ignore_timestamps,
          set.ignore_locs,
          set.add_pads,
          set.quiet,
          set.aul};
}

/// What the names came to.
struct tally {
  int built = 0;
  int up_to_date = 0;
  int not_found = 0;
  int failed = 0;

  void add(short result, bool is_built) {
    ++(result == LA_FAILED      ? failed
       : result == LA_NOT_FOUND ? not_found
       : is_built               ? built
                                : up_to_date);
  }
  /// Tells it, where there was more than one name.
  void tell(std::size_t names) const {
    const int tried = built + up_to_date + not_found + failed;
    if (names < 2) return;
    std::string text = std::to_string(names) + " names:";
    const struct {
      int number;
      const char* what;
    } counts[] = {{built, is_dry_run() ? "to be built" : "built"},
                  {up_to_date, "up to date"},
                  {not_found, "not found"},
                  {failed, "failed"},
                  {static_cast<int>(names) - tried, "not tried"}};
    for (const auto& [number, what] : counts) {
      if (number > 0)
        text.append(" ").append(std::to_string(number)).append(" ").append(what) += ',';
    }
    text.pop_back();
    complain(text);
  }
};

/// The exit status after one more name.
int worse(int status, short result) {
  return std::max(status, result == LA_FAILED      ? int{FAILED}
                          : result == LA_NOT_FOUND ? int{NOT_ALL_FOUND}
                                                   : int{ALL_FOUND});
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

int resolve(settings& set, const console& shown) {
  LA_LAUNCHER launcher = launcher_of(set);
  int status = launcher.ok ? ALL_FOUND : FAILED;
  tally counted;
  const signal_handling while_it_resolves;
  const auto goes_on = [] {
    return Port_Interrupt::Requested() == 0 && !console::has_lost_results();
  };
  for (std::size_t i = 0; launcher.ok && i < set.names.size() && goes_on(); ++i) {
    const std::string& name = set.names[i];
    if (shown.is_terminal() && set.names.size() > 1) {
      const std::string number = std::to_string(i + 1) + "/" + std::to_string(set.names.size());
      for (const std::string_view piece : {"[", number.c_str(), "] ", name.c_str(), "\n"}) {
        console::say(piece);
      }
      console::flush();
    }
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
  counted.tell(set.names.size());
  if (set.json) print_totals(launcher.ok, launcher.errors, launcher.warnings);
  // While signals are still handled: whoever reads may have left.
  console::flush();
  return status;
}

int explain(settings& set) {
  LA_LAUNCHER launcher = launcher_of(set);
  int status = launcher.ok ? ALL_FOUND : FAILED;
  std::string error;
  // The explanation says what the messages say, and the errors are its answers.
  const diversion diverted([&error](const Port_Msg& message) {
    if (message.level == PORT_MSG_ERROR) error += message.text;
    return message.level != PORT_MSG_WARNING;
  });
  for (std::size_t i = 0; launcher.ok && i < set.names.size(); ++i) {
    if (i > 0) console::print("\n");
    LA_EXPLANATION why;
    launcher.explain_to(&why);
    char source[LA_MAX_PATH];
    char netlist[LA_MAX_PATH];
    error.clear();
    const short result = launcher.find(set.names[i].c_str(), source, netlist, set.top);
    console::print(explained({set.names[i], result, netlist, error}, why));
    console::flush();
    status = worse(status, result);
  }
  return status;
}

/// Shows the findings on the rules, and says so when there are no rules at all: the data of the
/// installation is probably not found.
void show_findings(const LA_RULE_SET& set) {
  if (set.is_valid && set.rules.count == 0) {
    complain("there are no rules; do MYCORVANE and CORVANE name installation roots?");
  }
}

int check(const settings& set) {
  std::vector<std::string> hints;
  std::unordered_set<std::string> given;
  std::optional<diversion> reading([&](const Port_Msg& message) {
    const std::string hint = hint_on(message.text);
    if (!hint.empty() && given.insert(hint).second) hints.push_back(hint);
    return false;
  });
  const LA_RULE_SET rules(set.part, set.user_rules);
  reading.reset();
  show_findings(rules);
  if (rules.is_valid) hints = hints_on(rules);
  for (std::string& hint : hints) hint.insert(0, "hint: ");
  complain(hints);
  if (set.json) print_totals(rules.is_valid, 0, 0);
  if (!set.json && rules.is_valid) {
    console::print("Rules checked: " + std::to_string(rules.rules.count) + ", all good\n");
  }
  return rules.is_valid ? ALL_FOUND : FAILED;
}

int list_rules(const settings& set) {
  const LA_RULE_SET rules(set.part, set.user_rules);
  show_findings(rules);
  const diversion to_output([](const Port_Msg& message) {
    const bool is_listed = message.level == PORT_MSG_STATUS;
    if (is_listed) console::print(message.text);
    return is_listed;
  });
  if (rules.is_valid) rules.dump(set.detail);
  return rules.is_valid ? ALL_FOUND : FAILED;
}

int draw_graph(const settings& set) {
  const LA_RULE_SET rules(set.part, set.user_rules);
  show_findings(rules);
  if (rules.is_valid) console::print(graph_of(rules));
  return rules.is_valid ? ALL_FOUND : FAILED;
}

int list_parts() {
  bool good = true;
  const diversion noting([&good](const Port_Msg& message) {
    good = good && message.level != PORT_MSG_ERROR;
    return false;
  });
  for (const std::string& part : PM_PIC::all_parts()) console::print(part + "\n");
  return good ? ALL_FOUND : FAILED;
}

int print_completion(const std::string& shell) {
  const std::string script = completion_for(shell);
  if (script.empty()) complain("--completion: there is none for \"" + shell + "\"");
  console::print(script);
  return script.empty() ? FAILED : ALL_FOUND;
}

int run(settings& set) {
  // The library's switches.
  if (set.dry_run || set.what == task::EXPLAIN) ::setenv("LA_TEST", "1", 1);
  if (set.detail) ::setenv("LAUNCHER_DETAIL", "1", 1);
  const console shown(set.debug);
  switch (set.what) {
    case task::HELP:
      console::print(help_text());
      return ALL_FOUND;
    case task::VERSION:
      console::print("kestrel-launch " KESTREL_VERSION "\n");
      return ALL_FOUND;
    case task::RESOLVE:
      return resolve(set, shown);
    case task::EXPLAIN:
      return explain(set);
    case task::CHECK:
      return check(set);
    case task::LIST_PARTS:
      return list_parts();
    case task::COMPLETION:
      return print_completion(set.shell);
    case task::LIST_RULES:
      return list_rules(set);
    default:
      return draw_graph(set);
  }
}

int run_command_line(int count, const char* const* words) {
  settings set;
  std::string wrong = read_command_line(count, words, set);
  const bool resolves = set.what == task::RESOLVE || set.what == task::EXPLAIN;
  if (wrong.empty() && resolves) wrong = complete(set);
  if (!wrong.empty()) {
    complain(wrong);
    console::say("Try 'kestrel-launch --help'.\n");
    console::flush();
    return FAILED;
  }
  const int status = run(set);
  if (console::has_lost_results()) {
    complain("could not write to standard output");
    return FAILED;
  }
  return status;
}

}  // namespace

int main(int count, char** words) {
  try {
    const int status = run_command_line(count - 1, words + 1);
    // Who interrupts the command shall see that it has ended so.
    if (const int signal = Port_Interrupt::Requested()) ::raise(signal);
    return status;
  } catch (const std::exception& failure) {
    complain(failure.what());
    return FAILED;
  }
}
