#include <gtest/gtest.h>

#include "platform/LineIndex.h"
#include "support/TempDir.h"

namespace zv {
namespace {

std::vector<std::string> Lines(const LineIndex& index) {
  std::vector<std::string> lines;
  for (size_t i = 0; i < index.lineCount(); ++i) lines.emplace_back(index.line(i));
  return lines;
}

TEST(LineIndexTest, LineEndsInOneGoAndInSmallSteps) {
  const std::string longLine(100'000, 'x');
  const std::pair<std::string, std::vector<std::string>> cases[] = {
      {"", {}},
      {"a\r\nbc\r\n", {"a", "bc"}},
      {"a\nbc", {"a", "bc"}},  // no end on the last line
      {"a\rb\r\n\r\nc\n\n", {"a", "b", "", "c", ""}},
      {"\n", {""}},
      {"AC:OS\r\n" + longLine + "\r\nPN:1", {"AC:OS", longLine, "PN:1"}},
      {longLine, {longLine}},
  };
  for (const auto& [text, expected] : cases) {
    for (size_t step : {size_t{1}, size_t{3}, size_t{1} << 20}) {
      LineIndex index(text);
      size_t calls = 0;
      while (!index.build(step)) ++calls;
      EXPECT_EQ(Lines(index), expected) << text.substr(0, 20) << " step " << step;
      EXPECT_EQ(index.scanned(), text.size());
      if (step == 1 && expected.size() > 1) {
        EXPECT_GT(calls, 0u);
      }
    }
  }

  const std::string text = "AC:OS\r\n" + longLine + "\r\nPN:1";
  LineIndex index(text);
  index.build();
  EXPECT_EQ(index.longestLine(), longLine.size());
  EXPECT_EQ(index.lineStart(2), text.size() - 4);
  for (auto [offset, line] : {std::pair{0, 0}, {5, 0}, {6, 0}, {7, 1}, {100'008, 1}, {100'009, 2}})
    EXPECT_EQ(index.lineAt(static_cast<size_t>(offset)), static_cast<size_t>(line)) << offset;
}

TEST(LineIndexTest, MapsFilesAndSaysWhyNot) {
  test::TempDir dir;
  MappedFile file;
  ASSERT_TRUE(file.open(dir.write("a.txt", "PN:1\r\nPN:2")));
  EXPECT_EQ(file.bytes(), "PN:1\r\nPN:2");
  ASSERT_TRUE(file.open(dir.write("empty.txt", "")));
  EXPECT_TRUE(file.bytes().empty());
  EXPECT_FALSE(file.open(dir.file("gone.txt")));
  EXPECT_FALSE(file.error().empty());
  EXPECT_FALSE(file.open(dir.path()));
}

}  // namespace
}  // namespace zv
