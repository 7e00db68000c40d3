#include "fuzz.h"

#include "rules/baslarules.h"

std::string lower(std::string text) {
  UT_STR::Lower(text.data());
  return text;
}

std::string rules_from(Tree& tree, const std::string& path, const std::string& text) {
  tree.write(path, text);
  Messages messages;
  const LA_RULE_SET set(nullptr, path.ends_with(".urf") ? path.c_str() : nullptr);
  set.dump(true);
  const std::string said = "\n" + messages.take();
  EXPECT_EQ(set.is_valid, said.find("\nE ") == said.npos);
  if (text.find('\r') == text.npos && text.find('\n') != text.npos) {
    EXPECT_EQ(rules_from(tree, path, replaced(text, "\n", "\r\n")), said);
  }
  return said;
}

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size) {
  static const int environment = (fix_environment(), 0);
  static Tree tree;
  const Messages messages;
  examine(std::string(data, data + size), tree);
  if (::testing::UnitTest::GetInstance()->ad_hoc_test_result().Failed()) std::abort();
  return environment;
}

#ifndef KESTREL_FUZZ
/// Examines the files that are given.
int main(int count, char** words) {
  for (int i = 1; i < count; ++i) {
    SCOPED_TRACE(words[i]);
    const std::string input = slurp(words[i]);
    LLVMFuzzerTestOneInput(reinterpret_cast<const unsigned char*>(input.data()), input.size());
  }
}
#endif
