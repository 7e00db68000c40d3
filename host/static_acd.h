// Static data files: keyed texts, one "KEY = VALUE" a line.
#ifndef KESTREL_HOST_STATIC_ACD_H
#define KESTREL_HOST_STATIC_ACD_H

#include <cstddef>
#include <deque>
#include <string>
#include <string_view>

#include "host/arena.h"
#include "host/blanks.h"
#include "host/hash_index.h"
#include "host/port_string.h"

/// Reads one static data file. A line that begins with a blank continues the value above it, with
/// one blank between the pieces. "#" at the start of a line or after a blank begins a comment that
/// runs to the end of the line. Key, fields and parts come without surrounding blanks. The first
/// of two equal keys counts. Line ends may be "\n" or "\r\n"; a byte order mark is skipped.
class StaticAcdRead {
 public:
  struct entry {
    std::string_view key;
    std::string_view value;
    int line;  ///< of the key, from 1
  };

  /// Reads the file at path; a missing one holds no keys. A file that cannot be read holds none
  /// either, and a line that is not of the form above is passed over: both are reported as errors
  /// and make valid() false. The other arguments are not used.
  StaticAcdRead(const char* path, const char*, char* const*, unsigned char, unsigned char,
                unsigned char);
  StaticAcdRead(const StaticAcdRead&) = delete;
  StaticAcdRead& operator=(const StaticAcdRead&) = delete;

  /// The value of key, split at separator, one character, field number index (from 0); when
  /// separator2 is not null, that field split at separator2, part number index2. An empty string
  /// when the key, the field or the part does not exist.
  Port::StringBase<char> GetStringByKey(const char* key, const char* separator, short index,
                                        const char* separator2, short index2) const;

  /// The same without copies, for who wants all of the fields: the value of key, null when it does
  /// not exist, which is good as long as this object.
  std::string_view value(std::string_view key) const;
  /// The line where key stands, from 1; 0 when it does not exist.
  int line(std::string_view key) const;
  /// Takes the first field from the front of such a text, which is null after the last one.
  static std::string_view take_piece(std::string_view& text, char separator) {
    const std::size_t end = text.find(separator);
    const std::string_view piece = la_trimmed(text.substr(0, end));
    text = end == text.npos ? std::string_view() : text.substr(end + 1);
    return piece;
  }
  /// All keys and their values, in the order of the file; good as long as this object.
  const std::deque<entry>& entries() const { return entries_; }
  /// False when something of the file could not be read or understood.
  bool valid() const { return valid_; }

 private:
  /// False when the line is not of the form above; it is then passed over.
  bool read_line(std::string_view line, int number);
  const entry* find(std::string_view key) const;
  auto is_key(std::string_view key) const {
    return [this, key](int number) { return la_at(entries_, number).key == key; };
  }
  std::string_view joined(std::string_view value, std::string_view content);

  la_long_string text_;  ///< the file, with the lines of a value joined where the first stands
  std::deque<entry> entries_;  ///< stay where they are: last_value_ points into them
  la_hash_index index_;        ///< of the entries, by key
  mutable std::size_t last_found_ = 0;
  std::string_view* last_value_ = nullptr;
  std::string_view passed_over_;  ///< the value of a key that stands earlier too
  bool valid_ = true;
};

#endif
