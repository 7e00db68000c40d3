#include "cli/roots.h"

#include "cli/console.h"

void tell_if_empty(const LA_RULE_SET& set) {
  if (set.is_valid && set.rules.count == 0) {
    complain("there are no rules; do MYCORVANE and CORVANE name installation roots?");
  }
}
