#include <gtest/gtest.h>

#include "platform/Numbers.h"

namespace zv {
namespace {

TEST(NumbersTest, NumericTestAcceptsSignedDecimalsWithBlanks) {
  for (const char* ok : {"0", "-1", "+2.5", " 12.3456 ", ".5", "5.", "1e3", "-2.5E-04", "\t7"}) {
    EXPECT_TRUE(IsNumeric(ok)) << ok;
  }
  for (const char* bad :
       {"", " ", "-", ".", "1.2.3", "12a", "1e", "1,000", "--1", "0x10", "nan", "inf", "1 2"}) {
    EXPECT_FALSE(IsNumeric(bad)) << bad;
  }
  EXPECT_DOUBLE_EQ(*ToNumber(" -12.25 "), -12.25);
  EXPECT_DOUBLE_EQ(*ToNumber("+3"), 3.0);
  EXPECT_FALSE(ToNumber("1e999").has_value());
  EXPECT_DOUBLE_EQ(*ToNumber("1e-999"), 0.0);
}

TEST(NumbersTest, FixedFormatsRoundAndNeverShowNegativeZero) {
  EXPECT_EQ(FormatFixed(1234.56786, 4), "1234.5679");
  EXPECT_EQ(FormatFixed(0.5, 3), "0.500");
  EXPECT_EQ(FormatFixed(-0.25, 4), "-0.2500");
  EXPECT_EQ(FormatFixed(-0.00001, 4), "0.0000");
  EXPECT_EQ(FormatFixed(-99999, 4), "-99999.0000");
  EXPECT_EQ(FormatFixed(2.0, 0), "2");
  EXPECT_EQ(FormatPadded(5.25, 2, 4), "05.2500");
  EXPECT_EQ(FormatPadded(-5.25, 2, 1), "-05.2");  // the sign stays in front
  EXPECT_EQ(FormatGrouped(1234567.891, 2), "1,234,567.89");
  EXPECT_EQ(FormatGrouped(-999.5, 0), "-1,000");
  EXPECT_EQ(FormatGrouped(12.0, 1), "12.0");
}

TEST(NumbersTest, PlainDecimalExpandsExponents) {
  EXPECT_EQ(FormatPlainDecimal(0.0033528106647474805), "0.0033528106647474805");
  EXPECT_EQ(FormatPlainDecimal(1e-7), "0.0000001");
  EXPECT_EQ(FormatPlainDecimal(1e21), "1000000000000000000000");
  EXPECT_EQ(FormatPlainDecimal(-0.0), "0");
  EXPECT_EQ(FormatPlainDecimal(12.5), "12.5");
}

}  // namespace
}  // namespace zv
