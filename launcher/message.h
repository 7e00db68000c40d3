// Where the launcher's messages come from, and what each room reports by beside them.
#ifndef KESTREL_LAUNCHER_MESSAGE_H
#define KESTREL_LAUNCHER_MESSAGE_H

#include "host/port_msgman.h"

/// The message manager, for one message from the line that calls this.
Port_MsgManData& la_launcher_message(int line = __builtin_LINE());

/// What the rooms of a find report with, besides messages. The counts are the launcher's.
struct la_report {
  bool detail;  ///< detail messages are wanted
  int& errors;
  int& warnings;
};

#endif
