// Cost of writing a form's script text: GetScript of a data sheet with 1,000 cells (a 20 x 40
// grid of data cells plus 200 column cells), the size of a large document form.
#include <benchmark/benchmark.h>

#include "layout/cell_info.h"
#include "layout/ds_info.h"

namespace xal {
namespace {

Ref<Cellinfo> BenchCell(int32_t n) {
  auto c = MakeRef<Cellinfo>();
  c->CType = ctData;
  c->SetExpr("GRArticle.Field" + std::to_string(n));
  c->Editable = true;
  c->Valid = "ValidateField(" + std::to_string(n) + ")";
  c->Width = static_cast<int16_t>(100 + n % 50);
  c->Height = 15;
  c->SetCaption("Field " + std::to_string(n));
  c->AddLangString("V\xC3\xA4li " + std::to_string(n), 4);
  return c;
}

Ref<DSInfo> ThousandCellSheet() {
  auto ds = MakeRef<DSInfo>();
  ds->lID = 1;
  ds->SetsCaption("Rows");
  ds->iRows = 20;
  ds->iCols = 40;
  SafeArray grid({SafeArray::Bound{0, 19}, SafeArray::Bound{0, 39}});
  int32_t n = 0;
  for (int32_t r = 0; r < 20; ++r)
    for (int32_t c = 0; c < 40; ++c) grid.At({r, c}) = Variant(BenchCell(n++));
  ds->aCells = Variant(std::move(grid));
  std::vector<Variant> columns;
  while (n < 1000) columns.push_back(Variant(BenchCell(n++)));
  ds->aCS = Variant(SafeArray::Vector(std::move(columns)));
  return ds;
}

void BM_DataSheetScript1000Cells(benchmark::State& state) {
  Ref<DSInfo> ds = ThousandCellSheet();
  size_t bytes = 0;
  for (auto _ : state) {
    std::string sc;
    std::string text = ds->GetScript(sc, 0);
    bytes = text.size();
    benchmark::DoNotOptimize(text);
  }
  state.counters["bytes"] = static_cast<double>(bytes);
}
BENCHMARK(BM_DataSheetScript1000Cells)->Unit(benchmark::kMicrosecond);

}  // namespace
}  // namespace xal
