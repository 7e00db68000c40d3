// The options of the netlisters of a chain, and the assurance that no name becomes an argument.
#ifndef KESTREL_LAUNCHER_COMMAND_OPTIONS_H
#define KESTREL_LAUNCHER_COMMAND_OPTIONS_H

#include <array>
#include <map>
#include <string>
#include <vector>

#include "optparse/baslaoptparse.h"

/// The keywords that a launcher defines.
inline constexpr std::array LA_OPTION_KEYWORDS = {
    "part",        "family",   "device", "pkg", "speed",  "infile",   "outfile",
    "ignore_locs", "add_pads", "quiet",  "aul", "OUTPUT", "libraries"};

/// The keywords of a chain. Those whose values are names of files or directories are kept twice:
/// as they are, and as stand-ins, which mean nothing in a command line. A template expanded with
/// the stand-ins shows which words its author meant.
class la_command_options {
 public:
  /// Gives a keyword a value, or none for null.
  void set_keyword(const char* keyword, const char* value);
  /// Gives a keyword a name as its value. A name in double quotes stands in them.
  void set_name(const char* keyword, const std::string& name);
  /// Adds a name to the values of a keyword.
  void add_name(const char* keyword, const std::string& name);

  /// Expands a template into a buffer of LA_MAX_OPTIONS characters, as LA_KEYWORD_TABLE does.
  unsigned char expand(const char* options_template, char* result) const;
  /// Whether a command line, made of start and the expanded template, splits into the words that
  /// the template's author meant. If not, something in a name - a quote, or a blank where the
  /// template does not quote it - would make or change an argument.
  bool keep_names_in_place(const std::string& start, const char* options_template,
                           const std::string& command) const;

 private:
  std::string stand_in_for(const std::string& name, std::size_t number);
  std::string with_names(std::string word) const;

  LA_KEYWORD_TABLE real_;
  LA_KEYWORD_TABLE plain_;
  std::vector<std::string> names_;              ///< by the number in their stand-in
  std::map<std::string, std::size_t> numbers_;  ///< of keywords with one name
};

#endif
