// The demo data set's stored documents. They are written from short descriptions (company, date,
// store, articles, quantities, prices) and get their amounts, taxes, base-currency values, issue
// costs from the current balances, lot reservations and header totals computed here, so that every
// document adds up. Closed-period stock flows are then summed from the rows dated before the
// store's "DateFixed" day.
#include <map>
#include <string>
#include <vector>

#include "host/demo_db.h"
#include "host/demo_writer.h"
#include "host/host_error.h"
#include "runtime/convert.h"

namespace xal::host::demo {

namespace {

const Variant kNull = Variant::Null();

// ---------------------------------------------------------------------------------------------
// Stored documents
// ---------------------------------------------------------------------------------------------

// How a document kind is stored: its rows, type and series, and which side of its partner it is.
struct KindInfo {
  const char* kind;
  const char* refType;
  const char* rowTable;
  int docType, series;
  bool purchase;  // the partner's purchase-side ("P") terms and lists apply
  bool taxed;
};
constexpr KindInfo kKinds[] = {
    {"SDInvoice", "SDInvoice", "SDInvoiceRow", 1, 1, false, true},
    {"SDOrder", "SDOrder", "SDOrderRow", 2, 2, false, true},
    {"PDReceiptD", "PDReceiptD", "DDStoreDRow", 3, 3, true, true},
    {"SDConsignmD", "SDConsignmD", "DDStoreDRow", 4, 4, false, true},
    {"DDMovement", "DDMovement", "DDStoreDRow", 5, 5, false, false},
    {"DDProduction", "DDMovement", "DDStoreDRow", 6, 6, false, false},
};

struct StoredDoc {
  int id;
  const char* kind;
  int docNo;
  int32_t date;
  int company;
  int currency;
  const char* dealState;
  int store;      // receiving store of receipts and assemblies, sending store of issues and moves
  int toStore;    // receiving store of a movement
  int user;
  int prevDoc;    // the document this one follows (order -> shipment -> invoice), or 0
  bool shipped;   // an order whose rows are shipped in full
  const char* sourceDocNo;
};

// clang-format off
const StoredDoc kDocs[] = {
  // id    kind           no  date                   comp cur state store to user prev shipped source
  {1001, "PDReceiptD",    1, DemoDay(2009, 6, 15),   20,  1, "",  1, 0, 2, 0,    false, "VP-3391"},
  {1002, "PDReceiptD",    2, DemoDay(2009, 9, 10),   22,  3, "",  1, 0, 4, 0,    false, "INV 20417"},
  {1003, "PDReceiptD",    3, DemoDay(2009, 11, 20),  24,  1, "",  3, 0, 3, 0,    false, "RK-0902"},
  {1004, "DDMovement",    1, DemoDay(2009, 12, 1),    0,  1, "",  1, 2, 2, 0,    false, ""},
  {1005, "SDOrder",       1, DemoDay(2009, 12, 10),  10,  1, "",  1, 0, 2, 0,    true,  "Tellimus 55"},
  {1006, "SDConsignmD",   1, DemoDay(2009, 12, 15),  10,  1, "",  1, 0, 2, 1005, false, ""},
  {1007, "SDInvoice",     1, DemoDay(2009, 12, 15),  10,  1, "",  1, 0, 2, 1006, false, ""},
  {1008, "PDReceiptD",    4, DemoDay(2010, 1, 12),   20,  1, "",  2, 0, 2, 0,    false, "VP-3527"},
  {1009, "SDOrder",       2, DemoDay(2010, 1, 18),   14,  1, "",  3, 0, 3, 0,    true,  "PAS-114"},
  {1010, "SDConsignmD",   2, DemoDay(2010, 1, 20),   14,  1, "",  3, 0, 3, 1009, false, ""},
  {1011, "SDInvoice",     2, DemoDay(2010, 1, 20),   14,  1, "",  3, 0, 3, 1010, false, ""},
  {1012, "PDReceiptD",    5, DemoDay(2010, 2, 3),    23,  2, "",  1, 0, 4, 0,    false, "AT-88120"},
  {1013, "DDProduction",  1, DemoDay(2010, 2, 5),     0,  1, "",  1, 0, 2, 0,    false, ""},
  {1014, "DDMovement",    2, DemoDay(2010, 2, 10),    0,  1, "",  3, 1, 3, 0,    false, ""},
  {1015, "PDReceiptD",    6, DemoDay(2010, 2, 15),   21,  4, "P", 1, 0, 4, 0,    false, "SV-2010-031"},
  {1016, "SDConsignmD",   3, DemoDay(2010, 2, 20),   12,  1, "R", 1, 0, 2, 0,    false, ""},
  {1017, "SDInvoice",     3, DemoDay(2010, 3, 1),    11,  1, "",  1, 0, 2, 0,    false, ""},
  {1018, "SDInvoice",     4, DemoDay(2010, 3, 5),    17,  4, "",  1, 0, 2, 0,    false, "PO 7781"},
  {1019, "SDOrder",       3, DemoDay(2010, 3, 15),   12,  1, "",  1, 0, 2, 0,    false, "Leping 2010/4"},
};

// Rows in document order; `parent` is the row number (from 1) of the set row a component belongs to.
struct StoredRow {
  int doc;
  int article;
  double quantity;
  double price;    // in the document's currency; issues and moves take their cost from the stock
  const char* lot;
  int parent;
};

const StoredRow kRows[] = {
  {1001, 1, 200, 2.10, "", 0},
  {1001, 2, 300, 0.95, "", 0},
  {1001, 3, 120, 5.80, "L0906", 0},
  {1001, 13, 400, 0.45, "", 0},
  {1001, 18, 150, 0.60, "", 0},
  {1002, 7, 40, 8.50, "", 0},
  {1002, 8, 15, 45.00, "TR0901-TR0915", 0},
  {1002, 9, 100, 2.20, "", 0},
  {1003, 10, 300, 3.40, "", 0},
  {1003, 12, 500, 3.10, "", 0},
  {1003, 11, 60, 28.00, "", 0},
  {1004, 1, 50, 0, "", 0},
  {1004, 2, 80, 0, "", 0},
  {1004, 3, 30, 0, "L0906", 0},
  {1004, 7, 10, 0, "", 0},
  {1005, 1, 60, 3.20, "", 0},
  {1005, 3, 25, 8.90, "", 0},
  {1005, 13, 150, 0.79, "", 0},
  {1006, 1, 60, 3.20, "", 0},
  {1006, 3, 25, 8.90, "L0906", 0},
  {1006, 13, 150, 0.79, "", 0},
  {1007, 1, 60, 3.20, "", 0},
  {1007, 3, 25, 8.90, "", 0},
  {1007, 13, 150, 0.79, "", 0},
  {1008, 1, 100, 2.20, "", 0},
  {1008, 3, 80, 5.90, "L1001", 0},
  {1008, 4, 40, 11.50, "L1002", 0},
  {1008, 5, 50, 7.80, "", 0},
  {1008, 6, 120, 2.40, "", 0},
  {1009, 12, 150, 4.60, "", 0},
  {1009, 11, 12, 39.90, "", 0},
  {1009, 14, 2, 25.00, "", 0},
  {1010, 12, 150, 4.60, "", 0},
  {1010, 11, 12, 39.90, "", 0},
  {1010, 14, 2, 25.00, "", 0},
  {1011, 12, 150, 4.60, "", 0},
  {1011, 11, 12, 39.90, "", 0},
  {1011, 14, 2, 25.00, "", 0},
  {1012, 8, 10, 62.00, "TR1001-TR1010", 0},
  {1013, 16, 10, 0, "", 0},
  {1013, 1, 10, 0, "", 1},
  {1013, 2, 20, 0, "", 1},
  {1013, 3, 5, 0, "L0906", 1},
  {1013, 18, 10, 0, "", 1},
  {1014, 12, 100, 0, "", 0},
  {1014, 10, 50, 0, "", 0},
  {1015, 7, 20, 95.00, "", 0},
  {1016, 8, 5, 84.00, "TR0901-TR0905", 0},
  {1016, 7, 8, 13.50, "", 0},
  {1016, 16, 4, 24.90, "", 0},
  {1017, 5, 6, 12.50, "", 0},
  {1017, 6, 10, 3.90, "", 0},
  {1017, 15, 4, 18.00, "", 0},
  {1017, 14, 1, 25.00, "", 0},
  {1018, 1, 40, 31.50, "", 0},
  {1018, 2, 60, 12.00, "", 0},
  {1019, 8, 3, 84.00, "", 0},
  {1019, 10, 40, 4.95, "", 0},
  {1019, 16, 2, 24.90, "", 0},
};
// clang-format on

const KindInfo& KindOf(const std::string& kind) {
  for (const KindInfo& k : kKinds)
    if (kind == k.kind) return k;
  Raise(kErrSql, "no demo kind " + kind);
}

struct Article {
  std::string name, type, country;
  int unit = 0, tax = 0;
  double netMass = 0;
};

class DocumentWriter {
 public:
  explicit DocumentWriter(Database& db) : db_(db) {
    for (const auto& r : db_.Query("SELECT A.ID, A.Name, A.ArticleType, A.Country, A.IDGRUnit, A.IDGRTax, A.NetMass "
                                   "FROM GRArticle A").rows)
      articles_[CLng(r[0])] = {r[1].AsString(), r[2].AsString(), r[3].AsString(), CLng(r[4]), CLng(r[5]), CDbl(r[6])};
    for (const auto& r : db_.Query("SELECT ID, TaxPercent FROM GRTax").rows) taxes_[CLng(r[0])] = CDbl(r[1]);
  }

  void Write(const StoredDoc& doc) {
    const KindInfo& k = KindOf(doc.kind);
    const Flow flow = FlowOf(doc, k);
    const double rate = Rate(doc.currency, doc.date);
    const Partner partner = PartnerOf(doc, k);
    const int zeroTax = ZeroTaxOf(doc);
    WriteHeader(doc, k, flow, rate, partner);
    // The rows: values first (issue costs read the stock before this document moves it), then stored.
    std::vector<Computed> rows = ComputeRows(doc, k, flow, rate, zeroTax);
    if (flow.assembly) CostAssembledSets(rows);
    WriteTotals(doc, WriteRows(doc, k, flow, rows, partner));
    LinkPrevious(doc);
  }

 private:
  // What the document does to the stock.
  struct Flow {
    bool receipt, issue, move, assembly;
    bool storeRows;  // its rows are store rows (DDStoreDRow)
  };
  // What the partner brings to the header.
  struct Partner {
    std::string name, addr;
    int term = 0, delivery = 0, priceList = 0, priceCat = 0, cPriceList = 0, contact = 0, partnerAcc = 0, agent = 0;
    int32_t promptTime = 0, deliveryTime = 0;
    double penalty = 0;
  };
  // One row's values, computed before any row is stored.
  struct Computed {
    const StoredRow* source;
    Article art;
    int tax;
    double unitPrice, amount, amountBase, taxAmount, taxBase, cost;
    Variant sender, receiver;
  };
  // The document's sums over its rows (a set's components are counted through the set row).
  struct Totals {
    double net = 0, tax = 0, netBase = 0, taxBase = 0;
  };

  static Flow FlowOf(const StoredDoc& doc, const KindInfo& k) {
    const std::string kind = doc.kind;
    return {kind == "PDReceiptD", kind == "SDConsignmD", kind == "DDMovement", kind == "DDProduction",
            std::string(k.rowTable) == "DDStoreDRow"};
  }

  // The partner's terms, lists, contact and account, from its purchase or sales side.
  Partner PartnerOf(const StoredDoc& doc, const KindInfo& k) {
    Partner pa;
    if (doc.company == 0) return pa;
    const char* p = k.purchase ? "P" : "";
    ResultSet c = db_.Query(std::string("SELECT Name, LocationAddr, IDGRTermPayment") + p + ", IDGRTermDelivery" + p +
                                ", IDGRPriceList" + p + ", IDGRCompanyPriceCat" + p + ", " +
                                (k.purchase ? "IDPurchasingAgent" : "IDSalesManager") + " FROM GRCompany WHERE ID = ?",
                            {Variant(doc.company)});
    if (c.rows.empty()) Raise(kErrSql, "demo document names a missing company");
    const Row& r = c.rows[0];
    pa.name = r[0].AsString();
    pa.addr = r[1].AsString();
    pa.term = CLng(r[2]);
    pa.delivery = CLng(r[3]);
    pa.priceList = CLng(r[4]);
    pa.priceCat = CLng(r[5]);
    pa.agent = CLng(r[6]);
    pa.promptTime = IntOr0("SELECT PromptTime FROM GRTermPayment WHERE ID = ?", pa.term);
    pa.penalty = ValueOr(db_.Scalar("SELECT PenaltyPercent FROM GRTermPayment WHERE ID = ?", {Variant(pa.term)}), 0.0);
    pa.deliveryTime = IntOr0("SELECT DeliveryTime FROM GRTermDelivery WHERE ID = ?", pa.delivery);
    pa.cPriceList = IntOr0("SELECT L.ID FROM GRCPriceList L JOIN GRCPriceLCompany C ON C.IDGRCPriceList = L.ID "
                           "WHERE C.IDGRCompany = ? AND L.IsCertified <> 0 ORDER BY L.ID LIMIT 1", doc.company);
    pa.contact = IntOr0("SELECT ID FROM GRCompContPerson WHERE IDGRCompany = ? AND IsDefault <> 0 LIMIT 1", doc.company);
    pa.partnerAcc = IntOr0("SELECT ID FROM GRBankAccount WHERE IDGRCompany = ? AND IsDefault <> 0 LIMIT 1", doc.company);
    return pa;
  }

  // A partner whose own tax is a zero rate (abroad) turns every taxed row to that rate; 0 otherwise.
  int ZeroTaxOf(const StoredDoc& doc) {
    const int zeroTax = IntOr0("SELECT IDGRTax FROM GRCompany WHERE ID = ?", doc.company);
    return zeroTax != 0 && taxes_[zeroTax] != 0 ? 0 : zeroTax;
  }

  void WriteHeader(const StoredDoc& doc, const KindInfo& k, const Flow& f, double rate, const Partner& pa) {
    const int ownAcc = IntOr0("SELECT ID FROM GRBankAccount WHERE IDGRCompany = 1 AND IsDefault <> 0 LIMIT 1", 0);
    Row header = {doc.id, doc.kind, k.refType, doc.docNo, Variant(Date(doc.date)), Variant(Date(doc.date)),
                  doc.dealState, doc.date < kDateFixed, doc.sourceDocNo, k.docType, k.series, doc.currency, rate, rate,
                  doc.user, doc.store};
    header.insert(header.end(),
                  {doc.company, pa.name, pa.addr, pa.term, Variant(Date(doc.date + pa.promptTime)), pa.penalty,
                   pa.delivery, Variant(Date(doc.date + pa.deliveryTime)), pa.priceList, pa.priceCat, pa.cPriceList,
                   pa.contact, pa.partnerAcc, k.purchase ? 0 : ownAcc, k.purchase ? 0 : pa.agent,
                   k.purchase ? pa.agent : 0, f.receipt || f.assembly ? doc.store : (f.move ? doc.toStore : 0),
                   f.issue || f.move ? doc.store : 0});
    Insert(db_, "GDocument",
           "ID, DocName, RefType, DocNo, DocDate, DealDate, DealState, IsCertified, SourceDocNo, IDGRDocType, "
           "IDGRDocSeries, IDGRCurrency, ExchangeRate, ExchangeRateRef, IDXALUser, IDDRStore, "
           "IDGRCompany, CompanyName, CompanyAddr, IDGRTermPayment, PromptDate, PenaltyPercent, IDGRTermDelivery, "
           "DeliveryDate, IDGRPriceList, IDGRCompanyPriceCat, IDGRCPriceList, IDGRCompContPerson, IDPartnerBAcc, "
           "IDGRBankAccount, IDSalesManager, IDPurchasingAgent, IDReceiverStore, IDSenderStore",
           {header});
  }

  // Amounts, taxes, base values and stock costs of the document's rows, and their stores.
  std::vector<Computed> ComputeRows(const StoredDoc& doc, const KindInfo& k, const Flow& f, double rate, int zeroTax) {
    std::vector<Computed> rows;
    for (const StoredRow& r : kRows) {
      if (r.doc != doc.id) continue;
      auto a = articles_.find(r.article);
      if (a == articles_.end()) Raise(kErrSql, "demo row names a missing article");
      Computed c{&r, a->second, k.taxed ? a->second.tax : 0, r.price, 0, 0, 0, 0, 0, kNull, kNull};
      if (c.tax != 0 && zeroTax != 0) c.tax = zeroTax;  // exports and imports carry no VAT
      const bool goods = c.art.type != "S";
      const bool fromStock = f.issue || f.move || (f.assembly && r.parent != 0);
      if (f.storeRows) {
        if (f.receipt || (f.assembly && r.parent == 0)) c.receiver = Variant(doc.store);
        if (f.issue || f.move || (f.assembly && r.parent != 0)) c.sender = Variant(doc.store);
        if (f.move) c.receiver = Variant(doc.toStore);
      }
      if (fromStock && goods) {
        Variant unit = db_.Scalar("SELECT Cost FROM DCurBalanceStore WHERE IDGRArticle = ? AND IDDRStore = ?",
                                  {Variant(r.article), Variant(doc.store)});
        c.cost = Money(r.quantity * ValueOr(unit, 0.0));
      }
      if (f.move || f.assembly) {
        c.amount = c.cost;
        c.unitPrice = r.quantity != 0 ? c.cost / r.quantity : 0;
      } else {
        c.amount = Money(r.quantity * r.price);
      }
      c.amountBase = Money(c.amount * rate);
      const double pct = c.tax ? taxes_[c.tax] : 0.0;
      c.taxAmount = Money(c.amount * pct / 100.0);
      c.taxBase = Money(c.taxAmount * rate);
      if (f.receipt) c.cost = c.amountBase;
      rows.push_back(c);
    }
    return rows;
  }

  // An assembled set costs what its components cost.
  static void CostAssembledSets(std::vector<Computed>& rows) {
    for (size_t i = 0; i < rows.size(); ++i) {
      if (rows[i].source->parent != 0) continue;
      double sum = 0;
      for (const Computed& c : rows)
        if (c.source->parent == static_cast<int>(i + 1)) sum += c.cost;
      rows[i].cost = rows[i].amount = rows[i].amountBase = Money(sum);
      rows[i].unitPrice = rows[i].source->quantity != 0 ? sum / rows[i].source->quantity : 0;
    }
  }

  // Stores the rows (components under their set row) with their lot reservations.
  Totals WriteRows(const StoredDoc& doc, const KindInfo& k, const Flow& f, const std::vector<Computed>& rows,
                   const Partner& pa) {
    const std::string kind = doc.kind;
    std::string columns =
        "IDDoc, RowNo, IDGRArticle, IDGRUnit, IDGRTax, IDDRStore, IDGRPriceList, ArticleType, CompletionType, Name, "
        "Country, DealState, DocDate, DeliveryDate, Quantity, BaseQuantity, NetMass, UnitPrice, Price, Amount, "
        "AmountBase, AmountRef, TaxAmount, TaxAmountBase, TaxAmountRef, Cost, SerialNo, IDParentRow";
    if (f.storeRows) columns += ", IDSenderStore, IDReceiverStore";
    if (kind == "SDOrder") columns += ", ShippedQuantity";
    std::vector<int64_t> ids;
    Totals t;
    for (size_t i = 0; i < rows.size(); ++i) {
      const Computed& c = rows[i];
      const StoredRow& r = *c.source;
      const bool isSet = c.art.type == "P" && f.assembly && r.parent == 0;
      Row row = {doc.id, static_cast<int>(i + 1), r.article, c.art.unit, c.tax, doc.store, pa.priceList, c.art.type,
                 isSet ? "P" : "", c.art.name, c.art.country, doc.dealState, Variant(Date(doc.date)),
                 Variant(Date(doc.date + pa.deliveryTime)), r.quantity, r.quantity, r.quantity * c.art.netMass,
                 c.unitPrice, c.unitPrice, c.amount, c.amountBase, c.amountBase, c.taxAmount, c.taxBase, c.taxBase,
                 c.cost, r.lot, r.parent ? Variant(static_cast<double>(ids.at(static_cast<size_t>(r.parent - 1))))
                                         : Variant(0)};
      if (f.storeRows) row.insert(row.end(), {c.sender, c.receiver});
      if (kind == "SDOrder") row.push_back(doc.shipped ? r.quantity : 0.0);
      Insert(db_, k.rowTable, columns.c_str(), {row});
      ids.push_back(db_.LastInsertId());
      if (f.storeRows && *r.lot) Reserve(r, doc, ids.back(), c.receiver.IsNull());
      if (f.assembly && r.parent != 0) continue;  // the set row carries the document's value
      t.net += c.amount;
      t.tax += c.taxAmount;
      t.netBase += c.amountBase;
      t.taxBase += c.taxBase;
    }
    return t;
  }

  void WriteTotals(const StoredDoc& doc, const Totals& t) {
    const double total = Money(t.net + t.tax), totalBase = Money(t.netBase + t.taxBase);
    db_.Exec("UPDATE GDocument SET TaxAmount = ?, TaxAmountBase = ?, TaxAmountRef = ?, TotalAmount = ?, "
             "TotalAmountBase = ?, TotalAmountRef = ? WHERE ID = ?",
             {Money(t.tax), Money(t.taxBase), Money(t.taxBase), total, totalBase, totalBase, doc.id});
  }

  // The relation to the document this one follows.
  void LinkPrevious(const StoredDoc& doc) {
    if (doc.prevDoc == 0) return;
    const char* prevKind = nullptr;
    for (const StoredDoc& d : kDocs)
      if (d.id == doc.prevDoc) prevKind = d.kind;
    Insert(db_, "GDocRel", "PrevDocName, IDPrevDoc, NextDocName, IDNextDoc",
           {{prevKind ? prevKind : "", doc.prevDoc, doc.kind, doc.id}});
  }

  // The document's rate: 1 for the base currency, else the rate of that very day.
  double Rate(int currency, int32_t date) {
    if (currency == 1) return 1.0;
    Variant r = db_.Scalar("SELECT ConversionRate FROM GRCurValue WHERE IDGRCurrency = ? AND ChangeDate = ?",
                           {Variant(currency), Variant(Date(date))});
    if (r.IsNull()) Raise(kErrSql, "demo document in currency " + std::to_string(currency) + " has no rate");
    return CDbl(r);
  }

  int IntOr0(const char* sql, int arg) {
    return ValueOr(db_.Scalar(sql, {Variant(arg)}), 0);
  }

  // Lots and serial numbers: a receipt opens a reservation under the lot; issues draw on it.
  void Reserve(const StoredRow& r, const StoredDoc& doc, int64_t rowID, bool issueOnly) {
    Variant res = db_.Scalar("SELECT ID FROM DRStockReserve WHERE IDGRArticle = ? AND SerialNo = ?",
                             {Variant(r.article), Variant(r.lot)});
    if (res.IsNull()) {
      if (issueOnly) {
        // A serial range issued out of a larger received range: find the range it came from.
        res = db_.Scalar("SELECT ID FROM DRStockReserve WHERE IDGRArticle = ? ORDER BY DocDate, ID LIMIT 1",
                         {Variant(r.article)});
        if (res.IsNull()) Raise(kErrSql, std::string("demo issue of lot ") + r.lot + " that was never received");
      } else {
        Insert(db_, "DRStockReserve", "IDGRArticle, Quantity, SerialNo, DocDate",
               {{r.article, r.quantity, r.lot, Variant(Date(doc.date))}});
        res = Variant(static_cast<double>(db_.LastInsertId()));
      }
    }
    Insert(db_, "DRStockReserveRel", "IDDRStockReserve, IDDDStoreDRow, Quantity",
           {{res, Variant(static_cast<double>(rowID)), r.quantity}});
  }

  Database& db_;
  std::map<int, Article> articles_;
  std::map<int, double> taxes_;
};

}  // namespace

void WriteDocuments(Database& db) {
  DocumentWriter writer(db);
  for (const StoredDoc& d : kDocs) writer.Write(d);
  // Taxes per document and rate; series numbers; closed-period stock flows.
  db.Exec("INSERT INTO GDTax (IDGDocument, IDGRTax, TaxAmount, TaxAmountBase, TaxAmountRef, Amount, AmountBase) "
          "SELECT IDDoc, IDGRTax, total(TaxAmount), total(TaxAmountBase), total(TaxAmountRef), total(Amount), "
          "total(AmountBase) FROM (SELECT IDDoc, IDGRTax, TaxAmount, TaxAmountBase, TaxAmountRef, Amount, AmountBase "
          "FROM SDInvoiceRow UNION ALL SELECT IDDoc, IDGRTax, TaxAmount, TaxAmountBase, TaxAmountRef, Amount, "
          "AmountBase FROM SDOrderRow UNION ALL SELECT IDDoc, IDGRTax, TaxAmount, TaxAmountBase, TaxAmountRef, Amount, "
          "AmountBase FROM DDStoreDRow) WHERE IDGRTax <> 0 GROUP BY IDDoc, IDGRTax ORDER BY IDDoc, IDGRTax");
  db.Exec("UPDATE GRDocSeries SET LastNo = (SELECT ifnull(max(DocNo), 0) FROM GDocument "
          "WHERE IDGRDocSeries = GRDocSeries.ID)");
  db.Exec("INSERT INTO DBalanceStore (DocDate, IDGRArticle, IDDRStore, DebitQFlow, CreditQFlow, DebitFlowBase, "
          "CreditFlowBase, DebitFlowRef, CreditFlowRef) "
          "SELECT DocDate, IDGRArticle, St, total(DQ), total(CQ), total(DB), total(CB), total(DB), total(CB) FROM ("
          " SELECT DocDate, IDGRArticle, IDReceiverStore St, BaseQuantity DQ, 0 CQ,"
          "  CASE WHEN DealState = '' THEN Cost ELSE 0 END DB, 0 CB FROM DDStoreDRow"
          "  WHERE IDReceiverStore IS NOT NULL AND ArticleType <> 'S' AND DealState <> 'P' AND DocDate < ?"
          " UNION ALL SELECT DocDate, IDGRArticle, IDSenderStore, 0, BaseQuantity, 0, Cost FROM DDStoreDRow"
          "  WHERE IDSenderStore IS NOT NULL AND ArticleType <> 'S' AND DealState <> 'P' AND DocDate < ?)"
          " GROUP BY DocDate, IDGRArticle, St ORDER BY DocDate, IDGRArticle, St",
          {Variant(Date(kDateFixed)), Variant(Date(kDateFixed))});
}

}  // namespace xal::host::demo
