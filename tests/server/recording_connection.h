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

#include "forwarding_host.h"
#include "host/connection.h"
#include "runtime/convert.h"

namespace xal::server::sqllog {

class SqlLogConnection;

// Records the text and mode of every query before passing it on.
class SqlLogServer : public testing::ForwardingServer {
 public:
  SqlLogServer(Ref<XALServer> inner, std::vector<std::string>* log, XALConnect* conn)
      : ForwardingServer(std::move(inner), conn), log_(log) {}
  Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                            const std::string& fields) override {
    log_->push_back(sqlOrTable);
    modes_.push_back(mode);
    return ForwardingServer::OpenQuery(sqlOrTable, mode, filter, fields);
  }

  const std::vector<int32_t>& Modes() const { return modes_; }
  void ClearModes() { modes_.clear(); }

 private:
  std::vector<std::string>* log_;
  std::vector<int32_t> modes_;
};

// Forwards every operation to the host connection; SQL texts and setting reads are recorded.
class SqlLogConnection : public testing::ForwardingConnection {
 public:
  explicit SqlLogConnection(Ref<host::HostConnection> inner) : ForwardingConnection(std::move(inner)) {}

  Variant Setting(const std::string& category, const std::string& name, const Variant& defaultValue) override {
    settingReads_.push_back(category + "/" + name);
    return ForwardingConnection::Setting(category, name, defaultValue);
  }
  Variant Execute(const std::string& sql, int32_t options) override {
    sql_.push_back(sql);
    return ForwardingConnection::Execute(sql, options);
  }

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

 protected:
  Ref<XALServer> MakeServer(Ref<XALServer> inner) override { return MakeRef<SqlLogServer>(std::move(inner), &sql_, this); }

 private:
  std::vector<std::string> sql_;
  std::vector<std::string> settingReads_;
};

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
