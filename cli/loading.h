// What is said of rules when they have been loaded, or could not be.
#ifndef KESTREL_CLI_LOADING_H
#define KESTREL_CLI_LOADING_H

#include "cli/settings.h"
#include "host/port_msgman.h"
#include "rules/baslarules.h"

/// Adds to what the library has said: what is wrong with a part that is not valid, and which places
/// were looked in where there are no rules at all, as a message of
/// the given level. rules may be null.
void tell_of_loading(const LA_RULE_SET* rules, const settings& set, Port_MsgLevel level);

/// Says which places were looked in where there is no device table. Returns whether there is one.
bool tell_of_device_tables();

#endif
