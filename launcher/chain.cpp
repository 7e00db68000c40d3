#include "launcher/chain.h"

#include <algorithm>
#include <optional>
#include <string>
#include <utility>

#include "file/full_root.h"
#include "host/port_interrupt.h"
#include "launcher/decision.h"
#include "launcher/netlister_run.h"
#include "rules/baslarules.h"

namespace {

/// A chain that is being carried out.
class chain_build {
 public:
  chain_build(const la_found_file& source, bool top, const la_build_settings& settings,
              la_home& home, const la_report& report, LA_EXPLANATION* why)
      : source_(source.file),
        top_(top),
        settings_(settings),
        home_(home),
        report_(report),
        why_(why),
        name_(LA_FILE(source_.get_tail()).get_name()),
        outputs_(settings.output_dir),
        input_status_(source.status) {
    outputs_.set_root(name_.c_str());
  }

  /// The full name of what a rule makes, good until the next call; null when there is none.
  const char* output_of(const LA_RULE& rule) { return outputs_.with_ext(rule.target->get_ext()); }

  /// Decides the step of a rule and carries it out. Returns whether the chain goes on.
  bool step(const LA_RULE& rule) {
    const LA_RULE* rule_before = std::exchange(rule_, &rule);
    if (is_interrupted(source_, report_)) return abandon(rule_before);
    if (report_.detail) {
      la_launcher_message().issueStatus("Launcher: Using rule %s\n", rule.rule_name.get());
    }
    output_ = output_of(rule);
    if (output_ == nullptr) {
      la_launcher_message().issueError(
          "Launcher: The output of rule %s for %s has no name of at most %d characters in the "
          "output directory, or there is none.\n",
          rule.rule_name.get(), source_.get_tail(), LA_MAX_PATH - 1);
      ++report_.errors;
      return false;
    }
    const la_decision decision = decide({rule, settings_.force, settings_.ignore_timestamps,
                                         after_rebuild(), source_, input_status_, output_},
                                        [this](const char* path) { return ask(path); });
    if (why_ != nullptr) explain(decision, rule_before);
    if (!report_decision(decision, rule_before)) return abandon(rule_before);
    input_status_ = decision.output_status;
    if (!decision.runs()) return true;
    input_status_ = {};  // What was known of the output is no longer true.
    return run(rule_before) || abandon(rule_before);
  }

  la_built_chain finish(bool is_complete) {
    la_built_chain built;
    built.is_complete = is_complete;
    if (is_complete) built.netlist = output_;
    built.is_seen = is_complete && input_status_.exists;
    built.runs = std::move(runs_);
    return built;
  }

 private:
  bool after_rebuild() const { return !runs_.empty(); }

  Port::FileStatus ask(const char* path) const {
    return netlisters_ ? netlisters_->ask(path) : home_.status(path);
  }

  LA_FULLFILE file_made_by(const LA_RULE& rule) const {
    LA_FULLFILE file(settings_.output_dir, source_.get_tail());
    file.set_ext(rule.target->get_ext());
    return file;
  }
  /// What the step reads.
  LA_FULLFILE input(const LA_RULE* rule_before) const {
    return rule_before != nullptr ? file_made_by(*rule_before) : source_;
  }
  /// Name and extension of what the step makes.
  std::string output_tail() const { return name_ + "." + rule_->target->get_ext(); }

  /// Reports the decision. Returns false when it ends the chain.
  bool report_decision(const la_decision& decision, const LA_RULE* rule_before) {
    if (decision.what == LA_BUILD_UNSUPPORTED) {
      la_launcher_message().issueError(
          "Launcher: Netlist format of %s is no longer supported, could not create %s\n",
          input(rule_before).get_fullfile(), output_tail().c_str());
      ++report_.errors;
      return false;
    }
    if (decision.is_output_left_by_failure && (report_.detail || settings_.ignore_timestamps)) {
      report_left_by_failure(output_);
    }
    const bool is_gone =
        report_.detail && decision.what == LA_BUILD_AFTER_REBUILD && !ask(output_).exists;
    const char* text = report_on(is_gone ? LA_BUILD_MISSING : decision.what, report_.detail);
    if (text != nullptr) la_launcher_message().issueStatus(text, output_tail().c_str());
    return true;
  }

  void explain(const la_decision& decision, const LA_RULE* rule_before) const {
    std::vector<LA_EXPLANATION::SEEN> dependencies;
    for (std::string& path : dependency_files_of(*rule_, source_)) {
      const Port::FileStatus status = ask(path.c_str());
      dependencies.push_back({std::move(path), status});
    }
    why_->steps.push_back({rule_, input(rule_before).get_fullfile(), output_, input_status_,
                           decision.output_status, decision.newer.path, decision.newer.status,
                           decision.what, "", std::move(dependencies)});
  }

  bool run(const LA_RULE* rule_before) {
    if (!netlisters_) netlisters_.emplace(settings_, top_, home_, report_);
    const LA_FULLFILE input_file = input(rule_before);
    LA_RUN run = {};
    run.rule = rule_;
    run.input = input_file.get_fullfile();
    run.output = output_;
    const bool goes_on = netlisters_->run(*rule_, {source_, input_file, file_made_by(*rule_)}, run);
    if (run.command.empty()) return goes_on;
    if (why_ != nullptr) why_->steps.back().command = run.command;
    runs_.push_back(std::move(run));
    return goes_on;
  }

  /// Gives the chain up at this step. Where the step before it has run, the output of this one must
  /// not look up to date to the next call, as it does if a netlister gives old time stamps.
  bool abandon(const LA_RULE* rule_before) {
    const auto before = std::find_if(runs_.begin(), runs_.end(), [&](const LA_RUN& run) {
      return run.rule == rule_before && run.end == LA_RUN::ENDED;
    });
    if (before == runs_.end()) return false;
    // What a netlister that was started has left is dealt with already.
    const LA_RUN& last = runs_.back();
    if (last.rule == rule_ && last.end != LA_RUN::NOT_STARTED) return false;
    const char* output = output_of(*rule_);
    const Port::FileStatus made = la_status_of(before->output.c_str());
    const Port::FileStatus old = la_status_of(output);
    if (!old.exists || old.time < made.time) return false;
    if (!Port::File::settime(output, made.time - 1)) {
      la_launcher_message().issueWarning(
          "Launcher: %s was made again, and the time stamp of %s could not be set back: remove "
          "it\n",
          before->output.c_str(), output);
      ++report_.warnings;
    }
    return false;
  }

  const LA_FULLFILE& source_;
  const bool top_;
  const la_build_settings& settings_;
  la_home& home_;
  const la_report& report_;
  LA_EXPLANATION* const why_;
  const std::string name_;  ///< of every output: that of a source "d." is d
  LA_FULLROOT outputs_;     ///< the outputs without their extensions

  // Of the step that is being carried out.
  const LA_RULE* rule_ = nullptr;
  const char* output_ = nullptr;
  Port::FileStatus input_status_;  ///< as of a missing file where it is not known

  std::optional<la_netlister_runs> netlisters_;  ///< made when the first of them is due
  std::vector<LA_RUN> runs_;
};

/// Whether the host agrees. It is not asked about a chain that has a file without a full name, and
/// fails there.
bool may_build(const la_found_file& source, const DARRAY_LA_RULE_CONST_PTR& chain,
               chain_build& build, const la_ask_host& ask_host) {
  std::vector<std::string> names = {source.file.get_fullfile()};
  for (const LA_RULE* rule : chain) {
    const char* output = build.output_of(*rule);
    if (output == nullptr) return true;
    names.emplace_back(output);
  }
  std::vector<const char*> files(names.size());
  std::transform(names.begin(), names.end(), files.begin(),
                 [](const std::string& name) { return name.c_str(); });
  return ask_host(files);
}

}  // namespace

la_built_chain build_chain(const la_found_file& source, const DARRAY_LA_RULE_CONST_PTR& chain,
                           bool top, const la_build_settings& settings, la_home& home,
                           const la_ask_host& ask_host, const la_report& report,
                           LA_EXPLANATION* why) {
  chain_build build(source, top, settings, home, report, why);
  if (ask_host && !may_build(source, chain, build, ask_host)) {
    ++report.errors;
    return build.finish(false);
  }
  const bool is_complete = std::all_of(chain.begin(), chain.end(),
                                       [&](const LA_RULE* rule) { return build.step(*rule); });
  return build.finish(is_complete);
}

bool is_interrupted(const LA_FULLFILE& file, const la_report& report) {
  if (Port_Interrupt::Requested() == 0) return false;
  la_launcher_message().issueError("Launcher: The work on %s was interrupted.\n", file.get_tail());
  ++report.errors;
  return true;
}
