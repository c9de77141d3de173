// The Win32-like calls over the store: handles, the buffer rules of RegQueryValueEx,
// and keys that exist only when someone created them.

#include <gtest/gtest.h>

#include <cstring>

#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"
#include "TempStore.h"

namespace registry {
namespace {

class RegistryTest : public testing::TempStoreTest {
 protected:
  HKEY Create(const std::string& subKey, HKEY root = HKEY_LOCAL_MACHINE) {
    HKEY key = 0;
    EXPECT_EQ(RegCreateKeyEx(root, subKey, &key), ERROR_SUCCESS);
    return key;
  }
  static long SetText(HKEY key, const std::string& name, const std::string& text) {
    return RegSetValueEx(key, name, REG_SZ, text.c_str(), static_cast<uint32_t>(text.size() + 1));
  }
};

TEST_F(RegistryTest, OpeningAMissingKeyFailsAndCreatesNothing) {
  HKEY key = 123;
  EXPECT_EQ(RegOpenKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\Quorvex\\POC", 0, KEY_READ, &key),
            ERROR_FILE_NOT_FOUND);
  EXPECT_EQ(key, 0u);
  EXPECT_FALSE(std::filesystem::exists(file_));
  EXPECT_EQ(RegOpenKeyEx(0x1234, "x", 0, KEY_READ, &key), ERROR_INVALID_HANDLE);
  EXPECT_EQ(RegOpenKeyEx(HKEY_LOCAL_MACHINE, "\\SOFTWARE", 0, KEY_READ, &key), ERROR_FILE_NOT_FOUND);

  // Root keys are always there, with or without a subkey path.
  ASSERT_EQ(RegOpenKeyEx(HKEY_CURRENT_USER, "", 0, KEY_READ, &key), ERROR_SUCCESS);
  EXPECT_EQ(RegCloseKey(key), ERROR_SUCCESS);
  EXPECT_EQ(RegCloseKey(key), ERROR_INVALID_HANDLE);
  EXPECT_FALSE(std::filesystem::exists(file_));
}

TEST_F(RegistryTest, CreatedKeysOpenIgnoringLetterCaseWithTheirAncestors) {
  HKEY created = Create("SOFTWARE\\Quorvex\\POC");
  ASSERT_EQ(SetText(created, "dtUser", "sa"), ERROR_SUCCESS);
  ASSERT_EQ(RegCloseKey(created), ERROR_SUCCESS);

  HKEY parent = 0, key = 0;
  ASSERT_EQ(RegOpenKeyEx(HKEY_LOCAL_MACHINE, "software\\QUORVEX", 0, KEY_READ, &parent), ERROR_SUCCESS);
  ASSERT_EQ(RegOpenKeyEx(parent, "poc", 0, KEY_READ, &key), ERROR_SUCCESS);
  char data[16];
  uint32_t size = sizeof data, type = 0;
  ASSERT_EQ(RegQueryValueEx(key, "DTUSER", &type, data, &size), ERROR_SUCCESS);
  EXPECT_EQ(type, REG_SZ);
  EXPECT_EQ(size, 3u);
  EXPECT_EQ(std::string(data, size), std::string("sa\0", 3));  // with its terminating zero

  std::string name;
  EXPECT_EQ(RegEnumKey(parent, 0, &name), ERROR_SUCCESS);
  EXPECT_EQ(name, "POC");
  EXPECT_EQ(RegEnumKey(parent, 1, &name), ERROR_NO_MORE_ITEMS);
  EXPECT_EQ(RegEnumValue(key, 0, &name, &type), ERROR_SUCCESS);
  EXPECT_EQ(name, "dtUser");
  EXPECT_EQ(RegEnumValue(key, 1, &name, &type), ERROR_NO_MORE_ITEMS);
  RegCloseKey(key);
  RegCloseKey(parent);
}

TEST_F(RegistryTest, QueryFollowsTheBufferSizeRules) {
  HKEY key = Create("SOFTWARE\\Quorvex\\POC");
  const std::string fits(3499, 'x'), tooLong(3500, 'y');
  ASSERT_EQ(SetText(key, "Fits", fits), ERROR_SUCCESS);
  ASSERT_EQ(SetText(key, "TooLong", tooLong), ERROR_SUCCESS);
  ASSERT_EQ(RegSetValueEx(key, "Number", REG_DWORD, "\x07\0\0\0", 4), ERROR_SUCCESS);

  std::vector<char> buffer(3500, ' ');
  uint32_t size = 3500;
  EXPECT_EQ(RegQueryValueEx(key, "Fits", nullptr, buffer.data(), &size), ERROR_SUCCESS);
  EXPECT_EQ(size, 3500u);
  EXPECT_EQ(buffer[3499], '\0');
  size = 3500;
  EXPECT_EQ(RegQueryValueEx(key, "TooLong", nullptr, buffer.data(), &size), ERROR_MORE_DATA);
  EXPECT_EQ(size, 3501u);  // what it would take
  EXPECT_EQ(buffer[0], 'x');  // and nothing was copied

  size = 0;
  EXPECT_EQ(RegQueryValueEx(key, "TooLong", nullptr, nullptr, &size), ERROR_SUCCESS);
  EXPECT_EQ(size, 3501u);
  uint32_t type = 0;
  size = 3500;
  EXPECT_EQ(RegQueryValueEx(key, "Number", &type, buffer.data(), &size), ERROR_SUCCESS);
  EXPECT_EQ(type, REG_DWORD);
  EXPECT_EQ(size, 4u);  // no terminating zero for data that is not text
  EXPECT_EQ(RegQueryValueEx(key, "Missing", nullptr, buffer.data(), &size), ERROR_FILE_NOT_FOUND);
  EXPECT_EQ(RegQueryValueEx(key, "Fits", nullptr, buffer.data(), nullptr), ERROR_INVALID_PARAMETER);
  RegCloseKey(key);
}

TEST_F(RegistryTest, AccessAndNamesAreChecked) {
  RegCloseKey(Create("SOFTWARE\\Quorvex\\POC"));
  HKEY reader = 0, writer = 0;
  ASSERT_EQ(RegOpenKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\Quorvex\\POC", 0, KEY_READ, &reader), ERROR_SUCCESS);
  ASSERT_EQ(RegOpenKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\Quorvex\\POC", 0, KEY_WRITE, &writer), ERROR_SUCCESS);
  EXPECT_EQ(SetText(reader, "v", "1"), ERROR_ACCESS_DENIED);
  EXPECT_EQ(RegQueryValueEx(writer, "v", nullptr, nullptr, nullptr), ERROR_ACCESS_DENIED);
  // A value name the one-line text form cannot hold is refused, not stored broken.
  EXPECT_EQ(SetText(writer, "two\nlines", "1"), ERROR_INVALID_PARAMETER);
  HKEY bad = 0;
  EXPECT_EQ(RegCreateKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\\\Empty", &bad), ERROR_INVALID_PARAMETER);
  EXPECT_EQ(RegCreateKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\Bad\nName", &bad), ERROR_INVALID_PARAMETER);
  RegCloseKey(reader);
  RegCloseKey(writer);
}

TEST_F(RegistryTest, DeletingValuesAndTrees) {
  HKEY key = Create("SOFTWARE\\Quorvex\\POC\\Sub");
  HKEY poc = Create("SOFTWARE\\Quorvex\\POC");
  ASSERT_EQ(SetText(poc, "v", "1"), ERROR_SUCCESS);
  EXPECT_EQ(RegDeleteValue(poc, "V"), ERROR_SUCCESS);
  EXPECT_EQ(RegDeleteValue(poc, "v"), ERROR_FILE_NOT_FOUND);

  ASSERT_EQ(SetText(poc, "w", "1"), ERROR_SUCCESS);
  EXPECT_EQ(RegDeleteTree(poc, ""), ERROR_SUCCESS);  // empties the key, keeps it
  EXPECT_EQ(RegQueryValueEx(poc, "w", nullptr, nullptr, nullptr), ERROR_FILE_NOT_FOUND);
  EXPECT_EQ(SetText(key, "x", "1"), ERROR_KEY_DELETED);  // Sub went with it

  EXPECT_EQ(RegDeleteTree(HKEY_LOCAL_MACHINE, "SOFTWARE\\Quorvex"), ERROR_SUCCESS);
  EXPECT_EQ(RegDeleteTree(HKEY_LOCAL_MACHINE, "SOFTWARE\\Quorvex"), ERROR_FILE_NOT_FOUND);
  EXPECT_EQ(SetText(poc, "w", "1"), ERROR_KEY_DELETED);  // never recreated by a write
  HKEY probe = 0;
  EXPECT_EQ(RegOpenKeyEx(HKEY_LOCAL_MACHINE, "SOFTWARE\\Quorvex\\POC", 0, KEY_READ, &probe),
            ERROR_FILE_NOT_FOUND);
  RegCloseKey(key);
  RegCloseKey(poc);
}

TEST_F(RegistryTest, ValuesOnARootKey) {
  ASSERT_EQ(SetText(HKEY_CURRENT_USER, "AtRoot", "yes"), ERROR_SUCCESS);
  char data[8];
  uint32_t size = sizeof data;
  EXPECT_EQ(RegQueryValueEx(HKEY_CURRENT_USER, "atroot", nullptr, data, &size), ERROR_SUCCESS);
  EXPECT_STREQ(data, "yes");
}

}  // namespace
}  // namespace registry
