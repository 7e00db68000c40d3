#include "rules/baslarules.h"

#include <climits>
#include <exception>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "host/blanks.h"
#include "host/hash_index.h"
#include "host/pm_devkey.h"
#include "host/pm_pic.h"
#include "host/port_env.h"
#include "host/port_init.h"
#include "host/port_msgman.h"
#include "host/port_pathlist.h"
#include "host/static_acd.h"
#include "optparse/baslaoptparse.h"
#include "rules/inheritance.h"
#include "rules/statement_reader.h"

namespace {

const Port::FileInit file_init;
const Port::PathListInit path_list_init;
const CitP::InstanceTableInit instance_table_init;
const CitP::FactoryInit factory_init;
const Port_MsgManInit message_manager_init;

char revision[] = "$Revision: 1.12 $";

Port_MsgManData& message(int line = __builtin_LINE()) {
  return Port_MsgManData::createObject("Kestrel", "rules/baslarules.cpp", line, revision);
}

bool is_none(const char* text) {
  return UT_STR::ICompare(text, "NONE") == 0;
}

bool is_same(std::string_view a, std::string_view b) {
  // As a rule they are spelt alike.
  return a.size() == b.size() && (a == b || UT_STR::INCompare(a.data(), b.data(), a.size()) == 0);
}

}  // namespace

// ---- Exit-status entries ----

namespace {

/// Operators by their number: what a status value begins with, one character, and what a dump
/// prints.
constexpr const char* SYMBOLS[] = {"=", "!", "<", ">", "", "NONE"};
constexpr unsigned short WRITTEN_OPERATORS = OP_GT + 1;

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
  message().issueStatus("%s status %s %d\n", level_word(level), SYMBOLS[op], code);
}

bool parse_status(const char* text, unsigned short& op, int& code) {
  op = OP_NOVALUE;
  code = 0;
  if (text == nullptr || UT_STR::Len(text) >= LA_MAX_PATH) return false;
  std::string_view value = la_trimmed(text);
  op = OP_EQ;
  for (unsigned short i = 0; i < WRITTEN_OPERATORS; ++i) {
    if (!value.starts_with(SYMBOLS[i][0])) continue;
    op = i;
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

// ---- Rules ----

namespace {

void set_dir(unsigned short& flag, std::unique_ptr<LA_DIR>& dir, const char* text) {
  static constexpr struct {
    const char* word;
    unsigned short flag;
  } WORDS[] = {{"NONE", DIR_NONE}, {"$SOURCE", DIR_SOURCE}, {"$OUTPUT", DIR_OUTPUT}};

  dir.reset();
  flag = DIR_UNSET;
  if (text == nullptr) return;
  for (const auto& known : WORDS) {
    if (UT_STR::ICompare(text, known.word) != 0) continue;
    flag = known.flag;
    return;
  }
  flag = DIR_GIVEN;
  dir = std::make_unique<LA_DIR>(text);
}

/// The entry that a text of a status field means; none when it is not valid.
std::optional<LA_STATUS> status_of(unsigned short level, const char* text) {
  LA_STATUS entry(level, OP_NOVALUE, 0);
  if (text != nullptr && is_none(text)) {
    entry.op = OP_NONE;
  } else if (text != nullptr && !parse_status(text, entry.op, entry.code)) {
    return {};
  }
  return entry;
}

unsigned short result(const DARRAY_LA_STATUS_PTR& list, int exit_code) {
  for (const LA_STATUS* entry : list) {
    if (entry->match(exit_code)) return entry->level;
  }
  return LA_FATAL;
}

LA_FILE* set_file(std::optional<LA_FILE>& file, const char* text) {
  if (text == nullptr) {
    file.reset();
  } else if (file) {
    file->set_file(text);  // The text may be a part of the file.
  } else {
    file.emplace(text);
  }
  return file ? &*file : nullptr;
}

const char* name_of(const std::unique_ptr<LA_DIR>& dir) {
  return dir ? dir->get_dir() : nullptr;
}

const char* name_of(const std::optional<LA_FILE>& file) {
  return file ? file->get_file() : nullptr;
}

}  // namespace

LA_RULE::LA_RULE(const char* rule_name, la_arena* arena)
    : own_arena_(arena == nullptr ? new la_arena : nullptr),
      arena_(arena == nullptr ? *own_arena_ : *arena),
      rule_name(rule_name, arena_),
      netlister_status(3),
      checker_status(3) {}

LA_RULE::~LA_RULE() {
  if (dependency_files) {
    for (LA_FILE* file : *dependency_files) delete file;
  }
}

LA_FILE* LA_RULE::set_netlist_file(const char* text) {
  return set_file(netlist_file, text);
}

LA_FILE* LA_RULE::set_target(const char* text) {
  return set_file(target, text);
}

void LA_RULE::add_dependency_file(const char* text) {
  if (!dependency_files) dependency_files = std::make_unique<DARRAY_LA_FILE_PTR>(2);
  dependency_files->append(new LA_FILE(text));
}

void LA_RULE::copy_dependency_files(const LA_RULE& other) {
  auto copy = std::make_unique<DARRAY_LA_FILE_PTR>(2);
  if (other.dependency_files) {
    for (const LA_FILE* file : *other.dependency_files) copy->append(new LA_FILE(*file));
  }
  std::swap(dependency_files, copy);
  if (copy) {
    for (LA_FILE* file : *copy) delete file;
  }
}

unsigned short LA_RULE::num_dependency_files() const {
  return dependency_files ? static_cast<unsigned short>(dependency_files->count) : 0;
}

void LA_RULE::set_netlister_dir(const LA_DIR* dir, unsigned short flag) {
  netlister_dir.reset(dir != nullptr ? new LA_DIR(*dir) : nullptr);
  netlister_dir_flag = flag;
}

void LA_RULE::set_checker_dir(const LA_DIR* dir, unsigned short flag) {
  checker_dir.reset(dir != nullptr ? new LA_DIR(*dir) : nullptr);
  checker_dir_flag = flag;
}

void LA_RULE::set_netlister_dir(const char* text) {
  set_dir(netlister_dir_flag, netlister_dir, text);
}

void LA_RULE::set_checker_dir(const char* text) {
  set_dir(checker_dir_flag, checker_dir, text);
}

// Nobody destroys the entries.
static_assert(std::is_trivially_destructible_v<LA_STATUS>);

void LA_RULE::add_netlister_status(const LA_STATUS& entry) {
  netlister_status.append(arena_.make<LA_STATUS>(entry));
}

void LA_RULE::add_checker_status(const LA_STATUS& entry) {
  checker_status.append(arena_.make<LA_STATUS>(entry));
}

bool LA_RULE::add_netlister_status(unsigned short level, const char* text) {
  const std::optional<LA_STATUS> entry = status_of(level, text);
  if (entry) add_netlister_status(*entry);
  return entry.has_value();
}

bool LA_RULE::add_checker_status(unsigned short level, const char* text) {
  const std::optional<LA_STATUS> entry = status_of(level, text);
  if (entry) add_checker_status(*entry);
  return entry.has_value();
}

unsigned short LA_RULE::netlister_result(int exit_code) const {
  return result(netlister_status, exit_code);
}

unsigned short LA_RULE::checker_result(int exit_code) const {
  return result(checker_status, exit_code);
}

void LA_RULE::dump(bool detail) const {
  if (!detail) {
    message().issueStatus("Rule %s: %s => %s  %s %s\n", rule_name.get(), name_of(netlist_file),
                          name_of(target), netlister.get(), netlister_options.get());
    return;
  }
  message().issueStatus("\n");
  message().issueStatus("Rule: %s\n", rule_name.get());
  message().issueStatus("Netlist File: %s\n", name_of(netlist_file));
  message().issueStatus("Target: %s\n", name_of(target));
  message().issueStatus("Netlister: %s\n", netlister.get());
  message().issueStatus("Netlister Options: %s\n", netlister_options.get());
  message().issueStatus("Netlister Top Options: %s\n", netlister_top_options.get());
  message().issueStatus("Netlister Directory Flag: %d  Dir: %s\n", netlister_dir_flag,
                        name_of(netlister_dir));
  message().issueStatus("Checker: %s\n", checker.get());
  message().issueStatus("Checker Options:%s\n", checker_options.get());
  message().issueStatus("Checker Directory Flag: %d  Dir: %s\n", checker_dir_flag,
                        name_of(checker_dir));
  for (const LA_STATUS* entry : netlister_status) entry->dump();
  for (const LA_STATUS* entry : checker_status) entry->dump();
}

// ---- Validation of a batch ----

namespace {

/// The keywords that a template may use, with values that stand for those of a run. Keywords that
/// may lack a value there lack it here, so that a template that needs it is found out.
void fill_for_check(LA_KEYWORD_TABLE& table) {
  static constexpr struct {
    const char* keyword;
    const char* value;
  } VALUES[] = {{"part", nullptr},     {"family", nullptr}, {"device", nullptr},
                {"pkg", nullptr},      {"speed", nullptr},  {"libraries", nullptr},
                {"infile", "junk"},    {"outfile", "junk"}, {"ignore_locs", nullptr},
                {"add_pads", nullptr}, {"quiet", nullptr},  {"aul", nullptr},
                {"OUTPUT", "junk"}};
  for (const auto& known : VALUES) table.set_keyword(known.keyword, known.value);
}

bool names_a_file(const std::optional<LA_FILE>& file) {
  if (!file) return false;
  return file->get_ext() != nullptr || (file->get_name() != nullptr && !is_none(file->get_name()));
}

bool check_template(const LA_RULE& rule, const char* keyword, const char* text,
                    const LA_KEYWORD_TABLE& table) {
  if (text == nullptr) return true;
  char options[LA_MAX_PATH];
  const bool fits = UT_STR::Len(text) < LA_MAX_PATH;
  if (fits && table.expand(text, options, LA_MAX_PATH)) return true;
  message().issueError("Launcher: Error parsing %s \"%s\" for rule %s\n", keyword,
                       fits ? options : text, rule.rule_name.get());
  return false;
}

bool check_rule(const LA_RULE& rule, const LA_KEYWORD_TABLE& table) {
  bool good = true;
  if (!names_a_file(rule.netlist_file)) {
    message().issueError("Launcher: Rule %s does not define a NetlistFile\n", rule.rule_name.get());
    good = false;
  }
  if (!names_a_file(rule.target)) {
    message().issueError("Launcher: Rule %s does not define a TargetExtension\n",
                         rule.rule_name.get());
    good = false;
  } else if (rule.target->get_name() != nullptr) {
    message().issueWarning("Launcher: Rule %s only extension is used. Ignoring name %s\n",
                           rule.rule_name.get(), rule.target->get_name());
  }
  if (rule.netlister != nullptr && is_none(rule.netlister)) {
    message().issueError("Launcher: Rule %s can not set Netlister to NONE\n", rule.rule_name.get());
    good = false;
  }
  if (!check_template(rule, "NetlisterTopOptions", rule.netlister_top_options, table)) good = false;
  if (!check_template(rule, "NetlisterOptions", rule.netlister_options, table)) good = false;
  return good;
}

/// The hash of what two rules for the same conversion have in common.
std::uint32_t hash_of_conversion(const LA_RULE& rule) {
  // A dot may belong to the name as well.
  std::uint32_t hash = la_hash(rule.netlist_file->get_name());
  const char* ext = rule.netlist_file->get_ext();
  if (ext != nullptr) hash = la_hash(ext, la_hash('.', hash));
  return la_hash(rule.target->get_ext(), hash);
}

bool redefines(const LA_RULE& a, const LA_RULE& b) {
  return a.netlist_file->match_tail(b.netlist_file->get_tail()) &&
         a.target->match_ext(b.target->get_ext());
}

/// Reports every pair of rules for the same netlist file and target, the earlier rule first.
bool check_redefinitions(const DARRAY_LA_RULE_PTR& batch) {
  // For each rule, the next one for the same conversion.
  std::vector<int> next(static_cast<std::size_t>(batch.count), batch.count);
  la_hash_index last(batch.count);
  for (int i = 0; i < batch.count; ++i) {
    const LA_RULE& rule = *batch.elements[i];
    // A target without extension matches none.
    if (rule.target->get_ext() == nullptr) continue;
    int& same = last.place(hash_of_conversion(rule),
                           [&](int other) { return redefines(rule, *batch.elements[other]); });
    if (same != la_hash_index::NONE) la_at(next, same) = i;
    same = i;
  }
  bool good = true;
  for (int a = 0; a < batch.count; ++a) {
    for (int b = la_at(next, a); b < batch.count; b = la_at(next, b)) {
      message().issueError("Launcher: Rule %s redefines rule %s\n",
                           batch.elements[a]->rule_name.get(), batch.elements[b]->rule_name.get());
      good = false;
    }
  }
  return good;
}

}  // namespace

bool validate_rules(const DARRAY_LA_RULE_PTR& batch) {
  LA_KEYWORD_TABLE table;
  fill_for_check(table);
  bool good = true;
  for (const LA_RULE* rule : batch) {
    if (!check_rule(*rule, table)) good = false;
  }
  return good && check_redefinitions(batch);
}

// ---- What both loaders share ----

namespace {

/// The memory of the rule is that of its arena.
struct destroy_rule {
  void operator()(LA_RULE* rule) const { std::destroy_at(rule); }
};
using owned_rule = std::unique_ptr<LA_RULE, destroy_rule>;

/// Rules on their way into the rule set; those that do not get there are destroyed.
struct rule_batch {
  rule_batch() = default;
  rule_batch(const rule_batch&) = delete;
  rule_batch& operator=(const rule_batch&) = delete;
  ~rule_batch() {
    for (LA_RULE* rule : rules) destroy_rule()(rule);
  }

  void add(owned_rule rule) {
    rules.append(nullptr);
    rules.elements[rules.count - 1] = rule.release();
  }
  void move_to(DARRAY_LA_RULE_PTR& set) {
    set.reserve(static_cast<std::uint64_t>(set.count) + static_cast<std::uint64_t>(rules.count));
    for (LA_RULE* rule : rules) set.append(rule);
    rules.a_resetnum(0);
  }

  DARRAY_LA_RULE_PTR rules{10};
};

/// One field of a rule, as both kinds of rules file write it. The order is that of the fields of a
/// record of system rules.
struct rule_field {
  std::string_view keyword;
  /// Stores text in the rule. False when it is not a valid status value.
  bool (*store)(LA_RULE& rule, const char* text);
  /// The line that the finding of the system rules loader on this field is known by: that a
  /// required field is missing, or that a status value is not valid.
  int line = 0;
  bool required = false;
  /// The keyword in the message on a status value of a user rules file, where it differs.
  const char* name_in_message = keyword.data();
};

/// Makes a field's store function of a setter that cannot fail.
template <auto setter>
bool store(LA_RULE& rule, const char* text) {
  (rule.*setter)(text);
  return true;
}
using dir_setter = void (LA_RULE::*)(const char*);
constexpr dir_setter SET_NETLISTER_DIR = &LA_RULE::set_netlister_dir;
constexpr dir_setter SET_CHECKER_DIR = &LA_RULE::set_checker_dir;

template <unsigned short level>
bool store_netlister_status(LA_RULE& rule, const char* text) {
  return rule.add_netlister_status(level, text);
}
template <unsigned short level>
bool store_checker_status(LA_RULE& rule, const char* text) {
  return rule.add_checker_status(level, text);
}

constexpr rule_field FIELDS[] = {
    {"NetlistFile", store<&LA_RULE::set_netlist_file>, 594, true},
    {"TargetExtension", store<&LA_RULE::set_target>, 605, true},
    {"dependency files", nullptr},
    {"Netlister", store<&LA_RULE::set_netlister>, 632, true},
    {"NetlisterTopOptions", store<&LA_RULE::set_netlister_top_options>},
    {"NetlisterOptions", store<&LA_RULE::set_netlister_options>},
    {"NetlisterDirectory", store<SET_NETLISTER_DIR>},
    {"Checker", store<&LA_RULE::set_checker>},
    {"CheckerDirectory", store<SET_CHECKER_DIR>},
    {"NetlisterSuccessStatus", store_netlister_status<LA_SUCCESS>, 670},
    {"NetlisterWarningStatus", store_netlister_status<LA_WARNING>, 682},
    {"NetlisterFatalStatus", store_netlister_status<LA_FATAL>, 694},
    {"CheckerSuccessStatus", store_checker_status<LA_SUCCESS>, 715, false, "CheckerSuccesStatus"},
    {"CheckerWarningStatus", store_checker_status<LA_WARNING>, 727},
    {"CheckerFatalStatus", store_checker_status<LA_FATAL>, 739},
};
constexpr std::size_t DEPENDENCY_FILES = 2;
constexpr std::size_t LAST_NETLISTER_STATUS = 11;
constexpr std::size_t NUM_FIELDS = std::size(FIELDS);

}  // namespace

std::vector<const char*> rule_keywords() {
  std::vector<const char*> keywords = {"RuleName"};
  for (const rule_field& field : FIELDS) {
    if (field.store != nullptr) keywords.push_back(field.keyword.data());
  }
  return keywords;
}

// ---- User rules file ----

namespace {

/// What is said of a line of a user rules file, by the finding of the statement reader.
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

class user_rules_loader {
 public:
  /// file_name is the name in messages, path the full one.
  user_rules_loader(const char* file_name, const char* path, Port::Stream& stream, la_arena& arena)
      : file_name_(file_name), path_(path), reader_(stream), arena_(arena) {}

  /// Reads the whole file into rules. Returns whether there was no error.
  bool read() {
    for (;;) {
      const la_statement_reader::item_kind item = reader_.next();
      if (item == la_statement_reader::END) break;
      if (item == la_statement_reader::STATEMENT) {
        take_statement(reader_.keyword(), reader_.value());
      } else if (item == la_statement_reader::UNEXPECTED_END) {
        message().issueError("Launcher: Unexpected end of file\n");
        unfinished_ = here();
        good_ = false;
      } else {
        report("%s", finding_text(item));
      }
    }
    finish_rule();
    return good_;
  }

  /// The statement that the end of the file has cut off.
  const LA_ORIGIN& unfinished_statement() const { return unfinished_; }
  bool validate() const { return validate_rules(named_.rules) && validate_rules(extension_.rules); }

  /// Rules for named files come first, as they are the more special ones.
  void move_to(DARRAY_LA_RULE_PTR& set) {
    named_.move_to(set);
    extension_.move_to(set);
  }

 private:
  void take_statement(std::string_view keyword, const char* value) {
    if (is_same(keyword, "RuleName")) {
      finish_rule();
      rule_.reset(arena_.make<LA_RULE>(value, &arena_));
      rule_->origin = here();
      return;
    }
    if (!rule_) return report("%s", "Rule does not have a RuleName");
    for (const rule_field& field : FIELDS) {
      if (field.store == nullptr || !is_same(keyword, field.keyword)) continue;
      if (!field.store(*rule_, value)) report("Invalid exit code for %s.", field.name_in_message);
      return;
    }
    report("Unexpected key word %s", keyword.data());
  }

  void finish_rule() {
    if (!rule_) return;
    const bool named = rule_->netlist_file && rule_->netlist_file->get_name() != nullptr;
    (named ? named_ : extension_).add(std::move(rule_));
  }

  /// Where the current statement begins.
  LA_ORIGIN here() const { return {path_, reader_.statement_line()}; }

  void report(const char* finding, const char* argument, int line = __builtin_LINE()) {
    const std::string format = std::string("Launcher: \"%s\", line %d: ") + finding + "\n";
    message(line).issueError(format.c_str(), file_name_, reader_.line(), argument);
    good_ = false;
  }

  const char* file_name_;
  std::string path_;
  la_statement_reader reader_;
  bool good_ = true;
  LA_ORIGIN unfinished_;
  la_arena& arena_;
  owned_rule rule_;
  rule_batch named_;
  rule_batch extension_;
};

struct close_stream {
  void operator()(Port::Stream* stream) const { Port::File::close(stream); }
};

}  // namespace

bool LA_RULE_SET::load_user_rules(const char* file_name) {
  if (UT_STR::Len(file_name) >= LA_MAX_PATH) {
    message().issueError("Launcher: User rules file name \"%s\" is longer than %d characters.\n",
                         file_name, LA_MAX_PATH - 1);
    return false;
  }
  LA_FULLFILE file(file_name);
  if (file.get_ext() == nullptr) file.set_ext("urf");
  const char* full_name = file.get_fullfile();
  if (full_name == nullptr && file.get_name() != nullptr) {
    message().issueError(
        "Launcher: User rules file \"%s\" has no full name of at most %d characters, or the "
        "current directory cannot be used.\n",
        file_name, LA_MAX_PATH - 1);
    return false;
  }
  if (!file.exists()) {
    message().issueError("Launcher: User rules file \"%s\" does not exist.\n",
                         full_name != nullptr ? full_name : file_name);
    return false;
  }
  std::unique_ptr<Port::Stream, close_stream> stream(
      Port::File::open(full_name, Port::Stream::READ, true));
  if (!stream) {
    message().issueError("Launcher: Could not open user rules file \"%s\".\n", file_name);
    return false;
  }
  user_rules_loader loader(file_name, full_name, *stream, arena_);
  const bool good = loader.read() && loader.validate();
  unfinished_statement = loader.unfinished_statement();
  loader.move_to(rules);
  add_file(file.get_fullfile());
  return good;
}

// ---- System rules ----

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

class system_rules_loader {
 public:
  system_rules_loader(const char* path, la_arena& arena)
      : path_(path), reader_(path, nullptr, nullptr, 1, 0, 1), arena_(arena) {}

  /// Reads all rules. Returns whether there was no error.
  bool read() {
    std::string_view names = reader_.value("RULES");
    for (int i = 0;; ++i) {
      const std::string name(StaticAcdRead::take_piece(names, ','));
      if (name.empty()) break;
      if (i == SHRT_MAX) {
        message().issueError("Launcher: Rule: %s - There are more than %d rules.\n", name.c_str(),
                             SHRT_MAX);
        return false;
      }
      read_rule(name.c_str());
    }
    return good_ && reader_.valid();
  }

  bool validate() const { return validate_rules(batch_.rules); }
  void move_to(DARRAY_LA_RULE_PTR& set) { batch_.move_to(set); }

 private:
  void read_rule(const char* name) {
    owned_rule rule(arena_.make<LA_RULE>(name, &arena_));
    rule->origin = {path_, reader_.line(name)};
    if (UT_STR::Len(name) >= LA_MAX_PATH) refuse_length(name, "The name");
    record_.assign(reader_.value(name));
    std::string_view record = record_;
    for (std::size_t position = 0; position < NUM_FIELDS; ++position) {
      read_field(*rule, position, StaticAcdRead::take_piece(record, ','));
      if (position == LAST_NETLISTER_STATUS && rule->netlister_status.count == 0) {
        report(703, name,
               "There must be at least one of the following: NetlisterSuccessStatus, "
               "NetlisterWarningStatus, or NetlisterFatalStatus.");
      }
    }
    if (rule->checker != nullptr && rule->checker_status.count == 0) {
      report(749, name,
             "There myst be at least one of the following: CheckerSuccessStatus, "
             "CheckerWarningStatus, or CheckerFatalStatus.");
    }
    if (!StaticAcdRead::take_piece(record, ',').empty()) {
      message().issueWarning("Launcher: Rule: %s - Only the first %d fields are used.\n", name,
                             static_cast<int>(NUM_FIELDS));
    }
    batch_.add(std::move(rule));
  }

  void read_field(LA_RULE& rule, std::size_t position, std::string_view given) {
    const rule_field& known = FIELDS[position];
    const char* name = rule.rule_name;
    if (given.empty() || is_same(given, "NONE")) {
      if (known.required) report(known.line, name, std::string(known.keyword) + " is required.");
    } else if (position == DEPENDENCY_FILES) {
      read_dependency_files(rule, given);
    } else if (given.size() >= LA_MAX_PATH) {
      refuse_length(name, known.keyword.data());
    } else if (!known.store(rule, terminated(given))) {
      report(known.line, name, "Invalid exit code for " + std::string(known.keyword) + ".");
    }
  }

  void read_dependency_files(LA_RULE& rule, std::string_view files) {
    for (int i = 0; i <= SHRT_MAX; ++i) {
      const std::string_view part = StaticAcdRead::take_piece(files, '|');
      if (part.empty()) return;
      if (part.size() >= LA_MAX_PATH) {
        refuse_length(rule.rule_name, "Dependency file");
        continue;
      }
      const char* text = terminated(part);
      const LA_FILE file(text);
      if (file.get_tail() == nullptr || file.get_head() != nullptr) {
        message().issueWarning(
            "Launcher: Rule: %s - Dependency file %s is not a plain file name.\n",
            rule.rule_name.get(), text);
      }
      rule.add_dependency_file(text);
    }
    report(__LINE__, rule.rule_name, "There are too many dependency files.");
  }

  /// Puts a terminator behind a piece of the record, in the place of a separator or blank that has
  /// been read.
  const char* terminated(std::string_view piece) {
    record_[static_cast<std::size_t>(piece.data() - record_.data()) + piece.size()] = '\0';
    return piece.data();
  }

  void refuse_length(const char* rule_name, const char* what, int line = __builtin_LINE()) {
    report(
        line, rule_name,
        std::string(what) + " is longer than " + std::to_string(LA_MAX_PATH - 1) + " characters.");
  }

  void report(int line, const char* rule_name, const std::string& finding) {
    message(line).issueError("Launcher: Rule: %s - %s\n", rule_name, finding.c_str());
    good_ = false;
  }

  std::string path_;
  StaticAcdRead reader_;
  la_arena& arena_;
  std::string record_;  ///< of the current rule, to be cut into its fields
  bool good_ = true;
  rule_batch batch_;
};

}  // namespace

bool LA_RULE_SET::load_system_rules(const char* part_name) {
  std::unique_ptr<PM_PIC> device;
  if (part_name != nullptr) {
    device = std::make_unique<PM_PIC>(part_name, 1, PM_PARTNAME_BINDING(0));
    if (!device->is_valid(1, 0)) {
      message(549).issueError("Launcher: %s is not a valid PM name.\n", part_name);
      return false;
    }
  } else {
    device = std::make_unique<PM_PIC>(nullptr, nullptr, nullptr);
  }
  const std::string path = system_rules_file(*device);
  device.reset();
  system_rules_loader loader(path.c_str(), arena_);
  if (!loader.read() || !loader.validate()) return false;
  loader.move_to(rules);
  add_file(path);
  return true;
}

/// The rules that no file before has are those of this one.
void LA_RULE_SET::add_file(const std::string& path) {
  int num_before = 0;
  for (const LA_RULES_FILE& file : files) num_before += file.num_rules;
  files.push_back({path, rules.count - num_before});
}

// ---- Rule set ----

LA_RULE_SET::LA_RULE_SET(const char* part_name, const char* user_rules_file) : rules(11) {
  try {
    is_valid = load(part_name, user_rules_file);
  } catch (const std::exception& failure) {
    message().issueError("Launcher: Could not load the rules: %s\n", failure.what());
  }
}

LA_RULE_SET::~LA_RULE_SET() {
  for (LA_RULE* rule : rules) destroy_rule()(rule);
}

bool LA_RULE_SET::load(const char* part_name, const char* user_rules_file) {
  if (user_rules_file != nullptr && !load_user_rules(user_rules_file)) return false;
  if (!load_system_rules(part_name)) return false;
  if (part_name != nullptr && !load_system_rules(nullptr)) return false;
  return check_rules();
}

bool LA_RULE_SET::check_rules() {
  inherit_from_later_rules(rules);
  bool good = true;
  for (const LA_RULE* rule : rules) {
    if (rule->netlister_status.count > 0) continue;
    message().issueError(
        "Launcher: Rule: %s - There must be at least one of the following: "
        "NetlisterSuccessStatus, NetlisterWarningStatus, or NetlisterFatalStatus.\n",
        rule->rule_name.get());
    good = false;
  }
  return good;
}

void LA_RULE_SET::dump(bool detail) const {
  for (const LA_RULE* rule : rules) rule->dump(detail);
}
