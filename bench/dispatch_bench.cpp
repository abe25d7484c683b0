// Cost of the late-bound path: a call by name of a trivial method, by dispatch id, a property
// get, and Variant copies of the common types.
#include <benchmark/benchmark.h>

#include "runtime/dispatch.h"
#include "typelib/probe.h"

namespace xal {
namespace {

void BM_InvokeByName(benchmark::State& state) {
  ObjectRef probe = CreateObject("XALProbe");
  std::vector<Variant> args{Variant(2), Variant(3)};
  for (auto _ : state) {
    args[0] = Variant(2);
    args[1] = Variant(3);
    benchmark::DoNotOptimize(Invoke(probe, "Add", MemberKind::Method, args));
  }
}
BENCHMARK(BM_InvokeByName);

void BM_InvokeByNameMixedCase(benchmark::State& state) {
  ObjectRef probe = CreateObject("XALProbe");
  std::vector<Variant> args{Variant(2)};
  for (auto _ : state) {
    args[0] = Variant(2);
    benchmark::DoNotOptimize(Invoke(probe, "aDD", MemberKind::Method, args));
  }
}
BENCHMARK(BM_InvokeByNameMixedCase);

void BM_InvokeById(benchmark::State& state) {
  ObjectRef probe = CreateObject("XALProbe");
  int32_t id = ClassOf(*probe)->Find("Add", MemberKind::Method)->dispid;
  std::vector<Variant> args{Variant(2), Variant(3)};
  for (auto _ : state) {
    args[0] = Variant(2);
    args[1] = Variant(3);
    benchmark::DoNotOptimize(Invoke(probe, id, MemberKind::Method, args));
  }
}
BENCHMARK(BM_InvokeById);

void BM_PropertyGetString(benchmark::State& state) {
  ObjectRef probe = CreateObject("XALProbe");
  PutProperty(probe, "Name", Variant("document"));
  std::vector<Variant> none;
  for (auto _ : state) benchmark::DoNotOptimize(Invoke(probe, "Name", MemberKind::Get, none));
}
BENCHMARK(BM_PropertyGetString);

void BM_VariantCopy(benchmark::State& state) {
  Variant v;
  switch (state.range(0)) {
    case 0: v = Variant(42); break;
    case 1: v = Variant(Currency::FromRaw(123456)); break;
    case 2: v = Variant("a short text"); break;
    case 3: v = Variant(std::string(200, 'x')); break;
    case 4: v = Variant(CreateObject("XALProbe")); break;
    default: v = Variant(SafeArray::Vector({Variant(1), Variant("a"), Variant(2.5)})); break;
  }
  for (auto _ : state) {
    Variant copy = v;
    benchmark::DoNotOptimize(copy);
  }
  state.SetLabel(VarTypeName(v.Type()));
}
BENCHMARK(BM_VariantCopy)->DenseRange(0, 5);

}  // namespace
}  // namespace xal
