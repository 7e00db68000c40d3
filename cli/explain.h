// Explanations for people.
#ifndef KESTREL_CLI_EXPLAIN_H
#define KESTREL_CLI_EXPLAIN_H

#include <string>

#include "launcher/explanation.h"

/// What a find came to.
struct outcome {
  std::string name;
  short result;
  std::string netlist;
  std::string error;  ///< what was reported, in lines; empty if nothing was
};

/// The answer in one line, then what it rests on: places, rules, steps.
std::string explained(const outcome& found, const LA_EXPLANATION& why);

/// A difference of two times in nanoseconds, in its two greatest units: "2 min 3 s".
std::string duration(unsigned long long nanoseconds);

#endif
