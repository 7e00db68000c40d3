// The rules as a picture.
#ifndef KESTREL_CLI_GRAPH_H
#define KESTREL_CLI_GRAPH_H

#include <string>

#include "rules/baslarules.h"

/// The rules as a directed graph in the language of Graphviz: extensions are nodes, rules are
/// edges, in the order of the set.
std::string graph_of(const DARRAY_LA_RULE_PTR& rules);

#endif
