// DVItems: the text format read by Create and written by ToString (headers, own values, entries,
// the lines that are skipped and the one that stops the read), the merge of defaults and values,
// the deep copy, and the item rules behind them (Add updates, DValue, SubItems on first read).
#include "collections/dv_items.h"

#include <gtest/gtest.h>

#include <functional>

#include "runtime/dispatch.h"

namespace xal {
namespace {

TEST(DVItemsText, CreateThenToString) {
  struct Row {
    const char* what;
    const char* source;
    bool asDefault;
    bool created;
    const char* values;    // ToString(False)
    const char* defaults;  // ToString(True)
  } rows[] = {
      {"header, own value and two entries come back trimmed, in order",
       "  [Main] \r\n *= top \r\nb = 2\r\n a=1  \r\n", false, true,
       "[Main]\r\n*=top\r\nb=2\r\na=1\r\n", "[Main]\r\n*=top\r\nb=2\r\na=1\r\n"},
      {"lines before the first header are skipped", "x=1\r\n*=2\r\nnoequals\r\n[S]\r\ny=3", false, true,
       "[S]\r\ny=3\r\n", "[S]\r\ny=3\r\n"},
      {"[] before any section is skipped", "[]\r\n[S]\r\na=1", false, true, "[S]\r\na=1\r\n", "[S]\r\na=1\r\n"},
      {"[] inside a section has no \"=\" and stops the read", "[S]\r\na=1\r\n[]\r\nb=2", false, false,
       "[S]\r\na=1\r\n", "[S]\r\na=1\r\n"},
      {"an entry without \"=\" stops the read, earlier lines stay", "[S]\r\na=1\r\nnoequals\r\n[T]", false, false,
       "[S]\r\na=1\r\n", "[S]\r\na=1\r\n"},
      {"\"*\" without \"=\" is its own value, star included", "[S]\r\n   *   ", false, true, "[S]\r\n*=*\r\n",
       "[S]\r\n*=*\r\n"},
      {"\"*text\" without \"=\" likewise", "[S]\r\n*abc", false, true, "[S]\r\n*=*abc\r\n", "[S]\r\n*=*abc\r\n"},
      {"text between \"*\" and \"=\" is dropped", "[S]\r\n*own = v", false, true, "[S]\r\n*=v\r\n", "[S]\r\n*=v\r\n"},
      {"as defaults: values write headers only", "[S]\r\n*=top\r\na=1", true, true, "[S]\r\n",
       "[S]\r\n*=top\r\na=1\r\n"},
      {"split at the first \"=\", the value keeps the second", "[S]\r\nf = a=b ", false, true, "[S]\r\nf=a=b\r\n",
       "[S]\r\nf=a=b\r\n"},
      {"a header in other case continues the section, last spelling kept",
       "[Sec]\r\nA=1\r\n[other]\r\n[SEC]\r\na=2\r\nB=3", false, true, "[SEC]\r\na=2\r\nB=3\r\n[other]\r\n",
       "[SEC]\r\na=2\r\nB=3\r\n[other]\r\n"},
      {"an empty value is not written", "[S]\r\na=\r\nb=1\r\n*=", false, true, "[S]\r\nb=1\r\n", "[S]\r\nb=1\r\n"},
      {"empty and blank lines are skipped", "\r\n[S]\r\n\r\n   \r\na=1\r\n\r\n", false, true, "[S]\r\na=1\r\n",
       "[S]\r\na=1\r\n"},
      {"sections are written even when empty", "[A]\r\n[B]", false, true, "[A]\r\n[B]\r\n", "[A]\r\n[B]\r\n"},
      {"nothing at all", "", false, true, "", ""},
      {"the header name keeps inner blanks", "[ x ]\r\na=1", false, true, "[ x ]\r\na=1\r\n", "[ x ]\r\na=1\r\n"},
      {"a header may hold \"=\"", "[a=b]\r\nc=d", false, true, "[a=b]\r\nc=d\r\n", "[a=b]\r\nc=d\r\n"},
      {"an entry may have an empty name", "[S]\r\n = v", false, true, "[S]\r\n=v\r\n", "[S]\r\n=v\r\n"},
      {"a lone LF does not end a line", "[S]\na=1", false, true, "", ""},  // one line, not a header
      {"tabs are not blanks", "[S]\r\n\ta = 1\t", false, true, "[S]\r\n\ta=1\t\r\n", "[S]\r\n\ta=1\t\r\n"},
      {"an entry line that looks half like a header", "[S]\r\n[x=1", false, true, "[S]\r\n[x=1\r\n",
       "[S]\r\n[x=1\r\n"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.what);
    DVItems list;
    EXPECT_EQ(list.Create(r.source, r.asDefault), r.created);
    EXPECT_EQ(list.ToString(false), r.values);
    EXPECT_EQ(list.ToString(true), r.defaults);
  }
}

TEST(DVItemsText, ValuesOverDefaults) {
  DVItems list;
  ASSERT_TRUE(list.Create("[S]\r\n*=d0\r\na=da\r\nb=db\r\n[T]\r\nx=dx", true));
  ASSERT_TRUE(list.Create("[s]\r\nb=vb\r\nc=vc\r\n[U]\r\n*=u", false));
  EXPECT_EQ(list.ToString(true), "[s]\r\n*=d0\r\na=da\r\nb=vb\r\nc=vc\r\n[T]\r\nx=dx\r\n[U]\r\n*=u\r\n");
  EXPECT_EQ(list.ToString(false), "[s]\r\nb=vb\r\nc=vc\r\n[T]\r\n[U]\r\n*=u\r\n");
  EXPECT_EQ(list.Item("S")->SubItems()->Item("b")->DefaultValue(), Variant("db"));  // defaults kept
}

TEST(DVItemsText, AnEmptyValueGivesWayToTheDefault) {
  DVItems list;
  ASSERT_TRUE(list.Create("[S]\r\n*=d\r\na=da\r\nb=db", true));
  ASSERT_TRUE(list.Create("[S]\r\n*=\r\na=", false));
  EXPECT_EQ(list.Item("S")->SubItems()->Item("a")->DValue(), Variant(""));  // "" is a value
  EXPECT_EQ(list.ToString(false), "[S]\r\n");
  EXPECT_EQ(list.ToString(true), "[S]\r\n*=d\r\na=da\r\nb=db\r\n");
}

TEST(DVItemsText, ValuesSetByScriptsAreWrittenInTheirTextForm) {
  struct Row {
    Variant value;
    Variant defaultValue;
    const char* values;
    const char* defaults;
  } rows[] = {
      {Variant(2.5), Variant(), "[S]\r\n*=2.5\r\n", "[S]\r\n*=2.5\r\n"},
      {Variant(true), Variant(), "[S]\r\n*=True\r\n", "[S]\r\n*=True\r\n"},
      {Variant(int16_t{0}), Variant("d"), "[S]\r\n*=0\r\n", "[S]\r\n*=0\r\n"},
      {Variant(), Variant(7), "[S]\r\n", "[S]\r\n*=7\r\n"},
      {Variant::Null(), Variant(), "", ""},                                   // Null has no text form
      {Variant(SafeArray::Vector({Variant(1)})), Variant(), "", ""},           // nor has an array
      {Variant(ObjectRef(MakeRef<DVItems>())), Variant(), "", ""},             // nor an object
      {Variant(), Variant::Null(), "[S]\r\n", ""},                             // a bad default fails only when used
      {Variant(""), Variant::Null(), "[S]\r\n", ""},                           // "" looks behind to the bad default
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(DebugString(r.value) + " / " + DebugString(r.defaultValue));
    DVItems list;
    list.Add("S", r.value, r.defaultValue);
    EXPECT_EQ(list.ToString(false), r.values);
    EXPECT_EQ(list.ToString(true), r.defaults);
  }
  // A failing sub-item spoils the whole text, not just its line.
  DVItems list;
  list.Add("A", Variant("ok"));
  list.Add("B")->SubItems()->Add("bad", Variant::Null());
  EXPECT_EQ(list.ToString(false), "");
}

TEST(DVItems, AddUpdatesAndLeavesOmittedValues) {
  DVItems list;
  Ref<DVItem> a = list.Add("Alpha", Variant(1), Variant(2));
  EXPECT_EQ(list.Add("ALPHA"), a);  // no values given: both stay
  EXPECT_EQ(a->Value(), Variant(1));
  EXPECT_EQ(a->DefaultValue(), Variant(2));
  EXPECT_EQ(a->Key(), "ALPHA");  // the newest spelling
  list.Add("alpha", Variant::Missing(), Variant("d"));
  EXPECT_EQ(a->Value(), Variant(1));
  EXPECT_EQ(a->DefaultValue(), Variant("d"));
  list.Add("alpha", Variant());  // Empty is a value: it clears
  EXPECT_EQ(a->Value(), Variant());
  EXPECT_EQ(list.Count(), 1);
  list.Add("Beta");
  EXPECT_EQ(list.Count(), 2);
  EXPECT_EQ(list.Item("beta")->Key(), "Beta");
}

TEST(DVItems, LookUpsNeverFail) {
  DVItems list;
  list.Add("A", Variant(1));
  EXPECT_EQ(list.Item("zz"), nullptr);
  EXPECT_FALSE(list.Exists("zz"));
  EXPECT_TRUE(list.Exists("a"));
  list.Remove("zz");  // no error
  EXPECT_EQ(list.Count(), 1);
  list.Remove("A");
  EXPECT_EQ(list.Count(), 0);
  list.Add("B");
  list.Clear();
  EXPECT_EQ(list.Count(), 0);
  EXPECT_EQ(list.ToString(true), "");
}

TEST(DVItems, DValue) {
  struct Row {
    Variant value;
    Variant defaultValue;
    Variant expected;
  } rows[] = {
      {Variant(), Variant("d"), Variant("d")},
      {Variant("v"), Variant("d"), Variant("v")},
      {Variant(""), Variant("d"), Variant("")},       // an empty string is not Empty
      {Variant::Null(), Variant("d"), Variant::Null()},
      {Variant(0), Variant("d"), Variant(0)},
      {Variant(), Variant(), Variant()},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(DebugString(r.value));
    DVItems list;
    EXPECT_EQ(list.Add("x", r.value, r.defaultValue)->DValue(), r.expected);
  }
}

TEST(DVItems, SubItemsAreMadeOnFirstRead) {
  DVItems list;
  Ref<DVItem> item = list.Add("S");
  EXPECT_EQ(item->ExistingSubItems(), nullptr);
  Ref<DVItems> subs = item->SubItems();
  ASSERT_NE(subs, nullptr);
  EXPECT_EQ(item->SubItems(), subs);  // the same list every time
  EXPECT_EQ(subs->Count(), 0);
}

TEST(DVItems, ReleasingAnItemEmptiesItsSubItems) {
  Ref<DVItems> subs;
  {
    DVItems list;
    Ref<DVItem> item = list.Add("S");
    subs = item->SubItems();
    subs->Add("a", Variant(1));
    list.Remove("S");
    EXPECT_EQ(subs->Count(), 1);  // still held by `item`
  }
  EXPECT_EQ(subs->Count(), 0);
}

TEST(DVItems, CloneIsDeep) {
  auto tag = MakeRef<DVItems>();
  DVItems original;
  ASSERT_TRUE(original.Create("[S]\r\n*=v\r\na=1\r\nb=2\r\n[T]\r\nc=3", false));
  ASSERT_TRUE(original.Create("[S]\r\na=d1", true));
  Ref<DVItem> s = original.Item("S");
  s->SetCategory("cat");
  s->SetState("dirty");
  s->SetTag(Variant(tag));
  original.Add("Bare");  // never read its sub-items

  Ref<DVItems> copy = original.Clone();
  EXPECT_EQ(copy->ToString(false), original.ToString(false));
  EXPECT_EQ(copy->ToString(true), original.ToString(true));
  Ref<DVItem> cs = copy->Item("S");
  ASSERT_NE(cs, s);
  EXPECT_EQ(cs->Key(), "S");
  EXPECT_EQ(cs->Category(), "cat");
  EXPECT_EQ(cs->State(), "");                   // State is the original's own
  EXPECT_EQ(cs->Tag().AsObject(), tag);         // the same tag object, not a copy
  EXPECT_EQ(cs->SubItems()->Item("a")->DefaultValue(), Variant("d1"));
  EXPECT_EQ(copy->Item("Bare")->ExistingSubItems(), nullptr);
  EXPECT_NE(cs->SubItems(), s->SubItems());

  // Changing the copy at any depth leaves the original as it was.
  const std::string before = original.ToString(true);
  cs->SubItems()->Item("a")->SetValue(Variant("changed"));
  cs->SubItems()->Add("new", Variant(9));
  cs->SetValue(Variant("other"));
  copy->Add("Extra", Variant(1));
  copy->Item("T")->SubItems()->Remove("c");
  EXPECT_EQ(original.ToString(true), before);
  EXPECT_EQ(original.Count(), 3);
  EXPECT_EQ(copy->Count(), 4);
}

TEST(DVItems, EnumeratesInOrder) {
  DVItems list;
  auto b = list.Add("b");
  auto a = list.Add("a");
  Variant all = list.NewEnum();
  ASSERT_TRUE(all.IsArray());
  EXPECT_EQ(all.AsArray().LBound(), 0);
  EXPECT_EQ(all.AsArray().Elements(), (std::vector<Variant>{Variant(b), Variant(a)}));
}

TEST(DVItems, ByNameFromAScript) {
  ObjectRef list = CreateObject("DVItems");
  EXPECT_EQ(Call(list, "Create", {Variant("[S]\r\na=1")}), Variant(true));  // AsDefault omitted: values
  EXPECT_EQ(Call(list, "Create", {Variant("[S]\r\nb=2"), Variant(true)}), Variant(true));
  EXPECT_EQ(Call(list, "ToString"), Variant("[S]\r\na=1\r\n"));
  EXPECT_EQ(Call(list, "ToString", {Variant(true)}), Variant("[S]\r\na=1\r\nb=2\r\n"));
  // Omitted Value leaves the old one; only the default changes.
  Variant s = Call(list, "Add", {Variant("s"), Variant::Missing(), Variant("def")});
  EXPECT_EQ(GetProperty(s.AsObject(), "Value"), Variant());
  EXPECT_EQ(GetProperty(s.AsObject(), "DValue"), Variant("def"));
  PutProperty(s.AsObject(), "Value", Variant("own"));
  EXPECT_EQ(GetProperty(s.AsObject(), "DValue"), Variant("own"));
  Variant subs = GetProperty(s.AsObject(), "SubItems");
  EXPECT_EQ(GetProperty(subs.AsObject(), "Count"), Variant(2));
  std::vector<Variant> key{Variant("A")};
  Variant a = Invoke(subs.AsObject(), 0, MemberKind::Get, key);  // Item, the default member
  EXPECT_EQ(GetProperty(a.AsObject(), "Key"), Variant("a"));
  EXPECT_EQ(GetProperty(subs.AsObject(), "Item", {Variant("zz")}), Variant::Nothing());
  Variant copy = Call(list, "Clone");
  EXPECT_EQ(Call(copy.AsObject(), "ToString", {Variant(true)}), Call(list, "ToString", {Variant(true)}));
  EXPECT_EQ(Call(list, "Exists", {Variant("S")}), Variant(true));
  std::vector<Variant> tag{Variant(list)};
  Invoke(s.AsObject(), "Tag", MemberKind::PutRef, tag);
  EXPECT_EQ(GetProperty(s.AsObject(), "Tag").AsObject(), list);
  PutProperty(s.AsObject(), "Tag", Variant());  // break the cycle the test just made
  try {
    CreateObject("DVItem");
    ADD_FAILURE() << "DVItem is made by its list only";
  } catch (const VbError& e) {
    EXPECT_EQ(e.number(), 429);
  }
  Call(list, "Remove", {Variant("s")});
  Call(list, "Clear");
  EXPECT_EQ(GetProperty(list, "Count"), Variant(0));
}

}  // namespace
}  // namespace xal
