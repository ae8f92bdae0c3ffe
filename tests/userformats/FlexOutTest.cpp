#include <gtest/gtest.h>

#include <sstream>

#include "Version.h"
#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/TempDir.h"
#include "userformats/FlexIn.h"
#include "userformats/FlexOut.h"
#include "userformats/FlexStore.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::TempDir;

FlexOutFormat Format(std::string delimiter, std::vector<std::string> columns,
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
  expect({Point("7", 10.25)}, Format("Comma", {"Point ID", "Northing"}, {"2", "1"}, {"", "3"}),
         {"10.250,7"}, "");
  expect({Point("7", 10.25)}, Format(" | ", {"Northing", "Point ID", "Geometry"}, {"2", "1", "2"}),
         {"7 | 10 | P"}, "");
  expect({Point("a", 0.5), Point("b", -12.34), Point("c", 1234.5), Point("d", kNoValue),
          Point("e", 0.04)},
         Format("Comma", {"Northing", "Northing", "Northing"}, {"1", "2", "3"}, {"2", "1", ""}),
         {"0.50,0.5,0", "-12.34,-12.3,-12", "1234.50,1234.5,1234", "-99999.00,-99999.0,-99999",
          "0.04,0.0,0"},
         "");
  expect({tree}, Format(";", {"Point Description", "Attribute", "Feature Code"}, {"1", "2", "3"}),
         {"PD:OAK  PD:24 IN;CM:a;OAK TREE"}, "");
  expect({Point("ABCDEFGH", 12.5), Point("AB", 3)},
         Format(kColumnSpecific, {"Northing", "Point ID"}, {"6", "1"}, {"1", ""}),
         {"ABCDE12.5", "AB   3.0"}, cut);
  expect({Point("0", 1), tree}, Format("Space", {"Point ID", "Feature Code"}, {"1", "2"}),
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
      Choices(Format("Comma",
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
  FlexOutFormat f = Format("Comma", {"Point ID", "Latitude", "Longitude", "Convergance Angle"},
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
  FlexOutFormat f = Format("Comma", {"Point ID"}, {"1"});
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
      {Format("", {"Point ID"}, {"1"}), "Delimiter Required", "A Delimiter is required."},
      {Format("Comma", {}, {}), "Specify Columns",
       "You must specify at least one column to import."},
      {Format("Comma", {"Point ID", "Northing"}, {"1"}), "Specify Column",
       "You must specify the column for 'Northing'."},
      {Format("Comma", {"Point ID"}, {"x"}), "Invalid Column Position",
       "The position 'x' of the column 'Point ID' is not a whole number from 1 to 32767."},
      {Format("Comma", {"Northing"}, {"1"}, {"16"}), "Invalid Decimal Places",
       "The decimal places '16' of the column 'Northing' are not a whole number from 0 to 15."},
  };
  work.OutputPoints = {Point("1", 5)};
  for (const auto& [format, title, text] : cases) {
    ScriptedUi ui2;
    EXPECT_FALSE(FlexOut(ui2, work, dir.path(), out, Choices(format)));
    EXPECT_EQ(ui2.onlyText(), text);
    EXPECT_EQ(ui2.boxes.at(0).title, title);
  }
  std::string bad = dir.file("no-such-folder/out.txt");
  EXPECT_FALSE(FlexOut(ui, work, dir.path(), bad, Choices(Format("Comma", {"Point ID"}, {"1"}))));
  EXPECT_NE(ui.onlyText().find(bad), std::string::npos);
  ui.boxes.clear();
  work.OutputPoints.clear();
  EXPECT_FALSE(FlexOut(ui, work, dir.path(), out, Choices(Format("Comma", {"Point ID"}, {"1"}))));
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
      Format("Tab", {"Point ID", "Latitude", "Longitude"}, {"1", "2", "3"}, {"", "5", "5"});
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
  EXPECT_EQ(FlexColumnNames(kGeographic)[1], "Latitude");
  EXPECT_TRUE(FlexColumnFromName("Convergance Angle"));
  EXPECT_FALSE(FlexColumnFromName("Convergence Angle") || FlexColumnFromName("point id"));
  EXPECT_EQ(ResolveDelimiter("Semicolon"), ";");
  EXPECT_EQ(ResolveDelimiter("tab"), "tab");
}

}  // namespace
}  // namespace zv
