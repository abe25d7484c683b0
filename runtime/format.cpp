// Format(value, pattern): the picture formats scripts use to print amounts, quantities and dates
// into documents and reports. Numbers are rounded half away from zero on the 15-digit text CStr
// would show, so "2.675" prints as 2.68 even though the binary value lies just below the tie;
// dates are split into calendar parts and printed token by token.
#include "runtime/format.h"

#include <algorithm>
#include <cmath>
#include <vector>

#include "runtime/ascii.h"
#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/locale.h"

namespace xal {

namespace {

// Up to four sections: positive;negative;zero;null. Further ";" stay in the last one.
struct Sections {
  std::string_view part[4];
  size_t count = 0;
  size_t size() const { return count; }
  std::string_view operator[](size_t i) const { return part[i]; }
};

// Splits a pattern at ";" outside quotes and backslash escapes.
Sections SplitSections(std::string_view pattern) {
  Sections out;
  size_t start = 0;
  bool quoted = false;
  for (size_t i = 0; i < pattern.size(); ++i) {
    char c = pattern[i];
    if (c == '"') quoted = !quoted;
    else if (c == '\\' && !quoted) ++i;
    else if (c == ';' && !quoted && out.count < 3) {
      out.part[out.count++] = pattern.substr(start, i - start);
      start = i + 1;
    }
  }
  out.part[out.count++] = pattern.substr(std::min(start, pattern.size()));
  return out;
}

// A quoted run or an escaped character at s[i]: appends the literal text, advances i past it.
bool TakeLiteral(std::string_view s, size_t& i, std::string& out) {
  if (s[i] == '"') {
    size_t end = s.find('"', i + 1);
    if (end == std::string_view::npos) end = s.size();
    out.append(s.substr(i + 1, end - i - 1));
    i = std::min(end + 1, s.size());
    return true;
  }
  if (s[i] == '\\') {
    if (i + 1 < s.size()) out += s[i + 1];
    i += 2;
    return true;
  }
  return false;
}

}  // namespace

// =================================================================================================
// Numeric patterns
// =================================================================================================

namespace {

enum class Tok { Zero, Hash, Point, Percent, Exp, Literal };

struct Token {
  Tok kind;
  std::string text;  // literal text, or "E+"/"e-" for an exponent
  int expMin = 0;    // exponent: minimum digit count
};

struct NumberPattern {
  std::vector<Token> tokens;
  int intPlaces = 0;     // 0/# before the point
  int intMin = 0;        // digits always shown: from the first integer '0' to the point
  int firstIntZero = -1;
  int fracPlaces = 0;    // 0/# after the point
  std::string fracKinds;  // per fraction place: '0' pads, '#' drops a trailing zero
  bool grouping = false;
  int scaleDown = 0;     // each "," right before the point divides by 1000
  int percent = 0;
  bool exponent = false;
  bool hasPlaces() const { return intPlaces + fracPlaces > 0 || exponent; }
};

// "E+00" / "e-0#": an exponent only when the sign is followed by at least one placeholder.
bool TakeExponent(std::string_view s, size_t& i, NumberPattern& np) {
  if (i + 2 >= s.size() || (s[i + 1] != '+' && s[i + 1] != '-')) return false;
  size_t j = i + 2;
  int zeros = 0;
  for (; j < s.size() && (s[j] == '0' || s[j] == '#'); ++j) zeros += s[j] == '0';
  if (j == i + 2) return false;
  np.tokens.push_back({Tok::Exp, std::string(s.substr(i, 2)), zeros});
  np.exponent = true;
  i = j;
  return true;
}

void AddLiteral(NumberPattern& np, std::string text) {
  if (!np.tokens.empty() && np.tokens.back().kind == Tok::Literal) np.tokens.back().text += text;
  else np.tokens.push_back({Tok::Literal, std::move(text)});
}

// A "," between integer placeholders switches on grouping; one with no placeholder after it
// (before the point) scales the number down by a thousand.
void TakeComma(std::string_view s, size_t i, NumberPattern& np, bool afterPoint) {
  if (afterPoint) return;
  size_t j = i + 1;
  while (j < s.size() && s[j] == ',') ++j;
  bool placeholderFollows = j < s.size() && (s[j] == '0' || s[j] == '#');
  if (placeholderFollows && np.intPlaces > 0) np.grouping = true;
  else if (!placeholderFollows && np.intPlaces > 0) ++np.scaleDown;
}

void AddPlace(NumberPattern& np, bool zero, bool afterPoint) {
  np.tokens.push_back({zero ? Tok::Zero : Tok::Hash, {}});
  if (afterPoint) {
    ++np.fracPlaces;
    np.fracKinds += zero ? '0' : '#';
  } else {
    if (zero && np.firstIntZero < 0) np.firstIntZero = np.intPlaces;
    ++np.intPlaces;
  }
}

NumberPattern ParseNumberPattern(std::string_view s) {
  NumberPattern np;
  np.tokens.reserve(s.size());
  bool afterPoint = false;
  for (size_t i = 0; i < s.size();) {
    std::string lit;
    if (TakeLiteral(s, i, lit)) {
      AddLiteral(np, std::move(lit));
      continue;
    }
    char c = s[i];
    if ((c == 'E' || c == 'e') && !np.exponent && TakeExponent(s, i, np)) continue;
    if (c == '0' || c == '#') AddPlace(np, c == '0', afterPoint || np.exponent);
    else if (c == '.' && !afterPoint && !np.exponent) {
      np.tokens.push_back({Tok::Point, {}});
      afterPoint = true;
    } else if (c == ',') TakeComma(s, i, np, afterPoint || np.exponent);
    else if (c == '%') {
      np.tokens.push_back({Tok::Percent, "%"});
      ++np.percent;
    } else AddLiteral(np, std::string(1, c));
    ++i;
  }
  np.intMin = np.firstIntZero < 0 ? 0 : np.intPlaces - np.firstIntZero;
  return np;
}

// Keeps the first `keep` digits of d (counted from the leading digit) and rounds on the first
// dropped one: 5 or more adds one to what is kept, which may carry into a new leading digit.
void RoundDigits(DecimalDigits& d, int64_t keep) {
  if (keep >= static_cast<int64_t>(d.digits.size())) return;
  bool up = keep >= 0 && d.digits[static_cast<size_t>(keep)] >= '5';
  d.digits.resize(static_cast<size_t>(std::max<int64_t>(keep, 0)));
  if (up) {
    size_t i = d.digits.size();
    while (i > 0 && d.digits[i - 1] == '9') d.digits[--i] = '0';
    if (i == 0) {
      d.digits.insert(d.digits.begin(), '1');
      ++d.point;
    } else {
      ++d.digits[i - 1];
    }
  }
  while (!d.digits.empty() && d.digits.back() == '0') d.digits.pop_back();
  if (d.digits.empty()) d.point = 0;
}

// Digit at position `pos` of 0.digits × 10^point counted from the decimal point (0 = first
// integer digit when point = 1 …); zero outside the stored digits.
char DigitAt(const DecimalDigits& d, int64_t index) {
  return (index >= 0 && index < static_cast<int64_t>(d.digits.size())) ? d.digits[static_cast<size_t>(index)] : '0';
}

struct Rendered {
  std::string intDigits;   // padded to the minimum, without separators
  std::string fracDigits;  // trailing '#' zeros removed
  std::string expText;     // sign and digits of the exponent
};

void FillFraction(const NumberPattern& np, const DecimalDigits& d, int64_t first, Rendered& r) {
  for (int i = 0; i < np.fracPlaces; ++i) r.fracDigits += DigitAt(d, first + i);
  size_t len = r.fracDigits.size();
  while (len > 0 && np.fracKinds[len - 1] == '#' && r.fracDigits[len - 1] == '0') --len;
  r.fracDigits.resize(len);
}

void PadInteger(const NumberPattern& np, Rendered& r) {
  if (static_cast<int>(r.intDigits.size()) < np.intMin)
    r.intDigits.insert(0, static_cast<size_t>(np.intMin) - r.intDigits.size(), '0');
}

Rendered RenderFixed(const NumberPattern& np, DecimalDigits d) {
  RoundDigits(d, int64_t(d.point) + np.fracPlaces);
  Rendered r;
  for (int64_t i = 0; i < d.point; ++i) r.intDigits += DigitAt(d, i);
  PadInteger(np, r);
  FillFraction(np, d, d.point, r);
  return r;
}

Rendered RenderScientific(const NumberPattern& np, DecimalDigits d, const Token& exp) {
  const int lead = np.intPlaces;
  RoundDigits(d, int64_t(lead) + np.fracPlaces);
  int64_t e = d.digits.empty() ? 0 : d.point - lead;
  Rendered r;
  if (!d.digits.empty())
    for (int i = 0; i < lead; ++i) r.intDigits += DigitAt(d, i);
  PadInteger(np, r);
  FillFraction(np, d, lead, r);
  r.expText = e < 0 ? "-" : (exp.text[1] == '+' ? "+" : "");
  std::string digits = std::to_string(e < 0 ? -e : e);
  if (static_cast<int>(digits.size()) < exp.expMin) digits.insert(0, exp.expMin - digits.size(), '0');
  r.expText += digits;
  return r;
}

// Integer digits spread over the placeholders from the right; surplus digits all go to the first.
void EmitIntegerPlace(std::string& out, const Rendered& r, const NumberPattern& np, int place,
                      const RuntimeLocale& loc) {
  const int k = static_cast<int>(r.intDigits.size());
  const int offset = k - np.intPlaces;
  int from = place == 0 ? 0 : place + offset, to = place + offset;
  for (int i = std::max(from, 0); i <= to; ++i) {
    out += r.intDigits[i];
    if (np.grouping && i < k - 1 && (k - 1 - i) % 3 == 0) out += loc.thousands;
  }
}

std::string EmitNumber(const NumberPattern& np, const Rendered& r, bool minus) {
  const RuntimeLocale& loc = CurrentLocale();
  std::string out;
  if (minus) out += '-';
  int place = 0, frac = 0;
  bool intDone = np.intPlaces > 0;
  auto flushInt = [&] {
    if (!intDone) out += r.intDigits;  // no integer placeholders: the digits still show
    intDone = true;
  };
  for (const Token& t : np.tokens) {
    switch (t.kind) {
      case Tok::Zero:
      case Tok::Hash:
        if (place < np.intPlaces) EmitIntegerPlace(out, r, np, place++, loc);
        else if (frac < static_cast<int>(r.fracDigits.size())) out += r.fracDigits[frac++];
        break;
      case Tok::Point: flushInt(); out += loc.decimal; break;
      case Tok::Exp: flushInt(); out += t.text[0]; out += r.expText; break;
      case Tok::Percent: flushInt(); out += '%'; break;
      case Tok::Literal: out += t.text; break;
    }
  }
  flushInt();
  return out;
}

std::string FormatDigits(std::string_view section, DecimalDigits d, bool showSign) {
  NumberPattern np = ParseNumberPattern(section);
  if (!np.hasPlaces()) {
    std::string out;
    for (const Token& t : np.tokens) out += t.text;
    return out;
  }
  if (!d.digits.empty()) d.point += 2 * np.percent - 3 * np.scaleDown;
  const Token* exp = nullptr;
  for (const Token& t : np.tokens)
    if (t.kind == Tok::Exp) exp = &t;
  Rendered r = exp ? RenderScientific(np, d, *exp) : RenderFixed(np, d);
  return EmitNumber(np, r, showSign && d.negative);
}

// Picks the section by the value: negative → second, zero → third; an empty or absent one falls
// back to the first, which then shows the sign itself.
std::string FormatNumberPattern(std::string_view pattern, DecimalDigits d) {
  Sections sections = SplitSections(pattern);
  if (d.negative && sections.size() >= 2 && !sections[1].empty()) {
    d.negative = false;
    return FormatDigits(sections[1], d, false);
  }
  if (d.digits.empty() && sections.size() >= 3 && !sections[2].empty()) return FormatDigits(sections[2], d, false);
  return FormatDigits(sections[0], d, true);
}

}  // namespace

// =================================================================================================
// Date patterns
// =================================================================================================

namespace {

constexpr const char* kMonthNames[] = {"January", "February", "March",     "April",   "May",      "June",
                                       "July",    "August",   "September", "October", "November", "December"};
constexpr const char* kDayNames[] = {"Sunday", "Monday", "Tuesday", "Wednesday", "Thursday", "Friday", "Saturday"};

bool IsDateLetter(char c) {
  c = AsciiLower(c);
  return c == 'd' || c == 'm' || c == 'y' || c == 'h' || c == 'n' || c == 's' || c == 'w' || c == 'q';
}

// A pattern is a date pattern when it has date letters and no digit placeholders.
bool IsDatePattern(std::string_view pattern) {
  bool letters = false;
  std::string ignored;
  for (size_t i = 0; i < pattern.size();) {
    if (TakeLiteral(pattern, i, ignored)) continue;
    char c = pattern[i++];
    if (c == '0' || c == '#') return false;
    letters |= IsDateLetter(c) || c == ':' || c == '/';
  }
  return letters;
}

std::string TwoDigits(int v) {
  std::string s = std::to_string(v);
  return s.size() < 2 ? "0" + s : s;
}

// The date separator that "/" stands for, following the locale's short-date style.
char DateSeparator() {
  switch (CurrentLocale().dateOrder) {
    case DateOrder::DayMonthYear: return '.';
    case DateOrder::YearMonthDay: return '-';
    default: return '/';
  }
}

struct DateContext {
  Date date;
  DateParts parts;
  bool twelveHour = false;
};

int WeekdayIndex(Date d) {  // 0 = Sunday; serial 0 was a Saturday
  int64_t day = static_cast<int64_t>(std::trunc(d.serial));
  return static_cast<int>(((day % 7) + 7 + 6) % 7);
}

int DayOfYear(const DateContext& c) {
  double jan1 = MakeDate(DateParts{c.parts.year, 1, 1, 0, 0, 0}).serial;
  return static_cast<int>(std::trunc(c.date.serial) - jan1) + 1;
}

// One run of a date letter ("dd", "mmmm", "yyyy" …); `minute` tells an "m" run that it is
// next to an hour or second and therefore means minutes.
std::string DateToken(char letter, size_t run, bool minute, const DateContext& c) {
  const DateParts& p = c.parts;
  switch (letter) {
    case 'd':
      if (run <= 2) return run == 1 ? std::to_string(p.day) : TwoDigits(p.day);
      if (run == 3) return std::string(kDayNames[WeekdayIndex(c.date)]).substr(0, 3);
      return kDayNames[WeekdayIndex(c.date)];
    case 'm':
      if (minute && run <= 2) return run == 1 ? std::to_string(p.minute) : TwoDigits(p.minute);
      if (run <= 2) return run == 1 ? std::to_string(p.month) : TwoDigits(p.month);
      return run == 3 ? std::string(kMonthNames[p.month - 1]).substr(0, 3) : kMonthNames[p.month - 1];
    case 'y':
      if (run == 1) return std::to_string(DayOfYear(c));
      if (run == 2) return TwoDigits(p.year % 100);
      return std::to_string(p.year);
    case 'h': {
      int h = c.twelveHour ? (p.hour % 12 == 0 ? 12 : p.hour % 12) : p.hour;
      return run == 1 ? std::to_string(h) : TwoDigits(h);
    }
    case 'n': return run == 1 ? std::to_string(p.minute) : TwoDigits(p.minute);
    case 's': return run == 1 ? std::to_string(p.second) : TwoDigits(p.second);
    case 'w': return std::to_string(WeekdayIndex(c.date) + 1);
    case 'q': return std::to_string((p.month - 1) / 3 + 1);
  }
  return {};
}

// "AM/PM", "am/pm", "A/P", "a/p" at s[i]: the marker as written, in the half of the day.
bool TakeAmPm(std::string_view s, size_t& i, const DateContext& c, std::string& out) {
  for (std::string_view form : {std::string_view("am/pm"), std::string_view("a/p")}) {
    if (i + form.size() > s.size() || !AsciiEqualsNoCase(s.substr(i, form.size()), form)) continue;
    bool pm = c.parts.hour >= 12;
    std::string_view text = s.substr(i, form.size());
    size_t slash = text.find('/');
    out.append(pm ? text.substr(slash + 1) : text.substr(0, slash));
    i += form.size();
    return true;
  }
  return false;
}

// Whether the "m" run at i is a minute: an hour token before it or a second token after it.
bool MinuteContext(std::string_view s, size_t i, size_t run, char prevLetter) {
  if (prevLetter == 'h') return true;
  for (size_t j = i + run; j < s.size(); ++j) {
    char c = AsciiLower(s[j]);
    if (IsDateLetter(c)) return c == 's';
    if (c == '"' || c == '\\') return false;
  }
  return false;
}

bool HasAmPm(std::string_view s) {
  std::string lower;
  for (char c : s) lower += AsciiLower(c);
  return lower.find("am/pm") != std::string::npos || lower.find("a/p") != std::string::npos;
}

std::string FormatDatePattern(Date date, std::string_view s) {
  DateContext c{date, SplitDate(date), HasAmPm(s)};
  std::string out;
  char prev = 0;
  for (size_t i = 0; i < s.size();) {
    if (TakeLiteral(s, i, out) || TakeAmPm(s, i, c, out)) continue;
    char letter = AsciiLower(s[i]);
    if (!IsDateLetter(letter)) {
      out += s[i] == '/' ? DateSeparator() : s[i];
      ++i;
      continue;
    }
    size_t run = 1;
    while (i + run < s.size() && AsciiLower(s[i + run]) == letter) ++run;
    out += DateToken(letter, run, letter == 'm' && MinuteContext(s, i, run, prev), c);
    prev = letter;
    i += run;
  }
  return out;
}

}  // namespace

// =================================================================================================
// Format
// =================================================================================================

namespace {

// The pattern a named format stands for; empty when the name is not one.
std::string_view NamedPattern(std::string_view name) {
  if (AsciiEqualsNoCase(name, "Fixed")) return "0.00";
  if (AsciiEqualsNoCase(name, "Standard")) return "#,##0.00";
  if (AsciiEqualsNoCase(name, "Percent")) return "0.00%";
  if (AsciiEqualsNoCase(name, "Scientific")) return "0.00E+00";
  return {};
}

// The digits of a value that formats as a number; false for text that is not numeric.
bool NumericDigits(const Variant& v, DecimalDigits& d) {
  switch (v.Type()) {
    case VarType::Empty: return true;
    case VarType::Currency: d = CurrencyDigits(v.AsCurrency()); return true;
    case VarType::String:
      if (!IsNumericText(v.AsString())) return false;
      d = DoubleDigits(ParseNumber(v.AsString()));
      return true;
    default: d = DoubleDigits(CDbl(v)); return true;
  }
}

std::string FormatBooleanName(const Variant& value, std::string_view name, bool& handled) {
  static constexpr std::string_view kPairs[][3] = {
      {"Yes/No", "Yes", "No"}, {"True/False", "True", "False"}, {"On/Off", "On", "Off"}};
  for (const auto& pair : kPairs)
    if (AsciiEqualsNoCase(name, pair[0])) {
      handled = true;
      return std::string(CBool(value) ? pair[1] : pair[2]);
    }
  handled = false;
  return {};
}

std::string FormatAsDate(const Variant& value, std::string_view pattern) {
  if (value.IsString()) {
    try {
      return FormatDatePattern(CDate(value), pattern);
    } catch (const VbError& e) {
      if (e.number() == kErrTypeMismatch) return value.AsString();  // not a date: unchanged
      throw;
    }
  }
  return FormatDatePattern(CDate(value), pattern);
}

}  // namespace

std::string Format(const Variant& value, std::string_view pattern) {
  if (value.IsNull()) {
    Sections sections = SplitSections(pattern);
    return sections.size() >= 4 ? FormatDigits(sections[3], {}, false) : std::string();
  }
  if (pattern.empty()) return CStr(value);  // Empty gives "", text stays as it is
  if (AsciiEqualsNoCase(pattern, "General Number")) {
    if (!value.IsString()) return value.Type() == VarType::Date ? DoubleToString(CDbl(value)) : CStr(value);
    return IsNumericText(value.AsString()) ? DoubleToString(ParseNumber(value.AsString())) : value.AsString();
  }
  bool handled = false;
  std::string named = FormatBooleanName(value, pattern, handled);
  if (handled) return named;
  if (std::string_view p = NamedPattern(pattern); !p.empty()) pattern = p;
  if (IsDatePattern(pattern)) return FormatAsDate(value, pattern);
  DecimalDigits d;
  if (!NumericDigits(value, d)) return value.AsString();
  return FormatNumberPattern(pattern, std::move(d));
}

}  // namespace xal
