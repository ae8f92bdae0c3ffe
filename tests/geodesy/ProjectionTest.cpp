#include <gtest/gtest.h>

#include <cmath>

#include "geodesy/Projection.h"
#include "geodesy/ProjectionTestSupport.h"
#include "platform/Numbers.h"

namespace zv {
namespace {

using test::Dms;

ZoneParameters Grs80(const char* projection) {
  ZoneParameters d{};
  d.projection = projection;
  d.a = test::kGrs80A;
  d.e = test::kGrs80E;
  return d;
}

ZoneParameters Clarke1866(const char* projection) {
  ZoneParameters d{};
  d.projection = projection;
  d.a = test::kClarke1866A;
  d.e = test::kClarke1866E;
  return d;
}

// Each name reaches its form with its parameters in the right places: the
// published values come out through the dispatch.
TEST(Projection, EachNameReachesItsFormWithItsParameters) {
  ZoneParameters tm = Grs80(kTransverseMercator);
  tm.phi0 = Dms(31);
  tm.lambda0 = Dms(106, 15);
  tm.falseEasting = 500000.0;
  tm.k0 = 0.9999;
  ProjectionZone zone = Projection_SetZone(tm);
  ASSERT_EQ(zone.status, ProjectionStatus::Ok);
  EXPECT_TRUE(std::holds_alternative<TmZone>(zone.record));
  EXPECT_FALSE(zone.usSurveyFeet);
  GridPoint g = Projection_GeographicToGrid(zone, Dms(32, 16, 52.33969), Dms(106, 45, 15.77636));
  EXPECT_NEAR(g.northing, 142158.262, 0.001);
  EXPECT_NEAR(g.easting, 452489.852, 0.001);

  ZoneParameters lcc = Grs80(kLambertTwoParallels);
  lcc.phiN = Dms(48, 44);
  lcc.phiS = Dms(47, 26);
  lcc.phi0 = Dms(47);
  lcc.lambda0 = Dms(100, 30);
  lcc.falseEasting = 600000.0;
  zone = Projection_SetZone(lcc);
  ASSERT_EQ(zone.status, ProjectionStatus::Ok);
  EXPECT_TRUE(std::holds_alternative<Lambert2Zone>(zone.record));
  g = Projection_GeographicToGrid(zone, Dms(48, 4, 18.44714), Dms(99, 14, 45.11046));
  EXPECT_NEAR(g.northing, 119923.671, 0.001);
  EXPECT_NEAR(g.easting, 693450.294, 0.001);
  const GeographicPoint p = Projection_GridToGeographic(zone, g.northing, g.easting);
  EXPECT_NEAR(p.phi, Dms(48, 4, 18.44714), 1e-10);

  ZoneParameters lcc27 = Clarke1866(kLambertNad27);
  lcc27.phiN = Dms(30, 17);
  lcc27.phiS = Dms(28, 23);
  lcc27.phi0 = Dms(27, 50);
  lcc27.lambda0 = Dms(99);
  lcc27.falseEasting = 2000000.0;
  zone = Projection_SetZone(lcc27);
  ASSERT_EQ(zone.status, ProjectionStatus::Ok);
  EXPECT_TRUE(std::holds_alternative<Lambert27Zone>(zone.record));
  EXPECT_TRUE(zone.usSurveyFeet);
  g = Projection_GeographicToGrid(zone, Dms(28, 30), Dms(96));
  EXPECT_NEAR(g.easting, 2963503.91, 0.005);
  EXPECT_NEAR(g.northing, 254759.80, 0.005);

  ZoneParameters om = Grs80(kObliqueMercator);
  om.phi0 = Dms(57);
  om.lambda0 = Dms(133, 40);
  om.falseNorthing = -5000000.0;
  om.falseEasting = 5000000.0;
  om.k0 = 0.9999;
  om.azimuth = kFullCircle + std::atan(-0.75);
  zone = Projection_SetZone(om);
  ASSERT_EQ(zone.status, ProjectionStatus::Ok);
  EXPECT_TRUE(std::holds_alternative<OmZone>(zone.record));
  g = Projection_GeographicToGrid(zone, Dms(57), Dms(133, 40));
  EXPECT_NEAR(g.easting, 818676.734, 0.001);
  EXPECT_NEAR(g.northing, 575097.689, 0.001);
}

// Every NAD 27 Transverse Mercator zone, Alaska's included, takes the one
// feet form on Clarke 1866.
TEST(Projection, NadTwentySevenTransverseMercatorIsOneFormInFeet) {
  ZoneParameters d = Clarke1866(kTransverseMercatorNad27);
  d.falseEasting = 500000.0;
  const struct {
    double phi0, lambda0, k0, lat, lon, easting;
  } cases[] = {{Dms(54), Dms(150), 0.9999, 61 + 13 / 60.0, 149.9, 517629.6503},
               {Dms(40, 40), Dms(108, 45), 0.999941177, 44.5, 110.5, 43396.5129}};
  for (const auto& c : cases) {
    d.phi0 = c.phi0;
    d.lambda0 = c.lambda0;
    d.k0 = c.k0;
    const ProjectionZone zone = Projection_SetZone(d);
    ASSERT_EQ(zone.status, ProjectionStatus::Ok);
    EXPECT_TRUE(std::holds_alternative<Tm27Zone>(zone.record));
    EXPECT_TRUE(zone.usSurveyFeet);
    EXPECT_NEAR(Projection_GeographicToGrid(zone, Dms(c.lat), Dms(c.lon)).easting, c.easting,
                0.003);
  }
}

// Forward then inverse over each form's area returns the point, and the
// inverse gives the convergence and scale of the same point.
TEST(Projection, RoundTripOfEveryForm) {
  struct Case {
    const char* name;
    ZoneParameters zone;
    double south, north, west, east;  // degrees, longitudes west-positive
    double angle, scale;              // tolerances
  };
  ZoneParameters utm = Grs80(kTransverseMercator);
  utm.lambda0 = Dms(99);
  utm.falseEasting = 500000.0;
  utm.k0 = 0.9996;
  ZoneParameters tm27 = Clarke1866(kTransverseMercatorNad27);
  tm27.phi0 = Dms(31);
  tm27.lambda0 = Dms(106, 15);
  tm27.falseEasting = 500000.0;
  tm27.k0 = 0.9999;
  ZoneParameters lcc = Grs80(kLambertTwoParallels);
  lcc.phiN = Dms(30, 17);
  lcc.phiS = Dms(28, 23);
  lcc.phi0 = Dms(27, 50);
  lcc.lambda0 = Dms(99);
  lcc.falseNorthing = 4000000.0;
  lcc.falseEasting = 600000.0;
  ZoneParameters lcc27 = lcc;
  lcc27.projection = kLambertNad27;
  lcc27.a = test::kClarke1866A;
  lcc27.e = test::kClarke1866E;
  lcc27.falseNorthing = 0.0;
  lcc27.falseEasting = 2000000.0;
  ZoneParameters one = Grs80(kLambertOneParallel);
  one.phi0 = Dms(40);
  one.lambda0 = Dms(100);
  one.falseEasting = 500000.0;
  one.k0 = 0.9999;
  ZoneParameters om = Grs80(kObliqueMercator);
  om.phi0 = Dms(57);
  om.lambda0 = Dms(133, 40);
  om.falseNorthing = -5000000.0;
  om.falseEasting = 5000000.0;
  om.k0 = 0.9999;
  om.azimuth = kFullCircle + std::atan(-0.75);

  const Case cases[] = {
      {"UTM 14, 3 degrees each side", utm, -70, 80, 96, 102, 1e-9, 5e-9},
      {"NAD 27 TM, 2 degrees each side", tm27, 25, 50, 104.25, 108.25, 1e-9, 1e-9},
      {"Lambert two parallels", lcc, 25, 33, 94, 104, 1e-10, 1e-12},
      {"Lambert NAD 27", lcc27, 26, 32, 94, 104, 1e-9, 1e-9},
      {"Lambert one parallel", one, 35, 45, 95, 105, 1e-10, 1e-12},
      {"Oblique Mercator", om, 54, 60.5, 129, 141.5, 1e-10, 1e-10},
  };
  for (const Case& c : cases) {
    const ProjectionZone zone = Projection_SetZone(c.zone);
    ASSERT_EQ(zone.status, ProjectionStatus::Ok) << c.name;
    constexpr int kSteps = 12;
    for (int i = 0; i <= kSteps; ++i) {
      for (int j = 0; j <= kSteps; ++j) {
        const double phi = Dms(c.south + (c.north - c.south) * i / kSteps);
        const double lambda = Dms(c.west + (c.east - c.west) * j / kSteps);
        const GridPoint g = Projection_GeographicToGrid(zone, phi, lambda);
        const GeographicPoint p = Projection_GridToGeographic(zone, g.northing, g.easting);
        SCOPED_TRACE(testing::Message() << c.name << " at " << phi << ", " << lambda);
        EXPECT_NEAR(p.phi, phi, c.angle);
        EXPECT_NEAR(p.lambda, lambda, c.angle);
        EXPECT_NEAR(p.convergence, g.convergence, c.angle);
        EXPECT_NEAR(p.scaleFactor, g.scaleFactor, c.scale);
      }
    }
  }
}

TEST(Projection, UnknownNamesFailedConesAndNoValueInputsGiveNoValue) {
  for (const char* name : {"transverse mercator", "Transverse Mercator ", "Polyconic", ""}) {
    const ProjectionZone zone = Projection_SetZone(Grs80(name));
    EXPECT_EQ(zone.status, ProjectionStatus::UnknownProjection) << name;
    const GridPoint g = Projection_GeographicToGrid(zone, Dms(40), Dms(100));
    EXPECT_EQ(g.northing, kNoValue);
    EXPECT_EQ(g.easting, kNoValue);
    const GeographicPoint p = Projection_GridToGeographic(zone, 0.0, 0.0);
    EXPECT_EQ(p.phi, kNoValue);
    EXPECT_EQ(p.lambda, kNoValue);
  }

  for (const char* name : {kLambertTwoParallels, kLambertNad27}) {
    ZoneParameters d = Clarke1866(name);
    d.phiN = d.phiS = Dms(40);
    d.phi0 = Dms(39);
    d.lambda0 = Dms(100);
    const ProjectionZone zone = Projection_SetZone(d);
    EXPECT_EQ(zone.status, ProjectionStatus::MappingRadius) << name;
    EXPECT_EQ(Projection_GeographicToGrid(zone, Dms(40), Dms(100)).northing, kNoValue) << name;
  }

  ZoneParameters tm = Grs80(kTransverseMercator);
  tm.lambda0 = Dms(99);
  tm.k0 = 0.9996;
  const ProjectionZone zone = Projection_SetZone(tm);
  const GridPoint g = Projection_GeographicToGrid(zone, kNoValue, Dms(99));
  EXPECT_EQ(g.northing, kNoValue);
  EXPECT_EQ(g.easting, kNoValue);
  EXPECT_EQ(g.convergence, kNoValue);
  EXPECT_EQ(g.scaleFactor, kNoValue);
  const GeographicPoint p = Projection_GridToGeographic(zone, 100.0, kNoValue);
  EXPECT_EQ(p.phi, kNoValue);
  EXPECT_EQ(p.lambda, kNoValue);
}

}  // namespace
}  // namespace zv
