#pragma once
// Lambert conformal conic: two standard parallels (SPCS 83, meters), one
// standard parallel (polynomial form, meters) and the NAD 27 equations
// (Clarke 1866 arc constants, U.S. survey feet). Set-up returns the zone
// record; forward and inverse take it. Angles are radians, latitude
// north-positive, longitude west-positive.

#include "geodesy/ProjectionMath.h"

namespace zv {

// Shown by the caller when a two-parallel or NAD 27 set-up reports that the
// mapping radius does not compute (mappingRadiusOk false).
inline constexpr const char* kMappingRadiusMessage =
    "Error - Mapping Radius does not compute properly";

// "Lambert Conformal Conic - Two Parallels" (NOAA Manual NOS NGS 5,
// Stem 1990: Lambert mapping equations, two-parallel case).
struct Lambert2Zone {
  double a = 0.0, e = 0.0;
  double lambda0 = 0.0;  // central longitude, west-positive
  double Nb = 0.0;       // false northing at the base latitude, meters
  double Eb = 0.0;       // false easting, meters
  double sinPhi0 = 0.0;  // sin of the central parallel of the cone
  double K = 0.0;        // mapping radius at the equator
  double Rb = 0.0;       // mapping radius at the base latitude
  double R0 = 0.0;       // mapping radius at the central parallel
  double k0 = 0.0;       // scale factor at the central parallel
  double N0 = 0.0;       // northing of the central parallel on the central meridian
  // False when K computed from the two parallels disagrees (for example
  // equal parallels); the other members are then not filled.
  bool mappingRadiusOk = false;
};

Lambert2Zone Lambert2_SetZone(double phiS, double phiN, double phiB, double lambda0, double Nb,
                              double Eb, double a, double e);
GridPoint Lambert2_GeographicToGrid(const Lambert2Zone& zone, double phi, double lambda);
GeographicPoint Lambert2_GridToGeographic(const Lambert2Zone& zone, double northing,
                                          double easting);

// "Lambert Conformal Conic - One Parallel": polynomial form in the meridian
// distance from the standard parallel (NOAA Manual NOS NGS 5, one-parallel
// Lambert; meridian arc series of the same manual).
struct Lambert1Zone {
  double a = 0.0, e = 0.0;
  double ep2 = 0.0;                               // e'^2
  double phi0 = 0.0;                              // the standard parallel
  double lambda0 = 0.0;                           // central longitude, west-positive
  double N0 = 0.0;                                // false northing, meters
  double E0 = 0.0;                                // false easting, meters
  double k0 = 0.0;                                // scale factor on the standard parallel
  double nu0 = 0.0, rho0 = 0.0;                   // radii of curvature at phi0
  double R0 = 0.0;                                // mapping radius of phi0
  double A0 = 0.0, A2 = 0.0, A4 = 0.0, A6 = 0.0;  // meridian arc coefficients
  double M0 = 0.0;                                // meridian arc of phi0
  double sinPhi0 = 0.0;
  // Coefficients of s^3 .. s^7 in the series for u / k0 and of s^2 .. s^4
  // in k / k0 (s: meridian distance from phi0).
  double L3 = 0.0, L4 = 0.0, L5 = 0.0, L6 = 0.0, L7 = 0.0;
  double F2 = 0.0, F3 = 0.0, F4 = 0.0;
};

Lambert1Zone Lambert1_SetZone(double a, double e, double phi0, double lambda0, double N0, double E0,
                              double k0);
GridPoint Lambert1_GeographicToGrid(const Lambert1Zone& zone, double phi, double lambda);
GeographicPoint Lambert1_GridToGeographic(const Lambert1Zone& zone, double northing,
                                          double easting);
double Lambert1_ScaleFactor(const Lambert1Zone& zone, double phi);

// "Lambert Conformal Conic - NAD 27 Equations": the classical SPCS 27
// formulas. The cone comes from the zone's ellipsoid; the meridian distances
// use the Clarke 1866 table constants. Lengths in U.S. survey feet. The
// false northing Nb is added at the base latitude (zero for nearly every
// SPCS 27 zone).
struct Lambert27Zone {
  double a = 0.0, e = 0.0;
  double lambda0Seconds = 0.0;  // lambda0'', west-positive
  double Nb = 0.0;              // false northing, U.S. survey feet
  double E0 = 0.0;              // false easting, U.S. survey feet
  double sinPhi0 = 0.0;
  double R0 = 0.0;            // mapping radius of the central parallel, feet
  double Rb = 0.0;            // mapping radius of the base latitude, feet
  double k0 = 0.0;            // scale factor at the central parallel
  double M0 = 0.0, S0 = 0.0;  // rectified arc of phi0: whole minutes, seconds
  double C3 = 0.0, C4 = 0.0, C5 = 0.0;
  bool mappingRadiusOk = false;
};

Lambert27Zone Lambert27_SetZone(double phiS, double phiN, double phiB, double lambda0, double Nb,
                                double E0, double a, double e);
GridPoint Lambert27_GeographicToGrid(const Lambert27Zone& zone, double phi, double lambda);
GeographicPoint Lambert27_GridToGeographic(const Lambert27Zone& zone, double northing,
                                           double easting);

}  // namespace zv
