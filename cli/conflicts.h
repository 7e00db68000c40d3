// Names of one call that would make one file from different ones.
#ifndef KESTREL_CLI_CONFLICTS_H
#define KESTREL_CLI_CONFLICTS_H

#include <map>
#include <string>
#include <unordered_map>
#include <vector>

#include "launcher/baslauncher.h"

/// Lets no chain of a launcher make a file that an earlier chain has made from another one, and
/// says so as an error.
class conflicts {
 public:
  /// The launcher must outlive this object. names: all of the call.
  conflicts(LA_LAUNCHER& launcher, const std::vector<std::string>& names);
  conflicts(const conflicts&) = delete;
  conflicts& operator=(const conflicts&) = delete;
  ~conflicts();

  /// Whose chains come from now on.
  void begin(const std::string& name);
  /// What its chain has made is taken; of one that failed, what netlisters ran for.
  void end(bool is_found);

 private:
  static unsigned char may_build(void* self, const char* const* files, int count);

  struct origin {
    std::string input;
    std::string name;
  };
  LA_LAUNCHER& launcher_;
  std::unordered_map<std::string, int> stems_;  ///< how many names have it
  std::string name_;
  std::map<std::string, origin> planned_;  ///< by the chain of the moment
  std::map<std::string, origin> origins_;  ///< of what has been made
};

#endif
