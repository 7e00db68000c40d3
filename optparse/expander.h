// The template language: expands one option template, and issues no message.
#ifndef KESTREL_OPTPARSE_EXPANDER_H
#define KESTREL_OPTPARSE_EXPANDER_H

#include <string_view>

#include "optparse/baslaoptparse.h"

/// Why a template has no expansion, or one that cannot be used.
enum class la_template_fault {
  NONE,
  UNDEFINED_KEYWORD,
  NOT_OPTIONAL,    ///< a keyword outside every group has no value
  NESTED_REPEAT,   ///< a "{" in a repeat group
  OPEN_REPEAT,     ///< a "{" without "}"
  OPEN_OPTIONAL,   ///< a "[" without "]"
  TOO_MANY_STEPS,  ///< more than 100 groups and copies of groups
  TOO_LONG,        ///< more than the buffer holds
  STRAY_REPEAT,    ///< a "}" in the expansion
  STRAY_OPTIONAL,  ///< a "]" in the expansion
};

/// What came of a template.
struct la_expansion {
  la_template_fault fault = la_template_fault::NONE;
  std::string_view name;  ///< the template's name for the keyword at fault
};

/// Expands text into result, a buffer of size characters apart from text. The first keyword whose
/// name is a prefix of a reference, in any case of letters, is the one that is meant. Where the
/// fault is a stray bracket, result holds the expansion with it; after any other fault, it holds
/// nothing of use. Allocates nothing.
la_expansion la_expand(std::string_view text, const DARRAY_LA_KEYWORD_ENTRY_PTR& keywords,
                       char* result, int size);

#endif
