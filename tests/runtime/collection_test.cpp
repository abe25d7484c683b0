// The keyed collection: order, 1-based positions, case-insensitive keys, Before/After, and the
// error numbers for each misuse (nothing is added when Add fails).
#include "runtime/collection.h"

#include <gtest/gtest.h>

#include "error_of.h"

#include "runtime/dispatch.h"

namespace xal {
namespace {

std::string Contents(const KeyedCollection<Variant>& c) {
  std::string s;
  for (const auto& e : c) s += CStr(e.value);
  return s;
}

using ::xal::test::ErrorOf;

TEST(KeyedCollection, SequenceOfAddItemRemove) {
  KeyedCollection<Variant> c;
  c.Add(Variant("a"));
  c.Add(Variant("c"), "CC");
  c.Add(Variant("b"), "BB", Variant(2));
  EXPECT_EQ(Contents(c), "abc");
  c.Add(Variant("d"), std::nullopt, Variant::Missing(), Variant("cc"));  // key match ignores case
  EXPECT_EQ(Contents(c), "abcd");
  EXPECT_EQ(c.Item(Variant("bb")), Variant("b"));
  EXPECT_EQ(c.Item(Variant(3)), Variant("c"));
  EXPECT_EQ(c.Item(Variant(3.0)), Variant("c"));  // any number is a position
  EXPECT_EQ(ErrorOf([&] { c.Add(Variant("x"), "Bb"); }), 457);
  EXPECT_EQ(Contents(c), "abcd");  // nothing added
  c.Remove(Variant(1));
  EXPECT_EQ(c.Item(Variant(1)), Variant("b"));
  EXPECT_EQ(c.Count(), 3);
}

TEST(KeyedCollection, Errors) {
  KeyedCollection<Variant> c;
  c.Add(Variant("a"), "A");
  c.Add(Variant("b"), "B");
  struct Row {
    const char* what;
    std::function<void()> call;
    int expected;
  } rows[] = {
      {"position 0", [&] { c.Item(Variant(0)); }, 9},
      {"position past the end", [&] { c.Item(Variant(3)); }, 9},
      {"unknown key", [&] { c.Item(Variant("zz")); }, 5},
      {"\"1\" is a key, not a position", [&] { c.Item(Variant("1")); }, 5},
      {"Null index", [&] { c.Item(Variant::Null()); }, 13},
      {"Before and After both", [&] { c.Add(Variant("x"), std::nullopt, Variant(1), Variant(1)); }, 5},
      {"Before an unknown key", [&] { c.Add(Variant("x"), std::nullopt, Variant("nope")); }, 5},
      {"After position 9", [&] { c.Add(Variant("x"), std::nullopt, Variant::Missing(), Variant(9)); }, 9},
      {"Remove unknown key", [&] { c.Remove(Variant("q")); }, 5},
      {"Remove position 0", [&] { c.Remove(Variant(0)); }, 9},
  };
  for (auto& r : rows) {
    SCOPED_TRACE(r.what);
    EXPECT_EQ(ErrorOf(r.call), r.expected);
  }
  EXPECT_EQ(c.Count(), 2);
}

TEST(KeyedCollection, KeysFoldNonAsciiCase) {
  KeyedCollection<int> c;
  c.Add(1, "Õun");
  c.Add(2, "ŠOKK");
  EXPECT_NE(c.Find("õUN"), nullptr);
  EXPECT_NE(c.Find("šokk"), nullptr);
  EXPECT_EQ(c.Find("oun"), nullptr);  // õ is not o
  EXPECT_TRUE(c.RemoveKey("ÕUN"));
  EXPECT_FALSE(c.RemoveKey("ÕUN"));
  EXPECT_EQ(c.Count(), 1);
  // A removed key may be used again.
  c.Add(3, "õun");
  EXPECT_EQ(*c.Find("ÕUN"), 3);
}

TEST(KeyedCollection, ScriptObjectByName) {
  ObjectRef col = CreateObject("Collection");
  Call(col, "Add", {Variant("a"), Variant("k1")});
  Call(col, "Add", {Variant("b"), Variant::Missing(), Variant("K1")});  // before "k1"
  EXPECT_EQ(GetProperty(col, "Count"), Variant(2));
  EXPECT_EQ(Call(col, "Item", {Variant(1)}), Variant("b"));
  std::vector<Variant> none{Variant(2)};
  EXPECT_EQ(Invoke(col, 0, MemberKind::Method, none), Variant("a"));  // default member
  Variant all = Call(col, "NewEnum");
  ASSERT_TRUE(all.IsArray());
  EXPECT_EQ(all.AsArray().Elements(), (std::vector<Variant>{Variant("b"), Variant("a")}));
  EXPECT_EQ(ErrorOf([&] { Call(col, "Add", {Variant("c"), Variant(5)}); }), 13);  // a key must be text
}

}  // namespace
}  // namespace xal
