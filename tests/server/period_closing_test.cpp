// Period closing through ServerFunctions.Execute on the SQLite host, on both database kinds:
// certification asked and answered, reserved documents, the accounting's fixed date, the Booking
// cascade and its first refusal, settings written only by a closing that succeeds, the closing
// texts in both languages, and the balance tables the host rebuilds when stores and bank close.
#include <gtest/gtest.h>

#include "server/module_state.h"
#include "server/server_functions.h"
#include "server/stock.h"
#include "sqlite_host_support.h"

namespace xal::server::testing {
namespace {

constexpr int32_t kYes = 6;
constexpr int32_t kNo = 7;
const Date kCloseDate = DateSerial(2009, 3, 5);  // 39877

class ClosePeriodTest : public SqliteHostTest {
 protected:
  // Runs Execute(name) with the connection, the system, the date and the scripted callback.
  Variant Close(const std::string& system, Date date = kCloseDate, const std::string& name = "ClosePeriod") {
    params = conn->Server()->NewParamList();
    params->SetObject("XALConnect", conn);
    params->Set("SystemName", Variant(system));
    params->Set("CloseDate", Variant(date));
    params->SetObject("CallBack", callback);
    auto functions = MakeRef<ServerFunctions>();
    return functions->Execute(name, params);
  }
  std::string Fixed(const std::string& system) { return CStr(conn->Setting("DateFixed", system, Variant("unset"))); }
  std::string Certified() { return Rows("GDocument", "ID, IsCertified"); }

  // Store documents before the date (one with a time of day), one on the date, a sales document,
  // and a certified consignment.
  void StoreDocuments() {
    Sql("INSERT INTO GDocument (ID, RefType, DocName, DealDate, IsCertified) VALUES"
        " (1, 'DDMovement', 'DDMovement', 39870, 0), (2, 'PDReceiptD', 'PDReceiptD', 39876.5, 0),"
        " (3, 'PDReceiptD', 'PDReceiptD', 39877, 0), (4, 'SDInvoice', 'SDInvoice', 39870, 0),"
        " (5, 'SDConsignmD', 'SDConsignmD', 39860, -1);"
        "INSERT INTO DBalanceStore (DocDate, IDGRArticle, IDDRStore, DebitQFlow) VALUES (39000, 5, 100, 99);");
  }

  Ref<ParamList> params;
};

TEST_P(ClosePeriodTest, CertificationAnsweredYesClosesTheStore) {
  StoreDocuments();
  user->answers = {kYes};
  EXPECT_EQ(Close("store", Date(39877.75)), Variant(true));  // the system name in any case; a time of day
  EXPECT_EQ(user->transcript,
            "MsgBox(77,\"Some store documents before 3/5/2009 6:00:00 PM are not certified. Certify?\",36)->6; "
            "Notify(2,4); Notify(4); Notify(4); Notify(4); Notify(4)");
  EXPECT_EQ(Certified(), "(1,True)(2,True)(3,False)(4,False)(5,True)");
  EXPECT_EQ(Fixed("Store"), "39877");  // whole days
  EXPECT_EQ(Rows("DBalanceStore", "IDGRArticle"), "");  // rebuilt: no store rows before the date
  EXPECT_FALSE(CurrentCallback()) << "Execute clears the callback it installed";
}

TEST_P(ClosePeriodTest, CertificationAnsweredNoChangesNothing) {
  StoreDocuments();
  const std::string before = Dump({"GDocument", "DBalanceStore", "XALUserOption"});
  user->answers = {kNo};
  EXPECT_EQ(Close("Store"), Variant(false));
  EXPECT_EQ(user->transcript, "MsgBox(77,\"Some store documents before 3/5/2009 are not certified. Certify?\",36)->7");
  EXPECT_EQ(Dump({"GDocument", "DBalanceStore", "XALUserOption"}), before);
}

TEST_P(ClosePeriodTest, ReservedDocumentsBlockEvenWhenTheUserWouldCertify) {
  StoreDocuments();
  Sql("UPDATE GDocument SET DealState = 'R' WHERE ID = 2");
  const std::string before = Dump({"GDocument", "DBalanceStore", "XALUserOption"});
  user->answers = {kYes, kYes};
  EXPECT_EQ(Close("Store"), Variant(false));
  EXPECT_EQ(user->transcript, "MsgBox(77,\"There are reserved documents in this period!\",48)->6");
  EXPECT_EQ(Dump({"GDocument", "DBalanceStore", "XALUserOption"}), before);
}

TEST_P(ClosePeriodTest, BeforeTheAccountingsFixedDateNothingIsDone) {
  StoreDocuments();
  conn->SetSetting("DateFixed", "Booking", Variant(int32_t{39900}));
  const std::string before = Dump({"GDocument", "DBalanceStore", "XALUserOption"});
  EXPECT_EQ(Close("Store"), Variant(true));
  EXPECT_EQ(user->transcript, "");
  EXPECT_EQ(Dump({"GDocument", "DBalanceStore", "XALUserOption"}), before);
}

TEST_P(ClosePeriodTest, NothingToCertifyAsksNothing) {
  StoreDocuments();
  EXPECT_EQ(Close("Wages"), Variant(true));
  EXPECT_EQ(user->transcript, "Notify(2,3); Notify(4); Notify(4); Notify(4)");
  EXPECT_EQ(Fixed("Wages"), "39877");
  EXPECT_EQ(Certified(), "(1,False)(2,False)(3,False)(4,False)(5,True)");
  EXPECT_EQ(Rows("DBalanceStore", "IDGRArticle"), "(5)") << "only closing the store rebuilds its balances";
}

TEST_P(ClosePeriodTest, UnknownSystemOrOperation) {
  StoreDocuments();
  const std::string before = Dump({"GDocument", "DBalanceStore", "XALUserOption"});
  EXPECT_EQ(Close("Inventory"), Variant(false));
  EXPECT_TRUE(Close("Store", kCloseDate, "ClosePeriods").IsEmpty());
  EXPECT_EQ(user->transcript, "");
  EXPECT_EQ(Dump({"GDocument", "DBalanceStore", "XALUserOption"}), before);
  EXPECT_FALSE(CurrentCallback());
}

TEST_P(ClosePeriodTest, ClosingTextsInTheConnectionsLanguage) {
  struct Row {
    int32_t lang;
    const char* system;
    const char* prompt;
  } rows[] = {
      {3, "Sales", "Some sales documents before 3/5/2009 are not certified. Certify?"},
      {4, "Sales", "Osa müügi dokumente enne 3/5/2009 ei ole kinnitatud. Kas kinnitada?"},
      {4, "Purchase", "Osa ostu dokumente enne 3/5/2009 ei ole kinnitatud. Kas kinnitada?"},
      {5, "Purchase", "Some purchase documents before 3/5/2009 are not certified. Certify?"},
      {9, "Bank", "Some bank documents before 3/5/2009 are not certified. Certify?"},  // unknown: English
      {4, "Bank", "Osa panga dokumente enne 3/5/2009 ei ole kinnitatud. Kas kinnitada?"},
      {4, "CapitalAssets", "Osa põhivara dokumente enne 3/5/2009 ei ole kinnitatud. Kas kinnitada?"},
      {3, "BookingOrder", "Some accountancy documents before 3/5/2009 are not certified. Certify?"},
      {4, "Wages", "Osa palga dokumente enne 3/5/2009 ei ole kinnitatud. Kas kinnitada?"},
      {4, "Store", "Osa lao dokumente enne 3/5/2009 ei ole kinnitatud. Kas kinnitada?"},
  };
  Sql("INSERT INTO GDocument (RefType, DealDate) VALUES ('SDOrder', 39870), ('PDInvoice', 39870),"
      " ('VDVoucher', 39870), ('CADocument', 39870), ('BDBookingO', 39870), ('WDocument', 39870),"
      " ('SDConsignmD', 39870)");
  for (const auto& r : rows) {
    SCOPED_TRACE(std::to_string(r.lang) + " " + r.system);
    conn->SetLanguage(r.lang);
    user->transcript.clear();
    user->answers = {kNo};
    EXPECT_EQ(Close(r.system), Variant(false));
    EXPECT_EQ(user->transcript, "MsgBox(77,\"" + std::string(r.prompt) + "\",36)->7");
  }
  conn->SetLanguage(4);
  user->transcript.clear();
  Sql("UPDATE GDocument SET DealState = 'R' WHERE RefType = 'SDOrder'");
  EXPECT_EQ(Close("Sales"), Variant(false));
  EXPECT_EQ(user->transcript, "MsgBox(77,\"Perioodis on reserveeringu dokumente!\",48)->0");
}

// Closing the accounting closes, in order, every subsystem fixed before the date (never-closed
// ones included), then certifies the bookings; the booking question names no subsystem. Each
// subsystem closed has a document to certify, so the questions show the order.
TEST_P(ClosePeriodTest, BookingCascadesInOrder) {
  conn->SetSetting("DateFixed", "Store", Variant(int32_t{39800}));
  conn->SetSetting("DateFixed", "Bank", Variant(int32_t{39900}));  // closed beyond the date: skipped
  conn->SetSetting("DateFixed", "Sales", Variant(int32_t{39877}));  // closed to the date: skipped
  conn->SetSetting("DateFixed", "CapitalAssets", Variant(int32_t{39000}));
  Sql("INSERT INTO GDocument (ID, RefType, DealDate) VALUES (1, 'WDocument', 39870), (2, 'BDBookingO', 39870),"
      " (3, 'CADocument', 39870), (4, 'SDInvoice', 39870), (5, 'PDInvoice', 39870), (6, 'VDVoucher', 39870),"
      " (7, 'DDMovement', 39870);"
      "INSERT INTO BBooking (ID, IsCertified, DealDate) VALUES (1, 0, 39870), (2, 0, 39877), (3, -1, 39800);");
  user->answers = {kYes, kYes, kYes, kYes, kYes, kYes};
  EXPECT_EQ(Close("Booking"), Variant(true));
  auto closed = [](const std::string& name) {
    return "MsgBox(77,\"Some " + name + " documents before 3/5/2009 are not certified. Certify?\",36)->6; " +
           "Notify(2,4); Notify(4); Notify(4); Notify(4); Notify(4); ";
  };
  EXPECT_EQ(user->transcript, closed("store") + closed("purchase") + closed("capital assets") + closed("accountancy") +
                                  closed("wages") +
                                  "MsgBox(77,\"Some  bookings before 3/5/2009 are not certified. Certify?\",36)->6; Notify(4)");
  for (const char* system : {"Store", "Purchase", "Sales", "CapitalAssets", "BookingOrder", "Wages", "Booking"}) {
    SCOPED_TRACE(system);
    EXPECT_EQ(Fixed(system), "39877");
  }
  EXPECT_EQ(Fixed("Bank"), "39900");
  EXPECT_EQ(Certified(), "(1,True)(2,True)(3,True)(4,False)(5,True)(6,False)(7,True)");
  EXPECT_EQ(Rows("BBooking", "ID, IsCertified"), "(1,True)(2,False)(3,True)");
}

TEST_P(ClosePeriodTest, BookingStopsAtTheFirstRefusal) {
  conn->SetSetting("DateFixed", "CapitalAssets", Variant(int32_t{39000}));
  Sql("INSERT INTO GDocument (ID, RefType, DealDate) VALUES (1, 'PDInvoice', 39870), (2, 'SDInvoice', 39870),"
      " (3, 'VDVoucher', 39870);"
      "INSERT INTO BBooking (ID, IsCertified, DealDate) VALUES (1, 0, 39870);");
  user->answers = {kYes, kNo, kYes, kYes};
  EXPECT_EQ(Close("Booking"), Variant(false));
  EXPECT_EQ(user->transcript,
            "Notify(2,3); Notify(4); Notify(4); Notify(4); "  // Store, closed before the refusal
            "MsgBox(77,\"Some bank documents before 3/5/2009 are not certified. Certify?\",36)->6; "
            "Notify(2,4); Notify(4); Notify(4); Notify(4); Notify(4); "  // Bank, likewise
            "MsgBox(77,\"Some purchase documents before 3/5/2009 are not certified. Certify?\",36)->7");
  EXPECT_EQ(Fixed("Store"), "39877") << "a subsystem closed earlier in the cascade stays closed";
  EXPECT_EQ(Fixed("Bank"), "39877");
  EXPECT_EQ(Fixed("Purchase"), "unset");
  EXPECT_EQ(Fixed("Sales"), "unset");
  EXPECT_EQ(Fixed("CapitalAssets"), "39000");
  EXPECT_EQ(Fixed("Booking"), "unset");
  EXPECT_EQ(Certified(), "(1,False)(2,False)(3,True)");
  EXPECT_EQ(Rows("BBooking", "ID, IsCertified"), "(1,False)");
}

TEST_P(ClosePeriodTest, RefusedBookingsLeaveTheAccountingOpen) {
  Sql("INSERT INTO BBooking (ID, IsCertified, DealDate) VALUES (1, 0, 39870);");
  for (const char* system : {"Store", "Bank", "Purchase", "Sales", "CapitalAssets", "BookingOrder", "Wages"})
    conn->SetSetting("DateFixed", system, Variant(int32_t{39877}));
  conn->SetLanguage(4);
  user->answers = {kNo};
  EXPECT_EQ(Close("BOOKING"), Variant(false));
  EXPECT_EQ(user->transcript, "MsgBox(77,\"Osa  konteeringuid enne 3/5/2009 ei ole kinnitatud. Kas kinnitada?\",36)->7");
  EXPECT_EQ(Fixed("Booking"), "unset");
  EXPECT_EQ(Rows("BBooking", "ID, IsCertified"), "(1,False)");
}

// A closing that fails after the user said Yes (here: the balance rebuild) leaves the period open
// and the documents as they were.
TEST_P(ClosePeriodTest, FailingBalanceRebuildChangesNothing) {
  StoreDocuments();
  Sql("INSERT INTO DDStoreDRow (IDGRArticle, IDReceiverStore, DocDate, BaseQuantity) VALUES (1, 100, 39870, 1);"
      "CREATE TRIGGER refuse_balance BEFORE INSERT ON DBalanceStore BEGIN SELECT RAISE(ABORT, 'disk full'); END;");
  const std::string before = Dump({"GDocument", "DBalanceStore", "XALUserOption"});
  user->answers = {kYes};
  EXPECT_EQ(Close("Store"), Variant(false));
  EXPECT_EQ(user->transcript,
            "MsgBox(77,\"Some store documents before 3/5/2009 are not certified. Certify?\",36)->6; "
            "Notify(2,4); Notify(4)");
  EXPECT_EQ(Dump({"GDocument", "DBalanceStore", "XALUserOption"}), before);
}

INSTANTIATE_TEST_SUITE_P(, ClosePeriodTest, ::testing::Values(1, 2), KindName);

// ---------------------------------------------------------------------------------------------
// The balance tables the host rebuilds when the store or the bank closes
// ---------------------------------------------------------------------------------------------

class BalanceRebuildTest : public ClosePeriodTest {
 protected:
  // Article 1 in stores 100 and 101: receipts (two on one day), a movement, issues, a reserved
  // issue, a pre-reserved receipt, a service, and rows on and after the closing date.
  void StoreRows() {
    Sql("INSERT INTO GRArticle (ID, Code) VALUES (1, 'A1'), (2, 'SERVICE');"
        "INSERT INTO DDStoreDRow (ID, IDGRArticle, ArticleType, IDSenderStore, IDReceiverStore, DealState, DocDate,"
        " BaseQuantity, Cost) VALUES"
        " (1, 1, '', NULL, 100, '', 39860, 10, 100), (2, 1, '', NULL, 100, '', 39860.25, 5, 60),"
        " (3, 1, '', 100, 101, '', 39865, 4, 44), (4, 1, '', 101, NULL, '', 39870, 1, 11),"
        " (5, 1, '', NULL, 100, 'P', 39866, 7, 70), (6, 2, 'S', NULL, 100, '', 39860, 3, 30),"
        " (7, 1, '', NULL, 100, '', 39877, 2, 30), (8, 1, '', 100, NULL, '', 39880, 3, 33),"
        " (9, 1, '', 100, NULL, 'R', 39868, 1, 12);"
        "INSERT INTO DBalanceStore (DocDate, IDGRArticle, IDDRStore, DebitQFlow) VALUES (39000, 5, 100, 99);");
  }
  double OnHand(int32_t store) {
    return CDbl(Scalar("SELECT total(Quantity + RQuantity) FROM DCurBalanceStore WHERE IDGRArticle = 1" +
                       (store ? " AND IDDRStore = " + std::to_string(store) : std::string())));
  }
};

TEST_P(BalanceRebuildTest, StoreFlowsBeforeTheDateAgreeWithStockAndCost) {
  StoreRows();
  conn->SetSetting("CostCounting", "RunningCost", Variant(true));
  struct Probe {
    int32_t store;
    bool byStore;
  } probes[] = {{100, false}, {101, false}, {0, false}, {100, true}, {101, true}};
  std::vector<double> quantities, costs;
  for (const auto& p : probes) {
    conn->SetSetting("CostCounting", "CostByStore", Variant(p.byStore));
    quantities.push_back(CountStockBalance(conn, 1, p.store));
    costs.push_back(CDbl(CountCost(conn, 1, p.store, 0, true, "X")));
  }

  EXPECT_EQ(Close("Store"), Variant(true));
  EXPECT_EQ(Rows("DBalanceStore",
                 "CAST(DocDate AS REAL) AS D, IDGRArticle, IDDRStore, DebitQFlow, CreditQFlow, DebitFlowBase, "
                 "CreditFlowBase, DebitFlowRef, CreditFlowRef"),
            "(39860,1,100,15,0,160,0,0,0)(39865,1,100,0,4,0,44,0,0)(39865,1,101,4,0,44,0,0,0)"
            "(39868,1,100,0,1,0,12,0,0)(39870,1,101,0,1,0,11,0,0)");

  // Closed flows before the fixed date plus the rows from it on: the same stock and cost as before.
  for (size_t i = 0; i < std::size(probes); ++i) {
    SCOPED_TRACE(std::to_string(probes[i].store) + (probes[i].byStore ? " by store" : ""));
    conn->SetSetting("CostCounting", "CostByStore", Variant(probes[i].byStore));
    EXPECT_DOUBLE_EQ(CountStockBalance(conn, 1, probes[i].store), quantities[i]);
    EXPECT_DOUBLE_EQ(CountStockBalance(conn, 1, probes[i].store), OnHand(probes[i].store));
    EXPECT_NEAR(CDbl(CountCost(conn, 1, probes[i].store, 0, true, "X")), costs[i], 1e-4);
  }
  EXPECT_DOUBLE_EQ(quantities[0], 9);
  EXPECT_DOUBLE_EQ(quantities[1], 3);
  EXPECT_DOUBLE_EQ(quantities[2], 12);
}

// Bank and cash: debit for money received (a positive amount), credit for money paid out.
TEST_P(BalanceRebuildTest, BankAndCashFlowsFromTheVouchers) {
  Sql("INSERT INTO VDVoucherRow (IDGRBankAccount, IDVRCashDesk, IDGRCurrency, DocDate, Amount, AmountBase, AmountRef)"
      " VALUES (7, 0, 1, 39860, 100, 100, 50), (7, 0, 1, 39860.5, -30, -30, -15), (7, 0, 1, 39861, -20, -20, -10),"
      " (7, 0, 1, 39880, 500, 500, 250), (8, 0, 2, 39862, 0, 15, 0), (0, 3, 1, 39860, 40, 40, 0),"
      " (0, 3, 1, 39860, -5, -5, 0), (0, 0, 1, 39860, 1000, 1000, 0);"
      "INSERT INTO VBalanceBank (DocDate, IDGRBankAccount, IDGRCurrency, DebitFlow) VALUES (39000, 9, 1, 1);");
  EXPECT_EQ(Close("Bank"), Variant(true));
  EXPECT_EQ(user->transcript, "Notify(2,3); Notify(4); Notify(4); Notify(4)");
  const std::string columns =
      "CAST(DocDate AS REAL) AS D, IDGRCurrency, DebitFlow, CreditFlow, DebitFlowBase, CreditFlowBase, DebitFlowRef, "
      "CreditFlowRef";
  EXPECT_EQ(Rows("VBalanceBank", "IDGRBankAccount, " + columns),
            "(7,39860,1,100,30,100,30,50,15)(7,39861,1,0,20,0,20,0,10)(8,39862,2,0,0,15,0,0,0)");
  EXPECT_EQ(Rows("VBalanceCash", "IDVRCashDesk, " + columns), "(3,39860,1,40,5,40,5,0,0)");
  EXPECT_EQ(Fixed("Bank"), "39877");
}

TEST_P(BalanceRebuildTest, UnknownBalanceTableIsRefused) {
  Ref<ParamList> args = conn->Server()->NewParamList();
  args->Set("Date", Variant(kCloseDate));
  Ref<DataObject> other = conn->Server()->OpenDataObject("DCurBalanceStore");
  EXPECT_THROW(other->CallFunction("ComputeBalance", Variant(args), 0), VbError);
}

INSTANTIATE_TEST_SUITE_P(, BalanceRebuildTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal::server::testing
