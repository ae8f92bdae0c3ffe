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

FlexInFormat Geo(std::vector<std::string> columns, std::string delimiter = "Comma") {
  FlexInFormat f = Format(std::move(delimiter), std::move(columns));
  f.coordinateType = kGeographic;
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
  ASSERT_TRUE(r.ok && r.points.size() == 2);
  EXPECT_EQ(r.header.HeaderExtraLines + "|" + r.points[1].PointName, "PRJ job 12\r\nPRJ second|2");
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
  for (auto [format, text] :
       {std::pair{kFormatDMS, "45 30 15.25"}, std::pair{kFormatPacked, "45.301525"},
        std::pair{kFormatDecimal, " 45.5042361111111 "},
        std::pair{kFormatDM, "45 30.2541666666667"}}) {
    ScriptedUi ui;
    FlexInFormat f = Geo({"Point ID", "Latitude", "Longitude", "Convergance Angle"}, ",");
    Read r = ReadText(ui, f, std::string("1,") + text + "," + text + ",\n", format);
    ASSERT_TRUE(r.ok) << format << ": " << ui.onlyText();
    EXPECT_NEAR(r.points[0].Latitude, expected, 1e-14) << format;
    EXPECT_NEAR(r.points[0].Longitude, expected, 1e-14) << format;
    EXPECT_EQ(r.points[0].Convergence, kNoValue);  // empty field
  }
}

TEST(FlexInRead, AngleOutOfRangeIsReportedWithItsLineAndReadingGoesOn) {
  ScriptedUi ui;
  Read r =
      ReadText(ui, Geo({"Point ID", "Latitude"}), CrLf({"1,45 61 00", "2,45 30 00"}), kFormatDMS);
  ASSERT_TRUE(r.ok && r.points.size() == 2);
  EXPECT_EQ(r.points[0].Latitude, kNoValue);
  EXPECT_NEAR(r.points[1].Latitude, 45.5 * kDegreesToRadians, 1e-14);
  EXPECT_EQ(ui.onlyText(),
            "Invalid Angle '45 61 00'. Minutes portion must be positive and not exceed 59."
            "\r\nError on line 1.");
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
}

// Refusals come as one message and return nothing. Bad data lines name their
// line, counted over all lines of the file.
TEST(FlexInRead, RefusalsNameTheirCause) {
  const std::string bad = "Invalid User-Defined ASCII File";
  const std::string at3 = bad + " 'in.txt'.\r\nError on line 3.\r\n";
  const std::string position = "Invalid Column Position";
  auto line3 = [](const std::string& line) { return CrLf({"1", "", line, "9"}); };
  const std::tuple<FlexInFormat, std::string, std::string, std::string, std::string> cases[] = {
      {Format("Comma", {"Point ID", "Northing"}), kMeters, line3("7,12,5"), bad,
       at3 + "The line has 3 fields but the format has 2 columns."},
      {Format("Comma", {"Point ID", "Northing"}), kMeters, line3("7,12a"), bad,
       at3 + "The Northing '12a' is not a number."},
      {Format("Comma", {"Point ID", "Scale Factor"}), kMeters, line3("7,1e999"), bad,
       at3 + "The Scale Factor '1e999' is not a number."},
      {Format("Comma", {"Point ID", "Height Error Estimate"}), kMeters, line3("7,1e60"), bad,
       at3 + "The Height Error Estimate '1e60' is out of range."},
      {Geo({"Point ID", "Longitude"}), kFormatPacked, line3("7,W45.30"), bad,
       at3 + "The Longitude 'W45.30' is not an angle in the DDD.MMSSssss format."},
      {Geo({"Point ID", "Longitude"}), kFormatDMS, line3("7,45 30 x"), bad,
       at3 + "The Longitude '45 30 x' is not an angle in the DDD MM SS.ssss format."},
      {Format("", {"Point ID"}), kMeters, "1,2\n", "Delimiter Required",
       "A Delimiter is required."},
      {Format("Comma", {}), kMeters, "1,2\n", "Specify Columns",
       "You must specify at least one column to import."},
      {Format(kColumnSpecific, {"Point ID", "Northing"}, {"1"}), kMeters, "1,2\n", "Specify Column",
       "You must specify the column for 'Northing'."},
      {Format(kColumnSpecific, {"Point ID", "Northing"}, {"1", "1.5"}), kMeters, "1,2\n", position,
       "The position '1.5' of the column 'Northing' is not a whole number from 1 to 32767."},
      {Format(kColumnSpecific, {"Point ID", "Northing"}, {"0", "5"}), kMeters, "1,2\n", position,
       "The position '0' of the column 'Point ID' is not a whole number from 1 to 32767."},
      {Format(kColumnSpecific, {"Point ID", "Northing", "Easting"}, {"1", "12", "12"}), kMeters,
       "1,2\n", position,
       "The column positions must be ascending: 'Easting' at position 12 does not start after "
       "'Northing' at position 12."},
      {Format("Comma", {"Point ID"}, {}, "PRJ", "#"), kMeters,
       "PRJ only a header\r\n# a comment\r\n\r\n", "No Points Found",
       "No points were found in 'in.txt'.\r\nEvery line is empty, a project-header line or "
       "an ignored line."},
  };
  for (const auto& [format, angles, text, title, message] : cases) {
    SCOPED_TRACE(message);
    ScriptedUi ui;
    Read r = ReadText(ui, format, text, angles);
    EXPECT_FALSE(r.ok);
    EXPECT_TRUE(r.points.empty());
    EXPECT_EQ(ui.onlyText(), message);
    EXPECT_EQ(ui.boxes.at(0).title, title);
    EXPECT_EQ(ui.boxes.at(0).icon, Icon::Exclamation);
  }
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
  EXPECT_EQ(h.HeaderExtraLines + "|" + h.ProjectLine + "|" + h.CoordinateSystem + "|" + h.Zone +
                "|" + h.HorizontalDatum + "|" + h.HorizontalUnits + "|" + h.VerticalDatum + "|" +
                h.VerticalUnits,
            std::string("PRJ Main St||State Plane 1983|Wisconsin Central|NAD 83|") + kUsSurveyFeet +
                "|NAVD 88|" + kMeters);
  // Without the units a writer would convert from "" and lose every value.
  const SurveyPoint& p = work.InputPoints.at(0);
  EXPECT_EQ(p.HorizontalUnits + "|" + p.VerticalUnits + "|" + p.LongitudeHemisphere,
            std::string(kUsSurveyFeet) + "|" + kMeters + "|W");
  EXPECT_EQ(work.InputChains.size(), 2u);  // chains are not the reader's
}

TEST_F(FlexInFile, GeographicPointsTakeTheChosenDirections) {
  std::string path = dir.write("geo.txt", "1;43.0415;89.2412\n");
  FlexInChoices c = Choices(Geo({"Point ID", "Latitude", "Longitude"}, "Semicolon"));
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
  EXPECT_EQ(Show(work.InputPoints.at(0)), "P-1     |5000.125|-|-||P|||-|W");

  c.formatName = "Gone";
  EXPECT_FALSE(FlexIn(ui, work, dir.path(), path, c));
  EXPECT_EQ(ui.boxes.back().title + ": " + ui.boxes.back().text,
            "Format Not Found: The format 'Gone' can not be found in '" + store.path() + "'.");
}

}  // namespace
}  // namespace zv
