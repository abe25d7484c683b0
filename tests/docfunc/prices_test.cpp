// Prices and discounts of DocFunc on the reference host, in both database kinds: the row price
// from company prices and price-list chains (dates, own and category lists, quantity steps,
// gross lists, units, chains that come back on themselves), the SQL one look-up sends, the
// header price list and price cut with the row question, the row discount and the percentage
// commands.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "docfunc/docfunc.h"
#include "host/document_session.h"
#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/text.h"
#include "server/recording_connection.h"

namespace xal {
namespace {

using server::sqllog::DialectDbTest;
using server::sqllog::KindName;

std::string S(int y, int m, int d) { return std::to_string(static_cast<int>(DateSerial(y, m, d).serial)); }
double Dbl(const Variant& v) { return v.IsNull() || v.IsEmpty() ? 0.0 : CDbl(v); }

// Lists: 11 (2008) -> 12 (2009) -> 13 -> 14 -> 15, the third the first valid in 2010; 20 gross;
// 30 with quantity steps; 40 a company's own list; 50 a category pair's list; 60 <-> 61 a cycle
// of valid lists, 62 <-> 63 a cycle of lists out of date; 64 out of date at the end of its chain.
// Companies: 100 plain; 101 own list 40; 102 price category 7; 103 own list 64.
// Articles (unit 1 "pcs" unless said): 1, 7 chain; 2 gross; 3 steps; 4 company price; 5 category
// 2 (category list); 6 priced per pack (unit 6 holds 10 pcs).
class PricesTest : public DialectDbTest {
 protected:
  void SetUp() override {
    DialectDbTest::SetUp();
    Exec("INSERT INTO GRUnit (ID, Code, IDFirst, Relation) VALUES (1, 'pcs', 0, 1), (6, 'pack', 1, 10);"
         "INSERT INTO GRTax (ID, Code, TaxPercent) VALUES (1, 'T22', 22);"
         "INSERT INTO GRArticle (ID, Code, IDGRUnit, IDGRArticlePriceCat) VALUES (1, 'A1', 1, 1), (2, 'A2', 1, 1),"
         " (3, 'A3', 1, 1), (4, 'A4', 1, 1), (5, 'A5', 1, 2), (6, 'A6', 1, 0), (7, 'A7', 1, 0);"
         "INSERT INTO GRPriceList (ID, Name, IDFirst, BeginDate, EndDate, IsBruto, WithoutPriceCut) VALUES"
         " (11, 'L2008', 12, " + S(2008, 1, 1) + ", " + S(2008, 12, 31) + ", 0, 0),"
         " (12, 'L2009', 13, " + S(2009, 1, 1) + ", " + S(2009, 12, 31) + ", 0, 0),"
         " (13, 'L3', 14, " + S(2010, 1, 1) + ", 0, 0, -1), (14, 'L4', 15, 0, 0, 0, 0), (15, 'L5', 0, 0, 0, 0, 0),"
         " (20, 'Gross', 0, 0, 0, -1, 0), (30, 'Steps', 0, 0, 0, 0, 0), (40, 'Own', 0, 0, 0, 0, 0),"
         " (50, 'Cat', 0, 0, 0, 0, 0), (60, 'A', 61, 0, 0, 0, 0), (61, 'B', 60, 0, 0, 0, 0),"
         " (62, 'C', 63, " + S(2008, 1, 1) + ", " + S(2008, 1, 31) + ", 0, 0),"
         " (63, 'D', 62, " + S(2008, 1, 1) + ", " + S(2008, 1, 31) + ", 0, 0),"
         " (64, 'Old', 0, " + S(2008, 1, 1) + ", " + S(2008, 1, 31) + ", 0, 0);"
         "INSERT INTO GRPriceListRel (ID, IDGRPriceList, IDGRArticle, IDGRUnit, Price, BeginDate, EndDate) VALUES"
         " (1101, 11, 1, 1, 11, 0, 0), (1201, 12, 1, 1, 12, 0, 0),"
         " (1301, 13, 1, 1, 39, " + S(2009, 1, 1) + ", " + S(2009, 12, 31) + "),"
         " (1302, 13, 1, 1, 30, " + S(2010, 1, 1) + ", 0), (1501, 15, 7, 1, 55, 0, 0),"
         " (2001, 20, 2, 1, 122, 0, 0), (3001, 30, 3, 1, 200, 0, 0), (3002, 30, 4, 1, 100, 0, 0),"
         " (3003, 30, 6, 6, 36, 0, 0), (4001, 40, 1, 1, 25, 0, 0), (5001, 50, 5, 1, 70, 0, 0),"
         " (6401, 64, 3, 1, 1, 0, 0);"
         "INSERT INTO GRPriceLQuantity (IDGRPriceListRel, Quantity, Price, QuantityPercent) VALUES"
         " (3001, 10, 0, -10), (3001, 50, 150, 0);"
         "INSERT INTO GRPriceCatRel (IDGRArticlePriceCat, IDGRCompanyPriceCat, IDGRPriceList, PriceCut) VALUES"
         " (2, 7, 50, 0), (1, 7, 30, -5);"
         "INSERT INTO GRCompany (ID, Code, IDGRPriceListC, IDGRCompanyPriceCat) VALUES (100, 'PLAIN', 0, 0),"
         " (101, 'OWN', 40, 0), (102, 'CAT', 0, 7), (103, 'OWNX', 64, 0);"
         // Certified company prices of article 4 for company 100: 80 is the cheapest valid one.
         "INSERT INTO GRCPriceList (ID, IsCertified, BeginDate, EndDate) VALUES (1, -1, " + S(2010, 1, 1) + ", 0),"
         " (2, 0, 0, 0), (3, -1, " + S(2008, 1, 1) + ", " + S(2008, 12, 31) + "), (4, -1, 0, 0);"
         "INSERT INTO GRCPriceListRel (IDGRCPriceList, IDGRArticle, IDGRUnit, Price) VALUES"
         " (1, 4, 1, 80), (2, 4, 1, 60), (3, 4, 1, 50), (4, 4, 1, 90);"
         "INSERT INTO GRCPriceLCompany (IDGRCPriceList, IDGRCompany) VALUES (1, 100), (2, 100), (3, 100), (4, 100);");
  }

  // A document of `kind` dated 2010-03-15 with a DocFunc over its header and rows.
  void Open(const std::string& kind = "SDInvoice") {
    session = host::DocumentSession::Open(host, kind);
    header = session->Header();
    rows = session->Rows();
    header->SetField("DocDate", Variant(DateSerial(2010, 3, 15)));
    df = MakeRef<DocFunc>();
    df->SetDoc(session->Proxy());
    df->SetDocData(header);
    df->SetXALServer(conn->Server());
    df->Create();
    df->SetRowOB(rows);
  }
  // A row (or a particular of `to`) with its list unit price, amount and base quantity.
  void AddRow(int32_t article, double unitPrice, double amount, double quantity, Ref<DataObject> to = nullptr) {
    DataObject& r = to ? *to : *rows;
    r.AddNew();
    r.SetField("IDGRArticle", Variant(article));
    r.SetField("UnitPrice", Variant(unitPrice));
    r.SetField("Amount", Variant(amount));
    r.SetField("BaseQuantity", Variant(quantity));
    r.SetField("Price", Variant(amount / quantity));
  }
  std::vector<std::string> Boxes() const {
    std::vector<std::string> out;
    for (const auto& line : session->Transcript())
      if (line.rfind("MsgBox", 0) == 0 || line.rfind("InputBox", 0) == 0) out.push_back(line);
    return out;
  }
  // Whether the transcript has `line` (the row table's name may come in another letter case).
  bool Transcribed(const std::string& line) const {
    const auto& t = session->Transcript();
    return std::any_of(t.begin(), t.end(), [&](const std::string& l) { return TextEquals(l, line); });
  }
  double Field(const Ref<DataObject>& r, const char* name) { return Dbl(r->Field(name)); }

  Ref<host::DocumentSession> session;
  Ref<DataObject> header, rows;
  Ref<DocFunc> df;
};

TEST_P(PricesTest, FillPrice) {
  // Flags: C company price, O own list, Q quantity step, G gross list, N list without cuts.
  struct Row {
    int32_t company, partner, list, article;
    double quantity;
    int32_t tax;
    double unitPrice, price;
    int32_t listID, cListID;
    const char* flags;
    const char* why;
  } cases[] = {
      {100, 0, 11, 1, 2, 0, 30, 30, 13, 0, "N", "lists 11, 12 out of date: the third list, its flags"},
      {100, 0, 11, 7, 2, 0, 55, 55, 15, 0, "", "no price in 13, 14: on to 15"},
      {100, 0, 20, 2, 1, 1, 100, 122, 20, 0, "G", "gross 122 with tax 22: net 100"},
      {100, 0, 20, 2, 1, 0, 122, 122, 20, 0, "G", "gross without a tax code"},
      {100, 0, 30, 3, 20, 0, 180, 200, 30, 0, "Q", "step with price 0 and -10 %"},
      {100, 0, 30, 3, 60, 0, 150, 200, 30, 0, "Q", "the highest step reached wins"},
      {100, 0, 30, 3, 10, 0, 180, 200, 30, 0, "Q", "the step's own quantity counts"},
      {100, 0, 30, 3, 5, 0, 200, 200, 30, 0, "", "below every step: the list price"},
      {100, 0, 30, 6, 5, 0, 3.6, 3.6, 30, 0, "", "price per pack of 10: per piece"},
      {100, 0, 30, 4, 1, 0, 80, 80, 0, 1, "C", "company price beats the list's 100"},
      {102, 100, 30, 4, 1, 0, 80, 80, 0, 1, "C", "the partner's company price"},
      {101, 0, 30, 1, 1, 0, 25, 25, 40, 0, "O", "the company's own list"},
      {101, 0, 11, 7, 1, 0, 55, 55, 15, 0, "", "own list without the article"},
      {103, 0, 30, 3, 1, 0, 200, 200, 30, 0, "", "own list out of date"},
      {102, 0, 0, 5, 1, 0, 70, 70, 50, 0, "", "no header list: the category's"},
      {100, 102, 0, 5, 1, 0, 70, 70, 50, 0, "", "the partner's category"},
      {100, 0, 0, 5, 1, 0, 0, 0, 0, 0, "", "no list and no category"},
      {100, 0, 60, 1, 1, 0, 0, 0, 0, 0, "", "A -> B -> A ends"},
      {100, 0, 62, 1, 1, 0, 0, 0, 0, 0, "", "a cycle of lists out of date ends"},
      {100, 0, 999, 1, 1, 0, 0, 0, 0, 0, "", "a list id naming no list"},
      {999, 998, 30, 999, 1, 0, 0, 0, 0, 0, "", "no such company, partner, article"},
  };
  Open();
  AddRow(1, 9, 9, 1);
  for (const auto& c : cases) {
    SCOPED_TRACE(c.why);
    header->SetField("IDGRCompany", Variant(c.company));
    header->SetField("IDPartner", Variant(c.partner));
    header->SetField("IDGRPriceList", Variant(c.list));
    rows->SetField("IDGRArticle", Variant(c.article));
    rows->SetField("BaseQuantity", Variant(c.quantity));
    rows->SetField("IDGRTax", Variant(c.tax));
    rows->SetField("IDGRCPriceList", Variant(9));
    EXPECT_TRUE(df->FillPrice(rows));
    EXPECT_EQ(rows->Field("UnitPrice"), Variant(CCur(Variant(c.unitPrice))));
    EXPECT_EQ(rows->Field("Price"), Variant(CCur(Variant(c.price))));
    EXPECT_EQ(rows->Field("IDGRPriceList"), Variant(c.listID));
    EXPECT_EQ(rows->Field("IDGRCPriceList"), Variant(c.cListID));
    const DocState& st = df->State();
    std::string flags = std::string(st.CompanyPriceFound ? "C" : "") + (st.CompanyListUsed ? "O" : "") +
                        (st.QuantityPriceUsed ? "Q" : "");
    if (c.listID != 0) flags += std::string(st.PriceIsGross ? "G" : "") + (st.PriceNoCut ? "N" : "");
    EXPECT_EQ(flags, c.flags);
  }
  EXPECT_EQ(session->TranscriptText(), "");  // no error reached the status line
}

TEST_P(PricesTest, SqlOfOneLookUp) {
  Open();
  AddRow(1, 0, 0, 2);
  header->SetField("IDGRCompany", Variant(100));
  header->SetField("IDGRPriceList", Variant(11));
  conn->Clear();
  df->FillPrice(rows);
  const std::vector<std::string> expected = {
      "SELECT TOP 1 R.* FROM (GRCPriceListRel R INNER JOIN GRCPriceList P ON R.IDGRCPriceList = P.ID) INNER JOIN "
      "GRCPriceLCompany C ON C.IDGRCPriceList = P.ID WHERE P.IsCertified <> 0 AND R.IDGRArticle = 1 AND "
      "C.IDGRCompany = 100 AND #3/15/2010# >= P.BeginDate AND (#3/15/2010# <= P.EndDate OR Year(P.EndDate) < "
      "1910)ORDER BY R.Price",
      "SELECT BeginDate, EndDate, IDFirst FROM GRPriceList WHERE ID = 11",
      "SELECT BeginDate, EndDate, IDFirst FROM GRPriceList WHERE ID = 12",
      "SELECT BeginDate, EndDate, IDFirst FROM GRPriceList WHERE ID = 13",
      "SELECT * FROM GRPriceListRel WHERE IDGRArticle = 1 AND IDGRPriceList = 13 ORDER BY BeginDate DESC, EndDate",
      "SELECT IDFirst, IsBruto, WithoutPriceCut FROM GRPriceList WHERE ID = 13",
      "SELECT Price, QuantityPercent FROM GRPriceLQuantity WHERE Quantity <= 2 AND IDGRPriceListRel = 1302 ORDER BY "
      "Quantity DESC",
  };
  EXPECT_EQ(conn->Sql(), expected);
}

// A document kind without prices looks nothing up and leaves the four price fields 0.
TEST_P(PricesTest, NoPriceList) {
  Open("DDMovement");
  AddRow(3, 7, 7, 20);
  header->SetField("IDGRPriceList", Variant(30));
  conn->Clear();
  EXPECT_TRUE(df->FillPrice(rows));
  for (const char* f : {"UnitPrice", "Price", "IDGRPriceList", "IDGRCPriceList"}) EXPECT_EQ(Field(rows, f), 0) << f;
  EXPECT_EQ(conn->Sql(), (std::vector<std::string>{"SELECT * FROM GRPriceListRel WHERE 1=0",
                                                    "SELECT * FROM GRCPriceListRel WHERE 1=0"}));
}

// Each case asks (or not) once; a second call without asking repeats that answer silently.
TEST_P(PricesTest, PriceCutQuestion) {
  struct Row {
    const char* option;  // the user's "AskCompany"
    bool rows;
    int32_t answer;
    std::vector<std::string> boxes;
    bool recompute;
  } cases[] = {
      {"", false, 6, {}, false},  // without rows nothing is asked or changed
      {"", true, 7, {"MsgBox(\"Recompute row amounts?\",4)->7"}, false},
      {"", true, 6, {"MsgBox(\"Recompute row amounts?\",4)->6"}, true},
      {"AlwaysYes", true, 7, {}, true},
      {"alwaysno", true, 6, {}, false},
      {" AlwaysNo ", true, 6, {}, false},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(std::string("option '") + c.option + "'");
    host->SetUserOption(host->UserID(), "SDInvoice", "AskCompany", Variant(c.option));
    Open();
    if (c.rows) AddRow(1, 0, 0, 1);
    session->ClearTranscript();
    session->Policy().msgBoxAnswers = {c.answer, c.recompute ? 7 : 6};
    EXPECT_TRUE(df->VPriceCut(true));
    EXPECT_EQ(Boxes(), c.boxes);
    EXPECT_EQ(df->State().RecalcRowsAnswer, c.recompute);
    EXPECT_EQ(Transcribed("RefreshBrowser(\"SDInvoiceRow.@\")"), c.rows);
    EXPECT_TRUE(df->VPriceCut(false));
    EXPECT_EQ(Boxes(), c.boxes);
    EXPECT_EQ(df->State().RecalcRowsAnswer, c.recompute);
    session->Close();
  }
}

TEST_P(PricesTest, HeaderPriceList) {
  Open();
  session->ClearTranscript();
  header->SetField("PriceCut", Variant(-5.0));
  header->SetField("IDGRPriceList", Variant(20));
  EXPECT_TRUE(df->VPriceList(true));
  EXPECT_EQ(header->Field("PriceList"), Variant("Gross"));
  EXPECT_TRUE(df->State().PriceIsGross);
  EXPECT_EQ(df->State().PriceListID, 20);
  EXPECT_EQ(Field(header, "PriceCut"), -5);
  EXPECT_TRUE(df->WPriceCut());
  EXPECT_EQ(session->TranscriptText(), "RefreshHeader(\"\")");  // no rows: no question

  header->SetField("IDGRPriceList", Variant(999));  // names no list: nothing changes
  EXPECT_TRUE(df->VPriceList(true));
  EXPECT_EQ(header->Field("PriceList"), Variant("Gross"));
  EXPECT_EQ(Field(header, "PriceCut"), -5);
  EXPECT_EQ(df->State().PriceListID, 20);

  header->SetField("IDGRPriceList", Variant(0));
  EXPECT_TRUE(df->VPriceList(true));
  EXPECT_EQ(header->Field("PriceList"), Variant(""));
  EXPECT_EQ(Field(header, "PriceCut"), 0);
  EXPECT_FALSE(df->WPriceCut());
}

TEST_P(PricesTest, Discount) {
  struct Row {
    double unitPrice;
    Variant discount, compType;
    double amount, price;
    const char* why;
  } cases[] = {
      {100, Variant(10), Variant(), 270, 90, "10 % off the list price"},
      {10, Variant(33.33), Variant(), 20.00, 6.6667, "price to 4 decimals, amount to 2"},
      {100, Variant("5"), Variant(), 285, 95, "a discount typed as text"},
      {0, Variant(10), Variant(), 300, 100, "no list price: the amount stays"},
      {100, Variant(10), Variant("C"), 300, 100, "part of a set priced as a whole"},
  };
  Open();
  for (const auto& c : cases) {
    SCOPED_TRACE(c.why);
    AddRow(1, c.unitPrice, 300, 3);
    rows->SetField("StatAmount", Variant(300));
    rows->SetField("@Discount", c.discount);
    rows->SetField("@CompType", c.compType);
    EXPECT_TRUE(df->VDiscount());
    EXPECT_EQ(rows->Field("Amount"), Variant(CCur(Variant(c.amount))));
    EXPECT_EQ(rows->Field("Price"), Variant(CCur(Variant(c.price))));
    EXPECT_EQ(rows->Field("StatAmount"), rows->Field("Amount"));
    EXPECT_EQ(rows->Field("@DiscountOK"), Variant(true));
  }
  // A set shown by its particulars passes the discount on and adds up their amounts.
  AddRow(1, 0, 0, 1);
  rows->SetField("CompletionType", Variant("D"));
  rows->SetField("@Discount", Variant(10));
  Ref<DataObject> parts = session->Proxy()->CachedRows("SDInvoiceRow", "Next");
  AddRow(1, 10, 0, 2, parts);
  AddRow(1, 5, 0, 4, parts);
  EXPECT_TRUE(df->VDiscount());
  EXPECT_EQ(Field(rows, "Amount"), 36);
  parts->MoveFirst();
  EXPECT_EQ(Field(parts, "Amount"), 18);
}

// Components an assembly consumes keep their amount (their cost); the product does not.
TEST_P(PricesTest, DiscountInAnAssembly) {
  Open("DDProduction");
  AddRow(1, 50, 100, 2);
  rows->SetField("@Discount", Variant(10));
  rows->SetField("IDSenderStore", Variant(1));
  df->VDiscount();
  EXPECT_EQ(Field(rows, "Amount"), 100);
  rows->SetField("IDSenderStore", Variant::Null());
  df->VDiscount();
  EXPECT_EQ(Field(rows, "Amount"), 90);
}

// Rows: a plain row (list price 100 × 2, article category 1 with the company's category 7: cut
// -5 %), a row without a list price, and a "D" set whose two particulars hold 30 and 20.
TEST_P(PricesTest, PercentCommands) {
  struct Row {
    bool priceList, confirm;
    double percent, plain, noPrice, setRow, part1, part2;
    const char* box;
  } cases[] = {
      {false, false, -10, 100, 40, 50, 30, 20, "InputBox(\"Amount discount\")->False"},
      {false, true, -10, 90, 36, 45, 27, 18, "InputBox(\"Amount discount\")->True"},
      {false, true, 12.5, 112.5, 45, 56.25, 33.75, 22.5, "InputBox(\"Amount discount\")->True"},
      {true, true, 10, 209, 40, 44, 22, 22, "InputBox(\"Pricelist discount\")->True"},  // 100 × 2 × 0.95 × 1.1
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.box);
    Exec("DELETE FROM SDInvoiceRow");  // rows the last case wrote back
    Open();
    header->SetField("IDGRCompany", Variant(102));
    AddRow(1, 100, 100, 2);
    AddRow(7, 0, 40, 2);
    AddRow(7, 0, 50, 1);
    rows->SetField("CompletionType", Variant("D"));
    Ref<DataObject> parts = session->Proxy()->CachedRows("SDInvoiceRow", "Next");
    AddRow(0, 10, 30, 2, parts);
    AddRow(0, 10, 20, 2, parts);
    std::string entry;
    session->Policy().inputBox = [&](ParamList& p, const std::string&) {
      entry = p.NameAt(1) + "=" + CStr(p.Item(p.NameAt(1)));
      p.Set("Percent", Variant(c.percent));
      return c.confirm;
    };
    session->ClearTranscript();
    EXPECT_EQ(c.priceList ? df->ComputePercentPricelist() : df->ComputePercentAmount(), c.confirm);
    EXPECT_EQ(entry, "Percent=0");
    EXPECT_EQ(Boxes(), std::vector<std::string>{c.box});
    EXPECT_EQ(Transcribed("RefreshBrowser(\"\")"), c.confirm);
    rows->MoveFirst();
    EXPECT_EQ(Field(rows, "Amount"), c.plain);
    EXPECT_EQ(Field(rows, "Price"), c.plain / 2);
    EXPECT_EQ(Field(rows, "StatAmount"), c.confirm ? c.plain : 0);
    rows->MoveNext();
    EXPECT_EQ(Field(rows, "Amount"), c.noPrice);
    rows->MoveNext();
    EXPECT_EQ(Field(rows, "Amount"), c.setRow);
    parts->MoveFirst();
    EXPECT_EQ(Field(parts, "Amount"), c.part1);
    parts->MoveNext();
    EXPECT_EQ(Field(parts, "Amount"), c.part2);
    session->Close();
  }
}

INSTANTIATE_TEST_SUITE_P(, PricesTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal
