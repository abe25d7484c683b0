// Tests of the conversions between Variant types: the text of numbers (15 significant digits and
// the fixed/exponent choice), parsing numeric text with the locale's separators, half-even
// rounding into Integer, Long and Currency, Int/Fix/Round/Val/Str, and the errors 6, 13 and 94.
#include <gtest/gtest.h>

#include "error_of.h"

#include <cmath>
#include <functional>
#include <limits>

#include "runtime/convert.h"
#include "runtime/locale.h"

namespace xal {
namespace {

// Runs f and returns the run-time error number it raised, 0 when none.
using ::xal::test::ErrorOf;

RuntimeLocale CommaLocale() {
  RuntimeLocale l;
  l.decimal = ",";
  l.thousands = "\u00A0";
  l.dateOrder = DateOrder::DayMonthYear;
  l.trueWord = "Tõene";
  l.falseWord = "Väär";
  return l;
}

// ---- Number to text -----------------------------------------------------------------------------

TEST(ConvertTest, CStrOfDoubleUsesFifteenDigitsAndTheFixedOrExponentRule) {
  struct Row {
    double input;
    const char* expected;
  };
  const Row rows[] = {
      {0.1 + 0.2, "0.3"},
      {1.0 / 3, "0.333333333333333"},
      {12.345678901234567, "12.3456789012346"},
      {-12.345678901234567, "-12.3456789012346"},
      {999999999999999.0, "999999999999999"},
      {9999999999999998.0, "1E+16"},
      {1e15, "1E+15"},
      {1.234e16, "1.234E+16"},
      {123456789012345678.0, "1.23456789012346E+17"},
      {1e100, "1E+100"},
      {0.0001, "0.0001"},
      {0.000015, "0.000015"},
      {5.6789e-11, "0.000000000056789"},
      {5.6789e-12, "5.6789E-12"},
      {-5.6789e-12, "-5.6789E-12"},
      {1e-14, "0.00000000000001"},
      {1e-15, "1E-15"},
      {4.9406564584124654e-324, "4.94065645841247E-324"},
      {1.7976931348623157e308, "1.79769313486232E+308"},
      {-0.0, "0"},
      {0.0, "0"},
      {1.5, "1.5"},
      {-2.5, "-2.5"},
      {100.0, "100"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(CStr(Variant(r.input)), r.expected);
  }
}

TEST(ConvertTest, CStrOfOtherTypes) {
  struct Row {
    Variant input;
    const char* expected;
    int error;
  };
  const Row rows[] = {
      {Variant(), "", 0},
      {Variant::Integer(-32768), "-32768", 0},
      {Variant::Long(2147483647), "2147483647", 0},
      {Variant(Currency::FromRaw(15000)), "1.5", 0},
      {Variant(Currency::FromRaw(9)), "0.0009", 0},
      {Variant(Currency::FromRaw(-9)), "-0.0009", 0},
      {Variant(Currency::FromRaw(std::numeric_limits<int64_t>::max())), "922337203685477.5807", 0},
      {Variant(Currency::FromRaw(std::numeric_limits<int64_t>::min())), "-922337203685477.5808", 0},
      {Variant(Currency::FromRaw(100000)), "10", 0},
      {Variant(true), "True", 0},
      {Variant(false), "False", 0},
      {Variant("text"), "text", 0},
      {Variant::Null(), "", kErrInvalidNull},            // Null cannot become text
      {Variant::Nothing(), "", kErrTypeMismatch},        // an object has no text
      {Variant(SafeArray()), "", kErrTypeMismatch},      // nor has an array
      {Variant::Missing(), "", kErrNotOptional},         // an omitted optional argument
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.input));
    std::string out;
    EXPECT_EQ(ErrorOf([&] { out = CStr(r.input); }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
  }
}

TEST(ConvertTest, CStrUsesTheLocaleDecimalButEnglishBooleans) {
  ScopedLocale comma(CommaLocale());
  struct Row {
    Variant input;
    const char* expected;
  };
  const Row rows[] = {
      {Variant(1.5), "1,5"},
      {Variant(1.234e16), "1,234E+16"},
      {Variant(5.6789e-11), "0,000000000056789"},
      {Variant(Currency::FromRaw(15000)), "1,5"},
      {Variant(1234567.0), "1234567"},  // no thousands separators in CStr
      {Variant(true), "True"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(CStr(r.input), r.expected);
  }
}

TEST(ConvertTest, StrHasALeadingBlankAndAlwaysAPoint) {
  struct Row {
    Variant input;
    const char* expected;
  };
  const Row rows[] = {
      {Variant(1.5), " 1.5"},
      {Variant(-1.5), "-1.5"},
      {Variant(0.0), " 0"},
      {Variant::Integer(-7), "-7"},
      {Variant(Currency::FromRaw(25000)), " 2.5"},
      {Variant(), " 0"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(Str(r.input), r.expected);
  }
  ScopedLocale comma(CommaLocale());
  EXPECT_EQ(Str(Variant(1.5)), " 1.5");
}

// ---- Text to number -----------------------------------------------------------------------------

struct ParseRow {
  const char* input;
  double expected;
  int error;
};

void CheckParse(const ParseRow& r) {
  SCOPED_TRACE(r.input);
  double out = 0;
  EXPECT_EQ(ErrorOf([&] { out = ParseNumber(r.input); }), r.error);
  EXPECT_EQ(IsNumericText(r.input), r.error == 0);
  if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
}

TEST(ConvertTest, ParseNumberWithPointLocale) {
  const ParseRow rows[] = {
      {" 12.5 ", 12.5, 0},
      {"1,5", 15, 0},              // the comma is a thousands separator here
      {"1,234.5", 1234.5, 0},
      {"1,,23,4", 1234, 0},        // separators anywhere in the integer digits
      {"&HFF", 255, 0},
      {"&hff", 255, 0},
      {"&O17", 15, 0},
      {"&HFFFFFFFF", -1, 0},       // a 32-bit pattern
      {"-5", -5, 0},
      {"+5", 5, 0},
      {"5-", -5, 0},
      {"(5)", -5, 0},
      {"( 2.5 )", -2.5, 0},
      {"1e3", 1000, 0},
      {"1.5E-2", 0.015, 0},
      {".5", 0.5, 0},
      {"5.", 5, 0},
      {"\t7\n", 7, 0},
      {"0.1", 0.1, 0},
      {"000123.4500", 123.45, 0},
      {"1e-999", 0, 0},
      {"", 0, kErrTypeMismatch},              // nothing to parse
      {"   ", 0, kErrTypeMismatch},           // only blanks
      {"abc", 0, kErrTypeMismatch},           // not a number
      {"1.2.3", 0, kErrTypeMismatch},         // two decimal separators
      {"1e", 0, kErrTypeMismatch},            // exponent without digits
      {"--5", 0, kErrTypeMismatch},           // two signs
      {"-5-", 0, kErrTypeMismatch},           // sign in front and behind
      {"(-5)", 0, kErrTypeMismatch},          // parentheses and a sign
      {"5 5", 0, kErrTypeMismatch},           // blank inside the number
      {",5", 0, kErrTypeMismatch},            // separator before any digit
      {".", 0, kErrTypeMismatch},             // no digits at all
      {"1.5,0", 0, kErrTypeMismatch},         // thousands separator in the fraction
      {"&H", 0, kErrTypeMismatch},            // prefix without digits
      {"&HG1", 0, kErrTypeMismatch},          // not a hex digit
      {"&O8", 0, kErrTypeMismatch},           // not an octal digit
      {"0x10", 0, kErrTypeMismatch},          // C notation is not accepted
      {"inf", 0, kErrTypeMismatch},           // nor are C's special words
      {"nan", 0, kErrTypeMismatch},
      {"1e999", 0, kErrOverflow},             // too large for a Double
      {"&H1FFFFFFFF", 0, kErrOverflow},       // more than 32 bits
  };
  for (const ParseRow& r : rows) CheckParse(r);
}

TEST(ConvertTest, ParseNumberWithCommaLocale) {
  ScopedLocale comma(CommaLocale());
  const ParseRow rows[] = {
      {"1,5", 1.5, 0},
      {"1\u00A0234,5", 1234.5, 0},
      {"-0,25", -0.25, 0},
      {"&HFF", 255, 0},
      {" 12.5 ", 0, kErrTypeMismatch},     // "." is no separator in this locale
      {"1,234.5", 0, kErrTypeMismatch},    // the en-US form is rejected
      {"1 234,5", 0, kErrTypeMismatch},    // a plain blank is not the no-break space
  };
  for (const ParseRow& r : rows) CheckParse(r);
}

TEST(ConvertTest, CDblOfEveryType) {
  struct Row {
    Variant input;
    double expected;
    int error;
  };
  const Row rows[] = {
      {Variant(), 0, 0},
      {Variant(true), -1, 0},
      {Variant(false), 0, 0},
      {Variant::Integer(7), 7, 0},
      {Variant(Currency::FromRaw(15000)), 1.5, 0},
      {Variant::FromDate(45292.5), 45292.5, 0},
      {Variant("1,5"), 15, 0},
      {Variant(""), 0, kErrTypeMismatch},             // empty text is not a number
      {Variant::Null(), 0, kErrInvalidNull},          // Null has no value
      {Variant::Nothing(), 0, kErrTypeMismatch},      // objects have no value here
      {Variant(SafeArray()), 0, kErrTypeMismatch},    // arrays neither
      {Variant::Missing(), 0, kErrNotOptional},       // omitted optional argument
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.input));
    double out = 0;
    EXPECT_EQ(ErrorOf([&] { out = CDbl(r.input); }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
  }
}

// ---- Rounding into integers and Currency --------------------------------------------------------

TEST(ConvertTest, CIntAndCLngRoundHalfToEven) {
  struct Row {
    Variant input;
    int64_t expected;
    int intError;   // CInt
    int longError;  // CLng
  };
  const Row rows[] = {
      {Variant(0.5), 0, 0, 0},
      {Variant(-0.5), 0, 0, 0},
      {Variant(1.5), 2, 0, 0},
      {Variant(-1.5), -2, 0, 0},
      {Variant(2.5), 2, 0, 0},
      {Variant(-2.5), -2, 0, 0},
      {Variant(2.4999999999999996), 2, 0, 0},
      {Variant(267.49999999999997), 267, 0, 0},   // the product CLng(2.675 * 100) sees on x87
      // In binary64 2.675 * 100 is exactly 267.5, so half-even gives 268.
      {Variant(2.675 * 100), 268, 0, 0},
      {Variant(32767.4), 32767, 0, 0},
      {Variant(-32768.5), -32768, 0, 0},          // tie to even stays in range
      {Variant(Currency::FromRaw(25000)), 2, 0, 0},
      {Variant(Currency::FromRaw(35000)), 4, 0, 0},
      {Variant(Currency::FromRaw(-25001)), -3, 0, 0},
      {Variant::FromDate(45292.5), 45292, kErrOverflow, 0},  // noon: even day; too big for Integer
      {Variant::FromDate(45293.5), 45294, kErrOverflow, 0},
      {Variant(true), -1, 0, 0},
      {Variant(), 0, 0, 0},
      {Variant("2.5"), 2, 0, 0},
      {Variant("3.5"), 4, 0, 0},
      {Variant("-2.5"), -2, 0, 0},
      {Variant("2.50000000000000001"), 3, 0, 0},  // exact text is above the tie
      {Variant("1.49999999999999999"), 1, 0, 0},  // exact text is below the tie (the double is 1.5)
      {Variant("25E-1"), 2, 0, 0},
      {Variant("&HFF"), 255, 0, 0},
      {Variant("1,000"), 1000, 0, 0},
      {Variant(32767.5), 32768, kErrOverflow, 0},  // rounds to 32768, one past Integer
      {Variant(40000.0), 40000, kErrOverflow, 0},
      {Variant(3e9), 0, kErrOverflow, kErrOverflow},            // beyond Long
      {Variant(2147483647.5), 0, kErrOverflow, kErrOverflow},   // rounds to 2^31
      {Variant("2147483648"), 0, kErrOverflow, kErrOverflow},   // one past Long
      {Variant("abc"), 0, kErrTypeMismatch, kErrTypeMismatch},  // not a number
      {Variant(""), 0, kErrTypeMismatch, kErrTypeMismatch},     // empty text
      {Variant::Null(), 0, kErrInvalidNull, kErrInvalidNull},   // Null has no value
      {Variant(std::nan("")), 0, kErrOverflow, kErrOverflow},   // NaN cannot be rounded
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.input));
    int64_t i = 0, l = 0;
    EXPECT_EQ(ErrorOf([&] { i = CInt(r.input); }), r.intError);
    EXPECT_EQ(ErrorOf([&] { l = CLng(r.input); }), r.longError);
    if (!r.intError) {
      EXPECT_EQ(i, r.expected);
    }
    if (!r.longError) {
      EXPECT_EQ(l, r.expected);
    }
  }
}

TEST(ConvertTest, CCurRoundsHalfEvenAtTheFourthDecimal) {
  struct Row {
    Variant input;
    int64_t raw;
    int error;
  };
  const Row rows[] = {
      {Variant(1.03125), 10312, 0},
      {Variant(1.09375), 10938, 0},
      {Variant(2.675), 26750, 0},
      {Variant(0.00005), 1, 0},            // the double lies above 5E-05
      {Variant(true), -10000, 0},
      {Variant::Integer(-3), -30000, 0},
      {Variant::Long(100000), 1000000000, 0},
      {Variant("1.00005"), 10000, 0},      // text: an exact tie, to even
      {Variant("1.00015"), 10002, 0},
      {Variant("0.00005"), 0, 0},          // text is exact, unlike the double
      {Variant("922337203685477.5807"), std::numeric_limits<int64_t>::max(), 0},
      {Variant("-922337203685477.5808"), std::numeric_limits<int64_t>::min(), 0},
      {Variant("922337203685477.5808"), 0, kErrOverflow},  // one unit past the maximum
      {Variant(1e15), 0, kErrOverflow},                    // out of range
      {Variant("x"), 0, kErrTypeMismatch},                 // not a number
      {Variant::Null(), 0, kErrInvalidNull},               // Null has no value
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.input));
    int64_t raw = 0;
    EXPECT_EQ(ErrorOf([&] { raw = CCur(r.input).raw(); }), r.error);
    if (!r.error) {
      EXPECT_EQ(raw, r.raw);
    }
  }
}

TEST(ConvertTest, CBoolOfTextAndNumbers) {
  struct Row {
    Variant input;
    bool expected;
    int error;
  };
  const Row rows[] = {
      {Variant("true"), true, 0},
      {Variant("FALSE"), false, 0},
      {Variant(" True "), true, 0},
      {Variant("0"), false, 0},
      {Variant("-1"), true, 0},
      {Variant("0.0"), false, 0},
      {Variant(0.5), true, 0},
      {Variant(Currency::FromRaw(1)), true, 0},
      {Variant(), false, 0},
      {Variant("abc"), false, kErrTypeMismatch},       // neither a word nor a number
      {Variant("yes"), false, kErrTypeMismatch},       // only True/False are words
      {Variant::Null(), false, kErrInvalidNull},       // Null has no truth value
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.input));
    bool out = false;
    EXPECT_EQ(ErrorOf([&] { out = CBool(r.input); }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
  }
}

TEST(ConvertTest, CDateOfNumbersChecksTheRange) {
  struct Row {
    Variant input;
    double serial;
    int error;
  };
  const Row rows[] = {
      {Variant(45292.5), 45292.5, 0},
      {Variant(), 0, 0},
      {Variant(true), -1, 0},
      {Variant::Long(2958465), 2958465, 0},
      {Variant(-657434.0), -657434, 0},
      {Variant(Currency::FromRaw(15000)), 1.5, 0},
      {Variant("45292"), 45292, 0},        // not date text: taken as a serial
      {Variant(1e7), 0, kErrOverflow},     // after 9999-12-31
      {Variant(-657435.0), 0, kErrOverflow},  // before 100-01-01
      {Variant::Null(), 0, kErrInvalidNull},  // Null has no date
      {Variant("xyz"), 0, kErrTypeMismatch},  // neither a date nor a number
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.input));
    double out = 0;
    EXPECT_EQ(ErrorOf([&] { out = CDate(r.input).serial; }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.serial);
    }
  }
}

// ---- Int, Fix, Round, Val -----------------------------------------------------------------------

TEST(ConvertTest, IntFloorsAndFixTruncatesKeepingTheType) {
  struct Row {
    Variant input;
    Variant intResult;
    Variant fixResult;
  };
  const Row rows[] = {
      {Variant(8.7), Variant(8.0), Variant(8.0)},
      {Variant(-8.4), Variant(-9.0), Variant(-8.0)},
      {Variant(-0.5), Variant(-1.0), Variant(-0.0)},
      {Variant(Currency::FromRaw(-15000)), Variant(Currency::FromRaw(-20000)), Variant(Currency::FromRaw(-10000))},
      {Variant(Currency::FromRaw(15000)), Variant(Currency::FromRaw(10000)), Variant(Currency::FromRaw(10000))},
      {Variant::FromDate(45292.75), Variant::FromDate(45292), Variant::FromDate(45292)},
      {Variant::FromDate(-1.25), Variant::FromDate(-2), Variant::FromDate(-1)},
      {Variant::Integer(5), Variant::Integer(5), Variant::Integer(5)},
      {Variant(true), Variant::Integer(-1), Variant::Integer(-1)},
      {Variant(), Variant::Integer(0), Variant::Integer(0)},
      {Variant("2.5"), Variant(2.0), Variant(2.0)},
      {Variant::Null(), Variant::Null(), Variant::Null()},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.input));
    EXPECT_EQ(Int(r.input), r.intResult);
    EXPECT_EQ(Fix(r.input), r.fixResult);
  }
  EXPECT_EQ(CStr(Fix(Variant(-0.5))), "0");
  EXPECT_EQ(ErrorOf([] { Int(Variant("abc")); }), kErrTypeMismatch);
  EXPECT_EQ(ErrorOf([] { Int(Variant(Currency::FromRaw(std::numeric_limits<int64_t>::min()))); }), kErrOverflow);
}

TEST(ConvertTest, RoundScalesInDoubleThenRoundsHalfEven) {
  struct Row {
    double x;
    int decimals;
    double expected;
    int error;
  };
  const Row rows[] = {
      {2.5, 0, 2, 0},
      {3.5, 0, 4, 0},
      {-2.5, 0, -2, 0},
      {0.5, 0, 0, 0},
      {1.5, 0, 2, 0},
      {0.12345, 4, 0.1234, 0},
      {0.12355, 4, 0.1236, 0},
      {0.00005, 4, 0, 0},
      {2.45, 1, 2.4, 0},
      {1.005, 2, 1, 0},
      {2.675, 2, 2.68, 0},
      {4.685, 2, 4.68, 0},
      {2.344 + 2.341, 2, 4.69, 0},
      {-2.675, 2, -2.68, 0},
      {1e300, 2, 1e300, 0},
      {1.5, -1, 0, kErrInvalidCall},  // negative number of decimals
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(testing::Message() << r.x << ", " << r.decimals);
    double out = 0;
    EXPECT_EQ(ErrorOf([&] { out = VbRound(r.x, r.decimals); }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
  }
}

TEST(ConvertTest, ValReadsTheLeadingNumberIgnoringBlanksAndLocale) {
  struct Row {
    const char* input;
    double expected;
    int error;
  };
  const Row rows[] = {
      {"1,5", 1, 0},
      {" 2 45 7", 2457, 0},
      {"24 and 57", 24, 0},
      {"", 0, 0},
      {"abc", 0, 0},
      {"-1.5e2", -150, 0},
      {"1e", 1, 0},
      {".5", 0.5, 0},
      {"1.2.3", 1.2, 0},
      {"&HFF", 255, 0},
      {"&O17x", 15, 0},
      {"\t12\r\n3", 123, 0},
      {"1e999", 0, kErrOverflow},  // too large for a Double
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.input);
    double out = 0;
    EXPECT_EQ(ErrorOf([&] { out = Val(r.input); }), r.error);
    if (!r.error) {
      EXPECT_EQ(out, r.expected);
    }
  }
  ScopedLocale comma(CommaLocale());
  EXPECT_EQ(Val("1,5"), 1);
  EXPECT_EQ(Val("1.5"), 1.5);
}

}  // namespace
}  // namespace xal
