// What a find saw, decided and did, and why.
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

/// A netlister that a find announced, and how it ended. The rule belongs to the launcher.
struct LA_RUN {
  enum END {
    ONLY_ANNOUNCED,  ///< LA_TEST is set: nothing was started
    NOT_STARTED,     ///< it could not be started
    LOST,            ///< how it ended is not known
    INTERRUPTED,     ///< the host asked for an end
    ENDED,           ///< exit_code and level are known
  };

  const LA_RULE* rule;
  std::string input;
  std::string output;
  std::string command;
  END end = ONLY_ANNOUNCED;
  int exit_code = 0;
  unsigned short level = 0;  ///< LA_SUCCESS, LA_WARNING or LA_FATAL
  /// What the file system knew of the output before the run, and when it had ended.
  Port::FileStatus output_before;
  Port::FileStatus output_after;
};

/// What LA_LAUNCHER::find saw, decided and did, in the order in which it happened, for hosts that
/// show it. The rules belong to the launcher.
struct LA_EXPLANATION {
  /// A place where a file was looked for.
  enum SIGHTING {
    MISSING,
    FOUND,
    PASSED_OVER,     ///< it is there, but one in an earlier search directory is taken
    LEFT_BY_FAILURE  ///< it is there, but a failed run has left it: it counts as missing
  };
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
    IN_A_LOOP,          ///< it leads into a loop, or is in it
    NOT_NEEDED,         ///< a rule before it serves
  };
  struct CONSIDERED {
    const LA_RULE* rule;
    VERDICT verdict;
  };

  /// A file, and what the file system knows of it. One that was not asked for does not exist.
  struct SEEN {
    std::string path;
    Port::FileStatus status;
  };

  /// A step of the chain.
  struct STEP {
    const LA_RULE* rule;
    std::string input;
    std::string output;
    Port::FileStatus input_status;
    Port::FileStatus output_status;
    std::string dependency;  ///< the dependency file that is newer than the output, if any
    Port::FileStatus dependency_status;
    LA_BUILD_DECISION decision;
    std::string command;             ///< empty when nothing is run
    std::vector<SEEN> dependencies;  ///< all dependency files, those that are missing too
  };

  std::vector<PROBE> probes;
  std::vector<CONSIDERED> rules;
  /// The loop that was met, from a rule to the same rule again: each needs what the next one makes.
  /// Empty when there is none.
  std::vector<const LA_RULE*> loop;
  std::vector<STEP> steps;
};

#endif
