#include <gtest/gtest.h>

#include "common/modCode.h"
#include "platform/vb/Conversions.h"

using common::SqlValue;
using vb::Variant;

namespace {

Variant D(int y, int m, int d, int h = 0, int n = 0, int s = 0) {
  return Variant(*vb::DateSerial(y, m, d, h, n, s));
}

TEST(SqlLiterals, TextIsTrimmedQuotedAndApostrophesAreSpelledOut) {
  EXPECT_EQ(SqlValue("O'Brien", common::kSqlText), "'O' + CHAR(39) + 'Brien'");
  EXPECT_EQ(SqlValue("  Lançamento de abertura ", common::kSqlText), "'Lançamento de abertura'");
  EXPECT_EQ(SqlValue("'; DROP TABLE tbFechos; --", common::kSqlText),
            "'' + CHAR(39) + '; DROP TABLE tbFechos; --'");
  EXPECT_EQ(SqlValue("   ", common::kSqlText), "null");
  EXPECT_EQ(SqlValue(Variant::Null(), common::kSqlText), "null");
  EXPECT_EQ(SqlValue("", common::kSqlTextEmpty), "''");
  EXPECT_EQ(SqlValue("x", common::kSqlTextEmpty), "'x'");
  EXPECT_EQ(SqlValue(int32_t{12}, common::kSqlText), "'12'");
}

TEST(SqlLiterals, LikePatternsSeparateWordsByAnything) {
  EXPECT_EQ(SqlValue("  ana  maria ", common::kSqlLikePattern), "'%ana%%maria%'");
  EXPECT_EQ(SqlValue("", common::kSqlLikePattern), "'%%'");
  // The escape of an apostrophe keeps its blanks, or the literal would break.
  EXPECT_EQ(SqlValue("d'a b", common::kSqlLikePattern), "'%d' + CHAR(39) + 'a%b%'");
}

TEST(SqlLiterals, NumbersGoOutUnquotedOnlyWhenTheyAreNumbers) {
  EXPECT_EQ(SqlValue("12,50", common::kSqlNumber), "12.50");
  EXPECT_EQ(SqlValue(12.5, common::kSqlNumber), "12.5");
  EXPECT_EQ(SqlValue(int32_t{-3}, common::kSqlNumber), "-3");
  EXPECT_EQ(SqlValue("abc", common::kSqlNumber), "null");
  EXPECT_EQ(SqlValue(Variant::Null(), common::kSqlNumber), "null");
  EXPECT_EQ(SqlValue(" ", common::kSqlNumber), "null");
  EXPECT_EQ(SqlValue("1 OR 1=1", common::kSqlNumber), "null");
  EXPECT_EQ(SqlValue("1;DELETE FROM tbPOC_Dorvantos", common::kSqlNumber), "null");
}

TEST(SqlLiterals, DatesBecomeConvertExceptTheEmptyDate) {
  EXPECT_EQ(SqlValue(D(2009, 12, 31, 18, 5, 9), common::kSqlDate),
            "CONVERT(DATETIME,'2009-12-31 18:05:09',102)");
  EXPECT_EQ(SqlValue("31-12-2009", common::kSqlDateTime),
            "CONVERT(DATETIME,'2009-12-31 00:00:00',102)");
  EXPECT_EQ(SqlValue(D(1900, 1, 1), common::kSqlDate), "null");
  EXPECT_EQ(SqlValue(D(1900, 1, 1, 10), common::kSqlDate),
            "CONVERT(DATETIME,'1900-01-01 10:00:00',102)");
  EXPECT_EQ(SqlValue("- - -", common::kSqlDate), "null");
  EXPECT_EQ(SqlValue("amanhã", common::kSqlDate), "null");
  EXPECT_EQ(SqlValue(Variant::Null(), common::kSqlDate), "null");
}

TEST(SqlLiterals, UnknownKindsGiveNothing) {
  EXPECT_EQ(SqlValue("x", 0), "");
  EXPECT_EQ(SqlValue("x", 7), "");
}

TEST(SqlLiterals, ReplaceCharWantsSingleCharacters) {
  EXPECT_EQ(common::ReplaceChar("12,5", ",", "."), "12.5");
  EXPECT_EQ(common::ReplaceChar(12.5, ",", "."), "12.5");
  EXPECT_EQ(common::ReplaceChar("a€b", "€", "E"), "aEb");
  EXPECT_EQ(common::ReplaceChar("12,5", ",,", "."), "");
  EXPECT_EQ(common::ReplaceChar("12,5", ",", ""), "");
  EXPECT_EQ(common::Trtf("sem apóstrofo"), "sem apóstrofo");
}

}  // namespace
