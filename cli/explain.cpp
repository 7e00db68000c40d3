#include "cli/explain.h"

#include <algorithm>
#include <array>
#include <ctime>
#include <unordered_set>
#include <vector>

#include "launcher/baslauncher.h"
#include "rules/baslarules.h"

namespace {

std::string name_of(const std::string& path) {
  return path.substr(path.rfind('/') + 1);
}

std::string indented(std::string text, std::size_t width) {
  text.resize(std::max(width, text.size() + 2), ' ');
  return text;
}

/// A time stamp, in the time zone of the user.
std::string shown(const Port::FileStatus& file) {
  constexpr __int64 SECOND = 1'000'000'000;
  // Rounded down, also before 1970.
  const time_t seconds = (file.time < 0 ? file.time - SECOND + 1 : file.time) / SECOND;
  std::tm local = {};
  ::localtime_r(&seconds, &local);
  std::array<char, 80> text;
  std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S", &local);
  std::string fraction = std::to_string((file.time - seconds * SECOND) / 1'000'000);
  return std::string(text.data()) + "." + fraction.insert(0, 3 - fraction.size(), '0');
}

std::string difference(const Port::FileStatus& newer, const Port::FileStatus& older) {
  return duration(static_cast<unsigned long long>(newer.time) -
                  static_cast<unsigned long long>(older.time));
}

/// Where it was looked for what: the places by number, then a line for each file.
std::string sightings(const std::vector<LA_EXPLANATION::PROBE>& probes) {
  std::vector<std::string> places;
  struct file {
    std::string name;
    std::string seen;
  };
  std::vector<file> files;
  for (const LA_EXPLANATION::PROBE& probe : probes) {
    const std::string name = name_of(probe.path);
    const std::string place = probe.path.substr(0, probe.path.size() - name.size());
    auto at = std::find(places.begin(), places.end(), place);
    if (at == places.end()) at = places.insert(places.end(), place);
    const std::string number = std::to_string(at - places.begin() + 1);
    if (files.empty() || files.back().name != name) files.push_back({name, ""});
    std::string& seen = files.back().seen;
    if (probe.sighting == LA_EXPLANATION::FOUND) seen = "found in " + number;
    if (probe.sighting == LA_EXPLANATION::PASSED_OVER) seen += ", passed over in " + number;
  }
  std::string text = "\nLooked in, in this order:\n";
  for (std::size_t i = 0; i < places.size(); ++i) {
    const bool is_there = Port::File::isdirectory(places[i].c_str());
    text += "  " + std::to_string(i + 1) + "  " + places[i] + (is_there ? "" : "  (no directory)") +
            "\n";
  }
  text += "for:\n";
  for (const auto& [name, seen] : files) {
    text += "  " + indented(name, 26) + (seen.empty() ? "missing" : seen) + "\n";
  }
  return text;
}

std::string file_of(const LA_FILE& file) {
  const char* name = file.get_name();
  const char* ext = file.get_ext();
  return std::string(name != nullptr ? name : "") + "." + (ext != nullptr ? ext : "");
}

/// width: of the column of names.
std::string line_of(const LA_EXPLANATION::CONSIDERED& considered, std::size_t width) {
  constexpr std::array VERDICTS = {
      "taken",
      "not taken: what it needs is not there",
      "not taken: you named another file",
      "not taken: it is for netlists of another name",
      "leads into a loop",
      "not needed: a rule before it serves",
  };
  const LA_RULE& rule = *considered.rule;
  const std::string kinds = file_of(*rule.netlist_file) + " => " + file_of(*rule.target);
  return "  " + indented(rule.rule_name.get(), width) + indented(kinds, 16) +
         VERDICTS[considered.verdict] + "\n";
}

/// Why a step runs, or why not.
std::string reason(const LA_EXPLANATION::STEP& step) {
  const std::string output = name_of(step.output);
  const std::string input = name_of(step.input);
  switch (step.decision) {
    case LA_BUILD_UNSUPPORTED:
      return "the format of " + input + " is no longer supported";
    case LA_BUILD_UP_TO_DATE:
      if (step.input_status.time == step.output_status.time) {
        return output + " is up to date: it is as old as " + input;
      }
      return output + " is up to date: it is " + difference(step.output_status, step.input_status) +
             " newer than " + input;
    case LA_BUILD_SKIPPED:
      return output + " is there, and time stamps are ignored";
    case LA_BUILD_FORCED:
      return "--force runs every step";
    case LA_BUILD_MISSING:
      return output + " does not exist";
    case LA_BUILD_OUT_OF_DATE:
      if (!step.dependency.empty()) {
        return name_of(step.dependency) + ", on which it depends, is " +
               difference(step.dependency_status, step.output_status) + " newer than " + output;
      }
      return input + " is " + difference(step.input_status, step.output_status) + " newer than " +
             output;
    case LA_BUILD_AFTER_REBUILD:
      return input + " is made anew";
    default:
      return "the time stamp of " + input + " could not be determined";
  }
}

std::string lines_of(const LA_EXPLANATION::STEP& step, int number) {
  const bool runs = step.decision > LA_BUILD_UNDECIDED;
  std::string text = "  " + std::to_string(number) + "  " +
                     indented(step.rule->rule_name.get(), 11) + (runs ? "runs: " : "") +
                     reason(step) + "\n";
  struct line {
    const std::string& path;
    const Port::FileStatus& status;
  };
  for (const auto& [path, status] :
       {line{step.input, step.input_status}, line{step.dependency, step.dependency_status},
        line{step.output, step.output_status}}) {
    const bool known = status.exists && !path.empty();
    if (!path.empty()) text += "     " + indented(known ? shown(status) : "", 25) + path + "\n";
  }
  if (!step.command.empty()) text += "     $ " + step.command + "\n";
  return text;
}

std::string answer(const outcome& found, const LA_EXPLANATION& why) {
  for (const LA_EXPLANATION::CONSIDERED& considered : why.rules) {
    if (considered.verdict == LA_EXPLANATION::IN_A_LOOP) {
      return std::string("cannot be resolved: rule ") + considered.rule->rule_name.get() +
             " leads into a loop";
    }
  }
  if (!found.error.empty()) return found.error.substr(0, found.error.size() - 1);
  if (found.result == LA_NOT_FOUND)
    return "not found: no file of this name, and none to make it from";
  if (why.steps.empty())
    return found.netlist + ", as it stands: no rule has a source to make it from";
  const auto runs = [](const LA_EXPLANATION::STEP& step) { return !step.command.empty(); };
  const auto first = std::find_if(why.steps.begin(), why.steps.end(), runs);
  if (first == why.steps.end()) return found.netlist + ", nothing needs to run";
  const auto count = std::count_if(why.steps.begin(), why.steps.end(), runs);
  return found.netlist + ", after " + std::to_string(count) + " of " +
         std::to_string(why.steps.size()) + " steps, because " + reason(*first);
}

}  // namespace

std::string duration(unsigned long long nanoseconds) {
  struct unit {
    const char* name;
    unsigned long long length;
  };
  constexpr unit UNITS[] = {{" d", 86'400'000'000'000},
                            {" h", 3'600'000'000'000},
                            {" min", 60'000'000'000},
                            {" s", 1'000'000'000},
                            {" ms", 1'000'000},
                            {" µs", 1'000},
                            {" ns", 1}};
  std::string text;
  for (const unit& u : UNITS) {
    const unsigned long long number = nanoseconds / u.length;
    nanoseconds %= u.length;
    if (number == 0 && text.empty()) continue;
    if (!text.empty()) return number > 0 ? text + " " + std::to_string(number) + u.name : text;
    text = std::to_string(number) + u.name;
  }
  return text;
}

std::string explained(const outcome& found, const LA_EXPLANATION& why) {
  std::string text = found.name + ": " + answer(found, why) + "\n";
  if (!why.probes.empty()) text += sightings(why.probes);
  std::string rules;
  std::size_t width = 10;
  for (const LA_EXPLANATION::CONSIDERED& considered : why.rules) {
    width = std::max(width, UT_STR::Len(considered.rule->rule_name) + 2);
  }
  std::unordered_set<std::string> lines;
  for (const LA_EXPLANATION::CONSIDERED& considered : why.rules) {
    // One that was wanted more than once has one line.
    const auto [line, is_new] = lines.insert(line_of(considered, width));
    if (is_new) rules += *line;
  }
  if (!rules.empty()) text += "\nRules:\n" + rules;
  if (!why.steps.empty()) text += "\nSteps:\n";
  int number = 0;
  for (const LA_EXPLANATION::STEP& step : why.steps) text += lines_of(step, ++number);
  return text;
}
