#include <gtest/gtest.h>

#include <charconv>
#include <cmath>
#include <random>

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
  // Plain decimals expand exponents.
  EXPECT_EQ(FormatPlainDecimal(0.0033528106647474805), "0.0033528106647474805");
  EXPECT_EQ(FormatPlainDecimal(1e-7), "0.0000001");
  EXPECT_EQ(FormatPlainDecimal(1e21), "1000000000000000000000");
  EXPECT_EQ(FormatPlainDecimal(-0.0), "0");
  EXPECT_EQ(FormatPlainDecimal(12.5), "12.5");
}

// The fast fixed formatting must give the text of the exact decimal expansion.
TEST(NumbersTest, FastFixedMatchesExactRoundingIncludingTies) {
  std::mt19937_64 rng(12345);
  std::uniform_real_distribution<double> any(-1e7, 1e7);
  std::uniform_int_distribution<int> places(0, 9);
  auto exact = [](double v, int d) {
    char buf[400];
    auto res = std::to_chars(buf, buf + sizeof buf, v, std::chars_format::fixed, d);
    std::string text(buf, res.ptr);
    if (text.front() == '-' && text.find_first_of("123456789") == std::string::npos) {
      text.erase(0, 1);
    }
    return text;
  };
  for (int i = 0; i < 200000; ++i) {
    double v = any(rng);
    int d = places(rng);
    ASSERT_EQ(FormatFixed(v, d), exact(v, d)) << v << " " << d;
    // Values on or next to a decimal tie of the last place.
    double tie = std::round(v * 1e3) / 1e3 + 0.0005;
    ASSERT_EQ(FormatFixed(tie, 3), exact(tie, 3)) << tie;
    ASSERT_EQ(FormatFixed(std::nextafter(tie, 0.0), 3), exact(std::nextafter(tie, 0.0), 3));
    double back = 0;
    std::string text = exact(v, d);
    std::from_chars(text.data(), text.data() + text.size(), back);
    ASSERT_EQ(RoundToDecimals(v, d), back) << v << " " << d;
  }
  EXPECT_EQ(FormatFixed(0.125, 2), exact(0.125, 2));
  EXPECT_EQ(FormatFixed(2.5, 0), exact(2.5, 0));
  EXPECT_EQ(FormatFixed(1e300, 2).size(), 304u);
}

}  // namespace
}  // namespace zv
