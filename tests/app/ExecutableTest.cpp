// The program driven as another program drives it: through its command line,
// standard streams and exit status, from a private application folder.

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>

#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;

struct Result {
  int status;
  std::string out;
  std::string err;
};

class ExecutableTest : public ::testing::Test {
 protected:
  ExecutableTest() {
    fs::create_directories(app.path() + "/UTIFiles");
    fs::copy(std::string(ZV_APP_DIR) + "/zurevazidu", app.file("zurevazidu"));
    fs::copy(std::string(ZV_APP_DIR) + "/UTIFiles", app.file("UTIFiles"),
             fs::copy_options::recursive);
    fs::copy(std::string(ZV_APP_DIR) + "/samples", work.file("samples"),
             fs::copy_options::recursive);
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
  test::TempDir app;
  test::TempDir work;
};

TEST_F(ExecutableTest, TranslatesWithRelativePathsAndDefinitionsFromItsOwnFolder) {
  Result r = run("'-t|CTL2PAC|samples/sample.ctl|job.pac'");
  EXPECT_EQ(r.status, 0) << r.err;
  EXPECT_EQ(r.err, "");
  std::string pac = ReadFile(work.file("job.pac"));
  EXPECT_EQ(pac.rfind("PR:Main Street Reconstruction", 0), 0u) << pac;
  EXPECT_NE(pac.find("\r\nAC:PD\r\nPN:CP100\r\nYY:"), std::string::npos);
  EXPECT_EQ(pac.find("\r\nYC:"), std::string::npos);
}

TEST_F(ExecutableTest, OverwriteQuestionReadsStandardInput) {
  work.write("job.pac", "keep me\r\n");
  Result no = run("'-t|CTL2PAC|samples/sample.ctl|job.pac'");
  EXPECT_EQ(no.status, 1);
  EXPECT_EQ(no.err,
            "none: VORN Zurevazidu\nThe specified output file 'job.pac' already exists."
            "  Overwrite it?\n\n[Yes/No]? ");
  EXPECT_EQ(ReadFile(work.file("job.pac")), "keep me\r\n");

  Result yes = run("'-t|CTL2PAC|samples/sample.ctl|job.pac'", "y\n");
  EXPECT_EQ(yes.status, 0) << yes.err;
  EXPECT_NE(ReadFile(work.file("job.pac")).find("PN:CP111"), std::string::npos);
}

TEST_F(ExecutableTest, ArgumentsSplitAtBarsAfterJoiningWords) {
  // Separate words are joined by blanks before the split.
  Result r = run("-t '|CTL2PAC|samples/sample.ctl|job.pac'");
  EXPECT_EQ(r.status, 2);
  EXPECT_EQ(r.err, "information: VORN Zurevazidu\nInvalid Command Line Argument.\n\n");

  Result count = run("'-t|CTL2PAC|samples/sample.ctl'");
  EXPECT_EQ(count.status, 2);
  EXPECT_EQ(count.err,
            "information: VORN Zurevazidu\nIncorrect Number of Command Line Arguments.\n\n");

  Result version = run("--version");
  EXPECT_EQ(version.status, 0);
  EXPECT_EQ(version.out.rfind("VORN Zurevazidu ", 0), 0u);
}

TEST_F(ExecutableTest, BinaryInputIsReportedNotCrashedOn) {
  std::string junk;
  for (int i = 0; i < 70000; ++i) junk += static_cast<char>((i * 7919) % 256);
  work.write("junk.ctl", junk);
  Result r = run("'-t|CTL2PAC|junk.ctl|junk.pac'");
  EXPECT_EQ(r.status, 1);
  EXPECT_EQ(r.err.rfind("exclamation: Invalid VORN Control File\n", 0), 0u) << r.err;
  EXPECT_FALSE(fs::exists(work.file("junk.pac")));
}

}  // namespace
}  // namespace zv
