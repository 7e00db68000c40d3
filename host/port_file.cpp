#include "host/port_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstring>
#include <limits>

namespace Port {

namespace {

constexpr __int64 SECOND = 1'000'000'000;

__int64 nanoseconds(const timespec& time) {
  // The years 1678 to 2262 fit; a time stamp outside them counts as the end that it lies beyond.
  constexpr __int64 LIMIT = INT64_MAX / SECOND - 1;
  return std::clamp<__int64>(time.tv_sec, -LIMIT, LIMIT) * SECOND + time.tv_nsec;
}

/// The system takes the nearest time that the file system can hold. The time of access stays.
bool set_modification_time(const char* path, const timespec& time) {
  const timespec times[] = {{0, UTIME_OMIT}, time};
  return ::utimensat(AT_FDCWD, path, times, 0) == 0;
}

}  // namespace

Stream::Stream(int descriptor, std::size_t size)
    : descriptor_(descriptor), size_(size), block_(new char[BLOCK]) {
  fill();
  static constexpr char BYTE_ORDER_MARK[] = {'\xEF', '\xBB', '\xBF'};
  if (end_ - next_ >= 3 && std::memcmp(next_, BYTE_ORDER_MARK, 3) == 0) {
    next_ += 3;
    if (next_ == end_) fill();
  }
}

Stream::~Stream() {
  ::close(descriptor_);
}

void Stream::fill() {
  ssize_t length = 0;
  do {
    length = ::read(descriptor_, block_.get(), BLOCK);
  } while (length < 0 && errno == EINTR);
  failed_ = length < 0;
  next_ = block_.get();
  end_ = next_ + std::max<ssize_t>(length, 0);
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

Place::Place() : descriptor_(::open(".", O_PATH | O_DIRECTORY | O_CLOEXEC)) {}

Place::~Place() {
  if (descriptor_ >= 0) ::close(descriptor_);
}

bool Place::enter() const {
  return ::fchdir(descriptor_) == 0;
}

bool FileStatus::is_left_by_failed_run() const {
  constexpr __int64 START_OF_1902 = -2'145'916'800 * SECOND;
  return exists && time < START_OF_1902;
}

FileStatus File::status(const char* path) {
  struct stat found = {};
  if (::stat(path, &found) != 0 || S_ISDIR(found.st_mode)) return {};
  return {true,
          nanoseconds(found.st_mtim),
          nanoseconds(found.st_ctim),
          found.st_dev,
          found.st_ino,
          found.st_size};
}

bool File::exist(const char* path) {
  return status(path).exists;
}

bool File::missing(const char* path) {
  struct stat found = {};
  return ::lstat(path, &found) != 0 && (errno == ENOENT || errno == ENOTDIR);
}

bool File::isdirectory(const char* path) {
  struct stat found = {};
  return ::stat(path, &found) == 0 && S_ISDIR(found.st_mode);
}

bool File::same(const char* path, const char* other) {
  struct stat first = {};
  struct stat second = {};
  return ::stat(path, &first) == 0 && ::stat(other, &second) == 0 &&
         first.st_dev == second.st_dev && first.st_ino == second.st_ino;
}

bool File::getdatetime(const char* path, __int64& time) {
  const FileStatus found = status(path);
  if (found.exists) time = found.time;
  return found.exists;
}

bool File::settime(const char* path, __int64 time) {
  // The nanoseconds count from the start of the second, also before 1970.
  const __int64 part = (time % SECOND + SECOND) % SECOND;
  return set_modification_time(path, {(time - part) / SECOND, part});
}

bool File::setoldest(const char* path) {
  return set_modification_time(path, {std::numeric_limits<time_t>::min(), 0});
}

bool File::remove(const char* path) {
  return ::unlink(path) == 0;
}

bool File::chdir(const char* path) {
  return ::chdir(path) == 0;
}

void File::getcwd(char* buffer, short size) {
  // A directory that the process cannot reach is not spelled with a leading slash.
  if (::getcwd(buffer, static_cast<std::size_t>(size)) == nullptr || buffer[0] != '/' ||
      UT_STR::FindChar(buffer, '\\') != nullptr) {
    buffer[0] = '\0';
  }
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

Stream* File::open(const char* path, Stream::Access access, bool /*flag*/) {
  if (access != Stream::READ) return nullptr;
  // Opening must not wait for the other end of a pipe.
  const int descriptor = ::open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK);
  if (descriptor < 0) return nullptr;
  struct stat opened = {};
  if (::fstat(descriptor, &opened) != 0 || !S_ISREG(opened.st_mode)) {
    ::close(descriptor);
    return nullptr;
  }
  return new Stream(descriptor, static_cast<std::size_t>(opened.st_size));
}

bool File::close(Stream* stream) {
  delete stream;
  return true;
}

}  // namespace Port
