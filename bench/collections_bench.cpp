// Cost of the collection classes on realistic sizes: reading and writing a default-value list of
// about 100 KB, deep-copying it, and filling and searching a value list of 1,000 entries.
#include <benchmark/benchmark.h>

#include <string>

#include "collections/dv_items.h"
#include "collections/value_texts.h"

namespace xal {
namespace {

// 100 sections of 30 entries each: about 100 KB of text.
std::string DefaultValueText() {
  std::string text;
  for (int s = 0; s < 100; ++s) {
    text += "[Section" + std::to_string(s) + "]\r\n*=own value " + std::to_string(s) + "\r\n";
    for (int e = 0; e < 30; ++e)
      text += "  FieldName" + std::to_string(e) + " = value of field " + std::to_string(e) + "\r\n";
  }
  return text;
}

void BM_DVItemsCreate(benchmark::State& state) {
  const std::string text = DefaultValueText();
  for (auto _ : state) {
    DVItems list;
    benchmark::DoNotOptimize(list.Create(text, false));
  }
  state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(text.size()));
  state.counters["bytes"] = double(text.size());
}
BENCHMARK(BM_DVItemsCreate)->Unit(benchmark::kMillisecond);

void BM_DVItemsToString(benchmark::State& state) {
  DVItems list;
  list.Create(DefaultValueText(), false);
  size_t written = 0;
  for (auto _ : state) {
    std::string s = list.ToString(true);
    written = s.size();
    benchmark::DoNotOptimize(s);
  }
  state.SetBytesProcessed(int64_t(state.iterations()) * int64_t(written));
}
BENCHMARK(BM_DVItemsToString)->Unit(benchmark::kMillisecond);

void BM_DVItemsClone(benchmark::State& state) {
  DVItems list;
  list.Create(DefaultValueText(), false);
  for (auto _ : state) benchmark::DoNotOptimize(list.Clone());
}
BENCHMARK(BM_DVItemsClone)->Unit(benchmark::kMillisecond);

void BM_ValueTextsAdd1000(benchmark::State& state) {
  for (auto _ : state) {
    ValueTexts list;
    for (int32_t i = 0; i < 1000; ++i) list.Add(Variant(i), "Text " + std::to_string(i));
    benchmark::DoNotOptimize(list.Count());
  }
  state.SetItemsProcessed(int64_t(state.iterations()) * 1000);
}
BENCHMARK(BM_ValueTextsAdd1000)->Unit(benchmark::kMicrosecond);

void BM_ValueTextsItem1000(benchmark::State& state) {
  ValueTexts list;
  for (int32_t i = 0; i < 1000; ++i) list.Add(Variant(i), "Text " + std::to_string(i));
  for (auto _ : state) {
    for (int32_t i = 0; i < 1000; ++i) benchmark::DoNotOptimize(list.Item(Variant(i)));
  }
  state.SetItemsProcessed(int64_t(state.iterations()) * 1000);
}
BENCHMARK(BM_ValueTextsItem1000)->Unit(benchmark::kMicrosecond);

// The reverse look-up walks the list: the worst case is a text near the end.
void BM_ValueTextsValueByText(benchmark::State& state) {
  ValueTexts list;
  for (int32_t i = 0; i < 1000; ++i) list.Add(Variant(i), "Text " + std::to_string(i));
  for (auto _ : state) benchmark::DoNotOptimize(list.Value("TEXT 999"));
}
BENCHMARK(BM_ValueTextsValueByText)->Unit(benchmark::kMicrosecond);

}  // namespace
}  // namespace xal
