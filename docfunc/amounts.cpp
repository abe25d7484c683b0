// Row amounts: the amount of a row from its unit price and quantity with the price cuts, the price
// derived from it, the informative figures shown next to a row (unit price with and without tax,
// margins, discount), the "may this be edited" answers of the row's money fields, their defaults,
// and the commands that recompute a whole document.
#include <string>

#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/internal/rows.h"
#include "docfunc/values.h"
#include "runtime/format.h"
#include "runtime/text.h"

namespace xal {

using docfunc::CurrencyOf;
using docfunc::DoubleOf;
using docfunc::IsBlank;
using docfunc::LongOf;
using docfunc::RoundedMoney;
using docfunc::TrimmedOf;

// ---------------------------------------------------------------------------------------------
// Commands
// ---------------------------------------------------------------------------------------------

// Every row's amount from its price again, then the totals in full.
bool DocFunc::RecomputeDocAmounts() {
  return Handle("RecomputeDocAmounts", [&](bool& result) {
    result = RecomputeRows(true);
    ComputeDocTotals(true);
    ResetDiscountChecks();
    st_.HeaderRefreshPending = true;
    st_.BrowserRefreshPending = true;
  });
}

// The totals in full, the rows as they stand.
bool DocFunc::AdjustAllAmounts() {
  return Handle("AdjustAmounts", [&](bool& result) {
    ComputeDocTotals(true);
    result = true;
  });
}

bool DocFunc::DoHeaderRefresh() {
  return Handle("DoHeaderRefresh", [&](bool& result) {
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

// ---------------------------------------------------------------------------------------------
// Recomputing rows
// ---------------------------------------------------------------------------------------------

// Every row of RowOB from its price: a set shown by its particulars ("D") through its
// particulars (an empty set of them is released), the set row itself then keeping its amount;
// any other row in full as asked. On documents with sets each row's set is to be refilled.
bool DocFunc::RecomputeRows(bool Full) {
  Ref<DataObject> rows = st_.RowOB.get();
  struct PairValuesKept {  // for this run only: the pairs may change between two commands
    DocState& st;
    explicit PairValuesKept(DocState& s) : st(s) { st.KeepPairValues = true; }
    ~PairValuesKept() {
      st.KeepPairValues = false;
      st.PairValues.clear();
      st.PriceLookUps.clear();
    }
  } kept(st_);
  docfunc::WalkRows(Require(rows), [&] {
    if (CompletionType(*rows) == "D") {
      ForEachPart([&](Ref<DataObject>& part) { RecomputeRow(part, Full); });
      RecomputeRow(rows, false);
    } else {
      RecomputeRow(rows, Full);
    }
    if (st_.UseSets) {
      st_.OldQuantity = 0;
      st_.SetRefillPending = true;
      // The set's component rows are refilled by the set work (FillCompletionRows), not yet here.
    }
  });
  return true;
}

// One row: its prices from the price lists, then (Full) its amount from them, and its price.
bool DocFunc::RecomputeRow(Ref<DataObject>& Row, bool Full) {
  FillPrice(Row);
  ComputeRowAmount(Require(Row), Full);
  return true;
}

// The amount and price of a row whose unit price is in place:
//   1. Full: "Amount" from the unit price, "BaseQuantity" and the price cuts (CutAmount).
//   2. The price: "Amount" / "BaseQuantity" to 4 decimals; the unit price when there is no
//      quantity.
//   3. The statistics amount follows the amount.
void DocFunc::ComputeRowAmount(DataObject& row, bool Full) {
  const double quantity = DoubleOf(row.Field("BaseQuantity"));
  if (Full) row.SetField("Amount", Variant(CutAmount(row, DoubleOf(row.Field(st_.UnitPriceField)) * quantity)));
  const Currency amount = CurrencyOf(row.Field("Amount"));
  row.SetField(st_.PriceField, quantity != 0 ? Variant(RoundedMoney(amount.ToDouble() / quantity, 4))
                                             : row.Field(st_.UnitPriceField));
  if (st_.UseStatFields) row.SetField("StatAmount", Variant(amount));
}

// The amount `listAmount` (unit price × quantity) after the price cuts, to cents: none when the
// price is cut-free; otherwise the header's "PriceCut", then the category pair's cut.
Currency DocFunc::CutAmount(DataObject& row, double listAmount) {
  if (PriceIsCutFree()) return RoundedMoney(listAmount, 2);
  const Currency amount = RoundedMoney(listAmount * (1 + DoubleOf(st_.HeaderOB->Field("PriceCut")) / 100), 2);
  const Variant cut = CategoryPairValue(row, "PriceCut");
  return IsBlank(cut) ? amount : RoundedMoney(amount.ToDouble() * (1 + CDbl(cut) / 100), 2);
}

// No price cut applies: the document takes no prices or no price categories, or the last price
// look-up used a certified company price or the company's own list, or a quantity step of a list
// that is not subject to cuts.
bool DocFunc::PriceIsCutFree() const {
  return !st_.ComputePrices || !st_.UsePriceCat || st_.CompanyPriceFound || st_.CompanyListUsed ||
         (st_.PriceNoCut && st_.QuantityPriceUsed);
}

// The value `column` ("PriceCut", "MinMarkup") of the price-category pair of the row's article and
// the document's company under the header's price list. When the company's category gives
// nothing, the partner's is tried if the partner is another company. Empty when no pair applies.
Variant DocFunc::CategoryPairValue(DataObject& row, const std::string& column) {
  DataObject& header = *st_.HeaderOB;
  const int32_t articleCat = LongOf(row.Field("GRArticle.IDGRArticlePriceCat"));
  const int32_t priceList = LongOf(header.Field(st_.PriceListField));
  if (articleCat == 0 || priceList == 0) return Variant();
  auto pair = [&](int32_t companyCat) -> Variant {
    if (companyCat == 0) return Variant();
    const std::string condition = "A.IDGRArticlePriceCat = " + std::to_string(articleCat) +
                                  " AND A.IDGRCompanyPriceCat = " + std::to_string(companyCat) +
                                  " AND A.IDGRPriceList = " + std::to_string(priceList);
    if (auto kept = st_.PairValues.find(column + " " + condition); kept != st_.PairValues.end()) return kept->second;
    const Ref<DataObject> found =
        OpenQuery("SELECT A." + column + " AS " + column + " FROM GRPriceCatRel A WHERE " + condition);
    const Variant value = found->IsEOF() ? Variant() : found->Field(column);
    if (st_.KeepPairValues) st_.PairValues.emplace(column + " " + condition, value);
    return value;
  };
  const Variant value = pair(LongOf(header.Field("GRCompany.IDGRCompanyPriceCat" + st_.CompanyFieldSuffix)));
  const int32_t partner = LongOf(header.Field("IDPartner"));
  if (!IsBlank(value) || partner == 0 || partner == LongOf(header.Field("IDGRCompany"))) return value;
  return pair(LongOf(header.Field("Partner.IDGRCompanyPriceCat" + st_.CompanyFieldSuffix)));
}

// ---------------------------------------------------------------------------------------------
// After the amount changed
// ---------------------------------------------------------------------------------------------

// The totals follow (when the outermost handler leaves); on documents with discounts the row's
// figures are shown again.
bool DocFunc::VAmount() {
  return Handle("VAmount", [&](bool& result) {
    st_.TotalsPending = true;
    if (st_.UseDiscounts) ShowRowFigures(*st_.RowOB);
    result = true;
  });
}

// The figures shown next to a row on documents with discounts:
//   1. Without a quantity the unit prices and margins are 0.
//   2. Otherwise the unit price (amount per unit of the row's unit), the margins of store rows,
//      the unit price with tax — the entered row tax when there is one, else at the row's rate —
//      and the minimum-markup warning.
//   3. The discount: how far the amount per base unit lies below the unit price, in percent.
//   4. The statistics amount follows the amount.
void DocFunc::ShowRowFigures(DataObject& row) {
  const Currency amount = CurrencyOf(row.Field("Amount"));
  const double quantity = DoubleOf(row.Field("Quantity"));
  if (quantity == 0) {
    for (const char* field : {"@UnitPrice", "@UnitPriceTax", "@CoverPercent", "@RetailPercent"})
      row.SetField(field, Variant(Currency()));
  } else {
    row.SetField("@UnitPrice", Variant(RoundedMoney(amount.ToDouble() / quantity, 4)));
    if (st_.IsStoreRow) SetMargins(row);
    row.SetField("@UnitPriceTax", Variant(RoundedMoney(UnitPriceWithTax(row, amount, quantity), 4)));
    if (st_.IsSales && st_.UsePriceCat) CheckMinimumMarkup(row, quantity);
  }
  const double base = DoubleOf(row.Field("BaseQuantity"));
  const double unitPrice = DoubleOf(row.Field(st_.UnitPriceField));
  row.SetField("@Discount",
               Variant(base == 0 || unitPrice == 0
                           ? Currency()
                           : RoundedMoney(
                                 (unitPrice - RoundedMoney(amount.ToDouble() / base, 4).ToDouble()) / unitPrice * 100,
                                 2)));
  if (st_.UseStatFields) row.SetField("StatAmount", Variant(amount));
}

// The unit price with tax: the amount with tax at the row's rate (to cents) per unit; on
// documents with row taxes an entered row tax instead adds its share per base unit.
double DocFunc::UnitPriceWithTax(DataObject& row, Currency amount, double quantity) {
  const Currency rowTax = CurrencyOf(row.Field("TaxAmount"));
  if (!st_.UseRowTax || rowTax == Currency()) {
    const double percent = DoubleOf(row.Field("GRTax.TaxPercent"));
    return RoundedMoney(amount.ToDouble() * (1 + percent / 100), 2).ToDouble() / quantity;
  }
  const double unitPrice = DoubleOf(row.Field("@UnitPrice"));
  const double base = DoubleOf(row.Field("BaseQuantity"));
  return base == 0 ? unitPrice : unitPrice + rowTax.ToDouble() / base;
}

// The margins of a store row in the base currency (amount × the header's exchange rate against
// the row's cost): the markup on cost and the share of the price that covers more than the cost,
// each 0 where its divisor is.
void DocFunc::SetMargins(DataObject& row) {
  const double amount = DoubleOf(row.Field("Amount"));
  const double cost = DoubleOf(row.Field("Cost"));
  const double rate = DoubleOf(st_.HeaderOB->Field("ExchangeRate"));
  row.SetField("@RetailPercent",
               Variant(cost == 0 ? Currency() : RoundedMoney((amount * rate / cost - 1) * 100, 2)));
  row.SetField("@CoverPercent", Variant(amount == 0 || rate == 0 ? Currency()
                                                                 : RoundedMoney(100 - cost * 100 / (amount * rate), 2)));
}

// The minimum markup of the row's price-category pair against its cost:
//   1. Nothing when the pair has no minimum markup.
//   2. The lowest price per unit is the cost per unit of the row ("Cost", the row's whole cost,
//      over "Quantity") raised by the markup.
//   3. A unit price below it is shown once, as the amount the row would then have (that price
//      times "Quantity", formatted ".00"): text 77, or text 78 with the article's code for a
//      part of a set (on a row form, whose rows are the parts of one set row).
void DocFunc::CheckMinimumMarkup(DataObject& row, double quantity) {
  const Variant markup = CategoryPairValue(row, "MinMarkup");
  if (IsBlank(markup)) return;
  const double lowest = DoubleOf(row.Field("Cost")) / quantity * (1 + CDbl(markup) / 100);
  if (DoubleOf(row.Field("@UnitPrice")) >= RoundedMoney(lowest, 4).ToDouble()) return;
  const Variant shown(Format(Variant(lowest * quantity), ".00"));
  const std::string text = st_.IsRowArea ? GetUIString(78, {Variant(TrimmedOf(row.Field("GRArticle.Code"))), shown})
                                         : GetUIString(77, {shown});
  st_.Doc->MsgBox(text, kMbOK, "");
}

// ---------------------------------------------------------------------------------------------
// May it be edited?
// ---------------------------------------------------------------------------------------------

// The amount before the edit is kept (0 on a new row); a set shown by its particulars takes its
// amount from them and is not edited itself.
bool DocFunc::WAmount() {
  return Handle("WAmount", [&](bool& result) {
    DataObject& row = *st_.RowOB;
    st_.OldAmount = st_.Doc->OnNewRow() ? Currency() : CurrencyOf(row.Field("Amount"));
    result = !(st_.UseSets && CompletionType(row) == "D");
  });
}

// Whether a row's cost may be entered:
//   1. Documents without sets: always.
//   2. A plain row (no completion type): unless its article is a set ("P"), whose cost is what
//      its components cost.
//   3. A set being assembled ("P"): never — its cost is the cost of its particulars.
//   4. A particular taken into a set ("A") or a set taken apart ("R"): only for a service ("S"),
//      which has no stock cost; goods leave the store at their stock cost.
//   5. Other set types ("C", "D"): always.
bool DocFunc::WCost() {
  return Handle("WCost", [&](bool& result) {
    DataObject& row = *st_.RowOB;
    const std::string type = CompletionType(row);
    const std::string article = UCase(TrimmedOf(row.Field("ArticleType")));
    if (!st_.UseSets)
      result = true;
    else if (type.empty())
      result = article != "P";
    else if (type == "P")
      result = false;
    else if (type == "A" || type == "R")
      result = article == "S";
    else
      result = true;
  });
}

// A component row of a set ("C", "D") takes its store from the set and is not edited.
bool DocFunc::WDRStoreRow() {
  return Handle("WDRStoreRow", [&](bool& result) {
    const std::string type = CompletionType(*st_.RowOB);
    result = !(st_.UseSets && (type == "C" || type == "D"));
  });
}

// The deal state is chosen only on a new document.
bool DocFunc::WDealState() {
  return Handle("WDealState", [&](bool& result) { result = st_.NewDocument; });
}

// A series is created for the row by the creators of related records (CrSeries), not yet here.
bool DocFunc::WSeries() {
  return Handle("WSeries", [&](bool& result) { result = true; });
}

// ---------------------------------------------------------------------------------------------
// Defaults
// ---------------------------------------------------------------------------------------------

Variant DocFunc::DQuantity() {
  return HandleDefault("DQuantity", [&](Variant& result) { result = st_.RowOB->Field("Quantity"); });
}

// "Series" for articles kept by series, "Lot" for articles kept by lots, else nothing.
Variant DocFunc::DSeries() {
  return HandleDefault("DSeries", [&](Variant& result) {
    const std::string kind = UCase(TrimmedOf(st_.RowOB->Field("GRArticle.QuantityType")));
    result = Variant(kind == "S" ? GetUIString(5) : kind == "P" ? GetUIString(6) : std::string());
  });
}

// The default discount of a row: what the price cuts take off its unit price, in percent.
//   1. 0 on documents that take no prices.
//   2. The row's prices are looked up; with PriceByOrderedQuantity and an "OrderedQuantity" on
//      the row, for the ordered quantity (quantity steps are reached by what was ordered, not
//      by what is delivered now) — "BaseQuantity" is put back afterwards.
//   3. 0 when the row then has no unit price.
//   4. The cut factor F as RecomputeRow applies it: 1 for a cut-free price, else
//      (1 + header "PriceCut" / 100) × (1 + the category pair's "PriceCut" / 100).
//   5. The discount is Round((1 − F) × 100, 2): a cut of −10 % is a discount of 10 %.
Variant DocFunc::DRowDiscount() {
  return HandleDefault("DRowDiscount", [&](Variant& result) {
    result = Variant(Currency());
    if (!st_.ComputePrices) return;
    Ref<DataObject> rows = st_.RowOB.get();
    DataObject& row = Require(rows);
    const double ordered = st_.PriceByOrderedQuantity ? DoubleOf(row.Field("OrderedQuantity")) : 0;
    const Variant delivered = row.Field("BaseQuantity");
    if (ordered != 0) row.SetField("BaseQuantity", Variant(ordered));
    FillPrice(rows);  // a handler: never throws, so the quantity is always put back
    if (ordered != 0) row.SetField("BaseQuantity", delivered);
    if (DoubleOf(row.Field(st_.UnitPriceField)) == 0 || PriceIsCutFree()) return;
    const Variant pairCut = CategoryPairValue(row, "PriceCut");
    const double factor = (1 + DoubleOf(st_.HeaderOB->Field("PriceCut")) / 100) * (1 + DoubleOf(pairCut) / 100);
    result = Variant(RoundedMoney((1 - factor) * 100, 2));
  });
}

}  // namespace xal
