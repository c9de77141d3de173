#pragma once
// A fresh demo database in a temporary folder per test, with one login, and a
// connection opened on it.

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <string>

#include "platform/ado/Connection.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"

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
    path_ = (dir_ / "demo.db").string();
    CreateOptions options;
    options.passwordIterations = 1000;  // fast in tests; the stored count is per login
    CreateDatabase(path_, {{kUser, kPassword}}, options);
    conn_ = Connection::Create();
    conn_->Open(EmbeddedConnectionString(path_, kUser, kPassword));
  }

  void TearDown() override {
    conn_.reset();
    std::filesystem::remove_all(dir_);
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
  std::string path_;
  ConnectionPtr conn_;
};

}  // namespace ado::testing
