// The store file: private, atomic, shared between processes, and never damaged by a
// fault, whether in the file, in a change or in the text being imported.

#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>

#include "platform/registry/RegText.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"
#include "TempStore.h"

namespace registry {
namespace {

using testing::TempStoreTest;

const std::string kPoc = "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC";

void SetString(Store& store, const std::string& path, const std::string& name, const std::string& data) {
  store.Update([&](Hive& hive) { hive.Create(path).Set(name, {REG_SZ, data}); });
}

class StoreTest : public TempStoreTest {};

TEST_F(StoreTest, MissingFileIsEmptyAndTheFirstWriteCreatesItPrivate) {
  std::string nested = (folder_ / "config" / "poc-dorvantos" / "registry.reg").string();
  Store store(nested);
  EXPECT_TRUE(store.Read().keys.empty());
  EXPECT_FALSE(std::filesystem::exists(nested));  // reading creates nothing

  SetString(store, kPoc, "dtUser", "sa");
  struct stat st {};
  ASSERT_EQ(::stat(nested.c_str(), &st), 0);
  EXPECT_EQ(st.st_mode & 0777, 0600u);
  ASSERT_EQ(::stat((folder_ / "config").c_str(), &st), 0);
  EXPECT_EQ(st.st_mode & 0777, 0700u);
  EXPECT_EQ(Store(nested).Read().Find(kPoc)->Find("dtUser")->data, "sa");
}

TEST_F(StoreTest, ReadsSeeEveryWriteOfAnotherStoreObject) {
  // Two objects on one file behave as two processes: each has its own cache.
  Store reader(file_), writer(file_);
  SetString(writer, kPoc, "n", "0");
  ASSERT_EQ(reader.Read().Find(kPoc)->Find("n")->data, "0");
  // Writes in quick succession, of the same size: the cache must not hide any.
  for (int i = 1; i <= 50; ++i) {
    SetString(writer, kPoc, "n", std::to_string(i % 10));
    ASSERT_EQ(reader.Snapshot()->Find(kPoc)->Find("n")->data, std::to_string(i % 10));
  }
  auto before = reader.Snapshot();
  EXPECT_EQ(reader.Snapshot(), before);  // unchanged file: the same parsed content
}

TEST_F(StoreTest, MalformedFileIsReportedByLineAndLeftUntouched) {
  const std::string bad =
      "Windows Registry Editor Version 5.00\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE]\n\"a\"=\"1\"\n\"b\"=\"unterminated\n";
  WriteBytes(file_, bad);
  Store store(file_);
  try {
    store.Read();
    FAIL() << "a malformed file was read";
  } catch (const StoreError& e) {
    EXPECT_NE(std::string(e.what()).find(file_), std::string::npos);
    EXPECT_NE(std::string(e.what()).find("line 5"), std::string::npos) << e.what();
  }
  EXPECT_THROW(SetString(store, kPoc, "x", "y"), StoreError);
  EXPECT_THROW(store.Import("Windows Registry Editor Version 5.00\n[HKEY_CURRENT_USER\\A]\n"), StoreError);

  // Through the registry calls the same fault is ERROR_BADDB, and nothing is written.
  HKEY key = 0;
  EXPECT_EQ(RegOpenKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE", 0, KEY_READ, &key), ERROR_BADDB);
  EXPECT_EQ(RegCreateKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\New", &key), ERROR_BADDB);
  EXPECT_EQ(ReadBytes(file_), bad);
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder_), {}), 2)  // file and lock
      << "a temporary file was left behind";
}

TEST_F(StoreTest, FailedChangeOrImportChangesNothing) {
  Store store(file_);
  SetString(store, kPoc, "dtUser", "sa");
  const std::string before = ReadBytes(file_);

  EXPECT_THROW(store.Update([](Hive& hive) {
    hive.Create("HKEY_CURRENT_USER\\Half").Set("done", {REG_SZ, "no"});
    throw std::runtime_error("change failed half way");
  }), std::runtime_error);
  // The last line is at fault; the first lines must not have been applied either.
  EXPECT_THROW(store.Import("Windows Registry Editor Version 5.00\n[HKEY_CURRENT_USER\\New]\n"
                            "\"v\"=\"1\"\n[-" + kPoc + "]\n\"w\"=bogus\n"),
               StoreError);
  EXPECT_EQ(ReadBytes(file_), before);
  EXPECT_EQ(store.Read().Find(kPoc)->Find("dtUser")->data, "sa");
}

TEST_F(StoreTest, ImportMergesAndExportRoundTrips) {
  Store store(file_);
  SetString(store, kPoc, "dtUser", "sa");
  SetString(store, kPoc, "Old", "gone soon");
  SetString(store, "HKEY_CURRENT_USER\\Stale\\Sub", "v", "1");
  SetString(store, "HKEY_CURRENT_USER\\Kept", "v", "1");
  // As regedit exports it: UTF-16 with its byte-order mark.
  store.Import("\xFF\xFE" + regtext::Utf8ToUtf16Le("Windows Registry Editor Version 5.00\r\n\r\n[" + kPoc +
                                                     "]\r\n\"dtDataSource\"=\"SERVIDOR\\\\SQL\"\r\n"
                                                     "\"Old\"=-\r\n\r\n[-HKEY_CURRENT_USER\\Stale]\r\n"));
  Hive hive = store.Read();
  const Key* poc = hive.Find(kPoc);
  ASSERT_NE(poc, nullptr);
  EXPECT_EQ(poc->Find("dtUser")->data, "sa");
  EXPECT_EQ(poc->Find("dtDataSource")->data, "SERVIDOR\\SQL");
  EXPECT_EQ(poc->Find("Old"), nullptr);
  EXPECT_FALSE(hive.Exists("HKEY_CURRENT_USER\\Stale\\Sub"));
  EXPECT_TRUE(hive.Exists("HKEY_CURRENT_USER\\Kept"));

  Store copy((folder_ / "copy.reg").string());
  copy.Import(store.Export(""));
  EXPECT_EQ(copy.Read(), hive);
  Hive one = ParseRegText(store.Export("hkey_local_machine\\software\\quorvex\\poc"));
  EXPECT_EQ(one.Find(kPoc)->Values(), poc->Values());
  EXPECT_FALSE(one.Exists("HKEY_CURRENT_USER\\Kept"));
  EXPECT_THROW(store.Export(kPoc + "\\Missing"), StoreError);
  EXPECT_THROW(store.Export("HKEY_NOWHERE\\X"), StoreError);
}

TEST_F(StoreTest, TwoProcessesWritingAtOnceLoseNothing) {
  constexpr int kWrites = 60;
  Store(file_).Update([](Hive& hive) { hive.Create(kPoc); });
  pid_t children[2];
  for (int child = 0; child < 2; ++child) {
    children[child] = ::fork();
    ASSERT_GE(children[child], 0);
    if (children[child] == 0) {
      // Through the registry calls, as the component writes.
      HKEY key = 0;
      if (RegOpenKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\Quorvex\\POC", 0, KEY_WRITE, &key) != 0) _exit(3);
      for (int i = 0; i < kWrites; ++i) {
        std::string name = "p" + std::to_string(child) + "_" + std::to_string(i);
        std::string data = std::to_string(i) + "";
        if (RegSetValueEx(key, name, REG_SZ, data.c_str(), static_cast<uint32_t>(data.size() + 1)) != 0) _exit(4);
      }
      _exit(0);
    }
  }
  for (pid_t child : children) {
    int status = 0;
    ASSERT_EQ(::waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    ASSERT_EQ(WEXITSTATUS(status), 0);
  }
  Hive hive = Store(file_).Read();
  const Key* key = hive.Find(kPoc);
  ASSERT_NE(key, nullptr);
  ASSERT_EQ(key->Values().size(), 2u * kWrites);
  for (int child = 0; child < 2; ++child)
    for (int i = 0; i < kWrites; ++i) {
      const Value* value = key->Find("p" + std::to_string(child) + "_" + std::to_string(i));
      ASSERT_NE(value, nullptr) << child << " " << i;
      EXPECT_EQ(value->data, std::to_string(i));
    }
}

TEST_F(StoreTest, DefaultPathFollowsTheOverrideThenTheEnvironment) {
  Store::SetDefaultPath("");
  const char* saved[] = {std::getenv("POC_REGISTRY_FILE"), std::getenv("XDG_CONFIG_HOME")};
  std::string savedFile = saved[0] ? saved[0] : "", savedXdg = saved[1] ? saved[1] : "";

  ::setenv("POC_REGISTRY_FILE", file_.c_str(), 1);
  EXPECT_EQ(Store::DefaultPath(), file_);
  EXPECT_EQ(Store::Default().Path(), file_);
  ::unsetenv("POC_REGISTRY_FILE");
  ::setenv("XDG_CONFIG_HOME", "/somewhere/config", 1);
  EXPECT_EQ(Store::DefaultPath(), "/somewhere/config/poc-dorvantos/registry.reg");
  ::setenv("XDG_CONFIG_HOME", "relative", 1);  // not absolute: ignored, as XDG says
  EXPECT_TRUE(Store::DefaultPath().ends_with("/.config/poc-dorvantos/registry.reg"));
  Store::SetDefaultPath("/elsewhere.reg");
  EXPECT_EQ(Store::Default().Path(), "/elsewhere.reg");

  savedFile.empty() ? ::unsetenv("POC_REGISTRY_FILE") : ::setenv("POC_REGISTRY_FILE", savedFile.c_str(), 1);
  savedXdg.empty() ? ::unsetenv("XDG_CONFIG_HOME") : ::setenv("XDG_CONFIG_HOME", savedXdg.c_str(), 1);
}

}  // namespace
}  // namespace registry
