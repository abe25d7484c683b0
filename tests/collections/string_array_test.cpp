// StringArray: lines joined with CR LF after each, split at every CR LF on the way in, single
// lines read and written by number with the array growing to reach them.
#include "collections/string_array.h"

#include <gtest/gtest.h>

#include <functional>

#include "runtime/dispatch.h"

namespace xal {
namespace {

// Every line in brackets, so empty lines show: "[a][][b]".
std::string Lines(const StringArray& sa) {
  std::string s;
  for (int32_t i = 1; i <= sa.Count(); ++i) s += "[" + sa.Text(i) + "]";
  return s;
}

TEST(StringArray, AddAndRead) {
  StringArray sa;
  EXPECT_EQ(sa.Text(), "");
  EXPECT_EQ(sa.Add("a"), 0);
  EXPECT_EQ(sa.Add("b"), 0);  // always 0, not the new count
  struct Row {
    int32_t line;
    const char* expected;
  } rows[] = {
      {-1, "a\r\nb\r\n"},
      {1, "a"},
      {2, "b"},
      {3, ""},   // past the count
      {0, ""},   // lines start at 1
      {-2, ""},  // only -1 means all lines
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.line);
    EXPECT_EQ(sa.Text(r.line), r.expected);
  }
}

TEST(StringArray, Writes) {
  struct Row {
    const char* what;
    std::function<void(StringArray&)> act;
    const char* lines;
    int32_t count;
  } rows[] = {
      {"set line 5 of two", [](StringArray& s) { s.Add("a"); s.Add("b"); s.SetText(5, "e"); }, "[a][b][][][e]", 5},
      {"set an existing line", [](StringArray& s) { s.Add("a"); s.Add("b"); s.SetText(1, "A"); }, "[A][b]", 2},
      {"all with a trailing line end", [](StringArray& s) { s.SetText(-1, "a\r\nb\r\n"); }, "[a][b][]", 3},
      {"all replaces what was there", [](StringArray& s) { s.Add("x"); s.Add("y"); s.Add("z"); s.SetText(-1, "a"); }, "[a]", 1},
      {"one line without a line end, then Add", [](StringArray& s) { s.SetText(-1, "a"); s.Add("b"); }, "[a][b]", 2},
      {"all set to nothing", [](StringArray& s) { s.Add("x"); s.SetText(-1, ""); }, "", 0},
      {"a lone LF or CR does not end a line", [](StringArray& s) { s.SetText(-1, "a\nb\rc\r\nd"); }, "[a\nb\rc][d]", 2},
      {"line 0 does nothing", [](StringArray& s) { s.Add("a"); s.SetText(0, "x"); }, "[a]", 1},
      {"line -2 does nothing", [](StringArray& s) { s.Add("a"); s.SetText(-2, "x"); }, "[a]", 1},
      {"Add after growing by number", [](StringArray& s) { s.SetText(3, "c"); s.Add("d"); }, "[][][c][d]", 4},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.what);
    StringArray sa;
    r.act(sa);
    EXPECT_EQ(Lines(sa), r.lines);
    EXPECT_EQ(sa.Count(), r.count);
  }
}

TEST(StringArray, RoundTripThroughText) {
  StringArray sa;
  sa.SetText(-1, "one\r\n\r\nthree");
  EXPECT_EQ(sa.Text(), "one\r\n\r\nthree\r\n");
  StringArray again;
  again.SetText(-1, sa.Text());
  EXPECT_EQ(again.Count(), 4);  // the closing line end of every line adds an empty last line
}

TEST(StringArray, GrowsPastManyStepsKeepingContents) {
  StringArray sa;
  std::string expected;
  for (int i = 1; i <= 35; ++i) {
    sa.Add("line" + std::to_string(i));
    expected += "line" + std::to_string(i) + "\r\n";
  }
  EXPECT_EQ(sa.Count(), 35);
  EXPECT_EQ(sa.Text(), expected);
  sa.SetText(47, "far");
  EXPECT_EQ(sa.Count(), 47);
  EXPECT_EQ(sa.Text(35), "line35");
  EXPECT_EQ(sa.Text(46), "");
  EXPECT_EQ(sa.Text(47), "far");
}

TEST(StringArray, ByNameFromAScript) {
  ObjectRef sa = CreateObject("StringArray");
  EXPECT_EQ(Call(sa, "Add", {Variant("a")}), Variant(0));
  Call(sa, "Add", {Variant("b")});
  EXPECT_EQ(GetProperty(sa, "Text"), Variant("a\r\nb\r\n"));  // Line defaults to -1
  EXPECT_EQ(GetProperty(sa, "Text", {Variant(2)}), Variant("b"));
  EXPECT_EQ(GetProperty(sa, "Count"), Variant(2));
  // Text put: the line number comes first and may be omitted; the text comes last.
  std::vector<Variant> whole{Variant::Missing(), Variant("x\r\ny")};
  Invoke(sa, "Text", MemberKind::Put, whole);
  EXPECT_EQ(GetProperty(sa, "Count"), Variant(2));
  std::vector<Variant> one{Variant(4), Variant("w")};
  Invoke(sa, "Text", MemberKind::Put, one);
  EXPECT_EQ(GetProperty(sa, "Text"), Variant("x\r\ny\r\n\r\nw\r\n"));
}

}  // namespace
}  // namespace xal
