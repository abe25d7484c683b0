// Row quantities: the quantity in the row's unit turned into the article's base unit, the amount
// that follows a new quantity (from the price lists, from an old document for credit rows, from
// the order for order rows), the warnings about a store falling below the article's minimum, a
// changed cost carried into a set's particulars, and the check before a row is left.
#include <algorithm>
#include <string>
#include <vector>

#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/internal/rows.h"
#include "docfunc/values.h"
#include "runtime/text.h"
#include "server/stock.h"

namespace xal {

using docfunc::CurrencyOf;
using docfunc::DoubleOf;
using docfunc::FlagOf;
using docfunc::IsBlank;
using docfunc::LongOf;
using docfunc::RoundedMoney;
using docfunc::TextOf;
using docfunc::TrimmedOf;

// ---------------------------------------------------------------------------------------------
// Units
// ---------------------------------------------------------------------------------------------

// The quantity `quantity` of unit `unit` expressed in unit `baseUnit`. Each unit names its first
// unit ("IDFirst", 0 for a first unit) and how many of that unit it holds ("Relation"):
//   1. The same unit, or either unit unknown (0): the quantity as it is.
//   2. Each unit is followed through its first units to the top of its chain, multiplying the
//      relations on the way (a relation of 0 counts as 1, so nothing is divided by it); a chain
//      that comes back to a unit it passed stops there.
//   3. Units with the same top unit: quantity × factor(unit) / factor(baseUnit).
//   4. Units without a common top unit cannot be converted: the quantity as it is.
double DocFunc::UnitToBase(double quantity, int32_t unit, int32_t baseUnit) {
  if (unit == baseUnit || unit == 0 || baseUnit == 0) return quantity;
  const UnitChain from = ChainOfUnit(unit), to = ChainOfUnit(baseUnit);
  return from.top == to.top ? quantity * from.factor / to.factor : quantity;
}

DocFunc::UnitChain DocFunc::ChainOfUnit(int32_t unit) {
  UnitChain chain{unit, 1.0};
  std::vector<int32_t> passed{unit};
  for (;;) {
    const Ref<DataObject> found =
        OpenQuery("SELECT ID, IDFirst, Relation FROM GRUnit WHERE ID = " + std::to_string(chain.top));
    if (found->IsEOF()) return chain;
    const int32_t first = LongOf(found->Field("IDFirst"));
    if (first == 0 || std::find(passed.begin(), passed.end(), first) != passed.end()) return chain;
    const double relation = DoubleOf(found->Field("Relation"));
    chain.factor *= relation != 0 ? relation : 1.0;
    chain.top = first;
    passed.push_back(first);
  }
}

// ---------------------------------------------------------------------------------------------
// Quantity and unit
// ---------------------------------------------------------------------------------------------

// The base quantity before the edit is kept (0 on a new row).
bool DocFunc::WQuantity() {
  return Handle("WQuantity", [&](bool& result) {
    st_.OldQuantity = st_.Doc->OnNewRow() ? 0.0 : DoubleOf(st_.RowOB->Field("BaseQuantity"));
    // Store rows: the series of the row (CrSeries) and the sub-rows' quantity bookkeeping
    // ("@OrigQ") belong to the creators and the reservation work, not yet here.
    result = true;
  });
}

// After the row's quantity changed, in this order: the quantity rounded (RoundingQuantity is the
// number of decimals; a negative value, the default True, keeps it as entered); the base quantity
// through the units; the statistics quantities; the minimum-stock warning; the prices and the
// amount; the row's figures and its discount check. The amount the row had is kept in OldAmount
// first, so that the totals add exactly this edit's change.
bool DocFunc::VQuantity() {
  return Handle("VQuantity", [&](bool& result) {
    Ref<DataObject> rows = st_.RowOB.get();
    DataObject& row = Require(rows);
    st_.OldAmount = CurrencyOf(row.Field("Amount"));
    if (st_.RoundingQuantity >= 0)
      row.SetField("Quantity", Variant(CDbl(server::Round(Variant(DoubleOf(row.Field("Quantity"))), st_.RoundingQuantity))));
    const double base =
        UnitToBase(DoubleOf(row.Field("Quantity")), LongOf(row.Field("IDGRUnit")), LongOf(row.Field(st_.UnitField)));
    row.SetField("BaseQuantity", Variant(base));
    if (st_.UseStatFields) SetStatQuantities(row, base);
    if (st_.IsStockDoc && st_.MinQuantityMessage) CheckMinimumQuantity(row, base);
    const bool credit = st_.CheckCreditRows && FlagOf(row.Field("@IsCreditByOld"));
    if (!credit) FillPrice(rows);
    const bool given = credit ? CreditRowAmount(row, base) : OrderRowAmount(row, base);
    ComputeRowAmount(row, !given);
    VAmount();
    VDiscount();
    // Sets: the component rows are refilled and checked by the set work (FillCompletionRows,
    // VCompletionRows), not yet here.
    result = true;
  });
}

// After the row's unit changed: the set is to be refilled; with a unit the quantity is taken
// again (base quantity and unit-dependent price) and the totals rebuilt in full; the row is shown
// again. True also when something failed.
bool DocFunc::VUnit() {
  return HandleAlwaysTrue("VUnit", [&](bool& result) {
    st_.SetRefillPending = true;
    if (LongOf(st_.RowOB->Field("IDGRUnit")) != 0) {
      VQuantity();
      st_.FullTotalsPending = true;
    }
    st_.RowRefreshPending = true;
    result = true;
  });
}

// Net mass and the quantity in the customs unit of the article's commodity code (0 without one).
void DocFunc::SetStatQuantities(DataObject& row, double baseQuantity) {
  row.SetField("NetMass", Variant(baseQuantity * DoubleOf(row.Field("GRArticle.NetMass"))));
  const int32_t customsUnit = LongOf(row.Field("GRArticle.DRIntrCNCode.IDGRUnit"));
  row.SetField("CNQuantity", Variant(customsUnit == 0 ? 0.0
                                                      : UnitToBase(baseQuantity, LongOf(row.Field(st_.UnitField)),
                                                                   customsUnit)));
}

// The article's minimum stock ("GRArticle.MnQuantity") against what the row leaves in its store,
// on stock documents whose users asked for the warning (MinQuantityMessage):
//   1. Only goods leaving a store (a positive base quantity from the row's store, "IDSenderStore"
//      on store rows) of an article with a minimum.
//   2. The store's balance is the row's "@StockRes"; when it is not known yet it is counted
//      (pre-reservations as the form's "CountPreReservations" says, sets when the row is a set
//      and set quantities are computed) and kept in "@StockRes".
//   3. Left = balance + "@OrigQ" − base quantity: the quantity the row had when loaded is already
//      out of the balance and goes back first.
//   4. Left below the minimum: text 76 with the two quantities (OK only).
void DocFunc::CheckMinimumQuantity(DataObject& row, double baseQuantity) {
  const double minimum = DoubleOf(row.Field("GRArticle.MnQuantity"));
  const int32_t store = LongOf(row.Field(st_.IsStoreRow ? std::string("IDSenderStore") : st_.StoreField));
  if (baseQuantity <= 0 || minimum == 0 || store == 0) return;
  if (IsBlank(row.Field("@StockRes"))) {
    const bool sets = !CompletionType(row).empty() && st_.ComputeSetQuantity != 0;
    row.SetField("@StockRes", Variant(server::CountStockBalance(st_.Connect.get(), LongOf(row.Field(st_.ArticleField)),
                                                                 store, 0, FlagOf(st_.Doc->Values("CountPreReservations")),
                                                                 sets)));
  }
  const double left = DoubleOf(row.Field("@StockRes")) + DoubleOf(row.Field("@OrigQ")) - baseQuantity;
  if (left < minimum) st_.Doc->MsgBox(GetUIString(76, {Variant(left), Variant(minimum)}), kMbOK, "");
}

// A credit row made from an old document ("@IsCreditByOld"; only when CheckCreditRows):
//   1. The price lists are not asked: the row keeps the old document's unit price
//      "@CreditUnitPrice" (per base unit) as its unit price, and "Amount" =
//      Round(@CreditUnitPrice × base quantity, 2).
//   2. A part of a set whose amount the set row carries ("@CompType" "C") is credited through
//      the set row: its own amount is 0.
//   3. With a known old cost "@CreditCost" (per base unit), "Cost" = Round(@CreditCost × base
//      quantity, 2): the goods come back at the cost they left at.
// True: the amount is given (the price cuts do not apply to it).
bool DocFunc::CreditRowAmount(DataObject& row, double baseQuantity) {
  const double unitPrice = DoubleOf(row.Field("@CreditUnitPrice"));
  row.SetField(st_.UnitPriceField, Variant(RoundedMoney(unitPrice, 4)));
  const bool carriedBySet = UCase(TrimmedOf(row.Field("@CompType"))) == "C";
  row.SetField("Amount", Variant(carriedBySet ? Currency() : RoundedMoney(unitPrice * baseQuantity, 2)));
  const Variant cost = row.Field("@CreditCost");
  if (!IsBlank(cost)) row.SetField("Cost", Variant(RoundedMoney(CDbl(cost) * baseQuantity, 2)));
  return true;
}

// A row made from an order row ("OrderRowID") on documents that take their amount from the order
// (AmountFromOrder):
//   1. The order row is read from SDOrderRow on sales documents, PDOrderRow otherwise.
//   2. When it is found and has a base quantity, "Amount" = Round(order amount × base quantity /
//      order base quantity, 2): the order's price, discounts included, for what is delivered now.
//   3. Otherwise (no order row, no order quantity) the amount comes from the price as on any row.
// True when the amount was taken from the order.
bool DocFunc::OrderRowAmount(DataObject& row, double baseQuantity) {
  if (!st_.AmountFromOrder) return false;
  const int32_t orderRow = LongOf(row.Field("OrderRowID"));
  if (orderRow == 0) return false;
  const std::string table = std::string(st_.IsSales ? "SD" : "PD") + "OrderRow";
  const Ref<DataObject> order =
      OpenQuery("SELECT Amount, BaseQuantity FROM " + table + " WHERE ID = " + std::to_string(orderRow));
  if (order->IsEOF()) return false;
  const double orderQuantity = DoubleOf(order->Field("BaseQuantity"));
  if (orderQuantity == 0) return false;
  row.SetField("Amount",
               Variant(RoundedMoney(DoubleOf(order->Field("Amount")) * baseQuantity / orderQuantity, 2)));
  return true;
}

// ---------------------------------------------------------------------------------------------
// Cost
// ---------------------------------------------------------------------------------------------

// After a row's cost changed:
//   1. Store rows of documents with discounts show their margins again.
//   2. A set row (any completion type) of a document with sets passes its cost on to its
//      particulars (SpreadSetCost).
//   3. True.
bool DocFunc::VCost() {
  return Handle("VCost", [&](bool& result) {
    DataObject& row = *st_.RowOB;
    if (st_.UseDiscounts && st_.IsStoreRow) SetMargins(row);
    if (st_.UseSets && !CompletionType(row).empty()) SpreadSetCost(row);
    result = true;
  });
}

// The set's cost shared among its particulars: in proportion to their present costs; when those
// add up to 0, to their base quantities; when those do too, in equal shares. Shares are rounded
// to cents and the last particular takes what rounding left, so the shares add up to the cost.
// Each particular is written back.
void DocFunc::SpreadSetCost(DataObject& row) {
  const Currency cost = CurrencyOf(row.Field("Cost"));
  std::vector<double> costs, quantities;
  ForEachPart([&](Ref<DataObject>& part) {
    costs.push_back(DoubleOf(part->Field("Cost")));
    quantities.push_back(DoubleOf(part->Field("BaseQuantity")));
  });
  if (costs.empty()) return;
  auto total = [](const std::vector<double>& v) {
    double sum = 0;
    for (double x : v) sum += x;
    return sum;
  };
  std::vector<double> weights = total(costs) != 0 ? costs : quantities;
  if (total(weights) == 0) weights.assign(costs.size(), 1.0);
  const double sum = total(weights);
  size_t i = 0;
  Currency given;
  ForEachPart([&](Ref<DataObject>& part) {
    const bool last = i + 1 == weights.size();
    const Currency share = last ? cost - given : RoundedMoney(cost.ToDouble() * weights[i] / sum, 2);
    given = given + share;
    ++i;
    part->SetField("Cost", Variant(share));
    part->UpdateRow(true, false, false);
  });
}

// ---------------------------------------------------------------------------------------------
// Before the row is left
// ---------------------------------------------------------------------------------------------

// The row-level check before a row is left; True unless a step below says otherwise:
//   1. The status line is cleared (the set's rows are refilled by the set work, FillCompletionRows,
//      not yet here).
//   2. A set row without particulars: text 94 in the status line.
//   3. A plain store row on a header form without a store: text 70 in the status line.
//   4. (The stock check of each row, CheckRowStock, comes with the row validations.)
//   5. Lot reservations: CheckLotQuantities.
bool DocFunc::VDocRow() {
  return Handle("VDocRow", [&](bool& result) {
    result = true;
    Status("");
    DataObject& row = *st_.RowOB;
    const std::string type = CompletionType(row);
    if (st_.UseSets && !type.empty()) {
      const Ref<DataObject> parts = st_.Doc->CachedRows(st_.RowTable, "Next");
      if (!parts || parts->RowCount() == 0) Status(GetUIString(94));
    }
    if (st_.IsStoreRow && !st_.IsRowArea && type.empty() && LongOf(row.Field(st_.StoreField)) == 0)
      Status(GetUIString(70));
    if ((st_.UsesReserveRel || st_.UsesStockReserve) && st_.CheckLotReserve && !CheckLotQuantities(row))
      result = false;
  });
}

// The row's reservation sub-rows against their lots. For each sub-row that carries
// "@StockReserveQ" (the free quantity of its lot when the sub-row was loaded, the sub-row's own
// quantity "@OrigQ" then already taken out):
//   1. free = "@StockReserveQ" + "@OrigQ" − "Quantity": what the sub-row held goes back to the
//      lot, and its present quantity is taken;
//   2. "@StockReserveQ" = free and "@OrigQ" = "Quantity", so that the next check starts here;
//   3. free below 0 is a shortage: text 63 in the status line (article, lot, store, the quantity
//      asked for, what the lot has for it) and the answer False. The other sub-rows are still
//      brought up to date.
bool DocFunc::CheckLotQuantities(DataObject& row) {
  const Ref<DataObject> subRows = st_.Doc->CachedRows(st_.RowTable, st_.ReserveTable);
  if (!subRows) return true;
  DataObject& sub = *subRows;
  bool enough = true;
  docfunc::WalkRows(sub, [&] {
    if (IsBlank(sub.Field("@StockReserveQ"))) return;
    const double quantity = DoubleOf(sub.Field("Quantity"));
    const double free = DoubleOf(sub.Field("@StockReserveQ")) + DoubleOf(sub.Field("@OrigQ")) - quantity;
    sub.SetField("@StockReserveQ", Variant(free));
    sub.SetField("@OrigQ", Variant(quantity));
    if (free >= 0) return;
    enough = false;
    const std::string store = st_.StoreField.size() > 2 ? st_.StoreField.substr(2) + ".Code" : "DRStore.Code";
    Status(GetUIString(63, {Variant(TrimmedOf(row.Field("GRArticle.Code"))),
                            Variant(TrimmedOf(sub.Field("DRStockReserve.SerialNo"))), Variant(TrimmedOf(row.Field(store))),
                            Variant(quantity), Variant(free + quantity)}));
  });
  return enough;
}

}  // namespace xal
