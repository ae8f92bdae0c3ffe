#include <gtest/gtest.h>

#include <sstream>

#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/SurveyFiles.h"
#include "survey/SurveyTestSupport.h"
#include "survey/TaggedFile.h"

namespace zv {
namespace {

using test::CrLf;
using test::Fixture;
using test::ReadFile;
using test::SplitCrLf;
using test::TempDir;

class SurveyProjectFile : public ::testing::Test {
 protected:
  bool read(const std::string& name) {
    return ReadProjectFile(ui, work, Fixture("project/" + name));
  }

  // Writes the input side as a project file and returns its lines.
  std::vector<std::string> writeBack() {
    work.copyInputToOutput();
    std::string path = dir.file("out.PRJ");
    EXPECT_TRUE(WriteProjectFile(ui, work, path));
    return SplitCrLf(ReadFile(path));
  }

  ScriptedUi ui;
  WorkArea work;
  TempDir dir;
};

TEST_F(SurveyProjectFile, RecordCodesAndControlFlagsSurviveARoundTrip) {
  ASSERT_TRUE(read("record_codes.PRJ"));
  ASSERT_EQ(work.InputPoints.size(), 3u);
  EXPECT_EQ(work.InputPoints[0].RecordCode, "SS");
  EXPECT_TRUE(work.InputPoints[0].HorizontalIsControl);
  EXPECT_TRUE(work.InputPoints[0].ElevationIsControl);
  EXPECT_EQ(work.InputPoints[1].RecordCode, "OS");
  EXPECT_FALSE(work.InputPoints[1].HorizontalIsControl);
  EXPECT_EQ(work.InputPoints[2].RecordCode, "PD");

  std::vector<std::string> lines = writeBack();
  EXPECT_EQ(lines, std::vector<std::string>(
                       {"AC:PR",     VersionLine(), "UL:M", "AC:SS", "PN:1", "YC:1.0000",
                        "XC:2.0000", "ZC:3.0000",   "GM:P", "AC:OS", "PN:2", "YY:4.0000",
                        "XX:5.0000", "ZZ:6.0000",   "GM:P", "AC:PD", "PN:3", "YY:7.0000",
                        "XX:8.0000", "ZZ:9.0000",   "GM:P"}));
  ASSERT_TRUE(ReadProjectFile(ui, work, dir.file("out.PRJ")));
  ASSERT_EQ(work.InputPoints.size(), 3u);
  EXPECT_EQ(work.InputPoints[0].RecordCode, "SS");
  EXPECT_EQ(work.InputPoints[2].RecordCode, "PD");
  EXPECT_EQ(work.InputPoints[2].Easting, 8);
}

TEST_F(SurveyProjectFile, ControlGridWithComputedElevation) {
  ASSERT_TRUE(read("mixed_flags.PRJ"));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_TRUE(work.InputPoints[0].HorizontalIsControl);
  EXPECT_FALSE(work.InputPoints[0].ElevationIsControl);
  std::vector<std::string> lines = writeBack();
  EXPECT_EQ(std::vector<std::string>(lines.begin() + 2, lines.begin() + 7),
            std::vector<std::string>({"AC:TP", "PN:1", "YC:1.0000", "XC:2.0000", "ZZ:3.0000"}));

  work.OutputPoints[0].GridMissing = true;
  work.OutputPoints[0].Elevation = kNoValue;
  ASSERT_TRUE(WriteProjectFile(ui, work, dir.file("g.PRJ")));
  EXPECT_NE(ReadFile(dir.file("g.PRJ")).find("YC:-99999\r\nXC:-99999\r\nZZ:-99999\r\n"),
            std::string::npos);
}

TEST_F(SurveyProjectFile, EmptyRecordCodeIsABareAcLine) {
  ASSERT_TRUE(read("bare_record_code.PRJ"));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_EQ(work.InputPoints[0].RecordCode, "");
  EXPECT_EQ(work.InputPoints[0].PointName, "1");
  std::vector<std::string> lines = writeBack();
  EXPECT_EQ(lines[2], "AC:");
  ASSERT_TRUE(ReadProjectFile(ui, work, dir.file("out.PRJ")));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_EQ(work.InputPoints[0].PointName, "1");
}

TEST_F(SurveyProjectFile, PointsAndChainsKeepTheirChains) {
  ASSERT_TRUE(ReadPointsChainsFile(ui, work, Fixture("pac/chains.PAC")));
  std::vector<std::string> lines = writeBack();
  EXPECT_EQ(lines[9], "AC:");  // points of a points-and-chains file have no record code
  ASSERT_TRUE(ReadProjectFile(ui, work, dir.file("out.PRJ")));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  ASSERT_EQ(work.InputChains.size(), 2u);
  EXPECT_EQ(work.InputChains[0].Description, "CD:Edge of pavement");
  EXPECT_EQ(work.InputChains[1].PointListLines, "PL:102,101");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(SurveyProjectFile, Messages) {
  std::string path = Fixture("project/blank_line.PRJ");
  EXPECT_FALSE(ReadProjectFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), "Invalid VORN File '" + path +
                               "'.\r\nError on line 4.\r\n"
                               "An VORN Points and Chains File can not contain blank lines.");
  EXPECT_EQ(ui.boxes[0].title, "Invalid VORN File");

  ui.boxes.clear();
  path = Fixture("project/bad_scale_factor.PRJ");
  EXPECT_FALSE(ReadProjectFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), "Invalid VORN File: '" + path +
                               "'\r\nError on Line: 4\r\nScale Factor must be numeric.");
}

TEST_F(SurveyProjectFile, ControlFileWithoutHeaderKeepsTheRecordCodeOfEachPoint) {
  std::istringstream in(CrLf({"AC:SS", "PN:1", "AC:PR", "CM:h", "AC:TP", "PN:2"}));
  ASSERT_TRUE(ReadProjectStream(ui, work, in, "mem.PRJ"));
  // The empty point before the first AC line, point 1 (kept although a
  // project section follows it), point 2.
  ASSERT_EQ(work.InputPoints.size(), 3u);
  EXPECT_EQ(work.InputPoints[1].RecordCode, "SS");
  EXPECT_EQ(work.InputPoints[1].PointName, "1");
  EXPECT_EQ(work.InputPoints[2].RecordCode, "TP");
  EXPECT_EQ(work.InputHeader.HeaderExtraLines, "CM:h");
}

}  // namespace
}  // namespace zv
