// Prices and discounts of document rows: the unit price of a row from certified company prices
// and price lists (chains through IDFirst, dates, quantity steps, gross lists, units), the header
// price list and price cut with the question whether the rows follow, the row discount, and the
// two commands that change every row by a percentage. The look-up leaves its flags in DocState,
// where the row recomputation reads them to decide whether the price cuts apply.
#include <cmath>
#include <unordered_set>

#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/internal/rows.h"
#include "docfunc/values.h"
#include "runtime/dates.h"
#include "runtime/text.h"
#include "server/company_price.h"
#include "server/sql_utils.h"

namespace xal {

using docfunc::DoubleOf;
using docfunc::FlagOf;
using docfunc::IsBlank;
using docfunc::LongOf;
using docfunc::TextOf;
using docfunc::TrimmedOf;

namespace {

using server::Num;

// Every price and amount is written rounded (4 decimals for prices, 2 for amounts) as currency.
Variant Money(double value, int16_t places) { return Variant(docfunc::RoundedMoney(value, places)); }

bool HasRow(const Ref<DataObject>& rs) { return rs && !rs->IsEOF(); }

}  // namespace

// ---------------------------------------------------------------------------------------------
// Header price list and price cut
// ---------------------------------------------------------------------------------------------

// After the header's price list changed. A list that exists gives the header its name and the
// document its gross and no-cut flags, and the rows follow as after a price cut; no list clears
// the name and the cut. A list id that names no list leaves every field as it was.
bool DocFunc::VPriceList(bool pAsk) {
  return Handle("VPriceList", [&](bool& result) {
    DataObject& header = *st_.HeaderOB;
    const int32_t list = LongOf(header.Field(st_.PriceListField));
    if (list == 0) {
      st_.PriceListID = 0;
      header.SetField("PriceList", Variant(""));
      header.SetField("PriceCut", Variant(0.0));
    } else if (!IsBlank(header.Field("GRPriceList.ID"))) {
      st_.PriceListID = list;
      header.SetField("PriceList", Variant(TextOf(header.Field("GRPriceList.Name"))));
      st_.PriceIsGross = FlagOf(header.Field("GRPriceList.IsBruto"));
      st_.PriceNoCut = FlagOf(header.Field("GRPriceList.WithoutPriceCut"));
      VPriceCut(pAsk);
    }
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

// After the header's price cut changed: when the document has rows, either the row amounts are
// recomputed with the new prices and cut (Yes) or only the prices are refreshed (No). `pAsk`
// False repeats the previous answer instead of asking. Without rows nothing happens at all.
bool DocFunc::VPriceCut(bool pAsk) {
  return Handle("VPriceCut", [&](bool& result) {
    if (st_.RowOB->RowCount() != 0) {
      st_.RecalcRowsAnswer = pAsk ? CarryToRows("AskCompany", GetUIString(80)) : st_.RecalcRowsAnswer;
      if (st_.RecalcRowsAnswer) {
        RecomputeRows(true);
        ComputeDocTotals(true);
      } else {
        RecomputeRows(false);
      }
      ResetDiscountChecks();
      st_.Doc->RefreshBrowser(st_.RowTable + ".@");
    }
    result = true;
  });
}

// The price cut means something only against a price list.
bool DocFunc::WPriceCut() {
  return Handle("WPriceCut", [&](bool& result) { result = LongOf(st_.HeaderOB->Field(st_.PriceListField)) != 0; });
}

// ---------------------------------------------------------------------------------------------
// The price of one row
// ---------------------------------------------------------------------------------------------

// Fills the four price fields of the row: cleared first, then from a certified company price,
// else from the price-list row with its quantity step, each per the article's unit.
bool DocFunc::FillPrice(Ref<xal::DataObject>& pRowOB) {
  return Handle("FillPrice", [&](bool& result) {
    DataObject& row = Require(pRowOB);
    row.SetField(st_.UnitPriceField, Variant(Currency()));
    row.SetField(st_.PriceField, Variant(Currency()));
    row.SetField(st_.PriceListIDField, Variant(int32_t{0}));
    row.SetField(st_.CPriceListField, Variant(int32_t{0}));
    st_.QuantityPriceUsed = false;
    LookUpPriceOnce(LongOf(row.Field(st_.ArticleField)));
    if (HasRow(st_.CompanyPriceRow))
      FillCompanyPrice(row);
    else if (HasRow(st_.PriceListRow))
      FillListPrice(row);
    result = true;
  });
}

// The price look-up, taken from the run's cache while RecomputeRows keeps one (the result rows
// are only read, never moved, so one pair of them serves every row of the article).
void DocFunc::LookUpPriceOnce(int32_t article) {
  if (!st_.KeepPairValues) return LookUpPrice(article);
  auto found = st_.PriceLookUps.find(article);
  if (found == st_.PriceLookUps.end()) {
    LookUpPrice(article);
    st_.PriceLookUps[article] = {st_.CompanyPriceRow, st_.PriceListRow, st_.CompanyPriceFound, st_.CompanyListUsed,
                                 st_.PriceIsGross, st_.PriceNoCut};
    return;
  }
  const DocState::PriceLookUp& kept = found->second;
  st_.CompanyPriceRow = kept.companyRow;
  st_.PriceListRow = kept.listRow;
  st_.CompanyPriceFound = kept.companyFound;
  st_.CompanyListUsed = kept.companyListUsed;
  st_.PriceIsGross = kept.gross;
  st_.PriceNoCut = kept.noCut;
}

void DocFunc::FillCompanyPrice(DataObject& row) {
  DataObject& company = *st_.CompanyPriceRow;
  const double f = UnitFactor(LongOf(row.Field(st_.UnitField)), LongOf(company.Field("IDGRUnit")));
  const Variant price = Money(DoubleOf(company.Field("Price")) / f, 4);
  row.SetField(st_.UnitPriceField, price);
  row.SetField(st_.PriceListIDField, Variant(int32_t{0}));
  row.SetField(st_.CPriceListField, Variant(LongOf(company.Field("IDGRCPriceList"))));
  row.SetField(st_.PriceField, price);
}

// The list price, or the price of the highest quantity step the row's quantity (in the price's
// unit) reaches: the step's own price, or when that is 0 the list price changed by the step's
// percentage. A gross list's price loses the row's tax to give the net unit price.
void DocFunc::FillListPrice(DataObject& row) {
  DataObject& rel = *st_.PriceListRow;
  const double f = UnitFactor(LongOf(row.Field(st_.UnitField)), LongOf(rel.Field("IDGRUnit")));
  const double listPrice = DoubleOf(rel.Field("Price"));
  double price = listPrice;
  if (st_.HasQuantityPrices) {
    const double quantity = DoubleOf(row.Field("BaseQuantity")) / f;
    Ref<DataObject> step = OpenQuery("SELECT Price, QuantityPercent FROM GRPriceLQuantity WHERE Quantity <= " +
                                     server::SQLDouble(Variant(quantity)) + " AND IDGRPriceListRel = " +
                                     Num(LongOf(rel.Field("ID"))) + " ORDER BY Quantity DESC");
    if (HasRow(step)) {
      st_.QuantityPriceUsed = true;
      const double stepPrice = DoubleOf(step->Field("Price"));
      price = stepPrice != 0 ? stepPrice : listPrice * (1 + DoubleOf(step->Field("QuantityPercent")) / 100);
    }
  }
  if (st_.PriceIsGross) price /= 1 + DoubleOf(row.Field("GRTax.TaxPercent")) / 100;
  row.SetField(st_.UnitPriceField, Money(price / f, 4));
  row.SetField(st_.CPriceListField, Variant(int32_t{0}));
  row.SetField(st_.PriceListIDField, Variant(LongOf(rel.Field("IDGRPriceList"))));
  row.SetField(st_.PriceField, Money(listPrice / f, 4));
}

// The unit factor F: one price unit holds F of the article's unit, so a price per price unit
// divided by F is the price per article unit. It is one price unit expressed in the article's
// unit, through the same unit walk as the quantities (UnitToBase): units that cannot be converted
// give 1, the price as it stands.
double DocFunc::UnitFactor(int32_t articleUnit, int32_t priceUnit) {
  return UnitToBase(1.0, priceUnit, articleUnit);
}

// ---------------------------------------------------------------------------------------------
// The price look-up
// ---------------------------------------------------------------------------------------------

// The price look-up for an article. It fills the two look-up results (CompanyPriceRow and
// PriceListRow, either of which may be an empty result) and the flags the row recomputation reads:
//   1. A document without prices ("@NoPriceList") looks nothing up: both results are the empty
//      queries and both company flags are cleared.
//   2. CompanyPriceFound and CompanyListUsed are cleared. The date is the header's "DocDate";
//      a document without a date (or one before 1900) is priced for today.
//   3. The company price: the cheapest certified company price valid on the date for the
//      header's company, or when it has none for the header's partner (another company). When
//      one is found CompanyPriceFound is set and no price list is looked at.
//   4. The company's own list (GRCompany.IDGRPriceListC), or when it has none the partner's, is
//      walked first with CompanyListUsed set (the supplier-side fields on purchase documents).
//   5. When there is no own list or its chain gave no price, CompanyListUsed is cleared and the
//      ordinary list's chain is walked once (OrdinaryPriceList).
//   6. Each walk takes PriceIsGross and PriceNoCut from the list it found the price in.
void DocFunc::LookUpPrice(int32_t article) {
  st_.CompanyPriceFound = st_.CompanyListUsed = false;
  st_.CompanyPriceRow = st_.PriceListRow = nullptr;
  if (TextEquals(st_.PriceListField, "@NoPriceList")) {
    st_.PriceListRow = OpenQuery("SELECT * FROM GRPriceListRel WHERE 1=0");
    st_.CompanyPriceRow = OpenQuery("SELECT * FROM GRCPriceListRel WHERE 1=0");
    return;
  }
  DataObject& header = *st_.HeaderOB;
  const Date date = PriceDate();
  const int32_t company = LongOf(header.Field("IDGRCompany"));
  const int32_t partner = LongOf(header.Field("IDPartner"));
  st_.CompanyPriceRow = CompanyPrice(article, company, date);
  if (!HasRow(st_.CompanyPriceRow) && partner != 0 && partner != company)
    st_.CompanyPriceRow = CompanyPrice(article, partner, date);
  if (HasRow(st_.CompanyPriceRow)) {
    st_.CompanyPriceFound = true;
    return;
  }
  const std::string& p = st_.CompanyFieldSuffix;
  int32_t ownList = LongOf(header.Field("GRCompany.IDGRPriceListC" + p));
  if (ownList == 0) ownList = LongOf(header.Field("Partner.IDGRPriceListC" + p));
  if (ownList != 0) {
    st_.PriceListRow = PriceRowInChain(article, ownList, date);
    st_.CompanyListUsed = st_.PriceListRow != nullptr;
  }
  if (!st_.PriceListRow) st_.PriceListRow = PriceRowInChain(article, OrdinaryPriceList(article), date);
}

Date DocFunc::PriceDate() {
  const Variant v = st_.HeaderOB->Field("DocDate");
  const Date d = IsBlank(v) ? Date() : CDate(v);
  return Year(d) < 1900 ? Today() : Date(std::floor(d.serial));
}

// The cheapest certified company price of the article for `company`, valid on `date`.
Ref<xal::DataObject> DocFunc::CompanyPrice(int32_t article, int32_t company, Date date) {
  if (company == 0) return nullptr;
  const std::string d = server::SQLDate(Variant(date));
  return OpenQuery(
      "SELECT TOP 1 R.* FROM (GRCPriceListRel R INNER JOIN GRCPriceList P ON R.IDGRCPriceList = P.ID) "
      "INNER JOIN GRCPriceLCompany C ON C.IDGRCPriceList = P.ID WHERE P.IsCertified <> 0 AND R.IDGRArticle = " +
      Num(article) + " AND C.IDGRCompany = " + Num(company) + " AND " + d + " >= P.BeginDate AND (" + d +
      " <= P.EndDate OR Year(P.EndDate) < 1910)ORDER BY R.Price");
}

// The ordinary starting list:
//   1. the header's price list;
//   2. without one, the list of the price-category pair of the article and the company's price
//      category, and when the company has no category or the pair no list, the partner's;
//   3. otherwise 0, no list.
int32_t DocFunc::OrdinaryPriceList(int32_t article) {
  DataObject& header = *st_.HeaderOB;
  const int32_t list = LongOf(header.Field(st_.PriceListField));
  if (list != 0) return list;
  for (const char* who : {"GRCompany", "Partner"}) {
    const int32_t category = LongOf(header.Field(std::string(who) + ".IDGRCompanyPriceCat" + st_.CompanyFieldSuffix));
    const int32_t found = category == 0 ? 0 : server::CategoryPriceList(st_.Server.get(), article, category);
    if (found != 0) return found;
  }
  return 0;
}

// Walks a price-list chain:
//   1. The list gives way to the first list of its chain that is valid on the date
//      (PriceListOnDate); none ends the walk without a price.
//   2. The list's newest price row covering the date is the price; PriceIsGross and PriceNoCut
//      are read from the list (its IDFirst, IsBruto and WithoutPriceCut).
//   3. Without one the walk goes on with the list's IDFirst (0 ends it).
//   4. A list reached a second time ends the walk without a price: a chain that comes back to
//      an earlier list (A -> B -> A) would otherwise never end.
Ref<xal::DataObject> DocFunc::PriceRowInChain(int32_t article, int32_t list, Date date) {
  std::unordered_set<int32_t> visited;
  while (list != 0) {
    int32_t next = 0;
    list = PriceListOnDate(list, date, next);
    if (list == 0 || !visited.insert(list).second) return nullptr;
    Ref<DataObject> row = server::PriceRowOnDate(st_.Server.get(), article, list, date);
    if (row) {
      const server::PriceListInfo info = server::ReadPriceList(st_.Server.get(), list);
      st_.PriceIsGross = info.gross;
      st_.PriceNoCut = info.noCut;
      return row;
    }
    list = next;
  }
  return nullptr;
}

// The first list of the chain from `list` that is valid on `date` (an EndDate of 0 is open), or
// 0; `next` is that list's IDFirst. The walk is the company price's, which also ends at a list
// already walked.
int32_t DocFunc::PriceListOnDate(int32_t list, Date date, int32_t& next) {
  return server::FindValidPriceList(st_.Connect.get(), date, list, &next);
}

// ---------------------------------------------------------------------------------------------
// Row discount
// ---------------------------------------------------------------------------------------------

// After a row's discount ("@Discount", a percentage off the price list's unit price) changed.
//   1. Rows whose amount is not made from the unit price keep it (KeepsAmount).
//   2. A set shown by its particulars (CompletionTypeField "D") hands the discount to each of
//      them (steps 3-5 on each) and takes the sum of their amounts as its own.
//   3. An emptied discount means the row has none of its own: its amount is the price-list
//      amount with the header and category cuts, as the row recomputation makes it.
//   4. Otherwise the discounted price is Round(unit price × (1 − discount / 100), 4) and the
//      amount Round(price × "BaseQuantity", 2). The cuts do not apply on top: the discount is
//      measured from the list's unit price, as VAmount measures it, so the two agree.
//   5. Each row touched gets its price re-derived, "StatAmount" and "@DiscountOK"; the totals
//      follow incrementally from the amount before the discount (a full pass would reset every
//      row's "@DiscountOK" again) and the row is refreshed.
bool DocFunc::VDiscount() {
  return Handle("VDiscount", [&](bool& result) {
    Ref<DataObject> row = st_.RowOB.get();
    Require(row);
    st_.OldAmount = docfunc::CurrencyOf(row->Field("Amount"));
    Ref<DataObject> parts;
    if (TextEquals(TrimmedOf(row->Field(st_.CompletionTypeField)), "D"))
      parts = st_.Doc->CachedRows(st_.RowTable, "Next");
    if (HasRow(parts)) {
      Currency sum;
      for (parts->MoveFirst(); !parts->IsEOF(); parts->MoveNext()) {
        parts->SetField("@Discount", row->Field("@Discount"));
        DiscountRow(parts);
        if (!parts->RowState(kRowMarkedDeleted)) sum = sum + docfunc::CurrencyOf(parts->Field("Amount"));
      }
      row->SetField("Amount", Variant(sum));
      RederivePrice(*row);
      row->SetField("@DiscountOK", Variant(true));
    } else {
      DiscountRow(row);
    }
    st_.TotalsPending = st_.RowRefreshPending = true;
    result = true;
  });
}

void DocFunc::DiscountRow(Ref<xal::DataObject>& row) {
  const double unitPrice = DoubleOf(row->Field(st_.UnitPriceField));
  const Variant discount = row->Field("@Discount");
  if (!KeepsAmount(*row)) {
    if (IsBlank(discount)) {
      RecomputeRow(row, true);
    } else if (unitPrice != 0) {
      const double price = CDbl(server::Round(Variant(unitPrice * (1 - DoubleOf(discount) / 100)), 4));
      row->SetField("Amount", Money(price * DoubleOf(row->Field("BaseQuantity")), 2));
    }
    RederivePrice(*row);
  }
  row->SetField("@DiscountOK", Variant(true));
}

// Rows whose amount is not made from their unit price:
//   1. rows taken from an order row ("OrderRowID") while the amount comes from the order;
//   2. in an assembly (DDProduction), the components the assembly consumes (a sender store);
//   3. particulars of a set priced as a whole ("@CompType" "C"): shares of the set's amount.
bool DocFunc::KeepsAmount(DataObject& row) {
  if (st_.AmountFromOrder && LongOf(row.Field("OrderRowID")) != 0) return true;
  if (TextEquals(st_.DocTable, "DDProduction") && LongOf(row.Field("IDSenderStore")) != 0) return true;
  return TextEquals(TrimmedOf(row.Field("@CompType")), "C");
}

// The price that the amount gives (the unit price when there is no quantity), and the
// statistics amount that follows the amount.
void DocFunc::RederivePrice(DataObject& row) {
  const double quantity = DoubleOf(row.Field("BaseQuantity"));
  if (quantity != 0)
    row.SetField(st_.PriceField, Money(DoubleOf(row.Field("Amount")) / quantity, 4));
  else
    row.SetField(st_.PriceField, row.Field(st_.UnitPriceField));
  if (st_.UseStatFields) row.SetField("StatAmount", row.Field("Amount"));
}

// ---------------------------------------------------------------------------------------------
// Percentage commands
// ---------------------------------------------------------------------------------------------

bool DocFunc::ComputePercentAmount() {
  return Handle("ComputePercentAmount", [&](bool& result) { result = ComputePercent(1, false); });
}

bool DocFunc::ComputePercentPricelist() {
  return Handle("ComputePercentPricelist", [&](bool& result) { result = ComputePercent(2, true); });
}

// Both commands ask for a percentage p (one entry, text 16, starting at 0) under the title text
// `title`; a cancelled box changes nothing and gives False. On confirmation every row of RowOB:
//   1. ComputePercentAmount: Amount = Round(Amount × (1 + p / 100), 2).
//   2. ComputePercentPricelist: Amount = Round(unit price × "BaseQuantity" × (1 + cut / 100) ×
//      (1 + p / 100), 2), with the cut of the row's price-category pair (CategoryCut); the
//      header's price cut does not apply, the percentage takes its place. A row without a unit
//      price keeps its amount.
//   3. Rows whose amount comes from an order row (AmountFromOrder and "OrderRowID") keep it, as
//      for the row discount.
//   4. The particulars of a set row (under "Next") are changed the same way, each by itself; a
//      set shown by its particulars ("D") then takes the sum of theirs as its amount, any other
//      set row is changed by itself. A "D" set without particulars is changed as a plain row.
//   5. Each changed row gets its price re-derived and its "StatAmount"; the rows are written
//      back and the browser and the full totals follow through the deferred work.
bool DocFunc::ComputePercent(int32_t title, bool fromPriceList) {
  Ref<ParamList> params = st_.Server->NewParamList();
  const std::string entry = GetUIString(16);
  Require(params).Add(entry, Variant(0));
  if (!st_.Doc->InputBox(params, kMbOKCancel, GetUIString(title))) return false;
  const double factor = 1 + DoubleOf(params->Item(entry)) / 100;
  DataObject& rows = *st_.RowOB;
  for (rows.MoveFirst(); !rows.IsEOF(); rows.MoveNext()) {
    const std::string type = TrimmedOf(rows.Field(st_.CompletionTypeField));
    Ref<DataObject> parts = type.empty() ? nullptr : st_.Doc->CachedRows(st_.RowTable, "Next");
    if (parts && parts->RowCount() == 0) st_.Doc->FreeCachedRows(st_.RowTable, "Next");
    if (!HasRow(parts)) {
      ChangeByPercent(rows, factor, fromPriceList);
      continue;
    }
    Currency sum;
    for (parts->MoveFirst(); !parts->IsEOF(); parts->MoveNext()) {
      ChangeByPercent(*parts, factor, fromPriceList);
      if (!parts->RowState(kRowMarkedDeleted)) sum = sum + docfunc::CurrencyOf(parts->Field("Amount"));
    }
    if (TextEquals(type, "D")) {
      rows.SetField("Amount", Variant(sum));
      RederivePrice(rows);
    } else {
      ChangeByPercent(rows, factor, fromPriceList);
    }
  }
  st_.RowsRecalcPending = st_.BrowserRefreshPending = st_.FullTotalsPending = true;
  return true;
}

void DocFunc::ChangeByPercent(DataObject& row, double factor, bool fromPriceList) {
  if (st_.AmountFromOrder && LongOf(row.Field("OrderRowID")) != 0) return;
  double amount = DoubleOf(row.Field("Amount")) * factor;
  if (fromPriceList) {
    const double unitPrice = DoubleOf(row.Field(st_.UnitPriceField));
    if (unitPrice == 0) return;
    amount = unitPrice * DoubleOf(row.Field("BaseQuantity")) * (1 + CategoryCut(row) / 100) * factor;
  }
  row.SetField("Amount", Money(amount, 2));
  RederivePrice(row);
}

// The price cut of the row's price-category pair: the article's category with the company's
// category, or when that pair has no cut, with the partner's; 0 when neither has one.
double DocFunc::CategoryCut(DataObject& row) {
  const int32_t articleCategory = LongOf(row.Field("GRArticle.IDGRArticlePriceCat"));
  if (articleCategory == 0) return 0;
  for (const char* who : {"GRCompany", "Partner"}) {
    const int32_t category =
        LongOf(st_.HeaderOB->Field(std::string(who) + ".IDGRCompanyPriceCat" + st_.CompanyFieldSuffix));
    if (category == 0) continue;
    Ref<DataObject> cut = OpenQuery("SELECT PriceCut FROM GRPriceCatRel WHERE IDGRArticlePriceCat = " +
                                    Num(articleCategory) + " AND IDGRCompanyPriceCat = " + Num(category));
    if (HasRow(cut)) return DoubleOf(cut->Field("PriceCut"));
  }
  return 0;
}

}  // namespace xal
