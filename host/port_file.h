// Files and text streams.
#ifndef KESTREL_HOST_PORT_FILE_H
#define KESTREL_HOST_PORT_FILE_H

#include <cstdint>
#include <memory>
#include <string>

#include "host/ut_str.h"

#if !defined(_MSC_VER)
typedef std::int64_t __int64;  // NOLINT(bugprone-reserved-identifier)
#endif

namespace Port {

/// A text file that is read line by line. Made by File::open, released by File::close.
class Stream {
 public:
  enum Access { READ = 1 };

  /// Takes over the file descriptor, which stands at the start of a file of so many bytes, as far
  /// as that is known: readall() makes room for these at once. A UTF-8 byte order mark at the start
  /// is skipped.
  explicit Stream(int descriptor, std::size_t size = 0);
  Stream(const Stream&) = delete;
  Stream& operator=(const Stream&) = delete;
  ~Stream();

  /// Reads the next line, without its line end ("\n" or "\r\n"), into buffer, which holds size
  /// characters. Returns the length of the line. When that is size or more, the line did not fit:
  /// the buffer then holds its start. When it is not the length of the string in the buffer, the
  /// line holds a zero byte.
  int readline(char* buffer, int size);
  /// All that has not been read yet.
  std::string readall();
  /// True once every line has been read, or reading failed.
  bool geteof() const { return next_ == end_; }
  /// True when the file could not be read to its end.
  bool failed() const { return failed_; }

 private:
  void fill();
  static constexpr int BLOCK = 65536;

  int descriptor_;
  std::size_t size_;
  bool failed_ = false;
  std::unique_ptr<char[]> block_;
  const char* next_ = nullptr;
  const char* end_ = nullptr;
};

/// What the file system knows of a name. All zero when there is no such file. Times are in
/// nanoseconds since 1970.
struct FileStatus {
  bool exists = false;  ///< there is such a file, and it is not a directory
  __int64 time = 0;     ///< modification time
  __int64 changed = 0;  ///< when the status last changed; no program can set that
  std::uint64_t device = 0;
  std::uint64_t inode = 0;
  __int64 size = 0;  ///< in bytes

  /// Whether the file has the time stamp with which a failed run leaves its output: before 1902
  /// (see File::setoldest). Files that have no true stamp are dated 1970 or 1980.
  bool is_left_by_failed_run() const;
  /// Whether this is in every respect the file that it was.
  friend bool operator==(const FileStatus& a, const FileStatus& b) {
    return a.exists == b.exists && a.time == b.time && a.changed == b.changed &&
           a.device == b.device && a.inode == b.inode && a.size == b.size;
  }
};

/// The directory that is current when this is made, by whatever name it goes later.
class Place {
 public:
  Place();
  Place(const Place&) = delete;
  Place& operator=(const Place&) = delete;
  ~Place();

  /// Makes it the current directory again. Returns false when that fails.
  bool enter() const;

 private:
  int descriptor_;
};

/// The files of the process, by their names in either form.
class File {
 public:
  /// What is known of path, with one question to the file system.
  static FileStatus status(const char* path);
  /// True when there is anything but a directory at path.
  static bool exist(const char* path);
  /// True when nothing is at path: no file, no directory, no link, and nothing that rights hide.
  static bool missing(const char* path);
  /// True when path is a directory.
  static bool isdirectory(const char* path);
  /// Whether two names lead to the same file or directory.
  static bool same(const char* path, const char* other);
  /// Sets time to the modification time of path, in nanoseconds since 1970. Returns false, and
  /// leaves time alone, when there is no such file.
  static bool getdatetime(const char* path, __int64& time);
  /// Sets the modification time of path, in nanoseconds since 1970. Returns false when that fails.
  static bool settime(const char* path, __int64 time);
  /// Sets the modification time of path to the oldest that its file system knows. Returns false
  /// when that fails.
  static bool setoldest(const char* path);
  /// Removes a file. Returns false when that fails.
  static bool remove(const char* path);
  /// Changes the current directory of the process. Returns false when that fails.
  static bool chdir(const char* path);
  /// Writes the current directory into buffer, which holds size characters; the empty string when
  /// it cannot be determined, does not fit, or has a backslash in its name, which the path classes
  /// would take for a separator.
  static void getcwd(char* buffer, short size);
  /// Turns every backslash of path into a forward slash, in place.
  static void makeunixpath(char* path);
  /// Looks for name in the count directories, in their order; null entries are passed over, and a
  /// count of 0 stands for the current directory. An absolute name is tested as it stands. Writes
  /// the first path that exists into found, a buffer of LA_MAX_PATH characters, and returns it.
  /// Returns null when there is none; found is then the empty string.
  static const char* find(const char* name, const char** dirs, int count, char* found);
  /// Opens the regular file at path for reading. Returns null when it cannot be opened or is
  /// anything else. flag: not used.
  static Stream* open(const char* path, Stream::Access access, bool flag);
  /// Closes and releases stream.
  static bool close(Stream* stream);
};

}  // namespace Port

#endif
