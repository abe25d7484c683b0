// Tests of Format(value, pattern): half-away-from-zero rounding on the 15-digit text of the value,
// placeholders, grouping, exponents, sections, the named formats, the locale's separators, and
// date patterns. Printed amounts in documents are compared with these texts character for character.
#include <gtest/gtest.h>

#include "error_of.h"

#include <functional>

#include "runtime/convert.h"
#include "runtime/format.h"
#include "runtime/locale.h"

namespace xal {
namespace {

using ::xal::test::ErrorOf;

struct Row {
  Variant value;
  const char* pattern;
  const char* expected;
};

void CheckRows(const Row* begin, const Row* end) {
  for (const Row* r = begin; r != end; ++r) {
    SCOPED_TRACE(testing::Message() << DebugString(r->value) << " with \"" << r->pattern << "\"");
    EXPECT_EQ(Format(r->value, r->pattern), r->expected);
  }
}

TEST(FormatTest, RoundsHalfAwayFromZeroOnTheFifteenDigitText) {
  const Row rows[] = {
      {Variant(2.675), "0.00", "2.68"},
      {Variant(-2.675), "0.00", "-2.68"},
      {Variant(1.005), "0.00", "1.01"},
      {Variant(0.125), "0.00", "0.13"},
      {Variant(1234.5), "0", "1235"},
      {Variant(2.5), "0", "3"},
      {Variant(-2.5), "0", "-3"},
      {Variant(0.9125), "0.000", "0.913"},
      {Variant(39.995), "0.00", "40.00"},
      {Variant(9.9999999), "#0.000000", "10.000000"},
      {Variant(0.6), "0", "1"},
      {Variant(0.4999), "0", "0"},
      {Variant(1e20), "0.00", "100000000000000000000.00"},
      {Variant(123456789012345678.0), "0", "123456789012346000"},
      {Variant(0.1 + 0.2), "0.00000000000000000", "0.30000000000000000"},
      {Variant(0.000015), "0.00000", "0.00002"},
      {Variant(5.6789e-12), "0.00", "0.00"},
      {Variant(Currency::FromRaw(26750)), "0.00", "2.68"},
      {Variant(Currency::FromRaw(-5)), "0.000", "-0.001"},
  };
  CheckRows(std::begin(rows), std::end(rows));
}

TEST(FormatTest, PlaceholdersSignAndPoint) {
  const Row rows[] = {
      {Variant(12.5), ".00", "12.50"},
      {Variant(0.5), ".00", ".50"},
      {Variant(-0.001), "0.00", "-0.00"},   // the text was negative
      {Variant(-0.4), "0", "-0"},
      {Variant(-0.0), "0.00", "0.00"},      // negative zero prints as 0
      {Variant(0.0049), "#.##", "."},
      {Variant(5.0), "#.##", "5."},
      {Variant(1.5), "0.0#", "1.5"},
      {Variant(1.25), "0.0#", "1.25"},
      {Variant::Integer(5), "000", "005"},
      {Variant::Long(1234567), "#,##0", "1,234,567"},
      {Variant(0.0), "#,##0", "0"},
      {Variant(1234.5), "#,##0.00", "1,234.50"},
      {Variant(-1234567.891), "#,##0.00", "-1,234,567.89"},
      {Variant(123.0), "#,##0", "123"},
      {Variant(1234567.0), "0,", "1235"},       // a trailing comma scales by a thousand
      {Variant(0.125), "0.0%", "12.5%"},
      {Variant(1.5), "\"$\"0.00", "$1.50"},
      {Variant(7.0), "\\#0", "#7"},
      {Variant(123456789.0), "000-00-0000", "123-45-6789"},
      {Variant(1234567.0), "000-00-0000", "001-23-4567"},
      {Variant(1234567.0), "00-00", "12345-67"},
  };
  CheckRows(std::begin(rows), std::end(rows));
}

TEST(FormatTest, ExponentPatterns) {
  const Row rows[] = {
      {Variant(1.73245), "0.0000E+000", "1.7325E+000"},
      {Variant(12345.0), "0.00E+00", "1.23E+04"},
      {Variant(0.000123), "0.00E-00", "1.23E-04"},
      {Variant(12345.0), "0.00E-00", "1.23E04"},
      {Variant(9.996), "0.00E+00", "1.00E+01"},   // the carry moves the exponent
      {Variant(-12345.0), "0.0e+0", "-1.2e+4"},
      {Variant(0.0), "0.00E+00", "0.00E+00"},
  };
  CheckRows(std::begin(rows), std::end(rows));
}

TEST(FormatTest, SectionsNamedFormatsAndSpecialValues) {
  const Row rows[] = {
      {Variant(5.0), "0;(0)", "5"},
      {Variant(-5.0), "0;(0)", "(5)"},
      {Variant(0.0), "0;(0);\"zero\"", "zero"},
      {Variant(-5.0), "0;;\"zero\"", "-5"},         // an empty negative section uses the first
      {Variant(1234.567), "Fixed", "1234.57"},
      {Variant(1234567.891), "Standard", "1,234,567.89"},
      {Variant(0.125), "Percent", "12.50%"},
      {Variant(12345.0), "Scientific", "1.23E+04"},
      {Variant(0.1 + 0.2), "General Number", "0.3"},
      {Variant(0.0), "Yes/No", "No"},
      {Variant(2.0), "On/Off", "On"},
      {Variant(0.1 + 0.2), "", "0.3"},
      {Variant(), "0.00", "0.00"},
      {Variant::Null(), "0.00", ""},
      {Variant::Null(), "0;0;0;\"n/a\"", "n/a"},
      {Variant(), "", ""},
      {Variant("abc"), "0.00", "abc"},              // text that is not a number stays as it is
      {Variant("2.675"), "0.00", "2.68"},
      {Variant("1,234.5"), "0.0", "1234.5"},
      {Variant(true), "0", "-1"},
      {Variant::FromDate(45292.5), "0.0", "45292.5"},
  };
  CheckRows(std::begin(rows), std::end(rows));
  EXPECT_EQ(ErrorOf([] { Format(Variant(SafeArray()), "0"); }), kErrTypeMismatch);  // arrays have no value
}

TEST(FormatTest, CommaLocaleSeparators) {
  ScopedLocale comma(RuntimeLocale{",", "\u00A0", DateOrder::DayMonthYear, "Tõene", "Väär"});
  const Row rows[] = {
      {Variant(2.675), "0.00", "2,68"},
      {Variant(1234.5), "#,##0.00", "1\u00A0234,50"},
      {Variant("1,5"), "0.00", "1,50"},
      {Variant(1.73245), "0.0000E+000", "1,7325E+000"},
      {Variant(45351.75), "dd/mm/yyyy", "29.02.2024"},
  };
  CheckRows(std::begin(rows), std::end(rows));
}

TEST(FormatTest, DatePatterns) {
  const Row rows[] = {
      {Variant::FromDate(45351.75), "yyyy-mm-dd", "2024-02-29"},
      {Variant::FromDate(45351.75), "dd.mm.yyyy", "29.02.2024"},
      {Variant::FromDate(45351.75), "hh:nn:ss", "18:00:00"},
      {Variant::FromDate(45351.75), "hh:mm", "18:00"},           // m after h is minutes
      {Variant::FromDate(45351.75), "h:nn AM/PM", "6:00 PM"},
      {Variant::FromDate(45292.25), "h:nn am/pm", "6:00 am"},
      {Variant::FromDate(45292.0), "d/m/yy", "1/1/24"},
      {Variant::FromDate(45351.75), "mmm d, yyyy", "Feb 29, 2024"},
      {Variant::FromDate(45351.75), "dddd", "Thursday"},
      {Variant::FromDate(45351.75), "\"Q\"q", "Q1"},
      {Variant(45292.0), "yyyy-mm-dd", "2024-01-01"},            // numbers are serials
      {Variant::FromDate(-1.25), "yyyy-mm-dd hh:nn", "1899-12-29 06:00"},
      {Variant("not a date"), "yyyy", "not a date"},
  };
  CheckRows(std::begin(rows), std::end(rows));
}

}  // namespace
}  // namespace xal
