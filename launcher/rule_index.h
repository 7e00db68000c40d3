// The rules of a set by their extensions.
#ifndef KESTREL_LAUNCHER_RULE_INDEX_H
#define KESTREL_LAUNCHER_RULE_INDEX_H

#include <utility>
#include <vector>

#include "host/base/text_numbers.h"
#include "rules/baslarules.h"

using DARRAY_LA_RULE_CONST_PTR = UT_TYPED_DARRAY<const LA_RULE*>;

/// Knows which rules of a set produce files of an extension, whose letters' case does not count. As
/// files are looked for as they are spelt, it numbers the spellings of the extensions, too. Rules
/// are numbers in the order of the set, which must outlive this object.
class la_rule_index {
 public:
  static constexpr int NONE = -1;

  explicit la_rule_index(const DARRAY_LA_RULE_PTR& rules)
      : set_(rules), rules_(static_cast<std::size_t>(rules.count)) {
    add(nullptr);
    for (int i = rules.count - 1; i >= 0; --i) {
      const LA_RULE& rule = *rules.elements[i];
      // In a set that is not valid a rule may lack its files: it can then not be used.
      const bool usable = rule.netlist_file && rule.target;
      la_at(rules_, i).needed = add(usable ? rule.netlist_file->get_ext() : nullptr);
      const std::size_t made = add(usable ? rule.target->get_ext() : nullptr);
      if (made == NO_EXTENSION) continue;
      int& first = first_producers_[extension_of_[made]];
      la_at(rules_, i).next_producer = std::exchange(first, i);
    }
  }

  /// The number of rules, and the rule of a number.
  int count() const { return set_.count; }
  const LA_RULE& operator[](int rule) const { return *set_.elements[rule]; }
  /// The first rule whose target has this extension, or NONE.
  int first_producer(const char* ext) const {
    const std::size_t extension = extensions_.find(ext);
    return extension < extensions_.count() ? first_producers_[extension] : NONE;
  }
  /// The first rule that produces files of the extension that the rule needs, or NONE.
  int first_producer_for(int rule) const { return first_producers_[extension_of_[spelling(rule)]]; }
  /// The next rule whose target has the same extension as that of the rule, or NONE.
  int next_producer(int rule) const { return la_at(rules_, rule).next_producer; }
  /// The spelling of the extension that the rule needs, from 0 to num_spellings() - 1.
  std::size_t spelling(int rule) const { return la_at(rules_, rule).needed; }
  std::size_t num_spellings() const { return extension_of_.size(); }

 private:
  struct rule_entry {
    std::size_t needed = NO_EXTENSION;  ///< as it is spelt
    int next_producer = NONE;
  };
  /// Nothing produces a file of no extension.
  static constexpr std::size_t NO_EXTENSION = 0;

  /// The number of a spelling, which is added if it is new.
  std::size_t add(const char* ext) {
    const std::size_t spelling = spellings_.number_of(ext);
    if (spelling == extension_of_.size()) {
      extension_of_.push_back(extensions_.number_of(ext));
      first_producers_.resize(extensions_.count(), NONE);
    }
    return spelling;
  }

  const DARRAY_LA_RULE_PTR& set_;
  std::vector<rule_entry> rules_;
  la_text_numbers<UT_STR::Compare> spellings_;
  la_text_numbers<UT_STR::ICompare> extensions_;
  std::vector<std::size_t> extension_of_;  ///< by spelling
  std::vector<int> first_producers_;       ///< by extension
};

#endif
