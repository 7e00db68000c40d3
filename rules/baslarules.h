// Rules: what turns a netlist file of one kind into a file of another kind, and the set of them
// that a launcher works with.
#ifndef KESTREL_RULES_BASLARULES_H
#define KESTREL_RULES_BASLARULES_H

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "file/baslafile.h"
#include "host/arena.h"
#include "host/ut_darray.h"
#include "host/ut_str.h"

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

/// Where a netlister or checker runs.
enum : unsigned short {
  DIR_UNSET = 0,   ///< not given: a later rule may supply it; like DIR_NONE when none does
  DIR_NONE = 1,    ///< "NONE": the directory that was current when the chain started
  DIR_SOURCE = 2,  ///< "$SOURCE": the directory of the step's input file
  DIR_OUTPUT = 3,  ///< "$OUTPUT": the directory of the step's output file
  DIR_GIVEN = 4,   ///< any other text: the directory of that name
};

/// One entry of an exit-code list.
class LA_STATUS {
 public:
  /// An entry that means level for exit codes that stand in the relation op to code.
  LA_STATUS(unsigned short level, unsigned short op, int code) : level(level), op(op), code(code) {}

  /// Whether the entry speaks of this exit code.
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

using DARRAY_LA_STATUS_PTR = UT_TYPED_DARRAY<LA_STATUS*>;
using DARRAY_LA_FILE_PTR = UT_TYPED_DARRAY<LA_FILE*>;

/// A place in a file; the line counts from 1, and is 0 where there is no such place.
struct LA_ORIGIN {
  std::string file;
  int line = 0;
};

/// One rule. All that its fields hold is its own, and ends with it. A text that is absent is null.
class LA_RULE {
 public:
  /// A rule with a copy of this name and nothing else. The arena, which must outlive it, holds
  /// the texts and exit-status entries that it is given, and also keeps those that are replaced;
  /// for null, the rule has an arena of its own.
  explicit LA_RULE(const char* rule_name, la_arena* arena = nullptr);
  LA_RULE(const LA_RULE&) = delete;
  LA_RULE& operator=(const LA_RULE&) = delete;
  ~LA_RULE();

  /// Replace the file; null removes it. They return the new file, which the rule owns, or null.
  LA_FILE* set_netlist_file(const char* text);
  LA_FILE* set_target(const char* text);

  /// Appends a file, whose name and extension are put in the place of those of a chain's source.
  void add_dependency_file(const char* text);
  /// Makes this rule's list of dependency files a copy of that of other.
  void copy_dependency_files(const LA_RULE& other);
  /// The number of dependency files.
  unsigned short num_dependency_files() const;
  bool has_dependency_files() const { return dependency_files && dependency_files->count > 0; }

  /// Replace the text by a copy; null removes it. They return the new text, which the rule owns.
  const char* set_netlister(const char* text) { return netlister = la_text(text, arena_); }
  const char* set_netlister_top_options(const char* text) {
    return netlister_top_options = la_text(text, arena_);
  }
  const char* set_netlister_options(const char* text) {
    return netlister_options = la_text(text, arena_);
  }
  const char* set_checker(const char* text) { return checker = la_text(text, arena_); }
  const char* set_checker_options(const char* text) {
    return checker_options = la_text(text, arena_);
  }

  /// Store a copy of dir, or none for null, and the flag as it is.
  void set_netlister_dir(const LA_DIR* dir, unsigned short flag);
  void set_checker_dir(const LA_DIR* dir, unsigned short flag);
  /// Set flag and directory from a text: "NONE", "$SOURCE", "$OUTPUT" or a directory; null gives
  /// DIR_UNSET.
  void set_netlister_dir(const char* text);
  void set_checker_dir(const char* text);

  /// Append an entry to the list: a copy, or one made from a status value or "NONE". The latter
  /// return false, and add nothing, when text is neither.
  void add_netlister_status(const LA_STATUS& entry);
  void add_checker_status(const LA_STATUS& entry);
  bool add_netlister_status(unsigned short level, const char* text);
  bool add_checker_status(unsigned short level, const char* text);

  /// The level of the first entry that matches the exit code; LA_FATAL when none does.
  unsigned short netlister_result(int exit_code) const;
  unsigned short checker_result(int exit_code) const;

  /// Issues the rule as status messages: in one line, or field by field, without dependency files.
  void dump(bool detail) const;

 private:
  std::unique_ptr<la_arena> own_arena_;
  la_arena& arena_;

 public:
  la_text rule_name;
  std::optional<LA_FILE> netlist_file;  ///< the sources that the rule applies to
  std::optional<LA_FILE> target;        ///< only its extension counts
  std::unique_ptr<DARRAY_LA_FILE_PTR> dependency_files;
  la_text netlister;
  la_text netlister_top_options;
  la_text netlister_options;
  unsigned short netlister_dir_flag = DIR_UNSET;
  std::unique_ptr<LA_DIR> netlister_dir;
  la_text checker;
  la_text checker_options;
  unsigned short checker_dir_flag = DIR_UNSET;
  std::unique_ptr<LA_DIR> checker_dir;
  DARRAY_LA_STATUS_PTR netlister_status;
  DARRAY_LA_STATUS_PTR checker_status;
  /// Where the rule begins: the file, as LA_RULE_SET::files names it, and the line of its RuleName
  /// or of its record. No line for a rule that no loader made.
  LA_ORIGIN origin;
  bool is_inherited_from = false;  ///< an earlier rule has taken something from it
};

using DARRAY_LA_RULE_PTR = UT_TYPED_DARRAY<LA_RULE*>;

/// Checks the rules of one batch on their own and against each other, and issues what it finds.
/// Returns whether there was no error. Changes nothing.
bool validate_rules(const DARRAY_LA_RULE_PTR& batch);

/// The keywords of a user rules file.
std::vector<const char*> rule_keywords();

/// A file that rules come from.
struct LA_RULES_FILE {
  std::string path;
  int num_rules;
};

/// The rules of a launcher, in the order of precedence: those of the user rules file (rules for
/// named files first), those of the device's family, the default ones. They end with it.
class LA_RULE_SET {
 public:
  /// Loads, completes and checks the rules. part_name and user_rules_file may be null. Findings
  /// are issued as messages; the outcome is is_valid.
  LA_RULE_SET(const char* part_name, const char* user_rules_file);
  LA_RULE_SET(const LA_RULE_SET&) = delete;
  LA_RULE_SET& operator=(const LA_RULE_SET&) = delete;
  ~LA_RULE_SET();

  /// Dumps every rule, in order.
  void dump(bool detail) const;

  /// 1 when every load step and the check succeeded. When it is 0 the rules may be incomplete.
  unsigned char is_valid = 0;
  DARRAY_LA_RULE_PTR rules;
  /// Where the rules come from, in their order.
  std::vector<LA_RULES_FILE> files;
  /// When "Unexpected end of file" was issued, where the statement begins that lacks its end; else
  /// no line.
  LA_ORIGIN unfinished_statement;

 private:
  void add_file(const std::string& path);
  bool load(const char* part_name, const char* user_rules_file);
  bool load_user_rules(const char* file_name);
  bool load_system_rules(const char* part_name);
  bool check_rules();

  la_arena arena_;  ///< of the rules
};

#endif
