// The capital-asset balance replayed from document rows, against figures worked out by hand:
// a receipt, a rebuilding, a move and monthly straight-line depreciation over a year boundary,
// accounting years, a partial consumption, a hand-entered write-down, and the balance before a row.
#include "server/ca_balance.h"

#include <gtest/gtest.h>

#include "../host/host_fixture.h"
#include "runtime/dates.h"

namespace xal::server {
namespace {

class CABalanceTest : public host::testing::HostTest {
 protected:
  // Asset 7: received 2009-10-15 for 12000 (6000 in the reference currency) at 20 % a year,
  // rebuilt 2010-01-20 for 2400 (1200), moved 2010-02-10.
  void SetUp() override {
    HostTest::SetUp();
    AddRow(1, "CDReceipts", Date(DateSerial(2009, 10, 15)), 12000, 6000, 20, 1);
    AddRow(2, "CDRebuilding", Date(DateSerial(2010, 1, 20)), 2400, 1200, 0, 0);
    AddRow(3, "CDMovement", Date(DateSerial(2010, 2, 10)), 0, 0, 0, 0);
  }
  void AddRow(int id, const char* kind, Date date, double basic, double basicRef, double rate, double qty) {
    conn->db().Exec(
        "INSERT INTO CADocRow (ID, IDCRCapitalAssets, DocName, DocDate, BasicCost, BasicCostRef, DepreciationRate, "
        "Quantity) VALUES (?, 7, ?, ?, ?, ?, ?, ?)",
        {Variant(id), Variant(kind), Variant(date), Variant(basic), Variant(basicRef), Variant(rate), Variant(qty)});
  }
  CABalance At(Date date, int32_t row = 0) {
    CABalance b;
    EXPECT_TRUE(CountCABalance(conn, 7, row, date, b));
    return b;
  }
  static Currency C(double x) { return Currency::FromDouble(x); }
};

TEST_F(CABalanceTest, DepreciatesMonthByMonthOverAYearBoundary) {
  // Nov, Dec 2009: 200 each; Jan, Feb, Mar 2010: 240 each (14400 × 20 / 1200).
  CABalance b = At(DateSerial(2010, 4, 15));
  EXPECT_EQ(b.basicCost, C(14400));
  EXPECT_EQ(b.basicCostRef, C(7200));
  EXPECT_EQ(b.depreciatedCost, C(14400 - 400 - 720));
  EXPECT_EQ(b.depreciatedCostRef, C(7200 - 200 - 360));
  EXPECT_EQ(b.depreciationAmount, C(720));  // only the calendar year 2010
  EXPECT_EQ(b.depreciationAmountRef, C(360));
  EXPECT_EQ(b.depreciationRate, 20.0);
  EXPECT_EQ(b.quantity, 1.0);
  EXPECT_EQ(b.idCALastRegRow, 3);
}

TEST_F(CABalanceTest, AccountingYearDecidesTheYearsDepreciation) {
  conn->db().Exec("INSERT INTO BRAccountingYear (BeginDate, EndDate) VALUES (?, ?)",
                  {Variant(DateSerial(2009, 7, 1)), Variant(DateSerial(2010, 6, 30))});
  CABalance b = At(DateSerial(2010, 4, 15));
  EXPECT_EQ(b.depreciationAmount, C(400 + 720));
}

TEST_F(CABalanceTest, NoMonthChargedBeforeItEnds) {
  CABalance b = At(DateSerial(2009, 11, 30));  // November has not ended before its last day
  EXPECT_EQ(b.depreciatedCost, C(12000));
  b = At(DateSerial(2009, 12, 1));
  EXPECT_EQ(b.depreciatedCost, C(11800));
  EXPECT_EQ(b.idCALastRegRow, 1);
}

TEST_F(CABalanceTest, BalanceBeforeARow) {
  // The rebuilding row sees the asset as it was on 2010-01-20: two months charged.
  CABalance b = At(Date(), 2);
  EXPECT_EQ(b.basicCost, C(12000));
  EXPECT_EQ(b.depreciatedCost, C(11600));
  EXPECT_EQ(b.idCALastRegRow, 1);
}

TEST_F(CABalanceTest, ConsumptionAndWriteDown) {
  conn->db().Exec("UPDATE CADocRow SET Quantity = 4 WHERE ID = 1");
  AddRow(4, "CDConsumption", Date(DateSerial(2010, 4, 20)), 0, 0, 0, 1);  // a quarter leaves
  conn->db().Exec(
      "INSERT INTO CADocRow (ID, IDCRCapitalAssets, DocName, DocDate, DepreciationAmount, DepreciationAmountRef) "
      "VALUES (5, 7, 'CDAmortizing', ?, 100, 50)",
      {Variant(DateSerial(2010, 4, 25))});
  CABalance b = At(DateSerial(2010, 4, 30));
  // Before the consumption: basic 14400, residual 13280 (ref 7200 / 6640); a quarter leaves.
  EXPECT_EQ(b.quantity, 3.0);
  EXPECT_EQ(b.basicCost, C(10800));
  EXPECT_EQ(b.depreciatedCost, C(13280 - 3320 - 100));
  EXPECT_EQ(b.depreciatedCostRef, C(6640 - 1660 - 50));
  EXPECT_EQ(b.depreciationAmount, C(720 + 100));
}

TEST_F(CABalanceTest, NeverBelowZeroAndUnknownAssets) {
  conn->db().Exec("UPDATE CADocRow SET DepreciationRate = 600 WHERE ID = 1");  // 50 % a month
  CABalance b = At(DateSerial(2012, 1, 1));
  EXPECT_EQ(b.depreciatedCost, Currency());
  CABalance none;
  EXPECT_TRUE(CountCABalance(conn, 99, 0, DateSerial(2010, 1, 1), none));
  EXPECT_EQ(none.basicCost, Currency());
}

}  // namespace
}  // namespace xal::server
