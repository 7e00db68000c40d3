#include "rules/user_rules.h"

#include <utility>

#include "host/port_file.h"
#include "rules/message.h"
#include "rules/rule_fields.h"
#include "rules/statement_reader.h"
#include "rules/validation.h"

namespace {

/// The text of a message on a line, by the finding of the statement reader.
const char* finding_text(la_statement_reader::item_kind finding) {
  switch (finding) {
    case la_statement_reader::EXPECTING_KEYWORD:
      return "Expecting keyword";
    case la_statement_reader::EXPECTING_EQUALS:
      return "Expecting \"=\"";
    case la_statement_reader::EXPECTING_VALUE:
      return "Expecting value";
    case la_statement_reader::EXPECTING_SEMICOLON:
      return "Expecting \";\"";
    case la_statement_reader::LONG_LINE:
      return "Line is longer than 259 characters";
    case la_statement_reader::LONG_VALUE:
      return "Value is longer than 259 characters";
    case la_statement_reader::ZERO_BYTE:
      return "Line holds a zero byte";
    case la_statement_reader::MANY_LINES:
      return "File has more than 32767 lines";
    default:
      return "Could not read on";
  }
}
static_assert(LA_MAX_PATH == 260 && la_statement_reader::MAX_LINES == 32767);

/// Makes rules of the statements of one file.
class rule_maker {
 public:
  /// file_name is the file's name in messages.
  rule_maker(const char* file_name, Port::Stream& stream, la_user_rules& rules)
      : file_name_(file_name), reader_(stream), rules_(rules) {}

  /// Reads the whole file. Returns whether there was no error.
  bool read() {
    for (;;) {
      const la_statement_reader::item_kind item = reader_.next();
      if (item == la_statement_reader::END) break;
      if (item == la_statement_reader::STATEMENT) {
        take_statement(reader_.keyword(), reader_.value());
      } else if (item == la_statement_reader::UNEXPECTED_END) {
        la_rules_message().issueError("Launcher: Unexpected end of file\n");
        rules_.unfinished_statement = statement_origin();
        good_ = false;
      } else {
        report(finding_text(item));
      }
    }
    finish_rule();
    return good_;
  }

 private:
  void take_statement(const char* keyword, const char* value) {
    if (UT_STR::ICompare(keyword, "RuleName") == 0) {
      finish_rule();
      rule_ = std::make_unique<LA_RULE>(value);
      rule_->origin = statement_origin();
      return;
    }
    if (!rule_) return report("Rule does not have a RuleName");
    for (const la_rule_field& field : la_rule_fields()) {
      if (field.store == nullptr || UT_STR::ICompare(keyword, field.keyword) != 0) continue;
      if (!field.store(*rule_, value)) report("Invalid exit code for ", field.name_in_message, ".");
      return;
    }
    report("Unexpected key word ", keyword);
  }

  void finish_rule() {
    if (!rule_) return;
    const bool is_named = rule_->netlist_file && rule_->netlist_file->get_name() != nullptr;
    (is_named ? rules_.for_named_files : rules_.for_extensions).add(std::move(rule_));
  }

  LA_ORIGIN statement_origin() const { return {rules_.path, reader_.statement_line()}; }

  /// Issues a finding on the current line: a text, perhaps an argument, and what follows it.
  void report(const char* text, const char* argument = "", const char* after = "",
              int line = __builtin_LINE()) {
    la_rules_message(line).issueError("Launcher: \"%s\", line %d: %s%s%s\n", file_name_,
                                      reader_.line(), text, argument, after);
    good_ = false;
  }

  const char* file_name_;
  la_statement_reader reader_;
  la_user_rules& rules_;
  std::unique_ptr<LA_RULE> rule_;  ///< the current one
  bool good_ = true;
};

struct close_stream {
  void operator()(Port::Stream* stream) const { Port::File::close(stream); }
};

/// The full name of the file; empty, and the reason is issued, when there is no such file.
std::string full_name_of(const char* file_name) {
  if (UT_STR::Len(file_name) >= LA_MAX_PATH) {
    la_rules_message().issueError(
        "Launcher: User rules file name \"%s\" is longer than %d characters.\n", file_name,
        LA_MAX_PATH - 1);
    return {};
  }
  LA_FULLFILE file(file_name);
  if (file.get_ext() == nullptr) file.set_ext("urf");
  const char* full_name = file.get_fullfile();
  if (full_name == nullptr && file.get_name() != nullptr) {
    la_rules_message().issueError(
        "Launcher: User rules file \"%s\" has no full name of at most %d characters, or the "
        "current directory cannot be used.\n",
        file_name, LA_MAX_PATH - 1);
    return {};
  }
  if (!file.exists()) {
    la_rules_message().issueError("Launcher: User rules file \"%s\" does not exist.\n",
                                  full_name != nullptr ? full_name : file_name);
    return {};
  }
  return full_name;
}

}  // namespace

bool la_user_rules::load(const char* file_name) {
  const std::string full_name = full_name_of(file_name);
  if (full_name.empty()) return false;
  const std::unique_ptr<Port::Stream, close_stream> stream(
      Port::File::open(full_name.c_str(), Port::Stream::READ, true));
  if (!stream) {
    la_rules_message().issueError("Launcher: Could not open user rules file \"%s\".\n", file_name);
    return false;
  }
  path = full_name;
  return rule_maker(file_name, *stream, *this).read() && validate_rules(for_named_files) &&
         validate_rules(for_extensions);
}
