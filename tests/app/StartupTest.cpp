// The start-up: command line, instance lock, and the program driven as another
// program drives it (command line, standard streams, exit status).

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <sstream>

#include "app/AppContext.h"
#include "app/Startup.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;

TEST(CommandLineTest, ModesFieldsAndTruthValues) {
  using M = StartMode;
  const std::pair<const char*, M> modes[] = {
      {"", M::Interactive},
      {"-t|ROUTE|in.ctl|out.pac", M::Unattended},
      {"-t|ROUTE|in.ctl|out.pac|C:/x.trn", M::Unattended},
      {"-t||tccin.tmp|tccout.tmp", M::Unattended},
      {"-t|ROUTE|in.ctl", M::WrongCount},
      {"-t|a|b|c|d|e", M::WrongCount},
      {"-s|True|/in/|/out/|JOB7", M::Preset},
      {"-s|True|/in/", M::WrongCount},
      {"-S|True|/in/|/out/|JOB7", M::InvalidArgument},
      {"/t|a|b|c", M::InvalidArgument},
  };
  for (const auto& [line, mode] : modes) EXPECT_EQ(ParseCommandLine(line).mode, mode) << line;
  // Blanks belong to the fields.
  EXPECT_EQ(ParseCommandLine("-t|My Route|in file.ctl|out.pac").fields[2], "in file.ctl");

  // "ok value" of each text; a text that is refused leaves the value alone.
  for (const auto& [text, expected] :
       {std::pair{"TRUE", "1 1"}, {"false", "1 0"}, {"-1", "1 1"}, {"0", "1 0"}, {"yes", "0 1"}}) {
    bool v = true;
    const bool ok = ParseTruthValue(text, v);
    EXPECT_EQ(std::to_string(ok) + " " + std::to_string(v), expected) << text;
  }
}

class RunProgramTest : public ::testing::Test {
 protected:
  int run(const std::string& args, const WindowOpener& window = nullptr) {
    AppContext ctx(ui, dir.path());
    return RunProgram(ctx, args, window, out);
  }
  test::TempDir dir;
  ScriptedUi ui;
  std::ostringstream out;
};

TEST_F(RunProgramTest, CommandLineErrorsShowTheirMessages) {
  const std::pair<const char*, const char*> cases[] = {
      {"-t|ROUTE|in.ctl", "Incorrect Number of Command Line Arguments."},
      {"-s|True", "Incorrect Number of Command Line Arguments."},
      {"-X|a", "Invalid Command Line Argument."},
      {"-s|maybe|/in/|/out/|JOB",
       "Invalid Command Line Argument.\r\nThe view field 'maybe' must be True, False or a number."},
  };
  for (const auto& [args, text] : cases) {
    EXPECT_EQ(run(args), 2) << args;
    EXPECT_EQ(test::Take(ui), std::string("I VORN Zurevazidu: ") + text);
  }
}

TEST_F(RunProgramTest, SecondInstanceIsRefusedAlsoForUnattendedCalls) {
  InstanceLock first(dir.path());
  ASSERT_TRUE(first.acquired());
  EXPECT_EQ(run("-t|ROUTE|in.ctl|out.pac"), 1);
  EXPECT_EQ(test::Take(ui).substr(1),
            " VORN Zurevazidu: An instance of VORN Zurevazidu is already running.");
}

TEST_F(RunProgramTest, InstanceLockIsPrivateAndKeyedByUserAndFolderOnly) {
  test::TempDir runtimeA, runtimeB;
  fs::create_directory_symlink(dir.path(), runtimeA.file("link"));
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
  EXPECT_EQ(run("-s|True|/in/|/out/|JOB7", [&](AppContext& c) { return seen = c.startup, 0; }), 0);
  EXPECT_EQ(std::to_string(seen.viewOutput) + " " + seen.defaultInputFolder + " " +
                seen.defaultOutputFolder + " " + seen.fileStem + " " + seen.configurationFolder,
            "1 /in/ /out/ JOB7 " + dir.path() + "/TRNFiles");
}

struct Result {
  int status;
  std::string out, err;
};

// The built program run from a private copy of its application folder.
class ExecutableTest : public ::testing::Test {
 protected:
  ExecutableTest() {
    const std::string shipped = ZV_APP_DIR;
    fs::copy(shipped + "/zurevazidu", app.file("zurevazidu"));
    fs::copy(shipped + "/UTIFiles", app.file("UTIFiles"), fs::copy_options::recursive);
    fs::copy(shipped + "/samples", work.file("samples"), fs::copy_options::recursive);
  }
  // Runs the program in the work folder with the given standard input.
  Result run(const std::string& args, const std::string& input = "") {
    std::string in = work.write(".stdin", input);
    std::string cmd = "cd '" + work.path() + "' && ZUREVAZIDU_UI=console '" +
                      app.file("zurevazidu") + "' " + args + " <'" + in + "' >'" +
                      work.file(".stdout") + "' 2>'" + work.file(".stderr") + "'";
    int raw = std::system(cmd.c_str());
    return {WIFEXITED(raw) ? WEXITSTATUS(raw) : -1, ReadFile(work.file(".stdout")),
            ReadFile(work.file(".stderr"))};
  }
  Result toPac(const std::string& in, const std::string& out, const std::string& stdIn = "") {
    return run("'-t|CTL2PAC|" + in + "|" + out + "'", stdIn);
  }
  test::TempDir app, work;
};

TEST_F(ExecutableTest, TranslatesWithRelativePathsAndAsksOnStandardInput) {
  Result r = toPac("samples/sample.ctl", "job.pac");
  EXPECT_EQ(r.status, 0) << r.err;
  EXPECT_EQ(r.err, "");
  std::string pac = ReadFile(work.file("job.pac"));
  EXPECT_NE(pac.find("\r\nAC:PD\r\nPN:CP100\r\nYY:"), std::string::npos) << pac;

  work.write("job.pac", "keep me\r\n");
  Result no = toPac("samples/sample.ctl", "job.pac");
  EXPECT_EQ(no.status, 1);
  EXPECT_EQ(no.err,
            "none: VORN Zurevazidu\nThe specified output file 'job.pac' already exists."
            "  Overwrite it?\n\n[Yes/No]? ");
  EXPECT_EQ(ReadFile(work.file("job.pac")), "keep me\r\n");
  EXPECT_EQ(toPac("samples/sample.ctl", "job.pac", "y\n").status, 0);
  EXPECT_EQ(ReadFile(work.file("job.pac")), pac);
}

TEST_F(ExecutableTest, ArgumentsSplitAtBarsAfterJoiningWords) {
  Result r = run("-t '|CTL2PAC|samples/sample.ctl|job.pac'");
  EXPECT_EQ(r.status, 2);
  EXPECT_EQ(r.err, "information: VORN Zurevazidu\nInvalid Command Line Argument.\n\n");
  Result version = run("--version");
  EXPECT_TRUE(version.status == 0 && version.out.starts_with("VORN Zurevazidu ")) << version.out;
}

// UTF-16 input and outputs that are no regular files are refused by name;
// nothing is written.
TEST_F(ExecutableTest, Utf16InputAndNonRegularOutputAreRefused) {
  std::string utf16 = "\xFF\xFE";
  for (char c : std::string("PN:1\r\nFE:TREE\r\n")) utf16 += std::string{c, '\0'};
  work.write("wide.ctl", utf16);
  work.write("wide.trn", utf16);
  // The definition's configuration is a bare name: it is found in the current folder.
  work.write("FEATCODES.TRN", ReadFile(std::string(ZV_APP_DIR) + "/TRNFiles/FEATCODES.TRN"));
  ASSERT_EQ(::mkfifo(work.file("pipe").c_str(), 0600), 0);
  const std::string refusal = "exclamation: Unsupported Text Encoding\nThe file '";
  const std::pair<std::string, std::string> cases[] = {
      {"'-t|CTL2PAC|wide.ctl|out.pac'", refusal + "wide.ctl' is UTF-16"},
      {"'-t|REPLCTL|wide.ctl|out.pac'", refusal + "wide.ctl' is UTF-16"},
      {"'-t|REPLCTL|samples/sample.ctl|out.pac|wide.trn'", refusal + "wide.trn' is UTF-16"},
      {"'-t|CTL2PAC|samples/sample.ctl|pipe'", "pipe"},
  };
  for (const auto& [args, message] : cases) {
    Result r = run(args);
    EXPECT_EQ(r.status, 1) << args;
    EXPECT_NE(r.err.find(message), std::string::npos) << args << "\n" << r.err;
    EXPECT_EQ(r.err.find("not a regular file") != std::string::npos, message == "pipe");
    EXPECT_FALSE(fs::exists(work.file("out.pac")));
  }
  EXPECT_TRUE(fs::is_fifo(work.file("pipe")));
}

}  // namespace
}  // namespace zv
