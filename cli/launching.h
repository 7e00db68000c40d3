// The launcher that the settings ask for.
#ifndef KESTREL_CLI_LAUNCHING_H
#define KESTREL_CLI_LAUNCHING_H

#include <string>

#include "cli/settings.h"
#include "launcher/baslauncher.h"

/// Whether the directories that the settings name can be used. Completes the names of those to
/// search, so that nobody needs to ask for the current directory again.
std::string complete_directories(settings& set);

/// A launcher with these settings, whose rules are loaded.
LA_LAUNCHER launcher_of(const settings& set);

/// The exit status after one more result of find.
int worse(int status, short result);

#endif
