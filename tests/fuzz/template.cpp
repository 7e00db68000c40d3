// The template expander. The first line of an input is the template; the others are keywords,
// NAME=VALUE, or NAME for one that lacks a value.
#include <sstream>

#include "fuzz.h"
#include "optparse/baslaoptparse.h"

/// What becomes of text in a buffer of this size, behind "1" or, after a failure, "0".
static std::string expand(const LA_KEYWORD_TABLE& table, std::string text, std::size_t size) {
  std::vector<char> buffer(size);
  text.copy(buffer.data(), size - 1);
  const bool done = table.expand(buffer.data(), static_cast<int>(size));
  return (done ? '1' : '0') + std::string(buffer.data());
}

void examine(const std::string& input, Tree& /*tree*/) {
  std::istringstream lines(input.substr(0, 4095).c_str());
  std::string text;
  std::getline(lines, text);
  LA_KEYWORD_TABLE table;
  for (std::string line; std::getline(lines, line);) {
    const std::size_t equals = line.find('=');
    const char* value = equals == line.npos ? nullptr : line.c_str() + equals + 1;
    table.add_keyword(line.substr(0, equals).c_str(), value);
  }

  Messages messages;
  const std::string result = expand(table, text, 4096);
  const bool stray = messages.take().find("in options string") != std::string::npos;
  EXPECT_EQ(expand(table, "", 1), "1");
  EXPECT_EQ(lower(expand(table, lower(text), 4096)), lower(result));
  if (result == "0" + text || (stray && result[0] == '0')) return;
  EXPECT_TRUE(result[0] == '1' && result[1] != ' ' && result.find_first_of("]}") == result.npos);
  // What is dropped leaves nothing behind.
  const std::string dropped = expand(table, text + "{}[ y ] z", 4096);
  EXPECT_TRUE(dropped[0] == '0' || dropped == expand(table, text + "{} z", 4096)) << dropped;
  // Its length and the terminator are the room that a result needs.
  const std::size_t room = std::max(result.size(), text.size() + 1);
  EXPECT_EQ(expand(table, text, room), result);
  EXPECT_TRUE(room == text.size() + 1 || expand(table, text, room - 1) == "0" + text) << result;
}
