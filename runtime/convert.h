// Conversions between Variant types with the original runtime's rules: locale-aware parsing of
// numeric text, half-even rounding into integer and Currency targets, error 6 on overflow, 13 on a
// type that cannot convert and 94 for Null.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <type_traits>

#include "runtime/variant.h"

namespace xal {

// ---- Coercions (one per target type) ------------------------------------------------------------
std::string CStr(const Variant& v);  // Double: 15 significant digits; Boolean "True"/"False"
double CDbl(const Variant& v);
int32_t CLng(const Variant& v);      // half-even; error 6 outside the 32-bit range
int16_t CInt(const Variant& v);      // half-even; error 6 outside the 16-bit range
Currency CCur(const Variant& v);     // half-even at the fourth decimal
Date CDate(const Variant& v);        // numbers are serials; text is parsed as a date
bool CBool(const Variant& v);        // numbers: non-zero; text "True"/"False" or numeric text

// ---- Values the host hands over ------------------------------------------------------------------
// A field of no row, a Null column and an unset option read as "no value"; the rules that read
// them want a default instead of error 94 (Null) or a silent 0 (Empty).
// `v` through the coercion for the fallback's type (CDbl, CLng, CCur, CDate, CStr, CBool), or
// `fallback` itself when `v` is Empty or Null. Other values convert with that coercion's errors.
template <class T>
T ValueOr(const Variant& v, T fallback) {
  if (v.IsEmpty() || v.IsNull()) return fallback;
  if constexpr (std::is_same_v<T, double>) return CDbl(v);
  else if constexpr (std::is_same_v<T, int32_t>) return CLng(v);
  else if constexpr (std::is_same_v<T, Currency>) return CCur(v);
  else if constexpr (std::is_same_v<T, Date>) return CDate(v);
  else if constexpr (std::is_same_v<T, std::string>) return CStr(v);
  else if constexpr (std::is_same_v<T, bool>) return CBool(v);
  else static_assert(sizeof(T) == 0, "ValueOr: no coercion for this type");
}
// A value the host means as True: neither Empty nor Null, and CBool True (non-zero).
inline bool IsTrue(const Variant& v) { return ValueOr(v, false); }

// Int = floor, Fix = toward zero; both keep the type of their argument (Double stays Double,
// Currency stays Currency, Date stays Date); Null gives Null; numeric text becomes Double.
Variant Int(const Variant& v);
Variant Fix(const Variant& v);

// ---- Numbers and text ---------------------------------------------------------------------------
// Parses numeric text with the locale's separators: white space around, sign in front or behind,
// parentheses for negative, thousands separators in the integer digits, one decimal separator,
// exponent, &H/&O prefixes; all of it must be consumed, otherwise error 13.
double ParseNumber(std::string_view text);
// True when ParseNumber would accept the text (IsNumeric on text).
bool IsNumericText(std::string_view text);
// Val: leading number of the text, "." always, blanks inside ignored, 0 when none.
double Val(std::string_view text);

// The text CStr gives for a Double: at most 15 significant digits, trailing zeros removed, fixed
// notation unless the number needs an exponent, "E+dd"/"E-dd" otherwise; the locale's decimal.
std::string DoubleToString(double value);
// The exact value with up to 4 decimals, trailing zeros dropped; the locale's decimal.
std::string CurrencyToString(Currency value);
// Str(): like CStr but "." always and a leading blank for non-negative numbers.
std::string Str(const Variant& v);

// The digits CStr shows for a number, before any separator is placed: value = 0.digits × 10^point.
// Zero has no digits. Format rounds on these digits rather than on the binary value.
struct DecimalDigits {
  bool negative = false;
  std::string digits;  // significant digits, no leading or trailing zeros
  int32_t point = 0;   // digits before the decimal point (may be ≤ 0 or beyond the digits)
};
DecimalDigits DoubleDigits(double value);      // at most 15 significant digits, as CStr
DecimalDigits CurrencyDigits(Currency value);  // exact

// ---- Rounding -----------------------------------------------------------------------------------
// Round to nearest, ties to even, on the binary value (CInt/CLng rule); no range check.
double RoundHalfEven(double x);
// Round(x, n): x × 10^n computed in double, rounded half to even, divided by 10^n.
double VbRound(double x, int decimals);

}  // namespace xal
