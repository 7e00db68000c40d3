// Completions of the command line.
#ifndef KESTREL_CLI_COMPLETION_H
#define KESTREL_CLI_COMPLETION_H

#include <string>

/// The completions for a shell, "bash" or "zsh", as a script for it; an empty text for any other.
std::string completion_for(const std::string& shell);

#endif
