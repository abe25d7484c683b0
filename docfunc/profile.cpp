// The document-kind profile: what Create derives from the table behind DocData. One data table
// says, per group of document tables, which flags are set, which field names and settings change,
// which options are read (section, key, default) and which deal states the kind offers; then come
// the closing steps every kind runs, the value lists of the fields, and the table-name lists of the
// register forms, whose texts are the host's captions from its table catalogue.
#include <optional>
#include <string_view>
#include <variant>
#include <vector>

#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/values.h"
#include "runtime/text.h"
#include "server/sql_utils.h"

namespace xal {

using namespace docfunc;  // NOLINT: the value readers of this folder

namespace {

using Flag = bool DocState::*;
using Number = int16_t DocState::*;
using Text = std::string DocState::*;

// Sections of an option that are not a fixed name.
constexpr const char* kSectionDocTable = nullptr;  // the document's own table
constexpr const char* kSectionHeader = "";         // the table of the header form above a row form

// An option read by Create into a flag (default False) or a number (default 0).
struct OptionRead {
  std::variant<Flag, Number> target;
  const char* section;
  const char* key;
};

// When a row of the profile applies beyond its table names: tests on the header form above a row
// form (its table, or its "RefType" / "DocName" field).
struct HeaderTest {
  enum Kind { kAlways, kTableIn, kTableNotIn, kRefTypeIs, kDocNameIs, kDocNameIsNot, kStoreDocIs };
  Kind kind = kAlways;
  std::initializer_list<std::string_view> names = {};
};

struct ListEntry {
  std::string_view value;
  int32_t text;
};

// The value of a text setting "$DocTable" is the document's own table name.
constexpr std::string_view kDocTableValue = "$DocTable";

// The capital-asset documents name their row fields after the side they work on.
enum class AssetSide { kNone, kReceiver, kSender };

struct ProfileRow {
  std::initializer_list<std::string_view> tables = {};
  HeaderTest when = {};
  std::initializer_list<Flag> setTrue = {};
  std::initializer_list<Flag> setFalse = {};
  std::initializer_list<std::pair<Text, std::string_view>> texts = {};
  std::initializer_list<OptionRead> options = {};
  std::initializer_list<ListEntry> dealStates = {};
  bool rowFormBindings = false;
  std::initializer_list<ListEntry> completionTypes = {};  // replaces the row table's CompletionType list
  AssetSide assetFields = AssetSide::kNone;
};

using S = DocState;
const Variant kOff(false);
const Variant kZero(int32_t{0});

// Option reads that several kinds share.
constexpr OptionRead kCampaignStock{&S::UseCampaignStock, "DRStore", "UseCampaignStock"};
constexpr OptionRead kCreditLimit{&S::CheckCreditLimit, kSectionDocTable, "CheckCreditLimit"};
constexpr OptionRead kFifo{&S::FillReserveFifo, "DRStore", "FillDRStockReserveFifo"};
constexpr OptionRead StockCheck(const char* section) { return {&S::CheckStockReserve, section, "CheckStockReserve"}; }
constexpr OptionRead LotCheck(const char* section) { return {&S::CheckLotReserve, section, "CheckLotReserve"}; }

// Row field names of the capital-asset documents on their receiving and sending side.
struct AssetField {
  Text field;
  std::string_view receiver, sender;
};
constexpr AssetField kAssetFields[] = {
    {&S::ArticleField, "IDReceiverArticle", "IDSenderArticle"},
    {&S::StoreField, "IDReceiverStore", "IDSenderStore"},
    {&S::DepartmentField, "IDReceiverDepartment", "IDSenderDepartment"},
    {&S::ProjectField, "IDReceiverProject", "IDSenderProject"},
    {&S::WorkerField, "IDReceiverWorker", "IDSenderWorker"},
    {&S::ARegisterField, "IDReceiverGARegister", "IDSenderGARegister"},
    {&S::BRegisterField, "IDReceiverGBRegister", "IDSenderGBRegister"},
};

// The price fields of the capital-asset documents, which have no prices: reads give nothing and
// writes go to scratch fields.
const std::initializer_list<std::pair<Text, std::string_view>> kAssetPriceFields = {
    {&S::PriceListField, "@NoGRPriceList"}, {&S::CompletionTypeField, "@CompletionType"},
    {&S::UnitPriceField, "@NoUnitPrice"},   {&S::PriceField, "@NoPrice"},
    {&S::PriceListIDField, "@NoIDGRPriceList"}, {&S::CPriceListField, "@NoIDGRCPriceList"}};

// The profile, one row per group of document tables. Every row whose tables name the document's
// table (any letter case) and whose header test holds applies, in table order; the groups of one
// kind are written as one row where they can be.
const ProfileRow kProfile[] = {
    {.tables = {"GUDocument"},
     .setTrue = {&S::ComputeTotals, &S::UseDiscounts, &S::ComputePrices, &S::IsSales, &S::UseDeliveryDate,
                 &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax, &S::UsePriceCat, &S::IsStockDoc}},
    {.tables = {"WDAccount", "WDHoldback", "WDPayout"},
     .setTrue = {&S::ComputeTotals},
     .setFalse = {&S::UseTax},
     .texts = {{&S::PriceListField, "@NoGRPriceList"}, {&S::CompletionTypeField, "@CompletionType"}}},
    {.tables = {"PDOrder"},
     .setTrue = {&S::ComputeTotals, &S::UseSets, &S::UseDiscounts, &S::ComputePrices, &S::UseDeliveryDate,
                 &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax, &S::UsePriceCat, &S::UseStatFields,
                 &S::IsPurchase}},
    {.tables = {"DDOrder"},
     .setTrue = {&S::CostRows, &S::IsStockDoc, &S::TwoStores, &S::ComputeTotals, &S::UseSets, &S::UseDeliveryDate,
                 &S::UseTermDelivery},
     .setFalse = {&S::CheckCreditRows},
     .texts = {{&S::RefType, "PDOrder"}, {&S::DocName, "DDOrder"}, {&S::RowValueField, "Amount"},
               {&S::PriceListField, "@NoPriceList"}}},
    {.tables = {"SDOrder"},
     .setTrue = {&S::ComputeTotals, &S::UseDiscounts, &S::ComputePrices, &S::UseSets, &S::IsSales,
                 &S::UseDeliveryDate, &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax, &S::UsePriceCat,
                 &S::IsStockDoc, &S::UseClientCard, &S::UseStatFields, &S::UseCompanyMessage},
     .options = {kCreditLimit, kCampaignStock}},
    {.tables = {"PDInvoice"},
     .setTrue = {&S::ComputeTotals, &S::UseSets, &S::UseDiscounts, &S::ComputePrices, &S::UseDeliveryDate,
                 &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax, &S::UsePriceCat, &S::UseStatFields,
                 &S::IsPurchase},
     .dealStates = {{"", 33}, {"P", 35}}},
    {.tables = {"SDInvoice"},
     .setTrue = {&S::UseCompanyMessage, &S::ComputeTotals, &S::UseDiscounts, &S::UseSets, &S::ComputePrices,
                 &S::IsSales, &S::UseDeliveryDate, &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax,
                 &S::UsePriceCat, &S::UseClientCard, &S::UseStatFields},
     .options = {kCreditLimit},
     .dealStates = {{"", 34}, {"P", 35}}},
    {.tables = {"PDReceiptD"},
     .setTrue = {&S::UseProductionCost, &S::ComputeTotals, &S::UsesStockReserve, &S::UseSets, &S::UseDiscounts,
                 &S::ComputePrices, &S::UseDeliveryDate, &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax,
                 &S::UsePriceCat, &S::IsStockDoc, &S::UseStatFields, &S::IsPurchase},
     .texts = {{&S::StoreField, "IDReceiverStore"}, {&S::ReserveTable, "DRStockReserve"}},
     .options = {StockCheck("SDConsignmD"), LotCheck("SDConsignmD"),
                 {&S::AmountFromOrder, "PDReceiptD", "AmountFromPDOrder"}},
     .dealStates = {{"", 38}, {"P", 36}}},
    {.tables = {"SDConsignmD", "SDExpenseD"},
     .setTrue = {&S::ComputeTotals, &S::UseDiscounts, &S::UseProductionCost, &S::UsesReserveRel, &S::ComputePrices,
                 &S::UseSets, &S::IsStockDoc, &S::IsSales, &S::UseRowTax, &S::UsePriceCat},
     .texts = {{&S::StoreField, "IDSenderStore"}, {&S::ReserveTable, "DRStockReserveRel"}},
     .options = {StockCheck(kSectionDocTable), LotCheck(kSectionDocTable), kCreditLimit,
                 {&S::AmountFromOrder, "SDConsignmD", "AmountFromSDOrder"},
                 {&S::MinQuantityMessage, "GRArticle", "MinQuantityMessage"},
                 {&S::PriceByOrderedQuantity, "DRStore", "PriceByOrderedQuantity"}, kFifo}},
    {.tables = {"SDConsignmD"},
     .setTrue = {&S::UseCompanyMessage, &S::UseClientCard, &S::UseStatFields, &S::UseDeliveryDate,
                 &S::UseTermDelivery, &S::UseTermPayment},
     .options = {kCampaignStock},
     .dealStates = {{"", 39}, {"P", 36}, {"R", 37}}},
    {.tables = {"SDExpenseD"},
     .texts = {{&S::RefType, "SDConsignmD"}, {&S::DocName, kDocTableValue}},
     .dealStates = {{"", 40}, {"P", 36}, {"R", 37}}},
    {.tables = {"DDMovement", "DDProduction"},
     .setTrue = {&S::UseProductionCost, &S::ComputeTotals, &S::IsStockDoc, &S::TwoStores, &S::UseSets},
     .texts = {{&S::StoreField, "IDReceiverStore"}, {&S::PriceListField, "@NoPriceList"}},
     .options = {StockCheck(kSectionDocTable), LotCheck(kSectionDocTable)}},
    {.tables = {"DDMovement"},
     .setTrue = {&S::UsesReserveRel},
     .texts = {{&S::ReserveTable, "DRStockReserveRel"}},
     .options = {kFifo},
     .dealStates = {{"", 41}, {"P", 36}}},
    {.tables = {"DDProduction"},
     .setTrue = {&S::UsesStockReserve},
     .texts = {{&S::RefType, "DDMovement"}, {&S::DocName, kDocTableValue}, {&S::ReserveTable, "DRStockReserve"}},
     .dealStates = {{"", 42}, {"P", 36}},
     .completionTypes = {{"", 0}, {"P", 7}, {"A", 8}, {"R", 9}}},
    {.tables = {"CDReceipts", "CDMovement", "CDConsumption", "CDAmortizing"},
     .setTrue = {&S::ComputeTotals, &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax},
     .setFalse = {&S::UseSets, &S::DropEmptyRows, &S::DefaultTax},
     .texts = kAssetPriceFields,
     .assetFields = AssetSide::kReceiver},
    {.tables = {"CDRebuilding"},
     .setTrue = {&S::ComputeTotals, &S::UseTermDelivery, &S::UseTermPayment, &S::UseRowTax},
     .setFalse = {&S::UseSets, &S::DropEmptyRows, &S::DefaultTax},
     .texts = kAssetPriceFields,
     .assetFields = AssetSide::kSender},
    {.tables = {"BDBookingO", "VDBalanceDoc", "DDCostInvD", "GDContract"},
     .setTrue = {&S::ComputeTotals},
     .setFalse = {&S::UseSets},
     .texts = {{&S::PriceListField, "@NoGRPriceList"}, {&S::CompletionTypeField, "@CompletionType"}}},
    {.tables = {"BDBookingO", "VDBalanceDoc", "GDContract"}, .setFalse = {&S::DropEmptyRows}},
    // Row forms.
    {.tables = {"DDStoreDRow"},
     .setTrue = {&S::IsRowArea, &S::IsStockDoc},
     .texts = {{&S::PriceListField, "@IDGRPriceList"}, {&S::StoreField, "IDSenderStore"}},
     .options = {StockCheck(kSectionHeader), LotCheck(kSectionHeader), kFifo},
     .rowFormBindings = true},
    {.tables = {"DDStoreDRow"},
     .when = {HeaderTest::kTableNotIn, {"DDProduction", "DDMovement"}},
     .setTrue = {&S::ComputePrices, &S::UsePriceCat}},
    {.tables = {"DDStoreDRow"},
     .when = {HeaderTest::kTableIn, {"SDConsignmD", "SDExpenseD"}},
     .setTrue = {&S::IsSales}},
    {.tables = {"DDStoreDRow"},
     .when = {HeaderTest::kRefTypeIs, {"PDReceiptD"}},
     .texts = {{&S::StoreField, "IDReceiverStore"}}},
    {.tables = {"DDStoreDRow"}, .when = {HeaderTest::kTableIn, {"SDConsignmD"}}, .options = {kCampaignStock}},
    {.tables = {"GUDocumentRow", "SDInvoiceRow", "SDOrderRow"},
     .setTrue = {&S::IsRowArea, &S::ComputePrices, &S::UsePriceCat, &S::IsSales},
     .texts = {{&S::PriceListField, "@IDGRPriceList"}},
     .rowFormBindings = true},
    {.tables = {"SDOrderRow"}, .options = {kCampaignStock}},
    {.tables = {"PDInvoiceRow"},
     .setTrue = {&S::IsRowArea, &S::ComputePrices, &S::UsePriceCat},
     .texts = {{&S::PriceListField, "@IDGRPriceList"}},
     .rowFormBindings = true},
    {.tables = {"PDOrderRow"},
     .setTrue = {&S::IsRowArea},
     .texts = {{&S::PriceListField, "@IDGRPriceList"}},
     .rowFormBindings = true},
    {.tables = {"PDOrderRow"},
     .when = {HeaderTest::kDocNameIs, {"DDOrder"}},
     .setTrue = {&S::CostRows, &S::IsStockDoc},
     .texts = {{&S::RowValueField, "Amount"}, {&S::StoreField, "IDSenderStore"}}},
    {.tables = {"PDOrderRow"},
     .when = {HeaderTest::kDocNameIsNot, {"DDOrder"}},
     .setTrue = {&S::ComputePrices, &S::UsePriceCat}},
    {.tables = {"DRStockReserveRel"}, .texts = {{&S::StoreField, "IDSenderStore"}}},
    {.tables = {"DRStockReserveRel"},
     .when = {HeaderTest::kStoreDocIs, {"PDReceiptD"}},
     .texts = {{&S::StoreField, "IDReceiverStore"}}},
};

}  // namespace

// ---------------------------------------------------------------------------------------------
// Create
// ---------------------------------------------------------------------------------------------

// Configures the object for its kind of document. Every step runs with errors resumed at the
// next statement: a missing option, catalogue entry or host object leaves that field at its
// default and the remaining steps still run.
void DocFunc::Create() {
  ApplyDefaults();
  TryStep([&] { st_.Connect = st_.Server->Connection(); });
  TryStep([&] { SetCurrentLangID(CLng(st_.Connect->Server()->Property(kServerPropLanguage))); });
  TryStep([&] { st_.UserID = st_.Connect->UserID(); });
  TryStep([&] { st_.DocTable = st_.DocData->TableName(); });
  st_.RefType = st_.DocTable;
  st_.RowTable = server::GetRowName(st_.DocTable);
  st_.HeaderOB = st_.DocData.get();
  if (TextEquals(st_.RowTable, "DDStoreDRow")) {
    st_.IsStoreRow = st_.CostRows = true;
  } else if (TextEquals(st_.RowTable, "CADocRow")) {
    st_.IsAssetRow = true;
    st_.UnitField = "CRCapitalAssets.IDGRUnit";
  }
  FillValueLists();
  TryStep([&] { st_.RoundingQuantity = CInt(UserOption("GDocument", "RoundingQuantity", Variant(true))); });
  TryStep([&] { st_.CreatePreReservation = FlagOf(UserOption("DRStore", "CreatePreReservation", Variant(true))); });
  TryStep([&] {
    st_.StockReservePreReservation = FlagOf(UserOption("DRStore", "StockReservePreReservation", kOff));
  });
  ApplyProfile();
  FillRegisterLists();
  ApplyClosingSteps();
}

// The state of a fresh object with the kind-independent defaults; the host objects and the
// handler call stack are kept (Create may run inside a handler).
void DocFunc::ApplyDefaults() {
  DocState fresh;
  fresh.Doc = st_.Doc;
  fresh.DocData = st_.DocData;
  fresh.Server = st_.Server;
  fresh.CallDepth = st_.CallDepth;
  fresh.CallName = st_.CallName;
  fresh.RowMarks = std::move(st_.RowMarks);
  fresh.Evaluator = st_.Evaluator;
  st_ = std::move(fresh);
  st_.UseTax = st_.DefaultTax = st_.DropEmptyRows = st_.CheckCreditRows = true;
}

namespace {

// What a row form knows of the forms above it.
struct HeaderInfo {
  std::string table, refType, docName;
  std::string storeDoc;  // the table of the store document above the parent row form
};

HeaderInfo ReadHeaderInfo(const Checked<XALSBEproxy>& doc) {
  HeaderInfo h;
  Ref<XALSBEproxy> parent = TryOr([&] { return doc->Parent(); }, Ref<XALSBEproxy>());
  if (!parent) return h;
  TryStep([&] {
    Ref<DataObject> header = parent->DataObject("DocData");
    h.table = Require(header).TableName();
    h.refType = TextOf(header->Field("RefType"));
    h.docName = TextOf(header->Field("DocName"));
  });
  TryStep([&] { h.storeDoc = Require(Require(parent->Parent()).DataObject("DocData")).TableName(); });
  return h;
}

bool HeaderTestHolds(const HeaderTest& t, const HeaderInfo& h) {
  switch (t.kind) {
    case HeaderTest::kAlways: return true;
    case HeaderTest::kTableIn: return NameIn(h.table, t.names);
    case HeaderTest::kTableNotIn: return !NameIn(h.table, t.names);
    case HeaderTest::kRefTypeIs: return NameIn(h.refType, t.names);
    case HeaderTest::kDocNameIs: return NameIn(h.docName, t.names);
    case HeaderTest::kDocNameIsNot: return !NameIn(h.docName, t.names);
    case HeaderTest::kStoreDocIs: return NameIn(h.storeDoc, t.names);
  }
  return false;
}

// Fills a field's value list; `replace` empties it first.
void FillList(XALSBEproxy& doc, const std::string& field, std::initializer_list<ListEntry> entries, bool replace) {
  Ref<ValueTexts> list = doc.ValueLists(field);
  if (!list) return;
  if (replace) list->Clear();
  for (const ListEntry& e : entries)
    list->Add(Variant(std::string(e.value)), e.text == 0 ? std::string() : GetUIString(e.text));
}

}  // namespace

// Every profile row that names the document's table and whose header test holds, in order. What
// the forms above know is read once, when a row first asks.
void DocFunc::ApplyProfile() {
  std::optional<HeaderInfo> header;
  auto above = [&]() -> const HeaderInfo& {
    if (!header) header = ReadHeaderInfo(st_.Doc);
    return *header;
  };
  for (const ProfileRow& row : kProfile) {
    if (!NameIn(st_.DocTable, row.tables)) continue;
    if (row.when.kind != HeaderTest::kAlways && !HeaderTestHolds(row.when, above())) continue;
    for (Flag f : row.setTrue) st_.*f = true;
    for (Flag f : row.setFalse) st_.*f = false;
    for (const auto& [field, value] : row.texts)
      st_.*field = value == kDocTableValue ? st_.DocTable : std::string(value);
    if (row.assetFields != AssetSide::kNone)
      for (const AssetField& a : kAssetFields)
        st_.*a.field = std::string(row.assetFields == AssetSide::kSender ? a.sender : a.receiver);
    for (const OptionRead& o : row.options) {
      const std::string section = o.section == kSectionDocTable ? st_.DocTable
                                  : *o.section == '\0'         ? above().table
                                                               : std::string(o.section);
      TryStep([&] {
        if (const Flag* f = std::get_if<Flag>(&o.target))
          st_.**f = FlagOf(UserOption(section, o.key, kOff));
        else
          st_.*std::get<Number>(o.target) = CInt(UserOption(section, o.key, kZero));
      });
    }
    if (row.dealStates.size() != 0) TryStep([&] { FillList(*st_.Doc, "DealState", row.dealStates, false); });
    if (row.completionTypes.size() != 0)
      TryStep([&] { FillList(*st_.Doc, st_.RowTable + ".CompletionType", row.completionTypes, true); });
    if (row.rowFormBindings) BindRowForm();
  }
}

// On a row form the rows are the form's own data object, the row set is the owner of its owner,
// and the header is the parent form's data object.
void DocFunc::BindRowForm() {
  st_.RowOB = st_.DocData.get();
  TryStep([&] { st_.RowsOB = Require(st_.DocData->Owner()).Owner(); });
  TryStep([&] { st_.HeaderOB = Require(st_.Doc->Parent()).DataObject("DocData"); });
}

// The steps every kind runs after its profile row.
void DocFunc::ApplyClosingSteps() {
  if (st_.IsStockDoc)
    TryStep([&] { st_.ComputeSetQuantity = CInt(UserOption("DRStore", "ComputeSetQuantity", kZero)); });
  if (Like(UCase(st_.DocTable), "VD*")) st_.DefaultTax = false;
  if (!st_.IsSales) st_.CompanyFieldSuffix = "P";
  if (st_.CostRows) TryStep([&] { st_.CostByStore = FlagOf(SystemOption("CostCounting", "CostByStore", kOff)); });
  TryStep([&] { st_.DocDateLimit = CInt(UserOption("GDocument", "DocDateLimit", kZero)); });
  // An empty list enables the company message on every kind; otherwise only on the kinds listed.
  TryStep([&] {
    const std::string kinds = TrimmedOf(UserOption("GRCompany", "CompanyMessage", Variant("")));
    st_.CompanyMessageDoc = kinds.empty();
    for (const std::string& k : Split(kinds, ","))
      if (TextEquals(Trim(k), st_.DocTable)) st_.CompanyMessageDoc = true;
  });
  // "Min" over no rows is one row holding Null: the value tells whether any quantity step exists.
  TryStep([&] {
    Ref<DataObject> q = OpenQuery("SELECT Min(ID) AS tmpID FROM GRPriceLQuantity");
    st_.HasQuantityPrices = !q->IsEOF() && !IsBlank(q->Field("tmpID"));
  });
}

// ---------------------------------------------------------------------------------------------
// Value lists
// ---------------------------------------------------------------------------------------------

namespace {

struct FieldList {
  const char* field;  // a leading "." is appended to the row table's name
  std::initializer_list<ListEntry> entries;
};

const FieldList kFieldLists[] = {
    {".CompletionType", {{"", 0}, {"C", 7}, {"D", 8}}},
    {"ArticleType", {{"G", 19}, {"P", 20}, {"S", 21}}},
    {".ArticleType", {{"G", 19}, {"P", 20}, {"S", 21}}},
    {"DocState", {{"", 0}, {"H", 22}, {"P", 23}, {"F", 24}}},
    {"BookState", {{"N", 0}, {"S", 25}, {"DE", 26}, {"IE", 27}, {"BE", 28}, {"CE", 32}, {"SE", 29}, {"NE", 30},
                   {"OK", 31}}},
    {"UsePackage", {{"", 0}, {"Y", 44}, {"N", 45}}},
    {"Record_State", {{"", 0}, {"A", 43}}},
};

// The register forms whose fields list table names, and where the names come from.
struct RegisterList {
  std::string_view form;
  std::string_view list;
  bool documents;  // the document tables (with cash and bank split in two); else every table
};

constexpr RegisterList kRegisterLists[] = {
    {"GRDocType", "DocType", true},       {"GRDocSeries", "@DocName", true}, {"XALOptionList", "TableName", false},
    {"XALMacro", "DocType", false},       {"XALForms", "XALID", false},      {"GRReport", "XALType", false},
    {"GRFilter", "XALType", false},       {"XALScript", "XALType", false},
};

// System tables the register forms list besides the tables that are not system tables.
constexpr std::string_view kListedSystemTables[] = {"GRFilter", "XALOptionList", "XALLog", "XALScript", "XALForms"};

}  // namespace

void DocFunc::FillValueLists() {
  for (const FieldList& l : kFieldLists) {
    const std::string field = l.field[0] == '.' ? st_.RowTable + l.field : std::string(l.field);
    TryStep([&] { FillList(*st_.Doc, field, l.entries, false); });
  }
}

// The table-name lists of the register forms, with the host's captions as texts.
void DocFunc::FillRegisterLists() {
  for (const RegisterList& r : kRegisterLists) {
    if (!TextEquals(st_.DocTable, r.form)) continue;
    TryStep([&] {
      Checked<ValueTexts> list = st_.Doc->ValueLists(std::string(r.list));
      Checked<ParamList> catalogue = st_.Server->TableCatalogue();
      if (TextEquals(r.form, "GRDocSeries")) {
        Checked<ValueTexts> types = st_.Doc->ValueLists("DocType");
        types->Add(Variant("DRStoreOut"), GetUIString(51));
      }
      auto add = [&](const std::string& name, const std::string& text) { list->Add(Variant(name), text); };
      for (int32_t i = 1; i <= catalogue->Count(); ++i) {
        const std::string name = catalogue->NameAt(i);
        Variant entry = catalogue->Item(name);
        auto info = std::dynamic_pointer_cast<ParamList>(entry.IsObject() ? entry.AsObject() : nullptr);
        if (!info) continue;
        const std::string caption = HostText(name);
        if (!r.documents) {
          if (!FlagOf(info->Item("SystemTable"))) add(name, caption);
        } else if (FlagOf(info->Item("isDocument"))) {
          const std::string upper = UCase(name);
          if (upper == "VDCASH" || upper == "VDBANK") {
            add(name + "Outgo", caption + " " + GetUIString(17));
            add(name + "Income", caption + " " + GetUIString(18));
          } else if (upper != "VDVOUCHER") {
            add(name, caption);
          }
        }
      }
      if (!r.documents)
        for (std::string_view t : kListedSystemTables) add(std::string(t), HostText(std::string(t)));
    });
  }
}

}  // namespace xal
