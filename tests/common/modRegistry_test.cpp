// Reading and writing settings through the registry module, against a store of its own.

#include <gtest/gtest.h>

#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <iterator>

#include "common/modRegistry.h"
#include "platform/forms/ScriptedDesktop.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"

namespace common {
namespace {

const std::string kPoc = "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC";

class ModRegistryTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = (std::filesystem::temp_directory_path() / "dv-modregistry-XXXXXX").string();
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    folder_ = pattern;
    file_ = (folder_ / "registry.reg").string();
    registry::Store::SetDefaultPath(file_);
    previous_ = forms::Desktop::Installed();
    desktop_ = std::make_shared<forms::ScriptedDesktop>();
    forms::Desktop::Install(desktop_);
  }

  void TearDown() override {
    forms::Desktop::Install(previous_);
    registry::Store::SetDefaultPath("");
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
  }

  // What setup tools do: create the key, then store raw values.
  void Store(const std::string& path, const std::string& name, const std::string& data,
             uint32_t type = registry::REG_SZ) {
    registry::Store::Default().Update(
        [&](registry::Hive& hive) { hive.Create(path).Set(name, {type, data}); });
  }

  std::string StoreBytes() const {
    return std::filesystem::exists(file_) ? registry::WriteRegText(registry::Store(file_).Read()) : "";
  }

  std::filesystem::path folder_;
  std::string file_;
  std::shared_ptr<forms::Desktop> previous_;
  std::shared_ptr<forms::ScriptedDesktop> desktop_;
};

vb::Variant Text(const char* text) { return vb::Variant(text); }

TEST_F(ModRegistryTest, RootNamesAreExactAndAPathSplitsAtItsFirstBackslash) {
  EXPECT_EQ(ObterHandleChavePrincipal("HKEY_LOCAL_MACHINE"), 0x80000002u);
  EXPECT_EQ(ObterHandleChavePrincipal("HKEY_DYN_DATA"), 0x80000006u);
  EXPECT_EQ(ObterHandleChavePrincipal("hkey_local_machine"), 0u);  // case matters
  EXPECT_EQ(ObterHandleChavePrincipal("HKLM"), 0u);

  std::string path = kPoc;
  registry::HKEY root = 0;
  FormatarChave(path, root);
  EXPECT_EQ(root, registry::HKEY_LOCAL_MACHINE);
  EXPECT_EQ(path, "SOFTWARE\\Quorvex\\POC");
  EXPECT_EQ(RegistryLastResult(), 19);  // where the first "\" was

  path = "HKEY_CURRENT_USER";
  FormatarChave(path, root);
  EXPECT_EQ(root, registry::HKEY_CURRENT_USER);
  EXPECT_EQ(path, "");
  EXPECT_TRUE(desktop_->messages.empty());

  // A path without "\" addresses the root key itself.
  Store("HKEY_CURRENT_USER", "AtRoot", "sim");
  EXPECT_EQ(ObterValorString("HKEY_CURRENT_USER", "AtRoot"), Text("sim"));
}

TEST_F(ModRegistryTest, MalformedPathsAreShownAndDoNothing) {
  for (const std::string bad : {"SOFTWARE\\Quorvex\\POC", "HKEY_LOCAL_MACHINE\\SOFTWARE\\", "hkey_local_machine\\X", ""}) {
    std::string path = bad;
    registry::HKEY root = 123;
    FormatarChave(path, root);
    EXPECT_EQ(root, 0u);
    EXPECT_EQ(path, bad);
  }
  ASSERT_EQ(desktop_->messages.size(), 4u);
  const forms::MessageBox& box = desktop_->messages[0];
  EXPECT_EQ(box.text, "Formato Incorrecto:\n\nSOFTWARE\\Quorvex\\POC");
  EXPECT_EQ(box.title, forms::ApplicationTitle());
  EXPECT_EQ(box.Buttons(), forms::MsgButtons::OK);
  EXPECT_EQ(box.Icon(), forms::MsgIcon::None);

  EXPECT_TRUE(ValorString("SOFTWARE\\Quorvex\\POC", "dtUser").IsEmpty());
  EXPECT_FALSE(DefinirValorString("HKEY_LOCAL_MACHINE\\SOFTWARE\\", "dtUser", "sa"));
  EXPECT_EQ(desktop_->messages.size(), 6u);
  EXPECT_FALSE(std::filesystem::exists(file_));
}

TEST_F(ModRegistryTest, MissingThingsReadAsNullAndUnknownRootsAsEmpty) {
  EXPECT_TRUE(ValorString(kPoc, "dtUser").IsNull());
  EXPECT_EQ(RegistryLastResult(), registry::ERROR_FILE_NOT_FOUND);
  Store(kPoc, "dtUser", "sa");
  EXPECT_TRUE(ObterValorString(kPoc, "dtPassword").IsNull());
  EXPECT_TRUE(ObterValorString("HKEY_NOWHERE\\SOFTWARE\\Quorvex\\POC", "dtUser").IsEmpty());
  EXPECT_TRUE(desktop_->messages.empty());  // an unknown root is not a malformed path

  // Value names ignore letter case, as on Windows.
  EXPECT_EQ(ObterValorString(kPoc, "DTUSER"), Text("sa"));
  EXPECT_EQ(RegistryLastResult(), 0);
}

TEST_F(ModRegistryTest, LeadingBlanksGoTrailingStayAndAnEmptyValueIsEmptyText) {
  Store(kPoc, "dtDataSource", "   SERVIDOR  ");
  Store(kPoc, "Blank", "    ");
  Store(kPoc, "Nothing", "");
  Store(kPoc, "Accents", " Contabilidade Geral – Ação");
  EXPECT_EQ(ObterValorString(kPoc, "dtDataSource"), Text("SERVIDOR  "));
  EXPECT_EQ(ObterValorString(kPoc, "Blank"), Text(""));
  EXPECT_EQ(ObterValorString(kPoc, "Nothing"), Text(""));
  EXPECT_EQ(ObterValorString(kPoc, "Accents"), Text("Contabilidade Geral – Ação"));
  // A value of no bytes at all (not text) gives "" too, not an error.
  Store(kPoc, "NoBytes", "", registry::REG_BINARY);
  EXPECT_EQ(ObterValorString(kPoc, "NoBytes"), Text(""));
}

TEST_F(ModRegistryTest, ValuesMustFitTheBuffer) {
  Store(kPoc, "Fits", std::string(kRegistryBufferSize - 1, 'a'));
  Store(kPoc, "TooLong", std::string(kRegistryBufferSize, 'b'));
  vb::Variant fits = ObterValorString(kPoc, "Fits");
  ASSERT_TRUE(fits.IsString());
  EXPECT_EQ(fits.AsString().size(), kRegistryBufferSize - 1);
  EXPECT_TRUE(ObterValorString(kPoc, "TooLong").IsNull());
  EXPECT_EQ(RegistryLastResult(), registry::ERROR_MORE_DATA);
}

TEST_F(ModRegistryTest, RedirectionsAreFollowedAndAlwaysEnd) {
  const std::string shared = "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\Shared";
  Store(kPoc, "dtDataSource", "SREF=" + shared);
  Store(shared, "dtDataSource", "SREF=HKEY_CURRENT_USER\\Servidor");
  Store("HKEY_CURRENT_USER\\Servidor", "dtDataSource", "  SQL01");
  EXPECT_EQ(ObterValorString(kPoc, "dtDataSource"), Text("SQL01"));
  EXPECT_EQ(ValorString(kPoc, "dtDataSource"), vb::Variant("SREF=" + shared));

  // The same value name is read at the end of the chain; missing there gives Null.
  Store(kPoc, "dtUser", "SREF=" + shared);
  EXPECT_TRUE(ObterValorString(kPoc, "dtUser").IsNull());
  Store(kPoc, "dtCatalog", "SREF=HKEY_NOWHERE\\X");
  EXPECT_TRUE(ObterValorString(kPoc, "dtCatalog").IsEmpty());
  // "SREF=" is case-sensitive: anything else is an ordinary value.
  Store(kPoc, "Lower", "sref=" + shared);
  EXPECT_EQ(ObterValorString(kPoc, "Lower"), vb::Variant("sref=" + shared));

  // A cycle, and a key redirecting to itself, end as Null.
  Store(kPoc, "Cycle", "SREF=" + shared);
  Store(shared, "Cycle", "SREF=" + kPoc);
  EXPECT_TRUE(ObterValorString(kPoc, "Cycle").IsNull());
  Store(kPoc, "Self", "SREF=" + kPoc);
  EXPECT_TRUE(ObterValorString(kPoc, "Self").IsNull());
}

TEST_F(ModRegistryTest, WritingNeedsAnExistingKey) {
  EXPECT_FALSE(DefinirValorString(kPoc, "LastData", "01-02-2024"));
  EXPECT_EQ(RegistryLastResult(), registry::ERROR_FILE_NOT_FOUND);
  EXPECT_FALSE(std::filesystem::exists(file_));
  EXPECT_FALSE(DefinirValorString("HKEY_NOWHERE\\X", "LastData", "01-02-2024"));

  Store("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex", "Other", "1");
  const std::string before = StoreBytes();
  EXPECT_FALSE(DefinirValorString(kPoc, "LastData", "01-02-2024"));
  EXPECT_EQ(StoreBytes(), before);  // the missing key was not created

  Store(kPoc, "dtUser", "sa");
  EXPECT_TRUE(DefinirValorString(kPoc, "LastDiario_ID", "7"));
  EXPECT_TRUE(DefinirValorString(kPoc, "dtuser", "Contabilista \"Ção\" \\ fim"));
  EXPECT_EQ(ObterValorString(kPoc, "dtUser"), Text("Contabilista \"Ção\" \\ fim"));
  EXPECT_EQ(ObterValorString(kPoc, "LastDiario_ID"), Text("7"));
}

TEST_F(ModRegistryTest, ABrokenStoreReadsAsNullAndWritesFail) {
  std::filesystem::create_directories(folder_);
  { std::ofstream(file_) << "not a registry file\n"; }
  EXPECT_TRUE(ObterValorString(kPoc, "dtUser").IsNull());
  EXPECT_EQ(RegistryLastResult(), registry::ERROR_BADDB);
  EXPECT_FALSE(DefinirValorString(kPoc, "dtUser", "sa"));
  std::ifstream in(file_);
  EXPECT_EQ(std::string(std::istreambuf_iterator<char>(in), {}), "not a registry file\n");
}

}  // namespace
}  // namespace common
