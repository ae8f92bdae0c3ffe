#pragma once
// The fixed Clarke 1866 table constants of the classical SPCS 27
// plane-coordinate formulas (U.S. Coast and Geodetic Survey projection
// tables) of the NAD 27 Lambert form.
// Arcs in seconds, lengths in U.S. survey feet unless noted.

#include <cmath>

namespace zv::nad27 {

inline constexpr double kE2 = 0.006768658;                 // e^2 of Clarke 1866
inline constexpr double kFeetPerSecond = 101.2794065;      // rectified meridian arc
inline constexpr double kSecondsPerFoot = 0.009873675553;  // 1 / 101.2794065
inline constexpr double kSemimajorFeet = 20925832.16;      // a of Clarke 1866, feet

// Seconds of rectified arc to subtract from phi'' (phi given by sin and cos):
// omega'' = phi'' - (1052.893882 - (4.483344 - 0.02352 cos^2) cos^2) sin cos.
inline double RectifyReduction(double s, double c) {
  const double c2 = c * c;
  return (1052.893882 - (4.483344 - 0.02352 * c2) * c2) * s * c;
}

// Seconds to add to the rectified arc omega (radians) to get the latitude:
// phi'' = omega'' + (1047.54671 + (6.19276 + 0.050912 cos^2) cos^2) sin cos.
inline double InverseReduction(double omega) {
  const double s = std::sin(omega);
  const double c = std::cos(omega);
  const double c2 = c * c;
  return (1047.54671 + (6.19276 + 0.050912 * c2) * c2) * s * c;
}

}  // namespace zv::nad27
