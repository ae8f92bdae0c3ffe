#include <gtest/gtest.h>

#include <cmath>

#include "geodesy/ProjectionTestSupport.h"
#include "geodesy/TransverseMercator.h"

namespace zv {
namespace {

using test::ArcSeconds;
using test::Dms;

// SPCS 83 New Mexico Central and UTM zone 14 (GRS 80).
TmZone NewMexicoCentral() {
  return TM_SetZone(test::kGrs80A, test::kGrs80E, Dms(31), Dms(106, 15), 0.0, 500000.0, 0.9999);
}
TmZone Utm14() {
  return TM_SetZone(test::kGrs80A, test::kGrs80E, 0.0, Dms(99), 0.0, 500000.0, 0.9996);
}

TEST(TransverseMercator, ReproducesPublishedStatePlaneAndUtmValues) {
  // NGS SPCS83 output, New Mexico Central.
  GridPoint g =
      TM_GeographicToGrid(NewMexicoCentral(), Dms(32, 16, 52.33969), Dms(106, 45, 15.77636));
  EXPECT_NEAR(g.northing, 142158.262, 0.001);
  EXPECT_NEAR(g.easting, 452489.852, 0.001);
  EXPECT_NEAR(ArcSeconds(g.convergence), -(16 * 60 + 9.78), 0.01);
  EXPECT_NEAR(g.scaleFactor, 0.99992783, 1e-8);

  // Data sheet TE1991, UTM zone 14.
  g = TM_GeographicToGrid(Utm14(), Dms(48, 4, 18.44714), Dms(99, 14, 45.11046));
  EXPECT_NEAR(g.northing, 5324308.767, 0.001);
  EXPECT_NEAR(g.easting, 481685.116, 0.001);
  EXPECT_NEAR(ArcSeconds(g.convergence), -(10 * 60 + 58.5), 0.05);
  EXPECT_NEAR(g.scaleFactor, 0.99960412, 1e-8);

  // And back from the published grid values.
  const GeographicPoint p = TM_GridToGeographic(NewMexicoCentral(), 142158.262, 452489.852);
  EXPECT_NEAR(p.phi, Dms(32, 16, 52.33969), 5e-10);
  EXPECT_NEAR(p.lambda, Dms(106, 45, 15.77636), 5e-10);
}

TEST(TransverseMercator, CentralMeridianAndOrigin) {
  const TmZone zone =
      TM_SetZone(test::kGrs80A, test::kGrs80E, Dms(31), Dms(106, 15), 1000.0, 500000.0, 0.9999);
  for (double lat = -60; lat <= 80; lat += 10) {
    const GridPoint g = TM_GeographicToGrid(zone, Dms(lat), Dms(106, 15));
    EXPECT_EQ(g.easting, 500000.0) << lat;
    EXPECT_EQ(g.convergence, 0.0) << lat;
    EXPECT_EQ(g.scaleFactor, 0.9999) << lat;
  }
  EXPECT_NEAR(TM_GeographicToGrid(zone, Dms(31), Dms(106, 15)).northing, 1000.0, 1e-9);
}

TEST(TransverseMercator, SidesOfTheCentralMeridian) {
  const TmZone zone = NewMexicoCentral();
  // West-positive longitudes: a smaller value is east of the central meridian.
  const GridPoint east = TM_GeographicToGrid(zone, Dms(34), Dms(105));
  EXPECT_GT(east.easting, 500000.0);
  EXPECT_GT(east.convergence, 0.0);
  const GridPoint west = TM_GeographicToGrid(zone, Dms(34), Dms(107, 30));
  EXPECT_LT(west.easting, 500000.0);
  EXPECT_LT(west.convergence, 0.0);
  // Symmetry about the central meridian.
  EXPECT_NEAR(east.easting - 500000.0, 500000.0 - west.easting, 1e-6);
  EXPECT_NEAR(east.northing, west.northing, 1e-6);
  EXPECT_GT(east.scaleFactor, 0.9999);
}

TEST(TransverseMercator, LongitudesAcrossTheZeroMeridian) {
  // Central meridian 1 W; a point 1 E is kFullCircle - 1 degree west-positive.
  const TmZone nearZero =
      TM_SetZone(test::kGrs80A, test::kGrs80E, 0.0, Dms(1), 0.0, 500000.0, 0.9996);
  const GridPoint g = TM_GeographicToGrid(nearZero, Dms(50), kFullCircle - Dms(1));
  // The same geometry two degrees east of a central meridian at 99 W.
  const GridPoint expected = TM_GeographicToGrid(Utm14(), Dms(50), Dms(97));
  EXPECT_NEAR(g.easting, expected.easting, 1e-6);
  EXPECT_NEAR(g.northing, expected.northing, 1e-6);
  EXPECT_NEAR(g.convergence, expected.convergence, 1e-12);

  // The inverse stays in 0..2 pi.
  const GeographicPoint p = TM_GridToGeographic(nearZero, g.northing, g.easting);
  EXPECT_NEAR(p.lambda, kFullCircle - Dms(1), 1e-9);
}

// ---- NAD 27 (Clarke 1866, U.S. survey feet) ----

TEST(TransverseMercator27, AgreesWithRigorousClarke1866OverTheWholeZone) {
  // Rigorous Transverse Mercator on Clarke 1866 (PROJ 9.1 tmerc), feet. The
  // points far from the central meridian are where truncated foot-latitude
  // series drift by decimetres.
  struct Case {
    const char* where;
    double phi0, lambda0, k0;  // zone
    double lat, lon;           // degrees, west-positive
    double northing, easting;  // feet
  };
  const Case cases[] = {
      {"New Mexico Central", Dms(31), Dms(106, 15), 0.9999, 33, 106, 727597.2435, 576645.2201},
      {"Nevada West, Reno", Dms(34, 45), Dms(118, 35), 0.9999, 39.5, 119.8, 1731615.9958,
       156682.3493},
      {"Wyoming West Central, Yellowstone", Dms(40, 40), Dms(108, 45), 0.999941177, 44.5, 110.5,
       1401847.6477, 43396.5129},
      {"Alaska zone 4, Anchorage", Dms(54), Dms(150), 0.9999, 61 + 13 / 60.0, 149.9, 2636665.8876,
       517629.6503},
      {"Alaska zone 2", Dms(54), Dms(142), 0.9999, 69.5, 141.5, 5666758.8360, 564135.8995},
  };
  for (const Case& c : cases) {
    const Tm27Zone zone = TM27_SetZone(c.phi0, c.lambda0, 0.0, 500000.0, c.k0);
    const GridPoint g = TM27_GeographicToGrid(zone, Dms(c.lat), Dms(c.lon));
    EXPECT_NEAR(g.northing, c.northing, 0.003) << c.where;
    EXPECT_NEAR(g.easting, c.easting, 0.003) << c.where;
    const GeographicPoint p = TM27_GridToGeographic(zone, c.northing, c.easting);
    EXPECT_NEAR(p.phi, Dms(c.lat), 2e-10) << c.where;
    EXPECT_NEAR(p.lambda, Dms(c.lon), 2e-10) << c.where;
    EXPECT_NEAR(p.convergence, g.convergence, 1e-9) << c.where;
  }
}

TEST(TransverseMercator27, FalseNorthingIsApplied) {
  const Tm27Zone plain = TM27_SetZone(Dms(31), Dms(106, 15), 0.0, 500000.0, 0.9999);
  const Tm27Zone shifted = TM27_SetZone(Dms(31), Dms(106, 15), 10000.0, 500000.0, 0.9999);
  const GridPoint a = TM27_GeographicToGrid(plain, Dms(34), Dms(105, 30));
  const GridPoint b = TM27_GeographicToGrid(shifted, Dms(34), Dms(105, 30));
  EXPECT_NEAR(b.northing - a.northing, 10000.0, 1e-6);
  EXPECT_EQ(b.easting, a.easting);
  EXPECT_NEAR(TM27_GeographicToGrid(plain, Dms(31), Dms(106, 15)).northing, 0.0, 1e-6);
  const GeographicPoint p = TM27_GridToGeographic(shifted, b.northing, b.easting);
  EXPECT_NEAR(p.phi, Dms(34), 1e-9);
  EXPECT_NEAR(p.lambda, Dms(105, 30), 1e-9);
}

}  // namespace
}  // namespace zv
