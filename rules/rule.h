// One rule: how a netlist file of one kind is turned into a file of another kind.
#ifndef KESTREL_RULES_RULE_H
#define KESTREL_RULES_RULE_H

#include <memory>
#include <optional>
#include <string>

#include "file/baslafile.h"
#include "host/ut_str.h"
#include "rules/owning_array.h"
#include "rules/status.h"

/// Where a netlister or checker runs.
enum : unsigned short {
  DIR_UNSET = 0,   ///< not given: a later rule may supply it; like DIR_NONE when none does
  DIR_NONE = 1,    ///< "NONE": the directory that was current when the chain started
  DIR_SOURCE = 2,  ///< "$SOURCE": the directory of the step's input file
  DIR_OUTPUT = 3,  ///< "$OUTPUT": the directory of the step's output file
  DIR_GIVEN = 4,   ///< any other text: the directory of that name
};

class LA_RULE;
using DARRAY_LA_FILE_PTR = la_owning_array<LA_FILE>;
using DARRAY_LA_RULE_PTR = la_owning_array<LA_RULE>;

/// A place in a file; the line counts from 1, and is 0 where there is no such place.
struct LA_ORIGIN {
  std::string file;
  int line = 0;
};

/// One of the two programs of a rule, by the fields that describe it.
struct la_program {
  la_text LA_RULE::*name;
  la_text LA_RULE::*options;
  unsigned short LA_RULE::*dir_flag;
  std::unique_ptr<LA_DIR> LA_RULE::*dir;
  la_text LA_RULE::*dir_text;
  DARRAY_LA_STATUS_PTR LA_RULE::*status;
};

/// One rule. It owns all that its fields hold. A text that is absent is null.
class LA_RULE {
 public:
  static const la_program NETLISTER;
  static const la_program CHECKER;

  /// A rule with a copy of this name and nothing else.
  explicit LA_RULE(const char* rule_name) : rule_name(rule_name) {}
  LA_RULE(const LA_RULE&) = delete;
  LA_RULE& operator=(const LA_RULE&) = delete;

  /// Replace the file; null removes it. They return the new file, which the rule owns, or null.
  LA_FILE* set_netlist_file(const char* text);
  LA_FILE* set_target(const char* text);

  /// Appends a file, whose name and extension replace those of a chain's source.
  void add_dependency_file(const char* text);
  /// Makes this rule's list of dependency files a copy of that of other.
  void copy_dependency_files(const LA_RULE& other);
  /// The number of dependency files.
  unsigned short num_dependency_files() const;
  bool has_dependency_files() const { return dependency_files && dependency_files->count > 0; }

  /// Replace the text by a copy; null removes it. They return the new text, which the rule owns.
  const char* set_netlister(const char* text) { return netlister = text; }
  const char* set_netlister_top_options(const char* text) { return netlister_top_options = text; }
  const char* set_netlister_options(const char* text) { return netlister_options = text; }
  const char* set_checker(const char* text) { return checker = text; }
  const char* set_checker_options(const char* text) { return checker_options = text; }

  /// Store a copy of dir, or none for null, and the flag as it is.
  void set_dir(const la_program& of, const LA_DIR* dir, unsigned short flag);
  void set_netlister_dir(const LA_DIR* dir, unsigned short flag) { set_dir(NETLISTER, dir, flag); }
  void set_checker_dir(const LA_DIR* dir, unsigned short flag) { set_dir(CHECKER, dir, flag); }
  /// Set flag and directory from a text: "NONE", "$SOURCE", "$OUTPUT" or a directory; null gives
  /// DIR_UNSET.
  void set_dir(const la_program& of, const char* text);
  void set_netlister_dir(const char* text) { set_dir(NETLISTER, text); }
  void set_checker_dir(const char* text) { set_dir(CHECKER, text); }

  /// Append a copy of the entry to the list.
  void add_status(const la_program& of, const LA_STATUS& entry);
  void add_netlister_status(const LA_STATUS& entry) { add_status(NETLISTER, entry); }
  void add_checker_status(const LA_STATUS& entry) { add_status(CHECKER, entry); }
  /// Append an entry made from a status value or "NONE", or from null, which matches nothing. They
  /// return false, and add nothing, for any other text.
  bool add_status(const la_program& of, unsigned short level, const char* text);
  bool add_netlister_status(unsigned short level, const char* text) {
    return add_status(NETLISTER, level, text);
  }
  bool add_checker_status(unsigned short level, const char* text) {
    return add_status(CHECKER, level, text);
  }

  /// The level of the first entry that matches the exit code; LA_FATAL when none does.
  unsigned short result(const la_program& of, int exit_code) const;
  unsigned short netlister_result(int exit_code) const { return result(NETLISTER, exit_code); }
  unsigned short checker_result(int exit_code) const { return result(CHECKER, exit_code); }

  /// Issues the rule as status messages: in one line, or field by field, without dependency files.
  void dump(bool detail) const;

  la_text rule_name;
  std::optional<LA_FILE> netlist_file;  ///< the sources that the rule applies to
  std::optional<LA_FILE> target;        ///< only its extension counts
  std::unique_ptr<DARRAY_LA_FILE_PTR> dependency_files;
  la_text netlister;
  la_text netlister_top_options;
  la_text netlister_options;
  unsigned short netlister_dir_flag = DIR_UNSET;
  std::unique_ptr<LA_DIR> netlister_dir;
  la_text netlister_dir_text;  ///< as it was given, for people
  la_text checker;
  la_text checker_options;
  unsigned short checker_dir_flag = DIR_UNSET;
  std::unique_ptr<LA_DIR> checker_dir;
  la_text checker_dir_text;
  DARRAY_LA_STATUS_PTR netlister_status{3};
  DARRAY_LA_STATUS_PTR checker_status{3};
  /// Where the rule begins: the file, as LA_RULE_SET::files names it, and the line of its RuleName
  /// or record. Line 0 when no loader made the rule.
  LA_ORIGIN origin;
  bool is_inherited_from = false;  ///< an earlier rule has taken something from it
};

inline constexpr la_program LA_RULE::NETLISTER = {
    &LA_RULE::netlister,     &LA_RULE::netlister_options,  &LA_RULE::netlister_dir_flag,
    &LA_RULE::netlister_dir, &LA_RULE::netlister_dir_text, &LA_RULE::netlister_status};
inline constexpr la_program LA_RULE::CHECKER = {
    &LA_RULE::checker,     &LA_RULE::checker_options,  &LA_RULE::checker_dir_flag,
    &LA_RULE::checker_dir, &LA_RULE::checker_dir_text, &LA_RULE::checker_status};

#endif
