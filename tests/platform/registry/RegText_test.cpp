// The ".reg" text: what regedit writes must read back, and what we write must read
// back identically, whatever the text holds.

#include <gtest/gtest.h>

#include <random>

#include "platform/registry/RegText.h"
#include "platform/registry/Registry.h"
#include "platform/registry/Store.h"

namespace registry {
namespace {

const std::string kHeader = "Windows Registry Editor Version 5.00\n";

std::string Utf16WithBom(const std::string& utf8) {
  return "\xFF\xFE" + regtext::Utf8ToUtf16Le(utf8);
}

TEST(RegText, RoundTripKeepsAccentsQuotesBackslashesAndEveryType) {
  Hive hive;
  Key& poc = hive.Create("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
  poc.Set("dtDataSource", {REG_SZ, "SERVIDOR\\SQL2000"});
  poc.Set("Descrição", {REG_SZ, "Lançamento \"à\" ordem \\\\ fim  "});
  poc.Set("", {REG_SZ, "padrão"});
  poc.Set("Empty", {REG_SZ, ""});
  poc.Set("Lines", {REG_SZ, "one\r\ntwo"});  // cannot sit between quotes: hex(1)
  poc.Set("Count", {REG_DWORD, std::string("\x2a\x00\x00\x80", 4)});
  poc.Set("Blob", {REG_BINARY, std::string(200, '\xab')});  // wrapped over lines
  poc.Set("Path", {REG_EXPAND_SZ, "%SystemRoot%\\çã"});
  poc.Set("List", {REG_MULTI_SZ, std::string("a\0bé\0", 5)});
  poc.Set("Big", {REG_QWORD, std::string("\1\2\3\4\5\6\7\x8", 8)});
  poc.Set("Odd", {REG_DWORD, "12"});  // a dword of the wrong size is kept as bytes
  hive.Create("HKEY_CURRENT_USER\\Software\\Ação [x]");

  std::string text = WriteRegText(hive);
  EXPECT_TRUE(text.starts_with(kHeader));
  for (size_t start = 0, end; (end = text.find('\n', start)) != std::string::npos; start = end + 1)
    EXPECT_LE(end - start, 80u) << "line too long at " << start;
  EXPECT_NE(text.find("\"Descrição\"=\"Lançamento \\\"à\\\" ordem \\\\\\\\ fim  \""), std::string::npos);
  EXPECT_NE(text.find("\"Count\"=dword:8000002a"), std::string::npos);
  EXPECT_NE(text.find("@=\"padrão\""), std::string::npos);

  Hive back = ParseRegText(text);
  EXPECT_EQ(back, hive);
  EXPECT_EQ(WriteRegText(back), text);
}

TEST(RegText, ReadsWhatRegeditWrites) {
  std::string text = kHeader +
                     "\r\n"
                     "; a comment\r\n"
                     "[hkey_local_machine\\SOFTWARE\\Quorvex\\POC]\r\n"
                     "\"dtUser\"=\"sa\"\r\n"
                     "\"Mask\"=DWORD:0000ffff\r\n"
                     "\"Bin\"=hex:01,02,\\\r\n"
                     "  03\r\n"
                     "\"Exp\"=hex(2):25,00,41,00,25,00,00,00\r\n"
                     "\"Q\"=hex(b):01,00,00,00,00,00,00,00\r\n"
                     "@=\"x\"\r\n";
  Hive hive = ParseRegText(text);
  // The root comes back spelled as Windows spells it, and the ancestors are keys too.
  ASSERT_TRUE(hive.Exists("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex"));
  const Key* key = hive.Find("HKEY_LOCAL_MACHINE\\software\\quorvex\\poc");
  ASSERT_NE(key, nullptr);
  EXPECT_EQ(key->path, "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
  EXPECT_EQ(*key->Find("DTUSER"), (Value{REG_SZ, "sa"}));
  EXPECT_EQ(*key->Find("Mask"), (Value{REG_DWORD, std::string("\xff\xff\0\0", 4)}));
  EXPECT_EQ(*key->Find("Bin"), (Value{REG_BINARY, "\x01\x02\x03"}));
  EXPECT_EQ(*key->Find("Exp"), (Value{REG_EXPAND_SZ, "%A%"}));
  EXPECT_EQ(key->Find("Q")->type, REG_QWORD);
  EXPECT_EQ(*key->Find(""), (Value{REG_SZ, "x"}));
}

TEST(RegText, Utf16ExportsAreAccepted) {
  std::string text = kHeader + "\n[HKEY_CURRENT_USER\\Software\\Contabilidade]\n\"Exercício\"=\"2024 – €\"\n";
  Hive hive = ParseRegText(Utf16WithBom(text));
  const Key* key = hive.Find("HKEY_CURRENT_USER\\Software\\Contabilidade");
  ASSERT_NE(key, nullptr);
  EXPECT_EQ(key->Find("Exercício")->data, "2024 – €");

  std::string bigEndian = "\xFE\xFF";
  std::string little = regtext::Utf8ToUtf16Le(text);
  for (size_t i = 0; i + 1 < little.size(); i += 2) bigEndian += {little[i + 1], little[i]};
  EXPECT_EQ(ParseRegText(bigEndian), hive);
  EXPECT_EQ(ParseRegText("\xEF\xBB\xBF" + text), hive);
}

TEST(RegText, Utf16ConversionsKeepEveryCharacter) {
  std::string text = "aé€𝄞";  // one, two, three and four UTF-8 bytes
  EXPECT_EQ(regtext::Utf16LeToUtf8(regtext::Utf8ToUtf16Le(text)), text);
  // Bytes that are not UTF-8 come across as Latin-1 characters.
  EXPECT_EQ(regtext::Utf16LeToUtf8(regtext::Utf8ToUtf16Le("\xe7")), "ç");
}

TEST(RegText, DeletionsApplyInOrder) {
  Hive hive = ParseRegText(kHeader +
                           "[HKEY_CURRENT_USER\\A\\B]\n\"v\"=\"1\"\n\"w\"=\"2\"\n"
                           "[HKEY_CURRENT_USER\\A\\B\\C]\n"
                           "[HKEY_CURRENT_USER\\AB]\n"
                           "[HKEY_CURRENT_USER\\A\\B]\n\"v\"=-\n"
                           "[-HKEY_CURRENT_USER\\A\\B\\C]\n");
  EXPECT_EQ(hive.Find("HKEY_CURRENT_USER\\A\\B")->Find("v"), nullptr);
  EXPECT_NE(hive.Find("HKEY_CURRENT_USER\\A\\B")->Find("w"), nullptr);
  EXPECT_FALSE(hive.Exists("HKEY_CURRENT_USER\\A\\B\\C"));

  // A key deletion takes the keys below, but not a sibling whose name merely starts alike.
  hive = ParseRegText(kHeader + "[HKEY_CURRENT_USER\\A\\B\\C]\n[HKEY_CURRENT_USER\\AB]\n[-HKEY_CURRENT_USER\\A]\n");
  EXPECT_FALSE(hive.Exists("HKEY_CURRENT_USER\\A\\B"));
  EXPECT_TRUE(hive.Exists("HKEY_CURRENT_USER\\AB"));
}

TEST(RegText, MalformedTextNamesTheLine) {
  struct Case {
    std::string text;
    std::string where;
  };
  const Case cases[] = {
      {"REGEDIT5\n", "line 1:"},
      {kHeader + "\n\"v\"=\"outside\"\n", "line 3:"},
      {kHeader + "[HKEY_NOWHERE\\X]\n", "line 2:"},
      {kHeader + "[HKEY_CURRENT_USER\\A\\\\B]\n", "line 2:"},
      {kHeader + "[HKEY_CURRENT_USER\\A\n", "line 2:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=\"unterminated\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=\"C:\\Temp\"\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=\"x\" trailing\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=dword:123456789\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=hex:01,zz\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=hex(1):41\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=hex:01,\\\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\" \"x\"\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\n\"v\"=str:x\n", "line 3:"},
      {kHeader + "[HKEY_CURRENT_USER\\A]\ngarbage\n", "line 3:"},
      {"\xFF\xFE\x41", "UTF-16"},
  };
  for (const Case& c : cases) {
    try {
      ParseRegText(c.text);
      ADD_FAILURE() << "accepted: " << c.text;
    } catch (const StoreError& e) {
      EXPECT_NE(std::string(e.what()).find(c.where), std::string::npos) << e.what();
    }
  }
}

TEST(RegText, DamagedTextEitherReadsOrFailsCleanly) {
  Hive hive;
  Key& key = hive.Create("HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC");
  key.Set("dtUser", {REG_SZ, "sa \"x\" \\"});
  key.Set("Lines", {REG_SZ, "a\nb"});
  key.Set("Blob", {REG_BINARY, std::string(60, '\x5a')});
  key.Set("N", {REG_DWORD, "\1\2\3\4"});
  const std::string text = WriteRegText(hive);
  std::mt19937 random(20240601);
  const char alphabet[] = "\"\\[]-=@:,()\n\r ;hexdword0123456789abcdefHKEY_\xff\xfe\x00";
  for (int round = 0; round < 3000; ++round) {
    std::string damaged = text;
    for (int edits = 1 + static_cast<int>(random() % 4); edits > 0; --edits) {
      size_t at = random() % (damaged.size() + 1);
      switch (random() % 3) {
        case 0: damaged.insert(at, 1, alphabet[random() % (sizeof alphabet - 1)]); break;
        case 1: if (at < damaged.size()) damaged.erase(at, 1 + random() % 8); break;
        default: damaged.resize(at); break;
      }
    }
    try {
      Hive back = ParseRegText(damaged);
      EXPECT_EQ(ParseRegText(WriteRegText(back)), back);  // whatever reads, writes back the same
    } catch (const StoreError&) {
    }
  }
}

TEST(RegText, EmptyTextIsAnEmptyHive) {
  EXPECT_TRUE(ParseRegText("").keys.empty());
  EXPECT_TRUE(ParseRegText(" \n\r\n").keys.empty());
  EXPECT_TRUE(ParseRegText(WriteRegText(Hive{})).keys.empty());
}

TEST(RegText, WritesOnlyTheKeysAtAndBelowAPath) {
  Hive hive;
  hive.Create("HKEY_CURRENT_USER\\A\\B").Set("v", {REG_SZ, "1"});
  hive.Create("HKEY_CURRENT_USER\\AB").Set("w", {REG_SZ, "2"});
  hive.Create("HKEY_LOCAL_MACHINE\\A");
  Hive below = ParseRegText(WriteRegText(hive, "hkey_current_user\\a"));
  EXPECT_TRUE(below.Exists("HKEY_CURRENT_USER\\A\\B"));
  EXPECT_FALSE(below.Exists("HKEY_CURRENT_USER\\AB"));
  EXPECT_FALSE(below.Exists("HKEY_LOCAL_MACHINE\\A"));
}

TEST(Hive, KeysAndValuesIgnoreLetterCaseAndKeepTheirSpelling) {
  Hive hive;
  Key& key = hive.Create("HKEY_CURRENT_USER\\Software\\Poc");
  key.Set("LastData", {REG_SZ, "01-01-2024"});
  key.Set("LastDiario_ID", {REG_SZ, "3"});
  key.Set("lastdata", {REG_SZ, "02-01-2024"});
  ASSERT_EQ(key.Values().size(), 2u);
  EXPECT_EQ(key.Values()[0].first, "LastData");
  EXPECT_EQ(key.Values()[0].second.data, "02-01-2024");

  EXPECT_TRUE(key.Erase("LASTDATA"));
  EXPECT_FALSE(key.Erase("LastData"));
  EXPECT_EQ(key.Find("lastdiario_id")->data, "3");  // the index followed the move

  hive.Create("HKEY_CURRENT_USER\\SOFTWARE\\POC\\Sub");
  EXPECT_EQ(hive.Find("HKEY_CURRENT_USER\\SOFTWARE\\POC")->path, "HKEY_CURRENT_USER\\Software\\Poc");
  hive.Create("HKEY_CURRENT_USER\\Software\\Poc\\Sub\\Deep");
  hive.Create("HKEY_CURRENT_USER\\Software\\Poc2");
  EXPECT_EQ(hive.SubKeyNames("HKEY_CURRENT_USER\\Software\\Poc"), std::vector<std::string>{"Sub"});
  EXPECT_EQ(hive.SubKeyNames("HKEY_CURRENT_USER\\Software"), (std::vector<std::string>{"Poc", "Poc2"}));
  EXPECT_EQ(hive.EraseTree("HKEY_CURRENT_USER\\Software\\Poc"), 3u);
  EXPECT_TRUE(hive.Exists("HKEY_CURRENT_USER\\Software\\Poc2"));
}

}  // namespace
}  // namespace registry
