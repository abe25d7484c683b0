// Balances, balance dates, penalties, working days and the user's employee. Working days and
// penalties are pure date arithmetic; the rest runs on the SQLite host over both database kinds:
// bank and cash balances summed by the host's "GetBalance" from the balance tables, the last
// balance date before a day (Null when there is none, a Date otherwise), the penalty with a
// payment term, and the employee of the current user.
#include "server/balances.h"

#include <gtest/gtest.h>

#include "runtime/dates.h"
#include "sqlite_host_support.h"

namespace xal::server::testing {
namespace {

Date D(int y, int m, int d) { return DateSerial(y, m, d); }
Date DT(int y, int m, int d, int h) { return Date(DateSerial(y, m, d).serial + h / 24.0); }

// ---------------------------------------------------------------------------------------------
// Working days
// ---------------------------------------------------------------------------------------------

TEST(WDaysTest, WeekdaysBothEndsIncluded) {
  // 2 March 2009 was a Monday.
  ASSERT_EQ(Weekday(D(2009, 3, 2), 2), 1);
  struct Row {
    Date from, to;
    int32_t expected;
    const char* why;
  } rows[] = {
      {D(2009, 3, 2), D(2009, 3, 2), 1, "Monday to the same Monday"},
      {D(2009, 3, 6), D(2009, 3, 11), 4, "Friday to the next Wednesday"},
      {D(2009, 3, 7), D(2009, 3, 15), 5, "Saturday to the Sunday eight days later"},
      {D(2009, 3, 2), D(2009, 3, 6), 5, "one working week"},
      {D(2009, 3, 2), D(2009, 3, 9), 6, "a week and a Monday"},
      {D(2009, 3, 7), D(2009, 3, 8), 0, "a weekend"},
      {D(2009, 3, 8), D(2009, 3, 9), 1, "Sunday to Monday"},
      {D(2009, 1, 1), D(2009, 12, 31), 261, "the year 2009"},
      {D(2009, 2, 27), D(2009, 3, 2), 2, "Friday to Monday across a month end"},
      {DT(2009, 3, 2, 18), DT(2009, 3, 3, 6), 2, "times of day do not matter"},
      {D(2009, 3, 3), D(2009, 3, 2), 0, "last day before the first: the week count rounds down"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    EXPECT_EQ(ComputeWDays(r.from, r.to), r.expected);
  }
}

// ---------------------------------------------------------------------------------------------
// Penalties without a payment term
// ---------------------------------------------------------------------------------------------

TEST(PenaltyTest, DaysLateTimesDailyPercent) {
  struct Row {
    double amount;
    Date paid, due;
    double percent;
    double expected;
    const char* why;
  } rows[] = {
      {1000, D(2009, 3, 15), D(2009, 3, 10), 0.1, 5, "five days late at 0.1 % a day"},
      {1000, D(2009, 3, 10), D(2009, 3, 10), 0.1, 0, "paid on the due date"},
      {1000, D(2009, 3, 9), D(2009, 3, 10), 0.1, 0, "paid before the due date"},
      {1000, DT(2009, 3, 15, 23), D(2009, 3, 10), 0.1, 5, "the time of the payment does not count"},
      {1000, DT(2009, 3, 10, 20), D(2009, 3, 10), 0.1, 0, "later on the due day is not late"},
      {200, D(2009, 3, 12), D(2009, 3, 10), 0.5, 2, "two days at 0.5 %"},
      {-1000, D(2009, 3, 15), D(2009, 3, 10), 0.1, -5, "a credit gives a negative penalty"},
      {0, D(2009, 3, 15), D(2009, 3, 10), 0.1, 0, "no amount"},
      {1000, Date(), D(2009, 3, 10), 0.1, 0, "no payment date"},
      {1000, D(2009, 3, 15), Date(), 0.1, 0, "no due date"},
      {1000, D(2009, 3, 15), D(2009, 3, 10), 0, 0, "no percent"},
      {1000, D(2010, 3, 10), D(2009, 3, 10), 0.05, 182.5, "a year late"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    EXPECT_DOUBLE_EQ(ComputePenalty(r.amount, r.paid, r.due, r.percent), r.expected);
  }
}

TEST(PenaltyTest, WithoutConnectionThePaymentTermIsIgnored) {
  EXPECT_DOUBLE_EQ(ComputePenalty(1000, D(2009, 3, 15), D(2009, 3, 10), 0.1, 4, nullptr), 5);
}

// ---------------------------------------------------------------------------------------------
// On the host
// ---------------------------------------------------------------------------------------------

class BalanceTest : public SqliteHostTest {
 protected:
  void SetUp() override {
    SqliteHostTest::SetUp();
    // Account 1: +100.25 on 1 March, -30.10 on 5 March, +5 on 10 March (in two currency rows);
    // account 2: +999 on 1 March; account 3 exists without rows. Cash desks alike.
    const std::string rows =
        " (1, " + Day(2009, 3, 1) + ", 1, 1, 100.25, 0), (2, " + Day(2009, 3, 5) + ", 1, 1, 0, 30.1),"
        " (3, " + Day(2009, 3, 10) + ", 1, 1, 3, 0), (4, " + Day(2009, 3, 10) + ", 1, 2, 2, 0),"
        " (5, " + Day(2009, 3, 1) + ", 2, 1, 999, 0);";
    Sql("INSERT INTO GRBankAccount (ID, Code) VALUES (1, 'B1'), (2, 'B2'), (3, 'B3');"
        "INSERT INTO VRCashDesk (ID, Code) VALUES (1, 'K1'), (2, 'K2'), (3, 'K3');"
        "INSERT INTO VBalanceBank (ID, DocDate, IDGRBankAccount, IDGRCurrency, DebitFlow, CreditFlow) VALUES" + rows +
        "INSERT INTO VBalanceCash (ID, DocDate, IDVRCashDesk, IDGRCurrency, DebitFlow, CreditFlow) VALUES" + rows);
  }
  static std::string Day(int y, int m, int d) { return std::to_string(static_cast<int>(D(y, m, d).serial)); }
};

struct BalanceRow {
  int32_t account;
  Date date;
  Currency expected;
  const char* why;
};

const BalanceRow kBalanceRows[] = {
    {1, D(2009, 2, 28), Currency(), "before the first flow"},
    {1, D(2009, 3, 1), Currency::FromRaw(1002500), "the day of a flow counts"},
    {1, D(2009, 3, 4), Currency::FromRaw(1002500), "between flows"},
    {1, D(2009, 3, 5), Currency::FromRaw(701500), "after a credit"},
    {1, DT(2009, 3, 5, 15), Currency::FromRaw(701500), "the time of day does not count"},
    {1, D(2009, 3, 10), Currency::FromRaw(751500), "both currency rows of the day"},
    {1, D(2030, 1, 1), Currency::FromRaw(751500), "long after"},
    {2, D(2009, 3, 31), Currency::FromInt(999), "another account"},
    {3, D(2009, 3, 31), Currency(), "an account without flows"},
    {7, D(2009, 3, 31), Currency(), "no such account: GetBalance answers False"},
};

TEST_P(BalanceTest, BankBalanceFromTheBalanceRows) {
  for (const auto& r : kBalanceRows) {
    SCOPED_TRACE(r.why);
    EXPECT_EQ(CountBankBalance(conn, r.account, r.date), r.expected);
  }
}

TEST_P(BalanceTest, CashBalanceFromTheBalanceRows) {
  for (const auto& r : kBalanceRows) {
    SCOPED_TRACE(r.why);
    EXPECT_EQ(CountCashBalance(conn, r.account, r.date), r.expected);
  }
}

TEST_P(BalanceTest, BankAndCashAreKeptApart) {
  Sql("UPDATE VBalanceCash SET DebitFlow = DebitFlow * 2 WHERE IDVRCashDesk = 2");
  EXPECT_EQ(CountBankBalance(conn, 2, D(2009, 3, 31)), Currency::FromInt(999));
  EXPECT_EQ(CountCashBalance(conn, 2, D(2009, 3, 31)), Currency::FromInt(1998));
}

TEST_P(BalanceTest, GetBalancePositionsOnItsRow) {
  Ref<DataObject> ob = conn->Server()->OpenDataObject("VBalanceBank");
  Ref<ParamList> params = conn->Server()->NewParamList();
  params->Set("Date", Variant(D(2009, 3, 5)));
  params->Set("IDGRBankAccount", Variant(int32_t{1}));
  EXPECT_EQ(ob->CallFunction("GetBalance", Variant(params), 0), Variant(true));
  ASSERT_FALSE(ob->IsEOF());
  EXPECT_EQ(ob->RowCount(), 1);
  const Variant balance = ob->Field("Balance");
  ASSERT_EQ(balance.Type(), VarType::Currency);
  EXPECT_EQ(balance.AsCurrency(), Currency::FromRaw(701500));
  EXPECT_EQ(ob->Field("DocDate"), Variant(D(2009, 3, 5)));
  EXPECT_EQ(CLng(ob->Field("IDGRBankAccount")), 1);

  // A missing account leaves the data object as it was.
  params->Set("IDGRBankAccount", Variant(int32_t{9}));
  EXPECT_EQ(ob->CallFunction("GetBalance", Variant(params), 0), Variant(false));
  EXPECT_EQ(ob->Field("Balance").AsCurrency(), Currency::FromRaw(701500));
}

TEST_P(BalanceTest, GetBalanceOnlyOnBalanceTables) {
  Ref<DataObject> ob = conn->Server()->OpenDataObject("GRBankAccount");
  Ref<ParamList> params = conn->Server()->NewParamList();
  params->Set("IDGRBankAccount", Variant(int32_t{1}));
  EXPECT_THROW(ob->CallFunction("GetBalance", Variant(params), 0), VbError);
}

TEST_P(BalanceTest, BalanceDateIsTheLastDayBefore) {
  struct Row {
    const char* table;
    Date before;
    Variant expected;
    const char* why;
  } rows[] = {
      {"VBalanceBank", D(2009, 3, 10), Variant(D(2009, 3, 5)), "the day itself is not before"},
      {"VBalanceBank", D(2009, 3, 11), Variant(D(2009, 3, 10)), "the latest row"},
      {"VBalanceCash", D(2009, 3, 2), Variant(D(2009, 3, 1)), "the first row"},
      {"VBalanceBank", D(2009, 3, 1), Variant::Null(), "no earlier row"},
      {"DBalanceStore", D(2009, 3, 31), Variant::Null(), "an empty table"},
      {"NoSuchBalance", D(2009, 3, 31), Variant(), "an error gives Empty"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    const Variant v = GetBalanceDate(conn, r.before, r.table);
    EXPECT_EQ(v.Type(), r.expected.Type());
    if (r.expected.Type() == VarType::Date) {
      EXPECT_EQ(v.AsDate(), r.expected.AsDate());
    }
  }
}

TEST_P(BalanceTest, PenaltyWithPaymentTermIsZero) {
  Sql("INSERT INTO GRTermPayment (ID, Code, PromptTime, PenaltyPercent) VALUES (4, 'T14', 14, 0.1)");
  EXPECT_DOUBLE_EQ(ComputePenalty(1000, D(2009, 3, 15), D(2009, 3, 10), 0.1, 4, conn), 0);
  EXPECT_DOUBLE_EQ(ComputePenalty(1000, D(2009, 3, 15), D(2009, 3, 10), 0.1, 99, conn), 0);
  // Without a payment term the connection changes nothing.
  EXPECT_DOUBLE_EQ(ComputePenalty(1000, D(2009, 3, 15), D(2009, 3, 10), 0.1, 0, conn), 5);
}

TEST_P(BalanceTest, EmployeeOfTheCurrentUser) {
  Sql("INSERT INTO XALUser (ID, Code, IDEREmployee) VALUES (1, 'U1', 42), (2, 'U2', 0), (3, 'U3', 43)");
  struct Row {
    int32_t user;
    int32_t expected;
    const char* why;
  } rows[] = {
      {1, 42, "a user with an employee"},
      {3, 43, "another user"},
      {2, 0, "a user without an employee"},
      {9, 0, "no such user"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    conn->SetUserID(r.user);
    EXPECT_EQ(GetEmployeeID(conn), r.expected);
  }
}

TEST_P(BalanceTest, FailingHostCallsReachTheCaller) {
  EXPECT_THROW(CountBankBalance(nullptr, 1, D(2009, 3, 1)), VbError);
  EXPECT_THROW(GetEmployeeID(nullptr), VbError);
  EXPECT_EQ(GetBalanceDate(nullptr, D(2009, 3, 1), "VBalanceBank").Type(), VarType::Empty);
}

INSTANTIATE_TEST_SUITE_P(, BalanceTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal::server::testing
