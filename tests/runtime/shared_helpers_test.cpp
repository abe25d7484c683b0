// The small shared helpers every layer calls instead of writing its own: ASCII letter case for
// the system's own names, and reading a host value with a default for Empty and Null.
#include <gtest/gtest.h>

#include "error_of.h"
#include "runtime/ascii.h"
#include "runtime/convert.h"

namespace xal {
namespace {

using test::ErrorOf;

TEST(AsciiCase, OnlyAsciiLettersChange) {
  struct Row {
    const char* a;
    const char* b;
    bool equal;
  };
  const Row rows[] = {
      {"GetBalance", "GETBALANCE", true},
      {"", "", true},
      {"a", "", false},      // lengths differ
      {"[", "{", false},     // '[' + 32 is '{': only A-Z move
      {"@", "`", false},     // '@' + 32 is '`'
      {"Ä", "ä", false},     // UTF-8 letters are not folded here
      {"x_1$", "X_1$", true},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::string(r.a) + " ~ " + r.b);
    EXPECT_EQ(AsciiEqualsNoCase(r.a, r.b), r.equal);
  }
  EXPECT_EQ(AsciiLower("Dëcimal [Z]"), "dëcimal [z]");
  EXPECT_EQ(AsciiUpper('z'), 'Z');
  EXPECT_EQ(AsciiUpper('{'), '{');
  EXPECT_TRUE(AsciiStartsWithNoCase("varchar(50)", "VARCHAR"));
  EXPECT_FALSE(AsciiStartsWithNoCase("VAR", "VARCHAR"));  // shorter than the prefix
}

TEST(ValueOr, EmptyAndNullGiveTheFallbackOthersConvert) {
  EXPECT_EQ(ValueOr(Variant(), 7.5), 7.5);
  EXPECT_EQ(ValueOr(Variant::Null(), 7.5), 7.5);
  EXPECT_EQ(ValueOr(Variant("2.5"), 0.0), 2.5);
  EXPECT_EQ(ValueOr(Variant(2.5), int32_t{9}), 2);                 // half to even, as CLng
  EXPECT_EQ(ValueOr(Variant::Null(), int32_t{9}), 9);
  EXPECT_EQ(ValueOr(Variant(1.23456), Currency()), CCur(Variant(1.23456)));
  EXPECT_EQ(ValueOr(Variant(), Date(3.0)).serial, 3.0);
  EXPECT_EQ(ValueOr(Variant(40179), Date()).serial, 40179.0);
  EXPECT_EQ(ValueOr(Variant::Null(), std::string("none")), "none");
  EXPECT_EQ(ValueOr(Variant(12), std::string()), "12");
  EXPECT_EQ(ErrorOf([] { ValueOr(Variant("abc"), 0.0); }), kErrTypeMismatch);  // not Empty/Null: CDbl's error
}

TEST(IsTrue, OnlyANonZeroValueIsTrue) {
  struct Row {
    Variant v;
    bool expected;
  };
  const Row rows[] = {
      {Variant(), false},  {Variant::Null(), false}, {Variant(0), false}, {Variant(-1), true},
      {Variant(0.5), true}, {Variant(true), true},   {Variant("True"), true}, {Variant("0"), false},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(DebugString(r.v));
    EXPECT_EQ(IsTrue(r.v), r.expected);
  }
  EXPECT_EQ(ErrorOf([] { IsTrue(Variant("maybe")); }), kErrTypeMismatch);
}

}  // namespace
}  // namespace xal
