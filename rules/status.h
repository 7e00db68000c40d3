// Exit-status entries: what an exit code of a netlister or checker means.
#ifndef KESTREL_RULES_STATUS_H
#define KESTREL_RULES_STATUS_H

#include "rules/owning_array.h"

/// What an exit code means. A code that no entry of a rule matches is fatal.
enum : unsigned short { LA_SUCCESS = 0, LA_WARNING = 1, LA_FATAL = 3 };

/// How an exit code x is compared with the code of an entry.
enum : unsigned short {
  OP_EQ = 0,       ///< "=", or no operator: x == code
  OP_NE = 1,       ///< "!": x != code
  OP_LT = 2,       ///< "<": x < code
  OP_GT = 3,       ///< ">": x > code
  OP_NOVALUE = 4,  ///< never matches: made from an absent text
  OP_NONE = 5,     ///< never matches: made from "NONE"
};

/// One entry of an exit-code list.
class LA_STATUS {
 public:
  /// An entry that means level for exit codes that stand in the relation op to code.
  LA_STATUS(unsigned short level, unsigned short op, int code) : level(level), op(op), code(code) {}

  /// Whether the entry applies to this exit code.
  bool match(int exit_code) const;
  /// Issues the entry as a status message.
  void dump() const;

  unsigned short level;
  unsigned short op;
  int code;
};

/// Reads a status value: an optional operator, blanks, a decimal number. Returns false, with
/// code 0, for anything else (null included, which gives OP_NOVALUE).
bool parse_status(const char* text, unsigned short& op, int& code);

using DARRAY_LA_STATUS_PTR = la_owning_array<LA_STATUS>;

#endif
