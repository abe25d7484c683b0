// Table filters from the current user's row-level rights, the check that a record holds at most
// one category of each category group, and the rewrite of stored options that point to a record
// being replaced. A right is a condition text in xalurights, in which "#UID" stands for the user
// and "#." for the table's alias; it becomes a WHERE condition, a list of permitted ids or a
// sub-select, whichever the caller asks for.
#include "server/table_filters.h"

#include <string>

#include "runtime/convert.h"
#include "runtime/error.h"
#include "runtime/text.h"
#include "server/internal/require.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {

using internal::Require;

// Server properties that put row rights in force (either one is enough).
constexpr int32_t kPropRowRights = 8;
constexpr int32_t kPropRowRightsAlt = 50;

// The catalogue flag `name` of object type `entry`; an object type the catalogue does not list
// has no flags.
bool CatalogueFlag(const Ref<ParamList>& entry, const char* name) { return entry && IsTrue(entry->Item(name)); }

// The rights category of object type `xalType`, or "" when its rights are not kept by category.
std::string RightsCategory(XALServer& server, const std::string& xalType) {
  Ref<ParamList> entry;
  Ref<ParamList> catalogue = server.TableCatalogue();
  if (catalogue && catalogue->Exists(xalType)) {
    const Variant item = catalogue->Item(xalType);
    if (item.IsObject()) entry = std::dynamic_pointer_cast<ParamList>(item.AsObject());
  }
  if (CatalogueFlag(entry, "isDocument")) return "DOCUMENT";
  // Persons of the wage register and set completions are registers for rights, whatever the
  // catalogue calls them.
  if (CatalogueFlag(entry, "isRegister") || TextEquals(xalType, "WRPerson") || TextEquals(xalType, "GRArtCompletion"))
    return "REGISTER";
  if (CatalogueFlag(entry, "isReport")) return "REPORT";
  if (CatalogueFlag(entry, "CanAdminister")) return "XTABLES";
  return "";
}

// The ids of the rows of `xalType` that satisfy `condition`, joined with ",".
std::string IdList(XALServer& server, const std::string& xalType, const std::string& condition) {
  Ref<DataObject> rs = server.OpenQuery(xalType, 3, condition, "ID");
  std::string ids;
  for (Require(rs).MoveFirst(); !rs->IsEOF(); rs->MoveNext()) {
    if (!ids.empty()) ids += ",";
    ids += CStr(rs->Field("ID"));
  }
  return ids;
}

// "SELECT A23.ID FROM … WHERE …" over `xalType`, the host turning `condition` (which may follow
// links of the table) into the joins and the condition.
std::string SubSelect(XALServer& server, const std::string& xalType, const std::string& condition) {
  Ref<DataObject> ob = server.OpenDataObject(xalType);
  Ref<ParamList> params = server.NewParamList();
  params->Set("SelectQuery", Variant(condition + "<<<23>>>"));
  params->Set("LeftJoin", Variant(true));
  Require(ob).CallFunction("ParseFields", Variant(params), 0);
  return "SELECT A23.ID FROM " + CStr(params->Item("From")) + " WHERE " + CStr(params->Item("Where"));
}

}  // namespace

std::string GetTableFilter(const Ref<XALConnect>& xalConnect, const std::string& xalType, bool idListOnly,
                           const std::string& alias, bool subSelect) {
  try {
    XALConnect& conn = Require(xalConnect);
    Ref<XALServer> serverRef = conn.Server();
    XALServer& server = Require(serverRef);
    if (!IsTrue(server.Property(kPropRowRights)) && !IsTrue(server.Property(kPropRowRightsAlt))) return "";

    const std::string user = std::to_string(conn.UserID());
    const std::string category = RightsCategory(server, xalType);
    if (category.empty()) return "";

    Ref<DataObject> right = server.OpenQuery(
        "select fcondition from xalurights where idxaluser = " + user + " and objectname = " + SQLText(xalType) +
            " and category = " + SQLText(category) + " and factive <> 0",
        3, "", "");
    if (Require(right).IsEOF()) return "";
    const Variant text = right->Field("FCondition");
    std::string c = text.IsNull() ? std::string() : Trim(CStr(text));
    if (c.empty()) return "";

    c = Replace(c, "#UID", user, 1, -1, CompareMode::Text);
    if (idListOnly) return IdList(server, xalType, Replace(c, "#.", ""));
    if (subSelect) return SubSelect(server, xalType, Replace(c, "#.", ""));
    return Replace(c, "#.", alias.empty() ? std::string() : alias + ".");
  } catch (const VbError&) {
    return "";
  }
}

// True when record `pID` holds no category of `pCatID`'s group other than `pCatID` itself.
// A category with an empty group never conflicts.
bool CheckCategory(const Ref<XALConnect>& pXALConnect, const std::string& pTableName, int32_t pID, int32_t pCatID) {
  const std::string& t = pTableName;
  const std::string id = std::to_string(pID), cat = std::to_string(pCatID);
  Ref<DataObject> rs = Require(Require(pXALConnect).Server())
                           .OpenQuery("SELECT REL.ID FROM " + t + "Cat C, " + t + "Cat CNew, " + t + "CatRel REL" +
                                          " WHERE REL.ID" + t + "=" + id + " AND C.ID=REL.ID" + t + "Cat" +
                                          " AND CNew.ID=" + cat + " AND CNew.Category=C.Category" +
                                          " AND CNew.Category<>'' AND NOT(REL.ID" + t + "=" + id + " AND REL.ID" +
                                          t + "Cat=" + cat + ")",
                                      4, "", "");
  return Require(rs).IsEOF();
}

// Stored options of type "ID" that name record `oldID` of `tableName` are made to name `newID`
// (an empty text when it is 0); the host is then told to drop what it has cached of them.
bool ResetOptions(const Ref<XALConnect>& conn, const std::string& tableName, int32_t oldID, int32_t newID) {
  try {
    const std::string table = Trim(tableName);
    if (table.empty() || oldID == 0) return false;
    XALConnect& c = Require(conn);
    const std::string value = newID == 0 ? SQLText("") : std::to_string(newID);
    c.Execute("UPDATE XALUserOption O, XALOptionList L SET O.OptValue=" + value +
                  " WHERE O.Category=L.Category AND O.Name=L.Name AND O.OptValue=" + SQLText(std::to_string(oldID)) +
                  " AND L.TableName=" + SQLText(table) + " AND L.Type='ID'",
              4);
    Ref<XALServer> server = c.Server();
    c.ServerCommand("ResetOptions", Require(server).NewParamList());
    return true;
  } catch (const VbError&) {
    return false;
  }
}

}  // namespace xal::server
