#include "rules/rule_fields.h"

namespace {

/// A store function made of a setter that cannot fail.
template <auto setter>
bool text(LA_RULE& rule, const char* value) {
  (rule.*setter)(value);
  return true;
}

template <const la_program& program>
bool directory(LA_RULE& rule, const char* value) {
  rule.set_dir(program, value);
  return true;
}

template <const la_program& program, unsigned short level>
bool status(LA_RULE& rule, const char* value) {
  return rule.add_status(program, level, value);
}

constexpr const la_program& NETLISTER = LA_RULE::NETLISTER;
constexpr const la_program& CHECKER = LA_RULE::CHECKER;

constexpr la_rule_field FIELDS[] = {
    {"NetlistFile", text<&LA_RULE::set_netlist_file>, 594, true},
    {"TargetExtension", text<&LA_RULE::set_target>, 605, true},
    {"", nullptr},  // The dependency files.
    {"Netlister", text<&LA_RULE::set_netlister>, 632, true},
    {"NetlisterTopOptions", text<&LA_RULE::set_netlister_top_options>},
    {"NetlisterOptions", text<&LA_RULE::set_netlister_options>},
    {"NetlisterDirectory", directory<NETLISTER>},
    {"Checker", text<&LA_RULE::set_checker>},
    {"CheckerDirectory", directory<CHECKER>},
    {"NetlisterSuccessStatus", status<NETLISTER, LA_SUCCESS>, 670},
    {"NetlisterWarningStatus", status<NETLISTER, LA_WARNING>, 682},
    {.keyword = "NetlisterFatalStatus",
     .store = status<NETLISTER, LA_FATAL>,
     .line = 694,
     .completes = &NETLISTER},
    {.keyword = "CheckerSuccessStatus",
     .store = status<CHECKER, LA_SUCCESS>,
     .line = 715,
     .name_in_message = "CheckerSuccesStatus"},
    {"CheckerWarningStatus", status<CHECKER, LA_WARNING>, 727},
    {.keyword = "CheckerFatalStatus",
     .store = status<CHECKER, LA_FATAL>,
     .line = 739,
     .completes = &CHECKER},
};

}  // namespace

std::span<const la_rule_field> la_rule_fields() {
  return FIELDS;
}

std::vector<const char*> rule_keywords() {
  std::vector<const char*> keywords = {"RuleName"};
  for (const la_rule_field& field : FIELDS) {
    if (field.store != nullptr) keywords.push_back(field.keyword);
  }
  return keywords;
}
