// Memory for much at once: without an allocation for each thing, and with few page faults.
#ifndef KESTREL_HOST_ARENA_H
#define KESTREL_HOST_ARENA_H

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <new>
#include <string>
#include <utility>
#include <vector>

/// New memory of size bytes, in the big pages of the system when it fills at least one. It is the
/// caller's to release with std::free.
char* la_new_block(std::size_t size);

/// Hands out memory piece by piece, and releases all of it at its end. It takes few blocks, which
/// grow with what is taken.
class la_arena {
 public:
  la_arena() = default;
  la_arena(const la_arena&) = delete;
  la_arena& operator=(const la_arena&) = delete;

  /// A new object, made from the arguments. It is the caller's to destroy, and not to release.
  template <class Type, class... Arguments>
  Type* make(Arguments&&... arguments) {
    static_assert(alignof(Type) <= alignof(std::max_align_t), "blocks are aligned no better");
    return new (take(sizeof(Type), alignof(Type))) Type(std::forward<Arguments>(arguments)...);
  }
  /// Room for size bytes. The alignment is a power of two, at most that of std::max_align_t.
  void* take(std::size_t size, std::size_t alignment) {
    std::size_t left = left_ / alignment * alignment;
    if (size > left) left = add_block(size);
    left_ = left - size;
    return end_ - left;
  }

 private:
  struct release {
    void operator()(char* memory) const { std::free(memory); }
  };
  using block = std::unique_ptr<char, release>;

  /// Returns the size of the new block.
  std::size_t add_block(std::size_t least);

  std::vector<block> blocks_;
  char* end_ = nullptr;  ///< of the last block; a multiple of any such alignment
  std::size_t left_ = 0;
};

/// Gives strings such blocks.
template <class Type>
struct la_block_allocator {
  using value_type = Type;
  Type* allocate(std::size_t count) {
    return reinterpret_cast<Type*>(la_new_block(count * sizeof(Type)));
  }
  void deallocate(Type* block, std::size_t /*count*/) { std::free(block); }
  bool operator==(const la_block_allocator&) const { return true; }
  bool operator!=(const la_block_allocator&) const { return false; }
};

/// A string that may be as long as a file.
using la_long_string = std::basic_string<char, std::char_traits<char>, la_block_allocator<char>>;

#endif
