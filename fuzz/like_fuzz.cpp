// libFuzzer target for the text layer: arbitrary bytes (often not valid UTF-8) go through Like in
// both compare modes, the slicing and searching functions, case mapping and date parsing.
// A VbError is an expected answer to bad input; a crash, a sanitizer report or a broken
// invariant between functions (checked below) is a finding.
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

#include "runtime/dates.h"
#include "runtime/error.h"
#include "runtime/text.h"

namespace {

using xal::CompareMode;

void Check(bool ok) {
  if (!ok) __builtin_trap();
}

// Text survives decoding unchanged only when it is valid UTF-8.
bool IsCleanUtf8(std::string_view s) { return xal::ToUtf8(xal::ToUtf32(s)) == s; }

bool HasWildcards(std::string_view p) { return p.find_first_of("?*#[") != std::string_view::npos; }

void FuzzLike(std::string_view text, std::string_view pattern) {
  for (CompareMode mode : {CompareMode::Binary, CompareMode::Text}) {
    try {
      bool r = xal::Like(text, pattern, mode);
      // Without wildcards a binary Like is plain equality of the characters.
      if (mode == CompareMode::Binary && !HasWildcards(pattern))
        Check(r == (xal::ToUtf32(text) == xal::ToUtf32(pattern)));
    } catch (const xal::VbError& e) {
      Check(e.number() == xal::kErrBadPattern);
    }
  }
  Check(xal::Like(text, "*"));
}

void FuzzSlicing(std::string_view text, uint8_t k) {
  int32_t n = xal::Len(text);
  int32_t cut = n == 0 ? 0 : k % (n + 1);
  Check(xal::Mid(text, 1, cut) + xal::Mid(text, cut + 1) == text);
  Check(xal::Left(text, cut) + xal::Right(text, n - cut) == text);
  Check(xal::Len(xal::Left(text, cut)) == cut);
  Check(xal::Len(xal::UCase(text)) == n && xal::Len(xal::LCase(text)) == n);
  Check(xal::ToUtf32(text).size() == static_cast<size_t>(n));
}

void FuzzSearch(std::string_view text, std::string_view find) {
  for (CompareMode mode : {CompareMode::Binary, CompareMode::Text}) {
    int32_t p = xal::InStr(1, text, find, mode);
    int32_t q = xal::InStrRev(text, find, -1, mode);
    Check((p == 0) == (q == 0) || find.empty());
    if (p > 0 && !find.empty()) {
      std::string hit = xal::Mid(text, p, xal::Len(find));
      if (mode == CompareMode::Binary)
        Check(xal::ToUtf32(hit) == xal::ToUtf32(find));
      else
        Check(xal::Len(hit) == xal::Len(find));
      Check(q >= p);
    }
    std::string replaced = xal::Replace(text, find, "#", 1, -1, mode);
    auto parts = xal::Split(text, find, -1, mode);
    if (mode == CompareMode::Binary && !find.empty() && !text.empty() && IsCleanUtf8(text) && IsCleanUtf8(find))
      Check(xal::Join(parts, find) == text && xal::Join(parts, "#") == replaced);
  }
  Check(xal::TextEquals(text, find) == (xal::FoldCase(text) == xal::FoldCase(find)));
  Check(xal::StrComp(text, find, CompareMode::Text) == -xal::StrComp(find, text, CompareMode::Text));
  Check((xal::StrComp(text, find, CompareMode::Text) == 0) == xal::TextEquals(text, find));
}

void FuzzDates(std::string_view text) {
  try {
    xal::Date d = xal::ParseDate(text);
    Check(xal::ParseDate(xal::DateToString(d)) == d);
    Check(xal::ParseDate(xal::DateToIso(d)) == d);
  } catch (const xal::VbError& e) {
    Check(e.number() == xal::kErrTypeMismatch || e.number() == xal::kErrOverflow);
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) return 0;
  std::string_view in(reinterpret_cast<const char*>(data + 1), size - 1);
  // Text and pattern are separated by the first NUL byte, or split in half when there is none.
  size_t cut = in.find('\0');
  std::string_view text = cut == std::string_view::npos ? in.substr(0, in.size() / 2) : in.substr(0, cut);
  std::string_view pattern = cut == std::string_view::npos ? in.substr(in.size() / 2) : in.substr(cut + 1);
  FuzzLike(text, pattern);
  FuzzSlicing(text, data[0]);
  FuzzSearch(text, pattern);
  FuzzDates(text);
  return 0;
}
