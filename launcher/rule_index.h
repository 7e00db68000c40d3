// The rules of a set by their extensions.
#ifndef KESTREL_LAUNCHER_RULE_INDEX_H
#define KESTREL_LAUNCHER_RULE_INDEX_H

#include <cstring>
#include <utility>
#include <vector>

#include "host/hash_index.h"
#include "rules/baslarules.h"

/// Knows which rules of a set produce files of an extension, whose letters' case does not count. As
/// files are looked for as they are spelt, it numbers the spellings of the extensions, too. Rules
/// are numbers in the order of the set, which must outlive this object.
class la_rule_index {
 public:
  static constexpr int NONE = -1;

  explicit la_rule_index(const DARRAY_LA_RULE_PTR& rules)
      : rules_(static_cast<std::size_t>(rules.count)) {
    for (int i = rules.count - 1; i >= 0; --i) {
      const LA_RULE& rule = *rules.elements[i];
      // In a set that is not valid a rule may lack its files: it can then not be used.
      const bool usable = rule.netlist_file && rule.target;
      la_at(rules_, i).needed = add(usable ? rule.netlist_file->get_ext() : nullptr);
      const int made = add(usable ? rule.target->get_ext() : nullptr);
      if (made == NO_EXTENSION) continue;
      int& first = la_at(first_producers_, la_at(spellings_, made).extension);
      la_at(rules_, i).next_producer = std::exchange(first, i);
    }
  }

  /// The first rule whose target has this extension, or NONE.
  int first_producer(const char* ext) const {
    const int extension =
        extensions_.find(la_hash(ext), [&](int number) { return is_extension(number, ext); });
    return extension != NONE ? la_at(first_producers_, extension) : NONE;
  }
  /// The first rule that produces files of the extension that the rule needs, or NONE.
  int first_producer_for(int rule) const {
    return la_at(first_producers_, la_at(spellings_, spelling(rule)).extension);
  }
  /// The next rule whose target has the same extension as that of the rule, or NONE.
  int next_producer(int rule) const { return la_at(rules_, rule).next_producer; }
  /// The spelling of the extension that the rule needs, from 0 to num_spellings() - 1.
  int spelling(int rule) const { return la_at(rules_, rule).needed; }
  std::size_t num_spellings() const { return spellings_.size(); }

 private:
  struct rule_entry {
    int needed = NO_EXTENSION;  ///< as it is spelt
    int next_producer = NONE;
  };
  struct spelling_entry {
    const char* text;
    int extension;
  };
  /// Nothing produces a file of no extension.
  static constexpr int NO_EXTENSION = 0;

  bool is_extension(int number, const char* ext) const {
    return UT_STR::ICompare(la_at(extension_texts_, number), ext) == 0;
  }
  /// The number of a spelling, which is added if it is new.
  int add(const char* ext) {
    if (ext == nullptr) return NO_EXTENSION;
    const std::uint32_t hash = la_hash(ext);
    int& spelt = by_spelling_.place(
        hash, [&](int number) { return std::strcmp(la_at(spellings_, number).text, ext) == 0; });
    if (spelt != NONE) return spelt;
    spelt = static_cast<int>(spellings_.size());
    int& extension = extensions_.place(hash, [&](int number) { return is_extension(number, ext); });
    if (extension == NONE) {
      extension = static_cast<int>(first_producers_.size());
      extension_texts_.push_back(ext);
      first_producers_.push_back(NONE);
    }
    spellings_.push_back({ext, extension});
    return spelt;
  }

  std::vector<rule_entry> rules_;
  std::vector<spelling_entry> spellings_ = {{"", NO_EXTENSION}};
  std::vector<const char*> extension_texts_ = {""};
  std::vector<int> first_producers_ = {NONE};  ///< by extension
  la_hash_index by_spelling_;
  la_hash_index extensions_;
};

#endif
