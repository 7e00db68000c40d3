#include "file/full_root.h"

#include "file/normal_form.h"
#include "host/ut_path.h"

LA_FULLROOT::LA_FULLROOT(const LA_DIR& directory, const char* root) {
  if (directory.dir == nullptr || root == nullptr) return;
  la_path_text text = directory.full_name();
  text.add(root);
  if (!text.fits()) return;
  room_ = LA_MAX_PATH - text.length();
  la_normalise(text);
  length_ = text.length();
  text_ = text;
}

LA_FULLROOT::LA_FULLROOT(const LA_FULLFILE& file) : LA_FULLROOT(*file.dir, file.get_root()) {}

const char* LA_FULLROOT::with_ext(const char* ext) {
  const std::size_t added = ext != nullptr ? 1 + UT_STR::Len(ext) : 0;
  if (added >= room_) return nullptr;
  text_.cut(length_);
  if (ext != nullptr) text_.add(".").add(ext);
  return UT_PATH::ExternalPath(text_.chars());
}
