// What names came to, on standard output and in a summary.
#ifndef KESTREL_CLI_RESULTS_H
#define KESTREL_CLI_RESULTS_H

#include <cstddef>
#include <string>

#include "cli/settings.h"

/// Prints the result of one name: its netlist if it was found, or a line of JSON.
void print_result(const settings& set, const std::string& name, short result, const char* source,
                  const char* netlist);

/// Prints the last line of JSON.
void print_totals(bool ok, int errors, int warnings);

/// Counts what the names came to.
class tally {
 public:
  void add(short result, bool is_built);
  /// Tells it, where there was more than one name. is_dry_run: nothing was started.
  void tell(std::size_t names, bool is_dry_run) const;

 private:
  int built_ = 0;
  int up_to_date_ = 0;
  int not_found_ = 0;
  int failed_ = 0;
};

#endif
