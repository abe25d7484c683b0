// Variant storage, structural equality and the SafeArray container.
#include "runtime/variant.h"

#include <ostream>

#include "runtime/convert.h"

namespace xal {

// ---------------------------------------------------------------------------------------------
// Type names
// ---------------------------------------------------------------------------------------------

const char* VarTypeName(VarType t) {
  switch (t) {
    case VarType::Empty: return "Empty";
    case VarType::Null: return "Null";
    case VarType::Integer: return "Integer";
    case VarType::Long: return "Long";
    case VarType::Double: return "Double";
    case VarType::Currency: return "Currency";
    case VarType::Date: return "Date";
    case VarType::String: return "String";
    case VarType::Object: return "Object";
    case VarType::Missing: return "Missing";
    case VarType::Boolean: return "Boolean";
    case VarType::Variant: return "Variant";
    case VarType::Array: return "Array";
  }
  return "Unknown";
}

// ---------------------------------------------------------------------------------------------
// SafeArray
// ---------------------------------------------------------------------------------------------

SafeArray::SafeArray(std::vector<Bound> bounds) : bounds_(std::move(bounds)) {
  if (bounds_.empty()) bounds_.push_back(Bound{});
  data_.resize(Size());
}

SafeArray SafeArray::Vector(std::vector<Variant> items, int32_t lower) {
  SafeArray a;
  a.bounds_ = {Bound{lower, static_cast<int32_t>(lower + static_cast<int64_t>(items.size()) - 1)}};
  a.data_ = std::move(items);
  return a;
}

size_t SafeArray::Size() const {
  size_t n = 1;
  for (const auto& b : bounds_) n *= static_cast<size_t>(b.Count());
  return n;
}

int32_t SafeArray::LBound(int dim) const {
  if (dim < 1 || dim > Dims()) Raise(kErrSubscript);
  return bounds_[dim - 1].lower;
}

int32_t SafeArray::UBound(int dim) const {
  if (dim < 1 || dim > Dims()) Raise(kErrSubscript);
  return bounds_[dim - 1].upper;
}

size_t SafeArray::Offset(std::span<const int32_t> indices) const {
  if (indices.size() != bounds_.size()) Raise(kErrSubscript);
  size_t offset = 0, stride = 1;
  for (size_t d = 0; d < bounds_.size(); ++d) {
    const Bound& b = bounds_[d];
    if (indices[d] < b.lower || indices[d] > b.upper) Raise(kErrSubscript);
    offset += static_cast<size_t>(int64_t(indices[d]) - b.lower) * stride;
    stride *= static_cast<size_t>(b.Count());
  }
  return offset;
}

Variant& SafeArray::At(std::span<const int32_t> indices) { return data_[Offset(indices)]; }
const Variant& SafeArray::At(std::span<const int32_t> indices) const { return data_[Offset(indices)]; }

void SafeArray::Redim(std::vector<Bound> bounds, bool preserve) {
  if (bounds.empty()) Raise(kErrSubscript);
  if (!preserve) {
    *this = SafeArray(std::move(bounds));
    return;
  }
  if (bounds.size() != bounds_.size()) Raise(kErrSubscript);
  for (size_t d = 0; d + 1 < bounds.size(); ++d)
    if (bounds[d].lower != bounds_[d].lower || bounds[d].upper != bounds_[d].upper) Raise(kErrSubscript);
  if (bounds.back().lower != bounds_.back().lower) Raise(kErrSubscript);
  // Only the last dimension changes, and it is the slowest-varying one in storage: a resize keeps
  // every surviving element at its place.
  bounds_ = std::move(bounds);
  data_.resize(Size());
}

bool SafeArray::operator==(const SafeArray& other) const {
  if (bounds_.size() != other.bounds_.size()) return false;
  for (size_t d = 0; d < bounds_.size(); ++d)
    if (bounds_[d].lower != other.bounds_[d].lower || bounds_[d].upper != other.bounds_[d].upper) return false;
  return data_ == other.data_;
}

// ---------------------------------------------------------------------------------------------
// Variant
// ---------------------------------------------------------------------------------------------

Variant::ArrayBox::ArrayBox(SafeArray arr) : a(std::make_unique<SafeArray>(std::move(arr))) {}
Variant::ArrayBox::ArrayBox(const ArrayBox& o) : a(o.a ? std::make_unique<SafeArray>(*o.a) : nullptr) {}
Variant::ArrayBox& Variant::ArrayBox::operator=(const ArrayBox& o) {
  if (this != &o) a = o.a ? std::make_unique<SafeArray>(*o.a) : nullptr;
  return *this;
}
Variant::ArrayBox::~ArrayBox() = default;

Variant::Variant(SafeArray a) : v_(ArrayBox(std::move(a))) {}

VarType Variant::Type() const {
  static constexpr VarType kByIndex[] = {VarType::Empty,    VarType::Null,   VarType::Integer, VarType::Long,
                                         VarType::Double,   VarType::Currency, VarType::Date,  VarType::String,
                                         VarType::Boolean,  VarType::Object, VarType::Array,   VarType::Missing};
  return kByIndex[v_.index()];
}

bool Variant::IsNumber() const {
  switch (Type()) {
    case VarType::Integer:
    case VarType::Long:
    case VarType::Double:
    case VarType::Currency: return true;
    default: return false;
  }
}

const SafeArray& Variant::AsArray() const { return *Get<ArrayBox>().a; }
SafeArray& Variant::MutableArray() {
  if (auto* p = std::get_if<ArrayBox>(&v_)) return *p->a;
  Raise(kErrTypeMismatch);
}

bool Variant::operator==(const Variant& other) const {
  if (v_.index() != other.v_.index()) return false;
  return std::visit(
      [&](const auto& mine) -> bool {
        using T = std::decay_t<decltype(mine)>;
        const T& theirs = std::get<T>(other.v_);
        if constexpr (std::is_same_v<T, ArrayBox>)
          return *mine.a == *theirs.a;
        else
          return mine == theirs;
      },
      v_);
}

std::string DebugString(const Variant& v) {
  std::string type = VarTypeName(v.Type());
  return v.Visit(Overloaded{
      [&](std::monostate) { return type; },
      [&](NullValue) { return type; },
      [&](MissingValue) { return type; },
      [&](const std::string& s) { return type + " \"" + s + "\""; },
      [&](const ObjectRef& o) { return type + (o ? " <object>" : " Nothing"); },
      [&](const SafeArray& a) {
        std::string s = type + "(";
        for (size_t i = 0; i < a.Elements().size(); ++i) s += (i ? ", " : "") + DebugString(a.Elements()[i]);
        return s + ")";
      },
      [&](const auto&) { return type + " " + CStr(v); },
  });
}

void PrintTo(const Variant& v, std::ostream* os) { *os << DebugString(v); }

}  // namespace xal
