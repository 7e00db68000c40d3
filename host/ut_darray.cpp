#include "host/ut_darray.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <utility>

UT_DARRAY::UT_DARRAY(void** elements, int element_size, int step, unsigned char /*flag*/)
    : elements_(elements), element_size_(element_size), step_(step) {}

std::size_t UT_DARRAY::bytes(int elements) const {
  return static_cast<std::size_t>(elements) * static_cast<std::size_t>(element_size_);
}

void UT_DARRAY::clearmem(void* from, int elements) {
  std::memset(from, 0, bytes(elements));
}

void UT_DARRAY::qsort(int first, int last, Compare compare) {
  if (first >= last) return;
  std::qsort(place(first), static_cast<std::size_t>(last) - static_cast<std::size_t>(first) + 1,
             static_cast<std::size_t>(element_size_), compare);
}

void UT_DARRAY::a_shift(int from, int by) {
  const int moved = count - from;
  if (by > 0) a_resetnum(count + by);
  if (moved > 0) std::memmove(place(from + by), place(from), bytes(moved));
  if (by > 0) clearmem(place(from), std::min(by, moved));
  if (by < 0) count += by;
}

void UT_DARRAY::a_sort(Compare compare, int first, int last) {
  qsort(first, last, compare);
}

void UT_DARRAY::a_sortadd(const void* item, Compare compare) {
  int index = 0;
  while (index < count && compare(place(index), item) <= 0) ++index;
  a_shift(index, 1);
  std::memcpy(place(index), item, bytes(1));
}

int UT_DARRAY::a_bsearch(const void* key, Compare compare) {
  if (count == 0) return -1;
  const void* found = std::bsearch(key, place(0), static_cast<std::size_t>(count),
                                   static_cast<std::size_t>(element_size_), compare);
  if (found == nullptr) return -1;
  return static_cast<int>((static_cast<const char*>(found) - storage_.get()) / element_size_);
}

void UT_DARRAY::a_resetnum(int new_count) {
  reserve(static_cast<std::uint64_t>(new_count));
  if (new_count > count) clearmem(place(count), new_count - count);
  count = new_count;
}

int UT_DARRAY::intgetindex(void* element) {
  for (int i = 0; i < count; ++i) {
    if (std::memcmp(place(i), &element, sizeof element) == 0) return i;
  }
  return -1;
}

void* UT_DARRAY::a_makearray() {
  char* copy = new char[bytes(count)];
  std::copy_n(storage_.get(), bytes(count), copy);
  return copy;
}

void* UT_DARRAY::getaddr(int index) {
  if (index >= count) a_resetnum(index + 1);
  return place(index);
}

void UT_DARRAY::reserve(std::uint64_t size) {
  if (size <= capacity_) return;
  const auto first = static_cast<std::uint64_t>(std::max(step_, 1));
  capacity_ = std::max({size, first, capacity_ * 2});
  std::unique_ptr<char[]> grown(new char[capacity_ * bytes(1)]);
  std::copy_n(storage_.get(), bytes(count), grown.get());
  storage_ = std::move(grown);
  // The typed array's pointer to its elements is of a type not known here: written as bytes.
  char* const published = storage_.get();
  std::memcpy(elements_, &published, sizeof published);
}
