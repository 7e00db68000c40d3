// Growable arrays that own what their elements point to.
#ifndef KESTREL_RULES_OWNING_ARRAY_H
#define KESTREL_RULES_OWNING_ARRAY_H

#include <cstdint>
#include <memory>

#include "host/ut_darray.h"

/// A typed array that deletes its elements at its end. Each was made with new.
template <class Type>
class la_owning_array : public UT_TYPED_DARRAY<Type*> {
 public:
  using UT_TYPED_DARRAY<Type*>::UT_TYPED_DARRAY;
  ~la_owning_array() override {
    for (Type* element : *this) delete element;
  }

  /// Appends an element.
  void add(std::unique_ptr<Type> element) {
    this->append(element.get());
    static_cast<void>(element.release());
  }
  /// Appends all elements of other, which is empty then.
  void take(la_owning_array& other) {
    this->reserve(static_cast<std::uint64_t>(this->count) +
                  static_cast<std::uint64_t>(other.count));
    for (Type* element : other) this->append(element);
    other.a_resetnum(0);
  }
};

#endif
