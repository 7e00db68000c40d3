// Finds things that are kept elsewhere, by their numbers.
#ifndef KESTREL_HOST_HASH_INDEX_H
#define KESTREL_HOST_HASH_INDEX_H

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <utility>
#include <vector>

constexpr std::uint32_t LA_HASH_START = 2166136261;

/// The hash of a text that goes on with c. It ignores the case of letters.
constexpr std::uint32_t la_hash(char c, std::uint32_t start) {
  return (start ^ (static_cast<unsigned char>(c) | 0x20U)) * 16777619;
}
/// The hash of text; start is that of what stands before it.
inline std::uint32_t la_hash(std::string_view text, std::uint32_t start = LA_HASH_START) {
  for (const char c : text) start = la_hash(c, start);
  return start;
}
/// Likewise of a zero-terminated text; null is like an empty one.
inline std::uint32_t la_hash(const char* text, std::uint32_t start = LA_HASH_START) {
  while (text != nullptr && *text != '\0') start = la_hash(*text++, start);
  return start;
}

/// The element of this number.
template <class Table>
auto& la_at(Table& table, int number) {
  return table[static_cast<std::size_t>(number)];
}

/// Numbers by the hash of what they stand for. It holds no keys, which makes it small: whoever asks
/// tells whether a number is that of the thing in question.
class la_hash_index {
 public:
  static constexpr int NONE = -1;

  la_hash_index() = default;
  /// With room for so many numbers.
  explicit la_hash_index(int count)
      : slots_(std::bit_ceil(2 * static_cast<std::size_t>(count) + 2)) {}

  /// The number under this hash for which is_it(number) holds, or NONE.
  template <class Test>
  int find(std::uint32_t hash, Test is_it) const {
    return slots_.empty() ? NONE : slots_[search(hash, is_it)].number;
  }
  /// Likewise, the place of that number, to be set or changed before the next call.
  template <class Test>
  int& place(std::uint32_t hash, Test is_it) {
    if (2 * used_ >= slots_.size()) grow();
    slot& found = slots_[search(hash, is_it)];
    if (found.number == NONE) ++used_;
    found.hash = hash;
    return found.number;
  }

 private:
  struct slot {
    std::uint32_t hash = 0;
    int number = NONE;
  };

  /// The slot of the number, or the one where it belongs: half of the slots are free.
  template <class Test>
  std::size_t search(std::uint32_t hash, Test is_it) const {
    std::size_t at = hash;
    for (;; ++at) {
      const slot& found = slots_[at &= slots_.size() - 1];
      if (found.number == NONE || (found.hash == hash && is_it(found.number))) return at;
    }
  }

  void grow() {
    std::vector<slot> old(slots_.empty() ? 64 : 2 * slots_.size());
    std::swap(slots_, old);
    for (const slot& each : old) {
      if (each.number == NONE) continue;
      slots_[search(each.hash, [](int) { return false; })] = each;
    }
  }

  std::vector<slot> slots_;  ///< as many as a power of two
  std::size_t used_ = 0;
};

#endif
