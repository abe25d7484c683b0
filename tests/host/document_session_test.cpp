// Document sessions: a new document saved with rows and component rows, a stored one reopened,
// events answered by the policy, and the transcript of a scripted session compared whole.
#include "host/document_session.h"

#include <gtest/gtest.h>

#include "host_fixture.h"
#include "runtime/convert.h"
#include "runtime/dispatch.h"

namespace xal::host {
namespace {

class Sessions : public testing::HostTest {};

TEST_F(Sessions, NewStoreDocumentWithComponentRows) {
  auto s = DocumentSession::Open(conn, "DDMovement");
  EXPECT_EQ(s->RowTable(), "DDStoreDRow");
  auto doc = s->Proxy();
  Ref<DataObject> header = doc->DataObject();  // "DocData" is registered
  ASSERT_EQ(header, s->Header());
  header->SetField("DocDate", Variant(Date(39877)));
  header->SetField("DealState", Variant(""));
  Ref<DataObject> rows = doc->DataObject("DDStoreDRow");
  rows->AddNew();
  rows->SetField("IDGRArticle", Variant(1));
  rows->SetField("BaseQuantity", Variant(5));
  rows->SetField("IDReceiverStore", Variant(100));
  rows->SetField("CompletionType", Variant("C"));
  Ref<DataObject> parts = doc->CachedRows("DDStoreDRow", "Next");
  ASSERT_NE(parts, nullptr);
  EXPECT_TRUE(doc->CheckCachedRows("DDStoreDRow", "Next"));
  EXPECT_EQ(doc->CachedRows("DDStoreDRow", "Next"), parts);  // the same cache while on this row
  parts->AddNew();
  parts->SetField("IDGRArticle", Variant(2));
  parts->SetField("BaseQuantity", Variant(10));
  parts->SetField("IDReceiverStore", Variant(100));
  int32_t id = s->Save();
  EXPECT_GT(id, 0);
  Database& db = conn->db();
  EXPECT_EQ(db.Scalar("SELECT DocName FROM GDocument WHERE ID = ?", {Variant(id)}), Variant("DDMovement"));
  ResultSet stored = db.Query("SELECT IDGRArticle, IDDoc, IDParentRow, DocDate FROM DDStoreDRow ORDER BY ID");
  ASSERT_EQ(stored.rows.size(), 2u);
  const Variant parentID = db.Scalar("SELECT ID FROM DDStoreDRow WHERE IDGRArticle = 1");
  EXPECT_EQ(stored.rows[1][0], Variant(2));
  EXPECT_EQ(stored.rows[1][1], Variant(id));          // component rows belong to the document
  EXPECT_EQ(stored.rows[1][2], parentID);              // and to their set row
  EXPECT_EQ(stored.rows[0][3], Variant(Date(39877)));  // header date copied into the store row
  // The server-side balance followed the rows.
  EXPECT_EQ(db.Scalar("SELECT Quantity FROM DCurBalanceStore WHERE IDGRArticle = 2 AND IDDRStore = 100"), Variant(10.0));

  // Reopened: one top-level row, its component row under "Next".
  s->Close();
  auto again = DocumentSession::Open(conn, "DDMovement", id);
  EXPECT_EQ(again->Rows()->RowCount(), 1);
  Ref<DataObject> reread = again->Proxy()->CachedRows("DDStoreDRow", "Next");
  ASSERT_NE(reread, nullptr);
  EXPECT_EQ(reread->RowCount(), 1);
  EXPECT_EQ(reread->Field("BaseQuantity"), Variant(10.0));
  EXPECT_EQ(again->Header()->Owner()->Field("DocDate"), Variant(Date(39877)));  // the saved values
  EXPECT_EQ(again->Rows()->Owner(), again->Header());
}

TEST_F(Sessions, DeletingASetRowDeletesItsComponents) {
  auto s = DocumentSession::Open(conn, "DDMovement");
  Ref<DataObject> rows = s->Rows();
  rows->AddNew();
  rows->SetField("IDGRArticle", Variant(1));
  s->Proxy()->CachedRows("DDStoreDRow", "Next")->AddNew();
  int32_t id = s->Save();
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM DDStoreDRow"), Variant(2));
  auto again = DocumentSession::Open(conn, "DDMovement", id);
  again->Proxy()->CachedRows("DDStoreDRow", "Next");  // loaded into the cache
  again->Rows()->MoveFirst();
  again->Rows()->Delete();
  again->Save();
  EXPECT_EQ(conn->db().Scalar("SELECT count(*) FROM DDStoreDRow"), Variant(0));
}

TEST_F(Sessions, ScriptedTranscript) {
  auto s = DocumentSession::Open(conn, "SDInvoice", 1000);
  s->Policy().msgBoxAnswers = {7};
  s->Policy().settings["rows"] = Variant(3);
  ObjectRef doc = s->Proxy();
  EXPECT_EQ(Call(doc, "MsgBox", {Variant("Save changes?"), Variant(4)}), Variant(7));
  EXPECT_EQ(Call(doc, "MsgBox", {Variant("Again?"), Variant(4)}), Variant(6));   // then the default
  EXPECT_EQ(Call(doc, "MsgBox", {Variant("Done"), Variant(64)}), Variant(1));    // information: OK
  EXPECT_EQ(Call(doc, "Settings", {Variant("Rows"), Variant(10)}), Variant(3));
  EXPECT_EQ(Call(doc, "Settings", {Variant("Cols"), Variant(10)}), Variant(10));
  Call(doc, "StatusMsg", {Variant("")});
  Call(doc, "RefreshHeader");
  Call(doc, "CmdPost", {Variant("@Save")});
  EXPECT_EQ(Call(doc, "AddMenuItem", {Variant("Percent"), Variant("ComputePercentAmount")}),
            Variant("@ComputePercentAmount"));
  EXPECT_EQ(Call(doc, "DataObject", {Variant("Nope")}), Variant::Nothing());
  EXPECT_EQ(s->TranscriptText(),
            "MsgBox(\"Save changes?\",4)->7; MsgBox(\"Again?\",4)->6; MsgBox(\"Done\",64)->1; "
            "Settings(\"Rows\")->3; Settings(\"Cols\")->10; StatusMsg(\"\"); "
            "RefreshHeader(\"\"); CmdPost(\"@Save\"); AddMenuItem(\"Percent\",\"ComputePercentAmount\"); "
            "GetObject(\"Nope\")->Nothing");
}

// Every event of the proxy through the session gives its line; the cache, settings and selection
// requests carry the name the script called.
TEST_F(Sessions, TranscriptLineOfEveryEvent) {
  auto s = DocumentSession::Open(conn, "SDInvoice", 1000);
  ObjectRef doc = s->Proxy();
  ObjectRef params = conn->Server()->NewParamList();
  struct Row {
    const char* member;
    std::vector<Variant> args;
    const char* line;  // "" when the event writes none
  } rows[] = {
      {"DataChanged", {}, "DataChanged()"},
      {"ReloadSheet", {Variant(5)}, "ReloadSheet(5)"},
      {"RefreshData", {Variant("a")}, "RefreshData(\"a\")"},
      {"RefreshBrowser", {Variant("b")}, "RefreshBrowser(\"b\")"},
      {"RefreshRow", {}, "RefreshRow()"},
      {"MsgBox", {Variant("Q"), Variant(4), Variant("T")}, "MsgBox(\"Q\",4,\"T\")->6"},
      {"InputBox", {Variant(params), Variant(1), Variant("Amount")}, "InputBox(\"Amount\")->False"},
      {"OnNewRow", {}, "OnNewRow()"},
      {"AddCmdTarget", {Variant("Cmd"), Variant("Fn")}, "AddCmdTarget(\"Cmd\",\"Fn\")"},
      {"CmdExecute", {Variant("@X"), Variant(2.5)}, "CmdExecute(\"@X\",2.5)"},
      {"CmdExecute", {Variant("@Y")}, "CmdExecute(\"@Y\")"},
      {"InvokeFunc", {Variant("F")}, "InvokeFunc(\"F\")"},
      {"ShowForm", {Variant(12), Variant("a=1")}, "ShowForm(12,\"a=1\")"},
      {"DataObject", {Variant("Rows")}, "GetObject(\"Rows\")"},
      {"XALExecuteCB", {Variant::Nothing(), Variant("Fn")}, "XALExecuteCB(\"Fn\")"},
      {"ReloadLayout", {Variant(1), Variant("Area")}, "ReloadLayout(\"Area\")"},
      {"PrintReport", {Variant(3)}, "PrintReport(3)"},
      {"SendReport", {Variant(3), Variant(), Variant("a@b")}, "SendReport(3,\"a@b\")"},
      {"Properties", {Variant("P")}, "Properties(\"P\")"},
      {"SendMail", {Variant(params)}, "SendMail()"},
      {"ExportReport", {Variant(3), Variant(), Variant("f.pdf")}, "ExportReport(3,\"f.pdf\")"},
      {"CachedRows", {Variant("SDInvoiceRow"), Variant("Next")}, "CachedRows(\"SDInvoiceRow\",\"Next\")->Nothing"},
      {"CheckCachedRows", {Variant("SDInvoiceRow"), Variant("Next")}, "CheckCachedRows(\"SDInvoiceRow\",\"Next\")->False"},
      {"FreeCachedRows", {Variant("SDInvoiceRow"), Variant("Next")}, "FreeCachedRows(\"SDInvoiceRow\",\"Next\")"},
      {"Settings", {Variant("k")}, "Settings(\"k\")->"},
      {"SelBookmarks", {}, "SelBookmarks()"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.member);
    s->ClearTranscript();
    Call(doc, r.member, r.args);
    EXPECT_EQ(s->TranscriptText(), r.line);
  }
}

TEST_F(Sessions, InputBoxPolicyFillsTheList) {
  auto s = DocumentSession::Open(conn, "SDInvoice");
  s->Policy().inputBox = [](ParamList& p, const std::string&) {
    p.Set("Percent", Variant(10));
    return true;
  };
  Ref<ParamList> params = conn->Server()->NewParamList();
  params->Set("Percent", Variant(0));
  EXPECT_TRUE(s->Proxy()->InputBox(params, 1, "Amount discount"));
  EXPECT_EQ(params->Item("percent"), Variant(10));
}

TEST_F(Sessions, UnknownKindsAndDocuments) {
  EXPECT_THROW(DocumentSession::Open(conn, "GRArticle"), VbError);
  EXPECT_THROW(DocumentSession::Open(conn, "SDInvoice", 424242), VbError);
}

}  // namespace
}  // namespace xal::host
