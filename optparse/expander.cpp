#include "optparse/expander.h"

#include <algorithm>

namespace {

constexpr int STEP_LIMIT = 100;
int la_expand_steps = 0;

/// The result, in a buffer of the caller's. It may grow beyond the buffer, as what does not fit may
/// be cut off again.
class output {
 public:
  output(char* chars, int size) : chars_(chars), size_(static_cast<std::size_t>(size)) {}

  std::size_t length() const { return length_; }
  void cut(std::size_t length) { length_ = length; }

  /// Appends a piece to the text that begins at start. Where blanks meet blanks, one of them
  /// remains; at the start, none does.
  void join(std::string_view piece, std::size_t start) {
    if (piece.starts_with(' ') && (length_ == start || ends_with_blank())) {
      piece.remove_prefix(std::min(piece.find_first_not_of(' '), piece.size()));
      while (length_ > start && ends_with_blank()) --length_;
      if (length_ > start) append(" ");
    }
    append(piece);
  }

  /// Ends the text with its terminator. False if the two do not fit.
  bool terminate() {
    if (length_ >= size_) return false;
    chars_[length_] = '\0';
    return true;
  }

 private:
  bool ends_with_blank() const { return length_ <= size_ && chars_[length_ - 1] == ' '; }

  /// Blanks beyond the buffer do not count: what follows removes them, or does not fit either.
  void append(std::string_view piece) {
    if (length_ > size_) return;
    const std::size_t fitting = piece.copy(chars_ + length_, size_ - length_);
    length_ += fitting;
    if (piece.find_first_not_of(' ', fitting) != piece.npos) length_ = size_ + 1;
  }

  char* const chars_;
  const std::size_t size_;
  std::size_t length_ = 0;  ///< one more than the buffer has when something did not fit
};

enum class part_kind { TEMPLATE, OPTIONAL, REPEAT };

/// The template, or the body of a group, while it is being expanded.
struct part {
  const part_kind kind;
  const int position;       ///< the index of the values that its keywords give
  const std::size_t start;  ///< where its expansion begins
};

/// What a piece of a part comes to.
enum class outcome {
  TEXT,         ///< nothing that would keep a group
  SUBSTITUTED,  ///< something with a keyword's value in it
  MISSING,      ///< a keyword lacks a value: the group goes
  FAILED,
};

/// Whether a name goes on with c, at whatever it began.
bool continues_name(char c) {
  return UT_STR::IsAlpha(c) || c == '_';
}

bool is_literal(char c) {
  return c != '$' && c != '[' && c != '{';
}

/// The index of the "]" that belongs to the "[" at the front of text, or npos.
std::size_t closing_bracket(std::string_view text) {
  int depth = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '[') ++depth;
    if (text[i] == ']' && --depth == 0) return i;
  }
  return text.npos;
}

/// Takes the first length characters off text.
std::string_view take(std::string_view& text, std::size_t length) {
  const std::string_view taken = text.substr(0, length);
  text.remove_prefix(length);
  return taken;
}

/// Takes the first length characters off text, and those behind them for which holds is true.
std::string_view take_while(std::string_view& text, std::size_t length, bool (*holds)(char)) {
  while (length < text.size() && holds(text[length])) ++length;
  return take(text, length);
}

/// One expansion. All groups write to the one output, each behind what precedes it: as no group's
/// expansion begins with a blank, joining it to that is to leave it there.
class expander {
 public:
  expander(const DARRAY_LA_KEYWORD_ENTRY_PTR& keywords, char* result, int size)
      : keywords_(keywords), output_(result, size) {}

  la_expansion expand(std::string_view text) {
    la_expand_steps = 0;
    expand_part(text, part_kind::TEMPLATE, 0);
    return expansion_;
  }
  bool terminate() { return output_.terminate(); }
  std::size_t length() const { return output_.length(); }

 private:
  outcome expand_part(std::string_view text, part_kind kind, int position) {
    if (++la_expand_steps > STEP_LIMIT) return fail(la_template_fault::TOO_MANY_STEPS);
    const part whole = {kind, position, output_.length()};
    outcome all = outcome::TEXT;
    while (!text.empty()) {
      const outcome piece = expand_piece(text, whole);
      if (piece == outcome::MISSING || piece == outcome::FAILED) return piece;
      if (piece == outcome::SUBSTITUTED) all = piece;
    }
    return all;
  }

  // Each of these takes a piece from the front of rest.

  outcome expand_piece(std::string_view& rest, const part& in) {
    switch (rest.front()) {
      case '$':
        return expand_keyword(rest, in);
      case '[':
        return expand_optional(rest);
      case '{':
        return expand_repeat(rest, in);
      default:
        output_.join(take_while(rest, 0, is_literal), in.start);
        return outcome::TEXT;
    }
  }

  outcome expand_keyword(std::string_view& rest, const part& in) {
    rest.remove_prefix(1);
    // The first character of a name may be any.
    const std::size_t first = rest.empty() ? 0 : 1;
    const std::string_view name = take_while(rest, first, continues_name);
    const LA_KEYWORD_ENTRY* keyword = find_keyword(name);
    if (keyword == nullptr) return fail(la_template_fault::UNDEFINED_KEYWORD, name);
    const DARRAY_NAME& values = keyword->values;
    const char* value = in.position < values.count ? values.elements[in.position] : nullptr;
    if (value == nullptr) {
      return in.kind == part_kind::TEMPLATE ? fail(la_template_fault::NOT_OPTIONAL, name)
                                            : outcome::MISSING;
    }
    output_.join(value, in.start);
    return outcome::SUBSTITUTED;
  }

  outcome expand_optional(std::string_view& rest) {
    const std::size_t end = closing_bracket(rest);
    if (end == rest.npos) return fail(la_template_fault::OPEN_OPTIONAL);
    return expand_group(take(rest, end + 1), part_kind::OPTIONAL, 0);
  }

  outcome expand_repeat(std::string_view& rest, const part& in) {
    if (in.kind == part_kind::REPEAT) return fail(la_template_fault::NESTED_REPEAT);
    const std::size_t end = rest.find('}');
    if (end == rest.npos) return fail(la_template_fault::OPEN_REPEAT);
    const std::string_view group = take(rest, end + 1);
    outcome copy = expand_group(group, part_kind::REPEAT, 0);
    const outcome first = copy;
    for (int position = 1; copy == outcome::SUBSTITUTED; ++position) {
      copy = expand_group(group, part_kind::REPEAT, position);
    }
    return copy == outcome::FAILED ? copy : first;
  }

  /// Expands a group, given with its brackets. What has no value in it is dropped.
  outcome expand_group(std::string_view group, part_kind kind, int position) {
    const std::size_t start = output_.length();
    const outcome body = expand_part(group.substr(1, group.size() - 2), kind, position);
    if (body == outcome::TEXT || body == outcome::MISSING) output_.cut(start);
    return body == outcome::MISSING ? outcome::TEXT : body;
  }

  const LA_KEYWORD_ENTRY* find_keyword(std::string_view name) const {
    for (const LA_KEYWORD_ENTRY* keyword : keywords_) {
      const std::string& known = keyword->name;
      if (known.size() <= name.size() &&
          UT_STR::INCompare(known.c_str(), name.data(), known.size()) == 0) {
        return keyword;
      }
    }
    return nullptr;
  }

  outcome fail(la_template_fault fault, std::string_view name = {}) {
    expansion_ = {fault, name};
    return outcome::FAILED;
  }

  const DARRAY_LA_KEYWORD_ENTRY_PTR& keywords_;
  output output_;
  la_expansion expansion_;
};

}  // namespace

la_expansion la_expand(std::string_view text, const DARRAY_LA_KEYWORD_ENTRY_PTR& keywords,
                       char* result, int size) {
  expander expansion(keywords, result, size);
  const la_expansion expanded = expansion.expand(text);
  if (expanded.fault != la_template_fault::NONE) return expanded;
  if (!expansion.terminate()) return {la_template_fault::TOO_LONG, {}};
  const std::string_view all(result, expansion.length());
  if (all.find('}') != all.npos) return {la_template_fault::STRAY_REPEAT, {}};
  if (all.find(']') != all.npos) return {la_template_fault::STRAY_OPTIONAL, {}};
  return {};
}
