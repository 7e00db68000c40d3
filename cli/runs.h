// What the command has to say of the netlisters that were run for a name.
#ifndef KESTREL_CLI_RUNS_H
#define KESTREL_CLI_RUNS_H

#include <string>
#include <vector>

#include "host/port_file.h"
#include "launcher/explanation.h"

/// Says how the netlisters ended that did not succeed, and which was the first to leave its output
/// unwritten. start: when the first of them had not started yet, in nanoseconds since 1970. Returns
/// whether all that ended well have written their outputs.
bool tell_of_runs(const std::string& name, const std::vector<LA_RUN>& runs, __int64 start);

#endif
