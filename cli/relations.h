// How the rules of a set stand to each other.
#ifndef KESTREL_CLI_RELATIONS_H
#define KESTREL_CLI_RELATIONS_H

#include <string>
#include <vector>

#include "rules/baslarules.h"

/// The kind of a file: its extension in lower case, with the dot.
std::string kind_of(const LA_FILE& file);

/// What is to be said of one rule among the others.
struct relation {
  const LA_RULE* overridden_by = nullptr;  ///< an earlier rule that serves whenever this one could
  bool is_in_loop = false;                 ///< it can lead back to itself
  bool is_useful = false;                  ///< it leads to the native netlist
};

/// The relations of all rules of the set, in their order.
std::vector<relation> relations_of(const LA_RULE_SET& set);

#endif
