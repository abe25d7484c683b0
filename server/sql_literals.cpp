// SQL literals and rounding through formatting: the helpers every SQL text of the component and
// many amounts go through.
#include <cmath>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/format.h"
#include "runtime/text.h"
#include "server/sql_utils.h"

namespace xal::server {

std::string SQLDate(const Variant& pInDate, bool pWithTime) {
  const DateParts p = SplitDate(CDate(pInDate));
  std::string s = "#" + std::to_string(p.month) + "/" + std::to_string(p.day) + "/" + std::to_string(p.year);
  if (pWithTime)
    s += " " + std::to_string(p.hour) + ":" + std::to_string(p.minute) + ":" + std::to_string(p.second);
  return s + "#";
}

std::string SQLDouble(const Variant& pNum) {
  std::string s = CStr(pNum);
  const size_t comma = s.find(',');
  if (comma != std::string::npos) s[comma] = '.';
  return s;
}

std::string SQLText(std::string_view text) {
  std::string s = "'";
  for (char c : text) {
    if (c == '\'') s += '\'';
    s += c;
  }
  return s + "'";
}

Variant Round(const Variant& pInVal, int16_t pPos) {
  // Format passes text that is not a number through unchanged; a rounding must fail on it (and on
  // Null) as the scaled branch below does, rather than hand back the text as if it were rounded.
  (void)CDbl(pInVal);
  if (pPos >= 1) return Variant(Format(pInVal, "0." + std::string(static_cast<size_t>(pPos), '0')));
  // d = 10^n built by repeated multiplication from 0.1, as the amounts stored so far were.
  const int n = std::abs(static_cast<int>(pPos));
  double d = 0.1;
  for (int i = 0; i <= n; ++i) d *= 10.0;
  const double scaled = CDbl(Variant(Format(Variant(CDbl(pInVal) / d), "0")));
  return Variant(Trim(CStr(Variant(scaled * d))));
}

}  // namespace xal::server
