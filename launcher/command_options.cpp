#include "launcher/command_options.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <memory>

#include "launcher/baslauncher.h"

namespace {

constexpr char MARK = '\1';

bool is_blank(char c) {
  return c == ' ' || c == '\t';
}

bool is_control(char c) {
  return (c > '\0' && c < ' ') || c == '\x7f';
}

/// The texts between quotes of a command line, each behind the quote that begins it.
std::vector<std::string> quoted_texts(const std::string& command) {
  std::vector<std::string> texts;
  bool in_word = false;
  for (std::size_t i = 0; i < command.size(); ++i) {
    const char c = command[i];
    if (c == '"' || (c == '\'' && !in_word)) {
      const std::size_t partner = std::min(command.find(c, i + 1), command.size());
      texts.push_back(command.substr(i, partner - i));
      i = partner;
    }
    in_word = !is_blank(c);
  }
  return texts;
}

// What a character of a value means where the template's author has put it in quotes:

/// In an argument that is one word, such as '-o=$OUTPUT'.
bool is_safe_in_word(char c) {
  return c != '"' && c != '\'';
}

/// Between quotes in a text, such as 'read "$OUTPUT/cells"; map': there, in the languages that
/// programs have, nothing but these is more than a character.
bool is_safe_in_inner_quotes(char c) {
  return std::strchr("\"'\\$`[", c) == nullptr && !is_control(c);
}

/// In a text of several words, such as 'read $libraries; map', any other may be more.
bool is_safe_in_text(char c) {
  return UT_STR::IsAlpha(c) || (c >= '0' && c <= '9') || (c & 0x80) != 0 ||
         std::strchr("/._-+,:=@%~", c) != nullptr;
}

std::string reason_against(char c) {
  if (c == ' ') return "it holds a blank";
  if (is_control(c)) return "it holds a control character";
  return std::string("it holds the character ") + c;
}

}  // namespace

/// Where a stand-in is in a text, and the number of its value.
struct la_command_options::place {
  std::size_t begin;
  std::size_t end;
  std::size_t number;
};

void la_command_options::set_keyword(const char* keyword, const char* value) {
  real_.set_keyword(keyword, value);
  plain_.set_keyword(keyword, value ? keep(number_of(keyword), value, false).c_str() : nullptr);
}

void la_command_options::set_file(const char* keyword, const std::string& quoted_name) {
  real_.set_keyword(keyword, quoted_name.c_str());
  const std::string name = quoted_name.substr(1, quoted_name.size() - 2);
  plain_.set_keyword(keyword, ('"' + keep(number_of(keyword), name, true) + '"').c_str());
}

void la_command_options::add_keyword(const char* keyword, const char* value) {
  real_.add_keyword(keyword, value);
  plain_.add_keyword(keyword, keep(values_.size(), value, false).c_str());
}

/// A later value takes the place of the one before: a chain may have many steps.
std::size_t la_command_options::number_of(const char* keyword) {
  return numbers_.try_emplace(keyword, values_.size()).first->second;
}

/// Keeps a value. Returns its stand-in.
std::string la_command_options::keep(std::size_t number, const std::string& text, bool in_quotes) {
  values_.resize(std::max(values_.size(), number + 1));
  values_[number] = {text, in_quotes};
  return MARK + std::to_string(number) + MARK;
}

unsigned char la_command_options::expand(const char* options_template, char* result) const {
  return real_.expand(options_template, result, LA_MAX_OPTIONS);
}

std::optional<la_command_options::place> la_command_options::next_value(const std::string& text,
                                                                        std::size_t from) const {
  const char* const chars = text.c_str();
  for (std::size_t at = text.find(MARK, from); at != text.npos; at = text.find(MARK, at + 1)) {
    std::size_t number = 0;
    const auto [end, error] = std::from_chars(chars + at + 1, chars + text.size(), number);
    if (error != std::errc() || *end != MARK || number >= values_.size()) continue;
    return place{at, static_cast<std::size_t>(end + 1 - chars), number};
  }
  return std::nullopt;
}

/// A word with the values in the place of their stand-ins.
std::string la_command_options::with_values(const std::string& word,
                                            bool with_leading_blanks) const {
  std::string result;
  std::size_t from = 0;
  for (auto next = next_value(word, 0); next; next = next_value(word, from)) {
    const std::string& value = values_[next->number].text;
    const std::size_t blanks = std::min(value.find_first_not_of(' '), value.size());
    result.append(word, from, next->begin - from);
    result.append(value, with_leading_blanks ? 0 : blanks);
    from = next->end;
  }
  return result.append(word, from);
}

/// The command line with stand-ins; empty if the template cannot be expanded.
std::string la_command_options::command_with_stand_ins(const std::string& start,
                                                       const char* options_template) const {
  // Stand-ins may be longer than the values.
  constexpr int SIZE = 4 * LA_MAX_OPTIONS;
  const std::unique_ptr<char[]> options(new char[SIZE]);
  if (!plain_.expand(options_template, options.get(), SIZE)) return "";
  return start + options.get();
}

bool la_command_options::keeps_words(const std::string& start, const char* options_template,
                                     const std::string& command) const {
  const std::string meant_command = command_with_stand_ins(start, options_template);
  if (meant_command.empty()) return false;
  std::vector<std::string> words;
  std::vector<std::string> meant_words;
  // A template that cannot be split, for want of a quote, must not find its partner in a value.
  const bool is_meant = Port_Process::Split(meant_command, meant_words);
  if (Port_Process::Split(command, words) != is_meant) return false;
  if (!is_meant) return true;
  auto word = words.begin();
  for (const std::string& meant : meant_words) {
    // The template language drops blanks at the front of a value where there are blanks already.
    const std::string without_blanks = with_values(meant, false);
    if (word != words.end() && (*word == without_blanks || *word == with_values(meant, true))) {
      ++word;
    } else if (!without_blanks.empty()) {
      return false;
    }
  }
  return word == words.end();
}

std::optional<la_misplaced_value> la_command_options::misplaced_value(
    const std::string& start, const char* options_template) const {
  for (const std::string& text : quoted_texts(command_with_stand_ins(start, options_template))) {
    const bool has_words = text.find_first_of(" \t\n;") != text.npos;
    const char inner_quote = text.front() == '"' ? '\'' : '"';
    std::size_t from = 0;
    for (auto next = next_value(text, 0); next; next = next_value(text, from)) {
      from = next->end;
      const auto& [value, in_quotes] = values_[next->number];
      if (in_quotes && inner_quote == '\'') continue;  // These are its own quotes.
      const auto quotes = std::count(
          text.begin(), text.begin() + static_cast<std::ptrdiff_t>(next->begin), inner_quote);
      const bool in_inner_quotes = quotes % 2 != 0;
      const auto is_safe = in_inner_quotes ? is_safe_in_inner_quotes
                           : has_words     ? is_safe_in_text
                                           : is_safe_in_word;
      if (value.empty() && has_words && !in_inner_quotes) return {{value, "it is empty"}};
      const auto unsafe = std::find_if_not(value.begin(), value.end(), is_safe);
      if (unsafe != value.end()) return {{value, reason_against(*unsafe)}};
    }
  }
  return std::nullopt;
}
