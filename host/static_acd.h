// Static data files: keyed texts, one "KEY = VALUE" a line.
#ifndef KESTREL_HOST_STATIC_ACD_H
#define KESTREL_HOST_STATIC_ACD_H

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/port_string.h"

/// Reads one static data file. A line that begins with a blank continues the value above it, with
/// one blank between the pieces. "#" at the start of a line or after a blank begins a comment that
/// runs to the end of the line. Key, fields and parts come without surrounding blanks. The first
/// of two equal keys counts. Line ends may be "\n" or "\r\n"; a byte order mark is skipped.
class StaticAcdRead {
 public:
  /// Reads the file at path; a missing one holds no keys. A file that cannot be read holds none
  /// either, and a line that is not of the form above is passed over: both are reported as errors
  /// and make valid() false. The other arguments are not used.
  StaticAcdRead(const char* path, const char*, char* const*, unsigned char, unsigned char,
                unsigned char);
  StaticAcdRead(const StaticAcdRead&) = delete;
  StaticAcdRead& operator=(const StaticAcdRead&) = delete;

  /// The value of key, split at separator, field number index (from 0); when separator2 is not
  /// null, that field split at separator2, part number index2. An empty string when the key, the
  /// field or the part does not exist.
  Port::StringBase<char> GetStringByKey(const char* key, const char* separator, short index,
                                        const char* separator2, short index2) const;

  /// The same without copies, for who wants all of the fields: the value of key, empty when it does
  /// not exist, and the pieces of such a text. They are good as long as this object.
  std::string_view value(std::string_view key) const;
  static void split(std::string_view text, std::string_view separator,
                    std::vector<std::string_view>& pieces);
  /// All keys, in the order of the file; good as long as this object.
  const std::vector<std::string_view>& keys() const { return keys_; }
  /// False when something of the file could not be read or understood.
  bool valid() const { return valid_; }

 private:
  void read_line(const char* path, int number, std::string_view line);
  std::string_view joined(std::string_view value, std::string_view content);

  std::string text_;  ///< the file, with the lines of a value joined where the first stands
  std::unordered_map<std::string_view, std::string_view> values_;
  std::vector<std::string_view> keys_;
  std::string_view* last_value_ = nullptr;
  std::string_view passed_over_;  ///< the value of a key that stands earlier too
  bool valid_ = true;
};

#endif
