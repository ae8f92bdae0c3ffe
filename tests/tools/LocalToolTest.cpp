// The localization tool: its three modes and the height each point is taken
// at, the round trip grid -> local -> grid, its failures (a message and no
// output), and the Translate window's "Local.EXE" run through the built tool.

#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "app/AppContext.h"
#include "app/WindowRoutines.h"
#include "ngs/NgsGrids.h"
#include "pintrel/Localizer.h"
#include "platform/Numbers.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;
using test::Take;

const std::string kCatalogs = ZV_SOURCE_DIR "/appdata";
const std::string kSystem = "State Plane 1983";
const std::string kZone = "Wisconsin Central 4802";

// Three points of one zone in metres: an ellipsoid height, an elevation with
// the file's geoid height, an elevation alone; and one without grid
// coordinates.
const std::string kGrid = CrLf({"AC:PR",
                                "CS:State Plane 1983",
                                "ZN:Wisconsin Central 4802",
                                "HD:NAD 83",
                                "UL:M",
                                "AC:OS",
                                "PN:101",
                                "YC:75000.0000",
                                "XC:600000.0000",
                                "ZC:300.0000",
                                "HE:266.0000",
                                "AC:OS",
                                "PN:102",
                                "YC:76000.0000",
                                "XC:650000.0000",
                                "ZC:310.0000",
                                "HG:-34.000",
                                "AC:OS",
                                "PN:103",
                                "YC:74000.0000",
                                "XC:550000.0000",
                                "ZC:305.0000",
                                "AC:OS",
                                "PN:104",
                                "YC:-99999.0000",
                                "XC:-99999.0000",
                                "ZC:1.0000"});

// The factor at a position in metres; the zone is in U.S. survey feet.
double FactorAt(double northing, double easting, double h) {
  const double feet = 3937.0 / 1200.0;
  const auto f = local::FactorsAt(kCatalogs, kSystem, kZone, northing * feet, easting * feet, h);
  EXPECT_TRUE(f.has_value());
  return f ? f->combined : 0.0;
}

std::vector<std::string> Lines(const std::string& path) {
  std::vector<std::string> lines;
  std::istringstream in(ReadFile(path));
  for (std::string line; std::getline(in, line);) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    lines.push_back(line);
  }
  return lines;
}

// The value of the first line starting with prefix.
std::string After(const std::string& path, const std::string& prefix) {
  for (const std::string& line : Lines(path))
    if (line.rfind(prefix, 0) == 0) return line.substr(prefix.size());
  return "<none>";
}

class LocalToolTest : public ::testing::Test {
 protected:
  // The message of a failed job; empty when it succeeded.
  std::string run(const std::vector<std::string>& job, const std::string& app = kCatalogs) {
    std::string error;
    const std::optional<local::LocalJob> parsed = local::ParseJob(job, error);
    return parsed ? local::RunJob(*parsed, app, report) : error;
  }
  double factorOf(const std::string& path) {
    return ToNumber(After(path, "CM:COMB. FACTOR =")).value_or(0.0);
  }

  test::TempDir dir;
  const std::string grid = dir.write("grid.ctl", kGrid);
  const std::string report = dir.file("LATLONG.OUT");
  const std::string out = dir.file("out.ctl");
  const std::string stem = dir.file("out");
};

TEST_F(LocalToolTest, EachModeFindsItsFactor) {
  const double f101 = FactorAt(75000, 600000, 266), f102 = FactorAt(76000, 650000, 276),
               f103 = FactorAt(74000, 550000, 305);
  ASSERT_EQ(run({grid, stem, "1", ""}), "");
  EXPECT_NEAR(factorOf(out), (f101 + f102 + f103) / 3, 1e-10);
  const std::string all = ReadFile(report);
  EXPECT_NE(all.find("Points used: 3"), std::string::npos) << all;
  for (const char* source : {"ellipsoid height: 1", "elevation + geoid height of the file: 1",
                             "elevation (no geoid height): 1"}) {
    EXPECT_NE(all.find(source), std::string::npos) << source << "\n" << all;
  }

  // The point is found by its number.
  fs::remove(report);
  ASSERT_EQ(run({grid, stem, "3", "0102"}), "");
  EXPECT_NEAR(factorOf(out), f102, 1e-10);
  EXPECT_TRUE(fs::exists(report));

  fs::remove(report);
  ASSERT_EQ(run({grid, stem, "2", "1.0002"}), "");
  EXPECT_EQ(After(out, "CM:COMB. FACTOR = "), "1.0002000000");
  EXPECT_EQ(After(out, "YC:"), "74985.0030");  // 75000 / 1.0002
  EXPECT_FALSE(fs::exists(report));
}

TEST_F(LocalToolTest, GeoidGridGivesTheHeightOfAnElevation) {
  test::TempDir app;
  for (const char* name : {"zones.ini", "datums.ini", "ellipsoids.ini"})
    fs::copy_file(kCatalogs + "/" + name, app.file(name));
  fs::create_directories(app.file("NGS/GEOID"));
  GeoidGrid geoid;
  geoid.south = 42, geoid.west = 266, geoid.dlat = geoid.dlon = 0.5;
  geoid.nla = 9, geoid.nlo = 13;
  geoid.values.assign(9 * 13, -33.5f);
  std::ofstream file(app.file("NGS/GEOID/g2009u05.bin"), std::ios::binary);
  WriteGeoidGrid(file, geoid);
  file.close();

  ASSERT_EQ(run({grid, stem, "3", "103"}, app.path()), "");
  EXPECT_NEAR(factorOf(out), FactorAt(74000, 550000, 305 - 33.5), 1e-10);
  EXPECT_NE(ReadFile(report).find("elevation + geoid height of the grid (GEOID09): 1"),
            std::string::npos)
      << ReadFile(report);
}

TEST_F(LocalToolTest, GridToLocalToGridRestoresTheFile) {
  const std::string sample = kCatalogs + "/samples/sample.ctl";
  ASSERT_EQ(run({sample, dir.file("local"), "1", ""}), "");
  const std::string local = dir.file("local.ctl");
  const std::vector<std::string> header = {
      "CS:State Plane 1983", "CM:ORIGINAL ZN:4802", "CM:ORIGINAL HD:NAD 83",
      std::string("CM:COMB. FACTOR = ").append(After(local, "CM:COMB. FACTOR = ")), "VD:NAVD 88"};
  const std::vector<std::string> lines = Lines(local);
  EXPECT_EQ(std::vector<std::string>(lines.begin() + 2, lines.begin() + 7), header);
  const double factor = factorOf(local);
  EXPECT_GT(factor, 0.9998);
  EXPECT_LT(factor, 1.0);

  ASSERT_EQ(run({local, dir.file("back"), "1983", "4802", After(local, "CM:COMB. FACTOR =")}), "");
  const std::vector<std::string> original = Lines(sample), back = Lines(dir.file("back.ctl"));
  ASSERT_EQ(back.size(), original.size());
  for (size_t i = 0; i < back.size(); ++i) {
    const std::string tag = original[i].substr(0, 3);
    if (tag != "YC:" && tag != "XC:") {
      EXPECT_EQ(back[i], original[i]);
      continue;
    }
    // 0.1 mm in U.S. survey feet.
    EXPECT_NEAR(std::stod(back[i].substr(3)), std::stod(original[i].substr(3)), 0.000328)
        << original[i];
  }
}

TEST_F(LocalToolTest, FailuresLeaveAMessageAndNoOutput) {
  const std::string noDatum = dir.write("nodatum.ctl", CrLf({"AC:PR", "ZN:X", "AC:OS"}));
  const std::string nowhere = dir.write(
      "nowhere.ctl", CrLf({"AC:PR", "ZN:Nowhere", "HD:NAD 83", "AC:OS", "YC:1.0", "XC:2.0"}));
  const std::string badNumber = dir.write(
      "bad.ctl", CrLf({"AC:PR", "CM:COMB. FACTOR = 1.0001", "AC:OS", "YC:12a", "XC:2.0"}));
  struct Case {
    std::vector<std::string> job;
    std::string message;
  };
  const Case cases[] = {
      {{grid, stem, "1983", "9999", "1"},
       "The zone code 9999 is not a zone of State Plane 1983 in zones.ini."},
      {{grid, stem, "1927", "0101", "0"}, "The combined factor '0' is not a positive number."},
      {{grid, stem, "2", "-1"}, "The combined factor '-1' is not a positive number."},
      {{grid, stem, "3", "999"}, "The point '999' is not in '" + grid + "'."},
      {{grid, stem, "3", "104"}, "The point '104' of '" + grid + "' has no grid coordinates"},
      {{dir.file("none.ctl"), stem, "1", ""},
       std::string("The file '").append(dir.file("none.ctl")) + "' can not be read."},
      {{noDatum, stem, "2", "1"}, "holds no grid coordinates: its header has no HD and ZN"},
      {{nowhere, stem, "1", ""}, "The zone 'Nowhere' of '" + nowhere + "' is not in zones.ini."},
      {{badNumber, stem, "1983", "0101", "1"}, "('YC:12a') does not hold a number."},
      {{grid, stem}, "The job file does not hold a localization job (2 lines)."},
  };
  for (const Case& c : cases) {
    EXPECT_NE(run(c.job).find(c.message), std::string::npos) << c.message << "\n" << run(c.job);
    EXPECT_FALSE(fs::exists(out)) << c.message;
  }
}

// Dialogs that press OK at once with a preset request.
struct OkDialogs : EngineDialogs {
  bool coordinateConversion(AppContext&, ConversionState&, bool) override { return false; }
  bool enterPoint(const ManualEntrySetup&, SurveyPoint&) override { return false; }
  void showReport(const std::string&) override {}
  bool gridToLocal(AppContext&, const std::string& in, const std::string& out,
                   const GridToLocalRunner& run) override {
    return run({in, out, 1, "", 0, 0});
  }
  bool localToGrid(AppContext&, const RecordedGridReference& recorded, const std::string& in,
                   const std::string& out, const LocalToGridRunner& run) override {
    return run({in, out, recorded.horizontalDatum, zone, recorded.combinedFactor, 0, 0});
  }
  std::string zone = "4802";
};

TEST_F(LocalToolTest, WindowRunsTheBuiltToolAndShowsItsReportOrMessage) {
  ScriptedUi ui;
  AppContext ctx(ui, ZV_APP_DIR);
  OkDialogs dialogs;
  ctx.dialogs = &dialogs;
  const WindowRoutine* routine = FindWindowRoutine("Local.EXE");
  ASSERT_NE(routine, nullptr);
  const std::string local = dir.file("local.ctl"), back = dir.file("back.ctl");
  WindowRun toLocal{ctx, {grid, local, "", "", "", ""}, false, {}, {}};
  ASSERT_TRUE(routine->run(toLocal)) << Take(ui);
  EXPECT_EQ(After(local, "CM:ORIGINAL ZN:"), "4802");
  const std::string report = std::string(ZV_APP_DIR) + "/Pintrel/LATLONG.OUT";
  EXPECT_EQ(ui.editors, std::vector<std::string>{"viewer: Out File (*.OUT): " + report});
  EXPECT_FALSE(fs::exists(report));

  // The tool's message instead of a completion; the empty output made for
  // the tool is gone again.
  dialogs.zone = "9999";
  WindowRun toGrid{ctx, {local, back, "", "", "", ""}, false, {}, {}};
  EXPECT_FALSE(routine->run(toGrid));
  EXPECT_EQ(Take(ui),
            "E Local.EXE: The zone code 9999 is not a zone of State Plane 1983 in zones.ini.");
  EXPECT_FALSE(fs::exists(back));

  dialogs.zone = "4802";
  ASSERT_TRUE(routine->run(toGrid)) << Take(ui);
  EXPECT_EQ(Lines(back), Lines(grid));
}

}  // namespace
}  // namespace zv
