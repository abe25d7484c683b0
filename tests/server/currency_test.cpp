// Currency rates and conversion over the reference host, in both database kinds: fixed and dated
// rates (exactly that day, no earlier one), triangulation, the base-currency second amount, the
// rounding of ConvertWithRates and the division by zero of a missing base rate; and the SQL sent.
#include "server/currency.h"

#include <gtest/gtest.h>

#include "recording_connection.h"
#include "runtime/dates.h"
#include "runtime/error.h"

namespace xal::server {
namespace {

using sqllog::KindName;
using sqllog::DialectDbTest;

Currency Cur(double v) { return Currency::FromDouble(v); }
Date D(int y, int m, int d) { return DateSerial(y, m, d); }
std::string Serial(int y, int m, int d) { return std::to_string(static_cast<int>(D(y, m, d).serial)); }

// Currencies: 1 no dated rates (a stray GRCurValue row must be ignored), 2 dated rates, 3 a
// triangulation currency, 4 a zero rate, 5 the base currency with a dated rate, 6 a third.
class CurrencyTest : public DialectDbTest {
 protected:
  void SetUp() override {
    DialectDbTest::SetUp();
    Exec("INSERT INTO GRCurrency (ID, Code, FixedRate, DivThreshold, IsTriangulation) VALUES"
         " (1, 'EEK', 1, 0, 0), (2, 'USD', 0.9, 1, 0), (3, 'LVL', 1.42, 0, -1), (4, 'ZZZ', 0, 0, 0),"
         " (5, 'EUR', 2, 1, 0), (6, 'THR', 0.3333333333333333, 0, 0);"
         "INSERT INTO GRCurValue (IDGRCurrency, ChangeDate, ConversionRate) VALUES"
         " (1, " + Serial(2009, 3, 5) + ", 7),"
         " (2, " + Serial(2009, 3, 4) + ", 0.7),"
         " (2, " + Serial(2009, 3, 5) + ", 0.8),"
         " (2, 0, 0.5),"
         " (5, " + Serial(2009, 3, 5) + ", 2.5);");
    host->SetSetting("GRCurrency", "BaseCurrency", Variant(int32_t{5}));
  }
};

TEST_P(CurrencyTest, CurRate) {
  struct Row {
    int32_t currency;
    Date date;
    double expected;
  } rows[] = {
      {1, Date(), 1.0},
      {1, D(2009, 3, 5), 1.0},  // no dated rates: its GRCurValue row is not read
      {2, D(2009, 3, 5), 0.8},
      {2, Date(D(2009, 3, 5).serial + 0.6), 0.8},  // the time of day does not matter
      {2, D(2009, 3, 6), 0.9},  // no rate that day: the fixed rate, not the 3/5 one
      {2, Date(), 0.9},         // no date: the fixed rate, though a row dated 0 exists
      {3, D(2009, 3, 5), 1.42},
      {99, D(2009, 3, 5), 0.0},  // no such currency
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << "currency " << r.currency << " date " << r.date.serial);
    EXPECT_DOUBLE_EQ(CurRate(conn, r.currency, r.date), r.expected);
  }
}

TEST_P(CurrencyTest, CurRateSql) {
  conn->Clear();
  CurRate(conn, 2, Date(D(2009, 3, 5).serial + 0.25));
  CurRate(conn, 2, Date());
  CurRate(conn, 1, D(2009, 3, 5));
  const std::vector<std::string> expected = {
      "SELECT DivThreshold, FixedRate FROM GRCurrency WHERE ID = 2",
      "SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency = 2 AND ChangeDate = #3/5/2009#",
      "SELECT DivThreshold, FixedRate FROM GRCurrency WHERE ID = 2",
      "SELECT DivThreshold, FixedRate FROM GRCurrency WHERE ID = 1",
  };
  EXPECT_EQ(conn->Sql(), expected);
  EXPECT_EQ(conn->Modes(), std::vector<int32_t>(4, 1));
}

TEST(CurrencyConvertWithRates, Table) {
  struct Row {
    double amount, rate1, rate2;
    bool refAmount, triangulation;
    double expected;
  } rows[] = {
      {10, 0, 0, false, false, 10.00},  // rate 0 is taken as 1
      {100, 15.6466, 0, false, false, 1564.66},
      {100, 3, 0, true, true, 300},  // no second rate: the flags do not matter
      {100, 2, 4, false, true, 200},
      {100, 2, 4, true, true, 50},
      {100, 0, 4, false, true, 400},  // triangulation with a rate of 0 divides by 1
      {100, 2, 4, false, false, 200},
      {100, 3, 0.5, true, false, 600},
      {0.125, 1, 0, false, false, 0.13},    // cents half away from zero
      {-0.125, 1, 0, false, false, -0.13},
      {1.005, 1, 0, false, false, 1.01},    // the amount's exact digits, not its binary value
      {1, 0.12499999, 0, false, false, 0.13},  // four decimals first: 0.1250, then cents
      {1, 0.12449999, 0, false, false, 0.12},
      {10, 1.0 / 3, 0, false, false, 3.33},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << r.amount << " " << r.rate1 << " " << r.rate2 << " " << r.refAmount << " "
                                      << r.triangulation);
    EXPECT_EQ(ConvertWithRates(Cur(r.amount), r.rate1, r.rate2, r.refAmount, r.triangulation), Cur(r.expected));
  }
}

TEST_P(CurrencyTest, Convert) {
  struct Row {
    int32_t currency;
    Date date;
    double amount;
    double expected, expectedRef;
  } rows[] = {
      {2, D(2009, 3, 5), 100, 80, 32},       // dated 0.8; base 2.5 that day
      {2, D(2009, 3, 6), 100, 90, 45},       // fixed 0.9; base fixed 2
      {3, D(2009, 3, 5), 100, 56.8, 142},    // triangulation: the base amount first
      {3, D(2009, 3, 6), 100, 71, 142},
      {2, Date(), 100, 50, 25},              // a zero date finds the row dated 0; the base rate is fixed
      {6, D(2009, 3, 6), 1, 0.3333, 0.1667},  // four decimals, no rounding to cents
      {99, D(2009, 3, 5), 12.34, 12.34, 12.34},  // no such currency: the amount in both
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(::testing::Message() << "currency " << r.currency << " date " << r.date.serial);
    Currency ref = Cur(-1);
    EXPECT_EQ(Convert(conn, r.currency, r.date, Cur(r.amount), ref), Cur(r.expected));
    EXPECT_EQ(ref, Cur(r.expectedRef));
  }
}

TEST_P(CurrencyTest, ConvertSql) {
  Currency ref;
  conn->Clear();
  Convert(conn, 2, D(2009, 3, 5), Cur(100), ref);
  const std::vector<std::string> expected = {
      "SELECT IsTriangulation, DivThreshold, FixedRate FROM GRCurrency WHERE ID=2",
      "SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency=2 AND ChangeDate=#3/5/2009#",
      "SELECT DivThreshold, FixedRate FROM GRCurrency WHERE ID = 5",
      "SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency = 5 AND ChangeDate = #3/5/2009#",
  };
  EXPECT_EQ(conn->Sql(), expected);
  EXPECT_EQ(conn->SettingReads(), std::vector<std::string>{"GRCurrency/BaseCurrency"});
  // A currency without dated rates reads no GRCurValue row.
  conn->Clear();
  Convert(conn, 3, D(2009, 3, 5), Cur(100), ref);
  ASSERT_EQ(conn->Sql().size(), 3u);
  EXPECT_EQ(conn->Sql()[0], "SELECT IsTriangulation, DivThreshold, FixedRate FROM GRCurrency WHERE ID=3");
}

TEST_P(CurrencyTest, MissingBaseRateDividesByZero) {
  struct Row {
    const char* baseCurrency;  // the setting's text; empty: not set
  } rows[] = {
      {"4"},   // a base currency whose rate is 0
      {"77"},  // a base currency that does not exist
      {""},    // no base currency at all
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.baseCurrency);
    if (*r.baseCurrency)
      host->SetSetting("GRCurrency", "BaseCurrency", Variant(r.baseCurrency));
    else
      Exec("DELETE FROM XALUserOption WHERE Category = 'GRCurrency'");
    Currency ref = Cur(-1);
    int error = 0;
    try {
      Convert(conn, 2, D(2009, 3, 5), Cur(100), ref);
    } catch (const VbError& e) {
      error = e.number();
    }
    EXPECT_EQ(error, kErrDivByZero);
    EXPECT_EQ(ref, Cur(100));  // set to the amount before the failure
  }
}

INSTANTIATE_TEST_SUITE_P(, CurrencyTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal::server
