#pragma once
// A private folder with its own store file for one test; the process's default store
// points at it while the test runs.

#include <gtest/gtest.h>

#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

#include "platform/registry/Store.h"

namespace registry::testing {

class TempStoreTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (std::filesystem::temp_directory_path() / "dv-registry-XXXXXX").string();
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    folder_ = pattern;
    file_ = (folder_ / "registry.reg").string();
    Store::SetDefaultPath(file_);
  }

  void TearDown() override {
    Store::SetDefaultPath("");
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
  }

  static std::string ReadBytes(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
  }

  static void WriteBytes(const std::string& path, const std::string& bytes) {
    std::ofstream(path, std::ios::binary | std::ios::trunc) << bytes;
  }

  std::filesystem::path folder_;
  std::string file_;
};

}  // namespace registry::testing
