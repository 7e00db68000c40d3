// What is said of names for which nothing was found.
#ifndef KESTREL_CLI_NOT_FOUND_H
#define KESTREL_CLI_NOT_FOUND_H

#include <map>
#include <set>
#include <string>
#include <vector>

#include "file/baslafile.h"
#include "host/ut_str.h"
#include "rules/baslarules.h"

/// Says that names are not found, and what may be meant.
class not_found {
 public:
  /// Both must outlive this object. rules may be null.
  not_found(const LA_RULE_SET* rules, const std::vector<std::string>& search_dirs)
      : rules_(rules), search_dirs_(search_dirs) {}

  void tell(const std::string& name);

 private:
  struct any_case {
    bool operator()(const std::string& a, const std::string& b) const {
      return UT_STR::ICompare(a.c_str(), b.c_str()) < 0;
    }
  };
  std::string what_is_there(const std::string& name) const;
  std::map<std::string, std::string> names_near(const LA_FULLFILE& file) const;

  const LA_RULE_SET* rules_;
  const std::vector<std::string>& search_dirs_;
  std::set<std::string, any_case> extensions_;  ///< of what rules read, and of netlists
  int told_ = 0;
};

#endif
