// The batch coordinate exchange end to end: tccin.tmp written as another
// program writes it, the program run with -t||tccin.tmp|tccout.tmp from a
// private application folder, and the answers checked against PROJ. The
// datum shift and the single-point report run in process over the stand-in
// NGS programs.

#include <gtest/gtest.h>
#include <proj.h>
#include <sys/wait.h>

#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <map>
#include <sstream>

#include "geodesy/Angles.h"
#include "geodesy/ConversionDriver.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/Profile.h"
#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::CrLf;
using test::ReadFile;

constexpr double kDeg = 3.14159265358979323846 / 180.0;

// Convergence is answered with one decimal of seconds, formatted from the
// angle rounded to five decimals of degrees (0.018"): 0.05" + 0.018".
constexpr double kConvergenceTolerance = 0.069;

struct Zone {
  std::string system, zone;
  std::string unitCode;  // tccin.tmp line 9
  double tolerance;      // metres
};

// One zone of each form in the shipped catalog (the oblique Mercator zone's
// EPSG azimuth is rounded, which moves PROJ by up to 0.9 mm).
const Zone kZones[] = {
    {"State Plane 1983", "New Mexico Central 3002", "F", 0.001},
    {"State Plane 1983", "North Dakota North 3301", "I", 0.001},
    {"State Plane 1983", "Alaska Zone 1 5001", "M", 0.002},
};

// PROJ's projected CRS of a zone (the EPSG code of its "Full Name").
class Reference {
 public:
  explicit Reference(const std::string& fullName) {
    ctx_ = proj_context_create();
    const size_t at = fullName.find("EPSG:");
    crs_ =
        proj_create(ctx_, ("EPSG:" + std::to_string(std::atoi(fullName.c_str() + at + 5))).c_str());
    PJ* cs = proj_crs_get_coordinate_system(ctx_, crs_);
    proj_cs_get_axis_info(ctx_, cs, 0, nullptr, nullptr, nullptr, &toMeters_, nullptr, nullptr,
                          nullptr);
    proj_destroy(cs);
    PJ* base = proj_crs_get_geodetic_crs(ctx_, crs_);
    PJ* op = proj_create_crs_to_crs_from_pj(ctx_, base, crs_, nullptr, nullptr);
    op_ = proj_normalize_for_visualization(ctx_, op);
    proj_destroy(op);
    proj_destroy(base);
    proj_get_area_of_use(ctx_, crs_, &west, &south, &east, &north, nullptr);
    // Convergence and scale factor from the zone's projection in metres
    // (proj_factors does not take the foot units of a CRS).
    std::string def = proj_as_proj_string(ctx_, crs_, PJ_PROJ_5, nullptr);
    for (const char* key : {" +units=", " +vunits="}) {
      size_t at = def.find(key);
      if (at != std::string::npos) def.erase(at, def.find(' ', at + 1) - at);
    }
    projection_ = proj_create(ctx_, (def + " +units=m").c_str());
  }
  ~Reference() {
    proj_destroy(projection_);
    proj_destroy(op_);
    proj_destroy(crs_);
    proj_context_destroy(ctx_);
  }
  // Easting and northing in the zone's units for east-positive degrees.
  std::pair<double, double> forward(double latDeg, double lonDeg) const {
    PJ_COORD c = proj_trans(op_, PJ_FWD, proj_coord(lonDeg, latDeg, 0, 0));
    return {c.xy.x, c.xy.y};
  }
  std::pair<double, double> inverse(double easting, double northing) const {
    PJ_COORD c = proj_trans(op_, PJ_INV, proj_coord(easting, northing, 0, 0));
    return {c.lp.phi, c.lp.lam};
  }
  PJ_FACTORS factors(double latDeg, double lonDeg) const {
    return proj_factors(projection_, proj_coord(lonDeg * kDeg, latDeg * kDeg, 0, 0));
  }
  double toMeters() const { return toMeters_; }
  double west = 0, south = 0, east = 0, north = 0;

 private:
  PJ_CONTEXT* ctx_ = nullptr;
  PJ* crs_ = nullptr;
  PJ* op_ = nullptr;
  PJ* projection_ = nullptr;
  double toMeters_ = 1.0;
};

std::vector<std::string> Fields(const std::string& line) {
  std::vector<std::string> f;
  std::stringstream row(line);
  for (std::string field; std::getline(row, field, ',');) f.push_back(field);
  if (!line.empty() && line.back() == ',') f.push_back("");
  return f;
}

// A packed "DDD.MMSSsssss" text in degrees.
double PackedDegrees(const std::string& text) {
  const bool negative = text[0] == '-';
  const std::string t = negative ? text.substr(1) : text;
  const size_t dot = t.find('.');
  const std::string frac = t.substr(dot + 1);
  double d = std::stod(t.substr(0, dot)) + std::stod(frac.substr(0, 2)) / 60 +
             std::stod(frac.substr(2, 2) + "." + frac.substr(4)) / 3600;
  return negative ? -d : d;
}

std::string Packed(double degrees) {
  ScriptedUi ui;
  return Angles_RadiansToPacked(ui, degrees * kDegreesToRadians, 5);
}

class BatchEndToEndTest : public ::testing::Test {
 protected:
  BatchEndToEndTest() {
    fs::copy(std::string(ZV_APP_DIR) + "/zurevazidu", app.file("zurevazidu"));
    test::InstallCatalogs(app.path());
    test::InstallAllStandIns(app.path());
  }
  struct Result {
    int status;
    std::string err;
    std::vector<std::string> answer;
  };
  // Writes tccin.tmp into the application folder and runs the exchange from
  // another current folder.
  Result run(const std::vector<std::string>& request) {
    app.write("tccin.tmp", CrLf(request));
    std::string cmd = "cd '" + work.path() + "' && ZUREVAZIDU_UI=console '" +
                      app.file("zurevazidu") + "' '-t||tccin.tmp|tccout.tmp' </dev/null >'" +
                      work.file("out") + "' 2>'" + work.file("err") + "'";
    int raw = std::system(cmd.c_str());
    Result r{WIFEXITED(raw) ? WEXITSTATUS(raw) : -1, ReadFile(work.file("err")), {}};
    ReadTextLines(app.file("tccout.tmp"), r.answer);
    return r;
  }
  static std::vector<std::string> Header(const std::string& kind, const Zone& z,
                                         const std::string& geoid = "") {
    return {"Caller", "1",  "Automatic", kind, z.system,      z.zone,
            "83",     "88", z.unitCode,  "M",  "Orthometric", geoid};
  }
  std::string fullName(const Zone& z) const {
    return ReadProfileValue(app.file("zones.ini"), z.system + "~" + z.zone, "Full Name", "");
  }
  // 3 x 3 points over the inner part of the zone's area of use.
  static std::vector<std::pair<double, double>> Samples(const Reference& ref) {
    std::vector<std::pair<double, double>> s;
    for (double i : {0.15, 0.5, 0.85})
      for (double j : {0.15, 0.5, 0.85})
        s.emplace_back(ref.south + (ref.north - ref.south) * i,
                       ref.west + (ref.east - ref.west) * j);
    return s;
  }
  test::TempDir app;
  test::TempDir work;
};

TEST_F(BatchEndToEndTest, GridPointsAnswerPROJsLatitudeLongitudeConvergenceAndScale) {
  for (const Zone& z : kZones) {
    Reference ref(fullName(z));
    auto request = Header("Plane", z);
    auto samples = Samples(ref);
    for (size_t i = 0; i < samples.size(); ++i) {
      auto [e, n] = ref.forward(samples[i].first, samples[i].second);
      char line[128];
      std::snprintf(line, sizeof line, "P%zu,%.4f,%.4f,100,,,", i, n, e);
      request.push_back(line);
    }
    Result r = run(request);
    ASSERT_EQ(r.status, 0) << z.zone << "\n" << r.err;
    ASSERT_EQ(r.answer.size(), 12 + samples.size()) << z.zone;
    for (size_t i = 0; i < samples.size(); ++i) {
      std::vector<std::string> f = Fields(r.answer[12 + i]);
      ASSERT_EQ(f.size(), 13u) << r.answer[12 + i];
      // The position PROJ gives for the grid coordinates as written.
      auto [lat, lon] = ref.inverse(std::stod(f[2]), std::stod(f[1]));
      const double gotLat = PackedDegrees(f[10]), gotLon = -PackedDegrees(f[11]);
      const double dn = (gotLat - lat) * 111320.0;
      const double de = (gotLon - lon) * 111320.0 * std::cos(lat * kDeg);
      EXPECT_LT(std::hypot(dn, de), z.tolerance) << z.zone << " " << r.answer[12 + i];
      PJ_FACTORS fac = ref.factors(lat, lon);
      EXPECT_NEAR(PackedDegrees(f[7]) * 3600, fac.meridian_convergence / kDeg * 3600,
                  kConvergenceTolerance)
          << z.zone << " " << r.answer[12 + i];
      EXPECT_NEAR(std::stod(f[8]), fac.meridional_scale, 2e-8) << z.zone;
      EXPECT_EQ(f[3], "100.0000");
    }
  }
}

TEST_F(BatchEndToEndTest, GeographicPointsAnswerPROJsGridCoordinates) {
  for (const Zone& z : kZones) {
    Reference ref(fullName(z));
    auto request = Header("Geographic", z);
    std::vector<std::pair<double, double>> written;
    for (auto [lat, lon] : Samples(ref)) {
      const std::string plat = Packed(lat), plon = Packed(-lon);
      written.emplace_back(PackedDegrees(plat), -PackedDegrees(plon));
      request.push_back("G" + std::to_string(written.size()) + "," + plat + "," + plon + ",");
    }
    Result r = run(request);
    ASSERT_EQ(r.status, 0) << z.zone << "\n" << r.err;
    ASSERT_EQ(r.answer.size(), 12 + written.size());
    EXPECT_EQ(r.answer[3], "Plane");
    EXPECT_EQ(r.answer[4], z.system);
    EXPECT_EQ(r.answer[5], z.zone);
    EXPECT_EQ(r.answer[8], z.unitCode);
    for (size_t i = 0; i < written.size(); ++i) {
      std::vector<std::string> f = Fields(r.answer[12 + i]);
      ASSERT_EQ(f.size(), 13u);
      auto [e, n] = ref.forward(written[i].first, written[i].second);
      EXPECT_NEAR(std::stod(f[1]) * ref.toMeters(), n * ref.toMeters(), z.tolerance)
          << z.zone << " " << r.answer[12 + i];
      EXPECT_NEAR(std::stod(f[2]) * ref.toMeters(), e * ref.toMeters(), z.tolerance)
          << z.zone << " " << r.answer[12 + i];
      PJ_FACTORS fac = ref.factors(written[i].first, written[i].second);
      EXPECT_NEAR(PackedDegrees(f[7]) * 3600, fac.meridian_convergence / kDeg * 3600,
                  kConvergenceTolerance);
      EXPECT_NEAR(std::stod(f[8]), fac.meridional_scale, 2e-8);
    }
  }
}

TEST_F(BatchEndToEndTest, GeoidHeightsFromTheGeoidProgram) {
  // GEOID09 over New Mexico: N = -25 + 0.5 (lat - 31) - 0.2 (lon - 250).
  auto n = [](double lat, double lon) { return -25.0 + 0.5 * (lat - 31) - 0.2 * (lon - 250); };
  test::SaveGeoidGrid(app.file("NGS/GEOID/g2009u03.bin"),
                      test::MakeGeoidGrid(31, 250, 1.0 / 60, 301, 361, n));
  auto request = Header("Geographic", kZones[0], "GEOID09");
  request.push_back("NM,32.1652339690,106.4515776360,1500");
  Result r = run(request);
  ASSERT_EQ(r.status, 0) << r.err;
  ASSERT_EQ(r.answer.size(), 13u);
  EXPECT_EQ(r.answer[11], "GEOID09");
  std::vector<std::string> f = Fields(r.answer[12]);
  const double lat = 32 + 16 / 60.0 + 52.33969 / 3600,
               lon = 360 - (106 + 45 / 60.0 + 15.77636 / 3600);
  // Metres from the program, in the request's vertical units (metres).
  EXPECT_NEAR(std::stod(f[9]), n(lat, lon), 0.0006) << r.answer[12];
  EXPECT_EQ(f[3], "1500.0000");
  for (const char* left : {"geoid.con", "geoid.inp", "geoid.bat", "geoid.out", "junk"})
    EXPECT_FALSE(fs::exists(app.file(std::string("NGS/GEOID/") + left))) << left;
}

TEST_F(BatchEndToEndTest, BrokenRequestIsRefusedWithoutAnswer) {
  app.write("tccout.tmp", "old\r\n");
  auto request = Header("Plane", kZones[0]);
  request.push_back("P1,100,200,,,,");
  request.push_back("P2,100;200");
  Result r = run(request);
  EXPECT_EQ(r.status, 1);
  EXPECT_EQ(r.err,
            "exclamation: Invalid Coordinate Request\nLine 14 of tccin.tmp has 2 fields; a grid "
            "point needs 7: name, northing, easting, height, northing error, easting error and "
            "elevation error.\nP2,100;200\n\n");
  EXPECT_FALSE(fs::exists(app.file("tccout.tmp")));
}

// In process: NAD 27 geographic coordinates into a NAD 83 zone through the
// stand-in NADCON on a synthetic grid, then the single-point report.
TEST_F(BatchEndToEndTest, DatumShiftIntoAZoneAndTheReport) {
  // Shifts of +0.5" in latitude and 1.5" west in longitude (stored positive
  // west) over New Mexico.
  const std::string folder = app.file("NGS/NADCON/");
  test::SaveShiftGrid(
      folder + "conus.las",
      test::MakeShiftGrid(-110, 30, 0.25, 41, 29, [](double, double) { return 0.5; }));
  test::SaveShiftGrid(
      folder + "conus.los",
      test::MakeShiftGrid(-110, 30, 0.25, 41, 29, [](double, double) { return 1.5; }));
  ScriptedUi ui;
  ConversionState state;
  state.singlePoint = true;
  const double lat27 = 32 + 16 / 60.0 + 52.0 / 3600, lon27 = 106 + 45 / 60.0 + 14.0 / 3600;
  SurveyPoint p;
  p.PointName = "TIE";
  p.Latitude = lat27 * kDegreesToRadians;
  p.Longitude = lon27 * kDegreesToRadians;
  p.Elevation = 1500;
  p.VerticalUnits = kMeters;
  state.points = {p};
  ConversionSettings& s = state.settings;
  s.inputCoordinateSystem = kGeographicCoordinates;
  s.inputHorizontalDatum = "NAD 27";
  s.inputHorizontalUnits = kFormatPacked;
  s.inputVerticalDatum = s.outputVerticalDatum = "NAVD 88";
  s.inputVerticalUnits = kMeters;
  s.outputCoordinateSystem = kZones[0].system;
  s.outputZone = kZones[0].zone;
  s.outputHorizontalDatum = "NAD 83";
  s.outputHorizontalUnits = kMeters;
  s.outputVerticalUnits = kUsSurveyFeet;
  s.OutputScaleFactor = true;
  ASSERT_TRUE(ConvertPoints(ui, app.path(), state)) << (ui.boxes.empty() ? "" : ui.boxes[0].text);

  Reference ref(fullName(kZones[0]));
  auto [e, n] = ref.forward(lat27 + 0.5 / 3600, -(lon27 + 1.5 / 3600));
  EXPECT_NEAR(state.points[0].Northing, n * ref.toMeters(), 0.001);
  EXPECT_NEAR(state.points[0].Easting, e * ref.toMeters(), 0.001);

  const std::string& report = state.report;
  EXPECT_NE(report.find("Single Point Conversion\t\tPoint Name: TIE\r\n\r\nInput:\r\n"
                        "     Coordinate System: \tGeographic Coordinates\r\n"
                        "     Horizontal Datum: \t\tNAD 27\r\n"
                        "     Vertical Datum: \t\tNAVD 88\r\n"
                        "     Latitude: \t\t\t32.165200000 (N)\r\n"
                        "     Longitude: \t\t106.451400000 (W)\r\n"
                        "     Orthometric Height: \t1,500.000 (Meters)\r\n\r\nOutput:\r\n"
                        "     Coordinate System: \tState Plane 1983\r\n"
                        "     Zone: \t\t\tNew Mexico Central 3002\r\n"
                        "     Horizontal Datum: \t\tNAD 83\r\n"
                        "     Vertical Datum: \t\tNAVD 88\r\n     Northing (Y): \t\t"),
            std::string::npos)
      << report;
  EXPECT_NE(report.find("     Orthometric Height: \t4,921.250 (U.S. Survey Feet)\r\n"
                        "     Scale Factor: \t\t0.9999"),
            std::string::npos)
      << report;
  const std::string northing = report.substr(report.find("Northing (Y): \t\t") + 16);
  std::string digits;
  for (char c : northing.substr(0, northing.find(' ')))
    if (c != ',') digits += c;
  EXPECT_NEAR(std::stod(digits), n * ref.toMeters(), 0.001);
  EXPECT_EQ(northing.substr(northing.find(' '), 10), " (Meters)\r");
}

}  // namespace
}  // namespace zv
