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

  /// Where a group begins, and how to return there.
  struct mark {
    std::size_t length;
    std::size_t blanks;
    std::size_t start;
  };

  mark begin_group() {
    const mark here = {length_, blanks_, start_};
    start_ = length_;
    return here;
  }
  void keep_group(const mark& begin) { start_ = begin.start; }
  void drop_group(const mark& begin) {
    length_ = begin.length;
    blanks_ = begin.blanks;
    start_ = begin.start;
  }

  /// Appends a piece. Where blanks at its front meet blanks at the end of the text, or the
  /// beginning of the group, one of them remains, or none.
  void join_option(std::string_view piece) {
    const bool empty = length_ == start_;
    if (piece.starts_with(' ') && (empty || blanks_ < length_)) {
      if (!empty) length_ = blanks_ + 1;
      do {
        piece.remove_prefix(1);
      } while (piece.starts_with(' '));
    }
    append(piece);
  }

  bool fits() const { return length_ < size_; }
  void terminate() { buffer_[length_] = '\0'; }

 private:
  void append(std::string_view piece) {
    if (length_ < size_)
      std::memcpy(buffer_ + length_, piece.data(), std::min(piece.size(), size_ - length_));
    const std::size_t end = length_ + piece.size();
    while (piece.ends_with(' ')) piece.remove_suffix(1);
    if (!piece.empty()) blanks_ = length_ + piece.size();
    length_ = end;
  }

  char* buffer_;
  std::size_t size_;
  std::size_t length_ = 0;
  std::size_t blanks_ = 0;  ///< where the blanks at the end begin; length_ when there are none
  std::size_t start_ = 0;   ///< where the current group begins
};

/// What a piece or a part of a template gives: something of which a keyword is the reason, nothing
/// of the kind, or a failure, which has said why.
enum class outcome { SUBSTITUTED, NOTHING, FAILED };

enum class part_kind { TEMPLATE, OPTIONAL, REPEAT };

constexpr bool begins_construct(char c) {
  return c == '$' || c == '[' || c == '{';
}

constexpr bool continues_name(char c) {
  return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_';
}

class expander {
 public:
  expander(const LA_KEYWORD_TABLE& keywords, expansion_text& output)
      : keywords_(keywords), output_(output) {}

  /// One step: expands the text from at to end behind what the output holds. If it gives nothing,
  /// the caller drops the output of a group. position is the index of the value that keywords in a
  /// repeat group give, and 0 elsewhere.
  outcome expand_part(const char* at, const char* end, part_kind kind, int position) {
    if (++la_expand_steps > STEP_LIMIT) return outcome::FAILED;
    outcome all = outcome::NOTHING;
    while (at != end) {
      outcome piece = outcome::NOTHING;
      switch (*at) {
        case '$':
          piece = expand_keyword(at, end, kind, position);
          if (piece == outcome::NOTHING) return piece;
          break;
        case '[':
          piece = expand_optional(at, end);
          break;
        case '{':
          piece = expand_repeat(at, end, kind);
          break;
        default:
          expand_literal(at, end);
      }
      if (piece == outcome::FAILED) return piece;
      if (piece == outcome::SUBSTITUTED) all = piece;
    }
    return all;
  }

 private:
  // Each of these expands the piece at the front of the text, and moves on behind it.

  void expand_literal(const char*& at, const char* end) {
    const char* start = at;
    at = std::find_if(at + 1, end, begins_construct);
    output_.join_option(std::string_view(start, at));
  }

  outcome expand_keyword(const char*& at, const char* end, part_kind kind, int position) {
    const char* start = ++at;
    if (at != end) at = std::find_if_not(at + 1, end, continues_name);
    const std::string_view name(start, at);
    const LA_KEYWORD_ENTRY* entry = keywords_.find(name);
    if (entry == nullptr) return fail(UNDEFINED_KEYWORD, name);
    const DARRAY_NAME& values = entry->values;
    if (values.elements[0] == nullptr && kind == part_kind::TEMPLATE) {
      return fail(NOT_OPTIONAL, name);
    }
    if (values.elements[0] == nullptr || position >= values.count ||
        values.elements[position] == nullptr) {
      return outcome::NOTHING;
    }
    output_.join_option(values.elements[position]);
    return outcome::SUBSTITUTED;
  }

  outcome expand_repeat(const char*& at, const char* end, part_kind kind) {
    if (kind == part_kind::REPEAT) return fail(NESTED_REPEAT);
    const char* body = at + 1;
    at = std::find(body, end, '}');
    if (at == end) return fail(OPEN_REPEAT);
    const char* end_of_body = at++;
    outcome all = outcome::NOTHING;
    for (int position = 0;; ++position) {
      const outcome copy = expand_group(body, end_of_body, part_kind::REPEAT, position);
      if (copy == outcome::FAILED) return copy;
      if (copy == outcome::NOTHING) return all;
      all = copy;
    }
  }

  outcome expand_optional(const char*& at, const char* end) {
    const char* body = at + 1;
    at = end_of_optional(body, end);
    if (at == end) return fail(OPEN_OPTIONAL);
    return expand_group(body, at++, part_kind::OPTIONAL, 0);
  }

  outcome expand_group(const char* at, const char* end, part_kind kind, int position) {
    const expansion_text::mark begin = output_.begin_group();
    const outcome result = expand_part(at, end, kind, position);
    if (result == outcome::SUBSTITUTED) {
      output_.keep_group(begin);
    } else {
      output_.drop_group(begin);
    }
    return result;
  }

  /// The "]" that balances the "[" in front of at, or end.
  static const char* end_of_optional(const char* at, const char* end) {
    for (int depth = 0; at != end; ++at) {
      if (*at == '[') ++depth;
      if (*at == ']' && depth-- == 0) break;
    }
    return at;
  }

  static outcome fail(const finding& found, std::string_view name = {}) {
    char text[LA_MAX_PATH];
    text[name.copy(text, sizeof text - 1)] = '\0';
    message(found.line).issueError(found.text, text);
    return outcome::FAILED;
  }

  const LA_KEYWORD_TABLE& keywords_;
  expansion_text& output_;
};

constexpr char lower(char c) {
  return c >= 'A' && c <= 'Z' ? static_cast<char>(c + ('a' - 'A')) : c;
}

/// Whether reference begins with name, in any case of letters.
bool begins_with(std::string_view reference, const char* name) {
  for (const char c : reference) {
    if (c != *name && lower(c) != lower(*name)) break;
    ++name;
  }
  return *name == '\0';
}

/// Letters that differ in case alone have the same.
constexpr std::size_t bucket(char first) {
  return static_cast<unsigned char>(first) % 32;
}

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

LA_KEYWORD_TABLE::LA_KEYWORD_TABLE() : entries(10) {
  std::fill(std::begin(first_), std::end(first_), NONE);
}

LA_KEYWORD_TABLE::~LA_KEYWORD_TABLE() {
  for (LA_KEYWORD_ENTRY* entry : entries) delete entry;
}

LA_KEYWORD_ENTRY& LA_KEYWORD_TABLE::entry(const char* name) {
  for (LA_KEYWORD_ENTRY* entry : entries) {
    if (UT_STR::Compare(entry->name, name) == 0) return *entry;
  }
  auto created = std::make_unique<LA_KEYWORD_ENTRY>(name);
  for (std::size_t i = 0; i < std::size(first_); ++i) {
    // An empty name begins every reference.
    const bool may_match = name[0] == '\0' || i == bucket(name[0]);
    if (may_match && first_[i] == NONE) first_[i] = entries.count;
  }
  entries.append(created.get());
  return *created.release();
}

const LA_KEYWORD_ENTRY* LA_KEYWORD_TABLE::find(std::string_view reference) const {
  const std::size_t start = bucket(reference.empty() ? '\0' : reference[0]);
  for (int i = first_[start]; i < entries.count; ++i) {
    if (begins_with(reference, entries.elements[i]->name)) return entries.elements[i];
  }
  return nullptr;
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
  const std::size_t length = UT_STR::Len(options);
  if (length >= sizeof text) {
    message().issueError("Launcher: Option string \"%s\" is longer than %d characters\n", options,
                         LA_MAX_PATH - 1);
    return 0;
  }
  std::memcpy(text, options, length + 1);
  expansion_text output(options, size);
  const bool expanded =
      expander(*this, output).expand_part(text, text + length, part_kind::TEMPLATE, 0) !=
      outcome::FAILED;
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
