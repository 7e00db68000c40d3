// Static data files: keyed texts, one "KEY = VALUE" a line.
#ifndef KESTREL_HOST_STATIC_ACD_H
#define KESTREL_HOST_STATIC_ACD_H

#include <deque>
#include <string>
#include <string_view>
#include <unordered_map>

#include "host/base/blanks.h"
#include "host/port_string.h"

/// Reads one static data file. A line that begins with a blank continues the value above it, with
/// one blank between the pieces. "#" at the start of a line or after a blank begins a comment that
/// runs to the end of the line. Key, fields and parts come without surrounding blanks. The first
/// of two equal keys counts. Line ends may be "\n" or "\r\n"; a byte order mark is skipped.
class StaticAcdRead {
 public:
  struct entry {
    std::string key;
    std::string value;
    int line = 0;  ///< of the key, from 1
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

  /// The entry of key, which lives as long as this object; an empty one when there is none. For
  /// callers that want all fields of a value.
  const entry& find(std::string_view key) const;
  /// Takes the first field from the front of a value, which is null after the last one.
  static std::string_view take_piece(std::string_view& text, char separator) {
    const std::size_t end = text.find(separator);
    const std::string_view piece = la_trimmed(text.substr(0, end));
    text = end == text.npos ? std::string_view() : text.substr(end + 1);
    return piece;
  }
  /// All entries, in the order of the file.
  const std::deque<entry>& entries() const { return entries_; }
  /// False when something of the file could not be read or understood.
  bool valid() const { return valid_; }

 private:
  /// False when the line is not of the form above; it is then passed over.
  bool read_line(std::string_view line, int number);

  std::deque<entry> entries_;  ///< a deque: the keys in the index stay where they are
  std::unordered_map<std::string_view, const entry*> index_;
  std::string passed_over_;            ///< the value of a key that stands earlier too
  std::string* last_value_ = nullptr;  ///< the one that a line with a blank at its start continues
  bool valid_ = true;
};

#endif
