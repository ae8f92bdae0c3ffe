#include <gtest/gtest.h>

#include <cmath>

#include "geodesy/Lambert.h"
#include "geodesy/ProjectionTestSupport.h"

namespace zv {
namespace {

using test::ArcSeconds;
using test::Dms;

// SPCS 83 North Dakota North (GRS 80).
Lambert2Zone NorthDakotaNorth() {
  return Lambert2_SetZone(Dms(47, 26), Dms(48, 44), Dms(47), Dms(100, 30), 0.0, 600000.0,
                          test::kGrs80A, test::kGrs80E);
}

// SPCS 83 Texas South Central (GRS 80), false northing 4000000 m.
Lambert2Zone TexasSouthCentral() {
  return Lambert2_SetZone(Dms(28, 23), Dms(30, 17), Dms(27, 50), Dms(99), 4000000.0, 600000.0,
                          test::kGrs80A, test::kGrs80E);
}

TEST(Lambert2, ReproducesPublishedNorthDakotaNorth) {
  // Data sheet TE1991.
  const Lambert2Zone zone = NorthDakotaNorth();
  ASSERT_TRUE(zone.mappingRadiusOk);
  const GridPoint g = Lambert2_GeographicToGrid(zone, Dms(48, 4, 18.44714), Dms(99, 14, 45.11046));
  EXPECT_NEAR(g.northing, 119923.671, 0.001);
  EXPECT_NEAR(g.easting, 693450.294, 0.001);
  EXPECT_NEAR(g.scaleFactor, 0.99993587, 1e-8);
  EXPECT_NEAR(ArcSeconds(g.convergence), 55 * 60 + 59.7, 0.05);

  const GeographicPoint p = Lambert2_GridToGeographic(zone, 119923.671, 693450.294);
  EXPECT_NEAR(p.phi, Dms(48, 4, 18.44714), 5e-10);
  EXPECT_NEAR(p.lambda, Dms(99, 14, 45.11046), 5e-10);
}

TEST(Lambert2, BaseLatitudeCentralMeridianAndStandardParallels) {
  const Lambert2Zone zone = TexasSouthCentral();
  GridPoint g = Lambert2_GeographicToGrid(zone, Dms(27, 50), Dms(99));
  EXPECT_NEAR(g.northing, 4000000.0, 1e-6);
  EXPECT_NEAR(g.easting, 600000.0, 1e-9);
  EXPECT_EQ(g.convergence, 0.0);
  // Scale 1 on both standard parallels, below 1 between them.
  EXPECT_NEAR(Lambert2_GeographicToGrid(zone, Dms(28, 23), Dms(97)).scaleFactor, 1.0, 1e-9);
  EXPECT_NEAR(Lambert2_GeographicToGrid(zone, Dms(30, 17), Dms(101)).scaleFactor, 1.0, 1e-9);
  EXPECT_LT(Lambert2_GeographicToGrid(zone, Dms(29, 20), Dms(99)).scaleFactor, 1.0);
  // East of the central meridian: larger easting, positive convergence.
  g = Lambert2_GeographicToGrid(zone, Dms(29), Dms(97));
  EXPECT_GT(g.easting, 600000.0);
  EXPECT_GT(g.convergence, 0.0);
}

TEST(Lambert2, StandardParallelsInEitherOrder) {
  const Lambert2Zone swapped = Lambert2_SetZone(Dms(30, 17), Dms(28, 23), Dms(27, 50), Dms(99),
                                                4000000.0, 600000.0, test::kGrs80A, test::kGrs80E);
  ASSERT_TRUE(swapped.mappingRadiusOk);
  const GridPoint a = Lambert2_GeographicToGrid(TexasSouthCentral(), Dms(31), Dms(102));
  const GridPoint b = Lambert2_GeographicToGrid(swapped, Dms(31), Dms(102));
  EXPECT_NEAR(a.northing, b.northing, 1e-6);
  EXPECT_NEAR(a.easting, b.easting, 1e-6);
  EXPECT_NEAR(a.scaleFactor, b.scaleFactor, 1e-12);
}

// ---- One standard parallel ----

TEST(Lambert1, StandardParallelOnTheCentralMeridian) {
  const Lambert1Zone zone =
      Lambert1_SetZone(test::kGrs80A, test::kGrs80E, Dms(40), Dms(100), 100000.0, 500000.0, 0.9999);
  const GridPoint g = Lambert1_GeographicToGrid(zone, Dms(40), Dms(100));
  EXPECT_NEAR(g.northing, 100000.0, 1e-9);
  EXPECT_NEAR(g.easting, 500000.0, 1e-9);
  EXPECT_EQ(g.convergence, 0.0);
  EXPECT_NEAR(g.scaleFactor, 0.9999, 1e-15);
  EXPECT_NEAR(Lambert1_ScaleFactor(zone, Dms(40)), 0.9999, 1e-15);
}

TEST(Lambert1, AgreesWithTheSameConeFromTwoParallels) {
  // A two-parallel cone is a one-parallel cone on its central parallel with
  // the scale factor k0 there; the series form must reproduce it.
  const Lambert2Zone two = Lambert2_SetZone(Dms(39), Dms(41), Dms(38), Dms(100), 0.0, 500000.0,
                                            test::kGrs80A, test::kGrs80E);
  const Lambert1Zone one = Lambert1_SetZone(test::kGrs80A, test::kGrs80E, std::asin(two.sinPhi0),
                                            Dms(100), two.N0, 500000.0, two.k0);
  for (double lat = 38; lat <= 42; lat += 0.5) {
    for (double lon = 97; lon <= 103; lon += 1) {
      const GridPoint a = Lambert2_GeographicToGrid(two, Dms(lat), Dms(lon));
      const GridPoint b = Lambert1_GeographicToGrid(one, Dms(lat), Dms(lon));
      EXPECT_NEAR(b.northing, a.northing, 0.001) << lat << " " << lon;
      EXPECT_NEAR(b.easting, a.easting, 0.001) << lat << " " << lon;
      EXPECT_NEAR(b.convergence, a.convergence, 1e-12) << lat << " " << lon;
      EXPECT_NEAR(b.scaleFactor, a.scaleFactor, 1e-7) << lat << " " << lon;
    }
  }
}

TEST(Lambert1, OriginNeedsNoNewtonStep) {
  const Lambert1Zone zone =
      Lambert1_SetZone(test::kGrs80A, test::kGrs80E, Dms(40), Dms(100), 0.0, 500000.0, 0.9999);
  const GeographicPoint origin = Lambert1_GridToGeographic(zone, 0.0, 500000.0);
  EXPECT_NEAR(origin.phi, Dms(40), 1e-12);
  EXPECT_NEAR(origin.lambda, Dms(100), 1e-15);
  EXPECT_EQ(origin.convergence, 0.0);
}

TEST(Lambert1, NonFiniteGridValuesDoNotHang) {
  const Lambert1Zone zone =
      Lambert1_SetZone(test::kGrs80A, test::kGrs80E, Dms(40), Dms(100), 0.0, 500000.0, 0.9999);
  const GeographicPoint p = Lambert1_GridToGeographic(zone, std::nan(""), 500000.0);
  EXPECT_TRUE(std::isnan(p.phi));
  const GeographicPoint q = Lambert1_GridToGeographic(zone, INFINITY, 500000.0);
  EXPECT_FALSE(std::isfinite(q.phi));
}

// ---- NAD 27 equations ----

Lambert27Zone TexasSouthCentral27() {
  return Lambert27_SetZone(Dms(28, 23), Dms(30, 17), Dms(27, 50), Dms(99), 0.0, 2000000.0,
                           test::kClarke1866A, test::kClarke1866E);
}

TEST(Lambert27, ReproducesPublishedTexasSouthCentral) {
  const Lambert27Zone zone = TexasSouthCentral27();
  ASSERT_TRUE(zone.mappingRadiusOk);
  const GridPoint g = Lambert27_GeographicToGrid(zone, Dms(28, 30), Dms(96));
  EXPECT_NEAR(g.easting, 2963503.91, 0.005);
  EXPECT_NEAR(g.northing, 254759.80, 0.005);
  const GeographicPoint p = Lambert27_GridToGeographic(zone, 254759.80, 2963503.91);
  EXPECT_NEAR(p.phi, Dms(28, 30), 1e-9);
  EXPECT_NEAR(p.lambda, Dms(96), 1e-9);
}

TEST(Lambert27, AgreesWithTheRigorousConeOnClarke1866) {
  // The table-constant meridian distances against the closed formulas, feet.
  const Lambert27Zone nad27 = TexasSouthCentral27();
  const Lambert2Zone rigorous =
      Lambert2_SetZone(Dms(28, 23), Dms(30, 17), Dms(27, 50), Dms(99), 0.0,
                       2000000.0 / kMetersToUsFeet, test::kClarke1866A, test::kClarke1866E);
  // Over the zone (27.8 to 30.6 N, 95.5 to 101.5 W).
  for (double lat = 27.75; lat <= 30.75; lat += 0.25) {
    for (double lon = 95; lon <= 102; lon += 1) {
      const GridPoint a = Lambert2_GeographicToGrid(rigorous, Dms(lat), Dms(lon));
      const GridPoint b = Lambert27_GeographicToGrid(nad27, Dms(lat), Dms(lon));
      EXPECT_NEAR(b.northing, a.northing * kMetersToUsFeet, 0.01) << lat << " " << lon;
      EXPECT_NEAR(b.easting, a.easting * kMetersToUsFeet, 0.01) << lat << " " << lon;
      EXPECT_NEAR(b.convergence, a.convergence, 1e-12) << lat << " " << lon;
      EXPECT_NEAR(b.scaleFactor, a.scaleFactor, 1e-9) << lat << " " << lon;
    }
  }
}

TEST(Lambert27, FalseNorthingAtTheBaseLatitude) {
  // California zone VII of SPCS 27 has a false origin in both coordinates.
  const Lambert27Zone zone =
      Lambert27_SetZone(Dms(33, 52), Dms(34, 25), Dms(34, 8), Dms(118, 20), 4160926.74, 4186692.58,
                        test::kClarke1866A, test::kClarke1866E);
  const GridPoint g = Lambert27_GeographicToGrid(zone, Dms(34, 8), Dms(118, 20));
  EXPECT_NEAR(g.northing, 4160926.74, 1e-5);
  EXPECT_NEAR(g.easting, 4186692.58, 1e-9);
  const GeographicPoint p = Lambert27_GridToGeographic(zone, 4170000.0, 4190000.0);
  const GridPoint back = Lambert27_GeographicToGrid(zone, p.phi, p.lambda);
  EXPECT_NEAR(back.northing, 4170000.0, 1e-4);
  EXPECT_NEAR(back.easting, 4190000.0, 1e-4);
}

}  // namespace
}  // namespace zv
