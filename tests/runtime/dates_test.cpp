// Tests of date serials and the calendar: splitting serials (including those before 1899-12-30,
// whose time counts forwards), Weekday, DateSerial roll-over, DateAdd's month-end clamping,
// DateDiff boundaries, and date text and parsing under the three date orders.
#include <gtest/gtest.h>

#include "error_of.h"

#include <cmath>
#include <functional>
#include <string>

#include "runtime/dates.h"
#include "runtime/error.h"
#include "runtime/locale.h"

namespace xal {
namespace {

using ::xal::test::ErrorOf;

RuntimeLocale WithOrder(DateOrder order) {
  RuntimeLocale l;
  l.dateOrder = order;
  return l;
}

std::string PartsText(const DateParts& p) {
  char buf[64];
  std::snprintf(buf, sizeof buf, "%04d-%02d-%02d %02d:%02d:%02d", p.year, p.month, p.day, p.hour, p.minute,
                p.second);
  return buf;
}

TEST(DatesSplit, SerialsOnBothSidesOfDayZero) {
  struct Row {
    double serial;
    std::string parts;
  } rows[] = {
      {0, "1899-12-30 00:00:00"},
      {1, "1899-12-31 00:00:00"},
      {2, "1900-01-01 00:00:00"},
      {60, "1900-02-28 00:00:00"},  // no 1900 leap day
      {61, "1900-03-01 00:00:00"},
      {2.5, "1900-01-01 12:00:00"},
      {365.25, "1900-12-30 06:00:00"},
      {45292, "2024-01-01 00:00:00"},
      {45351.75, "2024-02-29 18:00:00"},
      {36526, "2000-01-01 00:00:00"},
      {-1, "1899-12-29 00:00:00"},
      {-1.25, "1899-12-29 06:00:00"},  // day counts back, time forwards
      {-1.5, "1899-12-29 12:00:00"},
      {-2.5, "1899-12-28 12:00:00"},
      {-0.5, "1899-12-30 12:00:00"},
      {-49192.24, "1765-04-24 05:45:36"},
      {-657434, "0100-01-01 00:00:00"},
      {2958465, "9999-12-31 00:00:00"},
      {2958465.9999999, "9999-12-31 23:59:59"},  // rounding must not reach year 10000
      {0.99999999, "1899-12-31 00:00:00"},       // rounds up to the next midnight
      {-1.99999999, "1899-12-30 00:00:00"},      // 23:59:59.999 of Dec 29 is midnight of Dec 30
      {45292 + 1.0 / 86400 * 0.49, "2024-01-01 00:00:00"},
      {45292 + 1.0 / 86400 * 0.51, "2024-01-01 00:00:01"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.serial);
    EXPECT_EQ(PartsText(SplitDate(Date(r.serial))), r.parts);
  }
}

TEST(DatesSplit, OutOfRangeSerialsOverflow) {
  const double bad[] = {
      -657435,          // the day before 100-01-01
      2958466,          // the day after 9999-12-31
      1e7,              // far out
      std::nan(""),     // not a number at all
  };
  for (double s : bad) {
    SCOPED_TRACE(s);
    EXPECT_EQ(ErrorOf([&] { SplitDate(Date(s)); }), kErrOverflow);
  }
}

TEST(DatesParts, AccessorsAgreeWithSplit) {
  struct Row {
    double serial;
    int year, month, day, hour, minute, second;
  } rows[] = {
      {0, 1899, 12, 30, 0, 0, 0},
      {-49192.24, 1765, 4, 24, 5, 45, 36},
      {45351.75, 2024, 2, 29, 18, 0, 0},
      {-2.5, 1899, 12, 28, 12, 0, 0},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.serial);
    Date d(r.serial);
    EXPECT_EQ(Year(d), r.year);
    EXPECT_EQ(Month(d), r.month);
    EXPECT_EQ(Day(d), r.day);
    EXPECT_EQ(Hour(d), r.hour);
    EXPECT_EQ(Minute(d), r.minute);
    EXPECT_EQ(Second(d), r.second);
  }
}

TEST(DatesMake, BuildsSerialsWithoutRollOver) {
  struct Row {
    DateParts parts;
    double serial;
    int error;
  } rows[] = {
      {{2024, 2, 29, 18, 0, 0}, 45351.75, 0},
      {{1899, 12, 29, 6, 0, 0}, -1.25, 0},
      {{1899, 12, 30, 12, 0, 0}, 0.5, 0},
      {{100, 1, 1, 0, 0, 0}, -657434, 0},
      {{2023, 2, 29, 0, 0, 0}, 0, kErrInvalidCall},  // bad: 2023 is not a leap year
      {{2024, 13, 1, 0, 0, 0}, 0, kErrInvalidCall},  // bad: month 13
      {{2024, 1, 1, 24, 0, 0}, 0, kErrInvalidCall},  // bad: hour 24
      {{99, 1, 1, 0, 0, 0}, 0, kErrInvalidCall},     // bad: before the year 100
      {{2024, 1, 0, 0, 0, 0}, 0, kErrInvalidCall},   // bad: day 0 (no roll-over here)
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(PartsText(r.parts));
    Date got;
    int err = ErrorOf([&] { got = MakeDate(r.parts); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_DOUBLE_EQ(got.serial, r.serial);
    }
  }
}

TEST(DatesWeekday, SundayFirstAndMondayFirst) {
  struct Row {
    double serial;
    int sundayFirst, mondayFirst;
  } rows[] = {
      {0, 7, 6},
      {-1, 6, 5},
      {-1.5, 6, 5},
      {-2.5, 5, 4},
      {2.5, 2, 1},
      {45292, 2, 1},
      {45351.75, 5, 4},
      {1, 1, 7},  // 1899-12-31 was a Sunday
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.serial);
    EXPECT_EQ(Weekday(Date(r.serial)), r.sundayFirst);
    EXPECT_EQ(Weekday(Date(r.serial), 0), r.sundayFirst);  // the system's first day is Sunday
    EXPECT_EQ(Weekday(Date(r.serial), 2), r.mondayFirst);
  }
  EXPECT_EQ(Weekday(Date(0), 7), 1);                                 // Saturday-first week
  EXPECT_EQ(ErrorOf([] { Weekday(Date(0), 8); }), kErrInvalidCall);  // no eighth weekday
}

TEST(DatesSerial, RollsOverOutOfRangeParts) {
  struct Row {
    int year, month, day;
    double serial;
    int error;
  } rows[] = {
      {2024, 2, 30, 45352, 0},  // 2024-03-01
      {2024, 1, 0, 45291, 0},   // 2023-12-31
      {2024, 14, 1, 45689, 0},  // 2025-02-01
      {2024, 0, 1, 45261, 0},   // 2023-12-01
      {1899, 12, 30, 0, 0},
      {24, 1, 1, 45292, 0},     // two-digit year 24 is 2024
      {29, 12, 31, 47483, 0},   // 29 is still 2029
      {30, 1, 1, 10959, 0},     // 30 is 1930
      {99, 1, 1, 36161, 0},
      {1900, 1, -2, -1, 0},     // day counted back past the epoch: 1899-12-29
      {10000, 1, 1, 0, kErrInvalidCall},    // bad: beyond 9999-12-31
      {9999, 12, 32, 0, kErrInvalidCall},   // bad: rolls past 9999-12-31
      {-1, 1, 1, 0, kErrInvalidCall},       // bad: negative year is before the year 100
      {2024, 40000, 1, 0, kErrInvalidCall}, // bad: argument outside the 16-bit range
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::to_string(r.year) + "," + std::to_string(r.month) + "," + std::to_string(r.day));
    Date got;
    int err = ErrorOf([&] { got = DateSerial(r.year, r.month, r.day); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got.serial, r.serial);
    }
  }
}

TEST(DatesTimeSerial, SecondsIntoTheDay) {
  struct Row {
    int h, m, s;
    std::string parts;
  } rows[] = {
      {6, 0, 0, "1899-12-30 06:00:00"},
      {0, 90, 0, "1899-12-30 01:30:00"},
      {25, 0, 0, "1899-12-31 01:00:00"},
      {-1, 0, 0, "1899-12-29 23:00:00"},
      {0, 0, 59, "1899-12-30 00:00:59"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.parts);
    EXPECT_EQ(PartsText(SplitDate(Date(TimeSerial(r.h, r.m, r.s)))), r.parts);
  }
  EXPECT_DOUBLE_EQ(TimeSerial(6, 0, 0), 0.25);
}

TEST(DatesAdd, IntervalsAndMonthEndClamping) {
  struct Row {
    std::string interval;
    double number;
    std::string from, to;
    int error;
  } rows[] = {
      {"m", 1, "2024-01-31", "2024-02-29", 0},
      {"m", 1, "2023-01-31", "2023-02-28", 0},
      {"yyyy", 1, "2024-02-29", "2025-02-28", 0},
      {"m", -1, "2024-03-31", "2024-02-29", 0},
      {"q", 1, "2024-11-30", "2025-02-28", 0},
      {"m", 13, "2024-01-15T08:30:00", "2025-02-15T08:30:00", 0},
      {"d", 1, "2024-02-28T10:30:00", "2024-02-29T10:30:00", 0},
      {"y", 1, "2024-12-31", "2025-01-01", 0},
      {"w", 1, "2024-01-01", "2024-01-02", 0},
      {"d", -1, "2024-03-01", "2024-02-29", 0},
      {"ww", 2, "2024-01-01", "2024-01-15", 0},
      {"h", 25, "2024-01-01", "2024-01-02T01:00:00", 0},
      {"n", -1, "2024-01-01", "2023-12-31T23:59:00", 0},
      {"s", 86401, "2024-01-01", "2024-01-02T00:00:01", 0},
      {"d", 1.9, "2024-01-01", "2024-01-02", 0},  // the count is truncated
      {"D", 1, "2024-01-01", "2024-01-02", 0},    // interval letters ignore case
      {"x", 1, "2024-01-01", "", kErrInvalidCall},     // bad: unknown interval
      {"yyyy", 1, "9999-01-01", "", kErrInvalidCall},  // bad: result after 9999-12-31
      {"d", -1, "0100-01-01", "", kErrInvalidCall},    // bad: result before 100-01-01
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.interval + " " + std::to_string(r.number) + " " + r.from);
    std::string got;
    int err = ErrorOf([&] { got = DateToIso(DateAdd(r.interval, r.number, ParseDate(r.from))); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.to);
    }
  }
}

TEST(DatesAdd, NegativeSerialComesBackNormalised) {
  EXPECT_DOUBLE_EQ(DateAdd("d", 1, Date(-1.25)).serial, 0.25);    // 1899-12-30 06:00
  EXPECT_DOUBLE_EQ(DateAdd("d", -1, Date(0.25)).serial, -1.25);   // 1899-12-29 06:00
  EXPECT_DOUBLE_EQ(DateAdd("h", -12, Date(0.25)).serial, -1.75);  // 1899-12-29 18:00
}

TEST(DatesDiff, CountsBoundariesCrossed) {
  struct Row {
    std::string interval, from, to;
    int32_t expected;
    int error;
  } rows[] = {
      {"d", "2024-01-01", "2024-03-01", 60, 0},
      {"d", "2024-03-01", "2024-01-01", -60, 0},
      {"d", "2024-01-01T23:00", "2024-01-02T01:00", 1, 0},
      {"m", "2024-01-31", "2024-02-01", 1, 0},
      {"yyyy", "2023-12-31", "2024-01-01", 1, 0},
      {"q", "2024-03-31", "2024-04-01", 1, 0},
      {"ww", "2024-01-06", "2024-01-07", 1, 0},  // Saturday to Sunday
      {"ww", "2024-01-07", "2024-01-13", 0, 0},  // within one Sunday-first week
      {"w", "2024-01-01", "2024-01-14", 1, 0},
      {"w", "2024-01-01", "2024-01-15", 2, 0},
      {"h", "2024-01-01T10:59:00", "2024-01-01T11:00:00", 1, 0},
      {"n", "2024-01-01T10:59:59", "2024-01-01T11:00:00", 1, 0},
      {"s", "2024-01-01", "2024-01-02", 86400, 0},
      {"zz", "2024-01-01", "2024-01-02", 0, kErrInvalidCall},  // bad: unknown interval
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.interval + " " + r.from + " " + r.to);
    int32_t got = 0;
    int err = ErrorOf([&] { got = DateDiff(r.interval, ParseDate(r.from), ParseDate(r.to)); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
  EXPECT_EQ(DateDiff("h", Date(-1.25), Date(0.25)), 24);  // across day zero, time counted forwards
}

TEST(DatesText, ThreeDateOrders) {
  struct Row {
    double serial;
    std::string mdy, dmy, ymd;
  } rows[] = {
      {0, "12:00:00 AM", "0:00:00", "0:00:00"},
      {0.5, "12:00:00 PM", "12:00:00", "12:00:00"},
      {-0.5, "12:00:00 PM", "12:00:00", "12:00:00"},  // the same moment as +0.5
      {365, "12/30/1900", "30.12.1900", "1900-12-30"},
      {365.25, "12/30/1900 6:00:00 AM", "30.12.1900 6:00:00", "1900-12-30 6:00:00"},
      {-49192.24, "4/24/1765 5:45:36 AM", "24.04.1765 5:45:36", "1765-04-24 5:45:36"},
      {45351.75, "2/29/2024 6:00:00 PM", "29.02.2024 18:00:00", "2024-02-29 18:00:00"},
      {-1, "12/29/1899", "29.12.1899", "1899-12-29"},
      {-1.25, "12/29/1899 6:00:00 AM", "29.12.1899 6:00:00", "1899-12-29 6:00:00"},
      {-1.5, "12/29/1899 12:00:00 PM", "29.12.1899 12:00:00", "1899-12-29 12:00:00"},
      {-2.5, "12/28/1899 12:00:00 PM", "28.12.1899 12:00:00", "1899-12-28 12:00:00"},
      {45292 + 13.0 / 24 + 5.0 / 1440, "1/1/2024 1:05:00 PM", "01.01.2024 13:05:00", "2024-01-01 13:05:00"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.serial);
    {
      ScopedLocale l(WithOrder(DateOrder::MonthDayYear));
      EXPECT_EQ(DateToString(Date(r.serial)), r.mdy);
    }
    {
      ScopedLocale l(WithOrder(DateOrder::DayMonthYear));
      EXPECT_EQ(DateToString(Date(r.serial)), r.dmy);
    }
    {
      ScopedLocale l(WithOrder(DateOrder::YearMonthDay));
      EXPECT_EQ(DateToString(Date(r.serial)), r.ymd);
    }
  }
}

TEST(DatesText, IsoForm) {
  struct Row {
    double serial;
    std::string iso;
  } rows[] = {
      {0, "1899-12-30"},
      {365.25, "1900-12-30T06:00:00"},
      {-1.25, "1899-12-29T06:00:00"},
      {45351.75, "2024-02-29T18:00:00"},
      {-657434, "0100-01-01"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.serial);
    EXPECT_EQ(DateToIso(Date(r.serial)), r.iso);
  }
}

TEST(DatesParse, IsoLocaleAndTimeForms) {
  const double d2009 = 39877;  // 2009-03-05
  const double t1407 = (14 * 60 + 7) / 1440.0;
  struct Row {
    std::string text;
    DateOrder order;
    double serial;
    int error;
  } rows[] = {
      {"2009-03-05", DateOrder::MonthDayYear, d2009, 0},
      {"2009-03-05", DateOrder::DayMonthYear, d2009, 0},
      {"2009-03-05 14:07", DateOrder::MonthDayYear, d2009 + t1407, 0},
      {"2009-03-05T14:07:00", DateOrder::DayMonthYear, d2009 + t1407, 0},
      {" 2009-03-05 ", DateOrder::MonthDayYear, d2009, 0},
      {"3/5/2009", DateOrder::MonthDayYear, d2009, 0},
      {"3/5/2009 2:07 PM", DateOrder::MonthDayYear, d2009 + t1407, 0},
      {"3/5/2009 2:07:00 pm", DateOrder::MonthDayYear, d2009 + t1407, 0},
      {"03/05/2009 14:07:00", DateOrder::MonthDayYear, d2009 + t1407, 0},
      {"3/5/09", DateOrder::MonthDayYear, d2009, 0},
      {"1/1/30", DateOrder::MonthDayYear, 10959, 0},
      {"05.03.2009", DateOrder::DayMonthYear, d2009, 0},
      {"5.3.2009 14:07", DateOrder::DayMonthYear, d2009 + t1407, 0},
      {"30.12.1899", DateOrder::DayMonthYear, 0, 0},
      {"2009-3-5", DateOrder::YearMonthDay, d2009, 0},
      {"12:00:00 AM", DateOrder::MonthDayYear, 0, 0},
      {"6:00 AM", DateOrder::MonthDayYear, 0.25, 0},
      {"12:00 PM", DateOrder::MonthDayYear, 0.5, 0},
      {"18:00", DateOrder::DayMonthYear, 0.75, 0},
      {"12/29/1899 6:00:00 AM", DateOrder::MonthDayYear, -1.25, 0},
      {"xyz", DateOrder::MonthDayYear, 0, kErrTypeMismatch},               // bad: not a date
      {"", DateOrder::MonthDayYear, 0, kErrTypeMismatch},                  // bad: empty text
      {"2009-13-01", DateOrder::MonthDayYear, 0, kErrTypeMismatch},        // bad: month 13
      {"2009-02-29", DateOrder::MonthDayYear, 0, kErrTypeMismatch},        // bad: 2009 is not a leap year
      {"3/5/2009", DateOrder::DayMonthYear, 0, kErrTypeMismatch},          // bad: wrong separator for the order
      {"05.03.2009", DateOrder::MonthDayYear, 0, kErrTypeMismatch},        // bad: wrong separator for the order
      {"3/5/2009", DateOrder::YearMonthDay, 0, kErrTypeMismatch},          // bad: year-first locale
      {"25:00", DateOrder::DayMonthYear, 0, kErrTypeMismatch},             // bad: hour 25
      {"13:00 PM", DateOrder::MonthDayYear, 0, kErrTypeMismatch},          // bad: 12-hour clock past 12
      {"2009-03-05 14:07 x", DateOrder::MonthDayYear, 0, kErrTypeMismatch},// bad: trailing junk
      {"2009-03-05 14", DateOrder::MonthDayYear, 0, kErrTypeMismatch},     // bad: hour without minutes
      {"12345-01-01", DateOrder::MonthDayYear, 0, kErrTypeMismatch},       // bad: five-digit year
      {"0050-01-01", DateOrder::MonthDayYear, 0, kErrOverflow},            // bad: before the year 100
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.text);
    ScopedLocale l(WithOrder(r.order));
    Date got;
    int err = ErrorOf([&] { got = ParseDate(r.text); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_NEAR(got.serial, r.serial, 1e-9);
    }
  }
}

TEST(DatesParse, TextRoundTripsInEveryOrder) {
  const double serials[] = {0, 0.25, 365.25, -1.25, -2.5, -49192.24, 45351.75, 2958465.5, -657434};
  for (DateOrder order : {DateOrder::MonthDayYear, DateOrder::DayMonthYear, DateOrder::YearMonthDay}) {
    ScopedLocale l(WithOrder(order));
    for (double s : serials) {
      SCOPED_TRACE(DateToString(Date(s)));
      Date back = ParseDate(DateToString(Date(s)));
      EXPECT_EQ(PartsText(SplitDate(back)), PartsText(SplitDate(Date(s))));
      EXPECT_EQ(ParseDate(DateToIso(Date(s))), back);
    }
  }
}

TEST(DatesClock, TodayIsMidnightOfNow) {
  Date before = Today();
  Date now = Now();
  Date after = Today();
  EXPECT_EQ(before.serial, std::trunc(before.serial));
  EXPECT_LE(before.serial, now.serial);
  EXPECT_LT(now.serial, after.serial + 1);
  EXPECT_GE(Year(now), 2024);
}

}  // namespace
}  // namespace xal
