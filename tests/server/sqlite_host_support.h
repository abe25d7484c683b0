// What the period-closing, balance-rebuild and merge tests share: a fresh reference-host database
// per test for either database kind, a user who answers the callback's questions from a script
// and keeps a transcript of every call, and table dumps to compare whole database states.
#pragma once

#include <gtest/gtest.h>

#include <deque>
#include <filesystem>
#include <string>
#include <vector>

#include "bridge/callback_proxy.h"
#include "host/connection.h"
#include "host/data_object.h"
#include "runtime/convert.h"
#include "runtime/dates.h"

namespace xal::server::testing {

// Answers MsgBox from a queue (0 when it runs dry) and writes each call as
// MsgBox(caller,"prompt",buttons)->answer or Notify(kind[,value]), joined by "; ".
class ScriptedUser : public XALCBProxyEvents {
 public:
  std::deque<int32_t> answers;
  std::string transcript;

  void MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string& Title,
              const std::string& Helpfile, int32_t Context, int32_t& Result) override {
    int32_t answer = 0;
    if (!answers.empty()) {
      answer = answers.front();
      answers.pop_front();
    }
    std::string call = "MsgBox(" + std::to_string(callerID) + ",\"" + Prompt + "\"," + std::to_string(Buttons);
    if (!Title.empty() || !Helpfile.empty() || Context != 0)
      call += ",\"" + Title + "\",\"" + Helpfile + "\"," + std::to_string(Context);
    Append(call + ")->" + std::to_string(answer));
    Result = answer;
  }
  void Notify(int32_t callerID, int32_t eNotify, const std::string& sMessage, const Variant& vParam,
              bool& Result) override {
    std::string call = "Notify(";
    if (callerID != 77) call += "caller " + std::to_string(callerID) + ",";
    call += std::to_string(eNotify);
    if (!sMessage.empty()) call += ",\"" + sMessage + "\"";
    if (!vParam.IsEmpty()) call += "," + CStr(vParam);
    Append(call + ")");
    Result = true;
  }

 private:
  void Append(const std::string& call) { transcript += (transcript.empty() ? "" : "; ") + call; }
};

// Runs each test on a new database file of the kind the parameter names (1 file, 2 server).
class SqliteHostTest : public ::testing::TestWithParam<int32_t> {
 protected:
  void SetUp() override {
    const auto* info = ::testing::UnitTest::GetInstance()->current_test_info();
    std::string name = std::string("xalsrv_") + info->test_suite_name() + "_" + info->name() + ".db";
    for (char& c : name)
      if (c == '/') c = '_';
    path_ = std::filesystem::temp_directory_path() / name;
    std::filesystem::remove(path_);
    conn = host::HostConnection::Open(path_.string(), GetParam());
    user = std::make_shared<ScriptedUser>();
    callback = MakeRef<XALCBProxy>();
    callback->Events().Connect(user);
  }
  void TearDown() override {
    conn.reset();
    std::filesystem::remove(path_);
  }

  void Sql(const std::string& script) { conn->db().ExecScript(script); }
  Variant Scalar(const std::string& sql) { return conn->db().Scalar(sql); }
  int32_t Count(const std::string& sql) { return CLng(Scalar(sql)); }

  // Every row of `table`, ordered by all its columns, one "(v1,v2,…)" per row.
  std::string Rows(const std::string& table, const std::string& columns = "*", const std::string& where = "") {
    host::ResultSet rs = conn->db().Query("SELECT " + columns + " FROM \"" + table + "\"" +
                                          (where.empty() ? "" : " WHERE " + where) + " ORDER BY " + OrderAll(table, columns));
    std::string out;
    for (const auto& row : rs.rows) {
      out += "(";
      for (size_t i = 0; i < row.size(); ++i) out += (i ? "," : "") + (row[i].IsNull() ? std::string("NULL") : CStr(row[i]));
      out += ")";
    }
    return out;
  }
  // The rows of several tables, for comparing whole database states.
  std::string Dump(const std::vector<std::string>& tables) {
    std::string out;
    for (const auto& t : tables) out += t + ":" + Rows(t) + "\n";
    return out;
  }

  Ref<host::HostConnection> conn;
  std::shared_ptr<ScriptedUser> user;
  Ref<XALCBProxy> callback;

 private:
  std::string OrderAll(const std::string& table, const std::string& columns) {
    if (columns != "*") {
      std::string order;
      int n = 1;
      for (char c : columns) n += c == ',';
      for (int i = 1; i <= n; ++i) order += (i > 1 ? "," : "") + std::to_string(i);
      return order;
    }
    std::string order;
    for (const auto& c : conn->db().TableColumns(table)) order += (order.empty() ? "\"" : ",\"") + c + "\"";
    return order;
  }

  std::filesystem::path path_;
};

inline std::string KindName(const ::testing::TestParamInfo<int32_t>& info) {
  return info.param == 2 ? "Server" : "File";
}

}  // namespace xal::server::testing
