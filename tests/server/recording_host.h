// A connection and server that pass every call on to the reference host and record the SQL the
// component sends: statements run through Execute (with their options) and queries opened through
// the server (with their modes). Tests compare the recorded text with what the operation must
// send, and the SQLite database underneath shows what it did.
#pragma once

#include <string>
#include <vector>

#include "bridge/host_model.h"
#include "host/connection.h"

namespace xal::server::testing {

struct SqlCall {
  std::string sql;
  int32_t number;  // Execute: the options; OpenQuery: the mode
  bool operator==(const SqlCall&) const = default;
};

inline void PrintTo(const SqlCall& c, std::ostream* os) { *os << "{\"" << c.sql << "\", " << c.number << "}"; }

class RecordingConnection;

class RecordingServer : public XALServer {
 public:
  RecordingServer(Ref<XALServer> inner, RecordingConnection* owner) : inner_(std::move(inner)), owner_(owner) {}
  Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                            const std::string& fields) override;
  Ref<DataObject> OpenDataObject(const std::string& table) override { return inner_->OpenDataObject(table); }
  Ref<ParamList> NewParamList() override { return inner_->NewParamList(); }
  Ref<XALConnect> Connection() override;
  std::string Text(const std::string& key, int32_t kind, int32_t lang) override { return inner_->Text(key, kind, lang); }
  Variant Property(int32_t number) override { return inner_->Property(number); }
  Ref<ParamList> TableCatalogue() override { return inner_->TableCatalogue(); }

 private:
  Ref<XALServer> inner_;
  RecordingConnection* owner_;
};

class RecordingConnection : public XALConnect {
 public:
  explicit RecordingConnection(Ref<host::HostConnection> inner) : inner_(std::move(inner)) {}

  std::vector<SqlCall> executed;  // Execute(sql, options)
  std::vector<SqlCall> queried;   // OpenQuery(sql, mode)

  Ref<XALServer> Server() override {
    if (!server_) server_ = MakeRef<RecordingServer>(inner_->Server(), this);
    return server_;
  }
  int32_t DatabaseKind() override { return inner_->DatabaseKind(); }
  int32_t UserID() override { return inner_->UserID(); }
  Ref<DataObject> UserObject() override { return inner_->UserObject(); }
  Variant UserOption(int32_t user, const std::string& section, const std::string& key,
                     const Variant& defaultValue) override {
    return inner_->UserOption(user, section, key, defaultValue);
  }
  Variant Setting(const std::string& category, const std::string& name, const Variant& defaultValue) override {
    return inner_->Setting(category, name, defaultValue);
  }
  void SetSetting(const std::string& category, const std::string& name, const Variant& value) override {
    inner_->SetSetting(category, name, value);
  }
  Variant Execute(const std::string& sql, int32_t options) override {
    executed.push_back({sql, options});
    return inner_->Execute(sql, options);
  }
  Variant ServerCommand(const std::string& name, const Ref<ParamList>& params) override {
    return inner_->ServerCommand(name, params);
  }
  bool CheckRight(int32_t user, const std::string& kind, const std::string& object, int32_t a, int32_t b) override {
    return inner_->CheckRight(user, kind, object, a, b);
  }
  bool LogCheck(const std::string& kind, const std::string& table, int32_t flags) override {
    return inner_->LogCheck(kind, table, flags);
  }
  void WriteLog(const std::string& kind, const std::string& table, int32_t id, const std::string& text) override {
    inner_->WriteLog(kind, table, id, text);
  }
  Variant Property(int32_t number) override { return inner_->Property(number); }

 private:
  friend class RecordingServer;
  Ref<host::HostConnection> inner_;
  Ref<RecordingServer> server_;
};

inline Ref<DataObject> RecordingServer::OpenQuery(const std::string& sqlOrTable, int32_t mode,
                                                  const std::string& filter, const std::string& fields) {
  owner_->queried.push_back({sqlOrTable, mode});
  return inner_->OpenQuery(sqlOrTable, mode, filter, fields);
}

inline Ref<XALConnect> RecordingServer::Connection() { return RefTo<XALConnect>(*owner_); }

}  // namespace xal::server::testing
