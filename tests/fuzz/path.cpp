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
  EXPECT_TRUE(file.set_file(name) || file.get_tail() == nullptr);
  // In front of a head stands its drive, and behind the last dot an extension, or nothing.
  const std::string dot = file.get_ext() != nullptr ? "" : ".";
  const std::string relative = text_of(file.get_file()) + dot;
  const LA_FILE again(((file.get_head() != nullptr ? "C:" : "") + relative).c_str());
  if (file.get_tail() != nullptr && again.get_tail() != nullptr) {
    EXPECT_EQ(shown({again.get_head(), again.get_name(), again.get_ext()}),
              shown({file.get_head(), file.get_name(), file.get_ext()}));
  }

  LA_DIR dir("/old");
  EXPECT_TRUE(dir.set_dir(name) || dir.get_dir() == nullptr);
  const std::string path = text_of(dir.get_dir());
  EXPECT_EQ(text_of(LA_DIR(path.c_str()).get_dir()), path);
  EXPECT_EQ(path.ends_with('/') && dir.match_dir(lower(path).c_str()), !path.empty());

  LA_FULLFILE full("/old/name.ext");
  full.set_file(replaced(name, "/", "\\").c_str());
  const std::string whole = text_of(full.get_fullfile());
  EXPECT_EQ(text_of(LA_FULLFILE(name).get_fullfile()), whole);
  // The directory "d" is left at once. "../" that would climb above the root stays.
  for (const std::string& other : {whole + dot, "d/../" + relative}) {
    const std::string found = text_of(LA_FULLFILE(other.c_str()).get_fullfile());
    EXPECT_TRUE(found.empty() || found == whole || whole.find("../") != whole.npos) << found;
  }
  const std::string below = tree.home + "/";
  const bool is_below = whole.starts_with(below) && !whole.starts_with(below + "/");
  const std::size_t skipped = is_below ? below.size() : 0;
  const std::string argument = text_of(full.get_external_path());
  EXPECT_TRUE(argument.empty() || argument == '"' + whole.substr(skipped) + '"') << argument;
}
