// The Translate window's routines for the external tools, with shell
// scripts standing in for the tools of the Pintrel folder.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "app/AppContext.h"
#include "app/WindowRoutines.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;

const std::string kCtl = "VORN Control Files (*.CTL)";

// A UI without editor windows.
class NoEditorUi : public ScriptedUi {
 public:
  bool openEditor(const std::string&, const std::string&, EditorMode) override { return false; }
};

class WindowRoutinesTest : public ::testing::Test {
 protected:
  WindowRoutinesTest() {
    fs::create_directories(app.file("Pintrel"));
    ctx.startup.viewOutput = true;
  }

  std::string pintrel() const { return app.file("Pintrel"); }

  // A tool that keeps its job file as <tool>.job in the capture folder, then
  // runs the extra shell lines in the job folder.
  void tool(const std::string& name, const std::string& extra = "") {
    const std::string path =
        app.write("Pintrel/" + name,
                  "#!/bin/sh\ncp TRANS.JOB '" + capture.file(name + ".job") + "'\n" + extra);
    ::chmod(path.c_str(), 0755);
  }
  std::string job(const std::string& name) const { return ReadFile(capture.file(name + ".job")); }

  bool run(const std::string& program, const std::string& configuration = "") {
    return runIn(ctx, program, configuration);
  }
  bool runIn(AppContext& context, const std::string& program, const std::string& configuration) {
    const WindowRoutine* routine = FindWindowRoutine(program);
    if (!routine) {
      ADD_FAILURE() << program << " is not in the table";
      return false;
    }
    WindowRun w{context, {}, false, {}, {}};
    w.call.inputPath = input;
    w.call.outputPath = output;
    w.call.configurationPath = configuration;
    w.call.outputType = kCtl;
    return routine->run(w);
  }
  std::vector<std::string> texts() const {
    std::vector<std::string> t;
    for (const auto& b : ui.boxes) t.push_back(b.text);
    return t;
  }

  test::TempDir app;
  test::TempDir work;
  test::TempDir capture;
  ScriptedUi ui;
  AppContext ctx{ui, app.path()};
  std::string input = work.write("in.ctl", "x\r\n");
  std::string output = work.file("out.ctl");
  std::string trn = work.write("CODES.TRN", "a\r\n");
};

TEST_F(WindowRoutinesTest, ConvertShowsUnmatchedCodesInsteadOfCompletion) {
  const std::string report = pintrel() + "/Convert.out";
  tool("CONVERT.EXE", "[ -f make-report ] && printf 'XX\\r\\n' > Convert.out\nexit 0\n");

  // No report: the usual completion and the output in a viewer.
  ASSERT_TRUE(run("CONVERT.EXE", trn));
  EXPECT_EQ(job("CONVERT.EXE"), CrLf({input, output, work.file("CODES")}));
  EXPECT_EQ(ui.onlyText(), "Translation Complete.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Information);
  EXPECT_EQ(ui.editors, (std::vector<std::string>{"viewer: " + kCtl + ": " + output}));

  // A report: its message and the report in a viewer, no completion and no
  // output; the report is gone afterwards.
  app.write("Pintrel/make-report", "");
  ui.boxes.clear();
  ui.editors.clear();
  ASSERT_TRUE(run("CONVERT.EXE", trn));
  EXPECT_EQ(ui.onlyText(), "The following codes had no match.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Information);
  EXPECT_EQ(ui.editors, (std::vector<std::string>{"viewer: Out File (*.OUT): " + report}));
  EXPECT_FALSE(fs::exists(report));
}

TEST_F(WindowRoutinesTest, ReportNoWindowCouldShowIsKept) {
  tool("CONVERT.EXE", "printf 'XX\\r\\n' > Convert.out\n");
  NoEditorUi bare;
  AppContext bareCtx(bare, app.path());
  ASSERT_TRUE(runIn(bareCtx, "CONVERT.EXE", trn));
  EXPECT_EQ(bare.onlyText(), "The following codes had no match.");
  EXPECT_EQ(ReadFile(pintrel() + "/Convert.out"), "XX\r\n");
}

TEST_F(WindowRoutinesTest, SortNeedsItsPointNumberReport) {
  const std::string report = pintrel() + "/PTNUM.INF";
  tool("SORT.EXE", "[ -f make-report ] && printf '1-99\\r\\n' > PTNUM.INF\nexit 0\n");

  ASSERT_FALSE(run("SORT.EXE"));
  EXPECT_EQ(job("SORT.EXE"), CrLf({input, output}));
  EXPECT_EQ(ui.onlyText(), "The Translation appears to have failed.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Information);
  EXPECT_TRUE(ui.editors.empty());

  // Completion, the output (made by the tool), then the free point numbers.
  app.write("Pintrel/make-report", "");
  work.write("out.ctl", "sorted\r\n");
  ui.boxes.clear();
  ASSERT_TRUE(run("SORT.EXE"));
  EXPECT_EQ(ui.onlyText(), "Translation Complete.");
  EXPECT_EQ(ui.editors, (std::vector<std::string>{"viewer: " + kCtl + ": " + output,
                                                  "viewer: Available Point Numbers: " + report}));
  EXPECT_FALSE(fs::exists(report));
}

TEST_F(WindowRoutinesTest, ExtractChecksItsConfigurationThenAsks) {
  tool("EXTRACT.EXE");
  ASSERT_FALSE(run("EXTRACT.EXE"));
  EXPECT_EQ(ui.onlyText(), "You must specify a configuration file to use for this translation.");
  ui.boxes.clear();
  ASSERT_FALSE(run("EXTRACT.EXE", work.file("NONE.TRN")));
  EXPECT_EQ(ui.onlyText(), "The specified configuration file does not exist.");
  EXPECT_FALSE(fs::exists(capture.file("EXTRACT.EXE.job")));
  ui.boxes.clear();

  ui.answers.push_back(Answer::Yes);
  ASSERT_TRUE(run("EXTRACT.EXE", trn));
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[0].text, "Is extract by any match?");
  EXPECT_EQ(ui.boxes[0].title, "Any Match?");
  EXPECT_EQ(ui.boxes[0].buttons, Buttons::YesNo);
  EXPECT_EQ(ui.boxes[1].text, "Translation Complete.");
  EXPECT_EQ(job("EXTRACT.EXE"), CrLf({input, output, work.file("CODES"), "Y"}));

  // CONVERT.EXE makes the same check.
  tool("CONVERT.EXE");
  ui.boxes.clear();
  ASSERT_FALSE(run("CONVERT.EXE"));
  EXPECT_EQ(ui.onlyText(), "You must specify a configuration file to use for this translation.");
  EXPECT_FALSE(fs::exists(capture.file("CONVERT.EXE.job")));
}

TEST_F(WindowRoutinesTest, MissingToolStopsWithoutCompletion) {
  for (const char* program : {"CONVERT.EXE", "PCPT2PI.EXE", "PI2PCPT.EXE", "EXTRACT.EXE",
                              "CTL2ARE.EXE", "ALI2FLA.EXE", "LLEV.EXE", "SORT.EXE"}) {
    ui.boxes.clear();
    EXPECT_FALSE(run(program, trn)) << program;
    ASSERT_FALSE(ui.boxes.empty()) << program;
    EXPECT_EQ(ui.boxes.back().text,
              std::string("The program '") + program + "' was not found in '" + pintrel() + "'.");
    EXPECT_TRUE(ui.editors.empty()) << program;
  }

  // The limit question comes first and a non-number ends the run there.
  tool("LLEV.EXE");
  ui.boxes.clear();
  ui.inputs = {std::string("12a")};
  EXPECT_FALSE(run("LLEV.EXE"));
  EXPECT_EQ(ui.onlyText(), "You must enter a numeric point number.");
  EXPECT_FALSE(fs::exists(capture.file("LLEV.EXE.job")));
}

}  // namespace
}  // namespace zv
