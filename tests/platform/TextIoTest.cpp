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

using namespace std::string_literals;

std::vector<std::string> Lines(const std::string& text) {
  std::istringstream in(text);
  LineReader reader(in);
  std::vector<std::string> lines;
  std::string_view line;
  while (reader.next(line)) lines.emplace_back(line);
  return lines;
}

TEST(TextIoTest, ReadsCrLfLfAndCrAloneSkipsAUtf8MarkAndKnowsUtf16) {
  using L = std::vector<std::string>;
  const std::pair<std::string, L> cases[] = {
      {"a\r\nb\nc", {"a", "b", "c"}},
      {"a\r\n\r\nb\r\n", {"a", "", "b"}},
      {"", {}},
      {"x\r", {"x"}},
      {"n\0ul\n"s, {"n\0ul"s}},
      {"PN:1\rPN:2\r\rPN:3", {"PN:1", "PN:2", "", "PN:3"}},
      {"a\rb\nc\r\nd\n\re", {"a", "b", "c", "d", "", "e"}},
      {"\xEF\xBB\xBFPN:1\r\n\xEF\xBB\xBF", {"PN:1", "\xEF\xBB\xBF"}},
      // A CR LF split between two reads is one line end.
      {std::string((64 << 10) - 1, 'q') + "\r\nz", {std::string((64 << 10) - 1, 'q'), "z"}},
      // Lines longer than the read chunk stay whole.
      {"a\n" + std::string(3 << 20, 'q') + "\r\nz", {"a", std::string(3 << 20, 'q'), "z"}},
  };
  for (const auto& [text, lines] : cases) EXPECT_EQ(Lines(text), lines) << text.substr(0, 20);
  // Long files without LF stay fast: a million CR lines.
  std::string many;
  for (int i = 0; i < 1000000; ++i) many += "PN:1\r";
  EXPECT_EQ(Lines(many).size(), 1000000u);

  for (const std::string& wide :
       {"\xFF\xFEP"s, "\xFE\xFF"s, "P\0N\0:\0001\0\r\0\n\0"s, "\0P\0N\0:"s})
    EXPECT_TRUE(LooksLikeUtf16(wide)) << wide;
  EXPECT_FALSE(LooksLikeUtf16("PN:1\r\n"));
  EXPECT_FALSE(LooksLikeUtf16("\0\0\0\0ab"s));  // binary, not text
  std::istringstream in("\xFF\xFEP\0"s);
  EXPECT_TRUE(LineReader(in).isUtf16());
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
