// SQL literals and rounding: date literals with and without time, numbers whose first comma becomes
// a point, quoted text, and rounding through formatting in both decimal-separator locales, with
// positive, zero and negative positions; values that cannot convert fail with error 13.
#include <gtest/gtest.h>

#include "error_of.h"

#include <functional>

#include "runtime/dates.h"
#include "runtime/locale.h"
#include "server/sql_utils.h"

namespace xal::server {
namespace {

using ::xal::test::ErrorOf;

RuntimeLocale CommaLocale() {
  RuntimeLocale l;
  l.decimal = ",";
  l.thousands = "\u00A0";
  l.dateOrder = DateOrder::DayMonthYear;
  return l;
}

Variant At(int y, int mo, int d, int h = 0, int mi = 0, int s = 0) {
  return Variant(MakeDate(DateParts{y, mo, d, h, mi, s}));
}

TEST(SQLDate, MonthDayYearWithoutLeadingZeros) {
  struct Row {
    Variant date;
    bool withTime;
    const char* expected;
  } rows[] = {
      {At(2009, 12, 31, 23, 5, 9), true, "#12/31/2009 23:5:9#"},
      {At(2009, 12, 31, 23, 5, 9), false, "#12/31/2009#"},
      {At(2009, 3, 5), false, "#3/5/2009#"},
      {At(2009, 3, 5, 14, 7, 0), true, "#3/5/2009 14:7:0#"},
      {At(2009, 3, 5), true, "#3/5/2009 0:0:0#"},           // midnight still writes its time
      {At(1899, 12, 30), false, "#12/30/1899#"},            // serial 0
      {Variant(39877.5), true, "#3/5/2009 12:0:0#"},         // a number is a date serial
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(SQLDate(r.date, r.withTime), r.expected);
  }
}

TEST(SQLDate, NonDatesFail) {
  EXPECT_EQ(ErrorOf([] { SQLDate(Variant("not a date")); }), kErrTypeMismatch);  // text that is no date
  EXPECT_EQ(ErrorOf([] { SQLDate(Variant::Null()); }), kErrInvalidNull);         // Null cannot convert
}

TEST(SQLDouble, FirstCommaBecomesAPoint) {
  struct Row {
    Variant number;
    bool commaLocale;
    const char* expected;
  } rows[] = {
      {Variant("1,234,5"), false, "1.234,5"},  // only the first comma changes
      {Variant(12.5), true, "12.5"},
      {Variant(12.5), false, "12.5"},
      {Variant(-0.25), true, "-0.25"},
      {Variant(int32_t{1234567}), true, "1234567"},
      {Variant(Currency::FromDouble(12.34)), true, "12.34"},
      {Variant("abc"), false, "abc"},          // text without a comma is returned unchanged
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expected);
    if (r.commaLocale) {
      ScopedLocale comma(CommaLocale());
      EXPECT_EQ(SQLDouble(r.number), r.expected);
    } else {
      EXPECT_EQ(SQLDouble(r.number), r.expected);
    }
  }
}

TEST(SQLText, QuotesAreDoubled) {
  struct Row {
    const char* text;
    const char* expected;
  } rows[] = {
      {"ACME", "'ACME'"},
      {"O'Brien", "'O''Brien'"},
      {"''", "''''''"},
      {"", "''"},
      {"x') OR ('1'='1", "'x'') OR (''1''=''1'"},  // an attempt to end the literal stays inside it
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.text);
    EXPECT_EQ(SQLText(r.text), r.expected);
  }
}

struct RoundRow {
  Variant value;
  int16_t pos;
  const char* expected;
};

TEST(Round, PointLocale) {
  const RoundRow rows[] = {
      {Variant(2.5), 0, "3"},
      {Variant(-2.5), 0, "-3"},          // half away from zero, not to even
      {Variant(3.5), 0, "4"},
      {Variant(1234.5), 0, "1235"},
      {Variant(1234.5), -2, "1200"},
      {Variant(1250.0), -2, "1300"},
      {Variant(-1250.0), -2, "-1300"},
      {Variant(1234.0), -1, "1230"},
      {Variant(1235.0), -1, "1240"},
      {Variant(int32_t{3}), 2, "3.00"},
      {Variant(2.345), 2, "2.35"},       // rounds on the decimal digits, not the binary value
      {Variant(1.005), 2, "1.01"},
      {Variant(-1.005), 2, "-1.01"},
      {Variant(0.5), 1, "0.5"},
      {Variant(0.04), 1, "0.0"},
      {Variant(Currency::FromDouble(12.3456)), 3, "12.346"},
      {Variant("7.25"), 1, "7.3"},       // numeric text is parsed first
      {Variant(-0.4), 0, "0"},
  };
  for (const RoundRow& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(Round(r.value, r.pos), Variant(r.expected));
  }
}

TEST(Round, CommaLocale) {
  ScopedLocale comma(CommaLocale());
  const RoundRow rows[] = {
      {Variant(int32_t{3}), 2, "3,00"},
      {Variant(2.345), 2, "2,35"},
      {Variant(1234.5), 0, "1235"},
      {Variant(1234.5), -2, "1200"},
      {Variant("2,5"), 0, "3"},          // text in the locale's own notation
      {Variant(12.25), 1, "12,3"},
  };
  for (const RoundRow& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(Round(r.value, r.pos), Variant(r.expected));
  }
}

TEST(Round, NonNumbersFail) {
  EXPECT_EQ(ErrorOf([] { Round(Variant("abc"), 0); }), kErrTypeMismatch);  // no number below the text
  EXPECT_EQ(ErrorOf([] { Round(Variant("abc"), 2); }), kErrTypeMismatch);  // formatting would pass it through
  EXPECT_EQ(ErrorOf([] { Round(Variant::Null(), 2); }), kErrInvalidNull);
  EXPECT_EQ(ErrorOf([] { Round(Variant::Null(), -1); }), kErrInvalidNull);  // Null cannot be scaled
}

}  // namespace
}  // namespace xal::server
