#include <gtest/gtest.h>

#include <limits>

#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"
#include "platform/vb/Locale.h"

using namespace vb;

namespace {

int ErrorOf(const std::function<void()>& f) {
  try {
    f();
  } catch (const Error& e) {
    return e.Number();
  }
  return 0;
}

TEST(Conversions, CLngRoundsHalvesToEvenAndOverflows) {
  EXPECT_EQ(CLng(2.5), 2);
  EXPECT_EQ(CLng(3.5), 4);
  EXPECT_EQ(CLng(-2.5), -2);
  EXPECT_EQ(CLng(-3.5), -4);
  EXPECT_EQ(CLng(2.5000001), 3);
  EXPECT_EQ(CLng(2147483647.4), 2147483647);
  EXPECT_EQ(CLng(-2147483648.5), std::numeric_limits<int32_t>::min());
  EXPECT_EQ(ErrorOf([] { CLng(2147483647.5); }), kErrOverflow);
  EXPECT_EQ(ErrorOf([] { CLng(1e300); }), kErrOverflow);
  EXPECT_EQ(ErrorOf([] { CLng(std::numeric_limits<double>::quiet_NaN()); }), kErrOverflow);
  EXPECT_EQ(CLng(true), -1);
  EXPECT_EQ(CLng(Variant()), 0);
  EXPECT_EQ(CLng("1.234,5"), 1234);
  EXPECT_EQ(CLng(" 42 "), 42);
}

TEST(Conversions, NullAndTextThatIsNoNumberRaise) {
  EXPECT_EQ(ErrorOf([] { CLng(Variant::Null()); }), kErrInvalidUseOfNull);
  EXPECT_EQ(ErrorOf([] { CDbl(Variant::Null()); }), kErrInvalidUseOfNull);
  EXPECT_EQ(ErrorOf([] { CStr(Variant::Null()); }), kErrInvalidUseOfNull);
  EXPECT_EQ(ErrorOf([] { CLng("abc"); }), kErrTypeMismatch);
  EXPECT_EQ(ErrorOf([] { CDbl("1-2-3"); }), kErrTypeMismatch);
  EXPECT_EQ(ErrorOf([] { CDate("31-02-2009"); }), kErrTypeMismatch);
}

TEST(Conversions, RegionalNumbers) {
  EXPECT_DOUBLE_EQ(CDbl("1.234,50"), 1234.5);
  EXPECT_DOUBLE_EQ(CDbl("12,5"), 12.5);
  EXPECT_DOUBLE_EQ(CDbl("-12,5"), -12.5);
  EXPECT_DOUBLE_EQ(CDbl("€ 12,50"), 12.5);
  EXPECT_DOUBLE_EQ(CDbl("- 3"), -3);
  EXPECT_DOUBLE_EQ(CDbl(",5"), 0.5);
  EXPECT_DOUBLE_EQ(CDbl("1E3"), 1000);
  EXPECT_DOUBLE_EQ(CDbl("&HFF"), 255);
  EXPECT_TRUE(IsNumeric("12.5"));  // "." groups, as Basic reads it
  EXPECT_FALSE(IsNumeric("12,5,1"));
  EXPECT_FALSE(IsNumeric(""));
  EXPECT_FALSE(IsNumeric("   "));
  EXPECT_FALSE(IsNumeric("abc"));
  EXPECT_FALSE(IsNumeric("1 2"));
  EXPECT_FALSE(IsNumeric(Variant::Null()));
  EXPECT_TRUE(IsNumeric(Variant()));
  EXPECT_FALSE(IsNumeric(Variant(*DateSerial(2009, 1, 1))));
}

TEST(Conversions, InvariantNumbersAcceptOnlyWhatSqlWrites) {
  EXPECT_EQ(ParseInvariantNumber("12.50"), 12.5);
  EXPECT_EQ(ParseInvariantNumber("-3"), -3);
  EXPECT_EQ(ParseInvariantNumber("1e3"), 1000);
  EXPECT_FALSE(ParseInvariantNumber("1,5"));
  EXPECT_FALSE(ParseInvariantNumber(" 1"));
  EXPECT_FALSE(ParseInvariantNumber("1;DROP TABLE x"));
  EXPECT_FALSE(ParseInvariantNumber("."));
  EXPECT_FALSE(ParseInvariantNumber("1e999"));
}

TEST(Conversions, CStrUsesTheRegionalDecimalSymbol) {
  EXPECT_EQ(CStr(12.5), "12,5");
  EXPECT_EQ(CStr(0.1 + 0.2), "0,3");
  EXPECT_EQ(CStr(-1234.0), "-1234");
  EXPECT_EQ(CStr(1e20), "1E+20");
  EXPECT_EQ(CStr(0.0001), "0,0001");
  EXPECT_EQ(CStr(int32_t{-7}), "-7");
  EXPECT_EQ(CStr(Variant()), "");
  EXPECT_EQ(CStr(*DateSerial(2009, 3, 5)), "05-03-2009");
  EXPECT_EQ(CStr(*DateSerial(2009, 3, 5, 18, 0, 1)), "05-03-2009 18:00:01");
}

TEST(Conversions, Dates) {
  const Date d = CDate("31-12-2009 18:00");
  EXPECT_EQ(Year(d), 2009);
  EXPECT_EQ(Month(d), 12);
  EXPECT_EQ(Day(d), 31);
  EXPECT_EQ(SplitDate(d).hour, 18);
  EXPECT_EQ(CDate("2010-01-01"), *DateSerial(2010, 1, 1));
  EXPECT_EQ(CDate("1-2-2010 0:00:00"), *DateSerial(2010, 2, 1));
  EXPECT_EQ(CDate("2010-01-01 23:59:59.997"), *DateSerial(2010, 1, 1, 23, 59, 59));
  EXPECT_TRUE(IsDate("29-02-2008"));
  EXPECT_FALSE(IsDate("29-02-2009"));
  EXPECT_FALSE(IsDate("- - -"));
  EXPECT_FALSE(IsDate("12,5"));
  EXPECT_EQ(*DateSerial(1900, 1, 1), kEmptyDate);
  EXPECT_FALSE(DateSerial(2009, 13, 1));
  const DateParts p = SplitDate(*DateSerial(2009, 12, 31, 23, 59, 59));
  EXPECT_EQ(p.day, 31);
  EXPECT_EQ(p.second, 59);
  EXPECT_EQ(p.weekday, 5);  // a Thursday
  EXPECT_EQ(DateOnly(*DateSerial(2009, 12, 31, 23, 59, 59)), *DateSerial(2009, 12, 31));
}

TEST(Conversions, RoundIsBankersOnTheDecimalDigits) {
  EXPECT_DOUBLE_EQ(Round(2.675, 2), 2.68);
  EXPECT_DOUBLE_EQ(Round(2.665, 2), 2.66);
  EXPECT_DOUBLE_EQ(Round(1234.5), 1234);
  EXPECT_DOUBLE_EQ(Round(-0.125, 2), -0.12);
  EXPECT_DOUBLE_EQ(Round(1.2344999, 3), 1.234);
}

TEST(Conversions, TrimRemovesBlanksOnly) {
  EXPECT_EQ(Trim("  ana maria  "), "ana maria");
  EXPECT_EQ(LTrim("  a "), "a ");
  EXPECT_EQ(RTrim("  a "), "  a");
  EXPECT_EQ(Trim(" a\t "), "a\t");
  EXPECT_EQ(Len("Lançamento"), 10);
}

TEST(Variants, EqualityIsByTypeAndValue) {
  EXPECT_EQ(Variant(int32_t{1}), Variant(int32_t{1}));
  EXPECT_FALSE(Variant(int32_t{1}) == Variant(1.0));
  EXPECT_FALSE(Variant::Null() == Variant());
  EXPECT_EQ(Variant::FromInt64(5000000000LL).Type(), VarType::Double);
  EXPECT_EQ(Variant::FromInt64(-5).Type(), VarType::Long);
  EXPECT_EQ(ErrorOf([] { (void)Variant("x").AsLong(); }), kErrTypeMismatch);
}

}  // namespace
