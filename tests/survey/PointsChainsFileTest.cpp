#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <regex>
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

class SurveyPointsChains : public ::testing::Test {
 protected:
  bool read(const std::string& name) {
    return ReadPointsChainsFile(ui, work, Fixture("pac/" + name));
  }
  bool readText(const std::string& text) {
    std::istringstream in(text);
    return ReadPointsChainsStream(ui, work, in, "mem.PAC");
  }

  ScriptedUi ui;
  WorkArea work;
};

TEST_F(SurveyPointsChains, ReadsPointsAndChains) {
  ASSERT_TRUE(read("chains.PAC"));
  EXPECT_TRUE(ui.boxes.empty());
  const FileHeader& h = work.InputHeader;
  EXPECT_EQ(h.ProjectLine, "PR:Highway 7");
  EXPECT_EQ(h.HeaderExtraLines, "VR:Old Program 2.0.1");
  EXPECT_EQ(h.Zone, "4801");
  EXPECT_EQ(h.VerticalDatum, "NAVD88");
  EXPECT_EQ(h.HorizontalUnits, kMeters);

  ASSERT_EQ(work.InputPoints.size(), 2u);
  const SurveyPoint& p = work.InputPoints[0];
  EXPECT_EQ(p.PointName, "101");
  EXPECT_EQ(p.Northing, 1000.1234);
  EXPECT_FALSE(p.HorizontalIsControl);
  EXPECT_NEAR(p.Latitude, Dms(45, 30, 15.12345), 1e-12);
  EXPECT_EQ(p.DescriptionLines, "PD:Iron pin\r\nPD:found");
  EXPECT_EQ(p.FeatureCode, "IP");
  EXPECT_EQ(p.ExtraLines, "CM:checked");
  EXPECT_FLOAT_EQ(p.NorthingError, 0.01f);
  EXPECT_EQ(p.HorizontalUnits, kMeters);
  EXPECT_EQ(work.InputPoints[1].Geometry, "L");

  ASSERT_EQ(work.InputChains.size(), 2u);
  const SurveyChain& c = work.InputChains[0];
  EXPECT_TRUE(c.Open);
  EXPECT_EQ(c.FeatureCode, "EP");
  EXPECT_EQ(c.Description, "CD:Edge of pavement");
  EXPECT_EQ(c.FGText, "1");
  EXPECT_EQ(c.PointListLines, "PL:101,102");
  EXPECT_EQ(c.ChainLines, "CH:A");
  EXPECT_EQ(c.ExtraLines, "CM:chain note");
  EXPECT_EQ(work.InputChains[1].FeatureCode, "CL");
  EXPECT_EQ(work.InputChains[1].PointListLines, "PL:102,101");
}

TEST_F(SurveyPointsChains, RoundTripKeepsPointsAndChains) {
  TempDir dir;
  ASSERT_TRUE(read("chains.PAC"));
  WorkArea first = work;
  work.copyInputToOutput();
  ASSERT_TRUE(WritePointsChainsFile(ui, work, dir.file("out.PAC")));
  std::vector<std::string> lines = SplitCrLf(ReadFile(dir.file("out.PAC")));
  ASSERT_GE(lines.size(), 4u);
  EXPECT_TRUE(std::regex_match(lines.back(), std::regex(R"(CP:\d\d/\d\d/\d{4} \d{1,2}:\d\d:\d\d)")))
      << lines.back();
  EXPECT_EQ(lines[lines.size() - 2], "EG:END CHAIN LIST");
  for (const std::string& l : lines) EXPECT_FALSE(l.empty());

  ASSERT_TRUE(ReadPointsChainsFile(ui, work, dir.file("out.PAC")));
  ASSERT_EQ(work.InputPoints.size(), first.InputPoints.size());
  for (size_t i = 0; i < work.InputPoints.size(); ++i) {
    const SurveyPoint& a = first.InputPoints[i];
    const SurveyPoint& b = work.InputPoints[i];
    EXPECT_EQ(a.PointName, b.PointName);
    EXPECT_EQ(a.Northing, b.Northing);
    EXPECT_EQ(a.Easting, b.Easting);
    EXPECT_EQ(a.Elevation, b.Elevation);
    EXPECT_NEAR(a.Latitude, b.Latitude, 1e-12);
    EXPECT_NEAR(a.Longitude, b.Longitude, 1e-12);
    EXPECT_NEAR(a.Convergence, b.Convergence, 1e-9);
    EXPECT_EQ(a.ScaleFactor, b.ScaleFactor);
    EXPECT_EQ(a.FeatureCode, b.FeatureCode);
    EXPECT_EQ(a.Geometry, b.Geometry);
    EXPECT_EQ(a.DescriptionLines, b.DescriptionLines);
    EXPECT_EQ(a.ExtraLines, b.ExtraLines);
    EXPECT_EQ(a.GRText, b.GRText);
    EXPECT_FLOAT_EQ(a.EastingError, b.EastingError);
  }
  ASSERT_EQ(work.InputChains.size(), 2u);
  for (size_t i = 0; i < 2; ++i) {
    const SurveyChain& a = first.InputChains[i];
    const SurveyChain& b = work.InputChains[i];
    EXPECT_EQ(a.FeatureCode, b.FeatureCode);
    EXPECT_EQ(a.Description, b.Description);
    EXPECT_EQ(a.FGText, b.FGText);
    EXPECT_EQ(a.PointListLines, b.PointListLines);
    EXPECT_EQ(a.ChainLines, b.ChainLines);
    EXPECT_EQ(a.ExtraLines, b.ExtraLines);
  }
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(SurveyPointsChains, ChainSectionQuirks) {
  // Only EG ends a chain section: FE and unknown lines of a later point go
  // to the open chain.
  ASSERT_TRUE(read("point_after_chain.PAC"));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  ASSERT_EQ(work.InputChains.size(), 1u);
  EXPECT_EQ(work.InputPoints[1].PointName, "2");
  EXPECT_EQ(work.InputPoints[1].FeatureCode, "");
  EXPECT_EQ(work.InputPoints[1].ExtraLines, "");
  EXPECT_EQ(work.InputChains[0].FeatureCode, "XX");
  EXPECT_EQ(work.InputChains[0].ExtraLines, "CM:point note");

  // AC:CH does not store the pending point; it is stored at the next AC line.
  ASSERT_TRUE(read("chain_keeps_pending_point.PAC"));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputPoints[0].PointName, "1");
  EXPECT_EQ(work.InputPoints[0].Elevation, 1);
  EXPECT_EQ(work.InputPoints[1].PointName, "2");
  ASSERT_EQ(work.InputChains.size(), 1u);
  EXPECT_EQ(work.InputChains[0].PointListLines, "PL:1,2");

  ASSERT_TRUE(read("no_ac_lines.PAC"));
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_EQ(work.InputPoints[0].FeatureCode, "TR");
  EXPECT_TRUE(work.InputChains.empty());
}

TEST_F(SurveyPointsChains, NothingIsLostAroundSections) {
  // A stray EG adds no empty or repeated chain.
  ASSERT_TRUE(read("stray_end_chain.PAC"));
  ASSERT_EQ(work.InputChains.size(), 1u);
  EXPECT_EQ(work.InputChains[0].PointListLines, "PL:1,2");

  // Chain lines outside a chain section are kept with the point.
  ASSERT_TRUE(read("chain_lines_outside_chain.PAC"));
  ASSERT_EQ(work.InputChains.size(), 1u);
  EXPECT_EQ(work.InputChains[0].PointListLines, "PL:1,2");
  EXPECT_EQ(work.InputPoints[0].ExtraLines, "PL:7,8\r\nCD:late");

  // A point followed by a second project section is stored, not dropped.
  ASSERT_TRUE(read("point_before_project_section.PAC"));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputPoints[0].PointName, "1");
  EXPECT_EQ(work.InputPoints[0].Northing, 1);
  EXPECT_EQ(work.InputPoints[1].PointName, "2");
}

TEST_F(SurveyPointsChains, Messages) {
  std::string path = Fixture("pac/control_coordinates.PAC");
  EXPECT_FALSE(ReadPointsChainsFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), "Invalid VORN Points and Chains File '" + path +
                               "'.\r\nError on line 5.\r\n"
                               "An VORN Points and Chains File can not contain control "
                               "coordinates.");
  EXPECT_EQ(ui.boxes[0].title, "Invalid VORN Points and Chains File");

  ui.boxes.clear();
  path = Fixture("pac/bad_latitude.PAC");
  EXPECT_FALSE(ReadPointsChainsFile(ui, work, path));
  EXPECT_EQ(ui.onlyText(), "Invalid VORN Points and Chains File: '" + path +
                               "'\r\nError on Line: 4\r\nLatitude must be numeric.");

  ui.boxes.clear();
  EXPECT_FALSE(readText("AC:PR\r\n\r\n"));
  EXPECT_EQ(ui.onlyText(),
            "Invalid VORN Points and Chains File 'mem.PAC'.\r\nError on line 2.\r\n"
            "An VORN Points and Chains File can not contain blank lines.");
}

TEST_F(SurveyPointsChains, FieldMessagesByTag) {
  const std::pair<const char*, const char*> cases[] = {
      {"XX", "Easting Coordinate must be numeric."},
      {"YY", "Northing Coordinate must be numeric."},
      {"ZZ", "Elevation Coordinate must be numeric."},
      {"SX", "Easting Error Estimate must be numeric."},
      {"SY", "Northing Error Estimate must be numeric."},
      {"SZ", "Elevation Error Estimate must be numeric."},
      {"LT", "Latitude must be numeric."},
      {"LG", "Longitude must be numeric."},
      {"HE", "Ellipsoid Height must be numeric."},
      {"HG", "Geoid Height must be numeric."},
      {"CA", "Convergance Angle must be numeric."},
      {"SF", "Scale Factor must be numeric."},
  };
  for (const auto& [tag, message] : cases) {
    for (const char* value : {"", "1,5", "1.2.3", "nan", "1e999"}) {
      ui.boxes.clear();
      EXPECT_FALSE(readText("AC:PD\r\n" + std::string(tag) + ":" + value + "\r\n")) << tag << value;
      EXPECT_EQ(ui.onlyText(),
                "Invalid VORN Points and Chains File: 'mem.PAC'\r\n"
                "Error on Line: 2\r\n" +
                    std::string(message));
    }
  }
  // Blanks around a number are allowed; an error estimate beyond single
  // precision is refused rather than overflowing.
  ui.boxes.clear();
  ASSERT_TRUE(readText("YY: -12.5 \r\nSX:+0.01\r\n"));
  EXPECT_EQ(work.InputPoints[0].Northing, -12.5);
  EXPECT_FALSE(readText("SZ:1e39\r\n"));
}

TEST_F(SurveyPointsChains, WritesGeometryAndOnlyNeededChainLines) {
  TempDir dir;
  SurveyPoint p;
  p.PointName = "1";
  p.Northing = 1;
  p.Easting = 2;
  p.Elevation = 3;
  p.HorizontalIsControl = true;  // still written as computed
  work.OutputPoints = {p};
  ASSERT_TRUE(WritePointsChainsFile(ui, work, dir.file("a.PAC")));
  EXPECT_EQ(ReadFile(dir.file("a.PAC")), CrLf({"AC:PR", VersionLine(), "AC:PD", "PN:1", "YY:1.0000",
                                               "XX:2.0000", "ZZ:3.0000", "GM:P"}));

  SurveyChain bare;
  StartChain(bare);
  SurveyChain full;
  full.FeatureCode = "EP";
  full.Description = "CD:one\r\nCD:two";
  full.FGText = "F";
  full.PointListLines = "PL:1,2\r\nPL:3";
  full.ChainLines = "CH:x";
  full.ExtraLines = "CM:y\r\n";  // a stray line end writes no empty line
  work.OutputChains = {bare, full};
  work.OutputPoints[0].GridMissing = true;
  ASSERT_TRUE(WritePointsChainsFile(ui, work, dir.file("b.PAC")));
  std::vector<std::string> lines = SplitCrLf(ReadFile(dir.file("b.PAC")));
  lines.pop_back();  // CP
  EXPECT_EQ(lines, std::vector<std::string>({"AC:PR",
                                             VersionLine(),
                                             "AC:PD",
                                             "PN:1",
                                             "YY:-99999",
                                             "XX:-99999",
                                             "ZZ:3.0000",
                                             "GM:P",
                                             "BG:BEGIN CHAIN LIST",
                                             "AC:CH",
                                             "AC:CH",
                                             "FE:EP",
                                             "CD:one",
                                             "CD:two",
                                             "FG:F",
                                             "PL:1,2",
                                             "PL:3",
                                             "CH:x",
                                             "CM:y",
                                             "EG:END CHAIN LIST"}));
}

TEST_F(SurveyPointsChains, ChainListDateFormat) {
  const char* old = std::getenv("TZ");
  std::string saved = old ? old : "";
  setenv("TZ", "UTC", 1);
  tzset();
  EXPECT_EQ(ChainListDate(0), "01/01/1970 0:00:00");
  EXPECT_EQ(ChainListDate(1715072703), "05/07/2024 9:05:03");
  EXPECT_EQ(ChainListDate(1734567890), "12/19/2024 0:24:50");
  if (old) {
    setenv("TZ", saved.c_str(), 1);
  } else {
    unsetenv("TZ");
  }
  tzset();
}

}  // namespace
}  // namespace zv
