// The batch exchange through tccin.tmp and tccout.tmp of the application
// folder: request reading, zone lookup, the automatic conversions, the
// answer file, and refusals that leave no answer behind.

#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "geodesy/Angles.h"
#include "geodesy/BatchExchange.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/Numbers.h"
#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;

std::tm FixedTime() {
  std::tm t{};
  t.tm_year = 2026 - 1900;
  t.tm_mon = 11;
  t.tm_mday = 6;
  t.tm_hour = 14;
  t.tm_min = 3;
  t.tm_sec = 9;
  return t;
}

std::vector<std::string> Header(const std::string& mode, const std::string& kind,
                                const std::string& system, const std::string& zone,
                                const std::string& hUnits = "M", const std::string& geoid = "") {
  return {"Caller 2.0", "request", mode,   kind, system,        zone,
          "83",         "88",      hUnits, "M",  "Orthometric", geoid};
}

class BatchExchangeTest : public ::testing::Test {
 protected:
  BatchExchangeTest() {
    test::InstallCatalogs(app.path());
    state.now = FixedTime;
  }
  bool exchange(std::vector<std::string> lines, const ManualConversion& manual = nullptr) {
    app.write("tccin.tmp", CrLf(lines));
    return BatchExchange(ui, app.path(), state, manual);
  }
  std::vector<std::string> answer() {
    std::vector<std::string> lines;
    ReadTextLines(app.file("tccout.tmp"), lines);
    return lines;
  }
  test::TempDir app;
  ScriptedUi ui;
  ConversionState state;
};

std::vector<std::string> Fields(const std::string& line) {
  std::vector<std::string> f;
  std::stringstream row(line);
  for (std::string field; std::getline(row, field, ',');) f.push_back(field);
  if (!line.empty() && line.back() == ',') f.push_back("");
  return f;
}

TEST_F(BatchExchangeTest, GridPointsAreAnsweredWithGeographicCoordinates) {
  // A station of the NGS SPCS83 example (32 16 52.33969 N, 106 45 15.77636 W)
  // in UTM zone 13.
  std::vector<SurveyPoint> station(1);
  station[0].Latitude = (32 + 16 / 60.0 + 52.33969 / 3600) * kDegreesToRadians;
  station[0].Longitude = (106 + 45 / 60.0 + 15.77636 / 3600) * kDegreesToRadians;
  ASSERT_TRUE(
      GeographicToGrid(ui, app.path(), station, "UTM NAD 83", "Zone 13N", "NAD 83", kMeters));
  char bm2[128];
  std::snprintf(bm2, sizeof bm2, "BM2,%.4f,%.4f,1520.25,0.01,0.02,0.03", station[0].Northing,
                station[0].Easting);

  auto lines = Header("Automatic", "Plane", "UTM NAD 83", "Zone 13N");
  lines.push_back("P1,12.3,45.6,,,,");
  lines.push_back(bm2);
  ASSERT_TRUE(exchange(lines)) << ui.onlyText();
  auto out = answer();
  ASSERT_EQ(out.size(), 14u);
  EXPECT_EQ(out[0], "VORN Zurevazidu 1.0.0");
  EXPECT_EQ(out[1], "12/06/2026 14:03:09");
  EXPECT_EQ(std::vector<std::string>(out.begin() + 2, out.begin() + 12),
            (std::vector<std::string>{"Automatic", "Plane", "Geographic Coordinates", "", "NAD 83",
                                      "NAVD 88", "M", "Meters", "", ""}));
  // Far off the zone, but answered: two lengths, four empty fields, then
  // convergence, scale factor, no geoid height, latitude and longitude.
  EXPECT_EQ(out[12].rfind("P1,12.3000,45.6000,,,,,", 0), 0u) << out[12];
  std::vector<std::string> f = Fields(out[13]);
  ASSERT_EQ(f.size(), 13u) << out[13];
  EXPECT_EQ(std::vector<std::string>(f.begin() + 3, f.begin() + 7),
            (std::vector<std::string>{"1520.2500", "0.0100", "0.0200", "0.0300"}));
  EXPECT_EQ(f[7], Angles_RadiansToPacked(ui, station[0].Convergence, 1));
  EXPECT_EQ(f[8], FormatFixed(station[0].ScaleFactor, 8));
  EXPECT_EQ(f[9], "");
  EXPECT_EQ(f[10], "32.165233969");
  EXPECT_EQ(f[11], "106.451577636");
  EXPECT_EQ(f[12], "");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(BatchExchangeTest, LengthsAreAnsweredInTheUnitsAsked) {
  // A metre zone asked in U.S. survey feet: the northing stays in feet in
  // the answer, as line 9 says, although the projection computed in metres.
  auto lines = Header("Automatic", "Plane", "UTM NAD 83", "Zone 13N", "F");
  lines.push_back("A,11724000.0000,1873400.0000,100,,,");
  ASSERT_TRUE(exchange(lines)) << ui.onlyText();
  auto out = answer();
  ASSERT_EQ(out.size(), 13u);
  EXPECT_EQ(out[8], "F");
  EXPECT_EQ(out[12].rfind("A,11724000.0000,1873400.0000,100.0000,,,,", 0), 0u) << out[12];
}

TEST_F(BatchExchangeTest, GeographicPointsAreAnsweredInTheZone) {
  // NGS SPCS83 example, New Mexico Central, in U.S. survey feet.
  auto lines =
      Header("Automatic", "Geographic", "State Plane 1983", "New Mexico Central 3002", "F");
  lines.push_back("NM,32.1652339690,106.4515776360,");
  ASSERT_TRUE(exchange(lines)) << ui.onlyText();
  auto out = answer();
  ASSERT_EQ(out.size(), 13u);
  EXPECT_EQ(
      std::vector<std::string>(out.begin() + 2, out.begin() + 12),
      (std::vector<std::string>{"Automatic", "Plane", "State Plane 1983", "New Mexico Central 3002",
                                "NAD 83", "NAVD 88", "F", "Meters", "", ""}));
  // N 142158.262 m, E 452489.852 m, convergence -0 16 09.78, scale 0.99992783.
  std::vector<std::string> f = Fields(out[12]);
  ASSERT_EQ(f.size(), 13u) << out[12];
  EXPECT_EQ(f[0], "NM");
  EXPECT_NEAR(std::stod(f[1]) * 0.3048006096012192, 142158.262, 0.001);
  EXPECT_NEAR(std::stod(f[2]) * 0.3048006096012192, 452489.852, 0.001);
  EXPECT_EQ(f[7], "-0.16098");
  EXPECT_NEAR(std::stod(f[8]), 0.99992783, 1.1e-8);
  for (int i : {3, 4, 5, 6, 9, 10, 11, 12}) EXPECT_EQ(f[i], "") << i;
}

TEST_F(BatchExchangeTest, ZoneLookup) {
  app.write("zones.ini",
            CrLf({"[SP~North]", "Horizontal Datum=NAD 83 (HARN)", "[Other~North]",
                  "Horizontal Datum=NAD 83", "[SP~North Two]", "Horizontal Datum=NAD 83 (CORS)",
                  "[SP~South]", "Horizontal Datum=NAD 27", "[X~Far]", "Horizontal Datum=NAD 83 (A)",
                  "[Y~Far]", "Horizontal Datum=NAD 83 (B)", "[Z~Far]", "Horizontal Datum=NAD 83"}));
  const std::string a = app.path();
  EXPECT_EQ(FindExchangeZone(a, "SP", "South", "NAD 27"), "SP~South");
  // The named section with another datum: walk the sections containing the
  // zone name; an exact datum before the second partial match wins.
  EXPECT_EQ(FindExchangeZone(a, "SP", "North", "NAD 83"), "Other~North");
  EXPECT_EQ(FindExchangeZone(a, "Z", "Far", "NAD 83"), "Z~Far");
  EXPECT_EQ(FindExchangeZone(a, "", "Far", "NAD 83"), "");  // exact only after two partial
  EXPECT_EQ(FindExchangeZone(a, "", "South", "NAD 27"), "SP~South");
  EXPECT_EQ(FindExchangeZone(a, "sp", "south", "NAD 27"), "SP~South");
  EXPECT_EQ(FindExchangeZone(a, "SP", "North", "HARN"), "SP~North");  // one partial match
  EXPECT_EQ(FindExchangeZone(a, "SP", "North", "NAD 8"), "");         // two partial matches
  EXPECT_EQ(FindExchangeZone(a, "SP", "East", "NAD 83"), "");

  ASSERT_FALSE(exchange(Header("Automatic", "Plane", "SP", "East")));
  EXPECT_EQ(ui.onlyText(),
            "Unable to determine Coordinate System and Zone. Can not compute Latitude, "
            "Longitude, Scale Factor, or Convergence Angle.");
  EXPECT_EQ(ui.boxes[0].title, "VORN Zurevazidu Error");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Information);
}

TEST_F(BatchExchangeTest, RequestHeaderLines) {
  std::vector<std::string> lines = Header("Automatic", "Plane", "SP", "North", "I");
  lines[6] = "NAD 83";
  lines[7] = "29";
  lines[9] = "F";
  lines.push_back("");
  lines.push_back("A,1,2,3,,,");
  std::istringstream in(CrLf(lines));
  ExchangeRequest r;
  ASSERT_TRUE(ReadExchangeRequest(ui, in, r, state));
  EXPECT_TRUE(r.automatic);
  EXPECT_TRUE(r.grid);
  EXPECT_EQ(r.horizontalDatum, "NAD 83");
  EXPECT_EQ(r.verticalDatum, "NGVD 29");
  ASSERT_EQ(state.points.size(), 1u);
  const SurveyPoint& p = state.points[0];
  EXPECT_EQ(p.HorizontalUnits, kInternationalFeet);
  EXPECT_EQ(p.VerticalUnits, kUsSurveyFeet);
  EXPECT_EQ(p.Elevation, 3.0);
  EXPECT_EQ(p.NorthingError, kNoValueF);

  lines[2] = "automatic";
  lines[3] = "Geographic";
  lines[10] = "Ellipsoid";
  lines.back() = "B,45.3015,90.0000,12.5";
  std::istringstream geo(CrLf(lines));
  ASSERT_TRUE(ReadExchangeRequest(ui, geo, r, state));
  EXPECT_FALSE(r.automatic);
  EXPECT_FALSE(r.grid);
  EXPECT_NEAR(state.points[0].Latitude, (45 + 30 / 60.0 + 15 / 3600.0) * kDegreesToRadians, 1e-15);
  EXPECT_EQ(state.points[0].EllipsoidHeight, 12.5);
  EXPECT_EQ(state.points[0].Elevation, kNoValue);
  EXPECT_TRUE(state.points[0].GridMissing);
}

TEST_F(BatchExchangeTest, BrokenPointLinesAreRefusedByLineAndLeaveNoAnswer) {
  struct Case {
    std::string kind, line, message;
  };
  const Case cases[] = {
      {"Plane", "A,1,2,3",
       "Line 14 of tccin.tmp has 4 fields; a grid point needs 7: name, northing, easting, "
       "height, northing error, easting error and elevation error.\r\nA,1,2,3"},
      {"Plane", "A,1,2O5,,,,",
       "Line 14 of tccin.tmp gives the easting '2O5', not a number.\r\nA,1,2O5,,,,"},
      {"Plane", "A,,2,,,,",
       "Line 14 of tccin.tmp gives the northing '', not a number.\r\nA,,2,,,,"},
      {"Plane", "A,1,2,3,x,,",
       "Line 14 of tccin.tmp gives the northing error 'x', not a number.\r\nA,1,2,3,x,,"},
      {"Geographic", "A,45.30",
       "Line 14 of tccin.tmp has 2 fields; a geographic point needs 4: name, latitude, "
       "longitude and height.\r\nA,45.30"},
      {"Geographic", "A,45.30,W90,",
       "Line 14 of tccin.tmp gives the longitude 'W90', not a number.\r\nA,45.30,W90,"},
  };
  for (const Case& c : cases) {
    app.write("tccout.tmp", "previous answer\r\n");
    ui.boxes.clear();
    auto lines = Header("Automatic", c.kind, "UTM NAD 83", "Zone 13N");
    lines.push_back("OK,1,2,3,,,");
    lines.push_back(c.line);
    if (c.kind == "Geographic") lines[12] = "OK,45.30,105.0,";
    EXPECT_FALSE(exchange(lines)) << c.line;
    EXPECT_EQ(ui.onlyText(), c.message);
    EXPECT_EQ(ui.boxes[0].title, "Invalid Coordinate Request");
    EXPECT_FALSE(fs::exists(app.file("tccout.tmp"))) << c.line;
  }

  // An angle outside its limits is refused after its own message.
  ui.boxes.clear();
  auto lines = Header("Automatic", "Geographic", "UTM NAD 83", "Zone 13N");
  lines.push_back("A,45.6000,105.0,");
  EXPECT_FALSE(exchange(lines));
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
  EXPECT_EQ(ui.boxes[1].text,
            "Line 13 of tccin.tmp gives the latitude '45.6000', not a valid angle.\r\n"
            "A,45.6000,105.0,");

  ui.boxes.clear();
  EXPECT_FALSE(exchange(Header("Automatic", "Plane", "UTM NAD 83", "Zone 13N", "Feet")));
  EXPECT_EQ(ui.onlyText(),
            "Line 9 of tccin.tmp gives the horizontal units 'Feet'; they must be F, M or I.");
  ui.boxes.clear();
  EXPECT_FALSE(exchange({"only", "three", "lines"}));
  EXPECT_EQ(ui.onlyText(),
            "tccin.tmp holds 3 lines; a coordinate request starts with 12 header lines.");
}

TEST_F(BatchExchangeTest, ManualModeNeedsTheConversionWindow) {
  app.write("tccout.tmp", "previous answer\r\n");
  auto lines = Header("automatic", "Plane", "UTM NAD 83", "Zone 13N");
  lines.push_back("A,1,2,,,,");
  EXPECT_FALSE(exchange(lines));
  EXPECT_EQ(ui.onlyText(),
            "The coordinate request in tccin.tmp asks for the manual mode (its line 3 is not "
            "\"Automatic\"), which needs the Coordinate Conversion window. That window is not "
            "available in this run.");
  EXPECT_FALSE(fs::exists(app.file("tccout.tmp")));

  // With a window: its settings and result are answered as "Manual".
  ConversionSettings seen;
  ManualConversion window = [&](ConversionState& s) {
    seen = s.settings;
    s.settings.outputCoordinateSystem = "Chosen";
    s.batchGrid = false;
    return true;
  };
  ASSERT_TRUE(exchange(lines, window));
  EXPECT_EQ(seen.inputCoordinateSystem, "UTM NAD 83");
  EXPECT_EQ(seen.inputZone, "Zone 13N");
  EXPECT_EQ(seen.inputHorizontalDatum, "NAD 83");
  EXPECT_EQ(seen.inputVerticalDatum, "NAVD 88");
  EXPECT_EQ(seen.inputHorizontalUnits, kMeters);
  auto out = answer();
  ASSERT_GE(out.size(), 5u);
  EXPECT_EQ(out[2], "Manual");
  EXPECT_EQ(out[3], "Geographic");
  EXPECT_EQ(out[4], "Chosen");

  EXPECT_FALSE(exchange(lines, [](ConversionState&) { return false; }));
  EXPECT_FALSE(fs::exists(app.file("tccout.tmp")));
}

TEST_F(BatchExchangeTest, GeographicRequestWithGeoidModel) {
  test::InstallAllStandIns(app.path());
  test::SaveGeoidGrid(
      app.file("NGS/GEOID/g2009u03.bin"),
      test::MakeGeoidGrid(30, 250, 0.5, 20, 20, [](double, double) { return -21.5; }));
  auto lines = Header("Automatic", "Geographic", "UTM NAD 83", "Zone 13N", "M", "GEOID09");
  lines.push_back("G,35.0,105.0,1500");
  ASSERT_TRUE(exchange(lines)) << ui.onlyText();
  auto out = answer();
  ASSERT_EQ(out.size(), 13u);
  EXPECT_EQ(out[11], "GEOID09");
  // On the central meridian: easting 500000, convergence 0, scale 0.9996;
  // the ellipsoid height is H + N.
  EXPECT_EQ(out[12].substr(out[12].find(",500000.0000,")),
            ",500000.0000,1500.0000,,,,0.00000,0.99960000,-21.5000,,,1478.5000");
}

}  // namespace
}  // namespace zv
