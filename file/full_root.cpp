#include <cstring>

#include "file/baslafile.h"
#include "file/normal_form.h"
#include "file/path_text.h"
#include "host/ut_path.h"

LA_FULLROOT::LA_FULLROOT(const LA_DIR& directory, const char* root) {
  if (directory.dir == nullptr || root == nullptr) return;
  la_path_text text = directory.full_name();
  text.add(root);
  if (!text.fits()) return;
  room = LA_MAX_PATH - text.length();
  la_normalise(text);
  length = text.length();
  std::memcpy(chars, text.chars(), length);
}

LA_FULLROOT::LA_FULLROOT(const LA_FULLFILE& file) : LA_FULLROOT(*file.dir, file.get_root()) {}

const char* LA_FULLROOT::with_ext(const char* ext) {
  const std::size_t added = ext != nullptr ? 1 + std::strlen(ext) : 0;
  if (added >= room) return nullptr;
  if (ext != nullptr) {
    chars[length] = '.';
    std::memcpy(chars + length + 1, ext, added - 1);
  }
  chars[length + added] = '\0';
  return UT_PATH::ExternalPath(chars);
}
