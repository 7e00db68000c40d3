// The rules of a set by their extensions.
#ifndef KESTREL_LAUNCHER_RULE_INDEX_H
#define KESTREL_LAUNCHER_RULE_INDEX_H

#include <string>
#include <unordered_map>
#include <vector>

#include "rules/baslarules.h"

/// Numbers the extensions that the rules name, ignoring the case of letters, and knows for each
/// which rules produce it. As files are looked for as they are spelt, it numbers the spellings of
/// the extensions that rules need, too.
class la_rule_index {
 public:
  explicit la_rule_index(const DARRAY_LA_RULE_PTR& rules) : producers_(1) {
    for (int i = 0; i < rules.count; ++i) {
      const LA_RULE& rule = *rules.elements[i];
      // In a set that is not valid a rule may lack its files: it can then not be used.
      const bool usable = rule.netlist_file && rule.target;
      const char* needed = usable ? rule.netlist_file->get_ext() : nullptr;
      needed_.push_back(add(needed));
      const auto spelling =
          spellings_.try_emplace(needed != nullptr ? needed : "", spellings_.size());
      spelling_.push_back(spelling.first->second);
      const int made = add(usable ? rule.target->get_ext() : nullptr);
      if (made != NO_EXTENSION) producers_[static_cast<std::size_t>(made)].push_back(i);
    }
  }

  /// The number of an extension; NO_EXTENSION for null and for one that no rule names.
  int extension(const char* ext) const {
    const auto found = ext != nullptr ? numbers_.find(key(ext)) : numbers_.end();
    return found != numbers_.end() ? found->second : NO_EXTENSION;
  }
  /// The extension of the rule's netlist file.
  int needed(int rule) const { return needed_[static_cast<std::size_t>(rule)]; }
  /// The spelling of that extension, from 0 to num_spellings() - 1.
  std::size_t spelling(int rule) const { return spelling_[static_cast<std::size_t>(rule)]; }
  std::size_t num_spellings() const { return spellings_.size(); }
  /// The rules whose target has this extension, in the order of the set.
  const std::vector<int>& producers(int extension) const {
    return producers_[static_cast<std::size_t>(extension)];
  }

 private:
  /// Nothing produces a file of no extension.
  static constexpr int NO_EXTENSION = 0;

  static std::string key(const char* ext) {
    std::string lower(ext);
    UT_STR::Lower(lower.data());
    return lower;
  }
  int add(const char* ext) {
    if (ext == nullptr) return NO_EXTENSION;
    const auto [place, is_new] =
        numbers_.try_emplace(key(ext), static_cast<int>(producers_.size()));
    if (is_new) producers_.emplace_back();
    return place->second;
  }

  std::unordered_map<std::string, int> numbers_;
  std::vector<std::vector<int>> producers_;
  std::vector<int> needed_;
  std::unordered_map<std::string, std::size_t> spellings_;
  std::vector<std::size_t> spelling_;
};

#endif
