#include "rules/system_rules.h"

#include <climits>
#include <string_view>
#include <utility>

#include "host/pm_devkey.h"
#include "host/pm_pic.h"
#include "host/port_env.h"
#include "host/port_file.h"
#include "host/port_msgman.h"
#include "host/port_pathlist.h"
#include "host/static_acd.h"
#include "rules/message.h"
#include "rules/rule_fields.h"
#include "rules/validation.h"

namespace {

/// Where the system rules for the device are: of its family, or the default ones.
std::string system_rules_file(PM_PIC& device) {
  const PM_DEVKEY key("larules.acd", &device, 0, 1, 1);
  if (Port_Env::GetEnv("CVN_KESTREL_ALLOW_PLF") != nullptr) {
    for (const Port::StringBase<char>& root : Port::CvnenvPath::GetInstance()) {
      std::string path = std::string(root.c_str()) + "/data/" + "laplfrules.acd";
      if (!Port::File::exist(path.c_str())) continue;
      Port_MsgManData::debugStub(
          "Launcher: CVN_KESTREL_ALLOW_PLF is set. Using rules file for plf2kdb.\n");
      return path;
    }
  }
  return key.getlocation();
}

/// Whether the part is known; path is then where the rules for it are.
bool find_file(const char* part_name, std::string& path) {
  if (part_name == nullptr) {
    PM_PIC no_device(nullptr, nullptr, nullptr);
    path = system_rules_file(no_device);
    return true;
  }
  PM_PIC device(part_name, 1, PM_PARTNAME_BINDING(0));
  if (!device.is_valid(1, 0)) {
    la_rules_message(549).issueError("Launcher: %s is not a valid PM name.\n", part_name);
    return false;
  }
  path = system_rules_file(device);
  return true;
}

/// Makes rules of the records of one file.
class rule_maker {
 public:
  rule_maker(std::string path, DARRAY_LA_RULE_PTR& batch)
      : path_(std::move(path)), reader_(path_.c_str(), nullptr, nullptr, 1, 0, 1), batch_(batch) {}

  /// Reads all rules. Returns whether there was no error.
  bool read() {
    std::string_view names = reader_.find("RULES").value;
    for (int i = 0;; ++i) {
      const std::string name(StaticAcdRead::take_piece(names, ','));
      if (name.empty()) break;
      if (i == SHRT_MAX) {
        report(name.c_str(), "There are more than " + std::to_string(SHRT_MAX) + " rules.");
        break;
      }
      batch_.add(std::make_unique<LA_RULE>(name.c_str()));
      read_rule(*batch_.elements[batch_.count - 1]);
    }
    return good_ && reader_.valid();
  }

 private:
  void read_rule(LA_RULE& rule) {
    const char* name = rule.rule_name;
    if (UT_STR::Len(name) >= LA_MAX_PATH) refuse_length(name, "The name");
    const StaticAcdRead::entry& record = reader_.find(name);
    rule.origin = {path_, record.line};
    std::string_view rest = record.value;
    for (const la_rule_field& field : la_rule_fields()) {
      given_ = StaticAcdRead::take_piece(rest, ',');
      read_field(rule, field);
      if (field.completes != nullptr) check_statuses(rule, *field.completes);
    }
    if (!StaticAcdRead::take_piece(rest, ',').empty()) {
      la_rules_message().issueWarning("Launcher: Rule: %s - Only the first %d fields are used.\n",
                                      name, static_cast<int>(la_rule_fields().size()));
    }
  }

  void read_field(LA_RULE& rule, const la_rule_field& field) {
    const char* name = rule.rule_name;
    if (given_.empty() || UT_STR::ICompare(given_.c_str(), "NONE") == 0) {
      if (field.is_required) report(name, std::string(field.keyword) + " is required.", field.line);
    } else if (field.store == nullptr) {
      read_dependency_files(rule, given_);
    } else if (given_.size() >= LA_MAX_PATH) {
      refuse_length(name, field.keyword);
    } else if (!field.store(rule, given_.c_str())) {
      report(name, std::string("Invalid exit code for ") + field.keyword + ".", field.line);
    }
  }

  void read_dependency_files(LA_RULE& rule, std::string_view files) {
    for (int i = 0; i <= SHRT_MAX; ++i) {
      const std::string part(StaticAcdRead::take_piece(files, '|'));
      if (part.empty()) return;
      if (part.size() >= LA_MAX_PATH) {
        refuse_length(rule.rule_name, "Dependency file");
        continue;
      }
      const LA_FILE file(part.c_str());
      if (file.get_tail() == nullptr || file.get_head() != nullptr) {
        la_rules_message().issueWarning(
            "Launcher: Rule: %s - Dependency file %s is not a plain file name.\n",
            rule.rule_name.get(), part.c_str());
      }
      rule.add_dependency_file(part.c_str());
    }
    report(rule.rule_name, "There are too many dependency files.");
  }

  void check_statuses(const LA_RULE& rule, const la_program& program) {
    if ((rule.*program.status).count > 0) return;
    if (&program == &LA_RULE::NETLISTER) {
      report(rule.rule_name,
             "There must be at least one of the following: NetlisterSuccessStatus, "
             "NetlisterWarningStatus, or NetlisterFatalStatus.",
             703);
    } else if (rule.checker != nullptr) {
      report(rule.rule_name,
             "There myst be at least one of the following: CheckerSuccessStatus, "
             "CheckerWarningStatus, or CheckerFatalStatus.",
             749);
    }
  }

  void refuse_length(const char* rule_name, const std::string& what, int line = __builtin_LINE()) {
    report(rule_name, what + " is longer than " + std::to_string(LA_MAX_PATH - 1) + " characters.",
           line);
  }

  void report(const char* rule_name, const std::string& finding, int line = __builtin_LINE()) {
    la_rules_message(line).issueError("Launcher: Rule: %s - %s\n", rule_name, finding.c_str());
    good_ = false;
  }

  std::string path_;
  StaticAcdRead reader_;
  DARRAY_LA_RULE_PTR& batch_;
  std::string given_;  ///< the text of the current field; kept for the sake of its memory
  bool good_ = true;
};

}  // namespace

bool la_load_system_rules(const char* part_name, DARRAY_LA_RULE_PTR& batch, std::string& path) {
  return find_file(part_name, path) && rule_maker(path, batch).read() && validate_rules(batch);
}
