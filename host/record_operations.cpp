// The named functions and record-level operations of the host's data objects. Each does the
// least that gives the component what it relies on:
//   "ActualRowCount"  the rows of the set not marked deleted;
//   "LinkedTableName" the table a link field refers to ("IDPartner" -> "GRCompany"), "" if none;
//   "AfterUpdate"     the host's notice that a document changed: recorded in the log, True;
//   record operation 41 (merge): every reference to the current record, in every table that has
//                     a link field to its table, is moved to the record whose id is given.
#include <sqlite3.h>

#include "host/connection.h"
#include "host/data_object.h"
#include "host/host_error.h"
#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

std::string ParamText(const Variant& params, const char* name) {
  if (params.IsObject())
    if (auto list = std::dynamic_pointer_cast<ParamList>(params.AsObject())) return CStr(list->Item(name));
  return params.IsString() ? params.AsString() : std::string();
}

// The table a field leads to: a dotted path ("Partner.Code", "GRCompany.GRCurrency.Code") names
// the table of its last link; a link field ("IDPartner") the table it refers to; "" when neither.
Variant LinkedTableName(HostDataObject& self, const Variant& params, int32_t) {
  std::string field = ParamText(params, "Field");
  if (field.empty()) field = ParamText(params, "FieldName");
  HostConnection& conn = *self.HostConn();
  std::string idField, table;
  if (field.find('.') != std::string::npos) {
    std::vector<std::string> parts = Split(field, ".");
    for (size_t i = 0; i + 1 < parts.size(); ++i)
      if (!conn.ResolveLink(parts[i], idField, table)) return Variant(std::string());
    return Variant(table);
  }
  if (field.size() <= 2 || !TextEquals(Left(field, 2), "ID")) return Variant(std::string());
  if (conn.ResolveLink(Mid(field, 3), idField, table)) return Variant(table);
  // Aliases are listed by link name; look one up by its field too.
  ResultSet rs = conn.db().Query("SELECT TargetTable FROM XALLink WHERE FieldName = ?", {Variant(field)});
  return Variant(rs.rows.empty() ? std::string() : rs.rows[0][0].AsString());
}

Variant AfterUpdate(HostDataObject& self, const Variant& params, int32_t) {
  self.HostConn()->WriteLog("AfterUpdate", self.TableName(), CLng(Variant(ParamText(params, "ID").empty() ? "0" : ParamText(params, "ID"))),
                            "OnUpdateDoc=" + ParamText(params, "OnUpdateDoc") + " NoCostUpdate=" +
                                ParamText(params, "NoCostUpdate"));
  return Variant(true);
}

// Every (table, column) that refers to rows of `target`: "ID" + table columns and link aliases.
std::vector<std::pair<std::string, std::string>> ReferencesTo(Database& db, const std::string& target) {
  std::vector<std::string> fields{"ID" + target};
  ResultSet aliases = db.Query("SELECT FieldName FROM XALLink WHERE TargetTable = ?", {Variant(target)});
  for (auto& r : aliases.rows) fields.push_back(r[0].AsString());
  ResultSet tables = db.Query("SELECT name FROM sqlite_schema WHERE type = 'table' AND name NOT LIKE 'sqlite_%'");
  std::vector<std::pair<std::string, std::string>> refs;
  for (auto& t : tables.rows)
    for (const std::string& col : db.TableColumns(t[0].AsString()))
      for (const std::string& f : fields)
        if (TextEquals(col, f)) refs.emplace_back(t[0].AsString(), col);
  return refs;
}

}  // namespace

Variant HostDataObject::RecordOperation(int32_t code, const Variant& arg) {
  if (code != kRecordOpMoveReferences)
    Raise(kErrInvalidCall, "Record operation " + std::to_string(code) + " is not supported");
  const Variant source = Field("ID");
  const int32_t target = CLng(arg);
  if (source.IsNull() || target == 0) Raise(kErrInvalidCall, "Record operation 41 needs a current record and a target");
  Database& db = conn_->db();
  const std::string table = conn_->BaseTable(TableName());
  int64_t moved = 0;
  for (const auto& [t, col] : ReferencesTo(db, table))
    moved += db.Exec("UPDATE " + QuoteName(t) + " SET " + QuoteName(col) + " = ? WHERE " + QuoteName(col) + " = ?",
                     {Variant(target), source});
  conn_->InvalidateLinks();
  return Variant(static_cast<int32_t>(moved));
}

namespace {
const bool kRegistered = [] {
  RegisterDataObjectFunction("ActualRowCount",
                             [](HostDataObject& self, const Variant&, int32_t) { return Variant(self.ActualRowCount()); });
  RegisterDataObjectFunction("LinkedTableName", LinkedTableName);
  RegisterDataObjectFunction("AfterUpdate", AfterUpdate);
  return true;
}();
}  // namespace

}  // namespace xal::host
