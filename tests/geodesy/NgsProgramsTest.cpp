// The NGS program runs: the files written for the programs (seen by small
// scripts standing in their place), the reading of their output, the
// clean-up, and the stand-in programs of the build on synthetic grids.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cmath>
#include <filesystem>

#include "geodesy/Angles.h"
#include "geodesy/NgsPrograms.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;

constexpr double kDeg = kDegreesToRadians;

SurveyPoint Point(const std::string& name, double latDeg, double lonDeg) {
  SurveyPoint p;
  p.PointName = name;
  p.Latitude = latDeg * kDeg;
  p.Longitude = lonDeg * kDeg;
  p.VerticalUnits = kMeters;
  return p;
}

std::vector<std::string> FilesIn(const std::string& folder) {
  std::vector<std::string> names;
  for (const auto& e : fs::directory_iterator(folder)) names.push_back(e.path().filename());
  std::sort(names.begin(), names.end());
  return names;
}

// Output lines: latitude and west longitude in columns 1-14 and 17-30, a
// value in columns 33-39 (VERTCON) or 33-40 (GEOID), the name from column 41.
std::string Coordinates(double lat, double lon) {
  char text[64];
  std::snprintf(text, sizeof text, "%14.9f  %14.9f", lat, lon);
  return text;
}
std::string OutLine(double lat, double lon, const std::string& name) {
  return Coordinates(lat, lon) + std::string(10, ' ') + name;
}
std::string VertLine(double shift, const std::string& name) {
  char text[32];
  std::snprintf(text, sizeof text, "  %7.3f ", shift);
  return Coordinates(36, 98) + text + name;
}
std::string GeoidLine(double n, const std::string& name) {
  char text[32];
  std::snprintf(text, sizeof text, "  %8.3f", n);
  return Coordinates(48, 99) + text + name;
}

class NgsRunTest : public ::testing::Test {
 protected:
  // A program that keeps what it is given (keyboard answers, input file,
  // batch file, folder listing) and answers with the file `reply` of the
  // capture folder, plus `screen` on its standard output.
  void fake(const std::string& folder, const std::string& exe, const std::string& stem,
            const std::string& screen = "") {
    const std::string c = capture.path();
    std::string script = "#!/bin/sh\ncat > '" + c + "/" + stem + ".con'\ncp " + stem + ".inp '" +
                         c + "/'\ncp " + stem + ".bat '" + c + "/'\nls > '" + c +
                         "/listing'\n[ -f '" + c + "/reply' ] && cp '" + c + "/reply' " + stem +
                         ".out\nprintf '" + screen + "'\n";
    std::string path = app.write("NGS/" + folder + "/" + exe, script);
    ::chmod(path.c_str(), 0755);
  }
  void reply(const std::vector<std::string>& lines) { capture.write("reply", CrLf(lines)); }
  std::string seen(const std::string& name) { return ReadFile(capture.file(name)); }

  test::TempDir app;
  test::TempDir capture;
  ScriptedUi ui;
};

TEST_F(NgsRunTest, NadconGetsItsAnswersAndPointsAndLeavesNothingBehind) {
  fake("NADCON", "ndcon210", "nadcon");
  std::vector<SurveyPoint> points{Point("P1", 45.5, 111.25), Point("S1", 28.5, 3.5),
                                  Point("NOLON", 40, 0)};
  points[1].LatitudeHemisphere = "S";   // 28.5 S
  points[1].LongitudeHemisphere = "E";  // 3.5 E = 356.5 W
  points[2].Longitude = kNoValue;
  reply({"header", OutLine(45.500100000, 111.250200000, "P1"),
         OutLine(-28.499900000, 356.499800000, "S1")});

  ASSERT_TRUE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83")) << ui.onlyText();
  EXPECT_EQ(seen("nadcon.con"),
            CrLf({"", "", "", "", "", "", "Y", "nadcon.out", "Y", "nadcon.inp", "2", "N", "Q"}));
  EXPECT_EQ(seen("nadcon.bat"), CrLf({"del nadcon.out", "del junk", "ndcon210 <nadcon.con >junk"}));
  EXPECT_EQ(seen("nadcon.inp"), CrLf({"45.500000000 111.250000000               P1",
                                      "-28.500000000 356.500000000              S1"}));
  EXPECT_EQ(seen("listing"), "junk\nnadcon.bat\nnadcon.con\nnadcon.inp\nndcon210\n");
  EXPECT_EQ(FilesIn(app.file("NGS/NADCON")), std::vector<std::string>{"ndcon210"});

  EXPECT_NEAR(points[0].Latitude / kDeg, 45.5001, 1e-12);
  EXPECT_NEAR(points[0].Longitude / kDeg, 111.2502, 1e-12);
  // Back in the point's own hemispheres.
  EXPECT_NEAR(points[1].Latitude / kDeg, 28.4999, 1e-12);
  EXPECT_NEAR(points[1].Longitude, (360 - 356.4998) * kDeg, 1e-12);
  EXPECT_EQ(points[2].Latitude, 40 * kDeg);
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(NgsRunTest, NadconMethodsPickTheAreaAndDirection) {
  fake("NADCON", "ndcon210", "nadcon");
  std::vector<SurveyPoint> points{Point("A", 44, 90)};
  reply({"h", OutLine(44.000000000, 90.000000000, "A")});
  auto control = [&](const std::string& method) {
    EXPECT_TRUE(Nadcon_Run(ui, app.path(), points, method)) << method;
    return seen("nadcon.con");
  };
  const auto tail = std::vector<std::string>{"nadcon.out", "Y", "nadcon.inp", "2", "N", "Q"};
  auto with = [&](std::vector<std::string> head) {
    head.insert(head.end(), tail.begin(), tail.end());
    return CrLf(head);
  };
  EXPECT_EQ(control("NADCON NAD 83 to NAD 27"), with({"", "", "", "", "", "", "N"}));
  EXPECT_EQ(control("NADCON NAD 83 (1986) to Wisconsin HPGN"),
            with({"", "", "", "", "A", "WI", "", "Y"}));
  EXPECT_EQ(control("NADCON Texas HPGN to NAD 83 (1986) (West of 100\xC2\xB0 Longitude)"),
            with({"", "", "", "", "A", "WT", "", "N"}));
  // Older catalogs hold the degree sign as the Latin-1 byte 176.
  EXPECT_EQ(control("NADCON Texas HPGN to NAD 83 (1986) (East of 100\xB0 Longitude)"),
            with({"", "", "", "", "A", "ET", "", "N"}));
  EXPECT_EQ(control("NADCON Alabama HPGN to NAD 83 (1996)"),
            with({"", "", "", "", "A", "AL", "", "N"}));

  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON Alabama HPGN to NAD 83 (1986)"));
  EXPECT_EQ(ui.boxes.back().text, "Unkown NADCON Conversion.");
  EXPECT_EQ(ui.boxes.back().title, "Unkown NADCON Conversion");

  // The table holds every NADCON method the shipped datums.ini uses.
  const auto& methods = NadconMethods();
  EXPECT_EQ(methods.size(), 100u);
  EXPECT_EQ(methods[8].name, "NADCON NAD 83 (1986) to California HPGN (Above 37\xC2\xB0 Latitude)");
  EXPECT_EQ(methods[9].name, "NADCON California HPGN to NAD 83 (1986) (Above 37\xC2\xB0 Latitude)");
  EXPECT_EQ(methods[54].name, "NADCON NAD 83 (1986) to New England HPGN (CT, MA, NH, RI, VT)");
  std::vector<std::string> lines;
  ASSERT_TRUE(ReadTextLines(std::string(ZV_APP_DIR) + "/datums.ini", lines));
  for (const std::string& line : lines) {
    size_t eq = line.find("=NADCON");
    if (eq == std::string::npos) continue;
    const std::string method = line.substr(eq + 1);
    EXPECT_TRUE(std::any_of(methods.begin(), methods.end(), [&](const NadconMethod& m) {
      return m.name == method;
    })) << method;
  }
}

TEST_F(NgsRunTest, OutputLinesFindTheirPointsInListOrder) {
  fake("NADCON", "ndcon210", "nadcon");
  // Two points of one name: the first line goes to the first, the second
  // to the second; a point without coordinates takes no line.
  std::vector<SurveyPoint> points{Point("X", 40, 100), Point("X", 0, 0), Point("X", 41, 101),
                                  Point("Y", 42, 102)};
  points[1].Latitude = kNoValue;
  reply({"h", OutLine(40.000100000, 100.000100000, "X"), OutLine(41.000200000, 101.000200000, "X"),
         OutLine(42.000300000, 102.000300000, "Y")});
  ASSERT_TRUE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_NEAR(points[0].Latitude / kDeg, 40.0001, 1e-12);
  EXPECT_EQ(points[1].Latitude, kNoValue);
  EXPECT_NEAR(points[2].Latitude / kDeg, 41.0002, 1e-12);
  EXPECT_NEAR(points[3].Latitude / kDeg, 42.0003, 1e-12);
}

TEST_F(NgsRunTest, FailuresNameTheProgramTheGridAndThePoint) {
  std::vector<SurveyPoint> points{Point("P1", 45, 100), Point("FAR", 10, 100)};
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(ui.onlyText(),
            "The NADCON program 'ndcon210' was not found in '" + app.file("NGS/NADCON") + "'.");
  EXPECT_EQ(ui.boxes[0].title, "NADCON Error");

  // No output: the program's own reason is quoted.
  ui.boxes.clear();
  fake("NADCON", "ndcon210", "nadcon", "Reading grids\\nERROR: The grid file x was not found.\\n");
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(ui.onlyText(), "NADCON wrote no output file '" + app.file("NGS/NADCON/nadcon.out") +
                               "'.\r\n\r\nThe grid file x was not found.");

  // A point that got no line fails the run instead of staying unshifted.
  ui.boxes.clear();
  reply({"h", OutLine(45.000100000, 100.000100000, "P1")});
  fake("NADCON", "ndcon210", "nadcon", "ERROR: Point FAR lies outside.\\n");
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(ui.onlyText(),
            "NADCON returned no result for point 'FAR'.\r\n\r\nPoint FAR lies outside.");
  EXPECT_EQ(FilesIn(app.file("NGS/NADCON")), std::vector<std::string>{"ndcon210"});
}

TEST_F(NgsRunTest, VertconShiftsPresentElevationsInTheirUnits) {
  fake("VERTCON", "vertcon", "vertcon");
  std::vector<SurveyPoint> points{Point("M", 36, 98), Point("F", 36, 98), Point("NONE", 36, 98)};
  points[0].Elevation = 100.0;
  points[1].Elevation = 328.0;
  points[1].VerticalUnits = kUsSurveyFeet;
  reply({"header", VertLine(0.202, "M"), VertLine(0.202, "F"), VertLine(0.202, "NONE")});
  ASSERT_TRUE(Vertcon_Run(ui, app.path(), points, true)) << ui.onlyText();
  EXPECT_EQ(seen("vertcon.con"), CrLf({"Y", "2", "vertcon.inp", "N", "vertcon.out"}));
  EXPECT_EQ(seen("vertcon.bat"),
            CrLf({"del vertcon.out", "del junk", "vertcon oht <vertcon.con >junk"}));
  EXPECT_DOUBLE_EQ(points[0].Elevation, 100.202);
  EXPECT_DOUBLE_EQ(points[1].Elevation, 328.0 + 0.202 * 3.2808333333333333);
  EXPECT_EQ(points[2].Elevation, kNoValue);

  ASSERT_TRUE(Vertcon_Run(ui, app.path(), points, false));
  EXPECT_NEAR(points[0].Elevation, 100.0, 1e-12);
  EXPECT_EQ(FilesIn(app.file("NGS/VERTCON")), std::vector<std::string>{"vertcon"});
}

TEST_F(NgsRunTest, GeoidModelsAndMethods) {
  fake("GEOID", "intg", "geoid");
  std::vector<SurveyPoint> points{Point("A", 48, 99), Point("B", 48, 99)};
  points[0].Elevation = 500.0;
  points[1].EllipsoidHeight = 470.0;
  reply({GeoidLine(-23.33, "A"), GeoidLine(-23.33, "B")});

  ASSERT_TRUE(Geoid_Run(ui, app.path(), points, "GEOID06")) << ui.onlyText();
  EXPECT_EQ(seen("geoid.con"),
            CrLf({"", "", "", "5", "", "2", "2", "2", "geoid.inp", "geoid.out"}));
  EXPECT_EQ(seen("geoid.bat"), CrLf({"del geoid.out", "del junk", "intg <geoid.con >junk"}));
  EXPECT_DOUBLE_EQ(points[0].GeoidHeight, -23.33);
  EXPECT_EQ(points[0].Text19, "GEOID06");
  EXPECT_EQ(points[0].EllipsoidHeight, kNoValue);
  EXPECT_EQ(points[1].Elevation, kNoValue);

  ASSERT_TRUE(Geoid_Run(ui, app.path(), points, "GEOID99 NAVD 88 to NAD 83"));
  EXPECT_EQ(seen("geoid.con"),
            CrLf({"", "", "", "1", "", "2", "2", "2", "geoid.inp", "geoid.out"}));
  EXPECT_DOUBLE_EQ(points[0].EllipsoidHeight, 500.0 - 23.33);
  EXPECT_EQ(points[1].EllipsoidHeight, kNoValue);  // no orthometric height
  EXPECT_EQ(points[0].Text19, "GEOID99 NAVD 88 to NAD 83");

  points[1].EllipsoidHeight = 470.0;
  ASSERT_TRUE(Geoid_Run(ui, app.path(), points, "GEOID09 NAD 83 to NAVD 88"));
  EXPECT_DOUBLE_EQ(points[1].Elevation, 470.0 + 23.33);

  EXPECT_FALSE(Geoid_Run(ui, app.path(), points, "GEOID12 NAD 83 to NAVD 88"));
  EXPECT_EQ(ui.boxes.back().text, "Unknown geoid model 'GEOID12'.");
  EXPECT_EQ(ui.boxes.back().title, "Unknown Geoid Model");
  EXPECT_FALSE(Geoid_Run(ui, app.path(), points, "GEOID09 WGS 84 to NAD 83"));
  EXPECT_EQ(ui.boxes.back().text,
            "Can not perform vertical datum transformation 'GEOID09 WGS 84 to NAD 83'.");
  EXPECT_EQ(ui.boxes.back().title, "Aborting Datum Transformation");
  EXPECT_EQ(ui.boxes.size(), 2u);
}

// The stand-in programs of the build on grids written here.
class NgsStandInTest : public NgsRunTest {
 protected:
  NgsStandInTest() { test::InstallAllStandIns(app.path()); }
};

TEST_F(NgsStandInTest, NadconShiftsByItsGridAndBack) {
  // Shifts linear across the grid, so bilinear interpolation is exact:
  // las = 0.25 + 0.5 (lon + 112) arc-seconds, los = 2 + 0.25 (lat - 44).
  auto las = [](double x, double) { return 0.25 + 0.5 * (x + 112); };
  auto los = [](double, double y) { return 2.0 + 0.25 * (y - 44); };
  const std::string folder = app.file("NGS/NADCON/");
  test::SaveShiftGrid(folder + "conus.las", test::MakeShiftGrid(-112, 44, 0.25, 25, 17, las));
  test::SaveShiftGrid(folder + "conus.los", test::MakeShiftGrid(-112, 44, 0.25, 25, 17, los));

  std::vector<SurveyPoint> points{Point("P", 45.7626543, 111.1864197)};
  ASSERT_TRUE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83")) << ui.onlyText();
  const double lat83 = 45.7626543 + (0.25 + 0.5 * 0.8135803) / 3600;
  const double lon83 = 111.1864197 + (2.0 + 0.25 * 1.7626543) / 3600;
  EXPECT_NEAR(points[0].Latitude / kDeg, lat83, 1e-9);
  EXPECT_NEAR(points[0].Longitude / kDeg, lon83, 1e-9);

  ASSERT_TRUE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 83 to NAD 27")) << ui.onlyText();
  EXPECT_NEAR(points[0].Latitude / kDeg, 45.7626543, 2e-9);
  EXPECT_NEAR(points[0].Longitude / kDeg, 111.1864197, 2e-9);
  EXPECT_EQ(FilesIn(folder), (std::vector<std::string>{"conus.las", "conus.los", "ndcon210"}));
}

TEST_F(NgsStandInTest, NadconNamesTheMissingGridAndThePointOutside) {
  const std::string folder = app.file("NGS/NADCON");
  std::vector<SurveyPoint> points{Point("P", 45, 100), Point("FAR", 10, 100)};
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 83 (1986) to Wisconsin HPGN"));
  EXPECT_EQ(ui.onlyText(),
            "NADCON wrote no output file '" + folder +
                "/nadcon.out'.\r\n\r\nThe grid file 'wihpgn.las' was not found in '" + folder +
                "'.");

  auto zero = [](double, double) { return 0.0; };
  test::SaveShiftGrid(folder + "/conus.las", test::MakeShiftGrid(-110, 40, 1, 20, 10, zero));
  test::SaveShiftGrid(folder + "/conus.los", test::MakeShiftGrid(-110, 40, 1, 20, 10, zero));
  ui.boxes.clear();
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(ui.onlyText(),
            "NADCON returned no result for point 'FAR'.\r\n\r\nPoint 'FAR' at "
            "10.000000000 N, 100.000000000 W lies outside the NADCON grids in '" +
                folder + "' (conus).");
}

TEST_F(NgsStandInTest, VertconAndGeoidFromTheirGrids) {
  // VERTCON central grid in millimetres: 100 + 20 (lon + 107) - 10 (lat - 24).
  test::SaveShiftGrid(app.file("NGS/VERTCON/vertconc.94"),
                      test::MakeShiftGrid(-107, 24, 0.05, 461, 521, [](double x, double y) {
                        return 100 + 20 * (x + 107) - 10 * (y - 24);
                      }));
  std::vector<SurveyPoint> points{Point("V", 36.176388889, 98.669444444), Point("W", 36.2, 120.0)};
  points[0].Elevation = 10.0;
  points[1].Elevation = 10.0;
  EXPECT_FALSE(Vertcon_Run(ui, app.path(), points, true));
  EXPECT_EQ(ui.onlyText(),
            "VERTCON returned no result for point 'W'.\r\n\r\nPoint 'W' at 36.200000000 N, "
            "120.000000000 W lies outside the VERTCON grids in '" +
                app.file("NGS/VERTCON") + "' (vertconc.94; not found: vertconw.94, vertcone.94).");
  const double mm = 100 + 20 * (107 - 98.669444444) - 10 * (36.176388889 - 24);
  EXPECT_NEAR(points[0].Elevation, 10.0 + mm / 1000, 0.0005);  // 3 decimals in the output

  // GEOID09: a bilinear surface, which the splines reproduce.
  auto n = [](double lat, double lon) { return -30.0 + 0.5 * (lat - 40) - 0.25 * (lon - 255); };
  test::SaveGeoidGrid(app.file("NGS/GEOID/g2009u04.bin"),
                      test::MakeGeoidGrid(40, 255, 1.0 / 60, 600, 600, n), true);
  std::vector<SurveyPoint> g{Point("G", 48.071790872, 99.245864017)};
  ui.boxes.clear();
  ASSERT_TRUE(Geoid_Run(ui, app.path(), g, "GEOID09")) << ui.onlyText();
  EXPECT_NEAR(g[0].GeoidHeight, n(48.071790872, 360 - 99.245864017), 0.0005);

  EXPECT_FALSE(Geoid_Run(ui, app.path(), g, "GEOID03"));
  EXPECT_EQ(ui.onlyText(), "GEOID wrote no output file '" + app.file("NGS/GEOID/geoid.out") +
                               "'.\r\n\r\nNo GEOID03 grid files (g2003*.bin) were found in '" +
                               app.file("NGS/GEOID") + "'.");
}

// The published examples, when the real NGS grids are in the build's
// application folder.
TEST(NgsPublishedExamples, NadconConus) {
  const std::string real = std::string(ZV_APP_DIR) + "/NGS/NADCON/conus.las";
  if (!fs::exists(real)) GTEST_SKIP() << "no NADCON grids in " << ZV_APP_DIR << "/NGS/NADCON";
  ScriptedUi ui;
  std::vector<SurveyPoint> points{
      Point("A", 45 + 45 / 60.0 + 45.55555 / 3600, 111 + 11 / 60.0 + 11.11111 / 3600),
      Point("B", 25 + 55.5555555 / 60, 76 + 56.6666666 / 60)};
  ASSERT_TRUE(Nadcon_Run(ui, ZV_APP_DIR, points, "NADCON NAD 27 to NAD 83")) << ui.onlyText();
  EXPECT_NEAR(points[0].Latitude / kDeg * 3600, (45 * 60 + 45) * 60 + 45.30043, 0.0001);
  EXPECT_NEAR(points[0].Longitude / kDeg * 3600, (111 * 60 + 11) * 60 + 13.94256, 0.0001);
  EXPECT_NEAR(points[1].Latitude / kDeg * 60, 25 * 60 + 55.5778817, 0.000002);
  EXPECT_NEAR(points[1].Longitude / kDeg * 60, 76 * 60 + 56.6404343, 0.000002);
}

TEST(NgsPublishedExamples, Vertcon) {
  const std::string folder = std::string(ZV_APP_DIR) + "/NGS/VERTCON/";
  if (!fs::exists(folder + "vertconc.94") || !fs::exists(folder + "vertcone.94"))
    GTEST_SKIP() << "no VERTCON grids in " << folder;
  ScriptedUi ui;
  std::vector<SurveyPoint> points{
      Point("A", 36 + 10 / 60.0 + 35 / 3600.0, 98 + 40 / 60.0 + 10 / 3600.0),
      Point("B", 36 + 10 / 60.0 + 35 / 3600.0, 78 + 40 / 60.0 + 10 / 3600.0)};
  points[0].Elevation = points[1].Elevation = 0.0;
  ASSERT_TRUE(Vertcon_Run(ui, ZV_APP_DIR, points, true)) << ui.onlyText();
  EXPECT_NEAR(points[0].Elevation, 0.202, 0.0005);
  EXPECT_NEAR(points[1].Elevation, -0.267, 0.0005);
}

}  // namespace
}  // namespace zv
