// Record merging through ServerFunctions.AggrRec on the SQLite host, on both database kinds:
// articles, stores, bank accounts, cash desks and categories; balances summed and moved,
// references and options moved, the source deleted or kept, the log line; refusals with their
// texts in English and Estonian; a merge that fails half-way rolls back whole; and a work table
// left under the drawn name is neither used nor destroyed.
#include <gtest/gtest.h>

#include "server/internal/work_table.h"
#include "server/server_functions.h"
#include "server/table_filters.h"
#include "sqlite_host_support.h"

namespace xal::server::testing {
namespace {

const std::vector<std::string> kAllTables = {
    "GRArticle",     "DRStore",     "DBalanceStore", "DCurBalanceStore", "DDStoreDRow",  "GRArtCompletion",
    "GRArtCompletionRow", "GRArticleCat", "GRArticleCatRel", "XALUserOption", "XALLog", "VBalanceBank",
    "VBalanceCash",  "GRBankAccount", "VRCashDesk",   "GDocument",        "VDVoucherRow"};

const char* const kStockColumns =
    "CAST(DocDate AS REAL) AS D, IDGRArticle, IDDRStore, DebitQFlow, CreditQFlow, DebitFlowBase, CreditFlowBase, "
    "DebitFlowRef, CreditFlowRef";

class AggrRecTest : public SqliteHostTest {
 protected:
  void SetUp() override {
    SqliteHostTest::SetUp();
    Sql("INSERT INTO XALMessage (MsgKey, Kind, English, Estonian) VALUES"
        " ('Err_AggrRec', 2, 'The records cannot be merged', 'Kirjeid ei saa ühendada'),"
        " ('Err_TargetNotFound', 2, 'the target record was not found', 'sihtkirjet ei leitud'),"
        " ('Err_DiffUnits', 2, 'the articles have different units', 'artiklitel on erinevad mõõtühikud'),"
        " ('Err_DiffType', 2, 'the articles have different quantity types', 'artiklitel on erinev koguse tüüp'),"
        " ('Err_DiffCategory', 2, 'the records belong to different categories',"
        "  'kirjed kuuluvad erinevatesse kategooriatesse');"
        "INSERT INTO GRArticle (ID, Code, IDGRUnit, QuantityType) VALUES"
        " (1, 'A1', 1, 'Q'), (2, 'A2', 1, 'Q'), (3, 'A3', 2, 'Q'), (4, 'A4', 1, 'W');"
        "INSERT INTO DRStore (ID, Code) VALUES (100, 'S1'), (101, 'S2');"
        "INSERT INTO DBalanceStore (ID, DocDate, IDGRArticle, IDDRStore, DebitQFlow, CreditQFlow, DebitFlowBase,"
        " CreditFlowBase, DebitFlowRef, CreditFlowRef) VALUES"
        " (1, 39800, 1, 100, 5, 1, 50, 10, 5, 1), (2, 39800, 2, 100, 3, 0, 30, 0, 3, 0),"
        " (3, 39801, 1, 101, 2, 0, 20, 0, 2, 0), (4, 39800, 2, 101, 7, 0, 70, 0, 7, 0),"
        " (5, 39800, 3, 100, 1, 0, 10, 0, 1, 0);"
        "INSERT INTO DDStoreDRow (ID, IDGRArticle, IDSenderStore, IDReceiverStore, DocDate, BaseQuantity, Cost) VALUES"
        " (1, 1, NULL, 100, 39850, 4, 40), (2, 1, 100, 101, 39851, 1, 10), (3, 2, NULL, 100, 39850, 6, 66),"
        " (4, 3, NULL, 101, 39850, 2, 8);"
        "INSERT INTO GRArtCompletion (ID, IDGRArticle) VALUES (50, 1), (51, 3);"
        "INSERT INTO GRArtCompletionRow (ID, IDGRArtCompletion, IDGRArticle, Quantity) VALUES"
        " (60, 50, 3, 1), (61, 51, 1, 2);"
        "INSERT INTO GRArticleCat (ID, Code, Category) VALUES (1, 'C1', 'G1'), (2, 'C2', 'G1'), (3, 'C3', 'G2');"
        "INSERT INTO GRArticleCatRel (ID, IDGRArticle, IDGRArticleCat) VALUES (1, 1, 1), (2, 3, 3);"
        "INSERT INTO XALOptionList (Category, Name, TableName, Type) VALUES"
        " ('Defaults', 'Article', 'GRArticle', 'ID'), ('Defaults', 'Store', 'DRStore', 'ID');"
        "INSERT INTO XALUserOption (IDXALUser, Category, Name, OptValue) VALUES"
        " (1, 'Defaults', 'Article', '1'), (2, 'Defaults', 'Store', '100');"
        "INSERT INTO XALLogTable (TableName, Kind) VALUES ('GRArticle', 'REGISTER'), ('DRStore', 'REGISTER');"
        "INSERT INTO GRBankAccount (ID, Code) VALUES (7, 'B7'), (8, 'B8');"
        "INSERT INTO VRCashDesk (ID, Code) VALUES (3, 'K3'), (4, 'K4');"
        "INSERT INTO GDocument (ID, RefType, IDGRBankAccount, IDVRCashDesk) VALUES (1, 'VDVoucher', 7, 3);"
        "INSERT INTO VDVoucherRow (ID, IDVDVoucher, IDGRBankAccount, IDVRCashDesk) VALUES (1, 1, 7, 0), (2, 1, 0, 3);");
    for (const char* balance : {"VBalanceBank", "VBalanceCash"}) {
      const std::string link = std::string(balance) == "VBalanceBank" ? "IDGRBankAccount" : "IDVRCashDesk";
      const std::string s = link == "IDGRBankAccount" ? "7" : "3", d = link == "IDGRBankAccount" ? "8" : "4";
      Sql(std::string("INSERT INTO ") + balance + " (DocDate, " + link +
          ", IDGRCurrency, DebitFlow, CreditFlow, DebitFlowBase, CreditFlowBase, DebitFlowRef, CreditFlowRef) VALUES"
          " (39800, " + s + ", 1, 100, 10, 100, 10, 50, 5), (39800, " + d + ", 1, 20, 0, 20, 0, 10, 0),"
          " (39800, " + s + ", 2, 30, 3, 30, 3, 15, 1), (39801, " + d + ", 1, 1, 1, 1, 1, 1, 1)");
    }
    Sql("INSERT INTO DCurBalanceStoreRefresh SELECT DISTINCT IDGRArticle, IDDRStore FROM vCurBalanceStore");
  }
  void TearDown() override {
    internal::SetWorkTableNumberSource(nullptr);
    SqliteHostTest::TearDown();
  }

  // Merges `source` into `target` through the facade; `errText` gets "ErrText" ("<none>" if unset).
  bool Merge(const std::string& table, int32_t source, int32_t target, bool deleteSource, std::string& errText) {
    Ref<DataObject> obj = conn->Server()->OpenDataObject(table);
    Ref<ParamList> params = conn->Server()->NewParamList();
    params->Set("TargetID", Variant(target));
    params->Set("Delete", Variant(deleteSource));
    auto functions = MakeRef<ServerFunctions>();
    const bool merged = functions->AggrRec(obj, source, params);
    errText = params->Exists("ErrText") ? CStr(params->Item("ErrText")) : "<none>";
    return merged;
  }
  int32_t WorkTables() {
    return Count("SELECT count(*) FROM sqlite_schema WHERE type = 'table' AND name LIKE '%TmpDBalanceStore'");
  }
  // The current balances equal their defining view: the host rebuilt what the merge touched.
  void ExpectCurrentBalancesRebuilt() {
    const std::string columns = "IDGRArticle, IDDRStore, Quantity, RQuantity, PQuantity, AmountBase";
    EXPECT_EQ(Rows("DCurBalanceStore", columns), Rows("vCurBalanceStore", columns));
  }
};

TEST_P(AggrRecTest, ArticlesSumBalancesMoveReferencesAndDeleteTheSource) {
  std::string err;
  ASSERT_TRUE(Merge("GRArticle", 1, 2, true, err)) << err;
  EXPECT_EQ(err, "<none>");
  // Same date and store: summed into the target's row. A date and store the target lacks: the
  // source's row itself moves (its ID stays 3).
  EXPECT_EQ(Rows("DBalanceStore", std::string("ID, ") + kStockColumns),
            "(2,39800,2,100,8,1,80,10,8,1)(3,39801,2,101,2,0,20,0,2,0)(4,39800,2,101,7,0,70,0,7,0)"
            "(5,39800,3,100,1,0,10,0,1,0)");
  EXPECT_EQ(Rows("DDStoreDRow", "ID, IDGRArticle"), "(1,2)(2,2)(3,2)(4,3)");
  EXPECT_EQ(Rows("GRArtCompletion", "ID, IDGRArticle"), "(51,3)");  // the source's set definition is gone
  EXPECT_EQ(Rows("GRArtCompletionRow", "ID, IDGRArtCompletion, IDGRArticle"), "(61,51,2)");
  EXPECT_EQ(Rows("GRArticleCatRel", "IDGRArticle, IDGRArticleCat"), "(2,1)(3,3)");
  EXPECT_EQ(Rows("XALUserOption", "Name, OptValue"), "(Article,2)(Store,100)");
  EXPECT_EQ(Rows("GRArticle", "ID"), "(2)(3)(4)");
  EXPECT_EQ(Rows("XALLog", "Kind, TableName, IDRecord, LogText"), "(REGISTER,GRArticle,1,A1 Aggregated/Deleted (into: A2))");
  EXPECT_EQ(Count("SELECT count(*) FROM DCurBalanceStore WHERE IDGRArticle = 1"), 0);
  ExpectCurrentBalancesRebuilt();
  EXPECT_EQ(WorkTables(), 0);
}

TEST_P(AggrRecTest, StoresMergeWithoutDeletingTheSource) {
  std::string err;
  ASSERT_TRUE(Merge("DRStore", 100, 101, false, err)) << err;
  EXPECT_EQ(Rows("DBalanceStore", kStockColumns),
            "(39800,1,101,5,1,50,10,5,1)(39800,2,101,10,0,100,0,10,0)(39800,3,101,1,0,10,0,1,0)"
            "(39801,1,101,2,0,20,0,2,0)");
  EXPECT_EQ(Rows("DDStoreDRow", "ID, IDSenderStore, IDReceiverStore"), "(1,NULL,101)(2,101,101)(3,NULL,101)(4,NULL,101)");
  EXPECT_EQ(Rows("DRStore", "ID"), "(100)(101)") << "Delete False keeps the source record";
  EXPECT_EQ(Rows("XALUserOption", "Name, OptValue"), "(Article,1)(Store,101)");
  EXPECT_EQ(Count("SELECT count(*) FROM DCurBalanceStore WHERE IDDRStore = 100"), 0);
  EXPECT_EQ(Rows("XALLog", "LogText"), "(S1 Aggregated/Deleted (into: S2))");
  ExpectCurrentBalancesRebuilt();
  EXPECT_EQ(WorkTables(), 0);
}

TEST_P(AggrRecTest, BankAccountsAndCashDesksSumTheirMoneyBalances) {
  struct Row {
    const char* table;
    const char* balance;
    const char* link;
    int32_t source, target;
  } rows[] = {{"GRBankAccount", "VBalanceBank", "IDGRBankAccount", 7, 8}, {"VRCashDesk", "VBalanceCash", "IDVRCashDesk", 3, 4}};
  for (const auto& r : rows) {
    SCOPED_TRACE(r.table);
    std::string err;
    ASSERT_TRUE(Merge(r.table, r.source, r.target, true, err)) << err;
    const std::string d = std::to_string(r.target);
    EXPECT_EQ(Rows(r.balance, std::string("CAST(DocDate AS REAL) AS D, ") + r.link +
                                  ", IDGRCurrency, DebitFlow, CreditFlow, DebitFlowBase, CreditFlowBase, DebitFlowRef, "
                                  "CreditFlowRef"),
              "(39800," + d + ",1,120,10,120,10,60,5)(39800," + d + ",2,30,3,30,3,15,1)(39801," + d + ",1,1,1,1,1,1,1)");
    EXPECT_EQ(Rows("GDocument", r.link), "(" + d + ")");
    EXPECT_EQ(Count(std::string("SELECT count(*) FROM ") + r.table + " WHERE ID = " + std::to_string(r.source)), 0);
  }
  EXPECT_EQ(Rows("VDVoucherRow", "ID, IDGRBankAccount, IDVRCashDesk"), "(1,8,0)(2,0,4)");
}

TEST_P(AggrRecTest, CategoriesOfOneGroupMerge) {
  std::string err;
  ASSERT_TRUE(Merge("GRArticleCat", 1, 2, true, err)) << err;
  EXPECT_EQ(Rows("GRArticleCatRel", "IDGRArticle, IDGRArticleCat"), "(1,2)(3,3)");
  EXPECT_EQ(Rows("GRArticleCat", "ID"), "(2)(3)");
}

// Category groups are codes and compare without regard to case, in the merge as in CheckCategory:
// two categories are one group exactly when a record may not hold both, and then they merge.
TEST_P(AggrRecTest, CategoryGroupsDifferingInCaseAreOneGroup) {
  Sql("INSERT INTO GRArticleCat (ID, Code, Category) VALUES"
      " (4, 'C4', 'COLOR'), (5, 'C5', 'color'), (6, 'C6', 'SIZE'), (7, 'C7', 'Weight');"
      "INSERT INTO GRArticleCatRel (ID, IDGRArticle, IDGRArticleCat) VALUES (3, 2, 4), (4, 4, 6);");
  struct Row {
    int32_t holder, held, other;
    bool oneGroup;
  } rows[] = {
      {2, 4, 5, true},   // "COLOR" and "color"
      {4, 6, 7, false},  // "SIZE" and "Weight"
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(std::to_string(r.other) + " -> " + std::to_string(r.held));
    EXPECT_EQ(CheckCategory(conn, "GRArticle", r.holder, r.other), !r.oneGroup);
    std::string err;
    EXPECT_EQ(Merge("GRArticleCat", r.other, r.held, true, err), r.oneGroup) << err;
    EXPECT_EQ(Count("SELECT count(*) FROM GRArticleCat WHERE ID = " + std::to_string(r.other)), r.oneGroup ? 0 : 1);
  }
}

// Refusals: nothing changes, and "ErrText" is the general text with the reason after " - ", in
// the connection's language.
TEST_P(AggrRecTest, RefusalsChangeNothingAndSayWhy) {
  struct Row {
    int32_t lang;
    const char* table;
    int32_t source, target;
    const char* expected;
  } rows[] = {
      {3, "GRArticle", 1, 3, "The records cannot be merged - the articles have different units"},
      {4, "GRArticle", 1, 3, "Kirjeid ei saa ühendada - artiklitel on erinevad mõõtühikud"},
      {3, "GRArticle", 1, 4, "The records cannot be merged - the articles have different quantity types"},
      {4, "GRArticle", 1, 4, "Kirjeid ei saa ühendada - artiklitel on erinev koguse tüüp"},
      {3, "GRArticleCat", 1, 3, "The records cannot be merged - the records belong to different categories"},
      {4, "GRArticleCat", 1, 3, "Kirjeid ei saa ühendada - kirjed kuuluvad erinevatesse kategooriatesse"},
      {3, "GRArticle", 1, 99, "The records cannot be merged - the target record was not found"},  // no target
      {4, "GRArticle", 98, 2, "Kirjeid ei saa ühendada - sihtkirjet ei leitud"},                   // no source
      {3, "GRArticle", 1, 1, "The records cannot be merged"},                                      // into itself
      {4, "DRStore", 100, 0, "Kirjeid ei saa ühendada"},                                           // no target given
      {3, "GRArticle", 0, 2, "The records cannot be merged"},                                      // no source given
  };
  const std::string before = Dump(kAllTables);
  for (const auto& r : rows) {
    SCOPED_TRACE(std::string(r.table) + " " + std::to_string(r.source) + "->" + std::to_string(r.target));
    conn->SetLanguage(r.lang);
    std::string err;
    EXPECT_FALSE(Merge(r.table, r.source, r.target, true, err));
    EXPECT_EQ(err, r.expected);
    EXPECT_EQ(Dump(kAllTables), before);
  }
}

// A merge that fails half-way (here the last statement, the deletion of the source) is rolled
// back whole; the next merge on the same connection is not disturbed by the failure before it.
TEST_P(AggrRecTest, FailingMergeRollsBackCompletely) {
  Sql("CREATE TRIGGER refuse_delete BEFORE DELETE ON GRArticle WHEN OLD.ID = 1 BEGIN"
      " SELECT RAISE(ABORT, 'the article is in use'); END;");
  const std::string before = Dump(kAllTables);
  std::string err;
  EXPECT_FALSE(Merge("GRArticle", 1, 2, true, err));
  EXPECT_EQ(err, "The records cannot be merged");
  EXPECT_EQ(Dump(kAllTables), before);
  EXPECT_EQ(WorkTables(), 0);

  Sql("DROP TRIGGER refuse_delete");
  ASSERT_TRUE(Merge("GRArticle", 1, 2, true, err)) << err;
  EXPECT_EQ(Rows("GRArticle", "ID"), "(2)(3)(4)");
}

// The first name drawn for the work table is taken by another table, which the merge must leave
// alone; it draws again and works under the next name.
TEST_P(AggrRecTest, WorkTableNameInUseIsNeitherUsedNorDropped) {
  Sql("CREATE TABLE \"42TmpDBalanceStore\" (DocDate REAL, IDDRStore INTEGER, DQ REAL);"
      "INSERT INTO \"42TmpDBalanceStore\" VALUES (1, 2, 3);");
  std::vector<int32_t> drawn;
  internal::SetWorkTableNumberSource([&drawn] {
    drawn.push_back(drawn.empty() ? 42 : 43);
    return drawn.back();
  });
  std::string err;
  ASSERT_TRUE(Merge("GRArticle", 1, 2, false, err)) << err;
  EXPECT_EQ(drawn, (std::vector<int32_t>{42, 43}));
  EXPECT_EQ(Rows("42TmpDBalanceStore"), "(1,2,3)");
  EXPECT_EQ(WorkTables(), 1) << "the merge's own work table is dropped";
  EXPECT_EQ(Rows("DBalanceStore", kStockColumns),
            "(39800,2,100,8,1,80,10,8,1)(39800,2,101,7,0,70,0,7,0)(39800,3,100,1,0,10,0,1,0)"
            "(39801,2,101,2,0,20,0,2,0)");
}

// The host's "CountCost" recomputes the cost of the current balances of one article or store.
TEST_P(AggrRecTest, HostCountCostRecomputesCurrentCosts) {
  Sql("UPDATE DCurBalanceStore SET Cost = 999");
  Ref<ParamList> args = conn->Server()->NewParamList();
  args->Set("ID", Variant(int32_t{1}));
  args->Set("Filter", Variant(""));
  Ref<DataObject> articles = conn->Server()->OpenDataObject("GRArticle");
  EXPECT_EQ(articles->CallFunction("CountCost", Variant(args), 0), Variant(true));
  EXPECT_EQ(Rows("DCurBalanceStore", "IDGRArticle, IDDRStore, Cost"), "(1,100,10)(1,101,10)(2,100,999)(3,101,999)");
  args->Set("ID", Variant(int32_t{101}));
  args->Set("Filter", Variant("1"));
  EXPECT_EQ(articles->CallFunction("CountCost", Variant(args), 0), Variant(true));
  EXPECT_EQ(Rows("DCurBalanceStore", "IDGRArticle, IDDRStore, Cost"), "(1,100,10)(1,101,10)(2,100,999)(3,101,4)");
}

INSTANTIATE_TEST_SUITE_P(, AggrRecTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal::server::testing
