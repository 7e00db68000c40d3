#include "file/full_root.h"

#include "file/normal_form.h"
#include "host/ut_path.h"

LA_FULLROOT::LA_FULLROOT(const LA_DIR& directory) : directory_(directory) {
  if (directory.dir == nullptr) return;
  normal_directory_ = directory.full_name();
  if (!normal_directory_.fits()) return;
  directory_length_ = normal_directory_.length();
  la_normalise(normal_directory_);
}

LA_FULLROOT::LA_FULLROOT(const LA_FULLFILE& file) : LA_FULLROOT(*file.dir) {
  set_root(file.get_root());
}

void LA_FULLROOT::set_root(const char* root) {
  room_ = 0;
  const std::string_view added(root != nullptr ? root : "");
  const std::size_t length = directory_length_ + added.size();
  if (directory_length_ == 0 || root == nullptr || length >= LA_MAX_PATH) return;
  room_ = LA_MAX_PATH - length;
  if (la_is_normal(added)) {
    text_ = normal_directory_;
    text_.add(added);
  } else {
    text_ = directory_.full_name();
    la_normalise(text_.add(added));
  }
  root_length_ = text_.length();
}

const char* LA_FULLROOT::with_ext(const char* ext) {
  const std::string_view added(ext != nullptr ? ext : "");
  if (added.size() + (ext != nullptr ? 1 : 0) >= room_) return nullptr;
  text_.cut(root_length_);
  if (ext != nullptr) text_.add(".").add(added);
  return UT_PATH::ExternalPath(text_.chars());
}
