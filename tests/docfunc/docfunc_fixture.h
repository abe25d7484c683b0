// DocFunc on the reference host: a fresh database with a few articles, stores and companies, and
// helpers that open a document form and wire a DocFunc to it as the host does (Doc, DocData and
// XALServer set, Create called), reaching it afterwards only through late-bound calls by name.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "docfunc/docfunc.h"
#include "host/document_session.h"
#include "host/host_fixture.h"
#include "runtime/dispatch.h"

namespace xal::docfunc::testing {

class DocFuncTest : public host::testing::HostTest {
 protected:
  void SetUp() override {
    HostTest::SetUp();
    conn->db().ExecScript(
        "INSERT INTO GRArticle (ID, Code, Name) VALUES (1, 'A1', 'Apples'), (2, 'B2', 'Bolts'), (3, 'KIT', 'Kit');"
        "INSERT INTO DRStore (ID, Code, Name, IDGRCompany) VALUES (101, 'SIDE', 'Side store', 10);"
        "INSERT INTO XALUser (ID, Code, Name, IDEREmployee) VALUES (1, 'ME', 'Me', 7);");
  }

  // A document form of kind `docTable` (`id` 0: a new one) with a DocFunc wired to it and its
  // rows bound, as the form binds them.
  Ref<host::DocumentSession> Open(const std::string& docTable, int32_t id = 0) {
    session = host::DocumentSession::Open(conn, docTable, id);
    df = Wire(session->Proxy(), session->Header(), conn->Server());
    SetRowOB(session->Rows());
    return session;
  }
  static ObjectRef Wire(const Ref<XALSBEproxy>& doc, const Ref<DataObject>& data, const Ref<XALServer>& server) {
    ObjectRef obj = CreateObject("DocFunc");
    PutRef(obj, "Doc", doc);
    PutRef(obj, "DocData", data);
    PutRef(obj, "XALServer", server);
    Call(obj, "Create");
    return obj;
  }
  static void PutRef(const ObjectRef& obj, const char* name, const ObjectRef& value) {
    std::vector<Variant> args{Variant(value)};
    Invoke(obj, name, MemberKind::PutRef, args);
  }
  // A handler called by name, as a form's script calls it.
  Variant Handler(const std::string& name) { return Call(df, name); }
  const DocState& State() const { return std::static_pointer_cast<DocFunc>(df)->State(); }
  void SetOption(const std::string& section, const std::string& key, const Variant& value, int32_t user = 1) {
    conn->SetUserOption(user, section, key, value);
  }
  void SetRowOB(const Ref<DataObject>& rows) {
    std::vector<Variant> args{Variant(ObjectRef(rows))};
    Invoke(df, "SetRowOB", MemberKind::Method, args);
  }
  // Adds a row to the form's rows with the given fields.
  void AddRow(std::initializer_list<std::pair<const char*, Variant>> fields) {
    Ref<DataObject> rows = session->Rows();
    rows->AddNew();
    for (const auto& [name, value] : fields) rows->SetField(name, value);
  }

  Ref<host::DocumentSession> session;
  ObjectRef df;
};

}  // namespace xal::docfunc::testing
