#include "launcher/decision.h"

#include <algorithm>
#include <iterator>

#include "rules/baslarules.h"

namespace {

bool is_supported(const LA_RULE& rule) {
  return rule.netlister == nullptr || UT_STR::_Compare(rule.netlister, "NOT_SUPPORTED") != 0;
}

/// LA_BUILD_UNDECIDED when it depends on files.
LA_BUILD_DECISION decide_without_files(const la_step_facts& step) {
  if (!is_supported(step.rule)) return LA_BUILD_UNSUPPORTED;
  if (step.after_rebuild) return LA_BUILD_AFTER_REBUILD;
  return step.force ? LA_BUILD_FORCED : LA_BUILD_UNDECIDED;
}

}  // namespace

la_decision decide(const la_step_facts& step, const la_ask& ask) {
  la_decision decision;
  decision.what = decide_without_files(step);
  if (decision.what != LA_BUILD_UNDECIDED) return decision;

  const Port::FileStatus output = ask(step.output);
  decision.output_status = output;
  decision.what = LA_BUILD_UP_TO_DATE;
  if (!output.exists) {
    decision.what = LA_BUILD_MISSING;
  } else if (output.is_left_by_failed_run()) {
    decision.what = LA_BUILD_OUT_OF_DATE;
    decision.is_output_left_by_failure = true;
  } else if (step.ignore_timestamps) {
    decision.what = LA_BUILD_SKIPPED;
  } else if (!step.input_status.exists) {
    decision.what = LA_BUILD_NO_TIMESTAMP;
  } else if (step.input_status.time > output.time) {
    decision.what = LA_BUILD_OUT_OF_DATE;
  } else {
    for (std::string& path : dependency_files_of(step.rule, step.source)) {
      const Port::FileStatus status = ask(path.c_str());
      if (!status.exists || status.time <= output.time) continue;
      decision.what = LA_BUILD_OUT_OF_DATE;
      decision.newer = {std::move(path), status};
      break;
    }
  }
  return decision;
}

std::vector<std::string> dependency_files_of(const LA_RULE& rule, const LA_FULLFILE& source) {
  std::vector<std::string> files;
  if (!rule.has_dependency_files()) return files;
  for (const LA_FILE* dependency : *rule.dependency_files) {
    LA_FULLFILE file(source);
    if (dependency->get_ext() != nullptr) file.set_ext(dependency->get_ext());
    if (dependency->get_name() != nullptr) file.set_name(dependency->get_name());
    const char* path = file.get_fullfile();
    files.emplace_back(path != nullptr ? path : "");
  }
  return files;
}

const char* report_on(LA_BUILD_DECISION decision, bool detail) {
  constexpr struct {
    LA_BUILD_DECISION decision;
    bool only_detail;
    const char* text;
  } REPORTS[] = {
      {LA_BUILD_UP_TO_DATE, false, "Launcher: %s is up to date\n"},
      {LA_BUILD_SKIPPED, false, "Launcher: NOT compiling %s because of ignore timestamp flag\n"},
      {LA_BUILD_FORCED, true, "Launcher: %s being compiled because of force flag\n"},
      {LA_BUILD_MISSING, true, "Launcher: %s being compiled because it does not exist\n"},
      {LA_BUILD_OUT_OF_DATE, true, "Launcher: %s being compiled because it is out of date\n"},
      {LA_BUILD_AFTER_REBUILD, true, "Launcher: %s being compiled because it is out of date\n"},
      {LA_BUILD_NO_TIMESTAMP, true,
       "Launcher: %s being compiled because the time stamps could not be determined\n"},
  };
  const auto* report = std::find_if(std::begin(REPORTS), std::end(REPORTS),
                                    [&](const auto& r) { return r.decision == decision; });
  const bool is_told = report != std::end(REPORTS) && (detail || !report->only_detail);
  return is_told ? report->text : nullptr;
}
