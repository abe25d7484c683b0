// Header field validations on the reference host: dates against the closed periods, the reference
// number's check digit, registers carried into rows (sets and the capital-asset twin fields), the
// company and partner fills with their questions, the batch-invoice guard and the credit limit.
#include "docfunc/docfunc_fixture.h"
#include "host/data_object.h"
#include "runtime/dates.h"

namespace xal::docfunc::testing {
namespace {

using Fields = std::initializer_list<std::pair<const char*, Variant>>;

class HeaderFields : public DocFuncTest {
 protected:
  void SetHeader(Fields fields) {
    for (const auto& [name, value] : fields) session->Header()->SetField(name, value);
  }
  void Sql(const std::string& script) {
    conn->db().ExecScript(script);
    conn->InvalidateLinks();
  }
  Variant HeaderField(const char* name) { return session->Header()->Field(name); }
  Variant Scalar(const std::string& sql) { return conn->db().Scalar(sql, {}); }
};

TEST_F(HeaderFields, DatesAgainstClosedPeriodsAndTheLimit) {
  const double today = Today().serial;
  const std::string kAsk = "MsgBox(\"Document date outside allowed date range. Do you want to proceed?\",4)->";
  struct Case {
    const char* handler;
    double date, closedUpTo, promptDate;
    int32_t answer;  // 0: no question expected
    bool result;
    std::string transcript;
  } cases[] = {
      {"VDocDate", 39877, 39877, 0, 0, true, "StatusMsg(\"\"); RefreshHeader(\"\")"},  // the closing day itself
      {"VDocDate", 39876, 39877, 0, 0, false, "StatusMsg(\"Err_DocInClosedPeriod\")"},
      {"VDocDate", 39876, 0, 0, 0, true, "StatusMsg(\"\"); RefreshHeader(\"\")"},  // 0: nothing closed
      {"VDocDate", 0, 0, 0, 0, false, "StatusMsg(\"Err_DocDateMissing\")"},
      {"VDocDate", today + 1, 0, 0, 7, false, kAsk + "7"},
      {"VDocDate", -3, 0, 0, 6, true, kAsk + "6; StatusMsg(\"\"); RefreshHeader(\"\")"},  // before 1900
      {"VDocDate", 39880, 0, 39870, 0, false, "StatusMsg(\"Due date earlier than document date\")"},
      {"VDealDate", 39876, 39877, 0, 0, false, "StatusMsg(\"Err_DealDateOutOfRange\")"},
      {"VDealDate", 39877.75, 39877, 0, 0, true, "StatusMsg(\"\")"},
      {"VDealDate", 0, 0, 0, 0, false, "StatusMsg(\"Err_DealDateMissing\")"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.handler) + " " + std::to_string(c.date));
    conn->SetUserOption(0, "DateFixed", "SALES", Variant(Date(c.closedUpTo)));
    Open("SDInvoice");
    const char* field = std::string(c.handler) == "VDocDate" ? "DocDate" : "DealDate";
    SetHeader({{field, Variant(Date(c.date))}, {"PromptDate", Variant(Date(c.promptDate))}});
    if (c.answer) session->AddMsgBoxAnswer(c.answer);
    EXPECT_EQ(Handler(c.handler), Variant(c.result));
    EXPECT_EQ(session->TranscriptText(), c.transcript);
    if (c.result && std::string(c.handler) == "VDocDate") EXPECT_EQ(HeaderField("DealDate"), Variant(Date(c.date)));
  }
}

TEST_F(HeaderFields, ReferenceNumberCheckDigit) {
  const char* kWrong = "StatusMsg(\"\"); StatusMsg(\"Incorrect reference no. checksum, correct value is 1\")";
  const char* kNoDigits = "StatusMsg(\"\"); StatusMsg(\"Error in script 'VReferenceNo': (13) Type mismatch\")";
  struct Case {
    const char* number;
    bool result;
    const char* transcript;
  } cases[] = {
      {"", true, "StatusMsg(\"\")"},
      {"1234561", true, "StatusMsg(\"\")"},
      {" 1234561 ", true, "StatusMsg(\"\")"},  // blanks around the number are not part of it
      {"1234560", false, kWrong},
      {"123456X", false, kWrong},   // a letter in the check place is a wrong digit
      {"12A4561", false, kNoDigits},  // a letter before it: no check digit exists
      {"123 4561", false, kNoDigits},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.number);
    Open("SDInvoice");
    SetHeader({{"ReferenceNo", Variant(c.number)}});
    EXPECT_EQ(Handler("VReferenceNo"), Variant(c.result));
    EXPECT_EQ(session->TranscriptText(), c.transcript);
  }
}

TEST_F(HeaderFields, TermsGiveTheDueAndDeliveryDatesAndTheRowsTakeThem) {
  Sql("INSERT INTO GRTermPaymentRow (IDGRTermPayment, PromptTime, PenaltyPercent) VALUES (20, 10, 0.1), (20, 30, 0.05);"
      "INSERT INTO GRTermDelivery (ID, DeliveryTime) VALUES (5, 7);");
  Open("SDInvoice");
  AddRow({{"IDGRArticle", Variant(1)}});
  SetHeader({{"DocDate", Variant(Date(39877))}, {"IDGRTermPayment", Variant(20)}, {"IDGRTermDelivery", Variant(5)},
             {"Country", Variant("LV")}});
  for (const char* handler : {"VTermPayment", "VTermDelivery", "VDeliveryDate", "VCountry"})
    EXPECT_EQ(Handler(handler), Variant(true)) << handler;
  EXPECT_EQ(HeaderField("PromptDate"), Variant(Date(39907)));  // the longest prompt time
  EXPECT_EQ(HeaderField("PenaltyPercent"), Variant(0.05));
  EXPECT_EQ(session->Rows()->Field("DeliveryDate"), Variant(Date(39884)));
  EXPECT_EQ(session->Rows()->Field("Country"), Variant("LV"));
  SetHeader({{"PromptDate", Variant(Date(39876))}});
  EXPECT_EQ(Handler("VPromptDate"), Variant(false));
}

// The partner's name follows the company's when blank or the same company; on the purchase side
// the reference number is the supplier's first that is not blank; the deal state names type and series.
TEST_F(HeaderFields, SmallFills) {
  struct Case {
    int32_t partner;
    const char* before;
    const char* after;
  } cases[] = {{10, "Old", "Acme Ltd"}, {11, " ", "Acme Ltd"}, {11, "Other", "Other"}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.before);
    Open("SDInvoice");
    SetHeader({{"IDGRCompany", Variant(10)}, {"IDPartner", Variant(c.partner)}, {"CompanyName", Variant(" Acme Ltd ")},
               {"PartnerName", Variant(c.before)}});
    EXPECT_EQ(Handler("VCompanyName"), Variant(true));
    EXPECT_EQ(HeaderField("PartnerName"), Variant(c.after));
  }
  Sql("UPDATE GRCompany SET ReferenceNo = '13' WHERE ID = 10; UPDATE GRCompany SET ReferenceNo = ' ' WHERE ID = 11;"
      "INSERT INTO GRBankAccount (ID, IDGRCompany, ReferenceNo) VALUES (41, 11, '');");
  SetOption("PDInvoice", "PGRDocType", Variant(3));
  Open("PDInvoice");
  SetHeader({{"IDGRCompany", Variant(10)}, {"IDPartner", Variant(11)}, {"IDPartnerBAcc", Variant(41)},
             {"DealState", Variant(" P")}});
  EXPECT_EQ(Handler("VGRBankAccount"), Variant(true));
  EXPECT_EQ(Handler("VDealState"), Variant(true));
  EXPECT_EQ(HeaderField("ReferenceNo"), Variant("13"));
  EXPECT_EQ(HeaderField("IDGRDocType"), Variant(3));
  EXPECT_EQ(HeaderField("IDGRDocSeries"), Variant(0));
  // A new series draws a new number; a new currency has its rates looked up again.
  SetHeader({{"DocNo", Variant(12)}, {"ExchangeRate", Variant(1.5)}, {"ExchangeRateRef", Variant(2.5)}});
  session->ClearTranscript();
  EXPECT_EQ(Handler("VGRDocSeries"), Variant(true));
  EXPECT_EQ(Handler("VGRCurrency"), Variant(true));
  EXPECT_EQ(session->TranscriptText(), "RefreshHeader(\"DocNo\"); RefreshHeader(\"\")");
  EXPECT_EQ(HeaderField("DocNo"), Variant(0));
  EXPECT_EQ(HeaderField("ExchangeRate"), Variant(0.0));
  EXPECT_EQ(HeaderField("ExchangeRateRef"), Variant(0.0));
}

// A stored invoice with a set row (two components) and a plain row.
class RegisterQuestion : public HeaderFields {
 protected:
  void SetUp() override {
    HeaderFields::SetUp();
    Sql("INSERT INTO SDInvoiceRow (ID, IDDoc, IDParentRow, IDGRArticle, CompletionType) VALUES"
        " (1, 1000, 0, 3, 'C'), (2, 1000, 1, 1, ''), (3, 1000, 1, 2, ''), (4, 1000, 0, 2, '');");
  }
  Variant RowsWith(const char* field, int32_t value) {
    return Scalar("SELECT count(*) FROM SDInvoiceRow WHERE " + std::string(field) + " = " + std::to_string(value));
  }
};

TEST_F(RegisterQuestion, OptionOrAnswerDecidesAndSetsChangeWithTheirComponents) {
  const std::string kAsk = "MsgBox(\"Replace departments on document rows?\",4)->";
  const std::string kParts = "CachedRows(\"SDINVOICERow\",\"Next\"); ";  // the set row's components
  struct Case {
    const char* option;
    int32_t answer;
    int32_t rowsChanged;
    std::string transcript;
  } cases[] = {
      {"AlwaysYes", 0, 4, kParts + "RefreshBrowser(\"\")"},
      {" alwaysno ", 0, 0, ""},
      {"", 7, 0, kAsk + "7"},
      {"", 6, 4, kAsk + "6; " + kParts + "RefreshBrowser(\"\")"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.option);
    Sql("UPDATE SDInvoiceRow SET IDGRDepartment = 0");
    SetOption("SDInvoice", "AskRegister", Variant(c.option));
    Open("SDInvoice", 1000);
    SetHeader({{"IDGRDepartment", Variant(7)}});
    if (c.answer) session->AddMsgBoxAnswer(c.answer);
    EXPECT_EQ(Handler("VGRDepartment"), Variant(true));
    EXPECT_EQ(session->TranscriptText(), c.transcript);
    EXPECT_EQ(RowsWith("IDGRDepartment", 7), Variant(c.rowsChanged));
  }
  // Without rows nothing is asked.
  SetOption("SDInvoice", "AskRegister", Variant(""));
  Open("SDInvoice");
  SetHeader({{"IDGRDepartment", Variant(7)}});
  EXPECT_EQ(Handler("VGRDepartment"), Variant(true));
  EXPECT_EQ(session->TranscriptText(), "");
}

TEST_F(RegisterQuestion, RegisterOfTheEditedCell) {
  SetOption("SDInvoice", "AskRegister", Variant("AlwaysYes"));
  struct Case {
    const char* expr;
    const char* header;
    const char* row;
  } cases[] = {{"GARegister2.Code", "IDGARegister2", "IDGARegister2"}, {"gbRegister4.Name", "IDGBRegister4", "IDGBRegister4"}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.expr);
    Open("SDInvoice", 1000);
    ObjectRef cell = CreateObject("Cellinfo");
    PutProperty(cell, "Expr", Variant(c.expr));
    session->Proxy()->SetCell(cell);
    SetHeader({{c.header, Variant(55)}});
    EXPECT_EQ(Handler("VRegisters"), Variant(true));
    EXPECT_EQ(RowsWith(c.row, 55), Variant(4));
  }
}

// A capital-asset receipt writes the department on both sides of every row.
TEST_F(HeaderFields, CapitalAssetReceiptWritesBothSides) {
  Sql("INSERT INTO CADocRow (ID, IDCADocument) VALUES (1, 1000), (2, 1000);");
  SetOption("CDReceipts", "AskRegister", Variant("AlwaysYes"));
  auto header = conn->OpenRows("SELECT * FROM GDocument WHERE ID = 1000", "CDReceipts", "GDocument");
  auto rows = conn->OpenRows("SELECT * FROM CADocRow ORDER BY ID", "CADocRow", "CADocRow");
  df = Wire(MakeRef<XALSBEproxy>(), header, conn->Server());
  SetRowOB(rows);
  header->SetField("IDGRDepartment", Variant(9));
  EXPECT_EQ(Handler("VGRDepartment"), Variant(true));
  EXPECT_EQ(Scalar("SELECT count(*) FROM CADocRow WHERE IDSenderDepartment = 9 AND IDReceiverDepartment = 9"),
            Variant(2));
}

TEST_F(HeaderFields, AskCompanyDecidesTheRefill) {
  Sql("INSERT INTO SDInvoiceRow (ID, IDDoc) VALUES (1, 1000);");
  const std::string kAsk = "MsgBox(\"Recompute all header fields?\",4)->";
  const std::string kEnd = "CmdPost(\"ShowGRCompanyInfo\"); RefreshHeader(\"\")";
  struct Case {
    const char* option;
    int32_t answer;
    bool refilled;
    std::string transcript;
  } cases[] = {
      {"AlwaysYes", 0, true, "StatusMsg(\"\"); " + kEnd},
      {"AlwaysNo", 0, false, "StatusMsg(\"\"); " + kEnd},
      {"", 7, false, "StatusMsg(\"\"); " + kAsk + "7; " + kEnd},
      {"Ask", 6, true, "StatusMsg(\"\"); " + kAsk + "6; " + kEnd},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.option);
    SetOption("SDInvoice", "AskCompany", Variant(c.option));
    Open("SDInvoice", 1000);
    SetHeader({{"IDGRCompany", Variant(11)}});
    if (c.answer) session->AddMsgBoxAnswer(c.answer);
    EXPECT_EQ(Handler("VGRCompany"), Variant(true));
    EXPECT_EQ(session->TranscriptText(), c.transcript);
    EXPECT_EQ(HeaderField("IDPartner"), Variant(11));          // always: the company is its own partner
    EXPECT_EQ(HeaderField("CompanyName"), Variant("Beta OÜ"));  // always
    EXPECT_EQ(HeaderField("IDGRCurrency"), Variant(c.refilled ? 2 : 0));
  }
}

TEST_F(HeaderFields, CompanyMessageMarkers) {
  struct Case {
    const char* docTable;
    const char* message;
    bool result;
    const char* shown;
  } cases[] = {
      {"SDOrder", "@$Pay first", false, "Pay first"},  // "@$" refuses the company on a sales order
      {"SDInvoice", "@$Pay first", true, "Pay first"},
      {"SDInvoice", "@$$Blocked", false, "Blocked"},
      {"PDInvoice", "@$$Blocked", true, "Blocked"},  // a kind without company messages only shows it
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.docTable) + c.message);
    conn->db().Exec("UPDATE GRCompany SET Message = ? WHERE ID = 10", {Variant(c.message)});
    conn->InvalidateLinks();
    Open(c.docTable);
    SetHeader({{"IDGRCompany", Variant(10)}});
    EXPECT_EQ(Handler("VGRCompany"), Variant(c.result));
    EXPECT_NE(session->TranscriptText().find("MsgBox(\"" + std::string(c.shown) + "\",64)->1"), std::string::npos);
  }
}

// Two deliveries on invoice 2000 make it a batch invoice; delivery 3002 has an invoice of its own.
TEST_F(HeaderFields, BatchInvoiceRefusesACompanyChange) {
  for (int32_t kind : {1, 2}) {
    conn = host::HostConnection::Open(path(), kind);
    Sql("DELETE FROM GDocRel; DELETE FROM GDocument WHERE ID >= 2000;"
        "INSERT INTO GDocument (ID, DocName, RefType, IDGRCompany) VALUES (2000, 'SDInvoice', 'SDInvoice', 10),"
        " (2001, 'SDInvoice', 'SDInvoice', 10), (3000, 'SDConsignmD', 'SDConsignmD', 10),"
        " (3001, 'SDConsignmD', 'SDConsignmD', 10), (3002, 'SDConsignmD', 'SDConsignmD', 10);"
        "INSERT INTO GDocRel (PrevDocName, IDPrevDoc, NextDocName, IDNextDoc) VALUES ('SDConsignmD', 3000, "
        "'SDInvoice', 2000), ('SDConsignmD', 3001, 'SDInvoice', 2000), ('SDConsignmD', 3002, 'SDInvoice', 2001);");
    SetOption("SDInvoice", "AskCompany", Variant("AlwaysNo"));
    SetOption("SDConsignmD", "AskCompany", Variant("AlwaysNo"));
    struct Case {
      const char* docTable;
      int32_t id;
      int32_t companyAfter;
      const char* refusal;
    } cases[] = {
        {"SDInvoice", 2000, 10, "MsgBox(\"Company cannot be changed on batch invoice\",0)->1; "},
        {"SDConsignmD", 3001, 10, "MsgBox(\"Company cannot be changed: a related batch invoice exists\",0)->1; "},
        {"SDConsignmD", 3002, 11, ""},
        {"SDInvoice", 2001, 11, ""},
    };
    for (const Case& c : cases) {
      SCOPED_TRACE(std::to_string(kind) + " " + std::to_string(c.id));
      Open(c.docTable, c.id);
      SetHeader({{"IDGRCompany", Variant(11)}});
      EXPECT_EQ(Handler("VGRCompany"), Variant(true));
      EXPECT_EQ(HeaderField("IDGRCompany"), Variant(c.companyAfter));
      EXPECT_EQ(session->TranscriptText(),
                "StatusMsg(\"\"); " + std::string(c.refusal) + "CmdPost(\"ShowGRCompanyInfo\"); RefreshHeader(\"\")");
    }
  }
}

// Prices of a refill: the company's own list and cut win; the one list of a category comes next;
// a document saved under the same category keeps its list and cut; a contract list means no cut.
TEST_F(HeaderFields, PriceFieldsFromTheCompanyAndTheSavedCategory) {
  Sql("UPDATE GRCompany SET IDGRCompanyPriceCat = 1 WHERE ID = 10;"
      "UPDATE GDocument SET IDGRPriceList = 5, PriceCut = 3 WHERE ID = 1000;"
      "INSERT INTO GRPriceList (ID, Name, IsBruto) VALUES (5, 'Retail', 0), (6, 'Wholesale', -1), (7, 'Own', 0);"
      "INSERT INTO GRPriceCatRel (IDGRArticlePriceCat, IDGRCompanyPriceCat, IDGRPriceList) VALUES (1, 2, 6), (2, 2, 6);"
      "INSERT INTO GRCompany (ID, Code, IDGRCompanyPriceCat, IDGRPriceList, PriceCut, IDGRPriceListC) VALUES"
      " (12, 'SAME', 1, 0, 0, 0), (13, 'OTHER', 2, 0, 0, 0), (14, 'OWN', 1, 7, 2.5, 0), (15, 'CONTRACT', 2, 0, 4, 9);");
  SetOption("SDInvoice", "AskCompany", Variant("AlwaysYes"));
  struct Case {
    int32_t company, list;
    double cut;
    const char* name;
    bool gross;
  } cases[] = {{12, 5, 3, "Retail", false}, {13, 6, 0, "Wholesale", true}, {14, 7, 2.5, "Own", false},
               {15, 6, 0, "Wholesale", true}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.company);
    Open("SDInvoice", 1000);
    SetHeader({{"IDGRCompany", Variant(c.company)}});
    EXPECT_EQ(Handler("VGRCompany"), Variant(true));
    EXPECT_EQ(HeaderField("IDGRPriceList"), Variant(c.list));
    EXPECT_EQ(HeaderField("PriceCut"), Variant(c.cut));
    EXPECT_EQ(HeaderField("PriceList"), Variant(c.name));
    EXPECT_EQ(State().PriceIsGross, c.gross);
  }
}

// pFill 1: the partner's currency overrides the company's; pFill 2: only where the company has none.
TEST_F(HeaderFields, PartnerOverridesOrFillsGaps) {
  Sql("INSERT INTO GRBankAccount (ID, IDGRCompany, ShowInReport, ReferenceNo) VALUES (40, 11, -1, ' 778 ');");
  SetOption("SDInvoice", "AskCompany", Variant("AlwaysYes"));
  struct Case {
    int16_t fill;
    int32_t companyCurrency, currency;
    double rate;
  } cases[] = {{1, 1, 2, 0}, {2, 1, 1, 1.5}, {2, 0, 2, 0}, {0, 0, 1, 1.5}};
  for (const Case& c : cases) {
    SCOPED_TRACE(std::to_string(c.fill) + " " + std::to_string(c.companyCurrency));
    conn->db().Exec("UPDATE GRCompany SET IDGRCurrency = ? WHERE ID = 10", {Variant(c.companyCurrency)});
    conn->InvalidateLinks();
    Open("SDInvoice");
    AddRow({{"IDGRArticle", Variant(1)}});
    SetHeader({{"IDGRCompany", Variant(10)}, {"IDPartner", Variant(11)}, {"IDGRCurrency", Variant(1)},
               {"ExchangeRate", Variant(1.5)}});
    EXPECT_EQ(Call(df, "VPartner", {Variant(c.fill)}), Variant(true));
    EXPECT_EQ(HeaderField("IDGRCurrency"), Variant(c.currency));
    EXPECT_EQ(HeaderField("ExchangeRate"), Variant(c.rate));
    EXPECT_EQ(HeaderField("PartnerName"), Variant("Beta OÜ"));
    EXPECT_EQ(HeaderField("IDPartnerBAcc"), Variant(40));
    EXPECT_EQ(HeaderField("ReferenceNo"), Variant("778"));
    EXPECT_EQ(session->Rows()->Field("IDGRCompany"), Variant(11));
    EXPECT_EQ(session->TranscriptText(), "CmdPost(\"ShowGRCompanyInfo\"); RefreshHeader(\"\"); RefreshBrowser(\"\")");
  }
}

// Ids that point at no row leave the fields they would fill as they were.
TEST_F(HeaderFields, IdsWithoutTheirRowChangeNothing) {
  Open("SDInvoice");
  SetHeader({{"IDGRCompany", Variant(999)}, {"CompanyName", Variant("Kept")}, {"IDPartner", Variant(998)},
             {"PartnerName", Variant("Kept")}, {"IDGRTermPayment", Variant(997)}, {"DocDate", Variant(Date(39877))},
             {"PromptDate", Variant(Date(39880))}});
  EXPECT_EQ(Handler("VGRCompany"), Variant(true));
  EXPECT_EQ(Handler("VPartner"), Variant(true));
  EXPECT_EQ(Handler("VTermPayment"), Variant(true));
  EXPECT_EQ(HeaderField("CompanyName"), Variant("Kept"));
  EXPECT_EQ(HeaderField("PartnerName"), Variant("Kept"));
  EXPECT_EQ(HeaderField("IDPartner"), Variant(998));
  EXPECT_EQ(HeaderField("PromptDate"), Variant(Date(39880)));
  EXPECT_EQ(session->TranscriptText(), "StatusMsg(\"\"); CmdPost(\"ShowGRCompanyInfo\"); RefreshHeader(\"\")");
  // A partner whose price list has no row: the list's name and mode stay.
  Sql("UPDATE GRCompany SET IDGRPriceList = 888 WHERE ID = 11;");
  SetHeader({{"IDPartner", Variant(11)}, {"PriceList", Variant("Kept")}});
  EXPECT_EQ(Handler("VPartner"), Variant(true));
  EXPECT_EQ(HeaderField("IDGRPriceList"), Variant(888));
  EXPECT_EQ(HeaderField("PriceList"), Variant("Kept"));
}

// ACME (limit 5000) owes 4000 on an open invoice less a payment of 1500.50 booked against it; a
// finished invoice and another company's invoice do not count.
TEST_F(HeaderFields, CreditLimitWarnsAndAsksWithTheRealFigures) {
  const std::string kOver = "Company 'ACME' credit limit is exceeded: unpaid invoices ";
  for (int32_t kind : {1, 2}) {
    conn = host::HostConnection::Open(path(), kind);
    Sql("DELETE FROM XALLog; DELETE FROM VDVoucherRow; DELETE FROM GDocument WHERE ID >= 2000;"
        "INSERT INTO GDocument (ID, DocName, RefType, DocState, IDGRCompany, TotalAmount, TotalAmountBase) VALUES"
        " (2000, 'SDInvoice', 'SDInvoice', '', 10, 4000, 4000), (2001, 'SDInvoice', 'SDInvoice', 'F', 10, 9000, 9000),"
        " (2002, 'SDInvoice', 'SDInvoice', '', 11, 7000, 7000), (2003, 'SDOrder', 'SDOrder', '', 10, 800, 800);"
        "INSERT INTO VDVoucherRow (IDSourceDoc, AmountBase) VALUES (2000, -1500.5), (2002, -1);");
    SetOption("SDInvoice", "CheckCreditLimit", Variant(-1));
    SetOption("SDOrder", "CheckCreditLimit", Variant(-1));
    struct Case {
      const char* docTable;
      int32_t id;  // 0: a new document
      double total, rate;
      int16_t mode;
      int32_t answer;
      bool result;
      const char* sum;  // nullptr: within the limit
    } cases[] = {
        {"SDInvoice", 0, 3000, 0, 0, 0, true, "5499.50"},
        {"SDInvoice", 0, 1000, 3, 0, 0, true, "5499.50"},   // 1000 at rate 3 in the base currency
        {"SDInvoice", 0, 2500, 0, 1, 0, true, nullptr},
        {"SDInvoice", 2000, 7000, 0, 1, 7, false, "5499.50"},  // the stored 4000 is not counted twice
        {"SDInvoice", 2000, 4100, 0, 1, 0, true, nullptr},
        {"SDOrder", 2003, 3000, 0, 1, 6, true, "5499.50"},  // a stored order is not in the sum: counted in full
    };
    for (const Case& c : cases) {
      SCOPED_TRACE(std::to_string(kind) + " " + std::to_string(c.id) + " " + std::to_string(c.total));
      Open(c.docTable, c.id);
      SetHeader({{"IDGRCompany", Variant(10)}, {"TotalAmount", Variant(c.total)}, {"ExchangeRate", Variant(c.rate)}});
      session->ClearTranscript();
      if (c.answer) session->AddMsgBoxAnswer(c.answer);
      EXPECT_EQ(std::static_pointer_cast<DocFunc>(df)->VerifyCreditLimit(c.mode), c.result);
      const std::string text = c.sum ? kOver + c.sum + " - credit limit 5000.00" : "";
      std::string expected = "StatusMsg(\"Finding credit limit...\"); StatusMsg(\"\")";
      if (c.sum)
        expected += c.mode == 0 ? "; MsgBox(\"" + text + "\",0)->1"
                                : "; MsgBox(\"" + text + "\r\nSave document?\",4)->" + std::to_string(c.answer);
      EXPECT_EQ(session->TranscriptText(), expected);
      EXPECT_EQ(Scalar("SELECT LogText FROM XALLog WHERE Kind = '2' AND TableName = 'SDOrder' AND IDRecord = 2003"),
                c.answer == 6 ? Variant(text) : Variant::Null());
    }
    // Saving asks the same question: No stops the save, Yes lets it go on.
    for (int32_t answer : {kAnswerNo, kAnswerYes}) {
      Open("SDInvoice", 2000);
      SetHeader({{"IDGRCompany", Variant(10)}, {"TotalAmount", Variant(7000.0)}, {"ExchangeRate", Variant(0.0)}});
      session->AddMsgBoxAnswer(answer);
      EXPECT_EQ(Handler("Doc_Valid"), Variant(answer == kAnswerYes));
    }
  }
}

}  // namespace
}  // namespace xal::docfunc::testing
