// The reference host's connection and server objects over one SQLite database. The connection
// answers options and settings from XALUserOption, runs the component's SQL through the dialect
// translator, keeps named locks that refuse a second holder, writes the log, and caches the rows
// that dotted field paths read (dropped on every write). The server opens queries and data
// objects, makes parameter lists, and answers keyed messages and the table catalogue.
// Ownership: a connection owns its database and its server; the server refers back weakly; data
// objects hold their connection.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <unordered_map>

#include "bridge/host_model.h"
#include "host/database.h"

namespace xal::host {

class HostServer;
class HostDataObject;

// A row read through a link, with its columns by folded name.
struct LinkedRow {
  std::unordered_map<std::string, Variant> fields;
};

class HostConnection : public XALConnect {
 public:
  // Opens (or creates) the database at `path`; `kind` 1 is the file database, 2 the server.
  // A new database gets the schema.
  static Ref<HostConnection> Open(const std::string& path, int32_t kind, int32_t userID = 1);
  ~HostConnection() override;

  // ---- XALConnect -------------------------------------------------------------------------------
  Ref<XALServer> Server() override;
  int32_t DatabaseKind() override { return kind_; }
  int32_t UserID() override { return userID_; }
  Ref<DataObject> UserObject() override;
  Variant UserOption(int32_t user, const std::string& section, const std::string& key,
                     const Variant& defaultValue) override;
  Variant Setting(const std::string& category, const std::string& name, const Variant& defaultValue) override;
  void SetSetting(const std::string& category, const std::string& name, const Variant& value) override;
  Variant Execute(const std::string& sql, int32_t options) override;
  Variant ServerCommand(const std::string& name, const Ref<ParamList>& params) override;
  bool CheckRight(int32_t user, const std::string& kind, const std::string& object, int32_t a, int32_t b) override;
  bool LogCheck(const std::string& kind, const std::string& table, int32_t flags) override;
  void WriteLog(const std::string& kind, const std::string& table, int32_t id, const std::string& text) override;
  Variant Property(int32_t number) override;
  bool BeginTransaction() override;
  void CommitTransaction() override;
  void RollbackTransaction() override;

  // ---- Host side --------------------------------------------------------------------------------
  Database& db() { return *db_; }
  std::string Translate(const std::string& sql) const;
  void SetUserID(int32_t id) { userID_ = id; }
  void SetLanguage(int32_t langID) { langID_ = langID; }
  int32_t Language() const { return langID_; }
  // Stores a user option (user 0: a system option).
  void SetUserOption(int32_t user, const std::string& section, const std::string& key, const Variant& value);
  // A data object over the rows of `sql` (already SQLite) that writes back to `writeTable`.
  Ref<HostDataObject> OpenRows(const std::string& sql, const std::string& table, const std::string& writeTable,
                               const std::vector<Variant>& params = {});
  // The table a document kind's rows are written to ("SDInvoice" -> "GDocument"), or the name itself.
  std::string BaseTable(const std::string& table);
  // Resolves a link name of a dotted path: the field holding the id and the linked table.
  bool ResolveLink(const std::string& link, std::string& field, std::string& table);
  // The row `id` of `table` through the link cache; nullptr when there is none.
  const LinkedRow* LinkedRecord(const std::string& table, int32_t id);
  // Drops every cached linked row; called on every write.
  void InvalidateLinks() { linkCache_.clear(); }
  const std::string& LastError() const { return lastError_; }
  void SetLastError(std::string e) { lastError_ = std::move(e); }
  int64_t SessionNumber() const { return session_; }

 private:
  HostConnection(std::shared_ptr<Database> db, int32_t kind, int32_t userID);
  Variant Lock(const Ref<ParamList>& params, bool take);
  std::string OptionText(const Variant& v) const;

  std::shared_ptr<Database> db_;
  int32_t kind_;
  int32_t userID_;
  int32_t langID_ = kLangEnglish;
  int64_t session_;
  int transactionDepth_ = 0;
  std::string lastError_;
  Ref<HostServer> server_;
  std::unordered_map<std::string, std::unique_ptr<LinkedRow>> linkCache_;  // "table#id"
  std::unordered_map<std::string, std::pair<std::string, std::string>> links_;  // folded link -> field, table
  std::unordered_map<std::string, std::string> baseTables_;
};

class HostServer : public XALServer {
 public:
  explicit HostServer(const Ref<HostConnection>& conn) : conn_(conn) {}
  // Modes are accepted and not distinguished: every query is a snapshot the caller may edit.
  Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                            const std::string& fields) override;
  Ref<DataObject> OpenDataObject(const std::string& table) override;
  Ref<ParamList> NewParamList() override;
  Ref<XALConnect> Connection() override;
  std::string Text(const std::string& key, int32_t kind, int32_t lang) override;
  Variant Property(int32_t number) override;
  Ref<ParamList> TableCatalogue() override;

  // A form filter made a condition on `table`: raw "{…}" unwrapped, a condition on a relation
  // table turned into an id sub-select; anything else as given.
  std::string FilterCondition(const std::string& table, const std::string& filter);

  // Server properties by number (5: language; 7, 8, 50: whether row rights are in force).
  void SetProperty(int32_t number, const Variant& value) { properties_[number] = value; }

 private:
  Ref<HostConnection> conn() const;
  WeakRef<HostConnection> conn_;
  std::map<int32_t, Variant> properties_;
};

}  // namespace xal::host
