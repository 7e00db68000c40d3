#include "host/static_acd.h"

#include <algorithm>
#include <cstring>
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
  text_ = stream->readall();
  std::size_t start = 0;
  for (int number = 1; start < text_.size(); ++number) {
    const std::size_t end = text_.find('\n', start);
    std::string_view line = std::string_view(text_).substr(start, end - start);
    if (end != text_.npos && line.ends_with('\r')) line.remove_suffix(1);
    if (!read_line(line, number)) {
      message().issueError("Launcher: \"%s\", line %d: Expecting KEY = VALUE\n", path, number);
      valid_ = false;
    }
    start = std::min(end, text_.size() - 1) + 1;
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
    *last_value_ = joined(*last_value_, content);
    return true;
  }
  const std::size_t equals = content.find('=');
  const std::string_view key = la_trimmed(content.substr(0, equals));
  if (equals == content.npos || key.empty()) return false;
  int& known = index_.place(la_hash(key), is_key(key));
  last_value_ = &passed_over_;
  if (known == la_hash_index::NONE) {
    known = static_cast<int>(entries_.size());
    last_value_ = &entries_.emplace_back(entry{key, {}, number}).value;
  }
  *last_value_ = la_trimmed(content.substr(equals + 1));
  return true;
}

/// A line end and a blank lie between the two, and make room for the blank between the pieces.
std::string_view StaticAcdRead::joined(std::string_view value, std::string_view content) {
  if (value.empty()) return content;
  char* start = text_.data() + (value.data() - text_.data());
  start[value.size()] = ' ';
  std::memmove(start + value.size() + 1, content.data(), content.size());
  return {start, value.size() + 1 + content.size()};
}

const StaticAcdRead::entry* StaticAcdRead::find(std::string_view key) const {
  // Most keys are asked for in the order of the file.
  const std::size_t next = last_found_ + 1;
  if (next < entries_.size() && entries_[next].key == key) return &entries_[last_found_ = next];
  const int number = index_.find(la_hash(key), is_key(key));
  if (number == la_hash_index::NONE) return nullptr;
  last_found_ = static_cast<std::size_t>(number);
  return &entries_[last_found_];
}

std::string_view StaticAcdRead::value(std::string_view key) const {
  const entry* found = find(key);
  return found != nullptr ? found->value : std::string_view();
}

int StaticAcdRead::line(std::string_view key) const {
  const entry* found = find(key);
  return found != nullptr ? found->line : 0;
}

Port::StringBase<char> StaticAcdRead::GetStringByKey(const char* key, const char* separator,
                                                     short index, const char* separator2,
                                                     short index2) const {
  std::string_view text = piece_at(value(key), *separator, index);
  if (separator2 != nullptr) text = piece_at(text, *separator2, index2);
  return Port::StringBase<char>(std::string(text));
}
