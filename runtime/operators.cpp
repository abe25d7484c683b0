// The script operators on Variants: + − * / \ Mod, unary minus, & and the comparisons. Each
// operator first settles the type of its result (Currency + Double stays Currency, Currency ×
// Double is Double, Date − Date is Double …), then computes in that type, so that amounts and
// dates come out exactly as they did in the scripts' original environment.
#include "runtime/operators.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

#include "runtime/convert.h"
#include "runtime/locale.h"

namespace xal {

namespace {

// A Missing argument in an expression is an omitted optional parameter: "argument not optional".
[[noreturn]] void RaiseBadType(const Variant& v) {
  if (v.IsMissing()) Raise(kErrNotOptional);
  Raise(kErrTypeMismatch);
}

// Operand kinds in the order in which + and − widen their result.
enum class Kind { Integer, Long, Double, Currency, Date };

struct Operand {
  Kind kind;
  int32_t i = 0;   // Integer, Long
  double d = 0;    // Double, Date serial
  Currency c;      // Currency

  static Operand Whole(Kind k, int32_t v) { return Operand{k, v, 0, Currency()}; }
  static Operand Real(Kind k, double v) { return Operand{k, 0, v, Currency()}; }
  static Operand Money(Currency v) { return Operand{Kind::Currency, 0, 0, v}; }

  double AsDouble() const {
    return kind == Kind::Currency ? c.ToDouble() : (kind == Kind::Double || kind == Kind::Date) ? d : i;
  }
  Currency AsCurrency() const {
    return kind == Kind::Currency ? c : (kind == Kind::Double || kind == Kind::Date) ? Currency::FromDouble(d)
                                                                                       : Currency::FromInt(i);
  }
};

// Empty is 0, True is -1 and numeric text a Double; Null never gets here.
Operand ToOperand(const Variant& v) {
  switch (v.Type()) {
    case VarType::Empty: return Operand::Whole(Kind::Integer, 0);
    case VarType::Integer: return Operand::Whole(Kind::Integer, v.AsInteger());
    case VarType::Boolean: return Operand::Whole(Kind::Integer, v.AsBool() ? -1 : 0);
    case VarType::Long: return Operand::Whole(Kind::Long, v.AsLong());
    case VarType::Double: return Operand::Real(Kind::Double, v.AsDouble());
    case VarType::Date: return Operand::Real(Kind::Date, v.AsDate().serial);
    case VarType::String: return Operand::Real(Kind::Double, ParseNumber(v.AsString()));
    case VarType::Currency: return Operand::Money(v.AsCurrency());
    default: RaiseBadType(v);
  }
}

Variant CheckedDouble(double r) {
  if (!std::isfinite(r)) Raise(kErrOverflow);
  return Variant(r);
}

Variant CheckedDate(double serial) {
  if (!(serial >= kMinDateSerial && serial <= kMaxDateSerial)) Raise(kErrOverflow);
  return Variant(Date(serial));
}

// Integer results that leave their type move up one size instead of failing, as Variant
// arithmetic does: Integer → Long → Double.
Variant WidenedInteger(int64_t r, Kind kind) {
  if (kind == Kind::Integer && r >= INT16_MIN && r <= INT16_MAX) return Variant(static_cast<int16_t>(r));
  if (r >= INT32_MIN && r <= INT32_MAX) return Variant(static_cast<int32_t>(r));
  return Variant(static_cast<double>(r));
}

bool EitherNull(const Variant& a, const Variant& b) { return a.IsNull() || b.IsNull(); }

Variant AddOrSubtract(const Operand& x, const Operand& y, bool subtract) {
  Kind k = std::max(x.kind, y.kind);
  double sign = subtract ? -1.0 : 1.0;
  switch (k) {
    case Kind::Date:
      if (subtract && x.kind == Kind::Date && y.kind == Kind::Date) return CheckedDouble(x.d - y.d);
      return CheckedDate(x.AsDouble() + sign * y.AsDouble());
    case Kind::Currency: return Variant(subtract ? x.AsCurrency() - y.AsCurrency() : x.AsCurrency() + y.AsCurrency());
    case Kind::Double: return CheckedDouble(subtract ? x.AsDouble() - y.AsDouble() : x.AsDouble() + y.AsDouble());
    default: return WidenedInteger(subtract ? int64_t(x.i) - y.i : int64_t(x.i) + y.i, k);
  }
}

}  // namespace

// =================================================================================================
// Arithmetic
// =================================================================================================

Variant Add(const Variant& a, const Variant& b) {
  if (EitherNull(a, b)) return Variant::Null();
  // "+" on text joins it; Empty beside text counts as "".
  if (a.IsString() && (b.IsString() || b.IsEmpty())) return Variant(a.AsString() + (b.IsString() ? b.AsString() : ""));
  if (b.IsString() && a.IsEmpty()) return b;
  return AddOrSubtract(ToOperand(a), ToOperand(b), false);
}

Variant Subtract(const Variant& a, const Variant& b) {
  if (EitherNull(a, b)) return Variant::Null();
  return AddOrSubtract(ToOperand(a), ToOperand(b), true);
}

Variant Multiply(const Variant& a, const Variant& b) {
  if (EitherNull(a, b)) return Variant::Null();
  Operand x = ToOperand(a), y = ToOperand(b);
  // A Date multiplies as its serial; Double outranks Currency here (Currency × Double is Double).
  auto rank = [](Kind k) { return k == Kind::Date || k == Kind::Double ? 3 : k == Kind::Currency ? 2 : int(k); };
  int r = std::max(rank(x.kind), rank(y.kind));
  if (r == 3) return CheckedDouble(x.AsDouble() * y.AsDouble());
  if (r == 2) {
    if (x.kind == Kind::Currency && y.kind == Kind::Currency) return Variant(x.c * y.c);
    return Variant(x.kind == Kind::Currency ? x.c.MulInt(y.i) : y.c.MulInt(x.i));
  }
  return WidenedInteger(int64_t(x.i) * y.i, r == 0 ? Kind::Integer : Kind::Long);
}

Variant Divide(const Variant& a, const Variant& b) {
  if (EitherNull(a, b)) return Variant::Null();
  double x = ToOperand(a).AsDouble(), y = ToOperand(b).AsDouble();
  if (y == 0) Raise(x == 0 ? kErrOverflow : kErrDivByZero);
  return CheckedDouble(x / y);
}

namespace {

// "\" and Mod round both operands half to even into Long first; the result is Integer when both
// were Integer-sized (Integer, Boolean, Empty), Long otherwise.
bool IntegerSized(const Variant& v) {
  return v.IsEmpty() || v.IsBoolean() || v.Type() == VarType::Integer;
}

}  // namespace

Variant IntDivide(const Variant& a, const Variant& b) {
  if (EitherNull(a, b)) return Variant::Null();
  int64_t x = CLng(a), y = CLng(b);
  if (y == 0) Raise(kErrDivByZero);
  int64_t q = x / y;
  if (q > INT32_MAX) Raise(kErrOverflow);  // -2147483648 \ -1
  return WidenedInteger(q, IntegerSized(a) && IntegerSized(b) ? Kind::Integer : Kind::Long);
}

Variant Modulo(const Variant& a, const Variant& b) {
  if (EitherNull(a, b)) return Variant::Null();
  int64_t x = CLng(a), y = CLng(b);
  if (y == 0) Raise(kErrDivByZero);
  return WidenedInteger(x % y, IntegerSized(a) && IntegerSized(b) ? Kind::Integer : Kind::Long);
}

Variant Negate(const Variant& a) {
  if (a.IsNull()) return a;
  Operand x = ToOperand(a);
  switch (x.kind) {
    case Kind::Date: return CheckedDate(-x.d);
    case Kind::Currency: return Variant(-x.c);
    case Kind::Double: return Variant(-x.d);
    default: return WidenedInteger(-int64_t(x.i), x.kind);
  }
}

// =================================================================================================
// Concatenation
// =================================================================================================

namespace {

// Text of an operand of "&": implicit conversion, so Booleans use the locale's words.
std::string ConcatText(const Variant& v) {
  if (v.IsNull()) return {};
  if (v.IsBoolean()) return v.AsBool() ? CurrentLocale().trueWord : CurrentLocale().falseWord;
  return CStr(v);
}

}  // namespace

Variant Concat(const Variant& a, const Variant& b) {
  if (a.IsNull() && b.IsNull()) return Variant::Null();
  return Variant(ConcatText(a) + ConcatText(b));
}

// =================================================================================================
// Comparison
// =================================================================================================

namespace {

template <typename T>
int Sign3(T a, T b) {
  return a < b ? -1 : (b < a ? 1 : 0);
}

// Currency against a Double: the Double is turned into Currency first, so CCur(0.3) equals
// 0.1 + 0.2. A Double beyond the Currency range is simply larger or smaller.
int CompareCurrencyDouble(Currency c, double d) {
  if (std::isnan(d)) return 1;
  if (d >= 0x1p63 / Currency::kScale) return -1;
  if (d <= -0x1p63 / Currency::kScale) return 1;
  return Sign3(c, Currency::FromDouble(d));
}

int CompareCurrencyTo(Currency c, const Operand& other) {
  if (other.kind == Kind::Integer || other.kind == Kind::Long) return Sign3(c, Currency::FromInt(other.i));
  return CompareCurrencyDouble(c, other.d);
}

int CompareOperands(const Operand& x, const Operand& y) {
  if (x.kind == Kind::Currency && y.kind == Kind::Currency) return Sign3(x.c, y.c);
  if (x.kind == Kind::Currency) return CompareCurrencyTo(x.c, y);
  if (y.kind == Kind::Currency) return -CompareCurrencyTo(y.c, x);
  if (x.kind >= Kind::Double || y.kind >= Kind::Double) return Sign3(x.AsDouble(), y.AsDouble());
  return Sign3(x.i, y.i);
}

bool IsComparableNumber(const Variant& v) {
  switch (v.Type()) {
    case VarType::Integer:
    case VarType::Long:
    case VarType::Double:
    case VarType::Currency:
    case VarType::Date:
    case VarType::Boolean: return true;
    default: return false;
  }
}

}  // namespace

std::optional<int> Compare(const Variant& a, const Variant& b, CompareMode mode) {
  if (EitherNull(a, b)) return std::nullopt;
  if (!a.IsEmpty() && !a.IsString() && !IsComparableNumber(a)) RaiseBadType(a);
  if (!b.IsEmpty() && !b.IsString() && !IsComparableNumber(b)) RaiseBadType(b);
  if (a.IsEmpty() && b.IsEmpty()) return 0;
  if (a.IsString() && b.IsString()) return StrComp(a.AsString(), b.AsString(), mode);
  // Empty beside text is "", beside a number 0.
  if (a.IsEmpty() && b.IsString()) return b.AsString().empty() ? 0 : -1;
  if (b.IsEmpty() && a.IsString()) return a.AsString().empty() ? 0 : 1;
  // Text held in a Variant always sorts after any number: "10" > 100.
  if (a.IsString()) return 1;
  if (b.IsString()) return -1;
  return CompareOperands(ToOperand(a), ToOperand(b));
}

Variant Equals(const Variant& a, const Variant& b, CompareMode mode) {
  std::optional<int> r = Compare(a, b, mode);
  if (!r) return Variant::Null();
  return Variant(*r == 0);
}

}  // namespace xal
