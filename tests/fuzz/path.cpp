// Path names.
#include "file/baslafile.h"
#include "fuzz.h"

/// A text, which is never too long; nothing for null.
static std::string text_of(const char* chars) {
  EXPECT_TRUE(chars == nullptr || UT_STR::Len(chars) < LA_MAX_PATH);
  return chars != nullptr ? chars : "";
}

void examine(const std::string& input, Tree& tree) {
  const char* const name = input.c_str();
  // What an object held before does not matter, here and below.
  LA_FILE file("old/name.ext");
  file.set_file(name);
  // In front of a head stands its drive, and behind the last dot an extension, or nothing.
  const std::string dot = file.get_ext() != nullptr ? "" : ".";
  const LA_FILE again(((file.get_head() ? "C:" : "") + text_of(file.get_file()) + dot).c_str());
  if (file.get_tail() != nullptr && again.get_tail() != nullptr) {
    EXPECT_EQ(shown({again.get_head(), again.get_name(), again.get_ext()}),
              shown({file.get_head(), file.get_name(), file.get_ext()}));
  }

  LA_DIR dir("/old");
  dir.set_dir(name);
  const std::string path = text_of(dir.get_dir());
  EXPECT_EQ(text_of(LA_DIR(path.c_str()).get_dir()), path);
  EXPECT_EQ(path.ends_with('/') && dir.match_dir(lower(path).c_str()), !path.empty());

  LA_FULLFILE full("/old/name.ext");
  full.set_file(replaced(name, "/", "\\").c_str());
  const std::string whole = text_of(full.get_fullfile());
  EXPECT_EQ(text_of(LA_FULLFILE(name).get_fullfile()), whole);
  const LA_FULLFILE same((whole + dot).c_str());
  EXPECT_TRUE(same.get_fullfile() == nullptr || same.match_fullfile(whole.c_str()) ||
              whole.empty());
  // "../" stays where it would climb above the root.
  EXPECT_TRUE(whole.find("./") == whole.npos || whole.find("../") != whole.npos) << whole;
  const std::size_t skipped = whole.starts_with(tree.home + "/") ? tree.home.size() + 1 : 0;
  const std::string argument = text_of(full.get_external_path());
  EXPECT_TRUE(argument.empty() || argument == '"' + whole.substr(skipped) + '"') << argument;
}
