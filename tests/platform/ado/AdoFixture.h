#pragma once
// A fresh demo database per test, with one login, and a connection opened on it: a file
// in a temporary folder, or a database on the PostgreSQL server under test.

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <optional>
#include <string>

#include "platform/ado/Connection.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"
#include "support/TestLedger.h"

namespace ado::testing {

inline constexpr const char* kUser = "contabilista";
inline constexpr const char* kPassword = "s3gr3d0;Data Source=x";

class DemoDatabase : public ::testing::Test {
 protected:
  void SetUp() override {
    dir_ = std::filesystem::temp_directory_path() /
           ("dv-ado-" + std::to_string(::getpid()) + "-" +
            ::testing::UnitTest::GetInstance()->current_test_info()->name());
    std::filesystem::remove_all(dir_);
    std::filesystem::create_directories(dir_);
    CreateOptions options;
    options.passwordIterations = 1000;  // fast in tests; the stored count is per login
    ledger_.emplace(dir_.string(), std::vector<Login>{{kUser, kPassword}}, options);
    path_ = ledger_->Path();
    conn_ = Connection::Create();
    conn_->Open(ConnectionString(kUser, kPassword));
  }

  void TearDown() override {
    conn_.reset();
    ledger_.reset();
    std::filesystem::remove_all(dir_);
  }

  std::string ConnectionString(const std::string& user, const std::string& password) const {
    return ledger_->ConnectionString(user, password);
  }

  // The single value of a one-row query.
  vb::Variant Scalar(const std::string& sql) {
    auto rs = conn_->Execute(sql);
    EXPECT_FALSE(rs->Eof()) << sql;
    return rs->Fields(0).Value();
  }

  RecordsetPtr Query(const std::string& sql) {
    auto rs = Recordset::Create();
    rs->Open(sql, conn_);
    return rs;
  }

  std::filesystem::path dir_;
  std::optional<dvtest::TestLedger> ledger_;
  std::string path_;  // the embedded database's file; empty on a server
  ConnectionPtr conn_;
};

}  // namespace ado::testing
