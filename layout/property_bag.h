// The layout definitions are property bags: their plain fields are public data members named as
// scripts name them. PropertyBag gives the type library one generic Get and one generic Put per
// field, so a field needs a single line in its class's member table and no hand-written accessor.
#pragma once

#include "runtime/object.h"

namespace xal {

template <class>
struct FieldTraits;
template <class C, class T>
struct FieldTraits<T C::*> {
  using Type = T;
};
// The type of the data member that the member pointer `F` names.
template <auto F>
using FieldType = typename FieldTraits<decltype(F)>::Type;

template <class Derived>
class PropertyBag : public Object {
 public:
  template <auto F>
  FieldType<F> GetField() const {
    return static_cast<const Derived&>(*this).*F;
  }
  template <auto F>
  void PutField(const FieldType<F>& value) {
    static_cast<Derived&>(*this).*F = value;
  }
};

}  // namespace xal
