#include "host/port_file.h"

#include <algorithm>
#include <climits>
#include <cstring>

namespace Port {

Stream::Stream(int descriptor, std::size_t size)
    : descriptor_(descriptor), size_(size), block_(new char[BLOCK]) {
  fill();
  static constexpr char BYTE_ORDER_MARK[] = {'\xEF', '\xBB', '\xBF'};
  if (end_ - next_ >= 3 && std::memcmp(next_, BYTE_ORDER_MARK, 3) == 0) {
    next_ += 3;
    if (next_ == end_) fill();
  }
}

int Stream::readline(char* buffer, int size) {
  int length = 0;
  char last = '\0';
  bool ended = false;
  while (!ended && next_ != end_) {
    const auto left = static_cast<std::size_t>(end_ - next_);
    const auto* stop = static_cast<const char*>(std::memchr(next_, '\n', left));
    ended = stop != nullptr;
    if (!ended) stop = end_;
    const auto piece = static_cast<int>(stop - next_);
    if (length < size) std::copy_n(next_, std::min(piece, size - length), buffer + length);
    if (piece > 0) last = stop[-1];
    length = std::min(length, INT_MAX - BLOCK) + piece;
    next_ = ended ? stop + 1 : stop;
    if (next_ == end_) fill();
  }
  if (ended && last == '\r') --length;
  buffer[std::min(length, size - 1)] = '\0';
  return length;
}

std::string Stream::readall() {
  std::string text;
  text.reserve(size_);
  for (; !geteof(); fill()) text.append(next_, end_);
  return text;
}

bool FileStatus::is_left_by_failed_run() const {
  constexpr __int64 START_OF_1902 = -2'145'916'800'000'000'000;
  return exists && time < START_OF_1902;
}

bool File::exist(const char* path) {
  return status(path).exists;
}

bool File::getdatetime(const char* path, __int64& time) {
  const FileStatus found = status(path);
  if (found.exists) time = found.time;
  return found.exists;
}

void File::makeunixpath(char* path) {
  std::replace(path, path + UT_STR::Len(path), '\\', '/');
}

const char* File::find(const char* name, const char** dirs, int count, char* found) {
  static const char* here[] = {""};
  if (name[0] == '/' || count == 0) {
    dirs = here;
    count = 1;
  }
  for (int i = 0; i < count; ++i) {
    if (dirs[i] == nullptr || UT_STR::Copy(found, dirs[i]) == nullptr) continue;
    if (UT_STR::Cat(found, name) != nullptr && exist(found)) return found;
  }
  found[0] = '\0';
  return nullptr;
}

bool File::close(Stream* stream) {
  delete stream;
  return true;
}

}  // namespace Port
