// The running child, for those who interrupt it.
#ifndef KESTREL_HOST_SYSTEM_RUNNING_CHILD_H
#define KESTREL_HOST_SYSTEM_RUNNING_CHILD_H

#include <sys/types.h>

/// What Port_Interrupt is told of the child that runs, in this order.
namespace la_running_child {

/// Whether a child is to lead a process group of its own.
bool leads_group();
/// Requests go to this child from now on, also one that came while it was started.
void started(pid_t child);
/// To be called before the child is reaped: its number may be that of another process then. That
/// of a group stays as long as the group has members.
void ended();
/// Ends what an interrupted child has left in its group.
void reaped(pid_t child);

}  // namespace la_running_child

#endif
