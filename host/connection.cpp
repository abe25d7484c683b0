// HostConnection and HostServer over SQLite.
#include "host/connection.h"

#include <unistd.h>

#include <atomic>

#include "host/data_object.h"
#include "host/filter_layer.h"
#include "host/host_error.h"
#include "host/inventory.h"
#include "host/kept_balances.h"
#include "host/param_list.h"
#include "host/schema.h"
#include "host/sql_translator.h"
#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/text.h"

namespace xal::host {

namespace {
std::atomic<int64_t> gNextSession{1};

// Session numbers hold locks in a database that other processes open too, so they carry the
// process id above the process's own count.
int64_t NewSessionNumber() { return (static_cast<int64_t>(getpid()) << 24) + gNextSession++; }

// The text an option is stored as: numbers in "." form, dates as serials, Booleans as -1/0, so
// that what is read back converts to the same value in any locale.
std::string StoredText(const Variant& v) {
  switch (v.Type()) {
    case VarType::Boolean: return v.AsBool() ? "-1" : "0";
    case VarType::Date: return DoubleToString(v.AsDate().serial);
    case VarType::Null:
    case VarType::Empty: return "";
    default: return CStr(v);
  }
}
}  // namespace

// ---------------------------------------------------------------------------------------------
// Opening
// ---------------------------------------------------------------------------------------------

HostConnection::HostConnection(std::shared_ptr<Database> db, int32_t kind, int32_t userID)
    : db_(std::move(db)), kind_(kind), userID_(userID), session_(NewSessionNumber()) {}

HostConnection::~HostConnection() {
  // Locks die with their holder, as a server drops a session's locks when it disconnects.
  try {
    db_->Exec("DELETE FROM XALLock WHERE Holder = ?", {Variant(static_cast<double>(session_))});
  } catch (const VbError&) {
  }
}

Ref<HostConnection> HostConnection::Open(const std::string& path, int32_t kind, int32_t userID) {
  auto db = std::make_shared<Database>(path);
  if (!db->TableExists("GDocument")) {
    // One transaction for the whole schema: a file database would otherwise sync every statement.
    db->ExecScript("BEGIN");
    try {
      CreateSchema(*db);
      db->ExecScript("COMMIT");
    } catch (const VbError&) {
      db->ExecScript("ROLLBACK");
      throw;
    }
  }
  Ref<HostConnection> c(new HostConnection(std::move(db), kind, userID));
  c->server_ = MakeRef<HostServer>(c);
  return c;
}

Ref<XALServer> HostConnection::Server() { return server_; }

std::string HostConnection::Translate(const std::string& sql) const { return TranslateToSqlite(sql, kind_); }

Ref<DataObject> HostConnection::UserObject() {
  return OpenRows("SELECT * FROM XALUser WHERE ID = ?", "XALUser", "XALUser", {Variant(userID_)});
}

// ---------------------------------------------------------------------------------------------
// Options and settings
// ---------------------------------------------------------------------------------------------

Variant HostConnection::UserOption(int32_t user, const std::string& section, const std::string& key,
                                   const Variant& defaultValue) {
  Variant v = db_->Scalar("SELECT OptValue FROM XALUserOption WHERE IDXALUser = ? AND Category = ? AND Name = ?",
                          {Variant(user), Variant(section), Variant(key)});
  return v.IsNull() ? defaultValue : v;
}

Variant HostConnection::Setting(const std::string& category, const std::string& name, const Variant& defaultValue) {
  return UserOption(0, category, name, defaultValue);
}

void HostConnection::SetUserOption(int32_t user, const std::string& section, const std::string& key,
                                   const Variant& value) {
  db_->Exec("INSERT INTO XALUserOption (IDXALUser, Category, Name, OptValue) VALUES (?, ?, ?, ?) "
            "ON CONFLICT (IDXALUser, Category, Name) DO UPDATE SET OptValue = excluded.OptValue",
            {Variant(user), Variant(section), Variant(key), Variant(StoredText(value))});
}

void HostConnection::SetSetting(const std::string& category, const std::string& name, const Variant& value) {
  SetUserOption(0, category, name, value);
}

// ---------------------------------------------------------------------------------------------
// SQL, commands, rights, log
// ---------------------------------------------------------------------------------------------

Variant HostConnection::Execute(const std::string& sql, int32_t) {
  try {
    int64_t n = db_->Exec(Translate(sql));
    InvalidateLinks();
    // The error text tells about the last statement only; a success leaves none behind.
    lastError_.clear();
    return Variant(static_cast<int32_t>(n));
  } catch (const VbError& e) {
    lastError_ = e.description();
    InvalidateLinks();
    throw;
  }
}

// Server locks ("Lock" / "UnLock", ParamList "XALType", "LockType", "ID"):
//   1. A lock is named by its kind ("XALType", required), its type ("LockType", a number, 0 when
//      missing) and its record ("ID"; missing, Empty or 0 lock the whole kind).
//   2. "Lock" takes the lock and answers True, unless another connection holds it, or holds the
//      whole kind (same type) while a record is asked, or any record of it while the whole kind is
//      asked: then False. Asking again for a lock one holds answers True. Check and take are one
//      statement, so two connections can never both win.
//   3. "UnLock" releases this connection's lock of that name and answers True; with a record it
//      also releases this connection's lock on the whole kind (same type): saving the document is
//      the end of the work such a lock guards ("Add lots" locks the kind, then saves). Another
//      connection's lock is never released.
//   4. A connection's locks end with the connection.
Variant HostConnection::Lock(const Ref<ParamList>& params, bool take) {
  const std::string kind = params ? Trim(CStr(params->Item("XALType"))) : "";
  if (kind.empty()) Raise(kErrInvalidCall, std::string(take ? "Lock" : "UnLock") + " needs an XALType");
  const Variant type(CLng(params->Item("LockType")));
  const Variant record(CLng(params->Item("ID")));
  const Variant me(static_cast<double>(session_));
  if (!take) {
    db_->Exec("DELETE FROM XALLock WHERE XALType = ?1 AND LockType = ?2 AND Holder = ?4 "
              "AND (IDRecord = ?3 OR IDRecord = 0)",
              {Variant(kind), type, record, me});
    return Variant(true);
  }
  db_->Exec("INSERT INTO XALLock (XALType, LockType, IDRecord, Holder, TakenAt) SELECT ?1, ?2, ?3, ?4, ?5 "
            "WHERE NOT EXISTS (SELECT 1 FROM XALLock WHERE XALType = ?1 AND LockType = ?2 AND Holder <> ?4 "
            "AND (IDRecord = ?3 OR IDRecord = 0 OR ?3 = 0)) ON CONFLICT DO NOTHING",
            {Variant(kind), type, record, me, Variant(Now())});
  const Variant holder = db_->Scalar("SELECT Holder FROM XALLock WHERE XALType = ? AND LockType = ? AND IDRecord = ?",
                                     {Variant(kind), type, record});
  return Variant(!holder.IsNull() && CDbl(holder) == static_cast<double>(session_));
}

Variant HostConnection::ServerCommand(const std::string& name, const Ref<ParamList>& params) {
  if (TextEquals(name, "Lock")) return Lock(params, true);
  if (TextEquals(name, "UnLock")) return Lock(params, false);
  if (TextEquals(name, "DPInventoryB")) return InventoryB(*this, params);
  if (TextEquals(name, "Update_DCurBalance")) {
    // Rebuilds the current balances of the rows a field value selects (or all of them).
    const std::string field = params ? CStr(params->Item("FieldName")) : "";
    RebuildStockBalances(*db_, field, field.empty() ? Variant() : params->Item("FieldValue"));
    InvalidateLinks();
    return Variant(true);
  }
  if (TextEquals(name, "ResetOptions")) {
    // Options that name a record of a table: an old id becomes the new one ("" for none).
    std::string table = CStr(params->Item("TableName"));
    std::string oldID = CStr(params->Item("OldID")), newID = CStr(params->Item("NewID"));
    db_->Exec("UPDATE XALUserOption SET OptValue = ? WHERE OptValue = ? AND EXISTS (SELECT 1 FROM XALOptionList L "
              "WHERE L.Category = XALUserOption.Category AND L.Name = XALUserOption.Name AND L.TableName = ? "
              "AND L.Type = 'ID')",
              {Variant(newID == "0" ? std::string() : newID), Variant(oldID), Variant(table)});
    return Variant(true);
  }
  Raise(kErrInvalidCall, "Unknown server command " + name);
}

bool HostConnection::CheckRight(int32_t user, const std::string& kind, const std::string& object, int32_t,
                                int32_t b) {
  Variant denied = db_->Scalar("SELECT Denied FROM XALRight WHERE IDXALUser = ? AND Kind = ? AND ObjectName = ?",
                               {Variant(user), Variant(kind), Variant(object)});
  if (denied.IsNull()) return true;
  return (CLng(denied) & b) == 0;
}

// Logged when XALLogTable lists the table for this kind (or for every kind, Kind '') with one of
// the operation bits `flags` asks about (0: any).
bool HostConnection::LogCheck(const std::string& kind, const std::string& table, int32_t flags) {
  Variant n = db_->Scalar("SELECT count(*) FROM XALLogTable WHERE TableName = ? AND (Kind = ? OR Kind = '') "
                          "AND (?3 = 0 OR (Flags & ?3) <> 0)",
                          {Variant(table), Variant(kind), Variant(flags)});
  return CLng(n) > 0;
}

void HostConnection::WriteLog(const std::string& kind, const std::string& table, int32_t id, const std::string& text) {
  db_->Exec("INSERT INTO XALLog (IDXALUser, Kind, TableName, IDRecord, LogText, LogTime) VALUES (?, ?, ?, ?, ?, ?)",
            {Variant(userID_), Variant(kind), Variant(table), Variant(id), Variant(text), Variant(Now())});
}

Variant HostConnection::Property(int32_t number) {
  if (number == kConnPropLanguage) return Variant(langID_);
  return Variant();
}

// Nested begins are savepoints, so a component transaction inside a host one still rolls back alone.
bool HostConnection::BeginTransaction() {
  db_->ExecScript("SAVEPOINT xal_t" + std::to_string(transactionDepth_));
  ++transactionDepth_;
  return true;
}

void HostConnection::CommitTransaction() {
  if (transactionDepth_ == 0) return;
  --transactionDepth_;
  db_->ExecScript("RELEASE SAVEPOINT xal_t" + std::to_string(transactionDepth_));
}

void HostConnection::RollbackTransaction() {
  if (transactionDepth_ == 0) return;
  --transactionDepth_;
  const std::string sp = "xal_t" + std::to_string(transactionDepth_);
  db_->ExecScript("ROLLBACK TO SAVEPOINT " + sp + "; RELEASE SAVEPOINT " + sp);
  InvalidateLinks();
}

// ---------------------------------------------------------------------------------------------
// Rows, links and the table catalogue
// ---------------------------------------------------------------------------------------------

Ref<HostDataObject> HostConnection::OpenRows(const std::string& sql, const std::string& table,
                                             const std::string& writeTable, const std::vector<Variant>& params) {
  ResultSet rs = db_->Query(sql, params);
  auto self = std::static_pointer_cast<HostConnection>(shared_from_this());
  return MakeRef<HostDataObject>(self, table, writeTable, std::move(rs));
}

std::string HostConnection::BaseTable(const std::string& table) {
  std::string key = FoldCase(table);
  auto it = baseTables_.find(key);
  if (it != baseTables_.end()) return it->second;
  Variant base = db_->Scalar("SELECT BaseTable FROM XALTable WHERE TableName = ?", {Variant(table)});
  std::string result = (base.IsString() && !base.AsString().empty()) ? base.AsString() : table;
  baseTables_[key] = result;
  return result;
}

bool HostConnection::ResolveLink(const std::string& link, std::string& field, std::string& table) {
  std::string key = FoldCase(link);
  auto it = links_.find(key);
  if (it == links_.end()) {
    ResultSet rs = db_->Query("SELECT FieldName, TargetTable FROM XALLink WHERE LinkName = ?", {Variant(link)});
    std::pair<std::string, std::string> resolved;
    if (!rs.rows.empty())
      resolved = {rs.rows[0][0].AsString(), rs.rows[0][1].AsString()};
    else if (db_->TableExists(link))
      resolved = {"ID" + link, BaseTable(link)};
    it = links_.emplace(key, resolved).first;
  }
  if (it->second.first.empty()) return false;
  field = it->second.first;
  table = it->second.second;
  return true;
}

const LinkedRow* HostConnection::LinkedRecord(const std::string& table, int32_t id) {
  std::string key = table;
  key += '#';
  key += std::to_string(id);
  auto it = linkCache_.find(key);
  if (it != linkCache_.end()) return it->second.get();
  ResultSet rs = db_->Query("SELECT * FROM " + QuoteName(table) + " WHERE ID = ?", {Variant(id)});
  std::unique_ptr<LinkedRow> row;
  if (!rs.rows.empty()) {
    row = std::make_unique<LinkedRow>();
    for (size_t i = 0; i < rs.columns.size(); ++i) row->fields.emplace(FoldCase(rs.columns[i]), rs.rows[0][i]);
  }
  return linkCache_.emplace(key, std::move(row)).first->second.get();
}

// ---------------------------------------------------------------------------------------------
// HostServer
// ---------------------------------------------------------------------------------------------

Ref<HostConnection> HostServer::conn() const {
  auto c = conn_.lock();
  if (!c) Raise(kErrObjectNotSet, "The connection of this server is closed");
  return c;
}

// The form filter as a condition on `table` (host/filter_layer.h).
std::string HostServer::FilterCondition(const std::string& table, const std::string& filter) {
  return FormFilterCondition(*conn(), table, filter);
}

Ref<DataObject> HostServer::OpenQuery(const std::string& sqlOrTable, int32_t, const std::string& filter,
                                      const std::string& fields) {
  Ref<HostConnection> c = conn();
  const std::string source = Trim(sqlOrTable);
  if (IsPlainName(source)) {
    std::string sql = "SELECT " + (Trim(fields).empty() ? std::string("*") : fields) + " FROM " + source;
    if (!Trim(filter).empty()) sql += " WHERE " + FilterCondition(source, filter);
    return c->OpenRows(c->Translate(sql), source, c->BaseTable(source));
  }
  std::string sql = c->Translate(source);
  if (!Trim(filter).empty()) sql = "SELECT * FROM (" + sql + ") WHERE " + c->Translate(FilterCondition("", filter));
  // A query whose columns all come from one table can still write its rows back to that table;
  // the result itself names the table, so the query runs once.
  ResultSet rs = c->db().Query(sql);
  const std::string table = rs.sourceTable;
  return MakeRef<HostDataObject>(c, table, table.empty() ? "" : c->BaseTable(table), std::move(rs));
}

Ref<DataObject> HostServer::OpenDataObject(const std::string& table) {
  Ref<HostConnection> c = conn();
  if (!IsPlainName(table)) Raise(kErrInvalidCall, "Not a table name: " + table);
  return c->OpenRows("SELECT * FROM " + QuoteName(table), table, c->BaseTable(table));
}

Ref<ParamList> HostServer::NewParamList() { return MakeRef<HostParamList>(); }

Ref<XALConnect> HostServer::Connection() { return conn(); }

std::string HostServer::Text(const std::string& key, int32_t kind, int32_t lang) {
  ResultSet rs = conn()->db().Query("SELECT English, Estonian FROM XALMessage WHERE MsgKey = ? AND Kind = ?",
                                    {Variant(key), Variant(kind)});
  if (rs.rows.empty()) return key;
  const Variant& text = rs.rows[0][lang == kLangEstonian ? 1 : 0];
  return text.IsString() && !text.AsString().empty() ? text.AsString() : rs.rows[0][0].AsString();
}

Variant HostServer::Property(int32_t number) {
  auto it = properties_.find(number);
  if (it != properties_.end()) return it->second;
  if (number == kServerPropLanguage) return Variant(conn()->Language());
  return Variant(false);
}

Ref<ParamList> HostServer::TableCatalogue() {
  auto catalogue = MakeRef<HostParamList>("Catalogue");
  ResultSet rs = conn()->db().Query(
      "SELECT TableName, isDocument, isRegister, isReport, CanAdminister, SystemTable FROM XALTable");
  for (auto& row : rs.rows) {
    auto entry = MakeRef<HostParamList>(row[0].AsString());
    for (size_t i = 1; i < rs.columns.size(); ++i) entry->Set(rs.columns[i], row[i]);
    catalogue->SetObject(row[0].AsString(), entry);
  }
  return catalogue;
}

}  // namespace xal::host
