// Taxes of a document: the header's tax code and entered tax, each row's tax code and entered tax
// amount. A header tax code is carried into every row (and every particular of a set row); a
// change of a row's tax code or tax amount makes the next totals pass a full one.
#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/internal/rows.h"
#include "docfunc/values.h"
#include "runtime/text.h"

namespace xal {

using docfunc::CurrencyOf;
using docfunc::DoubleOf;
using docfunc::LongOf;
using docfunc::RoundedMoney;
using docfunc::TrimmedOf;

// ---------------------------------------------------------------------------------------------
// May the tax be edited?
// ---------------------------------------------------------------------------------------------

// The header's tax amount may be entered only under a header tax code.
bool DocFunc::WTaxAmount() {
  return Handle("WTaxAmount", [&](bool& result) { result = LongOf(st_.HeaderOB->Field("IDGRTax")) != 0; });
}

// A row's tax amount may be entered when the header has no tax code and the row has one; the
// amount before the edit is kept (0 on a new row).
bool DocFunc::WRowTaxAmount() {
  return Handle("WRowTaxAmount", [&](bool& result) {
    DataObject& row = *st_.RowOB;
    if (LongOf(st_.HeaderOB->Field("IDGRTax")) != 0 || LongOf(row.Field("IDGRTax")) == 0) return;
    st_.OldRowTax = st_.Doc->OnNewRow() ? Currency() : CurrencyOf(row.Field("TaxAmount"));
    result = true;
  });
}

// A row's tax code: on a row form only under a set shown by its particulars that has no tax code
// of its own; on a header form only when the header has no tax code (the rate before the edit is
// kept).
bool DocFunc::WRowTax() {
  return Handle("WRowTax", [&](bool& result) {
    if (st_.IsRowArea) {
      DataObject& set = *st_.RowsOB;
      result = LongOf(set.Field("IDGRTax")) == 0 && CompletionType(set) == "D";
      return;
    }
    if (LongOf(st_.HeaderOB->Field("IDGRTax")) != 0) return;
    st_.OldRowTax = CurrencyOf(st_.RowOB->Field("GRTax.TaxPercent"));
    result = true;
  });
}

// ---------------------------------------------------------------------------------------------
// After a tax changed
// ---------------------------------------------------------------------------------------------

// After a row's tax code changed:
//   1. No tax code: the row's tax amounts become 0 (documents with row taxes).
//   2. A set row passes its tax code on to its particulars.
//   3. With discounts the row's figures are shown again (VAmount).
//   4. The totals are rebuilt from the rows by the next pass, which looks for entered row taxes
//      afresh; that pass runs when the outermost handler leaves.
bool DocFunc::VRowTax() {
  return Handle("VRowTax", [&](bool& result) {
    DataObject& row = *st_.RowOB;
    const int32_t tax = LongOf(row.Field("IDGRTax"));
    if (tax == 0) {
      if (st_.UseRowTax) ClearRowTaxes(row);
    } else if (!CompletionType(row).empty()) {
      ForEachPart([&](Ref<DataObject>& part) {
        part->SetField("IDGRTax", Variant(tax));
        part->UpdateRow(true, false, false);
      });
    }
    if (st_.UseDiscounts) {
      st_.OldAmount = CurrencyOf(row.Field("Amount"));
      VAmount();
    }
    st_.TotalsReady = false;
    st_.RowTaxEntered = false;
    st_.TotalsPending = true;
    result = true;
  });
}

// After a row's tax amount was entered: as after a change of its tax code, and the header shown
// again. True also when something failed.
bool DocFunc::VRowTaxAmount() {
  return HandleAlwaysTrue("VRowTaxAmount", [&](bool& result) {
    VRowTax();
    st_.OldAmount = CurrencyOf(st_.RowOB->Field("Amount"));
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

// After the header's tax amount was entered: the totals are rebuilt in full.
bool DocFunc::VTaxAmount() {
  return Handle("VTaxAmount", [&](bool& result) {
    st_.FullTotalsPending = true;
    result = true;
  });
}

// After the header's tax code changed:
//   1. No tax code: the header's tax amounts become 0; on a document with rows the user is asked
//      (unless the company validation switched the question off) whether the rows lose their
//      tax too; only Yes takes it from every row and particular.
//   2. A tax code: every row and particular gets it; the totals are ready (rates only).
//   3. Either way the rows are written back, the browser refreshed, the totals rebuilt in full.
bool DocFunc::VTax() {
  return Handle("VTax", [&](bool& result) {
    DataObject& header = *st_.HeaderOB;
    const int32_t tax = LongOf(header.Field("IDGRTax"));
    if (tax == 0) {
      for (const char* field : {"TaxAmount", "TaxAmountBase", "TaxAmountRef"}) header.SetField(field, Variant(Currency()));
      st_.HeaderRefreshPending = true;
      if (st_.RowOB->RowCount() != 0 && !st_.TaxQuestionOff &&
          st_.Doc->MsgBox(GetUIString(75), kMbYesNo, "") == kAnswerYes)
        ForEachRowAndPart([&](DataObject& row) { SetRowTax(row, 0, Currency::FromInt(1)); });
    } else {
      st_.TotalsReady = true;
      st_.RowTaxEntered = false;
      const Currency factor = Currency::FromDouble(1 + DoubleOf(header.Field("GRTax.TaxPercent")) / 100);
      ForEachRowAndPart([&](DataObject& row) { SetRowTax(row, tax, factor); });
    }
    st_.RowsRecalcPending = true;
    st_.BrowserRefreshPending = true;
    st_.FullTotalsPending = true;
    result = true;
  });
}

// One row or particular under the header's tax code `tax`: its tax amounts cleared (documents
// with row taxes), its unit price with tax shown at `factor` (documents with discounts), and the
// row written back.
void DocFunc::SetRowTax(DataObject& row, int32_t tax, Currency factor) {
  row.SetField("IDGRTax", Variant(tax));
  if (st_.UseRowTax) ClearRowTaxes(row);
  if (st_.UseDiscounts)
    row.SetField("@UnitPriceTax", Variant(RoundedMoney(DoubleOf(row.Field("@UnitPrice")) * factor.ToDouble(), 2)));
  row.UpdateRow(true, false, false);
}

void DocFunc::ClearRowTaxes(DataObject& row) {
  for (const char* field : {"TaxAmount", "TaxAmountBase", "TaxAmountRef"}) row.SetField(field, Variant(Currency()));
}

// ---------------------------------------------------------------------------------------------
// Rows and the particulars of set rows
// ---------------------------------------------------------------------------------------------

// The completion type of `row` (trimmed, upper case): "" for a plain row; "C", "D" and the
// production types mark set rows.
std::string DocFunc::CompletionType(DataObject& row) { return UCase(TrimmedOf(row.Field(st_.CompletionTypeField))); }

// Runs `step` on each particular of the current row of RowOB (the cached rows under "Next",
// positioned on the particular); an empty set of particulars is released instead.
void DocFunc::ForEachPart(const std::function<void(Ref<DataObject>&)>& step) {
  Ref<DataObject> parts = st_.Doc->CachedRows(st_.RowTable, "Next");
  if (!parts) return;
  if (parts->RowCount() == 0) return st_.Doc->FreeCachedRows(st_.RowTable, "Next");
  docfunc::WalkRows(*parts, [&] { step(parts); });
}

// Runs `step` on every row of RowOB and on the particulars of each set row.
void DocFunc::ForEachRowAndPart(const std::function<void(DataObject&)>& step) {
  DataObject& rows = *st_.RowOB;
  docfunc::WalkRows(rows, [&] {
    step(rows);
    if (!CompletionType(rows).empty()) ForEachPart([&](Ref<DataObject>& part) { step(*part); });
  });
}

}  // namespace xal
