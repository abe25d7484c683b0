// Text functions over UTF-8 strings that count positions and lengths in code points, as the
// original runtime counts characters. Case mapping and case-insensitive comparison go through ICU
// so that Estonian, Latvian and Lithuanian letters upper-case and compare correctly.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "runtime/variant.h"

namespace xal {

// Binary: ordinal by code point. Text: case-insensitive (and, for ordering, linguistic).
enum class CompareMode { Binary = 0, Text = 1 };

int32_t Len(std::string_view s);
// Mid(s, start[, length]): start ≥ 1 and length ≥ 0, else error 5; length < 0 in the call means
// "to the end" only through the overload without a length.
std::string Mid(std::string_view s, int32_t start);
std::string Mid(std::string_view s, int32_t start, int32_t length);
std::string Left(std::string_view s, int32_t length);   // error 5 for length < 0
std::string Right(std::string_view s, int32_t length);  // error 5 for length < 0

// InStr([start,] s, find[, compare]): 1-based position or 0; empty `find` gives start when
// start ≤ Len + 1; start < 1 is error 5.
int32_t InStr(int32_t start, std::string_view s, std::string_view find, CompareMode mode = CompareMode::Binary);
inline int32_t InStr(std::string_view s, std::string_view find, CompareMode mode = CompareMode::Binary) {
  return InStr(1, s, find, mode);
}
// InStrRev(s, find[, start = -1 (end)][, compare]); start 0 or < -1 is error 5.
int32_t InStrRev(std::string_view s, std::string_view find, int32_t start = -1,
                 CompareMode mode = CompareMode::Binary);

// Replace(s, find, with[, start = 1][, count = -1][, compare]): the result starts at `start`.
std::string Replace(std::string_view s, std::string_view find, std::string_view with, int32_t start = 1,
                    int32_t count = -1, CompareMode mode = CompareMode::Binary);

// Split: Split("") is an empty vector; an empty delimiter gives the whole text; limit -1 = all.
std::vector<std::string> Split(std::string_view s, std::string_view delimiter = " ", int32_t limit = -1,
                               CompareMode mode = CompareMode::Binary);
// The same as a 1-D array with lower bound 0 (UBound -1 when empty).
SafeArray SplitToArray(std::string_view s, std::string_view delimiter = " ", int32_t limit = -1,
                       CompareMode mode = CompareMode::Binary);
std::string Join(const std::vector<std::string>& parts, std::string_view delimiter = " ");
// Join of a 1-D array: every element through CStr.
std::string Join(const SafeArray& parts, std::string_view delimiter = " ");

// Only U+0020 blanks are trimmed.
std::string Trim(std::string_view s);
std::string LTrim(std::string_view s);
std::string RTrim(std::string_view s);

// The text between double quotes, each double quote inside doubled: the literal form of a string
// in script text and of a quoted identifier in SQL.
std::string DoubleQuoted(std::string_view s);

std::string UCase(std::string_view s);  // one-to-one simple case mapping ("ß" stays "ß")
std::string LCase(std::string_view s);
std::string Space(int32_t n);           // error 5 for n < 0
std::string String(int32_t n, std::string_view ch);  // n copies of ch's first character

// Characters by code: Chr for 0-255 (the Windows-1252 page), ChrW/AscW for code points.
std::string ChrW(int32_t code);
int32_t AscW(std::string_view s);  // error 5 for ""
std::string Chr(int32_t code);     // error 5 outside 0-255
int32_t Asc(std::string_view s);   // Windows-1252 code of the first character, '?' if it has none

// StrComp: -1, 0, 1. Binary orders by code point; Text compares case-insensitively (ICU
// collation at secondary strength, so accents count and letter case does not).
int32_t StrComp(std::string_view a, std::string_view b, CompareMode mode = CompareMode::Binary);
// Case-insensitive equality of names, codes and options (simple case folding).
bool TextEquals(std::string_view a, std::string_view b);
// The case-folded form used as a key for case-insensitive look-ups ("ABC" and "abc" give the same).
std::string FoldCase(std::string_view s);

// `s Like pattern`: ? * # [list] [!list] [a-z]; error 93 for an unclosed "[".
bool Like(std::string_view s, std::string_view pattern, CompareMode mode = CompareMode::Binary);

// UTF-8 <-> code points (invalid bytes become U+FFFD).
std::u32string ToUtf32(std::string_view s);
std::string ToUtf8(std::u32string_view s);

}  // namespace xal
