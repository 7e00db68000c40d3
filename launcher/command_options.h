// The options of the netlisters of a chain, and the assurance that no value becomes an argument.
#ifndef KESTREL_LAUNCHER_COMMAND_OPTIONS_H
#define KESTREL_LAUNCHER_COMMAND_OPTIONS_H

#include <array>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "optparse/baslaoptparse.h"

/// The keywords that a launcher defines.
inline constexpr std::array LA_OPTION_KEYWORDS = {
    "part",        "family",   "device", "pkg", "speed",  "infile",   "outfile",
    "ignore_locs", "add_pads", "quiet",  "aul", "OUTPUT", "libraries"};

/// A value that holds what it may not hold where a template uses it.
struct la_misplaced_value {
  std::string value;
  std::string reason;  ///< as in "it holds a blank"
};

/// The keywords of a chain. Every value is kept twice: as it is, and as a stand-in, which means
/// nothing in a command line. A template expanded with the stand-ins shows which words its author
/// meant, and where the values are in them.
class la_command_options {
 public:
  /// Gives a keyword a value, or none for null.
  void set_keyword(const char* keyword, const char* value);
  /// Gives a keyword the name of a file as its value, which stands in double quotes.
  void set_file(const char* keyword, const std::string& quoted_name);
  /// Adds a value to those of a keyword.
  void add_keyword(const char* keyword, const char* value);

  /// Expands a template into a buffer of LA_MAX_OPTIONS characters, as LA_KEYWORD_TABLE does.
  unsigned char expand(const char* options_template, char* result) const;
  /// Whether a command line, made of start and the expanded template, splits into the words that
  /// the template's author meant. If not, something in a value - a quote, or a blank where the
  /// template does not quote it - would make or change an argument. An empty value makes none.
  bool keeps_words(const std::string& start, const char* options_template,
                   const std::string& command) const;
  /// The first value that could change the meaning of a text that the template's author put in
  /// quotes. Such a text may be written in a language of the program: see docs/rules.md.
  std::optional<la_misplaced_value> misplaced_value(const std::string& start,
                                                    const char* options_template) const;

 private:
  struct kept_value {
    std::string text;
    bool in_quotes;  ///< which belong to the value
  };
  struct place;

  std::string keep(std::size_t number, const std::string& text, bool in_quotes);
  std::size_t number_of(const char* keyword);
  std::optional<place> next_value(const std::string& text, std::size_t from) const;
  std::string with_values(const std::string& word, bool with_leading_blanks) const;
  std::string command_with_stand_ins(const std::string& start, const char* options_template) const;

  LA_KEYWORD_TABLE real_;
  LA_KEYWORD_TABLE plain_;
  std::vector<kept_value> values_;              ///< by the number in their stand-in
  std::map<std::string, std::size_t> numbers_;  ///< of keywords with one value
};

#endif
