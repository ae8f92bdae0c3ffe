#pragma once
// Helpers for the projection tests: degrees-minutes-seconds to radians and
// the two ellipsoids of the published values.

#include <cmath>

namespace zv::test {

inline constexpr double kRadiansPerDegree = 3.14159265358979323846 / 180.0;

// Degrees, minutes, seconds to radians (all parts of the same sign).
inline double Dms(double degrees, double minutes = 0.0, double seconds = 0.0) {
  return (degrees + minutes / 60.0 + seconds / 3600.0) * kRadiansPerDegree;
}

// Radians to arc seconds.
inline double ArcSeconds(double radians) {
  return radians / kRadiansPerDegree * 3600.0;
}

inline constexpr double kGrs80A = 6378137.0;
inline const double kGrs80E =
    std::sqrt(2.0 / 298.257222101 - 1.0 / (298.257222101 * 298.257222101));
inline constexpr double kClarke1866A = 6378206.4;
inline constexpr double kClarke1866E = 0.08227185422300323;

}  // namespace zv::test
