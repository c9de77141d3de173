#include <gtest/gtest.h>

#include <optional>

#include "platform/automation/TestSandbox.h"
#include "platform/automation/ClassRegistry.h"
#include "platform/automation/CreateObject.h"
#include "platform/automation/ServerLoader.h"
#include "platform/vb/Error.h"
#include "platform/vb/Variant.h"

namespace {

using vb::Variant;

int32_t ErrorNumberOf(const std::function<void()>& action) {
  try {
    action();
  } catch (const vb::Error& e) {
    return e.Number();
  }
  return 0;
}

class ComponentServerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    path_ = dvtest::LibraryPath("libpoc_dorvantos.so");
    server_ = &automation::LoadInprocServer(path_);
    ASSERT_EQ(server_->registerServer(), automation::S_OK);
  }

  dvtest::Sandbox sandbox_;
  std::string path_;
  const automation::LoadedServer* server_ = nullptr;
};

TEST_F(ComponentServerTest, RegistersBothClassesAndTheTypeLibrary) {
  std::optional<std::string> general = automation::CLSIDFromProgID("POC_Dorvantos.General");
  std::optional<std::string> details = automation::CLSIDFromProgID("POC_Dorvantos.GeneralDetails");
  ASSERT_TRUE(general && details);
  EXPECT_NE(*general, *details);
  EXPECT_EQ(automation::InprocServerOf(*general), path_);
  EXPECT_EQ(automation::InprocServerOf(*details), path_);

  std::vector<automation::ClassEntry> served = automation::ClassesServedBy(path_);
  ASSERT_EQ(served.size(), 2u);
  for (const auto& entry : served) {
    EXPECT_EQ(entry.progId, "POC_Dorvantos." + entry.className);
  }
}

TEST_F(ComponentServerTest, ClassesAnswerByNameBeforeAnyLogin) {
  for (const char* progId : {"POC_Dorvantos.General", "POC_Dorvantos.GeneralDetails"}) {
    SCOPED_TRACE(progId);
    vb::ObjectPtr object = automation::CreateObject(progId);
    EXPECT_EQ(server_->canUnloadNow(), automation::S_FALSE);

    // No login is in place yet, so none succeeds; nothing is reported either.
    std::vector<Variant> login{Variant("ana"), Variant("encoded")};
    EXPECT_EQ(object->Invoke("login", login), Variant(false));
    EXPECT_EQ(login[0], Variant("ana"));
    EXPECT_EQ(object->Call("LOGIN"), Variant(false));

    // Before a login they return at once, whatever they are given.
    EXPECT_EQ(object->Call("NovoRegisto", {Variant("tbPOC_Dorvantos"), Variant(12)}), Variant());
    EXPECT_EQ(object->Call("Registo", {vb::Nothing(), Variant(7), Variant(""), Variant(""),
                                       vb::Nothing()}),
              Variant());
    EXPECT_TRUE(sandbox_.ErrorLogLines().empty());

    // The argument lists are the interface's own.
    EXPECT_EQ(ErrorNumberOf([&] { object->Call("NovoRegisto"); }), 449);
    EXPECT_EQ(ErrorNumberOf([&] { object->Call("Registo"); }), 449);
    EXPECT_EQ(ErrorNumberOf([&] { object->Call("Login", {Variant(""), Variant(""), Variant("")}); }),
              450);
    EXPECT_EQ(ErrorNumberOf([&] { object->Call("NovoRegisto", {Variant(""), Variant(), Variant(),
                                                                Variant(5)}); }),
              vb::kErrTypeMismatch);  // Caller must be an object
    EXPECT_EQ(ErrorNumberOf([&] { object->Call("DoInsert"); }), 438);
  }
  EXPECT_EQ(server_->canUnloadNow(), automation::S_OK);
}

TEST_F(ComponentServerTest, AfterUnregisteringTheClassesCannotBeCreated) {
  ASSERT_EQ(server_->unregisterServer(), automation::S_OK);
  for (const char* progId : {"POC_Dorvantos.General", "POC_Dorvantos.GeneralDetails"}) {
    try {
      automation::CreateObject(progId);
      ADD_FAILURE() << progId << " was created";
    } catch (const vb::Error& e) {
      EXPECT_EQ(e.Number(), 429);
      EXPECT_NE(e.Description().find(progId), std::string::npos) << e.Description();
    }
  }
  EXPECT_TRUE(automation::ClassesServedBy(path_).empty());
}

}  // namespace
