// Date serials and the calendar: splitting a serial into its parts and back, DateSerial's
// roll-over, DateAdd/DateDiff, Weekday, the local clock, and date text in the three date orders
// the component meets (month/day/year with AM/PM, day.month.year and year-month-day).
// The calendar is proleptic Gregorian throughout, serial 0 being 1899-12-30.
#include "runtime/dates.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <ctime>

#include "runtime/ascii.h"
#include "runtime/error.h"
#include "runtime/locale.h"

namespace xal {

namespace {

// ---------------------------------------------------------------------------------------------
// Calendar arithmetic
// ---------------------------------------------------------------------------------------------

constexpr int64_t kSecondsPerDay = 86400;
constexpr int64_t kDaysPer400Years = 146097;
constexpr int64_t kDaysPer100Years = 36524;
constexpr int64_t kDaysPer4Years = 1461;
constexpr int kDaysBeforeMonth[13] = {0, 31, 59, 90, 120, 151, 181, 212, 243, 273, 304, 334, 365};

constexpr int64_t FloorDiv(int64_t a, int64_t b) { return a / b - ((a % b != 0) && ((a < 0) != (b < 0))); }
constexpr int64_t FloorMod(int64_t a, int64_t b) { return a - FloorDiv(a, b) * b; }

constexpr bool IsLeap(int64_t y) { return (y % 4 == 0 && y % 100 != 0) || y % 400 == 0; }

int DaysInMonth(int64_t y, int m) {
  return kDaysBeforeMonth[m] - kDaysBeforeMonth[m - 1] + (m == 2 && IsLeap(y) ? 1 : 0);
}

// Days from 0001-01-01 to the given date: whole years before it (365 each plus the leap days the
// Gregorian rules give), whole months before it in its year, then the day.
constexpr int64_t DaysFromYearOne(int64_t y, int m, int d) {
  int64_t py = y - 1;
  int64_t days = 365 * py + FloorDiv(py, 4) - FloorDiv(py, 100) + FloorDiv(py, 400);
  days += kDaysBeforeMonth[m - 1] + (m > 2 && IsLeap(y) ? 1 : 0);
  return days + d - 1;
}

constexpr int64_t kEpoch = DaysFromYearOne(1899, 12, 30);

int64_t DayNumber(int64_t y, int m, int d) { return DaysFromYearOne(y, m, d) - kEpoch; }

struct Ymd {
  int64_t y;
  int m, d;
};

// The inverse: peel off 400-year cycles, then centuries, 4-year groups and single years. The last
// century of a cycle and the last year of a group are one day longer, hence the clamps to 3.
Ymd CivilFromDayNumber(int64_t dayNumber) {
  int64_t n = dayNumber + kEpoch;
  int64_t cycles = FloorDiv(n, kDaysPer400Years);
  int64_t r = n - cycles * kDaysPer400Years;
  int64_t centuries = std::min<int64_t>(r / kDaysPer100Years, 3);
  r -= centuries * kDaysPer100Years;
  int64_t groups = r / kDaysPer4Years;
  r -= groups * kDaysPer4Years;
  int64_t years = std::min<int64_t>(r / 365, 3);
  r -= years * 365;
  Ymd out{cycles * 400 + centuries * 100 + groups * 4 + years + 1, 1, 1};
  int leap = IsLeap(out.y) ? 1 : 0;
  while (out.m < 12 && r >= kDaysBeforeMonth[out.m] + (out.m >= 2 ? leap : 0)) ++out.m;
  out.d = static_cast<int>(r - kDaysBeforeMonth[out.m - 1] - (out.m > 2 ? leap : 0)) + 1;
  return out;
}

// The whole day must lie in 100-01-01 … 9999-12-31; any time on those days is fine, including
// the afternoon of 100-01-01, whose serials fall just below the smallest whole serial.
void CheckSerial(double serial) {
  double whole = std::trunc(serial);
  if (!(whole >= kMinDateSerial && whole <= std::trunc(kMaxDateSerial))) Raise(kErrOverflow);
}

// A serial as a calendar day number and seconds into that day, with the seconds rounded; a time
// that rounds up to midnight moves on to the next calendar day.
struct DayTime {
  int64_t day;
  int64_t secs;
};

DayTime SplitSerial(double serial) {
  CheckSerial(serial);
  double whole = std::trunc(serial);
  double frac = std::fabs(serial - whole);  // exact: the whole part is removed without rounding
  DayTime dt{static_cast<int64_t>(whole), static_cast<int64_t>(std::floor(frac * kSecondsPerDay + 0.5))};
  if (dt.secs >= kSecondsPerDay) {
    // Rounding must not carry the last representable day into the year 10000.
    if (double(dt.day) == std::trunc(kMaxDateSerial)) {
      dt.secs = kSecondsPerDay - 1;
    } else {
      dt.secs -= kSecondsPerDay;
      ++dt.day;
    }
  }
  return dt;
}

// Back to a serial. Before 1899-12-30 the day counts backwards while the time still counts
// forwards from midnight, so the time is subtracted there.
double JoinSerial(int64_t day, double secs) {
  double t = secs / kSecondsPerDay;
  return day < 0 ? double(day) - t : double(day) + t;
}

double CheckedSerial(int64_t day, double secs, int32_t err) {
  if (day < kMinDateSerial || day > std::trunc(kMaxDateSerial)) Raise(err);
  return JoinSerial(day, secs);
}

// Seconds on one continuous time line, for DateDiff and the h/n/s intervals of DateAdd.
int64_t Timeline(Date d) {
  DayTime dt = SplitSerial(d.serial);
  return dt.day * kSecondsPerDay + dt.secs;
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// Parts
// ---------------------------------------------------------------------------------------------

DateParts SplitDate(Date d) {
  DayTime dt = SplitSerial(d.serial);
  Ymd ymd = CivilFromDayNumber(dt.day);
  DateParts p;
  p.year = static_cast<int>(ymd.y);
  p.month = ymd.m;
  p.day = ymd.d;
  p.hour = static_cast<int>(dt.secs / 3600);
  p.minute = static_cast<int>(dt.secs / 60 % 60);
  p.second = static_cast<int>(dt.secs % 60);
  return p;
}

Date MakeDate(const DateParts& p) {
  if (p.year < 100 || p.year > 9999 || p.month < 1 || p.month > 12 || p.day < 1 ||
      p.day > DaysInMonth(p.year, p.month) || p.hour < 0 || p.hour > 23 || p.minute < 0 || p.minute > 59 ||
      p.second < 0 || p.second > 59)
    Raise(kErrInvalidCall);
  double secs = p.hour * 3600.0 + p.minute * 60.0 + p.second;
  return Date(JoinSerial(DayNumber(p.year, p.month, p.day), secs));
}

Date DateSerial(int year, int month, int day) {
  for (int v : {year, month, day})
    if (v < -32768 || v > 32767) Raise(kErrInvalidCall);
  if (year >= 0 && year <= 29) year += 2000;
  else if (year >= 30 && year <= 99) year += 1900;
  int64_t months = int64_t(year) * 12 + (month - 1);
  int64_t y = FloorDiv(months, 12);
  int m = static_cast<int>(FloorMod(months, 12)) + 1;
  int64_t dayNumber = DayNumber(y, m, 1) + (day - 1);
  return Date(CheckedSerial(dayNumber, 0, kErrInvalidCall));
}

double TimeSerial(int hour, int minute, int second) {
  int64_t total = int64_t(hour) * 3600 + int64_t(minute) * 60 + second;
  return CheckedSerial(FloorDiv(total, kSecondsPerDay), double(FloorMod(total, kSecondsPerDay)),
                       kErrInvalidCall);
}

int Year(Date d) { return SplitDate(d).year; }
int Month(Date d) { return SplitDate(d).month; }
int Day(Date d) { return SplitDate(d).day; }
int Hour(Date d) { return SplitDate(d).hour; }
int Minute(Date d) { return SplitDate(d).minute; }
int Second(Date d) { return SplitDate(d).second; }

int Weekday(Date d, int firstDay) {
  if (firstDay < 0 || firstDay > 7) Raise(kErrInvalidCall);
  if (firstDay == 0) firstDay = 1;  // the system's first day of the week: Sunday
  // Day 0 (1899-12-30) was a Saturday, day 7 of a Sunday-first week.
  int dow = static_cast<int>(FloorMod(SplitSerial(d.serial).day + 6, 7)) + 1;
  return (dow - firstDay + 7) % 7 + 1;
}

// ---------------------------------------------------------------------------------------------
// DateAdd and DateDiff
// ---------------------------------------------------------------------------------------------

namespace {

enum class Unit { Year, Quarter, Month, Day, Week, WeekOfYear, Hour, Minute, Second };

Unit ParseInterval(std::string_view interval) {
  std::string i = AsciiLower(interval);
  if (i == "yyyy") return Unit::Year;
  if (i == "q") return Unit::Quarter;
  if (i == "m") return Unit::Month;
  if (i == "d" || i == "y") return Unit::Day;
  if (i == "w") return Unit::Week;
  if (i == "ww") return Unit::WeekOfYear;
  if (i == "h") return Unit::Hour;
  if (i == "n") return Unit::Minute;
  if (i == "s") return Unit::Second;
  Raise(kErrInvalidCall);
}

// Months onto a date: the day is clamped to the end of the target month, the time kept.
Date AddMonths(Date d, int64_t months) {
  DayTime dt = SplitSerial(d.serial);
  Ymd ymd = CivilFromDayNumber(dt.day);
  int64_t total = ymd.y * 12 + (ymd.m - 1) + months;
  int64_t y = FloorDiv(total, 12);
  int m = static_cast<int>(FloorMod(total, 12)) + 1;
  if (y < 100 || y > 9999) Raise(kErrInvalidCall);
  int day = std::min(ymd.d, DaysInMonth(y, m));
  return Date(CheckedSerial(DayNumber(y, m, day), double(dt.secs), kErrInvalidCall));
}

Date AddSeconds(Date d, int64_t seconds) {
  int64_t t = Timeline(d) + seconds;
  return Date(CheckedSerial(FloorDiv(t, kSecondsPerDay), double(FloorMod(t, kSecondsPerDay)), kErrInvalidCall));
}

int32_t ToLong(int64_t v) {
  if (v < INT32_MIN || v > INT32_MAX) Raise(kErrOverflow);
  return static_cast<int32_t>(v);
}

}  // namespace

// The number of intervals is truncated toward zero; the result is rebuilt from calendar parts, so
// a date before 1899-12-30 comes back in the normal form (time counted forwards from midnight).
Date DateAdd(std::string_view interval, double number, Date d) {
  Unit unit = ParseInterval(interval);
  if (!std::isfinite(number) || std::fabs(number) > 1e10) Raise(kErrInvalidCall);
  int64_t n = static_cast<int64_t>(std::trunc(number));
  switch (unit) {
    case Unit::Year: return AddMonths(d, n * 12);
    case Unit::Quarter: return AddMonths(d, n * 3);
    case Unit::Month: return AddMonths(d, n);
    case Unit::Day:
    case Unit::Week: return AddSeconds(d, n * kSecondsPerDay);  // "w" (weekday) adds plain days here
    case Unit::WeekOfYear: return AddSeconds(d, n * 7 * kSecondsPerDay);
    case Unit::Hour: return AddSeconds(d, n * 3600);
    case Unit::Minute: return AddSeconds(d, n * 60);
    case Unit::Second: return AddSeconds(d, n);
  }
  Raise(kErrInvalidCall);
}

// Counts the interval boundaries crossed from d1 to d2: "m" counts month changes (Jan 31 to
// Feb 1 is 1), "ww" counts Sundays, "w" whole 7-day spans, "h"/"n"/"s" clock boundaries.
int32_t DateDiff(std::string_view interval, Date d1, Date d2) {
  Unit unit = ParseInterval(interval);
  DayTime a = SplitSerial(d1.serial), b = SplitSerial(d2.serial);
  Ymd ya = CivilFromDayNumber(a.day), yb = CivilFromDayNumber(b.day);
  switch (unit) {
    case Unit::Year: return ToLong(yb.y - ya.y);
    case Unit::Quarter: return ToLong((yb.y * 4 + (yb.m - 1) / 3) - (ya.y * 4 + (ya.m - 1) / 3));
    case Unit::Month: return ToLong((yb.y * 12 + yb.m) - (ya.y * 12 + ya.m));
    case Unit::Day: return ToLong(b.day - a.day);
    case Unit::Week: return ToLong((b.day - a.day) / 7);
    case Unit::WeekOfYear: return ToLong(FloorDiv(b.day - 1, 7) - FloorDiv(a.day - 1, 7));  // day 1 = Sunday
    case Unit::Hour: return ToLong(FloorDiv(Timeline(d2), 3600) - FloorDiv(Timeline(d1), 3600));
    case Unit::Minute: return ToLong(FloorDiv(Timeline(d2), 60) - FloorDiv(Timeline(d1), 60));
    case Unit::Second: return ToLong(Timeline(d2) - Timeline(d1));
  }
  Raise(kErrInvalidCall);
}

// ---------------------------------------------------------------------------------------------
// Clock
// ---------------------------------------------------------------------------------------------

namespace {
std::tm LocalNow() {
  std::time_t t = std::time(nullptr);
  std::tm tm{};
  localtime_r(&t, &tm);
  return tm;
}
}  // namespace

Date Today() {
  std::tm tm = LocalNow();
  return Date(double(DayNumber(tm.tm_year + 1900, tm.tm_mon + 1, tm.tm_mday)));
}

Date Now() {
  std::tm tm = LocalNow();
  double secs = tm.tm_hour * 3600.0 + tm.tm_min * 60.0 + std::min(tm.tm_sec, 59);
  return Date(JoinSerial(DayNumber(tm.tm_year + 1900, tm.tm_mon + 1, tm.tm_mday), secs));
}

// ---------------------------------------------------------------------------------------------
// Date text
// ---------------------------------------------------------------------------------------------

namespace {

std::string DatePartText(const DateParts& p, DateOrder order) {
  char buf[32];
  switch (order) {
    case DateOrder::MonthDayYear: std::snprintf(buf, sizeof buf, "%d/%d/%04d", p.month, p.day, p.year); break;
    case DateOrder::DayMonthYear: std::snprintf(buf, sizeof buf, "%02d.%02d.%04d", p.day, p.month, p.year); break;
    case DateOrder::YearMonthDay: std::snprintf(buf, sizeof buf, "%04d-%02d-%02d", p.year, p.month, p.day); break;
  }
  return buf;
}

// en-US uses a 12-hour clock with AM/PM; the other orders go with a 24-hour clock.
std::string TimePartText(const DateParts& p, DateOrder order) {
  char buf[32];
  if (order == DateOrder::MonthDayYear) {
    int h12 = p.hour % 12 == 0 ? 12 : p.hour % 12;
    std::snprintf(buf, sizeof buf, "%d:%02d:%02d %s", h12, p.minute, p.second, p.hour < 12 ? "AM" : "PM");
  } else {
    std::snprintf(buf, sizeof buf, "%d:%02d:%02d", p.hour, p.minute, p.second);
  }
  return buf;
}

}  // namespace

std::string DateToString(Date d) {
  DateParts p = SplitDate(d);
  DateOrder order = CurrentLocale().dateOrder;
  bool noDate = p.year == 1899 && p.month == 12 && p.day == 30;
  bool noTime = p.hour == 0 && p.minute == 0 && p.second == 0;
  if (noDate) return TimePartText(p, order);
  if (noTime) return DatePartText(p, order);
  return DatePartText(p, order) + " " + TimePartText(p, order);
}

std::string DateToIso(Date d) {
  DateParts p = SplitDate(d);
  char buf[40];
  if (p.hour == 0 && p.minute == 0 && p.second == 0)
    std::snprintf(buf, sizeof buf, "%04d-%02d-%02d", p.year, p.month, p.day);
  else
    std::snprintf(buf, sizeof buf, "%04d-%02d-%02dT%02d:%02d:%02d", p.year, p.month, p.day, p.hour, p.minute,
                  p.second);
  return buf;
}

// ---------------------------------------------------------------------------------------------
// Parsing date text
// ---------------------------------------------------------------------------------------------

namespace {

// A small cursor over ASCII date text; any failure is a type mismatch (the text is not a date).
class DateScanner {
 public:
  explicit DateScanner(std::string_view s) : s_(s) {}

  bool AtEnd() const { return i_ == s_.size(); }
  bool Peek(char c) const { return i_ < s_.size() && s_[i_] == c; }
  bool Eat(char c) {
    if (!Peek(c)) return false;
    ++i_;
    return true;
  }
  void Expect(char c) {
    if (!Eat(c)) Raise(kErrTypeMismatch);
  }
  void SkipBlanks() {
    while (i_ < s_.size() && (s_[i_] == ' ' || s_[i_] == '\t')) ++i_;
  }
  // 1..maxDigits decimal digits; `digits` receives how many there were.
  int Number(int maxDigits, int* digits = nullptr) {
    int v = 0, n = 0;
    while (i_ < s_.size() && s_[i_] >= '0' && s_[i_] <= '9' && n < maxDigits) v = v * 10 + (s_[i_++] - '0'), ++n;
    if (n == 0 || (i_ < s_.size() && s_[i_] >= '0' && s_[i_] <= '9')) Raise(kErrTypeMismatch);
    if (digits) *digits = n;
    return v;
  }
  bool EatWord(std::string_view w) {
    if (s_.size() - i_ < w.size() || AsciiLower(s_.substr(i_, w.size())) != w) return false;
    i_ += w.size();
    return true;
  }
  size_t Pos() const { return i_; }
  void Rewind(size_t pos) { i_ = pos; }

 private:
  std::string_view s_;
  size_t i_ = 0;
};

// "h:mm[:ss][ AM|PM]" -> seconds into the day. With AM/PM the hour must be 1-12.
int64_t ParseTime(DateScanner& sc) {
  int h = sc.Number(2);
  sc.Expect(':');
  int m = sc.Number(2), s = 0;
  if (sc.Eat(':')) s = sc.Number(2);
  sc.SkipBlanks();
  bool am = sc.EatWord("am"), pm = !am && sc.EatWord("pm");
  if (am || pm) {
    if (h < 1 || h > 12) Raise(kErrTypeMismatch);
    h = h % 12 + (pm ? 12 : 0);
  }
  if (h > 23 || m > 59 || s > 59) Raise(kErrTypeMismatch);
  return h * 3600 + m * 60 + s;
}

struct ParsedDay {
  int year, month, day;
};

int WindowYear(int year, int digits) {
  if (digits > 2) return year;
  return year < 30 ? 2000 + year : 1900 + year;
}

// The date part: ISO/year-first "yyyy-m-d", or the locale's order with its separator.
ParsedDay ParseDayPart(DateScanner& sc, DateOrder order) {
  size_t start = sc.Pos();
  int digits = 0;
  int first = sc.Number(4, &digits);
  if (digits == 4 && sc.Eat('-')) {
    int m = sc.Number(2);
    sc.Expect('-');
    return {first, m, sc.Number(2)};
  }
  sc.Rewind(start);
  ParsedDay p{};
  if (order == DateOrder::MonthDayYear) {
    p.month = sc.Number(2);
    sc.Expect('/');
    p.day = sc.Number(2);
    sc.Expect('/');
  } else if (order == DateOrder::DayMonthYear) {
    p.day = sc.Number(2);
    sc.Expect('.');
    p.month = sc.Number(2);
    sc.Expect('.');
  } else {
    Raise(kErrTypeMismatch);  // year-first text was handled above
  }
  int y = sc.Number(4, &digits);
  p.year = WindowYear(y, digits);
  return p;
}

// A time alone has a ':' before any date separator.
bool LooksLikeTimeOnly(std::string_view s) {
  size_t colon = s.find(':');
  return colon != std::string_view::npos && s.substr(0, colon).find_first_of("/.-") == std::string_view::npos;
}

}  // namespace

// Text that is not a date (wrong shape, month 13, 30 February, 24:00) is a type mismatch (13);
// a well-formed date outside the years 100-9999 (e.g. "0050-01-01") is an overflow (6), as for a
// number outside the date range.
Date ParseDate(std::string_view text) {
  DateScanner sc(text);
  sc.SkipBlanks();
  int64_t secs = 0;
  int64_t day = 0;
  if (LooksLikeTimeOnly(text)) {
    secs = ParseTime(sc);
  } else {
    ParsedDay p = ParseDayPart(sc, CurrentLocale().dateOrder);
    if (p.month < 1 || p.month > 12 || p.day < 1 || p.day > DaysInMonth(p.year, p.month)) Raise(kErrTypeMismatch);
    if (p.year < 100 || p.year > 9999) Raise(kErrOverflow);
    day = DayNumber(p.year, p.month, p.day);
    if (sc.Eat('T')) {
      secs = ParseTime(sc);
    } else if (sc.Peek(' ') || sc.Peek('\t')) {
      sc.SkipBlanks();
      if (!sc.AtEnd()) secs = ParseTime(sc);
    }
  }
  sc.SkipBlanks();
  if (!sc.AtEnd()) Raise(kErrTypeMismatch);
  return Date(JoinSerial(day, double(secs)));
}

}  // namespace xal
