// Plans a chain of rules: what leads from a file that exists to one of the wanted extension.
#ifndef KESTREL_LAUNCHER_PLANNER_H
#define KESTREL_LAUNCHER_PLANNER_H

#include <functional>
#include <vector>

#include "launcher/explanation.h"
#include "launcher/lookup.h"
#include "launcher/rule_index.h"

/// What planning came to.
struct la_plan {
  enum OUTCOME {
    CHAIN,        ///< rules lead from source to a file of the wanted extension
    NOTHING,      ///< no rules do
    LOOP,         ///< rules that lead to each other were met
    INTERRUPTED,  ///< the host asked for an end
  };

  OUTCOME outcome = NOTHING;
  DARRAY_LA_RULE_CONST_PTR chain{3};  ///< in the order in which they run
  la_found_file source;               ///< what the first of them reads
  /// The numbers of the rules on the way into the loop and around it: each needs what the next one
  /// makes, and the last is one that has come before. Empty when there is no loop.
  std::vector<int> loop;
};

/// Looks for the file with this extension that a rule could read.
using la_find_input = std::function<bool(const char* ext, la_found_file& found)>;

/// Looks for a chain that makes a file with the extension wanted, for netlists called name. For
/// each rule, in the order of the set, a chain that produces its input is preferred to the input
/// itself. considered may be null; else it gets the rules that were considered. plan must be new.
void plan_chain(const la_rule_index& rules, const char* name, const char* wanted,
                const la_find_input& find_input,
                std::vector<LA_EXPLANATION::CONSIDERED>* considered, la_plan& plan);

#endif
