// Lifecycle handlers on the reference host: menu commands, a new and a copied document, the checks
// before saving, and the handler template's behaviour on calls it cannot serve.
#include <stdexcept>

#include "docfunc/docfunc_fixture.h"
#include "host/data_object.h"
#include "runtime/binding.h"
#include "runtime/dates.h"
#include "server/forwarding_host.h"

namespace xal::docfunc::testing {
namespace {

class Lifecycle : public DocFuncTest {};

TEST_F(Lifecycle, MenuCommandsPerKind) {
  struct Case {
    const char* docTable;
    const char* transcript;
  } cases[] = {
      {"SDInvoice", "AddMenuItem(\"Amount discount\",\"@ComputePercentAmount\"); "
                    "AddMenuItem(\"Pricelist discount\",\"@ComputePercentPricelist\"); "
                    "AddMenuItem(\"Client card\",\"@ClientCard\"); "
                    "AddMenuItem(\"Interest note info\",\"@InterestNoteInfo\")"},
      {"SDConsignmD", "AddMenuItem(\"Amount discount\",\"@ComputePercentAmount\"); "
                      "AddMenuItem(\"Pricelist discount\",\"@ComputePercentPricelist\"); "
                      "AddMenuItem(\"Find production costs\",\"@ComputeProductionCosts\"); "
                      "AddMenuItem(\"Client card\",\"@ClientCard\"); "
                      "AddMenuItem(\"Print prepayment invoice\",\"@PrintAPInvoice\"); "
                      "AddMenuItem(\"Add lots\",\"@Save_DRStockReserve\")"},
      {"DDMovement", "AddMenuItem(\"Find production costs\",\"@ComputeProductionCosts\")"},
      {"VDBank", ""},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.docTable);
    Open(c.docTable);
    EXPECT_EQ(Handler("Doc_Initialize"), Variant(true));
    EXPECT_EQ(session->TranscriptText(), c.transcript);
  }
  // Without the right to run the kind's special functions there is no production-cost command.
  conn->db().ExecScript(
      "INSERT INTO XALRight (IDXALUser, Kind, ObjectName, Denied) VALUES (1, 'DOCUMENT', 'DDMovement', 4)");
  Open("DDMovement");
  Handler("Doc_Initialize");
  EXPECT_EQ(session->TranscriptText(), "");
}

TEST_F(Lifecycle, NewDocumentTakesTheUsersDefaults) {
  conn->SetUserOption(0, "Owner", "GRCompany", Variant(10));
  conn->db().ExecScript("INSERT INTO GRBankAccount (ID, IDGRCompany, ShowInReport) VALUES (30, 10, -1), (31, 11, -1);");
  SetOption("CashSale", "DealState", Variant("P"));
  SetOption("CashSale", "GRDocTypeP", Variant(3));
  SetOption("CashSale", "GRCompany", Variant(11));
  SetOption("CashSale", "GRTax", Variant(2));
  SetOption("CashSale", "GARegister4", Variant(44));
  SetOption("CashSale", "IsApproximated", Variant(-1));
  SetOption("SDInvoice", "GRCompany", Variant(99));  // the form's own section wins
  Open("SDInvoice");
  session->Proxy()->SetValues("OptionName", Variant("CashSale"));
  Ref<DataObject> h = session->Header();
  h->SetField("IDGRDepartment", Variant(5));  // already set: kept
  EXPECT_EQ(Handler("AddNewDocument"), Variant(true));
  ExpectFields(*h, {{"DealState", Variant("P")}, {"IDGRDocType", Variant(3)}, {"IDGRDocSeries", Variant(0)},
                    {"IDGRCompany", Variant(11)}, {"IDOwner", Variant(10)},
                    {"IDOwnerBAcc", Variant(30)},  // the owner's account shown in reports
                    {"IDGRTax", Variant(2)}, {"IDGARegister4", Variant(44)}, {"IDGRDepartment", Variant(5)},
                    {"IsApproximated", Variant(true)}, {"DocDate", Variant(Today())}, {"IDEREmployee", Variant(7)},
                    {"IDXALUser", Variant(1)}});
  // The company is validated as if entered: it clears the status line and shows its panel.
  EXPECT_EQ(session->TranscriptText(),
            "StatusMsg(\"\"); StatusMsg(\"Missing doc. series\"); StatusMsg(\"\"); CmdPost(\"ShowGRCompanyInfo\"); "
            "RefreshHeader(\"@\"); RefreshHeader(\"TotalAmount\"); RefreshHeader(\"\")");
  EXPECT_TRUE(State().NewDocument);
  EXPECT_FALSE(State().NewDocPending);
  EXPECT_EQ(State().RowOB.get(), session->Rows());
  EXPECT_EQ(State().CallDepth, 0);
}

TEST_F(Lifecycle, CopiedDocumentKeepsItsTypeButGetsANewNumberAndDates) {
  Open("SDInvoice");
  Ref<DataObject> h = session->Header();
  for (const auto& [field, value] : std::initializer_list<std::pair<const char*, Variant>>{
           {"IDGRDocType", Variant(5)}, {"IDGRDocSeries", Variant(2)}, {"DealState", Variant("P")},
           {"DocNo", Variant(17)}, {"SourceDocNo", Variant("X-1")}, {"DocState", Variant("F")},
           {"DocDate", Variant(Date(39000))}, {"IDXALUser", Variant(9)}})
    h->SetField(field, value);
  EXPECT_EQ(Handler("AddNewDocument"), Variant(true));
  ExpectFields(*h, {{"IDGRDocType", Variant(5)}, {"IDGRDocSeries", Variant(2)}, {"DealState", Variant("P")},
                    {"IDOwner", Variant::Null()},  // no defaults on a copy
                    {"DocNo", Variant(0)}, {"SourceDocNo", Variant("")}, {"DocState", Variant("")},
                    {"DocDate", Variant(Today())}, {"DealDate", Variant(Today())}, {"IDXALUser", Variant(1)}});
  EXPECT_EQ(session->TranscriptText(),
            "StatusMsg(\"\"); StatusMsg(\"\"); CmdPost(\"ShowGRCompanyInfo\"); RefreshHeader(\"\")");
  EXPECT_TRUE(State().NewDocument);
}

TEST_F(Lifecycle, CompanyMessagesStopSaving) {
  struct Case {
    const char* docTable;
    const char* company;
    const char* partner;
    bool valid;
    const char* shown;
  } cases[] = {
      {"SDInvoice", "@$Pay first", "", false, "Pay first"},
      {"SDOrder", "@$Pay first", "", true, nullptr},  // "@$" does not stop a sales order
      {"SDOrder", "@$$Blocked", "", false, "Blocked"},
      {"SDInvoice", "@$$", "", false, "$"},            // exactly "@$$": its last character
      {"SDInvoice", "@$", "", false, "@$"},            // exactly "@$": shown unchanged
      {"SDOrder", "@$", "", true, nullptr},
      {"SDInvoice", " Call us ", " @$$Partner stop", false, "Partner stop"},
      {"SDInvoice", "Call us", "", true, nullptr},
      {"PDInvoice", "@$$Blocked", "", true, nullptr},  // a kind without company messages
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.docTable) + " " + c.company);
    conn->db().Exec("UPDATE GRCompany SET Message = ? WHERE ID = 10", {Variant(c.company)});
    conn->db().Exec("UPDATE GRCompany SET Message = ? WHERE ID = 11", {Variant(c.partner)});
    conn->InvalidateLinks();
    Open(c.docTable);
    session->Header()->SetField("IDGRCompany", Variant(10));
    session->Header()->SetField("IDPartner", Variant(11));
    EXPECT_EQ(Handler("Doc_Valid"), Variant(c.valid));
    EXPECT_EQ(session->TranscriptText(),
              c.shown ? "StatusMsg(\"\"); MsgBox(\"" + std::string(c.shown) + "\",64)->1" : "StatusMsg(\"\")");
  }
}

TEST_F(Lifecycle, PreReservationsNeedTheirOption) {
  for (bool allowed : {false, true}) {
    SCOPED_TRACE(allowed);
    SetOption("DRStore", "CreatePreReservation", Variant(allowed ? -1 : 0));
    Open("SDConsignmD");
    session->Header()->SetField("DealState", Variant("p"));
    EXPECT_EQ(Handler("Doc_Valid"), Variant(allowed));
    EXPECT_EQ(session->TranscriptText(), allowed ? "StatusMsg(\"\")" : "MsgBox(\"Pre-reservations not allowed\",0)->1");
  }
}

TEST_F(Lifecycle, EmptyRowsAreDroppedAndSetsNeedTheirParts) {
  Open("SDInvoice");
  AddRow({{"IDGRArticle", Variant(1)}});                                     // empty: dropped
  AddRow({{"IDGRArticle", Variant(2)}, {"BaseQuantity", Variant(2.0)}});     // kept
  AddRow({{"IDGRArticle", Variant(3)}, {"CompletionType", Variant("C")}, {"Amount", Variant(5)}});  // a set, no parts
  AddRow({{"IDGRArticle", Variant(1)}, {"AltQuantity", Variant(1.0)}});      // kept
  EXPECT_EQ(Handler("VDocument"), Variant(false));
  EXPECT_EQ(session->TranscriptText(),
            "CachedRows(\"SDINVOICERow\",\"Next\"); MsgBox(\"Set rows are missing 'KIT'\",0)->1");
  auto rows = std::static_pointer_cast<host::HostDataObject>(session->Rows());
  EXPECT_EQ(rows->ActualRowCount(), 3);
  rows->MoveFirst();
  EXPECT_TRUE(rows->RowState(kRowMarkedDeleted));
}

// The duplicate question on the purchase side compares the supplier's document number, quoted as
// a text literal: a number with a quote neither fails nor matches another number.
TEST_F(Lifecycle, DuplicateQuestionQuotesTheSuppliersNumber) {
  for (int32_t kind : {1, 2}) {
    SCOPED_TRACE(kind);
    conn = host::HostConnection::Open(path(), kind);
    conn->db().ExecScript("DELETE FROM GDocument WHERE DocName = 'PDInvoice';"
                          "INSERT INTO GDocument (ID, DocName, RefType, IDGRCompany, DocDate, SourceDocNo) VALUES"
                          " (2000, 'PDInvoice', 'PDInvoice', 10, 39877, 'O''Brien-1'), "
                          " (2001, 'PDInvoice', 'PDInvoice', 10, 39877, 'O');");
    SetOption("PDInvoice", "AskDoc", Variant(-1));
    struct Case {
      const char* number;
      bool asked;
    } cases[] = {{"O'Brien-1", true}, {"O'Brien-2", false}, {"O' OR ''='", false}, {"O", true}};
    for (const Case& c : cases) {
      SCOPED_TRACE(c.number);
      Open("PDInvoice");
      session->Header()->SetField("IDGRCompany", Variant(10));
      session->Header()->SetField("DocDate", Variant(Date(39877)));
      session->Header()->SetField("SourceDocNo", Variant(c.number));
      session->AddMsgBoxAnswer(kAnswerNo);
      EXPECT_EQ(Handler("VDocument"), Variant(!c.asked));
      EXPECT_EQ(session->TranscriptText(),
                c.asked ? "MsgBox(\"Analogous document already exists. Overwrite?\",260)->7" : "");
    }
  }
}

// A stored document excludes itself from the duplicates, and its lock is released.
TEST_F(Lifecycle, StoredDocumentIsNotItsOwnDuplicateAndIsUnlocked) {
  SetOption("SDInvoice", "AskDoc", Variant(-1));
  Open("SDInvoice", 1000);
  Ref<ParamList> lock = conn->Server()->NewParamList();
  lock->Set("ID", Variant(1000));
  lock->Set("XALType", Variant("SDInvoice"));
  lock->Set("LockType", Variant(1));
  EXPECT_EQ(conn->ServerCommand("Lock", lock), Variant(true));
  EXPECT_EQ(Handler("VDocument"), Variant(true));
  EXPECT_EQ(session->TranscriptText(), "");
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM XALLock"), Variant(0));
}

// ---------------------------------------------------------------------------------------------
// The on-hand check, through the host's inventory computation
// ---------------------------------------------------------------------------------------------

// The host's inventory computation "DPInventoryB", with the parameters the check hands it kept for
// the test to read.
class InventoryConnection : public server::testing::ForwardingConnection {
 public:
  using ForwardingConnection::ForwardingConnection;
  Variant ServerCommand(const std::string& name, const Ref<ParamList>& p) override {
    if (name == "DPInventoryB") params = p;
    return ForwardingConnection::ServerCommand(name, p);
  }
  Ref<ParamList> params;
};

TEST_F(Lifecycle, OnHandCheckThroughTheInventoryComputation) {
  conn->db().ExecScript(
      "INSERT INTO GDocument (ID, DocName, RefType) VALUES (3000, 'PDReceiptD', 'PDReceiptD');"
      "INSERT INTO DDStoreDRow (IDDoc, IDGRArticle, BaseQuantity, IDReceiverStore, ArticleType) VALUES"
      " (3000, 1, 10, 100, 'G'), (3000, 2, 1, 100, 'G');");
  SetOption("SDConsignmD", "CheckStockReserve", Variant(-1));
  auto inventory = MakeRef<InventoryConnection>(conn);
  struct Case {
    double apples, bolts;
    bool valid;
    const char* transcript;
  } cases[] = {
      {8, 1, true, "StatusMsg(\"\"); StatusMsg(\"Checking quantity on hand...\")"},
      {12, 1, false, "StatusMsg(\"\"); StatusMsg(\"Checking quantity on hand...\"); "
                     "MsgBox(\"Insufficient item 'A1' in warehouse 'MAIN'.\r\nRequired quantity 12 on hand 10\",0)->1"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.apples);
    session = host::DocumentSession::Open(conn, "SDConsignmD");
    df = Wire(session->Proxy(), session->Header(), inventory->Server());
    AddRow({{"IDGRArticle", Variant(1)}, {"BaseQuantity", Variant(c.apples)}, {"IDSenderStore", Variant(100)},
            {"ArticleType", Variant("G")}});
    AddRow({{"IDGRArticle", Variant(2)}, {"BaseQuantity", Variant(c.bolts)}, {"IDSenderStore", Variant(100)},
            {"ArticleType", Variant("G")}});
    AddRow({{"IDGRArticle", Variant(2)}, {"BaseQuantity", Variant(50.0)}, {"IDSenderStore", Variant(100)},
            {"ArticleType", Variant("S")}});  // a service takes nothing from the store
    SetRowOB(session->Rows());  // the form's rows
    EXPECT_EQ(Handler("Doc_Valid"), Variant(c.valid));
    EXPECT_EQ(session->TranscriptText(), c.transcript);
    EXPECT_EQ(CStr(inventory->params->Item("GRArticleIDs")), "1,2");
    EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM DPInventoryB"), Variant(0));  // the computation is removed
  }
}

// ---------------------------------------------------------------------------------------------
// Calls the template cannot serve
// ---------------------------------------------------------------------------------------------

// Before Create, after Destroy, and on a header without a current row.
TEST_F(Lifecycle, CallsTheTemplateCannotServe) {
  session = host::DocumentSession::Open(conn, "SDInvoice");
  df = CreateObject("DocFunc");
  PutRef(df, "Doc", session->Proxy());
  PutRef(df, "DocData", session->Header());
  EXPECT_EQ(Handler("Doc_Valid"), Variant(true));  // reads the header only
  EXPECT_EQ(Handler("VDocument"), Variant(true));  // its result starts True; the error does not change it
  EXPECT_EQ(session->TranscriptText(),
            "StatusMsg(\"\"); StatusMsg(\"Error in script 'VDocument': (91) Object variable or With block variable "
            "not set\")");
  EXPECT_EQ(Handler("DQuantity"), Variant());
  Call(df, "Create");
  Call(df, "Destroy");
  session->ClearTranscript();
  // Nothing bound and nothing to report to: each returns its result as it stood when it failed.
  for (const char* name : {"Doc_Initialize", "DelRow", "WhenDocument"}) {
    SCOPED_TRACE(name);
    EXPECT_EQ(Handler(name), Variant(false));
  }
  for (const char* name : {"Doc_Valid", "VDocument", "AddNewDocument"}) {
    SCOPED_TRACE(name);
    EXPECT_EQ(Handler(name), Variant(true));
  }
  EXPECT_EQ(session->TranscriptText(), "");
  EXPECT_EQ(State().CallDepth, 0);

  Open("SDInvoice");
  session->Header()->MoveNext();  // no current row
  EXPECT_EQ(Handler("AddNewDocument"), Variant(true));
  EXPECT_EQ(session->TranscriptText(),
            "StatusMsg(\"\"); StatusMsg(\"Error in script 'AddNewDocument': (3021) No current record.\")");
}

// A connection whose user record cannot be read: a host failure that is no run-time error.
class FailingUserConnection : public server::testing::ForwardingConnection {
 public:
  using ForwardingConnection::ForwardingConnection;
  Ref<DataObject> UserObject() override { throw std::runtime_error("user table unreadable"); }
};

TEST_F(Lifecycle, HostFailureEndsThatHandlerOnly) {
  auto failing = MakeRef<FailingUserConnection>(conn);
  session = host::DocumentSession::Open(conn, "SDInvoice");
  df = Wire(session->Proxy(), session->Header(), failing->Server());
  EXPECT_EQ(Handler("AddNewDocument"), Variant(true));
  EXPECT_EQ(session->Header()->Field("DocNo"), Variant(0));          // before the failure
  EXPECT_EQ(session->Header()->Field("IDXALUser"), Variant::Null());  // after it: not reached
  EXPECT_EQ(session->TranscriptText(),
            "StatusMsg(\"\"); StatusMsg(\"Missing doc. series\"); "
            "StatusMsg(\"Error in script 'AddNewDocument': (440) user table unreadable\")");
  EXPECT_TRUE(State().NewDocument);
  session->ClearTranscript();
  EXPECT_EQ(Handler("Doc_Valid"), Variant(true));  // the next handler runs as usual
  EXPECT_EQ(session->TranscriptText(), "StatusMsg(\"\")");
  EXPECT_EQ(State().CallDepth, 0);
}

// ---------------------------------------------------------------------------------------------
// Nesting
// ---------------------------------------------------------------------------------------------

// Re-enters Doc_Valid from its own status message, each level on another row, `levels` deep;
// every level checks that the nested call left the rows where this level put them.
class Reentry : public XALSBEproxyEvents {
 public:
  Reentry(ObjectRef df, Ref<DataObject> rows, int levels)
      : df_(std::move(df)), rows_(std::move(rows)), levels_(levels) {}
  void DoStatusMsg(const std::string& Msg) override {
    if (!Msg.empty() || depth_ >= levels_) return;
    ++depth_;
    rows_->MoveFirst();
    for (int i = 0; i < depth_ % 3; ++i) rows_->MoveNext();
    const Variant mark = rows_->Bookmark();
    Call(df_, "Doc_Valid");
    if (!(rows_->Bookmark() == mark)) ++misplaced;
  }
  int misplaced = 0;

 private:
  ObjectRef df_;
  Ref<DataObject> rows_;
  int levels_;
  int depth_ = 0;
};

TEST_F(Lifecycle, MoreThanTenNestedHandlersKeepTheirRows) {
  Open("SDInvoice");
  for (int i = 0; i < 3; ++i) AddRow({{"Amount", Variant(i + 1)}});
  session->Rows()->MoveFirst();
  session->Rows()->MoveNext();
  const Variant start = session->Rows()->Bookmark();
  auto reentry = std::make_shared<Reentry>(df, session->Rows(), 14);
  session->Proxy()->Events().Connect(reentry);
  EXPECT_EQ(Handler("Doc_Valid"), Variant(true));
  EXPECT_EQ(reentry->misplaced, 0);
  EXPECT_EQ(session->Rows()->Bookmark(), start);
  EXPECT_EQ(State().CallDepth, 0);
  EXPECT_GE(State().RowMarks.size(), 16u);
}

// ---------------------------------------------------------------------------------------------
// The optional test suite
// ---------------------------------------------------------------------------------------------

class TestSuite : public Object {
 public:
  // Takes the document and hands back another one.
  void RunTestScript(const ObjectRef& docFunc, Ref<XALSBEproxy>& doc) {
    seen = doc;
    doc = replacement;
  }
  static inline Ref<XALSBEproxy> seen, replacement;
};

TEST_F(Lifecycle, TestSuiteWhenInstalled) {
  Open("SDInvoice");
  EXPECT_EQ(Handler("Doc_TestScript"), Variant(true));  // no suite: nothing happens
  EXPECT_EQ(GetProperty(df, "Doc"), Variant(ObjectRef(session->Proxy())));
  ClassBuilder<TestSuite>("ScriptTest.ScriptTestSuite").Creatable()
      .Method<&TestSuite::RunTestScript>("RunTestScript", {Param("DocFunc"), Param("Doc")});
  TestSuite::replacement = MakeRef<XALSBEproxy>();
  EXPECT_EQ(Handler("Doc_TestScript"), Variant(true));
  EXPECT_EQ(TestSuite::seen, session->Proxy());
  EXPECT_EQ(GetProperty(df, "Doc"), Variant(ObjectRef(TestSuite::replacement)));
  TestSuite::seen.reset();
  TestSuite::replacement.reset();
}

}  // namespace
}  // namespace xal::docfunc::testing
