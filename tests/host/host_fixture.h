// A fresh reference-host database for each test, in a temporary file (so a second connection can
// open it too) named after the test and the process (so builds that run side by side keep apart),
// with a few rows to read through links.
#pragma once

#include <gtest/gtest.h>

#include <unistd.h>

#include <filesystem>
#include <string>

#include "host/connection.h"
#include "host/data_object.h"

namespace xal::host::testing {

class HostTest : public ::testing::Test {
 protected:
  void SetUp() override {
    const auto* info = ::testing::UnitTest::GetInstance()->current_test_info();
    path_ = std::filesystem::temp_directory_path() / (std::string("xalhost_") + info->test_suite_name() + "_" +
                                                      info->name() + "_" + std::to_string(::getpid()) + ".db");
    std::filesystem::remove(path_);
    conn = HostConnection::Open(path_.string(), 1);
    Database& db = conn->db();
    db.ExecScript(
        "INSERT INTO GRCurrency (ID, Code) VALUES (1, 'EUR'), (2, 'USD');"
        "INSERT INTO GRCompany (ID, Code, Name, IDGRCurrency, CreditLimit) VALUES"
        " (10, 'ACME', 'Acme Ltd', 1, 5000), (11, 'BETA', 'Beta OÜ', 2, 0);"
        "INSERT INTO DRStore (ID, Code, Name, IDGRCompany) VALUES (100, 'MAIN', 'Main store', 10);"
        "INSERT INTO GDocument (ID, DocName, RefType, DocNo, IDGRCompany, IDPartner, DocDate, TotalAmount)"
        " VALUES (1000, 'SDInvoice', 'SDInvoice', 7, 10, 11, 39877, 12.5),"
        "        (1001, 'SDInvoice', 'SDInvoice', 8, 0, 0, 39878, 0);");
  }
  void TearDown() override {
    conn.reset();
    std::filesystem::remove(path_);
  }
  std::string path() const { return path_.string(); }

  Ref<HostConnection> conn;
  std::filesystem::path path_;
};

}  // namespace xal::host::testing
