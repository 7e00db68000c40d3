// The command line of a step.
#ifndef KESTREL_LAUNCHER_COMMAND_LINE_H
#define KESTREL_LAUNCHER_COMMAND_LINE_H

#include <string>

#include "file/baslafile.h"
#include "launcher/build_settings.h"
#include "launcher/command_options.h"
#include "launcher/message.h"

class LA_RULE;

/// Sets every keyword but those of a step's files.
void set_keywords(la_command_options& options, const la_build_settings& settings);

/// Makes the command line of a step: the rule's netlister, and the options that its template
/// expands to; top asks for those of the top level. Files below the current directory get relative
/// names. Returns an empty text when there is none, and has said why.
std::string make_command(const LA_RULE& rule, const LA_FULLFILE& input, const LA_FULLFILE& output,
                         la_command_options& options, bool top, const la_report& report);

#endif
