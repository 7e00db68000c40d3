// What is said when the installation roots do not hold what is looked for in them.
#ifndef KESTREL_CLI_ROOTS_H
#define KESTREL_CLI_ROOTS_H

#include "rules/baslarules.h"

/// Says so when there are no rules at all: the data of the installation is probably not found.
void tell_if_empty(const LA_RULE_SET& set);

#endif
