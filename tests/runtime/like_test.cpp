// Tests of the Like operator: wildcards, digit and character lists, the bracketed literals,
// case-insensitive matching in text mode, the "Invalid pattern string" error, and that patterns
// full of stars stay fast on long texts.
#include <gtest/gtest.h>

#include <chrono>
#include <string>

#include "runtime/error.h"
#include "runtime/text.h"

namespace xal {
namespace {

constexpr CompareMode B = CompareMode::Binary;
constexpr CompareMode T = CompareMode::Text;

struct Row {
  std::string s, pattern;
  CompareMode mode;
  bool expected;
  int error;  // 0, or the error the call must raise
};

void CheckRows(const Row* rows, size_t count) {
  for (size_t i = 0; i < count; ++i) {
    const Row& r = rows[i];
    SCOPED_TRACE("[" + r.s + "] Like [" + r.pattern + "]" + (r.mode == T ? " text" : " binary"));
    try {
      EXPECT_EQ(Like(r.s, r.pattern, r.mode), r.expected);
      EXPECT_EQ(r.error, 0);
    } catch (const VbError& e) {
      EXPECT_EQ(e.number(), r.error);
    }
  }
}

TEST(LikeWildcards, QuestionStarAndDigit) {
  const Row rows[] = {
      {"aBBBa", "a*a", B, true, 0},
      {"a2a", "a#a", B, true, 0},
      {"aba", "a#a", B, false, 0},
      {"", "*", B, true, 0},
      {"", "?", B, false, 0},
      {"", "", B, true, 0},
      {"a", "", B, false, 0},
      {"abc", "a?c", B, true, 0},
      {"ac", "a?c", B, false, 0},
      {"abc", "*", B, true, 0},
      {"abc", "a*", B, true, 0},
      {"abc", "*c", B, true, 0},
      {"abc", "*b", B, false, 0},
      {"abcbc", "*b*c", B, true, 0},
      {"ab", "*b*c", B, false, 0},
      {"õun", "?un", B, true, 0},         // "?" takes one character, not one byte
      {"\U0001F600x", "?x", B, true, 0},  // even outside the BMP
      {"a]", "a]", B, true, 0},           // "]" outside a list is itself
      {"a!-", "a!-", B, true, 0},
  };
  CheckRows(rows, std::size(rows));
}

TEST(LikeLists, RangesNegationAndLiterals) {
  const Row rows[] = {
      {"F", "[A-Z]", B, true, 0},
      {"f", "[A-Z]", B, false, 0},
      {"aM5b", "a[L-P]#[!c-e]", B, true, 0},
      {"aM5d", "a[L-P]#[!c-e]", B, false, 0},
      {"3", "[0-9]", B, true, 0},
      {"x", "[!0-9]", B, true, 0},
      {"5", "[!0-9]", B, false, 0},
      {"b", "[abc]", B, true, 0},
      {"d", "[abc]", B, false, 0},
      {"š", "[a-z]", B, false, 0},  // binary ranges are code point ranges
      {"[", "[[]", B, true, 0},
      {"?", "[?]", B, true, 0},
      {"a", "[?]", B, false, 0},
      {"#", "[#]", B, true, 0},
      {"1", "[#]", B, false, 0},
      {"*", "[*]", B, true, 0},
      {"ab", "[*]", B, false, 0},
      {"-", "[a-]", B, true, 0},
      {"-", "[-a]", B, true, 0},
      {"b", "[-a]", B, false, 0},
      {"ab", "a[]b", B, true, 0},   // "[]" matches the empty string
      {"x", "[!]", B, true, 0},     // none of nothing: any one character
      {"õ", "[õä]", B, true, 0},
  };
  CheckRows(rows, std::size(rows));
}

TEST(LikeTextMode, IgnoresCaseButNotAccents) {
  const Row rows[] = {
      {"f", "[A-Z]", T, true, 0},
      {"F", "[a-z]", T, true, 0},
      {"A", "[a-c]", T, true, 0},
      {"D", "[a-c]", T, false, 0},
      {"abc", "ABC", T, true, 0},
      {"abc", "ABC", B, false, 0},
      {"ÕUN", "õun", T, true, 0},
      {"ÕUN", "õun", B, false, 0},
      {"õ", "o", T, false, 0},
      {"Š", "[šž]", T, true, 0},
      {"Ž", "[!šž]", T, false, 0},
      {"xÄy", "*ä*", T, true, 0},
  };
  CheckRows(rows, std::size(rows));
}

TEST(LikeErrors, BadPatterns) {
  const Row rows[] = {
      {"abc", "a[bc", B, false, kErrBadPattern},  // bad: "[" never closed
      {"abc", "[", B, false, kErrBadPattern},     // bad: "[" never closed
      {"", "*[!", T, false, kErrBadPattern},      // bad: "[" never closed, even with nothing to match
      {"x", "x[", B, false, kErrBadPattern},      // bad: "[" never closed after a full match
      {"b", "[z-a]", B, false, kErrBadPattern},   // bad: range runs backwards
      {"b", "[Z-A]", T, false, kErrBadPattern},   // bad: range runs backwards in text order too
  };
  CheckRows(rows, std::size(rows));
}

TEST(LikePerformance, ManyStarsOnLongTextStayLinearish) {
  const std::string text(20000, 'a');
  const std::string patterns[] = {"*a*a*a*a*b", "*a*a*a*a*a*a*a*a*a*a*a*a*b", "*?*?*?*?*?*?*b", "a*a*a*a*[!a]"};
  auto start = std::chrono::steady_clock::now();
  for (const std::string& p : patterns) {
    SCOPED_TRACE(p);
    EXPECT_FALSE(Like(text, p, B));
    EXPECT_FALSE(Like(text, p, T));
  }
  EXPECT_TRUE(Like(text + "b", "*a*a*a*a*b", B));
  double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
  EXPECT_LT(seconds, 5.0);  // an exponential matcher would take far longer than this
}

}  // namespace
}  // namespace xal
