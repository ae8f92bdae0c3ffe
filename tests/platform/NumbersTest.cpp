#include <gtest/gtest.h>

#include <charconv>
#include <cmath>
#include <cstdio>
#include <random>
#include <string>

#include "platform/Numbers.h"

namespace zv {
namespace {

// The quick path for plain decimals gives the same double as a full
// conversion, digit for digit, at every length it takes and beyond.
TEST(NumbersTest, PlainDecimalsReadAsTheNearestDouble) {
  std::mt19937_64 random(7);
  for (int i = 0; i < 200000; ++i) {
    const int intDigits = static_cast<int>(random() % 10);
    const int decimals = static_cast<int>(random() % 12);
    std::string text = random() % 2 ? "-" : "";
    for (int d = 0; d < intDigits; ++d) text.append(1, static_cast<char>('0' + random() % 10));
    if (decimals > 0 || intDigits == 0) text.append(1, '.');
    for (int d = 0; d < decimals || (intDigits == 0 && d == 0); ++d)
      text.append(1, static_cast<char>('0' + random() % 10));
    double expected = 0;
    std::from_chars(text.data(), text.data() + text.size(), expected);
    const std::optional<double> read = ToNumber(" " + text + " ");
    ASSERT_TRUE(read) << text;
    ASSERT_EQ(std::signbit(*read), std::signbit(expected)) << text;
    ASSERT_EQ(*read, expected) << text;
  }
  for (const char* bad : {"", ".", "-", "+-1", "1..2", "1.2.3", "12a", "--1"})
    EXPECT_FALSE(ToNumber(bad)) << bad;
  EXPECT_EQ(ToNumber("+.5"), 0.5);
  EXPECT_EQ(ToNumber("1."), 1.0);
}

}  // namespace
}  // namespace zv
