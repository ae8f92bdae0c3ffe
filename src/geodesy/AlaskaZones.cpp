#include "geodesy/AlaskaZones.h"

#include <cmath>

namespace zv {

namespace {

constexpr double kClarke1866A = 6378206.4;
constexpr double kClarke1866E = 0.08227185422300323;  // sqrt(a^2 - b^2) / a, b = 6356583.8
constexpr double kAlaskaK0 = 0.9999;
constexpr double kAlaskaPhi0Degrees = 54.0;
constexpr double kUsFeetToMeters = 0.3048006096012192;  // 1200/3937

}  // namespace

bool IsAlaska27Zone(double a, double e, double phi0, double lambda0, double k0) {
  constexpr double kAngleTolerance = 1e-8;
  if (std::fabs(a - kClarke1866A) > 1e-3 || std::fabs(e - kClarke1866E) > 1e-9) return false;
  if (std::fabs(k0 - kAlaskaK0) > 1e-10) return false;
  if (std::fabs(phi0 - kAlaskaPhi0Degrees * kDegreesToRadians) > kAngleTolerance) return false;
  for (int degrees = 142; degrees <= 170; degrees += 4) {
    if (std::fabs(lambda0 - degrees * kDegreesToRadians) <= kAngleTolerance) return true;
  }
  return false;
}

Ak27Zone AK27_SetZone(double lambda0, double N0, double E0) {
  Ak27Zone z;
  z.N0 = N0;
  z.E0 = E0;
  z.tm = TM_SetZone(kClarke1866A, kClarke1866E, kAlaskaPhi0Degrees * kDegreesToRadians, lambda0,
                    0.0, 0.0, kAlaskaK0);
  return z;
}

GridPoint AK27_GeographicToGrid(const Ak27Zone& z, double phi, double lambda) {
  GridPoint g = TM_GeographicToGrid(z.tm, phi, lambda);
  g.northing = g.northing * kMetersToUsFeet + z.N0;
  g.easting = g.easting * kMetersToUsFeet + z.E0;
  return g;
}

GeographicPoint AK27_GridToGeographic(const Ak27Zone& z, double northing, double easting) {
  return TM_GridToGeographic(z.tm, (northing - z.N0) * kUsFeetToMeters,
                             (easting - z.E0) * kUsFeetToMeters);
}

}  // namespace zv
