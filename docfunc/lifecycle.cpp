// Lifecycle handlers of DocFunc: the menu commands of the kind, a new document's defaults, the
// checks before saving (empty rows, duplicates, pre-reservations, stock on hand, company
// messages), deleting a row, rebinding the rows, and releasing everything at the end.
#include <string_view>
#include <vector>

#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/values.h"
#include "runtime/dates.h"
#include "runtime/dispatch.h"
#include "runtime/text.h"
#include "server/sql_utils.h"

namespace xal {

using namespace docfunc;  // NOLINT: the value readers of this folder

namespace {

// A header field that has no value yet: Null, Empty or 0.
bool Unset(const Variant& v) { return IsBlank(v) || CDbl(v) == 0; }

}  // namespace

// ---------------------------------------------------------------------------------------------
// Releasing and binding
// ---------------------------------------------------------------------------------------------

// Releases every reference, in the order that breaks the cycles between the document's objects.
void DocFunc::Destroy() {
  st_.Evaluator.reset();
  st_.SetRowsOB.reset();
  st_.RowsOB.reset();
  st_.TransientOB.reset();
  st_.HeaderOB.reset();
  st_.RowOB.reset();
  st_.TransientRowOB.reset();
  st_.CompanyPriceRow.reset();
  st_.PriceListRow.reset();
  st_.Connect.reset();
  st_.Doc.reset();
  st_.DocData.reset();
  st_.Server.reset();
}

void DocFunc::SetRowOB(Ref<xal::DataObject>& pRowOB) {
  st_.RowOB = pRowOB;
  st_.RowsOB = pRowOB;
}

// ---------------------------------------------------------------------------------------------
// Doc_TestScript, Doc_Initialize, Doc_Show
// ---------------------------------------------------------------------------------------------

// Hands the object and its document to the optional test suite, when one is installed; the
// suite may replace the document. A missing or failing suite is ignored.
bool DocFunc::Doc_TestScript() {
  return Handle("Doc_TestScript", [&](bool& result) {
    constexpr std::string_view kSuite = "ScriptTest.ScriptTestSuite";
    if (TypeRegistry::Instance().ByName(kSuite)) {
      std::vector<Variant> args{Variant(ObjectRef(RefTo(*this))), Variant(ObjectRef(st_.Doc.get()))};
      TryStep([&] { Invoke(CreateObject(kSuite), "RunTestScript", MemberKind::Method, args); });
      st_.Doc = args[1].IsObject() ? std::dynamic_pointer_cast<XALSBEproxy>(args[1].AsObject()) : nullptr;
    }
    result = true;
  });
}

namespace {

// The menu commands a kind of document offers, each under the condition of its group.
enum MenuGroup { kDiscounts, kProductionCost, kClientCard, kPrepayment, kRegister, kLots, kInterest, kGroupCount };
struct MenuItem {
  MenuGroup group;
  int32_t caption;  // UI text number
  const char* func;
  bool forceEdit;
};
constexpr MenuItem kMenuItems[] = {
    {kDiscounts, 1, "@ComputePercentAmount", true},   {kDiscounts, 2, "@ComputePercentPricelist", true},
    {kProductionCost, 3, "@ComputeProductionCosts", false}, {kClientCard, 4, "@ClientCard", true},
    {kPrepayment, 52, "@PrintAPInvoice", false},      {kRegister, 53, "@FilterUnused", false},
    {kRegister, 56, "@ArchiveRecords", false},        {kLots, 54, "@Save_DRStockReserve", true},
    {kInterest, 55, "@InterestNoteInfo", false},
};

}  // namespace

// Registers the commands of the kind as menu items.
bool DocFunc::Doc_Initialize() {
  return Handle("Doc_Initialize", [&](bool& result) {
    bool offered[kGroupCount] = {};
    offered[kDiscounts] = st_.UseDiscounts;
    offered[kProductionCost] = st_.UseProductionCost &&
                               st_.Connect->CheckRight(st_.UserID, "DOCUMENT", st_.DocTable, kRightNone, kRightExecute);
    offered[kClientCard] = st_.UseClientCard;
    offered[kPrepayment] = NameIn(st_.DocTable, {"PDOrder", "PDReceiptD", "SDConsignmD", "SDOrder"});
    offered[kRegister] = TryOr([&] {
      const Variant entry = Require(st_.Server->TableCatalogue()).Item(st_.DocTable);
      auto info = std::dynamic_pointer_cast<ParamList>(entry.IsObject() ? entry.AsObject() : nullptr);
      return info && FlagOf(info->Item("isRegister"));
    }, false);
    offered[kLots] = TextEquals(st_.DocTable, "SDConsignmD") && st_.Doc->DataObject("DDStoreDRow") != nullptr;
    offered[kInterest] = TextEquals(st_.DocTable, "SDInvoice");
    for (const MenuItem& m : kMenuItems)
      if (offered[m.group]) st_.Doc->AddMenuItem(GetUIString(m.caption), m.func, m.forceEdit, 0, 0, "");
    result = true;
  });
}

// A row form's parent may have moved to another row since the last show: bind again.
// The preparation of a reservation-relation form comes with the reservation handlers.
bool DocFunc::Doc_Show() {
  return Handle("Doc_Show", [&](bool& result) {
    if (st_.IsRowArea) BindRowForm();
    result = true;
  });
}

// ---------------------------------------------------------------------------------------------
// A new document
// ---------------------------------------------------------------------------------------------

// The option section of a new document: the form's own ("OptionName") or the document table.
std::string DocFunc::OptionName() {
  const std::string name = TextOf(st_.Doc->Values("OptionName"));
  return name.empty() ? st_.DocTable : name;
}

// Fills the header of a new document: a fresh document gets its deal state, type, series and
// defaults from the user's options; a copy keeps them. Both get a new number, today's dates, the
// user and the employee. Then the company and terms are validated as if entered.
bool DocFunc::AddNewDocument() {
  const bool result = HandleAlwaysTrue("AddNewDocument", [&](bool&) {
    Status("");
    const std::string section = OptionName();
    auto option = [&](const std::string& key, const Variant& def) { return UserOption(section, key, def); };
    const Checked<xal::DataObject> doc = st_.DocData;  // held for the call
    if (LongOf(doc->Field("IDGRDocType")) == 0) {
      doc->SetField("DealState", option("DealState", Variant("")));
      const std::string ds = TrimmedOf(doc->Field("DealState"));
      doc->SetField("IDGRDocType", option("GRDocType" + ds, Variant(int32_t{0})));
      doc->SetField("IDGRDocSeries", option("GRDocSeries" + ds, Variant(int32_t{0})));
      SetNewDocDefaults();
      doc->SetField("IsApproximated", option("IsApproximated", Variant(int32_t{0})));
      if (LongOf(doc->Field("IDGRDocSeries")) == 0) Status(GetUIString(68));
      st_.RowTaxEntered = false;
      st_.NewDocPending = true;
    }
    doc->SetField("DocNo", Variant(int32_t{0}));
    doc->SetField("SourceDocNo", Variant(""));
    doc->SetField("DocState", Variant(""));
    doc->SetField("DocDate", Variant(Today()));
    doc->SetField("DealDate", Variant(Today()));
    doc->SetField("IDEREmployee", Require(st_.Connect->UserObject()).Field("IDEREmployee"));
    doc->SetField("IDXALUser", Variant(st_.UserID));
    for (const char* link : TextEquals(st_.DocTable, "PDReceiptD")
                                ? std::initializer_list<const char*>{"IDPDInvoice", "IDPDOrder"}
                            : NameIn(st_.DocTable, {"SDConsignmD", "SDExpenseD"})
                                ? std::initializer_list<const char*>{"IDSDInvoice", "IDSDOrder"}
                                : std::initializer_list<const char*>{})
      doc->SetField(link, Variant(int32_t{0}));
    st_.RecalcRowsAnswer = true;
    st_.HeaderOB = st_.DocData.get();
    st_.RowOB = st_.Doc->DataObject(st_.RowTable);
    st_.RowsOB = st_.RowOB.get();
    RunHeaderHandler("VGRCompany");
    RunHeaderHandler("VTermPayment");
    RunHeaderHandler("VTermDelivery");
    if (st_.NewDocPending) WhenDocument();
  });
  st_.NewDocument = true;
  st_.NewDocPending = false;
  return result;
}

// Runs a header handler of this object by name, as the form's script would, when the type
// library offers it; the header validations come with their own handlers.
void DocFunc::RunHeaderHandler(const char* name) {
  ObjectRef self = RefTo(*this);
  if (!self || !ClassOf(*self)->Find(name, MemberKind::Method)) return;
  Invoke(self, name, MemberKind::Method, {});
}

// Header fields of a new document that are still Null or 0 take the user's defaults, in order.
//   1. The stores (for store orders, movements and production the receiving and sending store).
//   2. The company (for an expense document the company that owns the database).
//   3. The owner, always; then its bank account: the default one, else the first shown in
//      reports, else the user's default account. It follows the owner even on a copied header.
//   4. Tax (where the kind has a default tax), department, project, price list, worker, the five
//      A and B registers, and the payment and delivery terms where the kind has them.
void DocFunc::SetNewDocDefaults() {
  const Checked<xal::DataObject> doc = st_.DocData;  // held for the call
  const std::string section = OptionName();
  auto fill = [&](const std::string& field, const std::string& key) {
    if (Unset(doc->Field(field))) doc->SetField(field, UserOption(section, key, Variant(int32_t{0})));
  };
  if (!NameIn(section, {"DDOrder", "DDProduction", "DDMovement"})) {
    fill("IDDRStore", "DRStore");
  } else {
    fill("IDDRStore", "ReceiverStore");
    fill("IDSenderStore", "SenderStore");
  }
  if (!TextEquals(st_.DocTable, "SDExpenseD"))
    fill("IDGRCompany", "GRCompany");
  else if (Unset(doc->Field("IDGRCompany")))
    doc->SetField("IDGRCompany", SystemOption("Owner", "GRCompany", Variant(int32_t{0})));
  doc->SetField("IDOwner", SystemOption("Owner", "GRCompany", Variant(int32_t{0})));
  const std::string owner = std::to_string(LongOf(doc->Field("IDOwner")));
  Variant account(int32_t{0});
  for (const std::string& sql :
       {"SELECT ID FROM GRBankAccount WHERE IsDefault <> 0 AND IDGRCompany = " + owner,
        "SELECT ID, ReferenceNo FROM GRBankAccount WHERE ShowInReport <> 0 AND IDGRCompany = " + owner}) {
    Ref<xal::DataObject> q = OpenQuery(sql);
    if (!q->IsEOF()) {
      account = q->Field("ID");
      break;
    }
  }
  doc->SetField("IDOwnerBAcc", account);
  fill("IDOwnerBAcc", "GRBankAccount");
  if (st_.DefaultTax) fill("IDGRTax", "GRTax");
  fill("IDGRDepartment", "GRDepartment");
  fill("IDGRProject", "GRProject");
  fill(st_.PriceListField, "GRPriceList");
  fill("IDWorker", "Worker");
  for (int i = 1; i <= 5; ++i) {
    fill("IDGARegister" + std::to_string(i), "GARegister" + std::to_string(i));
    fill("IDGBRegister" + std::to_string(i), "GBRegister" + std::to_string(i));
  }
  if (st_.UseTermPayment) fill("IDGRTermPayment", "GRTermPayment");
  if (st_.UseTermDelivery) fill("IDGRTermDelivery", "GRTermDelivery");
}

// The header's "when" handler: the totals are built afresh (from the stored taxes unless a new
// document is being filled), and the document is no longer new.
bool DocFunc::WhenDocument() {
  return Handle("WhenDocument", [&](bool& result) {
    st_.TotalsReady = false;
    st_.RowTaxEntered = false;
    st_.NewDocument = false;
    if (FlagOf(st_.Doc->Values("UseSets"))) st_.UseSets = true;
    StoredTaxes taxes;
    if (!st_.NewDocPending) {
      Ref<xal::DataObject> q = OpenQuery(
          "SELECT Sum(TaxAmount) AS Tax, Sum(TaxAmountBase) AS TaxBase, Sum(TaxAmountRef) AS TaxRef FROM GDTax "
          "WHERE IDGDocument = " + std::to_string(LongOf(st_.DocData->Field("ID"))));
      if (!q->IsEOF()) {
        taxes.tax = CurrencyOf(q->Field("Tax"));
        taxes.taxBase = CurrencyOf(q->Field("TaxBase"));
        taxes.taxRef = CurrencyOf(q->Field("TaxRef"));
      }
    }
    InitialTotals(taxes);
    result = true;
  });
}

// ---------------------------------------------------------------------------------------------
// Before saving: VDocument and Doc_Valid
// ---------------------------------------------------------------------------------------------

// Whether the current row carries nothing worth saving.
bool DocFunc::IsEmptyRow() {
  static const std::vector<const char*> kStoreRow = {"Amount", "BaseQuantity", "AltQuantity", "Cost",
                                                     "OrderedQuantity"};
  static const std::vector<const char*> kPlainRow = {"Amount", "BaseQuantity"};
  static const std::vector<const char*> kOtherRow = {"Amount", "BaseQuantity", "AltQuantity"};
  const auto& fields = st_.IsStoreRow ? kStoreRow : TextEquals(st_.DocTable, "GUDocument") ? kPlainRow : kOtherRow;
  for (const char* f : fields)
    if (DoubleOf(st_.RowOB->Field(f)) != 0) return false;
  return true;
}

// A stored document of the same kind, company and date (and, on the purchase side, the same
// supplier's number). The user's number goes into the SQL as a quoted literal.
bool DocFunc::HasDuplicate() {
  const Checked<xal::DataObject> doc = st_.DocData;  // held for the call
  std::string sql = "SELECT ID FROM GDocument WHERE " +
                    (st_.DocName.empty() ? "RefType = " + server::SQLText(st_.RefType) + " "
                                         : "DocName = " + server::SQLText(st_.DocName) + " ") +
                    "AND IDGRCompany = " + std::to_string(LongOf(doc->Field("IDGRCompany"))) +
                    " AND DocDate = " + server::SQLDate(doc->Field("DocDate"));
  if (!doc->RowState(kRowNotStored)) sql += " AND ID <> " + std::to_string(LongOf(doc->Field("ID")));
  if (!st_.IsSales) sql += " AND SourceDocNo = " + server::SQLText(TrimmedOf(doc->Field("SourceDocNo")));
  return !OpenQuery(sql)->IsEOF();
}

void DocFunc::UnlockDocument() {
  Ref<ParamList> params = NewParams();
  params->Set("ID", st_.DocData->Field("ID"));
  params->Set("XALType", Variant(st_.DocTable));
  params->Set("LockType", Variant(int32_t{1}));
  st_.Connect->ServerCommand("UnLock", params);
}

// The document-level check before saving: empty rows are dropped (a set without its particulars
// is refused), and a possible duplicate is confirmed. The document's lock is released in any case.
bool DocFunc::VDocument() {
  const bool result = Handle("VDocument", [&](bool& result) {
    result = true;
    if (st_.DropEmptyRows) {
      const Checked<xal::DataObject> rows = st_.RowOB;  // held for the call
      rows->MoveFirst();
      while (!rows->IsEOF()) {
        const bool isSet = !TextOf(rows->Field(st_.CompletionTypeField)).empty();
        if (st_.UseSets && !rows->RowState(kRowMarkedDeleted) && isSet) {
          Ref<xal::DataObject> parts = st_.Doc->CachedRows(st_.RowTable, "Next");
          if (!parts || parts->RowCount() == 0) {
            st_.Doc->MsgBox(GetUIString(94) + " '" + TrimmedOf(rows->Field("GRArticle.Code")) + "'", kMbOK, "");
            result = false;
          }
        }
        if (IsEmptyRow())
          rows->Delete();
        else
          rows->MoveNext();
      }
    }
    if (FlagOf(UserOption(st_.DocTable, "AskDoc", Variant(int32_t{0}))) && HasDuplicate() &&
        st_.Doc->MsgBox(GetUIString(69), kMbYesNoDefaultNo, "") == kAnswerNo)
      result = false;
  });
  TryStep([&] { UnlockDocument(); });
  return result;
}

// A company message that starts with "@$" blocks saving (not of a sales order) and one that
// starts with "@$$" blocks every kind; the text after the marker is shown. The partner's message
// counts when the company's has no marker.
bool DocFunc::CompanyMessageBlocks() {
  std::string msg = TrimmedOf(st_.DocData->Field("GRCompany.Message"));
  if (!msg.starts_with("@$")) msg = TrimmedOf(st_.DocData->Field("Partner.Message"));
  const bool strong = msg.starts_with("@$$");
  if (!strong && !(msg.starts_with("@$") && !TextEquals(st_.DocTable, "SDOrder"))) return false;
  std::string shown = msg;
  if (strong && Len(msg) > 3)
    shown = Mid(msg, 4);
  else if (Len(msg) > 2)
    shown = Mid(msg, 3);
  st_.Doc->MsgBox(shown, kMbInformation, "");
  return true;
}

// The save-time check: pre-reservations where they are not allowed, the credit limit, stock on
// hand, and blocking company messages. The lot check joins with the reservation handlers.
bool DocFunc::Doc_Valid() {
  return Handle("Doc_Valid", [&](bool& result) {
    result = true;
    const std::string dealState = TrimmedOf(st_.DocData->Field("DealState"));
    const bool preReservation = TextEquals(dealState, "P");
    if (preReservation && !st_.CreatePreReservation) {
      st_.Doc->MsgBox(GetUIString(96), kMbOK, "");
      result = false;
      return;
    }
    result = VerifyCreditLimit(1);  // asking mode: the user may save over the limit
    Status("");
    if (result && st_.IsStockDoc && st_.CheckStockReserve && !preReservation) result = CheckOnHand();
    if (st_.UseCompanyMessage && CompanyMessageBlocks()) result = false;
  });
}

namespace {

// What the document's rows do to one article in one store.
struct StockChange {
  int32_t article = 0, store = 0;
  double change = 0;        // + taken in, - taken out
  std::string setCode;      // the set a particular belongs to ("" for a plain row)
};

void AddChange(std::vector<StockChange>& changes, int32_t article, int32_t store, double q, const std::string& set) {
  if (store == 0 || q == 0) return;
  for (StockChange& c : changes)
    if (c.article == article && c.store == store) {
      c.change += q;
      if (c.setCode.empty()) c.setCode = set;
      return;
    }
  changes.push_back({article, store, q, set});
}

}  // namespace

// The code of a register record ("" when there is none).
std::string DocFunc::CodeOf(const std::string& table, int32_t id) {
  Ref<xal::DataObject> q = OpenQuery("SELECT Code FROM " + table + " WHERE ID = " + std::to_string(id));
  return q->IsEOF() ? std::string() : TrimmedOf(q->Field("Code"));
}

// The on-hand check of a store document. The rule:
//   1. The rows of the form (a set row by its particulars), leaving out rows marked deleted and
//      articles of type "P" (production) and "S" (service), give per article and store what the
//      document does to the stock: its quantity into the receiving store, out of the sending one.
//   2. The host's inventory computation "DPInventoryB" gives the on-hand quantity per article and
//      store of those articles, leaving out the document's own stored rows ("Documents": its ID),
//      since the rows of the form replace them. Pre-reservations count when the form's value
//      "CountPreReservations" says so; "ReservedD" and "PreReservedD" name no further documents;
//      no report is made. Its answer is the ID of the computation, whose rows are DPInventoryBRow
//      (IDGRArticle, IDDRStore, Quantity).
//   3. Every article and store the document takes more out of than is on hand is reported (text
//      62, or 64 for a particular of a set), and the check fails.
//   4. The computation's rows are removed, also when the comparison failed.
bool DocFunc::CheckOnHand() {
  Status(GetUIString(61));
  std::vector<StockChange> changes;
  auto collect = [&](DataObject& r, const std::string& set) {
    if (r.RowState(kRowMarkedDeleted)) return;
    const std::string type = UCase(TrimmedOf(r.Field("ArticleType")));
    if (type == "P" || type == "S") return;
    const double q = DoubleOf(r.Field("BaseQuantity"));
    const int32_t article = LongOf(r.Field(st_.ArticleField));
    AddChange(changes, article, LongOf(r.Field("IDReceiverStore")), q, set);
    AddChange(changes, article, LongOf(r.Field("IDSenderStore")), -q, set);
  };
  const Checked<xal::DataObject> rows = st_.RowOB;  // held for the call
  for (rows->MoveFirst(); !rows->IsEOF(); rows->MoveNext()) {
    if (TextOf(rows->Field(st_.CompletionTypeField)).empty()) {
      collect(*rows, "");
      continue;
    }
    const std::string set = TrimmedOf(rows->Field("GRArticle.Code"));
    if (Ref<xal::DataObject> parts = st_.Doc->CachedRows(st_.RowTable, "Next"))
      for (parts->MoveFirst(); !parts->IsEOF(); parts->MoveNext()) collect(*parts, set);
  }
  std::string articles;
  for (const StockChange& c : changes)
    if (c.change < 0) articles += (articles.empty() ? "" : ",") + std::to_string(c.article);
  if (articles.empty()) return true;
  Ref<ParamList> params = NewParams();
  params->Set("Documents", Variant(std::to_string(LongOf(st_.DocData->Field("ID")))));
  params->Set("ReservedD", Variant(""));
  params->Set("CountPreReservations", Variant(FlagOf(st_.Doc->Values("CountPreReservations"))));
  params->Set("PreReservedD", Variant(""));
  params->Set("GRArticleIDs", Variant(articles));
  params->Set("MakeReport", Variant(false));
  const std::string id = std::to_string(LongOf(st_.Connect->ServerCommand("DPInventoryB", params)));
  bool enough = true;
  try {
    Ref<xal::DataObject> onHand =
        OpenQuery("SELECT IDGRArticle, IDDRStore, Quantity FROM DPInventoryBRow WHERE IDDPInventoryB = " + id);
    for (const StockChange& c : changes) {
      if (c.change >= 0) continue;
      double available = 0;
      for (onHand->MoveFirst(); !onHand->IsEOF(); onHand->MoveNext())
        if (LongOf(onHand->Field("IDGRArticle")) == c.article && LongOf(onHand->Field("IDDRStore")) == c.store)
          available += DoubleOf(onHand->Field("Quantity"));
      if (available + c.change >= 0) continue;
      const Variant article(CodeOf("GRArticle", c.article)), store(CodeOf("DRStore", c.store));
      const Variant required(-c.change), held(available);
      st_.Doc->MsgBox(c.setCode.empty() ? GetUIString(62, {article, store, required, held})
                                        : GetUIString(64, {Variant(c.setCode), article, store, required, held}),
                      kMbOK, "");
      enough = false;
    }
  } catch (...) {
    TryStep([&] { st_.Connect->Execute("DELETE * FROM DPInventoryB WHERE ID = " + id, 0); });
    throw;
  }
  st_.Connect->Execute("DELETE * FROM DPInventoryB WHERE ID = " + id, 0);
  return enough;
}

// ---------------------------------------------------------------------------------------------
// DelRow
// ---------------------------------------------------------------------------------------------

// Before the current row is deleted (or undeleted): its reservations go with it, and the totals
// drop (or take back) its amount through the incremental pass.
bool DocFunc::DelRow() {
  return Handle("DelRow", [&](bool& result) {
    const Checked<xal::DataObject> row = st_.RowOB;  // held for the call
    if (row->RowState(kRowMarkedDeleted)) {
      st_.OldAmount = Currency();
    } else {
      if ((st_.UsesStockReserve || st_.UsesReserveRel) &&
          (st_.Doc->CheckCachedRows(st_.RowTable, st_.ReserveTable) || !row->RowState(kRowNotStored))) {
        Checked<xal::DataObject> reservations = st_.Doc->CachedRows(st_.RowTable, st_.ReserveTable);
        Ref<xal::DataObject> owner = reservations->Owner();
        if (owner && owner->RowCount() == 0) {
          reservations->UpdateRow(false, false, true);
        } else {
          for (reservations->MoveFirst(); !reservations->IsEOF();) reservations->Delete();
        }
      }
      st_.OldAmount = CurrencyOf(row->Field("Amount")) * Currency::FromInt(2);
    }
    ComputeDocTotals(false);
    result = true;
  });
}

}  // namespace xal
