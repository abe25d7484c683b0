// Table filters from the current user's row-level rights, the check that a record holds at most
// one category of each category group, and the rewrite of stored options that point to a record
// being replaced. A right is a condition text in xalurights, in which "#UID" stands for the user
// and "#." for the table's alias; it becomes a WHERE condition, a list of permitted ids or a
// sub-select, whichever the caller asks for.
#include "server/table_filters.h"

#include <string>

#include "runtime/convert.h"
#include "runtime/text.h"
#include "runtime/trap.h"
#include "server/sql_utils.h"

namespace xal::server {

namespace {


// The catalogue flag `name` of object type `entry`; an object type the catalogue does not list
// has no flags.
bool CatalogueFlag(const Ref<ParamList>& entry, const char* name) { return entry && IsTrue(entry->Item(name)); }

// The rights category of object type `xalType`, or "" when its rights are not kept by category.
std::string RightsCategory(XALServer& server, const std::string& xalType) {
  Ref<ParamList> entry;
  const Checked<ParamList> catalogue = server.TableCatalogue();
  if (catalogue->Exists(xalType)) {
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
  const Checked<DataObject> rs = server.OpenQuery(xalType, kQueryReadOnly, condition, "ID");
  std::string ids;
  for (rs->MoveFirst(); !rs->IsEOF(); rs->MoveNext()) {
    if (!ids.empty()) ids += ",";
    ids += CStr(rs->Field("ID"));
  }
  return ids;
}

// "SELECT A23.ID FROM … WHERE …" over `xalType`, the host turning `condition` (which may follow
// links of the table) into the joins and the condition.
std::string SubSelect(XALServer& server, const std::string& xalType, const std::string& condition) {
  const Checked<DataObject> ob = server.OpenDataObject(xalType);
  const Checked<ParamList> params = server.NewParamList();
  params->Set("SelectQuery", Variant(condition + "<<<23>>>"));
  params->Set("LeftJoin", Variant(true));
  ob->CallFunction("ParseFields", Variant(params.get()), 0);
  return "SELECT A23.ID FROM " + CStr(params->Item("From")) + " WHERE " + CStr(params->Item("Where"));
}

// GetTableFilter without its trap: raises when the host fails or answers Nothing.
std::string TableFilter(const Checked<XALConnect>& conn, const std::string& xalType, bool idListOnly,
                        const std::string& alias, bool subSelect) {
  const Checked<XALServer> serverRef = conn->Server();
  XALServer& server = *serverRef;
  if (!IsTrue(server.Property(kServerPropRowRights)) && !IsTrue(server.Property(kServerPropRowRightsAlt))) return "";

  const std::string user = std::to_string(conn->UserID());
  const std::string category = RightsCategory(server, xalType);
  if (category.empty()) return "";

  const Checked<DataObject> right = server.OpenQuery(
      "select fcondition from xalurights where idxaluser = " + user + " and objectname = " + SQLText(xalType) +
          " and category = " + SQLText(category) + " and factive <> 0",
      kQueryReadOnly, "", "");
  if (right->IsEOF()) return "";
  const Variant text = right->Field("FCondition");
  std::string c = text.IsNull() ? std::string() : Trim(CStr(text));
  if (c.empty()) return "";

  c = Replace(c, "#UID", user, 1, -1, CompareMode::Text);
  if (idListOnly) return IdList(server, xalType, Replace(c, "#.", ""));
  if (subSelect) return SubSelect(server, xalType, Replace(c, "#.", ""));
  return Replace(c, "#.", alias.empty() ? std::string() : alias + ".");
}

}  // namespace

std::string GetTableFilter(const Ref<XALConnect>& xalConnect, const std::string& xalType, bool idListOnly,
                           const std::string& alias, bool subSelect) {
  return TryOr([&] { return TableFilter(xalConnect, xalType, idListOnly, alias, subSelect); }, std::string());
}

// True when record `pID` holds no category of `pCatID`'s group other than `pCatID` itself.
// A category with an empty group never conflicts. The groups are compared by the host, whose text
// comparison ignores case like the component's own (TextEquals): "COLOR" and "color" are one group
// here and in the merge of categories.
bool CheckCategory(const Ref<XALConnect>& pXALConnect, const std::string& pTableName, int32_t pID, int32_t pCatID) {
  const std::string& t = pTableName;
  const std::string id = std::to_string(pID), cat = std::to_string(pCatID);
  const Checked<XALServer> server = Checked<XALConnect>(pXALConnect)->Server();
  const Checked<DataObject> rs = server->OpenQuery("SELECT REL.ID FROM " + t + "Cat C, " + t + "Cat CNew, " + t + "CatRel REL" +
                                          " WHERE REL.ID" + t + "=" + id + " AND C.ID=REL.ID" + t + "Cat" +
                                          " AND CNew.ID=" + cat + " AND CNew.Category=C.Category" +
                                          " AND CNew.Category<>'' AND NOT(REL.ID" + t + "=" + id + " AND REL.ID" +
                                          t + "Cat=" + cat + ")",
                                      kQueryForward, "", "");
  return rs->IsEOF();
}

// Stored options of type "ID" that name record `oldID` of `tableName` are made to name `newID`
// (an empty text when it is 0); the host is then told to drop what it has cached of them.
bool ResetOptions(const Ref<XALConnect>& conn, const std::string& tableName, int32_t oldID, int32_t newID) {
  const std::string table = Trim(tableName);
  if (table.empty() || oldID == 0) return false;
  return TryStep([&] {
    const Checked<XALConnect> c = conn;
    const std::string value = newID == 0 ? SQLText("") : std::to_string(newID);
    c->Execute("UPDATE XALUserOption O, XALOptionList L SET O.OptValue=" + value +
                   " WHERE O.Category=L.Category AND O.Name=L.Name AND O.OptValue=" + SQLText(std::to_string(oldID)) +
                   " AND L.TableName=" + SQLText(table) + " AND L.Type='ID'",
               4);
    const Checked<XALServer> server = c->Server();
    c->ServerCommand("ResetOptions", server->NewParamList());
  });
}

}  // namespace xal::server
