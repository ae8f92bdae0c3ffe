#pragma once
// Alaska zones 2 to 9 of SPCS 27: Transverse Mercator on the Clarke 1866
// ellipsoid, scale factor 0.9999 on the central meridian, origin latitude
// 54 N, central meridians 142 W to 170 W every 4 degrees, U.S. survey feet.
//
// The classical NAD 27 equations with the lower-48 table constants lose
// accuracy at these latitudes, so these zones are computed with the full
// Transverse Mercator series (NOAA Manual NOS NGS 5) on Clarke 1866 in
// meters and expressed in U.S. survey feet (3937/1200 exactly). This agrees
// with a rigorous Clarke 1866 computation to well under a millimetre.
//
// Routing rule (IsAlaska27Zone): a "Transverse Mercator - NAD 27 Equations"
// zone goes to these routines when its ellipsoid is Clarke 1866
// (a = 6378206.4 m, e = 0.0822718542), its central latitude is 54 N, its
// central meridian is one of 142, 146, 150, 154, 158, 162, 166 or 170 W and
// its scale factor is 0.9999 (angles within 1e-8 rad, a within 1 mm,
// e within 1e-9, k0 within 1e-10). Every other NAD 27 Transverse Mercator
// zone uses TM27_*.

#include "geodesy/ProjectionMath.h"
#include "geodesy/TransverseMercator.h"

namespace zv {

struct Ak27Zone {
  TmZone tm;        // the zone in meters on Clarke 1866
  double N0 = 0.0;  // false northing, U.S. survey feet
  double E0 = 0.0;  // false easting, U.S. survey feet
};

// a and e of the zone's ellipsoid, phi0 and lambda0 in radians (west-positive).
bool IsAlaska27Zone(double a, double e, double phi0, double lambda0, double k0);

// lambda0 west-positive radians; false northing and easting in U.S. survey feet.
Ak27Zone AK27_SetZone(double lambda0, double N0, double E0);
GridPoint AK27_GeographicToGrid(const Ak27Zone& zone, double phi, double lambda);
GeographicPoint AK27_GridToGeographic(const Ak27Zone& zone, double northing, double easting);

}  // namespace zv
