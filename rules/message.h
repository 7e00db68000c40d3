// The origin of the messages on rules.
#ifndef KESTREL_RULES_MESSAGE_H
#define KESTREL_RULES_MESSAGE_H

#include "host/port_msgman.h"

/// The message manager, for one message from this line of rules/baslarules.cpp.
Port_MsgManData& la_rules_message(int line = __builtin_LINE());

#endif
