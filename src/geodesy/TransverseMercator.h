#pragma once
// Transverse Mercator: the SPCS 83 form for any ellipsoid (meters) and the
// NAD 27 equations for Clarke 1866 (U.S. survey feet, arcs in seconds).
// Set-up returns the zone record; the forward and inverse routines take it.
// Angles are radians, latitude north-positive, longitude west-positive.

#include "geodesy/ProjectionMath.h"

namespace zv {

// "Transverse Mercator" (NOAA Manual NOS NGS 5, Stem 1990: TM mapping
// equations with the rectifying-latitude series in n).
struct TmZone {
  double a = 0.0;                                 // semimajor axis, meters
  double e = 0.0;                                 // first eccentricity
  double ep2 = 0.0;                               // e'^2 = e^2 / (1 - e^2)
  double phi0 = 0.0;                              // central latitude
  double lambda0 = 0.0;                           // central longitude, west-positive
  double N0 = 0.0;                                // false northing, meters
  double E0 = 0.0;                                // false easting, meters
  double k0 = 0.0;                                // scale factor on the central meridian
  double r = 0.0;                                 // radius of the rectifying sphere
  double u0 = 0.0, u2 = 0.0, u4 = 0.0, u6 = 0.0;  // geodetic to rectifying latitude
  double v0 = 0.0, v2 = 0.0, v4 = 0.0, v6 = 0.0;  // rectifying to footpoint latitude
  double S0 = 0.0;                                // scaled meridian arc of phi0
};

TmZone TM_SetZone(double a, double e, double phi0, double lambda0, double N0, double E0, double k0);
GridPoint TM_GeographicToGrid(const TmZone& zone, double phi, double lambda);
GeographicPoint TM_GridToGeographic(const TmZone& zone, double northing, double easting);

// "Transverse Mercator - NAD 27 Equations": the classical SPCS 27
// plane-coordinate formulas with the fixed Clarke 1866 table constants.
// Northing and easting in U.S. survey feet. The false northing is added to
// the northing (zero for every SPCS 27 zone).
struct Tm27Zone {
  double a = 0.0;  // meters, for the radii rho0 and nu0 only
  double e = 0.0;
  double lambda0Seconds = 0.0;  // lambda0'', west-positive
  double N0 = 0.0;              // false northing, U.S. survey feet
  double E0 = 0.0;              // false easting, U.S. survey feet
  double k0 = 0.0;
  double M0 = 0.0;  // rectified arc of phi0: whole minutes
  double S0 = 0.0;  // ... and the remaining seconds
  double C = 0.0;   // cubic easting coefficient
};

Tm27Zone TM27_SetZone(double a, double e, double phi0, double lambda0, double N0, double E0,
                      double k0);
GridPoint TM27_GeographicToGrid(const Tm27Zone& zone, double phi, double lambda);
GeographicPoint TM27_GridToGeographic(const Tm27Zone& zone, double northing, double easting);
double TM27_ScaleFactor(const Tm27Zone& zone, double phi, double easting);

}  // namespace zv
