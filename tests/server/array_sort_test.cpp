// The in-place array sort: text compared without case, numbers as numbers, mixed types, odd
// bounds, 2-D arrays ordered by their first column with rows kept whole, and large sorted,
// reversed, uniform and random inputs that a recursive or first-element-pivot sort would not
// survive (the middle pivot makes those fast; an "organ pipe" input is still quadratic).
#include <gtest/gtest.h>

#include "error_of.h"

#include <algorithm>
#include <functional>
#include <random>

#include "runtime/convert.h"
#include "runtime/operators.h"
#include "server/array_sort.h"

namespace xal::server {
namespace {

using ::xal::test::ErrorOf;

// Equal under the sort's own comparison ("b" equals "B").
bool SameKey(const Variant& a, const Variant& b) { return Compare(a, b, CompareMode::Text) == 0; }

TEST(ArraySort, OneDimension) {
  struct Row {
    const char* name;
    std::vector<Variant> input;
    std::vector<Variant> expected;  // compared without case
  } rows[] = {
      {"text", {"pear", "Apple", "fig", "banana"}, {"Apple", "banana", "fig", "pear"}},
      {"case does not count", {"b", "a", "B", "c", "A"}, {"a", "A", "b", "b", "c"}},
      {"numbers as numbers", {int32_t{10}, int32_t{9}, int32_t{100}, int32_t{2}},
       {int32_t{2}, int32_t{9}, int32_t{10}, int32_t{100}}},
      {"mixed number types", {2.5, Currency::FromInt(2), int16_t{1}, -0.5}, {-0.5, int16_t{1}, int32_t{2}, 2.5}},
      {"numbers before text", {"b", int32_t{1}, "a", 0.5}, {0.5, int32_t{1}, "a", "b"}},
      {"duplicates", {int32_t{3}, int32_t{1}, int32_t{3}, int32_t{1}, int32_t{2}},
       {int32_t{1}, int32_t{1}, int32_t{2}, int32_t{3}, int32_t{3}}},
      {"two", {"z", "y"}, {"y", "z"}},
      {"one", {"z"}, {"z"}},
      {"none", {}, {}},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.name);
    Variant a(SafeArray::Vector(r.input, 3));  // a lower bound other than 0 or 1
    ArraySort(a);
    const SafeArray& sorted = a.AsArray();
    ASSERT_EQ(sorted.Size(), r.expected.size());
    EXPECT_EQ(sorted.LBound(), 3);
    for (size_t i = 0; i < r.expected.size(); ++i) {
      SCOPED_TRACE(i);
      EXPECT_TRUE(SameKey(sorted.Elements()[i], r.expected[i])) << DebugString(sorted.Elements()[i]);
    }
  }
}

TEST(ArraySort, TwoDimensionsKeepRowsTogether) {
  // Rows (key, payload, payload); the payload tells which row moved where.
  const std::vector<std::vector<Variant>> input = {
      {"b", int32_t{1}, "row b"}, {"C", int32_t{2}, "row C"}, {"a", int32_t{3}, "row a"}, {"B", int32_t{4}, "row B"}};
  SafeArray a({{1, 4}, {0, 2}});
  for (int32_t i = 0; i < 4; ++i)
    for (int32_t c = 0; c < 3; ++c) a.At({i + 1, c}) = input[i][c];
  Variant v(a);
  ArraySort(v);
  const SafeArray& s = v.AsArray();
  const char* expectedKeys[] = {"a", "b", "b", "c"};
  for (int32_t i = 1; i <= 4; ++i) {
    SCOPED_TRACE(i);
    EXPECT_TRUE(SameKey(s.At({i, 0}), Variant(expectedKeys[i - 1])));
    // Whatever row landed here, its payload is its own.
    const int32_t original = CLng(s.At({i, 1})) - 1;
    EXPECT_EQ(s.At({i, 0}), input[original][0]);
    EXPECT_EQ(s.At({i, 2}), input[original][2]);
  }
}

TEST(ArraySort, NotAnArrayIsLeftAlone) {
  const Variant rows[] = {Variant(), Variant(int32_t{5}), Variant("text"), Variant::Null()};
  for (const Variant& r : rows) {
    SCOPED_TRACE(DebugString(r));
    Variant v = r;
    ArraySort(v);
    EXPECT_EQ(v, r);
  }
}

TEST(ArraySort, ThreeDimensionsFail) {
  Variant v(SafeArray({{0, 1}, {0, 1}, {0, 1}}));
  EXPECT_EQ(ErrorOf([&] { ArraySort(v); }), kErrSubscript);  // a row of a 3-D array has no single key
}

TEST(ArraySort, LargeInputsOfEveryShape) {
  constexpr int32_t n = 10000;
  std::mt19937 rng(42);
  struct Row {
    const char* name;
    std::function<int32_t(int32_t)> value;
  } rows[] = {
      {"sorted", [](int32_t i) { return i; }},
      {"reversed", [](int32_t i) { return n - i; }},
      {"all equal", [](int32_t) { return 7; }},
      {"random", [&](int32_t) { return static_cast<int32_t>(rng() % 1000); }},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(r.name);
    std::vector<Variant> items;
    std::vector<int32_t> expected;
    for (int32_t i = 0; i < n; ++i) {
      const int32_t x = r.value(i);
      items.emplace_back(x);
      expected.push_back(x);
    }
    std::sort(expected.begin(), expected.end());
    Variant v(SafeArray::Vector(std::move(items)));
    ArraySort(v);
    const auto& got = v.AsArray().Elements();
    ASSERT_EQ(got.size(), expected.size());
    for (size_t i = 0; i < expected.size(); ++i)
      if (got[i].AsLong() != expected[i]) FAIL() << "element " << i << " is " << got[i].AsLong();
  }
}

}  // namespace
}  // namespace xal::server
