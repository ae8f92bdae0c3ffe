#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <sstream>

#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/SurveyFiles.h"
#include "survey/SurveyTestSupport.h"
#include "survey/TaggedFile.h"

namespace zv {
namespace {

using test::CrLf;
using test::Dms;
using test::Fixture;
using test::ReadFile;
using test::SplitCrLf;
using test::TempDir;

class SurveyControlFile : public ::testing::Test {
 protected:
  bool read(const std::string& name) {
    return ReadControlFile(ui, work, Fixture("control/" + name));
  }
  bool readText(const std::string& text, const std::string& path = "mem.CTL") {
    std::istringstream in(text);
    return ReadControlStream(ui, work, in, path);
  }
  std::string invalid(const std::string& path, int line, const std::string& rule) {
    return "Invalid VORN Control File '" + path + "'.\r\nError on line " + std::to_string(line) +
           ".\r\n" + rule;
  }

  ScriptedUi ui;
  WorkArea work;
};

SurveyPoint FullPoint() {
  SurveyPoint p;
  p.PointName = "P1";
  p.Northing = 1000.5;
  p.Easting = 2000.25;
  p.Elevation = 100;
  p.Latitude = Dms(45, 30, 15);
  p.Longitude = Dms(93, 15, 0);
  p.EllipsoidHeight = 75.125;
  p.DescriptionLines = "PD:Iron pin\r\nPD:found";
  p.FeatureCode = "IP";
  p.Geometry = "L";
  p.GeoidHeight = -24.875;
  p.ScaleFactor = 0.99991234;
  p.Convergence = Dms(0, 30, 15);
  p.GRText = "A";
  p.ExtraLines = "CM:checked";
  p.NorthingError = 0.01f;
  p.EastingError = 0.02f;
  p.ElevationError = 0.03f;
  p.HorizontalUnits = kMeters;
  p.VerticalUnits = kMeters;
  return p;
}

FileHeader FullHeader() {
  FileHeader h;
  h.ProjectLine = "PR:Job 12";
  h.HeaderExtraLines = "CM:extra";
  h.CoordinateSystem = "SPC";
  h.Zone = "4801";
  h.HorizontalDatum = "NAD83";
  h.VerticalDatum = "None";
  h.HorizontalUnits = kMeters;
  h.VerticalUnits = kMeters;
  return h;
}

TEST_F(SurveyControlFile, MissingFileIsReported) {
  TempDir dir;
  std::string path = dir.file("none.CTL");
  work.InputPoints.resize(2);
  EXPECT_FALSE(ReadControlFile(ui, work, path));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "File Not Found");
  EXPECT_EQ(ui.boxes[0].text, "The file '" + path + "' can not be found.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
  EXPECT_EQ(work.InputPoints.size(), 2u);
}

TEST_F(SurveyControlFile, SectionSwitchQuirks) {
  // Without a leading AC:PR the first AC line stores an empty first point.
  ASSERT_TRUE(read("no_project_section.CTL"));
  ASSERT_EQ(work.InputPoints.size(), 3u);
  EXPECT_EQ(work.InputPoints[0].PointName, "");
  EXPECT_EQ(work.InputPoints[0].Northing, kNoValue);
  EXPECT_EQ(work.InputPoints[2].PointName, "2");
  EXPECT_EQ(work.InputPoints[2].Elevation, 31);
  EXPECT_TRUE(work.InputPoints[2].HorizontalIsControl);
  EXPECT_TRUE(work.InputPoints[2].ElevationIsControl);

  // Point tags between AC:PR and the first AC line belong to the first
  // point; unknown tags there are header lines.
  ASSERT_TRUE(read("tags_before_first_point.CTL"));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  const SurveyPoint& p = work.InputPoints[0];
  EXPECT_EQ(p.PointName, "P1");
  EXPECT_EQ(p.Northing, 100);
  EXPECT_EQ(p.Easting, 200);
  EXPECT_EQ(p.Elevation, 5);
  EXPECT_EQ(work.InputHeader.ProjectLine, "PR:Job 12");
  EXPECT_EQ(work.InputHeader.CoordinateSystem, "State Plane");
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, "CM:header comment");
  EXPECT_EQ(p.ExtraLines, "");

  // Only the first two characters of the AC value are compared.
  ASSERT_TRUE(read("project_prefix.CTL"));
  ASSERT_EQ(work.InputPoints.size(), 3u);
  EXPECT_EQ(work.InputPoints[1].PointName, "1");
  EXPECT_EQ(work.InputPoints[2].PointName, "2");
  EXPECT_EQ(work.InputPoints[2].Northing, kNoValue);
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, "CM:x");

  // No AC line at all: one point; an empty file: one empty point.
  ASSERT_TRUE(read("no_ac_lines.CTL"));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_EQ(work.InputPoints[0].PointName, "7");
  EXPECT_EQ(work.InputPoints[0].Elevation, 3);
  ASSERT_TRUE(read("empty.CTL"));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_EQ(work.InputPoints[0].Easting, kNoValue);
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(SurveyControlFile, RuleAndFieldErrorsNameTheLine) {
  std::string path = Fixture("control/computed_coordinates.CTL");
  EXPECT_FALSE(ReadControlFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(),
            invalid(path, 4, "An VORN Control File can not contain computed coordinates."));
  EXPECT_EQ(ui.boxes[0].title, "Invalid VORN Control File");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);

  ui.boxes.clear();
  path = Fixture("control/blank_line.CTL");
  EXPECT_FALSE(ReadControlFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), invalid(path, 3, "An VORN Control File can not contain blank lines."));

  // Field errors of a control file use the line-rule layout.
  ui.boxes.clear();
  path = Fixture("control/bad_easting.CTL");
  EXPECT_FALSE(ReadControlFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), invalid(path, 5, "Easting Coordinate must be numeric."));

  // The value is not trimmed: a blank and 8 digits are 9 characters.
  ui.boxes.clear();
  path = Fixture("control/long_point_name.CTL");
  EXPECT_FALSE(ReadControlFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), invalid(path, 3, "Point Name can not exceeed 8 characters."));
}

TEST_F(SurveyControlFile, FailedReadLeavesTheWorkAreaAlone) {
  work.InputHeader.Zone = "kept";
  work.InputPoints.resize(3);
  EXPECT_FALSE(read("bad_easting.CTL"));
  EXPECT_EQ(work.InputHeader.Zone, "kept");
  EXPECT_EQ(work.InputPoints.size(), 3u);
}

TEST_F(SurveyControlFile, LineNumbersPastSixteenBits) {
  std::string text = "AC:PR\r\nAC:OS\r\n";
  for (int i = 0; i < 40000; ++i) text += "CM:note\r\n";
  text += "ZC:high\r\n";
  EXPECT_FALSE(readText(text));
  EXPECT_EQ(ui.onlyText(), invalid("mem.CTL", 40003, "Elevation Coordinate must be numeric."));
}

TEST_F(SurveyControlFile, BinaryAndTruncatedInput) {
  EXPECT_FALSE(readText(std::string("AC:PR\r\nPN:a\0b\r\n", 15)));
  EXPECT_EQ(ui.onlyText(),
            invalid("mem.CTL", 2, "An VORN Control File can not contain binary data."));

  // A last line without its line end reads; one cut inside a value is
  // refused like any other bad value.
  ui.boxes.clear();
  ASSERT_TRUE(readText("AC:PR\r\nAC:OS\r\nPN:1\r\nYC:12"));
  EXPECT_EQ(work.InputPoints[0].Northing, 12);
  EXPECT_FALSE(readText("AC:PR\r\nAC:OS\r\nYC:"));
  EXPECT_EQ(ui.onlyText(), invalid("mem.CTL", 3, "Northing Coordinate must be numeric."));
}

TEST_F(SurveyControlFile, AnglesAreCheckedNotTrusted) {
  // Minutes out of range: the angle routine's own message, the value absent,
  // and the file still reads.
  ASSERT_TRUE(read("bad_angle_minutes.CTL"));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
  EXPECT_EQ(ui.boxes[0].text,
            "Invalid Angle '45.6000'. Minutes portion must be positive and not exceed 59.");
  EXPECT_EQ(work.InputPoints[0].Latitude, kNoValue);
  EXPECT_NEAR(work.InputPoints[0].Longitude, Dms(90, 30, 0), 1e-12);

  // Degrees too large for the angle routine: the field error of the tag.
  ui.boxes.clear();
  std::string path = Fixture("control/angle_overflow.CTL");
  EXPECT_FALSE(ReadControlFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), invalid(path, 4, "Latitude must be numeric."));
}

TEST_F(SurveyControlFile, UnitCodes) {
  // A lower-case code is unknown: the horizontal unit stays, the vertical
  // unit becomes a copy of it.
  ASSERT_TRUE(read("lowercase_units.CTL"));
  EXPECT_EQ(work.InputHeader.HorizontalUnits, kUsSurveyFeet);
  EXPECT_EQ(work.InputHeader.VerticalUnits, kUsSurveyFeet);
  EXPECT_EQ(work.InputPoints[0].HorizontalUnits, kUsSurveyFeet);

  ASSERT_TRUE(readText("UL:i\r\nUL:I\r\n"));
  EXPECT_EQ(work.InputHeader.HorizontalUnits, kInternationalFeet);
  ASSERT_TRUE(readText("VD:NGVD29\r\nUL:x\r\n"));
  EXPECT_EQ(work.InputHeader.HorizontalUnits, "");
  EXPECT_EQ(work.InputHeader.VerticalDatum, "NGVD29");
}

// FullPoint carries computed coordinates: a control file writes them as XC, YC, ZC.
TEST_F(SurveyControlFile, WritesTheLayout) {
  TempDir dir;
  work.OutputHeader = FullHeader();
  work.OutputPoints = {FullPoint()};
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out.CTL")));
  EXPECT_EQ(
      ReadFile(dir.file("out.CTL")),
      CrLf({"PR:Job 12",     "AC:PR",        VersionLine(), "CM:extra",        "CS:SPC",
            "ZN:4801",       "HD:NAD83",     "UL:M",        "AC:OS",           "PN:P1",
            "YC:1000.5000",  "XC:2000.2500", "ZC:100.0000", "LT:45.301500000", "LG:93.150000000",
            "HE:75.125",     "PD:Iron pin",  "PD:found",    "FE:IP",           "HG:-24.875",
            "SF:0.99991234", "CA:0.30150",   "GR:A",        "CM:checked",      "SY:0.0100",
            "SX:0.0200",     "SZ:0.0300"}));
  EXPECT_EQ(VersionLine(), "VR:VORN Zurevazidu " + std::to_string(kVersionMajor) + "." +
                               std::to_string(kVersionMinor) + "." +
                               std::to_string(kVersionRevision));
}

TEST_F(SurveyControlFile, ConvertsUnitsOnWrite) {
  TempDir dir;
  work.OutputHeader = FullHeader();
  work.OutputHeader.HorizontalUnits = kUsSurveyFeet;
  work.OutputHeader.VerticalUnits = kUsSurveyFeet;
  work.OutputPoints = {FullPoint()};
  work.OutputPoints[0].Northing = 1000;
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out.CTL")));
  std::vector<std::string> lines = SplitCrLf(ReadFile(dir.file("out.CTL")));
  auto has = [&](const std::string& l) {
    return std::find(lines.begin(), lines.end(), l) != lines.end();
  };
  EXPECT_TRUE(has("UL:F"));
  EXPECT_TRUE(has("YC:3280.8333"));
  EXPECT_TRUE(has("XC:6562.4869"));
  EXPECT_TRUE(has("ZC:328.0833"));
  EXPECT_TRUE(has("HE:246.473"));
  EXPECT_TRUE(has("HG:-81.611"));
  EXPECT_TRUE(has("SY:0.0328"));
  EXPECT_TRUE(has("SF:0.99991234"));  // not a length
  // The converted values are stored back with their unit, so a second write
  // does not convert again.
  const SurveyPoint& p = work.OutputPoints[0];
  EXPECT_DOUBLE_EQ(p.Northing, 1000 * 3.2808333333333333);
  EXPECT_EQ(p.HorizontalUnits, kUsSurveyFeet);
  EXPECT_EQ(work.OutputHeader.HorizontalUnits, "F");
  std::string first = ReadFile(dir.file("out.CTL"));
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("again.CTL")));
  EXPECT_EQ(ReadFile(dir.file("again.CTL")), first);
}

TEST_F(SurveyControlFile, GeographicOutputTakesTheVerticalUnit) {
  TempDir dir;
  work.OutputHeader.HorizontalUnits = kFormatPacked;
  work.OutputHeader.VerticalUnits = kInternationalFeet;
  SurveyPoint p;
  p.Elevation = 0.3048;
  p.HorizontalUnits = kMeters;
  p.VerticalUnits = kMeters;
  work.OutputPoints = {p};
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out.CTL")));
  std::string text = ReadFile(dir.file("out.CTL"));
  EXPECT_NE(text.find("\r\nUL:I\r\n"), std::string::npos);
  EXPECT_NE(text.find("\r\nZC:1.0000\r\n"), std::string::npos);

  // Geographic output without a vertical unit: no UL line, no conversion.
  work.OutputHeader.HorizontalUnits = kFormatPacked;
  work.OutputHeader.VerticalUnits = "";
  work.OutputPoints = {p};
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out2.CTL")));
  text = ReadFile(dir.file("out2.CTL"));
  EXPECT_EQ(text.find("UL:"), std::string::npos);
  EXPECT_NE(text.find("\r\nZC:0.3048\r\n"), std::string::npos);
}

TEST_F(SurveyControlFile, PointsWithoutUnitKeepTheirValues) {
  // The first point is stored before the UL line and has no unit; it cannot
  // be converted and must not lose its coordinates.
  ASSERT_TRUE(read("units_after_points.CTL"));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputPoints[0].HorizontalUnits, "");
  work.InputHeader.HorizontalUnits = kMeters;
  work.InputHeader.VerticalUnits = kMeters;
  work.copyInputToOutput();
  TempDir dir;
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out.CTL")));
  std::string text = ReadFile(dir.file("out.CTL"));
  EXPECT_NE(text.find("PN:1\r\nYC:1000.0000\r\nXC:2000.0000\r\nZC:10.0000\r\n"), std::string::npos);
  EXPECT_NE(text.find("PN:2\r\nYC:914.4018\r\n"), std::string::npos);
}

TEST_F(SurveyControlFile, GridMissingAndAbsentCoordinates) {
  TempDir dir;
  SurveyPoint missing;
  missing.PointName = "G";
  missing.GridMissing = true;
  missing.Northing = 5;  // stale grid values are not written
  SurveyPoint withHeight = missing;
  withHeight.Elevation = 12.5;
  SurveyPoint absent;
  absent.PointName = "A";
  work.OutputPoints = {missing, withHeight, absent};
  work.OutputHeader.VerticalDatum = "None";
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out.CTL")));
  EXPECT_EQ(ReadFile(dir.file("out.CTL")),
            CrLf({"AC:PR", VersionLine(), "AC:OS", "PN:G", "YC:-99999", "XC:-99999", "ZC:-99999",
                  "AC:OS", "PN:G", "YC:-99999", "XC:-99999", "ZC:12.5000", "AC:OS", "PN:A",
                  "YC:-99999.0000", "XC:-99999.0000", "ZC:-99999.0000"}));
}

TEST_F(SurveyControlFile, OutputOptionsGateAnglesAndScale) {
  TempDir dir;
  work.OutputPoints = {FullPoint()};
  work.ConversionOptionsActive = true;
  work.OutputLatLong = false;
  work.OutputConvergence = false;
  work.OutputScaleFactor = true;
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out.CTL")));
  std::string text = ReadFile(dir.file("out.CTL"));
  EXPECT_EQ(text.find("LT:"), std::string::npos);
  EXPECT_EQ(text.find("LG:"), std::string::npos);
  EXPECT_EQ(text.find("CA:"), std::string::npos);
  EXPECT_NE(text.find("SF:0.99991234"), std::string::npos);
}

TEST_F(SurveyControlFile, SouthAndEastAnglesAreWrittenNorthAndWest) {
  TempDir dir;
  SurveyPoint p;
  p.Latitude = Dms(33, 0, 0);
  p.LatitudeHemisphere = "S";
  p.Longitude = 0.1;
  p.LongitudeHemisphere = "E";
  work.OutputPoints = {p};
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("out.CTL")));
  std::string text = ReadFile(dir.file("out.CTL"));
  EXPECT_NE(text.find("\r\nLT:-33.000000000\r\n"), std::string::npos);
  EXPECT_NEAR(work.OutputPoints[0].Longitude, kFullCircle - 0.1, 1e-15);
  EXPECT_EQ(work.OutputPoints[0].LongitudeHemisphere, "W");
  EXPECT_EQ(work.OutputPoints[0].LatitudeHemisphere, "N");
}

TEST_F(SurveyControlFile, RoundTripAddsOneVersionLine) {
  TempDir dir;
  work.OutputHeader = FullHeader();
  SurveyPoint computed = FullPoint();
  computed.PointName = "C";
  work.OutputPoints = {FullPoint(), computed};
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("a.CTL")));
  ASSERT_TRUE(ReadControlFile(ui, work, dir.file("a.CTL")));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  const SurveyPoint& p = work.InputPoints[0];
  EXPECT_EQ(p.PointName, "P1");
  EXPECT_EQ(p.Northing, 1000.5);
  EXPECT_NEAR(p.Latitude, Dms(45, 30, 15), 1e-12);
  EXPECT_NEAR(p.Convergence, Dms(0, 30, 15), 1e-12);
  EXPECT_FLOAT_EQ(p.ElevationError, 0.03f);
  EXPECT_EQ(p.DescriptionLines, "PD:Iron pin\r\nPD:found");
  EXPECT_EQ(p.ExtraLines, "CM:checked");
  EXPECT_EQ(p.Geometry, "P");  // GM is not written to a control file
  EXPECT_TRUE(p.HorizontalIsControl);
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, VersionLine() + "\r\nCM:extra");

  work.copyInputToOutput();
  ASSERT_TRUE(WriteControlFile(ui, work, dir.file("b.CTL")));
  std::vector<std::string> lines = SplitCrLf(ReadFile(dir.file("b.CTL")));
  ASSERT_GE(lines.size(), 5u);
  EXPECT_EQ(lines[2], VersionLine());
  EXPECT_EQ(lines[3], VersionLine());
  EXPECT_EQ(lines[4], "CM:extra");
  EXPECT_TRUE(ui.boxes.empty());
}

}  // namespace
}  // namespace zv
