// The external tools of the Pintrel folder, played by small shell scripts
// that keep a copy of the job file they were given, and the runner beneath.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "app/ToolJobs.h"
#include "platform/Process.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;

void MakeExecutable(const std::string& path) {
  ::chmod(path.c_str(), 0755);
}

class ToolJobsTest : public ::testing::Test {
 protected:
  ToolJobsTest() : ctx(ui, app.path()) { fs::create_directories(pintrel()); }

  std::string pintrel() const { return app.file("Pintrel"); }

  // A tool that keeps its job file as <tool>.job and its working folder as
  // <tool>.cwd in the capture folder, then runs the extra shell lines.
  void tool(const std::string& name, const std::string& extra = "") {
    std::string script = "#!/bin/sh\ncp TRANS.JOB '" + capture.file(name + ".job") + "'\npwd > '" +
                         capture.file(name + ".cwd") + "'\n" + extra;
    MakeExecutable(app.write("Pintrel/" + name, script));
  }
  std::string job(const std::string& name) const { return ReadFile(capture.file(name + ".job")); }

  test::TempDir app;
  test::TempDir work;
  test::TempDir capture;
  ScriptedUi ui;
  AppContext ctx;
};

TEST_F(ToolJobsTest, JobFilesHoldTheLinesEachToolReads) {
  for (const char* name : {"CONVERT.EXE", "EXTRACT.EXE", "PCPT2PI.EXE", "SORT.EXE"}) tool(name);
  const std::string input = work.write("in.ctl", "x\r\n");
  const std::string output = work.file("out.ctl");
  const std::string sorted = work.file("sorted output.ctl");
  ToolPlace place = PintrelPlace(app.path());

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
  ASSERT_TRUE(SortToolJob(ui, input, sorted, place));
  EXPECT_EQ(job("SORT.EXE"), CrLf({input, sorted}));
  EXPECT_FALSE(fs::exists(sorted));

  // The tools run in the job folder and leave no job file behind; the
  // program's own current folder does not move.
  EXPECT_EQ(ReadFile(capture.file("PCPT2PI.EXE.cwd")), "");
  const fs::path before = fs::current_path();
  ASSERT_TRUE(Pcpt2PiToolJob(ui, input, work.file("new.ali"), place));
  EXPECT_EQ(ReadFile(capture.file("PCPT2PI.EXE.cwd")), fs::canonical(pintrel()).string() + "\n");
  EXPECT_EQ(fs::current_path(), before);
  EXPECT_FALSE(fs::exists(app.file("Pintrel/TRANS.JOB")));
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ToolJobsTest, EmptyOutputFileIsMadeSoTheToolGetsItsPath) {
  tool("PI2PCPT.EXE");
  const std::string input = work.write("in.ali", "x\r\n");
  const std::string output = work.file("made.ali");
  ASSERT_TRUE(Pi2PcptToolJob(ui, input, output, PintrelPlace(app.path())));
  EXPECT_EQ(job("PI2PCPT.EXE"), CrLf({input, output}));
  ASSERT_TRUE(fs::exists(output));
  EXPECT_EQ(fs::file_size(output), 0u);

  // A relative input path reaches the tool as an absolute one; a missing
  // input becomes an empty line.
  ASSERT_TRUE(Pi2PcptToolJob(ui, "no-such.ali", output, PintrelPlace(app.path())));
  EXPECT_EQ(job("PI2PCPT.EXE"), CrLf({"", output}));
}

TEST_F(ToolJobsTest, LlevWritesTheLimitAndMovesItsResultToTheOutput) {
  // The tool writes <input without "lev">prj next to the input.
  tool("LLEV.EXE",
       "in=$(head -n 1 TRANS.JOB | tr -d '\\r')\n"
       "printf 'levelled\\r\\n' > \"${in%lev}prj\"\n");
  const std::string input = work.write("run.lev", "x\r\n");
  const std::string output = work.file("result.prj");
  ASSERT_TRUE(LlevToolJob(ui, input, output, 0, PintrelPlace(app.path())));
  EXPECT_EQ(job("LLEV.EXE"), CrLf({input, "0"}));
  EXPECT_EQ(ReadFile(output), "levelled\r\n");
  EXPECT_FALSE(fs::exists(work.file("run.prj")));

  ASSERT_TRUE(LlevToolJob(ui, input, output, 1250.5, PintrelPlace(app.path())));
  EXPECT_EQ(job("LLEV.EXE"), CrLf({input, "1250.5"}));

  // An output naming the tool's result itself keeps it (a copy onto itself
  // followed by the delete would lose it).
  ASSERT_TRUE(LlevToolJob(ui, input, work.file("run.prj"), 0, PintrelPlace(app.path())));
  EXPECT_EQ(ReadFile(work.file("run.prj")), "levelled\r\n");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ToolJobsTest, LlevWithoutResultIsReportedAndTheInputKept) {
  tool("LLEV.EXE");
  // An input ending in "prj" is where the result would be: it is no result.
  for (const char* name : {"run.lev", "run.prj"}) {
    ui.boxes.clear();
    const std::string input = work.write(name, "x\r\n");
    EXPECT_FALSE(LlevToolJob(ui, input, work.file("out.prj"), 0, PintrelPlace(app.path())));
    EXPECT_EQ(ui.onlyText(), "LLEV.EXE left no result file '" + work.file("run.prj") + "'.");
    EXPECT_FALSE(fs::exists(work.file("out.prj")));
    EXPECT_EQ(ReadFile(input), "x\r\n");
  }
}

TEST_F(ToolJobsTest, MissingOrUnstartableToolStopsTheRunByName) {
  const std::string input = work.write("in.ctl", "x\r\n");
  const std::string output = work.file("out.ctl");
  EXPECT_FALSE(ConvertToolJob(ui, input, output, "", PintrelPlace(app.path())));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].text, "The program 'CONVERT.EXE' was not found in '" + pintrel() + "'.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
  EXPECT_FALSE(fs::exists(output));
  EXPECT_FALSE(fs::exists(app.file("Pintrel/TRANS.JOB")));

  // Present but not executable: the start fails, the job file and the
  // empty output made for the tool go anyway.
  app.write("Pintrel/PI2PCPT.EXE", "not a program");
  EXPECT_FALSE(Pi2PcptToolJob(ui, input, output, PintrelPlace(app.path())));
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[1].text,
            "The program '" + pintrel() + "/PI2PCPT.EXE' could not be started: Permission denied");
  EXPECT_FALSE(fs::exists(app.file("Pintrel/TRANS.JOB")));
  EXPECT_FALSE(fs::exists(output));

  // Through the dispatcher the run stops with the same message.
  const std::string def = work.write("conv.uti", CrLf({"PCPT2PI.EXE", "", "a", "b"}));
  EXPECT_FALSE(Translate(ctx, {def, input, output, ""}));
  EXPECT_EQ(ui.boxes.back().text,
            "The program 'PCPT2PI.EXE' was not found in '" + pintrel() + "'.");
}

TEST_F(ToolJobsTest, LocalJobsWriteTheirDirectionThenRun) {
  tool("Local.EXE");
  const std::string input = work.write("in.ctl", "x\r\n");
  const std::string output = work.file("local.ctl");
  ToolPlace place = PintrelPlace(app.path());
  ASSERT_TRUE(LocalGridToLocalJob(ui, input, output, 2, "Scale 1.0002", place));
  EXPECT_EQ(ReadFile(app.file("Pintrel/TRANS.JOB")),
            CrLf({input, output.substr(0, output.size() - 4), "2", "Scale 1.0002"}));
  ASSERT_TRUE(LocalRun(ui, place));
  EXPECT_FALSE(fs::exists(app.file("Pintrel/TRANS.JOB")));

  ASSERT_TRUE(LocalLocalToGridJob(ui, input, output, "a", "b c", "d", place));
  ASSERT_TRUE(LocalRun(ui, place));
  EXPECT_EQ(job("Local.EXE"), CrLf({input, output.substr(0, output.size() - 4), "a", "b c", "d"}));
}

class ToolRoutinesTest : public ToolJobsTest {
 protected:
  bool translate(const std::string& program, const std::string& configuration = "") {
    const std::string def = work.write("job.uti", CrLf({program, "", "in", "out"}));
    std::error_code ec;
    fs::remove(work.file("out.txt"), ec);
    return Translate(ctx, {def, input, work.file("out.txt"), configuration});
  }
  std::string input = work.write("in.txt", "x\r\n");
};

TEST_F(ToolRoutinesTest, ConvertShowsTheUnmatchedCodesReport) {
  tool("CONVERT.EXE", "printf 'XX\\r\\n' > Convert.out\n");
  const std::string trn = work.write("CODES.TRN", "a\r\n");
  ASSERT_TRUE(translate("CONVERT.EXE", trn));
  EXPECT_EQ(job("CONVERT.EXE"), CrLf({input, work.file("out.txt"), work.file("CODES")}));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].text, "The following codes had no match.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Information);
  ASSERT_EQ(ui.viewed.size(), 1u);
  EXPECT_EQ(ui.viewed[0], "Out File (*.OUT): " + pintrel() + "/Convert.out");
  EXPECT_TRUE(fs::exists(pintrel() + "/Convert.out"));  // left in place
}

TEST_F(ToolRoutinesTest, SortShowsAndDeletesTheFreePointNumbers) {
  tool("SORT.EXE", "printf '1-99\\r\\n' > PTNUM.INF\n");
  ASSERT_TRUE(translate("SORT.EXE"));
  ASSERT_EQ(ui.viewed.size(), 1u);
  EXPECT_EQ(ui.viewed[0], "Available Point Numbers: " + pintrel() + "/PTNUM.INF");
  EXPECT_FALSE(fs::exists(pintrel() + "/PTNUM.INF"));
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ToolRoutinesTest, ExtractAndLlevAskFirst) {
  tool("EXTRACT.EXE");
  tool("LLEV.EXE", "printf 'r' > \"" + work.file("in.prj") + "\"\n");
  const std::string trn = work.write("PICK.TRN", "a\r\n");
  ui.answers.push_back(Answer::Yes);
  ASSERT_TRUE(translate("EXTRACT.EXE", trn));
  EXPECT_EQ(ui.boxes.back().text, "Is extract by any match?");
  EXPECT_EQ(ui.boxes.back().title, "Any Match?");
  EXPECT_EQ(job("EXTRACT.EXE"), CrLf({input, work.file("out.txt"), work.file("PICK"), "Y"}));

  ui.inputs = {std::string("12a")};
  EXPECT_FALSE(translate("LLEV.EXE"));
  EXPECT_EQ(ui.boxes.back().text, "You must enter a numeric point number.");
  EXPECT_EQ(ui.inputPrompts.back(),
            "Enter Point Number: Upper limit point number used to exclude points from VORN "
            "Project File:");
  EXPECT_FALSE(fs::exists(capture.file("LLEV.EXE.job")));

  ui.inputs = {std::nullopt};  // Cancel counts as 0
  ASSERT_TRUE(translate("LLEV.EXE"));
  EXPECT_EQ(job("LLEV.EXE"), CrLf({input, "0"}));
  EXPECT_EQ(ReadFile(work.file("out.txt")), "r");
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

TEST(ProcessTest, RunsAndWaitsInTheWorkingFolder) {
  test::TempDir dir;
  ProcessResult r = RunAndWait("/bin/sh", {"-c", "pwd > here; exit 3"}, dir.path(), {});
  ASSERT_TRUE(r.started);
  EXPECT_EQ(r.exitCode, 3);
  EXPECT_EQ(ReadFile(dir.file("here")), fs::canonical(dir.path()).string() + "\n");

  ProcessResult missing = RunAndWait(dir.file("nothing"), {}, "", {});
  EXPECT_FALSE(missing.started);
  EXPECT_EQ(missing.error, "No such file or directory");
}

TEST(ProcessTest, BatchFilesRunWithDelAndProgramsOfTheirFolder) {
  test::TempDir dir;
  MakeExecutable(dir.write("prog", "#!/bin/sh\nread a\necho \"got $a\"\n"));
  dir.write("old.out", "stale");
  dir.write("answers.con", "yes\r\n");
  const std::string bat =
      dir.write("run.bat", CrLf({"del old.out", "del missing", "prog <answers.con >junk"}));
  ProcessResult r = RunBatchFile(bat, {});
  ASSERT_TRUE(r.started);
  EXPECT_EQ(r.exitCode, 0);
  EXPECT_FALSE(fs::exists(dir.file("old.out")));
  EXPECT_EQ(ReadFile(dir.file("junk")), "got yes\r\n");
}

TEST(ProcessTest, ShortPathIsTheAbsolutePathOfAnExistingFile) {
  test::TempDir dir;
  const std::string file = dir.write("a b.txt", "");
  EXPECT_EQ(ShortPath(file), file);
  EXPECT_EQ(ShortPath(dir.file("none.txt")), "");
  EXPECT_EQ(ShortPath(""), "");
}

}  // namespace
}  // namespace zv
