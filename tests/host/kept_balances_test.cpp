// The kept current balances follow every write by difference: single writes give the balances a
// server keeps, random sequences of inserts, updates and deletes (relations before their rows,
// rows changing id) keep both kept tables equal to their defining views, and a bulk load rebuilds
// them once.
#include "host/kept_balances.h"

#include <gtest/gtest.h>

#include <random>

#include "balance_check.h"
#include "error_of.h"
#include "host/host_error.h"
#include "host/param_list.h"
#include "host_fixture.h"

namespace xal::host {
namespace {

using testing::BalanceMismatches;
using ::xal::test::ErrorOf;

class KeptBalances : public testing::HostTest {
 protected:
  Database& db() { return conn->db(); }
  void Sql(const std::string& script) { db().ExecScript(script); }
  // "key1/key2:value,value…" for each row of `sql` (two key columns, then the values).
  std::string Keys(const std::string& sql) {
    std::string out;
    for (auto& r : db().Query(sql).rows) {
      out += (out.empty() ? "" : " ") + CStr(r[0]) + "/" + CStr(r[1]) + ":";
      for (size_t i = 2; i < r.size(); ++i) out += (i > 2 ? "," : "") + CStr(r[i]);
    }
    return out;
  }
  // "article/store:Quantity,RQuantity,PQuantity,AmountBase,Cost" per key, in key order.
  std::string Stock() {
    return Keys("SELECT IDGRArticle, IDDRStore, Quantity, RQuantity, PQuantity, AmountBase, Cost "
                "FROM DCurBalanceStore ORDER BY 1, 2");
  }
  // "reservation/store:article,Quantity,RQuantity,PQuantity" per key.
  std::string Reserves() {
    return Keys("SELECT IDDRStockReserve, IDDRStore, IDGRArticle, Quantity, RQuantity, PQuantity "
                "FROM DCurDRStockReserve ORDER BY 1, 2");
  }
};

constexpr const char* kRow = "INSERT INTO DDStoreDRow (ID, IDGRArticle, IDReceiverStore, IDSenderStore, DealState, "
                             "ArticleType, BaseQuantity, Cost) VALUES ";
std::string Rows(const std::string& values) { return kRow + values + ";"; }
std::string Rel(const std::string& values) {
  return "INSERT INTO DRStockReserveRel (IDDRStockReserve, IDDDStoreDRow, Quantity) VALUES " + values + ";";
}

TEST_F(KeptBalances, EachWriteChangesItsKeys) {
  const std::string receipt = Rows("(50, 4, 1, NULL, '', 'G', 2, 4)");
  struct Case {
    const char* name;
    std::string script;
    const char* stock;     // article/store: Quantity, RQuantity, PQuantity, AmountBase, Cost
    const char* reserves;  // reservation/store: article, Quantity, RQuantity, PQuantity
  } cases[] = {
      {"receipt", Rows("(1, 1, 1, NULL, '', 'G', 4, 10)"), "1/1:4,0,0,10,2.5", ""},
      {"issue in state R", Rows("(1, 1, NULL, 1, 'r', 'G', 1, 3)"), "1/1:0,-1,0,-3,3", ""},
      {"pre-reserved receipt", Rows("(1, 1, 1, NULL, 'P', 'G', 2, 8)"), "1/1:0,0,2,0,0", ""},
      {"service", Rows("(1, 1, 1, NULL, '', 's', 2, 8)"), "", ""},
      {"movement", Rows("(1, 2, 1, 2, '', 'G', 3, 6)"), "2/1:3,0,0,6,2 2/2:-3,0,0,-6,2", ""},
      {"update moves the row", receipt + "UPDATE DDStoreDRow SET IDReceiverStore = 2, BaseQuantity = 5;",
       "4/2:5,0,0,4,0.8", ""},
      {"delete empties the key", receipt + Rows("(2, 4, 1, NULL, '', 'G', 1, 1)") + "DELETE FROM DDStoreDRow;", "", ""},
      {"a balance back at zero is zero",
       Rows("(1, 3, 1, NULL, '', 'G', 0.1, 1), (2, 3, 1, NULL, '', 'G', 0.2, 1), (3, 3, NULL, 1, '', 'G', 0.3, 2)"),
       "3/1:0,0,0,0,0", ""},
      {"relation saved before its row", Rel("(5, 50, 2)") + receipt, "4/1:2,0,0,4,2", "5/1:4,2,0,0"},
      {"relation of an issue in state R", Rows("(50, 4, NULL, 2, 'R', 'G', 2, 4)") + Rel("(5, 50, 2)"),
       "4/2:0,-2,0,-4,2", "5/2:4,0,-2,0"},
      {"row state change", receipt + Rel("(5, 50, 2)") + "UPDATE DDStoreDRow SET DealState = 'p';", "4/1:0,0,2,0,0",
       "5/1:4,0,0,2"},
      {"row id change", receipt + Rel("(5, 50, 2), (6, 51, 1)") + "UPDATE DDStoreDRow SET ID = 51;", "4/1:2,0,0,4,2",
       "6/1:4,1,0,0"},
      {"deleting the row deletes its relations", receipt + Rel("(5, 50, 2)") + "DELETE FROM DDStoreDRow;", "", ""},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    Sql("DELETE FROM DRStockReserveRel; DELETE FROM DDStoreDRow;" + c.script);
    EXPECT_EQ(Stock(), c.stock);
    EXPECT_EQ(Reserves(), c.reserves);
    EXPECT_EQ(BalanceMismatches(db()), std::vector<std::string>{});
  }
  // A deleted row's relations went with it.
  EXPECT_EQ(db().Scalar("SELECT count(*) FROM DRStockReserveRel"), Variant(0));
}

// One random write: a store row inserted, changed or deleted, or a relation inserted (also for a
// row that is not stored yet), changed or deleted. Few articles, stores and reservations, so that
// keys fill, empty and fill again.
std::string RandomWrite(std::mt19937& rng) {
  auto pick = [&](std::initializer_list<const char*> v) { return std::string(*(v.begin() + rng() % v.size())); };
  auto id = [&] { return std::to_string(1 + rng() % 30); };
  const std::string store = pick({"NULL", "1", "2", "3"}), state = pick({"''", "''", "'R'", "'P'", "'r'", "'X'"});
  const std::string type = pick({"'G'", "'G'", "'G'", "'S'"}), qty = pick({"0.1", "0.25", "1", "2.5", "3", "0.3", "-1"});
  const std::string cost = pick({"0", "1.15", "2.5", "7.33"}), article = std::to_string(1 + rng() % 3);
  switch (rng() % 8) {
    case 0:
    case 1:
      return "INSERT OR IGNORE" + std::string(kRow).substr(6) + "(" + id() + ", " + article + ", " + store + ", " +
             pick({"NULL", "1", "2", "3"}) + ", " + state + ", " + type + ", " + qty + ", " + cost +
             ")";
    case 2: return "UPDATE DDStoreDRow SET BaseQuantity = " + qty + ", Cost = " + cost + " WHERE ID = " + id();
    case 3:
      return "UPDATE DDStoreDRow SET DealState = " + state + ", IDReceiverStore = " + store + ", ArticleType = " +
             type + ", IDGRArticle = " + article + " WHERE ID = " + id();
    case 4: return "DELETE FROM DDStoreDRow WHERE ID = " + id();
    case 5: return Rel("(" + std::to_string(1 + rng() % 4) + ", " + id() + ", " + qty + ")");
    case 6:
      return "UPDATE DRStockReserveRel SET Quantity = " + qty + ", IDDDStoreDRow = " + id() +
             " WHERE ID = (SELECT min(ID) FROM DRStockReserveRel WHERE ID >= " + id() + ")";
    default:
      return rng() % 4 ? "DELETE FROM DRStockReserveRel WHERE IDDDStoreDRow = " + id()
                       : "UPDATE DDStoreDRow SET ID = " + std::to_string(31 + rng() % 10) + " WHERE ID = " + id() +
                             " AND NOT EXISTS (SELECT 1 FROM DDStoreDRow WHERE ID > 30)";
  }
}

TEST_F(KeptBalances, RandomWriteSequencesKeepBothTablesEqualToTheirViews) {
  for (uint32_t seed = 1; seed <= 12; ++seed) {
    std::mt19937 rng(seed);
    Sql("DELETE FROM DRStockReserveRel; DELETE FROM DDStoreDRow;");
    for (int step = 0; step < 250; ++step) {
      const std::string write = RandomWrite(rng);
      db().Exec(write);
      const auto bad = BalanceMismatches(db());
      ASSERT_EQ(bad, std::vector<std::string>{}) << "seed " << seed << " step " << step << ": " << write;
    }
    // The sequences reach every kind of key, not only empty tables.
    EXPECT_GT(CLng(db().Scalar("SELECT count(*) FROM DCurBalanceStore")), 2) << seed;
  }
}

TEST_F(KeptBalances, BulkLoadRebuildsOnceAndRollsBackWhole) {
  LoadInBulk(*conn, [&](Database& d) {
    d.ExecScript(Rows("(1, 1, 1, NULL, '', 'G', 4, 10), (2, 1, NULL, 1, '', 'G', 1, 2.5)") + Rel("(5, 1, 4)"));
    // No upkeep while loading.
    EXPECT_EQ(d.Scalar("SELECT count(*) FROM DCurBalanceStore"), Variant(0));
  });
  EXPECT_EQ(Stock(), "1/1:3,0,0,7.5,2.5");
  EXPECT_EQ(Reserves(), "5/1:1,4,0,0");
  const int failed = ErrorOf([&] {
    LoadInBulk(*conn, [&](Database& d) {
      d.ExecScript(Rows("(3, 1, 1, NULL, '', 'G', 100, 100)"));
      d.Exec("INSERT INTO NoSuchTable VALUES (1)");
    });
  });
  EXPECT_EQ(failed, kErrSql);
  EXPECT_EQ(db().Scalar("SELECT count(*) FROM DDStoreDRow"), Variant(2));
  // The upkeep is on again after the failure.
  Sql(Rows("(4, 1, 1, NULL, '', 'G', 1, 2.5)"));
  EXPECT_EQ(Stock(), "1/1:4,0,0,10,2.5");
  EXPECT_EQ(BalanceMismatches(db()), std::vector<std::string>{});
  // The rebuild command knows the two key fields only.
  auto params = MakeRef<HostParamList>();
  params->Set("FieldName", Variant("Cost"));
  EXPECT_EQ(ErrorOf([&] { conn->ServerCommand("Update_DCurBalance", params); }), kErrInvalidCall);
}

}  // namespace
}  // namespace xal::host
