// Tests of the Variant operators: the result type each arithmetic operator picks (Currency + Double
// stays Currency, Currency × Double is Double, Date − Date is Double, Integer widening to Long),
// Null propagation, concatenation, and comparisons between mixed types.
#include <gtest/gtest.h>

#include "error_of.h"

#include <functional>
#include <limits>

#include "runtime/convert.h"
#include "runtime/locale.h"
#include "runtime/operators.h"

namespace xal {
namespace {

using ::xal::test::ErrorOf;

Variant Cur(int64_t raw) { return Variant(Currency::FromRaw(raw)); }

using BinaryOp = Variant (*)(const Variant&, const Variant&);

struct Row {
  const char* name;
  BinaryOp op;
  Variant a, b;
  Variant expected;  // type and value
  int error;
};

void CheckRows(const Row* begin, const Row* end) {
  for (const Row* r = begin; r != end; ++r) {
    SCOPED_TRACE(testing::Message() << r->name << ": " << DebugString(r->a) << ", " << DebugString(r->b));
    Variant out;
    EXPECT_EQ(ErrorOf([&] { out = r->op(r->a, r->b); }), r->error);
    if (!r->error) {
      EXPECT_EQ(out, r->expected);
    }
  }
}

const Variant kNull = Variant::Null();
const Variant kEmpty;

TEST(OperatorsTest, AddAndSubtractPickTheWiderType) {
  const Row rows[] = {
      {"Empty+5", Add, kEmpty, Variant::Integer(5), Variant::Integer(5), 0},
      {"Empty+Empty", Add, kEmpty, kEmpty, Variant::Integer(0), 0},
      {"Null+1", Add, kNull, Variant::Integer(1), kNull, 0},
      {"1+Null", Add, Variant::Integer(1), kNull, kNull, 0},
      {"Integer overflow widens", Add, Variant::Integer(32767), Variant::Integer(1), Variant::Long(32768), 0},
      {"Long overflow widens", Add, Variant::Long(2147483647), Variant::Integer(1), Variant(2147483648.0), 0},
      {"Integer+Long", Add, Variant::Integer(1), Variant::Long(2), Variant::Long(3), 0},
      {"Double", Add, Variant(1.5), Variant::Integer(1), Variant(2.5), 0},
      {"Double rounding", Add, Variant(0.1), Variant(0.2), Variant(0.1 + 0.2), 0},
      {"Currency+Double", Add, Cur(1000), Variant(0.2), Cur(3000), 0},
      {"Currency+Long", Add, Cur(15000), Variant::Long(2), Cur(35000), 0},
      {"True+True", Add, Variant(true), Variant(true), Variant::Integer(-2), 0},
      {"text+text", Add, Variant("a"), Variant("b"), Variant("ab"), 0},
      {"text+Empty", Add, Variant("x"), kEmpty, Variant("x"), 0},
      {"numeric text+number", Add, Variant("1"), Variant::Integer(2), Variant(3.0), 0},
      {"Date+number", Add, Variant::FromDate(45292), Variant::Integer(1), Variant::FromDate(45293), 0},
      {"number+Date", Add, Variant(0.5), Variant::FromDate(45292), Variant::FromDate(45292.5), 0},
      {"Date-Date", Subtract, Variant::FromDate(45352), Variant::FromDate(45323), Variant(29.0), 0},
      {"Date-number", Subtract, Variant::FromDate(45292), Variant::Integer(1), Variant::FromDate(45291), 0},
      {"Integer underflow widens", Subtract, Variant::Integer(-32768), Variant::Integer(1), Variant::Long(-32769), 0},
      {"text-number", Subtract, Variant("5"), Variant::Integer(2), Variant(3.0), 0},
      {"Currency-Currency", Subtract, Cur(10000), Cur(2500), Cur(7500), 0},
      {"Null-1", Subtract, kNull, Variant::Integer(1), kNull, 0},
      {"text+number", Add, Variant("abc"), Variant::Integer(1), kNull, kErrTypeMismatch},   // not numeric text
      {"Currency max+1", Add, Cur(std::numeric_limits<int64_t>::max()), Variant::Integer(1), kNull, kErrOverflow},  // out of range
      {"Date+1E7", Add, Variant::FromDate(45292), Variant(1e7), kNull, kErrOverflow},       // past 9999-12-31
      {"Double overflow", Add, Variant(1.7e308), Variant(1.7e308), kNull, kErrOverflow},    // infinite
      {"array+1", Add, Variant(SafeArray()), Variant::Integer(1), kNull, kErrTypeMismatch}, // arrays have no value
      {"Missing+1", Add, Variant::Missing(), Variant::Integer(1), kNull, kErrNotOptional},  // omitted argument
  };
  CheckRows(std::begin(rows), std::end(rows));
  // c = 922337203685477 + 1: the Double sum does not fit a Currency.
  EXPECT_EQ(ErrorOf([] { CCur(Add(Variant(922337203685477.0), Variant::Integer(1))); }), kErrOverflow);
}

TEST(OperatorsTest, MultiplyAndDivideResultTypes) {
  const Row rows[] = {
      {"Currency*Double", Multiply, Cur(999900), Variant(0.18), Variant(99.99 * 0.18), 0},
      {"Currency*Integer", Multiply, Cur(15000), Variant::Integer(3), Cur(45000), 0},
      {"Currency*Currency", Multiply, Cur(15000), Cur(15000), Cur(22500), 0},
      {"Integer*Integer widens", Multiply, Variant::Integer(200), Variant::Integer(200), Variant::Long(40000), 0},
      {"Long*Long widens", Multiply, Variant::Long(100000), Variant::Long(100000), Variant(1e10), 0},
      {"Date*2", Multiply, Variant::FromDate(1.5), Variant::Integer(2), Variant(3.0), 0},
      {"text*text", Multiply, Variant("2"), Variant("3"), Variant(6.0), 0},
      {"True*5", Multiply, Variant(true), Variant::Integer(5), Variant::Integer(-5), 0},
      {"Null*2", Multiply, kNull, Variant::Integer(2), kNull, 0},
      {"10/3", Divide, Variant::Integer(10), Variant::Integer(3), Variant(10.0 / 3), 0},
      {"Currency/Currency", Divide, Cur(100000), Cur(40000), Variant(2.5), 0},
      {"Empty/1", Divide, kEmpty, Variant::Integer(1), Variant(0.0), 0},
      {"Null/0", Divide, kNull, Variant::Integer(0), kNull, 0},
      {"Currency*2 overflow", Multiply, Cur(9000000000000000000), Variant::Integer(2), kNull, kErrOverflow},  // 1.8E15
      {"Double overflow", Multiply, Variant(1e200), Variant(1e200), kNull, kErrOverflow},  // infinite
      {"0/0", Divide, Variant::Integer(0), Variant::Integer(0), kNull, kErrOverflow},      // 0/0 is overflow
      {"1/0", Divide, Variant::Integer(1), Variant(0.0), kNull, kErrDivByZero},           // x/0
      {"x/Empty", Divide, Variant(2.5), kEmpty, kNull, kErrDivByZero},                     // Empty is 0
      {"text/1", Divide, Variant("x"), Variant::Integer(1), kNull, kErrTypeMismatch},     // not numeric
  };
  CheckRows(std::begin(rows), std::end(rows));
  // c = 10 / 3 and CCur(99.99) * 0.18 stored into Currency.
  EXPECT_EQ(CCur(Divide(Variant::Integer(10), Variant::Integer(3))).raw(), 33333);
  EXPECT_EQ(CCur(Multiply(Cur(999900), Variant(0.18))).raw(), 179982);
}

TEST(OperatorsTest, IntegerDivisionAndModRoundOperandsFirst) {
  const Row rows[] = {
      {"7.5\\2", IntDivide, Variant(7.5), Variant::Integer(2), Variant::Long(4), 0},
      {"7\\2", IntDivide, Variant::Integer(7), Variant::Integer(2), Variant::Integer(3), 0},
      {"-7\\2", IntDivide, Variant::Integer(-7), Variant::Integer(2), Variant::Integer(-3), 0},
      {"Currency\\n", IntDivide, Cur(105000), Variant::Integer(2), Variant::Long(5), 0},
      {"-32768\\-1 widens", IntDivide, Variant::Integer(-32768), Variant::Integer(-1), Variant::Long(32768), 0},
      {"Null\\1", IntDivide, kNull, Variant::Integer(1), kNull, 0},
      {"12.6 Mod 5", Modulo, Variant(12.6), Variant::Integer(5), Variant::Long(3), 0},
      {"-7 Mod 3", Modulo, Variant::Integer(-7), Variant::Integer(3), Variant::Integer(-1), 0},
      {"7 Mod -3", Modulo, Variant::Integer(7), Variant::Integer(-3), Variant::Integer(1), 0},
      {"2.5 Mod 2", Modulo, Variant(2.5), Variant::Integer(2), Variant::Long(0), 0},
      {"3.5 Mod 3", Modulo, Variant(3.5), Variant::Integer(3), Variant::Long(1), 0},
      {"Long min Mod -1", Modulo, Variant::Long(INT32_MIN), Variant::Integer(-1), Variant::Long(0), 0},
      {"x\\0", IntDivide, Variant::Integer(5), Variant::Integer(0), kNull, kErrDivByZero},     // divisor 0
      {"x\\0.4", IntDivide, Variant::Integer(5), Variant(0.4), kNull, kErrDivByZero},          // rounds to 0
      {"x Mod 0", Modulo, Variant::Integer(5), kEmpty, kNull, kErrDivByZero},                  // Empty is 0
      {"Long min\\-1", IntDivide, Variant::Long(INT32_MIN), Variant::Integer(-1), kNull, kErrOverflow},  // 2^31
      {"3E9\\1", IntDivide, Variant(3e9), Variant::Integer(1), kNull, kErrOverflow},           // operand beyond Long
  };
  CheckRows(std::begin(rows), std::end(rows));
}

TEST(OperatorsTest, NegateKeepsTheTypeOrWidens) {
  struct NegRow {
    Variant a, expected;
    int error;
  };
  const NegRow rows[] = {
      {Variant::Integer(5), Variant::Integer(-5), 0},
      {Variant::Integer(-32768), Variant::Long(32768), 0},
      {Variant::Long(INT32_MIN), Variant(2147483648.0), 0},
      {Variant(true), Variant::Integer(1), 0},
      {kEmpty, Variant::Integer(0), 0},
      {Variant("5"), Variant(-5.0), 0},
      {Cur(15000), Cur(-15000), 0},
      {Variant::FromDate(1.5), Variant::FromDate(-1.5), 0},
      {kNull, kNull, 0},
      {Cur(std::numeric_limits<int64_t>::min()), kNull, kErrOverflow},  // no positive counterpart
      {Variant("x"), kNull, kErrTypeMismatch},                          // not numeric
  };
  for (const NegRow& r : rows) {
    SCOPED_TRACE(DebugString(r.a));
    Variant out;
    EXPECT_EQ(ErrorOf([&] { out = Negate(r.a); }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
  }
}

TEST(OperatorsTest, ConcatTreatsNullAsEmptyUnlessBothAreNull) {
  const Row rows[] = {
      {"Null&x", Concat, kNull, Variant("x"), Variant("x"), 0},
      {"x&Null", Concat, Variant("x"), kNull, Variant("x"), 0},
      {"Null&Null", Concat, kNull, kNull, kNull, 0},
      {"Empty&x", Concat, kEmpty, Variant("x"), Variant("x"), 0},
      {"number&text", Concat, Variant(1.5), Variant("x"), Variant("1.5x"), 0},
      {"Integer&Long", Concat, Variant::Integer(1), Variant::Long(2), Variant("12"), 0},
      {"Boolean", Concat, Variant("x"), Variant(true), Variant("xTrue"), 0},
      {"array&x", Concat, Variant(SafeArray()), Variant("x"), kNull, kErrTypeMismatch},  // arrays have no text
  };
  CheckRows(std::begin(rows), std::end(rows));
  ScopedLocale comma(RuntimeLocale{",", "\u00A0", DateOrder::DayMonthYear, "Tõene", "Väär"});
  EXPECT_EQ(Concat(Variant(true), Variant(1.5)), Variant("Tõene1,5"));
}

struct CompareRow {
  Variant a, b;
  std::optional<int> expected;
  int error;
};

TEST(OperatorsTest, CompareMixedTypes) {
  const CompareRow rows[] = {
      {Variant("10"), Variant::Integer(9), 1, 0},       // text sorts after numbers
      {Variant("10"), Variant::Integer(100), 1, 0},
      {Variant(""), Variant::Integer(0), 1, 0},
      {Variant::Integer(9), Variant("10"), -1, 0},
      {kEmpty, Variant::Integer(0), 0, 0},
      {kEmpty, Variant(-0.5), 1, 0},
      {kEmpty, Variant(""), 0, 0},
      {kEmpty, Variant("a"), -1, 0},
      {Variant("a"), kEmpty, 1, 0},
      {kEmpty, kEmpty, 0, 0},
      {Cur(3000), Variant(0.1 + 0.2), 0, 0},            // the Double becomes Currency first
      {Variant(0.1 + 0.2), Cur(3000), 0, 0},
      {Variant(0.3), Variant(0.1 + 0.2), -1, 0},        // as Doubles they differ
      {Cur(10000), Variant::Integer(1), 0, 0},
      {Variant::Integer(2), Cur(10000), 1, 0},
      {Cur(10000), Variant(1e300), -1, 0},              // beyond the Currency range
      {Cur(10000), Variant(-1e300), 1, 0},
      {Variant(true), Variant::Integer(-1), 0, 0},
      {Variant(true), Variant::Integer(1), -1, 0},
      {Variant::Integer(1), Variant(true), 1, 0},
      {Variant(true), Variant(true), 0, 0},
      {Variant::FromDate(36526), Variant::Long(36526), 0, 0},
      {Variant::Long(5), Variant(5.5), -1, 0},
      {Variant::Long(2147483647), Variant::Integer(-32768), 1, 0},
      {kNull, Variant::Integer(1), std::nullopt, 0},
      {kNull, kNull, std::nullopt, 0},
      {Variant(SafeArray()), Variant::Integer(1), std::nullopt, kErrTypeMismatch},  // arrays do not compare
      {Variant::Integer(1), Variant::Missing(), std::nullopt, kErrNotOptional},     // omitted argument
  };
  for (const CompareRow& r : rows) {
    SCOPED_TRACE(testing::Message() << DebugString(r.a) << " vs " << DebugString(r.b));
    std::optional<int> out;
    EXPECT_EQ(ErrorOf([&] { out = Compare(r.a, r.b); }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
  }
}

TEST(OperatorsTest, CompareTextUsesTheCompareMode) {
  struct TextRow {
    const char* a;
    const char* b;
    CompareMode mode;
    int expected;
  };
  const TextRow rows[] = {
      {"abc", "abd", CompareMode::Binary, -1},
      {"a", "A", CompareMode::Binary, 1},
      {"a", "A", CompareMode::Text, 0},
      {"b", "b", CompareMode::Binary, 0},
  };
  for (const TextRow& r : rows) {
    SCOPED_TRACE(testing::Message() << r.a << " vs " << r.b);
    EXPECT_EQ(Compare(Variant(r.a), Variant(r.b), r.mode), r.expected);
  }
}

TEST(OperatorsTest, EqualsGivesNullOrBoolean) {
  struct EqRow {
    Variant a, b, expected;
  };
  const EqRow rows[] = {
      {Variant(true), Variant::Integer(-1), Variant(true)},
      {Variant(true), Variant::Integer(1), Variant(false)},
      {Variant::Integer(1), Variant(true), Variant(false)},
      {Variant(CBool(Variant::Integer(1))), Variant(true), Variant(true)},
      {Variant(Currency::FromDouble(0.3)), Add(Variant(0.1), Variant(0.2)), Variant(true)},
      {Variant("10"), Variant::Integer(10), Variant(false)},
      {Variant::FromDate(36526), Variant::Long(36526), Variant(true)},
      {kNull, kNull, kNull},
      {kNull, Variant::Integer(1), kNull},
  };
  for (const EqRow& r : rows) {
    SCOPED_TRACE(testing::Message() << DebugString(r.a) << " = " << DebugString(r.b));
    EXPECT_EQ(Equals(r.a, r.b), r.expected);
  }
}

}  // namespace
}  // namespace xal
