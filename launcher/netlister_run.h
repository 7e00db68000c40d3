// Runs the netlisters of a chain; no output of a run that failed counts as up to date afterwards.
#ifndef KESTREL_LAUNCHER_NETLISTER_RUN_H
#define KESTREL_LAUNCHER_NETLISTER_RUN_H

#include <vector>

#include "file/baslafile.h"
#include "host/port_file.h"
#include "launcher/build_settings.h"
#include "launcher/command_options.h"
#include "launcher/explanation.h"
#include "launcher/home.h"
#include "launcher/message.h"
#include "launcher/working_directory.h"

/// The files of a step.
struct la_step_files {
  const LA_FULLFILE& source;  ///< of the chain: dependency files lie beside it
  const LA_FULLFILE& input;
  const LA_FULLFILE& output;
};

/// The runs of one chain, which share a working directory and the values of keywords.
class la_netlister_runs {
 public:
  /// All that it is given must outlive it. top asks for the options of the top level.
  la_netlister_runs(const la_build_settings& settings, bool top, la_home& home,
                    const la_report& report);

  /// Announces and runs the rule's netlister, and judges how it ended. result holds the rule, the
  /// input and the output, and gets what else there is to know; its command is empty if nothing was
  /// announced. Returns false, after an error message, when the chain ends here.
  bool run(const LA_RULE& rule, const la_step_files& files, LA_RUN& result);
  /// What is known of a file, wherever the process is.
  Port::FileStatus ask(const char* path) const;

 private:
  std::vector<LA_EXPLANATION::SEEN> inputs_of(const LA_RULE& rule,
                                              const la_step_files& files) const;
  bool execute(const LA_RULE& rule, LA_RUN& result) const;
  void mark_stale(const std::vector<LA_EXPLANATION::SEEN>& inputs, const la_step_files& files,
                  const Port::FileStatus& before);
  void mind_changes(const std::vector<LA_EXPLANATION::SEEN>& before, const la_step_files& files,
                    const LA_RUN& run) const;

  const bool top_;
  la_home& home_;
  const la_report& report_;
  la_working_directory directory_;
  la_command_options options_;
};

#endif
