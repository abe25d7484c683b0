// Row-level rights as filters, the category check and the option reset, on the SQLite host over
// both database kinds: rights in force or not, the rights category from the table catalogue, the
// condition with an alias and the user's id, the list of permitted ids, the sub-select built by
// the host's "ParseFields" (run on the host to check which rows it selects), and the stored
// options rewritten when a record is replaced.
#include "server/table_filters.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "runtime/text.h"
#include "sqlite_host_support.h"

namespace xal::server::testing {
namespace {

constexpr int32_t kUser = 5;

class TableFilterTest : public SqliteHostTest {
 protected:
  void SetUp() override {
    SqliteHostTest::SetUp();
    conn->SetUserID(kUser);
    Sql("INSERT INTO GRCurrency (ID, Code) VALUES (1, 'EUR'), (2, 'USD');"
        "INSERT INTO GRCompany (ID, Code, Name, IDGRCurrency) VALUES"
        " (10, 'ACME', 'Acme Ltd', 1), (11, 'BETA', 'Beta OÜ', 2), (12, 'GAMMA', 'Gamma AS', 1);"
        "INSERT INTO GDocument (ID, DocName, RefType, DocNo, IDGRCompany, IDPartner, IDXALUser) VALUES"
        " (1000, 'SDInvoice', 'SDInvoice', 7, 10, 11, 4),"
        " (1001, 'SDInvoice', 'SDInvoice', 8, 0, 0, 5),"
        " (1002, 'SDInvoice', 'SDInvoice', 9, 11, 10, 5),"
        " (1003, 'PDInvoice', 'PDInvoice', 7, 10, 11, 5);");
  }
  void RightsInForce(int32_t property = 8) {
    std::static_pointer_cast<host::HostServer>(conn->Server())->SetProperty(property, Variant(true));
  }
  void Right(int32_t user, const std::string& object, const std::string& category, const std::string& condition,
             bool active = true) {
    conn->db().Exec("INSERT INTO xalurights (idxaluser, objectname, category, fcondition, factive) VALUES (?,?,?,?,?)",
                    {Variant(user), Variant(object), Variant(category), Variant(condition), Variant(active)});
  }
  // The ids the query `sql` selects, in ascending order.
  std::vector<int32_t> Ids(const std::string& sql) {
    Ref<DataObject> rs = conn->Server()->OpenQuery(sql, 1, "", "");
    std::vector<int32_t> ids;
    for (; !rs->IsEOF(); rs->MoveNext()) ids.push_back(CLng(rs->Field("ID")));
    std::sort(ids.begin(), ids.end());
    return ids;
  }
};

class CategoryTest : public SqliteHostTest {};
class ResetOptionsTest : public SqliteHostTest {};

// ---------------------------------------------------------------------------------------------
// GetTableFilter
// ---------------------------------------------------------------------------------------------

TEST_P(TableFilterTest, NothingWhenRightsAreNotInForce) {
  for (const char* type : {"SDInvoice", "GRCompany", "GRReport", "XALUser", "WRPerson"}) {
    Right(kUser, type, "DOCUMENT", "#.IDXALUser = #UID");
    Right(kUser, type, "REGISTER", "#.ID > 0");
    Right(kUser, type, "REPORT", "#.ID > 0");
    Right(kUser, type, "XTABLES", "#.ID > 0");
  }
  for (const char* type : {"SDInvoice", "GRCompany", "GRReport", "XALUser", "WRPerson"}) {
    SCOPED_TRACE(type);
    EXPECT_EQ(GetTableFilter(conn, type), "");
    EXPECT_EQ(GetTableFilter(conn, type, true), "");
    EXPECT_EQ(GetTableFilter(conn, type, false, "D", true), "");
  }
}

TEST_P(TableFilterTest, ConditionWithAliasAndUser) {
  RightsInForce();
  Right(kUser, "SDInvoice", "DOCUMENT", "  #.IDXALUser = #UID  ");
  EXPECT_EQ(GetTableFilter(conn, "SDInvoice", false, "D"), "D.IDXALUser = 5");
  EXPECT_EQ(GetTableFilter(conn, "SDInvoice"), "IDXALUser = 5");
  EXPECT_EQ(GetTableFilter(conn, "sdinvoice", false, "X"), "X.IDXALUser = 5");
}

TEST_P(TableFilterTest, EitherPropertyPutsRightsInForce) {
  Right(kUser, "SDInvoice", "DOCUMENT", "#.IDXALUser = #UID");
  auto server = std::static_pointer_cast<host::HostServer>(conn->Server());
  struct Row {
    int32_t property;
    const char* expected;
  } rows[] = {{8, "IDXALUser = 5"}, {50, "IDXALUser = 5"}, {7, ""} /* not one of the two */};
  for (const auto& r : rows) {
    SCOPED_TRACE(r.property);
    for (int32_t p : {7, 8, 50}) server->SetProperty(p, Variant(p == r.property));
    EXPECT_EQ(GetTableFilter(conn, "SDInvoice"), r.expected);
  }
}

TEST_P(TableFilterTest, UserPlaceholderInAnyCase) {
  RightsInForce();
  Right(kUser, "SDInvoice", "DOCUMENT", "#.IDXALUser = #uid OR #.IDSalesManager = #Uid");
  EXPECT_EQ(GetTableFilter(conn, "SDInvoice", false, "A"), "A.IDXALUser = 5 OR A.IDSalesManager = 5");
}

TEST_P(TableFilterTest, CategoryFollowsTheCatalogue) {
  RightsInForce();
  struct Row {
    const char* type;
    const char* storedAs;
    bool found;
    const char* why;
  } rows[] = {
      {"SDInvoice", "DOCUMENT", true, "a document"},
      {"GRCompany", "REGISTER", true, "a register"},
      {"GRReport", "REPORT", true, "a report"},
      {"XALUser", "XTABLES", true, "a table the user may administer"},
      {"WRPerson", "REGISTER", true, "a register by name"},
      {"GRArtCompletion", "REGISTER", true, "a register by name, though the catalogue does not list it"},
      {"GRCompany", "DOCUMENT", false, "a register's right stored as a document's"},
      {"SDInvoice", "REGISTER", false, "a document's right stored as a register's"},
      {"XALUserOption", "XTABLES", false, "a system table nobody administers"},
      {"GRHoliday", "REGISTER", false, "not in the catalogue"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    conn->db().Exec("DELETE FROM xalurights");
    Right(kUser, r.type, r.storedAs, "#.ID > 1");
    EXPECT_EQ(GetTableFilter(conn, r.type), r.found ? "ID > 1" : "");
  }
}

TEST_P(TableFilterTest, OnlyActiveRightsOfTheUser) {
  RightsInForce();
  struct Row {
    int32_t user;
    const char* condition;
    bool active;
    const char* why;
  } rows[] = {
      {kUser, "#.ID > 1", false, "an inactive right"},
      {kUser + 1, "#.ID > 1", true, "another user's right"},
      {kUser, "   ", true, "an empty condition"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    conn->db().Exec("DELETE FROM xalurights");
    Right(r.user, "GRCompany", "REGISTER", r.condition, r.active);
    EXPECT_EQ(GetTableFilter(conn, "GRCompany"), "");
    EXPECT_EQ(GetTableFilter(conn, "GRCompany", true), "");
  }
}

TEST_P(TableFilterTest, IdList) {
  RightsInForce();
  struct Row {
    const char* type;
    const char* condition;
    const char* expected;
    const char* why;
  } rows[] = {
      {"GRCompany", "#.Code <> 'BETA'", "10,12", "two of three"},
      {"GRCompany", "#.Code = 'BETA'", "11", "one"},
      {"GRCompany", "#.Code = 'NONE'", "", "no rows: an empty list"},
      {"SDInvoice", "#.IDXALUser = #UID", "1001,1002", "the user's own documents of the kind"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    conn->db().Exec("DELETE FROM xalurights");
    Right(kUser, r.type, TextEquals(r.type, "SDInvoice") ? "DOCUMENT" : "REGISTER", r.condition);
    EXPECT_EQ(GetTableFilter(conn, r.type, true, "IgnoredAlias", true), r.expected);
  }
}

TEST_P(TableFilterTest, SubSelectSelectsThePermittedRows) {
  RightsInForce();
  struct Row {
    const char* condition;
    std::vector<int32_t> expected;
    const char* why;
  } rows[] = {
      {"#.IDXALUser = #UID", {1001, 1002}, "a column of the table"},
      {"GRCompany.Code = 'ACME'", {1000}, "through a link"},
      {"GRCompany.Code = 'ACME' OR #.DocNo = 9", {1000, 1002}, "a link and a column"},
      {"Partner.GRCurrency.Code = 'USD'", {1000}, "through two links"},
      {"GRCompany.Code IS NULL", {1001}, "the joins keep rows without a linked record"},
      {"Partner.Code = 'ACME' AND GRCompany.Code = 'BETA'", {1002}, "the same table linked twice"},
      {"IDGRCompany IN (SELECT ID FROM GRCompany WHERE Code = 'BETA')", {1002}, "names in a sub-select stay"},
      {"UPPER(GRCompany.Name) LIKE 'ACME%'", {1000}, "a function over a path"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    conn->db().Exec("DELETE FROM xalurights");
    Right(kUser, "SDInvoice", "DOCUMENT", r.condition);
    const std::string sql = GetTableFilter(conn, "SDInvoice", false, "", true);
    ASSERT_EQ(sql.rfind("SELECT A23.ID FROM ", 0), 0u) << sql;
    ASSERT_NE(sql.find("SDInvoice A23"), std::string::npos) << sql;
    EXPECT_EQ(Ids(sql), r.expected) << sql;
  }
}

TEST_P(TableFilterTest, SubSelectText) {
  RightsInForce();
  Right(kUser, "SDInvoice", "DOCUMENT", "GRCompany.Code = 'ACME' AND #.IDXALUser = #UID");
  EXPECT_EQ(GetTableFilter(conn, "SDInvoice", false, "", true),
            "SELECT A23.ID FROM SDInvoice A23 LEFT JOIN GRCompany A23_1 ON A23_1.ID = A23.IDGRCompany"
            " WHERE A23_1.Code = 'ACME' AND A23.IDXALUser = 5");
  conn->db().Exec("DELETE FROM xalurights");
  // Two joins: the file database wants all but the last bracketed.
  Right(kUser, "SDInvoice", "DOCUMENT", "Partner.GRCurrency.Code = 'USD'");
  const std::string from =
      GetParam() == 2 ? "SDInvoice A23 LEFT JOIN GRCompany A23_1 ON A23_1.ID = A23.IDPartner"
                        " LEFT JOIN GRCurrency A23_2 ON A23_2.ID = A23_1.IDGRCurrency"
                      : "(SDInvoice A23 LEFT JOIN GRCompany A23_1 ON A23_1.ID = A23.IDPartner)"
                        " LEFT JOIN GRCurrency A23_2 ON A23_2.ID = A23_1.IDGRCurrency";
  EXPECT_EQ(GetTableFilter(conn, "SDInvoice", false, "", true),
            "SELECT A23.ID FROM " + from + " WHERE A23_2.Code = 'USD'");
}

TEST_P(TableFilterTest, ParseFieldsInnerJoinsAndDefaultAlias) {
  Ref<DataObject> ob = conn->Server()->OpenDataObject("SDInvoice");
  Ref<ParamList> params = conn->Server()->NewParamList();
  params->Set("SelectQuery", Variant("GRCompany.Code IS NULL OR DocNo = 9"));
  params->Set("LeftJoin", Variant(false));
  ob->CallFunction("ParseFields", Variant(params), 0);
  EXPECT_EQ(CStr(params->Item("From")), "SDInvoice A0 INNER JOIN GRCompany A0_1 ON A0_1.ID = A0.IDGRCompany");
  EXPECT_EQ(CStr(params->Item("Where")), "A0_1.Code IS NULL OR A0.DocNo = 9");
  // An inner join drops the invoice without a company.
  EXPECT_EQ(Ids("SELECT A0.ID FROM " + CStr(params->Item("From")) + " WHERE " + CStr(params->Item("Where"))),
            (std::vector<int32_t>{1002}));
}

TEST_P(TableFilterTest, ErrorsGiveNothing) {
  RightsInForce();
  Right(kUser, "GRCompany", "REGISTER", "#.NoSuchColumn = 1");
  EXPECT_EQ(GetTableFilter(conn, "GRCompany", true), "");
  EXPECT_EQ(GetTableFilter(nullptr, "GRCompany"), "");
}

// ---------------------------------------------------------------------------------------------
// CheckCategory
// ---------------------------------------------------------------------------------------------

TEST_P(CategoryTest, OneCategoryPerGroup) {
  Sql("INSERT INTO GRCompanyCat (ID, Code, Category) VALUES"
      " (1, 'SMALL', 'SIZE'), (2, 'LARGE', 'SIZE'), (3, 'NORTH', 'REGION'), (4, 'VIP', ''), (5, 'NEW', '');"
      "INSERT INTO GRCompanyCatRel (ID, IDGRCompany, IDGRCompanyCat) VALUES (1, 10, 1), (2, 10, 4), (3, 12, 3);"
      "INSERT INTO GRArticleCat (ID, Code, Category) VALUES (1, 'FOOD', 'KIND'), (2, 'TOOL', 'KIND');"
      "INSERT INTO GRArticleCatRel (ID, IDGRArticle, IDGRArticleCat) VALUES (1, 7, 1);");
  struct Row {
    const char* table;
    int32_t id, cat;
    bool expected;
    const char* why;
  } rows[] = {
      {"GRCompany", 10, 1, true, "the record's own pair is excluded"},
      {"GRCompany", 10, 2, false, "another category of the same group"},
      {"GRCompany", 10, 3, true, "a category of another group"},
      {"GRCompany", 10, 5, true, "categories without a group never conflict"},
      {"GRCompany", 11, 2, true, "a record without categories"},
      {"GRCompany", 12, 3, true, "its own only category"},
      {"GRArticle", 7, 2, false, "another table"},
      {"GRArticle", 8, 2, true, "another record of that table"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    EXPECT_EQ(CheckCategory(conn, r.table, r.id, r.cat), r.expected);
  }
}

// ---------------------------------------------------------------------------------------------
// ResetOptions
// ---------------------------------------------------------------------------------------------

TEST_P(ResetOptionsTest, IdOptionsOfTheTableFollowTheRecord) {
  Sql("INSERT INTO XALOptionList (Category, Name, TableName, Type) VALUES"
      " ('Sales', 'DefCompany', 'GRCompany', 'ID'), ('Sales', 'CompanyCode', 'GRCompany', 'TEXT'),"
      " ('Store', 'DefStore', 'DRStore', 'ID');"
      "INSERT INTO XALUserOption (IDXALUser, Category, Name, OptValue) VALUES"
      " (1, 'Sales', 'DefCompany', '10'), (2, 'Sales', 'DefCompany', '10'), (3, 'Sales', 'DefCompany', '12'),"
      " (0, 'Sales', 'DefCompany', '10'), (1, 'Sales', 'CompanyCode', '10'), (1, 'Store', 'DefStore', '10');");
  auto options = [&] { return Rows("XALUserOption", "IDXALUser, Category, Name, OptValue"); };

  EXPECT_TRUE(ResetOptions(conn, " GRCompany ", 10, 11));
  EXPECT_EQ(options(),
            "(0,Sales,DefCompany,11)(1,Sales,CompanyCode,10)(1,Sales,DefCompany,11)(1,Store,DefStore,10)"
            "(2,Sales,DefCompany,11)(3,Sales,DefCompany,12)");

  EXPECT_TRUE(ResetOptions(conn, "GRCompany", 11, 0));
  EXPECT_EQ(options(),
            "(0,Sales,DefCompany,)(1,Sales,CompanyCode,10)(1,Sales,DefCompany,)(1,Store,DefStore,10)"
            "(2,Sales,DefCompany,)(3,Sales,DefCompany,12)");
  EXPECT_EQ(Count("SELECT count(*) FROM XALUserOption WHERE OptValue = '' AND typeof(OptValue) = 'text'"), 3);
}

TEST_P(ResetOptionsTest, Refusals) {
  Sql("INSERT INTO XALOptionList (Category, Name, TableName, Type) VALUES ('Sales', 'DefCompany', 'GRCompany', 'ID');"
      "INSERT INTO XALUserOption (IDXALUser, Category, Name, OptValue) VALUES (1, 'Sales', 'DefCompany', '10');");
  struct Row {
    const char* table;
    int32_t oldID;
    const char* why;
  } rows[] = {
      {"", 10, "no table"},
      {"   ", 10, "a blank table name"},
      {"GRCompany", 0, "no old id"},
  };
  for (const auto& r : rows) {
    SCOPED_TRACE(r.why);
    EXPECT_FALSE(ResetOptions(conn, r.table, r.oldID, 11));
  }
  EXPECT_FALSE(ResetOptions(nullptr, "GRCompany", 10, 11));  // an error is trapped
  EXPECT_EQ(Rows("XALUserOption", "OptValue"), "(10)");
}

INSTANTIATE_TEST_SUITE_P(, TableFilterTest, ::testing::Values(1, 2), KindName);
INSTANTIATE_TEST_SUITE_P(, CategoryTest, ::testing::Values(1, 2), KindName);
INSTANTIATE_TEST_SUITE_P(, ResetOptionsTest, ::testing::Values(1, 2), KindName);

}  // namespace
}  // namespace xal::server::testing
