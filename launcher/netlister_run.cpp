#include "launcher/netlister_run.h"

#include <algorithm>

#include "host/port_env.h"
#include "host/port_interrupt.h"
#include "launcher/baslauncher.h"
#include "launcher/command_line.h"
#include "launcher/decision.h"
#include "rules/baslarules.h"

namespace {

bool is_same_file(const Port::FileStatus& a, const Port::FileStatus& b) {
  return a.exists && b.exists && a.device == b.device && a.inode == b.inode;
}

/// Whether something has written to a file, or put another one in its place. Its time of change
/// says less: a netlister may have made a link to it. One that is gone makes nothing stale.
bool has_changed(const Port::FileStatus& before, const Port::FileStatus& after) {
  return after.exists &&
         (!is_same_file(before, after) || before.size != after.size || before.time != after.time);
}

}  // namespace

la_netlister_runs::la_netlister_runs(const la_build_settings& settings, bool top, la_home& home,
                                     const la_report& report)
    : top_(top), home_(home), report_(report), directory_(home.dir()) {
  set_keywords(options_, settings);
}

bool la_netlister_runs::run(const LA_RULE& rule, const la_step_files& files, LA_RUN& result) {
  if (home_.dir().get_dir() == nullptr) {
    la_launcher_message().issueError(
        "Launcher: The current directory is gone, too long, or has a backslash in its name: %s is "
        "not run.\n",
        rule.netlister.get());
    ++report_.errors;
    return false;
  }
  const bool only_announce = Port_Env::GetEnv("LA_TEST") != nullptr;
  std::vector<LA_EXPLANATION::SEEN> inputs;
  if (!only_announce) {
    result.output_before = ask(result.output.c_str());
    inputs = inputs_of(rule, files);
  }
  directory_.enter(rule, files.input, files.output, report_);
  result.command = make_command(rule, files.input, files.output, options_, top_, report_);
  if (result.command.empty()) return false;
  la_launcher_message().issueStatus("Launcher: Executing %s\n", result.command.c_str());
  if (only_announce) return true;

  home_.doubt();
  bool goes_on = false;
  try {
    goes_on = execute(rule, result);
  } catch (...) {
    mark_stale(inputs, files, result.output_before);
    throw;
  }
  result.output_after = la_status_of(result.output.c_str());
  if (!goes_on && result.end != LA_RUN::NOT_STARTED)
    mark_stale(inputs, files, result.output_before);
  if (goes_on && result.output_after.exists) mind_changes(inputs, files, result);
  return goes_on;
}

Port::FileStatus la_netlister_runs::ask(const char* path) const {
  return directory_.never_left() ? home_.status(path) : la_status_of(path);
}

/// Runs the command line and judges its exit code by the rule.
bool la_netlister_runs::execute(const LA_RULE& rule, LA_RUN& result) const {
  La_Port_Process process(2);
  const Port_Process::PROCESS_STATUS status = process.Run(result.command.c_str());
  if (Port_Interrupt::Requested() != 0) {
    // Whatever its exit code says: it may have been cut short.
    const bool is_started = status != Port_Process::PROCESS_FAILED;
    result.end = is_started ? LA_RUN::INTERRUPTED : LA_RUN::NOT_STARTED;
    la_launcher_message().issueError("Launcher: %s was interrupted.\n", rule.netlister.get());
    ++report_.errors;
    return false;
  }
  if (status != Port_Process::PROCESS_ENDED) {
    result.end = status == Port_Process::PROCESS_LOST ? LA_RUN::LOST : LA_RUN::NOT_STARTED;
    la_launcher_message().issueError("Failed to launch program %z\n", process.GetProcessErrmsg());
    ++report_.errors;
    return false;
  }
  result.end = LA_RUN::ENDED;
  result.exit_code = process.GetChildRetcode();
  result.level = rule.netlister_result(result.exit_code);
  if (report_.detail) {
    la_launcher_message().issueStatus("Launcher: %s exited with an exit code of %d\n",
                                      rule.netlister.get(), result.exit_code);
  }
  if (result.level != LA_FATAL) return true;
  la_launcher_message().issueError("%s exited with errors (return code %d).\n",
                                   rule.netlister.get(), result.exit_code);
  ++report_.errors;
  return false;
}

std::vector<LA_EXPLANATION::SEEN> la_netlister_runs::inputs_of(const LA_RULE& rule,
                                                               const la_step_files& files) const {
  std::vector<LA_EXPLANATION::SEEN> inputs;
  const auto add = [&](const char* path) { inputs.push_back({path, ask(path)}); };
  add(files.input.get_fullfile());
  for (const std::string& path : dependency_files_of(rule, files.source)) add(path.c_str());
  return inputs;
}

/// If a file that the step depends on was changed while the netlister ran, nobody knows which of
/// its contents the netlister has read. The output gets the time stamp that the input had before,
/// so that the next call makes it again.
void la_netlister_runs::mind_changes(const std::vector<LA_EXPLANATION::SEEN>& before,
                                     const la_step_files& files, const LA_RUN& run) const {
  __int64 time = before.front().status.time;
  const char* changed = nullptr;
  for (const auto& [path, status] : before) {
    const Port::FileStatus now = la_status_of(path.c_str());
    // A link to the file, or the file itself, is not made from it.
    if (is_same_file(now, run.output_after) || !has_changed(status, now)) continue;
    // The file may have been replaced by an older one.
    time = std::min(time, now.time - 1);
    if (changed == nullptr) changed = path.c_str();
  }
  if (changed == nullptr) return;
  const char* netlister = run.rule->netlister;
  if (!Port::File::settime(run.output.c_str(), time)) {
    la_launcher_message().issueWarning(
        "Launcher: %s was changed while %s ran, and the time stamp of %s could not be set back: "
        "remove it\n",
        changed, netlister, files.output.get_tail());
    ++report_.warnings;
  } else if (report_.detail) {
    la_launcher_message().issueStatus(
        "Launcher: %s was changed while %s ran: %s will be made again\n", changed, netlister,
        files.output.get_tail());
  }
}

/// Sees to it that the output of a run that failed is never taken for up to date: gives it the
/// oldest time stamp that there is. Its content stays for whoever wants to look into it. inputs and
/// before: the files that the step depends on, and the output, as they were before the run. Goes
/// home.
void la_netlister_runs::mark_stale(const std::vector<LA_EXPLANATION::SEEN>& inputs,
                                   const la_step_files& files, const Port::FileStatus& before) {
  directory_.leave();
  const char* output = files.output.get_fullfile();
  const char* tail = files.output.get_tail();
  // A netlister may have moved home, or put another directory in its place.
  const char* file = la_status_of(output).exists ? output : home_.relative(output);
  const Port::FileStatus status = la_status_of(file);
  if (!status.exists) return;
  // A link to what was read must not make that old.
  const bool is_link = is_same_file(status, la_status_of(files.source.get_fullfile())) ||
                       std::any_of(inputs.begin(), inputs.end(), [&](const auto& input) {
                         return is_same_file(status, la_status_of(input.path.c_str()));
                       });
  if (!is_link && Port::File::setoldest(file)) {
    if (!report_.detail) return;
    la_launcher_message().issueStatus(
        "Launcher: %s comes from a failed run, its time stamp is set back: it will be made again\n",
        tail);
    return;
  }
  // The time stamp of another user's file cannot be set. One that was not written, and will be
  // found out of date as it stands, need not be touched.
  const Port::FileStatus input = la_status_of(files.input.get_fullfile());
  if (status == before && status.time < input.time) return;
  const bool is_removed = Port::File::remove(file);
  la_launcher_message().issueWarning(
      "Launcher: %s comes from a failed run, and its time stamp could not be set back: %s\n", tail,
      is_removed ? "it is removed" : "remove it");
  ++report_.warnings;
}
