#include <gtest/gtest.h>
#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

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

TEST(TextIoTest, ReadsCrLfLfAndCrAloneAndSkipsAUtf8Mark) {
  using L = std::vector<std::string>;
  EXPECT_EQ(Lines("a\r\nb\nc"), (L{"a", "b", "c"}));
  EXPECT_EQ(Lines("a\r\n\r\nb\r\n"), (L{"a", "", "b"}));
  EXPECT_EQ(Lines(""), L{});
  EXPECT_EQ(Lines("x\r"), L{"x"});
  EXPECT_EQ(Lines(std::string("n\0ul\n", 5)), L{std::string("n\0ul", 4)});
  EXPECT_EQ(Lines("PN:1\rPN:2\r\rPN:3"), (L{"PN:1", "PN:2", "", "PN:3"}));
  EXPECT_EQ(Lines("a\rb\nc\r\nd\n\re"), (L{"a", "b", "c", "d", "", "e"}));
  EXPECT_EQ(Lines("\xEF\xBB\xBFPN:1\r\n\xEF\xBB\xBF"), (L{"PN:1", "\xEF\xBB\xBF"}));
  // A CR LF split between two reads is one line end.
  std::string first(64 << 10, 'q');
  first.back() = '\r';
  auto split = Lines(first + "\nz");
  ASSERT_EQ(split.size(), 2u);
  EXPECT_EQ(split[1], "z");
  // Long files without LF stay fast: a million CR lines.
  std::string many;
  for (int i = 0; i < 1000000; ++i) many += "PN:1\r";
  EXPECT_EQ(Lines(many).size(), 1000000u);
}

TEST(TextIoTest, RecognisesUtf16) {
  EXPECT_TRUE(LooksLikeUtf16("\xFF\xFEP"));
  EXPECT_TRUE(LooksLikeUtf16("\xFE\xFF"));
  EXPECT_TRUE(
      LooksLikeUtf16(std::string("P\0N\0:\0"
                                 "1\0\r\0\n\0",
                                 12)));
  EXPECT_TRUE(LooksLikeUtf16(std::string("\0P\0N\0:", 6)));
  EXPECT_FALSE(LooksLikeUtf16("PN:1\r\n"));
  EXPECT_FALSE(LooksLikeUtf16(std::string("\0\0\0\0ab", 6)));  // binary, not text
  std::istringstream in(std::string("\xFF\xFEP\0", 4));
  EXPECT_TRUE(LineReader(in).isUtf16());
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

size_t Entries(const std::string& folder) {
  return static_cast<size_t>(std::distance(std::filesystem::directory_iterator(folder), {}));
}

// Writes one line to path in a child process that then gets the signal;
// returns the signal that ended the child.
int WriteAndGetSignal(const std::string& path, int sig) {
  pid_t pid = ::fork();
  if (pid == 0) {
    TextFileWriter writer(path);
    if (writer.open()) {
      writer.line("half");
      ::kill(::getpid(), sig);
    }
    ::_exit(0);
  }
  int status = 0;
  ::waitpid(pid, &status, 0);
  return WIFSIGNALED(status) ? WTERMSIG(status) : 0;
}

TEST(TextIoTest, KilledWritesLeaveNoTemporaryFiles) {
  test::TempDir dir;
  const std::string path = dir.write("out.txt", "old\r\n");
  for (int sig : {SIGINT, SIGTERM, SIGHUP}) {
    EXPECT_EQ(WriteAndGetSignal(path, sig), sig);
    EXPECT_EQ(Entries(dir.path()), 1u) << "signal " << sig;
  }
  // SIGKILL leaves the temporary file; the next write of the same file
  // removes it, that of another file does not.
  EXPECT_EQ(WriteAndGetSignal(path, SIGKILL), SIGKILL);
  EXPECT_EQ(Entries(dir.path()), 2u);
  ASSERT_TRUE(WriteTextLines(dir.file("other.txt"), {"x"}));
  EXPECT_EQ(Entries(dir.path()), 3u);
  ASSERT_TRUE(WriteTextLines(path, {"new"}));
  EXPECT_EQ(Entries(dir.path()), 2u);
  EXPECT_EQ(test::ReadFile(path), "new\r\n");

  // The longest file name the system takes can still be written.
  const std::string longName = dir.file(std::string(255, 'n'));
  ASSERT_TRUE(WriteTextLines(longName, {"x"}));
  EXPECT_EQ(test::ReadFile(longName), "x\r\n");
}

TEST(TextIoTest, OnlyRegularFilesAreReplaced) {
  test::TempDir dir;
  const std::string fifo = dir.file("pipe");
  ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
  std::filesystem::create_directory(dir.file("folder"));
  std::filesystem::create_symlink(fifo, dir.file("link"));
  for (const char* name : {"pipe", "folder", "link"}) {
    std::string error;
    EXPECT_FALSE(WriteTextLines(dir.file(name), {"x"}, &error)) << name;
    EXPECT_EQ(error, kNotRegularFile);
  }
  EXPECT_TRUE(std::filesystem::is_fifo(fifo));
  EXPECT_TRUE(std::filesystem::is_symlink(dir.file("link")));
  EXPECT_EQ(Entries(dir.path()), 3u);
}

}  // namespace
}  // namespace zv
