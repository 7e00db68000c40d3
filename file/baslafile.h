// Path names: LA_DIR, a directory; LA_FILE, a file name with an optional relative directory;
// LA_FULLFILE, a directory and a file in it.
//
// Names are parsed and stored in the internal form (forward slashes only); getters return the
// external form. A name that does not fit LA_MAX_PATH characters is refused whole, never cut:
// setters return 0 and leave the object empty, and a getter whose result would not fit returns
// null. Booleans are unsigned char, 1 or 0. Comparisons ignore the case of letters.
//
// Getters marked "ring" return a slot of one ring of 100 result buffers, shared by all objects of
// the process: the text is not the caller's to free and stays unchanged until 100 more slots have
// been taken. A getter takes the number of slots that stands behind the mark; one that returns
// null takes none for its own result. Nothing here may be used by two threads at once.
#ifndef KESTREL_FILE_BASLAFILE_H
#define KESTREL_FILE_BASLAFILE_H

#include <memory>

#include "host/port_file.h"
#include "host/ut_str.h"

class la_path_text;

/// A directory name: an optional UNC host or drive letter, and a path that ends with "/" and is
/// absolute once set from a name.
class LA_DIR {
 public:
  LA_DIR() = default;
  /// As set_dir(path).
  explicit LA_DIR(const char* path) { set_dir(path); }

  /// Makes the object empty. Returns 0.
  unsigned char set_dir();
  /// Sets the directory. A relative name is joined to the current directory of this moment; null
  /// stands for the current directory itself. Returns whether the object holds a directory: it
  /// does not after an empty name or a UNC name without host.
  unsigned char set_dir(const char* path);
  /// Copies other. Returns whether the object holds a directory.
  unsigned char set_dir(const LA_DIR& other);

  /// The full directory name, with "/" at its end (ring, 1); null when there is none.
  const char* get_dir() const;
  /// Whether path, with or without "/" at its end, is the same text as get_dir().
  unsigned char match_dir(const char* path) const;
  /// Makes this the current directory of the process. Returns whether that succeeded.
  unsigned char chdir() const;
  /// Issues the path, without host or drive, as a status message.
  void dump() const;

 private:
  friend class LA_FULLFILE;
  friend class LA_FULLROOT;
  LA_DIR(la_text unc_host, la_text drive, la_text dir);
  la_path_text full_name() const;

  la_text unc_host;
  la_text drive;
  la_text dir;
};

/// A file name: an optional relative directory (the head), a base name and an extension. It names
/// a file when it has a name or an extension.
class LA_FILE {
 public:
  /// As set_file(path).
  explicit LA_FILE(const char* path = nullptr) { set_file(path); }

  /// Sets all parts from a relative name. Returns whether the object names a file; it is empty
  /// after null, an empty or an absolute name, and holds only a head after one that ends in "/".
  unsigned char set_file(const char* path);
  /// Copies other. Returns whether the object names a file.
  unsigned char set_file(const LA_FILE& other);
  /// Replaces the name; null clears it. Returns whether there is a name then.
  unsigned char set_name(const char* new_name);
  /// Replaces the extension, given without a dot; null clears it. Returns whether there is one.
  unsigned char set_ext(const char* new_ext);
  /// Replaces name and extension; a "/" in tail stays in the name. Returns whether the object
  /// names a file.
  unsigned char set_tail(const char* tail);

  /// Name and extension as stored, or null; good while the object is unchanged.
  const char* get_name() const { return name; }
  const char* get_ext() const { return ext; }
  /// The head with "/" at its end (ring, 1), or null.
  const char* get_head() const;
  /// Head and name (ring, 1); null without a name.
  const char* get_root() const;
  /// Name, "." and extension (ring, 1); null when the object names no file.
  const char* get_tail() const;
  /// Head, name, "." and extension (ring, 1); null when the object names no file.
  const char* get_file() const;

  /// Whether the part is there and equals the argument; null never matches.
  unsigned char match_name(const char* other) const;
  unsigned char match_ext(const char* other) const;
  unsigned char match_tail(const char* tail) const;
  /// Whether there is such a file, seen from the current directory of the process.
  unsigned char exists() const;
  /// Issues the three parts as a status message.
  void dump() const;

 private:
  friend class LA_FULLFILE;
  LA_FILE(la_text head, la_text name, la_text ext);
  bool names_file() const { return name != nullptr || ext != nullptr; }
  unsigned char set_part(la_text LA_FILE::*part, const char* text);
  void append_tail_to(la_path_text& text) const;
  void append_to(la_path_text& text) const;

  la_text head;
  la_text name;
  la_text ext;
};

/// A full file name: a directory, and a file name relative to it. It is complete when it has both.
class LA_FULLFILE {
 public:
  LA_FULLFILE() = default;
  /// As the set_file with the same arguments.
  explicit LA_FULLFILE(const char* path) { set_file(path); }
  LA_FULLFILE(const char* dirname, const char* filename) { set_file(dirname, filename); }
  LA_FULLFILE(const LA_DIR& directory, const char* filename) { set_file(directory, filename); }
  LA_FULLFILE(const LA_FULLFILE& other) { set_file(other); }
  LA_FULLFILE(LA_FULLFILE&& other) noexcept = default;
  LA_FULLFILE& operator=(const LA_FULLFILE& other);
  LA_FULLFILE& operator=(LA_FULLFILE&& other) noexcept = default;
  ~LA_FULLFILE() = default;

  /// Makes the object empty. Returns 0.
  unsigned char set_file();
  /// The setters below return whether the object is complete. An absolute file name brings its own
  /// directory. A null file name, and one that ends in "/", leave a directory without a file,
  /// except that set_file(null) leaves the object empty, as an empty file name does.
  ///
  /// A relative path is taken relative to the current directory of this moment.
  unsigned char set_file(const char* path);
  /// A relative filename is taken relative to dirname, itself relative to the current directory;
  /// null stands for the current directory.
  unsigned char set_file(const char* dirname, const char* filename);
  /// A relative filename is taken relative to a copy of directory.
  unsigned char set_file(const LA_DIR& directory, const char* filename);
  unsigned char set_file(const LA_FULLFILE& other);
  /// Replace a part of the file name, as LA_FILE does; an object without a file gets one that
  /// holds only this part. They return whether the part is there then (set_tail: whether there is
  /// a file name), not whether the object is complete.
  unsigned char set_name(const char* name);
  unsigned char set_ext(const char* ext);
  unsigned char set_tail(const char* tail);

  /// As in LA_FILE; null without a file.
  const char* get_name() const { return file ? file->get_name() : nullptr; }
  const char* get_ext() const { return file ? file->get_ext() : nullptr; }
  const char* get_head() const { return file ? file->get_head() : nullptr; }
  const char* get_root() const { return file ? file->get_root() : nullptr; }
  const char* get_tail() const { return file ? file->get_tail() : nullptr; }
  const char* get_file() const { return file ? file->get_file() : nullptr; }
  /// The directory, followed by the head (ring, 3; without head 2); null without a directory.
  const char* get_fullhead() const;
  /// The directory, followed by head and name (ring, 3); null without a directory or name.
  const char* get_fullroot() const;
  /// The full name, with "./" and "../" resolved (ring, 3); when "../" would climb above the
  /// first directory, the name as it stands. Null when the object is not complete.
  const char* get_fullfile() const;
  /// The full name as an argument of a command line: between double quotes, and relative to the
  /// current directory of this moment if it lies below it (ring, 4).
  const char* get_external_path() const;

  /// Whether the part is there and equals the argument; null never matches. Tail and directory
  /// take a slot of the ring.
  unsigned char match_name(const char* name) const { return file && file->match_name(name); }
  unsigned char match_ext(const char* ext) const { return file && file->match_ext(ext); }
  unsigned char match_tail(const char* tail) const { return file && file->match_tail(tail); }
  unsigned char match_dir(const char* path) const { return dir && dir->match_dir(path); }
  /// Whether get_fullfile() and path are the same text; path is compared as it stands. Takes the
  /// slots of get_fullfile(), as exists() does, and get_timestamp() twice.
  unsigned char match_fullfile(const char* path) const;
  /// Whether there is such a file (a directory is none).
  unsigned char exists() const;
  /// Sets time to the file's modification time, in nanoseconds since 1970. Returns 0, and leaves
  /// time alone, when there is no such file.
  unsigned char get_timestamp(__int64& time) const;
  /// Issues the dumps of the directory and of the file.
  void dump() const;

 private:
  friend class LA_FULLROOT;
  bool split(const char* filename);
  unsigned char settle();
  bool has_dir() const { return dir && dir->dir != nullptr; }
  bool complete() const { return has_dir() && file && file->names_file(); }
  unsigned char set_part(la_text LA_FILE::*part, const char* text);
  la_path_text full_name() const;

  std::unique_ptr<LA_DIR> dir;
  std::unique_ptr<LA_FILE> file;
};

#endif
