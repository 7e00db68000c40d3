// Starts a program.
#ifndef KESTREL_HOST_SYSTEM_SPAWN_H
#define KESTREL_HOST_SYSTEM_SPAWN_H

#include <sys/types.h>

#include <string>
#include <vector>

/// Starts the program words[0], with the environment of this process, no signal blocked, every
/// signal at its default, and standard input from /dev/null. output: the descriptor for its
/// standard output and error, above 2; or -1 to share those of this process. own_group: it leads a
/// process group of its own. Returns 0, or the error number.
int la_spawn(std::vector<std::string>& words, int output, bool own_group, pid_t& child);

#endif
