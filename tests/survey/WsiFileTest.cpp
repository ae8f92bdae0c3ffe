#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/SurveyTestSupport.h"
#include "survey/WsiFile.h"

namespace zv {
namespace {

using test::Fixture;
using test::ReadFile;
using test::SplitCrLf;
using test::TempDir;

const std::string kHeading =
    "     PT ID           X              Y              Z      REMARKS         AH  AV";
const std::string kRule(80, '=');

class WsiFile : public ::testing::Test {
 protected:
  bool read(const std::string& name) { return ReadWsiFile(ui, work, Fixture("wsi/" + name)); }
  bool readText(const std::string& text) {
    std::istringstream in(text);
    return ReadWsiFileStream(ui, work, in, "mem.WSI");
  }
  // Writes the output side and returns the file's lines.
  std::vector<std::string> write() {
    std::string path = dir.file("out.WSI");
    EXPECT_TRUE(WriteWsiFile(ui, work, path));
    return SplitCrLf(ReadFile(path));
  }
  // The rows of the written file (lines that begin with two blanks).
  std::vector<std::string> rows() {
    std::vector<std::string> out;
    for (const auto& l : write()) {
      if (l.rfind("  ", 0) == 0 && l != kHeading) out.push_back(l);
    }
    return out;
  }
  SurveyPoint& addPoint(const std::string& name, double e, double n, double z) {
    SurveyPoint p;
    p.PointName = name;
    p.Easting = e;
    p.Northing = n;
    p.Elevation = z;
    p.HorizontalUnits = kMeters;
    p.VerticalUnits = kMeters;
    work.OutputPoints.push_back(p);
    return work.OutputPoints.back();
  }

  ScriptedUi ui;
  WorkArea work;
  TempDir dir;
};

TEST_F(WsiFile, ReadsHeaderGroupsAndRows) {
  ASSERT_TRUE(read("groups.wsi"));
  EXPECT_TRUE(ui.boxes.empty());
  const FileHeader& h = work.InputHeader;
  EXPECT_EQ(h.HorizontalDatum, "NAD 83(1997)");
  EXPECT_EQ(h.CoordinateSystem, "WISCRS");
  EXPECT_EQ(h.Zone, "Dane County");
  EXPECT_EQ(h.VerticalDatum, "NAVD 88(1991)");
  EXPECT_EQ(h.HorizontalUnits, "Meters");
  EXPECT_EQ(h.VerticalUnits, "Meters");
  EXPECT_EQ(h.HeaderExtraLines,
            "ID:1206-04-71\r\nCL:USH 51 - STOUGHTON TO MCFARLAND\r\n"
            "PR:PROJECT 1206-04-71 CONTROL SUMMARY\r\nHY:USH 51\r\nCO:DANE\r\nHT:ORTHO\r\n"
            "VR:SURVEY SUMMARY 4.2.1\r\nRE:REV 2\r\nDT:06/11/2019\r\nI0:INSTR TOPCON GT-1003\r\n"
            "I1:LEVEL DNA03\r\nNT:CHECKED BY R. OLSEN");

  const auto& pts = work.InputPoints;
  ASSERT_EQ(pts.size(), 8u);
  EXPECT_EQ(pts[0].PointName, "101");
  EXPECT_EQ(pts[0].GRText, "CONTROL POINTS");
  EXPECT_DOUBLE_EQ(pts[0].Easting, 254871.334);
  EXPECT_DOUBLE_EQ(pts[0].Northing, 131208.102);
  EXPECT_DOUBLE_EQ(pts[0].Elevation, 263.115);
  EXPECT_EQ(pts[0].FeatureCode, "CONTROL PT");
  EXPECT_EQ(pts[0].ExtraLines, "AH:1\r\nAV:2");
  EXPECT_EQ(pts[0].HorizontalUnits, "Meters");
  EXPECT_EQ(pts[0].VerticalUnits, "Meters");

  const SurveyPoint& bm1 = pts[3];
  EXPECT_EQ(bm1.GRText, "BENCH MARKS");
  EXPECT_EQ(bm1.ExtraLines, "AV:1\r\nOW:WISDOT\r\nTY:DISK IN CONCRETE\r\nNM:BM 1 STA 12+50");
  EXPECT_EQ(bm1.DescriptionLines, "PD:NE CORNER OF BRIDGE DECK\r\nPD:0.3 M BELOW RAIL");
  const SurveyPoint& bm2 = pts[4];
  EXPECT_EQ(bm2.Easting, kNoValue);
  EXPECT_EQ(bm2.Northing, kNoValue);
  EXPECT_DOUBLE_EQ(bm2.Elevation, 266.774);
  EXPECT_EQ(pts[5].GRText, "BENCH");
  EXPECT_EQ(pts[6].GRText, "UNCLASSIFIED POINTS");
  EXPECT_EQ(pts[6].Elevation, kNoValue);
  EXPECT_EQ(pts[6].FeatureCode, "");
  EXPECT_EQ(pts[6].ExtraLines, "");
}

TEST_F(WsiFile, WrittenBackAsItWasRead) {
  ASSERT_TRUE(read("groups.wsi"));
  work.copyInputToOutput();
  std::string path = dir.file("out.WSI");
  ASSERT_TRUE(WriteWsiFile(ui, work, path));
  // Only the PD line outside BENCH MARKS is not part of the format's output.
  std::string expected = ReadFile(Fixture("wsi/groups.wsi"));
  std::string dropped = "PD:EDGE OF PAVEMENT\r\n";
  expected.erase(expected.find(dropped), dropped.size());
  EXPECT_EQ(ReadFile(path), expected);
  EXPECT_EQ(work.OutputHeader.HorizontalUnits, "M");
  EXPECT_EQ(work.OutputHeader.VerticalUnits, "M");
}

TEST_F(WsiFile, EllipsoidHeightsStayEllipsoidHeights) {
  ASSERT_TRUE(read("ellipsoid_heights.wsi"));
  EXPECT_EQ(work.InputHeader.VerticalDatum, "");
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_DOUBLE_EQ(work.InputPoints[0].EllipsoidHeight, 214.566);
  EXPECT_EQ(work.InputPoints[0].Elevation, kNoValue);
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, "HT:ELLIP\r\nVR:SURVEY SUMMARY 4.2.1");

  work.copyInputToOutput();
  std::vector<std::string> lines = write();
  EXPECT_NE(std::find(lines.begin(), lines.end(), "HT:ELLIP"), lines.end());
  EXPECT_EQ(std::find(lines.begin(), lines.end(), "HT:ORTHO"), lines.end());
  ASSERT_TRUE(ReadWsiFile(ui, work, dir.file("out.WSI")));
  EXPECT_DOUBLE_EQ(work.InputPoints[1].EllipsoidHeight, 216.003);
}

TEST_F(WsiFile, UnitsMustBeMetric) {
  work.InputPoints.resize(1);
  EXPECT_FALSE(read("feet_units.wsi"));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].text, "Invalid WSI File.  Units must be metric.");
  EXPECT_EQ(ui.boxes[0].title, "VORN Zurevazidu");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
  EXPECT_EQ(work.InputPoints.size(), 1u);
}

TEST_F(WsiFile, ReaderEdgeCases) {
  // A file without rows; lines before the first row of a group stay in the header.
  ASSERT_TRUE(readText("AC:PR\r\nUL:M\r\n\r\nGR:EMPTY\r\n\r\n" + kHeading + "\r\n" + kRule +
                       "\r\nOW:NOBODY\r\n"));
  EXPECT_TRUE(work.InputPoints.empty());
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, "OW:NOBODY");

  // A truncated row keeps what its columns hold.
  ASSERT_TRUE(readText("GR:A\r\n\r\nh\r\nr\r\n       101      254871.3"));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_DOUBLE_EQ(work.InputPoints[0].Easting, 254871.3);
  EXPECT_EQ(work.InputPoints[0].Northing, kNoValue);

  // Lines shorter than a tag are header lines like any other.
  ASSERT_TRUE(readText("AC:PR\r\nHD\r\nU\r\n"));
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, "HD\r\nU");

  // Binary data.
  EXPECT_FALSE(
      readText(std::string("AC:PR\r\n\x7f"
                           "ELF\0\0\x02\r\n",
                           13)));
  EXPECT_EQ(ui.onlyText(), "Invalid WSI File.  Line 2 holds binary data.");
}

TEST_F(WsiFile, MissingFile) {
  EXPECT_FALSE(ReadWsiFile(ui, work, "/nonexistent/a.WSI"));
  EXPECT_EQ(ui.onlyText(), "The file '/nonexistent/a.WSI' can not be found.");
  EXPECT_EQ(ui.boxes[0].title, "File Not Found");
}

TEST_F(WsiFile, RowColumns) {
  SurveyPoint& a = addPoint("1", 1234.5, 678.25, 99.125);
  a.FeatureCode = "EP";
  a.ExtraLines = "AH:A\r\nCM:kept\r\nAV:B1";
  SurveyPoint& b = addPoint("NOEAST", kNoValue, 500, kNoValue);
  (void)b;
  std::vector<std::string> r = rows();
  ASSERT_EQ(r.size(), 2u);
  EXPECT_EQ(r[0],
            "         1        1234.500        678.250         99.125  EP              A   B1");
  EXPECT_EQ(r[0].size(), 80u);
  EXPECT_EQ(r[0].substr(78, 2), "B1");  // a one-letter AH does not move AV
  // Without an easting the X and Y columns are blank, and so is a missing Z.
  EXPECT_EQ(r[1], "    NOEAST" + std::string(70, ' '));
  EXPECT_EQ(work.OutputPoints[0].ExtraLines, "CM:kept");

  // Read back, the values land where they were.
  ASSERT_TRUE(ReadWsiFile(ui, work, dir.file("out.WSI")));
  EXPECT_EQ(work.InputPoints[0].ExtraLines, "AH:A\r\nAV:B1");
  EXPECT_DOUBLE_EQ(work.InputPoints[0].Elevation, 99.125);
}

TEST_F(WsiFile, GroupsInOrderOfFirstAppearanceUnnamedLast) {
  addPoint("1", 1, 1, 1);
  addPoint("2", 2, 2, 2).GRText = "BENCH MARKS";
  addPoint("3", 3, 3, 3).GRText = "BENCH";
  addPoint("4", 4, 4, 4).GRText = "BENCH MARKS";
  work.OutputPoints[1].DescriptionLines = "PD:on rock";
  work.OutputPoints[1].ExtraLines = "NM:BM 2\r\nTY:DISK\r\nOW:CITY\r\nZZ:not written";
  work.OutputPoints[2].DescriptionLines = "PD:not written";
  std::vector<std::string> lines = write();
  std::vector<std::string> groups;
  for (const auto& l : lines) {
    if (l.rfind("GR:", 0) == 0) groups.push_back(l);
  }
  EXPECT_EQ(groups,
            (std::vector<std::string>{"GR:BENCH MARKS", "GR:BENCH", "GR:UNCLASSIFIED POINTS"}));
  auto at = std::find(lines.begin(), lines.end(), "GR:BENCH MARKS");
  ASSERT_NE(at, lines.end());
  std::vector<std::string> block(at, at + 10);
  EXPECT_EQ(block[1], "");
  EXPECT_EQ(block[2], kHeading);
  EXPECT_EQ(block[3], kRule);
  EXPECT_EQ(block[4].substr(2, 8), "       2");
  EXPECT_EQ(block[5], "OW:CITY");
  EXPECT_EQ(block[6], "TY:DISK");
  EXPECT_EQ(block[7], "NM:BM 2");
  EXPECT_EQ(block[8], "PD:on rock");
  EXPECT_EQ(block[9].substr(2, 8), "       4");
  EXPECT_EQ(std::find(lines.begin(), lines.end(), "PD:not written"), lines.end());
  EXPECT_EQ(std::find(lines.begin(), lines.end(), "ZZ:not written"), lines.end());
}

TEST_F(WsiFile, HeaderFromAnotherFormat) {
  work.OutputHeader.ProjectLine = "PR:Main Street";
  work.OutputHeader.HeaderExtraLines = "CM:first\r\nUL:F\r\nHD:old";
  work.OutputHeader.HorizontalDatum = "NAD 83";
  work.OutputHeader.VerticalDatum = "None";
  work.OutputHeader.HorizontalUnits = kUsSurveyFeet;
  addPoint("1", 1, 2, 3);
  std::vector<std::string> lines = write();
  ASSERT_GE(lines.size(), 9u);
  EXPECT_EQ(lines[0], "AC:PR");
  EXPECT_EQ(lines[1], "PR:Main Street");
  EXPECT_EQ(lines[2], "HD:NAD 83");
  EXPECT_EQ(lines[3], "VD:None");
  EXPECT_EQ(lines[4], "HT:ORTHO");
  EXPECT_EQ(lines[5], "UL:M");
  EXPECT_EQ(lines[6], std::string("VR:VORN Zurevazidu ") + std::to_string(kVersionMajor) + "." +
                          std::to_string(kVersionMinor) + "." + std::to_string(kVersionRevision));
  EXPECT_EQ(lines[7], "");
  EXPECT_EQ(lines[8], "CM:first");
}

TEST_F(WsiFile, LengthsAreConvertedToMetres) {
  SurveyPoint& p = addPoint("1", 1000, 2000, 100);
  p.HorizontalUnits = kUsSurveyFeet;
  p.VerticalUnits = kInternationalFeet;
  SurveyPoint& q = addPoint("2", 10, 20, 30);
  q.HorizontalUnits = "";  // a point without a unit keeps its values
  q.VerticalUnits = "";
  std::vector<std::string> r = rows();
  ASSERT_EQ(r.size(), 2u);
  EXPECT_DOUBLE_EQ(work.OutputPoints[0].Easting, 1000 * 0.3048006096012192);
  EXPECT_DOUBLE_EQ(work.OutputPoints[0].Elevation, 100 * 0.3048);
  EXPECT_EQ(r[0].substr(12, 14), "       304.801");
  EXPECT_EQ(r[0].substr(43, 13), "       30.480");
  EXPECT_EQ(r[1].substr(12, 14), "        10.000");
}

TEST_F(WsiFile, RefusalsWriteNothing) {
  work.OutputHeader.CoordinateSystem = "Geographic Coordinates";
  addPoint("1", 1, 2, 3);
  std::string path = dir.file("geo.WSI");
  EXPECT_FALSE(WriteWsiFile(ui, work, path));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Plane Coordiantes Required");
  EXPECT_EQ(ui.boxes[0].text, "A Wisconsin Summary Index File must contain plane coordinates.");
  EXPECT_FALSE(std::filesystem::exists(path));

  EXPECT_TRUE(std::filesystem::is_empty(dir.path()));
}

// Values wider than their columns are cut (numbers lose decimals first, and
// are left blank when even that is too wide); points without a unit are
// written as metres. One warning names the points.
TEST_F(WsiFile, OversizeValuesAreCutAndMissingUnitsNamed) {
  addPoint("1", 1234567890.1234, 1234567890.1234, 1e13).FeatureCode = "FIFTEEN CHARS X";
  addPoint("2", 1, 2, 3).ExtraLines = "AH:ABC\r\nAV:7";
  SurveyPoint& bare = addPoint("3", 5, 6, 7);
  bare.HorizontalUnits = bare.VerticalUnits = "";
  std::vector<std::string> r = rows();
  ASSERT_EQ(r.size(), 3u);
  EXPECT_EQ(r[0],
            "         1  1234567890.123  1234567890.12                 FIFTEEN CHARS         ");
  EXPECT_EQ(r[1].substr(72), "  AB  7 ");
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Check Output File");
  EXPECT_EQ(ui.boxes[0].text, "The file '" + dir.file("out.WSI") +
                                  "' was written, but:\r\n2 point(s) had values cut to fit their "
                                  "columns: '1', '2'.\r\n1 point(s) had no unit and were taken as "
                                  "metres: '3'.");
  EXPECT_EQ(r[2].substr(12, 14), "         5.000");
}

TEST(WsiTakeTaggedLine, LastMatchAndRemoval) {
  std::string text = "AH:1\r\nCM:x\r\nAH:22\r\n\r\nAV:3";
  std::string copy = text;
  EXPECT_EQ(TakeTaggedLine(copy, "AH:", false, false), "22");
  EXPECT_EQ(copy, text);
  EXPECT_EQ(TakeTaggedLine(copy, "AH:", true, true), "AH:22");
  EXPECT_EQ(copy, "CM:x\r\n\r\nAV:3");
  EXPECT_EQ(TakeTaggedLine(copy, "ZZ:", true, true), "");
  EXPECT_EQ(copy, "CM:x\r\n\r\nAV:3");
  EXPECT_EQ(TakeTaggedLine(copy, "", true, true), "");
  EXPECT_EQ(TakeTaggedLine(copy, "AV:", false, true), "3");
  EXPECT_EQ(copy, "CM:x\r\n");
  std::string empty;
  EXPECT_EQ(TakeTaggedLine(empty, "AH:", true, true), "");
  std::string only = "AH:";
  EXPECT_EQ(TakeTaggedLine(only, "AH:", false, true), "");
  EXPECT_EQ(only, "");
}

}  // namespace
}  // namespace zv
