// A path while it is being put together: text in a fixed buffer that refuses what does not fit.
#ifndef KESTREL_FILE_PATH_TEXT_H
#define KESTREL_FILE_PATH_TEXT_H

#include <cstddef>
#include <string_view>

#include "host/port_file.h"
#include "host/ut_str.h"

/// At most LA_MAX_PATH - 1 characters. What does not fit makes the text unfit; nothing is cut.
class la_path_text {
 public:
  la_path_text() { cut(0); }
  /// text in the internal form.
  explicit la_path_text(const char* text) : la_path_text() {
    add(text);
    Port::File::makeunixpath(chars_);
  }

  /// Appends text; null adds nothing.
  la_path_text& add(const char* text) {
    return text != nullptr ? add(std::string_view(text)) : *this;
  }
  la_path_text& add(std::string_view text) {
    if (length_ + text.size() >= sizeof chars_) refuse();
    if (fits_) cut(length_ + text.copy(chars_ + length_, text.size()));
    return *this;
  }
  /// Appends "/" when the text does not end with one.
  la_path_text& add_slash() { return view().ends_with('/') ? *this : add("/"); }
  /// Shortens the text to length characters.
  void cut(std::size_t length) {
    length_ = length;
    chars_[length] = '\0';
  }
  /// Makes the text unfit.
  void refuse() { fits_ = false; }

  bool fits() const { return fits_; }
  std::size_t length() const { return length_; }
  char* chars() { return chars_; }
  const char* chars() const { return chars_; }
  std::string_view view() const { return {chars_, length_}; }

 private:
  char chars_[LA_MAX_PATH];
  std::size_t length_ = 0;
  bool fits_ = true;
};

/// The current directory of the process; unfit when it cannot be determined.
inline la_path_text la_current_directory() {
  char cwd[LA_MAX_PATH];
  Port::File::getcwd(cwd, sizeof cwd);
  la_path_text text;
  if (cwd[0] == '\0') text.refuse();
  return text.add(cwd);
}

#endif
