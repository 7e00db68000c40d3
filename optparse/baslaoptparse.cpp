#include "optparse/baslaoptparse.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <string_view>

#include "host/port_init.h"
#include "host/port_msgman.h"

namespace {

const Port::FileInit file_init;
const Port::PathListInit path_list_init;
const CitP::InstanceTableInit instance_table_init;
const CitP::FactoryInit factory_init;
const Port_MsgManInit message_manager_init;

char revision[] = "$Revision: 1.6 $";

Port_MsgManData& message(int line = __builtin_LINE()) {
  return Port_MsgManData::createObject("Kestrel", "optparse/baslaoptparse.cpp", line, revision);
}

/// What can be wrong with a template: the text and the line that it is known by.
struct finding {
  const char* text;
  int line;
};
constexpr finding UNDEFINED_KEYWORD = {"Undefined keyword \"%s\" in option string\n", 217};
constexpr finding NOT_OPTIONAL = {"Keyword \"%s\" is not optional\n", 226};
constexpr finding NESTED_REPEAT = {"Cannot nest {'s in option string\n", 267};
constexpr finding OPEN_REPEAT = {"Missing '}' in option string\n", 274};
constexpr finding OPEN_OPTIONAL = {"Missing ']' in option string\n", 332};
constexpr finding STRAY_REPEAT = {"Missing '{' in options string\n", 157};
constexpr finding STRAY_OPTIONAL = {"Missing '[' in options string\n", 163};

constexpr int STEP_LIMIT = 100;
int la_expand_steps = 0;

/// The result of an expansion. All groups write to the same buffer, each behind what precedes it:
/// as no group's expansion begins with a blank, joining it to its surroundings is to leave it
/// there. Characters beyond the end of the buffer are counted and not kept, since a group that
/// reaches there may still be dropped.
class expansion_text {
 public:
  expansion_text(char* buffer, int size) : buffer_(buffer), size_(static_cast<std::size_t>(size)) {}

  /// A place to return to: where a group begins.
  struct mark {
    std::size_t length;
    std::size_t trailing_blanks;
    std::size_t start;
  };

  mark begin_group() {
    const mark here = {length_, trailing_blanks_, start_};
    start_ = length_;
    trailing_blanks_ = 0;
    return here;
  }
  void keep_group(const mark& begin) {
    if (length_ == begin.length) trailing_blanks_ = begin.trailing_blanks;
    start_ = begin.start;
  }
  void drop_group(const mark& begin) {
    length_ = begin.length;
    trailing_blanks_ = begin.trailing_blanks;
    start_ = begin.start;
  }

  /// Appends a piece. Where blanks at its front meet blanks at the end of the text, or the
  /// beginning of the group, one of them remains, or none.
  void join_option(std::string_view piece) {
    const bool empty = length_ == start_;
    if (piece.starts_with(' ') && (empty || trailing_blanks_ > 0)) {
      length_ -= trailing_blanks_;
      trailing_blanks_ = 0;
      if (length_ > start_) append(" ");
      piece.remove_prefix(std::min(piece.find_first_not_of(' '), piece.size()));
    }
    append(piece);
  }

  bool fits() const { return length_ < size_; }
  void terminate() { buffer_[length_] = '\0'; }

 private:
  void append(std::string_view piece) {
    if (length_ < size_)
      std::memcpy(buffer_ + length_, piece.data(), std::min(piece.size(), size_ - length_));
    length_ += piece.size();
    const std::size_t last = piece.find_last_not_of(' ');
    if (last == piece.npos) {
      trailing_blanks_ += piece.size();
    } else {
      trailing_blanks_ = piece.size() - last - 1;
    }
  }

  char* buffer_;
  std::size_t size_;
  std::size_t length_ = 0;
  std::size_t trailing_blanks_ = 0;  ///< of the current group
  std::size_t start_ = 0;            ///< where the current group begins
};

/// How a step of the expansion goes on: a failed one has said why.
enum class outcome { DONE, NO_VALUE, FAILED };

class expander {
 public:
  expander(const DARRAY_LA_KEYWORD_ENTRY_PTR& entries, expansion_text& output)
      : entries_(entries), output_(output) {}

  /// One step: expands text behind what the output holds. On success substituted tells whether a
  /// keyword or a group gave something; the caller drops the output otherwise. position is the
  /// index of the value that keywords in a repeat group give.
  bool expand_part(std::string_view text, bool& substituted, bool optional, bool in_repeat,
                   int position) {
    substituted = false;
    if (++la_expand_steps > STEP_LIMIT) return false;
    while (!text.empty()) {
      switch (expand_piece(text, substituted, optional, in_repeat, position)) {
        case outcome::DONE:
          break;
        case outcome::NO_VALUE:
          substituted = false;
          return true;
        case outcome::FAILED:
          return false;
      }
    }
    return true;
  }

 private:
  /// Takes a piece from the front of text and expands it.
  outcome expand_piece(std::string_view& text, bool& substituted, bool optional, bool in_repeat,
                       int position) {
    switch (text[0]) {
      case '$':
        return expand_keyword(text, substituted, optional, in_repeat, position);
      case '[':
        return expand_optional(text, substituted);
      case '{':
        return expand_repeat(text, substituted, in_repeat);
      default:
        output_.join_option(take(text, text.find_first_of("$[{")));
        return outcome::DONE;
    }
  }

  outcome expand_keyword(std::string_view& text, bool& substituted, bool optional, bool in_repeat,
                         int position) {
    const std::string_view name = take(text, end_of_name(text)).substr(1);
    const LA_KEYWORD_ENTRY* entry = find(name);
    if (entry == nullptr) return fail(UNDEFINED_KEYWORD, name);
    if (entry->values.elements[0] == nullptr) {
      return optional || in_repeat ? outcome::NO_VALUE : fail(NOT_OPTIONAL, name);
    }
    const int index = in_repeat ? position : 0;
    if (index >= entry->values.count || entry->values.elements[index] == nullptr) {
      return outcome::NO_VALUE;
    }
    output_.join_option(entry->values.elements[index]);
    substituted = true;
    return outcome::DONE;
  }

  outcome expand_repeat(std::string_view& text, bool& substituted, bool in_repeat) {
    if (in_repeat) return fail(NESTED_REPEAT);
    const std::size_t end = text.find('}');
    if (end == text.npos) return fail(OPEN_REPEAT);
    const std::string_view body = take(text, end + 1).substr(1, end - 1);
    for (int position = 0;; ++position) {
      bool kept = false;
      if (!expand_group(body, kept, false, true, position)) return outcome::FAILED;
      if (!kept) return outcome::DONE;
      substituted = true;
    }
  }

  outcome expand_optional(std::string_view& text, bool& substituted) {
    const std::size_t end = end_of_optional(text);
    if (end == text.npos) return fail(OPEN_OPTIONAL);
    const std::string_view body = take(text, end + 1).substr(1, end - 1);
    bool kept = false;
    if (!expand_group(body, kept, true, false, 0)) return outcome::FAILED;
    if (kept) substituted = true;
    return outcome::DONE;
  }

  bool expand_group(std::string_view body, bool& kept, bool optional, bool in_repeat,
                    int position) {
    const expansion_text::mark begin = output_.begin_group();
    if (!expand_part(body, kept, optional, in_repeat, position)) return false;
    if (kept) {
      output_.keep_group(begin);
    } else {
      output_.drop_group(begin);
    }
    return true;
  }

  /// Takes length characters, or all, from the front of text.
  static std::string_view take(std::string_view& text, std::size_t length) {
    const std::string_view front = text.substr(0, length);
    text.remove_prefix(front.size());
    return front;
  }

  static std::size_t end_of_name(std::string_view text) {
    std::size_t end = 2;
    while (end < text.size() && (UT_STR::IsAlpha(text[end]) || text[end] == '_')) ++end;
    return end;
  }

  /// Position of the "]" that balances the "[" at the front of text, or npos.
  static std::size_t end_of_optional(std::string_view text) {
    int depth = 0;
    for (std::size_t i = 1; i < text.size(); ++i) {
      if (text[i] == '[') ++depth;
      if (text[i] == ']' && depth-- == 0) return i;
    }
    return text.npos;
  }

  /// The first entry whose name the reference begins with: a longer reference is that keyword too.
  const LA_KEYWORD_ENTRY* find(std::string_view name) const {
    for (const LA_KEYWORD_ENTRY* entry : entries_) {
      const std::size_t length = UT_STR::Len(entry->name);
      if (length <= name.size() && UT_STR::INCompare(name.data(), entry->name, length) == 0) {
        return entry;
      }
    }
    return nullptr;
  }

  static outcome fail(const finding& found, std::string_view name = {}) {
    char text[LA_MAX_PATH];
    text[name.copy(text, sizeof text - 1)] = '\0';
    message(found.line).issueError(found.text, text);
    return outcome::FAILED;
  }

  const DARRAY_LA_KEYWORD_ENTRY_PTR& entries_;
  expansion_text& output_;
};

}  // namespace

void LA_KEYWORD_ENTRY::add_value(const char* value) {
  values.append(value != nullptr ? UT_STR::Dup(value) : nullptr);
}

void LA_KEYWORD_ENTRY::clear_values() {
  for (char* value : values) delete[] value;
  values.a_resetnum(0);
}

void LA_KEYWORD_ENTRY::dump() const {
  for (const char* value : values) message(84).issueStatus("%s = %s", name.get(), value);
}

LA_KEYWORD_TABLE::~LA_KEYWORD_TABLE() {
  for (LA_KEYWORD_ENTRY* entry : entries) delete entry;
}

LA_KEYWORD_ENTRY& LA_KEYWORD_TABLE::entry(const char* name) {
  for (LA_KEYWORD_ENTRY* entry : entries) {
    if (UT_STR::Compare(entry->name, name) == 0) return *entry;
  }
  auto created = std::make_unique<LA_KEYWORD_ENTRY>(name);
  entries.append(created.get());
  return *created.release();
}

void LA_KEYWORD_TABLE::set_keyword(const char* name, const char* value) {
  // The copy comes first: value may be one of those that go.
  const la_text copy(value);
  LA_KEYWORD_ENTRY& keyword = entry(name);
  keyword.clear_values();
  keyword.add_value(copy);
}

void LA_KEYWORD_TABLE::add_keyword(const char* name, const char* value) {
  entry(name).add_value(value);
}

unsigned char LA_KEYWORD_TABLE::expand(char* options, int size) const {
  la_expand_steps = 0;
  char text[LA_MAX_PATH];
  if (UT_STR::Copy(text, options) == nullptr) {
    message().issueError("Launcher: Option string \"%s\" is longer than %d characters\n", options,
                         LA_MAX_PATH - 1);
    return 0;
  }
  expansion_text output(options, size);
  bool substituted = false;
  const bool expanded = expander(entries, output).expand_part(text, substituted, false, false, 0);
  if (!expanded || !output.fits()) {
    UT_STR::Copy(options, text);
    if (expanded) {
      message().issueError(
          "Launcher: The expansion of option string \"%s\" is longer than %d characters\n", options,
          size - 1);
    }
    return 0;
  }
  output.terminate();
  const finding* stray = std::strchr(options, '}') != nullptr   ? &STRAY_REPEAT
                         : std::strchr(options, ']') != nullptr ? &STRAY_OPTIONAL
                                                                : nullptr;
  if (stray != nullptr) message(stray->line).issueError(stray->text);
  return stray == nullptr;
}

void LA_KEYWORD_TABLE::dump() const {
  for (const LA_KEYWORD_ENTRY* entry : entries) entry->dump();
}
