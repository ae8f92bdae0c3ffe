// The program driven as another program drives it: through its command line,
// standard streams and exit status, from a private application folder.

#include <gtest/gtest.h>
#include <sys/stat.h>
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

// Every line end reads alike, and a UTF-8 mark is skipped.
TEST_F(ExecutableTest, LineEndsAndUtf8MarkGiveTheSameOutput) {
  std::string ctl = ReadFile(work.file("samples/sample.ctl"));
  ASSERT_EQ(run("'-t|CTL2PAC|samples/sample.ctl|crlf.pac'").status, 0);
  const std::string expected = ReadFile(work.file("crlf.pac"));
  auto replaced = [&](const std::string& end) {
    std::string text;
    for (size_t at = 0, next; at < ctl.size(); at = next + 2) {
      next = std::min(ctl.find("\r\n", at), ctl.size());
      text += ctl.substr(at, next - at) + end;
    }
    return text;
  };
  for (const auto& [name, text] :
       {std::pair{"cr.ctl", replaced("\r")}, std::pair{"lf.ctl", replaced("\n")},
        std::pair{"bom.ctl", "\xEF\xBB\xBF" + ctl}}) {
    work.write(name, text);
    Result r = run(std::string("'-t|CTL2PAC|") + name + "|" + name + ".pac'");
    EXPECT_EQ(r.status, 0) << name << r.err;
    EXPECT_EQ(ReadFile(work.file(std::string(name) + ".pac")), expected) << name;
  }
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
  struct Case {
    std::string args, message;
  } cases[] = {
      {"'-t|CTL2PAC|wide.ctl|out.pac'", refusal + "wide.ctl' is UTF-16"},
      {"'-t|REPLCTL|wide.ctl|out.pac'", refusal + "wide.ctl' is UTF-16"},
      {"'-t|REPLCTL|samples/sample.ctl|out.pac|wide.trn'", refusal + "wide.trn' is UTF-16"},
      {"'-t|CTL2PAC|samples/sample.ctl|pipe'", "pipe"},
  };
  for (const Case& c : cases) {
    Result r = run(c.args);
    EXPECT_EQ(r.status, 1) << c.args;
    EXPECT_NE(r.err.find(c.message), std::string::npos) << c.args << "\n" << r.err;
    EXPECT_EQ(r.err.find("not a regular file") != std::string::npos, c.message == "pipe");
    EXPECT_FALSE(fs::exists(work.file("out.pac")));
  }
  EXPECT_TRUE(fs::is_fifo(work.file("pipe")));
}

}  // namespace
}  // namespace zv
