// External codes of records read through real data objects of the reference host, and the
// translation of filter arguments between codes and identifiers run as SQL on it: quotes and
// escaped commas in codes, identifiers that are not numbers, conditions and fields that are not
// translated, and a host that names no table.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>

#include "../host/host_fixture.h"
#include "runtime/convert.h"
#include "runtime/text.h"
#include "server/sql_utils.h"

namespace xal::server {
namespace {

class CodeQueries : public host::testing::HostTest {
 protected:
  void SetUp() override {
    HostTest::SetUp();
    conn->db().ExecScript(
        "UPDATE GRCompany SET DXCode = 'AC' WHERE ID = 10;"
        "INSERT INTO GRCompany (ID, Code, Name) VALUES (12, 'O''BRIEN', 'O''Brien & Co'), (13, 'A,B', 'Comma');"
        "INSERT INTO GRArticle (ID, Code, DXCode, Name) VALUES (5, 'A5', 'ART5', 'Widget');"
        "INSERT INTO GRBankAccount (ID, IDGRCompany, Name, Code) VALUES (1, 10, 'Main account', 'BA1');"
        "INSERT INTO GRCompContPerson (ID, IDGRCompany, SurName, FirstName) VALUES"
        " (1, 10, 'Smith', 'John'), (2, 0, 'Doe', 'Jane');"
        "INSERT INTO DRStockReserve (ID, IDGRArticle, SerialNo) VALUES (1, 5, 'S1'), (2, 0, 'S2');"
        "INSERT INTO GRReport (ID, Code, XALIndex) VALUES (1, 'R1', 'xal12'), (2, 'R2', 'MY1'), (3, 'R3', ' XAL9');");
  }
  Ref<DataObject> Open(const std::string& table, const std::string& filter) {
    return conn->Server()->OpenQuery(table, 1, filter, "");
  }
};

TEST_F(CodeQueries, DXCodePerTable) {
  struct Row {
    const char* table;
    const char* filter;
    const char* codeSetting;  // the "DXCode" setting for the table, or nullptr
    const char* expected;
  } rows[] = {
      {"GRBankAccount", "ID = 1", nullptr, "Main account"},  // default field Name
      {"GRBankAccount", "ID = 1", "Code", "BA1"},
      {"GRCompContPerson", "ID = 1", nullptr, "ACSmith"},    // company code + surname
      {"GRCompContPerson", "ID = 2", nullptr, "DoeJane"},    // no company: surname + first name
      {"GRCompContPerson", "ID = 1", "FirstName", "ACSmith"},  // the setting plays no part here
      {"DRStockReserve", "ID = 1", nullptr, "ART5S1"},       // article code + serial number
      {"DRStockReserve", "ID = 2", nullptr, "S2"},
      {"DRStockReserve", "ID = 1", "ID", "ART51"},
      {"GRReport", "ID = 1", nullptr, "xal12"},              // an "XAL" index, in any case
      {"GRReport", "ID = 3", nullptr, " XAL9"},              // tested trimmed, returned as stored
      {"GRReport", "ID = 2", nullptr, "R2"},
      {"GRReport", "ID = 2", "XALIndex", "MY1"},
      {"GRArticle", "ID = 5", nullptr, "A5"},                // any other table: default Code
      {"GRArticle", "ID = 5", "DXCode", "ART5"},
      {"GRArticle", "ID = 99", nullptr, ""},                 // no current record
      {"GRArticle", "ID = 5", "NoSuchField", ""},            // the host rejects the field: trapped
      {"DRStockReserve", "ID = 1", "NoSuchField", "ART5"},   // a failure keeps what was built
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::string(r.table) + " " + r.filter + " " + (r.codeSetting ? r.codeSetting : "-"));
    conn->db().Exec("DELETE FROM XALUserOption WHERE Category = 'DXCode'");
    if (r.codeSetting) conn->SetSetting("DXCode", UCase(r.table), Variant(r.codeSetting));
    EXPECT_EQ(GetDXCode(Open(r.table, r.filter)), r.expected);
  }
}

TEST_F(CodeQueries, DXCodeOfNothingIsEmpty) { EXPECT_EQ(GetDXCode(nullptr), ""); }

// A source object that answers "LinkedTableName" from a map of link names, reading the entry
// "Field" of the list it is given, and refuses everything else but its connection: the operations
// must not need more of it.
class LinkSource : public DataObject {
 public:
  LinkSource(Ref<XALConnect> conn, std::map<std::string, std::string> links)
      : conn_(std::move(conn)), links_(std::move(links)) {}
  std::vector<std::string> askedFields;

  Variant CallFunction(const std::string& name, const Variant& params, int32_t) override {
    if (!TextEquals(name, "LinkedTableName")) Raise(kErrNoMember);
    auto list = std::dynamic_pointer_cast<ParamList>(params.AsObject());
    const std::string field = CStr(list->Item("Field"));
    askedFields.push_back(field);
    auto it = links_.find(Left(field, InStr(field, ".") - 1));
    return Variant(it == links_.end() ? std::string() : it->second);
  }
  Ref<XALConnect> Connection() override { return conn_; }

  Variant Field(const std::string&) override { Raise(kErrNoMember); }
  void SetField(const std::string&, const Variant&) override { Raise(kErrNoMember); }
  void MoveFirst() override { Raise(kErrNoMember); }
  void MoveNext() override { Raise(kErrNoMember); }
  bool IsEOF() override { Raise(kErrNoMember); }
  bool IsBOF() override { Raise(kErrNoMember); }
  int32_t RowCount() override { Raise(kErrNoMember); }
  int32_t FindFirst(const std::string&, int32_t) override { Raise(kErrNoMember); }
  void AddNew() override { Raise(kErrNoMember); }
  void Delete() override { Raise(kErrNoMember); }
  Variant Bookmark() override { Raise(kErrNoMember); }
  void GoToBookmark(const Variant&) override { Raise(kErrNoMember); }
  void UpdateRow(bool, bool, bool) override { Raise(kErrNoMember); }
  bool RowState(int32_t) override { Raise(kErrNoMember); }
  Ref<DataObject> Owner() override { Raise(kErrNoMember); }
  std::string TableName() override { Raise(kErrNoMember); }
  Variant Property(int32_t) override { Raise(kErrNoMember); }
  Variant RecordOperation(int32_t, const Variant&) override { Raise(kErrNoMember); }

 private:
  Ref<XALConnect> conn_;
  std::map<std::string, std::string> links_;
};

// A list's pieces joined with "," in sorted order, so rows may come back in any order.
std::string SortedList(const std::string& list) {
  std::vector<std::string> parts = Split(list, ",");
  std::sort(parts.begin(), parts.end());
  return Join(parts, ",");
}

struct TranslationRow {
  const char* field;
  const char* condition;
  const char* argument;
  const char* queryLinkTable;
  const char* expected;
};

TEST_F(CodeQueries, CodesToIDs) {
  auto source = MakeRef<LinkSource>(conn, std::map<std::string, std::string>{{"Partner", "GRCompany"}});
  const TranslationRow rows[] = {
      {"Partner.Code", "=", "ACME", "", "10"},
      {"Partner.Code", "in", "acme,BETA", "", "10,11"},      // conditions and codes in any case
      {"Partner.Code", "NOT IN", "O'Brien", "", "12"},       // a quote in a code is doubled
      {"Partner.Code", "<>", "A,,B", "", "13"},              // ",," is a comma inside a code
      {"Partner.Code", "=", "x') OR ('1'='1", "", ""},       // cannot end the literal: no row matches
      {"Partner.DXCode", "=", "AC", "", "10"},               // the code field is the part after "."
      {"Partner.Code", "=", "NONE", "", ""},                 // no row
      {"Partner.Code", "=", "", "", ""},                     // no codes at all
      {"Partner.Name", "=", "ACME", "", "ACME"},             // not a code field: unchanged
      {"Partner.Code", ">", "ACME", "", "ACME"},             // not a list condition: unchanged
      {"Partner.Code", "LIKE", "AC*", "", "AC*"},
      {"Nowhere.Code", "=", "ACME", "", ""},                 // the host names no table
      {"Anything", "IN QUERY", "ACME,O'Brien", "GRCompany", "10,12"},  // the table given, field Code
  };
  for (const TranslationRow& r : rows) {
    SCOPED_TRACE(std::string(r.field) + " " + r.condition + " " + r.argument);
    EXPECT_EQ(SortedList(QueryCodeToID(r.field, r.condition, r.argument, source, r.queryLinkTable)),
              SortedList(r.expected));
  }
  // The host was asked with the whole field path under "Field", once per translated call.
  EXPECT_EQ(source->askedFields,
            (std::vector<std::string>{"Partner.Code", "Partner.Code", "Partner.Code", "Partner.Code", "Partner.Code",
                                      "Partner.DXCode", "Partner.Code", "Nowhere.Code"}));
}

TEST_F(CodeQueries, IDsToCodes) {
  auto source = MakeRef<LinkSource>(conn, std::map<std::string, std::string>{{"Partner", "GRCompany"}});
  const TranslationRow rows[] = {
      {"Partner.Code", "IN", "10,11", "", "ACME,BETA"},
      {"Partner.Code", "=", " 12 ", "", "O'BRIEN"},          // blanks around a number are fine
      {"Partner.Code", "=", "13", "", "A,,B"},               // a comma in a code is doubled
      {"Partner.DXCode", "=", "10", "", "AC"},
      {"Partner.Code", "=", "99", "", ""},                   // no row
      {"Partner.Code", "=", "10) OR (1=1", "", ""},          // not a number: nothing reaches the SQL
      {"Partner.Code", "=", "", "", ""},                     // no identifiers
      {"Partner.Name", "=", "10", "", "10"},                 // not a code field: unchanged
      {"Partner.Code", "BETWEEN", "10", "", "10"},           // not a list condition: unchanged
      {"Nowhere.Code", "=", "10", "", ""},                   // the host names no table
      {"Anything", "in query", "10,12", "GRCompany", "ACME,O'BRIEN"},
  };
  for (const TranslationRow& r : rows) {
    SCOPED_TRACE(std::string(r.field) + " " + r.condition + " " + r.argument);
    EXPECT_EQ(SortedList(QueryIDToCode(r.field, r.condition, r.argument, source, r.queryLinkTable)),
              SortedList(r.expected));
  }
}

TEST_F(CodeQueries, InQueryThroughAHostDataObject) {
  // The reference host's own data object as the source: the query goes through its server.
  Ref<DataObject> source = Open("GDocument", "ID = 1000");
  EXPECT_EQ(QueryCodeToID("", "IN QUERY", "o'brien", source, "GRCompany"), "12");
  EXPECT_EQ(QueryIDToCode("", "IN QUERY", "12", source, "GRCompany"), "O'BRIEN");
  EXPECT_EQ(QueryCodeToID("", "IN QUERY", "ACME", source, "NoSuchTable"), "");  // the SQL fails: trapped
  EXPECT_EQ(QueryCodeToID("", "IN QUERY", "ACME", nullptr, "GRCompany"), "");   // no source object
}

}  // namespace
}  // namespace xal::server
