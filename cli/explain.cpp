#include "cli/explain.h"

#include <algorithm>
#include <array>
#include <unordered_set>
#include <vector>

#include "cli/place.h"
#include "cli/times.h"
#include "rules/baslarules.h"

namespace {

std::string indented(std::string text, std::size_t width) {
  text.resize(std::max(width, text.size() + 2), ' ');
  return text;
}

/// The width of a column for the names of rules.
std::size_t width_for(const std::vector<const LA_RULE*>& rules) {
  std::size_t width = 10;
  for (const LA_RULE* rule : rules) width = std::max(width, UT_STR::Len(rule->rule_name) + 2);
  return width;
}

std::string file_of(const LA_FILE& file) {
  const char* name = file.get_name();
  const char* ext = file.get_ext();
  return std::string(name != nullptr ? name : "") + "." + (ext != nullptr ? ext : "");
}

/// A line on a rule, with something said between what it converts and where it stands.
std::string line_on(const LA_RULE& rule, std::size_t width, const std::string& said,
                    const place_names& places) {
  const std::string kinds = file_of(*rule.netlist_file) + " => " + file_of(*rule.target);
  return "  " + indented(rule.rule_name.get(), width) + indented(kinds, 16) + said +
         places.line(rule.origin) + "\n";
}

// ---- Steps ----

std::string state_of(const Port::FileStatus& status, bool is_known) {
  if (!is_known) return "not looked at";
  if (!status.exists) return "missing";
  return status.is_left_by_failed_run() ? "left by a failed run" : time_of(status);
}

std::string lines_on(const LA_EXPLANATION::STEP& step, int number, const place_names& places) {
  const auto line = [](const char* label, const std::string& text) {
    return "     " + indented(label, 9) + text + "\n";
  };
  const auto file = [&](const char* label, const std::string& path, const Port::FileStatus& status,
                        bool is_known) {
    return line(label, indented(state_of(status, is_known), 25) + places.file(path));
  };
  const bool runs = step.decision > LA_BUILD_UNDECIDED;
  const bool is_output_missing = step.decision == LA_BUILD_MISSING;
  std::string text = "  " + std::to_string(number) + "  " +
                     indented(step.rule->rule_name.get(), 9) + (runs ? "runs: " : "") +
                     reason_for(step) + "\n" +
                     file("reads", step.input, step.input_status, step.input_status.exists);
  for (const auto& [path, status] : step.dependencies) {
    if (!path.empty()) text += file("watches", path, status, true);
  }
  text += file("makes", step.output, step.output_status,
               step.output_status.exists || is_output_missing) +
          line("rule", places.line(step.rule->origin));
  return step.command.empty() ? text : text + "     $ " + step.command + "\n";
}

std::string steps(const LA_EXPLANATION& why, const place_names& places) {
  std::string text;
  int number = 0;
  for (const LA_EXPLANATION::STEP& step : why.steps) text += lines_on(step, ++number, places);
  return text.empty() ? text : "\nSteps:\n" + text;
}

// ---- Places ----

/// Where it was looked for what: the places by number, then a line for each file.
std::string sightings(const LA_EXPLANATION& why) {
  constexpr std::array SIGHTINGS = {"", "found in ", "passed over in ", "left by a failed run in "};
  std::vector<std::string> places;
  struct file {
    std::string name;
    std::string seen;
  };
  std::vector<file> files;
  for (const auto& [sighting, path] : why.probes) {
    const std::string name = tail_of(path);
    const std::string place = path.substr(0, path.size() - name.size());
    auto at = std::find(places.begin(), places.end(), place);
    if (at == places.end()) at = places.insert(places.end(), place);
    if (files.empty() || files.back().name != name) files.push_back({name, ""});
    if (sighting == LA_EXPLANATION::MISSING) continue;
    std::string& seen = files.back().seen;
    seen += (seen.empty() ? "" : ", ") + std::string(SIGHTINGS[sighting]) +
            std::to_string(at - places.begin() + 1);
  }
  if (places.empty()) return {};
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

// ---- Rules ----

/// The loop, drawn from a rule to the same rule again.
std::string loop(const LA_EXPLANATION& why, const place_names& places) {
  std::string text;
  for (const LA_RULE* rule : why.loop) text += line_on(*rule, width_for(why.loop), "", places);
  return text.empty() ? text
                      : "\nThe circle, in which each rule needs what the next one makes:\n" + text;
}

/// The rules that were considered, but for those of the steps or the loop.
std::string other_rules(const LA_EXPLANATION& why, const place_names& places) {
  constexpr std::array VERDICTS = {
      "taken, but not come to",       "what it needs is not there", "you named another file",
      "for netlists of another name", "leads into the circle",      "a rule before it serves",
  };
  std::unordered_set<const LA_RULE*> shown(why.loop.begin(), why.loop.end());
  for (const LA_EXPLANATION::STEP& step : why.steps) shown.insert(step.rule);
  std::vector<const LA_RULE*> rules;
  for (const auto& [rule, verdict] : why.rules) rules.push_back(rule);
  const std::size_t width = width_for(rules);
  std::string text;
  for (const auto& [rule, verdict] : why.rules) {
    // One that was wanted more than once has one line.
    if (!shown.insert(rule).second) continue;
    text += line_on(*rule, width, indented(VERDICTS[verdict], 30), places);
  }
  if (text.empty()) return text;
  return (why.steps.empty() && why.loop.empty() ? "\nRules:\n" : "\nOther rules:\n") + text;
}

}  // namespace

std::string explained(const outcome& found, const LA_EXPLANATION& why) {
  const place_names places;
  return answer_to(found, why) + "\n" + steps(why, places) + loop(why, places) + sightings(why) +
         other_rules(why, places);
}
