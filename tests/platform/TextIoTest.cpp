#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "platform/TextIo.h"
#include "support/TempDir.h"

namespace zv {
namespace {

std::vector<std::string> Lines(const std::string& text) {
  std::istringstream in(text);
  LineReader reader(in);
  std::vector<std::string> lines;
  std::string_view line;
  while (reader.next(line)) lines.emplace_back(line);
  return lines;
}

TEST(TextIoTest, ReadsLfAndCrLfAndALastLineWithoutEnd) {
  EXPECT_EQ(Lines("a\r\nb\nc"), (std::vector<std::string>{"a", "b", "c"}));
  EXPECT_EQ(Lines("a\r\n\r\nb\r\n"), (std::vector<std::string>{"a", "", "b"}));
  EXPECT_EQ(Lines(""), std::vector<std::string>{});
  EXPECT_EQ(Lines("x\r"), std::vector<std::string>{"x"});
  EXPECT_EQ(Lines(std::string("n\0ul\n", 5)), std::vector<std::string>{std::string("n\0ul", 4)});
}

TEST(TextIoTest, LinesLongerThanTheReadChunkStayWhole) {
  std::string big(3 << 20, 'q');
  auto lines = Lines("first\n" + big + "\r\nlast\n");
  ASSERT_EQ(lines.size(), 3u);
  EXPECT_EQ(lines[1].size(), big.size());
  EXPECT_EQ(lines[2], "last");
}

TEST(TextIoTest, WriterUsesCrLfAndReplacesOnlyOnCommit) {
  test::TempDir dir;
  std::string path = dir.write("out.txt", "old\r\n");
  {
    TextFileWriter writer(path);
    ASSERT_TRUE(writer.open());
    writer.line("one");
    writer.line("two");
    // Abandoned without commit: the old file stays, no temporary is left.
  }
  EXPECT_EQ(test::ReadFile(path), "old\r\n");
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 1);

  ASSERT_TRUE(WriteTextLines(path, {"one", "two"}));
  EXPECT_EQ(test::ReadFile(path), "one\r\ntwo\r\n");

  std::string error;
  EXPECT_FALSE(WriteTextLines(dir.file("missing/dir/x.txt"), {"a"}, &error));
  EXPECT_FALSE(error.empty());
}

}  // namespace
}  // namespace zv
