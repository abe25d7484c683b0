// Benchmarks of the text and date functions that document scripts call in tight loops: Len, Mid
// and InStr on ASCII and on Estonian text, UCase, Like with stars, and date splitting and text.
// ASCII inputs should stay on the byte paths; the non-ASCII ones show the cost of decoding.
#include <benchmark/benchmark.h>

#include <string>

#include "runtime/dates.h"
#include "runtime/text.h"

namespace {

// 100 characters each: plain ASCII, and Estonian with a non-ASCII letter every few characters.
std::string AsciiText() {
  std::string s;
  while (s.size() < 100) s += "invoice line ";
  s.resize(99);
  return s + "Z";
}

std::string EstonianText() {
  std::string s;
  while (xal::Len(s) < 100) s += "õun ära söö ";
  return xal::Left(s, 99) + "Ž";
}

void BM_LenAscii(benchmark::State& st) {
  std::string s = AsciiText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::Len(s));
}
void BM_LenEstonian(benchmark::State& st) {
  std::string s = EstonianText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::Len(s));
}
void BM_MidAscii(benchmark::State& st) {
  std::string s = AsciiText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::Mid(s, 60, 10));
}
void BM_MidEstonian(benchmark::State& st) {
  std::string s = EstonianText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::Mid(s, 60, 10));
}
void BM_InStrAscii(benchmark::State& st) {
  std::string s = AsciiText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::InStr(s, "Z"));
}
void BM_InStrEstonian(benchmark::State& st) {
  std::string s = EstonianText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::InStr(s, "Ž"));
}
void BM_InStrTextAscii(benchmark::State& st) {
  std::string s = AsciiText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::InStr(1, s, "z", xal::CompareMode::Text));
}
void BM_InStrTextEstonian(benchmark::State& st) {
  std::string s = EstonianText();
  for (auto _ : st) benchmark::DoNotOptimize(xal::InStr(1, s, "ž", xal::CompareMode::Text));
}
void BM_UCaseEstonianWord(benchmark::State& st) {
  std::string s = "jäätisemüüja õõnestas šokolaadi";
  for (auto _ : st) benchmark::DoNotOptimize(xal::UCase(s));
}
void BM_LikeStars(benchmark::State& st) {
  std::string s = "abcdefghijklmnopqrstuvwxyz0123456789";
  for (auto _ : st) benchmark::DoNotOptimize(xal::Like(s, "*b*c"));
}
void BM_DateToString(benchmark::State& st) {
  xal::Date d(45351.75);
  for (auto _ : st) benchmark::DoNotOptimize(xal::DateToString(d));
}
void BM_SplitDate(benchmark::State& st) {
  xal::Date d(-49192.24);
  for (auto _ : st) benchmark::DoNotOptimize(xal::SplitDate(d));
}

}  // namespace

BENCHMARK(BM_LenAscii);
BENCHMARK(BM_LenEstonian);
BENCHMARK(BM_MidAscii);
BENCHMARK(BM_MidEstonian);
BENCHMARK(BM_InStrAscii);
BENCHMARK(BM_InStrEstonian);
BENCHMARK(BM_InStrTextAscii);
BENCHMARK(BM_InStrTextEstonian);
BENCHMARK(BM_UCaseEstonianWord);
BENCHMARK(BM_LikeStars);
BENCHMARK(BM_DateToString);
BENCHMARK(BM_SplitDate);
