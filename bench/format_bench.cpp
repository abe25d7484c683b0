// Benchmarks of the number-to-text and text-to-number paths that reports and document exports
// run for every amount they print: CStr and Format of a Double, CCur of a Double, and parsing
// numeric text with thousands separators.
#include <benchmark/benchmark.h>

#include "runtime/convert.h"
#include "runtime/format.h"

namespace {

void BM_CStrDouble(benchmark::State& state) {
  xal::Variant v(1234.5678);
  for (auto _ : state) benchmark::DoNotOptimize(xal::CStr(v));
}
BENCHMARK(BM_CStrDouble);

void BM_CStrThird(benchmark::State& state) {
  xal::Variant v(1.0 / 3);
  for (auto _ : state) benchmark::DoNotOptimize(xal::CStr(v));
}
BENCHMARK(BM_CStrThird);

void BM_FormatFixed(benchmark::State& state) {
  xal::Variant v(2.675);
  for (auto _ : state) benchmark::DoNotOptimize(xal::Format(v, "0.00"));
}
BENCHMARK(BM_FormatFixed);

void BM_FormatGrouped(benchmark::State& state) {
  xal::Variant v(1234567.891);
  for (auto _ : state) benchmark::DoNotOptimize(xal::Format(v, "#,##0.00"));
}
BENCHMARK(BM_FormatGrouped);

void BM_CCurDouble(benchmark::State& state) {
  double x = 1234.5678;
  for (auto _ : state) {
    benchmark::DoNotOptimize(x);
    benchmark::DoNotOptimize(xal::CCur(xal::Variant(x)));
  }
}
BENCHMARK(BM_CCurDouble);

void BM_ParseNumber(benchmark::State& state) {
  std::string text = "1,234.56";
  for (auto _ : state) benchmark::DoNotOptimize(xal::ParseNumber(text));
}
BENCHMARK(BM_ParseNumber);

}  // namespace
