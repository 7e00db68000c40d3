// The data file reader, and the system rules that are read with it.
#include "fuzz.h"
#include "host/static_acd.h"

/// The records of a file, each in one line.
static std::string records(const char* path) {
  const StaticAcdRead reader(path, nullptr, nullptr, 1, 0, 1);
  std::string text;
  for (const std::string_view key : reader.keys()) {
    text.append("\n").append(key).append("=");
    for (short i = 0; i < 40; ++i) {
      text.append(reader.GetStringByKey(key.data(), ",", i, nullptr, 0).c_str()) += ',';
    }
  }
  return text;
}

void examine(const std::string& input, Tree& tree) {
  static const char* const path = "share/data/larules.acd";
  rules_from(tree, path, input);
  const std::string text = records(path);
  tree.write(path, text);
  EXPECT_EQ(records(path), text);
}
