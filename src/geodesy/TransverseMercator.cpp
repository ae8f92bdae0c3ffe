#include "geodesy/TransverseMercator.h"

#include <cmath>

namespace zv {

// ---- Transverse Mercator (NOAA Manual NOS NGS 5, TM equations) ----

TmZone TM_SetZone(double a, double e, double phi0, double lambda0, double N0, double E0,
                  double k0) {
  TmZone z;
  z.a = a;
  z.e = e;
  z.phi0 = phi0;
  z.lambda0 = lambda0;
  z.N0 = N0;
  z.E0 = E0;
  z.k0 = k0;
  const double e2 = e * e;
  z.ep2 = e2 / (1.0 - e2);

  const double root = std::sqrt(1.0 - e2);
  const double n = (1.0 - root) / (1.0 + root);
  const double n2 = n * n;
  const double n3 = n2 * n;
  const double n4 = n3 * n;
  z.r = a * (1.0 - n) * (1.0 - n2) * (1.0 + 9.0 * n2 / 4.0 + 225.0 * n4 / 64.0);

  const double U0 = -3.0 * n / 2.0 + 9.0 * n3 / 16.0;
  const double U2 = 15.0 * n2 / 16.0 - 15.0 * n4 / 32.0;
  const double U4 = -35.0 * n3 / 48.0;
  const double U6 = 315.0 * n4 / 512.0;
  z.u0 = 2.0 * (U0 - 2.0 * U2 + 3.0 * U4 - 4.0 * U6);
  z.u2 = 8.0 * (U2 - 4.0 * U4 + 10.0 * U6);
  z.u4 = 32.0 * (U4 - 6.0 * U6);
  z.u6 = 128.0 * U6;

  const double V0 = 3.0 * n / 2.0 - 27.0 * n3 / 32.0;
  const double V2 = 21.0 * n2 / 16.0 - 55.0 * n4 / 32.0;
  const double V4 = 151.0 * n3 / 96.0;
  const double V6 = 1097.0 * n4 / 512.0;
  z.v0 = 2.0 * (V0 - 2.0 * V2 + 3.0 * V4 - 4.0 * V6);
  z.v2 = 8.0 * (V2 - 4.0 * V4 + 10.0 * V6);
  z.v4 = 32.0 * (V4 - 6.0 * V6);
  z.v6 = 128.0 * V6;

  const double s = std::sin(phi0);
  const double c = std::cos(phi0);
  const double c2 = c * c;
  const double omega0 = phi0 + s * c * (z.u0 + c2 * (z.u2 + c2 * (z.u4 + c2 * z.u6)));
  z.S0 = k0 * omega0 * z.r;
  return z;
}

GridPoint TM_GeographicToGrid(const TmZone& z, double phi, double lambda) {
  const double s = std::sin(phi);
  const double c = std::cos(phi);
  const double c2 = c * c;

  // Rectifying latitude and scaled meridian arc.
  const double omega = phi + s * c * (z.u0 + c2 * (z.u2 + c2 * (z.u4 + c2 * z.u6)));
  const double S = z.k0 * omega * z.r;
  const double R = z.k0 * z.a / std::sqrt(1.0 - z.e * z.e * s * s);
  const double L = ReduceAngle(lambda - z.lambda0) * c;  // positive west
  const double t = s / c;
  const double t2 = t * t;
  const double t4 = t2 * t2;
  const double eta2 = z.ep2 * c2;

  const double A1 = -R;
  const double A2 = R * t / 2.0;
  const double A3 = (1.0 - t2 + eta2) / 6.0;
  const double A4 = (5.0 - t2 + eta2 * (9.0 + 4.0 * eta2)) / 12.0;
  const double A5 = (5.0 - 18.0 * t2 + t4 + eta2 * (14.0 - 58.0 * t2)) / 120.0;
  const double A6 = (61.0 - 58.0 * t2 + t4 + eta2 * (270.0 - 330.0 * t2)) / 360.0;
  const double A7 = (61.0 - 479.0 * t2 + 179.0 * t4 - t4 * t2) / 5040.0;
  const double L2 = L * L;

  GridPoint g;
  g.northing = S - z.S0 + z.N0 + A2 * L2 * (1.0 + L2 * (A4 + A6 * L2));
  g.easting = z.E0 + A1 * L * (1.0 + L2 * (A3 + L2 * (A5 + A7 * L2)));

  const double C1 = -t;
  const double C3 = (1.0 + 3.0 * eta2 + 2.0 * eta2 * eta2) / 3.0;
  const double C5 = (2.0 - t2) / 15.0;
  g.convergence = C1 * L * (1.0 + L2 * (C3 + C5 * L2));

  const double F2 = (1.0 + eta2) / 2.0;
  const double F4 = (5.0 - 4.0 * t2 + eta2 * (9.0 - 24.0 * t2)) / 12.0;
  g.scaleFactor = z.k0 * (1.0 + F2 * L2 * (1.0 + F4 * L2));
  return g;
}

GeographicPoint TM_GridToGeographic(const TmZone& z, double northing, double easting) {
  // Footpoint latitude from the rectifying latitude.
  const double omega = (northing - z.N0 + z.S0) / (z.k0 * z.r);
  const double so = std::sin(omega);
  const double co = std::cos(omega);
  const double co2 = co * co;
  const double phif = omega + so * co * (z.v0 + co2 * (z.v2 + co2 * (z.v4 + co2 * z.v6)));

  const double sf = std::sin(phif);
  const double cf = std::cos(phif);
  const double Rf = z.k0 * z.a / std::sqrt(1.0 - z.e * z.e * sf * sf);
  const double Q = (easting - z.E0) / Rf;
  const double Q2 = Q * Q;
  const double tf = sf / cf;
  const double tf2 = tf * tf;
  const double tf4 = tf2 * tf2;
  const double etaf2 = z.ep2 * cf * cf;

  const double B2 = -tf * (1.0 + etaf2) / 2.0;
  const double B4 = -(5.0 + 3.0 * tf2 + etaf2 * (1.0 - 9.0 * tf2) - 4.0 * etaf2 * etaf2) / 12.0;
  const double B6 =
      (61.0 + 90.0 * tf2 + 45.0 * tf4 + etaf2 * (46.0 - 252.0 * tf2 - 90.0 * tf4)) / 360.0;
  const double B3 = -(1.0 + 2.0 * tf2 + etaf2) / 6.0;
  const double B5 = (5.0 + 28.0 * tf2 + 24.0 * tf4 + etaf2 * (6.0 + 8.0 * tf2)) / 120.0;
  const double B7 = -(61.0 + 662.0 * tf2 + 1320.0 * tf4 + 720.0 * tf4 * tf2) / 5040.0;

  GeographicPoint p;
  p.phi = phif + B2 * Q2 * (1.0 + Q2 * (B4 + B6 * Q2));
  const double L = Q * (1.0 + Q2 * (B3 + Q2 * (B5 + B7 * Q2)));
  p.lambda = NormalizeWestLongitude(z.lambda0 - L / cf);

  const double D3 = -(1.0 + tf2 - etaf2 - 2.0 * etaf2 * etaf2) / 3.0;
  const double D5 = (2.0 + 5.0 * tf2 + 3.0 * tf4) / 15.0;
  p.convergence = tf * Q * (1.0 + Q2 * (D3 + D5 * Q2));

  const double G2 = (1.0 + etaf2) / 2.0;
  const double G4 = (1.0 + 5.0 * etaf2) / 12.0;
  p.scaleFactor = z.k0 * (1.0 + G2 * Q2 * (1.0 + G4 * Q2));
  return p;
}

// ---- Transverse Mercator, NAD 27: Clarke 1866, U.S. survey feet ----

namespace {

constexpr double kClarke1866A = 6378206.4;
constexpr double kClarke1866E = 0.08227185422300323;    // sqrt(a^2 - b^2) / a, b = 6356583.8
constexpr double kUsFeetToMeters = 0.3048006096012192;  // 1200/3937

}  // namespace

Tm27Zone TM27_SetZone(double phi0, double lambda0, double N0, double E0, double k0) {
  Tm27Zone z;
  z.tm = TM_SetZone(kClarke1866A, kClarke1866E, phi0, lambda0, 0.0, 0.0, k0);
  z.N0 = N0;
  z.E0 = E0;
  return z;
}

GridPoint TM27_GeographicToGrid(const Tm27Zone& z, double phi, double lambda) {
  GridPoint g = TM_GeographicToGrid(z.tm, phi, lambda);
  g.northing = g.northing * kMetersToUsFeet + z.N0;
  g.easting = g.easting * kMetersToUsFeet + z.E0;
  return g;
}

GeographicPoint TM27_GridToGeographic(const Tm27Zone& z, double northing, double easting) {
  return TM_GridToGeographic(z.tm, (northing - z.N0) * kUsFeetToMeters,
                             (easting - z.E0) * kUsFeetToMeters);
}

}  // namespace zv
