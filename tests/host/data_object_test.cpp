// The reference host's data objects, connection and server: dotted paths, pseudo-fields, row
// states, write-back, locks between connections, options by user, and SQL errors as run-time errors.
#include "host/data_object.h"

#include <gtest/gtest.h>

#include "error_of.h"

#include "host/host_error.h"
#include "host/param_list.h"
#include "host_fixture.h"
#include "runtime/convert.h"

namespace xal::host {
namespace {

using testing::HostTest;

using ::xal::test::ErrorOf;

class DataObjects : public HostTest {};

TEST_F(DataObjects, DottedPaths) {
  Ref<DataObject> doc = conn->Server()->OpenQuery("SDInvoice", 1, "ID = 1000", "");
  ASSERT_FALSE(doc->IsEOF());
  struct Row {
    const char* path;
    Variant expected;
  } rows[] = {
      {"GRCompany.Name", Variant("Acme Ltd")},
      {"grcompany.name", Variant("Acme Ltd")},          // any letter case
      {"Partner.Name", Variant("Beta OÜ")},             // alias through IDPartner
      {"GRCompany.GRCurrency.Code", Variant("EUR")},    // two links
      {"Partner.GRCurrency.Code", Variant("USD")},
      {"GRCompany.CreditLimit", Variant(Currency::FromInt(5000))},  // typed by the column
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.path);
    EXPECT_EQ(doc->Field(r.path), r.expected);
  }
  // Three links: a store's company's currency, read from a row of DDStoreDRow-like data.
  conn->db().ExecScript("INSERT INTO DDStoreDRow (ID, IDDoc, IDReceiverStore) VALUES (1, 1000, 100);");
  Ref<DataObject> row = conn->Server()->OpenQuery("DDStoreDRow", 1, "", "");
  EXPECT_EQ(row->Field("ReceiverStore.GRCompany.GRCurrency.Code"), Variant("EUR"));
  EXPECT_EQ(row->Field("Doc.DocNo"), Variant(7));
  // A link with no id (0 or NULL) or pointing nowhere gives Empty.
  EXPECT_TRUE(row->Field("SenderStore.Name").IsEmpty());  // NULL store
  doc->MoveNext();
  EXPECT_TRUE(doc->Field("GRCompany.Name").IsEmpty());    // IDGRCompany = 0
  conn->db().ExecScript("UPDATE GDocument SET IDGRCompany = 999 WHERE ID = 1001;");
  Ref<DataObject> again = conn->Server()->OpenQuery("SDInvoice", 1, "ID = 1001", "");
  EXPECT_TRUE(again->Field("GRCompany.Name").IsEmpty());  // no such row
  Ref<DataObject> first = conn->Server()->OpenQuery("SDInvoice", 1, "ID = 1000", "");
  EXPECT_EQ(ErrorOf([&] { first->Field("Partner.NoSuchColumn"); }), 3265);
  EXPECT_EQ(ErrorOf([&] { again->Field("NoSuchField"); }), 3265);
  EXPECT_EQ(ErrorOf([&] { again->Field("NoSuchLink.Name"); }), 3265);
}

TEST_F(DataObjects, LinkCacheDroppedOnWrite) {
  Ref<DataObject> doc = conn->Server()->OpenQuery("SDInvoice", 1, "ID = 1000", "");
  EXPECT_EQ(doc->Field("GRCompany.Name"), Variant("Acme Ltd"));
  conn->Execute("UPDATE GRCompany SET Name = 'Acme Group' WHERE ID = 10", 0);
  EXPECT_EQ(doc->Field("GRCompany.Name"), Variant("Acme Group"));
}

TEST_F(DataObjects, PseudoFieldsSurviveMovesAndBookmarks) {
  Ref<DataObject> docs = conn->Server()->OpenQuery("SELECT * FROM GDocument ORDER BY ID", 1, "", "");
  docs->SetField("@UnitPrice", Variant(1.5));
  Variant mark = docs->Bookmark();
  docs->MoveNext();
  EXPECT_TRUE(docs->Field("@UnitPrice").IsEmpty());  // per row
  docs->SetField("@unitprice", Variant(2.5));
  docs->MoveFirst();
  EXPECT_EQ(docs->Field("@UNITPRICE"), Variant(1.5));
  docs->MoveNext();
  docs->GoToBookmark(mark);
  EXPECT_EQ(docs->Field("ID"), Variant(1000));
  EXPECT_EQ(docs->Field("@UnitPrice"), Variant(1.5));
  EXPECT_EQ(ErrorOf([&] { docs->GoToBookmark(Variant(999)); }), 3159);
}

TEST_F(DataObjects, NavigationAndFindFirst) {
  Ref<DataObject> docs = conn->Server()->OpenQuery("SELECT * FROM GDocument ORDER BY ID", 1, "", "");
  EXPECT_EQ(docs->RowCount(), 2);
  EXPECT_FALSE(docs->IsBOF());
  EXPECT_EQ(docs->FindFirst("DocNo = 8 AND DocDate = #3/6/2009#", 0), 0);
  EXPECT_EQ(docs->Field("ID"), Variant(1001));
  EXPECT_EQ(docs->FindFirst("ID=5", 0), 1);   // not found: stays
  EXPECT_EQ(docs->Field("ID"), Variant(1001));
  docs->MoveNext();
  EXPECT_TRUE(docs->IsEOF());
  EXPECT_TRUE(docs->Field("ID").IsEmpty());    // no current row
  Ref<DataObject> none = conn->Server()->OpenQuery("GDocument", 1, "ID = -1", "");
  EXPECT_TRUE(none->IsEOF());
  EXPECT_TRUE(none->IsBOF());
}

TEST_F(DataObjects, RowStatesAndWriteBack) {
  Ref<DataObject> docs = conn->Server()->OpenDataObject("SDInvoice");
  docs->AddNew();
  EXPECT_TRUE(docs->RowState(kRowNotStored));
  docs->SetField("DocNo", Variant("42"));  // converted to the column's type
  docs->SetField("DocDate", Variant("2009-03-05"));
  docs->SetField("TotalAmount", Variant(10.0 / 3.0));
  docs->UpdateRow(false, false, false);
  EXPECT_FALSE(docs->RowState(kRowNotStored));
  Variant id = docs->Field("ID");
  EXPECT_EQ(docs->Field("DocState"), Variant(""));  // default filled in by the table
  ResultSet rs = conn->db().Query("SELECT DocName, DocNo, DocDate, TotalAmount FROM GDocument WHERE ID = ?", {id});
  ASSERT_EQ(rs.rows.size(), 1u);
  EXPECT_EQ(rs.rows[0][0], Variant("SDInvoice"));  // a kind view stores its rows as that kind
  EXPECT_EQ(rs.rows[0][1], Variant(42));
  EXPECT_EQ(rs.rows[0][2], Variant(Date(39877)));
  EXPECT_EQ(rs.rows[0][3], Variant(Currency::FromRaw(33333)));

  docs->MoveFirst();
  docs->SetField("PriceList", Variant("Retail"));
  docs->UpdateRow(false, false, false);
  EXPECT_EQ(conn->db().Scalar("SELECT PriceList FROM GDocument WHERE ID = 1000"), Variant("Retail"));

  docs->MoveFirst();
  docs->Delete();  // marked, moves on
  EXPECT_FALSE(docs->RowState(kRowMarkedDeleted));
  docs->MoveFirst();
  EXPECT_TRUE(docs->RowState(kRowMarkedDeleted));
  EXPECT_EQ(std::static_pointer_cast<HostDataObject>(docs)->ActualRowCount(), 2);
  EXPECT_EQ(docs->CallFunction("ActualRowCount", Variant(), 0), Variant(2));
  std::static_pointer_cast<HostDataObject>(docs)->Save();
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM GDocument WHERE ID = 1000"), Variant(0));
  EXPECT_EQ(docs->RowCount(), 2);
}

TEST_F(DataObjects, ReadOnlyQueriesAndBadInput) {
  Ref<DataObject> sums = conn->Server()->OpenQuery("SELECT Sum(TotalAmount) AS S FROM GDocument", 1, "", "");
  EXPECT_EQ(ErrorOf([&] { sums->UpdateRow(false, false, false); }), 3027);
  EXPECT_EQ(ErrorOf([&] { conn->Server()->OpenQuery("SELECT * FROM NoSuchTable", 1, "", ""); }), kErrSql);
  EXPECT_EQ(ErrorOf([&] { conn->Execute("UPDATE GDocument SET Nope = 1", 0); }), kErrSql);
  // Text with quotes passes through a literal intact.
  conn->Execute("UPDATE GRCompany SET Name = 'O''Brien & #1 \"x\"' WHERE ID = 10", 0);
  EXPECT_EQ(conn->db().Scalar("SELECT Name FROM GRCompany WHERE ID = 10"), Variant("O'Brien & #1 \"x\""));
}

TEST_F(DataObjects, OptionsByUserWithDefaults) {
  conn->SetUserOption(0, "Costs", "RunningCost", Variant(true));
  conn->SetUserOption(5, "Costs", "RunningCost", Variant(false));
  EXPECT_EQ(conn->UserOption(5, "costs", "runningcost", Variant("d")), Variant("0"));
  EXPECT_EQ(conn->UserOption(6, "Costs", "RunningCost", Variant("d")), Variant("d"));  // no fallback to system
  EXPECT_EQ(conn->Setting("Costs", "RunningCost", Variant()), Variant("-1"));
  EXPECT_TRUE(CBool(conn->Setting("Costs", "RunningCost", Variant())));
  EXPECT_EQ(conn->Setting("Nope", "Nope", Variant(7)), Variant(7));
  conn->SetSetting("DateFixed", "Store", Variant(Date(39877)));
  EXPECT_EQ(CDate(conn->Setting("DateFixed", "Store", Variant())), Date(39877));
}

TEST_F(DataObjects, LockRefusesASecondHolder) {
  auto other = HostConnection::Open(path(), 1, 2);
  auto params = MakeRef<HostParamList>();
  params->Set("XALType", Variant("SDConsignmD"));
  params->Set("LockType", Variant(1));
  EXPECT_EQ(conn->ServerCommand("Lock", params), Variant(true));
  EXPECT_EQ(conn->ServerCommand("Lock", params), Variant(true));    // the holder may take it again
  EXPECT_EQ(other->ServerCommand("Lock", params), Variant(false));  // another connection may not
  other->ServerCommand("UnLock", params);                           // nor release it
  EXPECT_EQ(other->ServerCommand("Lock", params), Variant(false));
  conn->ServerCommand("UnLock", params);
  EXPECT_EQ(other->ServerCommand("Lock", params), Variant(true));
  other.reset();  // a closed connection's locks go with it
  EXPECT_EQ(conn->ServerCommand("Lock", params), Variant(true));
}

TEST_F(DataObjects, TransactionsRollBack) {
  ASSERT_TRUE(conn->BeginTransaction());
  conn->Execute("DELETE FROM GRCompany", 0);
  conn->RollbackTransaction();
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM GRCompany"), Variant(2));
}

TEST_F(DataObjects, RecordOperationMovesReferences) {
  Ref<DataObject> companies = conn->Server()->OpenQuery("GRCompany", 1, "ID = 11", "");
  EXPECT_EQ(companies->RecordOperation(41, Variant(10)), Variant(1));  // GDocument.IDPartner
  EXPECT_EQ(conn->db().Scalar("SELECT IDPartner FROM GDocument WHERE ID = 1000"), Variant(10));
  EXPECT_EQ(companies->CallFunction("LinkedTableName", Variant("IDPartner"), 0), Variant("GRCompany"));
}

TEST_F(DataObjects, CatalogueMessagesAndProperties) {
  Ref<ParamList> cat = conn->Server()->TableCatalogue();
  auto inv = std::dynamic_pointer_cast<ParamList>(cat->Item("sdinvoice").AsObject());
  ASSERT_NE(inv, nullptr);
  EXPECT_EQ(inv->Item("isDocument"), Variant(true));
  EXPECT_EQ(inv->Item("isRegister"), Variant(false));
  conn->db().ExecScript("INSERT INTO XALMessage VALUES ('Err_DocDateMissing', 2, 'Date missing', 'Kuupäev puudub');");
  EXPECT_EQ(conn->Server()->Text("err_docdatemissing", 2, 4), "Kuupäev puudub");
  EXPECT_EQ(conn->Server()->Text("Err_DocDateMissing", 2, 3), "Date missing");
  conn->SetLanguage(4);
  EXPECT_EQ(conn->Property(8), Variant(4));
  EXPECT_EQ(conn->Server()->Property(5), Variant(4));
  Ref<DataObject> q = conn->Server()->OpenQuery("GRCompany", 1, "", "");
  EXPECT_EQ(q->Property(kPropTableName), Variant("GRCompany"));
}

}  // namespace
}  // namespace xal::host

namespace xal::host {
namespace {

class FilterLayer : public testing::HostTest {};

TEST_F(FilterLayer, RelationConditionsAndRawBraces) {
  conn->db().ExecScript(
      "INSERT INTO GRArticle (ID, Code) VALUES (1, 'A'), (2, 'B'), (3, 'C');"
      "INSERT INTO GRArticleCatRel (IDGRArticle, IDGRArticleCat) VALUES (1, 7), (3, 7), (2, 8);"
      "INSERT INTO SDInvoiceRow (ID, IDDoc) VALUES (50, 1000), (51, 1001);"
      "INSERT INTO SDInvoiceRowPenalty (ID, IDSDInvoiceRow) VALUES (60, 50), (61, 51), (62, 50);");
  auto ids = [](const Ref<DataObject>& d) {
    std::string s;
    for (d->MoveFirst(); !d->IsEOF(); d->MoveNext()) s += (s.empty() ? "" : ",") + CStr(d->Field("ID"));
    return s;
  };
  struct Row {
    const char* table;
    const char* filter;
    const char* expected;
  } rows[] = {
      {"GRArticle", "GRArticleCatRel.IDGRArticleCat = 7", "1,3"},   // a relation table names the rows
      {"GRArticle", "grarticlecatrel.IDGRArticleCat IN (8)", "2"},
      {"GRArticle", "GRArticle.Code = 'B'", "2"},                    // the table itself: as given
      {"SDInvoiceRowPenalty", "{IDSDInvoiceRow IN (SELECT ID FROM SDInvoiceRow WHERE IDDoc = 1000)}", "60,62"},
      {"GRArticle", "ID = 1 OR ID = 3", "1,3"},                      // a plain condition
      {"GRArticle", "Code > 'A' AND 1.5 > 1", "2,3"},                // a decimal point is no link
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.filter);
    EXPECT_EQ(ids(conn->Server()->OpenQuery(r.table, 1, r.filter, "")), r.expected);
  }
}

}  // namespace
}  // namespace xal::host
