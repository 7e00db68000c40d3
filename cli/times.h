// Time stamps and differences between them, for people.
#ifndef KESTREL_CLI_TIMES_H
#define KESTREL_CLI_TIMES_H

#include <string>

#include "host/port_file.h"

/// A time stamp with milliseconds, in the time zone of the user.
std::string time_of(const Port::FileStatus& file);

/// How much newer a file is than an older one, in the two greatest units: "2 min 3 s".
std::string lead_of(const Port::FileStatus& newer, const Port::FileStatus& older);

#endif
