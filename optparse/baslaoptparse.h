// The table of keywords, and the template language of netlister options.
//
// A template is text with
//   $name     a keyword reference: "$", any character, then letters and underscores
//   [ ... ]   an optional group: kept when something in it was substituted and no keyword directly
//             in it lacks a value; optional groups nest
//   { ... }   a repeat group: one copy for each value of the keywords in it
// There is no escape character.
#ifndef KESTREL_OPTPARSE_BASLAOPTPARSE_H
#define KESTREL_OPTPARSE_BASLAOPTPARSE_H

#include <string>

#include "host/ut_darray.h"
#include "host/ut_str.h"

/// One keyword with its values: strings owned by the entry, or a single null for no value.
class LA_KEYWORD_ENTRY {
 public:
  /// A keyword of this name, without values.
  explicit LA_KEYWORD_ENTRY(const char* name);
  LA_KEYWORD_ENTRY(const LA_KEYWORD_ENTRY&) = delete;
  LA_KEYWORD_ENTRY& operator=(const LA_KEYWORD_ENTRY&) = delete;
  ~LA_KEYWORD_ENTRY() { clear_values(); }

  /// Appends a copy of value; null appends an absent value.
  void add_value(const char* value);
  /// Removes all values.
  void clear_values();
  /// Issues one status message for each value.
  void dump() const;

  const std::string name;
  DARRAY_NAME values;  ///< at least one in a table
};

using DARRAY_LA_KEYWORD_ENTRY_PTR = UT_TYPED_DARRAY<LA_KEYWORD_ENTRY*>;

/// The keywords that a template may name, in the order in which they were defined.
class LA_KEYWORD_TABLE {
 public:
  LA_KEYWORD_TABLE() : entries(10) {}
  LA_KEYWORD_TABLE(const LA_KEYWORD_TABLE&) = delete;
  LA_KEYWORD_TABLE& operator=(const LA_KEYWORD_TABLE&) = delete;
  ~LA_KEYWORD_TABLE();

  /// Makes value the only one of the keyword; null means no value. Names are compared exactly.
  void set_keyword(const char* name, const char* value);
  /// Appends a value to those of the keyword.
  void add_keyword(const char* name, const char* value);
  /// Expands the template in options, a buffer of size characters, in place. The template holds
  /// less than LA_MAX_PATH characters. Returns 1, or 0 after an error message; only a template that
  /// takes more than 100 steps fails without one. After a failure options holds the template, or,
  /// when the result has a stray "}" or "]", that result. Allocates nothing.
  unsigned char expand(char* options, int size = LA_MAX_PATH) const {
    return expand(options, options, size);
  }
  /// The same for a template that stays where it is: result, a buffer of size characters with room
  /// for the template, then holds what options holds above.
  unsigned char expand(const char* options, char* result, int size) const;
  /// Issues one status message for each value of each keyword.
  void dump() const;

 private:
  LA_KEYWORD_ENTRY& entry(const char* name);

  DARRAY_LA_KEYWORD_ENTRY_PTR entries;
};

#endif
