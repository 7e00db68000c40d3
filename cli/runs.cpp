#include "cli/runs.h"

#include <signal.h>
#include <string.h>

#include "cli/console.h"
#include "rules/baslarules.h"

namespace {

/// How a netlister ended. A child that was ended by a signal has the code 128 + its number.
std::string ending(const LA_RUN& run) {
  switch (run.end) {
    case LA_RUN::NOT_STARTED:
      return "could not be started";
    case LA_RUN::LOST:
      return "ended in a way that is not known";
    default:
      const char* signal = ::sigabbrev_np(run.exit_code - 128);
      return signal != nullptr ? std::string("was killed by SIG") + signal
                               : "ended with exit code " + std::to_string(run.exit_code);
  }
}

/// The rule, what it reads, and its program.
std::string step_of(const LA_RUN& run) {
  const char* program = run.rule->netlister;
  return std::string("rule ") + run.rule->rule_name.get() + ", from " + run.input + ": " +
         (program != nullptr ? program : "\"\"");
}

/// Whether a netlister has left its output as it was. A file whose status changed a moment before
/// the netlister started may have been written again within one tick of the clock.
bool is_unwritten(const LA_RUN& run, __int64 start) {
  if (run.end != LA_RUN::ENDED || run.level == LA_FATAL) return false;
  if (!run.output_after.exists) return true;
  // Some file systems know seconds only, or every other one.
  constexpr __int64 SECOND = 1'000'000'000;
  const __int64 changed = run.output_before.changed;
  const __int64 tick = changed % SECOND == 0 ? 2 * SECOND : SECOND / 50;
  return run.output_after == run.output_before && changed < start - tick;
}

std::string what_is_left(const LA_RUN& run) {
  if (run.output_after.exists) return " has left " + run.output + " as it was";
  return Port::File::isdirectory(run.output.c_str())
             ? " has not written " + run.output + ": it is a directory"
             : " has not written " + run.output;
}

}  // namespace

bool tell_of_runs(const std::string& name, const std::vector<LA_RUN>& runs, __int64 start) {
  bool is_all_written = true;
  for (const LA_RUN& run : runs) {
    // That the user asked for an end need not be said.
    if (run.end == LA_RUN::ONLY_ANNOUNCED || run.end == LA_RUN::INTERRUPTED) continue;
    const std::string step = name + ": " + step_of(run);
    if (run.end != LA_RUN::ENDED || run.level == LA_FATAL) complain(step + " " + ending(run));
    if (run.end == LA_RUN::ENDED && run.level == LA_WARNING) {
      complain(PORT_MSG_WARNING, step + " " + ending(run) + ", which is a warning");
    }
    // What is made from it later is no better, and what fails for its sake is not to blame.
    if (is_all_written && is_unwritten(run, start)) {
      complain(PORT_MSG_ERROR, step + what_is_left(run));
      is_all_written = false;
    }
  }
  return is_all_written;
}
