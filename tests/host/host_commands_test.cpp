// What the reference host performs for the document logic: the inventory computation
// "DPInventoryB", server locks between connections, the log, row states and the begin/end-of-data
// flags, OnNewRow and bookmarks without a current row, and the user's data object.
#include <gtest/gtest.h>

#include "error_of.h"
#include "host/document_session.h"
#include "host/inventory.h"
#include "host/param_list.h"
#include "host_fixture.h"
#include "runtime/convert.h"
#include "server/stock.h"

namespace xal::host {
namespace {

using ::xal::test::ErrorOf;

class HostCommands : public testing::HostTest {
 protected:
  Ref<ParamList> Params(std::initializer_list<std::pair<const char*, Variant>> entries) {
    auto p = MakeRef<HostParamList>();
    for (const auto& [name, value] : entries) p->Set(name, value);
    return p;
  }
  // "article/store:Quantity" per row of one computation.
  std::string Inventory(const Ref<ParamList>& params) {
    const Variant id = conn->ServerCommand("DPInventoryB", params);
    std::string out;
    for (auto& r : conn->db().Query("SELECT IDGRArticle, IDDRStore, Quantity FROM DPInventoryBRow "
                                    "WHERE IDDPInventoryB = ? ORDER BY 1, 2", {id}).rows)
      out += (out.empty() ? "" : " ") + CStr(r[0]) + "/" + CStr(r[1]) + ":" + CStr(r[2]);
    return out;
  }
};

// Article 1: 10 received into store 1 (document 1), 3 shipped (document 2), 2 reserved for a
// shipment (document 3, state R), 4 pre-reserved receipt and 1 pre-reserved issue (documents 4, 5,
// state P); article 2: 6 received into store 2, a service row that never counts.
constexpr const char* kStock =
    "INSERT INTO DDStoreDRow (IDDoc, IDGRArticle, IDReceiverStore, IDSenderStore, DealState, ArticleType, "
    "BaseQuantity) VALUES (1, 1, 1, NULL, '', 'G', 10), (2, 1, NULL, 1, '', 'G', 3), (3, 1, NULL, 1, 'R', 'G', 2),"
    " (4, 1, 1, NULL, 'P', 'G', 4), (5, 1, NULL, 1, 'P', 'G', 1), (1, 2, 2, NULL, '', 'G', 6),"
    " (1, 3, 2, NULL, '', 'S', 9);";

TEST_F(HostCommands, InventoryComputation) {
  conn->db().ExecScript(kStock);
  struct Case {
    const char* name;
    Ref<ParamList> params;
    const char* rows;
  } cases[] = {
      {"defaults: on hand less reservations", nullptr, "1/1:5 2/2:6"},
      {"reservations free", Params({{"ReservedD", Variant(false)}}), "1/1:7 2/2:6"},
      {"pre-reservations counted", Params({{"CountPreReservations", Variant(true)}}), "1/1:8 2/2:6"},
      {"pre-reserved issues only", Params({{"PreReservedD", Variant(-1)}}), "1/1:4 2/2:6"},
      {"a shipment left out", Params({{"Documents", Variant(2)}}), "1/1:8 2/2:6"},
      {"two documents as text", Params({{"Documents", Variant(" 2; 3 ")}}), "1/1:10 2/2:6"},
      {"left out with pre-reserved issues", Params({{"Documents", Variant("5")}, {"PreReservedD", Variant(true)}}),
       "1/1:5 2/2:6"},
      {"one article", Params({{"GRArticleIDs", Variant("2")}}), "2/2:6"},
      {"nothing left in the store", Params({{"Documents", Variant(1)}, {"GRArticleIDs", Variant(2)}}), ""},
      {"a report keeps the zero pairs",
       Params({{"Documents", Variant(1)}, {"GRArticleIDs", Variant(2)}, {"MakeReport", Variant(true)}}), "2/2:0"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    EXPECT_EQ(Inventory(c.params), c.rows);
  }
  // The default computation is the stock balance the server functions count.
  EXPECT_EQ(server::CountStockBalance(conn, 1, 1), 5.0);
  // The header records the request; deleting it (as the document logic does) takes the rows along.
  const Variant id = conn->ServerCommand("DPInventoryB", Params({{"Documents", Variant("2,3")}}));
  EXPECT_EQ(conn->db().Scalar("SELECT Documents FROM DPInventoryB WHERE ID = ?", {id}), Variant("2,3"));
  conn->Execute("DELETE * FROM DPInventoryB WHERE ID = " + CStr(id), 0);
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM DPInventoryBRow WHERE IDDPInventoryB = ?", {id}), Variant(0));
  // An id list that is not one: a type mismatch, and nothing is written.
  const Variant before = conn->db().Scalar("SELECT count(*) FROM DPInventoryB");
  EXPECT_EQ(ErrorOf([&] { Inventory(Params({{"Documents", Variant("2, x")}})); }), kErrTypeMismatch);
  EXPECT_EQ(ErrorOf([&] { Inventory(Params({{"GRArticleIDs", Variant("1); DROP TABLE GRArticle")}})); }),
            kErrTypeMismatch);
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM DPInventoryB"), before);
}

TEST_F(HostCommands, LocksBetweenConnections) {
  auto other = HostConnection::Open(path(), 2, 2);
  HostConnection* who[] = {conn.get(), other.get()};
  struct Step {
    int connection;
    const char* command;
    const char* type;
    int32_t id;
    bool expected;
  } steps[] = {
      {0, "Lock", "SDConsignmD", 0, true},     // the whole kind
      {1, "Lock", "SDConsignmD", 7, false},    // a record of a kind another holds
      {1, "Lock", "SDInvoice", 7, true},       // another kind is free
      {0, "Lock", "SDInvoice", 0, false},      // a kind with a record another holds
      {1, "UnLock", "SDConsignmD", 0, true},   // answers True but releases nothing of A's
      {1, "Lock", "SDConsignmD", 0, false},
      {0, "UnLock", "SDConsignmD", 9, true},   // a record unlock ends the kind lock too
      {1, "Lock", "SDConsignmD", 9, true},
      {0, "Lock", "SDConsignmD", 8, true},     // another record of the same kind
      {0, "Lock", "SDConsignmD", 9, false},
  };
  int n = 0;
  for (const Step& s : steps) {
    SCOPED_TRACE(++n);
    auto params = Params({{"XALType", Variant(s.type)}, {"LockType", Variant(1)}});
    if (s.id) params->Set("ID", Variant(s.id));
    EXPECT_EQ(who[s.connection]->ServerCommand(s.command, params), Variant(s.expected));
  }
  other.reset();
  EXPECT_EQ(conn->ServerCommand("Lock", Params({{"XALType", Variant("SDConsignmD")}, {"LockType", Variant(1)},
                                                {"ID", Variant(9)}})),
            Variant(true));
  EXPECT_EQ(ErrorOf([&] { conn->ServerCommand("Lock", Params({{"LockType", Variant(1)}})); }), kErrInvalidCall);
  EXPECT_EQ(ErrorOf([&] { conn->ServerCommand("UnLock", nullptr); }), kErrInvalidCall);
}

TEST_F(HostCommands, LogCheckAndWriteLog) {
  conn->db().ExecScript("INSERT INTO XALLogTable (TableName, Kind, Flags) VALUES ('GRArticle', 'REGISTER', 16),"
                        " ('SDInvoice', '', -1);");
  struct Case {
    const char* kind;
    const char* table;
    int32_t flags;
    bool logged;
  } cases[] = {
      {"REGISTER", "grarticle", 16, true}, {"REGISTER", "GRArticle", 4, false}, {"REGISTER", "GRArticle", 0, true},
      {"2", "GRArticle", 16, false},       {"2", "SDInvoice", 16, true},        {"2", "SDOrder", 0, false},
  };
  for (const Case& c : cases)
    EXPECT_EQ(conn->LogCheck(c.kind, c.table, c.flags), c.logged) << c.kind << " " << c.table << " " << c.flags;
  conn->SetUserID(5);
  conn->WriteLog("2", "SDInvoice", 1000, "Company 'ACME' credit limit is exceeded");
  ResultSet log = conn->db().Query("SELECT IDXALUser, Kind, TableName, IDRecord, LogText, LogTime > 0 FROM XALLog");
  ASSERT_EQ(log.rows.size(), 1u);
  EXPECT_EQ(log.rows[0], (std::vector<Variant>{Variant(5), Variant("2"), Variant("SDInvoice"), Variant(1000),
                                               Variant("Company 'ACME' credit limit is exceeded"), Variant(1)}));
}

TEST_F(HostCommands, RowStatesAndDataFlags) {
  Ref<DataObject> docs = conn->Server()->OpenQuery("SELECT * FROM GDocument ORDER BY ID", 1, "", "");
  Ref<DataObject> none = conn->Server()->OpenQuery("GDocument", 1, "ID = -1", "");
  // bof, eof, deleted (16), not stored (17), bookmark: after each step.
  auto state = [](const Ref<DataObject>& d) {
    std::string s = std::string(d->IsBOF() ? "B" : "-") + (d->IsEOF() ? "E" : "-") +
                    (d->RowState(kRowMarkedDeleted) ? "D" : "-") + (d->RowState(kRowNotStored) ? "N" : "-");
    return s + (d->Bookmark().IsEmpty() ? " no mark" : "");
  };
  struct Step {
    std::function<void()> act;
    Ref<DataObject>* on;
    const char* expected;
  } steps[] = {
      {[] {}, &docs, "----"},
      {[] {}, &none, "BE-- no mark"},
      {[&] { docs->Delete(); }, &docs, "----"},  // marked, moved on to the second row
      {[&] { docs->MoveFirst(); }, &docs, "--D-"},
      {[&] { docs->MoveNext(); docs->MoveNext(); }, &docs, "-E-- no mark"},
      {[&] { docs->AddNew(); }, &docs, "---N"},
      {[&] { docs->Delete(); docs->MoveFirst(); docs->MoveNext(); docs->MoveNext(); }, &docs, "--DN"},
      {[&] { std::static_pointer_cast<HostDataObject>(docs)->Save(); }, &docs, "-E-- no mark"},
      {[&] { none->AddNew(); }, &none, "---N"},
      {[&] { none->Delete(); none->MoveFirst(); none->UpdateRow(false, false, false); }, &none, "BE-- no mark"},
  };
  int n = 0;
  for (const Step& s : steps) {
    SCOPED_TRACE(++n);
    s.act();
    EXPECT_EQ(state(*s.on), s.expected);
  }
  EXPECT_EQ(ErrorOf([&] { docs->GoToBookmark(Variant()); }), 3159);
}

TEST_F(HostCommands, OnNewRowOnlyForARowNotStored) {
  conn->db().ExecScript("INSERT INTO DDStoreDRow (ID, IDDoc, IDGRArticle) VALUES (1, 1000, 1);"
                        "UPDATE GDocument SET DocName = 'DDMovement' WHERE ID = 1000;");
  auto s = DocumentSession::Open(conn, "DDMovement", 1000);
  auto doc = s->Proxy();
  EXPECT_FALSE(doc->OnNewRow());  // the stored row
  s->Rows()->AddNew();
  EXPECT_TRUE(doc->OnNewRow());
  s->Save();
  s->Rows()->MoveFirst();
  s->Rows()->MoveNext();
  EXPECT_FALSE(doc->OnNewRow());  // stored by the save
  s->Rows()->MoveNext();
  EXPECT_FALSE(doc->OnNewRow());  // no current row
  s->Close();
}

TEST_F(HostCommands, UserObjectCarriesTheEmployee) {
  conn->db().ExecScript("INSERT INTO XALUser (ID, Code, IDEREmployee) VALUES (1, 'MARI', 40);");
  EXPECT_EQ(conn->UserObject()->Field("IDEREmployee"), Variant(40));
  conn->SetUserID(99);  // no such user: no row, every field Empty
  EXPECT_TRUE(conn->UserObject()->Field("IDEREmployee").IsEmpty());
}

}  // namespace
}  // namespace xal::host
