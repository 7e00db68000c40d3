#include "rules/rule.h"

#include <utility>

#include "rules/message.h"

namespace {

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

LA_FILE* LA_RULE::set_netlist_file(const char* text) {
  return set_file(netlist_file, text);
}

LA_FILE* LA_RULE::set_target(const char* text) {
  return set_file(target, text);
}

void LA_RULE::add_dependency_file(const char* text) {
  if (!dependency_files) dependency_files = std::make_unique<DARRAY_LA_FILE_PTR>(2);
  dependency_files->add(std::make_unique<LA_FILE>(text));
}

void LA_RULE::copy_dependency_files(const LA_RULE& other) {
  auto copy = std::make_unique<DARRAY_LA_FILE_PTR>(2);
  if (other.dependency_files) {
    for (const LA_FILE* file : *other.dependency_files) copy->add(std::make_unique<LA_FILE>(*file));
  }
  dependency_files = std::move(copy);
}

unsigned short LA_RULE::num_dependency_files() const {
  return dependency_files ? static_cast<unsigned short>(dependency_files->count) : 0;
}

void LA_RULE::set_dir(const la_program& of, const LA_DIR* dir, unsigned short flag) {
  this->*of.dir = dir != nullptr ? std::make_unique<LA_DIR>(*dir) : nullptr;
  this->*of.dir_flag = flag;
}

void LA_RULE::set_dir(const la_program& of, const char* text) {
  static constexpr struct {
    const char* word;
    unsigned short flag;
  } WORDS[] = {{"NONE", DIR_NONE}, {"$SOURCE", DIR_SOURCE}, {"$OUTPUT", DIR_OUTPUT}};

  if (text == nullptr) return set_dir(of, nullptr, DIR_UNSET);
  for (const auto& [word, flag] : WORDS) {
    if (UT_STR::ICompare(text, word) == 0) return set_dir(of, nullptr, flag);
  }
  const LA_DIR dir(text);
  set_dir(of, &dir, DIR_GIVEN);
  this->*of.dir_text = text;
}

void LA_RULE::add_status(const la_program& of, const LA_STATUS& entry) {
  (this->*of.status).add(std::make_unique<LA_STATUS>(entry));
}

bool LA_RULE::add_status(const la_program& of, unsigned short level, const char* text) {
  LA_STATUS entry(level, OP_NOVALUE, 0);
  if (text != nullptr && UT_STR::ICompare(text, "NONE") == 0) {
    entry.op = OP_NONE;
  } else if (text != nullptr && !parse_status(text, entry.op, entry.code)) {
    return false;
  }
  add_status(of, entry);
  return true;
}

unsigned short LA_RULE::result(const la_program& of, int exit_code) const {
  for (const LA_STATUS* entry : this->*of.status) {
    if (entry->match(exit_code)) return entry->level;
  }
  return LA_FATAL;
}

void LA_RULE::dump(bool detail) const {
  if (!detail) {
    la_rules_message().issueStatus("Rule %s: %s => %s  %s %s\n", rule_name.get(),
                                   name_of(netlist_file), name_of(target), netlister.get(),
                                   netlister_options.get());
    return;
  }
  la_rules_message().issueStatus("\n");
  la_rules_message().issueStatus("Rule: %s\n", rule_name.get());
  la_rules_message().issueStatus("Netlist File: %s\n", name_of(netlist_file));
  la_rules_message().issueStatus("Target: %s\n", name_of(target));
  la_rules_message().issueStatus("Netlister: %s\n", netlister.get());
  la_rules_message().issueStatus("Netlister Options: %s\n", netlister_options.get());
  la_rules_message().issueStatus("Netlister Top Options: %s\n", netlister_top_options.get());
  la_rules_message().issueStatus("Netlister Directory Flag: %d  Dir: %s\n", netlister_dir_flag,
                                 name_of(netlister_dir));
  la_rules_message().issueStatus("Checker: %s\n", checker.get());
  la_rules_message().issueStatus("Checker Options:%s\n", checker_options.get());
  la_rules_message().issueStatus("Checker Directory Flag: %d  Dir: %s\n", checker_dir_flag,
                                 name_of(checker_dir));
  for (const LA_STATUS* entry : netlister_status) entry->dump();
  for (const LA_STATUS* entry : checker_status) entry->dump();
}
