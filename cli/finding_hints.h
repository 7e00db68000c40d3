// Hints on what is wrong in rules, from the error messages and the lines that they name.
#ifndef KESTREL_CLI_FINDING_HINTS_H
#define KESTREL_CLI_FINDING_HINTS_H

#include <string>
#include <unordered_set>
#include <vector>

/// A line of a rules file, and those around it. Lines count from 1; what is not there is empty.
struct line_of_rules {
  const std::vector<std::string>& lines;
  int number;

  const std::string& text() const { return text(number); }
  const std::string& text(int of) const;
};

/// Collects hints on error messages, each of them once.
class finding_hints {
 public:
  /// Adds the hint on a message, if there is one.
  void add(const std::string& error);
  const std::vector<std::string>& all() const { return hints_; }

 private:
  void read(const std::string& file);

  std::vector<std::string> hints_;
  std::unordered_set<std::string> given_;
  std::string file_;  ///< the one that was read last
  std::vector<std::string> lines_;
};

#endif
