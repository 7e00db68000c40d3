// Answers to "what would you do, and why?": a line for a name, and a reason for a step.
#ifndef KESTREL_CLI_ANSWER_H
#define KESTREL_CLI_ANSWER_H

#include <string>

#include "launcher/explanation.h"

/// What a find came to.
struct outcome {
  std::string name;
  short result;
  std::string netlist;
  std::string error;  ///< what was reported, in lines; empty if nothing was
};

/// Why a step runs, or why not.
std::string reason_for(const LA_EXPLANATION::STEP& step);

/// What would be done for the name, and above all why, in one line.
std::string answer_to(const outcome& found, const LA_EXPLANATION& why);

/// A path without its directory.
std::string tail_of(const std::string& path);

#endif
