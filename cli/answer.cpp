#include "cli/answer.h"

#include <algorithm>
#include <sstream>

#include "cli/times.h"
#include "launcher/baslauncher.h"
#include "rules/baslarules.h"

namespace {

/// What the files of a step are called.
struct file_names {
  std::string input;
  std::string output;
  std::string dependency;
};

std::string reason(const LA_EXPLANATION::STEP& step, const file_names& of) {
  const bool is_equal = step.input_status.time == step.output_status.time;
  switch (step.decision) {
    case LA_BUILD_UNSUPPORTED:
      return "the format of " + of.input + " is no longer supported";
    case LA_BUILD_UP_TO_DATE:
      return of.output + " is up to date: it is " +
             (is_equal ? "as old as "
                       : lead_of(step.output_status, step.input_status) + " newer than ") +
             of.input;
    case LA_BUILD_SKIPPED:
      return of.output + " is there, and time stamps are ignored";
    case LA_BUILD_FORCED:
      return "--force runs every step";
    case LA_BUILD_MISSING:
      return of.output + " does not exist";
    case LA_BUILD_OUT_OF_DATE:
      if (step.output_status.is_left_by_failed_run()) {
        return of.output + " is what a failed run has left";
      }
      if (!step.dependency.empty()) {
        return of.dependency + " is " + lead_of(step.dependency_status, step.output_status) +
               " newer than " + of.output;
      }
      return of.input + " is " + lead_of(step.input_status, step.output_status) + " newer than " +
             of.output;
    case LA_BUILD_AFTER_REBUILD:
      return of.input + " is made anew";
    default:
      return "the time stamp of " + of.input + " could not be determined";
  }
}

/// The reason with the part that each file has in the chain: the user knows only the ends of it.
std::string reason_in_chain(const LA_EXPLANATION& why, const LA_EXPLANATION::STEP& step,
                            bool ends) {
  const bool is_first = &step == &why.steps.front();
  const bool is_last = ends && &step == &why.steps.back();
  return reason(step, {(is_first ? "the source " : "the intermediate file ") + tail_of(step.input),
                       (is_last ? "" : "the intermediate file ") + tail_of(step.output),
                       "the dependency file " + tail_of(step.dependency)});
}

/// Errors in one line, without what messages of the launcher begin with.
std::string joined(const std::string& errors) {
  constexpr std::string_view START = "Launcher: ";
  std::istringstream lines(errors);
  std::string text;
  for (std::string line; std::getline(lines, line);) {
    if (line.starts_with(START)) line.erase(0, START.size());
    text += (text.empty() ? "" : "; ") + line;
  }
  return text;
}

std::string failure(const outcome& found, const LA_EXPLANATION& why) {
  if (!why.loop.empty()) {
    std::string rules;
    for (const LA_RULE* rule : why.loop)
      rules.append(rules.empty() ? "" : " <- ").append(rule->rule_name.get());
    return "its rules need each other in a circle: " + rules;
  }
  const bool is_unsupported =
      !why.steps.empty() && why.steps.back().decision == LA_BUILD_UNSUPPORTED;
  return is_unsupported ? reason_in_chain(why, why.steps.back(), false) : joined(found.error);
}

bool saw(const LA_EXPLANATION& why, LA_EXPLANATION::SIGHTING sighting, const std::string& tail) {
  return std::any_of(why.probes.begin(), why.probes.end(), [&](const LA_EXPLANATION::PROBE& probe) {
    return probe.sighting == sighting && (tail.empty() || tail_of(probe.path) == tail);
  });
}

/// What has become of a file that the user named, if it is not the one that is used.
std::string unused_file(const outcome& found, const LA_EXPLANATION& why) {
  const LA_FULLFILE named(found.name.c_str());
  if (named.get_ext() == nullptr) return {};
  if (named.match_ext("kbo")) {
    // This extension asks for a netlist, wherever it is made.
    const std::string path = named.get_fullfile();
    const bool is_other = path != found.netlist && Port::File::exist(path.c_str());
    return is_other ? found.name + " is there, but not used; " : "";
  }
  const std::string tail = named.get_tail();
  const std::string used = tail_of(why.steps.empty() ? found.netlist : why.steps.front().input);
  if (UT_STR::ICompare(tail.c_str(), used.c_str()) == 0) return {};
  if (saw(why, LA_EXPLANATION::FOUND, tail)) return "no rule makes a netlist from " + tail + "; ";
  const bool is_left = saw(why, LA_EXPLANATION::LEFT_BY_FAILURE, tail);
  return tail + (is_left ? " is what a failed run has left; " : " is not there; ");
}

std::string not_found(const LA_EXPLANATION& why) {
  const bool is_left = saw(why, LA_EXPLANATION::LEFT_BY_FAILURE, "");
  return is_left ? "not found: what there is was left by a failed run"
                 : "not found: no file of this name, and none to make it from";
}

/// What is found or made, and why.
std::string result(const outcome& found, const LA_EXPLANATION& why) {
  if (why.steps.empty())
    return found.netlist + ", as it stands: no rule has a source to make it from";
  const auto runs = [](const LA_EXPLANATION::STEP& step) { return !step.command.empty(); };
  const auto first = std::find_if(why.steps.begin(), why.steps.end(), runs);
  if (first == why.steps.end()) return found.netlist + ", nothing needs to run";
  const auto count = std::count_if(why.steps.begin(), why.steps.end(), runs);
  return found.netlist + ", after " + std::to_string(count) + " of " +
         std::to_string(why.steps.size()) + " steps, because " + reason_in_chain(why, *first, true);
}

}  // namespace

std::string reason_for(const LA_EXPLANATION::STEP& step) {
  return reason(step, {tail_of(step.input), tail_of(step.output), tail_of(step.dependency)});
}

std::string answer_to(const outcome& found, const LA_EXPLANATION& why) {
  const std::string name = found.name.empty() ? "\"\"" : found.name;
  if (found.result == LA_FAILED) return name + ": cannot be resolved: " + failure(found, why);
  if (found.result == LA_NOT_FOUND) return name + ": " + not_found(why);
  return name + ": " + unused_file(found, why) + result(found, why);
}

std::string tail_of(const std::string& path) {
  return path.substr(path.rfind('/') + 1);
}
