// Why a find does what it does.
#ifndef KESTREL_LAUNCHER_EXPLANATION_H
#define KESTREL_LAUNCHER_EXPLANATION_H

#include <string>
#include <vector>

#include "host/port_file.h"

class LA_RULE;

/// Why a step of a chain runs, or does not.
enum LA_BUILD_DECISION : short {
  LA_BUILD_UNSUPPORTED = -3,
  LA_BUILD_UP_TO_DATE = -2,
  LA_BUILD_SKIPPED = -1,
  LA_BUILD_UNDECIDED = 0,
  LA_BUILD_FORCED = 1,  // From here on the netlister runs.
  LA_BUILD_MISSING = 2,
  LA_BUILD_OUT_OF_DATE = 3,
  LA_BUILD_AFTER_REBUILD = 4,
  LA_BUILD_NO_TIMESTAMP = 5,
};

/// What LA_LAUNCHER::find records on the way, for those who want to show it: what it saw and what
/// it decided, in this order, where it saw and decided it. The rules belong to the launcher.
struct LA_EXPLANATION {
  /// A place where a file was looked for. What is passed over is there, but another one is taken.
  enum SIGHTING { MISSING, FOUND, PASSED_OVER };
  struct PROBE {
    SIGHTING sighting;
    std::string path;
  };

  /// A rule that could have made a file that was wanted.
  enum VERDICT {
    TAKEN,
    NO_SOURCE,          ///< what it needs is not there, and cannot be made
    NOT_WHAT_IS_NAMED,  ///< the user named a file, and it is not what the rule needs
    FOR_ANOTHER_NAME,   ///< the rule is for netlists of another name
    IN_A_LOOP,          ///< it leads into a loop
    NOT_NEEDED,         ///< a rule before it serves
  };
  struct CONSIDERED {
    const LA_RULE* rule;
    VERDICT verdict;
  };

  /// A step of the chain. A file that was not asked for does not exist, in its status.
  struct STEP {
    const LA_RULE* rule;
    std::string input;
    std::string output;
    Port::FileStatus input_status;
    Port::FileStatus output_status;
    std::string dependency;  ///< the dependency file that is newer than the output, if any
    Port::FileStatus dependency_status;
    LA_BUILD_DECISION decision;
    std::string command;  ///< empty when nothing is run
  };

  std::vector<PROBE> probes;
  std::vector<CONSIDERED> rules;
  std::vector<STEP> steps;
};

#endif
