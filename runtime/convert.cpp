// Conversions between the Variant types: numbers to text the way the original runtime printed
// them (15 significant digits, its own choice between fixed and exponent form), numeric text back
// to numbers with the locale's separators, and the rounding rules of the integer and Currency
// targets. Scripts and stored documents depend on these texts and roundings to the last digit.
#include "runtime/convert.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstring>
#include <limits>

#include "runtime/ascii.h"
#include "runtime/dates.h"
#include "runtime/locale.h"

namespace xal {

namespace {

using i128 = __int128;

// A Missing argument reaching a conversion means the script used an optional parameter that the
// caller left out: that is "argument not optional", not a type problem.
[[noreturn]] void RaiseBadType(const Variant& v) {
  if (v.IsMissing()) Raise(kErrNotOptional);
  Raise(kErrTypeMismatch);
}

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r' || c == '\v' || c == '\f'; }

std::string_view TrimBlanks(std::string_view s) {
  while (!s.empty() && IsBlank(s.front())) s.remove_prefix(1);
  while (!s.empty() && IsBlank(s.back())) s.remove_suffix(1);
  return s;
}

void AppendInt(std::string& out, uint64_t v) {
  char buf[24];
  auto r = std::to_chars(buf, buf + sizeof buf, v);
  out.append(buf, r.ptr);
}

}  // namespace

// =================================================================================================
// Numbers to text
// =================================================================================================

DecimalDigits DoubleDigits(double value) {
  DecimalDigits d;
  if (value == 0 || !std::isfinite(value)) return d;
  // 15 significant digits, correctly rounded from the binary value: "d.dddddddddddddde±xx".
  char buf[32];
  auto r = std::to_chars(buf, buf + sizeof buf, value, std::chars_format::scientific, 14);
  const char* p = buf;
  if (*p == '-') {
    d.negative = true;
    ++p;
  }
  d.digits.push_back(*p++);
  if (*p == '.')
    for (++p; *p != 'e'; ++p) d.digits.push_back(*p);
  int exp = 0;
  std::from_chars(p + 1 + (p[1] == '+'), r.ptr, exp);
  while (d.digits.back() == '0') d.digits.pop_back();
  d.point = exp + 1;
  return d;
}

DecimalDigits CurrencyDigits(Currency value) {
  DecimalDigits d;
  if (value.raw() == 0) return d;
  d.negative = value.raw() < 0;
  uint64_t mag = d.negative ? 0 - static_cast<uint64_t>(value.raw()) : static_cast<uint64_t>(value.raw());
  AppendInt(d.digits, mag);
  d.point = static_cast<int32_t>(d.digits.size()) - 4;
  while (d.digits.back() == '0') d.digits.pop_back();
  return d;
}

namespace {

// Fixed notation of 0.digits × 10^point.
void AppendFixed(std::string& out, const DecimalDigits& d, std::string_view sep) {
  const int n = static_cast<int>(d.digits.size());
  if (d.point <= 0) {
    out += '0';
    out += sep;
    out.append(static_cast<size_t>(-d.point), '0');
    out += d.digits;
  } else if (d.point >= n) {
    out += d.digits;
    out.append(static_cast<size_t>(d.point - n), '0');
  } else {
    out.append(d.digits, 0, static_cast<size_t>(d.point));
    out += sep;
    out.append(d.digits, static_cast<size_t>(d.point));
  }
}

void AppendExponent(std::string& out, const DecimalDigits& d, std::string_view sep) {
  out += d.digits[0];
  if (d.digits.size() > 1) {
    out += sep;
    out.append(d.digits, 1);
  }
  int exp = d.point - 1;
  out += exp < 0 ? "E-" : "E+";
  unsigned mag = static_cast<unsigned>(exp < 0 ? -exp : exp);
  if (mag < 10) out += '0';
  AppendInt(out, mag);
}

// Fixed notation whenever printf's %G would use it (-4 ≤ exponent < 15); small numbers also stay
// fixed as long as the fixed text needs no more than about 15 decimals, which is how 0.000015 and
// 5.6789E-11 came out of the original.
bool UseFixed(const DecimalDigits& d) {
  const int exp = d.point - 1;
  if (exp >= -4 && exp < 15) return true;
  if (exp >= 15) return false;
  const int fracDigits = static_cast<int>(d.digits.size()) - 1;
  return -exp + std::max(0, fracDigits - 1) < 15;
}

std::string DoubleText(double value, std::string_view sep) {
  if (std::isnan(value)) return "NaN";
  if (std::isinf(value)) return value < 0 ? "-Infinity" : "Infinity";
  if (value == 0) return "0";  // negative zero too
  DecimalDigits d = DoubleDigits(value);
  std::string out;
  if (d.negative) out += '-';
  if (UseFixed(d))
    AppendFixed(out, d, sep);
  else
    AppendExponent(out, d, sep);
  return out;
}

std::string CurrencyText(Currency value, std::string_view sep) {
  if (value.raw() == 0) return "0";
  DecimalDigits d = CurrencyDigits(value);
  std::string out;
  if (d.negative) out += '-';
  AppendFixed(out, d, sep);
  return out;
}

}  // namespace

std::string DoubleToString(double value) { return DoubleText(value, CurrentLocale().decimal); }
std::string CurrencyToString(Currency value) { return CurrencyText(value, CurrentLocale().decimal); }

// =================================================================================================
// Numeric text: scanning
// =================================================================================================

namespace {

// Numeric text reduced to its value: 0.digits × 10^point, or a &H/&O integer.
struct NumberText {
  bool negative = false;
  bool radix = false;
  uint64_t radixValue = 0;  // saturates above 32 bits; the conversion reports the overflow
  std::string digits;       // significant digits, leading zeros dropped
  int64_t point = 0;
  bool sticky = false;      // non-zero digits dropped beyond kMaxDigits

  // More digits than a double can ever need to round correctly; the rest only count as "non-zero".
  static constexpr size_t kMaxDigits = 800;
  static constexpr int64_t kMaxExponent = 1000000000;

  void IntDigit(char c) {
    if (digits.empty() && c == '0') return;
    if (digits.size() < kMaxDigits) digits.push_back(c);
    else sticky |= c != '0';
    if (point < kMaxExponent) ++point;
  }
  void FracDigit(char c) {
    if (digits.empty() && c == '0') {
      if (point > -kMaxExponent) --point;
      return;
    }
    if (digits.size() < kMaxDigits) digits.push_back(c);
    else sticky |= c != '0';
  }
  void ShiftExponent(int64_t e) { point = std::clamp(point + e, -kMaxExponent, kMaxExponent); }
  void Finish() {
    if (sticky) digits.push_back('1');
  }
};

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

int RadixDigit(char c, int base) {
  int v = IsDigit(c) ? c - '0' : (c >= 'a' && c <= 'f') ? c - 'a' + 10 : (c >= 'A' && c <= 'F') ? c - 'A' + 10 : 99;
  return v < base ? v : -1;
}

// "&H1F" / "&O17" (the prefix included); the whole text must be digits of the base.
bool ScanRadix(std::string_view s, NumberText& out) {
  if (s.size() < 3 || s[0] != '&') return false;
  int base = (s[1] == 'H' || s[1] == 'h') ? 16 : (s[1] == 'O' || s[1] == 'o') ? 8 : 0;
  if (base == 0) return false;
  out.radix = true;
  for (char c : s.substr(2)) {
    int v = RadixDigit(c, base);
    if (v < 0) return false;
    out.radixValue = std::min<uint64_t>(out.radixValue * base + v, uint64_t(1) << 40);
  }
  return true;
}

// Optional exponent "E[+-]digits"; returns false when an "E" is not followed by digits.
bool ScanExponent(std::string_view& s, NumberText& out) {
  if (s.empty() || (s[0] != 'e' && s[0] != 'E')) return true;
  size_t i = 1;
  bool neg = false;
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) neg = s[i++] == '-';
  if (i >= s.size() || !IsDigit(s[i])) return false;
  int64_t e = 0;
  for (; i < s.size() && IsDigit(s[i]); ++i) e = std::min<int64_t>(e * 10 + (s[i] - '0'), NumberText::kMaxExponent);
  out.ShiftExponent(neg ? -e : e);
  s.remove_prefix(i);
  return true;
}

// Digits with thousands separators (only after the first digit), one decimal separator, more digits.
bool ScanMantissa(std::string_view& s, NumberText& out, const RuntimeLocale& loc) {
  bool anyDigit = false, inFraction = false;
  while (!s.empty()) {
    if (IsDigit(s[0])) {
      inFraction ? out.FracDigit(s[0]) : out.IntDigit(s[0]);
      anyDigit = true;
      s.remove_prefix(1);
    } else if (!inFraction && !loc.decimal.empty() && s.starts_with(loc.decimal)) {
      inFraction = true;
      s.remove_prefix(loc.decimal.size());
    } else if (!inFraction && anyDigit && !loc.thousands.empty() && s.starts_with(loc.thousands)) {
      s.remove_prefix(loc.thousands.size());
    } else {
      break;
    }
  }
  return anyDigit;
}

// The whole grammar: blanks, "(" … ")" or a sign in front or a "-" behind, mantissa, exponent.
bool ScanNumber(std::string_view text, NumberText& out, const RuntimeLocale& loc) {
  std::string_view s = TrimBlanks(text);
  if (!s.empty() && s[0] == '&') return ScanRadix(s, out);
  bool parens = s.size() >= 2 && s.front() == '(' && s.back() == ')';
  if (parens) s = TrimBlanks(s.substr(1, s.size() - 2));
  bool leadingSign = !s.empty() && (s[0] == '+' || s[0] == '-');
  if (leadingSign) {
    if (parens) return false;
    out.negative = s[0] == '-';
    s.remove_prefix(1);
  }
  if (!ScanMantissa(s, out, loc) || !ScanExponent(s, out)) return false;
  if (!s.empty() && s == "-" && !leadingSign && !parens) {
    out.negative = true;
    s.remove_prefix(1);
  }
  out.negative |= parens;
  out.Finish();
  return s.empty();
}

// =================================================================================================
// Numeric text: values
// =================================================================================================

enum class NumStatus { Ok, Overflow };

double RadixToDouble(const NumberText& t, NumStatus& st) {
  st = NumStatus::Ok;
  if (t.radixValue > 0xFFFFFFFFu) {
    st = NumStatus::Overflow;
    return 0;
  }
  // Hex and octal text is a 32-bit pattern: &HFFFFFFFF is -1, as a Long literal would be.
  return static_cast<double>(static_cast<int32_t>(static_cast<uint32_t>(t.radixValue)));
}

double TextToDouble(const NumberText& t, NumStatus& st) {
  st = NumStatus::Ok;
  if (t.radix) return RadixToDouble(t, st);
  if (t.digits.empty()) return 0.0;
  if (t.point > 400) {
    st = NumStatus::Overflow;
    return 0;
  }
  if (t.point < -400) return 0.0;
  // from_chars wants clean ASCII: "-DIGITSe<exp>" with value digits × 10^(point − n).
  std::string buf;
  buf.reserve(t.digits.size() + 8);
  if (t.negative) buf += '-';
  buf += t.digits;
  buf += 'e';
  int64_t exp = t.point - static_cast<int64_t>(t.digits.size());
  if (exp < 0) buf += '-';
  AppendInt(buf, static_cast<uint64_t>(exp < 0 ? -exp : exp));
  double v = 0;
  auto r = std::from_chars(buf.data(), buf.data() + buf.size(), v);
  if (r.ec == std::errc::result_out_of_range) {
    if (t.point > 0) st = NumStatus::Overflow;
    return 0.0;
  }
  if (std::isinf(v)) st = NumStatus::Overflow;
  return v;
}

double TextToDoubleOrRaise(const NumberText& t) {
  NumStatus st = NumStatus::Ok;
  double v = TextToDouble(t, st);
  if (st == NumStatus::Overflow) Raise(kErrOverflow);
  return v;
}

NumberText ScanOrRaise(std::string_view text) {
  NumberText t;
  if (!ScanNumber(text, t, CurrentLocale())) Raise(kErrTypeMismatch);
  return t;
}

// The exact decimal value × 10^scale rounded half to even; integer targets and Currency use this
// so that "2.5" goes to 2 and "2.50000000000000001" to 3, whatever the nearest double is.
i128 RoundTextHalfEven(const NumberText& t, int scale) {
  if (t.radix) {
    NumStatus st = NumStatus::Ok;
    double v = RadixToDouble(t, st);
    if (st == NumStatus::Overflow) Raise(kErrOverflow);
    i128 r = static_cast<i128>(v);
    for (int i = 0; i < scale; ++i) r *= 10;
    return r;
  }
  const int64_t n = static_cast<int64_t>(t.digits.size());
  const int64_t whole = t.point + scale;  // digits before the point after scaling
  if (n == 0 || whole < 0) return 0;       // below 0.1: rounds to zero
  if (whole > 24) Raise(kErrOverflow);
  i128 v = 0;
  for (int64_t i = 0; i < whole; ++i) v = v * 10 + (i < n ? t.digits[i] - '0' : 0);
  int first = whole < n ? t.digits[whole] - '0' : 0;
  bool rest = false;
  for (int64_t i = whole + 1; i < n && !rest; ++i) rest = t.digits[i] != '0';
  if (first > 5 || (first == 5 && (rest || (v & 1) != 0))) ++v;
  return t.negative ? -v : v;
}

}  // namespace

double ParseNumber(std::string_view text) { return TextToDoubleOrRaise(ScanOrRaise(text)); }

bool IsNumericText(std::string_view text) {
  NumberText t;
  if (!ScanNumber(text, t, CurrentLocale())) return false;
  NumStatus st = NumStatus::Ok;
  TextToDouble(t, st);
  return st == NumStatus::Ok;
}

// =================================================================================================
// Val
// =================================================================================================

namespace {

// Val skips blanks, tabs and line breaks anywhere in the number.
bool ValBlank(char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; }

double ValRadix(std::string_view s, size_t i, int base) {
  NumberText t;
  t.radix = true;
  for (; i < s.size(); ++i) {
    if (ValBlank(s[i])) continue;
    int v = RadixDigit(s[i], base);
    if (v < 0) break;
    t.radixValue = std::min<uint64_t>(t.radixValue * base + v, uint64_t(1) << 40);
  }
  return TextToDoubleOrRaise(t);
}

// Exponent part of Val: "E[+-]digits" with blanks allowed; ignored when no digit follows.
void ValExponent(std::string_view s, size_t i, NumberText& t) {
  bool neg = false, any = false;
  int64_t e = 0;
  for (; i < s.size() && ValBlank(s[i]); ++i) {}
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) neg = s[i++] == '-';
  for (; i < s.size(); ++i) {
    if (ValBlank(s[i])) continue;
    if (!IsDigit(s[i])) break;
    e = std::min<int64_t>(e * 10 + (s[i] - '0'), NumberText::kMaxExponent);
    any = true;
  }
  if (any) t.ShiftExponent(neg ? -e : e);
}

}  // namespace

double Val(std::string_view s) {
  size_t i = 0;
  while (i < s.size() && ValBlank(s[i])) ++i;
  if (i + 1 < s.size() && s[i] == '&') {
    char k = s[i + 1];
    if (k == 'H' || k == 'h') return ValRadix(s, i + 2, 16);
    if (k == 'O' || k == 'o') return ValRadix(s, i + 2, 8);
    return 0;
  }
  NumberText t;
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) t.negative = s[i++] == '-';
  bool inFraction = false;
  for (; i < s.size(); ++i) {
    char c = s[i];
    if (ValBlank(c)) continue;
    if (IsDigit(c)) inFraction ? t.FracDigit(c) : t.IntDigit(c);
    else if (c == '.' && !inFraction) inFraction = true;
    else break;
  }
  if (i < s.size() && (s[i] == 'e' || s[i] == 'E')) ValExponent(s, i + 1, t);
  t.Finish();
  return TextToDoubleOrRaise(t);
}

// =================================================================================================
// Rounding
// =================================================================================================

double RoundHalfEven(double x) {
  if (!std::isfinite(x)) return x;
  double mag = std::fabs(x);
  if (mag >= 0x1p52) return x;  // already an integer
  double whole = std::floor(mag);
  double frac = mag - whole;  // exact for non-negative values
  if (frac > 0.5 || (frac == 0.5 && std::fmod(whole, 2.0) != 0)) whole += 1;
  return std::copysign(whole, x);
}

double VbRound(double x, int decimals) {
  if (decimals < 0) Raise(kErrInvalidCall);
  if (decimals == 0) return RoundHalfEven(x);
  static constexpr double kPow10[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,  1e8,  1e9,  1e10, 1e11,
                                      1e12, 1e13, 1e14, 1e15, 1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};
  double scale = decimals <= 22 ? kPow10[decimals] : std::pow(10.0, decimals);
  // The scaling happens in double on purpose: the results scripts saw came from this product,
  // not from the exact decimal value (0.12345 rounds to 0.1234 although it lies above the tie).
  double scaled = x * scale;
  if (!std::isfinite(scaled) || std::fabs(scaled) >= 0x1p52) return x;
  return RoundHalfEven(scaled) / scale;
}

// =================================================================================================
// Coercions
// =================================================================================================

namespace {

double BoolValue(bool b) { return b ? -1.0 : 0.0; }

i128 RoundedDouble(double d) {
  double r = RoundHalfEven(d);
  if (!(std::fabs(r) < 0x1p100)) Raise(kErrOverflow);  // NaN included
  return static_cast<i128>(r);
}

// Half-even integer of a Variant, before the target's range check.
i128 RoundedInteger(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty: return 0;
    case VarType::Null: Raise(kErrInvalidNull);
    case VarType::Integer: return v.AsInteger();
    case VarType::Long: return v.AsLong();
    case VarType::Boolean: return v.AsBool() ? -1 : 0;
    case VarType::String: return RoundTextHalfEven(ScanOrRaise(v.AsString()), 0);
    case VarType::Currency: {
      i128 raw = v.AsCurrency().raw(), q = raw / Currency::kScale, r = raw % Currency::kScale;
      i128 twice = 2 * (r < 0 ? -r : r);
      if (twice > Currency::kScale || (twice == Currency::kScale && (q & 1) != 0)) q += raw < 0 ? -1 : 1;
      return q;
    }
    case VarType::Double: return RoundedDouble(v.AsDouble());
    case VarType::Date: return RoundedDouble(v.AsDate().serial);
    default: RaiseBadType(v);
  }
}

}  // namespace

std::string CStr(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty: return {};
    case VarType::Null: Raise(kErrInvalidNull);
    case VarType::Integer: return std::to_string(v.AsInteger());
    case VarType::Long: return std::to_string(v.AsLong());
    case VarType::Double: return DoubleToString(v.AsDouble());
    case VarType::Currency: return CurrencyToString(v.AsCurrency());
    case VarType::Date: return DateToString(v.AsDate());
    case VarType::Boolean: return v.AsBool() ? "True" : "False";  // English in every locale
    case VarType::String: return v.AsString();
    default: RaiseBadType(v);  // objects (no default member yet), arrays, Missing
  }
}

double CDbl(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty: return 0;
    case VarType::Null: Raise(kErrInvalidNull);
    case VarType::Integer: return v.AsInteger();
    case VarType::Long: return v.AsLong();
    case VarType::Double: return v.AsDouble();
    case VarType::Currency: return v.AsCurrency().ToDouble();
    case VarType::Date: return v.AsDate().serial;
    case VarType::Boolean: return BoolValue(v.AsBool());
    case VarType::String: return ParseNumber(v.AsString());
    default: RaiseBadType(v);
  }
}

int32_t CLng(const Variant& v) {
  i128 r = RoundedInteger(v);
  if (r < std::numeric_limits<int32_t>::min() || r > std::numeric_limits<int32_t>::max()) Raise(kErrOverflow);
  return static_cast<int32_t>(r);
}

int16_t CInt(const Variant& v) {
  i128 r = RoundedInteger(v);
  if (r < std::numeric_limits<int16_t>::min() || r > std::numeric_limits<int16_t>::max()) Raise(kErrOverflow);
  return static_cast<int16_t>(r);
}

Currency CCur(const Variant& v) {
  switch (v.Type()) {
    case VarType::Currency: return v.AsCurrency();
    case VarType::Double: return Currency::FromDouble(v.AsDouble());
    case VarType::Date: return Currency::FromDouble(v.AsDate().serial);
    case VarType::String: {
      // Like the integer targets, text rounds on its exact decimal value at the fourth decimal.
      i128 raw = RoundTextHalfEven(ScanOrRaise(v.AsString()), 4);
      if (raw < std::numeric_limits<int64_t>::min() || raw > std::numeric_limits<int64_t>::max())
        Raise(kErrOverflow);
      return Currency::FromRaw(static_cast<int64_t>(raw));
    }
    default: return Currency::FromInt(static_cast<int64_t>(RoundedInteger(v)));
  }
}

namespace {

Date CheckedDate(double serial) {
  if (!(serial >= kMinDateSerial && serial <= kMaxDateSerial)) Raise(kErrOverflow);
  return Date(serial);
}

}  // namespace

Date CDate(const Variant& v) {
  switch (v.Type()) {
    case VarType::Date: return v.AsDate();
    case VarType::String: {
      // Date text is tried first, then a number as a serial: "45292" is a serial but "1.2.2024"
      // in a day-month locale is a date, never a number.
      try {
        return ParseDate(v.AsString());
      } catch (const VbError& e) {
        if (e.number() != kErrTypeMismatch) throw;
      }
      return CheckedDate(ParseNumber(v.AsString()));
    }
    default: return CheckedDate(CDbl(v));
  }
}

bool CBool(const Variant& v) {
  if (v.Type() != VarType::String) {
    if (v.IsBoolean()) return v.AsBool();
    if (v.Type() == VarType::Currency) return v.AsCurrency().raw() != 0;
    return CDbl(v) != 0;
  }
  std::string_view s = TrimBlanks(v.AsString());
  const RuntimeLocale& loc = CurrentLocale();
  if (AsciiEqualsNoCase(s, "True") || AsciiEqualsNoCase(s, loc.trueWord)) return true;
  if (AsciiEqualsNoCase(s, "False") || AsciiEqualsNoCase(s, loc.falseWord)) return false;
  return ParseNumber(s) != 0;
}

// =================================================================================================
// Int, Fix, Str
// =================================================================================================

namespace {

Variant IntOrFix(const Variant& v, bool floorMode) {
  auto cut = [&](double x) { return floorMode ? std::floor(x) : std::trunc(x); };
  switch (v.Type()) {
    case VarType::Empty: return Variant(int16_t{0});
    case VarType::Null: return v;
    case VarType::Integer:
    case VarType::Long: return v;
    case VarType::Boolean: return Variant(static_cast<int16_t>(v.AsBool() ? -1 : 0));
    case VarType::Double: return Variant(cut(v.AsDouble()));
    case VarType::Date: return Variant(Date(cut(v.AsDate().serial)));
    case VarType::String: return Variant(cut(ParseNumber(v.AsString())));
    case VarType::Currency: {
      i128 raw = v.AsCurrency().raw(), q = raw / Currency::kScale;
      if (floorMode && raw < 0 && raw % Currency::kScale != 0) --q;
      i128 scaled = q * Currency::kScale;
      if (scaled < std::numeric_limits<int64_t>::min()) Raise(kErrOverflow);
      return Variant(Currency::FromRaw(static_cast<int64_t>(scaled)));
    }
    default: RaiseBadType(v);
  }
}

}  // namespace

Variant Int(const Variant& v) { return IntOrFix(v, true); }
Variant Fix(const Variant& v) { return IntOrFix(v, false); }

std::string Str(const Variant& v) {
  std::string text;
  switch (v.Type()) {
    case VarType::Null: Raise(kErrInvalidNull);
    case VarType::Boolean:
    case VarType::Date: return CStr(v);  // not numbers: Str passes them through as CStr does
    case VarType::Currency: text = CurrencyText(v.AsCurrency(), "."); break;
    case VarType::Integer:
    case VarType::Long: text = std::to_string(CLng(v)); break;
    default: text = DoubleText(CDbl(v), "."); break;
  }
  if (text[0] != '-') text.insert(text.begin(), ' ');
  return text;
}

}  // namespace xal
