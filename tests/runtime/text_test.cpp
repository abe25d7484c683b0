// Tests of the script text functions: character counting on UTF-8, the edge rows of Mid, Left,
// Right, InStr, InStrRev, Replace and Split, blank-only trimming, Baltic upper/lower casing,
// binary versus text comparison, and the UTF-8 conversions on damaged input.
#include <gtest/gtest.h>

#include "error_of.h"

#include <functional>
#include <string>
#include <vector>

#include "runtime/error.h"
#include "runtime/locale.h"
#include "runtime/text.h"

namespace xal {
namespace {

constexpr CompareMode B = CompareMode::Binary;
constexpr CompareMode T = CompareMode::Text;
constexpr int kOmit = -999;  // "argument left out" in the tables below

// The error number a call raises, 0 when it returns normally.
using ::xal::test::ErrorOf;

TEST(TextLen, CountsCodePoints) {
  struct Row {
    std::string s;
    int32_t expected;
  } rows[] = {
      {"", 0},
      {"abc", 3},
      {"õun", 3},
      {"ĀČĒĢĪĶĻŅŪ", 9},
      {"\U0001F600a", 2},           // a character outside the BMP is one code point
      {"abcdefghõijklmnop", 17},    // non-ASCII in the middle of the word-at-a-time scan
      {"a\xff" "b", 3},             // bad: a stray byte counts as one character
      {"\xe2\x82", 1},              // bad: truncated sequence is one character
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.s);
    EXPECT_EQ(Len(r.s), r.expected);
  }
}

TEST(TextMid, SlicesByCharacter) {
  struct Row {
    std::string s;
    int32_t start, length;
    std::string expected;
    int error;
  } rows[] = {
      {"abcdef", 2, 3, "bcd", 0},
      {"abc", 2, kOmit, "bc", 0},
      {"abc", 5, kOmit, "", 0},
      {"abc", 4, kOmit, "", 0},
      {"abc", 2, 99, "bc", 0},
      {"abc", 3, 0, "", 0},
      {"õunapuu", 2, 3, "una", 0},
      {"aõbõc", 4, kOmit, "õc", 0},
      {"abcdefghijklmnopõ", 17, 1, "õ", 0},
      {"abc", 0, kOmit, "", kErrInvalidCall},  // bad: start must be at least 1
      {"abc", 0, 1, "", kErrInvalidCall},      // bad: start must be at least 1
      {"abc", 1, -1, "", kErrInvalidCall},     // bad: negative length
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.s + " " + std::to_string(r.start) + " " + std::to_string(r.length));
    std::string got;
    int err = ErrorOf([&] { got = r.length == kOmit ? Mid(r.s, r.start) : Mid(r.s, r.start, r.length); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
}

TEST(TextLeftRight, TakeCharactersFromEitherEnd) {
  struct Row {
    bool left;
    std::string s;
    int32_t n;
    std::string expected;
    int error;
  } rows[] = {
      {true, "abc", 5, "abc", 0},
      {true, "abc", 0, "", 0},
      {true, "õäö", 2, "õä", 0},
      {false, "abc", 2, "bc", 0},
      {false, "abc", 9, "abc", 0},
      {false, "abc", 0, "", 0},
      {false, "õäö", 1, "ö", 0},
      {true, "abc", -1, "", kErrInvalidCall},   // bad: negative length
      {false, "abc", -1, "", kErrInvalidCall},  // bad: negative length
  };
  for (const Row& r : rows) {
    SCOPED_TRACE((r.left ? "Left " : "Right ") + r.s + " " + std::to_string(r.n));
    std::string got;
    int err = ErrorOf([&] { got = r.left ? Left(r.s, r.n) : Right(r.s, r.n); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
}

TEST(TextInStr, FindsFirstPositionFromStart) {
  struct Row {
    int32_t start;
    std::string s, find;
    CompareMode mode;
    int32_t expected;
    int error;
  } rows[] = {
      {1, "abc", "", B, 1, 0},
      {3, "abc", "", B, 3, 0},
      {4, "abc", "", B, 4, 0},
      {5, "abc", "", B, 0, 0},
      {1, "", "", B, 0, 0},
      {1, "abc", "x", B, 0, 0},
      {1, "abc", "c", B, 3, 0},
      {4, "abc", "c", B, 0, 0},
      {1, "XXpXXP", "P", T, 3, 0},
      {1, "XXpXXP", "P", B, 6, 0},
      {1, "õunõ", "õ", B, 1, 0},
      {2, "õunõ", "õ", B, 4, 0},
      {1, "ÕUN õun", "õun", B, 5, 0},
      {2, "ÕUN õun", "õun", T, 5, 0},
      {1, "ÕUN õun", "õun", T, 1, 0},
      {1, "Šokolaad", "š", T, 1, 0},
      {1, "Šokolaad", "š", B, 0, 0},
      {1, "ab\xff" "cd", "cd", B, 4, 0},  // bad byte in the text still counts one position
      {1, "Õ\xff" "õ", "õ", B, 3, 0},    // damaged text: binary search stays case-sensitive
      {0, "abc", "a", B, 0, kErrInvalidCall},  // bad: start must be at least 1
      {-3, "", "", B, 0, kErrInvalidCall},     // bad: start checked before anything else
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::to_string(r.start) + " [" + r.s + "] [" + r.find + "] " + (r.mode == T ? "text" : "binary"));
    int32_t got = -1;
    int err = ErrorOf([&] { got = InStr(r.start, r.s, r.find, r.mode); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
}

TEST(TextInStrRev, FindsLastMatchEndingByStart) {
  struct Row {
    std::string s, find;
    int32_t start;
    CompareMode mode;
    int32_t expected;
    int error;
  } rows[] = {
      {"a,b,c", ",", -1, B, 4, 0},
      {"a,b,c", ",", 3, B, 2, 0},
      {"a,b,c", ",", 4, B, 4, 0},
      {"abc", "", -1, B, 3, 0},
      {"abc", "", 2, B, 2, 0},
      {"abc", "x", -1, B, 0, 0},
      {"", "a", -1, B, 0, 0},
      {"abc", "c", 5, B, 0, 0},
      {"abcabc", "bc", 5, B, 2, 0},
      {"õ,õ,õ", "õ", -1, B, 5, 0},
      {"aXbx", "X", -1, T, 4, 0},
      {"aXbx", "X", -1, B, 2, 0},
      {"abc", "a", 0, B, 0, kErrInvalidCall},   // bad: start 0
      {"abc", "a", -2, B, 0, kErrInvalidCall},  // bad: only -1 means "from the end"
  };
  for (const Row& r : rows) {
    SCOPED_TRACE("[" + r.s + "] [" + r.find + "] " + std::to_string(r.start));
    int32_t got = -1;
    int err = ErrorOf([&] { got = InStrRev(r.s, r.find, r.start, r.mode); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
}

TEST(TextReplace, ReplacesFromStartAndDropsThePrefix) {
  struct Row {
    std::string s, find, with;
    int32_t start, count;
    CompareMode mode;
    std::string expected;
    int error;
  } rows[] = {
      {"aXbx", "x", "-", 1, -1, T, "a-b-", 0},
      {"aXbx", "x", "-", 1, -1, B, "aXb-", 0},
      {"abcabc", "b", "", 3, -1, B, "cac", 0},
      {"abc", "", "x", 1, -1, B, "abc", 0},
      {"abc", "", "x", 2, -1, B, "bc", 0},
      {"abcabc", "b", "X", 1, 1, B, "aXcabc", 0},
      {"abc", "b", "X", 1, 0, B, "abc", 0},
      {"abc", "b", "X", 5, -1, B, "", 0},
      {"aaa", "aa", "b", 1, -1, B, "ba", 0},
      {"õunõ", "õ", "o", 1, -1, B, "ouno", 0},
      {"ÕunÕ", "õ", "ä", 2, -1, T, "unä", 0},
      {"a\xff" "a", "a", "b", 1, -1, B, "b\xff" "b", 0},  // a bad byte is carried through as is
      {"abc", "b", "X", 0, -1, B, "", kErrInvalidCall},   // bad: start 0
      {"abc", "b", "X", 1, -2, B, "", kErrInvalidCall},   // bad: count below -1
  };
  for (const Row& r : rows) {
    SCOPED_TRACE("[" + r.s + "] [" + r.find + "] [" + r.with + "] " + std::to_string(r.start));
    std::string got;
    int err = ErrorOf([&] { got = Replace(r.s, r.find, r.with, r.start, r.count, r.mode); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
}

TEST(TextSplit, CutsAtEveryDelimiter) {
  using V = std::vector<std::string>;
  struct Row {
    std::string s, delimiter;
    int32_t limit;
    CompareMode mode;
    V expected;
    int error;
  } rows[] = {
      {"", " ", -1, B, V{}, 0},
      {"abc", ",", -1, B, V{"abc"}, 0},
      {"a,,b", ",", -1, B, V{"a", "", "b"}, 0},
      {"a,b,", ",", -1, B, V{"a", "b", ""}, 0},
      {"a,b,c", ",", 2, B, V{"a", "b,c"}, 0},
      {"a,b,c", ",", 1, B, V{"a,b,c"}, 0},
      {"a,b", "", -1, B, V{"a,b"}, 0},
      {"a b c", " ", -1, B, V{"a", "b", "c"}, 0},
      {"aXbxc", "x", -1, T, V{"a", "b", "c"}, 0},
      {"aXbxc", "x", -1, B, V{"aXb", "c"}, 0},
      {"õ;ä;ö", ";", -1, B, V{"õ", "ä", "ö"}, 0},
      {"ÕaõbÕ", "õ", -1, T, V{"", "a", "b", ""}, 0},
      {"a,b", ",", 0, B, V{}, 0},
      {"a,b", ",", -2, B, V{}, kErrInvalidCall},  // bad: limit below -1
  };
  for (const Row& r : rows) {
    SCOPED_TRACE("[" + r.s + "] [" + r.delimiter + "] " + std::to_string(r.limit));
    V got;
    int err = ErrorOf([&] { got = Split(r.s, r.delimiter, r.limit, r.mode); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
}

TEST(TextSplit, ArrayHasLowerBoundZero) {
  SafeArray empty = SplitToArray("");
  EXPECT_EQ(empty.LBound(), 0);
  EXPECT_EQ(empty.UBound(), -1);
  SafeArray two = SplitToArray("a,õ", ",");
  EXPECT_EQ(two.LBound(), 0);
  ASSERT_EQ(two.UBound(), 1);
  EXPECT_EQ(two.At({1}).AsString(), "õ");
}

TEST(TextJoin, PutsDelimiterBetweenParts) {
  struct Row {
    std::vector<std::string> parts;
    std::string delimiter;
    std::string expected;
  } rows[] = {
      {{"a", "b"}, " ", "a b"},
      {{}, ",", ""},
      {{"x"}, ",", "x"},
      {{"a", "", "c"}, ", ", "a, , c"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(Join(r.parts, r.delimiter), r.expected);
  }
  EXPECT_EQ(Join(std::vector<std::string>{"a", "b"}), "a b");
}

TEST(TextJoin, ArrayElementsGoThroughCStr) {
  struct Row {
    std::vector<Variant> items;
    std::string expected;
  } rows[] = {
      {{Variant("a"), Variant("b")}, "a b"},
      {{Variant("x"), Variant(int32_t{5}), Variant(true)}, "x 5 True"},
      {{}, ""},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.expected);
    EXPECT_EQ(Join(SafeArray::Vector(r.items)), r.expected);
  }
  SafeArray twoDims(std::vector<SafeArray::Bound>{{0, 1}, {0, 1}});
  EXPECT_EQ(ErrorOf([&] { Join(twoDims); }), kErrInvalidCall);  // only a 1-D array can be joined
}

TEST(TextTrim, OnlyPlainBlanks) {
  struct Row {
    std::string s, trim, ltrim, rtrim;
  } rows[] = {
      {"  a b  ", "a b", "a b  ", "  a b"},
      {"\ta", "\ta", "\ta", "\ta"},                       // a tab is not trimmed
      {"\u00A0a\u00A0", "\u00A0a\u00A0", "\u00A0a\u00A0", "\u00A0a\u00A0"},  // nor a no-break space
      {"   ", "", "", ""},
      {"", "", "", ""},
      {" õ ", "õ", "õ ", " õ"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE("[" + r.s + "]");
    EXPECT_EQ(Trim(r.s), r.trim);
    EXPECT_EQ(LTrim(r.s), r.ltrim);
    EXPECT_EQ(RTrim(r.s), r.rtrim);
  }
}

TEST(TextCase, BalticLettersMapOneToOne) {
  struct Row {
    std::string lower, upper;
  } rows[] = {
      {"õäöüšž", "ÕÄÖÜŠŽ"},
      {"āčēģīķļņū", "ĀČĒĢĪĶĻŅŪ"},
      {"ąęėįųū", "ĄĘĖĮŲŪ"},
      {"abc xyz 123", "ABC XYZ 123"},
      {"tänavaõõtsus", "TÄNAVAÕÕTSUS"},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.lower);
    EXPECT_EQ(UCase(r.lower), r.upper);
    EXPECT_EQ(LCase(r.upper), r.lower);
  }
}

TEST(TextCase, NoExpansionsAndBadBytesKept) {
  struct Row {
    std::string s, upper;
  } rows[] = {
      {"ß", "ß"},          // simple mapping: no "SS"
      {"straße", "STRAßE"},
      {"a\xff" "b", "A\xff" "B"},  // bad: the stray byte passes through unchanged
      {"", ""},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.s);
    EXPECT_EQ(UCase(r.s), r.upper);
  }
}

TEST(TextSpaceString, RepeatCharacters) {
  struct Row {
    int32_t n;
    std::string ch;  // empty: Space
    std::string expected;
    int error;
  } rows[] = {
      {3, "", "   ", 0},
      {0, "", "", 0},
      {3, "õx", "õõõ", 0},
      {2, "ab", "aa", 0},
      {-1, "", "", kErrInvalidCall},   // bad: negative count
      {-1, "a", "", kErrInvalidCall},  // bad: negative count
      {2, "\x01", "\x01\x01", 0},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::to_string(r.n) + " [" + r.ch + "]");
    std::string got;
    int err = ErrorOf([&] { got = r.ch.empty() ? Space(r.n) : String(r.n, r.ch); });
    EXPECT_EQ(err, r.error);
    if (!r.error) {
      EXPECT_EQ(got, r.expected);
    }
  }
  EXPECT_EQ(ErrorOf([] { String(2, ""); }), kErrInvalidCall);  // no character to repeat
}

TEST(TextCharCodes, ChrAndAsc) {
  struct Row {
    bool wide;
    int32_t code;
    std::string ch;
    int error;
  } rows[] = {
      {true, 0xF5, "õ", 0},
      {true, 0x1F600, "\U0001F600", 0},
      {true, -1, "\uFFFF", 0},                      // signed 16-bit code of U+FFFF
      {true, 0x41, "A", 0},
      {false, 0x41, "A", 0},
      {false, 0x80, "€", 0},
      {false, 0x8A, "Š", 0},
      {false, 0xF5, "õ", 0},
      {true, 0xD800, "", kErrInvalidCall},          // bad: lone surrogate
      {true, 0x110000, "", kErrInvalidCall},        // bad: beyond Unicode
      {true, -40000, "", kErrInvalidCall},          // bad: below the 16-bit range
      {false, 256, "", kErrInvalidCall},            // bad: Chr takes one byte's worth
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::to_string(r.code));
    std::string got;
    int err = ErrorOf([&] { got = r.wide ? ChrW(r.code) : Chr(r.code); });
    EXPECT_EQ(err, r.error);
    if (r.error) continue;
    EXPECT_EQ(got, r.ch);
    EXPECT_EQ(r.wide ? AscW(got) : Asc(got), r.code < 0 ? r.code + 65536 : r.code);
  }
  EXPECT_EQ(Asc("ā"), '?');  // not on the Windows-1252 page
  EXPECT_EQ(ErrorOf([] { AscW(""); }), kErrInvalidCall);
  EXPECT_EQ(ErrorOf([] { Asc(""); }), kErrInvalidCall);
}

TEST(TextStrComp, BinaryAndTextOrder) {
  struct Row {
    std::string a, b;
    CompareMode mode;
    int32_t expected;
  } rows[] = {
      {"a", "A", B, 1},
      {"a", "A", T, 0},
      {"abc", "abd", B, -1},
      {"A", "Z", B, -1},
      {"Z", "a", B, -1},
      {"z", "Õ", B, -1},
      {"Õ", "õ", B, -1},
      {"õ", "Š", B, -1},
      {"", "a", B, -1},
      {"a", "a", B, 0},
      {"ABC", "abc", T, 0},
      {"ÕUN", "õun", T, 0},
      {"abc", "ABD", T, -1},
      {"b", "A", T, 1},
      {"a", "", T, 1},
      {"Z", "a", T, 1},   // text order ignores the case-first code point layout
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.a + " vs " + r.b + (r.mode == T ? " text" : " binary"));
    EXPECT_EQ(StrComp(r.a, r.b, r.mode), r.expected);
    EXPECT_EQ(StrComp(r.b, r.a, r.mode), -r.expected);
  }
  EXPECT_NE(StrComp("õ", "o", T), 0);  // accents count in text mode
}

TEST(TextEquality, FoldingAgreesWithTextEquals) {
  struct Row {
    std::string a, b;
    bool equal;
  } rows[] = {
      {"ABC", "abc", true},
      {"õ", "o", false},
      {"ÕÄÖÜ", "õäöü", true},
      {"ŠŽ", "šž", true},
      {"ĀČĒĢĪĶĻŅŪ", "āčēģīķļņū", true},
      {"ĄĘĖĮŲŪ", "ąęėįųū", true},
      {"abc", "abcd", false},
      {"", "", true},
      {"a\xff", "A\xff", true},    // bad bytes: equal only to the same bytes
      {"a\xff", "a\xfe", false},   // bad bytes: different bytes differ
      {"\xff", "\uFFFD", false},   // bad byte is not the replacement character itself
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.a + " vs " + r.b);
    EXPECT_EQ(TextEquals(r.a, r.b), r.equal);
    EXPECT_EQ(FoldCase(r.a) == FoldCase(r.b), r.equal);
    EXPECT_EQ(StrComp(r.a, r.b, T) == 0, r.equal);
  }
}

TEST(TextUtf, DecodeAndEncode) {
  struct Row {
    std::string utf8;
    std::u32string utf32;
    std::string back;  // ToUtf8(ToUtf32(utf8))
  } rows[] = {
      {"aõ\U0001F600", U"aõ\U0001F600", "aõ\U0001F600"},
      {"a\xff" "b", U"a\uFFFDb", "a\uFFFDb"},     // bad: stray byte
      {"\xe2\x82", U"\uFFFD", "\uFFFD"},            // bad: truncated sequence
      {"\xc0\xaf", U"\uFFFD\uFFFD", "\uFFFD\uFFFD"},  // bad: overlong "/"
      {"", U"", ""},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.back);
    EXPECT_EQ(ToUtf32(r.utf8), r.utf32);
    EXPECT_EQ(ToUtf8(ToUtf32(r.utf8)), r.back);
  }
  EXPECT_EQ(ToUtf8(std::u32string{char32_t(0xD800), U'a', char32_t(0x110000)}), "\uFFFDa\uFFFD");
}

}  // namespace
}  // namespace xal

namespace xal {
namespace {

// Text comparisons follow the locale's alphabet: in Estonian z sorts before t and ä after õ.
TEST(TextCollation, EstonianAlphabet) {
  EXPECT_EQ(StrComp("z", "t", CompareMode::Text), 1);  // language-neutral: t < z
  RuntimeLocale et;
  et.collation = "et";
  ScopedLocale scope(et);
  struct Row {
    const char* a;
    const char* b;
    int expected;
  } rows[] = {
      {"z", "t", -1},
      {"ä", "õ", 1},
      {"ü", "x", -1},
      {"Šokk", "sokk", 1},
      {"ÕUN", "õun", 0},  // case still ignored
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(std::string(r.a) + " vs " + r.b);
    EXPECT_EQ(StrComp(r.a, r.b, CompareMode::Text), r.expected);
  }
  EXPECT_FALSE(Like("t", "[a-z]", CompareMode::Text));  // t is past z in this alphabet
}

}  // namespace
}  // namespace xal
