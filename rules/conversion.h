// Keys under which rules for the same conversion are found again.
#ifndef KESTREL_RULES_CONVERSION_H
#define KESTREL_RULES_CONVERSION_H

#include <string>

#include "host/ut_str.h"

/// A key for what a rule converts from and into, neither of them null. The case of letters does not
/// count.
inline std::string la_conversion(const char* from, const char* into) {
  std::string key = std::string(from) + "/" + into;
  UT_STR::Lower(key.data());
  return key;
}

#endif
