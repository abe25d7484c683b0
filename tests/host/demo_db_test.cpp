// The demo database: every reference id points to a row, the kept balances equal their defining
// views and the closed-period flows, stored documents add up, currencies have rates, messages
// have both languages, the data does not depend on the database kind, and two builds are equal.
#include "host/demo_db.h"

#include <gtest/gtest.h>
#include <sqlite3.h>

#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <map>

#include "balance_check.h"
#include "host/document_session.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {
namespace {

namespace fs = std::filesystem;
using testing::BalanceMismatches;

fs::path TempPath(const std::string& name) {
  return fs::temp_directory_path() / ("xalhost_demo_" + std::to_string(::getpid()) + "_" + name + ".db");
}

void RemoveDb(const fs::path& p) {
  std::error_code ec;
  for (const char* suffix : {"", "-wal", "-shm"}) fs::remove(p.string() + suffix, ec);
}

std::vector<std::string> Tables(Database& db) {
  std::vector<std::string> names;
  for (auto& r : db.Query("SELECT name FROM sqlite_schema WHERE type = 'table' AND name NOT LIKE 'sqlite%' "
                          "ORDER BY name").rows)
    names.push_back(r[0].AsString());
  return names;
}

// The table a reference column points to, or "" when its target is not a table of this database.
std::string TargetOf(Database& db, const std::string& table, const std::string& column) {
  if (column.size() <= 2 || !TextEquals(column.substr(0, 2), "ID")) return "";
  const std::string name = column.substr(2);
  if (TextEquals(name, "First") || TextEquals(name, "ParentRow")) return table;  // chains within a table
  Variant link = db.Scalar("SELECT TargetTable FROM XALLink WHERE FieldName = ?", {Variant(column)});
  if (link.IsString()) return link.AsString();
  if (name.size() > 3 && TextEquals(name.substr(name.size() - 3), "Doc")) return "GDocument";
  // Purchase-side ("P") and company-specific ("C") variants name the same table.
  for (std::string n = name; !n.empty(); n.pop_back()) {
    if (db.TableExists(n)) return n;
    const char last = n.back();
    if (last != 'P' && last != 'C') break;
  }
  return "";
}

// Every non-zero reference whose target row is missing, as "Table.Column=id".
std::vector<std::string> DanglingReferences(Database& db, int* checkedColumns = nullptr) {
  std::vector<std::string> dangling;
  int checked = 0;
  for (const std::string& table : Tables(db)) {
    for (const std::string& column : db.TableColumns(table)) {
      const std::string target = TargetOf(db, table, column);
      if (target.empty()) continue;
      ++checked;
      ResultSet rs = db.Query("SELECT DISTINCT \"" + column + "\" FROM \"" + table + "\" WHERE \"" + column +
                              "\" IS NOT NULL AND \"" + column + "\" <> 0 AND \"" + column +
                              "\" NOT IN (SELECT ID FROM \"" + target + "\")");
      for (auto& r : rs.rows) dangling.push_back(table + "." + column + "=" + CStr(r[0]));
    }
  }
  if (checkedColumns) *checkedColumns = checked;
  return dangling;
}

// Every table's rows, exactly as stored, one string per table.
std::map<std::string, std::string> Dump(Database& db) {
  std::map<std::string, std::string> out;
  for (const std::string& table : Tables(db)) {
    std::string text;
    sqlite3_stmt* st = nullptr;
    const std::string sql = "SELECT * FROM \"" + table + "\" ORDER BY rowid";
    if (sqlite3_prepare_v2(db.handle(), sql.c_str(), -1, &st, nullptr) != SQLITE_OK) {
      out[table] = "cannot read";
      continue;
    }
    while (sqlite3_step(st) == SQLITE_ROW) {
      for (int i = 0; i < sqlite3_column_count(st); ++i) {
        char buf[40];
        switch (sqlite3_column_type(st, i)) {
          case SQLITE_NULL: text += "NULL"; break;
          case SQLITE_INTEGER: text += std::to_string(sqlite3_column_int64(st, i)); break;
          case SQLITE_FLOAT:
            std::snprintf(buf, sizeof buf, "%.17g", sqlite3_column_double(st, i));
            text += buf;
            break;
          default: text += reinterpret_cast<const char*>(sqlite3_column_text(st, i)); break;
        }
        text += '|';
      }
      text += '\n';
    }
    sqlite3_finalize(st);
    out[table] = text;
  }
  return out;
}

class DemoDb : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    path_ = new fs::path(TempPath("shared"));
    RemoveDb(*path_);
    conn_ = new Ref<HostConnection>(OpenDemoDatabase(path_->string(), 1));
    built_ = new std::map<std::string, std::string>(Dump(db()));
  }
  static void TearDownTestSuite() {
    delete built_;
    delete conn_;
    RemoveDb(*path_);
    delete path_;
  }
  static HostConnection& conn() { return **conn_; }
  static Database& db() { return conn().db(); }
  static double Num(const std::string& sql, const std::vector<Variant>& params = {}) {
    Variant v = db().Scalar(sql, params);
    return v.IsNull() ? 0.0 : CDbl(v);
  }

  static fs::path* path_;
  static Ref<HostConnection>* conn_;
  static std::map<std::string, std::string>* built_;  // every table as first built
};
fs::path* DemoDb::path_ = nullptr;
Ref<HostConnection>* DemoDb::conn_ = nullptr;
std::map<std::string, std::string>* DemoDb::built_ = nullptr;

TEST_F(DemoDb, EveryReferencePointsToARow) {
  int checked = 0;
  EXPECT_EQ(DanglingReferences(db(), &checked), std::vector<std::string>{});
  EXPECT_GT(checked, 60);  // the check reaches the documents, rows, registers and balances
}

TEST_F(DemoDb, DanglingReferencesAreFound) {
  const fs::path p = TempPath("dangling");
  RemoveDb(p);
  {
    auto c = OpenDemoDatabase(p.string(), 1);
    Database& d = c->db();
    d.Exec("UPDATE GRArticle SET IDGRUnit = 999 WHERE ID = 1");
    d.Exec("UPDATE GRCompany SET IDGRPriceListC = 77 WHERE ID = 12");   // a variant name of GRPriceList
    d.Exec("UPDATE GRUnit SET IDFirst = 55 WHERE ID = 6");                // a chain within the table
    d.Exec("UPDATE GDocument SET IDPartner = 4242 WHERE ID = 1007");      // an alias from the link table
    d.Exec("UPDATE DDStoreDRow SET IDReceiverStore = 9 WHERE ID = 1");     // a store through its alias
    auto found = DanglingReferences(d);
    for (const char* expected : {"GRArticle.IDGRUnit=999", "GRCompany.IDGRPriceListC=77", "GRUnit.IDFirst=55",
                                 "GDocument.IDPartner=4242", "DDStoreDRow.IDReceiverStore=9"})
      EXPECT_NE(std::find(found.begin(), found.end(), expected), found.end()) << expected;
  }
  RemoveDb(p);
}

double Number(Database& db, const std::string& sql, const std::vector<Variant>& params = {}) {
  Variant v = db.Scalar(sql, params);
  return v.IsNull() ? 0.0 : CDbl(v);
}

// The file database counts stock as closed-period flows before `fixed` plus the rows from that
// day on; the server reads its kept balance. The keys where the two disagree, in quantity or value.
std::vector<std::string> ClosedFlowMismatches(Database& db, double fixed) {
  std::vector<std::string> out;
  ResultSet keys = db.Query("SELECT IDGRArticle, IDDRStore, Quantity + RQuantity, AmountBase FROM DCurBalanceStore");
  for (auto& k : keys.rows) {
    const std::vector<Variant> args{k[0], k[1], Variant(Date(fixed))};
    auto sum = [&](const std::string& sql) { return Number(db, sql, args); };
    const double closedQ = sum("SELECT total(DebitQFlow) - total(CreditQFlow) FROM DBalanceStore "
                               "WHERE IDGRArticle = ? AND IDDRStore = ? AND DocDate < ?");
    const double closedA = sum("SELECT total(DebitFlowBase) - total(CreditFlowBase) FROM DBalanceStore "
                               "WHERE IDGRArticle = ? AND IDDRStore = ? AND DocDate < ?");
    const double inQ = sum("SELECT total(BaseQuantity) FROM DDStoreDRow WHERE IDGRArticle = ? AND IDReceiverStore = ? "
                           "AND DocDate >= ? AND ArticleType <> 'S' AND DealState <> 'P'");
    const double outQ = sum("SELECT total(BaseQuantity) FROM DDStoreDRow WHERE IDGRArticle = ? AND IDSenderStore = ? "
                            "AND DocDate >= ? AND ArticleType <> 'S' AND DealState <> 'P'");
    const double inA = sum("SELECT total(Cost) FROM DDStoreDRow WHERE IDGRArticle = ? AND IDReceiverStore = ? "
                           "AND DocDate >= ? AND ArticleType <> 'S' AND DealState = ''");
    const double outA = sum("SELECT total(Cost) FROM DDStoreDRow WHERE IDGRArticle = ? AND IDSenderStore = ? "
                            "AND DocDate >= ? AND ArticleType <> 'S' AND DealState <> 'P'");
    if (std::abs(closedQ + inQ - outQ - CDbl(k[2])) > 1e-9 || std::abs(closedA + inA - outA - CDbl(k[3])) > 1e-6)
      out.push_back("article " + CStr(k[0]) + " store " + CStr(k[1]));
  }
  return out;
}

// Documents whose header totals are not the sums of their top-level rows (or of their tax lines).
std::vector<std::string> TotalMismatches(Database& db, std::map<std::string, int>* kinds = nullptr) {
  std::vector<std::string> out;
  ResultSet docs = db.Query(
      "SELECT D.ID, D.DocName, T.RowTable, D.TotalAmount, D.TaxAmount, D.TotalAmountBase, D.ApproxDifference "
      "FROM GDocument D JOIN XALTable T ON T.TableName = D.DocName ORDER BY D.ID");
  for (auto& d : docs.rows) {
    const std::string rowTable = d[2].AsString();
    const auto columns = db.TableColumns(rowTable);
    const bool nested = std::any_of(columns.begin(), columns.end(),
                                    [](const std::string& c) { return TextEquals(c, "IDParentRow"); });
    const std::string where = " FROM " + rowTable + " WHERE IDDoc = ?" + (nested ? " AND IDParentRow = 0" : "");
    const std::vector<Variant> id{d[0]};
    const double net = Number(db, "SELECT total(Amount)" + where, id);
    const double tax = Number(db, "SELECT total(TaxAmount)" + where, id);
    const double base = Number(db, "SELECT total(AmountBase) + total(TaxAmountBase)" + where, id);
    const double taxLines = Number(db, "SELECT total(TaxAmount) FROM GDTax WHERE IDGDocument = ?", id);
    const bool hasRows = Number(db, "SELECT count(*)" + where, id) > 0;
    if (!hasRows || std::abs(CDbl(d[4]) - tax) > 0.005 ||
        std::abs(CDbl(d[3]) - std::round((net + tax + CDbl(d[6])) * 100) / 100) > 0.005 ||
        std::abs(CDbl(d[5]) - base) > 0.005 || std::abs(taxLines - CDbl(d[4])) > 0.005)
      out.push_back(d[1].AsString() + " " + CStr(d[0]));
    if (kinds) ++(*kinds)[d[1].AsString()];
  }
  return out;
}

TEST_F(DemoDb, KeptBalancesEqualTheirViews) {
  ASSERT_GT(Num("SELECT count(*) FROM DCurBalanceStore"), 20);
  ASSERT_GT(Num("SELECT count(*) FROM DCurDRStockReserve"), 3);
  EXPECT_EQ(BalanceMismatches(db()), std::vector<std::string>{});
  // Documents are stored in date order: no store ever shows less than nothing.
  EXPECT_EQ(Num("SELECT count(*) FROM DCurBalanceStore WHERE Quantity < 0 OR Quantity + RQuantity < 0"), 0);
  // Every store holds stock, and services never count.
  EXPECT_EQ(Num("SELECT count(DISTINCT IDDRStore) FROM DCurBalanceStore WHERE Quantity > 0"), 3);
  EXPECT_EQ(Num("SELECT count(*) FROM DCurBalanceStore B JOIN GRArticle A ON A.ID = B.IDGRArticle "
                "WHERE A.ArticleType = 'S'"),
            0);
}

TEST_F(DemoDb, ClosedPeriodFlowsAgreeWithTheKeptBalance) {
  const double d = CDbl(conn().Setting("DateFixed", "Store", Variant(0)));
  ASSERT_EQ(d, DemoDay(2010, 1, 1));
  ASSERT_GT(Num("SELECT count(*) FROM DBalanceStore"), 0);
  ASSERT_GT(Num("SELECT count(*) FROM DDStoreDRow WHERE DocDate >= ?", {Variant(Date(d))}), 0);
  EXPECT_EQ(ClosedFlowMismatches(db(), d), std::vector<std::string>{});
}

TEST_F(DemoDb, StoredDocumentsAddUp) {
  std::map<std::string, int> kinds;
  EXPECT_EQ(TotalMismatches(db(), &kinds), std::vector<std::string>{});
  for (const char* k : {"SDInvoice", "SDOrder", "PDReceiptD", "SDConsignmD", "DDMovement", "DDProduction"})
    EXPECT_GT(kinds[k], 0) << k;
  // A set row of an assembly carries what its components cost.
  EXPECT_EQ(Num("SELECT count(*) FROM DDStoreDRow P WHERE P.CompletionType <> '' AND abs(P.Cost - "
                "(SELECT total(C.Cost) FROM DDStoreDRow C WHERE C.IDParentRow = P.ID)) > 0.005"),
            0);
  EXPECT_GT(Num("SELECT count(*) FROM DDStoreDRow WHERE IDParentRow <> 0"), 0);
}

// The checks above see a balance, a closed flow or a total that does not fit.
TEST_F(DemoDb, TheChecksCatchTampering) {
  const fs::path p = TempPath("tampered");
  RemoveDb(p);
  {
    auto c = OpenDemoDatabase(p.string(), 1);
    Database& d = c->db();
    const double fixed = DemoDay(2010, 1, 1);
    d.Exec("UPDATE DCurBalanceStore SET Quantity = Quantity + 1 WHERE IDGRArticle = 1 AND IDDRStore = 1");
    EXPECT_EQ(BalanceMismatches(d), std::vector<std::string>{"stock 1/1"});
    EXPECT_EQ(ClosedFlowMismatches(d, fixed), std::vector<std::string>{"article 1 store 1"});
    d.Exec("INSERT INTO DCurBalanceStoreRefresh VALUES (1, 1)");  // rebuilt from the rows
    EXPECT_EQ(BalanceMismatches(d), std::vector<std::string>{});
    d.Exec("UPDATE DCurDRStockReserve SET Quantity = Quantity - 1 WHERE IDDRStore = 2");
    EXPECT_FALSE(BalanceMismatches(d).empty());
    d.Exec("UPDATE DBalanceStore SET CreditFlowBase = CreditFlowBase + 0.5 WHERE IDGRArticle = 13");
    EXPECT_EQ(ClosedFlowMismatches(d, fixed), std::vector<std::string>{"article 13 store 1"});
    d.Exec("UPDATE SDInvoiceRow SET TaxAmount = TaxAmount + 0.01 WHERE ID = (SELECT min(ID) FROM SDInvoiceRow)");
    d.Exec("UPDATE GDocument SET TotalAmountBase = TotalAmountBase - 1 WHERE DocName = 'DDMovement' AND DocNo = 2");
    auto bad = TotalMismatches(d);
    EXPECT_EQ(bad.size(), 2u);
    EXPECT_NE(std::find(bad.begin(), bad.end(), "DDMovement 1014"), bad.end());
  }
  RemoveDb(p);
}

TEST_F(DemoDb, EveryCurrencyHasARate) {
  ResultSet cur = db().Query("SELECT ID, Code, FixedRate, DivThreshold FROM GRCurrency");
  ASSERT_GE(cur.rows.size(), 4u);
  for (auto& c : cur.rows) {
    EXPECT_GT(CDbl(c[2]), 0) << CStr(c[1]);
    if (CDbl(c[3]) != 0) {
      EXPECT_GT(Num("SELECT count(*) FROM GRCurValue WHERE IDGRCurrency = ? AND ConversionRate > 0", {c[0]}), 0)
          << CStr(c[1]);
    }
  }
  EXPECT_EQ(Num("SELECT count(*) FROM GRCurrency WHERE IsTriangulation <> 0"), 1);
  // The base currency is worth itself, and a foreign document's rate is that day's rate.
  const Variant base = conn().Setting("GRCurrency", "BaseCurrency", Variant(0));
  EXPECT_EQ(Num("SELECT FixedRate FROM GRCurrency WHERE ID = ? AND DivThreshold = 0", {Variant(CLng(base))}), 1.0);
  ResultSet foreign = db().Query("SELECT D.ID, D.IDGRCurrency, D.DocDate, D.ExchangeRate FROM GDocument D "
                                 "JOIN GRCurrency C ON C.ID = D.IDGRCurrency WHERE C.DivThreshold <> 0");
  ASSERT_GE(foreign.rows.size(), 3u);
  for (auto& d : foreign.rows)
    EXPECT_EQ(Num("SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency = ? AND ChangeDate = ?", {d[1], d[2]}),
              CDbl(d[3]))
        << "document " << CStr(d[0]);
}

TEST_F(DemoDb, MessagesInBothLanguages) {
  Ref<XALServer> server = conn().Server();
  for (const char* key : {"Err_AggrRec", "Err_ChangeCertifiedDoc", "Err_DealDateMissing", "Err_DealDateOutOfRange",
                          "Err_DiffCategory", "Err_DiffType", "Err_DiffUnits", "Err_DocDateMissing",
                          "Err_DocInClosedPeriod", "Err_TargetNotFound"}) {
    const std::string en = server->Text(key, 2, 3), et = server->Text(key, 2, 4);
    EXPECT_NE(en, key);
    EXPECT_NE(et, key);
    EXPECT_NE(en, et) << key;
  }
}

TEST_F(DemoDb, SetsLotsAndPriceChains) {
  // Every set article has its components; every lot- or serial-kept row names its lot.
  EXPECT_EQ(Num("SELECT count(*) FROM GRArticle A WHERE A.ArticleType = 'P' AND NOT EXISTS (SELECT 1 FROM "
                "GRArtCompletion C JOIN GRArtCompletionRow R ON R.IDGRArtCompletion = C.ID "
                "WHERE C.IDGRArticle = A.ID)"),
            0);
  EXPECT_EQ(Num("SELECT count(*) FROM DDStoreDRow R JOIN GRArticle A ON A.ID = R.IDGRArticle "
                "WHERE (A.IsLot <> 0 OR A.IsSerial <> 0) AND R.SerialNo = ''"),
            0);
  // Price-list chains end: following IDFirst from any list reaches 0 within the lists there are.
  const int lists = static_cast<int>(Num("SELECT count(*) FROM GRPriceList"));
  for (auto& r : db().Query("SELECT ID FROM GRPriceList").rows) {
    int id = CLng(r[0]), steps = 0;
    while (id != 0 && steps <= lists) {
      id = static_cast<int>(Num("SELECT IDFirst FROM GRPriceList WHERE ID = ?", {Variant(id)}));
      ++steps;
    }
    EXPECT_EQ(id, 0) << "the chain from list " << CStr(r[0]) << " loops";
  }
  EXPECT_GT(Num("SELECT count(*) FROM GRPriceList WHERE IDFirst <> 0 AND EndDate <> 0"), 0);
  EXPECT_GT(Num("SELECT count(*) FROM GRCPriceList L JOIN GRCPriceLCompany C ON C.IDGRCPriceList = L.ID "
                "WHERE L.IsCertified <> 0"),
            0);
}

TEST_F(DemoDb, StoredInvoiceOpensInASession) {
  const Variant id = db().Scalar("SELECT min(ID) FROM SDInvoice");
  ASSERT_FALSE(id.IsNull());
  auto s = DocumentSession::Open(*conn_, "SDInvoice", CLng(id));
  Ref<HostDataObject> header = s->Header();
  EXPECT_EQ(header->Field("GRCompany.Name"), header->Field("CompanyName"));
  EXPECT_EQ(s->Rows()->RowCount(), Num("SELECT count(*) FROM SDInvoiceRow WHERE IDDoc = ?", {id}));
  for (s->Rows()->MoveFirst(); !s->Rows()->IsEOF(); s->Rows()->MoveNext())
    EXPECT_EQ(s->Rows()->Field("GRArticle.Name"), s->Rows()->Field("Name"));
  s->Close();
}

// The data does not depend on the kind a database is opened with, and a built file is reused.
TEST_F(DemoDb, BothKindsOpenTheSameData) {
  const fs::path p = TempPath("kind2");
  RemoveDb(p);
  {
    auto c2 = OpenDemoDatabase(p.string(), 2);
    EXPECT_EQ(c2->DatabaseKind(), 2);
    EXPECT_EQ(Dump(c2->db()), *built_);
    c2->db().Exec("UPDATE GRCompany SET Message = 'kept' WHERE ID = 10");
  }
  {
    auto c1 = OpenDemoDatabase(p.string(), 1);  // opened, not rebuilt
    EXPECT_EQ(c1->DatabaseKind(), 1);
    EXPECT_EQ(c1->db().Scalar("SELECT Message FROM GRCompany WHERE ID = 10"), Variant("kept"));
  }
  RemoveDb(p);
  { std::ofstream(p.string()).flush(); }  // an empty file is built
  ASSERT_TRUE(fs::exists(p));
  {
    auto c = OpenDemoDatabase(p.string(), 1);
    const char* count = "SELECT count(*) FROM GDocument";
    EXPECT_EQ(CLng(c->db().Scalar(count)), CLng(db().Scalar(count)));
  }
  RemoveDb(p);
}

TEST_F(DemoDb, TwoBuildsAreIdentical) {
  const fs::path p = TempPath("again");
  RemoveDb(p);
  {
    auto c = HostConnection::Open(p.string(), 1);
    BuildDemoDatabase(*c);
    auto a = Dump(c->db()), b = *built_;
    ASSERT_EQ(a.size(), b.size());
    for (auto& [table, rows] : a) EXPECT_EQ(rows, b[table]) << table;
    EXPECT_FALSE(b["GDocument"].empty());
  }
  RemoveDb(p);
}

}  // namespace
}  // namespace xal::host
