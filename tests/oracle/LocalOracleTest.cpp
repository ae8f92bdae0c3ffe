// The localization tool's factors against PROJ's scale factor (proj_factors)
// and the elevation factor R / (R + h), R = sqrt(M N), worked out here from
// the meridian and prime vertical radii of GRS 80.

#include <gtest/gtest.h>

#include <cmath>

#include "EpsgZone.h"
#include "pintrel/Localizer.h"

namespace zv {
namespace {

TEST(LocalOracle, FactorsMatchProjAndTheElevationFormula) {
  struct Case {
    const char* zone;
    int epsg;
    double lat, lon, h;
  };
  const Case cases[] = {
      {"Alabama East 0101", 26929, 32.5, -85.9, 180.0},        // Transverse Mercator
      {"Wisconsin Central 4802", 2288, 44.51, -89.6, 302.99},  // Lambert, U.S. survey feet
      {"Alaska Zone 1 5001", 26931, 57.0, -134.0, 1500.0},     // oblique Mercator
  };
  const double a = 6378137.0, f = 1.0 / 298.257222101, e2 = f * (2.0 - f);
  for (const Case& c : cases) {
    test::EpsgZone epsg(c.epsg);
    ASSERT_TRUE(epsg.ok()) << c.zone;
    const PJ_XY grid = epsg.forward(c.lat, c.lon);
    const std::optional<local::PointFactors> got =
        local::FactorsAt(ZV_SOURCE_DIR "/appdata", "State Plane 1983", c.zone, grid.y, grid.x, c.h);
    ASSERT_TRUE(got.has_value()) << c.zone;
    const double phi = c.lat * M_PI / 180.0;
    EXPECT_NEAR(got->latitude, phi, 1e-9) << c.zone;
    EXPECT_NEAR(got->gridScale, epsg.factors(c.lat, c.lon).meridional_scale, 1e-9) << c.zone;

    const double w2 = 1.0 - e2 * std::sin(phi) * std::sin(phi);
    const double m = a * (1.0 - e2) / std::pow(w2, 1.5), n = a / std::sqrt(w2);
    const double r = std::sqrt(m * n);
    EXPECT_NEAR(got->elevationFactor, r / (r + c.h), 1e-12) << c.zone;
    EXPECT_DOUBLE_EQ(got->combined, got->gridScale * got->elevationFactor) << c.zone;
  }
}

}  // namespace
}  // namespace zv
