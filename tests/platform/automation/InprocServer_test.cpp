// Registration, creation by ProgID and the failures of both, through a real server
// library loaded the way a host loads one.

#include <gtest/gtest.h>

#include <functional>
#include <optional>

#include "platform/automation/TestSandbox.h"
#include "platform/automation/ClassRegistry.h"
#include "platform/automation/CreateObject.h"
#include "platform/automation/ServerLoader.h"
#include "platform/registry/Registry.h"
#include "platform/vb/Error.h"
#include "platform/vb/Variant.h"

namespace {

using vb::Variant;

constexpr const char* kEchoClsid = "{73D8261D-CE0E-47C9-BC73-A4ED1278D484}";
constexpr const char* kTestLibId = "{2BC0B2AD-90D6-4DD3-AE63-88EFD3A942D9}";

// Reads a value straight from the store, apart from the class registry's own readers.
std::optional<std::string> ReadValue(const std::string& path, const std::string& name = "") {
  registry::HKEY key = 0;
  if (registry::RegOpenKeyEx(registry::HKEY_CLASSES_ROOT, path, 0, registry::KEY_READ, &key) !=
      registry::ERROR_SUCCESS) {
    return std::nullopt;
  }
  char data[1024];
  uint32_t size = sizeof data;
  uint32_t type = 0;
  long rc = registry::RegQueryValueEx(key, name, &type, data, &size);
  registry::RegCloseKey(key);
  if (rc != registry::ERROR_SUCCESS || size == 0) return std::nullopt;
  return std::string(data, size - 1);
}

// The description of the 429 that creating the ProgID raises; fails the test otherwise.
std::string CreationFailure(const std::string& progId) {
  try {
    automation::CreateObject(progId);
  } catch (const vb::Error& e) {
    EXPECT_EQ(e.Number(), vb::kErrCannotCreateObject) << e.Description();
    EXPECT_EQ(e.Description().rfind("ActiveX component can't create object: ", 0), 0u)
        << e.Description();
    return e.Description();
  }
  ADD_FAILURE() << progId << " was created";
  return {};
}

class InprocServerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    path_ = dvtest::LibraryPath("libdvtest_server.so");
    server_ = &automation::LoadInprocServer(path_);
  }
  void Register() { ASSERT_EQ(server_->registerServer(), automation::S_OK); }

  dvtest::Sandbox sandbox_;
  std::string path_;
  const automation::LoadedServer* server_ = nullptr;
};

TEST_F(InprocServerTest, RegistrationWritesWhatWindowsSelfRegistrationWrites) {
  Register();
  EXPECT_EQ(ReadValue("DvTest.Echo\\CLSID"), kEchoClsid);
  EXPECT_EQ(ReadValue(std::string("CLSID\\") + kEchoClsid), "Echo");
  EXPECT_EQ(ReadValue(std::string("CLSID\\") + kEchoClsid + "\\InprocServer32"), path_);
  EXPECT_EQ(ReadValue(std::string("CLSID\\") + kEchoClsid + "\\InprocServer32",
                      "ThreadingModel"),
            "Apartment");
  EXPECT_EQ(ReadValue(std::string("CLSID\\") + kEchoClsid + "\\ProgID"), "DvTest.Echo");
  EXPECT_EQ(ReadValue(std::string("CLSID\\") + kEchoClsid + "\\TypeLib"), kTestLibId);
  EXPECT_EQ(ReadValue(std::string("TypeLib\\") + kTestLibId + "\\1.0"), "DvTest");
  ASSERT_EQ(path_.front(), '/');

  std::vector<automation::ClassEntry> served = automation::ClassesServedBy(path_);
  ASSERT_EQ(served.size(), 3u);
}

TEST_F(InprocServerTest, CreatedObjectAnswersByNameAndCountsAsAlive) {
  Register();
  ASSERT_EQ(server_->canUnloadNow(), automation::S_OK);
  {
    vb::ObjectPtr echo = automation::CreateObject("DvTest.Echo");
    EXPECT_EQ(echo->Call("ECHO", {Variant("olá")}), Variant("olá"));
    std::vector<Variant> args{Variant(21)};
    echo->Invoke("twice", args);
    EXPECT_EQ(args[0], Variant(42));
    EXPECT_EQ(server_->canUnloadNow(), automation::S_FALSE);
  }
  EXPECT_EQ(server_->canUnloadNow(), automation::S_OK);
  // Loaded once: the same server however its path is spelled.
  EXPECT_EQ(&automation::LoadInprocServer(dvtest::LibDirectory() + "/./libdvtest_server.so"),
            server_);
}

TEST_F(InprocServerTest, UnregisteredClassCannotBeCreated) {
  Register();
  ASSERT_EQ(server_->unregisterServer(), automation::S_OK);
  EXPECT_NE(CreationFailure("DvTest.Echo").find("not registered"), std::string::npos);
  EXPECT_FALSE(ReadValue(std::string("CLSID\\") + kEchoClsid).has_value());
  EXPECT_FALSE(ReadValue(std::string("TypeLib\\") + kTestLibId + "\\1.0").has_value());
}

TEST_F(InprocServerTest, UnregisteringLeavesAProgIdThatAnotherServerTookOver) {
  Register();
  const std::string other = "{11111111-2222-3333-4444-555555555555}";
  automation::RegisterClass({"Echo", "DvTest.Echo", other}, {}, "/opt/other/libecho.so");
  ASSERT_EQ(server_->unregisterServer(), automation::S_OK);
  EXPECT_EQ(ReadValue("DvTest.Echo\\CLSID"), other);
  EXPECT_EQ(ReadValue("CLSID\\" + other + "\\InprocServer32"), "/opt/other/libecho.so");
}

TEST_F(InprocServerTest, EveryStepOfCreationFailsWithA429ThatSaysWhy) {
  Register();
  EXPECT_NE(CreationFailure("Nowhere.General").find("not registered"), std::string::npos);
  // A ProgID is no path into the store.
  EXPECT_NE(CreationFailure("CLSID\\" + std::string(kEchoClsid)).find("is no ProgID"),
            std::string::npos);

  automation::RegisterClass({"Gone", "DvTest.Gone", "{22222222-2222-3333-4444-555555555555}"},
                            {}, sandbox_.Directory() + "/libgone.so");
  EXPECT_NE(CreationFailure("DvTest.Gone").find("libgone.so"), std::string::npos);

  automation::RegisterClass({"NotAServer", "DvTest.NotAServer",
                             "{33333333-2222-3333-4444-555555555555}"},
                            {}, dvtest::LibraryPath("libdv_vb.so"));
  EXPECT_NE(CreationFailure("DvTest.NotAServer").find("DllGetClassObject"), std::string::npos);

  automation::RegisterClass({"Ghost", "DvTest.Ghost", "{44444444-2222-3333-4444-555555555555}"},
                            {}, path_);
  EXPECT_NE(CreationFailure("DvTest.Ghost").find("class not available"), std::string::npos);

  EXPECT_NE(CreationFailure("DvTest.Unmakeable").find("no licence for this class"),
            std::string::npos);
}

TEST(ClassRegistry, NamesThatCouldAddressOtherKeysAreRefused) {
  dvtest::Sandbox sandbox;
  EXPECT_TRUE(automation::IsValidProgID("POC_Dorvantos.GeneralDetails"));
  EXPECT_FALSE(automation::IsValidProgID(""));
  EXPECT_FALSE(automation::IsValidProgID("A\\B"));
  EXPECT_FALSE(automation::IsValidProgID("1Class"));
  EXPECT_FALSE(automation::IsValidProgID(std::string(40, 'a')));
  EXPECT_TRUE(automation::IsValidGuid(kEchoClsid));
  EXPECT_FALSE(automation::IsValidGuid("{73D8261D-CE0E-47C9-BC73-A4ED1278D48}"));
  EXPECT_FALSE(automation::IsValidGuid("{73D8261D\\CE0E-47C9-BC73-A4ED1278D484}"));
  EXPECT_TRUE(automation::SameGuid(kEchoClsid, "{73d8261d-ce0e-47c9-bc73-a4ed1278d484}"));

  EXPECT_THROW(automation::RegisterClass({"X", "..\\X", kEchoClsid}, {}, "/x.so"),
               automation::RegistrationError);
  EXPECT_THROW(automation::RegisterClass({"X", "Test.X", "CLSID\\X"}, {}, "/x.so"),
               automation::RegistrationError);
  // A CLSID read back from the store is checked as well before it becomes a path.
  registry::HKEY key = 0;
  ASSERT_EQ(registry::RegCreateKeyEx(registry::HKEY_CLASSES_ROOT, "Bad.Class\\CLSID", &key),
            registry::ERROR_SUCCESS);
  const char bad[] = "..\\..\\HKEY_LOCAL_MACHINE";
  registry::RegSetValueEx(key, "", registry::REG_SZ, bad, sizeof bad);
  registry::RegCloseKey(key);
  EXPECT_FALSE(automation::CLSIDFromProgID("Bad.Class").has_value());
}

}  // namespace
