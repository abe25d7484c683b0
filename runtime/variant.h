// Variant: the one value type that crosses every interface of the component — properties,
// arguments, fields, events. It mirrors the original runtime's variant: Empty, Null, Integer
// (16-bit), Long (32-bit), Double, Currency, Date, String (UTF-8 here), Boolean, Object, Array,
// and Missing (an optional argument the caller left out). Copying a Variant that holds an array
// copies the array; objects are shared references.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <iosfwd>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>
#include <variant>
#include <vector>

#include "runtime/currency.h"
#include "runtime/date.h"
#include "runtime/error.h"

namespace xal {

class Object;
using ObjectRef = std::shared_ptr<Object>;
class Variant;

// Type codes as the original runtime numbers them (VarType). `Variant` is used only to declare
// "any type" in member tables; `Missing` is how an omitted optional argument travels.
enum class VarType : uint16_t {
  Empty = 0,
  Null = 1,
  Integer = 2,
  Long = 3,
  Double = 5,
  Currency = 6,
  Date = 7,
  String = 8,
  Object = 9,
  Missing = 10,
  Boolean = 11,
  Variant = 12,
  Array = 0x2000,
};

// The type name as TypeName() and the type library print it ("Long", "Currency", …).
const char* VarTypeName(VarType t);

// An array of Variants with one or more dimensions, each with its own lower and upper bound.
// Elements are stored with the first index varying fastest, as the original runtime does, so
// enumeration of a 2-D array walks down the first dimension first.
class SafeArray {
 public:
  struct Bound {
    int32_t lower = 0;
    int32_t upper = -1;  // upper < lower: the dimension is empty
    int64_t Count() const { return upper < lower ? 0 : int64_t(upper) - lower + 1; }
  };

  SafeArray() = default;  // one empty dimension, bounds 0..-1 (what Split("") returns)
  explicit SafeArray(std::vector<Bound> bounds);
  // A 1-D array holding `items`, first index `lower`.
  static SafeArray Vector(std::vector<Variant> items, int32_t lower = 0);

  int Dims() const { return static_cast<int>(bounds_.size()); }
  // Bounds of dimension `dim` (1-based as LBound/UBound take it); error 9 for a bad dimension.
  int32_t LBound(int dim = 1) const;
  int32_t UBound(int dim = 1) const;
  const std::vector<Bound>& Bounds() const { return bounds_; }
  size_t Size() const;

  // Element access by indices, one per dimension; error 9 for a wrong count or an index out of bounds.
  Variant& At(std::span<const int32_t> indices);
  const Variant& At(std::span<const int32_t> indices) const;
  Variant& At(std::initializer_list<int32_t> indices) { return At(std::span(indices.begin(), indices.size())); }
  const Variant& At(std::initializer_list<int32_t> indices) const {
    return At(std::span(indices.begin(), indices.size()));
  }

  // Elements in storage order.
  std::vector<Variant>& Elements() { return data_; }
  const std::vector<Variant>& Elements() const { return data_; }

  // ReDim [Preserve]: new bounds; with `preserve` only the last dimension may change and
  // existing elements keep their indices (error 9 otherwise).
  void Redim(std::vector<Bound> bounds, bool preserve);

  bool operator==(const SafeArray& other) const;

 private:
  size_t Offset(std::span<const int32_t> indices) const;
  std::vector<Bound> bounds_{Bound{}};
  std::vector<Variant> data_;
};

struct NullValue {
  bool operator==(const NullValue&) const = default;
};
struct MissingValue {
  bool operator==(const MissingValue&) const = default;
};

class Variant {
 public:
  Variant() = default;  // Empty
  Variant(int16_t v) : v_(v) {}
  Variant(int32_t v) : v_(v) {}
  Variant(double v) : v_(v) {}
  Variant(Currency v) : v_(v) {}
  Variant(Date v) : v_(v) {}
  Variant(std::string v) : v_(std::move(v)) {}
  Variant(std::string_view v) : v_(std::string(v)) {}
  Variant(const char* v) : v_(std::string(v)) {}
  Variant(bool v) : v_(v) {}
  Variant(ObjectRef v) : v_(std::move(v)) {}
  template <typename T, typename = std::enable_if_t<std::is_base_of_v<Object, T> && !std::is_same_v<T, Object>>>
  Variant(std::shared_ptr<T> v) : v_(ObjectRef(std::move(v))) {}
  Variant(SafeArray a);
  Variant(NullValue) : v_(NullValue{}) {}
  Variant(MissingValue) : v_(MissingValue{}) {}
  // Pointers other than const char* would silently become Boolean: forbid them.
  template <typename T>
  Variant(T*) = delete;

  // Named factories where the C++ type alone would be ambiguous.
  static Variant Null() { return Variant(NullValue{}); }
  static Variant Missing() { return Variant(MissingValue{}); }
  static Variant Integer(int16_t v) { return Variant(v); }
  static Variant Long(int32_t v) { return Variant(v); }
  static Variant Cur(Currency v) { return Variant(v); }
  static Variant FromDate(double serial) { return Variant(Date(serial)); }
  static Variant Nothing() { return Variant(ObjectRef()); }

  VarType Type() const;
  bool IsEmpty() const { return v_.index() == 0; }
  bool IsNull() const { return std::holds_alternative<NullValue>(v_); }
  bool IsMissing() const { return std::holds_alternative<MissingValue>(v_); }
  bool IsString() const { return std::holds_alternative<std::string>(v_); }
  bool IsObject() const { return std::holds_alternative<ObjectRef>(v_); }
  bool IsArray() const { return std::holds_alternative<ArrayBox>(v_); }
  bool IsBoolean() const { return std::holds_alternative<bool>(v_); }
  // Integer, Long, Double, Currency (not Date, Boolean or numeric text).
  bool IsNumber() const;

  // Raw accessors: the value as stored; error 13 when the Variant holds another type.
  int16_t AsInteger() const { return Get<int16_t>(); }
  int32_t AsLong() const { return Get<int32_t>(); }
  double AsDouble() const { return Get<double>(); }
  Currency AsCurrency() const { return Get<Currency>(); }
  Date AsDate() const { return Get<Date>(); }
  bool AsBool() const { return Get<bool>(); }
  const std::string& AsString() const { return Get<std::string>(); }
  const ObjectRef& AsObject() const { return Get<ObjectRef>(); }
  const SafeArray& AsArray() const;
  SafeArray& MutableArray();

  // Structural equality: same type and same value (not the runtime's "=" operator; see Compare).
  bool operator==(const Variant& other) const;

  template <typename Visitor>
  decltype(auto) Visit(Visitor&& vis) const;

 private:
  // Arrays live behind a pointer so a Variant stays small; copying copies the array.
  struct ArrayBox {
    std::unique_ptr<SafeArray> a;
    ArrayBox() = default;
    explicit ArrayBox(SafeArray arr);
    ArrayBox(const ArrayBox& o);
    ArrayBox(ArrayBox&&) noexcept = default;
    ArrayBox& operator=(const ArrayBox& o);
    ArrayBox& operator=(ArrayBox&&) noexcept = default;
    ~ArrayBox();
  };

  template <typename T>
  const T& Get() const {
    if (const T* p = std::get_if<T>(&v_)) return *p;
    Raise(kErrTypeMismatch);
  }

  std::variant<std::monostate, NullValue, int16_t, int32_t, double, Currency, Date, std::string, bool,
               ObjectRef, ArrayBox, MissingValue>
      v_;

 public:
  // Visit sees the stored value; arrays arrive as `const SafeArray&`.
  using Storage = decltype(v_);
  const Storage& storage() const { return v_; }
};

// Overloaded lambdas for Variant::Visit.
template <class... Ts>
struct Overloaded : Ts... {
  using Ts::operator()...;
};
template <class... Ts>
Overloaded(Ts...) -> Overloaded<Ts...>;

template <typename Visitor>
decltype(auto) Variant::Visit(Visitor&& vis) const {
  return std::visit(
      [&](const auto& x) -> decltype(auto) {
        if constexpr (std::is_same_v<std::decay_t<decltype(x)>, ArrayBox>)
          return vis(static_cast<const SafeArray&>(*x.a));
        else
          return vis(x);
      },
      v_);
}

// Debug text for test failures: type and value ("Long 5", "String \"x\"").
std::string DebugString(const Variant& v);
void PrintTo(const Variant& v, std::ostream* os);

}  // namespace xal
