#include "rules/status.h"

#include <climits>
#include <string_view>

#include "host/base/blanks.h"
#include "host/ut_str.h"
#include "rules/message.h"

namespace {

/// Operators by their number: what a status value begins with, one character, and what a dump
/// prints. Those from OP_NOVALUE on cannot be written.
constexpr const char* SYMBOLS[] = {"=", "!", "<", ">", "", "NONE"};

const char* level_word(unsigned short level) {
  return level == LA_SUCCESS ? "success" : level == LA_WARNING ? "warning" : "fatal";
}

}  // namespace

bool LA_STATUS::match(int exit_code) const {
  switch (op) {
    case OP_EQ:
      return exit_code == code;
    case OP_NE:
      return exit_code != code;
    case OP_LT:
      return exit_code < code;
    case OP_GT:
      return exit_code > code;
    default:
      return false;
  }
}

void LA_STATUS::dump() const {
  la_rules_message().issueStatus("%s status %s %d\n", level_word(level), SYMBOLS[op], code);
}

bool parse_status(const char* text, unsigned short& op, int& code) {
  op = OP_NOVALUE;
  code = 0;
  if (text == nullptr || UT_STR::Len(text) >= LA_MAX_PATH) return false;
  std::string_view value = la_trimmed(text);
  op = OP_EQ;
  for (unsigned short written = OP_EQ; written < OP_NOVALUE; ++written) {
    if (!value.starts_with(SYMBOLS[written])) continue;
    op = written;
    value.remove_prefix(1);
    while (value.starts_with(' ')) value.remove_prefix(1);
    break;
  }
  long number = 0;
  if (!UT_STR::StrToL(value.data(), value.size(), number) || number < INT_MIN || number > INT_MAX)
    return false;
  code = static_cast<int>(number);
  return true;
}
