// LOItems: positions kept in each item's Index through adds, inserts and removals; the keyed
// collection's errors for missing and duplicate keys; the case rule of Caption and ToolTipText;
// and the weak tie from an item to its list.
#include "collections/lo_items.h"

#include <gtest/gtest.h>

#include "error_of.h"

#include <functional>

#include "runtime/dispatch.h"

namespace xal {
namespace {

using ::xal::test::ErrorOf;

// "key:index" of every item in collection order.
std::string Indices(const LOItems& list) {
  std::string s;
  for (const auto& e : list.items()) {
    if (!s.empty()) s += ' ';
    s += e.value->Key() + ":" + std::to_string(e.value->Index());
  }
  return s;
}

TEST(LOItems, IndicesFollowPositions) {
  auto list = MakeRef<LOItems>();
  struct Step {
    const char* what;
    std::function<void()> act;
    const char* expected;
  } steps[] = {
      {"add a", [&] { list->Add("A", "a"); }, "a:1"},
      {"add b", [&] { list->Add("B", "b"); }, "a:1 b:2"},
      {"add c", [&] { list->Add("C", "c"); }, "a:1 b:2 c:3"},
      {"remove the second", [&] { list->Remove(Variant(2)); }, "a:1 c:2"},
      {"add d before the first", [&] { list->Add("D", "d", Variant(1)); }, "d:1 a:2 c:3"},
      {"add e after key a", [&] { list->Add("E", "e", Variant::Missing(), Variant("A")); }, "d:1 a:2 e:3 c:4"},
      {"remove by key in other case", [&] { list->Remove(Variant("D")); }, "a:1 e:2 c:3"},
      {"remove the last", [&] { list->Remove(Variant(3)); }, "a:1 e:2"},
      {"add without a key", [&] { list->Add("F"); }, "a:1 e:2 :3"},
  };
  for (const auto& s : steps) {
    SCOPED_TRACE(s.what);
    s.act();
    EXPECT_EQ(Indices(*list), s.expected);
  }
}

TEST(LOItems, AddSetsCaptionKeyAndList) {
  auto list = MakeRef<LOItems>();
  Ref<LOItem> item = list->Add("Price", "colPrice");
  EXPECT_EQ(item->Caption(), "Price");
  EXPECT_EQ(item->Key(), "colPrice");
  EXPECT_EQ(item->List(), list);
  EXPECT_EQ(list->Item(Variant("COLPRICE")), item);
  EXPECT_EQ(list->Item(Variant(1)), item);
  // An item without a key is reached by position only.
  Ref<LOItem> anon = list->Add("Qty");
  EXPECT_EQ(anon->Key(), "");
  EXPECT_EQ(list->Item(Variant(2)), anon);
  EXPECT_FALSE(list->Exists(Variant("")));
}

TEST(LOItems, FailuresReachTheCallerAndChangeNothing) {
  auto list = MakeRef<LOItems>();
  list->Add("A", "a");
  list->Add("B", "b");
  struct Row {
    const char* what;
    std::function<void()> call;
    int expected;
  } rows[] = {
      {"Item of a missing key", [&] { list->Item(Variant("zz")); }, 5},
      {"Item at position 0", [&] { list->Item(Variant(0)); }, 9},
      {"Item past the end", [&] { list->Item(Variant(3)); }, 9},
      {"Item of Null", [&] { list->Item(Variant::Null()); }, 13},
      {"Remove of a missing key", [&] { list->Remove(Variant("zz")); }, 5},
      {"Remove past the end", [&] { list->Remove(Variant(3)); }, 9},
      {"Add of a key already there, other case", [&] { list->Add("X", "B"); }, 457},
      {"Add before a missing key", [&] { list->Add("X", "x", Variant("zz")); }, 5},
      {"Add with Before and After both", [&] { list->Add("X", "x", Variant(1), Variant(2)); }, 5},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.what);
    EXPECT_EQ(ErrorOf(r.call), r.expected);
    EXPECT_EQ(Indices(*list), "a:1 b:2");
  }
}

TEST(LOItems, ExistsNeverFails) {
  auto list = MakeRef<LOItems>();
  list->Add("A", "a");
  struct Row {
    Variant key;
    bool expected;
  } rows[] = {
      {Variant("a"), true},
      {Variant("A"), true},
      {Variant(1), true},
      {Variant(1.0), true},
      {Variant("b"), false},
      {Variant(2), false},        // past the end
      {Variant(0), false},        // positions start at 1
      {Variant::Null(), false},   // neither a position nor a key
      {Variant(SafeArray()), false},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(DebugString(r.key));
    EXPECT_EQ(list->Exists(r.key), r.expected);
  }
}

TEST(LOItems, CaptionAndToolTipKeepTheirSpellingForACaseOnlyChange) {
  struct Row {
    const char* before;
    const char* assigned;
    const char* after;
  } rows[] = {
      {"Amount", "AMOUNT", "Amount"},  // same text ignoring case: not assigned
      {"Amount", "amount", "Amount"},
      {"Õun", "ÕUN", "Õun"},
      {"Amount", "Amount ", "Amount "},
      {"Amount", "Sum", "Sum"},
      {"Amount", "", ""},
      {"", "x", "x"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(std::string(r.before) + " <- " + r.assigned);
    LOItem item;
    item.SetCaption(r.before);
    item.SetToolTipText(r.before);
    item.SetCaption(r.assigned);
    item.SetToolTipText(r.assigned);
    EXPECT_EQ(item.Caption(), r.after);
    EXPECT_EQ(item.ToolTipText(), r.after);
  }
}

TEST(LOItems, AnItemOutlivingItsListDoesNotKeepItAlive) {
  Ref<LOItem> survivor;
  WeakRef<LOItems> watch;
  {
    auto list = MakeRef<LOItems>();
    watch = list;
    survivor = list->Add("Name", "name");
    list->Add("Other", "other");
    EXPECT_EQ(survivor->List(), list);
  }
  EXPECT_TRUE(watch.expired());          // the item's back reference did not hold the list
  EXPECT_EQ(survivor->List(), nullptr);  // and the item knows its list is gone
  EXPECT_EQ(survivor->Caption(), "Name");
  EXPECT_EQ(survivor->Index(), 1);
  survivor->SetCaption("Still usable");
  EXPECT_EQ(GetProperty(survivor, "Caption"), Variant("Still usable"));
}

TEST(LOItems, RemovedAndClearedItemsLeaveTheList) {
  auto list = MakeRef<LOItems>();
  Ref<LOItem> a = list->Add("A", "a");
  Ref<LOItem> b = list->Add("B", "b");
  Ref<LOItem> c = list->Add("C", "c");
  list->Remove(Variant("a"));
  EXPECT_EQ(a->List(), nullptr);
  EXPECT_EQ(a->Index(), 1);
  list->Clear();
  EXPECT_EQ(list->Count(), 0);
  EXPECT_EQ(b->List(), nullptr);
  EXPECT_EQ(b->Index(), 1);  // indices of items held elsewhere stay as they were
  EXPECT_EQ(c->Index(), 2);
  Ref<LOItem> d = list->Add("D", "b");  // the old keys are free again
  EXPECT_EQ(d->Index(), 1);
}

TEST(LOItems, ByNameFromAScript) {
  ObjectRef list = CreateObject("LOItems");
  Variant a = Call(list, "Add", {Variant("Code"), Variant("code")});
  Call(list, "Add", {Variant("Name"), Variant("name")});
  Variant first = Call(list, "Add", {Variant("Id"), Variant("id"), Variant(1)});
  EXPECT_EQ(GetProperty(first.AsObject(), "Index"), Variant(int16_t{1}));
  EXPECT_EQ(GetProperty(a.AsObject(), "Index"), Variant(int16_t{2}));
  EXPECT_EQ(GetProperty(list, "Count"), Variant(3));
  std::vector<Variant> key{Variant("NAME")};
  EXPECT_EQ(Invoke(list, 0, MemberKind::Get, key).AsObject(), Call(list, "Item", {Variant(3)}).AsObject());
  EXPECT_EQ(ErrorOf([&] { Call(list, "Item", {Variant("missing")}); }), 5);
  EXPECT_EQ(ErrorOf([&] { Call(list, "Add", {Variant("Again"), Variant("CODE")}); }), 457);
  EXPECT_EQ(Call(list, "Exists", {Variant("missing")}), Variant(false));
  Call(list, "Remove", {Variant(1)});
  EXPECT_EQ(GetProperty(a.AsObject(), "Index"), Variant(int16_t{1}));

  ObjectRef item = a.AsObject();
  struct Row {
    const char* property;
    Variant value;
    Variant expected;
  } rows[] = {
      {"Visible", Variant(true), Variant(true)},
      {"Skip", Variant(1), Variant(true)},
      {"Width", Variant(1200), Variant(int16_t{1200})},
      {"Name", Variant("fldCode"), Variant("fldCode")},
      {"Locked", Variant(true), Variant(true)},
      {"Script", Variant("s"), Variant("s")},
      {"Show", Variant("sh"), Variant("sh")},
      {"When", Variant("w"), Variant("w")},
      {"Valid", Variant("v"), Variant("v")},
      {"AddNew", Variant("an"), Variant("an")},
      {"Delete", Variant("d"), Variant("d")},
      {"Filter", Variant("f"), Variant("f")},
      {"Order", Variant("o"), Variant("o")},
      {"Caption", Variant("CODE"), Variant("Code")},  // differs in case only: unchanged
      {"Enabled", Variant(true), Variant(true)},
      {"ToolTipText", Variant("Tip"), Variant("Tip")},
      {"Tag", Variant(2.5), Variant(2.5)},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.property);
    PutProperty(item, r.property, r.value);
    EXPECT_EQ(GetProperty(item, r.property), r.expected);
  }
  EXPECT_EQ(ErrorOf([&] { PutProperty(item, "Index", Variant(5)); }), 438);  // read-only
  EXPECT_EQ(ErrorOf([&] { PutProperty(item, "Key", Variant("k")); }), 438);
  EXPECT_EQ(ErrorOf([&] { PutProperty(item, "Width", Variant(40000)); }), 6);  // Width is 16-bit
  Variant all = GetProperty(list, "NewEnum");
  ASSERT_TRUE(all.IsArray());
  EXPECT_EQ(all.AsArray().Elements().front().AsObject(), item);
}

}  // namespace
}  // namespace xal
