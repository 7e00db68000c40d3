// What the command line asks for.
#ifndef KESTREL_CLI_SETTINGS_H
#define KESTREL_CLI_SETTINGS_H

#include <span>
#include <string>
#include <vector>

/// What the command is to do.
enum class task {
  RESOLVE,
  EXPLAIN,
  CHECK,
  LIST_RULES,
  LIST_PARTS,
  GRAPH,
  COMPLETION,
  HELP,
  VERSION
};

/// Whether a task works on names.
bool takes_names(task what);

/// The settings of one call. Texts that are pointers belong to the command line.
struct settings {
  task what = task::RESOLVE;
  const char* part = nullptr;
  std::vector<std::string> search_dirs;
  std::vector<const char*> libraries;
  const char* output_dir = nullptr;
  const char* user_rules = nullptr;
  const char* shell = nullptr;
  std::vector<const char*> names_files;
  std::vector<std::string> names;
  bool force = false;
  bool ignore_timestamps = false;
  bool ignore_locs = false;
  bool add_pads = false;
  bool quiet = false;
  bool aul = false;
  bool top = true;
  bool dry_run = false;
  bool detail = false;
  bool json = false;
  bool debug = false;
  bool strict = false;
};

/// One option. The table of them is the source of the parser, of the help and of the completions.
struct option {
  const char* short_name;  ///< with its dash; null when there is none
  const char* long_name;
  const char* argument;  ///< what its argument is called; null when it takes none
  const char* help;
  void (*apply)(settings& to, const char* argument);
};

/// All options, in the order of the help.
std::span<const option> all_options();

/// Reads a command line. Returns an empty text, or what is wrong with it.
std::string read_command_line(int count, const char* const* words, settings& to);

/// The text of --help.
std::string help_text();

#endif
