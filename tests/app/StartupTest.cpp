#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <sstream>

#include "app/AppContext.h"
#include "app/Startup.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

TEST(CommandLineTest, ModesByFieldCount) {
  EXPECT_EQ(ParseCommandLine("").mode, StartMode::Interactive);
  EXPECT_EQ(ParseCommandLine("-t|ROUTE|in.ctl|out.pac").mode, StartMode::Unattended);
  EXPECT_EQ(ParseCommandLine("-t|ROUTE|in.ctl|out.pac|C:/x.trn").mode, StartMode::Unattended);
  EXPECT_EQ(ParseCommandLine("-t||tccin.tmp|tccout.tmp").mode, StartMode::Unattended);
  EXPECT_EQ(ParseCommandLine("-t|ROUTE|in.ctl").mode, StartMode::WrongCount);
  EXPECT_EQ(ParseCommandLine("-t|a|b|c|d|e").mode, StartMode::WrongCount);
  EXPECT_EQ(ParseCommandLine("-s|True|/in/|/out/|JOB7").mode, StartMode::Preset);
  EXPECT_EQ(ParseCommandLine("-s|True|/in/").mode, StartMode::WrongCount);
  EXPECT_EQ(ParseCommandLine("-S|True|/in/|/out/|JOB7").mode, StartMode::InvalidArgument);
  EXPECT_EQ(ParseCommandLine("/t|a|b|c").mode, StartMode::InvalidArgument);
  // Blanks belong to the fields.
  auto parsed = ParseCommandLine("-t|My Route|in file.ctl|out.pac");
  EXPECT_EQ(parsed.fields[1], "My Route");
  EXPECT_EQ(parsed.fields[2], "in file.ctl");
}

TEST(CommandLineTest, TruthValues) {
  bool v = false;
  EXPECT_TRUE(ParseTruthValue("TRUE", v) && v);
  EXPECT_TRUE(ParseTruthValue("false", v) && !v);
  EXPECT_TRUE(ParseTruthValue("-1", v) && v);
  EXPECT_TRUE(ParseTruthValue("0", v) && !v);
  EXPECT_FALSE(ParseTruthValue("yes", v));
}

class RunProgramTest : public ::testing::Test {
 protected:
  int run(const std::string& args) {
    AppContext ctx(ui, dir.path());
    return RunProgram(ctx, args, nullptr, out);
  }
  test::TempDir dir;
  ScriptedUi ui;
  std::ostringstream out;
};

TEST_F(RunProgramTest, CommandLineErrorsShowTheirMessages) {
  EXPECT_EQ(run("-t|ROUTE|in.ctl"), 2);
  EXPECT_EQ(run("-s|True"), 2);
  EXPECT_EQ(run("-X|a"), 2);
  EXPECT_EQ(run("-s|maybe|/in/|/out/|JOB"), 2);
  ASSERT_EQ(ui.boxes.size(), 4u);
  EXPECT_EQ(ui.boxes[0].text, "Incorrect Number of Command Line Arguments.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Information);
  EXPECT_EQ(ui.boxes[0].title, "VORN Zurevazidu");
  EXPECT_EQ(ui.boxes[1].text, "Incorrect Number of Command Line Arguments.");
  EXPECT_EQ(ui.boxes[2].text, "Invalid Command Line Argument.");
}

TEST_F(RunProgramTest, SecondInstanceIsRefusedAlsoForUnattendedCalls) {
  InstanceLock first(dir.path());
  ASSERT_TRUE(first.acquired());
  EXPECT_EQ(run("-t|ROUTE|in.ctl|out.pac"), 1);
  EXPECT_EQ(ui.onlyText(), "An instance of VORN Zurevazidu is already running.");
  EXPECT_EQ(ui.boxes[0].title, "VORN Zurevazidu");
}

TEST_F(RunProgramTest, InstanceLockIsPrivateAndKeyedByUserAndFolderOnly) {
  test::TempDir runtimeA, runtimeB;
  std::filesystem::create_directory_symlink(dir.path(), runtimeA.file("link"));
  const char* old = std::getenv("XDG_RUNTIME_DIR");
  const std::string saved = old ? old : "";
  ::setenv("XDG_RUNTIME_DIR", runtimeA.path().c_str(), 1);
  InstanceLock first(dir.path());
  ::setenv("XDG_RUNTIME_DIR", runtimeB.path().c_str(), 1);
  // Another environment or another name of the same folder finds the lock.
  InstanceLock second(runtimeA.file("link"));
  InstanceLock other(runtimeB.path());
  old ? ::setenv("XDG_RUNTIME_DIR", saved.c_str(), 1) : ::unsetenv("XDG_RUNTIME_DIR");
  EXPECT_TRUE(first.acquired());
  EXPECT_FALSE(second.acquired());
  EXPECT_TRUE(other.acquired());

  // The lock folder belongs to the user alone and is no link.
  int fd = OpenLockFolder();
  ASSERT_GE(fd, 0);
  struct stat st {};
  ASSERT_EQ(::fstat(fd, &st), 0);
  EXPECT_EQ(st.st_uid, ::getuid());
  EXPECT_EQ(st.st_mode & 0777, 0700u);
  ::close(fd);
}

TEST_F(RunProgramTest, PresetsAreHandedToTheWindow) {
  StartupSettings seen;
  AppContext ctx(ui, dir.path());
  int status = RunProgram(
      ctx, "-s|True|/in/|/out/|JOB7",
      [&](AppContext& c) {
        seen = c.startup;
        return 0;
      },
      out);
  EXPECT_EQ(status, 0);
  EXPECT_TRUE(seen.viewOutput);
  EXPECT_EQ(seen.defaultInputFolder, "/in/");
  EXPECT_EQ(seen.defaultOutputFolder, "/out/");
  EXPECT_EQ(seen.fileStem, "JOB7");
  EXPECT_EQ(seen.configurationFolder, dir.path() + "/TRNFiles");
}

}  // namespace
}  // namespace zv
