// The document row tables, made from one column list, and the schema around them.
#include "host/schema.h"

#include <vector>

#include "runtime/text.h"

namespace xal::host {

extern const char kSchemaSql[];

namespace {

// What every document row holds, whatever its kind: the article and its unit, quantities, prices,
// amounts in the three currencies, taxes, the set structure (IDParentRow, CompletionType), the
// registers the header hands down (department, project, worker; the A and B registers 1 to 5 are
// added by RegisterColumns), and the fields the row validations fill (bar codes, accounts,
// statistics, the order row).
constexpr const char* kDocumentRowColumns = R"sql(
  IDGRArticle INTEGER NOT NULL DEFAULT 0,
  IDDRStore INTEGER NOT NULL DEFAULT 0,
  IDGRUnit INTEGER NOT NULL DEFAULT 0,
  IDGRTax INTEGER NOT NULL DEFAULT 0,
  IDGRPriceList INTEGER NOT NULL DEFAULT 0,
  IDGRCPriceList INTEGER NOT NULL DEFAULT 0,
  IDGRBarCode INTEGER NOT NULL DEFAULT 0,
  AltBarCode TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  IDGRArticleCat INTEGER NOT NULL DEFAULT 0,
  IDParentRow INTEGER NOT NULL DEFAULT 0,
  IDGRCompany INTEGER NOT NULL DEFAULT 0,
  IDGRDepartment INTEGER NOT NULL DEFAULT 0,
  IDGRProject INTEGER NOT NULL DEFAULT 0,
  IDWorker INTEGER NOT NULL DEFAULT 0,
  IDBRAccount INTEGER NOT NULL DEFAULT 0,
  OrderRowID INTEGER NOT NULL DEFAULT 0,
  ArticleType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  CompletionType TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Name TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  Country TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DealState TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  DocDate DATE REAL NOT NULL DEFAULT 0,
  Quantity REAL NOT NULL DEFAULT 0,
  BaseQuantity REAL NOT NULL DEFAULT 0,
  AltQuantity REAL NOT NULL DEFAULT 0,
  OrderedQuantity REAL NOT NULL DEFAULT 0,
  NetMass REAL NOT NULL DEFAULT 0,
  CNQuantity REAL NOT NULL DEFAULT 0,
  UnitPrice CURRENCY REAL NOT NULL DEFAULT 0,
  Price CURRENCY REAL NOT NULL DEFAULT 0,
  Amount CURRENCY REAL NOT NULL DEFAULT 0,
  AmountBase CURRENCY REAL NOT NULL DEFAULT 0,
  AmountRef CURRENCY REAL NOT NULL DEFAULT 0,
  Cost CURRENCY REAL NOT NULL DEFAULT 0,
  StatAmount CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmount CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmountBase CURRENCY REAL NOT NULL DEFAULT 0,
  TaxAmountRef CURRENCY REAL NOT NULL DEFAULT 0,
  PriceCut REAL NOT NULL DEFAULT 0,
  DeliveryDate DATE REAL NOT NULL DEFAULT 0,
  RowNo INTEGER NOT NULL DEFAULT 0,
  SerialNo TEXT COLLATE NOCASE NOT NULL DEFAULT '')sql";

// Capital-asset rows: the asset's values, and both sides of a movement of the asset. The
// capital-asset documents name their row fields with "IDReceiver" (or, for a rebuilding,
// "IDSender") in front of the article, store, department, project, worker and registers.
constexpr const char* kCapitalAssetColumns = R"sql(IDCRCapitalAssets INTEGER NOT NULL DEFAULT 0,
  DocName TEXT COLLATE NOCASE NOT NULL DEFAULT '',
  BasicCost CURRENCY REAL NOT NULL DEFAULT 0,
  BasicCostRef CURRENCY REAL NOT NULL DEFAULT 0,
  DepreciatedCost CURRENCY REAL NOT NULL DEFAULT 0,
  DepreciatedCostRef CURRENCY REAL NOT NULL DEFAULT 0,
  DepreciationRate REAL NOT NULL DEFAULT 0,
  DepreciationAmount CURRENCY REAL NOT NULL DEFAULT 0,
  DepreciationAmountRef CURRENCY REAL NOT NULL DEFAULT 0,
  IDCALastRegRow INTEGER NOT NULL DEFAULT 0)sql";

struct RowTable {
  const char* name;
  const char* link;        // the column that names the document
  const char* extra;       // columns of this kind only
  bool twoSided = false;   // the receiver and sender columns of capital-asset movements
};

constexpr RowTable kRowTables[] = {
    // Store rows: a missing store is NULL, so that the balance triggers and indexes skip it.
    {"DDStoreDRow", "IDDoc",
     "IDSenderStore INTEGER, IDReceiverStore INTEGER, IDRealIncomeAccount INTEGER NOT NULL DEFAULT 0"},
    {"SDInvoiceRow", "IDDoc", ""},
    {"SDOrderRow", "IDDoc", "ShippedQuantity REAL NOT NULL DEFAULT 0"},
    {"PDOrderRow", "IDDoc", ""},
    {"PDInvoiceRow", "IDDoc", ""},
    {"GUDocumentRow", "IDDoc", ""},
    {"GDContractRow", "IDDoc", ""},
    {"VDVoucherRow", "IDVDVoucher",
     "IDSourceDoc INTEGER NOT NULL DEFAULT 0, IDGRBankAccount INTEGER NOT NULL DEFAULT 0, "
     "IDVRCashDesk INTEGER NOT NULL DEFAULT 0, IDGRCurrency INTEGER NOT NULL DEFAULT 0"},
    {"BDBookingORow", "IDBDBookingO", ""},
    {"WDocumentRow", "IDWDocument", ""},
    {"CADocRow", "IDCADocument", kCapitalAssetColumns, true},
};

// ",\n  <prefix>GARegister1 INTEGER NOT NULL DEFAULT 0" … for the A and B registers 1 to 5.
std::string RegisterColumns(const std::string& prefix) {
  std::string out;
  for (const char* reg : {"GARegister", "GBRegister"})
    for (int i = 1; i <= 5; ++i) out += ",\n  " + prefix + reg + std::to_string(i) + " INTEGER NOT NULL DEFAULT 0";
  return out;
}

// The receiver and sender columns of every field a capital-asset movement keeps on both sides.
std::string TwoSidedColumns() {
  std::string out;
  for (const std::string side : {"IDReceiver", "IDSender"}) {
    for (const char* f : {"Article", "Store", "Department", "Project", "Worker"})
      out += ",\n  " + side + f + " INTEGER NOT NULL DEFAULT 0";
    out += RegisterColumns(side);
  }
  return out;
}

}  // namespace

std::string DocumentRowTablesSql() {
  std::string sql;
  for (const RowTable& t : kRowTables) {
    const std::string name = t.name, link = t.link;
    sql += "CREATE TABLE " + name + " (\n  ID INTEGER PRIMARY KEY,\n  " + link + " INTEGER NOT NULL DEFAULT 0," +
           kDocumentRowColumns + RegisterColumns("ID");
    if (*t.extra) sql += ",\n  " + std::string(t.extra);
    if (t.twoSided) sql += TwoSidedColumns();
    sql += "\n);\nCREATE INDEX " + name + "_" + link + " ON " + name + " (" + link + ");\n";
  }
  return sql;
}

std::string DocumentLinkColumn(const std::string& rowTable) {
  for (const RowTable& t : kRowTables)
    if (TextEquals(rowTable, t.name)) return t.link;
  return "IDDoc";
}

void CreateSchema(Database& db) {
  db.ExecScript(DocumentRowTablesSql());
  db.ExecScript(kSchemaSql);
}

}  // namespace xal::host
