#include "rules/validation.h"

#include <unordered_map>
#include <utility>
#include <vector>

#include "host/base/text_numbers.h"
#include "optparse/baslaoptparse.h"
#include "rules/conversion.h"
#include "rules/message.h"

namespace {

/// Sets the keywords that a template may use to stand-ins for a run's values. A keyword that may
/// lack a value in a run has none here, so that a template that relies on it is refused.
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

bool is_none(const char* text) {
  return UT_STR::ICompare(text, "NONE") == 0;
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
  la_rules_message().issueError("Launcher: Error parsing %s \"%s\" for rule %s\n", keyword,
                                fits ? options : text, rule.rule_name.get());
  return false;
}

/// Checks a rule on its own.
bool check_rule(const LA_RULE& rule, const LA_KEYWORD_TABLE& table) {
  bool good = true;
  const char* name = rule.rule_name;
  if (!names_a_file(rule.netlist_file)) {
    la_rules_message().issueError("Launcher: Rule %s does not define a NetlistFile\n", name);
    good = false;
  }
  if (!names_a_file(rule.target)) {
    la_rules_message().issueError("Launcher: Rule %s does not define a TargetExtension\n", name);
    good = false;
  } else if (rule.target->get_name() != nullptr) {
    la_rules_message().issueWarning("Launcher: Rule %s only extension is used. Ignoring name %s\n",
                                    name, rule.target->get_name());
  }
  if (rule.netlister != nullptr && is_none(rule.netlister)) {
    la_rules_message().issueError("Launcher: Rule %s can not set Netlister to NONE\n", name);
    good = false;
  }
  if (!check_template(rule, "NetlisterTopOptions", rule.netlister_top_options, table)) good = false;
  if (!check_template(rule, "NetlisterOptions", rule.netlister_options, table)) good = false;
  return good;
}

/// Reports every pair of rules for the same netlist file and target, the earlier rule first.
bool check_redefinitions(const DARRAY_LA_RULE_PTR& batch) {
  constexpr int NONE = -1;
  // By rule: the next rule for the same conversion.
  std::vector<int> next(static_cast<std::size_t>(batch.count), NONE);
  std::unordered_map<std::string, int> last;
  for (int i = 0; i < batch.count; ++i) {
    const LA_RULE& rule = *batch.elements[i];
    // A target without extension is that of no other rule.
    const char* ext = rule.target->get_ext();
    if (ext == nullptr) continue;
    const auto [same, is_new] =
        last.try_emplace(la_conversion(rule.netlist_file->get_tail(), ext), i);
    if (!is_new) la_at(next, std::exchange(same->second, i)) = i;
  }
  bool good = true;
  for (int a = 0; a < batch.count; ++a) {
    for (int b = la_at(next, a); b != NONE; b = la_at(next, b)) {
      la_rules_message().issueError("Launcher: Rule %s redefines rule %s\n",
                                    batch.elements[a]->rule_name.get(),
                                    batch.elements[b]->rule_name.get());
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
