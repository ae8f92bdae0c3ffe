// Running the NGS programs: the files written for them (seen by small
// scripts standing in their place), the reading of their output, the
// failures and the clean-up.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>

#include "geodesy/Angles.h"
#include "geodesy/NgsPrograms.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;
using V = std::vector<std::string>;

constexpr double kDeg = kDegreesToRadians;

SurveyPoint Point(const std::string& name, double latDeg, double lonDeg) {
  SurveyPoint p;
  p.PointName = name;
  p.Latitude = latDeg * kDeg;
  p.Longitude = lonDeg * kDeg;
  p.VerticalUnits = kMeters;
  return p;
}

V FilesIn(const std::string& folder) {
  V names;
  for (const auto& e : fs::directory_iterator(folder)) names.push_back(e.path().filename());
  std::sort(names.begin(), names.end());
  return names;
}

// Output lines: latitude and west longitude in columns 1-14 and 17-30, a
// value in columns 33-39 (VERTCON) or 33-40 (GEOID), the name from column 41.
std::string OutLine(double lat, double lon, const std::string& value, const std::string& name) {
  char text[64];
  std::snprintf(text, sizeof text, "%14.9f  %14.9f", lat, lon);
  return text + value + name;
}
std::string OutLine(double lat, double lon, const std::string& name) {
  return OutLine(lat, lon, std::string(10, ' '), name);
}

class NgsRunTest : public ::testing::Test {
 protected:
  // A program that keeps what it is given (keyboard answers, input file,
  // batch file, folder listing) and answers with the file `reply` of the
  // capture folder, plus `screen` on its standard output.
  void fake(const std::string& folder, const std::string& exe, const std::string& stem,
            const std::string& screen = "") {
    const std::string c = capture.path();
    const std::string path = app.write(
        "NGS/" + folder + "/" + exe,
        "#!/bin/sh\ncat > '" + c + "/" + stem + ".con'\ncp " + stem + ".inp '" + c + "/'\ncp " +
            stem + ".bat '" + c + "/'\nls > '" + c + "/listing'\n[ -f '" + c + "/reply' ] && cp '" +
            c + "/reply' " + stem + ".out\nprintf '" + screen + "'\n");
    ::chmod(path.c_str(), 0755);
  }
  void reply(const V& lines) { capture.write("reply", CrLf(lines)); }
  std::string seen(const std::string& name) { return ReadFile(capture.file(name)); }

  test::TempDir app;
  test::TempDir capture;
  ScriptedUi ui;
};

TEST_F(NgsRunTest, NadconGetsItsAnswersAndPointsInListOrderAndLeavesNothingBehind) {
  fake("NADCON", "ndcon210", "nadcon");
  // Two points of one name take the lines in list order; a point without
  // coordinates takes none.
  std::vector<SurveyPoint> points{Point("P1", 45.5, 111.25), Point("S1", 28.5, 3.5),
                                  Point("NOLON", 40, 0), Point("P1", 41, 101)};
  points[1].LatitudeHemisphere = "S";   // 28.5 S
  points[1].LongitudeHemisphere = "E";  // 3.5 E = 356.5 W
  points[2].Longitude = kNoValue;
  reply({"header", OutLine(45.5001, 111.2502, "P1"), OutLine(-28.4999, 356.4998, "S1"),
         OutLine(41.0002, 101.0002, "P1")});

  ASSERT_TRUE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83")) << ui.onlyText();
  EXPECT_EQ(seen("nadcon.con"),
            CrLf({"", "", "", "", "", "", "Y", "nadcon.out", "Y", "nadcon.inp", "2", "N", "Q"}));
  EXPECT_EQ(seen("nadcon.bat"), CrLf({"del nadcon.out", "del junk", "ndcon210 <nadcon.con >junk"}));
  EXPECT_EQ(seen("nadcon.inp"), CrLf({"45.500000000 111.250000000               P1",
                                      "-28.500000000 356.500000000              S1",
                                      "41.000000000 101.000000000               P1"}));
  EXPECT_EQ(seen("listing"), "junk\nnadcon.bat\nnadcon.con\nnadcon.inp\nndcon210\n");
  EXPECT_EQ(FilesIn(app.file("NGS/NADCON")), V{"ndcon210"});

  // Back in the point's own hemispheres.
  const double want[][2] = {
      {45.5001, 111.2502}, {28.4999, 360 - 356.4998}, {40, 0}, {41.0002, 101.0002}};
  for (size_t i = 0; i < points.size(); ++i) {
    EXPECT_NEAR(points[i].Latitude / kDeg, want[i][0], 1e-12) << i;
    if (i != 2) {
      EXPECT_NEAR(points[i].Longitude / kDeg, want[i][1], 1e-12) << i;
    }
  }
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(NgsRunTest, NadconMethodsPickTheAreaAndDirection) {
  fake("NADCON", "ndcon210", "nadcon");
  std::vector<SurveyPoint> points{Point("A", 44, 90)};
  reply({"h", OutLine(44.0, 90.0, "A")});
  const struct {
    std::string method;
    V head;
  } cases[] = {
      {"NADCON NAD 83 to NAD 27", {"", "", "", "", "", "", "N"}},
      {"NADCON NAD 83 (1986) to Wisconsin HPGN", {"", "", "", "", "A", "WI", "", "Y"}},
      {"NADCON Texas HPGN to NAD 83 (1986) (West of 100\xC2\xB0 Longitude)",
       {"", "", "", "", "A", "WT", "", "N"}},
      // Older catalogs hold the degree sign as the Latin-1 byte 176.
      {"NADCON Texas HPGN to NAD 83 (1986) (East of 100\xB0 Longitude)",
       {"", "", "", "", "A", "ET", "", "N"}},
      {"NADCON Alabama HPGN to NAD 83 (1996)", {"", "", "", "", "A", "AL", "", "N"}},
  };
  for (auto c : cases) {
    EXPECT_TRUE(Nadcon_Run(ui, app.path(), points, c.method)) << c.method;
    c.head.insert(c.head.end(), {"nadcon.out", "Y", "nadcon.inp", "2", "N", "Q"});
    EXPECT_EQ(seen("nadcon.con"), CrLf(c.head)) << c.method;
  }
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON Alabama HPGN to NAD 83 (1986)"));
  EXPECT_EQ(test::Take(ui), "E Unkown NADCON Conversion: Unkown NADCON Conversion.");
}

TEST_F(NgsRunTest, FailuresNameTheProgramTheGridAndThePoint) {
  std::vector<SurveyPoint> points{Point("P1", 45, 100), Point("FAR", 10, 100)};
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(test::Take(ui), "E NADCON Error: The NADCON program 'ndcon210' was not found in '" +
                                app.file("NGS/NADCON") + "'.");

  // No output: the program's own reason is quoted.
  fake("NADCON", "ndcon210", "nadcon", "Reading grids\\nERROR: The grid file x was not found.\\n");
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(ui.onlyText(), "NADCON wrote no output file '" + app.file("NGS/NADCON/nadcon.out") +
                               "'.\r\n\r\nThe grid file x was not found.");

  // A point that got no line fails the run instead of staying unshifted.
  ui.boxes.clear();
  reply({"h", OutLine(45.0001, 100.0001, "P1")});
  fake("NADCON", "ndcon210", "nadcon", "ERROR: Point FAR lies outside.\\n");
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(ui.onlyText(),
            "NADCON returned no result for point 'FAR'.\r\n\r\nPoint FAR lies outside.");
  EXPECT_EQ(FilesIn(app.file("NGS/NADCON")), V{"ndcon210"});
}

TEST_F(NgsRunTest, VertconShiftsPresentElevationsInTheirUnits) {
  fake("VERTCON", "vertcon", "vertcon");
  std::vector<SurveyPoint> points{Point("M", 36, 98), Point("F", 36, 98), Point("NONE", 36, 98)};
  points[0].Elevation = 100.0;
  points[1].Elevation = 328.0;
  points[1].VerticalUnits = kUsSurveyFeet;
  reply({"header", OutLine(36, 98, "    0.202 ", "M"), OutLine(36, 98, "    0.202 ", "F"),
         OutLine(36, 98, "    0.202 ", "NONE")});
  ASSERT_TRUE(Vertcon_Run(ui, app.path(), points, true)) << ui.onlyText();
  EXPECT_EQ(seen("vertcon.con"), CrLf({"Y", "2", "vertcon.inp", "N", "vertcon.out"}));
  EXPECT_EQ(seen("vertcon.bat"),
            CrLf({"del vertcon.out", "del junk", "vertcon oht <vertcon.con >junk"}));
  EXPECT_DOUBLE_EQ(points[0].Elevation, 100.202);
  EXPECT_DOUBLE_EQ(points[1].Elevation, 328.0 + 0.202 * 3.2808333333333333);
  EXPECT_EQ(points[2].Elevation, kNoValue);

  ASSERT_TRUE(Vertcon_Run(ui, app.path(), points, false));
  EXPECT_NEAR(points[0].Elevation, 100.0, 1e-12);
  EXPECT_EQ(FilesIn(app.file("NGS/VERTCON")), V{"vertcon"});
}

TEST_F(NgsRunTest, GeoidModelsAndMethods) {
  fake("GEOID", "intg", "geoid");
  std::vector<SurveyPoint> points{Point("A", 48, 99), Point("B", 48, 99)};
  points[0].Elevation = 500.0;
  points[1].EllipsoidHeight = 470.0;
  reply({OutLine(48, 99, "   -23.330", "A"), OutLine(48, 99, "   -23.330", "B")});
  const auto control = [](const char* model) {
    return CrLf({"", "", "", model, "", "2", "2", "2", "geoid.inp", "geoid.out"});
  };

  ASSERT_TRUE(Geoid_Run(ui, app.path(), points, "GEOID06")) << ui.onlyText();
  EXPECT_EQ(seen("geoid.con"), control("5"));
  EXPECT_EQ(seen("geoid.bat"), CrLf({"del geoid.out", "del junk", "intg <geoid.con >junk"}));
  EXPECT_DOUBLE_EQ(points[0].GeoidHeight, -23.33);
  EXPECT_EQ(points[0].Text19, "GEOID06");
  EXPECT_TRUE(points[0].EllipsoidHeight == kNoValue && points[1].Elevation == kNoValue);

  ASSERT_TRUE(Geoid_Run(ui, app.path(), points, "GEOID99 NAVD 88 to NAD 83"));
  EXPECT_EQ(seen("geoid.con"), control("1"));
  EXPECT_DOUBLE_EQ(points[0].EllipsoidHeight, 500.0 - 23.33);
  EXPECT_EQ(points[1].EllipsoidHeight, kNoValue);  // no orthometric height
  EXPECT_EQ(points[0].Text19, "GEOID99 NAVD 88 to NAD 83");

  points[1].EllipsoidHeight = 470.0;
  ASSERT_TRUE(Geoid_Run(ui, app.path(), points, "GEOID09 NAD 83 to NAVD 88"));
  EXPECT_DOUBLE_EQ(points[1].Elevation, 470.0 + 23.33);

  EXPECT_FALSE(Geoid_Run(ui, app.path(), points, "GEOID12 NAD 83 to NAVD 88"));
  EXPECT_FALSE(Geoid_Run(ui, app.path(), points, "GEOID09 WGS 84 to NAD 83"));
  EXPECT_EQ(test::Take(ui),
            "E Unknown Geoid Model: Unknown geoid model 'GEOID12'.\nE Aborting Datum "
            "Transformation: Can not perform vertical datum transformation 'GEOID09 WGS 84 to NAD "
            "83'.");
}

}  // namespace
}  // namespace zv
