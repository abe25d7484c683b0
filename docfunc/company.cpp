// The company and the partner of a document. Choosing the company shows its message, guards
// invoices made from several deliveries, names the partner, checks the credit limit, and fills
// the contact, names, accounts, terms, tax, worker and prices from the company; choosing the
// partner fills its own side and, as far as the caller allows, the same dependent fields.
#include <initializer_list>

#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/values.h"
#include "runtime/format.h"
#include "runtime/text.h"
#include "server/currency.h"
#include "server/sql_utils.h"

namespace xal {

using namespace docfunc;  // NOLINT: the value readers of this folder

namespace {

const Variant kNone(int32_t{0});

// Which dependent field a document kind takes.
enum class Need { kAlways, kTermDelivery, kDefaultTax, kSales, kPurchase, kPriceCat, kPriceCatTermPayment };

// A header field filled from the same-named (or `source`) field of the company or the partner;
// `suffixed` fields read the supplier-side column on purchase documents.
struct DependentField {
  const char* target;
  const char* source;
  bool suffixed;
  Need need;
};

// What both the company and the partner fill.
constexpr DependentField kDependentFields[] = {
    {"IDGRCurrency", "IDGRCurrency", false, Need::kAlways},
    {"IDGRTermDelivery", "IDGRTermDelivery", true, Need::kTermDelivery},
    {"IDGRTax", "IDGRTax", false, Need::kDefaultTax},
    {"IDWorker", "IDSalesManager", false, Need::kSales},
    {"IDWorker", "IDPurchasingAgent", false, Need::kPurchase},
};

// The price fields a partner fills; the company's follow their own rule (RefillFromCompany).
constexpr DependentField kPartnerPriceFields[] = {
    {"IDGRCompanyPriceCat", "IDGRCompanyPriceCat", true, Need::kPriceCat},
    {"IDGRPriceList", "IDGRPriceList", true, Need::kPriceCat},
    {"IDGRTermPayment", "IDGRTermPayment", true, Need::kPriceCatTermPayment},
};

// The foreign-trade fields a partner fills.
constexpr DependentField kForeignTradeFields[] = {
    {"IDDRIntrTermDelivery", "IDDRIntrTermDelivery", false, Need::kAlways},
    {"IDDRIntrTransport", "IDDRIntrTransport", false, Need::kAlways},
    {"IDDRIntrCustomsProc", "IDDRIntrCustomsProc", false, Need::kAlways},
    {"DeliveryLocation", "DeliveryLocation", false, Need::kAlways},
    {"Country", "Country", false, Need::kAlways},
};

// The account a company brings when the user's option "FillBRAccount" is set, by document kind.
struct AccountFill {
  const char* docTable;
  const char* target;
  const char* source;
};
constexpr AccountFill kAccountFills[] = {
    {"PDOrder", "IDBRAccount", "IDPurchaseAccount"},       {"PDInvoice", "IDBRAccount", "IDPurchaseAccount"},
    {"PDReceiptD", "IDPurchaseAccount", "IDPurchaseAccount"}, {"SDOrder", "IDBRAccount", "IDDebtAccount"},
    {"SDInvoice", "IDBRAccount", "IDDebtAccount"},         {"SDConsignmD", "IDDebtAccount", "IDDebtAccount"},
};

// A delivery and the invoice made from it.
struct DeliveryInvoice {
  const char* delivery;
  const char* invoice;
};
constexpr DeliveryInvoice kDeliveryInvoices[] = {{"SDConsignmD", "SDInvoice"}, {"PDReceiptD", "PDInvoice"}};

// A value the company or partner has: a non-zero number or a non-blank text.
bool HasValue(const Variant& v) {
  if (IsBlank(v)) return false;
  if (v.IsString()) return !Trim(v.AsString()).empty();
  return DoubleOf(v) != 0;
}

// Whether the header's link finds its row. A missing row reads blank (or, on some hosts, fails).
bool LinkFound(xal::DataObject& doc, const std::string& link) {
  return !IsBlank(TryOr([&] { return doc.Field(link + ".ID"); }, Variant()));
}

// Writes `source` into `target` unless it reads blank (no row behind the link).
void CopyLinked(xal::DataObject& doc, const char* target, const std::string& source) {
  const Variant v = doc.Field(source);
  if (!IsBlank(v)) doc.SetField(target, v);
}

void TakeReferenceNo(xal::DataObject& doc, const Variant& number) {
  const std::string text = TrimmedOf(number);
  if (!text.empty()) doc.SetField("ReferenceNo", Variant(text));
}

// The first row of the first query that has one; nullptr when none has.
template <class Open>
Ref<xal::DataObject> FirstRowOf(Open&& open, std::initializer_list<std::string> queries) {
  for (const std::string& sql : queries) {
    Ref<xal::DataObject> q = open(sql);
    if (!q->IsEOF()) return q;
  }
  return nullptr;
}

// Rows of a query, counted up to `limit`.
int32_t CountRows(xal::DataObject& q, int32_t limit) {
  int32_t n = 0;
  for (; n < limit && !q.IsEOF(); q.MoveNext()) ++n;
  return n;
}

}  // namespace

// ---------------------------------------------------------------------------------------------
// The company
// ---------------------------------------------------------------------------------------------

// The company chosen, in these steps:
//   1. The status line is cleared; the result is True. No company, or an id that points at no
//      company row, goes to step 7: nothing is filled.
//   2. The company's message is shown; its marker may refuse the company (result False).
//   3. While a new document is being filled, go to step 7: the new document fills the rest.
//   4. The company-change guard: a refused change puts the saved company back, commits the
//      header and goes to step 7.
//   5. The fill from the company (FillFromCompany).
//   6. The header is refreshed when the outermost handler leaves.
//   7. In every case the form is asked to show the company's information panel.
bool DocFunc::VGRCompany() {
  return Handle("VGRCompany", [&](bool& result) {
    Status("");
    result = true;
    const Checked<xal::DataObject> doc = st_.DocData;
    const int32_t company = LongOf(doc->Field("IDGRCompany"));
    if (company != 0 && LinkFound(*doc, "GRCompany")) {
      if (ShowCompanyMessage("GRCompany.Message")) result = false;
      if (!st_.NewDocPending) {
        if (CheckCompanyChange()) {
          FillFromCompany(company);
        } else {
          doc->SetField("IDGRCompany", Require(doc->Owner()).Field("IDGRCompany"));
          doc->UpdateRow(true, false, false);
        }
        st_.HeaderRefreshPending = true;
      }
    }
    st_.Doc->CmdPost("ShowGRCompanyInfo");
  });
}

// A company's (or partner's) message, trimmed. A leading "@$$" is cut off when the text has at
// least four characters, else a leading "@$" when it has at least three; the rest is shown when
// this kind shows company messages. "@$$" refuses the company on every kind that uses company
// messages, "@$" on a sales order only.
bool DocFunc::ShowCompanyMessage(const std::string& field) {
  std::string message = TrimmedOf(st_.DocData->Field(field));
  if (message.empty()) return false;
  const bool strong = message.starts_with("@$$");
  const bool refuses =
      st_.UseCompanyMessage && (strong || (message.starts_with("@$") && TextEquals(st_.DocTable, "SDOrder")));
  if (strong && Len(message) >= 4)
    message = Mid(message, 4);
  else if (message.starts_with("@$") && Len(message) >= 3)
    message = Mid(message, 3);
  if (st_.CompanyMessageDoc) st_.Doc->MsgBox(message, kMbInformation, "");
  return refuses;
}

// The company of a delivery or of an invoice made from deliveries may change only while the
// invoice covers one delivery:
//   1. Other kinds, and documents not stored yet, may change it.
//   2. A delivery finds its invoice in GDocRel; without one the change is allowed. An invoice is
//      its own.
//   3. An invoice made from two or more deliveries (a batch invoice) refuses the change, with
//      text 85 on the invoice itself and text 86 on one of its deliveries.
bool DocFunc::CheckCompanyChange() {
  const DeliveryInvoice* pair = nullptr;
  for (const DeliveryInvoice& p : kDeliveryInvoices)
    if (NameIn(st_.DocTable, {p.delivery, p.invoice})) pair = &p;
  const int32_t id = LongOf(st_.DocData->Field("ID"));
  if (!pair || id == 0) return true;
  const std::string relation = "FROM GDocRel X WHERE X.PrevDocName = " + server::SQLText(pair->delivery) +
                               " AND X.NextDocName = " + server::SQLText(pair->invoice) + " ";
  const bool isInvoice = TextEquals(st_.DocTable, pair->invoice);
  int32_t invoice = id;
  if (!isInvoice) {
    Ref<xal::DataObject> next = OpenQuery("SELECT TOP 1 X.IDNextDoc " + relation + "AND X.IDPrevDoc = " + std::to_string(id));
    if (next->IsEOF()) return true;
    invoice = LongOf(next->Field("IDNextDoc"));
  }
  Ref<xal::DataObject> deliveries = OpenQuery("SELECT TOP 2 X.ID " + relation + "AND X.IDNextDoc = " + std::to_string(invoice));
  if (CountRows(*deliveries, 2) < 2) return true;
  st_.Doc->MsgBox(GetUIString(isInvoice ? 85 : 86), kMbOK, "");
  return false;
}

// What a company brings, in this order:
//   1. The partner: the company's settlement company, else the company itself (unless the form's
//      value "NoPartnerFill" is set).
//   2. The credit-limit warning.
//   3. The question whether the dependent header fields are filled again ("AskCompany", text 79);
//      without rows they are.
//   4. The contact person (the default one, else the first shown in reports, else none), the
//      company's name, address and (when not blank) reference number.
//   5. The account, when the user's option "FillBRAccount" asks for it.
//   6. When filling again: currency, terms, tax, worker and prices (RefillFromCompany), then the
//      user's defaults for what is still empty, then the due date.
void DocFunc::FillFromCompany(int32_t company) {
  const Checked<xal::DataObject> doc = st_.DocData;
  if (st_.Doc->Values("NoPartnerFill").IsEmpty()) {
    const int32_t settlement = LongOf(doc->Field("GRCompany.IDSettlCompany"));
    doc->SetField("IDPartner", Variant(settlement != 0 ? settlement : company));
  }
  VerifyCreditLimit(0);
  const bool refill = !HasRows() || CarryToRows("AskCompany", GetUIString(79));
  const std::string id = std::to_string(company);
  Ref<xal::DataObject> person =
      FirstRowOf([&](const std::string& sql) { return OpenQuery(sql); },
                 {"SELECT ID FROM GRCompContPerson WHERE IsDefault <> 0 AND IDGRCompany = " + id,
                  "SELECT ID FROM GRCompContPerson WHERE ShowInReport <> 0 AND IDGRCompany = " + id});
  doc->SetField("IDGRCompContPerson", person ? person->Field("ID") : kNone);
  CopyLinked(*doc, "CompanyName", "GRCompany.Name");
  CopyLinked(*doc, "CompanyAddr", "GRCompany.LocationAddr");
  TakeReferenceNo(*doc, doc->Field("GRCompany.ReferenceNo"));
  if (FlagOf(UserOption(st_.DocTable, "FillBRAccount", kNone)))
    for (const AccountFill& a : kAccountFills)
      if (TextEquals(st_.DocTable, a.docTable)) CopyLinked(*doc, a.target, std::string("GRCompany.") + a.source);
  if (!refill) return;
  RefillFromCompany();
  SetNewDocDefaults();
  if (st_.UseTermPayment) VTermPayment();
}

namespace {

bool Needed(const DocState& st, Need need) {
  switch (need) {
    case Need::kAlways: return true;
    case Need::kTermDelivery: return st.UseTermDelivery;
    case Need::kDefaultTax: return st.UseTax && st.DefaultTax;
    case Need::kSales: return st.IsSales;
    case Need::kPurchase: return !st.IsSales;
    case Need::kPriceCat: return st.UsePriceCat;
    case Need::kPriceCatTermPayment: return st.UsePriceCat && st.UseTermPayment;
  }
  return false;
}

std::string SourceOf(const DependentField& f, const std::string& suffix) {
  return f.suffixed ? f.source + suffix : std::string(f.source);
}

// The one price list the pairs of a company price category name; 0 when they name none or several.
template <class Open>
int32_t CategoryPriceList(Open&& open, int32_t category) {
  if (category == 0) return 0;
  Ref<xal::DataObject> lists = open("SELECT DISTINCT IDGRPriceList FROM GRPriceCatRel WHERE IDGRCompanyPriceCat = " +
                                    std::to_string(category) + " AND IDGRPriceList <> 0");
  if (lists->IsEOF()) return 0;
  const int32_t list = LongOf(lists->Field("IDGRPriceList"));
  return CountRows(*lists, 2) == 1 ? list : 0;
}

}  // namespace

// The dependent fields filled again from the company: currency (with its rates looked up
// again), delivery term, tax, worker; then, on documents with price categories, the prices:
//   1. The category is the company's.
//   2. The price list is the company's own; without one, the one list the category's pairs name;
//      without that, the list the document has stays when the category is the one of the company
//      the document was saved with (its rows were priced by it), and is cleared otherwise.
//   3. The price cut is 0 for a company with a contract price list (its prices are agreed, not
//      cut); otherwise the company's own cut; without one, the cut the document has stays on the
//      same terms as the list, and is cleared otherwise.
//   4. The payment term is the company's.
//   5. The price list's name and price mode are taken into the header.
void DocFunc::RefillFromCompany() {
  const Checked<xal::DataObject> doc = st_.DocData;
  const std::string& suffix = st_.CompanyFieldSuffix;
  for (const DependentField& f : kDependentFields)
    if (Needed(st_, f.need)) CopyLinked(*doc, f.target, "GRCompany." + SourceOf(f, suffix));
  ResetExchangeRates();
  if (!st_.UsePriceCat) return;
  auto company = [&](const std::string& field) { return doc->Field("GRCompany." + field + suffix); };
  const int32_t category = LongOf(company("IDGRCompanyPriceCat"));
  const bool sameCategory = category != 0 && category == SavedPriceCategory();
  doc->SetField("IDGRCompanyPriceCat", Variant(category));
  int32_t list = LongOf(company("IDGRPriceList"));
  if (list == 0) list = CategoryPriceList([&](const std::string& sql) { return OpenQuery(sql); }, category);
  if (list != 0 || !sameCategory) doc->SetField("IDGRPriceList", Variant(list));
  const double cut = DoubleOf(company("PriceCut"));
  if (LongOf(company("IDGRPriceListC")) != 0)
    doc->SetField("PriceCut", kNone);
  else if (cut != 0 || !sameCategory)
    doc->SetField("PriceCut", Variant(cut));
  if (st_.UseTermPayment) doc->SetField("IDGRTermPayment", company("IDGRTermPayment"));
  TakePriceListMode();
}

// The price category of the company the stored document was saved with; 0 for a new document.
int32_t DocFunc::SavedPriceCategory() {
  if (st_.DocData->RowState(kRowNotStored)) return 0;
  Ref<xal::DataObject> q = OpenQuery(
      "SELECT C.IDGRCompanyPriceCat AS IDPriceCat FROM GDocument D INNER JOIN GRCompany C ON D.IDGRCompany = C.ID "
      "WHERE D.ID = " + std::to_string(LongOf(st_.DocData->Field("ID"))));
  return q->IsEOF() ? 0 : LongOf(q->Field("IDPriceCat"));
}

// The header's price list shown by name, and its price mode kept for the price look-up. A list
// that points at no row changes nothing.
void DocFunc::TakePriceListMode() {
  const Checked<xal::DataObject> doc = st_.DocData;
  const int32_t list = LongOf(doc->Field("IDGRPriceList"));
  if (list == 0 || !LinkFound(*doc, "GRPriceList")) return;
  doc->SetField("PriceList", doc->Field("GRPriceList.Name"));
  st_.PriceIsGross = FlagOf(doc->Field("GRPriceList.IsBruto"));
  st_.PriceNoCut = FlagOf(doc->Field("GRPriceList.WithoutPriceCut"));
  st_.PriceListID = list;
}

// ---------------------------------------------------------------------------------------------
// The partner
// ---------------------------------------------------------------------------------------------

// The partner chosen (the party that receives the goods or the invoice), in these steps:
//   1. No partner, or an id that points at no company row: nothing happens.
//   2. The partner's message is shown (its marker refuses nothing here).
//   3. The partner's name, address and (when not blank) reference number.
//   4. Its bank account: the default one, else the first shown in reports, else none; the
//      account's reference number (when not blank) wins over the partner's.
//   5. With pFill above 0 the dependent fields (FillFromPartner).
//   6. The price list's name and mode.
//   7. With rows, the partner goes into the rows' company when the user agrees ("AskCompany",
//      text 74 naming the companies).
//   8. The due date, when the partner's terms override the company's (pFill 1).
//   9. The company information panel, when the partner is not the company itself.
bool DocFunc::VPartner(int16_t pFill) {
  return Handle("VPartner", [&](bool& result) {
    result = true;
    const Checked<xal::DataObject> doc = st_.DocData;
    const int32_t partner = LongOf(doc->Field("IDPartner"));
    if (partner == 0 || !LinkFound(*doc, "Partner")) return;
    ShowCompanyMessage("Partner.Message");
    CopyLinked(*doc, "PartnerName", "Partner.Name");
    CopyLinked(*doc, "PartnerAddr", "Partner.LocationAddr");
    TakeReferenceNo(*doc, doc->Field("Partner.ReferenceNo"));
    const std::string id = std::to_string(partner);
    Ref<xal::DataObject> account =
        FirstRowOf([&](const std::string& sql) { return OpenQuery(sql); },
                   {"SELECT ID, ReferenceNo FROM GRBankAccount WHERE IsDefault <> 0 AND IDGRCompany = " + id,
                    "SELECT ID, ReferenceNo FROM GRBankAccount WHERE ShowInReport <> 0 AND IDGRCompany = " + id});
    doc->SetField("IDPartnerBAcc", account ? account->Field("ID") : kNone);
    if (account) TakeReferenceNo(*doc, account->Field("ReferenceNo"));
    if (pFill > 0) FillFromPartner(pFill);
    TakePriceListMode();
    if (HasRows() && CarryToRows("AskCompany", GetUIString(74, {Variant(GetUIString(15))})))
      PropagateToRows("IDGRCompany", Variant(partner));
    if (st_.UseTermPayment && pFill == 1) VTermPayment();
    if (partner != LongOf(doc->Field("IDGRCompany"))) st_.Doc->CmdPost("ShowGRCompanyInfo");
    st_.HeaderRefreshPending = st_.BrowserRefreshPending = st_.RowsRecalcPending = true;
  });
}

// The dependent fields from the partner. For each pair of the partner's value and the company's
// own value of the same field, the partner's is written when it has one and either pFill is 1
// (the partner overrides) or the company has none (pFill 2: the partner fills the gaps).
//   1. The account ("FillBRAccount"), currency (a new one has its rates looked up again),
//      delivery term, tax and worker, as for the company.
//   2. On documents with price categories: category, price list, payment term; the price cut is
//      0 when the partner's contract price list wins its pair, else the partner's cut by its pair.
//   3. The foreign-trade fields: delivery term, transport, customs procedure, delivery location
//      and country.
void DocFunc::FillFromPartner(int16_t pFill) {
  const Checked<xal::DataObject> doc = st_.DocData;
  const std::string& suffix = st_.CompanyFieldSuffix;
  auto wins = [&](const std::string& field) {
    return HasValue(doc->Field("Partner." + field)) && (pFill == 1 || !HasValue(doc->Field("GRCompany." + field)));
  };
  auto take = [&](const char* target, const std::string& field) {
    if (!wins(field)) return false;
    doc->SetField(target, doc->Field("Partner." + field));
    return true;
  };
  if (FlagOf(UserOption(st_.DocTable, "FillBRAccount", kNone)))
    for (const AccountFill& a : kAccountFills)
      if (TextEquals(st_.DocTable, a.docTable)) take(a.target, a.source);
  for (const DependentField& f : kDependentFields)
    if (Needed(st_, f.need) && take(f.target, SourceOf(f, suffix)) && TextEquals(f.target, "IDGRCurrency"))
      ResetExchangeRates();
  for (const DependentField& f : kPartnerPriceFields)
    if (Needed(st_, f.need)) take(f.target, SourceOf(f, suffix));
  if (st_.UsePriceCat && wins("IDGRPriceListC" + suffix))
    doc->SetField("PriceCut", kNone);
  else if (st_.UsePriceCat)
    take("PriceCut", "PriceCut" + suffix);
  for (const DependentField& f : kForeignTradeFields) take(f.target, f.source);
}

// ---------------------------------------------------------------------------------------------
// The credit limit
// ---------------------------------------------------------------------------------------------

// The credit-limit check, where the document kind asks for it ("CheckCreditLimit"):
//   1. The limit is the company's; when it has none, the partner's. No limit: passed.
//   2. What the customer owes: its sales invoices not finished (their base-currency totals,
//      rounded to cents) plus the voucher rows booked against them, as stored.
//   3. This document's own total in the base currency is added. A stored document is already in
//      that sum when it is an unfinished sales invoice of the same customer: its stored total is
//      then taken out, so that an edited invoice is not counted twice, while any other stored
//      document (an order, a delivery) is counted in full.
//   4. Over the limit, text 88 names the customer's code, the sum and the limit (two decimals).
//      Mode 0 shows it and passes. Other modes ask whether to save (text 89); No fails; Yes passes
//      and writes that same text, with its figures, to the log (kind 2, the document's table and
//      ID).
bool DocFunc::VerifyCreditLimit(int16_t mode) {
  if (!st_.CheckCreditLimit) return true;
  const Checked<xal::DataObject> doc = st_.DocData;
  std::string link = "GRCompany", keyField = "IDGRCompany";
  Currency limit = CurrencyOf(doc->Field("GRCompany.CreditLimit"));
  if (limit == Currency()) {
    link = "Partner", keyField = "IDPartner";
    limit = CurrencyOf(doc->Field("Partner.CreditLimit"));
  }
  if (limit == Currency()) return true;
  const std::string key = std::to_string(LongOf(doc->Field(keyField)));
  const std::string code = TrimmedOf(doc->Field(link + ".Code"));
  auto sum = [&](const std::string& sql) { return CurrencyOf(OpenQuery(sql)->Field("Amount")); };
  Status(GetUIString(87));
  const Currency invoiced = sum("SELECT Sum(TotalAmountBase) AS Amount FROM GDocument WHERE " + keyField + " = " + key +
                                " AND RefType = 'SDInvoice' AND DocState <> 'F'");
  const Currency booked = sum(
      "SELECT Sum(B.AmountBase) AS Amount FROM GDocument A INNER JOIN VDVoucherRow B ON A.ID = B.IDSourceDoc "
      "WHERE A." + keyField + " = " + key + " AND A.RefType = 'SDInvoice' AND A.DocState <> 'F'");
  Status("");
  const Currency totalAmount = CurrencyOf(doc->Field("TotalAmount"));
  const double rate = DoubleOf(doc->Field("ExchangeRate"));
  Currency own = rate == 0 ? totalAmount : server::ConvertWithRates(totalAmount, rate);
  const int32_t id = LongOf(doc->Field("ID"));
  if (!doc->RowState(kRowNotStored) && id != 0) {
    Ref<xal::DataObject> stored = OpenQuery("SELECT TotalAmountBase FROM GDocument WHERE ID = " + std::to_string(id) +
                                            " AND " + keyField + " = " + key + " AND RefType = 'SDInvoice' AND DocState <> 'F'");
    if (!stored->IsEOF()) own = own - CurrencyOf(stored->Field("TotalAmountBase"));
  }
  const Currency total = CCur(server::Round(Variant(invoiced), 2)) + own + booked;
  if (total <= limit) return true;
  const std::string text =
      GetUIString(88, {Variant(code), Variant(Format(Variant(total), "0.00")), Variant(Format(Variant(limit), "0.00"))});
  if (mode == 0) {
    st_.Doc->MsgBox(text, kMbOK, "");
    return true;
  }
  if (st_.Doc->MsgBox(text + "\r\n" + GetUIString(89), kMbYesNo, "") == kAnswerNo) return false;
  st_.Connect->WriteLog("2", st_.DocTable, id, text);
  return true;
}

}  // namespace xal
