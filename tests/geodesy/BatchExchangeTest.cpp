// The batch coordinate exchange through tccin.tmp and tccout.tmp of the
// application folder: the program run with -t||tccin.tmp|tccout.tmp from a
// private application folder and its answers checked against PROJ; the
// refusals, the zone lookup and the manual mode in process.

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <sstream>

#include "geodesy/Angles.h"
#include "geodesy/BatchExchange.h"
#include "geodesy/NgsTestSupport.h"
#include "oracle/EpsgZone.h"
#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using V = std::vector<std::string>;

constexpr double kDeg = 3.14159265358979323846 / 180.0;

V Fields(const std::string& line) {
  V f;
  std::stringstream row(line);
  for (std::string field; std::getline(row, field, ',');) f.push_back(field);
  if (!line.empty() && line.back() == ',') f.push_back("");
  return f;
}

// A packed "DDD.MMSSsssss" text in degrees.
double PackedDegrees(const std::string& text) {
  ScriptedUi ui;
  return Angles_PackedToRadians(ui, text) / kDegreesToRadians;
}

class BatchExchangeTest : public ::testing::Test {
 protected:
  BatchExchangeTest() {
    fs::copy(std::string(ZV_APP_DIR) + "/zurevazidu", app.file("zurevazidu"));
    test::InstallCatalogs(app.path());
    test::InstallAllStandIns(app.path());
  }
  struct Result {
    int status;
    std::string err;
    V answer;
  };
  // Writes tccin.tmp and runs the exchange from another current folder.
  Result run(const V& request) {
    app.write("tccin.tmp", CrLf(request));
    const std::string cmd = "cd '" + work.path() + "' && ZUREVAZIDU_UI=console '" +
                            app.file("zurevazidu") + "' '-t||tccin.tmp|tccout.tmp' </dev/null 2>'" +
                            work.file("err") + "'";
    const int raw = std::system(cmd.c_str());
    Result r{WIFEXITED(raw) ? WEXITSTATUS(raw) : -1, test::ReadFile(work.file("err")), {}};
    ReadTextLines(app.file("tccout.tmp"), r.answer);
    return r;
  }
  // The same in process.
  bool exchange(const V& request, const ManualConversion& manual = nullptr) {
    app.write("tccout.tmp", "previous answer\r\n");
    app.write("tccin.tmp", CrLf(request));
    return BatchExchange(ui, app.path(), state, manual);
  }
  static V Header(const std::string& kind, const std::string& system, const std::string& zone,
                  const std::string& units = "M", const std::string& geoid = "",
                  const V& points = {}) {
    V lines{"Caller 2.0", "request", "Automatic", kind, system,        zone,
            "83",         "88",      units,       "M",  "Orthometric", geoid};
    lines.insert(lines.end(), points.begin(), points.end());
    return lines;
  }
  test::TempDir app, work;
  ScriptedUi ui;
  ConversionState state;
};

// One point in one zone of each form, in each unit (the oblique Mercator
// zone's EPSG azimuth is rounded, which moves PROJ by up to 0.9 mm).
TEST_F(BatchExchangeTest, AnswersAgreeWithPROJ) {
  const struct {
    std::string zone, units;
    int epsg;
    double tolerance;  // metres
  } zones[] = {{"New Mexico Central 3002", "F", 2258, 0.001},
               {"North Dakota North 3301", "I", 2265, 0.001},
               {"Alaska Zone 1 5001", "M", 26931, 0.002}};
  // Convergence is answered with one decimal of seconds, formatted from the
  // angle rounded to five decimals of degrees (0.018"): 0.05" + 0.018".
  const double convergence = 0.069;
  const std::string system = "State Plane 1983";
  for (const auto& z : zones) {
    SCOPED_TRACE(z.zone);
    const test::EpsgZone ref(z.epsg);
    // Off the central meridian, in the inner part of the area of use.
    const double lat0 = ref.south + (ref.north - ref.south) * 0.85;
    const double lon0 = ref.west + (ref.east - ref.west) * 0.15;
    const PJ_XY g0 = ref.forward(lat0, lon0);
    char line[128];
    std::snprintf(line, sizeof line, "P,%.4f,%.4f,100,,,", g0.y, g0.x);
    const std::string packedLat = Angles_RadiansToPacked(ui, lat0 * kDeg, 5);
    const std::string packedLon = Angles_RadiansToPacked(ui, -lon0 * kDeg, 5);
    const Result p = run(Header("Plane", system, z.zone, z.units, "", {line}));
    const Result g = run(Header("Geographic", system, z.zone, z.units, "",
                                {"G," + packedLat + "," + packedLon + ","}));
    ASSERT_EQ(p.status + g.status, 0) << p.err << g.err;
    ASSERT_TRUE(p.answer.size() == 13 && g.answer.size() == 13);
    EXPECT_EQ(p.answer[0], "VORN Zurevazidu 1.0.0");
    const V tail{"NAD 83", "NAVD 88", z.units, "Meters", "", ""};
    V head{"Automatic", "Plane", "Geographic Coordinates", ""};
    head.insert(head.end(), tail.begin(), tail.end());
    EXPECT_EQ(V(p.answer.begin() + 2, p.answer.begin() + 12), head);
    head[2] = system, head[3] = z.zone;
    EXPECT_EQ(V(g.answer.begin() + 2, g.answer.begin() + 12), head);
    // The grid point: PROJ's position for the grid coordinates as written.
    V f = Fields(p.answer[12]);
    ASSERT_EQ(f.size(), 13u) << p.answer[12];
    EXPECT_EQ(f[3] + "|" + f[4] + f[5] + f[6] + f[9] + f[12], "100.0000|");
    const PJ_LP lp = ref.inverse(std::stod(f[2]), std::stod(f[1]));
    const double dn = (PackedDegrees(f[10]) - lp.phi) * 111320.0;
    const double de = (-PackedDegrees(f[11]) - lp.lam) * 111320.0 * std::cos(lp.phi * kDeg);
    EXPECT_LT(std::hypot(dn, de), z.tolerance) << p.answer[12];
    PJ_FACTORS fac = ref.factors(lp.phi, lp.lam);
    EXPECT_NEAR(PackedDegrees(f[7]) * 3600, fac.meridian_convergence / kDeg * 3600, convergence);
    EXPECT_NEAR(std::stod(f[8]), fac.meridional_scale, 2e-8);
    // The geographic point: PROJ's grid coordinates.
    f = Fields(g.answer[12]);
    ASSERT_EQ(f.size(), 13u) << g.answer[12];
    const double lat = PackedDegrees(packedLat), lon = -PackedDegrees(packedLon);
    const PJ_XY xy = ref.forward(lat, lon);
    EXPECT_NEAR(std::stod(f[1]) * ref.toMeters, xy.y * ref.toMeters, z.tolerance);
    EXPECT_NEAR(std::stod(f[2]) * ref.toMeters, xy.x * ref.toMeters, z.tolerance);
    fac = ref.factors(lat, lon);
    EXPECT_NEAR(PackedDegrees(f[7]) * 3600, fac.meridian_convergence / kDeg * 3600, convergence);
    EXPECT_NEAR(std::stod(f[8]), fac.meridional_scale, 2e-8);
    EXPECT_EQ(f[3] + f[4] + f[5] + f[6] + f[9] + f[10] + f[11] + f[12], "");
  }

  // A metre zone asked in U.S. survey feet: lengths stay in feet in the
  // answer, as line 9 says, although the projection computed in metres; a
  // point far off the zone is answered too.
  const Result r = run(Header("Plane", "UTM NAD 83", "Zone 13N", "F", "",
                              {"A,11724000.0000,1873400.0000,100,,,", "B,12.3,45.6,,,,"}));
  ASSERT_EQ(r.answer.size(), 14u) << r.err;
  EXPECT_EQ(r.answer[8], "F");
  EXPECT_TRUE(r.answer[12].starts_with("A,11724000.0000,1873400.0000,100.0000,,,,"))
      << r.answer[12];
  EXPECT_TRUE(r.answer[13].starts_with("B,12.3000,45.6000,,,,,")) << r.answer[13];
}

TEST_F(BatchExchangeTest, GeoidHeightsFromTheGeoidProgram) {
  // GEOID09 over New Mexico: N = -25 + 0.5 (lat - 31) - 0.2 (lon - 250).
  const auto n = [](double lat, double lon) {
    return -25.0 + 0.5 * (lat - 31) - 0.2 * (lon - 250);
  };
  test::SaveGeoidGrid(app.file("NGS/GEOID/g2009u03.bin"),
                      test::MakeGeoidGrid(31, 250, 1.0 / 60, 301, 361, n));
  const Result r = run(Header("Geographic", "State Plane 1983", "New Mexico Central 3002", "F",
                              "GEOID09", {"NM,32.1652339690,106.4515776360,1500"}));
  ASSERT_EQ(r.status, 0) << r.err;
  ASSERT_EQ(r.answer.size(), 13u);
  EXPECT_EQ(r.answer[11], "GEOID09");
  const V f = Fields(r.answer[12]);
  const double lat = 32 + 16 / 60.0 + 52.33969 / 3600;
  const double lon = 360 - (106 + 45 / 60.0 + 15.77636 / 3600);
  // Metres from the program, in the request's vertical units (metres); the
  // ellipsoid height is H + N.
  EXPECT_NEAR(std::stod(f[9]), n(lat, lon), 0.0006) << r.answer[12];
  EXPECT_EQ(f[3], "1500.0000");
  EXPECT_NEAR(std::stod(f[12]), 1500 + n(lat, lon), 0.0006) << r.answer[12];
  for (const char* left : {"geoid.con", "geoid.inp", "geoid.bat", "geoid.out", "junk"})
    EXPECT_FALSE(fs::exists(app.file(std::string("NGS/GEOID/") + left))) << left;
}

TEST_F(BatchExchangeTest, BrokenRequestsAreRefusedByLineAndLeaveNoAnswer) {
  app.write("tccout.tmp", "old\r\n");
  const Result r =
      run(Header("Plane", "UTM NAD 83", "Zone 13N", "M", "", {"P1,100,200,,,,", "P2,100;200"}));
  EXPECT_EQ(r.status, 1);
  EXPECT_EQ(r.err,
            "exclamation: Invalid Coordinate Request\nLine 14 of tccin.tmp has 2 fields; a grid "
            "point needs 7: name, northing, easting, height, northing error, easting error and "
            "elevation error.\nP2,100;200\n\n");
  EXPECT_FALSE(fs::exists(app.file("tccout.tmp")));

  const auto with = [](const std::string& kind, const std::string& line) {
    return Header(kind, "UTM NAD 83", "Zone 13N", "M", "",
                  {kind == "Plane" ? "OK,1,2,3,,," : "OK,45.30,105.0,", line});
  };
  const std::string invalid = "E Invalid Coordinate Request: ",
                    at14 = invalid + "Line 14 of tccin.tmp ";
  const std::pair<V, std::string> cases[] = {
      {with("Plane", "A,1,2O5,,,,"),
       at14 + "gives the easting '2O5', not a number.\r\nA,1,2O5,,,,"},
      {with("Plane", "A,,2,,,,"), at14 + "gives the northing '', not a number.\r\nA,,2,,,,"},
      {with("Plane", "A,1,2,3,x,,"),
       at14 + "gives the northing error 'x', not a number.\r\nA,1,2,3,x,,"},
      {with("Geographic", "A,45.30"),
       at14 + "has 2 fields; a geographic point needs 4: name, latitude, longitude and "
              "height.\r\nA,45.30"},
      {with("Geographic", "A,45.30,W90,"),
       at14 + "gives the longitude 'W90', not a number.\r\nA,45.30,W90,"},
      // An angle outside its limits is refused after its own message.
      {with("Geographic", "A,45.6000,105.0,"),
       "E Invalid Angle: Invalid Angle '45.6000'. Minutes portion must be positive and not "
       "exceed 59.\n" +
           at14 + "gives the latitude '45.6000', not a valid angle.\r\nA,45.6000,105.0,"},
      {Header("Plane", "UTM NAD 83", "Zone 13N", "Feet"),
       invalid + "Line 9 of tccin.tmp gives the horizontal units 'Feet'; they must be F, M or I."},
      {{"only", "three", "lines"},
       invalid + "tccin.tmp holds 3 lines; a coordinate request starts with 12 header lines."},
      {Header("Plane", "UTM NAD 83", "Atlantis"),
       "I VORN Zurevazidu Error: Unable to determine Coordinate System and Zone. Can not compute "
       "Latitude, Longitude, Scale Factor, or Convergence Angle."},
  };
  for (const auto& [request, boxes] : cases) {
    EXPECT_FALSE(exchange(request)) << boxes;
    EXPECT_EQ(test::Take(ui), boxes);
    EXPECT_FALSE(fs::exists(app.file("tccout.tmp"))) << boxes;
  }
}

TEST_F(BatchExchangeTest, ZoneLookup) {
  app.write("zones.ini",
            test::Ini("[SP~North]|Horizontal Datum=NAD 83 (HARN)|[Other~North]|"
                      "Horizontal Datum=NAD 83|[SP~North Two]|Horizontal Datum=NAD 83 (CORS)|"
                      "[SP~South]|Horizontal Datum=NAD 27|[X~Far]|Horizontal Datum=NAD 83 (A)|"
                      "[Y~Far]|Horizontal Datum=NAD 83 (B)|[Z~Far]|Horizontal Datum=NAD 83"));
  const struct {
    const char *system, *zone, *datum, *found;
  } cases[] = {
      {"SP", "South", "NAD 27", "SP~South"},
      // The named section with another datum: walk the sections containing
      // the zone name; an exact datum before the second partial match wins.
      {"SP", "North", "NAD 83", "Other~North"},
      {"Z", "Far", "NAD 83", "Z~Far"},
      {"", "Far", "NAD 83", ""},  // exact only after two partial
      {"", "South", "NAD 27", "SP~South"},
      {"sp", "south", "NAD 27", "SP~South"},
      {"SP", "North", "HARN", "SP~North"},  // one partial match
      {"SP", "North", "NAD 8", ""},         // two partial matches
      {"SP", "East", "NAD 83", ""},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(FindExchangeZone(app.path(), c.system, c.zone, c.datum), c.found)
        << c.system << "~" << c.zone << " " << c.datum;
  }
}

TEST_F(BatchExchangeTest, ManualModeNeedsTheConversionWindow) {
  // Not "Automatic" (letter case counts); NGVD 29, international feet and
  // ellipsoid heights.
  V lines = Header("Geographic", "UTM NAD 83", "Zone 13N", "I", "", {"B,45.3015,90.0000,12.5"});
  lines[2] = "automatic";
  lines[7] = "29";
  lines[10] = "Ellipsoid";
  EXPECT_FALSE(exchange(lines));
  EXPECT_EQ(ui.onlyText(),
            "The coordinate request in tccin.tmp asks for the manual mode (its line 3 is not "
            "\"Automatic\"), which needs the Coordinate Conversion window. That window is not "
            "available in this run.");
  EXPECT_FALSE(fs::exists(app.file("tccout.tmp")));

  // With a window: its settings and result are answered as "Manual".
  ConversionState seen;
  const ManualConversion window = [&](ConversionState& s) {
    seen = s;
    s.settings.outputCoordinateSystem = "Chosen";
    s.batchGrid = false;
    return true;
  };
  ASSERT_TRUE(exchange(lines, window));
  const ConversionSettings& s = seen.settings;
  // Geographic points are offered as such, in the packed format.
  EXPECT_EQ(s.inputCoordinateSystem + "|" + s.inputZone + "|" + s.inputHorizontalUnits + "|" +
                s.inputHorizontalDatum + "|" + s.inputVerticalDatum,
            std::string(kGeographicCoordinates) + "||" + kFormatPacked + "|NAD 83|NGVD 29");
  ASSERT_EQ(seen.points.size(), 1u);
  const SurveyPoint& p = seen.points[0];
  EXPECT_NEAR(p.Latitude, (45 + 30 / 60.0 + 15 / 3600.0) * kDegreesToRadians, 1e-15);
  EXPECT_TRUE(p.EllipsoidHeight == 12.5 && p.Elevation == kNoValue && p.VerticalUnits == kMeters);
  V answer;
  ASSERT_TRUE(ReadTextLines(app.file("tccout.tmp"), answer));
  ASSERT_GE(answer.size(), 5u);
  EXPECT_EQ(V(answer.begin() + 2, answer.begin() + 5), (V{"Manual", "Geographic", "Chosen"}));

  EXPECT_FALSE(exchange(lines, [](ConversionState&) { return false; }));
  EXPECT_FALSE(fs::exists(app.file("tccout.tmp")));
}

}  // namespace
}  // namespace zv
