// A connection and server that pass every host operation on to the reference host. Test doubles
// derive from them and override only the operations they watch (the SQL sent, the settings read),
// so the forwarding is written once.
#pragma once

#include <string>

#include "bridge/host_model.h"
#include "host/connection.h"

namespace xal::server::testing {

class ForwardingServer : public XALServer {
 public:
  // `owner` is the connection decorator this server belongs to; it outlives the server.
  ForwardingServer(Ref<XALServer> inner, XALConnect* owner) : inner_(std::move(inner)), owner_(owner) {}
  Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                            const std::string& fields) override {
    return inner_->OpenQuery(sqlOrTable, mode, filter, fields);
  }
  Ref<DataObject> OpenDataObject(const std::string& table) override { return inner_->OpenDataObject(table); }
  Ref<ParamList> NewParamList() override { return inner_->NewParamList(); }
  Ref<XALConnect> Connection() override { return std::static_pointer_cast<XALConnect>(owner_->shared_from_this()); }
  std::string Text(const std::string& key, int32_t kind, int32_t lang) override { return inner_->Text(key, kind, lang); }
  Variant Property(int32_t number) override { return inner_->Property(number); }
  Ref<ParamList> TableCatalogue() override { return inner_->TableCatalogue(); }

 protected:
  Ref<XALServer> inner_;
  XALConnect* owner_;
};

class ForwardingConnection : public XALConnect {
 public:
  explicit ForwardingConnection(Ref<host::HostConnection> inner) : inner_(std::move(inner)) {}

  // The server is made once, by MakeServer, so a decorator can hand out its own kind of server.
  Ref<XALServer> Server() override {
    if (!server_) server_ = MakeServer(inner_->Server());
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
  Variant Execute(const std::string& sql, int32_t options) override { return inner_->Execute(sql, options); }
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
  bool BeginTransaction() override { return inner_->BeginTransaction(); }
  void CommitTransaction() override { inner_->CommitTransaction(); }
  void RollbackTransaction() override { inner_->RollbackTransaction(); }

 protected:
  virtual Ref<XALServer> MakeServer(Ref<XALServer> inner) { return MakeRef<ForwardingServer>(std::move(inner), this); }
  Ref<host::HostConnection> inner_;
  Ref<XALServer> server_;
};

}  // namespace xal::server::testing
