// Date arithmetic and parts: serials <-> calendar dates (proleptic Gregorian, no 1900 leap day),
// DateSerial's roll-over of out-of-range parts, DateAdd, Weekday, and date text in the locale's
// short-date and long-time patterns.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "runtime/date.h"

namespace xal {

struct DateParts {
  int year = 1899, month = 12, day = 30;
  int hour = 0, minute = 0, second = 0;
};

// Splits a serial: day = truncation toward zero, time = |fraction| rounded to the second.
DateParts SplitDate(Date d);
// The serial of a calendar date and time, with no roll-over (error 5 for an invalid day).
Date MakeDate(const DateParts& p);
// DateSerial: months and days outside their range roll over into the next/previous units;
// two-digit years 0-29 mean 2000-2029, 30-99 mean 1930-1999; error 5 outside the date range.
Date DateSerial(int year, int month, int day);
double TimeSerial(int hour, int minute, int second);

int Year(Date d);
int Month(Date d);
int Day(Date d);
int Hour(Date d);
int Minute(Date d);
int Second(Date d);
// Weekday with vbSunday = 1 … vbSaturday = 7; firstDay 1 (Sunday) … 7; 0 means the system's (Sunday).
int Weekday(Date d, int firstDay = 1);

// DateAdd for the intervals "d", "y", "w" (days), "ww" (weeks), "m" (months), "q", "yyyy",
// "h", "n", "s"; months and years clamp to the month's end. Unknown interval: error 5.
Date DateAdd(std::string_view interval, double number, Date d);
// DateDiff for "d", "m", "yyyy", "ww", "h", "n", "s" (calendar boundaries crossed).
int32_t DateDiff(std::string_view interval, Date d1, Date d2);

// Today at midnight, and now, from the local clock.
Date Today();
Date Now();

// CStr of a date: time only when the whole part is 0, date only when the fraction is 0, else both;
// in the locale's patterns (en-US: M/d/yyyy h:mm:ss AM/PM).
std::string DateToString(Date d);
// CDate of text: ISO "yyyy-mm-dd[ hh:mm[:ss]]" or "yyyy-mm-ddThh:mm:ss", the locale's short date
// with an optional time, or a time alone; error 13 when it is not a date.
Date ParseDate(std::string_view text);
// "yyyy-mm-ddThh:mm:ss" (date part only when there is no time), for JSON and logs.
std::string DateToIso(Date d);

}  // namespace xal
