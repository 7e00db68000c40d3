#include "launcher/working_directory.h"

#include "host/port_env.h"
#include "rules/baslarules.h"

namespace {

LA_DIR directory_of(const LA_RULE& rule, const LA_FULLFILE& input, const LA_FULLFILE& output,
                    const LA_DIR& home) {
  switch (rule.netlister_dir_flag) {
    case DIR_UNSET:
    case DIR_NONE:
      return LA_DIR(home.get_dir());
    case DIR_SOURCE:
      return LA_DIR(input.get_fullhead());
    case DIR_OUTPUT:
      return LA_DIR(output.get_fullhead());
    default:
      return LA_DIR(rule.netlister_dir ? rule.netlister_dir->get_dir() : nullptr);
  }
}

}  // namespace

void la_working_directory::enter(const LA_RULE& rule, const LA_FULLFILE& input,
                                 const LA_FULLFILE& output, const la_report& report) {
  const LA_DIR chosen = directory_of(rule, input, output, home_);
  if (!left_) left_.emplace();
  chosen.chdir();
  if (!report.detail) return;

  const char* netlister = rule.netlister;
  la_launcher_message().issueStatus("Launcher: Running %s from %s\n", netlister, chosen.get_dir());
  la_launcher_message().issueStatus("Launcher: Environment inherited by %s will be:\n", netlister);
  for (const char* variable : {"MYCORVANE", "CORVANE", "PATH"}) {
    const char* value = Port_Env::GetEnv(variable);
    la_launcher_message().issueStatus("Launcher:    %s is %s\n", variable,
                                      value != nullptr ? value : "unset");
  }
}

void la_working_directory::leave() {
  // A netlister may have moved or removed the directory of that name.
  if (left_ && !left_->enter()) home_.chdir();
}
