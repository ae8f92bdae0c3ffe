// The NGS programs: grid files and interpolation against values worked by
// hand, the files written for the programs (seen by small scripts standing
// in their place), the reading of their output, the clean-up, and the
// stand-in programs of the build on synthetic grids.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <filesystem>
#include <sstream>

#include "geodesy/Angles.h"
#include "geodesy/NgsPrograms.h"
#include "geodesy/NgsTestSupport.h"
#include "ngs/NgsGrids.h"
#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::MakeGeoidGrid;
using test::MakeShiftGrid;
using test::ReadFile;
using V = std::vector<std::string>;

constexpr double kDeg = kDegreesToRadians;

template <typename T>
T At(const std::string& bytes, size_t offset) {
  T v;
  std::memcpy(&v, bytes.data() + offset, 4);
  return v;
}

TEST(NgsGrids, ShiftGridFileHasFortranRecordsOfOneRowEach) {
  const ShiftGrid g =
      MakeShiftGrid(-131.0, 20.0, 0.25, 30, 4, [](double x, double y) { return x + 1000 * y; });
  std::ostringstream out;
  WriteShiftGrid(out, g);
  const std::string bytes = out.str();
  const size_t record = 4 * 31;
  ASSERT_EQ(bytes.size(), record * 5);
  EXPECT_EQ(bytes.substr(0, 23), "NADCON EXTRACTED REGION");
  EXPECT_EQ(bytes.substr(56, 8), "NADGRD  ");
  EXPECT_EQ(std::tuple(At<int32_t>(bytes, 64), At<int32_t>(bytes, 68), At<int32_t>(bytes, 72)),
            std::tuple(30, 4, 1));
  EXPECT_EQ(std::tuple(At<float>(bytes, 76), At<float>(bytes, 80), At<float>(bytes, 84)),
            std::tuple(-131.0f, 0.25f, 20.0f));
  // Row 2 (second from the south), column 3: after the row's leading int32.
  EXPECT_EQ(At<float>(bytes, 2 * record + 4 + 4 * 2), static_cast<float>(-130.5 + 20250.0));
  std::istringstream cut(bytes.substr(0, bytes.size() - 10));
  ShiftGrid back;
  std::string error;
  EXPECT_FALSE(ReadShiftGrid(cut, back, error));
  EXPECT_EQ(error, "the file ends in row 4 of 4");
  std::istringstream junk(std::string(60, 'x'));
  GeoidGrid geoid;
  EXPECT_FALSE(ReadGeoidGrid(junk, geoid, error));
  EXPECT_EQ(error, "the header does not mark 4-byte real values");
}

TEST(NgsGrids, Interpolation) {
  // South row 0 1 2, middle row 10 20 30, north row 5 5 5.
  const float rows[3][3] = {{0, 1, 2}, {10, 20, 30}, {5, 5, 5}};
  ShiftGrid g = MakeShiftGrid(-100, 40, 1, 3, 3, [&](double x, double y) {
    return rows[static_cast<int>(y - 40)][static_cast<int>(x + 100)];
  });
  // Cell SW 0, NW 10, SE 1, NE 20 at dx 0.25, dy 0.5:
  // 0 + 1 * 0.25 + 10 * 0.5 + (20 - 1 - 10 + 0) * 0.125 = 6.375.
  EXPECT_DOUBLE_EQ(*InterpolateBilinear(g, -99.75, 40.5), 6.375);
  for (auto [x, y] : {std::pair{-100.0, 40.5}, {-98.0, 40.5}, {-99.5, 42.0}, {-99.5, 39.99}})
    EXPECT_FALSE(InterpolateBilinear(g, x, y)) << x << " " << y;  // on or outside the edge
  g.values[4] = kVertconNoData;                                   // the middle node
  EXPECT_FALSE(InterpolateBilinear(g, -99.75, 40.5, kVertconNoData));

  // The 3 x 3 parabolas hold any product of quadratics in latitude and
  // longitude; the natural splines hold any bilinear surface, also in the
  // cells at the edge where the 6 x 6 window is shifted inward.
  const auto quadratic = [](double lat, double lon) {
    const double y = lat - 40, x = lon - 260;
    return -28.0 + 3 * y - 2 * x + 5 * y * y - 4 * x * x + 6 * x * y + 2 * x * x * y * y;
  };
  const auto bilinear = [](double lat, double lon) {
    return -28.0 + 3 * (lat - 40) - 2 * (lon - 260) + 6 * (lon - 260) * (lat - 40);
  };
  const GeoidGrid q = MakeGeoidGrid(40, 260, 0.25, 10, 12, quadratic);
  const GeoidGrid b = MakeGeoidGrid(40, 260, 0.25, 10, 12, bilinear);
  for (auto [lat, lon] : {std::pair{41.1, 261.3}, {40.05, 260.02}, {42.2, 262.7}, {41.0, 261.0}}) {
    EXPECT_NEAR(InterpolateBiquadratic(q, lat, lon), quadratic(lat, lon), 1e-4) << lat;
    EXPECT_NEAR(InterpolateSpline(b, lat, lon), bilinear(lat, lon), 1e-4) << lat;
  }
  // On a smooth surface of a real geoid's size, within a millimetre.
  const auto smooth = [](double lat, double lon) {
    return -30.0 + 8 * std::sin(lat * 0.7) * std::cos(lon * 0.9);
  };
  const GeoidGrid s = MakeGeoidGrid(40, 260, 1.0 / 60, 30, 30, smooth);
  EXPECT_NEAR(InterpolateSpline(s, 40.2345, 260.3456), smooth(40.2345, 260.3456), 0.001);
  EXPECT_NEAR(InterpolateBiquadratic(s, 40.2345, 260.3456), smooth(40.2345, 260.3456), 0.01);
}

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

  // Every NADCON method of the shipped datums.ini is known.
  V lines;
  ASSERT_TRUE(ReadTextLines(std::string(ZV_APP_DIR) + "/datums.ini", lines));
  const auto& methods = NadconMethods();
  for (const std::string& line : lines) {
    const size_t eq = line.find("=NADCON");
    if (eq == std::string::npos) continue;
    EXPECT_TRUE(std::any_of(methods.begin(), methods.end(), [&](const NadconMethod& m) {
      return m.name == line.substr(eq + 1);
    })) << line;
  }
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

// The stand-in programs of the build on grids written here.
class NgsStandInTest : public NgsRunTest {
 protected:
  NgsStandInTest() { test::InstallAllStandIns(app.path()); }
};

TEST_F(NgsStandInTest, NadconShiftsByItsGridAndBackAndNamesWhatIsMissing) {
  const std::string folder = app.file("NGS/NADCON");
  std::vector<SurveyPoint> points{Point("P", 45.7626543, 111.1864197)};
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 83 (1986) to Wisconsin HPGN"));
  EXPECT_EQ(ui.onlyText(),
            "NADCON wrote no output file '" + folder +
                "/nadcon.out'.\r\n\r\nThe grid file 'wihpgn.las' was not found in '" + folder +
                "'.");

  // Shifts that vary across the grid, bilinear in each cell so that the
  // interpolation is exact: las = 0.5 + 0.75 dx - 0.5 dy + 0.25 dx dy,
  // los = 3 - 0.25 dx + dy arc seconds from (112 W, 44 N).
  const auto las = [](double x, double y) {
    return 0.5 + 0.75 * (x + 112) - 0.5 * (y - 44) + 0.25 * (x + 112) * (y - 44);
  };
  const auto los = [](double x, double y) { return 3.0 - 0.25 * (x + 112) + (y - 44); };
  test::SaveShiftGrid(folder + "/conus.las", MakeShiftGrid(-112, 44, 0.25, 25, 17, las));
  test::SaveShiftGrid(folder + "/conus.los", MakeShiftGrid(-112, 44, 0.25, 25, 17, los));
  ASSERT_TRUE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83")) << ui.onlyText();
  EXPECT_NEAR(points[0].Latitude / kDeg, 45.7626543 + las(-111.1864197, 45.7626543) / 3600, 1e-9);
  EXPECT_NEAR(points[0].Longitude / kDeg, 111.1864197 + los(-111.1864197, 45.7626543) / 3600, 1e-9);
  ASSERT_TRUE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 83 to NAD 27")) << ui.onlyText();
  EXPECT_NEAR(points[0].Latitude / kDeg, 45.7626543, 2e-9);
  EXPECT_NEAR(points[0].Longitude / kDeg, 111.1864197, 2e-9);
  ui.boxes.clear();
  points.push_back(Point("FAR", 10, 100));
  EXPECT_FALSE(Nadcon_Run(ui, app.path(), points, "NADCON NAD 27 to NAD 83"));
  EXPECT_EQ(ui.onlyText(),
            "NADCON returned no result for point 'FAR'.\r\n\r\nPoint 'FAR' at "
            "10.000000000 N, 100.000000000 W lies outside the NADCON grids in '" +
                folder + "' (conus).");
  EXPECT_EQ(FilesIn(folder), (V{"conus.las", "conus.los", "ndcon210"}));
}

TEST_F(NgsStandInTest, VertconAndGeoidFromTheirGrids) {
  // VERTCON central grid in millimetres: 100 + 20 (lon + 107) - 10 (lat - 24).
  test::SaveShiftGrid(app.file("NGS/VERTCON/vertconc.94"),
                      MakeShiftGrid(-107, 24, 0.05, 461, 521, [](double x, double y) {
                        return 100 + 20 * (x + 107) - 10 * (y - 24);
                      }));
  std::vector<SurveyPoint> points{Point("V", 36.176388889, 98.669444444), Point("W", 36.2, 120.0)};
  points[0].Elevation = points[1].Elevation = 10.0;
  EXPECT_FALSE(Vertcon_Run(ui, app.path(), points, true));
  EXPECT_EQ(ui.onlyText(),
            "VERTCON returned no result for point 'W'.\r\n\r\nPoint 'W' at 36.200000000 N, "
            "120.000000000 W lies outside the VERTCON grids in '" +
                app.file("NGS/VERTCON") + "' (vertconc.94; not found: vertconw.94, vertcone.94).");
  const double mm = 100 + 20 * (107 - 98.669444444) - 10 * (36.176388889 - 24);
  EXPECT_NEAR(points[0].Elevation, 10.0 + mm / 1000, 0.0005);  // 3 decimals in the output

  // GEOID09: a bilinear surface, which the splines reproduce.
  const auto n = [](double lat, double lon) {
    return -30.0 + 0.5 * (lat - 40) - 0.25 * (lon - 255);
  };
  test::SaveGeoidGrid(app.file("NGS/GEOID/g2009u04.bin"),
                      MakeGeoidGrid(40, 255, 1.0 / 60, 600, 600, n), true);
  std::vector<SurveyPoint> g{Point("G", 48.071790872, 99.245864017)};
  ui.boxes.clear();
  ASSERT_TRUE(Geoid_Run(ui, app.path(), g, "GEOID09")) << ui.onlyText();
  EXPECT_NEAR(g[0].GeoidHeight, n(48.071790872, 360 - 99.245864017), 0.0005);

  EXPECT_FALSE(Geoid_Run(ui, app.path(), g, "GEOID03"));
  EXPECT_EQ(ui.onlyText(), "GEOID wrote no output file '" + app.file("NGS/GEOID/geoid.out") +
                               "'.\r\n\r\nNo GEOID03 grid files (g2003*.bin) were found in '" +
                               app.file("NGS/GEOID") + "'.");
}

}  // namespace
}  // namespace zv
