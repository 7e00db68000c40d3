#include "host/static_acd.h"

#include <algorithm>
#include <memory>

#include "host/port_file.h"
#include "host/port_msgman.h"

namespace {

constexpr std::string_view BLANKS = " \t";

char revision[] = "$Revision: 1.0 $";

Port_MsgManData& message(int line = __builtin_LINE()) {
  return Port_MsgManData::createObject("Kestrel", "host/static_acd.cpp", line, revision);
}

std::string_view trimmed(std::string_view text) {
  const std::size_t start = text.find_first_not_of(BLANKS);
  if (start == text.npos) return {};
  return text.substr(start, text.find_last_not_of(BLANKS) - start + 1);
}

std::string_view without_comment(std::string_view line) {
  for (std::size_t at = line.find('#'); at != line.npos; at = line.find('#', at + 1)) {
    if (at == 0 || BLANKS.find(line[at - 1]) != BLANKS.npos) return line.substr(0, at);
  }
  return line;
}

/// Position of the separator that ends the piece that begins at start; the size of text for the
/// last piece.
std::size_t end_of_piece(std::string_view text, std::size_t start, std::string_view separator) {
  return std::min(text.find(separator, start), text.size());
}

/// Moves start, the beginning of a piece of text, on by so many pieces. False when there are fewer.
bool skip_pieces(std::string_view text, std::size_t& start, std::string_view separator,
                 int pieces) {
  for (; pieces > 0; --pieces) {
    const std::size_t end = end_of_piece(text, start, separator);
    if (end == text.size()) return false;
    start = end + separator.size();
  }
  return true;
}

std::string_view piece_at(std::string_view text, std::size_t start, std::string_view separator) {
  return trimmed(text.substr(start, end_of_piece(text, start, separator) - start));
}

}  // namespace

StaticAcdRead::StaticAcdRead(const char* path, const char* /*unused*/, char* const* /*unused*/,
                             unsigned char /*unused*/, unsigned char /*unused*/,
                             unsigned char /*unused*/) {
  if (Port::File::missing(path)) return;
  std::unique_ptr<Port::Stream> stream(Port::File::open(path, Port::Stream::READ, true));
  if (stream == nullptr) {
    message().issueError("Launcher: Could not open data file \"%s\".\n", path);
    valid_ = false;
    return;
  }
  std::string line;
  for (int number = 1; !stream->geteof(); ++number) {
    stream->readline(line);
    read_line(path, number, line);
  }
  if (stream->failed()) {
    message().issueError("Launcher: Could not read data file \"%s\".\n", path);
    valid_ = false;
  }
}

void StaticAcdRead::read_line(const char* path, int number, std::string_view line) {
  line = without_comment(line);
  const std::string_view content = trimmed(line);
  if (content.empty()) return;
  const bool continues = content.data() != line.data();
  const std::size_t equals = line.find('=');
  const std::string_view key = trimmed(line.substr(0, equals));
  if (line.find('\0') != line.npos || (continues && last_value_ == nullptr) ||
      (!continues && (equals == line.npos || key.empty()))) {
    message().issueError("Launcher: \"%s\", line %d: Expecting KEY = VALUE\n", path, number);
    valid_ = false;
    return;
  }
  if (continues) {
    if (!last_value_->empty()) *last_value_ += ' ';
    *last_value_ += content;
    return;
  }
  const auto [place, is_new] = records_.try_emplace(std::string(key));
  if (is_new) keys_.emplace_back(place->first);
  last_value_ = is_new ? &place->second.value : &passed_over_;
  *last_value_ = trimmed(line.substr(equals + 1));
}

Port::StringBase<char> StaticAcdRead::GetStringByKey(const char* key, const char* separator,
                                                     short index, const char* separator2,
                                                     short index2) const {
  std::string_view text = field(key, separator, index);
  if (separator2 != nullptr) {
    std::size_t start = 0;
    if (!skip_pieces(text, start, separator2, index2)) return {};
    text = piece_at(text, start, separator2);
  }
  return Port::StringBase<char>(std::string(text));
}

std::string_view StaticAcdRead::field(const char* key, std::string_view separator,
                                      int index) const {
  const auto found = records_.find(key);
  if (found == records_.end()) return {};
  record& asked = found->second;
  if (asked.separator != separator || asked.index > index) {
    asked.separator = separator;
    asked.index = 0;
    asked.start = 0;
  }
  std::size_t start = asked.start;
  if (!skip_pieces(asked.value, start, separator, index - asked.index)) return {};
  asked.index = index;
  asked.start = start;
  return piece_at(asked.value, start, separator);
}
