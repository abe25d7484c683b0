// Test support for the server functions over the reference host: a connection decorator that
// forwards to a HostConnection and records every SQL text the component sends (Execute, and
// OpenQuery through a server decorator), and a fixture that opens a fresh SQLite database per
// test, parameterised by database kind (1 the file database, 2 the server), so that one suite
// runs over both SQL dialects.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <vector>

#include "host/connection.h"
#include "runtime/convert.h"

namespace xal::server::sqllog {

class SqlLogConnection;

// Records the text of every query before passing it on; the server it wraps does the work.
class SqlLogServer : public XALServer {
 public:
  SqlLogServer(Ref<XALServer> inner, std::vector<std::string>* log, XALConnect* conn)
      : inner_(std::move(inner)), log_(log), conn_(conn) {}
  Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                            const std::string& fields) override {
    log_->push_back(sqlOrTable);
    modes_.push_back(mode);
    return inner_->OpenQuery(sqlOrTable, mode, filter, fields);
  }
  Ref<DataObject> OpenDataObject(const std::string& table) override { return inner_->OpenDataObject(table); }
  Ref<ParamList> NewParamList() override { return inner_->NewParamList(); }
  Ref<XALConnect> Connection() override;
  std::string Text(const std::string& key, int32_t kind, int32_t lang) override {
    return inner_->Text(key, kind, lang);
  }
  Variant Property(int32_t number) override { return inner_->Property(number); }
  Ref<ParamList> TableCatalogue() override { return inner_->TableCatalogue(); }

  const std::vector<int32_t>& Modes() const { return modes_; }
  void ClearModes() { modes_.clear(); }

 private:
  Ref<XALServer> inner_;
  std::vector<std::string>* log_;
  XALConnect* conn_;  // the owning decorator; it outlives this server
  std::vector<int32_t> modes_;
};

// Forwards every operation to the host connection; SQL texts and setting reads are recorded.
class SqlLogConnection : public XALConnect {
 public:
  explicit SqlLogConnection(Ref<host::HostConnection> inner) : inner_(std::move(inner)) {}

  Ref<XALServer> Server() override {
    if (!server_) server_ = MakeRef<SqlLogServer>(inner_->Server(), &sql_, this);
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
    settingReads_.push_back(category + "/" + name);
    return inner_->Setting(category, name, defaultValue);
  }
  void SetSetting(const std::string& category, const std::string& name, const Variant& value) override {
    inner_->SetSetting(category, name, value);
  }
  Variant Execute(const std::string& sql, int32_t options) override {
    sql_.push_back(sql);
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

  // Every SQL text sent, in order (queries and statements).
  const std::vector<std::string>& Sql() const { return sql_; }
  // The setting reads, as "category/name", in order.
  const std::vector<std::string>& SettingReads() const { return settingReads_; }
  const std::vector<int32_t>& Modes() { return static_cast<SqlLogServer&>(*Server()).Modes(); }
  void Clear() {
    sql_.clear();
    settingReads_.clear();
    if (server_) static_cast<SqlLogServer&>(*server_).ClearModes();
  }

 private:
  Ref<host::HostConnection> inner_;
  Ref<XALServer> server_;
  std::vector<std::string> sql_;
  std::vector<std::string> settingReads_;
};

inline Ref<XALConnect> SqlLogServer::Connection() {
  return std::static_pointer_cast<XALConnect>(conn_->shared_from_this());
}

// A fresh database per test in a temporary file, opened with the kind the parameter names.
class DialectDbTest : public ::testing::TestWithParam<int32_t> {
 protected:
  void SetUp() override {
    const auto* info = ::testing::UnitTest::GetInstance()->current_test_info();
    std::string name = std::string("xalserver_") + info->test_suite_name() + "_" + info->name() + ".db";
    for (char& ch : name)
      if (ch == '/') ch = '_';
    path_ = std::filesystem::temp_directory_path() / name;
    std::filesystem::remove(path_);
    host = host::HostConnection::Open(path_.string(), GetParam());
    conn = MakeRef<SqlLogConnection>(host);
  }
  void TearDown() override {
    conn.reset();
    host.reset();
    std::filesystem::remove(path_);
  }

  int32_t Kind() const { return GetParam(); }
  bool ServerDialect() const { return GetParam() == 2; }
  void Exec(const std::string& sqlite) { host->db().ExecScript(sqlite); }

  Ref<host::HostConnection> host;
  Ref<SqlLogConnection> conn;
  std::filesystem::path path_;
};

inline std::string KindName(const ::testing::TestParamInfo<int32_t>& info) {
  return info.param == 2 ? "ServerKind2" : "FileKind1";
}

}  // namespace xal::server::sqllog
