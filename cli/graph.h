// The rules as a picture.
#ifndef KESTREL_CLI_GRAPH_H
#define KESTREL_CLI_GRAPH_H

#include <string>

#include "rules/baslarules.h"

/// The rules as a directed graph in the language of Graphviz: extensions are nodes, rules are
/// edges, in the order of the set, each file of rules in a line style of its own. A rule that is
/// never used, as one before it has the same source and target, is grey; one that can lead back to
/// itself is red.
std::string graph_of(const LA_RULE_SET& set);

#endif
