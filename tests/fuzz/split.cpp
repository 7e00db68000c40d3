// The splitter of command lines.
#include "fuzz.h"
#include "host/port_process.h"

void examine(const std::string& input, Tree& /*tree*/) {
  std::vector<std::string> words, again;
  // A quote without its partner finds one at the end.
  if (!Port_Process::Split(input, words) && !Port_Process::Split(input + "'", words)) {
    EXPECT_TRUE(Port_Process::Split(input + '"', words));
  }
  std::string joined, kept = input;
  for (const std::string& word : words) {
    // Double quotes in a word come from the single quotes at its beginning. The rest of it can do
    // without quotes unless it has blanks.
    const std::size_t cut = word.rfind('"') + 1;
    if (cut > 0) joined += "'" + word.substr(0, cut) + "'";
    const bool bare = word.find_first_of(" \t") == word.npos && word[0] != '\0' && word[0] != '\'';
    joined += bare ? word.substr(cut) + "\t" : '"' + word.substr(cut) + "\"\t";
  }
  EXPECT_TRUE(Port_Process::Split(joined, again) && again == words) << joined;
  // Only blanks and quotes get lost.
  for (std::string* text : {&joined, &kept}) {
    std::erase_if(*text, [](char c) { return c == ' ' || c == '\t' || c == '"' || c == '\''; });
  }
  EXPECT_EQ(joined, kept);
}
