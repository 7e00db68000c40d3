// Strings: the operations that the library uses on zero-terminated 8-bit strings, and la_text, the
// owned, possibly absent string that its records are made of.
#ifndef KESTREL_HOST_UT_STR_H
#define KESTREL_HOST_UT_STR_H

#include <cstddef>
#include <cstring>
#include <memory>

/// Length, terminator included, of every fixed path buffer.
constexpr int LA_MAX_PATH = 260;

/// Operations on zero-terminated strings. Letters are those of ASCII whatever the locale; blanks
/// are the space and the tab. No argument may be null.
class UT_STR {
 public:
  /// Copies src into dest, a buffer of size characters. Returns dest; null when src does not fit,
  /// and dest is then the empty string.
  static char* Copy(char* dest, const char* src, std::size_t size = LA_MAX_PATH);
  /// Appends src to the string in dest, a buffer of size characters. Returns dest; null when it
  /// does not fit, and dest is then unchanged.
  static char* Cat(char* dest, const char* src, std::size_t size = LA_MAX_PATH);
  /// A new copy of s, made with array new; the caller releases it with array delete.
  static char* Dup(const char* s);
  /// Number of characters before the terminator.
  static std::size_t Len(const char* s) { return std::strlen(s); }

  /// The comparisons return 0 for equal, else a value below or above 0 for the order of a and b.
  /// Those with an N look at the first n characters at most, those with an I ignore the case of
  /// letters.
  static int Compare(const char* a, const char* b);
  static int ICompare(const char* a, const char* b);
  static int NCompare(const char* a, const char* b, std::size_t n);
  static int INCompare(const char* a, const char* b, std::size_t n);
  static int _Compare(const char* a, const char* b);  // NOLINT(bugprone-reserved-identifier)

  /// First and last occurrence of c in s, or null.
  static char* FindChar(char* s, int c);
  static char* RFindChar(char* s, int c);

  /// Removes the blanks at both ends, in place.
  static void Trim(char* s);
  /// 1 when s holds nothing but blanks, or nothing at all; else 0.
  static unsigned char AllBlank(const char* s);
  /// Takes a token from the front of line. Blanks at the front are skipped; the token is the text
  /// up to the first of the delimiters, and both are removed from line. Where the space is a
  /// delimiter a tab is one too, and counts as a space. token holds at least as much as line.
  /// Returns the delimiter that ended the token, or 0 when none did and line is now empty.
  static char GetToken(char* line, char* token, const char* delimiters);
  /// Reads s, or so many characters of it, as a whole as a decimal integer, possibly signed.
  /// Returns 0, and leaves value alone, when that is anything else or the number does not fit.
  static unsigned char StrToL(const char* s, long& value);
  static unsigned char StrToL(const char* s, std::size_t length, long& value);
  /// Turns letters into lower case, in place.
  static void Lower(char* s);
  /// Non-zero for a letter.
  static int IsAlpha(int c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }
};

/// A string of its own, or none: an absent text and an empty one are two things. Copies are deep.
class la_text {
 public:
  la_text() = default;
  /// A copy of chars; null makes an absent text.
  la_text(const char* chars) : chars_(chars != nullptr ? UT_STR::Dup(chars) : nullptr) {}
  /// A copy of the first length characters of chars, which hold no terminator.
  la_text(const char* chars, std::size_t length);
  la_text(const la_text& other) : la_text(other.get()) {}
  la_text(la_text&& other) noexcept = default;
  la_text& operator=(const la_text& other) { return *this = la_text(other); }
  la_text& operator=(la_text&& other) noexcept = default;

  /// The characters, or null for an absent text; good until the text is changed or destroyed.
  const char* get() const noexcept { return chars_.get(); }
  operator const char*() const noexcept { return get(); }

 private:
  std::unique_ptr<char[]> chars_;
};

#endif
