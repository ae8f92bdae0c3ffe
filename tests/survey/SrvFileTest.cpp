#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/SrvFile.h"
#include "survey/SurveyTestSupport.h"
#include "survey/WsiFile.h"

namespace zv {
namespace {

using test::Fixture;
using test::ReadFile;
using test::SplitCrLf;
using test::TempDir;

std::string Version() {
  return std::string("#VR:VORN Zurevazidu ") + std::to_string(kVersionMajor) + "." +
         std::to_string(kVersionMinor) + "." + std::to_string(kVersionRevision);
}

class SrvFile : public ::testing::Test {
 protected:
  bool read(const std::string& name) { return ReadSrvFile(ui, work, Fixture("srv/" + name)); }
  bool readText(const std::string& text) {
    std::istringstream in(text);
    return ReadSrvFileStream(ui, work, in, "mem.SRV");
  }
  std::vector<std::string> write() {
    std::string path = dir.file("out.SRV");
    EXPECT_TRUE(WriteSrvFile(ui, work, path));
    return SplitCrLf(ReadFile(path));
  }
  SurveyPoint& addPoint(const std::string& name, double e, double n, double z) {
    SurveyPoint p;
    p.PointName = name;
    p.Easting = e;
    p.Northing = n;
    p.Elevation = z;
    p.FeatureCode = "FE";
    work.OutputPoints.push_back(p);
    return work.OutputPoints.back();
  }
  SurveyChain& addChain(const std::string& pointList) {
    SurveyChain c;
    StartChain(c);
    c.PointListLines = pointList;
    work.OutputChains.push_back(c);
    return work.OutputChains.back();
  }
  void expectError(const std::string& text, const std::string& title, int line,
                   const std::string& rule) {
    ui.boxes.clear();
    work.InputPoints.resize(1);
    EXPECT_FALSE(readText(text)) << text;
    ASSERT_EQ(ui.boxes.size(), 1u) << text;
    EXPECT_EQ(ui.boxes[0].title, title);
    EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
    EXPECT_EQ(ui.boxes[0].text, "Invalid CAiCE SRV File 'mem.SRV.  An error occurred on line '" +
                                    std::to_string(line) + rule);
    EXPECT_EQ(work.InputPoints.size(), 1u);
  }

  ScriptedUi ui;
  WorkArea work;
  TempDir dir;
};

// The round trip below shows the fields that are written back; these are the
// ones that are not visible in the written text.
TEST_F(SrvFile, ReadsPointsChainsAndHeader) {
  ASSERT_TRUE(read("chains.srv"));
  EXPECT_TRUE(ui.boxes.empty());
  const FileHeader& h = work.InputHeader;
  EXPECT_EQ(h.HeaderExtraLines, "PR:PROJECT 1206-04-71 TOPO\r\nVR:CAICE SURVEY 10.2");
  EXPECT_EQ(h.HorizontalUnits, "Meters");
  EXPECT_EQ(h.VerticalUnits, "Meters");

  const auto& pts = work.InputPoints;
  ASSERT_EQ(pts.size(), 8u);
  EXPECT_EQ(pts[0].CodeLetter, "F");
  EXPECT_EQ(pts[0].IntegerAttribute, "1");
  EXPECT_DOUBLE_EQ(pts[0].Easting, 254871.334);
  EXPECT_DOUBLE_EQ(pts[0].Northing, 131208.102);
  EXPECT_EQ(pts[0].PointName, "101");
  EXPECT_EQ(pts[0].DescriptionLines, "PD:CONTROL POINT");
  EXPECT_EQ(pts[0].VerticalUnits, "Meters");
  EXPECT_EQ(pts[2].FeatureCode, "-1");
  EXPECT_EQ(pts[2].DescriptionLines, "");

  ASSERT_EQ(work.InputChains.size(), 2u);
  const SurveyChain& ep = work.InputChains[0];
  EXPECT_EQ(ep.CodeLetter, "X");
  EXPECT_EQ(ep.IntegerAttribute, "4");
  EXPECT_EQ(ep.Station, "10+00.00");
  EXPECT_EQ(ep.FeatureCode, "EP");
  EXPECT_EQ(ep.Description, "CD:EDGE OF PAVEMENT LEFT");
  EXPECT_EQ(ep.PointListLines, "PL:201,202,203");
  EXPECT_TRUE(ep.Open);
}

TEST_F(SrvFile, RoundTrip) {
  ASSERT_TRUE(read("chains.srv"));
  WorkArea first = work;
  work.copyInputToOutput();
  std::vector<std::string> lines = write();
  std::vector<std::string> expected = {
      Version(),
      "#PR:PROJECT 1206-04-71 TOPO",
      "#VR:CAICE SURVEY 10.2",
      "#CS:WISCRS",
      "#ZN:Dane County",
      "#HD:NAD 83(1997)",
      "#VD:NAVD 88",
      "#UL:M",
      "P F 1 254871.3340 131208.1020 263.1150 CP 101 CONTROL POINT",
      "P G 254900.5000 131210.2500 262.9000 TREE 150 12 INCH OAK",
      "P 254930.0000 131215.0000 262.7500 -1 151 ",
      "BEGIN EP1 X 4 10+00.00 EP EDGE OF PAVEMENT LEFT ",
      "P 254950.1000 131220.0000 262.5500 EP 201 ",
      "P 254975.3000 131245.5000 262.6010 EP 202 ",
      "C 255000.2000 131270.9000 262.6620 EP 203 PC STA 10+50",
      "END",
      "BEGIN CL1 CL ",
      "P 254960.0000 131230.0000 262.7000 CL 301 ",
      "P 254985.0000 131255.0000 262.7700 CL 302 ",
      "END"};
  EXPECT_EQ(lines, expected);

  ASSERT_TRUE(ReadSrvFile(ui, work, dir.file("out.SRV")));
  ASSERT_EQ(work.InputPoints.size(), first.InputPoints.size());
  for (size_t i = 0; i < work.InputPoints.size(); ++i) {
    const SurveyPoint& a = first.InputPoints[i];
    const SurveyPoint& b = work.InputPoints[i];
    EXPECT_EQ(a.PointName, b.PointName);
    EXPECT_EQ(a.Easting, b.Easting);
    EXPECT_EQ(a.Elevation, b.Elevation);
    EXPECT_EQ(a.DescriptionLines, b.DescriptionLines);
    EXPECT_EQ(a.CodeLetter, b.CodeLetter);
  }
  ASSERT_EQ(work.InputChains.size(), 2u);
  EXPECT_EQ(work.InputChains[0].Description, first.InputChains[0].Description);
  EXPECT_EQ(work.InputChains[0].Station, "10+00.00");
  EXPECT_EQ(work.InputChains[1].PointListLines, "PL:301,302");
}

TEST_F(SrvFile, UnitLineAppliesToPointsStoredAfterIt) {
  ASSERT_TRUE(read("us_feet.srv"));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputPoints[0].HorizontalUnits, "");
  EXPECT_EQ(work.InputPoints[1].HorizontalUnits, "U.S. Survey Feet");
  EXPECT_EQ(work.InputPoints[1].VerticalUnits, "U.S. Survey Feet");
  EXPECT_EQ(work.InputHeader.HorizontalUnits, "U.S. Survey Feet");
  EXPECT_EQ(work.InputHeader.VerticalUnits, "U.S. Survey Feet");

  // Written back, the point without a unit keeps its values.
  work.copyInputToOutput();
  std::vector<std::string> lines = write();
  ASSERT_EQ(lines.size(), 5u);
  EXPECT_EQ(lines[2], "#UL:F");
  EXPECT_EQ(lines[3], "P 836190.0000 430472.0000 863.2000 CP 1 BEFORE UNITS");
  EXPECT_EQ(lines[4], "P 836200.0000 430480.0000 863.5000 CP 2 AFTER UNITS");
}

TEST_F(SrvFile, TokenQuirks) {
  ASSERT_TRUE(read("quirks.srv")) << ui.onlyText();
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, " SURVEY BY FIELD CREW 3");
  const auto& pts = work.InputPoints;
  ASSERT_EQ(pts.size(), 6u);
  // Keywords in any letter case; words after the point id are its description.
  EXPECT_EQ(pts[0].Geometry, "p");
  EXPECT_EQ(pts[0].CodeLetter, "f");
  EXPECT_EQ(pts[0].IntegerAttribute, "7");
  EXPECT_EQ(pts[0].PointName, "10");
  EXPECT_EQ(pts[0].DescriptionLines, "PD:SANITARY MANHOLE END OF LINE");
  // Coordinates without a decimal point are integer attributes; the words and
  // the last attribute carry over to the next point line.
  EXPECT_EQ(pts[1].PointName, "11");
  EXPECT_EQ(pts[1].IntegerAttribute, "999");
  EXPECT_EQ(pts[1].DescriptionLines, "PD:EP #5 REBAR");
  // Inside a chain, code letters and attributes belong to the chain.
  EXPECT_EQ(pts[2].PointName, "12");
  EXPECT_EQ(pts[2].CodeLetter, "");
  EXPECT_EQ(pts[2].DescriptionLines, "PD:BACK OF CURB end");

  ASSERT_EQ(work.InputChains.size(), 2u);
  const SurveyChain& c1 = work.InputChains[0];
  EXPECT_EQ(c1.ChainName, "CURB1");
  EXPECT_EQ(c1.CodeLetter, "F");
  EXPECT_EQ(c1.IntegerAttribute, "22");
  EXPECT_EQ(c1.FeatureCode, "CURB");
  EXPECT_EQ(c1.PointListLines, "PL:12,13");
  // A BEGIN without END keeps the open chain; a new chain starts clean.
  const SurveyChain& c2 = work.InputChains[1];
  EXPECT_EQ(c2.ChainName, "CURB2");
  EXPECT_EQ(c2.CodeLetter, "");
  EXPECT_EQ(c2.IntegerAttribute, "");
  EXPECT_EQ(c2.PointListLines, "PL:14,15");
}

TEST_F(SrvFile, StrayEndAndKeywordsBeforeAPoint) {
  ASSERT_TRUE(readText("BEGIN A\r\n1.5 2.5 3.5 X 1\r\nEND\r\nEND\r\nend c 4.5 5.5 6.5 Y 2\r\n"));
  EXPECT_EQ(work.InputChains.size(), 1u);
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputPoints[1].Geometry, "c");
  EXPECT_EQ(work.InputChains[0].PointListLines, "PL:1");
}

TEST_F(SrvFile, ErrorsNameTheirLine) {
  expectError("P 1.0 2.0 3.0 EP 1\r\n\r\nBEGIN\r\n", "Invalid Chain Name", 3,
              ".  A chain must have a name.");
  expectError("BEGIN  A\r\n", "Invalid Chain Name", 1, ".  A chain must have a name.");
  expectError("P 1.0 N 3.0 EP 1\r\n", "Invalid Northing", 1,
              ".  The northing coordinate must be numeric.");
  expectError("P 1.0 2.0\r\n", "Invalid Elevation", 1, ".  The elevation must be numeric.");
  expectError("P 1.0 2.0 3.0\r\n", "Invalid Feature Code", 1, ".  A feature code is required.");
  expectError("# x\r\nP 1.0 2.0 3.0 EP  desc\r\n", "Invalid Point ID", 2,
              ".  A point id is required.");
  expectError("P 1.0 2.0 3.0 EP\r\n", "Invalid Point ID", 1, ".  A point id is required.");
  expectError("P 1.0 2.0 3.0 EP 1\r\n" + std::string("\0\0\xff\xfe", 4), "Invalid Line", 2,
              ".  The line holds binary data.");
}

TEST_F(SrvFile, MissingFile) {
  EXPECT_FALSE(ReadSrvFile(ui, work, "/nonexistent/a.SRV"));
  EXPECT_EQ(ui.onlyText(), "The file '/nonexistent/a.SRV' can not be found.");
  EXPECT_EQ(ui.boxes[0].title, "File Not Found");
}

TEST_F(SrvFile, ChainBlocks) {
  addPoint("1", 1, 1, 1);
  addPoint("2", 2, 2, 2);
  addPoint("3", 3, 3, 3);
  addPoint("4", 4, 4, 4);
  addPoint("5", 5, 5, 5);
  addChain("PL:1,2\r\nPL:9,3");              // unknown id 9 is skipped
  addChain("PL:3,4").FGText = "CURB LINE";   // shares point 3 with the first chain
  addChain("PL:5");                          // a single point: not a chain
  addChain("PL:1,4").ChainLines = "CH:100";  // a named one
  SurveyChain& named = addChain("PL:2,4");
  named.ChainName = "CL";
  named.CodeLetter = "X";
  named.IntegerAttribute = "3";
  named.Station = "1+00";
  named.FeatureCode = "CL";
  named.Description = "CD:CENTER\r\nCD:LINE";
  addChain("PL:3,1");
  std::vector<std::string> lines = write();
  // Point 4 is written inside the second chain, so only 5 is a loose point.
  std::vector<std::string> expected = {Version(),
                                       "P 5.0000 5.0000 5.0000 FE 5 ",
                                       "BEGIN CH1 ",
                                       "P 1.0000 1.0000 1.0000 FE 1 ",
                                       "P 2.0000 2.0000 2.0000 FE 2 ",
                                       "P 3.0000 3.0000 3.0000 FE 3 ",
                                       "END",
                                       "BEGIN CURB_LINE ",
                                       "",
                                       "P 4.0000 4.0000 4.0000 FE 4 ",
                                       "END",
                                       "BEGIN CH:100 ",
                                       "",
                                       "",
                                       "END",
                                       "BEGIN CL X 3 1+00 CL CENTER LINE ",
                                       "",
                                       "",
                                       "END",
                                       "BEGIN CH2 ",
                                       "",
                                       "",
                                       "END"};
  EXPECT_EQ(lines, expected);
  EXPECT_TRUE(work.OutputChains[0].Open);
  EXPECT_FALSE(work.OutputChains[2].Open);
  EXPECT_TRUE(work.OutputPoints[4].NotYetWritten);
  EXPECT_FALSE(work.OutputPoints[0].NotYetWritten);
}

TEST_F(SrvFile, PointLineAndUnits) {
  work.OutputHeader.HorizontalUnits = kUsSurveyFeet;
  work.OutputHeader.VerticalUnits = kUsSurveyFeet;
  work.OutputHeader.VerticalDatum = "None";
  work.OutputHeader.ProjectLine = "PR:Job 12";
  work.OutputHeader.HeaderExtraLines = "CM:one\r\nCM:two";
  SurveyPoint& p = addPoint("7", 100, 200, 10);
  p.HorizontalUnits = kMeters;
  p.VerticalUnits = kMeters;
  p.FeatureCode = "";
  p.Geometry = "P";
  p.CodeLetter = "U";
  p.IntegerAttribute = "5";
  p.DescriptionLines = "PD:first line\r\nPD:second";
  std::vector<std::string> lines = write();
  ASSERT_EQ(lines.size(), 6u);
  EXPECT_EQ(lines[0], "#PR:Job 12");
  EXPECT_EQ(lines[1], Version());
  EXPECT_EQ(lines[2], "#CM:one");
  EXPECT_EQ(lines[3], "#CM:two");
  EXPECT_EQ(lines[4], "#UL:F");
  EXPECT_EQ(lines[5], "P U 5 328.0833 656.1667 32.8083 -1 7 first line second");
  EXPECT_EQ(work.OutputHeader.HorizontalUnits, "F");
  EXPECT_DOUBLE_EQ(work.OutputPoints[0].Easting, 100 * 3.2808333333333333);

  SurveyPoint q = work.OutputPoints[0];
  q.NotYetWritten = false;
  EXPECT_EQ(SrvPointLine(q, "F"), "");
}

TEST_F(SrvFile, RefusalsWriteNothing) {
  std::string path = dir.file("x.SRV");
  work.OutputHeader.CoordinateSystem = "Geographic Coordinates";
  addPoint("1", 1, 2, 3);
  EXPECT_FALSE(WriteSrvFile(ui, work, path));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Plane Coordiantes Required");
  EXPECT_EQ(ui.boxes[0].text, "A Caice SRV File must contain plane coordinates.");

  work.OutputHeader.CoordinateSystem = "";
  ui.boxes.clear();
  work.OutputPoints[0].PointName = "";
  EXPECT_FALSE(WriteSrvFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), "Point 1 has no point id and can not be written to a CAiCE SRV File.");
  EXPECT_FALSE(std::filesystem::exists(path));
}

// Blanks in ids and feature codes (the shipped WSI sample has remarks such as
// "CONTROL PT") become "_" and are named in one warning.
TEST_F(SrvFile, BlanksInNamesAndCodesAreWrittenAsUnderscores) {
  ASSERT_TRUE(ReadWsiFile(ui, work, std::string(ZV_SOURCE_DIR) + "/appdata/samples/sample.wsi"));
  work.copyInputToOutput();
  work.OutputPoints[1].PointName = "A 1";
  std::string path = dir.file("out.SRV");
  ASSERT_TRUE(WriteSrvFile(ui, work, path));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Check Output File");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
  EXPECT_EQ(ui.boxes[0].text,
            "The file '" + path +
                "' was written, but:\r\n7 point(s) had blanks in their point id or feature code, "
                "written as \"_\": '1001', 'A 1', '1003', '1004', '1005', ...");
  size_t count = work.OutputPoints.size();
  ASSERT_TRUE(ReadSrvFile(ui, work, path));
  ASSERT_EQ(work.InputPoints.size(), count);
  EXPECT_EQ(work.InputPoints[0].FeatureCode, "CONTROL_PT");
  EXPECT_EQ(work.InputPoints[1].PointName, "A_1");
}

TEST_F(SrvFile, SampleInTheApplicationFolderReads) {
  ASSERT_TRUE(ReadSrvFile(ui, work, std::string(ZV_SOURCE_DIR) + "/appdata/samples/sample.srv"));
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(work.InputPoints.size(), 13u);
  EXPECT_EQ(work.InputChains.size(), 2u);
}

}  // namespace
}  // namespace zv
