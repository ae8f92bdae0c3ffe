// A run stopped by the user (Cancel, SIGINT, SIGTERM) ends at the next point:
// "Translation cancelled.", the old output kept, no temporary file left.

#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>
#include <sstream>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "platform/ConsoleUi.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;

// Asks to stop at the first report of the given stage.
class StopAt : public RunProgress {
 public:
  explicit StopAt(RunStage stage) : stage_(stage) {}
  void step(RunStage stage, std::uintmax_t, std::uintmax_t) override {
    if (stage == stage_) throw RunCancelled{};
  }

 private:
  RunStage stage_;
};

class StoppingUi : public ScriptedUi {
 public:
  explicit StoppingUi(RunStage stage) : stop_(stage) {}
  RunProgress* progress() override { return &stop_; }

 private:
  StopAt stop_;
};

class CancelTest : public ::testing::Test {
 protected:
  CancelTest() {
    dir.write("UTIFiles/CTL2PAC.uti", CrLf({"ConvertFile", "To PAC", "VORN Control Files (*.CTL)",
                                            "VORN Points and Chains Files (*.PAC)"}));
    dir.write("job.ctl", CrLf({"AC:PR", "AC:OS", "PN:1", "YC:1", "XC:2", "AC:OS", "PN:2"}));
    dir.write("job.pac", "precious\r\n");
  }
  TranslationJob job() const {
    return {dir.file("UTIFiles/CTL2PAC.uti"), dir.file("job.ctl"), dir.file("job.pac"), ""};
  }
  // The folder holds the three files it started with, the old output intact.
  void expectUntouched() const {
    EXPECT_EQ(ReadFile(dir.file("job.pac")), "precious\r\n");
    int files = 0;
    for (const auto& entry : std::filesystem::directory_iterator(dir.path()))
      files += entry.is_regular_file();
    EXPECT_EQ(files, 2);  // job.ctl and job.pac
  }
  test::TempDir dir;
};

TEST_F(CancelTest, StopWhileReadingOrWritingKeepsTheOldOutput) {
  for (RunStage stage : {RunStage::Reading, RunStage::Writing}) {
    SCOPED_TRACE(static_cast<int>(stage));
    StoppingUi ui(stage);
    ui.answers = {Answer::Yes};  // overwrite
    AppContext ctx(ui, dir.path());
    EXPECT_FALSE(Translate(ctx, job()));
    ASSERT_EQ(ui.boxes.size(), 2u);
    EXPECT_EQ(ui.boxes[1].text, kRunCancelled);
    EXPECT_EQ(ui.boxes[1].icon, Icon::Information);
    expectUntouched();
  }
}

TEST_F(CancelTest, SignalStopsTheUnattendedRunWithStatusOne) {
  EXPECT_EXIT(
      {
        StopOnSignals();
        std::raise(SIGTERM);  // asks to stop; the process lives on
        std::istringstream in("y\n");
        std::ostringstream out;
        ConsoleUi ui(in, out, std::cerr);
        AppContext ctx(ui, dir.path());
        std::exit(Translate(ctx, job()) ? 0 : 1);
      },
      ::testing::ExitedWithCode(1), "information: VORN Zurevazidu\nTranslation cancelled.");
  expectUntouched();
}

}  // namespace
}  // namespace zv
