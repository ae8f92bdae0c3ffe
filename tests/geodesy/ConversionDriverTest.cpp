// The point conversion driver: datum transformations with their questions,
// the vertical step, projections over the shipped zones, unit conversion and
// the single-point report.

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <filesystem>

#include "geodesy/Angles.h"
#include "geodesy/ConversionDriver.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

constexpr double kDeg = kDegreesToRadians;
constexpr double kUsFoot = 1200.0 / 3937.0;

double Dms(double d, double m, double s) {
  return (d + m / 60 + s / 3600) * kDeg;
}

std::tm FixedTime() {
  return std::tm{7, 5, 9, 4, 2, 126, 0, 0, 0, 0, nullptr};  // 03/04/2026 9:05:07
}

SurveyPoint Geographic(const std::string& name, double lat, double lon) {
  SurveyPoint p;
  p.PointName = name;
  p.Latitude = lat;
  p.Longitude = lon;
  p.VerticalUnits = kMeters;
  return p;
}

SurveyPoint Grid(const std::string& name, double northing, double easting,
                 const std::string& units) {
  SurveyPoint p;
  p.PointName = name;
  p.Northing = northing;
  p.Easting = easting;
  p.HorizontalUnits = units;
  p.VerticalUnits = kMeters;
  return p;
}

// Both sides in the order input, output: coordinate system, zone, horizontal
// datum and units, vertical datum and units.
void Set(ConversionSettings& s, const std::array<std::string, 12>& v) {
  std::string* f[] = {&s.inputCoordinateSystem,  &s.inputZone,           &s.inputHorizontalDatum,
                      &s.inputHorizontalUnits,   &s.inputVerticalDatum,  &s.inputVerticalUnits,
                      &s.outputCoordinateSystem, &s.outputZone,          &s.outputHorizontalDatum,
                      &s.outputHorizontalUnits,  &s.outputVerticalDatum, &s.outputVerticalUnits};
  for (int i = 0; i < 12; ++i) *f[i] = v[i];
}

// A GEOID09 grid of -30.25 m around 45 N, 90 W, with the stand-in programs.
void InstallGeoid(const test::TempDir& app) {
  test::InstallAllStandIns(app.path());
  test::SaveGeoidGrid(
      app.file("NGS/GEOID/g2009u05.bin"),
      test::MakeGeoidGrid(40, 265, 0.25, 40, 40, [](double, double) { return -30.25; }));
}

class ConversionDriverTest : public ::testing::Test {
 protected:
  ConversionDriverTest() {
    test::InstallCatalogs(app.path());
    state.now = FixedTime;
  }
  test::TempDir app;
  ScriptedUi ui;
  ConversionState state;
};

TEST_F(ConversionDriverTest, HorizontalDatumsWithoutMethodAskOrRefuse) {
  app.write("datums.ini", test::Ini("[NAD 83]|Ellipsoid=GRS 80|WGS 84=Same frame|[WGS 84]|"
                                    "Ellipsoid=GRS 80|[Local]|Ellipsoid=Clarke 1866"));
  std::vector<SurveyPoint> points{Geographic("A", 0.7, 1.6)};
  // Any method other than NADCON is a pair that needs no shift.
  EXPECT_TRUE(HorizontalDatumTransformation(ui, app.path(), points, "NAD 83", "WGS 84"));
  EXPECT_TRUE(ui.boxes.empty());

  const std::string question =
      "No datum transformation exists for 'WGS 84' to 'NAD 83' but these datums share the same "
      "ellipsoid.  The coordiantes can be converted without a datum transformation but this may "
      "introduce errors.  Do you want to convert the coordinates without applying a datum "
      "transformation?";
  ui.answers = {Answer::Yes, Answer::No};
  EXPECT_TRUE(HorizontalDatumTransformation(ui, app.path(), points, "WGS 84", "NAD 83"));
  EXPECT_FALSE(HorizontalDatumTransformation(ui, app.path(), points, "WGS 84", "NAD 83"));
  EXPECT_EQ(ui.boxes.at(1).buttons, Buttons::YesNo);
  EXPECT_EQ(test::Take(ui),
            "  Convert Coordiantes Without Datum Transformation?: " + question +
                "\n  Convert Coordiantes Without Datum Transformation?: " + question);
  EXPECT_EQ(points[0].Latitude, 0.7);

  // Two datums missing from datums.ini share the empty ellipsoid.
  EXPECT_FALSE(HorizontalDatumTransformation(ui, app.path(), points, "X", "Y"));
  EXPECT_EQ(ui.boxes.at(0).buttons, Buttons::YesNo);
  ui.boxes.clear();
  EXPECT_FALSE(HorizontalDatumTransformation(ui, app.path(), points, "Local", "NAD 83"));
  EXPECT_EQ(test::Take(ui),
            "E No Datum Transformation: No datum transformation exists for 'Local' to 'NAD 83'.");
}

// The datum shift comes before the projection: NAD 27 coordinates into a
// NAD 83 zone through the stand-in NADCON, shifts +0.5" and -1.25" (west).
TEST_F(ConversionDriverTest, DatumShiftIntoAZone) {
  test::InstallAllStandIns(app.path());
  const std::string folder = app.file("NGS/NADCON/");
  test::SaveShiftGrid(folder + "conus.las",
                      test::MakeShiftGrid(-120, 30, 1, 40, 20, [](double, double) { return 0.5; }));
  test::SaveShiftGrid(
      folder + "conus.los",
      test::MakeShiftGrid(-120, 30, 1, 40, 20, [](double, double) { return -1.25; }));
  const double lat = Dms(32, 16, 52), lon = Dms(106, 45, 14);
  std::vector<SurveyPoint> shifted{Geographic("A", lat + Dms(0, 0, 0.5), lon - Dms(0, 0, 1.25))};
  ASSERT_TRUE(GeographicToGrid(ui, app.path(), shifted, "State Plane 1983",
                               "New Mexico Central 3002", "NAD 83", kMeters));

  state.points = {Geographic("A", lat, lon)};
  state.points[0].Elevation = 10;
  Set(state.settings,
      {kGeographicCoordinates, "", "NAD 27", "", "NGVD 29", kMeters, "State Plane 1983",
       "New Mexico Central 3002", "NAD 83", kMeters, "NGVD 29", kUsSurveyFeet});
  ASSERT_TRUE(ConvertPoints(ui, app.path(), state)) << ui.onlyText();
  EXPECT_NEAR(state.points[0].Latitude, shifted[0].Latitude, 2e-11);
  EXPECT_NEAR(state.points[0].Northing, shifted[0].Northing, 0.001);
  EXPECT_NEAR(state.points[0].Easting, shifted[0].Easting, 0.001);
  EXPECT_DOUBLE_EQ(state.points[0].Elevation, 10 * 3.2808333333333333);
  EXPECT_TRUE(state.points[0].VerticalUnits == kUsSurveyFeet && ui.boxes.empty());
}

TEST_F(ConversionDriverTest, VerticalTransformationsAndUnits) {
  std::vector<SurveyPoint> points{Geographic("A", 0.7, 1.6)};
  EXPECT_FALSE(VerticalDatumTransformation(ui, app.path(), points, "NGVD 29", "NAD 83"));
  app.write("datums.ini", test::CrLf({"[Old]", "New=Tide gauge 1960"}));
  EXPECT_FALSE(VerticalDatumTransformation(ui, app.path(), points, "Old", "New"));
  EXPECT_EQ(test::Take(ui),
            "E No Datum Transformation: No datum transformation exists for 'NGVD 29' to 'NAD "
            "83'.\nE Unknown Transformation Method: Unknown vertical transformation method 'Tide "
            "gauge 1960'.");

  // Equal datums and no geoid heights: no program runs (none is installed),
  // only the units change; absent heights stay absent.
  points[0].VerticalUnits = kUsSurveyFeet;
  points[0].Elevation = 100.0;
  points[0].ElevationError = 0.5f;
  points[0].GeoidHeight = -99999.0;
  ConversionSettings s;
  s.inputVerticalDatum = s.outputVerticalDatum = "NAVD 88";
  s.outputVerticalUnits = kMeters;
  ASSERT_TRUE(VerticalStep(ui, app.path(), points, s));
  EXPECT_DOUBLE_EQ(points[0].Elevation, 100.0 * 0.3048006096012192);
  EXPECT_FLOAT_EQ(points[0].ElevationError, static_cast<float>(0.5 * 0.3048006096012192));
  EXPECT_TRUE(points[0].GeoidHeight == kNoValue && points[0].EllipsoidHeight == kNoValue);
  EXPECT_EQ(points[0].VerticalUnits, kMeters);

  // A height in units nobody knows is refused, not turned into -99999.
  points[0].VerticalUnits = "Chains";
  EXPECT_FALSE(VerticalStep(ui, app.path(), points, s));
  EXPECT_EQ(ui.onlyText(),
            "The lengths of point 'A' can not be converted from 'Chains' to 'Meters'.");
  EXPECT_DOUBLE_EQ(points[0].Elevation, 100.0 * 0.3048006096012192);
}

TEST_F(ConversionDriverTest, GeoidHeightsFillTheMissingHeight) {
  InstallGeoid(app);
  std::vector<SurveyPoint> points(3, Geographic("P", 45 * kDeg, 90 * kDeg));
  points[0].Elevation = 100.0;        // H: h = H + N
  points[1].EllipsoidHeight = 100.0;  // h: H = h - N
  points[2].Elevation = 1.0;          // both given: kept
  points[2].EllipsoidHeight = 2.0;
  ConversionSettings s;
  s.inputVerticalDatum = s.outputVerticalDatum = "NAVD 88";
  s.outputVerticalUnits = kMeters;
  s.OutputGeoid = true;
  s.geoidModel = "GEOID09";
  ASSERT_TRUE(VerticalStep(ui, app.path(), points, s)) << ui.onlyText();
  EXPECT_DOUBLE_EQ(points[0].EllipsoidHeight, 69.75);
  EXPECT_DOUBLE_EQ(points[1].Elevation, 130.25);
  EXPECT_TRUE(points[2].Elevation == 1.0 && points[2].EllipsoidHeight == 2.0);
  for (const SurveyPoint& p : points) EXPECT_EQ(p.GeoidHeight, -30.25);
}

TEST_F(ConversionDriverTest, ProjectsOverTheShippedZonesInTheAskedUnits) {
  // NGS SPCS83 example, New Mexico Central: N 142158.262, E 452489.852 m,
  // convergence -0 16 09.78, scale 0.99992783; given south-positive, with
  // an error in international feet, asked in U.S. survey feet.
  const double lat = Dms(32, 16, 52.33969), lon = Dms(106, 45, 15.77636);
  std::vector<SurveyPoint> feet{Geographic("NM", -lat, lon), Geographic("NONE", kNoValue, lon)};
  feet[0].LatitudeHemisphere = "S";
  feet[0].HorizontalUnits = kInternationalFeet;
  feet[0].EastingError = 1.0f;
  ASSERT_TRUE(GeographicToGrid(ui, app.path(), feet, "State Plane 1983", "New Mexico Central 3002",
                               "NAD 83", kUsSurveyFeet));
  EXPECT_NEAR(feet[0].Northing * kUsFoot, 142158.262, 0.001);
  EXPECT_NEAR(feet[0].Easting * kUsFoot, 452489.852, 0.001);
  EXPECT_NEAR(feet[0].Convergence, -Dms(0, 16, 9.78), 0.01 / 3600 * kDeg);
  EXPECT_NEAR(feet[0].ScaleFactor, 0.99992783, 1e-8);
  EXPECT_FLOAT_EQ(feet[0].EastingError, 0.999998f);
  EXPECT_EQ(feet[0].HorizontalUnits + feet[0].LatitudeHemisphere, std::string(kUsSurveyFeet) + "N");
  EXPECT_DOUBLE_EQ(feet[0].Latitude, lat);
  EXPECT_FALSE(feet[0].GridMissing);
  EXPECT_TRUE(feet[1].Northing == kNoValue && feet[1].Easting == kNoValue);

  // And back: northing and easting go to the projection's metres first.
  feet.pop_back();
  ASSERT_TRUE(GridToGeographic(ui, app.path(), feet, "State Plane 1983", "New Mexico Central 3002",
                               "NAD 83"));
  EXPECT_NEAR(feet[0].Latitude, lat, 1e-10);
  EXPECT_NEAR(feet[0].Longitude, lon, 1e-10);
  EXPECT_NEAR(feet[0].Northing, 142158.262, 0.001);
  EXPECT_EQ(feet[0].HorizontalUnits, kMeters);
  EXPECT_FLOAT_EQ(feet[0].EastingError, static_cast<float>(0.999998 * kUsFoot));
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ConversionDriverTest, Nad27ZonesComputeInUsSurveyFeet) {
  // NAD 27 Texas South Central: 28 30 N, 96 W -> E 2963503.91, N 254759.80 ft.
  std::vector<SurveyPoint> points{Geographic("TX", Dms(28, 30, 0), Dms(96, 0, 0))};
  ASSERT_TRUE(GeographicToGrid(ui, app.path(), points, "State Plane 1927",
                               "Texas South Central 4204", "NAD 27", kMeters));
  EXPECT_NEAR(points[0].Easting, 2963503.91 * kUsFoot, 0.005);
  EXPECT_NEAR(points[0].Northing, 254759.80 * kUsFoot, 0.005);

  std::vector<SurveyPoint> grid{Grid("TX", 254759.80, 2963503.91, kUsSurveyFeet)};
  ASSERT_TRUE(GridToGeographic(ui, app.path(), grid, "State Plane 1927", "Texas South Central 4204",
                               "NAD 27"));
  EXPECT_EQ(grid[0].HorizontalUnits, kUsSurveyFeet);
  EXPECT_NEAR(grid[0].Latitude, Dms(28, 30, 0), 0.0002 / 3600 * kDeg);
  EXPECT_NEAR(grid[0].Longitude, Dms(96, 0, 0), 0.0002 / 3600 * kDeg);
}

TEST_F(ConversionDriverTest, GridToGridThroughGeographic) {
  const double lat = Dms(32, 16, 52.33969), lon = Dms(106, 45, 15.77636);
  std::vector<SurveyPoint> direct{Geographic("D", lat, lon)};
  ASSERT_TRUE(GeographicToGrid(ui, app.path(), direct, "UTM NAD 83", "Zone 13N", "NAD 83",
                               kInternationalFeet));

  state.points = {Grid("NM", 142158.262 / kUsFoot, 452489.852 / kUsFoot, kUsSurveyFeet)};
  Set(state.settings, {"State Plane 1983", "New Mexico Central 3002", "NAD 83", "", "None", "",
                       "UTM NAD 83", "Zone 13N", "NAD 83", kInternationalFeet, "None", ""});
  ASSERT_TRUE(ConvertPoints(ui, app.path(), state)) << ui.onlyText();
  EXPECT_NEAR(state.points[0].Northing, direct[0].Northing, 0.001);
  EXPECT_NEAR(state.points[0].Easting, direct[0].Easting, 0.001);
  EXPECT_EQ(state.points[0].HorizontalUnits, kInternationalFeet);
  EXPECT_EQ(state.report.rfind("VORN Zurevazidu ", 0), 0u);  // input part only
  EXPECT_EQ(state.report.find("Output:"), std::string::npos);
}

TEST_F(ConversionDriverTest, UnusableZonesAreReported) {
  std::vector<SurveyPoint> points{Geographic("A", 0.7, 1.6)};
  EXPECT_FALSE(
      GeographicToGrid(ui, app.path(), points, "State Plane 1983", "Atlantis", "NAD 83", kMeters));
  EXPECT_EQ(test::Take(ui),
            "E VORN Zurevazidu: Error: Zone 'Atlantis' of coordinate system 'State Plane 1983' was "
            "not found in zones.ini.\r\nFunction: modMisc.ResolveZone");

  // A cone whose mapping radius does not compute gives no coordinates.
  app.write("zones.ini",
            test::Ini("[Bad~Cone]|Horizontal Datum=NAD 83|"
                      "Projection=Lambert Conformal Conic - Two Parallels|Central Latitude=40.0|"
                      "Central Longitude=100.0|False Northing=0|False Easting=0|"
                      "Northern Parallel=45.0|Southern Parallel=45.0|Positive Latitude Direction=N|"
                      "Positive Longitude Direction=W|Linear Units=Meters"));
  EXPECT_FALSE(GeographicToGrid(ui, app.path(), points, "Bad", "Cone", "NAD 83", kMeters));
  EXPECT_EQ(test::Take(ui), "  VORN Zurevazidu: Error - Mapping Radius does not compute properly");
  EXPECT_EQ(points[0].Northing, kNoValue);
}

// A zone whose origin is the test point: northing and easting are the false
// origin, convergence 0, scale factor the zone's.
const std::string kOriginZone = test::Ini(
    "[Test Grid~Origin]|Horizontal Datum=NAD 83|Projection=Transverse Mercator|"
    "Central Latitude=45.000000000|Central Longitude=90.000000000|False Northing=1000|"
    "False Easting=500000|Scale Factor=0.9999|Positive Latitude Direction=N|"
    "Positive Longitude Direction=W|Linear Units=Meters");

TEST_F(ConversionDriverTest, SinglePointReportGeographicToGrid) {
  app.write("zones.ini", kOriginZone);
  state.singlePoint = true;
  state.points = {Geographic("BM 1", 45 * kDeg, 90 * kDeg)};
  state.points[0].Elevation = 123.4567;
  ConversionSettings& s = state.settings;
  Set(s, {kGeographicCoordinates, "", "NAD 83", kFormatDMS, "NAVD 88", kMeters, "Test Grid",
          "Origin", "NAD 83", kMeters, "NAVD 88", kMeters});
  s.OutputLatLong = s.OutputConvergence = s.OutputScaleFactor = true;
  ASSERT_TRUE(ConvertPoints(ui, app.path(), state)) << ui.onlyText();
  EXPECT_EQ(state.report,
            "VORN Zurevazidu 1.0.0\t\t03/04/2026 9:05:07\r\n"
            "\r\n"
            "Single Point Conversion\t\tPoint Name: BM 1\r\n"
            "\r\n"
            "Input:\r\n"
            "     Coordinate System: \tGeographic Coordinates\r\n"
            "     Horizontal Datum: \t\tNAD 83\r\n"
            "     Vertical Datum: \t\tNAVD 88\r\n"
            "     Latitude: \t\t\t45\xC2\xB0 00' 00.00000\" (N)\r\n"
            "     Longitude: \t\t90\xC2\xB0 00' 00.00000\" (W)\r\n"
            "     Orthometric Height: \t123.457 (Meters)\r\n"
            "\r\n"
            "Output:\r\n"
            "     Coordinate System: \tTest Grid\r\n"
            "     Zone: \t\t\tOrigin\r\n"
            "     Horizontal Datum: \t\tNAD 83\r\n"
            "     Vertical Datum: \t\tNAVD 88\r\n"
            "     Northing (Y): \t\t1,000.0000 (Meters)\r\n"
            "     Easting (X): \t\t500,000.0000 (Meters)\r\n"
            "     Latitude: \t\t\t45\xC2\xB0 00' 00.00000\" (N)\r\n"
            "     Longitude: \t\t90\xC2\xB0 00' 00.00000\" (W)\r\n"
            "     Orthometric Height: \t123.457 (Meters)\r\n"
            "     Convergence Angle: \t0\xC2\xB0 00' 00.0\"\r\n"
            "     Scale Factor: \t\t0.99990000");
}

TEST_F(ConversionDriverTest, SinglePointReportGridToGeographicWithGeoid) {
  app.write("zones.ini", kOriginZone);
  InstallGeoid(app);
  state.singlePoint = true;
  state.points = {Grid("", 1000, 500000, kMeters)};
  state.points[0].EllipsoidHeight = 2000.5;
  ConversionSettings& s = state.settings;
  Set(s, {"Test Grid", "Origin", "NAD 83", kMeters, "NAD 83 Ellipsoid", kMeters,
          kGeographicCoordinates, "", "NAD 83", kFormatDM, "NAD 83 Ellipsoid", kInternationalFeet});
  s.OutputGeoid = true;
  s.geoidModel = "GEOID09";
  ASSERT_TRUE(ConvertPoints(ui, app.path(), state)) << ui.onlyText();
  EXPECT_EQ(state.report,
            "VORN Zurevazidu 1.0.0\t\t03/04/2026 9:05:07\r\n"
            "\r\n"
            "Single Point Conversion\r\n"
            "\r\n"
            "Input:\r\n"
            "     Coordinate System: \tTest Grid\r\n"
            "     Zone: \t\t\tOrigin\r\n"
            "     Horizontal Datum: \t\tNAD 83\r\n"
            "     Vertical Datum: \t\tNAD 83 Ellipsoid\r\n"
            "     Northing: \t\t\t1,000.0000 (Meters)\r\n"
            "     Easting: \t\t\t500,000.0000 (Meters)\r\n"
            "     Ellipsoid Height: \t\t2,000.500 (Meters)\r\n"
            "\r\n"
            "Output:\r\n"
            "     Coordinate System: \tGeographic Coordinates\r\n"
            "     Horizontal Datum: \t\tNAD 83\r\n"
            "     Vertical Datum: \t\tNAD 83 Ellipsoid\r\n"
            "     Latitude: \t\t\t45\xC2\xB0 00.00000' (N)\r\n"
            "     Longitude: \t\t90\xC2\xB0 00.00000' (W)\r\n"
            "     Orthometric Height: \t6,662.566 (International Feet)\r\n"
            "     Geoid Height (GEOID09): \t-99.245 (International Feet)\r\n"
            "     Ellipsoid Height: \t\t6,563.320 (International Feet)");
}

TEST_F(ConversionDriverTest, ReportNamesTheHemispheresOfTheResult) {
  state.singlePoint = true;
  state.points = {Geographic("S", 33.865 * kDeg, 151.209 * kDeg)};
  state.points[0].LatitudeHemisphere = "S";
  state.points[0].LongitudeHemisphere = "E";
  Set(state.settings, {kGeographicCoordinates, "", "WGS 84", kFormatDecimal, "None", "",
                       kGeographicCoordinates, "", "WGS 84", kFormatDecimal, "None", ""});
  ASSERT_TRUE(ConvertPoints(ui, app.path(), state));
  const std::string where =
      "     Latitude: \t\t\t33.865000000\xC2\xB0 (S)\r\n     Longitude: \t\t151.209000000\xC2\xB0 "
      "(E)";
  EXPECT_NE(state.report.find(where + "\r\n\r\nOutput:"), std::string::npos) << state.report;
  EXPECT_TRUE(state.report.ends_with(where)) << state.report;
}

}  // namespace
}  // namespace zv
