// The routines that open the Coordinate Conversion dialog: "SinglePoint" and
// "MultiPoint" from the window, and the manual mode of the batch exchange.

#include <gtest/gtest.h>

#include <filesystem>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "app/WindowRoutines.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/SurveyFiles.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;

// Records how the dialog was opened; accepts with UTM 16N metres, or cancels.
class ScriptedDialogs : public EngineDialogs {
 public:
  bool coordinateConversion(AppContext& ctx, ConversionState& state, bool presetInput) override {
    const ConversionSettings& s = state.settings;
    calls.push_back(std::string(state.singlePoint ? "single " : "file ") +
                    (presetInput ? "preset " : "") + s.inputCoordinateSystem + "|" + s.inputZone +
                    "|" + s.inputHorizontalUnits + "|" + std::to_string(state.points.size()));
    state.accepted = false;
    if (!accept) return false;
    state.settings.outputCoordinateSystem = "UTM NAD 83";
    state.settings.outputZone = "Zone 16N";
    state.settings.outputHorizontalDatum = s.inputHorizontalDatum;
    state.settings.outputVerticalDatum = s.inputVerticalDatum;
    state.settings.outputHorizontalUnits = state.settings.outputVerticalUnits = "Meters";
    state.accepted = ConvertPoints(ctx.ui, ctx.appFolder, state);
    return state.accepted;
  }
  bool enterPoint(const ManualEntrySetup&, SurveyPoint&) override { return false; }
  void showReport(const std::string&) override {}

  bool accept = true;
  std::vector<std::string> calls;
};

class ConversionRoutinesTest : public ::testing::Test {
 protected:
  ConversionRoutinesTest() : ctx(ui, dir.path()) {
    test::InstallCatalogs(dir.path());
    ctx.dialogs = &dialogs;
  }
  bool runWindow(const std::string& program, const std::string& inType, const std::string& outType,
                 const std::string& out) {
    WindowRun run{ctx, {input, out, "", inType, outType, "Reproject"}, false, {}, {}};
    return FindWindowRoutine(program)->run(run);
  }
  test::TempDir dir;
  ScriptedUi ui;
  ScriptedDialogs dialogs;
  AppContext ctx;
  std::string input = dir.write(
      "job.ctl", CrLf({"PR:Job 7", "AC:PR", "CS:State Plane 1983", "ZN:Wisconsin Central 4802",
                       "HD:NAD 83", "VD:NAVD 88", "UL:F", "AC:OS", "PN:CP100", "YC:247795.6047",
                       "XC:2072520.8575", "ZC:1102.3400"}));
};

TEST_F(ConversionRoutinesTest, MultiPointWritesEveryReprojectionTypeAndRefusesTheOthers) {
  const std::string kCtl = "VORN Control Files (*.CTL)";
  struct Case {
    std::string in, out;
    bool accept, done;
    std::string box, title;
  } cases[] = {
      {kCtl, "VORN Project Files (*.PRJ)", true, true, "Translation Complete.", "VORN Zurevazidu"},
      {kCtl, "NGS Data Sheets (*.DS)", true, false,
       "Can not write the reprojected file to NGS Data Sheets (*.DS)", "Invalid Format"},
      {"User-Defined ASCII Files (*.*)", kCtl, true, false,
       "Can not reproject User-Defined ASCII Files (*.*)", "Invalid Format"},
      {kCtl, kCtl, false, false, "", ""},  // the dialog cancelled: nothing written
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.in + " to " + c.out);
    ui.boxes.clear();
    dialogs.calls.clear();
    dialogs.accept = c.accept;
    const std::string out = dir.file("out.file");
    std::filesystem::remove(out);
    EXPECT_EQ(runWindow("MultiPoint", c.in, c.out, out), c.done);
    EXPECT_EQ(ui.boxes.empty() ? "" : ui.onlyText() + "|" + ui.boxes[0].title,
              c.box.empty() ? "" : c.box + "|" + c.title);
    EXPECT_EQ(std::filesystem::exists(out), c.done);
    const bool opened = c.in == kCtl;
    EXPECT_EQ(dialogs.calls, opened ? std::vector<std::string>{"file preset State Plane 1983|"
                                                               "Wisconsin Central 4802|U.S. "
                                                               "Survey Feet|1"}
                                    : std::vector<std::string>{});
  }
  // The project file holds the converted point under the output reference.
  dialogs.accept = true;
  ASSERT_TRUE(runWindow("MultiPoint", kCtl, "VORN Project Files (*.PRJ)", dir.file("job.prj")));
  WorkArea back;
  ASSERT_TRUE(ReadProjectFile(ui, back, dir.file("job.prj")));
  EXPECT_EQ(back.InputHeader.ProjectLine + "|" + back.InputHeader.Zone, "PR:Job 7|Zone 16N");
  ASSERT_EQ(back.InputPoints.size(), 1u);
  EXPECT_NEAR(back.InputPoints[0].Northing, 4932071.8324, 0.00005);
  EXPECT_NEAR(back.InputPoints[0].Easting, 293250.0789, 0.00005);
}

TEST_F(ConversionRoutinesTest, SinglePointOpensTheDialogForOnePointWithoutAMessage) {
  dialogs.accept = false;
  EXPECT_FALSE(runWindow("SinglePoint", "Coordinate Conversion Manual Entry",
                         "Coordinate Conversion Manual Entry", ""));
  EXPECT_EQ(dialogs.calls, std::vector<std::string>{"single |||1"});
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ConversionRoutinesTest, ManualBatchModeOffersTheRequestAsTheInputSide) {
  struct Case {
    std::string plane, point, call;
    bool accept;
  } cases[] = {
      {"Plane", "CP1,247795.6047,2072520.8575,1102.34,,,",
       "file preset State Plane 1983|Wisconsin Central 4802|U.S. Survey Feet|1", true},
      {"Geographic", "CP1,44.30444420,89.36044424,994.07",
       "file preset Geographic Coordinates||DDD.MMSSssss|1", true},
      {"Plane", "CP1,247795.6047,2072520.8575,1102.34,,,",
       "file preset State Plane 1983|Wisconsin Central 4802|U.S. Survey Feet|1", false},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.plane + (c.accept ? " accepted" : " cancelled"));
    dialogs.calls.clear();
    dialogs.accept = c.accept;
    // Line 3 differs from "Automatic" in letter case only: the manual mode.
    dir.write("tccin.tmp",
              CrLf({"Caller", "1", "automatic", c.plane, "State Plane 1983",
                    "Wisconsin Central 4802", "83", "88", "F", "F", "Orthometric", "", c.point}));
    EXPECT_EQ(Translate(ctx, {"", "tccin.tmp", "tccout.tmp", ""}), c.accept);
    EXPECT_EQ(dialogs.calls, std::vector<std::string>{c.call});
    const std::string answer = ReadFile(dir.file("tccout.tmp"));
    EXPECT_EQ(answer.empty() ? "" : answer.substr(answer.find("Manual"), 6),
              c.accept ? "Manual" : "");
  }
}

}  // namespace
}  // namespace zv
