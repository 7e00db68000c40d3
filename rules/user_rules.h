// The user rules file: its statements, made into rules.
#ifndef KESTREL_RULES_USER_RULES_H
#define KESTREL_RULES_USER_RULES_H

#include <string>

#include "rules/rule.h"

/// The rules of one user rules file.
struct la_user_rules {
  /// Reads and validates the file, whose extension is urf unless the name has one, and issues what
  /// it finds. Returns whether there was no error; after an error, the rules read so far are kept.
  bool load(const char* file_name);

  std::string path;  ///< the full name of the file; empty when it could not be opened
  DARRAY_LA_RULE_PTR for_named_files{10};
  DARRAY_LA_RULE_PTR for_extensions{10};
  /// The start of the statement that the end of the file cuts off; line 0 when there is none.
  LA_ORIGIN unfinished_statement;
};

#endif
