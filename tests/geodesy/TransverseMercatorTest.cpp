#include <gtest/gtest.h>

#include <cmath>

#include "geodesy/AlaskaZones.h"
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

// ---- NAD 27 equations ----

Tm27Zone NewMexicoCentral27(double falseNorthing = 0.0) {
  return TM27_SetZone(test::kClarke1866A, test::kClarke1866E, Dms(31), Dms(106, 15), falseNorthing,
                      500000.0, 0.9999);
}

TEST(TransverseMercator27, NearTheCentralMeridianAgreesWithRigorousClarke1866) {
  // Rigorous Transverse Mercator on Clarke 1866 (PROJ 9.1 tmerc), feet.
  const GridPoint g = TM27_GeographicToGrid(NewMexicoCentral27(), Dms(33), Dms(106));
  EXPECT_NEAR(g.easting, 576645.2201, 0.005);
  EXPECT_NEAR(g.northing, 727597.2435, 0.005);
}

TEST(TransverseMercator27, CentralMeridianAndOrigin) {
  const Tm27Zone zone = NewMexicoCentral27();
  for (double lat = 25; lat <= 45; lat += 5) {
    const GridPoint g = TM27_GeographicToGrid(zone, Dms(lat), Dms(106, 15));
    EXPECT_NEAR(g.easting, 500000.0, 1e-9) << lat;
    EXPECT_NEAR(g.convergence, 0.0, 1e-15) << lat;
    EXPECT_NEAR(g.scaleFactor, 0.9999, 1e-15) << lat;
  }
  EXPECT_NEAR(TM27_GeographicToGrid(zone, Dms(31), Dms(106, 15)).northing, 0.0, 1e-6);
}

TEST(TransverseMercator27, FalseNorthingIsApplied) {
  const Tm27Zone plain = NewMexicoCentral27();
  const Tm27Zone shifted = NewMexicoCentral27(10000.0);
  const GridPoint a = TM27_GeographicToGrid(plain, Dms(34), Dms(105, 30));
  const GridPoint b = TM27_GeographicToGrid(shifted, Dms(34), Dms(105, 30));
  EXPECT_NEAR(b.northing - a.northing, 10000.0, 1e-6);
  EXPECT_EQ(b.easting, a.easting);
  const GeographicPoint p = TM27_GridToGeographic(shifted, b.northing, b.easting);
  EXPECT_NEAR(p.phi, Dms(34), 1e-9);
  EXPECT_NEAR(p.lambda, Dms(105, 30), 1e-9);
}

// ---- Alaska zones 2 to 9 ----

TEST(AlaskaZones, AgreeWithRigorousClarke1866) {
  // Rigorous Transverse Mercator on Clarke 1866 (PROJ 9.1 tmerc), feet.
  const Ak27Zone zone4 = AK27_SetZone(Dms(150), 0.0, 500000.0);
  const GridPoint anchorage = AK27_GeographicToGrid(zone4, Dms(61, 13), Dms(149, 54));
  EXPECT_NEAR(anchorage.easting, 517629.6503, 0.003);
  EXPECT_NEAR(anchorage.northing, 2636665.8876, 0.003);
  EXPECT_NEAR(anchorage.scaleFactor, 0.99990035, 1e-8);
  EXPECT_NEAR(ArcSeconds(anchorage.convergence), 5 * 60 + 15.521, 0.001);

  const Ak27Zone zone2 = AK27_SetZone(Dms(142), 0.0, 500000.0);
  const GridPoint north = AK27_GeographicToGrid(zone2, Dms(69, 30), Dms(141, 30));
  EXPECT_NEAR(north.easting, 564135.8995, 0.003);
  EXPECT_NEAR(north.northing, 5666758.8360, 0.003);

  const GeographicPoint back = AK27_GridToGeographic(zone2, north.northing, north.easting);
  EXPECT_NEAR(back.phi, Dms(69, 30), 1e-10);
  EXPECT_NEAR(back.lambda, Dms(141, 30), 1e-10);
  EXPECT_NEAR(back.convergence, north.convergence, 1e-10);
}

TEST(AlaskaZones, RoutingRule) {
  const double a = test::kClarke1866A, e = test::kClarke1866E;
  for (int degrees = 142; degrees <= 170; degrees += 4) {
    EXPECT_TRUE(IsAlaska27Zone(a, e, Dms(54), Dms(degrees), 0.9999)) << degrees;
  }
  EXPECT_FALSE(IsAlaska27Zone(a, e, Dms(54), Dms(144), 0.9999));  // not a zone meridian
  EXPECT_FALSE(IsAlaska27Zone(a, e, Dms(54), Dms(174), 0.9999));  // beyond zone 9
  EXPECT_FALSE(IsAlaska27Zone(a, e, Dms(54), Dms(150), 0.9998));  // other scale
  EXPECT_FALSE(IsAlaska27Zone(a, e, Dms(55), Dms(150), 0.9999));  // other origin
  EXPECT_FALSE(IsAlaska27Zone(test::kGrs80A, test::kGrs80E, Dms(54), Dms(150), 0.9999));
  // The catalog's packed angle text (5 decimals of seconds) still matches.
  EXPECT_TRUE(IsAlaska27Zone(a, e, Dms(54, 0, 0.000004), Dms(150, 0, 0.000004), 0.9999));
}

}  // namespace
}  // namespace zv
