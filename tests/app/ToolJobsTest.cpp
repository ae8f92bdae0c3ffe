// The external tools of the Pintrel folder, played by small shell scripts
// that keep a copy of the job file they were given; the jobs, the routines
// of the dispatcher and of the Translate window, and the runner beneath.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "app/ToolJobs.h"
#include "app/WindowRoutines.h"
#include "platform/Process.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;
using test::Take;

const std::string kCtl = "VORN Control Files (*.CTL)";

void MakeExecutable(const std::string& path) {
  ::chmod(path.c_str(), 0755);
}

// A UI without editor windows.
struct NoEditorUi : ScriptedUi {
  bool openEditor(const std::string&, const std::string&, EditorMode) override { return false; }
};

class ToolJobsTest : public ::testing::Test {
 protected:
  ToolJobsTest() { fs::create_directories(pintrel); }

  // A tool that keeps its job file as <tool>.job and its working folder as
  // <tool>.cwd in the capture folder, then runs the extra shell lines.
  void tool(const std::string& name, const std::string& extra = "") {
    MakeExecutable(app.write("Pintrel/" + name, "#!/bin/sh\ncp TRANS.JOB '" +
                                                    capture.file(name + ".job") + "'\npwd > '" +
                                                    capture.file(name + ".cwd") + "'\n" + extra));
  }
  std::string job(const std::string& name) const { return ReadFile(capture.file(name + ".job")); }
  bool ran(const std::string& name) const { return fs::exists(capture.file(name + ".job")); }
  // The program run through the dispatcher, from input to out.txt.
  bool translate(const std::string& program, const std::string& configuration = "") {
    const std::string def = work.write("job.uti", CrLf({program, "", "in", "out"}));
    fs::remove(output);
    return Translate(ctx, {def, input, output, configuration});
  }
  // The program run as the Translate window runs it, viewing its output.
  bool window(const std::string& program, const std::string& configuration = "",
              AppContext* context = nullptr) {
    const WindowRoutine* routine = FindWindowRoutine(program);
    if (!routine) {
      ADD_FAILURE() << program << " is not in the table";
      return false;
    }
    WindowRun w{
        context ? *context : ctx, {input, output, configuration, "", kCtl, ""}, false, {}, {}};
    w.ctx.startup.viewOutput = true;
    return routine->run(w);
  }

  test::TempDir app, work, capture;
  const std::string pintrel = app.file("Pintrel");
  ScriptedUi ui;
  AppContext ctx{ui, app.path()};
  ToolPlace place = PintrelPlace(app.path());
  std::string input = work.write("in.txt", "x\r\n");
  std::string output = work.file("out.txt");
  std::string trn = work.write("CODES.TRN", "a\r\n");
};

TEST_F(ToolJobsTest, JobFilesHoldTheLinesEachToolReads) {
  for (const char* name : {"CONVERT.EXE", "EXTRACT.EXE", "PCPT2PI.EXE", "PI2PCPT.EXE", "SORT.EXE"})
    tool(name);
  ASSERT_TRUE(ConvertToolJob(ui, input, output, "/cfg/CODES.TRN", place));
  EXPECT_EQ(job("CONVERT.EXE"), CrLf({input, output, "/cfg/CODES"}));
  // The tool runs in its own folder: a relative configuration reaches it
  // as an absolute path.
  ASSERT_TRUE(ConvertToolJob(ui, input, output, "cfg/CODES.TRN", place));
  EXPECT_EQ(job("CONVERT.EXE"), CrLf({input, output, (fs::current_path() / "cfg/CODES").string()}));
  ASSERT_TRUE(ExtractToolJob(ui, input, output, "/cfg/PICK.TRN", false, place));
  EXPECT_EQ(job("EXTRACT.EXE"), CrLf({input, output, "/cfg/PICK", "N"}));
  ASSERT_TRUE(ExtractToolJob(ui, input, output, "/cfg/PICK.TRN", true, place));
  EXPECT_EQ(job("EXTRACT.EXE"), CrLf({input, output, "/cfg/PICK", "Y"}));

  // SORT gets its output path as given: no empty file is made for it, and
  // a path that does not exist still reaches the tool.
  const std::string sorted = work.file("sorted output.ctl");
  ASSERT_TRUE(SortToolJob(ui, input, sorted, place));
  EXPECT_EQ(job("SORT.EXE"), CrLf({input, sorted}));
  EXPECT_FALSE(fs::exists(sorted));
  // PI2PCPT gets an empty output file so that the tool has its path; a
  // relative input reaches it as an absolute one, a missing one as "".
  ASSERT_TRUE(Pi2PcptToolJob(ui, input, work.file("made.ali"), place));
  EXPECT_EQ(job("PI2PCPT.EXE"), CrLf({input, work.file("made.ali")}));
  EXPECT_EQ(fs::file_size(work.file("made.ali")), 0u);
  ASSERT_TRUE(Pi2PcptToolJob(ui, "no-such.ali", work.file("made.ali"), place));
  EXPECT_EQ(job("PI2PCPT.EXE"), CrLf({"", work.file("made.ali")}));

  // The tools run in the job folder and leave no job file behind; the
  // program's own current folder does not move.
  const fs::path before = fs::current_path();
  ASSERT_TRUE(Pcpt2PiToolJob(ui, input, work.file("new.ali"), place));
  EXPECT_EQ(ReadFile(capture.file("PCPT2PI.EXE.cwd")), fs::canonical(pintrel).string() + "\n");
  EXPECT_EQ(fs::current_path(), before);
  EXPECT_FALSE(fs::exists(pintrel + "/TRANS.JOB"));
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ToolJobsTest, LlevWritesTheLimitAndMovesItsResultToTheOutput) {
  // The tool writes <input without "lev">prj next to the input.
  tool("LLEV.EXE",
       "in=$(head -n 1 TRANS.JOB | tr -d '\\r')\nprintf 'levelled\\r\\n' > \"${in%lev}prj\"\n");
  const std::string lev = work.write("run.lev", "x\r\n"), result = work.file("result.prj");
  ASSERT_TRUE(LlevToolJob(ui, lev, result, 0, place));
  EXPECT_EQ(job("LLEV.EXE"), CrLf({lev, "0"}));
  EXPECT_EQ(ReadFile(result), "levelled\r\n");
  EXPECT_FALSE(fs::exists(work.file("run.prj")));
  ASSERT_TRUE(LlevToolJob(ui, lev, result, 1250.5, place));
  EXPECT_EQ(job("LLEV.EXE"), CrLf({lev, "1250.5"}));
  // An output naming the tool's result itself keeps it (a copy onto itself
  // followed by the delete would lose it).
  ASSERT_TRUE(LlevToolJob(ui, lev, work.file("run.prj"), 0, place));
  EXPECT_EQ(ReadFile(work.file("run.prj")), "levelled\r\n");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ToolJobsTest, LlevWithoutResultIsReportedAndTheInputKept) {
  tool("LLEV.EXE");
  // An input ending in "prj" is where the result would be: it is no result.
  for (const char* name : {"run.lev", "run.prj"}) {
    const std::string lev = work.write(name, "x\r\n");
    EXPECT_FALSE(LlevToolJob(ui, lev, output, 0, place));
    EXPECT_EQ(Take(ui),
              "E VORN Zurevazidu: LLEV.EXE left no result file '" + work.file("run.prj") + "'.");
    EXPECT_FALSE(fs::exists(output));
    EXPECT_EQ(ReadFile(lev), "x\r\n");
  }
}

TEST_F(ToolJobsTest, MissingOrUnstartableToolStopsTheRunByName) {
  // Every tool stops the window's run by name, without completion or output.
  for (const char* program : {"CONVERT.EXE", "PCPT2PI.EXE", "PI2PCPT.EXE", "EXTRACT.EXE",
                              "CTL2ARE.EXE", "ALI2FLA.EXE", "LLEV.EXE", "SORT.EXE"}) {
    EXPECT_FALSE(window(program, trn)) << program;
    const std::string boxes = Take(ui);
    EXPECT_TRUE(boxes.ends_with(std::string("E Program Not Found: The program '") + program +
                                "' was not found in '" + pintrel + "'."))
        << boxes;
  }
  EXPECT_TRUE(ui.editors.empty());
  EXPECT_FALSE(translate("PCPT2PI.EXE"));  // the dispatcher alike
  EXPECT_EQ(ui.boxes.back().text, "The program 'PCPT2PI.EXE' was not found in '" + pintrel + "'.");

  // Present but not executable: the start fails, the job file and the
  // empty output made for the tool go anyway.
  app.write("Pintrel/PI2PCPT.EXE", "not a program");
  EXPECT_FALSE(Pi2PcptToolJob(ui, input, output, place));
  EXPECT_EQ(ui.boxes.back().text,
            "The program '" + pintrel + "/PI2PCPT.EXE' could not be started: Permission denied");
  EXPECT_FALSE(fs::exists(pintrel + "/TRANS.JOB"));
  EXPECT_FALSE(fs::exists(output));
}

TEST_F(ToolJobsTest, LocalJobsWriteTheirDirectionThenRun) {
  tool("Local.EXE");
  const std::string local = work.file("local.ctl"), stem = work.file("local");
  ASSERT_TRUE(LocalGridToLocalJob(ui, input, local, 2, "Scale 1.0002", place));
  EXPECT_EQ(ReadFile(pintrel + "/TRANS.JOB"), CrLf({input, stem, "2", "Scale 1.0002"}));
  ASSERT_TRUE(LocalRun(ui, place));
  EXPECT_FALSE(fs::exists(pintrel + "/TRANS.JOB"));
  ASSERT_TRUE(LocalLocalToGridJob(ui, input, local, "a", "b c", "d", place));
  ASSERT_TRUE(LocalRun(ui, place));
  EXPECT_EQ(job("Local.EXE"), CrLf({input, stem, "a", "b c", "d"}));
}

TEST_F(ToolJobsTest, DispatcherShowsTheToolReports) {
  tool("CONVERT.EXE", "printf 'XX\\r\\n' > Convert.out\n");
  ASSERT_TRUE(translate("CONVERT.EXE", trn));
  EXPECT_EQ(job("CONVERT.EXE"), CrLf({input, output, work.file("CODES")}));
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: The following codes had no match.");
  EXPECT_EQ(ui.viewed, std::vector<std::string>{"Out File (*.OUT): " + pintrel + "/Convert.out"});
  EXPECT_TRUE(fs::exists(pintrel + "/Convert.out"));  // the unmatched codes stay
  // SORT's free point numbers are shown and deleted.
  tool("SORT.EXE", "printf '1-99\\r\\n' > PTNUM.INF\n");
  ASSERT_TRUE(translate("SORT.EXE"));
  EXPECT_EQ(ui.viewed.back(), "Available Point Numbers: " + pintrel + "/PTNUM.INF");
  EXPECT_FALSE(fs::exists(pintrel + "/PTNUM.INF"));
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ToolJobsTest, DispatcherAsksBeforeExtractAndLlev) {
  tool("EXTRACT.EXE");
  tool("LLEV.EXE", "printf 'r' > \"" + work.file("in.prj") + "\"\n");
  const std::string pick = work.write("PICK.TRN", "a\r\n");
  ui.answers.push_back(Answer::Yes);
  ASSERT_TRUE(translate("EXTRACT.EXE", pick));
  EXPECT_EQ(ui.boxes.back().title + "|" + ui.boxes.back().text,
            "Any Match?|Is extract by any match?");
  EXPECT_EQ(ui.boxes.back().buttons, Buttons::YesNo);
  EXPECT_EQ(job("EXTRACT.EXE"), CrLf({input, output, work.file("PICK"), "Y"}));

  ui.inputs = {std::string("12a")};
  EXPECT_FALSE(translate("LLEV.EXE"));
  EXPECT_EQ(ui.boxes.back().text, "You must enter a numeric point number.");
  EXPECT_EQ(ui.inputPrompts.back(),
            "Enter Point Number: Upper limit point number used to exclude points from VORN "
            "Project File:");
  EXPECT_FALSE(ran("LLEV.EXE"));
  ui.inputs = {std::nullopt};  // Cancel counts as 0
  ASSERT_TRUE(translate("LLEV.EXE"));
  EXPECT_EQ(job("LLEV.EXE"), CrLf({input, "0"}));
  EXPECT_EQ(ReadFile(output), "r");
}

TEST_F(ToolJobsTest, WindowShowsUnmatchedCodesInsteadOfCompletion) {
  const std::string report = pintrel + "/Convert.out";
  tool("CONVERT.EXE", "[ -f make-report ] && printf 'XX\\r\\n' > Convert.out\nexit 0\n");
  // No report: the usual completion and the output in a viewer.
  ASSERT_TRUE(window("CONVERT.EXE", trn));
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: Translation Complete.");
  EXPECT_EQ(ui.editors, std::vector<std::string>{"viewer: " + kCtl + ": " + output});

  // A report: its message and the report in a viewer, no completion and no
  // output; the report is gone afterwards.
  app.write("Pintrel/make-report", "");
  ui.editors.clear();
  ASSERT_TRUE(window("CONVERT.EXE", trn));
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: The following codes had no match.");
  EXPECT_EQ(ui.editors, std::vector<std::string>{"viewer: Out File (*.OUT): " + report});
  EXPECT_FALSE(fs::exists(report));

  // A report no window could show is kept.
  NoEditorUi bare;
  AppContext bareCtx(bare, app.path());
  ASSERT_TRUE(window("CONVERT.EXE", trn, &bareCtx));
  EXPECT_EQ(bare.onlyText(), "The following codes had no match.");
  EXPECT_EQ(ReadFile(report), "XX\r\n");
}

TEST_F(ToolJobsTest, WindowSortNeedsItsPointNumberReport) {
  const std::string report = pintrel + "/PTNUM.INF";
  tool("SORT.EXE", "[ -f make-report ] && printf '1-99\\r\\n' > PTNUM.INF\nexit 0\n");
  ASSERT_FALSE(window("SORT.EXE"));
  EXPECT_EQ(job("SORT.EXE"), CrLf({input, output}));
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: The Translation appears to have failed.");
  EXPECT_TRUE(ui.editors.empty());

  // Completion, the output (made by the tool), then the free point numbers.
  app.write("Pintrel/make-report", "");
  work.write("out.txt", "sorted\r\n");
  ASSERT_TRUE(window("SORT.EXE"));
  EXPECT_EQ(ui.onlyText(), "Translation Complete.");
  EXPECT_EQ(ui.editors, (std::vector<std::string>{"viewer: " + kCtl + ": " + output,
                                                  "viewer: Available Point Numbers: " + report}));
  EXPECT_FALSE(fs::exists(report));
}

TEST_F(ToolJobsTest, WindowChecksTheConfigurationThenAsks) {
  for (const char* program : {"EXTRACT.EXE", "CONVERT.EXE"}) {
    tool(program);
    ASSERT_FALSE(window(program)) << program;
    EXPECT_EQ(
        Take(ui),
        "E VORN Zurevazidu: You must specify a configuration file to use for this translation.");
    EXPECT_FALSE(ran(program));
  }
  ui.answers.push_back(Answer::Yes);
  ASSERT_TRUE(window("EXTRACT.EXE", trn));
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[0].text + "|" + ui.boxes[1].text,
            "Is extract by any match?|Translation Complete.");
  EXPECT_EQ(job("EXTRACT.EXE"), CrLf({input, output, work.file("CODES"), "Y"}));
}

// A UI that notes whether the answer file was there at the first message.
struct AnswerWatchUi : ScriptedUi {
  Answer message(const std::string& text, Icon icon, Buttons buttons,
                 const std::string& title) override {
    if (boxes.empty()) answerAtFirstBox = fs::exists(answer);
    return ScriptedUi::message(text, icon, buttons, title);
  }
  std::string answer;
  bool answerAtFirstBox = true;
};

TEST(CoordConvertRoutineTest, RemovesAnOldAnswerBeforeItStarts) {
  test::TempDir app;
  AnswerWatchUi ui;
  ui.answer = app.write("tccout.tmp", "an answer of an earlier run\r\n");
  AppContext ctx(ui, app.path());
  EXPECT_FALSE(Translate(ctx, {"", "tccin.tmp", "tccout.tmp", ""}));  // no tccin.tmp
  ASSERT_FALSE(ui.boxes.empty());
  EXPECT_FALSE(ui.answerAtFirstBox);
  EXPECT_FALSE(fs::exists(ui.answer));
}

TEST(ProcessTest, RunsAndWaitsInTheWorkingFolderAndRunsBatchFiles) {
  test::TempDir dir;
  ProcessResult r = RunAndWait("/bin/sh", {"-c", "pwd > here; exit 3"}, dir.path(), {});
  EXPECT_TRUE(r.started && r.exitCode == 3);
  EXPECT_EQ(ReadFile(dir.file("here")), fs::canonical(dir.path()).string() + "\n");
  ProcessResult missing = RunAndWait(dir.file("nothing"), {}, "", {});
  EXPECT_EQ(std::to_string(missing.started) + missing.error, "0No such file or directory");

  // Batch files run with "del" and the programs of their folder.
  MakeExecutable(dir.write("prog", "#!/bin/sh\nread a\necho \"got $a\"\n"));
  dir.write("old.out", "stale");
  dir.write("answers.con", "yes\r\n");
  ProcessResult bat = RunBatchFile(
      dir.write("run.bat", CrLf({"del old.out", "del missing", "prog <answers.con >junk"})), {});
  EXPECT_TRUE(bat.started && bat.exitCode == 0);
  EXPECT_FALSE(fs::exists(dir.file("old.out")));
  EXPECT_EQ(ReadFile(dir.file("junk")), "got yes\r\n");

  EXPECT_EQ(ShortPath(dir.file("prog")), dir.file("prog"));
  EXPECT_EQ(ShortPath(dir.file("none.txt")), "");
}

}  // namespace
}  // namespace zv
