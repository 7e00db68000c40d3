#include "host/static_acd.h"

#include <algorithm>
#include <memory>

#include "host/port_file.h"
#include "host/port_msgman.h"

namespace {

char revision[] = "$Revision: 1.0 $";

Port_MsgManData& message(int line = __builtin_LINE()) {
  return Port_MsgManData::createObject("Kestrel", "host/static_acd.cpp", line, revision);
}

std::string_view without_comment(std::string_view line) {
  for (std::size_t at = line.find('#'); at != line.npos; at = line.find('#', at + 1)) {
    if (at == 0 || la_is_blank(line[at - 1])) return line.substr(0, at);
  }
  return line;
}

/// A piece of text by its number; empty when there are fewer.
std::string_view piece_at(std::string_view text, char separator, int index) {
  for (; index > 0 && text.data() != nullptr; --index) StaticAcdRead::take_piece(text, separator);
  return StaticAcdRead::take_piece(text, separator);
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
  const std::string text = stream->readall();
  std::string_view rest = text;
  for (int number = 1; !rest.empty(); ++number) {
    const std::size_t end = rest.find('\n');
    std::string_view line = rest.substr(0, end);
    rest.remove_prefix(std::min(line.size() + 1, rest.size()));
    if (end != rest.npos && line.ends_with('\r')) line.remove_suffix(1);
    if (!read_line(line, number)) {
      message().issueError("Launcher: \"%s\", line %d: Expecting KEY = VALUE\n", path, number);
      valid_ = false;
    }
  }
  if (stream->failed()) {
    message().issueError("Launcher: Could not read data file \"%s\".\n", path);
    valid_ = false;
  }
}

bool StaticAcdRead::read_line(std::string_view line, int number) {
  line = without_comment(line);
  const std::string_view content = la_trimmed(line);
  if (content.empty()) return true;
  if (content.find('\0') != content.npos) return false;
  if (content.data() != line.data()) {
    if (last_value_ == nullptr) return false;
    if (!last_value_->empty()) *last_value_ += ' ';
    last_value_->append(content);
    return true;
  }
  const std::size_t equals = content.find('=');
  const std::string_view key = la_trimmed(content.substr(0, equals));
  if (equals == content.npos || key.empty()) return false;
  last_value_ = &passed_over_;
  if (!index_.contains(key)) {
    entry& added = entries_.emplace_back(entry{std::string(key), {}, number});
    index_.emplace(added.key, &added);
    last_value_ = &added.value;
  }
  *last_value_ = la_trimmed(content.substr(equals + 1));
  return true;
}

const StaticAcdRead::entry& StaticAcdRead::find(std::string_view key) const {
  static const entry none;
  const auto found = index_.find(key);
  return found != index_.end() ? *found->second : none;
}

Port::StringBase<char> StaticAcdRead::GetStringByKey(const char* key, const char* separator,
                                                     short index, const char* separator2,
                                                     short index2) const {
  std::string_view text = piece_at(find(key).value, *separator, index);
  if (separator2 != nullptr) text = piece_at(text, *separator2, index2);
  return Port::StringBase<char>(std::string(text));
}
