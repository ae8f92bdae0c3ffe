#pragma once
// Results of the projection routines and the small math functions the forms
// share. Angles are radians, latitude north-positive, longitude west-positive
// (0 to 2 pi); convergence is positive east of the central meridian.

#include <cmath>

#include "geodesy/Angles.h"

namespace zv {

// Result of a forward (geographic to grid) computation.
struct GridPoint {
  double northing = 0.0;
  double easting = 0.0;
  double convergence = 0.0;
  double scaleFactor = 0.0;
};

// Result of an inverse (grid to geographic) computation.
struct GeographicPoint {
  double phi = 0.0;
  double lambda = 0.0;
  double convergence = 0.0;
  double scaleFactor = 0.0;
};

// Seconds of arc per radian and radians per second of arc (the NAD 27 forms).
inline constexpr double kSecondsPerRadian = 206264.80624709657;
inline constexpr double kRadiansPerSecond = 4.848136811095355e-06;
// Meters to U.S. survey feet (3937/1200).
inline constexpr double kMetersToUsFeet = 3.2808333333333333;

// arcsin as atan(x / sqrt(1 - x^2)); pi/2 with the sign of x when |x| = 1.
inline double Math_ArcSin(double x) {
  if (std::fabs(x) == 1.0) return std::copysign(2.0 * std::atan(1.0), x);
  return std::atan(x / std::sqrt(1.0 - x * x));
}
inline double Math_Sinh(double x) {
  return (std::exp(x) - std::exp(-x)) / 2.0;
}
inline double Math_Cosh(double x) {
  return (std::exp(x) + std::exp(-x)) / 2.0;
}
inline double Math_ArcCosh(double x) {
  return std::log(x + std::sqrt(x * x - 1.0));
}

// Isometric latitude q of phi on the ellipsoid of first eccentricity e.
inline double Lambert_IsometricLatitude(double phi, double e) {
  const double s = std::sin(phi);
  return (std::log((1.0 + s) / (1.0 - s)) - e * std::log((1.0 + e * s) / (1.0 - e * s))) / 2.0;
}

// w = sqrt(1 - e^2 sin^2 phi).
inline double Lambert_W(double phi, double e) {
  const double s = std::sin(phi);
  return std::sqrt(1.0 - e * e * s * s);
}

// An angle brought into -pi..pi. Longitude differences go through it so that
// zones near the 0/360 degree meridian and east-positive inputs given as
// negative west longitudes still compute on the near side of the central
// meridian.
inline double ReduceAngle(double d) {
  if (d > kPi) return d - kFullCircle * std::floor((d + kPi) / kFullCircle);
  if (d < -kPi) return d + kFullCircle * std::floor((kPi - d) / kFullCircle);
  return d;
}

// The same reduction for a difference in seconds of arc (-648000..648000).
inline double ReduceSecondsDifference(double d) {
  if (d > 648000.0) return d - 1296000.0 * std::floor((d + 648000.0) / 1296000.0);
  if (d < -648000.0) return d + 1296000.0 * std::floor((648000.0 - d) / 1296000.0);
  return d;
}

// A west-positive longitude result brought into 0..2 pi.
inline double NormalizeWestLongitude(double lambda) {
  if (lambda < 0.0 || lambda > kFullCircle)
    lambda -= kFullCircle * std::floor(lambda / kFullCircle);
  return lambda;
}

}  // namespace zv
