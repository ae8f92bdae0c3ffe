#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

#include "geodesy/Angles.h"
#include "platform/Numbers.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "userformats/FlexIn.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::TempDir;

FlexInFormat Format(std::string delimiter, std::vector<std::string> columns,
                    std::vector<std::string> order = {}, std::string header = "",
                    std::string ignore = "") {
  FlexInFormat f;
  f.delimiter = std::move(delimiter);
  f.coordinateType = kPlane;
  f.columns = std::move(columns);
  if (order.empty()) {
    for (size_t i = 0; i < f.columns.size(); ++i) order.push_back(std::to_string(i + 1));
  }
  f.order = std::move(order);
  f.headerPrefix = std::move(header);
  f.ignorePrefix = std::move(ignore);
  return f;
}

struct Read {
  bool ok = false;
  FileHeader header;
  std::vector<SurveyPoint> points;
};

Read ReadText(ScriptedUi& ui, const FlexInFormat& format, const std::string& text,
              const std::string& angleFormat = kMeters) {
  std::istringstream in(text);
  Read r;
  r.ok = ReadFlexInStream(ui, in, "in.txt", format, angleFormat, r.header, r.points);
  return r;
}

// The fields of a point that the plane formats fill, "-" for no value.
std::string Show(const SurveyPoint& p) {
  auto n = [](double v) { return v == kNoValue ? std::string("-") : FormatPlainDecimal(v); };
  return p.PointName + "|" + n(p.Northing) + "|" + n(p.Easting) + "|" + n(p.Elevation) + "|" +
         p.FeatureCode + "|" + p.Geometry + "|" + p.DescriptionLines + "|" + p.ExtraLines + "|" +
         n(p.Convergence) + "|" + p.LongitudeHemisphere;
}

TEST(FlexInRead, FieldsFollowTheDelimiterAndColumns) {
  const std::vector<std::string> pnezd = {"Point ID", "Northing", "Easting", "Orthometric Height",
                                          "Feature Code"};
  struct Case {
    FlexInFormat format;
    std::string text;
    std::vector<std::string> points;
  };
  const std::vector<Case> cases = {
      // The order cells say nothing for a delimited format: field i is column i.
      {Format("Comma", {"Point ID", "Northing", "Feature Code", "Easting"}, {"4", "3", "2", "1"}),
       "12, 100.5,,200\n",
       {"12|100.5|200|-||P|||-|W"}},
      // Runs of blanks are one delimiter; other text is the delimiter itself,
      // also longer than one character and compared with letter case.
      {Format("Space", {"Point ID", "Feature Code", "Geometry"}), "A  5\n", {"A|-|-|-||5|||-|W"}},
      {Format("::", {"Point ID", "Northing"}), "P1::10.5\r\n", {"P1|10.5|-|-||P|||-|W"}},
      {Format("comma", {"Point ID", "Feature Code"}), "1,2comma3\n", {"1,2|-|-|-|3|P|||-|W"}},
      {Format("Tab", {"Point ID", "Point Description"}),
       "7\tOAK TREE\n",
       {"7|-|-|-||P|PD:OAK TREE||-|W"}},
      // Attributes accumulate; a plane format reads no angles.
      {Format("Comma", {"Point ID", "Attribute", "Convergance Angle", "Attribute", "Unknown"}),
       "1,first,0.5,second,whatever\n",
       {"1|-|-|-||P||CM:first\r\nCM:second|-|W"}},
      // Trailing delimiters and blank fields lose nothing; a line of blanks
      // holds no point.
      {Format("Comma", {"Point ID", "Northing", "Orthometric Height"}),
       CrLf({"1,10,,,", "2, ,   ", "   "}),
       {"1|10|-|-||P|||-|W", "2|-|-|-||P|||-|W"}},
      {Format("Comma", pnezd),
       ReadFile(ZV_FIXTURES "/flex/comma-trailing-delimiters.csv"),
       {"1|100.5|200.25|10|IPF|P|||-|W", "2|101.5|201.25|-|CP|P|||-|W"}},
      // Column-specific fields keep the blanks of text fields; a field may
      // start beyond the end of its line.
      {Format(kColumnSpecific, {"Point ID", "Northing", "Feature Code"}, {"1", "11", "25"}),
       CrLf({"AB        1234.5", "CD        99.25         TREE"}),
       {"AB        |1234.5|-|-||P|||-|W", "CD        |99.25|-|-|TREE|P|||-|W"}},
      {Format(kColumnSpecific, pnezd, {"1", "11", "25", "39", "49"}, "PRJ", "#"),
       ReadFile(ZV_FIXTURES "/flex/fixed-blank-fields.txt"),
       {"BR-1      |5012.25|7020.5|-|TREE|P|||-|W", "BR-2      |5013|7021.125|812.33||P|||-|W"}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.text);
    ScriptedUi ui;
    Read r = ReadText(ui, c.format, c.text);
    ASSERT_TRUE(r.ok) << ui.onlyText();
    EXPECT_TRUE(ui.boxes.empty());
    std::vector<std::string> shown;
    for (const auto& p : r.points) shown.push_back(Show(p));
    EXPECT_EQ(shown, c.points);
  }
}

TEST(FlexInRead, ProjectHeaderTestComesBeforeIgnore) {
  ScriptedUi ui;
  FlexInFormat f = Format("Comma", {"Point ID", "Northing"}, {}, "PRJ", "P");
  Read r = ReadText(ui, f, CrLf({"PRJ job 12", "PT,skipped", "", "1,10", "PRJ second", "2,20"}));
  ASSERT_TRUE(r.ok);
  EXPECT_EQ(r.header.HeaderExtraLines, "PRJ job 12\r\nPRJ second");
  ASSERT_EQ(r.points.size(), 2u);
  EXPECT_EQ(r.points[1].PointName, "2");
  // Without prefixes every non-empty line is data.
  Read all = ReadText(ui, Format("Comma", {"Point ID"}), CrLf({"PRJ", "#x", "", "P"}));
  EXPECT_EQ(all.points.size(), 3u);
  EXPECT_EQ(all.header.HeaderExtraLines, "");
  // Neither is the header of the fixed-width fixture.
  EXPECT_EQ(ReadText(ui, Format(kColumnSpecific, {"Point ID"}, {"1"}, "PRJ", "#"),
                     ReadFile(ZV_FIXTURES "/flex/fixed-blank-fields.txt"))
                .header.HeaderExtraLines,
            "PRJ Bridge 12");
}

TEST(FlexInRead, GeographicAnglesInEachFormat) {
  const double expected = (45 + 30 / 60.0 + 15.25 / 3600) * kDegreesToRadians;
  struct Case {
    const char* format;
    const char* text;
  };
  for (Case c :
       {Case{kFormatDMS, "45 30 15.25"}, Case{kFormatPacked, "45.301525"},
        Case{kFormatDecimal, " 45.5042361111111 "}, Case{kFormatDM, "45 30.2541666666667"}}) {
    ScriptedUi ui;
    FlexInFormat f = Format(",", {"Point ID", "Latitude", "Longitude", "Convergance Angle"});
    f.coordinateType = kGeographic;
    Read r = ReadText(ui, f, std::string("1,") + c.text + "," + c.text + ",\n", c.format);
    ASSERT_TRUE(r.ok) << c.format << ": " << ui.onlyText();
    EXPECT_NEAR(r.points[0].Latitude, expected, 1e-14) << c.format;
    EXPECT_NEAR(r.points[0].Longitude, expected, 1e-14) << c.format;
    EXPECT_EQ(r.points[0].Convergence, kNoValue);  // empty field
  }
}

TEST(FlexInRead, AngleOutOfRangeIsReportedWithItsLineAndReadingGoesOn) {
  ScriptedUi ui;
  FlexInFormat f = Format("Comma", {"Point ID", "Latitude"});
  f.coordinateType = kGeographic;
  Read r = ReadText(ui, f, CrLf({"1,45 61 00", "2,45 30 00"}), kFormatDMS);
  ASSERT_TRUE(r.ok);
  ASSERT_EQ(r.points.size(), 2u);
  EXPECT_EQ(r.points[0].Latitude, kNoValue);
  EXPECT_NEAR(r.points[1].Latitude, 45.5 * kDegreesToRadians, 1e-14);
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
  EXPECT_EQ(ui.boxes[0].text,
            "Invalid Angle '45 61 00'. Minutes portion must be positive and not exceed 59."
            "\r\nError on line 1.");
}

// Bad data lines stop the read with one message that names the line
// (counted over all lines of the file) and nothing is returned.
TEST(FlexInRead, BadDataLinesNameTheirLine) {
  const std::string head = "Invalid User-Defined ASCII File 'in.txt'.\r\nError on line 3.\r\n";
  struct Case {
    FlexInFormat format;
    std::string angleFormat;
    std::string line3;
    std::string message;
  };
  FlexInFormat geo = Format("Comma", {"Point ID", "Longitude"});
  geo.coordinateType = kGeographic;
  std::vector<Case> cases = {
      {Format("Comma", {"Point ID", "Northing"}), kMeters, "7,12,5",
       "The line has 3 fields but the format has 2 columns."},
      {Format("Comma", {"Point ID", "Northing"}), kMeters, "7,12a",
       "The Northing '12a' is not a number."},
      {Format("Comma", {"Point ID", "Scale Factor"}), kMeters, "7,1e999",
       "The Scale Factor '1e999' is not a number."},
      {Format("Comma", {"Point ID", "Height Error Estimate"}), kMeters, "7,1e60",
       "The Height Error Estimate '1e60' is out of range."},
      {geo, kFormatPacked, "7,W45.30",
       "The Longitude 'W45.30' is not an angle in the "
       "DDD.MMSSssss format."},
      {geo, kFormatDMS, "7,45 30 x",
       "The Longitude '45 30 x' is not an angle in the "
       "DDD MM SS.ssss format."},
  };
  for (const auto& c : cases) {
    ScriptedUi ui;
    Read r = ReadText(ui, c.format, CrLf({"1", "", c.line3, "9"}), c.angleFormat);
    EXPECT_FALSE(r.ok) << c.line3;
    EXPECT_TRUE(r.points.empty());
    ASSERT_EQ(ui.boxes.size(), 1u) << c.line3;
    EXPECT_EQ(ui.boxes[0].title, "Invalid User-Defined ASCII File");
    EXPECT_EQ(ui.boxes[0].text, head + c.message) << c.line3;
    EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
  }
}

TEST(FlexInRead, FormatsThatCannotBeReadWith) {
  struct Case {
    FlexInFormat format;
    std::string title;
    std::string text;
  };
  std::vector<Case> cases = {
      {Format("", {"Point ID"}), "Delimiter Required", "A Delimiter is required."},
      {Format("Comma", {}), "Specify Columns", "You must specify at least one column to import."},
      {Format(kColumnSpecific, {"Point ID", "Northing"}, {"1"}), "Specify Column",
       "You must specify the column for 'Northing'."},
      {Format(kColumnSpecific, {"Point ID", "Northing"}, {"1", "1.5"}), "Invalid Column Position",
       "The position '1.5' of the column 'Northing' is not a whole number from 1 to 32767."},
      {Format(kColumnSpecific, {"Point ID", "Northing"}, {"0", "5"}), "Invalid Column Position",
       "The position '0' of the column 'Point ID' is not a whole number from 1 to 32767."},
      {Format(kColumnSpecific, {"Point ID", "Northing", "Easting"}, {"1", "12", "12"}),
       "Invalid Column Position",
       "The column positions must be ascending: 'Easting' at position 12 does not start after "
       "'Northing' at position 12."},
  };
  for (const auto& c : cases) {
    ScriptedUi ui;
    Read r = ReadText(ui, c.format, "1,2\n");
    EXPECT_FALSE(r.ok) << c.text;
    ASSERT_EQ(ui.boxes.size(), 1u) << c.text;
    EXPECT_EQ(ui.boxes[0].title, c.title);
    EXPECT_EQ(ui.boxes[0].text, c.text);
  }
}

TEST(FlexInRead, FileWithoutDataLinesIsRefused) {
  ScriptedUi ui;
  Read r = ReadText(ui, Format("Comma", {"Point ID"}, {}, "PRJ", "#"),
                    CrLf({"PRJ only a header", "# and a comment", ""}));
  EXPECT_FALSE(r.ok);
  EXPECT_EQ(ui.onlyText(),
            "No points were found in 'in.txt'.\r\nEvery line is empty, a project-header line or "
            "an ignored line.");
}

class FlexInFile : public ::testing::Test {
 protected:
  FlexInChoices Choices(FlexInFormat format) {
    FlexInChoices c;
    c.formatName = "Test";
    c.format = std::move(format);
    c.coordinateSystem = "State Plane 1983";
    c.zone = "Wisconsin Central";
    c.horizontalDatum = "NAD 83";
    c.horizontalUnits = kUsSurveyFeet;
    c.verticalDatum = "NAVD 88";
    c.verticalUnits = kMeters;
    return c;
  }
  TempDir dir;
  ScriptedUi ui;
  WorkArea work;
};

TEST_F(FlexInFile, SuccessFillsHeaderAndStampsUnitsOnPoints) {
  std::string path = dir.write("pts.csv", CrLf({"PRJ Main St", "1,100,200,5"}));
  work.InputChains.resize(2);
  ASSERT_TRUE(
      FlexIn(ui, work, dir.path(), path,
             Choices(Format("Comma", {"Point ID", "Northing", "Easting", "Orthometric Height"}, {},
                            "PRJ"))));
  EXPECT_TRUE(ui.boxes.empty());
  const FileHeader& h = work.InputHeader;
  EXPECT_EQ(h.HeaderExtraLines, "PRJ Main St");
  EXPECT_EQ(h.ProjectLine, "");
  EXPECT_EQ(h.CoordinateSystem, "State Plane 1983");
  EXPECT_EQ(h.Zone, "Wisconsin Central");
  EXPECT_EQ(h.HorizontalDatum, "NAD 83");
  EXPECT_EQ(h.HorizontalUnits, kUsSurveyFeet);
  EXPECT_EQ(h.VerticalDatum, "NAVD 88");
  EXPECT_EQ(h.VerticalUnits, kMeters);
  ASSERT_EQ(work.InputPoints.size(), 1u);
  // Without the units a writer would convert from "" and lose every value.
  EXPECT_EQ(work.InputPoints[0].HorizontalUnits, kUsSurveyFeet);
  EXPECT_EQ(work.InputPoints[0].VerticalUnits, kMeters);
  EXPECT_EQ(work.InputPoints[0].LongitudeHemisphere, "W");
  EXPECT_EQ(work.InputChains.size(), 2u);  // chains are not the reader's
}

TEST_F(FlexInFile, GeographicPointsTakeTheChosenDirections) {
  std::string path = dir.write("geo.txt", "1;43.0415;89.2412\n");
  FlexInFormat f = Format("Semicolon", {"Point ID", "Latitude", "Longitude"});
  f.coordinateType = kGeographic;
  FlexInChoices c = Choices(f);
  c.coordinateSystem = kGeographicCoordinates;
  c.horizontalUnits = kFormatPacked;
  c.latitudeDirection = "S";
  c.longitudeDirection = "E";
  ASSERT_TRUE(FlexIn(ui, work, dir.path(), path, c)) << ui.onlyText();
  const SurveyPoint& p = work.InputPoints.at(0);
  // An east longitude must not be taken for a west one.
  EXPECT_EQ(p.LatitudeHemisphere, "S");
  EXPECT_EQ(p.LongitudeHemisphere, "E");
  EXPECT_NEAR(p.Longitude, (89 + 24 / 60.0 + 12 / 3600.0) * kDegreesToRadians, 1e-14);
}

TEST_F(FlexInFile, FailuresLeaveTheWorkAreaAlone) {
  work.InputPoints.resize(3);
  work.InputHeader.Zone = "kept";
  std::string missing = dir.file("nope.csv");
  EXPECT_FALSE(FlexIn(ui, work, dir.path(), missing, Choices(Format("Comma", {"Point ID"}))));
  EXPECT_EQ(ui.onlyText(), "The file '" + missing + "' can not be found.");
  EXPECT_EQ(ui.boxes[0].title, "File Not Found");

  std::string bad = dir.write("bad.csv", "1,2\n");
  EXPECT_FALSE(FlexIn(ui, work, dir.path(), bad, Choices(Format("Comma", {"Point ID"}))));
  EXPECT_EQ(work.InputPoints.size(), 3u);
  EXPECT_EQ(work.InputHeader.Zone, "kept");
}

TEST_F(FlexInFile, StoredFormatIsUsedWhenNoneIsGiven) {
  FlexStore store = FlexStore::Input(dir.path());
  ASSERT_TRUE(store.save("Office Fixed",
                         Format(kColumnSpecific, {"Point ID", "Northing"}, {"1", "9"}, "", "#")));
  std::string path = dir.write("f.txt", CrLf({"# comment", "P-1     5000.125"}));
  FlexInChoices c = Choices(FlexInFormat{});
  c.format.reset();
  c.formatName = "office fixed";  // section names ignore letter case
  ASSERT_TRUE(FlexIn(ui, work, dir.path(), path, c)) << ui.onlyText();
  EXPECT_EQ(work.InputPoints.at(0).PointName, "P-1     ");
  EXPECT_EQ(work.InputPoints.at(0).Northing, 5000.125);

  c.formatName = "Gone";
  EXPECT_FALSE(FlexIn(ui, work, dir.path(), path, c));
  EXPECT_EQ(ui.boxes.back().title, "Format Not Found");
  EXPECT_EQ(ui.boxes.back().text, "The format 'Gone' can not be found in '" + store.path() + "'.");
}

// The formats shipped in the application folder read their samples.
TEST(FlexInShipped, SamplesReadWithTheirFormats) {
  const std::string app = ZV_SOURCE_DIR "/appdata";
  struct Case {
    const char* format;
    const char* sample;
    size_t points;
  };
  for (Case c :
       {Case{"PNEZD Comma", "sample-pnezd.csv", 12}, Case{"PNEZD Space", "sample-pnezd.txt", 12},
        Case{"PNEZD Fixed", "sample-pnezd-fixed.txt", 12},
        Case{"Geographic PLLHD", "sample-geographic.csv", 6}}) {
    ScriptedUi ui;
    WorkArea work;
    FlexInChoices choices;
    choices.formatName = c.format;
    bool geographic = std::string(c.format).starts_with("Geographic");
    choices.horizontalUnits = geographic ? kFormatDMS : kUsSurveyFeet;
    choices.verticalUnits = kUsSurveyFeet;
    ASSERT_TRUE(FlexIn(ui, work, app, app + "/samples/" + c.sample, choices))
        << c.format << ": " << ui.onlyText();
    EXPECT_TRUE(ui.boxes.empty()) << c.format;
    ASSERT_EQ(work.InputPoints.size(), c.points) << c.format;
    for (const auto& p : work.InputPoints) {
      EXPECT_FALSE(p.PointName.empty()) << c.format;
      if (geographic) {
        EXPECT_GT(p.Latitude, 0.7) << c.format << " " << p.PointName;
        EXPECT_GT(p.Longitude, 1.5) << c.format << " " << p.PointName;
      } else {
        EXPECT_GT(p.Northing, 1000) << c.format << " " << p.PointName;
        EXPECT_GT(p.Easting, 1000) << c.format << " " << p.PointName;
      }
      EXPECT_FALSE(p.FeatureCode.empty()) << c.format;
    }
  }
}

}  // namespace
}  // namespace zv
