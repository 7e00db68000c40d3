#include "optparse/baslaoptparse.h"

#include <cstring>
#include <memory>

#include "host/port_init.h"
#include "host/port_msgman.h"
#include "optparse/expander.h"

namespace {

const Port::FileInit file_init;
const Port::PathListInit path_list_init;
const CitP::InstanceTableInit instance_table_init;
const CitP::FactoryInit factory_init;
const Port_MsgManInit message_manager_init;

char revision[] = "$Revision: 1.6 $";

Port_MsgManData& message(int line = __builtin_LINE()) {
  return Port_MsgManData::createObject("Kestrel", "optparse/baslaoptparse.cpp", line, revision);
}

/// What is said of a fault, and the line that the message is known by. Of too many steps nothing
/// is said.
struct fault_message {
  la_template_fault fault;
  int line;
  const char* text;
};
constexpr fault_message FAULT_MESSAGES[] = {
    {la_template_fault::UNDEFINED_KEYWORD, 217, "Undefined keyword \"%s\" in option string\n"},
    {la_template_fault::NOT_OPTIONAL, 226, "Keyword \"%s\" is not optional\n"},
    {la_template_fault::NESTED_REPEAT, 267, "Cannot nest {'s in option string\n"},
    {la_template_fault::OPEN_REPEAT, 274, "Missing '}' in option string\n"},
    {la_template_fault::OPEN_OPTIONAL, 332, "Missing ']' in option string\n"},
    {la_template_fault::STRAY_REPEAT, 157, "Missing '{' in options string\n"},
    {la_template_fault::STRAY_OPTIONAL, 163, "Missing '[' in options string\n"},
};

bool is_stray(la_template_fault fault) {
  return fault == la_template_fault::STRAY_REPEAT || fault == la_template_fault::STRAY_OPTIONAL;
}

void report(const la_expansion& expansion) {
  char name[LA_MAX_PATH];
  name[expansion.name.copy(name, sizeof name - 1)] = '\0';
  for (const fault_message& known : FAULT_MESSAGES) {
    if (known.fault == expansion.fault) message(known.line).issueError(known.text, name);
  }
}

}  // namespace

LA_KEYWORD_ENTRY::LA_KEYWORD_ENTRY(const char* name) : name(name), values(3) {}

void LA_KEYWORD_ENTRY::add_value(const char* value) {
  values.append(value != nullptr ? UT_STR::Dup(value) : nullptr);
}

void LA_KEYWORD_ENTRY::clear_values() {
  for (char* value : values) delete[] value;
  values.a_resetnum(0);
}

void LA_KEYWORD_ENTRY::dump() const {
  for (const char* value : values) message(84).issueStatus("%s = %s", name.c_str(), value);
}

LA_KEYWORD_TABLE::~LA_KEYWORD_TABLE() {
  for (LA_KEYWORD_ENTRY* entry : entries) delete entry;
}

LA_KEYWORD_ENTRY& LA_KEYWORD_TABLE::entry(const char* name) {
  for (LA_KEYWORD_ENTRY* entry : entries) {
    if (entry->name == name) return *entry;
  }
  auto created = std::make_unique<LA_KEYWORD_ENTRY>(name);
  entries.append(created.get());
  return *created.release();
}

void LA_KEYWORD_TABLE::set_keyword(const char* name, const char* value) {
  // The copy comes first: value may be one of those that go.
  const la_text copy(value);
  LA_KEYWORD_ENTRY& keyword = entry(name);
  keyword.clear_values();
  keyword.add_value(copy);
}

void LA_KEYWORD_TABLE::add_keyword(const char* name, const char* value) {
  entry(name).add_value(value);
}

unsigned char LA_KEYWORD_TABLE::expand(const char* options, char* result, int size) const {
  const std::size_t length = UT_STR::Len(options);
  if (length >= LA_MAX_PATH) {
    message().issueError("Launcher: Option string \"%s\" is longer than %d characters\n", options,
                         LA_MAX_PATH - 1);
    std::memmove(result, options, length + 1);
    return 0;
  }
  // A copy, as options may be the same buffer as result.
  char text[LA_MAX_PATH];
  UT_STR::Copy(text, options);
  const la_expansion expansion = la_expand({text, length}, entries, result, size);
  if (expansion.fault == la_template_fault::NONE) return 1;

  if (!is_stray(expansion.fault)) UT_STR::Copy(result, text);
  if (expansion.fault == la_template_fault::TOO_LONG) {
    message().issueError(
        "Launcher: The expansion of option string \"%s\" is longer than %d characters\n", text,
        size - 1);
  } else {
    report(expansion);
  }
  return 0;
}

void LA_KEYWORD_TABLE::dump() const {
  for (const LA_KEYWORD_ENTRY* entry : entries) entry->dump();
}
