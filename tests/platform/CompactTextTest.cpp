// The eight-byte text field: values in place and in shared blocks.

#include <gtest/gtest.h>

#include <string>

#include "platform/CompactText.h"

namespace zv {
namespace {

using namespace std::string_literals;

TEST(CompactTextTest, HoldsAnyBytesInPlaceAndInBlocks) {
  static_assert(sizeof(CompactText) == 8);
  for (const std::string& s :
       {""s, "P"s, "1234567"s, "12345678"s, "a\0b\xff"s, "x\0"s + std::string(40, '\xe9')}) {
    CompactText t = s;
    EXPECT_EQ(t, s);
    EXPECT_EQ(t.size(), s.size());
    EXPECT_EQ(t.empty(), s.empty());
    CompactText copy = t;
    t = "other";
    EXPECT_EQ(copy.str(), s);
    EXPECT_EQ(std::string("<") + copy + ">", "<" + s + ">");
    t = copy;
    t = t.view().substr(s.empty() ? 0 : 1);  // from its own value
    EXPECT_EQ(t, s.substr(s.empty() ? 0 : 1));
  }
}

TEST(CompactTextTest, AppendingGrowsAcrossTheInlineLimitAndNeverChangesACopy) {
  CompactText t;
  std::string expected;
  std::vector<std::pair<CompactText, std::string>> copies;
  for (int i = 0; i < 40; ++i) {
    std::string piece(static_cast<size_t>(i % 3), static_cast<char>('a' + i % 26));
    t += piece;
    expected += piece;
    ASSERT_EQ(t, expected);
    copies.emplace_back(t, expected);
  }
  for (const auto& [copy, value] : copies) EXPECT_EQ(copy, value);

  CompactText self = "abcdefghij";
  self.append(self.view());  // from its own, unshared block
  EXPECT_EQ(self, "abcdefghijabcdefghij");
  self.append(self.view().substr(0, 3), self.view().substr(17));
  EXPECT_EQ(self, "abcdefghijabcdefghijabchij");

  CompactText lines;
  AppendLine(lines, "PD:ONE");
  AppendLine(lines, "PD:TWO");
  EXPECT_EQ(lines, "PD:ONE\r\nPD:TWO");
  lines.clear();
  EXPECT_TRUE(lines.empty());
}

}  // namespace
}  // namespace zv
