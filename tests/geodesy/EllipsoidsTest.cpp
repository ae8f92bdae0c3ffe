#include <gtest/gtest.h>

#include <cmath>
#include <functional>

#include "geodesy/Ellipsoids.h"
#include "platform/Error.h"

namespace zv {
namespace {

constexpr double kA = 6378137.0;  // GRS 80
constexpr double kInvF = 298.257222101;
constexpr double kB = 6356752.314140356;

// The error a call throws (number 0 when it throws none).
ZvError Thrown(const std::function<void()>& fn) {
  try {
    fn();
  } catch (const ZvError& e) {
    return e;
  }
  return ZvError(0, "", "");
}

TEST(Ellipsoids, EveryPairCompletesGrs80) {
  const double f = 1 / kInvF;
  const double e = std::sqrt(2 * f - f * f);
  struct Case {
    double a, b, f, e;
  };
  const Case cases[] = {
      {kA, kB, -1, -1}, {kA, -1, f, -1}, {kA, -1, -1, e}, {-1, kB, f, -1}, {-1, kB, -1, e}};
  for (Case c : cases) {
    Ellipsoids_GET_Parameters(c.a, c.b, c.f, c.e);
    EXPECT_NEAR(c.a, kA, 1e-6);
    EXPECT_NEAR(c.b, kB, 1e-6);
    EXPECT_NEAR(c.f, f, 1e-15);
    EXPECT_NEAR(c.e, e, 1e-15);
  }
}

TEST(Ellipsoids, DerivedEccentricityAgreesBothWays) {
  double f = 1 / 294.978698213898;  // Clarke 1866
  double a = 6378206.4, b = -1, e = -1;
  Ellipsoids_GET_Parameters(a, b, f, e);
  EXPECT_NEAR(Ellipsoids_GET_eab(a, b), e, 1e-15);
  EXPECT_NEAR(b, 6356583.8, 1e-4);
}

TEST(Ellipsoids, SphereGivesZeroWithoutError) {
  EXPECT_EQ(Ellipsoids_GET_fab(6371000, 6371000), 0);
  EXPECT_EQ(Ellipsoids_GET_eab(6371000, 6371000), 0);
}

TEST(Ellipsoids, AllFourGivenAxesWin) {
  double a = kA, b = kB, f = 0.5, e = 0.5;
  Ellipsoids_GET_Parameters(a, b, f, e);
  EXPECT_NEAR(f, 1 / kInvF, 1e-15);
}

TEST(Ellipsoids, FailuresLeaveValuesAndCarryTheirTexts) {
  double a = 6356752.0, b = 6378137.0, f = -1, e = -1;
  ZvError err = Thrown([&] { Ellipsoids_GET_Parameters(a, b, f, e); });
  EXPECT_EQ(err.number(), 1);
  EXPECT_EQ(err.description(),
            "Can not compute the Ellipsoid Flattening. The Semimajor Axis must be greater than the "
            "Semiminor Axis.");
  EXPECT_EQ(err.source(), "modEllipsoids.Ellipsoids_GET_fab");
  EXPECT_EQ(f, -1);
  EXPECT_EQ(e, -1);

  err = Thrown([] { Ellipsoids_GET_eab(1, 2); });
  EXPECT_EQ(err.description(),
            "Can not compute the Ellipsoid Eccentricity. The Semimajor Axis must be greater than "
            "the Semiminor Axis.");
  EXPECT_EQ(err.source(), "modEllipsoids.Ellipsoids_GET_eab");

  // A negative flattening (an inverse flattening typed negative).
  a = kA, b = -1, f = -1 / kInvF, e = -1;
  err = Thrown([&] { Ellipsoids_GET_Parameters(a, b, f, e); });
  EXPECT_EQ(err.source(), "modEllipsoids.Ellipsoids_GET_baf");
  EXPECT_EQ(err.description(),
            "The computed Ellipsoid Semiminor Axis is greater than the Semimajor Axis.  Check the "
            "other ellipsoid parameters.");
  EXPECT_EQ(b, -1);
  EXPECT_EQ(e, -1);

  err = Thrown([] { Ellipsoids_GET_abf(kB, -0.01); });
  EXPECT_EQ(err.source(), "modEllipsoids.Ellipsoids_GET_abf");
  EXPECT_EQ(err.description(),
            "The computed Ellipsoid Semimajor Axis is less than the Semiminor Axis.  Check the "
            "other ellipsoid parameters.");
}

TEST(Ellipsoids, OnlyFlatteningAndEccentricityIsRefused) {
  double a = -1, b = -1, f = 0.003, e = 0.08;
  ZvError err = Thrown([&] { Ellipsoids_GET_Parameters(a, b, f, e); });
  EXPECT_EQ(err.number(), 1);
  EXPECT_EQ(err.description(),
            "Can not compute ellipsoid parameters. Two ellipsoidal parameters are required in any "
            "combination other than Flattening and Eccentricity.");
  EXPECT_EQ(err.source(), "modEllipsoids.Ellipsoids_GET_Parameters");
}

TEST(Ellipsoids, ImpossibleValuesAreArithmeticErrorsNotNaN) {
  // Eccentricity above 1 or flattening of 1 would store NaN or infinity.
  EXPECT_EQ(Thrown([] { Ellipsoids_GET_bae(kA, 1.5); }).number(), 5);
  EXPECT_EQ(Thrown([] { Ellipsoids_GET_fe(1.5); }).number(), 5);
  EXPECT_EQ(Thrown([] { Ellipsoids_GET_ef(2.5); }).number(), 5);
  EXPECT_EQ(Thrown([] { Ellipsoids_GET_abe(kB, 1); }).number(), 11);
  EXPECT_EQ(Thrown([] { Ellipsoids_GET_abf(kB, 1); }).number(), 11);
  double a = kA, b = -1, f = 2.5, e = -1;
  EXPECT_EQ(Thrown([&] { Ellipsoids_GET_Parameters(a, b, f, e); }).source(),
            "modEllipsoids.Ellipsoids_GET_ef");
  EXPECT_EQ(b, -1);
}

}  // namespace
}  // namespace zv
