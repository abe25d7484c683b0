// The document-kind profile that Create derives: flags, field names, options, value lists, the
// register forms' table lists and the closing steps, per kind of document.
#include <algorithm>
#include <map>

#include "collections/value_texts.h"
#include "docfunc/docfunc_fixture.h"
#include "host/data_object.h"
#include "runtime/text.h"

namespace xal::docfunc::testing {
namespace {

using Flag = bool DocState::*;
const std::map<std::string, Flag>& Flags() {
  static const std::map<std::string, Flag> flags = {
      {"UseCampaignStock", &DocState::UseCampaignStock}, {"UsePriceCat", &DocState::UsePriceCat},
      {"UseTermDelivery", &DocState::UseTermDelivery},   {"UseTermPayment", &DocState::UseTermPayment},
      {"ComputePrices", &DocState::ComputePrices},       {"UseSets", &DocState::UseSets},
      {"UseRowTax", &DocState::UseRowTax},               {"UseTax", &DocState::UseTax},
      {"DefaultTax", &DocState::DefaultTax},             {"UseClientCard", &DocState::UseClientCard},
      {"IsStoreRow", &DocState::IsStoreRow},             {"IsAssetRow", &DocState::IsAssetRow},
      {"IsStockDoc", &DocState::IsStockDoc},             {"UsesStockReserve", &DocState::UsesStockReserve},
      {"UsesReserveRel", &DocState::UsesReserveRel},     {"UseDeliveryDate", &DocState::UseDeliveryDate},
      {"DropEmptyRows", &DocState::DropEmptyRows},       {"IsSales", &DocState::IsSales},
      {"ComputeTotals", &DocState::ComputeTotals},       {"UseDiscounts", &DocState::UseDiscounts},
      {"UseProductionCost", &DocState::UseProductionCost}, {"IsPurchase", &DocState::IsPurchase},
      {"CheckStockReserve", &DocState::CheckStockReserve}, {"CheckLotReserve", &DocState::CheckLotReserve},
      {"CheckCreditLimit", &DocState::CheckCreditLimit}, {"CostRows", &DocState::CostRows},
      {"CheckCreditRows", &DocState::CheckCreditRows},   {"UseStatFields", &DocState::UseStatFields},
      {"UseCompanyMessage", &DocState::UseCompanyMessage}, {"TwoStores", &DocState::TwoStores},
      {"IsRowArea", &DocState::IsRowArea},               {"CreatePreReservation", &DocState::CreatePreReservation},
      {"CompanyMessageDoc", &DocState::CompanyMessageDoc}, {"AmountFromOrder", &DocState::AmountFromOrder},
      {"MinQuantityMessage", &DocState::MinQuantityMessage},
      {"PriceByOrderedQuantity", &DocState::PriceByOrderedQuantity},
  };
  return flags;
}

// The flags that are True, by name, in name order.
std::string TrueFlags(const DocState& st) {
  std::string out;
  for (const auto& [name, flag] : Flags())
    if (st.*flag) out += (out.empty() ? "" : " ") + name;
  return out;
}

std::string Sorted(std::string names) {
  std::vector<std::string> parts = Split(names, " ");
  std::sort(parts.begin(), parts.end());
  return Join(parts, " ");
}

// A form whose data object is a table of the given name, as register and row forms are.
struct Form {
  Ref<XALSBEproxy> doc = MakeRef<XALSBEproxy>();
  Ref<DataObject> data;
};

Form MakeForm(host::HostConnection& conn, const std::string& table) {
  Form f;
  f.data = conn.OpenRows("SELECT 1 AS ID", table, "");
  f.doc->AddDataOB("DocData", f.data);
  return f;
}

std::string ListText(XALSBEproxy& doc, const std::string& field) {
  std::string out;
  Ref<ValueTexts> list = doc.ValueLists(field);
  for (int32_t i = 1; i <= list->Count(); ++i) {
    const Ref<ValueText>& entry = list->entries().At(i);
    out += (out.empty() ? "" : "|") + CStr(entry->Value()) + "=" + entry->Text();
  }
  return out;
}

struct KindCase {
  const char* docTable;
  const char* flags;       // every flag that is True after Create
  const char* storeField;  // and a few settings
  const char* priceListField;
  const char* refType;
  const char* docName;
  const char* suffix;
  const char* dealStates;  // the "DealState" list
};

// Always on unless a kind switches them off: UseTax, DefaultTax, DropEmptyRows, CheckCreditRows,
// CreatePreReservation and CompanyMessageDoc (the option "CompanyMessage" is empty).
#define BASE "UseTax DefaultTax DropEmptyRows CheckCreditRows CreatePreReservation CompanyMessageDoc "
const KindCase kKinds[] = {
    {"SDInvoice", BASE "UseCompanyMessage ComputeTotals UseDiscounts UseSets ComputePrices IsSales UseDeliveryDate "
                  "UseTermDelivery UseTermPayment UseRowTax UsePriceCat UseClientCard UseStatFields",
     "IDDRStore", "IDGRPriceList", "SDInvoice", "", "", "=Sales invoice|P=Prepayment"},
    {"PDInvoice", BASE "ComputeTotals UseSets UseDiscounts ComputePrices UseDeliveryDate UseTermDelivery "
                  "UseTermPayment UseRowTax UsePriceCat UseStatFields IsPurchase",
     "IDDRStore", "IDGRPriceList", "PDInvoice", "", "P", "=Purchase invoice|P=Prepayment"},
    {"SDOrder", BASE "ComputeTotals UseDiscounts ComputePrices UseSets IsSales UseDeliveryDate UseTermDelivery "
                "UseTermPayment UseRowTax UsePriceCat IsStockDoc UseClientCard UseStatFields UseCompanyMessage",
     "IDDRStore", "IDGRPriceList", "SDOrder", "", "", ""},
    {"DDOrder", "UseTax DefaultTax DropEmptyRows CreatePreReservation CompanyMessageDoc CostRows IsStockDoc "
                "TwoStores ComputeTotals UseSets UseDeliveryDate UseTermDelivery",
     "IDDRStore", "@NoPriceList", "PDOrder", "DDOrder", "P", ""},
    {"PDReceiptD", BASE "UseProductionCost ComputeTotals UsesStockReserve UseSets UseDiscounts ComputePrices "
                   "UseDeliveryDate UseTermDelivery UseTermPayment UseRowTax UsePriceCat IsStockDoc UseStatFields "
                   "IsPurchase IsStoreRow CostRows",
     "IDReceiverStore", "IDGRPriceList", "PDReceiptD", "", "P", "=Receipt|P=Pre-reservation"},
    {"SDConsignmD", BASE "ComputeTotals UseDiscounts UseProductionCost UsesReserveRel ComputePrices UseSets "
                    "IsStockDoc IsSales UseRowTax UsePriceCat UseCompanyMessage UseClientCard UseStatFields "
                    "UseDeliveryDate UseTermDelivery UseTermPayment IsStoreRow CostRows",
     "IDSenderStore", "IDGRPriceList", "SDConsignmD", "", "", "=Shipment|P=Pre-reservation|R=Reservation"},
    {"SDExpenseD", BASE "ComputeTotals UseDiscounts UseProductionCost UsesReserveRel ComputePrices UseSets "
                   "IsStockDoc IsSales UseRowTax UsePriceCat IsStoreRow CostRows",
     "IDSenderStore", "IDGRPriceList", "SDConsignmD", "SDExpenseD", "", "=Expense|P=Pre-reservation|R=Reservation"},
    {"DDMovement", BASE "UseProductionCost ComputeTotals IsStockDoc TwoStores UseSets UsesReserveRel IsStoreRow "
                   "CostRows",
     "IDReceiverStore", "@NoPriceList", "DDMovement", "", "P", "=Movement|P=Pre-reservation"},
    {"DDProduction", BASE "UseProductionCost ComputeTotals IsStockDoc TwoStores UseSets UsesStockReserve "
                     "IsStoreRow CostRows",
     "IDReceiverStore", "@NoPriceList", "DDMovement", "DDProduction", "P", "=Assembly|P=Pre-reservation"},
    {"GUDocument", BASE "ComputeTotals UseDiscounts ComputePrices IsSales UseDeliveryDate UseTermDelivery "
                   "UseTermPayment UseRowTax UsePriceCat IsStockDoc",
     "IDDRStore", "IDGRPriceList", "GUDocument", "", "", ""},
    {"DDCostInvD", BASE "ComputeTotals IsStoreRow CostRows", "IDDRStore", "@NoGRPriceList", "DDCostInvD", "", "P", ""},
    // Not in the profile: the defaults; a "VD" table has no default tax.
    {"VDBank", "UseTax DropEmptyRows CheckCreditRows CreatePreReservation CompanyMessageDoc", "IDDRStore",
     "IDGRPriceList", "VDBank", "", "P", ""},
};
#undef BASE

class Profile : public DocFuncTest {};

TEST_F(Profile, EveryDocumentKind) {
  for (const KindCase& k : kKinds) {
    SCOPED_TRACE(k.docTable);
    Open(k.docTable);
    const DocState& st = State();
    EXPECT_EQ(TrueFlags(st), Sorted(k.flags));
    EXPECT_EQ(st.StoreField, k.storeField);
    EXPECT_EQ(st.PriceListField, k.priceListField);
    EXPECT_EQ(st.RefType, k.refType);
    EXPECT_EQ(st.DocName, k.docName);
    EXPECT_EQ(st.CompanyFieldSuffix, k.suffix);
    EXPECT_EQ(ListText(*session->Proxy(), "DealState"), k.dealStates);
    EXPECT_EQ(st.HeaderOB.get(), session->Header());
    session->Close();
  }
}

// Kinds the reference host has no document session for, on a form of their own.
TEST_F(Profile, KindsWithoutRowsAndUnknownTables) {
  struct Case {
    const char* table;
    const char* flags;
    const char* articleField;
    const char* unitPriceField;
  } cases[] = {
      {"CDRebuilding", "UseTax CheckCreditRows CreatePreReservation CompanyMessageDoc ComputeTotals "
                       "UseTermDelivery UseTermPayment UseRowTax IsAssetRow",
       "IDSenderArticle", "@NoUnitPrice"},
      {"CDReceipts", "UseTax CheckCreditRows CreatePreReservation CompanyMessageDoc ComputeTotals UseTermDelivery "
                     "UseTermPayment UseRowTax IsAssetRow",
       "IDReceiverArticle", "@NoUnitPrice"},
      {"WDPayout", "DefaultTax DropEmptyRows CheckCreditRows CreatePreReservation CompanyMessageDoc ComputeTotals",
       "IDGRArticle", "UnitPrice"},
      {"BDBookingO", "UseTax DefaultTax CheckCreditRows CreatePreReservation CompanyMessageDoc ComputeTotals",
       "IDGRArticle", "UnitPrice"},
      {"NoSuchTable", "UseTax DefaultTax DropEmptyRows CheckCreditRows CreatePreReservation CompanyMessageDoc",
       "IDGRArticle", "UnitPrice"},  // unknown: the defaults only
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.table);
    Form f = MakeForm(*conn, c.table);
    df = Wire(f.doc, f.data, conn->Server());
    EXPECT_EQ(TrueFlags(State()), Sorted(c.flags));
    EXPECT_EQ(State().ArticleField, c.articleField);
    EXPECT_EQ(State().UnitPriceField, c.unitPriceField);
    EXPECT_EQ(ListText(*f.doc, "DocState"), "=|H=Partial|P=Exported|F=Finished");
    EXPECT_EQ(f.doc->CValuelists()->Count(), 7);  // the field lists; no DealState, no table lists
  }
}

TEST_F(Profile, OptionsAreReadWithTheirSectionsAndKeys) {
  SetOption("SDInvoice", "CheckCreditLimit", Variant(-1));
  SetOption("SDConsignmD", "CheckStockReserve", Variant(-1));
  SetOption("SDConsignmD", "AmountFromSDOrder", Variant(-1));
  SetOption("DRStore", "FillDRStockReserveFifo", Variant(3));
  SetOption("DRStore", "ComputeSetQuantity", Variant(2));
  SetOption("GDocument", "DocDateLimit", Variant(30));
  conn->SetUserOption(0, "CostCounting", "CostByStore", Variant(-1));
  SetOption("SDOrder", "CheckCreditLimit", Variant(-1), 2);  // another user's option is not read
  Open("SDInvoice");
  EXPECT_TRUE(State().CheckCreditLimit);
  EXPECT_EQ(State().DocDateLimit, 30);
  EXPECT_EQ(State().RoundingQuantity, -1);  // default True
  Open("SDOrder");
  EXPECT_FALSE(State().CheckCreditLimit);
  Open("SDConsignmD");
  EXPECT_TRUE(State().CheckStockReserve);
  EXPECT_FALSE(State().CheckLotReserve);
  EXPECT_TRUE(State().AmountFromOrder);
  EXPECT_EQ(State().FillReserveFifo, 3);
  EXPECT_EQ(State().ComputeSetQuantity, 2);
  EXPECT_TRUE(State().CostByStore);
  Open("PDReceiptD");  // reads the stock checks of the shipments
  EXPECT_TRUE(State().CheckStockReserve);
  EXPECT_FALSE(State().AmountFromOrder);
  EXPECT_EQ(State().ReserveTable, "DRStockReserve");
}

TEST_F(Profile, CompanyMessageKindsAndQuantityPrices) {
  struct Case {
    const char* option;
    const char* docTable;
    bool shown;
  } cases[] = {
      {"", "PDInvoice", true},  // empty: every kind
      {" SDInvoice , SDOrder ", "SDInvoice", true},
      {" SDInvoice , SDOrder ", "sdorder", true},
      {" SDInvoice , SDOrder ", "PDInvoice", false},
      {"SDInvoiceX", "SDInvoice", false},  // names compare whole
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(std::string(c.option) + " " + c.docTable);
    SetOption("GRCompany", "CompanyMessage", Variant(c.option));
    Open(c.docTable);
    EXPECT_EQ(State().CompanyMessageDoc, c.shown);
    EXPECT_FALSE(State().HasQuantityPrices);  // no quantity steps: Min(ID) is Null
  }
  conn->db().ExecScript("INSERT INTO GRPriceLQuantity (ID, IDGRPriceListRel, Quantity) VALUES (4, 1, 10)");
  Open("SDInvoice");
  EXPECT_TRUE(State().HasQuantityPrices);
}

TEST_F(Profile, FieldValueLists) {
  Open("SDInvoice");
  XALSBEproxy& doc = *session->Proxy();
  EXPECT_EQ(ListText(doc, "SDInvoiceRow.CompletionType"), "=|C=Set|D=Particular");
  EXPECT_EQ(ListText(doc, "ArticleType"), "G=Item|P=Production|S=Service");
  EXPECT_EQ(ListText(doc, "SDInvoiceRow.ArticleType"), "G=Item|P=Production|S=Service");
  EXPECT_EQ(ListText(doc, "BookState"),
            "N=|S=Missing book. algorithm|DE=Error on saving doc.|IE=Invalid book. algorithm|BE=Doc. is edited|"
            "CE=Creation error|SE=Error on booking|NE=Not bookable|OK=Booked");
  EXPECT_EQ(ListText(doc, "UsePackage"), "=|Y=Yes|N=No");
  EXPECT_EQ(ListText(doc, "Record_State"), "=|A=Archived");
  Open("DDProduction");
  EXPECT_EQ(ListText(*session->Proxy(), "DDStoreDRow.CompletionType"), "=|P=Set|A=Particular|R=Reversed Set");
  conn->SetLanguage(4);
  Open("SDInvoice");
  EXPECT_EQ(ListText(*session->Proxy(), "DealState"), "=Arve|P=Ettemaks");
  EXPECT_EQ(CurrentLangID(), 4);
}

TEST_F(Profile, RegisterFormsListTablesWithTheirCaptions) {
  conn->db().ExecScript("INSERT INTO XALMessage (MsgKey, Kind, English) VALUES ('VDBank', 2, 'Bank voucher'),"
                        " ('SDInvoice', 2, 'Sales invoice');");
  Form types = MakeForm(*conn, "GRDocType");
  df = Wire(types.doc, types.data, conn->Server());
  const std::string docTypes = ListText(*types.doc, "DocType");
  EXPECT_NE(docTypes.find("SDInvoice=Sales invoice|"), std::string::npos);
  EXPECT_NE(docTypes.find("VDBankOutgo=Bank voucher expenditure|VDBankIncome=Bank voucher income|"), std::string::npos);
  EXPECT_EQ(docTypes.find("VDBank="), std::string::npos);
  EXPECT_EQ(docTypes.find("GRArticle"), std::string::npos);  // registers are not documents

  Form series = MakeForm(*conn, "GRDocSeries");
  df = Wire(series.doc, series.data, conn->Server());
  EXPECT_EQ(ListText(*series.doc, "DocType"), "DRStoreOut=Warehouse document");
  EXPECT_NE(ListText(*series.doc, "@DocName").find("PDInvoice=PDInvoice"), std::string::npos);

  Form reports = MakeForm(*conn, "GRReport");
  df = Wire(reports.doc, reports.data, conn->Server());
  const std::string tables = ListText(*reports.doc, "XALType");
  EXPECT_NE(tables.find("GRArticle=GRArticle"), std::string::npos);
  EXPECT_EQ(tables.find("XALUser"), std::string::npos);  // a system table not listed
  EXPECT_NE(tables.find("GRFilter=GRFilter|XALOptionList=XALOptionList|XALLog=XALLog|XALScript=XALScript|"
                        "XALForms=XALForms"),
            std::string::npos);
}

// Row forms: the rows are the form's data object, the header the parent form's.
TEST_F(Profile, RowFormsFollowTheirHeader) {
  struct Case {
    const char* header;
    const char* refType;  // written into the header's field
    const char* rowTable;
    const char* storeField;
    bool computePrices;
    bool isSales;
  } cases[] = {
      {"PDReceiptD", "PDReceiptD", "DDStoreDRow", "IDReceiverStore", true, false},
      {"SDConsignmD", "SDConsignmD", "DDStoreDRow", "IDSenderStore", true, true},
      {"DDMovement", "DDMovement", "DDStoreDRow", "IDSenderStore", false, false},
      {"SDInvoice", "SDInvoice", "SDInvoiceRow", "IDDRStore", true, true},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.header);
    auto header = host::DocumentSession::Open(conn, c.header);
    header->Header()->SetField("RefType", Variant(c.refType));
    Form row = MakeForm(*conn, c.rowTable);
    row.doc->SetParent(header->Proxy());
    df = Wire(row.doc, row.data, conn->Server());
    EXPECT_TRUE(State().IsRowArea);
    EXPECT_EQ(State().StoreField, c.storeField);
    EXPECT_EQ(State().ComputePrices, c.computePrices);
    EXPECT_EQ(State().IsSales, c.isSales);
    EXPECT_EQ(State().PriceListField, "@IDGRPriceList");
    EXPECT_EQ(State().RowOB.get(), row.data);
    EXPECT_EQ(State().HeaderOB.get(), header->Header());
  }
  // A store order's rows are cost rows taken from the sending store.
  auto order = host::DocumentSession::Open(conn, "DDOrder");
  order->Header()->SetField("DocName", Variant("DDOrder"));
  Form row = MakeForm(*conn, "PDOrderRow");
  row.doc->SetParent(order->Proxy());
  df = Wire(row.doc, row.data, conn->Server());
  EXPECT_EQ(TrueFlags(State()).find("ComputePrices"), std::string::npos);
  EXPECT_TRUE(State().CostRows);
  EXPECT_EQ(State().RowValueField, "Amount");
  EXPECT_EQ(State().StoreField, "IDSenderStore");
}

}  // namespace
}  // namespace xal::docfunc::testing
