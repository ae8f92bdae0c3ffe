#pragma once
// Hotine oblique Mercator ("Oblique Mercator - Hotine"), u measured from the
// natural origin (EPSG variant A), as for Alaska zone 1 (NOAA Manual NOS
// NGS 5, Stem 1990: oblique Mercator mapping equations). Meters. Angles are
// radians, latitude north-positive, longitude west-positive.

#include "geodesy/ProjectionMath.h"

namespace zv {

struct OmZone {
  double a = 0.0, e = 0.0;
  double ep2 = 0.0;                               // e'^2
  double d0 = 0.0, d2 = 0.0, d4 = 0.0, d6 = 0.0;  // conformal to geodetic latitude
  double B = 0.0, A = 0.0, C = 0.0;
  double AkcOverB = 0.0;  // A kc / B
  double AkcOverA = 0.0;  // A kc / a
  double lambda0 = 0.0;   // longitude of the origin, west-positive
  double sinGamma0 = 0.0, cosGamma0 = 0.0;
  double N0 = 0.0, E0 = 0.0;  // false northing and easting, meters
  double alphaC = 0.0;        // azimuth of the central line
  double sinAlphaC = 0.0, cosAlphaC = 0.0;
};

OmZone OM_SetZone(double a, double e, double phiC, double lambdaC, double N0, double E0, double kc,
                  double alphaC);
GridPoint OM_GeographicToGrid(const OmZone& zone, double phi, double lambda);
GeographicPoint OM_GridToGeographic(const OmZone& zone, double northing, double easting);

}  // namespace zv
