#include "host/arena.h"

#include <sys/mman.h>

#include <algorithm>
#include <new>

namespace {

constexpr std::size_t BIG_PAGE = 2UL << 20;
constexpr std::size_t FIRST_BLOCK = 1UL << 10;
constexpr std::size_t BIGGEST_BLOCK = 16UL << 20;

}  // namespace

char* la_new_block(std::size_t size) {
  const bool big = size >= BIG_PAGE;
  const std::size_t unit = big ? BIG_PAGE : alignof(std::max_align_t);
  size = (size + unit - 1) / unit * unit;
  void* block = std::aligned_alloc(unit, size);
  if (block == nullptr) throw std::bad_alloc();
#ifdef MADV_HUGEPAGE
  // A system without big pages refuses: that costs time, nothing else.
  if (big) ::madvise(block, size, MADV_HUGEPAGE);
#endif
  return static_cast<char*>(block);
}

std::size_t la_arena::add_block(std::size_t least) {
  std::size_t size = FIRST_BLOCK;
  for (std::size_t i = 0; i < blocks_.size() && size < BIGGEST_BLOCK; ++i) {
    size = std::min(8 * size, BIGGEST_BLOCK);
  }
  size = std::max(size, (least + FIRST_BLOCK - 1) / FIRST_BLOCK * FIRST_BLOCK);
  end_ = blocks_.emplace_back(block(la_new_block(size))).get() + size;
  return size;
}
