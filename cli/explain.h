// Explanations for people: the answer, and what it rests on.
#ifndef KESTREL_CLI_EXPLAIN_H
#define KESTREL_CLI_EXPLAIN_H

#include <string>

#include "cli/answer.h"
#include "launcher/explanation.h"

/// The answer in one line, then the steps or the loop, the places, and the rules that do not serve.
std::string explained(const outcome& found, const LA_EXPLANATION& why);

#endif
