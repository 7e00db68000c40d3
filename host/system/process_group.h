// Tells whether anything in a process group still lives.
#ifndef KESTREL_HOST_SYSTEM_PROCESS_GROUP_H
#define KESTREL_HOST_SYSTEM_PROCESS_GROUP_H

#include <sys/types.h>

/// Whether a process of the group, the number of its leader, still lives. Those that have ended and
/// that nobody has reaped do not, as far as the system can tell. Reaps those that come to this
/// process.
bool la_group_lives(pid_t group);

#endif
