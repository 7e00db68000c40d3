// Files and directories, as the operating system has them.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <limits>

#include "host/port_file.h"
#include "host/system/descriptor.h"

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

FileStatus File::status(const char* path) {
  struct stat found = {};
  if (::stat(path, &found) != 0 || S_ISDIR(found.st_mode)) return {};
  return {.exists = true,
          .time = nanoseconds(found.st_mtim),
          .changed = nanoseconds(found.st_ctim),
          .device = found.st_dev,
          .inode = found.st_ino,
          .size = found.st_size};
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

bool File::settime(const char* path, __int64 time) {
  // The nanoseconds count from the start of the second, also before 1970.
  const __int64 part = (time % SECOND + SECOND) % SECOND;
  return set_modification_time(path, {(time - part) / SECOND, part});
}

bool File::setoldest(const char* path) {
  // The first days of 1980 are the oldest that some file systems know. Some take any time, and
  // keep none.
  constexpr __int64 YEAR_1981 = 347'155'200 * SECOND;
  return set_modification_time(path, {std::numeric_limits<time_t>::min(), 0}) &&
         status(path).time < YEAR_1981;
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

Stream* File::open(const char* path, Stream::Access access, bool /*flag*/) {
  if (access != Stream::READ) return nullptr;
  // Opening must not wait for the other end of a pipe.
  la_descriptor file(::open(path, O_RDONLY | O_CLOEXEC | O_NONBLOCK));
  struct stat opened = {};
  if (::fstat(file.get(), &opened) != 0 || !S_ISREG(opened.st_mode)) return nullptr;
  auto* const stream = new Stream(file.get(), static_cast<std::size_t>(opened.st_size));
  file.release();
  return stream;
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

Place::Place() : descriptor_(::open(".", O_PATH | O_DIRECTORY | O_CLOEXEC)) {}

Place::~Place() {
  if (descriptor_ >= 0) ::close(descriptor_);
}

bool Place::enter() const {
  return ::fchdir(descriptor_) == 0;
}

}  // namespace Port
