// How a command line splits into words.
#include "host/port_process.h"

bool Port_Process::Split(const std::string& command, std::vector<std::string>& words) {
  words.clear();
  bool in_word = false;
  for (std::size_t i = 0; i < command.size(); ++i) {
    const char c = command[i];
    if (c == ' ' || c == '\t') {
      in_word = false;
      continue;
    }
    const bool quote = c == '"' || (c == '\'' && !in_word);
    if (!in_word) words.emplace_back();
    in_word = true;
    if (!quote) {
      words.back() += c;
      continue;
    }
    const std::size_t partner = command.find(c, i + 1);
    if (partner == command.npos) return false;
    words.back().append(command, i + 1, partner - i - 1);
    i = partner;
  }
  return true;
}
