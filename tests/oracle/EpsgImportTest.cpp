// Zones imported from EPSG: each imported zone is saved into a catalog,
// resolved and projected by the program, and compared with PROJ's own
// definition of the system.

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "EpsgZone.h"
#include "geodesy/Angles.h"
#include "geodesy/Catalogs.h"
#include "geodesy/Projection.h"
#include "geodesy/epsg/EpsgImport.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

const std::string kAppData = ZV_SOURCE_DIR "/appdata";
constexpr double kDeg = 3.14159265358979323846 / 180.0;

struct Case {
  const char* code;
  const char* projection;
  const char* units;
  const char* datum;
  const char* ellipsoid;  // "Computational Ellipsoid"
};

const Case kCases[] = {
    {"26916", kTransverseMercator, kMeters, "NAD 83", ""},  // UTM
    {"32616", kTransverseMercator, kMeters, "", "WGS 84"},  // no WGS 84 datum in the catalog
    {"2223", kTransverseMercator, kInternationalFeet, "NAD 83", ""},
    {"7587", kTransverseMercator, kUsSurveyFeet, "NAD 83", ""},       // WISCRS, NAD83(2011)
    {"7590", kLambertOneParallel, kUsSurveyFeet, "NAD 83", ""},       // WISCRS Bayfield
    {"6795", kLambertOneParallel, kInternationalFeet, "NAD 83", ""},  // Oregon county zone
    {"3448", kLambertOneParallel, kMeters, "", "WGS 84"},             // Jamaica
    {"2288", kLambertTwoParallels, kUsSurveyFeet, "NAD 83", ""},
    {"32054", kLambertTwoParallels, kUsSurveyFeet, "NAD 27", ""},
    {"2994", kLambertTwoParallels, kInternationalFeet, "Washington-Oregon HPGN", ""},
    {"3078", kObliqueMercator, kMeters, "NAD 83", ""},
    {"26931", kObliqueMercator, kMeters, "NAD 83", ""},
    {"6843", kObliqueMercator, kInternationalFeet, "NAD 83", ""},  // Oregon Coast zone
};

TEST(EpsgImport, ZonesProjectAsPROJDoes) {
  test::TempDir app;
  for (const char* file : {"datums.ini", "ellipsoids.ini"}) {
    std::filesystem::copy_file(kAppData + "/" + file, app.file(file));
  }
  double worst = 0.0;
  for (const Case& c : kCases) {
    SCOPED_TRACE(c.code);
    EpsgZone imported = ZoneFromEpsg(c.code, app.path());
    ASSERT_EQ(imported.error, "");
    ZoneRecord& z = imported.zone;
    EXPECT_NE(z.fullName.find(std::string("(EPSG:") + c.code + ")"), std::string::npos);
    EXPECT_EQ(z.projection, c.projection);
    EXPECT_EQ(z.linearUnits, c.units);
    EXPECT_EQ(z.horizontalDatum, c.datum) << imported.datumNote;
    EXPECT_EQ(z.computationalEllipsoid, c.ellipsoid) << imported.datumNote;
    EXPECT_FALSE(imported.datumNote.empty());

    z.coordinateSystem = "EPSG";
    z.zone = c.code;
    ASSERT_TRUE(ZoneStore(app.file("zones.ini")).save(z));
    ScriptedUi ui;
    const ZoneParameters parameters = ResolveZone(ui, app.path(), "EPSG", c.code);
    const ProjectionZone zone = Projection_SetZone(parameters);
    ASSERT_EQ(zone.status, ProjectionStatus::Ok);

    const test::EpsgZone proj(std::atoi(c.code));
    ASSERT_TRUE(proj.ok() && proj.hasArea);
    const double east = proj.east < proj.west ? proj.east + 360.0 : proj.east;
    double largest = 0.0;
    for (int i = 0; i < 16; ++i) {
      const double lat = proj.south + (proj.north - proj.south) * (0.1 + 0.8 * (i / 4) / 3.0);
      const double lon = proj.west + (east - proj.west) * (0.1 + 0.8 * (i % 4) / 3.0);
      const double west =
          lon > 0.0 ? 2.0 * kPi - lon * kDegreesToRadians : -lon * kDegreesToRadians;
      const GridPoint g = Projection_GeographicToGrid(zone, lat * kDeg, west);
      const PJ_XY expected = proj.forward(lat, lon > 180.0 ? lon - 360.0 : lon);
      const double dn = Distances_Convert(g.northing, kMeters, c.units) - expected.y;
      const double de = Distances_Convert(g.easting, kMeters, c.units) - expected.x;
      largest = std::max(largest, std::hypot(dn, de) * proj.toMeters);
    }
    EXPECT_LT(largest, 0.001);
    std::printf("EPSG:%-6s %-42s largest difference from PROJ %.4f mm\n", c.code,
                z.projection.c_str(), largest * 1000.0);
    worst = std::max(worst, largest);
  }
  std::printf("Largest difference over all imported zones: %.4f mm\n", worst * 1000.0);
}

TEST(EpsgImport, RefusesWhatTheProjectionsCannotExpress) {
  const std::pair<const char*, const char*> refused[] = {
      {"3031", "Polar Stereographic (variant B)"},
      {"5070", "Albers Equal Area"},
      {"4326", "not a projected coordinate system"},
      {"3375", "rectified grid angle"},
      {"27572", "prime meridian is Paris"},
      {"2136", "its unit (Gold Coast foot)"},
      {"20935", "ellipsoid Clarke 1880 (Arc) (semimajor axis 6378249.145"},
      {"9999999", "EPSG:9999999 is not in PROJ's database."},
  };
  for (const auto& [code, reason] : refused) {
    const EpsgZone z = ZoneFromEpsg(code, kAppData);
    EXPECT_NE(z.error.find(reason), std::string::npos) << code << ": " << z.error;
    EXPECT_EQ(z.zone.projection, "") << code;
  }
  // The search gives the same reason, without the catalogs.
  const EpsgSearch albers = SearchEpsg("5070");
  ASSERT_EQ(albers.candidates.size(), 1u);
  EXPECT_NE(albers.candidates[0].refusal.find("Albers"), std::string::npos);
}

TEST(EpsgImport, SearchesByCodeOrWordsOfTheName) {
  const EpsgSearch byCode = SearchEpsg(" epsg:2288 ");
  ASSERT_EQ(byCode.error, "");
  ASSERT_EQ(byCode.candidates.size(), 1u);
  EXPECT_EQ(byCode.candidates[0].name, "NAD83 / Wisconsin Central (ftUS)");
  EXPECT_EQ(byCode.candidates[0].refusal, "");

  const EpsgSearch county = SearchEpsg("wiscrs ADAMS");
  std::vector<std::string> codes;
  for (const EpsgCandidate& c : county.candidates) {
    EXPECT_NE(c.name.find("WISCRS Adams"), std::string::npos) << c.name;
    EXPECT_EQ(c.refusal, "") << c.name;
    codes.push_back(c.code);
  }
  for (const char* code : {"7528", "7587"}) {
    EXPECT_NE(std::find(codes.begin(), codes.end(), code), codes.end()) << code;
  }
  EXPECT_TRUE(std::is_sorted(county.candidates.begin(), county.candidates.end(),
                             [](auto& x, auto& y) { return x.name < y.name; }));

  EXPECT_EQ(SearchEpsg("nad83 oregon", 5).candidates.size(), 5u);
  EXPECT_TRUE(SearchEpsg("   ").candidates.empty());
}

TEST(EpsgImport, WithoutPROJDatabaseSaysSo) {
  test::TempDir empty;
  const char* before = std::getenv("PROJ_DATA");
  const std::string saved = before ? before : "";
  setenv("PROJ_DATA", empty.path().c_str(), 1);
  const EpsgSearch search = SearchEpsg("2288");
  const EpsgZone zone = ZoneFromEpsg("2288", kAppData);
  if (before) {
    setenv("PROJ_DATA", saved.c_str(), 1);
  } else {
    unsetenv("PROJ_DATA");
  }
  EXPECT_NE(search.error.find("proj.db"), std::string::npos);
  EXPECT_TRUE(search.candidates.empty());
  EXPECT_EQ(zone.error, search.error);
  EXPECT_EQ(SearchEpsg("2288").candidates.size(), 1u);
}

}  // namespace
}  // namespace zv
