#include "host/ut_darray.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

UT_DARRAY::UT_DARRAY(void** elements, int element_size, int step, unsigned char /*flag*/)
    : elements_(elements), element_size_(element_size), step_(step) {}

std::ptrdiff_t UT_DARRAY::bytes(int elements) const {
  return static_cast<std::ptrdiff_t>(elements) * element_size_;
}

/// To be called whenever the storage has changed.
void UT_DARRAY::publish() {
  count = static_cast<int>(static_cast<std::ptrdiff_t>(storage_.size()) / element_size_);
  // The typed array's pointer to its elements is of a type not known here: written as bytes.
  char* const storage = storage_.data();
  std::memcpy(elements_, &storage, sizeof storage);
}

void UT_DARRAY::clearmem(void* from, int elements) {
  std::memset(from, 0, static_cast<std::size_t>(bytes(elements)));
}

void UT_DARRAY::qsort(int first, int last, Compare compare) {
  if (first >= last) return;
  std::qsort(place(first), static_cast<std::size_t>(last) - static_cast<std::size_t>(first) + 1,
             static_cast<std::size_t>(element_size_), compare);
}

void UT_DARRAY::a_shift(int from, int by) {
  const auto start = storage_.begin() + bytes(from);
  if (by > 0) storage_.insert(start, static_cast<std::size_t>(bytes(by)), '\0');
  if (by < 0) storage_.erase(start + bytes(by), start);
  publish();
}

void UT_DARRAY::a_sort(Compare compare, int first, int last) {
  qsort(first, last, compare);
}

void UT_DARRAY::a_sortadd(const void* item, Compare compare) {
  int index = 0;
  while (index < count && compare(place(index), item) <= 0) ++index;
  a_shift(index, 1);
  std::memcpy(place(index), item, static_cast<std::size_t>(element_size_));
}

int UT_DARRAY::a_bsearch(const void* key, Compare compare) {
  if (count == 0) return -1;
  const void* found = std::bsearch(key, place(0), static_cast<std::size_t>(count),
                                   static_cast<std::size_t>(element_size_), compare);
  if (found == nullptr) return -1;
  return static_cast<int>((static_cast<const char*>(found) - storage_.data()) / element_size_);
}

void UT_DARRAY::a_resetnum(int new_count) {
  // Never to empty it: that is for destructors, too.
  if (new_count > 0 && storage_.empty()) reserve(static_cast<std::uint64_t>(std::max(step_, 1)));
  storage_.resize(static_cast<std::size_t>(bytes(new_count)));
  publish();
}

int UT_DARRAY::intgetindex(void* element) {
  for (int i = 0; i < count; ++i) {
    if (std::memcmp(place(i), &element, sizeof element) == 0) return i;
  }
  return -1;
}

void* UT_DARRAY::a_makearray() {
  char* copy = new char[storage_.size()];
  std::copy(storage_.begin(), storage_.end(), copy);
  return copy;
}

void* UT_DARRAY::getaddr(int index) {
  if (index >= count) a_resetnum(index + 1);
  return place(index);
}

void UT_DARRAY::reserve(std::uint64_t size) {
  storage_.reserve(size * static_cast<std::uint64_t>(element_size_));
  publish();
}
