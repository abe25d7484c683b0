// The script-visible text functions (Len, Mid, InStr, Replace, Split, UCase, StrComp, …) over
// UTF-8 strings. Positions and lengths count code points. Pure ASCII and valid UTF-8 take byte
// paths that need no decoding and no ICU call; only case mapping, case-insensitive searching of
// non-ASCII text and linguistic ordering go through ICU.
#include "runtime/text.h"

#include "runtime/ascii.h"
#include "runtime/locale.h"

#include <unicode/uchar.h>
#include <unicode/ucol.h>
#include <unicode/utf8.h>

#include <algorithm>
#include <cstring>

#include "runtime/convert.h"
#include "runtime/error.h"

namespace xal {

namespace {

// ---------------------------------------------------------------------------------------------
// UTF-8 walking
// ---------------------------------------------------------------------------------------------

constexpr char32_t kReplacement = 0xFFFD;

const uint8_t* Bytes(std::string_view s) { return reinterpret_cast<const uint8_t*>(s.data()); }

bool AsciiWord(const char* p) {
  uint64_t w;
  std::memcpy(&w, p, 8);
  return (w & 0x8080808080808080ULL) == 0;
}

bool IsAscii(std::string_view s) {
  size_t i = 0;
  for (; i + 8 <= s.size(); i += 8)
    if (!AsciiWord(s.data() + i)) return false;
  for (; i < s.size(); ++i)
    if (static_cast<unsigned char>(s[i]) >= 0x80) return false;
  return true;
}

// Decodes the character at byte `i` and moves past it. An ill-formed sequence is one character
// (its maximal ill-formed prefix), reported as -1; every function here counts it the same way, so
// Len, Mid and InStr agree with each other on damaged text.
int32_t NextChar(std::string_view s, size_t& i) {
  UChar32 c;
  U8_NEXT(Bytes(s), i, s.size(), c);
  return c;
}

// Byte offset reached after skipping `n` characters from byte `i` (or the end of the text).
size_t Skip(std::string_view s, size_t i, int64_t n) {
  while (n > 0 && i < s.size()) {
    if (n >= 8 && i + 8 <= s.size() && AsciiWord(s.data() + i)) {
      i += 8;
      n -= 8;
      continue;
    }
    NextChar(s, i);
    --n;
  }
  return i;
}

int64_t CountChars(std::string_view s) {
  int64_t n = 0;
  size_t i = 0;
  while (i < s.size()) {
    if (i + 8 <= s.size() && AsciiWord(s.data() + i)) {
      i += 8;
      n += 8;
      continue;
    }
    NextChar(s, i);
    ++n;
  }
  return n;
}

bool IsValidUtf8(std::string_view s) {
  size_t i = 0;
  while (i < s.size()) {
    if (i + 8 <= s.size() && AsciiWord(s.data() + i)) {
      i += 8;
      continue;
    }
    if (NextChar(s, i) < 0) return false;
  }
  return true;
}

void AppendUtf8(std::string& out, char32_t c) {
  if (c >= 0xD800 && (c <= 0xDFFF || c > 0x10FFFF)) c = kReplacement;
  char buf[4];
  int32_t len = 0;
  U8_APPEND_UNSAFE(buf, len, c);
  out.append(buf, static_cast<size_t>(len));
}

char32_t FoldChar(UChar32 c) {
  if (c < 0) return kReplacement;
  if (c < 0x80) return static_cast<char32_t>(AsciiLower(static_cast<char>(c)));
  return static_cast<char32_t>(u_foldCase(c, U_FOLD_CASE_DEFAULT));
}

// ---------------------------------------------------------------------------------------------
// Searching
// ---------------------------------------------------------------------------------------------

// Searches one text for one needle in a compare mode. Work happens in "units": bytes when both
// strings are valid UTF-8 in binary mode or pure ASCII in text mode (a byte match is then a
// character match), otherwise decoded, case-folded code points with their byte offsets kept so
// that results can still be cut out of the original text.
class Finder {
 public:
  static constexpr size_t npos = static_cast<size_t>(-1);

  Finder(std::string_view s, std::string_view find, CompareMode mode) : s_(s), find_(find) {
    if (mode == CompareMode::Binary) {
      bytes_ = IsValidUtf8(s) && IsValidUtf8(find);
    } else {
      bytes_ = IsAscii(s) && IsAscii(find);
      icase_ = true;
    }
    if (!bytes_) {
      bool fold = mode == CompareMode::Text;
      Decode(s, fold, hay_, &offs_);
      Decode(find, fold, needle_, nullptr);
    }
  }

  size_t Units() const { return bytes_ ? s_.size() : hay_.size(); }
  size_t NeedleUnits() const { return bytes_ ? find_.size() : needle_.size(); }
  size_t ByteAt(size_t unit) const { return bytes_ ? unit : offs_[unit]; }
  size_t UnitOfChar(int64_t n) const {
    return bytes_ ? Skip(s_, 0, n) : static_cast<size_t>(std::min<int64_t>(n, hay_.size()));
  }
  int64_t CharOfUnit(size_t unit) const { return bytes_ ? CountChars(s_.substr(0, unit)) : int64_t(unit); }

  // First match starting at or after `from`.
  size_t Find(size_t from) const {
    if (from > Units()) return npos;
    if (!bytes_) return std::u32string_view(hay_).find(needle_, from);
    if (!icase_) return s_.find(find_, from);
    for (size_t u = from; u + find_.size() <= s_.size(); ++u)
      if (MatchesAt(u)) return u;
    return npos;
  }

  // Last match starting at or before `last`.
  size_t RFind(size_t last) const {
    if (!bytes_) return std::u32string_view(hay_).rfind(needle_, last);
    if (!icase_) return s_.rfind(find_, last);
    for (size_t u = std::min(last, s_.size()) + 1; u-- > 0;)
      if (u + find_.size() <= s_.size() && MatchesAt(u)) return u;
    return npos;
  }

 private:
  static void Decode(std::string_view s, bool fold, std::u32string& out, std::vector<size_t>* offs) {
    out.reserve(s.size());
    size_t i = 0;
    while (i < s.size()) {
      if (offs) offs->push_back(i);
      int32_t c = NextChar(s, i);
      out.push_back(fold ? FoldChar(c) : c < 0 ? kReplacement : static_cast<char32_t>(c));
    }
    if (offs) offs->push_back(s.size());
  }

  bool MatchesAt(size_t u) const {
    for (size_t k = 0; k < find_.size(); ++k)
      if (AsciiLower(s_[u + k]) != AsciiLower(find_[k])) return false;
    return true;
  }

  std::string_view s_, find_;
  bool bytes_ = true, icase_ = false;
  std::u32string hay_, needle_;
  std::vector<size_t> offs_;
};

// ---------------------------------------------------------------------------------------------
// Case mapping and collation
// ---------------------------------------------------------------------------------------------

enum class CaseMap { Upper, Lower, Fold };

// Maps every character one-to-one; characters that do not change (and damaged bytes) are copied
// as they were, so the result differs from the input only in letters.
std::string MapCase(std::string_view s, CaseMap how) {
  std::string out;
  out.reserve(s.size());
  size_t i = 0;
  while (i < s.size()) {
    char b = s[i];
    if (static_cast<unsigned char>(b) < 0x80) {
      out.push_back(how == CaseMap::Upper ? AsciiUpper(b) : AsciiLower(b));
      ++i;
      continue;
    }
    size_t start = i;
    UChar32 c = NextChar(s, i);
    UChar32 m = c < 0                ? c
                : how == CaseMap::Upper ? u_toupper(c)
                : how == CaseMap::Lower ? u_tolower(c)
                                        : u_foldCase(c, U_FOLD_CASE_DEFAULT);
    if (m == c)
      out.append(s.substr(start, i - start));
    else
      AppendUtf8(out, static_cast<char32_t>(m));
  }
  return out;
}

// One collator per thread: ICU collators are not safe to share between threads while comparing.
// Secondary strength makes accents significant and letter case not.
// The collator follows the locale's alphabet and is opened again when that changes.
UCollator* TextCollator() {
  struct Holder {
    UCollator* c = nullptr;
    std::string name;
    bool opened = false;
    void Open(const std::string& locale) {
      if (c) ucol_close(c);
      c = nullptr;
      name = locale;
      opened = true;
      UErrorCode status = U_ZERO_ERROR;
      c = ucol_open(locale.c_str(), &status);
      if (U_FAILURE(status)) {
        c = nullptr;
        return;
      }
      ucol_setStrength(c, UCOL_SECONDARY);
    }
    ~Holder() {
      if (c) ucol_close(c);
    }
  };
  thread_local Holder holder;
  const std::string& wanted = CurrentLocale().collation;
  if (!holder.opened || holder.name != wanted) holder.Open(wanted);
  return holder.c;
}

int Sign(int64_t v) { return v < 0 ? -1 : v > 0 ? 1 : 0; }

// Windows-1252 characters 0x80-0x9F; the five codes that page leaves undefined map to themselves.
constexpr char16_t kCp1252High[32] = {
    0x20AC, 0x0081, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0x008D, 0x017D, 0x008F, 0x0090, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x009D, 0x017E, 0x0178};

}  // namespace

// ---------------------------------------------------------------------------------------------
// Length and slicing
// ---------------------------------------------------------------------------------------------

int32_t Len(std::string_view s) { return static_cast<int32_t>(CountChars(s)); }

std::string Mid(std::string_view s, int32_t start) {
  if (start < 1) Raise(kErrInvalidCall);
  return std::string(s.substr(Skip(s, 0, int64_t(start) - 1)));
}

std::string Mid(std::string_view s, int32_t start, int32_t length) {
  if (start < 1 || length < 0) Raise(kErrInvalidCall);
  size_t b = Skip(s, 0, int64_t(start) - 1);
  size_t e = Skip(s, b, length);
  return std::string(s.substr(b, e - b));
}

std::string Left(std::string_view s, int32_t length) {
  if (length < 0) Raise(kErrInvalidCall);
  return std::string(s.substr(0, Skip(s, 0, length)));
}

std::string Right(std::string_view s, int32_t length) {
  if (length < 0) Raise(kErrInvalidCall);
  int64_t total = CountChars(s);
  if (length >= total) return std::string(s);
  return std::string(s.substr(Skip(s, 0, total - length)));
}

// ---------------------------------------------------------------------------------------------
// Searching and replacing
// ---------------------------------------------------------------------------------------------

int32_t InStr(int32_t start, std::string_view s, std::string_view find, CompareMode mode) {
  if (start < 1) Raise(kErrInvalidCall);
  if (s.empty()) return 0;
  if (find.empty()) return start <= CountChars(s) + 1 ? start : 0;
  Finder f(s, find, mode);
  size_t from = f.UnitOfChar(int64_t(start) - 1);
  size_t u = f.Find(from);
  if (u == Finder::npos) return 0;
  return static_cast<int32_t>(f.CharOfUnit(u) + 1);
}

int32_t InStrRev(std::string_view s, std::string_view find, int32_t start, CompareMode mode) {
  if (start == 0 || start < -1) Raise(kErrInvalidCall);
  if (s.empty()) return 0;
  int64_t total = CountChars(s);
  int64_t last = start == -1 ? total : start;
  if (last > total) return 0;
  if (find.empty()) return static_cast<int32_t>(last);
  Finder f(s, find, mode);
  size_t endUnit = f.UnitOfChar(last);  // a match must end at or before this unit
  if (f.NeedleUnits() > endUnit) return 0;
  size_t u = f.RFind(endUnit - f.NeedleUnits());
  if (u == Finder::npos) return 0;
  return static_cast<int32_t>(f.CharOfUnit(u) + 1);
}

std::string Replace(std::string_view s, std::string_view find, std::string_view with, int32_t start,
                    int32_t count, CompareMode mode) {
  if (start < 1 || count < -1) Raise(kErrInvalidCall);
  std::string_view tail = s.substr(Skip(s, 0, int64_t(start) - 1));
  if (find.empty() || count == 0 || tail.empty()) return std::string(tail);
  Finder f(tail, find, mode);
  std::string out;
  out.reserve(tail.size());
  size_t pos = 0;
  for (int32_t done = 0; count < 0 || done < count; ++done) {
    size_t u = f.Find(pos);
    if (u == Finder::npos) break;
    out.append(tail.substr(f.ByteAt(pos), f.ByteAt(u) - f.ByteAt(pos)));
    out.append(with);
    pos = u + f.NeedleUnits();
  }
  out.append(tail.substr(f.ByteAt(pos)));
  return out;
}

// ---------------------------------------------------------------------------------------------
// Split and Join
// ---------------------------------------------------------------------------------------------

std::vector<std::string> Split(std::string_view s, std::string_view delimiter, int32_t limit,
                               CompareMode mode) {
  if (limit < -1) Raise(kErrInvalidCall);
  if (s.empty() || limit == 0) return {};
  if (delimiter.empty() || limit == 1) return {std::string(s)};
  Finder f(s, delimiter, mode);
  std::vector<std::string> parts;
  size_t pos = 0;
  while (limit < 0 || parts.size() + 1 < static_cast<size_t>(limit)) {
    size_t u = f.Find(pos);
    if (u == Finder::npos) break;
    parts.emplace_back(s.substr(f.ByteAt(pos), f.ByteAt(u) - f.ByteAt(pos)));
    pos = u + f.NeedleUnits();
  }
  parts.emplace_back(s.substr(f.ByteAt(pos)));
  return parts;
}

SafeArray SplitToArray(std::string_view s, std::string_view delimiter, int32_t limit, CompareMode mode) {
  std::vector<Variant> items;
  for (std::string& part : Split(s, delimiter, limit, mode)) items.emplace_back(std::move(part));
  return SafeArray::Vector(std::move(items), 0);
}

std::string Join(const std::vector<std::string>& parts, std::string_view delimiter) {
  std::string out;
  for (size_t i = 0; i < parts.size(); ++i) {
    if (i) out.append(delimiter);
    out.append(parts[i]);
  }
  return out;
}

std::string Join(const SafeArray& parts, std::string_view delimiter) {
  if (parts.Dims() != 1) Raise(kErrInvalidCall);
  std::string out;
  bool first = true;
  for (const Variant& v : parts.Elements()) {
    if (!first) out.append(delimiter);
    out.append(CStr(v));
    first = false;
  }
  return out;
}

// ---------------------------------------------------------------------------------------------
// Trimming, padding, case, quoting
// ---------------------------------------------------------------------------------------------

std::string LTrim(std::string_view s) {
  size_t b = s.find_first_not_of(' ');
  return b == std::string_view::npos ? std::string() : std::string(s.substr(b));
}

std::string RTrim(std::string_view s) {
  size_t e = s.find_last_not_of(' ');
  return e == std::string_view::npos ? std::string() : std::string(s.substr(0, e + 1));
}

std::string Trim(std::string_view s) {
  size_t b = s.find_first_not_of(' ');
  if (b == std::string_view::npos) return std::string();
  return std::string(s.substr(b, s.find_last_not_of(' ') - b + 1));
}

std::string UCase(std::string_view s) { return MapCase(s, CaseMap::Upper); }
std::string LCase(std::string_view s) { return MapCase(s, CaseMap::Lower); }
std::string FoldCase(std::string_view s) { return MapCase(s, CaseMap::Fold); }

std::string Space(int32_t n) {
  if (n < 0) Raise(kErrInvalidCall);
  return std::string(static_cast<size_t>(n), ' ');
}

std::string String(int32_t n, std::string_view ch) {
  if (n < 0 || ch.empty()) Raise(kErrInvalidCall);
  std::string_view one = ch.substr(0, Skip(ch, 0, 1));
  std::string out;
  out.reserve(one.size() * static_cast<size_t>(n));
  for (int32_t i = 0; i < n; ++i) out.append(one);
  return out;
}

std::string DoubleQuoted(std::string_view s) {
  std::string out;
  out.reserve(s.size() + 2);
  out += '"';
  for (char ch : s) {
    out += ch;
    if (ch == '"') out += '"';
  }
  out += '"';
  return out;
}

// ---------------------------------------------------------------------------------------------
// Character codes
// ---------------------------------------------------------------------------------------------

// Negative codes -32768..-1 are accepted as the original runtime's signed 16-bit codes; lone
// surrogates cannot be written in UTF-8 and are refused like any other non-character code.
std::string ChrW(int32_t code) {
  if (code >= -32768 && code < 0) code += 65536;
  if (code < 0 || code > 0x10FFFF || (code >= 0xD800 && code <= 0xDFFF)) Raise(kErrInvalidCall);
  std::string out;
  AppendUtf8(out, static_cast<char32_t>(code));
  return out;
}

int32_t AscW(std::string_view s) {
  if (s.empty()) Raise(kErrInvalidCall);
  size_t i = 0;
  int32_t c = NextChar(s, i);
  return c < 0 ? int32_t(kReplacement) : c;
}

std::string Chr(int32_t code) {
  if (code < 0 || code > 255) Raise(kErrInvalidCall);
  char32_t c = (code >= 0x80 && code < 0xA0) ? kCp1252High[code - 0x80] : static_cast<char32_t>(code);
  std::string out;
  AppendUtf8(out, c);
  return out;
}

int32_t Asc(std::string_view s) {
  int32_t c = AscW(s);
  if (c < 0x80 || (c >= 0xA0 && c <= 0xFF)) return c;
  for (int32_t k = 0; k < 32; ++k)
    if (kCp1252High[k] == c) return 0x80 + k;
  return '?';
}

// ---------------------------------------------------------------------------------------------
// Comparison
// ---------------------------------------------------------------------------------------------

// Damaged bytes compare as raw bytes, so TextEquals(a, b) is exactly FoldCase(a) == FoldCase(b).
bool TextEquals(std::string_view a, std::string_view b) {
  if (a == b) return true;
  size_t i = 0, j = 0;
  while (i < a.size() && j < b.size()) {
    unsigned char x = a[i], y = b[j];
    if (x < 0x80 && y < 0x80) {
      if (AsciiLower(char(x)) != AsciiLower(char(y))) return false;
      ++i, ++j;
      continue;
    }
    size_t si = i, sj = j;
    UChar32 c = NextChar(a, i), d = NextChar(b, j);
    if (c < 0 || d < 0) {
      if (a.substr(si, i - si) != b.substr(sj, j - sj)) return false;
    } else if (FoldChar(c) != FoldChar(d)) {
      return false;
    }
  }
  return i == a.size() && j == b.size();
}

int32_t StrComp(std::string_view a, std::string_view b, CompareMode mode) {
  // UTF-8 byte order is code point order, which is what binary comparison wants.
  if (mode == CompareMode::Binary) return Sign(a.compare(b));
  if (TextEquals(a, b)) return 0;
  if (UCollator* coll = TextCollator()) {
    UErrorCode status = U_ZERO_ERROR;
    UCollationResult r = ucol_strcollUTF8(coll, a.data(), static_cast<int32_t>(a.size()), b.data(),
                                          static_cast<int32_t>(b.size()), &status);
    if (U_SUCCESS(status) && r != UCOL_EQUAL) return r == UCOL_LESS ? -1 : 1;
  }
  // The collator sees no difference (width, compatibility forms…) but the texts are not equal
  // ignoring case: order them by their folded code points so equality stays one rule.
  return Sign(FoldCase(a).compare(FoldCase(b)));
}

// ---------------------------------------------------------------------------------------------
// Conversions
// ---------------------------------------------------------------------------------------------

std::u32string ToUtf32(std::string_view s) {
  std::u32string out;
  out.reserve(s.size());
  size_t i = 0;
  while (i < s.size()) {
    int32_t c = NextChar(s, i);
    out.push_back(c < 0 ? kReplacement : static_cast<char32_t>(c));
  }
  return out;
}

std::string ToUtf8(std::u32string_view s) {
  std::string out;
  out.reserve(s.size());
  for (char32_t c : s) AppendUtf8(out, c);
  return out;
}

}  // namespace xal
