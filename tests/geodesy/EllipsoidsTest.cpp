#include <gtest/gtest.h>

#include <cmath>
#include <functional>

#include "geodesy/Ellipsoids.h"
#include "platform/Error.h"

namespace zv {
namespace {

constexpr double kA = 6378137.0;  // GRS 80
constexpr double kB = 6356752.314140356;
constexpr double kF = 1 / 298.257222101;

// The error a call throws (number 0 when it throws none).
ZvError Thrown(const std::function<void()>& fn) {
  try {
    fn();
  } catch (const ZvError& e) {
    return e;
  }
  return ZvError(0, "", "");
}

TEST(Ellipsoids, EveryPairCompletesTheEllipsoid) {
  const double e = std::sqrt(2 * kF - kF * kF);
  struct Case {
    double a, b, f, e;
  };
  // Any two of a, b, f, e; all four given: a and b win.
  for (Case c : {Case{kA, kB, -1, -1}, Case{kA, -1, kF, -1}, Case{kA, -1, -1, e},
                 Case{-1, kB, kF, -1}, Case{-1, kB, -1, e}, Case{kA, kB, 0.5, 0.5}}) {
    Ellipsoids_GET_Parameters(c.a, c.b, c.f, c.e);
    EXPECT_NEAR(c.a, kA, 1e-6);
    EXPECT_NEAR(c.b, kB, 1e-6);
    EXPECT_NEAR(c.f, kF, 1e-15);
    EXPECT_NEAR(c.e, e, 1e-15);
  }
  EXPECT_EQ(Ellipsoids_GET_fab(6371000, 6371000), 0);  // a sphere
  EXPECT_EQ(Ellipsoids_GET_eab(6371000, 6371000), 0);
}

TEST(Ellipsoids, FailuresLeaveValuesAndCarryTheirTexts) {
  const std::string check = "  Check the other ellipsoid parameters.";
  double a = 6356752.0, b = kA, f = -1, e = -1;
  const struct {
    std::function<void()> call;
    int number;
    std::string source, description;
  } cases[] = {
      {[&] { Ellipsoids_GET_Parameters(a, b, f, e); }, 1, "Ellipsoids_GET_fab",
       "Can not compute the Ellipsoid Flattening. The Semimajor Axis must be greater than the "
       "Semiminor Axis."},
      {[] { Ellipsoids_GET_eab(1, 2); }, 1, "Ellipsoids_GET_eab",
       "Can not compute the Ellipsoid Eccentricity. The Semimajor Axis must be greater than the "
       "Semiminor Axis."},
      {[] { Ellipsoids_GET_abf(kB, -0.01); }, 1, "Ellipsoids_GET_abf",
       "The computed Ellipsoid Semimajor Axis is less than the Semiminor Axis." + check},
      {[] {
         double a = -1, b = -1, f = 0.003, e = 0.08;
         Ellipsoids_GET_Parameters(a, b, f, e);
       },
       1, "Ellipsoids_GET_Parameters",
       "Can not compute ellipsoid parameters. Two ellipsoidal parameters are required in any "
       "combination other than Flattening and Eccentricity."},
      // Values that would store NaN or infinity are arithmetic errors.
      {[] { Ellipsoids_GET_bae(kA, 1.5); }, 5, "", ""},
      {[] { Ellipsoids_GET_fe(1.5); }, 5, "", ""},
      {[] { Ellipsoids_GET_abe(kB, 1); }, 11, "", ""},
      {[] { Ellipsoids_GET_abf(kB, 1); }, 11, "", ""},
  };
  for (const auto& c : cases) {
    const ZvError err = Thrown(c.call);
    EXPECT_EQ(err.number(), c.number) << c.source;
    if (c.source.empty()) continue;
    EXPECT_EQ(err.source(), "modEllipsoids." + c.source);
    EXPECT_EQ(err.description(), c.description);
  }
  EXPECT_EQ(f, -1);
  EXPECT_EQ(e, -1);

  // A negative flattening (an inverse flattening typed negative), and one
  // above 1: b and e stay unset.
  for (double flattening : {-kF, 2.5}) {
    a = kA, b = -1, f = flattening, e = -1;
    const ZvError err = Thrown([&] { Ellipsoids_GET_Parameters(a, b, f, e); });
    EXPECT_EQ(err.source(), flattening < 0 ? "modEllipsoids.Ellipsoids_GET_baf"
                                           : "modEllipsoids.Ellipsoids_GET_ef");
    EXPECT_EQ(b, -1);
    EXPECT_EQ(e, -1);
  }
  EXPECT_EQ(Thrown([] {
              double a = kA, b = -1, f = -kF, e = -1;
              Ellipsoids_GET_Parameters(a, b, f, e);
            }).description(),
            "The computed Ellipsoid Semiminor Axis is greater than the Semimajor Axis." + check);
}

}  // namespace
}  // namespace zv
