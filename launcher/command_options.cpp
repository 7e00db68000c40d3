#include "launcher/command_options.h"

#include <algorithm>
#include <memory>

#include "launcher/baslauncher.h"

namespace {

std::string stand_in(std::size_t number) {
  std::string text = std::to_string(number);
  text.insert(text.begin(), '\1');
  text.push_back('\1');
  return text;
}

}  // namespace

void la_command_options::set_keyword(const char* keyword, const char* value) {
  real_.set_keyword(keyword, value);
  plain_.set_keyword(keyword, value);
}

void la_command_options::set_name(const char* keyword, const std::string& name) {
  real_.set_keyword(keyword, name.c_str());
  // A later name takes the place of the one before: a chain may have many steps.
  const std::size_t number = numbers_.try_emplace(keyword, names_.size()).first->second;
  plain_.set_keyword(keyword, stand_in_for(name, number).c_str());
}

void la_command_options::add_name(const char* keyword, const std::string& name) {
  real_.add_keyword(keyword, name.c_str());
  plain_.add_keyword(keyword, stand_in_for(name, names_.size()).c_str());
}

std::string la_command_options::stand_in_for(const std::string& name, std::size_t number) {
  const bool is_quoted = name.size() >= 2 && name.front() == '"' && name.back() == '"';
  // The template language drops blanks at the front of a value where there are blanks already.
  const std::size_t start = is_quoted ? 1 : std::min(name.find_first_not_of(' '), name.size());
  const std::size_t end = name.size() - (is_quoted ? 1 : 0);
  names_.resize(std::max(names_.size(), number + 1));
  names_[number] = name.substr(start, end - start);
  if (start == end && !is_quoted) return "";
  std::string text = stand_in(number);
  if (is_quoted) {
    text.insert(text.begin(), '"');
    text.push_back('"');
  }
  return text;
}

unsigned char la_command_options::expand(const char* options_template, char* result) const {
  return real_.expand(options_template, result, LA_MAX_OPTIONS);
}

std::string la_command_options::with_names(std::string word) const {
  for (std::size_t number = 0; number < names_.size(); ++number) {
    const std::string text = stand_in(number);
    const std::string& name = names_[number];
    for (std::size_t at = word.find(text); at != word.npos;
         at = word.find(text, at + name.size())) {
      word.replace(at, text.size(), name);
    }
  }
  return word;
}

bool la_command_options::keep_names_in_place(const std::string& start, const char* options_template,
                                             const std::string& command) const {
  // Stand-ins may be longer than the names.
  constexpr int SIZE = 4 * LA_MAX_OPTIONS;
  const std::unique_ptr<char[]> options(new char[SIZE]);
  if (!plain_.expand(options_template, options.get(), SIZE)) return false;
  std::vector<std::string> words;
  std::vector<std::string> meant;
  // A template that cannot be split, for want of a quote, must not find its partner in a name.
  const bool is_meant = Port_Process::Split(start + options.get(), meant);
  if (Port_Process::Split(command, words) != is_meant) return false;
  for (std::string& word : meant) word = with_names(word);
  return !is_meant || words == meant;
}
