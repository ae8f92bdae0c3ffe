#include <gtest/gtest.h>

#include <cmath>

#include "geodesy/ObliqueMercator.h"
#include "geodesy/ProjectionTestSupport.h"

namespace zv {
namespace {

using test::ArcSeconds;
using test::Dms;

// Alaska zone 1 of SPCS 83: azimuth atan(-3/4), as 323 07 48.36847.
OmZone AlaskaZone1(double azimuth = kFullCircle + std::atan(-0.75)) {
  return OM_SetZone(test::kGrs80A, test::kGrs80E, Dms(57), Dms(133, 40), -5000000.0, 5000000.0,
                    0.9999, azimuth);
}

TEST(ObliqueMercator, CentreOfAlaskaZone1) {
  // u is measured from the natural origin: the centre is not the false origin.
  const GridPoint g = OM_GeographicToGrid(AlaskaZone1(), Dms(57), Dms(133, 40));
  EXPECT_NEAR(g.easting, 818676.734, 0.001);
  EXPECT_NEAR(g.northing, 575097.689, 0.001);
  EXPECT_NEAR(g.scaleFactor, 0.9999, 1e-12);
  EXPECT_NEAR(g.convergence, 0.0, 1e-9);
}

TEST(ObliqueMercator, AgreesWithRigorousValuesAwayFromTheCentre) {
  // PROJ 9.1 omerc (variant A, no_uoff) at Juneau.
  const GridPoint g = OM_GeographicToGrid(AlaskaZone1(), Dms(58, 18), Dms(134, 24));
  EXPECT_NEAR(g.easting, 775672.4612, 0.001);
  EXPECT_NEAR(g.northing, 720098.3293, 0.001);
  EXPECT_NEAR(g.scaleFactor, 0.99993389, 1e-8);
  EXPECT_NEAR(ArcSeconds(g.convergence), -(36 * 60 + 51.552), 0.001);
}

TEST(ObliqueMercator, AzimuthAsNegativeOrFullCircleAngleGivesTheSameResults) {
  // The convergence stays within half a turn whichever form the azimuth has.
  const OmZone positive = AlaskaZone1();
  const OmZone negative = AlaskaZone1(std::atan(-0.75));
  for (double lat = 54; lat <= 60; lat += 2) {
    for (double lon = 130; lon <= 141; lon += 3) {
      const GridPoint a = OM_GeographicToGrid(positive, Dms(lat), Dms(lon));
      const GridPoint b = OM_GeographicToGrid(negative, Dms(lat), Dms(lon));
      EXPECT_NEAR(a.northing, b.northing, 1e-6);
      EXPECT_NEAR(a.easting, b.easting, 1e-6);
      EXPECT_NEAR(a.convergence, b.convergence, 1e-12);
      EXPECT_LT(std::fabs(a.convergence), 0.5);
    }
  }
}

}  // namespace
}  // namespace zv
