// Decides whether a step of a chain must run, and why.
#ifndef KESTREL_LAUNCHER_DECISION_H
#define KESTREL_LAUNCHER_DECISION_H

#include <functional>
#include <string>
#include <vector>

#include "file/baslafile.h"
#include "launcher/explanation.h"

/// What a decision rests on, beside what is asked for.
struct la_step_facts {
  const LA_RULE& rule;
  bool force;                     ///< the host wants every step to run
  bool ignore_timestamps;         ///< the host wants no step to run whose output exists
  bool after_rebuild;             ///< an earlier step of the chain has run
  const LA_FULLFILE& source;      ///< of the chain: dependency files lie beside it
  Port::FileStatus input_status;  ///< asked for only where the decision needs it
  const char* output;
};

/// A decision, and what it was seen from.
struct la_decision {
  bool runs() const { return what > LA_BUILD_UNDECIDED; }

  LA_BUILD_DECISION what = LA_BUILD_UNDECIDED;
  Port::FileStatus output_status;  ///< as of a missing file when it was not asked for
  LA_EXPLANATION::SEEN newer;      ///< the dependency file that is newer; without path if none is
  bool is_output_left_by_failure = false;
};

/// Asks what is known of a file; the path may be null.
using la_ask = std::function<Port::FileStatus(const char* path)>;

/// Decides. Asks for the output and the dependency files, each once, and only where the decision
/// depends on it.
la_decision decide(const la_step_facts& step, const la_ask& ask);

/// The dependency files of a rule, beside the source. One that is too long has an empty path.
std::vector<std::string> dependency_files_of(const LA_RULE& rule, const LA_FULLFILE& source);

/// The status message on a decision, with "%s" for the output, or null when there is none:
/// decisions for a run are told only in detail.
const char* report_on(LA_BUILD_DECISION decision, bool detail);

#endif
