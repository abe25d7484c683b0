// The runtime's operators on Variants: arithmetic with its result-type rules (Currency + Double
// stays Currency, Currency × Double is Double, "/" is Double), Null propagation, string
// concatenation, and the comparison rules between mixed types.
#pragma once

#include <optional>

#include "runtime/text.h"
#include "runtime/variant.h"

namespace xal {

Variant Add(const Variant& a, const Variant& b);       // numbers add; two strings concatenate
Variant Subtract(const Variant& a, const Variant& b);  // Date - Date is Double, Date ± n is Date
Variant Multiply(const Variant& a, const Variant& b);
Variant Divide(const Variant& a, const Variant& b);    // 0/0 error 6, x/0 error 11
Variant IntDivide(const Variant& a, const Variant& b); // operands rounded half-even first
Variant Modulo(const Variant& a, const Variant& b);    // operands rounded half-even first
Variant Negate(const Variant& a);
Variant Concat(const Variant& a, const Variant& b);    // "&": Null only when both are Null

// Comparison result: -1, 0, 1, or nullopt when either side is Null. Mixed types follow the
// runtime: a string always sorts after a number, Empty is 0 or "", Currency against Double
// converts the Double to Currency, True is -1.
std::optional<int> Compare(const Variant& a, const Variant& b, CompareMode mode = CompareMode::Binary);
// "=" as a script sees it: Null when either side is Null, else Boolean.
Variant Equals(const Variant& a, const Variant& b, CompareMode mode = CompareMode::Binary);

}  // namespace xal
