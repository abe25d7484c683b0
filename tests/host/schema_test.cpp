// The schema holds every header and row field the document logic reads or writes: each document
// kind of the catalogue, in both database kinds, stores and reads back every such field through
// a document session, and the linked fields and sub-rows the handlers read resolve.
#include <gtest/gtest.h>

#include "host/document_session.h"
#include "host_fixture.h"
#include "runtime/convert.h"

namespace xal::host {
namespace {

// Header fields of the document handlers (ids, flags and texts; the amounts the totals write).
const char* const kHeaderFields[] = {
    "IDGRDocType", "IDGRDocSeries", "IDGRCompany", "IDPartner", "IDOwner", "IDOwnerBAcc", "IDEREmployee",
    "IDXALUser", "IDDRStore", "IDSenderStore", "IDReceiverStore", "IDGRTax", "IDGRDepartment", "IDGRProject",
    "IDWorker", "IDGRArticle", "IDGRPriceList", "IDGRCompanyPriceCat", "IDGRTermPayment", "IDGRTermDelivery",
    "IDGRCompContPerson", "IDPartnerBAcc", "IDBRAccount", "IDPurchaseAccount", "IDDebtAccount", "IDGRCurrency",
    "IDDRIntrTermDelivery", "IDDRIntrTransport", "IDDRIntrCustomsProc", "IDPDInvoice", "IDPDOrder", "IDSDInvoice",
    "IDSDOrder", "IDGARegister1", "IDGARegister5", "IDGBRegister1", "IDGBRegister5", "DocNo", "IsApproximated",
    "IsCertified", "APInvoice", "DealState", "DocState", "RefType", "SourceDocNo", "ReferenceNo", "CompanyName",
    "CompanyAddr", "PartnerName", "PartnerAddr", "PriceList", "Country", "DeliveryLocation", "ExchangeRate",
    "ExchangeRateRef", "PriceCut", "PenaltyPercent", "TaxAmount", "TaxAmountBase", "TaxAmountRef", "TotalAmount",
    "TotalAmountBase", "TotalAmountRef", "ApproxDifference", "ApproxDifferenceBase", "ApproxDifferenceRef",
    "DocDate", "DealDate", "PromptDate", "DeliveryDate"};

// Row fields of the row handlers, on every document row table.
const char* const kRowFields[] = {
    "IDGRArticle", "IDGRUnit", "IDGRBarCode", "AltBarCode", "IDGRArticleCat", "IDDRStore", "IDGRTax",
    "IDGRPriceList", "IDGRCPriceList", "IDGRCompany", "IDGRDepartment", "IDGRProject", "IDWorker",
    "IDGARegister1", "IDGARegister5", "IDGBRegister1", "IDGBRegister5", "IDBRAccount", "OrderRowID",
    "ArticleType", "CompletionType", "Name", "Country", "Quantity", "BaseQuantity", "AltQuantity",
    "OrderedQuantity", "NetMass", "CNQuantity", "UnitPrice", "Price", "Amount", "AmountBase", "AmountRef", "Cost",
    "StatAmount", "TaxAmount", "TaxAmountBase", "TaxAmountRef", "PriceCut", "DeliveryDate", "SerialNo"};

// Rows of particular kinds: store rows, order rows, and both sides of capital-asset movements.
const char* const kStoreRowFields[] = {"IDSenderStore", "IDReceiverStore", "IDRealIncomeAccount"};
const char* const kAssetRowFields[] = {
    "IDReceiverArticle", "IDSenderArticle", "IDReceiverStore", "IDSenderStore", "IDReceiverDepartment",
    "IDSenderDepartment", "IDReceiverProject", "IDSenderProject", "IDReceiverWorker", "IDSenderWorker",
    "IDReceiverGARegister1", "IDSenderGARegister5", "IDReceiverGBRegister3", "IDSenderGBRegister1"};

// A value of the field's own kind, different for every field.
Variant ValueFor(const std::string& field, int n) {
  static const char* const texts[] = {"AltBarCode", "ArticleType", "CompletionType", "Name", "Country", "SerialNo",
                                      "DealState", "DocState", "RefType", "SourceDocNo", "ReferenceNo",
                                      "CompanyName", "CompanyAddr", "PartnerName", "PartnerAddr", "PriceList",
                                      "DeliveryLocation"};
  for (const char* t : texts)
    if (field == t) return Variant("t" + std::to_string(n));
  if (field.find("Date") != std::string::npos) return Variant(Date(40000 + n));
  if (field.rfind("Is", 0) == 0 || field == "APInvoice") return Variant(true);
  if (field.rfind("ID", 0) == 0 || field == "DocNo") return Variant(100 + n);
  return Variant(n + 0.5);
}

// Stores a document of `kind` with every handler field set, reopens it and reads them back.
void StoreEveryField(const Ref<HostConnection>& c, const std::string& kind, const std::string& rowTable) {
  std::vector<std::string> rowFields(std::begin(kRowFields), std::end(kRowFields));
  if (rowTable == "DDStoreDRow") rowFields.insert(rowFields.end(), std::begin(kStoreRowFields), std::end(kStoreRowFields));
  if (rowTable == "CADocRow") rowFields.insert(rowFields.end(), std::begin(kAssetRowFields), std::end(kAssetRowFields));
  if (rowTable == "SDOrderRow") rowFields.push_back("ShippedQuantity");
  auto s = DocumentSession::Open(c, kind);
  int n = 0;
  for (const char* f : kHeaderFields) s->Header()->SetField(f, ValueFor(f, ++n));
  s->Rows()->AddNew();
  for (const std::string& f : rowFields) s->Rows()->SetField(f, ValueFor(f, ++n));
  const int32_t id = s->Save();
  s->Close();
  auto again = DocumentSession::Open(c, kind, id);
  ASSERT_EQ(again->Rows()->RowCount(), 1);
  n = 0;
  for (const char* f : kHeaderFields) EXPECT_EQ(CStr(again->Header()->Field(f)), CStr(ValueFor(f, ++n))) << f;
  for (const std::string& f : rowFields) {
    ++n;
    if (f == "DealState" && rowTable == "DDStoreDRow") continue;  // a store row takes the header's
    EXPECT_EQ(CStr(again->Rows()->Field(f)), CStr(ValueFor(f, n))) << f;
  }
  EXPECT_EQ(again->Header()->Field("DocName"), Variant(kind));
  again->Close();
}

class Schema : public testing::HostTest {};

TEST_F(Schema, EveryDocumentKindStoresEveryHandlerField) {
  for (int32_t dbKind : {kDbFile, kDbServer}) {
    auto c = HostConnection::Open(path(), dbKind);
    ResultSet kinds = c->db().Query("SELECT TableName, RowTable FROM XALTable WHERE isDocument <> 0 AND RowTable <> ''");
    ASSERT_EQ(kinds.rows.size(), 26u);
    for (auto& k : kinds.rows) {
      SCOPED_TRACE(k[0].AsString() + " in database kind " + std::to_string(dbKind));
      StoreEveryField(c, k[0].AsString(), k[1].AsString());
    }
  }
}

TEST_F(Schema, LinkedFieldsAndSubRowsTheHandlersRead) {
  auto c = HostConnection::Open(path(), kDbServer);
  c->db().ExecScript(
      "INSERT INTO GRUnit (ID, Code) VALUES (3, 'kg');"
      "INSERT INTO DRIntrCNCode (ID, Code, IDGRUnit) VALUES (8, '0901', 3);"
      "INSERT INTO GRCompany (ID, Code, Country, IDDRIntrTransport, DeliveryLocation) VALUES (20, 'SUP', 'LV', 4, 'Riga');"
      "INSERT INTO GRArticle (ID, Code, IDDRIntrCNCode, IDGRCompany) VALUES (1, 'A1', 8, 20);"
      "INSERT INTO EREmployee (ID, Name) VALUES (40, 'Mari');"
      "INSERT INTO GRDocType (ID, Code, XALType) VALUES (2, 'T', 'SDInvoice');"
      "INSERT INTO GDocument (ID, DocName, IDPartner, IDWorker, IDOwner) VALUES (7, 'PDReceiptD', 20, 40, 20);"
      "INSERT INTO DDStoreDRow (ID, IDDoc, IDGRArticle, IDReceiverStore) VALUES (70, 7, 1, 100);"
      "INSERT INTO DRStockReserve (ID, IDGRArticle, IDDDStoreDRow, IDDRStore, Quantity) VALUES (5, 1, 70, 100, 3);");
  auto s = DocumentSession::Open(c, "PDReceiptD", 7);
  struct Path {
    Ref<DataObject> on;
    const char* path;
    Variant expected;
  } paths[] = {
      {s->Rows(), "GRArticle.DRIntrCNCode.IDGRUnit", Variant(3)},
      {s->Rows(), "GRArticle.GRCompany.Country", Variant("LV")},
      {s->Header(), "Partner.IDDRIntrTransport", Variant(4)},
      {s->Header(), "Partner.DeliveryLocation", Variant("Riga")},
      {s->Header(), "Worker.Name", Variant("Mari")},
      {s->Header(), "Owner.Code", Variant("SUP")},
  };
  for (const Path& p : paths) EXPECT_EQ(p.on->Field(p.path), p.expected) << p.path;
  EXPECT_EQ(c->db().Scalar("SELECT ID FROM GRDocType WHERE XALType = 'sdinvoice'"), Variant(2));
  // A receipt row's lots are its sub-rows; a relation carries the row's article.
  Ref<DataObject> lots = s->Proxy()->CachedRows("DDStoreDRow", "DRStockReserve");
  ASSERT_NE(lots, nullptr);
  ASSERT_EQ(lots->RowCount(), 1);
  lots->SetField("IDDRStore", Variant(101));
  Ref<DataObject> rels = s->Proxy()->CachedRows("DDStoreDRow", "DRStockReserveRel");
  ASSERT_NE(rels, nullptr);
  rels->AddNew();
  rels->SetField("IDDRStockReserve", Variant(5));
  rels->SetField("IDGRArticle", Variant(1));
  rels->SetField("Quantity", Variant(3));
  s->Save();
  EXPECT_EQ(c->db().Scalar("SELECT IDDRStore FROM DRStockReserve WHERE ID = 5"), Variant(101));
  EXPECT_EQ(c->db().Scalar("SELECT IDGRArticle FROM DRStockReserveRel WHERE IDDDStoreDRow = 70"), Variant(1));
  s->Close();
}

}  // namespace
}  // namespace xal::host
