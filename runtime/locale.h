// The host locale as far as the runtime needs it: the decimal and thousands separators that number
// parsing and formatting use, the short-date order, and the words for True and False in implicit
// conversions. It is per thread (each thread is its own apartment), "." by default.
#pragma once

#include <string>
#include <string_view>

namespace xal {

enum class DateOrder {
  MonthDayYear,  // en-US: 12/30/1900, 12-hour time with AM/PM
  DayMonthYear,  // Estonian style: 30.12.1900, 24-hour time
  YearMonthDay,  // Lithuanian style: 1900-12-30, 24-hour time
};

struct RuntimeLocale {
  std::string decimal = ".";
  std::string thousands = ",";
  DateOrder dateOrder = DateOrder::MonthDayYear;
  std::string trueWord = "True";
  std::string falseWord = "False";
  // The alphabet of Text comparisons ("" language-neutral, "et" Estonian: z < t, ä after õ).
  std::string collation;
};

const RuntimeLocale& CurrentLocale();
void SetLocale(const RuntimeLocale& locale);
// Sets the decimal separator; "," also makes the thousands separator a no-break space (as the
// Estonian locale has it), "." makes it ",".
void SetDecimalSeparator(std::string_view sep);

// Restores the previous locale when it goes out of scope (tests, temporary switches).
class ScopedLocale {
 public:
  explicit ScopedLocale(const RuntimeLocale& locale) : saved_(CurrentLocale()) { SetLocale(locale); }
  ~ScopedLocale() { SetLocale(saved_); }
  ScopedLocale(const ScopedLocale&) = delete;
  ScopedLocale& operator=(const ScopedLocale&) = delete;

 private:
  RuntimeLocale saved_;
};

}  // namespace xal
