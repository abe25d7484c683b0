// Reading host values the way the handlers test them: an identifier or number that is Null or
// Empty counts as 0, a text that is Null counts as "", an option that is Null, Empty or "" is
// not set. Any other value converts by the runtime's rules (and fails as they fail).
#pragma once

#include <cstdint>
#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>

#include "runtime/convert.h"
#include "runtime/text.h"
#include "runtime/variant.h"

namespace xal::docfunc {

inline bool IsBlank(const Variant& v) { return v.IsNull() || v.IsEmpty() || v.IsMissing(); }
// The runtime's ValueOr, with an omitted (Missing) value read as blank too.
template <class T>
T BlankOr(const Variant& v, T fallback) {
  return v.IsMissing() ? fallback : ValueOr(v, std::move(fallback));
}
inline int32_t LongOf(const Variant& v) { return BlankOr(v, int32_t{0}); }
inline double DoubleOf(const Variant& v) { return BlankOr(v, 0.0); }
inline Currency CurrencyOf(const Variant& v) { return BlankOr(v, Currency()); }
inline std::string TextOf(const Variant& v) { return BlankOr(v, std::string()); }
inline std::string TrimmedOf(const Variant& v) { return Trim(TextOf(v)); }
inline Date DateOf(const Variant& v) { return BlankOr(v, Date()); }
// An option or flag: True for a non-zero number, True or numeric text; "" and blanks are False.
inline bool FlagOf(const Variant& v) {
  if (IsBlank(v)) return false;
  if (v.IsString() && Trim(v.AsString()).empty()) return false;
  return CBool(v);
}

// Whether `name` is one of `names`, in any letter case (table and document names).
inline bool NameIn(std::string_view name, std::initializer_list<std::string_view> names) {
  for (std::string_view n : names)
    if (TextEquals(name, n)) return true;
  return false;
}

}  // namespace xal::docfunc
