#include <gtest/gtest.h>

#include "platform/vb/Conversions.h"
#include "platform/vb/Format.h"
#include "platform/vb/Locale.h"

using vb::Format;
using vb::Variant;

namespace {

class FormatTest : public ::testing::Test {
 protected:
  void SetUp() override { vb::SetLocale(vb::Locale{}); }
  void TearDown() override { vb::SetLocale(vb::Locale{}); }
};

Variant D(int y, int m, int d, int h = 0, int n = 0, int s = 0) {
  return Variant(*vb::DateSerial(y, m, d, h, n, s));
}

constexpr const char* kEuro = "€ #,##0.00;€ -#,##0.00";
constexpr const char* kNumber = "#,##0.00;- #,##0.00";

TEST_F(FormatTest, AmountsUseRegionalSymbolsAndTheNegativeSection) {
  EXPECT_EQ(Format(1234.5, kEuro), "€ 1.234,50");
  EXPECT_EQ(Format(-1234.5, kEuro), "€ -1.234,50");
  EXPECT_EQ(Format(1234567.891, kNumber), "1.234.567,89");
  EXPECT_EQ(Format(-1234.5, kNumber), "- 1.234,50");
  EXPECT_EQ(Format(0.5, kNumber), "0,50");
  EXPECT_EQ(Format(0, kEuro), "€ 0,00");
  EXPECT_EQ(Format(12345678.9, "€ #,##0.000;€ -#,##0.000"), "€ 12.345.678,900");
  EXPECT_EQ(Format(-3.14159, "#,##0.000;- #,##0.000"), "- 3,142");
  EXPECT_EQ(Format(999.999, "#,##0.00"), "1.000,00");
}

TEST_F(FormatTest, OneSectionWritesItsOwnMinusSign) {
  EXPECT_EQ(Format(-1234.5, "#,##0.00"), "-1.234,50");
  EXPECT_EQ(Format(-7, "#,##0"), "-7");
}

TEST_F(FormatTest, ValuesThatRoundToZeroShowNoSign) {
  EXPECT_EQ(Format(-0.001, kNumber), "0,00");
  EXPECT_EQ(Format(-0.004, kEuro), "€ 0,00");
}

TEST_F(FormatTest, HalvesRoundAwayFromZeroOnTheDecimalDigits) {
  // 1.005 is stored just below its decimal value; it still rounds as written.
  EXPECT_EQ(Format(1.005, "0.00"), "1,01");
  EXPECT_EQ(Format(2.5, "#,##0"), "3");
  EXPECT_EQ(Format(-2.5, "#,##0"), "-3");
  EXPECT_EQ(Format(0.125, "#,##0.00"), "0,13");
  EXPECT_EQ(Format(1234.0005, "#,##0.000"), "1.234,001");
}

TEST_F(FormatTest, PercentMultipliesByAHundred) {
  EXPECT_EQ(Format(0.23, "0.00 %"), "23,00 %");
  EXPECT_EQ(Format(0.15, "0.00 %"), "15,00 %");
  EXPECT_EQ(Format(1.5, "0.00 %"), "150,00 %");
  EXPECT_EQ(Format(0.0, "0.00 %"), "0,00 %");
}

TEST_F(FormatTest, GroupingOfLargeWholeNumbers) {
  EXPECT_EQ(Format(1234567, "#,##0"), "1.234.567");
  EXPECT_EQ(Format(100, "#,##0"), "100");
  EXPECT_EQ(Format(1000, "#,##0"), "1.000");
  EXPECT_EQ(Format(0, "#,##0"), "0");
}

TEST_F(FormatTest, TextThatIsANumberIsFormattedAndOtherTextIsLeftAlone) {
  EXPECT_EQ(Format("12,5", "0.00"), "12,50");
  EXPECT_EQ(Format("1.234,5", kEuro), "€ 1.234,50");
  EXPECT_EQ(Format("abc", "0.00"), "abc");
  EXPECT_EQ(Format(Variant::Null(), kEuro), "");
}

TEST_F(FormatTest, DatesAndTimes) {
  const Variant d = D(2009, 3, 5, 7, 8, 9);
  EXPECT_EQ(Format(d, "dd-mm-yyyy"), "05-03-2009");
  EXPECT_EQ(Format(d, "yyyy-mm-dd"), "2009-03-05");
  EXPECT_EQ(Format(d, "yyyy-mm-dd Hh:Nn:Ss"), "2009-03-05 07:08:09");
  EXPECT_EQ(Format(d, "dd-mm-yyyy Hh:Nn:Ss"), "05-03-2009 07:08:09");
  EXPECT_EQ(Format(D(2009, 12, 31, 23, 59, 59), "yyyy-mm-dd Hh:Nn:Ss"), "2009-12-31 23:59:59");
  EXPECT_EQ(Format(D(1900, 1, 1), "dd-mm-yyyy"), "01-01-1900");
  EXPECT_EQ(Format(d, "hh:mm"), "07:08");  // minutes after an hour
  EXPECT_EQ(Format("31-12-2009", "yyyy-mm-dd"), "2009-12-31");
}

TEST_F(FormatTest, AnotherRegionShowsItsOwnSymbols) {
  vb::Locale en;
  en.decimal = ".";
  en.grouping = ",";
  vb::SetLocale(en);
  EXPECT_EQ(Format(1234.5, kEuro), "€ 1,234.50");
  EXPECT_EQ(Format(0.23, "0.00 %"), "23.00 %");
}

TEST_F(FormatTest, QuotedAndEscapedLiterals) {
  EXPECT_EQ(Format(5, "\"Nº \"0"), "Nº 5");
  EXPECT_EQ(Format(5, "\\#0"), "#5");
  EXPECT_EQ(Format(-5, "0;\"(\"0\")\""), "(5)");
}

}  // namespace
