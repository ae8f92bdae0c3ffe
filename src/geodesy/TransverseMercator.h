#pragma once
// Transverse Mercator: the SPCS 83 form for any ellipsoid (meters) and the
// NAD 27 form, the same on Clarke 1866 in U.S. survey feet.
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

// "Transverse Mercator - NAD 27 Equations" (the SPCS 27 zones, the Alaska
// zones 2 to 9 among them): the Transverse Mercator above on the Clarke 1866
// ellipsoid, fixed whatever the zone's ellipsoid, in meters and expressed in
// U.S. survey feet (3937/1200 exactly). This agrees with a rigorous Clarke
// 1866 computation within 0.6 mm over every zone's area of use, 4.8 degrees
// from the central meridian at the most. (The classical plane-coordinate
// equations carry the latitude of the foot of the perpendicular to second
// order only and drift with the fourth power of the distance from the central
// meridian: 24 mm at one degree, decimetres at the edges of the wider zones.)
struct Tm27Zone {
  TmZone tm;        // the zone in meters on Clarke 1866, false origin zero
  double N0 = 0.0;  // false northing, U.S. survey feet
  double E0 = 0.0;  // false easting, U.S. survey feet
};

// phi0 and lambda0 in radians (west-positive); false northing and easting in
// U.S. survey feet.
Tm27Zone TM27_SetZone(double phi0, double lambda0, double N0, double E0, double k0);
GridPoint TM27_GeographicToGrid(const Tm27Zone& zone, double phi, double lambda);
GeographicPoint TM27_GridToGeographic(const Tm27Zone& zone, double northing, double easting);

}  // namespace zv
