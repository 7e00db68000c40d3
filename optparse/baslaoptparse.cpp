#include "optparse/baslaoptparse.h"

#include <algorithm>
#include <array>
#include <cstdint>
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

/// What can be wrong with a template: the text, if anything is to be said, and the line that it is
/// known by.
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
constexpr finding TOO_MANY_STEPS = {nullptr, 0};

constexpr int STEP_LIMIT = 100;
int la_expand_steps = 0;

/// What a character is to the reader of a template. Letters, "_" among them, continue a name. Marks
/// end literal text: what begins a construct, what ends one, and the terminator.
enum character : unsigned char { PLAIN, LETTER, MARK };

constexpr std::array<character, 256> CHARACTERS = [] {
  std::array<character, 256> kinds = {};
  for (std::size_t c = 'a'; c <= 'z'; ++c) kinds[c] = kinds[c - 'a' + 'A'] = LETTER;
  kinds['_'] = LETTER;
  // The terminator of the marks is one of them.
  for (const char mark : "$[]{}") kinds[static_cast<unsigned char>(mark)] = MARK;
  return kinds;
}();

constexpr character kind_of(char c) {
  return CHARACTERS[static_cast<unsigned char>(c)];
}

/// Letters that differ in case alone have the same.
constexpr std::size_t bucket(char first) {
  return static_cast<unsigned char>(first) % 32;
}

/// Pieces are copied in blocks of so many characters: behind a template and a value there is room
/// for one more.
constexpr std::ptrdiff_t BLOCK = 16;

/// One expansion. All groups write to the same buffer, each behind what precedes it: as no group's
/// expansion begins with a blank, joining it to its surroundings is to leave it there.
///
/// An optional group ends where its "]" is met. If something may happen before - a failure, the end
/// of the group for want of a value, a name or a repeat group that may hold a bracket - the "]" has
/// to be found first: a template that lacks it has no other fault.
class expander {
 public:
  expander(LA_KEYWORD_ENTRY* const* keywords, char* result, int size)
      : keywords_(keywords), buffer_(result), size_(size) {}

  /// Takes a template, and keeps a copy of it, as it may lie where the result goes. False if it is
  /// too long.
  bool read(const char* options) {
    const void* behind = ::memccpy(text_, options, '\0', LA_MAX_PATH);
    if (behind == nullptr) return false;
    *part_ = {text_, static_cast<const char*>(behind) - 1, 0, 0, part_kind::TEMPLATE, false, false};
    return true;
  }
  const char* text() const { return text_; }

  /// Expands the template. False after a failure, which has said why.
  bool expand() {
    la_expand_steps = 1;
    const char* at = text_;
    for (;;) {
      if (kind_of(*at) != MARK) expand_literal(at);
      bool good = true;
      switch (*at) {
        case '$':
          good = expand_keyword(++at);
          break;
        case '[':
          good = begin_group(++at, part_kind::OPTIONAL, part_->end);
          break;
        case '{':
          good = begin_repeat(++at);
          break;
        default:
          if (at != part_->end && !(*at == ']' && part_->open)) {
            may_have_stray_ = true;
            expand_literal(at);
          } else if (part_->kind == part_kind::TEMPLATE) {
            return true;
          } else {
            good = end_group(at);
          }
      }
      if (!good) return false;
    }
  }

  /// Whether the result fits into the buffer, with its terminator.
  bool fits() const { return length_ < size_; }
  /// Whether a "}" or "]" may have come into the result.
  bool may_have_stray() const { return may_have_stray_; }
  /// The result, if it fits, and behind it the terminator.
  std::string_view result() {
    buffer_[length_] = '\0';
    return {buffer_, static_cast<std::size_t>(length_)};
  }

 private:
  enum class part_kind : unsigned char { TEMPLATE, OPTIONAL, REPEAT };

  /// The template, or a group that is being expanded.
  struct part {
    const char* body;
    const char* end;        ///< the terminator, or what ends the group
    std::ptrdiff_t length;  ///< of what precedes its expansion
    int position;           ///< the index of the values that its keywords give
    part_kind kind;
    bool open;  ///< whether its "]" is yet to be found: end is that of the part around it
    bool substituted;
  };

  // Each of these takes a piece, which begins at at or in front of it, and moves on behind it.

  void expand_literal(const char*& at) {
    const char* start = at++;
    while (kind_of(*at) != MARK) ++at;
    join_option(start, at - start);
  }

  bool expand_keyword(const char*& at) {
    const char* name = at;
    char first = *name;
    if (kind_of(first) == MARK) {
      if (!find_ends()) return fail(OPEN_OPTIONAL);
      if (name == part_->end) first = '\0';
    }
    const LA_KEYWORD_ENTRY* entry = keywords_[bucket(first)];
    while (entry != nullptr && !begins(*entry, name)) entry = entry->next;
    if (entry != nullptr && entry->name_length != 0) {
      at += entry->name_length;
    } else if (first != '\0') {
      ++at;
    }
    while (kind_of(*at) == LETTER) ++at;
    if (entry == nullptr) return fail(UNDEFINED_KEYWORD, {name, at});

    const int position = part_->position;
    const char* value = position < entry->values.count ? entry->values.elements[position] : nullptr;
    if (value != nullptr) {
      join_option(value, entry->lengths[static_cast<std::size_t>(position)]);
      part_->substituted = true;
      may_have_stray_ |= entry->has_stray;
      return true;
    }
    if (part_->kind == part_kind::TEMPLATE) return fail(NOT_OPTIONAL, {name, at});
    if (!find_ends()) return fail(OPEN_OPTIONAL);
    part_->substituted = false;
    at = part_->end;
    return end_group(at);
  }

  bool begin_repeat(const char* at) {
    if (part_->kind == part_kind::REPEAT) return fail(NESTED_REPEAT);
    if (!find_ends()) return fail(OPEN_OPTIONAL);
    const char* end = std::find(at, part_->end, '}');
    return end != part_->end ? begin_group(at, part_kind::REPEAT, end) : fail(OPEN_REPEAT);
  }

  bool begin_group(const char* at, part_kind kind, const char* end) {
    *++part_ = {at, end, length_, 0, kind, kind == part_kind::OPTIONAL, false};
    return count_step();
  }

  bool count_step() { return ++la_expand_steps <= STEP_LIMIT || fail(TOO_MANY_STEPS); }

  /// Keeps or drops a group that ends at at, and begins the next copy of one that repeats.
  bool end_group(const char*& at) {
    if (part_->open && *at != ']') return fail(OPEN_OPTIONAL);
    if (!part_->substituted) {
      length_ = part_->length;
    } else {
      part_[-1].substituted = true;
      if (part_->kind == part_kind::REPEAT) {
        at = part_->body;
        part_->length = length_;
        part_->substituted = false;
        ++part_->position;
        return count_step();
      }
    }
    ++at;
    --part_;
    return true;
  }

  /// Finds the ends of the optional groups that are open. False if there is none for one.
  bool find_ends() {
    for (part* group = parts_ + 1; group <= part_; ++group) {
      if (!group->open) continue;
      const char* at = group->body;
      const char* end = group[-1].end;
      for (int depth = 0; at != end; ++at) {
        if (*at == '[') ++depth;
        if (*at == ']' && depth-- == 0) break;
      }
      if (at == end) return false;
      group->end = at;
      group->open = false;
    }
    return true;
  }

  /// Appends a piece, which something other than a blank follows. Where blanks at its front meet
  /// blanks at the end of the text, or the beginning of the group, one of them remains, or none.
  void join_option(const char* piece, std::ptrdiff_t size) {
    if (*piece == ' ' && length_ <= size_) {
      const bool empty = length_ == part_->length;
      if (empty || buffer_[length_ - 1] == ' ') {
        while (*piece == ' ') ++piece, --size;
        if (!empty) {
          while (buffer_[length_ - 1] == ' ') --length_;
          ++length_;
        }
      }
    }
    if (length_ + size + BLOCK <= size_) {
      std::ptrdiff_t i = 0;
      do {
        std::memcpy(buffer_ + length_ + i, piece + i, BLOCK);
        i += BLOCK;
      } while (i < size);
      length_ += size;
    } else {
      append_near_end(piece, size);
    }
  }

  /// Appends a piece that may not fit. Blanks beyond the buffer do not count: what follows them
  /// removes them, or does not fit either.
  void append_near_end(const char* piece, std::ptrdiff_t size) {
    for (const char* end = piece + size; piece != end; ++piece) {
      if (length_ < size_) {
        buffer_[length_++] = *piece;
      } else if (*piece != ' ') {
        length_ = size_ + 1;
      }
    }
  }

  /// Whether text begins with the name of a keyword, in any case of letters.
  static bool begins(const LA_KEYWORD_ENTRY& entry, const char* text) {
    constexpr std::uint64_t CASE = 0x2020202020202020;  // in what letters differ from capitals
    std::uint64_t head;
    std::memcpy(&head, text, sizeof head);
    const std::uint64_t difference = (head ^ entry.head) & entry.mask;
    if ((difference & ~CASE) != 0) return false;
    if (difference == 0 && entry.name_length <= sizeof head) return true;
    return UT_STR::NCompare(entry.name, text, entry.name_length) == 0 ||
           UT_STR::INCompare(entry.name, text, entry.name_length) == 0;
  }

  bool fail(finding found, std::string_view name = {}) {
    if (!find_ends()) found = OPEN_OPTIONAL;
    if (found.text == nullptr) return false;
    char text[LA_MAX_PATH];
    text[name.copy(text, sizeof text - 1)] = '\0';
    message(found.line).issueError(found.text, text);
    return false;
  }

  LA_KEYWORD_ENTRY* const* keywords_;
  char* buffer_;
  std::ptrdiff_t size_;
  std::ptrdiff_t length_ = 0;  ///< one more than the buffer has when something did not fit
  bool may_have_stray_ = false;
  part* part_ = parts_;
  part parts_[STEP_LIMIT + 1];
  char text_[LA_MAX_PATH + BLOCK];
};

}  // namespace

LA_KEYWORD_ENTRY::LA_KEYWORD_ENTRY(const char* name)
    : name(name), name_length(UT_STR::Len(name)), values(3) {
  const std::size_t size = std::min(name_length, sizeof head);
  std::memcpy(&head, name, size);
  std::memset(&mask, 0xff, size);
}

void LA_KEYWORD_ENTRY::add_value(const char* value) {
  const std::size_t length = value != nullptr ? UT_STR::Len(value) : 0;
  char* copy = value != nullptr ? new char[length + 1 + BLOCK] : nullptr;
  if (value != nullptr) std::memcpy(copy, value, length + 1);
  has_stray |= value != nullptr && std::strpbrk(value, "]}") != nullptr;
  lengths.push_back(static_cast<std::ptrdiff_t>(length));
  values.append(copy);
}

void LA_KEYWORD_ENTRY::clear_values() {
  for (char* value : values) delete[] value;
  values.a_resetnum(0);
  lengths.clear();
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
  // What no reference begins with is in no chain. An empty name begins every reference.
  const bool is_empty = created->name_length == 0;
  const bool is_name = std::all_of(name + (is_empty ? 0 : 1), name + created->name_length,
                                   [](char c) { return kind_of(c) == LETTER; });
  for (std::size_t i = 0; is_name && i < std::size(first_); ++i) {
    if (!is_empty && i != bucket(name[0])) continue;
    LA_KEYWORD_ENTRY** link = &first_[i];
    while (*link != nullptr) link = &(*link)->next;
    *link = created.get();
  }
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

// Where the code lies in the lines of the cache makes a difference of a fifth.
[[gnu::aligned(64)]] unsigned char LA_KEYWORD_TABLE::expand(const char* options, char* result,
                                                            int size) const {
  expander expansion(first_, result, size);
  if (!expansion.read(options)) {
    message().issueError("Launcher: Option string \"%s\" is longer than %d characters\n", options,
                         LA_MAX_PATH - 1);
    std::memmove(result, options, UT_STR::Len(options) + 1);
    return 0;
  }
  const bool expanded = expansion.expand();
  if (!expanded || !expansion.fits()) {
    UT_STR::Copy(result, expansion.text());
    if (expanded) {
      message().issueError(
          "Launcher: The expansion of option string \"%s\" is longer than %d characters\n",
          expansion.text(), size - 1);
    }
    return 0;
  }
  const std::string_view all = expansion.result();
  if (!expansion.may_have_stray()) return 1;
  const finding* stray = all.find('}') != all.npos   ? &STRAY_REPEAT
                         : all.find(']') != all.npos ? &STRAY_OPTIONAL
                                                     : nullptr;
  if (stray != nullptr) message(stray->line).issueError(stray->text);
  return stray == nullptr;
}

void LA_KEYWORD_TABLE::dump() const {
  for (const LA_KEYWORD_ENTRY* entry : entries) entry->dump();
}
