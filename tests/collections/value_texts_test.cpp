// ValueTexts: entries keyed by the text form of their value, updated in place when the same key
// comes again, the reverse look-up by text in any letter case, and the script view by name.
#include "collections/value_texts.h"

#include <gtest/gtest.h>

#include "error_of.h"

#include <functional>

#include "runtime/dispatch.h"

namespace xal {
namespace {

using ::xal::test::ErrorOf;

TEST(ValueTexts, NumberAndItsTextShareOneEntry) {
  ValueTexts vt;
  Ref<ValueText> first = vt.Add(Variant(1), "one");
  Ref<ValueText> second = vt.Add(Variant("1"), "One again");
  ASSERT_TRUE(first && second);
  EXPECT_EQ(first, second);  // the same entry, updated
  EXPECT_EQ(vt.Count(), 1);
  EXPECT_EQ(second->Key(), "1");
  EXPECT_EQ(second->Value(), Variant("1"));  // the second call's value wins, type and all
  EXPECT_EQ(second->Text(), "One again");
}

TEST(ValueTexts, KeyIsTheTextFormOfTheValue) {
  struct Row {
    Variant value;
    bool added;
    const char* key;
  } rows[] = {
      {Variant(int16_t{7}), true, "7"},
      {Variant(2.5), true, "2.5"},
      {Variant(true), true, "True"},
      {Variant("Abc"), true, "Abc"},
      {Variant(), true, ""},
      {Variant::Null(), false, ""},                                  // Null has no text form
      {Variant(SafeArray::Vector({Variant(1)})), false, ""},          // neither has an array
      {Variant(ObjectRef(MakeRef<ValueTexts>())), false, ""},         // nor an object
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(DebugString(r.value));
    ValueTexts vt;
    Ref<ValueText> e = vt.Add(r.value, "t");
    EXPECT_EQ(e != nullptr, r.added);
    EXPECT_EQ(vt.Count(), r.added ? 1 : 0);
    if (e) {
      EXPECT_EQ(e->Key(), r.key);
      EXPECT_EQ(vt.Item(Variant(r.key)), e);
    }
  }
}

TEST(ValueTexts, ReverseLookUpIgnoresCaseAndTakesTheFirstMatch) {
  ValueTexts vt;
  vt.Add(Variant(1), "Open");
  vt.Add(Variant(2), "Closed");
  vt.Add(Variant(3), "CLOSED");
  vt.Add(Variant(4), "Õun");
  struct Row {
    const char* text;
    Variant expected;
  } rows[] = {
      {"open", Variant(1)},
      {"closed", Variant(2)},  // entries 2 and 3 both match: the first in order wins
      {"CLOSED", Variant(2)},
      {"õUN", Variant(4)},
      {"Open ", Variant()},    // a trailing blank is part of the text
      {"", Variant()},         // no entry has an empty text
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.text);
    EXPECT_EQ(vt.Value(r.text), r.expected);
  }
}

TEST(ValueTexts, MissingEntriesAreNoError) {
  ValueTexts vt;
  vt.Add(Variant("a"), "A");
  EXPECT_EQ(vt.Item(Variant("zz")), nullptr);
  EXPECT_EQ(vt.Item(Variant::Null()), nullptr);
  EXPECT_FALSE(vt.Exists(Variant("zz")));
  EXPECT_TRUE(vt.Exists(Variant("A")));
  EXPECT_EQ(ErrorOf([&] { vt.Remove(Variant("zz")); }), 0);
  EXPECT_EQ(vt.Count(), 1);
  vt.Remove(Variant("A"));
  EXPECT_EQ(vt.Count(), 0);
  vt.Add(Variant("b"), "B");
  vt.Clear();
  EXPECT_EQ(vt.Count(), 0);
  EXPECT_FALSE(vt.Exists(Variant("b")));
}

TEST(ValueTexts, EnumeratesInOrderFromZero) {
  ValueTexts vt;
  auto a = vt.Add(Variant(3), "c");
  auto b = vt.Add(Variant(1), "a");
  vt.Add(Variant(3), "c2");  // an update keeps the entry's place
  Variant all = vt.NewEnum();
  ASSERT_TRUE(all.IsArray());
  EXPECT_EQ(all.AsArray().LBound(), 0);
  EXPECT_EQ(all.AsArray().Elements(), (std::vector<Variant>{Variant(a), Variant(b)}));
}

TEST(ValueTexts, ByNameFromAScript) {
  ObjectRef list = CreateObject("ValueTexts");
  PutProperty(list, "Name", Variant("States"));
  EXPECT_EQ(GetProperty(list, "name"), Variant("States"));
  Variant entry = Call(list, "Add", {Variant(1), Variant("Open")});
  Call(list, "add", {Variant("1"), Variant("Opened"), Variant(4)});
  EXPECT_EQ(GetProperty(list, "Count"), Variant(1));
  std::vector<Variant> key{Variant(1)};
  Variant viaDefault = Invoke(list, 0, MemberKind::Get, key);
  ASSERT_TRUE(viaDefault.IsObject());
  EXPECT_EQ(viaDefault.AsObject(), entry.AsObject());
  EXPECT_EQ(GetProperty(entry.AsObject(), "Text", {Variant(4)}), Variant("Opened"));  // LangID ignored
  EXPECT_EQ(Call(list, "Value", {Variant("OPENED")}), Variant("1"));
  EXPECT_EQ(Call(list, "Exists", {Variant("2")}), Variant(false));
  EXPECT_EQ(GetProperty(list, "Item", {Variant("2")}), Variant::Nothing());

  // Text put: the language comes first and may be omitted; the new text comes last.
  std::vector<Variant> put{Variant::Missing(), Variant("Shut")};
  Invoke(entry.AsObject(), "Text", MemberKind::Put, put);
  EXPECT_EQ(GetProperty(entry.AsObject(), "Text"), Variant("Shut"));

  // Tag hands back the very object it was given.
  ObjectRef other = CreateObject("ValueTexts");
  std::vector<Variant> tag{Variant(other)};
  Invoke(entry.AsObject(), "Tag", MemberKind::PutRef, tag);
  EXPECT_EQ(GetProperty(entry.AsObject(), "Tag").AsObject(), other);
  EXPECT_EQ(ErrorOf([&] { PutProperty(entry.AsObject(), "Key", Variant("x")); }), 438);  // read-only
  EXPECT_EQ(ErrorOf([&] { CreateObject("ValueText"); }), 429);  // made by its list only

  Variant all = GetProperty(list, "NewEnum");
  ASSERT_TRUE(all.IsArray());
  EXPECT_EQ(all.AsArray().Size(), 1u);
  Call(list, "Remove", {Variant(1)});
  Call(list, "Clear");
  EXPECT_EQ(GetProperty(list, "Count"), Variant(0));
}

}  // namespace
}  // namespace xal
