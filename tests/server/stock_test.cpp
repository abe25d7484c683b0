// Stock balances and costs over the reference host in both database kinds. The file kind sums
// the store rows (and closed-period flows before "DateFixed"/"Store"), the server kind reads the
// current balances the host's triggers keep; on the same data both must give the same figures.
// Also the exact SQL each kind sends, the given-row rule of each kind, trapped failures, the cost
// kinds (service, production price chain, stored, running average) and the cost-option cache.
#include "server/stock.h"

#include <gtest/gtest.h>

#include <thread>

#include "recording_connection.h"
#include "runtime/convert.h"
#include "runtime/dates.h"

namespace xal::server {
namespace {

using sqllog::KindName;
using sqllog::DialectDbTest;

Date D(int y, int m, int d) { return DateSerial(y, m, d); }
std::string Serial(int y, int m, int d) { return std::to_string(static_cast<int>(D(y, m, d).serial)); }
std::string Null() { return "NULL"; }

// A store row: id, article, sender, receiver (each a number or NULL), base quantity, cost, deal
// state, article type, date.
std::string StoreRow(int id, int article, const std::string& sender, const std::string& receiver, double q,
                     double cost, const char* deal, const char* type, const std::string& date) {
  return "INSERT INTO DDStoreDRow (ID, IDDoc, IDGRArticle, IDSenderStore, IDReceiverStore, BaseQuantity, Cost, "
         "DealState, ArticleType, DocDate) VALUES (" +
         std::to_string(id) + ", 1, " + std::to_string(article) + ", " + sender + ", " + receiver + ", " +
         DoubleToString(q) + ", " + DoubleToString(cost) + ", '" + deal + "', '" + type + "', " + date + ");";
}

// Articles: 10 goods, 11 a service, 12 goods never moved, 20 a set of 21 (2 per set), 22 (0 per
// set: counts as 1) and 23 (4 per set), 30 a production article, 31 a production completion.
// Stores 1 and 2. Rows are dated 3/1/2009, except the pre-reservations (3/20) and a few rows on or
// after 3/10/2009, the closing date the closed-period tests use.
class StockTest : public DialectDbTest {
 protected:
  void SetUp() override {
    DialectDbTest::SetUp();
    const std::string early = Serial(2009, 3, 1), onClose = Serial(2009, 3, 10), late = Serial(2009, 3, 20);
    Exec("INSERT INTO DRStore (ID, Code, IDGRPriceList, IDComplPriceList) VALUES (1, 'MAIN', 50, 60),"
         " (2, 'BRANCH', 0, 0);"
         "INSERT INTO GRArticle (ID, Code, ArticleType, Cost) VALUES (10, 'A10', '', 1.5), (11, 'SRV', 'S', 7.25),"
         " (12, 'IDLE', '', 0.75), (20, 'SET', '', 0), (21, 'C21', '', 0), (22, 'C22', '', 0), (23, 'C23', '', 0),"
         " (30, 'PROD', 'P', 3), (31, 'COMPL', 'PC', 4), (32, 'DEEP', 'P', 5);"
         "INSERT INTO GRArtCompletion (ID, IDGRArticle) VALUES (1, 20);"
         "INSERT INTO GRArtCompletionRow (IDGRArtCompletion, IDGRArticle, Quantity) VALUES (1, 21, 2), (1, 22, 0),"
         " (1, 23, 4);" +
         // Article 10.
         StoreRow(101, 10, Null(), "1", 10, 20, "", "", early) +  // receipt into 1
         StoreRow(102, 10, Null(), "2", 5, 15, "", "", early) +   // receipt into 2
         StoreRow(103, 10, "1", "2", 3, 6, "", "", early) +       // movement 1 -> 2
         StoreRow(104, 10, "1", Null(), 2, 5, "", "", onClose) +  // issue from 1
         StoreRow(105, 10, Null(), "1", 4, 8, "P", "", late) +    // pre-reservation into 1
         StoreRow(106, 10, "2", Null(), 1, 3, "R", "", early) +   // reserved issue from 2
         StoreRow(107, 10, Null(), "1", 100, 1, "", "S", early) +  // a service line: never stock
         // The set's components.
         StoreRow(201, 21, Null(), "1", 9, 0, "", "", early) + StoreRow(202, 21, "1", "2", 2, 0, "", "", early) +
         StoreRow(203, 21, Null(), "2", 4, 0, "", "", late) + StoreRow(204, 22, Null(), "1", 3, 0, "", "", early) +
         StoreRow(205, 23, Null(), "1", 20, 0, "", "", early) + StoreRow(206, 23, "1", Null(), 4, 0, "", "", onClose) +
         StoreRow(207, 22, Null(), "1", 5, 0, "P", "", late));
  }

  // Closes the periods before `date` the way the host's period balance does: the flows of the
  // rows dated before it (pre-reservations are not flows) go to DBalanceStore, the rows stay.
  void ClosePeriodsBefore(Date date) {
    const std::string d = std::to_string(static_cast<int>(date.serial));
    Exec("INSERT INTO DBalanceStore (DocDate, IDGRArticle, IDDRStore, DebitQFlow, CreditQFlow, DebitFlowBase,"
         " CreditFlowBase) SELECT DocDate, IDGRArticle, St, total(DQ), total(CQ), total(DB), total(CB) FROM ("
         " SELECT DocDate, IDGRArticle, IDReceiverStore St, BaseQuantity DQ, 0 CQ,"
         "  CASE WHEN DealState = '' THEN Cost ELSE 0 END DB, 0 CB FROM DDStoreDRow"
         "  WHERE IDReceiverStore IS NOT NULL AND DealState <> 'P' AND ArticleType <> 'S' AND DocDate < " + d +
         " UNION ALL SELECT DocDate, IDGRArticle, IDSenderStore, 0, BaseQuantity, 0, Cost FROM DDStoreDRow"
         "  WHERE IDSenderStore IS NOT NULL AND DealState <> 'P' AND ArticleType <> 'S' AND DocDate < " + d +
         ") GROUP BY DocDate, IDGRArticle, St;");
    host->SetSetting("DateFixed", "Store", Variant(date));
  }
};

// ---------------------------------------------------------------------------------------------
// Balances: the same figures in both kinds, with open periods and with periods closed
// ---------------------------------------------------------------------------------------------

struct BalanceRow {
  int32_t article, store;
  bool pre, sets;
  double expected;
  const char* why;
};

const BalanceRow kBalances[] = {
    {10, 1, false, false, 5, "10 in, 3 moved out, 2 issued"},
    {10, 1, true, false, 9, "the pre-reservation of 4 counts on request"},
    {10, 2, false, false, 7, "5 in, 3 moved in, 1 reserved issue"},
    {10, 2, true, false, 7, ""},
    {10, 0, false, false, 12, "all stores: the movement cancels"},
    {10, 0, true, false, 16, ""},
    {12, 1, false, false, 0, "no rows at all"},
    {12, 0, true, false, 0, ""},
    {20, 1, false, true, 3, "component 22 (0 per set counts as 1) limits: min(3.5, 3, 4)"},
    {20, 1, true, true, 3.5, "with its pre-reservation 22 has 8: min(3.5, 8, 4)"},
    {20, 2, false, true, 3, "only component 21 is in store 2"},
    {20, 0, false, true, 3, "all stores: min(6.5, 3, 4)"},
    {20, 0, true, true, 4, ""},
    {12, 1, false, true, 0, "not a set"},
};

TEST_P(StockTest, BalanceWithOpenPeriods) {
  for (const auto& r : kBalances) {
    SCOPED_TRACE(::testing::Message() << "article " << r.article << " store " << r.store << " pre " << r.pre
                                      << " sets " << r.sets << ": " << r.why);
    EXPECT_DOUBLE_EQ(CountStockBalance(conn, r.article, r.store, 0, r.pre, r.sets), r.expected);
  }
}

TEST_P(StockTest, BalanceWithClosedPeriods) {
  ClosePeriodsBefore(D(2009, 3, 10));
  for (const auto& r : kBalances) {
    SCOPED_TRACE(::testing::Message() << "article " << r.article << " store " << r.store << " pre " << r.pre
                                      << " sets " << r.sets << ": " << r.why);
    EXPECT_DOUBLE_EQ(CountStockBalance(conn, r.article, r.store, 0, r.pre, r.sets), r.expected);
  }
}

TEST_P(StockTest, DefaultsAreAllStoresNoRowNoPreReservationsNoSets) {
  EXPECT_DOUBLE_EQ(CountStockBalance(conn, 10), 12);
}

// The file kind leaves the given row out of its sums; the server kind reads balances that hold
// every stored row and applies the given row to them once more.
TEST_P(StockTest, GivenRow) {
  struct Row {
    int32_t store, row;
    bool pre;
    double file, server;
    const char* why;
  } rows[] = {
      {1, 101, false, -5, 15, "a receipt into store 1"},
      {1, 104, false, 7, 3, "an issue from store 1"},
      {1, 103, false, 8, 2, "a movement out of store 1"},
      {2, 103, false, 4, 10, "the same movement into store 2"},
      {1, 105, false, 5, 5, "a pre-reservation not counted: no effect in either kind"},
      {1, 105, true, 5, 13, "counted pre-reservation"},
      {1, 102, false, 5, 5, "a row of another store: no effect in either kind"},
      {1, 201, false, 5, 5, "a row of another article"},
      {1, 999, false, 5, 5, "no such row"},
      {0, 101, false, 2, 22, "all stores: a receipt from outside"},
      {0, 104, false, 14, 10, "all stores: an issue to outside"},
      {0, 103, false, 12, 12, "all stores: a movement counts in neither"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << "store " << r.store << " row " << r.row << ": " << r.why);
    EXPECT_DOUBLE_EQ(CountStockBalance(conn, 10, r.store, r.row, r.pre, false), ServerDialect() ? r.server : r.file);
  }
}

TEST_P(StockTest, FailureReturnsTheSumSoFar) {
  if (ServerDialect()) {
    // The balance is read, then the row query fails.
    Exec("DROP TABLE DDStoreDRow");
    EXPECT_DOUBLE_EQ(CountStockBalance(conn, 10, 1, 104), 5);
  } else {
    ClosePeriodsBefore(D(2009, 3, 10));
    Exec("DROP TABLE DBalanceStore");
    EXPECT_DOUBLE_EQ(CountStockBalance(conn, 10, 1), 0);
  }
}

// ---------------------------------------------------------------------------------------------
// Balance SQL, as each kind sends it
// ---------------------------------------------------------------------------------------------

struct BalanceSqlRow {
  int32_t kind;
  bool closed;
  int32_t article, store, row;
  bool pre, sets;
  int32_t mode;  // of the first query
  std::vector<std::string> sql;
};

const std::vector<BalanceSqlRow>& BalanceSqlRows() {
  static const std::vector<BalanceSqlRow> rows = {
      {1, false, 10, 1, 0, false, false, 3,
       {"SELECT SUM(I.BaseQuantity) AS Q FROM DDStoreDRow I WHERE I.IDGRArticle = 10 AND I.ArticleType <> 'S' "
        "AND I.DealState <> 'P' AND I.IDReceiverStore = 1 UNION ALL SELECT -SUM(O.BaseQuantity) AS Q FROM "
        "DDStoreDRow O WHERE O.IDGRArticle = 10 AND O.ArticleType <> 'S' AND O.DealState <> 'P' AND "
        "O.IDSenderStore = 1"}},
      {1, true, 10, 0, 5, true, false, 3,
       {"SELECT SUM(I.BaseQuantity) AS Q FROM DDStoreDRow I WHERE I.IDGRArticle = 10 AND I.ArticleType <> 'S' "
        "AND I.IDSenderStore IS NULL AND I.IDReceiverStore IS NOT NULL AND I.ID <> 5 AND I.DocDate >= #3/10/2009# "
        "UNION ALL SELECT -SUM(O.BaseQuantity) AS Q FROM DDStoreDRow O WHERE O.IDGRArticle = 10 AND "
        "O.ArticleType <> 'S' AND O.IDReceiverStore IS NULL AND O.IDSenderStore IS NOT NULL AND O.ID <> 5 AND "
        "O.DocDate >= #3/10/2009# UNION ALL SELECT (SUM(B.DebitQFlow) - SUM(B.CreditQFlow)) AS Q FROM "
        "DBalanceStore B WHERE B.IDGRArticle = 10 AND B.DocDate < #3/10/2009#"}},
      {1, true, 10, 2, 0, false, false, 3,
       {"SELECT SUM(I.BaseQuantity) AS Q FROM DDStoreDRow I WHERE I.IDGRArticle = 10 AND I.ArticleType <> 'S' "
        "AND I.DealState <> 'P' AND I.IDReceiverStore = 2 AND I.DocDate >= #3/10/2009# UNION ALL SELECT "
        "-SUM(O.BaseQuantity) AS Q FROM DDStoreDRow O WHERE O.IDGRArticle = 10 AND O.ArticleType <> 'S' AND "
        "O.DealState <> 'P' AND O.IDSenderStore = 2 AND O.DocDate >= #3/10/2009# UNION ALL SELECT "
        "(SUM(B.DebitQFlow) - SUM(B.CreditQFlow)) AS Q FROM DBalanceStore B WHERE B.IDGRArticle = 10 AND "
        "B.IDDRStore = 2 AND B.DocDate < #3/10/2009#"}},
      {1, false, 20, 1, 0, false, true, 3,
       {"SELECT Min(X.Q) AS Q FROM (SELECT Sum(Z.Q) AS Q FROM (SELECT I.IDGRArticle, SUM(I.BaseQuantity / "
        "IIf(R.Quantity = 0, 1, R.Quantity)) AS Q FROM (DDStoreDRow I INNER JOIN GRArtCompletionRow R ON "
        "I.IDGRArticle = R.IDGRArticle) INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE "
        "C.IDGRArticle = 20 AND I.ArticleType <> 'S' AND I.DealState <> 'P' AND I.IDReceiverStore = 1 GROUP BY "
        "I.IDGRArticle  UNION ALL SELECT O.IDGRArticle, -SUM(O.BaseQuantity / IIf(R.Quantity = 0, 1, "
        "R.Quantity)) AS Q FROM (DDStoreDRow O INNER JOIN GRArtCompletionRow R ON O.IDGRArticle = R.IDGRArticle) "
        "INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = 20 AND O.ArticleType "
        "<> 'S' AND O.DealState <> 'P' AND O.IDSenderStore = 1 GROUP BY O.IDGRArticle) Z GROUP BY Z.IDGRArticle) "
        "X"}},
      {1, true, 20, 1, 0, true, true, 3,
       {"SELECT Min(X.Q) AS Q FROM (SELECT Sum(Z.Q) AS Q FROM (SELECT I.IDGRArticle, SUM(I.BaseQuantity / "
        "IIf(R.Quantity = 0, 1, R.Quantity)) AS Q FROM (DDStoreDRow I INNER JOIN GRArtCompletionRow R ON "
        "I.IDGRArticle = R.IDGRArticle) INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE "
        "C.IDGRArticle = 20 AND I.ArticleType <> 'S' AND I.IDReceiverStore = 1 AND I.DocDate >= #3/10/2009# "
        "GROUP BY I.IDGRArticle  UNION ALL SELECT O.IDGRArticle, -SUM(O.BaseQuantity / IIf(R.Quantity = 0, 1, "
        "R.Quantity)) AS Q FROM (DDStoreDRow O INNER JOIN GRArtCompletionRow R ON O.IDGRArticle = R.IDGRArticle) "
        "INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = 20 AND O.ArticleType "
        "<> 'S' AND O.IDSenderStore = 1 AND O.DocDate >= #3/10/2009# GROUP BY O.IDGRArticle  UNION ALL SELECT "
        "B.IDGRArticle, (SUM(B.DebitQFlow / IIf(R.Quantity = 0, 1, R.Quantity)) - SUM(B.CreditQFlow / "
        "IIf(R.Quantity = 0, 1, R.Quantity))) AS Q FROM (DBalanceStore B INNER JOIN GRArtCompletionRow R ON "
        "B.IDGRArticle = R.IDGRArticle) INNER JOIN GRArtCompletion C ON R.IDGRArtCompletion = C.ID WHERE "
        "C.IDGRArticle = 20 AND B.IDDRStore = 1 AND B.DocDate < #3/10/2009# GROUP BY B.IDGRArticle ) Z GROUP BY "
        "Z.IDGRArticle) X"}},
      {2, true, 10, 1, 104, false, false, 3,
       {"SELECT Quantity AS Quantity, RQuantity AS RQuantity, PQuantity AS PQuantity FROM DCurBalanceStore WHERE "
        "IDGRArticle = 10 AND IDDRStore = 1",
        "SELECT BaseQuantity, IDReceiverStore, IDSenderStore FROM DDStoreDRow WHERE ID = 104 AND IDGRArticle = 10 "
        "AND (IDReceiverStore = 1 OR IDSenderStore = 1) AND ArticleType <> 'S' AND DealState <> 'P'"}},
      {2, false, 10, 0, 104, true, false, 3,
       {"SELECT Sum(Quantity) AS Quantity, Sum(RQuantity) AS RQuantity, Sum(PQuantity) AS PQuantity FROM "
        "DCurBalanceStore WHERE IDGRArticle = 10",
        "SELECT BaseQuantity, IDReceiverStore, IDSenderStore FROM DDStoreDRow WHERE ID = 104 AND IDGRArticle = 10 "
        "AND ArticleType <> 'S'"}},
      {2, false, 20, 1, 0, true, true, 11,
       {"SELECT Min(X.Quantity) AS Quantity, 0 AS RQuantity, 0 AS PQuantity FROM (SELECT Sum((A.Quantity + "
        "A.RQuantity + A.PQuantity) / Case When B.Quantity = 0 Then 1 Else B.Quantity End) AS Quantity FROM "
        "DCurBalanceStore A INNER JOIN GRArtCompletionRow B ON A.IDGRArticle = B.IDGRArticle INNER JOIN "
        "GRArtCompletion C ON B.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = 20 AND A.IDDRStore = 1 GROUP BY "
        "A.IDGRArticle ) X"}},
      {2, false, 20, 0, 0, false, true, 11,
       {"SELECT Min(X.Quantity) AS Quantity, 0 AS RQuantity, 0 AS PQuantity FROM (SELECT Sum((A.Quantity + "
        "A.RQuantity) / Case When B.Quantity = 0 Then 1 Else B.Quantity End) AS Quantity FROM DCurBalanceStore A "
        "INNER JOIN GRArtCompletionRow B ON A.IDGRArticle = B.IDGRArticle INNER JOIN GRArtCompletion C ON "
        "B.IDGRArtCompletion = C.ID WHERE C.IDGRArticle = 20 GROUP BY A.IDGRArticle ) X"}},
  };
  return rows;
}

TEST_P(StockTest, BalanceSql) {
  ClosePeriodsBefore(D(2009, 3, 10));
  for (const auto& r : BalanceSqlRows()) {
    if (r.kind != Kind()) continue;
    SCOPED_TRACE(::testing::Message() << "article " << r.article << " store " << r.store << " row " << r.row
                                      << " pre " << r.pre << " sets " << r.sets << " closed " << r.closed);
    host->SetSetting("DateFixed", "Store", Variant(r.closed ? D(2009, 3, 10) : Date()));
    conn->Clear();
    CountStockBalance(conn, r.article, r.store, r.row, r.pre, r.sets);
    EXPECT_EQ(conn->Sql(), r.sql);
    ASSERT_FALSE(conn->Modes().empty());
    EXPECT_EQ(conn->Modes()[0], r.mode);
    // The file kind reads the closing date on every call; the server kind never needs it.
    EXPECT_EQ(conn->SettingReads(), ServerDialect() ? std::vector<std::string>{}
                                                    : std::vector<std::string>{"DateFixed/Store"});
  }
}

// ---------------------------------------------------------------------------------------------
// Cost
// ---------------------------------------------------------------------------------------------

// Price lists for production costs: the store's list 50 (valid from 3/1/2009, open-ended) hands
// over to 51 and then 52; 60 is the store's list for completions.
class CostTest : public StockTest {
 protected:
  void SetUp() override {
    StockTest::SetUp();
    Exec("INSERT INTO GRPriceList (ID, IDFirst, BeginDate, EndDate) VALUES (50, 51, " + Serial(2009, 3, 1) +
         ", 0), (51, 52, 0, 0), (52, 0, 0, 0), (60, 0, 0, 0);"
         "INSERT INTO GRPriceListRel (IDGRPriceList, IDGRArticle, Price) VALUES (50, 30, 10), (51, 30, 12),"
         " (60, 31, 20), (50, 31, 99), (52, 32, 33);"
         "INSERT INTO GDocument (ID, DocName, RefType, DocDate) VALUES (500, 'DDProduction', 'DDProduction', " +
         Serial(2009, 2, 1) + "), (501, 'DDProduction', 'DDProduction', " + Serial(2009, 3, 15) + ");");
    Options(false, false);
  }
  // The option cache outlives the test on this thread: leave it holding the default options, as
  // a fresh database would give them, for the tests that follow.
  void TearDown() override {
    Options(false, false);
    CountCost(conn, 0, 0, 0, true);
    StockTest::TearDown();
  }
  void Options(bool byStore, bool running) {
    host->SetSetting("CostCounting", "CostByStore", Variant(byStore));
    host->SetSetting("CostCounting", "RunningCost", Variant(running));
  }
  // A cost call that reads the options afresh.
  Variant Cost(int32_t article, int32_t store, int32_t doc = 0, const std::string& type = "X") {
    return CountCost(conn, article, store, doc, true, type);
  }
};

TEST_P(CostTest, ServiceAndProductionArticles) {
  struct Row {
    int32_t article, store, doc;
    const char* type;
    double expected;
    const char* why;
  } rows[] = {
      {11, 1, 0, "X", 7.25, "a service: the article's cost"},
      {10, 1, 0, "S", 1.5, "the type given wins over the article's"},
      {30, 1, 0, "X", 10, "production: level 1 of the store's chain, today"},
      {30, 1, 501, "X", 10, "on the date of GDocument 501"},
      {30, 1, 500, "X", 12, "list 50 not yet valid on 2/1/2009: level 2"},
      {30, 1, 999, "X", 10, "no such document: today"},
      {32, 1, 0, "X", 33, "only level 3 has a price"},
      {31, 1, 0, "X", 20, "PC: the store's list for completions"},
      {31, 1, 0, "P", 99, "as P: the store's ordinary list"},
      {10, 1, 0, "p", 0, "no price in the chain gives 0"},
      {30, 2, 0, "X", 0, "a store without a price list"},
      {30, 0, 0, "X", 3, "no store: the balance-based cost (the article's)"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << "article " << r.article << " store " << r.store << " doc " << r.doc
                                      << " type " << r.type << ": " << r.why);
    Variant v = Cost(r.article, r.store, r.doc, r.type);
    ASSERT_FALSE(v.IsEmpty());
    EXPECT_DOUBLE_EQ(CDbl(v), r.expected);
  }
}

TEST_P(CostTest, ServiceReadsNoBalances) {
  conn->Clear();
  EXPECT_EQ(Cost(11, 1), Variant(Currency::FromDouble(7.25)));
  EXPECT_EQ(conn->Sql(), std::vector<std::string>{"SELECT ArticleType, Cost FROM GRArticle WHERE ID = 11"});
}

TEST_P(CostTest, ProductionSql) {
  conn->Clear();
  Cost(31, 1, 500);
  const std::string t = "#2/1/2009#";
  std::string valid;
  for (int i = 1; i <= 5; ++i) {
    const std::string wa = "WA" + std::to_string(i);
    valid += "IIf(" + t + " >= " + wa + ".BeginDate AND (" + t + " <= " + wa + ".EndDate OR Year(" + wa +
             ".EndDate) < 1900), " + wa + ".ID, 0) AS ID_" + std::to_string(i) + (i < 5 ? ", " : " ");
  }
  const std::vector<std::string> expected = {
      "SELECT ArticleType, Cost FROM GRArticle WHERE ID = 31",
      "SELECT IDComplPriceList AS IDGRPriceList FROM DRStore WHERE ID = 1",
      "SELECT DocDate FROM GDocument WHERE ID = 500",
      "SELECT A.IDGRArticle, A.IDGRPriceList, A.Price FROM GRPriceListRel A, (SELECT WA.IDGRArticle, "
      "Min(IIf(WB.ID_1 = WA.IDGRPriceList, 1, IIf(WB.ID_2 = WA.IDGRPriceList, 2, IIf(WB.ID_3 = WA.IDGRPriceList, "
      "3, IIf(WB.ID_4 = WA.IDGRPriceList, 4, 5))))) AS Weight FROM GRPriceListRel WA, (SELECT " +
          valid +
          "FROM (((GRPriceList WA1 LEFT JOIN GRPriceList WA2 ON WA1.IDFirst = WA2.ID) LEFT JOIN GRPriceList WA3 ON "
          "WA2.IDFirst = WA3.ID) LEFT JOIN GRPriceList WA4 ON WA3.IDFirst = WA4.ID) LEFT JOIN GRPriceList WA5 ON "
          "WA4.IDFirst = WA5.ID WHERE 60 In (WA1.ID, WA2.ID, WA3.ID, WA4.ID, WA5.ID)) WB WHERE WA.IDGRArticle = 31 "
          "GROUP BY WA.IDGRArticle) B, (SELECT A1.ID AS ID_1, A2.ID AS ID_2, A3.ID AS ID_3, A4.ID AS ID_4, A5.ID AS "
          "ID_5 FROM (((GRPriceList A1 LEFT JOIN GRPriceList A2 ON A1.IDFirst = A2.ID) LEFT JOIN GRPriceList A3 ON "
          "A2.IDFirst = A3.ID) LEFT JOIN GRPriceList A4 ON A3.IDFirst = A4.ID) LEFT JOIN GRPriceList A5 ON "
          "A4.IDFirst = A5.ID WHERE 60 In (A1.ID, A2.ID, A3.ID, A4.ID, A5.ID)) C WHERE A.IDGRArticle = "
          "B.IDGRArticle AND (IIf(B.Weight = 1, C.ID_1, IIf(B.Weight = 2, C.ID_2, IIf(B.Weight = 3, C.ID_3, "
          "IIf(B.Weight = 4, C.ID_4, C.ID_5))))) = A.IDGRPriceList",
  };
  EXPECT_EQ(conn->Sql(), expected);
  EXPECT_EQ(conn->Modes(), (std::vector<int32_t>{3, 1, 1, 1}));
}

TEST_P(CostTest, StoredCost) {
  struct Row {
    bool byStore;
    int32_t article, store;
    Variant expected;
    const char* why;
  } rows[] = {
      {false, 10, 1, Variant(Currency::FromDouble(1.5)), "the article's cost"},
      {false, 999, 1, Variant(), "no such article: Empty"},
      {true, 10, 1, Variant(Currency::FromDouble(1.8)), "store 1: 9 for 5"},
      {true, 10, 2, Variant(Currency::FromDouble(2.5714)), "store 2: 18 for 7, stored to four decimals"},
      {true, 10, 0, Variant(), "no balance row for store 0"},
      {true, 12, 1, Variant(), "never moved: no balance row"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << "article " << r.article << " store " << r.store << ": " << r.why);
    Options(r.byStore, false);
    EXPECT_EQ(Cost(r.article, r.store), r.expected);
  }
}

// The running average in both kinds gives the same figure: receipts' cost less issues' cost over
// the quantity, with the given issue row taken back.
TEST_P(CostTest, RunningAverage) {
  struct Row {
    bool byStore;
    int32_t article, store, row;
    double expected;
    const char* why;
  } rows[] = {
      {true, 10, 1, 0, 1.8, "store 1: (20 - 6 - 5) / 5"},
      {true, 10, 2, 0, 18.0 / 7, "store 2: (15 + 6 - 3) / 7"},
      {false, 10, 1, 0, 27.0 / 12, "over all stores, the store ignored"},
      {true, 10, 0, 0, 27.0 / 12, "store 0"},
      {true, 10, 1, 104, 2.0, "issue 104 taken back: 14 / 7"},
      {false, 10, 2, 104, 32.0 / 14, "over all stores, 104 taken back"},
      {true, 12, 1, 0, 0.0, "no movement at all: 0"},
      {false, 12, 0, 0, 0.0, ""},
      {true, 999, 1, 0, 0.0, "no such article"},
  };
  for (bool closed : {false, true}) {
    if (closed) ClosePeriodsBefore(D(2009, 3, 10));
    for (const auto& r : rows) {
      SCOPED_TRACE(::testing::Message() << "article " << r.article << " store " << r.store << " row " << r.row
                                        << " closed " << closed << ": " << r.why);
      Options(r.byStore, true);
      Variant v = Cost(r.article, r.store, r.row);
      ASSERT_FALSE(v.IsEmpty());
      EXPECT_NEAR(CDbl(v), r.expected, 1e-12);
    }
  }
}

TEST_P(CostTest, RunningAverageSql) {
  struct Row {
    int32_t kind;
    bool closed, byStore;
    int32_t store, row;
    std::string sql;
  } rows[] = {
      {1, false, true, 1, 0,
       "SELECT IIf(IIf(IsNull(Sum(R.Q)), 0,Sum(R.Q)) = 0, 0, Sum(R.A) / Sum(R.Q)) AS Cost FROM (SELECT "
       "IIf(IsNull(Sum(R2.Cost)), 0, Sum(R2.Cost)) AS A, IIf(IsNull(Sum(R2.BaseQuantity)), 0, Sum(R2.BaseQuantity)) "
       "AS Q FROM DDStoreDRow R2 WHERE R2.IDGRArticle = 10 AND R2.IDReceiverStore = 1 AND R2.DealState = '' AND "
       "R2.ArticleType <> 'S' AND R2.IDReceiverStore IS NOT NULL  UNION ALL SELECT -IIf(IsNull(Sum(R3.Cost)), 0, "
       "Sum(R3.Cost)), -IIf(IsNull(Sum(R3.BaseQuantity)), 0, Sum(R3.BaseQuantity)) FROM DDStoreDRow R3 WHERE "
       "R3.IDGRArticle = 10 AND R3.IDSenderStore = 1 AND R3.DealState <> 'P' AND R3.ArticleType <> 'S' AND "
       "R3.IDSenderStore IS NOT NULL ) R "},
      {1, true, false, 1, 104,
       "SELECT IIf(IIf(IsNull(Sum(R.Q)), 0,Sum(R.Q)) = 0, 0, Sum(R.A) / Sum(R.Q)) AS Cost FROM (SELECT "
       "IIf(IsNull(Sum(R1.DebitFlowBase)), 0, Sum(R1.DebitFlowBase)) -IIf(IsNull(Sum(R1.CreditFlowBase)), 0, "
       "Sum(R1.CreditFlowBase)) AS A, IIf(IsNull(Sum(R1.DebitQFlow)), 0, Sum(R1.DebitQFlow)) "
       "-IIf(IsNull(Sum(R1.CreditQFlow)), 0, Sum(R1.CreditQFlow)) AS Q FROM DBalanceStore R1 WHERE R1.IDGRArticle "
       "= 10 AND R1.DocDate < #3/10/2009# UNION ALL SELECT IIf(IsNull(Sum(R2.Cost)), 0, Sum(R2.Cost)) AS A, "
       "IIf(IsNull(Sum(R2.BaseQuantity)), 0, Sum(R2.BaseQuantity)) AS Q FROM DDStoreDRow R2 WHERE R2.IDGRArticle "
       "= 10 AND R2.DealState = '' AND R2.ArticleType <> 'S' AND R2.IDReceiverStore IS NOT NULL  AND R2.DocDate "
       ">= #3/10/2009# AND R2.ID <> 104 UNION ALL SELECT -IIf(IsNull(Sum(R3.Cost)), 0, Sum(R3.Cost)), "
       "-IIf(IsNull(Sum(R3.BaseQuantity)), 0, Sum(R3.BaseQuantity)) FROM DDStoreDRow R3 WHERE R3.IDGRArticle = 10 "
       "AND R3.DealState <> 'P' AND R3.ArticleType <> 'S' AND R3.IDSenderStore IS NOT NULL  AND R3.DocDate >= "
       "#3/10/2009# AND R3.ID <> 104) R "},
      {2, false, true, 1, 0,
       "SELECT (Case When IsNull(Sum(Quantity + RQuantity), 0) = 0 Then 0 Else IsNull(Sum(AmountBase), 0) / "
       "IsNull(Sum(Quantity + RQuantity), 0) End) AS Cost FROM DCurBalanceStore WHERE IDGRArticle = 10 AND "
       "IDDRStore = 1"},
      {2, true, true, 1, 104,
       "SELECT (Case When IsNull(DC.Quantity + R.BaseQuantity, 0) = 0 Then 0 Else (DC.AmountBase + R.Cost) / "
       "(DC.Quantity + R.BaseQuantity) End) AS Cost FROM (SELECT IsNull(Sum(Quantity + RQuantity), 0) AS Quantity, "
       "IsNull(Sum(AmountBase), 0) AS AmountBase FROM DCurBalanceStore WHERE IDGRArticle = 10 AND IDDRStore = 1) "
       "DC, (SELECT IsNull(Sum(BaseQuantity), 0) AS BaseQuantity, IsNull(Sum(Cost), 0) AS Cost FROM DDStoreDRow "
       "WHERE ID = 104 AND IDGRArticle = 10 AND IDSenderStore = 1 AND ArticleType <> 'S' AND DealState <> 'P') R"},
      {2, false, false, 1, 104,
       "SELECT (Case When IsNull(DC.Quantity + R.BaseQuantity, 0) = 0 Then 0 Else (DC.AmountBase + R.Cost) / "
       "(DC.Quantity + R.BaseQuantity) End) AS Cost FROM (SELECT IsNull(Sum(Quantity + RQuantity), 0) AS Quantity, "
       "IsNull(Sum(AmountBase), 0) AS AmountBase FROM DCurBalanceStore WHERE IDGRArticle = 10) DC, (SELECT "
       "IsNull(Sum(BaseQuantity), 0) AS BaseQuantity, IsNull(Sum(Cost), 0) AS Cost FROM DDStoreDRow WHERE ID = "
       "104 AND IDGRArticle = 10 AND IDSenderStore Is Not Null  AND ArticleType <> 'S' AND DealState <> 'P') R"},
  };
  ClosePeriodsBefore(D(2009, 3, 10));
  for (const auto& r : rows) {
    if (r.kind != Kind()) continue;
    SCOPED_TRACE(::testing::Message() << "closed " << r.closed << " by store " << r.byStore << " row " << r.row);
    host->SetSetting("DateFixed", "Store", Variant(r.closed ? D(2009, 3, 10) : Date()));
    Options(r.byStore, true);
    conn->Clear();
    Cost(10, r.store, r.row);
    const std::vector<std::string> expected = {"SELECT ArticleType, Cost FROM GRArticle WHERE ID = 10", r.sql};
    EXPECT_EQ(conn->Sql(), expected);
    EXPECT_EQ(conn->Modes(), (std::vector<int32_t>{3, ServerDialect() ? 11 : 3}));
  }
}

TEST_P(CostTest, StoredCostSql) {
  Options(true, false);
  conn->Clear();
  Cost(10, 2);
  Options(false, false);
  Cost(10, 2);
  const std::vector<std::string> expected = {
      "SELECT ArticleType, Cost FROM GRArticle WHERE ID = 10",
      "SELECT Cost FROM DCurBalanceStore WHERE IDDRStore = 2 AND IDGRArticle = 10",
      "SELECT ArticleType, Cost FROM GRArticle WHERE ID = 10",
      "SELECT Cost FROM GRArticle WHERE ID = 10",
  };
  EXPECT_EQ(conn->Sql(), expected);
}

// The options are read by the first call and kept until a call resets them; each thread keeps
// its own.
TEST_P(CostTest, OptionCache) {
  Options(false, false);
  conn->Clear();
  EXPECT_EQ(CountCost(conn, 10, 1, 0, true), Variant(Currency::FromDouble(1.5)));
  EXPECT_EQ(conn->SettingReads(), (std::vector<std::string>{"CostCounting/CostByStore", "CostCounting/RunningCost"}));

  Options(true, false);
  conn->Clear();
  EXPECT_EQ(CountCost(conn, 10, 1), Variant(Currency::FromDouble(1.5)));  // still the article's cost
  EXPECT_TRUE(conn->SettingReads().empty());

  // Another thread has a cache of its own and reads the options now in force.
  Variant other;
  std::thread([&] { other = CountCost(conn, 10, 1, 0, true); }).join();
  EXPECT_EQ(other, Variant(Currency::FromDouble(1.8)));
  EXPECT_EQ(CountCost(conn, 10, 1), Variant(Currency::FromDouble(1.5)));

  EXPECT_EQ(CountCost(conn, 10, 1, 0, true), Variant(Currency::FromDouble(1.8)));  // reset: stored per store

  // Switching on the running average: the file kind reads the closing date once, with the options.
  Options(true, true);
  conn->Clear();
  EXPECT_EQ(CountCost(conn, 10, 1), Variant(Currency::FromDouble(1.8)));  // cached: stored cost
  EXPECT_TRUE(conn->SettingReads().empty());
  EXPECT_NEAR(CDbl(CountCost(conn, 10, 2, 0, true)), 18.0 / 7, 1e-12);
  std::vector<std::string> reads = {"CostCounting/CostByStore", "CostCounting/RunningCost"};
  if (!ServerDialect()) reads.push_back("DateFixed/Store");
  EXPECT_EQ(conn->SettingReads(), reads);
  conn->Clear();
  EXPECT_NEAR(CDbl(CountCost(conn, 10, 2)), 18.0 / 7, 1e-12);
  EXPECT_TRUE(conn->SettingReads().empty());
}

INSTANTIATE_TEST_SUITE_P(, StockTest, ::testing::Values(1, 2), KindName);
INSTANTIATE_TEST_SUITE_P(, CostTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal::server
