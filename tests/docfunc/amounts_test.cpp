// Row amounts, quantities, taxes and the header totals on the reference host: the incremental
// totals against a full pass over many generated edit sequences, entered row and header taxes,
// the column totals, the tax questions, prices and cuts, units, and the row checks.
#include <ostream>
#include <random>

#include "docfunc/docfunc_fixture.h"
#include "docfunc/values.h"
#include "host/data_object.h"

namespace xal::docfunc::testing {
namespace {

using Fields = std::vector<std::pair<std::string, Variant>>;

Variant M(double v) { return Variant(Currency::FromDouble(v)); }

struct Totals {
  Currency net, tax, total;
  bool operator==(const Totals&) const = default;
  friend std::ostream& operator<<(std::ostream& os, const Totals& t) {
    return os << "{" << t.net.ToDouble() << ", " << t.tax.ToDouble() << ", " << t.total.ToDouble() << "}";
  }
};
Totals T(double net, double tax, double total) {
  return {Currency::FromDouble(net), Currency::FromDouble(tax), Currency::FromDouble(total)};
}

// An invoice row of article 1 (one piece) with an amount, a tax code and an entered tax.
Fields InvoiceRow(double amount, int32_t tax, double taxAmount = 0) {
  return {{"IDGRArticle", Variant(1)}, {"IDGRUnit", Variant(1)},  {"Quantity", Variant(1.0)},
          {"BaseQuantity", Variant(1.0)}, {"Amount", M(amount)}, {"IDGRTax", Variant(tax)},
          {"TaxAmount", M(taxAmount)}};
}

class Amounts : public DocFuncTest {
 protected:
  void SetUp() override {
    DocFuncTest::SetUp();
    conn->db().ExecScript(
        "INSERT INTO GRTax (ID, Code, TaxPercent) VALUES (1, 'T20', 20), (2, 'T9', 9), (3, 'T0', 0);"
        "INSERT INTO GRUnit (ID, Code, IDFirst, Relation) VALUES (1, 'pcs', 0, 1), (2, 'kg', 0, 1),"
        " (6, 'pack', 1, 10), (8, 'g', 2, 0.001), (10, 'box', 6, 2), (11, 'loopA', 12, 2), (12, 'loopB', 11, 3);"
        "INSERT INTO DRIntrCNCode (ID, Code, IDGRUnit) VALUES (1, '0901', 6);"
        "UPDATE GRArticle SET IDGRUnit = 1, NetMass = 0.5, IDGRArticlePriceCat = 1, IDDRIntrCNCode = 1,"
        " QuantityType = 'S', MnQuantity = 10 WHERE ID = 1;"
        "UPDATE GRArticle SET IDGRUnit = 2, QuantityType = 'P' WHERE ID = 2;"
        "INSERT INTO GRPriceList (ID, Code, BeginDate, EndDate) VALUES (1, 'BASE', 0, 73051);"
        "INSERT INTO GRPriceListRel (IDGRPriceList, IDGRArticle, IDGRUnit, Price, BeginDate, EndDate)"
        " VALUES (1, 1, 1, 2.5, 0, 73051);"
        "UPDATE GRCompany SET IDGRCompanyPriceCat = 1 WHERE ID = 10;"
        "INSERT INTO GRPriceCatRel (IDGRArticlePriceCat, IDGRCompanyPriceCat, IDGRPriceList, PriceCut, MinMarkup)"
        " VALUES (1, 1, 1, -5, 20);"
        "INSERT INTO DRStockReserve (ID, IDGRArticle, Quantity, SerialNo) VALUES (70, 1, 10, 'L1');");
  }

  // A document of `kind` stored with `header` and `rows`, opened again with a DocFunc wired to it.
  void OpenStored(const std::string& kind, Fields header, const std::vector<Fields>& rows) {
    Open(kind);
    header.insert(header.begin(), {{"IDGRCompany", Variant(10)}, {"DocDate", Variant(Date(40179))},
                                   {"IDGRPriceList", Variant(1)}});
    for (const auto& [name, value] : header) session->Header()->SetField(name, value);
    for (const Fields& row : rows)
      for (session->Rows()->AddNew(); const auto& [name, value] : row) session->Rows()->SetField(name, value);
    const int32_t id = session->Save();
    Call(df, "Destroy");
    session->Close();
    Open(kind, id);
    session->ClearTranscript();
  }
  Totals Read() {
    Ref<DataObject> h = session->Header();
    return {CurrencyOf(h->Field("@NetAmount")), CurrencyOf(h->Field("@TaxAmount")), CurrencyOf(h->Field("TotalAmount"))};
  }
  void GoToRow(int i) {
    session->Rows()->MoveFirst();
    while (i-- > 0) session->Rows()->MoveNext();
  }
  bool Run(const std::string& name) { return CBool(Handler(name)); }
  // The user edits field `name` of the current row between its W and V handlers.
  void Edit(const char* when, const char* name, const Variant& value, const char* valid) {
    Run(when);
    session->Rows()->SetField(name, value);
    Run(valid);
  }
  Variant RowField(const char* name) { return session->Rows()->Field(name); }
};

// ---------------------------------------------------------------------------------------------
// Totals
// ---------------------------------------------------------------------------------------------

TEST_F(Amounts, IncrementalTotalsEqualAFullPassAfterAnyEdits) {
  std::mt19937 random(20240611);
  auto pick = [&](int n) { return static_cast<int>(random() % static_cast<unsigned>(n)); };
  auto cents = [&](int most) { return pick(most * 100 + 1) / 100.0; };
  const double rate[] = {0, 20, 9, 0};
  for (int sequence = 0; sequence < 40; ++sequence) {
    std::vector<Fields> rows;
    for (int i = 3 + pick(5); i > 0; --i) rows.push_back(InvoiceRow(cents(500), pick(4)));
    OpenStored("SDInvoice", {}, rows);
    ASSERT_TRUE(Run("AdjustAllAmounts"));
    Ref<host::HostDataObject> data = session->Rows();
    std::vector<Variant> marks;
    for (data->MoveFirst(); !data->IsEOF(); data->MoveNext()) marks.push_back(data->Bookmark());
    for (int step = 0; step < 25; ++step) {
      const int kind = pick(5);
      data->GoToBookmark(marks[static_cast<size_t>(pick(static_cast<int>(marks.size())))]);
      if (data->RowState(kRowMarkedDeleted) != (kind == 4)) continue;  // undelete only a deleted row
      SCOPED_TRACE("sequence " + std::to_string(sequence) + " step " + std::to_string(step) + " edit " +
                   std::to_string(kind));
      if (kind == 0) Edit("WAmount", "Amount", M(cents(500)), "VAmount");
      if (kind == 1) Edit("WRowTax", "IDGRTax", Variant(pick(4)), "VRowTax");
      if (kind == 2 && Run("WRowTaxAmount")) Edit("WRowTaxAmount", "TaxAmount", M(cents(60)), "VRowTaxAmount");
      if (kind >= 3) { EXPECT_TRUE(Run("DelRow")); }
      if (kind == 3) data->Delete();
      if (kind == 4) data->Undelete();
      const Totals incremental = Read();
      ASSERT_TRUE(Run("AdjustAllAmounts"));
      EXPECT_EQ(incremental, Read());
      // Independently: the net is the sum of the rows left; without entered taxes the tax is the
      // rates' tax on them.
      Currency net, tax;
      for (data->MoveFirst(); !data->IsEOF(); data->MoveNext()) {
        if (data->RowState(kRowMarkedDeleted)) continue;
        net = net + CurrencyOf(data->Field("Amount"));
        const double percent = rate[LongOf(data->Field("IDGRTax"))];
        tax = Currency::FromDouble(tax.ToDouble() + CurrencyOf(data->Field("Amount")).ToDouble() * percent / 100);
      }
      EXPECT_EQ(incremental.net, net);
      if (!State().RowTaxEntered) { EXPECT_EQ(incremental.tax, tax); }
    }
  }
}

TEST_F(Amounts, EnteredRowTaxesCountFromTheFirstOneOn) {
  OpenStored("SDInvoice", {}, {InvoiceRow(100, 1), InvoiceRow(50, 2, 5), InvoiceRow(10, 1), InvoiceRow(30, 0)});
  for (int pass = 0; pass < 2; ++pass) {  // the same figures on a second pass over the same rows
    ASSERT_TRUE(Run("AdjustAllAmounts"));
    EXPECT_EQ(Read(), T(190, 25, 215));  // 20 at the rate, then 5 and 0 as entered
    EXPECT_TRUE(State().RowTaxEntered);
  }
  GoToRow(2);
  Edit("WAmount", "Amount", M(20), "VAmount");  // in the entered part: the tax stays
  EXPECT_EQ(Read(), T(200, 25, 225));
  GoToRow(0);
  Edit("WAmount", "Amount", M(200), "VAmount");  // before it: tax at the rate on the change
  EXPECT_EQ(Read(), T(300, 45, 345));
  GoToRow(1);
  Edit("WRowTaxAmount", "TaxAmount", M(0), "VRowTaxAmount");  // no entered tax left: rates again
  EXPECT_EQ(Read(), T(300, 48.5, 348.5));
  EXPECT_FALSE(State().RowTaxEntered);
}

TEST_F(Amounts, EnteredHeaderTaxWins) {
  OpenStored("SDInvoice", {{"TaxAmount", M(7.5)}, {"ApproxDifference", M(-0.5)}}, {InvoiceRow(100, 1)});
  ASSERT_TRUE(Run("AdjustAllAmounts"));
  EXPECT_EQ(Read(), T(100, 7.5, 107));
  session->ClearTranscript();
  Edit("WAmount", "Amount", M(200), "VAmount");
  EXPECT_EQ(Read(), T(200, 7.5, 207));
  EXPECT_EQ(session->TranscriptText(), "OnNewRow(); RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\")");
  session->Header()->SetField("TaxAmount", M(0));
  EXPECT_TRUE(Run("VTaxAmount"));
  EXPECT_EQ(Read(), T(200, 40, 239.5));
}

TEST_F(Amounts, TotalsNeverBuiltAreBuiltByWhenDocument) {
  // A row deleted first: the totals are built with it, then it goes.
  OpenStored("SDInvoice", {}, {InvoiceRow(100, 1), InvoiceRow(50, 2)});
  EXPECT_TRUE(IsBlank(session->Header()->Field("@NetAmount")));
  GoToRow(1);
  EXPECT_TRUE(Run("DelRow"));
  session->Rows()->Delete();
  EXPECT_EQ(Read(), T(100, 20, 120));
  EXPECT_EQ(session->TranscriptText(), "RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\"); "  // WhenDocument
                                       "RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\")");
  // An amount edited first: the built totals hold the new amount once.
  OpenStored("SDInvoice", {}, {InvoiceRow(100, 1), InvoiceRow(50, 2)});
  Edit("WAmount", "Amount", M(150), "VAmount");
  EXPECT_EQ(Read(), T(200, 34.5, 234.5));
}

TEST_F(Amounts, ColumnTotalsTakeTheNamesTrimmed) {
  OpenStored("SDInvoice", {}, {InvoiceRow(10, 1), InvoiceRow(20, 1), InvoiceRow(30, 1)});
  const double quantity[] = {2, 3, 0.5};
  const Variant cost[] = {M(1.5), M(2.25), Variant::Null()};  // a blank field adds nothing
  for (int i = 0; i < 3; ++i) {
    GoToRow(i);
    session->Rows()->SetField("Quantity", Variant(quantity[i]));
    session->Rows()->SetField("Cost", cost[i]);
  }
  GoToRow(1);
  session->Rows()->Delete();  // the form still shows it: counted
  session->Proxy()->SetValues("RowTotals", Variant(" Quantity ,  Cost ,"));
  ASSERT_TRUE(Run("AdjustAllAmounts"));
  EXPECT_EQ(session->Header()->Field("@Total_Quantity"), Variant(5.5));
  EXPECT_EQ(session->Header()->Field("@Total_Cost"), M(3.75));
  EXPECT_TRUE(IsBlank(session->Header()->Field("@Total_")));  // the empty last name is skipped
  EXPECT_EQ(Read(), T(40, 8, 48));
}

TEST_F(Amounts, BaseAndReferenceTotalsFromTheStoredTaxes) {
  Fields row1 = InvoiceRow(100, 1), row2 = InvoiceRow(50, 2);
  row1.insert(row1.end(), {{"AmountBase", M(110)}, {"AmountRef", M(90)}});
  row2.insert(row2.end(), {{"AmountBase", M(55)}, {"AmountRef", M(45)}});
  OpenStored("SDInvoice", {{"ApproxDifferenceBase", M(0.01)}, {"TaxAmountRef", M(30)}}, {row1, row2});
  conn->db().Exec("INSERT INTO GDTax (IDGDocument, TaxAmount, TaxAmountBase, TaxAmountRef) VALUES (?, 20, 22, 18), "
                  "(?, 4.5, 4.95, 4.05)",
                  {session->Header()->Field("ID"), session->Header()->Field("ID")});
  EXPECT_TRUE(Run("WhenDocument"));
  Ref<DataObject> h = session->Header();
  EXPECT_EQ(Read(), T(150, 24.5, 174.5));
  EXPECT_EQ(h->Field("@NetAmountBase"), M(165));
  EXPECT_EQ(h->Field("@TaxAmountBase"), M(26.95));
  EXPECT_EQ(h->Field("TotalAmountBase"), M(191.96));
  EXPECT_EQ(h->Field("@NetAmountRef"), M(135));
  EXPECT_EQ(h->Field("@TaxAmountRef"), M(30));  // entered on the header: wins over the stored 22.05
  EXPECT_EQ(h->Field("TotalAmountRef"), M(165));
}

// ---------------------------------------------------------------------------------------------
// Taxes
// ---------------------------------------------------------------------------------------------

TEST_F(Amounts, HeaderTaxCodeAndItsQuestion) {
  const char* kQuestion = "MsgBox(\"Delete tax on document rows?\",4)->";
  struct Case {
    int32_t headerTax, answer;
    std::string question;
    int32_t rowTax;
    double rowTaxAmount;
    Variant unitPriceTax;
    Totals totals;
  } cases[] = {
      {0, 6, kQuestion + std::string("6; RefreshHeader(\"\"); "), 0, 0, M(2.5), T(150, 0, 150)},
      {0, 7, kQuestion + std::string("7; RefreshHeader(\"\"); "), 1, 7, Variant(), T(150, 7, 157)},  // 7 entered
      {1, 6, "", 1, 0, M(3), T(150, 30, 180)},  // a header code: carried into the rows, rates only
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.question);
    OpenStored("SDInvoice", {{"IDGRTax", Variant(c.headerTax)}, {"TaxAmount", M(c.headerTax ? 0 : 3)}},
               {InvoiceRow(100, 1, 7), InvoiceRow(50, 2)});
    session->Rows()->SetField("@UnitPrice", M(2.5));
    session->Policy().msgBoxAnswers = {c.answer};
    EXPECT_TRUE(Run("VTax"));
    EXPECT_EQ(session->TranscriptText(), c.question + "RefreshBrowser(\"\"); RefreshBrowser(\"SDINVOICERow.@\"); "
                                                      "RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\")");
    GoToRow(0);
    EXPECT_EQ(LongOf(RowField("IDGRTax")), c.rowTax);
    EXPECT_EQ(RowField("TaxAmount"), M(c.rowTaxAmount));
    EXPECT_EQ(RowField("@UnitPriceTax"), c.unitPriceTax);
    EXPECT_EQ(session->Header()->Field("TaxAmount"), M(0));
    EXPECT_EQ(Read(), c.totals);
  }
}

TEST_F(Amounts, WhichTaxesMayBeEdited) {
  struct Case {
    int32_t headerTax, rowTax;
    bool taxAmount, rowTaxAmount, rowTaxCode;
  } cases[] = {{0, 1, false, true, true}, {1, 1, true, false, false}, {0, 0, false, false, true}};
  for (const Case& c : cases) {
    SCOPED_TRACE(std::to_string(c.headerTax) + "/" + std::to_string(c.rowTax));
    OpenStored("SDInvoice", {{"IDGRTax", Variant(c.headerTax)}}, {InvoiceRow(100, c.rowTax, 4)});
    EXPECT_EQ(Run("WTaxAmount"), c.taxAmount);
    EXPECT_EQ(Run("WRowTaxAmount"), c.rowTaxAmount);
    if (c.rowTaxAmount) { EXPECT_EQ(State().OldRowTax, CurrencyOf(M(4))); }
    EXPECT_EQ(Run("WRowTax"), c.rowTaxCode);
    if (c.rowTaxCode) { EXPECT_EQ(State().OldRowTax, CurrencyOf(M(c.rowTax ? 20 : 0))); }
  }
}

// ---------------------------------------------------------------------------------------------
// Row amounts and prices
// ---------------------------------------------------------------------------------------------

TEST_F(Amounts, RecomputedAmountsAndTheirCuts) {
  struct Case {
    const char* kind;
    double baseQuantity;
    double cut;  // the factor the amount gets after the unit price × quantity
  } cases[] = {
      {"SDInvoice", 4, 1.1 * 0.95},  // header cut 10 %, then the category pair's −5 %
      {"SDInvoice", 0, 1},           // no quantity: no amount, the unit price is the price
      {"DDMovement", 4, 1},          // no price categories: the header cut never applies
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.kind) + " " + std::to_string(c.baseQuantity));
    OpenStored(c.kind, {{"PriceCut", Variant(10.0)}},
               {{{"IDGRArticle", Variant(1)}, {"BaseQuantity", Variant(c.baseQuantity)}, {"UnitPrice", M(2.5)}}});
    EXPECT_TRUE(Run("RecomputeDocAmounts"));
    GoToRow(0);
    const double unitPrice = DoubleOf(RowField("UnitPrice"));
    if (TextEquals(c.kind, "SDInvoice")) { EXPECT_EQ(unitPrice, 2.5); }
    const double amount = DoubleOf(RowField("Amount"));
    EXPECT_NEAR(amount, unitPrice * c.baseQuantity * c.cut, 0.006);
    EXPECT_EQ(RowField("Price"), c.baseQuantity ? M(amount / c.baseQuantity) : M(unitPrice));
  }
}

TEST_F(Amounts, RowFiguresAfterTheAmount) {
  struct Case {
    double amount, quantity, base;
    int32_t tax;
    double taxAmount, unitPrice, unitPriceTax, discount;
  } cases[] = {
      {10, 4, 4, 1, 0, 2.5, 3, 0},
      {9, 4, 4, 1, 0, 2.25, 2.7, 10},    // 10 % under the list's 2.50
      {9, 4, 4, 2, 1, 2.25, 2.5, 10},    // an entered row tax: its share per unit
      {9, 0, 0, 1, 0, 0, 0, 0},          // no quantity: nothing to show
      {10, 2, 20, 1, 0, 5, 6, 80},       // two packs of ten: per pack, the discount per piece
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.amount);
    Open("SDInvoice");
    session->Header()->SetField("IDGRCompany", Variant(11));  // no price category: no markup check
    AddRow({{"IDGRArticle", Variant(1)}, {"Amount", M(c.amount)}, {"Quantity", Variant(c.quantity)},
            {"BaseQuantity", Variant(c.base)}, {"UnitPrice", M(2.5)}, {"IDGRTax", Variant(c.tax)},
            {"TaxAmount", M(c.taxAmount)}});
    EXPECT_TRUE(Run("VAmount"));
    EXPECT_EQ(RowField("@UnitPrice"), M(c.unitPrice));
    EXPECT_EQ(RowField("@UnitPriceTax"), M(c.unitPriceTax));
    EXPECT_EQ(RowField("@Discount"), M(c.discount));
    EXPECT_EQ(RowField("StatAmount"), M(c.amount));
    EXPECT_TRUE(State().TotalsPending == false && State().TotalsReady);  // the totals followed
  }
}

TEST_F(Amounts, MinimumMarkupWarning) {
  for (double amount : {10.0, 12.0}) {
    Open("SDInvoice");
    session->Header()->SetField("IDGRCompany", Variant(10));
    session->Header()->SetField("IDGRPriceList", Variant(1));
    AddRow({{"IDGRArticle", Variant(1)}, {"Amount", M(amount)}, {"Quantity", Variant(2.0)},
            {"BaseQuantity", Variant(2.0)}, {"Cost", M(10)}});
    session->ClearTranscript();
    EXPECT_TRUE(Run("VAmount"));  // cost 5 a piece, markup 20 %: at least 6 a piece
    EXPECT_EQ(session->TranscriptText().starts_with("MsgBox(\"Price with minimal markup is 12.00\",0)->1"),
              amount == 10.0);
  }
}

TEST_F(Amounts, EditingRulesOfTheMoneyFields) {
  struct Case {
    const char* kind;
    const char* completion;
    const char* articleType;
    bool cost, amount, store;
  } cases[] = {
      {"GUDocument", "P", "P", true, true, true},  // no sets on this kind
      {"SDInvoice", "", "G", true, true, true},   {"SDInvoice", "", "P", false, true, true},
      {"SDInvoice", "P", "G", false, true, true}, {"SDInvoice", "A", "S", true, true, true},
      {"SDInvoice", "a", "G", false, true, true}, {"SDInvoice", "R", "G", false, true, true},
      {"SDInvoice", "D", "G", true, false, false}, {"SDInvoice", " C", "G", true, true, false},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.kind) + " '" + c.completion + "' " + c.articleType);
    Open(c.kind);
    AddRow({{"CompletionType", Variant(c.completion)}, {"ArticleType", Variant(c.articleType)}, {"Amount", M(8)}});
    EXPECT_EQ(Run("WCost"), c.cost);
    EXPECT_EQ(Run("WAmount"), c.amount);
    EXPECT_EQ(State().OldAmount, Currency());  // a row not stored yet counts as new
    EXPECT_EQ(Run("WDRStoreRow"), c.store);
    EXPECT_FALSE(Run("WDealState"));
  }
}

TEST_F(Amounts, Defaults) {
  OpenStored("SDInvoice", {{"PriceCut", Variant(-10.0)}},
             {{{"IDGRArticle", Variant(1)}, {"Quantity", Variant(3.0)}, {"UnitPrice", M(2.5)}},
              {{"IDGRArticle", Variant(2)}}, {{"IDGRArticle", Variant(3)}}});
  EXPECT_EQ(Handler("DQuantity"), Variant(3.0));
  EXPECT_EQ(Handler("DSeries"), Variant("Series"));
  EXPECT_EQ(Handler("DRowDiscount"), M(14.5));  // 1 − 0.9 × 0.95
  session->Header()->SetField("PriceCut", Variant(0.0));
  EXPECT_EQ(Handler("DRowDiscount"), M(5));
  GoToRow(1);
  EXPECT_EQ(Handler("DSeries"), Variant("Lot"));
  GoToRow(2);
  EXPECT_EQ(Handler("DSeries"), Variant(""));
  OpenStored("DDMovement", {{"PriceCut", Variant(-10.0)}}, {{{"IDGRArticle", Variant(1)}, {"UnitPrice", M(2.5)}}});
  EXPECT_EQ(Handler("DRowDiscount"), M(0));  // a kind without prices
}

// ---------------------------------------------------------------------------------------------
// Quantities, units and cost
// ---------------------------------------------------------------------------------------------

TEST_F(Amounts, QuantityThroughTheUnits) {
  struct Case {
    int32_t unit, article;
    double quantity, base, customs;
  } cases[] = {
      {1, 1, 3, 3, 0.3},     // the article's own unit; customs counted in packs
      {6, 1, 3, 30, 3},      // packs of ten
      {10, 1, 2, 40, 4},     // boxes of two packs: two relations on the way
      {8, 2, 500, 0.5, 0},   // grams of an article kept in kilograms
      {2, 1, 7, 7, 0.7},     // kilograms of an article kept in pieces: no common unit, unchanged
      {11, 1, 4, 4, 0.4},    // a chain that runs in a circle stops; no common unit
      {0, 1, 5, 5, 0.5},     // no unit
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::to_string(c.unit) + " " + std::to_string(c.quantity));
    Open("SDInvoice");
    AddRow({{"IDGRArticle", Variant(c.article)}, {"IDGRUnit", Variant(c.unit)}, {"Quantity", Variant(c.quantity)}});
    EXPECT_TRUE(Run("VQuantity"));
    EXPECT_DOUBLE_EQ(DoubleOf(RowField("BaseQuantity")), c.base);
    EXPECT_DOUBLE_EQ(DoubleOf(RowField("NetMass")), c.article == 1 ? c.base * 0.5 : 0);
    EXPECT_DOUBLE_EQ(DoubleOf(RowField("CNQuantity")), c.customs);
  }
  SetOption("GDocument", "RoundingQuantity", Variant(2));  // decimals kept; the default keeps all
  Open("SDInvoice");
  AddRow({{"IDGRArticle", Variant(1)}, {"IDGRUnit", Variant(1)}, {"Quantity", Variant(1.23456)}});
  EXPECT_TRUE(Run("VUnit"));
  EXPECT_EQ(RowField("BaseQuantity"), Variant(1.23));
}

TEST_F(Amounts, QuantityOfCreditAndOrderRowsAndTheMinimumStock) {
  // A credit row keeps the old document's price and cost; a part of a set credited by its set row gets none.
  for (const char* compType : {"", "C"}) {
    Open("SDInvoice");
    AddRow({{"IDGRArticle", Variant(1)}, {"IDGRUnit", Variant(1)}, {"Quantity", Variant(2.0)},
            {"@IsCreditByOld", Variant(true)}, {"@CreditUnitPrice", Variant(7.5)}, {"@CreditCost", Variant(5.0)},
            {"@CompType", Variant(compType)}});
    EXPECT_TRUE(Run("VQuantity"));
    EXPECT_EQ(RowField("Amount"), M(*compType ? 0 : 15));
    EXPECT_EQ(RowField("Cost"), M(10));
    EXPECT_EQ(RowField("UnitPrice"), M(7.5));
  }
  // An issue made from an order takes its share of the order's amount; it leaves its store
  // under the article's minimum: 12 + 1 − 4 = 9 left, 10 critical.
  conn->db().Exec("INSERT INTO SDOrderRow (ID, Amount, BaseQuantity) VALUES (500, 100, 10)");
  SetOption("SDConsignmD", "AmountFromSDOrder", Variant(-1));
  SetOption("GRArticle", "MinQuantityMessage", Variant(-1));
  Open("SDConsignmD");
  AddRow({{"IDGRArticle", Variant(1)}, {"IDGRUnit", Variant(1)}, {"Quantity", Variant(4.0)},
          {"OrderRowID", Variant(500)}, {"IDSenderStore", Variant(100)}, {"@StockRes", Variant(12.0)},
          {"@OrigQ", Variant(1.0)}});
  EXPECT_TRUE(Run("VQuantity"));
  EXPECT_EQ(RowField("Amount"), M(40));
  EXPECT_EQ(RowField("Price"), M(10));
  EXPECT_TRUE(session->TranscriptText().starts_with("MsgBox(\"On hand 9, critical 10\",0)->1"));
}

TEST_F(Amounts, SetCostSharedAmongItsParticulars) {
  struct Case {
    std::vector<double> costs, quantities, shares;
  } cases[] = {
      {{1, 3}, {1, 1}, {2.5, 7.5}},           // by their costs
      {{0, 0}, {1, 4}, {2, 8}},               // by their quantities
      {{0, 0, 0}, {0, 0, 0}, {3.33, 3.33, 3.34}},  // equal; the last takes the rounding
  };
  for (const Case& c : cases) {
    Open("SDInvoice");
    AddRow({{"CompletionType", Variant("C")}, {"Cost", M(10)}});
    Ref<DataObject> parts = session->Proxy()->CachedRows("SDInvoiceRow", "Next");
    for (size_t i = 0; i < c.costs.size(); ++i) {
      parts->AddNew();
      parts->SetField("Cost", M(c.costs[i]));
      parts->SetField("BaseQuantity", Variant(c.quantities[i]));
    }
    EXPECT_TRUE(Run("VCost"));
    parts->MoveFirst();
    for (double share : c.shares) {
      EXPECT_EQ(parts->Field("Cost"), M(share));
      parts->MoveNext();
    }
  }
}

TEST_F(Amounts, RowChecksBeforeLeavingTheRow) {
  Open("SDInvoice");
  AddRow({{"CompletionType", Variant("C")}});
  EXPECT_TRUE(Run("VDocRow"));
  EXPECT_EQ(session->TranscriptText(),
            "StatusMsg(\"\"); CachedRows(\"SDINVOICERow\",\"Next\"); StatusMsg(\"Set rows are missing\")");
  Open("DDMovement");
  AddRow({{"IDGRArticle", Variant(1)}});
  EXPECT_TRUE(Run("VDocRow"));
  EXPECT_EQ(session->TranscriptText(), "StatusMsg(\"\"); StatusMsg(\"Warehouse required\")");
  // A lot taken beyond what it has left.
  SetOption("SDConsignmD", "CheckLotReserve", Variant(-1));
  Open("SDConsignmD");
  AddRow({{"IDGRArticle", Variant(1)}, {"IDSenderStore", Variant(100)}});
  Ref<DataObject> lots = session->Proxy()->CachedRows("DDStoreDRow", "DRStockReserveRel");
  for (double quantity : {8.0, 1.0}) {
    lots->AddNew();
    lots->SetField("IDDRStockReserve", Variant(70));
    lots->SetField("Quantity", Variant(quantity));
    lots->SetField("@StockReserveQ", Variant(5.0));
    lots->SetField("@OrigQ", Variant(2.0));
  }
  session->ClearTranscript();
  EXPECT_FALSE(Run("VDocRow"));
  EXPECT_EQ(session->TranscriptText(),
            "StatusMsg(\"\"); CachedRows(\"DDStoreDRow\",\"DRStockReserveRel\"); "
            "StatusMsg(\"Insufficient item 'A1' lot 'L1' in warehouse 'MAIN'.\r\nRequired quantity 8 lot on hand 7\")");
  lots->MoveFirst();
  EXPECT_EQ(lots->Field("@StockReserveQ"), Variant(-1.0));
  EXPECT_EQ(lots->Field("@OrigQ"), Variant(8.0));
  lots->MoveNext();
  EXPECT_EQ(lots->Field("@StockReserveQ"), Variant(6.0));  // brought up to date too
  lots->MoveFirst();
  lots->SetField("Quantity", Variant(7.0));  // back within the lot
  EXPECT_TRUE(Run("VDocRow"));
}

}  // namespace
}  // namespace xal::docfunc::testing
