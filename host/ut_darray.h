// Growable arrays of pointers: sorting and searching, storage, and a typed array over both.
#ifndef KESTREL_HOST_UT_DARRAY_H
#define KESTREL_HOST_UT_DARRAY_H

#include <cstddef>
#include <cstdint>
#include <vector>

/// Sorting and searching over the elements of an array. Elements are compared by the addresses of
/// the places that hold them.
class UT_BASE_ARRAY {
 public:
  using Compare = int (*)(const void*, const void*);

 protected:
  UT_BASE_ARRAY() = default;
  ~UT_BASE_ARRAY() = default;

  /// Sets count elements from the given place on to null.
  virtual void clearmem(void* from, int count) = 0;
  /// Sorts the elements first to last.
  virtual void qsort(int first, int last, Compare compare) = 0;
  /// Moves the elements from index from to the end by so many places up, or down when by is
  /// negative; the count changes by as much. Places that open are null.
  virtual void a_shift(int from, int by) = 0;
  virtual void a_sort(Compare compare, int first, int last) = 0;
  /// Adds the element that item points at, in order, to sorted elements.
  virtual void a_sortadd(const void* item, Compare compare) = 0;
  /// Index of an element equal to the one that key points at, or -1; the elements are sorted.
  virtual int a_bsearch(const void* key, Compare compare) = 0;
};

/// Dynamic storage of pointers. The array never owns what its elements point to.
class UT_DARRAY : public UT_BASE_ARRAY {
 public:
  UT_DARRAY(const UT_DARRAY&) = delete;
  UT_DARRAY& operator=(const UT_DARRAY&) = delete;

  /// Number of elements in use.
  int count = 0;

 protected:
  /// elements: address of the pointer to the storage, which this class keeps up to date and which
  /// starts as null. element_size: the size of a pointer. step: how many elements the first
  /// storage holds; it then doubles. flag: not used.
  UT_DARRAY(void** elements, int element_size, int step, unsigned char flag);

  void clearmem(void* from, int count) override;
  void qsort(int first, int last, Compare compare) override;
  void a_shift(int from, int by) override;
  void a_sort(Compare compare, int first, int last) override;
  void a_sortadd(const void* item, Compare compare) override;
  int a_bsearch(const void* key, Compare compare) override;
  /// Sets the count, growing the storage when needed; new elements are null.
  virtual void a_resetnum(int count);
  /// Index of the first element that is this pointer, or -1.
  virtual int intgetindex(void* element);
  /// A copy of the storage, made with array new; the caller releases it.
  virtual void* a_makearray();

 public:
  /// Releases the storage, not what the elements point to.
  virtual ~UT_DARRAY() = default;
  /// Address of the element at index, 0 or more. Past the end, the array grows so that it is the
  /// last one, null until it is set; earlier addresses are then no longer good.
  virtual void* getaddr(int index);
  /// Makes room for size elements in all.
  virtual void reserve(std::uint64_t size);

 private:
  std::ptrdiff_t bytes(int elements) const;
  void* place(int index) { return storage_.data() + bytes(index); }
  void publish();

  void* const elements_;
  const int element_size_;
  const int step_;
  std::vector<char> storage_;  ///< of the elements in use
};

/// A UT_DARRAY whose elements, pointers of the type Element, are read directly.
template <class Element>
class UT_TYPED_DARRAY : public UT_DARRAY {
 public:
  /// An empty array; step as in UT_DARRAY.
  explicit UT_TYPED_DARRAY(int step)
      : UT_DARRAY(reinterpret_cast<void**>(&elements), sizeof(void*), step, 0) {}

  using UT_DARRAY::a_resetnum;

  /// Adds an element at the end.
  void append(Element element) { *static_cast<Element*>(getaddr(count)) = element; }
  /// The elements in use, for a loop; good until the array grows.
  Element* begin() const { return elements; }
  Element* end() const { return elements + count; }

  /// The storage: elements 0 to count - 1 are in use.
  Element* elements = nullptr;
};

/// Strings, owned by whoever holds the array.
using DARRAY_NAME = UT_TYPED_DARRAY<char*>;

#endif
