// User formats: the FlexIn reader, the FlexOut writer and their store.

#include <gtest/gtest.h>

#include <sstream>

#include "Version.h"
#include "geodesy/Angles.h"
#include "platform/Numbers.h"
#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/Boxes.h"
#include "support/TempDir.h"
#include "userformats/FlexIn.h"
#include "userformats/FlexOut.h"
#include "userformats/FlexStore.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::Take;
using test::TempDir;

FlexInFormat InFormat(std::string delimiter, std::vector<std::string> columns,
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
  FlexInFormat f = InFormat(std::move(delimiter), std::move(columns));
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
      {InFormat("Comma", {"Point ID", "Northing", "Feature Code", "Easting"}, {"4", "3", "2", "1"}),
       "12, 100.5,,200\n",
       {"12|100.5|200|-||P|||-|W"}},
      // Runs of blanks are one delimiter; other text is the delimiter itself,
      // also longer than one character and compared with letter case.
      {InFormat("Space", {"Point ID", "Feature Code", "Geometry"}), "A  5\n", {"A|-|-|-||5|||-|W"}},
      {InFormat("::", {"Point ID", "Northing"}), "P1::10.5\r\n", {"P1|10.5|-|-||P|||-|W"}},
      {InFormat("comma", {"Point ID", "Feature Code"}), "1,2comma3\n", {"1,2|-|-|-|3|P|||-|W"}},
      {InFormat("Tab", {"Point ID", "Point Description"}),
       "7\tOAK TREE\n",
       {"7|-|-|-||P|PD:OAK TREE||-|W"}},
      // Attributes accumulate; a plane format reads no angles.
      {InFormat("Comma", {"Point ID", "Attribute", "Convergance Angle", "Attribute", "Unknown"}),
       "1,first,0.5,second,whatever\n",
       {"1|-|-|-||P||CM:first\r\nCM:second|-|W"}},
      // Trailing delimiters and blank fields lose nothing; a line of blanks
      // holds no point.
      {InFormat("Comma", {"Point ID", "Northing", "Orthometric Height"}),
       CrLf({"1,10,,,", "2, ,   ", "   "}),
       {"1|10|-|-||P|||-|W", "2|-|-|-||P|||-|W"}},
      {InFormat("Comma", pnezd),
       ReadFile(ZV_FIXTURES "/flex/comma-trailing-delimiters.csv"),
       {"1|100.5|200.25|10|IPF|P|||-|W", "2|101.5|201.25|-|CP|P|||-|W"}},
      // Column-specific text fields lose the blanks that pad them to their
      // width; a field may start beyond the end of its line.
      {InFormat(kColumnSpecific, {"Point ID", "Northing", "Feature Code"}, {"1", "11", "25"}),
       CrLf({"AB        1234.5", "CD        99.25         TREE"}),
       {"AB|1234.5|-|-||P|||-|W", "CD|99.25|-|-|TREE|P|||-|W"}},
      {InFormat(kColumnSpecific, pnezd, {"1", "11", "25", "39", "49"}, "PRJ", "#"),
       ReadFile(ZV_FIXTURES "/flex/fixed-blank-fields.txt"),
       {"BR-1|5012.25|7020.5|-|TREE|P|||-|W", "BR-2|5013|7021.125|812.33||P|||-|W"}},
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
  FlexInFormat f = InFormat("Comma", {"Point ID", "Northing"}, {}, "PRJ", "P");
  Read r = ReadText(ui, f, CrLf({"PRJ job 12", "PT,skipped", "", "1,10", "PRJ second", "2,20"}));
  ASSERT_TRUE(r.ok && r.points.size() == 2);
  EXPECT_EQ(r.header.HeaderExtraLines + "|" + r.points[1].PointName, "PRJ job 12\r\nPRJ second|2");
  // Without prefixes every non-empty line is data.
  Read all = ReadText(ui, InFormat("Comma", {"Point ID"}), CrLf({"PRJ", "#x", "", "P"}));
  EXPECT_EQ(all.points.size(), 3u);
  EXPECT_EQ(all.header.HeaderExtraLines, "");
  // Neither is the header of the fixed-width fixture.
  EXPECT_EQ(ReadText(ui, InFormat(kColumnSpecific, {"Point ID"}, {"1"}, "PRJ", "#"),
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
  EXPECT_EQ(Take(ui),
            "E Invalid Angle: Invalid Angle '45 61 00'. Minutes portion must be positive and not "
            "exceed 59.\r\nError on line 1.");
}

// Refusals come as one message and return nothing. Bad data lines name their
// line, counted over all lines of the file.
TEST(FlexInRead, RefusalsNameTheirCause) {
  const std::string bad = "Invalid User-Defined ASCII File";
  const std::string at3 = bad + " 'in.txt'.\r\nError on line 3.\r\n";
  const std::string position = "Invalid Column Position";
  auto line3 = [](const std::string& line) { return CrLf({"1", "", line, "9"}); };
  const std::tuple<FlexInFormat, std::string, std::string, std::string, std::string> cases[] = {
      {InFormat("Comma", {"Point ID", "Northing"}), kMeters, line3("7,12,5"), bad,
       at3 + "The line has 3 fields but the format has 2 columns."},
      {InFormat("Comma", {"Point ID", "Northing"}), kMeters, line3("7,12a"), bad,
       at3 + "The Northing '12a' is not a number."},
      {InFormat("Comma", {"Point ID", "Scale Factor"}), kMeters, line3("7,1e999"), bad,
       at3 + "The Scale Factor '1e999' is not a number."},
      {InFormat("Comma", {"Point ID", "Height Error Estimate"}), kMeters, line3("7,1e60"), bad,
       at3 + "The Height Error Estimate '1e60' is out of range."},
      {Geo({"Point ID", "Longitude"}), kFormatPacked, line3("7,W45.30"), bad,
       at3 + "The Longitude 'W45.30' is not an angle in the DDD.MMSSssss format."},
      {Geo({"Point ID", "Longitude"}), kFormatDMS, line3("7,45 30 x"), bad,
       at3 + "The Longitude '45 30 x' is not an angle in the DDD MM SS.ssss format."},
      {InFormat("", {"Point ID"}), kMeters, "1,2\n", "Delimiter Required",
       "A Delimiter is required."},
      {InFormat("Comma", {}), kMeters, "1,2\n", "Specify Columns",
       "You must specify at least one column to import."},
      {InFormat(kColumnSpecific, {"Point ID", "Northing"}, {"1"}), kMeters, "1,2\n",
       "Specify Column", "You must specify the column for 'Northing'."},
      {InFormat(kColumnSpecific, {"Point ID", "Northing"}, {"1", "1.5"}), kMeters, "1,2\n",
       position,
       "The position '1.5' of the column 'Northing' is not a whole number from 1 to 32767."},
      {InFormat(kColumnSpecific, {"Point ID", "Northing"}, {"0", "5"}), kMeters, "1,2\n", position,
       "The position '0' of the column 'Point ID' is not a whole number from 1 to 32767."},
      {InFormat(kColumnSpecific, {"Point ID", "Northing", "Easting"}, {"1", "12", "12"}), kMeters,
       "1,2\n", position,
       "The column positions must be ascending: 'Easting' at position 12 does not start after "
       "'Northing' at position 12."},
      {InFormat("Comma", {"Point ID"}, {}, "PRJ", "#"), kMeters,
       "PRJ only a header\r\n# a comment\r\n\r\n", "No Points Found",
       "No points were found in 'in.txt'.\r\nEvery line is empty, a project-header line or "
       "an ignored line."},
  };
  for (const auto& [format, angles, text, title, message] : cases) {
    ScriptedUi ui;
    Read r = ReadText(ui, format, text, angles);
    EXPECT_FALSE(r.ok || !r.points.empty()) << message;
    EXPECT_EQ(Take(ui), "E " + title + ": " + message);
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
             Choices(InFormat("Comma", {"Point ID", "Northing", "Easting", "Orthometric Height"},
                              {}, "PRJ"))));
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
  EXPECT_FALSE(FlexIn(ui, work, dir.path(), missing, Choices(InFormat("Comma", {"Point ID"}))));
  EXPECT_EQ(Take(ui), "E File Not Found: The file '" + missing + "' can not be found.");

  std::string bad = dir.write("bad.csv", "1,2\n");
  EXPECT_FALSE(FlexIn(ui, work, dir.path(), bad, Choices(InFormat("Comma", {"Point ID"}))));
  EXPECT_EQ(work.InputPoints.size(), 3u);
  EXPECT_EQ(work.InputHeader.Zone, "kept");
}

TEST_F(FlexInFile, StoredFormatIsUsedWhenNoneIsGiven) {
  FlexStore store = FlexStore::Input(dir.path());
  ASSERT_TRUE(store.save("Office Fixed",
                         InFormat(kColumnSpecific, {"Point ID", "Northing"}, {"1", "9"}, "", "#")));
  std::string path = dir.write("f.txt", CrLf({"# comment", "P-1     5000.125"}));
  FlexInChoices c = Choices(FlexInFormat{});
  c.format.reset();
  c.formatName = "office fixed";  // section names ignore letter case
  ASSERT_TRUE(FlexIn(ui, work, dir.path(), path, c)) << ui.onlyText();
  EXPECT_EQ(Show(work.InputPoints.at(0)), "P-1|5000.125|-|-||P|||-|W");

  c.formatName = "Gone";
  EXPECT_FALSE(FlexIn(ui, work, dir.path(), path, c));
  EXPECT_EQ(Take(ui),
            "E Format Not Found: The format 'Gone' can not be found in '" + store.path() + "'.");
}

FlexOutFormat OutFormat(std::string delimiter, std::vector<std::string> columns,
                        std::vector<std::string> order, std::vector<std::string> decimals = {}) {
  FlexOutFormat f;
  f.delimiter = std::move(delimiter);
  f.coordinateType = kPlane;
  f.columns = std::move(columns);
  f.order = std::move(order);
  f.decimalPlaces = std::move(decimals);
  return f;
}

SurveyPoint Point(std::string name, double northing, std::string units = kMeters) {
  SurveyPoint p;
  p.PointName = std::move(name);
  p.Northing = northing;
  p.HorizontalUnits = units;
  p.VerticalUnits = units;
  return p;
}

std::string Join(const std::vector<std::string>& items) {
  std::string all;
  for (size_t i = 0; i < items.size(); ++i) all += (i ? "," : "") + items[i];
  return all;
}

class FlexOutTest : public ::testing::Test {
 protected:
  FlexOutChoices Choices(FlexOutFormat format) {
    FlexOutChoices c;
    c.formatName = "Test";
    c.format = std::move(format);
    c.horizontalUnits = kMeters;
    c.verticalUnits = kMeters;
    c.coordinateSystem = "State Plane 1983";
    c.zone = "Wisconsin South";
    c.horizontalDatum = "NAD 83";
    c.verticalDatum = "NAVD 88";
    std::tm t{};
    t.tm_year = 124, t.tm_mon = 2, t.tm_mday = 5, t.tm_hour = 7, t.tm_min = 4, t.tm_sec = 9;
    c.timestamp = t;
    return c;
  }
  // Writes and returns the file's text.
  std::string Write(const FlexOutChoices& c) {
    EXPECT_TRUE(FlexOut(ui, work, dir.path(), out, c)) << ui.onlyText();
    return ReadFile(out);
  }
  TempDir dir;
  std::string out = dir.file("out.txt");
  ScriptedUi ui;
  WorkArea work;
};

// Columns sorted by order (equal numbers keep the grid order), number
// formats, text columns on one line, fixed positions padded and cut; the
// warnings come after a complete write.
TEST_F(FlexOutTest, WrittenLinesAndWarnings) {
  SurveyPoint tree = Point("1", 5);
  tree.DescriptionLines = "PD:OAK\r\nPD:24 IN";
  tree.ExtraLines = "CM:a";
  tree.FeatureCode = "OAK TREE";
  const std::string cut =
      "1 field(s) were cut short by the next column's position (first on "
      "line 1, column 'Point ID').";
  const std::string split =
      "1 field(s) contain the delimiter and will not read back as one "
      "field (first on line 2, column 'Feature Code').";
  auto expect = [&](std::vector<SurveyPoint> points, const FlexOutFormat& format,
                    const std::vector<std::string>& lines, const std::string& warning) {
    SCOPED_TRACE(lines[0]);
    work.OutputPoints = std::move(points);
    ui.boxes.clear();
    EXPECT_EQ(Write(Choices(format)), CrLf(lines));
    EXPECT_EQ(ui.boxes.empty() ? "" : ui.onlyText(),
              warning.empty() ? "" : "The file '" + out + "' was written, but:\r\n" + warning);
    for (const auto& box : ui.boxes) EXPECT_EQ(box.title, "Check Output File");
  };
  expect({Point("7", 10.25)}, OutFormat("Comma", {"Point ID", "Northing"}, {"2", "1"}, {"", "3"}),
         {"10.250,7"}, "");
  expect({Point("7", 10.25)},
         OutFormat(" | ", {"Northing", "Point ID", "Geometry"}, {"2", "1", "2"}), {"7 | 10 | P"},
         "");
  expect({Point("a", 0.5), Point("b", -12.34), Point("c", 1234.5), Point("d", kNoValue),
          Point("e", 0.04)},
         OutFormat("Comma", {"Northing", "Northing", "Northing"}, {"1", "2", "3"}, {"2", "1", ""}),
         {"0.50,0.5,0", "-12.34,-12.3,-12", "1234.50,1234.5,1234", "-99999.00,-99999.0,-99999",
          "0.04,0.0,0"},
         "");
  expect({tree},
         OutFormat(";", {"Point Description", "Attribute", "Feature Code"}, {"1", "2", "3"}),
         {"PD:OAK  PD:24 IN;CM:a;OAK TREE"}, "");
  expect({Point("ABCDEFGH", 12.5), Point("AB", 3)},
         OutFormat(kColumnSpecific, {"Northing", "Point ID"}, {"6", "1"}, {"1", ""}),
         {"ABCDE12.5", "AB   3.0"}, cut);
  expect({Point("0", 1), tree}, OutFormat("Space", {"Point ID", "Feature Code"}, {"1", "2"}),
         {"0 ", "1 OAK TREE"}, split);
}

TEST_F(FlexOutTest, UnitsAndHemispheresAreConvertedOnceAndStoredBack) {
  SurveyPoint p = Point("1", 1000, kMeters);
  p.Easting = 2000;
  p.Elevation = 100;
  p.NorthingError = 0.01f;
  p.ScaleFactor = 0.99996;
  work.OutputPoints = {p};
  FlexOutChoices c =
      Choices(OutFormat("Comma",
                        {"Northing", "Easting", "Orthometric Height", "Northing Error Estimate",
                         "Scale Factor", "Northing"},
                        {"1", "2", "3", "4", "5", "6"}, {"4", "4", "3", "4", "8", "4"}));
  c.horizontalUnits = kUsSurveyFeet;
  c.verticalUnits = kInternationalFeet;
  // The second Northing column must not convert the converted value again.
  EXPECT_EQ(Write(c), CrLf({"3280.8333,6561.6667,328.084,0.0328,0.99996000,3280.8333"}));
  EXPECT_NEAR(work.OutputPoints[0].Northing, 3280.833333333, 1e-6);  // stored back
  EXPECT_NEAR(work.OutputPoints[0].Elevation, 328.0839895, 1e-9);
}

TEST_F(FlexOutTest, GeographicColumns) {
  SurveyPoint p = Point("G", kNoValue);
  p.Latitude = (43 + 4 / 60.0 + 25.12345 / 3600) * kDegreesToRadians;
  p.Longitude = (89 + 23 / 60.0 + 51.6 / 3600) * kDegreesToRadians;
  p.Convergence = kNoValue;
  work.OutputPoints = {p};
  FlexOutFormat f = OutFormat("Comma", {"Point ID", "Latitude", "Longitude", "Convergance Angle"},
                              {"1", "2", "3", "4"}, {"", "5", "5", "1"});
  FlexOutChoices c = Choices(f);
  c.horizontalUnits = kFormatDMS;
  c.longitudeDirection = "E";
  EXPECT_EQ(Write(c), CrLf({"G,43 04 25.12345,270 36 08.40000,-99999"}));
  EXPECT_NEAR(work.OutputPoints[0].Longitude, kFullCircle - p.Longitude, 1e-12);

  // With linear horizontal units the angle columns are empty.
  work.OutputPoints = {p};
  c.horizontalUnits = kMeters;
  EXPECT_EQ(Write(c), CrLf({"G,,,"}));
}

TEST_F(FlexOutTest, HeaderBlock) {
  work.OutputPoints = {Point("1", 5)};
  work.OutputHeader.HeaderExtraLines = "PRJ Main St\r\nPRJ phase 2";
  FlexOutFormat f = OutFormat("Comma", {"Point ID"}, {"1"});
  f.writeHeader = true;
  f.headerPrefix = "# ";
  FlexOutChoices c = Choices(f);
  c.verticalUnits = kUsSurveyFeet;
  const std::string vr = "# VR:" + std::string(kAppTitle) + " " + std::to_string(kVersionMajor) +
                         "." + std::to_string(kVersionMinor) + "." +
                         std::to_string(kVersionRevision);
  EXPECT_EQ(
      Write(c),
      CrLf({vr, "# CM:03/05/2024 7:04:09", "# CM:FLEXED OUT USING Test", "# CS:State Plane 1983",
            "# ZN:Wisconsin South", "# HD:NAD 83", "# VD:NAVD 88", "# CM:HORIZONTAL UNITS - Meters",
            "# CM:VERTICAL UNITS - U.S. Survey Feet", "# PRJ Main St", "# PRJ phase 2", "1"}));

  // Geographic, no vertical datum, no format name, no prefix.
  f.headerPrefix = "";
  c = Choices(f);
  c.formatName = "";
  c.coordinateSystem = kGeographicCoordinates;
  c.horizontalUnits = kFormatDecimal;
  c.verticalDatum = "None";
  work.OutputHeader.HeaderExtraLines.clear();
  EXPECT_EQ(Write(c),
            CrLf({vr.substr(2), "CM:03/05/2024 7:04:09", "CM:FLEXED OUT USING UNDEFINED FORMAT",
                  "CS:Geographic Coordinates", "HD:NAD 83", "UL:DDD.dddddd", "1"}));

  // Unchecked: the first line is the first point.
  f.writeHeader = false;
  EXPECT_EQ(Write(Choices(f)), CrLf({"1"}));
}

TEST_F(FlexOutTest, RefusalsWriteNothing) {
  const std::tuple<FlexOutFormat, std::string, std::string> cases[] = {
      {OutFormat("", {"Point ID"}, {"1"}), "Delimiter Required", "A Delimiter is required."},
      {OutFormat("Comma", {}, {}), "Specify Columns",
       "You must specify at least one column to import."},
      {OutFormat("Comma", {"Point ID", "Northing"}, {"1"}), "Specify Column",
       "You must specify the column for 'Northing'."},
      {OutFormat("Comma", {"Point ID"}, {"x"}), "Invalid Column Position",
       "The position 'x' of the column 'Point ID' is not a whole number from 1 to 32767."},
      {OutFormat("Comma", {"Northing"}, {"1"}, {"16"}), "Invalid Decimal Places",
       "The decimal places '16' of the column 'Northing' are not a whole number from 0 to 15."},
  };
  work.OutputPoints = {Point("1", 5)};
  for (const auto& [format, title, text] : cases) {
    EXPECT_FALSE(FlexOut(ui, work, dir.path(), out, Choices(format)));
    EXPECT_EQ(Take(ui), "E " + title + ": " + text);
  }
  std::string bad = dir.file("no-such-folder/out.txt");
  EXPECT_FALSE(
      FlexOut(ui, work, dir.path(), bad, Choices(OutFormat("Comma", {"Point ID"}, {"1"}))));
  EXPECT_NE(Take(ui).find(bad), std::string::npos);
  work.OutputPoints.clear();
  EXPECT_FALSE(
      FlexOut(ui, work, dir.path(), out, Choices(OutFormat("Comma", {"Point ID"}, {"1"}))));
  EXPECT_EQ(ui.onlyText(), "There are no points to write. The file '" + out + "' was not written.");
  EXPECT_FALSE(FileExists(out));
}

// The shipped input formats read their samples, and the output formats of the
// same name write what reads back alike.
TEST(FlexShipped, SamplesReadAndRoundTrip) {
  const std::string app = ZV_SOURCE_DIR "/appdata";
  auto shown = [](const std::vector<SurveyPoint>& points) {
    std::ostringstream all;
    all.precision(12);
    for (const auto& p : points) {
      all << p.PointName << "," << p.Northing << "," << p.Easting << "," << p.Elevation << ","
          << p.Latitude << "," << p.Longitude << "," << p.FeatureCode << "\n";
      EXPECT_FALSE(p.PointName.empty() || p.FeatureCode.empty());
      EXPECT_TRUE((p.Northing > 1000 && p.Easting > 1000) ||
                  (p.Latitude > 0.7 && p.Longitude > 1.5));
    }
    return all.str();
  };
  for (auto [name, sample, count] : {std::tuple{"PNEZD Comma", "sample-pnezd.csv", 12u},
                                     {"PNEZD Space", "sample-pnezd.txt", 12u},
                                     {"PNEZD Fixed", "sample-pnezd-fixed.txt", 12u},
                                     {"Geographic PLLHD", "sample-geographic.csv", 6u}}) {
    SCOPED_TRACE(name);
    ScriptedUi ui;
    TempDir dir;
    WorkArea work;
    const bool geographic = std::string(name).starts_with("Geographic");
    FlexInChoices in;
    in.formatName = name;
    in.horizontalUnits = geographic ? kFormatDMS : kUsSurveyFeet;
    in.verticalUnits = kUsSurveyFeet;
    in.verticalDatum = "NAVD 88";
    ASSERT_TRUE(FlexIn(ui, work, app, app + "/samples/" + sample, in)) << ui.onlyText();
    ASSERT_EQ(work.InputPoints.size(), count);
    const std::string first = shown(work.InputPoints);
    work.copyInputToOutput();
    FlexOutChoices out;
    out.formatName = name;
    out.horizontalUnits = in.horizontalUnits;
    out.verticalUnits = kUsSurveyFeet;
    out.verticalDatum = "NAVD 88";
    ASSERT_TRUE(FlexOut(ui, work, app, dir.file("out.txt"), out)) << ui.onlyText();
    ASSERT_TRUE(FlexIn(ui, work, app, dir.file("out.txt"), in)) << ui.onlyText();
    EXPECT_TRUE(ui.boxes.empty()) << ui.boxes.size();
    EXPECT_EQ(shown(work.InputPoints), first);
  }
}

TEST(FlexStoreTest, ReadsTheWorkedExampleSections) {
  TempDir dir;
  dir.write(kFlexInStoreName,
            CrLf({"[Office CSV]", "Delimiter=Comma", "Coordinate Type=Plane",
                  "Columns=Point ID,Northing,Easting,Orthometric Height,Feature Code,Attribute",
                  "Column Order=1,2,3,4,5,6", "Header=", "Ignore=#", "", "[Office Fixed]",
                  "Delimiter=Column Specific", "Coordinate Type=Plane",
                  "Columns=Point ID,Northing,Easting,Orthometric Height,Feature Code,Attribute",
                  "Column Order=1,11,25,39,49,57", "Header=PRJ", "Ignore=#"}));
  FlexStore store = FlexStore::Input(dir.path());
  EXPECT_EQ(store.listFormats(), (std::vector<std::string>{"Office CSV", "Office Fixed"}));
  FlexInFormat f = store.loadInput("office fixed");
  EXPECT_EQ(f.delimiter + "|" + Join(f.columns) + "|" + Join(f.order) + "|" + f.headerPrefix + "|" +
                f.ignorePrefix,
            std::string(kColumnSpecific) +
                "|Point ID,Northing,Easting,Orthometric Height,Feature Code,Attribute|"
                "1,11,25,39,49,57|PRJ|#");
  EXPECT_EQ(store.loadInput("Office CSV").headerPrefix, "");
  EXPECT_EQ(store.readValue("Office CSV", "Header", "none"), "none");  // empty reads as default
  EXPECT_TRUE(store.hasFormat("OFFICE CSV"));
  EXPECT_FALSE(store.hasFormat("Office"));
}

TEST(FlexStoreTest, SaveLoadAndDeleteOutputFormats) {
  TempDir dir;
  FlexStore store = FlexStore::Output(dir.path());
  FlexOutFormat f =
      OutFormat("Tab", {"Point ID", "Latitude", "Longitude"}, {"1", "2", "3"}, {"", "5", "5"});
  f.coordinateType = kGeographic;
  f.writeHeader = true;
  f.headerPrefix = "#";
  ASSERT_TRUE(store.save("GNSS", f));
  FlexOutFormat other = f;
  other.writeHeader = false;
  ASSERT_TRUE(store.save("Other", other));

  FlexOutFormat b = store.loadOutput("GNSS");
  EXPECT_EQ(b.delimiter + "|" + b.coordinateType + "|" + Join(b.columns) + "|" + Join(b.order) +
                "|" + Join(b.decimalPlaces) + "|" + std::to_string(b.writeHeader) + "|" +
                b.headerPrefix + "|" + std::to_string(store.loadOutput("Other").writeHeader),
            "Tab|" + std::string(kGeographic) + "|Point ID,Latitude,Longitude|1,2,3|,5,5|1|#|0");
  EXPECT_NE(ReadFile(store.path()).find("Decimal Places=,5,5\r\n"), std::string::npos);

  ASSERT_TRUE(store.deleteFormat("gnss"));
  EXPECT_EQ(store.listFormats(), (std::vector<std::string>{"Other"}));

  // Names that would not read back as the same section are refused.
  for (std::string bad : {"", " lead", "trail ", "a]b", "two\nlines"}) {
    EXPECT_FALSE(store.save(bad, f)) << bad;
  }
  EXPECT_EQ(store.listFormats(), (std::vector<std::string>{"Other"}));
}

TEST(FlexStoreTest, WriteHeaderOtherThanOneIsOff) {
  TempDir dir;
  dir.write(kFlexOutStoreName, CrLf({"[A]", "Write Header=yes", "[B]", "Write Header=1"}));
  FlexStore store = FlexStore::Output(dir.path());
  const FlexOutFormat missing = store.loadOutput("missing");
  EXPECT_EQ(std::to_string(store.loadOutput("A").writeHeader) +
                std::to_string(store.loadOutput("B").writeHeader) +
                std::to_string(missing.writeHeader) + Join(missing.columns),
            "010");
  // Column names are spelt as stored, with letter case.
  EXPECT_FALSE(FlexColumnFromName("Convergence Angle") || FlexColumnFromName("point id"));
}

}  // namespace
}  // namespace zv
