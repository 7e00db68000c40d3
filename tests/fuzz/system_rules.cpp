// The data file reader, and the system rules that are read with it.
#include "fuzz.h"
#include "host/static_acd.h"

void examine(const std::string& input, Tree& tree) {
  static const char* const path = "share/data/larules.acd";
  // A comment makes no difference.
  const std::string rules = rules_from(tree, path, input);
  const std::string again = rules_from(tree, path, replaced(input, "\n", "\t# comment\n"));
  EXPECT_TRUE(again == rules || input.find('\r') != input.npos) << rules << again;

  tree.write(path, input);
  const StaticAcdRead reader(path, nullptr, nullptr, 1, 0, 1);
  for (const StaticAcdRead::entry& each : reader.entries()) {
    const std::string key(each.key);
    const std::string value = reader.GetStringByKey(key.c_str(), "\n", 0, nullptr, 0).c_str();
    // The fields are all of the value but blanks and commas.
    std::string fields;
    for (std::size_t i = 0; i <= value.size(); ++i) {
      fields += reader.GetStringByKey(key.c_str(), ",", static_cast<short>(i), nullptr, 0).c_str();
    }
    EXPECT_TRUE(replaced(fields, " ", "") == replaced(replaced(value, " ", ""), ",", "") ||
                value.find('\t') != value.npos);
  }
}
