// The header totals of a document — net amount, tax, total and the per-column totals — kept while
// the user edits rows. A full pass walks every row; once it has run, a change of one row's amount
// is added on its own (the incremental pass), so that editing a row of a thousand-row document
// costs what it costs on a ten-row one. WhenDocument builds the totals once, also in the base and
// reference currencies, when the document is shown.
#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/internal/rows.h"
#include "docfunc/values.h"
#include "runtime/operators.h"
#include "runtime/text.h"

namespace xal {

using docfunc::CurrencyOf;
using docfunc::DoubleOf;
using docfunc::IsBlank;
using docfunc::LongOf;
using docfunc::RoundedMoney;
using docfunc::TextOf;
using docfunc::WalkRows;

namespace {

// `sum` plus the tax at `percent` on `amount`, held as currency (each addition rounds to four
// decimals).
Currency WithTax(Currency sum, Currency amount, double percent) {
  return Currency::FromDouble(sum.ToDouble() + amount.ToDouble() * percent / 100);
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// ComputeDocTotals
// ---------------------------------------------------------------------------------------------

// Keeps the header totals (nothing on documents without totals):
//   1. A row amount that changed (OldAmount not 0) while "@NetAmount" is still 0 means the totals
//      were never built for this header: WhenDocument builds them from the rows as they stand
//      (NewDocument kept). Those totals already hold an edited amount, so only DelRow's change —
//      a row still standing that is about to go, or a marked row about to come back — is applied
//      to them; any other change is done. Otherwise a full pass on a document with discounts
//      first clears the rows' discount checks.
//   2. The incremental pass when it can be trusted (not Full, totals ready, no entered row taxes);
//      else the full pass.
//   3. The header figures, the column totals, and the header refreshed.
void DocFunc::ComputeDocTotals(bool Full) {
  if (!st_.ComputeTotals) return;
  const bool rowComesOrGoes = InDelRow();  // decided before WhenDocument renames the call
  if (st_.OldAmount != Currency() && CurrencyOf(st_.HeaderOB->Field("@NetAmount")) == Currency()) {
    const bool newDocument = st_.NewDocument;
    WhenDocument();
    st_.NewDocument = newDocument;
    if (!rowComesOrGoes) return;
  } else if (Full && st_.UseDiscounts) {
    ResetDiscountChecks();
    st_.Doc->RefreshBrowser(st_.RowTable + ".@");
  }
  Currency net, tax;
  if (!Full && st_.TotalsReady && !st_.RowTaxEntered)
    IncrementalTotals(net, tax);
  else
    FullTotals(net, tax, rowComesOrGoes);
  WriteTotals(net, tax);
}

// The change of the current row alone: its amount minus OldAmount added to the net, and the tax
// at the row's rate on that change. DelRow sets OldAmount to twice the amount of a row that goes
// (so the change subtracts it) and to 0 for a row that comes back.
void DocFunc::IncrementalTotals(Currency& net, Currency& tax) {
  DataObject& row = *st_.RowOB;
  DataObject& header = *st_.HeaderOB;
  const Currency diff = CurrencyOf(row.Field("Amount")) - st_.OldAmount;
  net = CurrencyOf(header.Field("@NetAmount")) + diff;
  tax = CurrencyOf(header.Field("@TaxAmount"));
  if (st_.UseTax && LongOf(row.Field("IDGRTax")) != 0) tax = WithTax(tax, diff, DoubleOf(row.Field("GRTax.TaxPercent")));
}

// Every row not marked deleted adds its amount and, when it has a tax code, its tax:
//   1. Rows carry entered tax amounts from the first row whose "TaxAmount" is not 0 on: that row
//      and every following one add their "TaxAmount" (also a zero one); the rows before it add
//      the tax at their rate. Rows with entered taxes are looked for only while the totals are
//      not ready yet or entered taxes were found before — the search starts over on each such
//      pass, so that a second pass over unchanged rows gives the first pass's figures, and a
//      document whose last entered tax went away goes back to the rates.
//   2. Otherwise (totals ready, no entered taxes) every row adds the tax at its rate.
//   3. Inside DelRow the current row is counted as it will stand once the host has deleted (or
//      undeleted) it: a pass over entered taxes is not additive, so DelRow's change cannot be
//      added on its own.
// The rows are left on the row they were on; the totals are ready afterwards.
void DocFunc::FullTotals(Currency& net, Currency& tax, bool currentRowFlips) {
  DataObject& rows = *st_.RowOB;
  const Variant current = currentRowFlips ? docfunc::PositionOf(rows) : Variant();
  const bool search = !st_.TotalsReady || st_.RowTaxEntered;
  bool entered = false;
  net = tax = Currency();
  WalkRows(rows, [&] {
    bool deleted = rows.RowState(kRowMarkedDeleted);
    if (!current.IsEmpty() && rows.Bookmark() == current) deleted = !deleted;
    if (deleted) return;
    const Currency amount = CurrencyOf(rows.Field("Amount"));
    net = net + amount;
    if (!st_.UseTax || LongOf(rows.Field("IDGRTax")) == 0) return;
    const Currency rowTax = CurrencyOf(rows.Field("TaxAmount"));
    if (search && !entered && rowTax != Currency()) entered = true;
    tax = entered ? tax + rowTax : WithTax(tax, amount, DoubleOf(rows.Field("GRTax.TaxPercent")));
  });
  if (search) st_.RowTaxEntered = entered;
  st_.TotalsReady = true;
}

// The header figures: an entered header tax wins over the rows' tax; the total is rounded to
// cents with the approximation difference in it. Then the column totals and the refreshes.
void DocFunc::WriteTotals(Currency net, Currency tax) {
  DataObject& header = *st_.HeaderOB;
  const Currency entered = CurrencyOf(header.Field("TaxAmount"));
  const Currency shown = entered != Currency() ? entered : tax;
  header.SetField("@TaxAmount", Variant(shown));
  header.SetField("@NetAmount", Variant(net));
  header.SetField("TotalAmount",
                  Variant(RoundedMoney(net + shown + CurrencyOf(header.Field("ApproxDifference")), 2)));
  WriteColumnTotals();
  st_.Doc->RefreshHeader("@");
  st_.Doc->RefreshHeader("TotalAmount");
}

// The form's "RowTotals" value lists row fields (comma-separated, blanks around the names
// allowed); each gets the header pseudo-field "@Total_" & name, the sum of that field over every
// row (marked-deleted rows included, as the form still shows them). A blank field adds nothing;
// an empty name in the list is skipped.
void DocFunc::WriteColumnTotals() {
  std::vector<std::string> names;
  for (const std::string& part : Split(TextOf(st_.Doc->Values("RowTotals")), ","))
    if (std::string name = Trim(part); !name.empty()) names.push_back(std::move(name));
  if (names.empty()) return;
  DataObject& header = *st_.HeaderOB;
  DataObject& rows = *st_.RowOB;
  for (const std::string& name : names) header.SetField("@Total_" + name, Variant(0));
  WalkRows(rows, [&] {
    for (const std::string& name : names) {
      const Variant value = rows.Field(name);
      if (!IsBlank(value)) header.SetField("@Total_" + name, Add(header.Field("@Total_" + name), value));
    }
  });
}

// True while DelRow's own body runs (not the work deferred to its leave step): the current row is
// about to leave the totals, or to come back to them.
bool DocFunc::InDelRow() const { return !st_.LeaveGuard && TextEquals(st_.CallName, "DelRow"); }

// ---------------------------------------------------------------------------------------------
// The totals WhenDocument builds
// ---------------------------------------------------------------------------------------------

// The totals shown when a document is opened or rebuilt (documents without totals get none):
//   1. Document currency: a full pass over the rows, written as ComputeDocTotals writes it.
//   2. Base and reference currency, for each of the suffixes "Base" and "Ref":
//      a. "@NetAmount" & S = the sum of the rows' "Amount" & S (each row's own conversion, as
//         stored with it), rows marked deleted left out; a row table without the field gives 0;
//      b. "@TaxAmount" & S = the header's "TaxAmount" & S when that is not 0 (an entered tax
//         wins), else the document's stored tax sum (0 for a document not stored yet);
//      c. "TotalAmount" & S = Round("@NetAmount" & S + "@TaxAmount" & S + "ApproxDifference" & S, 2).
void DocFunc::InitialTotals(const StoredTaxes& taxes) {
  if (!st_.ComputeTotals) return;
  Currency net, tax;
  FullTotals(net, tax, false);
  WriteTotals(net, tax);
  WriteCurrencyTotals("Base", taxes.taxBase);
  WriteCurrencyTotals("Ref", taxes.taxRef);
}

void DocFunc::WriteCurrencyTotals(const std::string& suffix, Currency storedTax) {
  DataObject& header = *st_.HeaderOB;
  DataObject& rows = *st_.RowOB;
  Currency net;
  WalkRows(rows, [&] {
    if (!rows.RowState(kRowMarkedDeleted))
      net = net + CurrencyOf(TryOr([&] { return rows.Field("Amount" + suffix); }, Variant()));
  });
  const Currency entered = CurrencyOf(header.Field("TaxAmount" + suffix));
  const Currency tax = entered != Currency() ? entered : storedTax;
  header.SetField("@NetAmount" + suffix, Variant(net));
  header.SetField("@TaxAmount" + suffix, Variant(tax));
  header.SetField("TotalAmount" + suffix,
                  Variant(RoundedMoney(net + tax + CurrencyOf(header.Field("ApproxDifference" + suffix)), 2)));
}

// ---------------------------------------------------------------------------------------------
// Discount checks
// ---------------------------------------------------------------------------------------------

// Every row's discount is to be checked again ("@DiscountOK" False); the rows stay where they were.
void DocFunc::ResetDiscountChecks() {
  DataObject& rows = *st_.RowOB;
  WalkRows(rows, [&] { rows.SetField("@DiscountOK", Variant(false)); });
}

}  // namespace xal
