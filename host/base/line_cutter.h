// Cuts a stream of bytes into lines of text.
#ifndef KESTREL_HOST_BASE_LINE_CUTTER_H
#define KESTREL_HOST_BASE_LINE_CUTTER_H

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>

/// Hands out what it is given line by line, each line with its line end. A line of more than
/// LONGEST bytes comes in pieces of that length, or up to 3 bytes less where it would end inside a
/// UTF-8 character; a zero byte comes as the character U+2400.
class la_line_cutter {
 public:
  /// The longest line, and the most that is added at once: a line that lies in such a block as a
  /// whole is not too long.
  static constexpr std::size_t LONGEST = 65536;

  explicit la_line_cutter(std::function<void(const char* line)> hand_out);

  /// Adds a block, behind which there is room for one character more. Lines that lie in it as they
  /// are to be shown are handed out from where they are.
  void add(char* text, std::size_t length);
  /// Hands out what there is of a line.
  void flush() { hand_out(line_.size()); }

 private:
  void collect(std::string_view text);
  void append(std::string_view text);
  void hand_out(std::size_t length);

  std::function<void(const char* line)> hand_out_;
  std::string line_;        ///< the start of a line, as it will be handed out
  std::size_t length_ = 0;  ///< of that start, as it was added
};

#endif
