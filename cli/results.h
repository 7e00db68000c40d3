// What names came to, on standard output and in a summary.
#ifndef KESTREL_CLI_RESULTS_H
#define KESTREL_CLI_RESULTS_H

#include <cstddef>
#include <string>

#include "cli/settings.h"

/// What became of one name.
struct resolution {
  std::string name;
  short result;
  std::string source;
  std::string netlist;
  bool is_built;      ///< a netlister has been run for it, or would be
  int warnings;       ///< reported on the way
  std::string error;  ///< the first that was reported; empty when none was
};

/// Prints the netlist if it was found, or a line of JSON.
void print_result(const settings& set, const resolution& of);

/// Prints the last line of JSON, with the errors and warnings that were shown.
void print_totals(bool ok);

/// Counts what the names came to.
class tally {
 public:
  void add(const resolution& next);
  /// Tells it, where there was more than one name. is_dry_run: nothing was started.
  void tell(std::size_t names, bool is_dry_run) const;

 private:
  int built_ = 0;
  int up_to_date_ = 0;
  int not_found_ = 0;
  int failed_ = 0;
};

#endif
