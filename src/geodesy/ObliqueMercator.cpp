#include "geodesy/ObliqueMercator.h"

#include <cmath>

namespace zv {

OmZone OM_SetZone(double a, double e, double phiC, double lambdaC, double N0, double E0, double kc,
                  double alphaC) {
  OmZone z;
  z.a = a;
  z.e = e;
  z.N0 = N0;
  z.E0 = E0;
  z.alphaC = alphaC;
  z.sinAlphaC = std::sin(alphaC);
  z.cosAlphaC = std::cos(alphaC);
  const double e2 = e * e;
  const double e4 = e2 * e2;
  const double e6 = e4 * e2;
  const double e8 = e4 * e4;
  z.ep2 = e2 / (1.0 - e2);

  // Conformal latitude chi to geodetic: phi = chi + sin chi cos chi
  // (d0 + d2 cos^2 chi + d4 cos^4 chi + d6 cos^6 chi).
  const double c2 = e2 / 2.0 + 5.0 * e4 / 24.0 + e6 / 12.0 + 13.0 * e8 / 360.0;
  const double c4 = 7.0 * e4 / 48.0 + 29.0 * e6 / 240.0 + 811.0 * e8 / 11520.0;
  const double c6 = 7.0 * e6 / 120.0 + 81.0 * e8 / 1120.0;
  const double c8 = 4279.0 * e8 / 161280.0;
  z.d0 = 2.0 * (c2 - 2.0 * c4 + 3.0 * c6 - 4.0 * c8);
  z.d2 = 8.0 * (c4 - 4.0 * c6 + 10.0 * c8);
  z.d4 = 32.0 * (c6 - 6.0 * c8);
  z.d6 = 128.0 * c8;

  const double cosC = std::cos(phiC);
  const double wC = Lambert_W(phiC, e);
  z.B = std::sqrt(1.0 + z.ep2 * cosC * cosC * cosC * cosC);
  z.A = z.B * a * std::sqrt(1.0 - e2) / (wC * wC);
  const double QC = Lambert_IsometricLatitude(phiC, e);
  z.C = Math_ArcCosh(z.B * std::sqrt(1.0 - e2) / (cosC * wC)) - z.B * QC;
  const double gamma0 = Math_ArcSin(std::sin(alphaC) * a * cosC / (z.A * wC));
  z.sinGamma0 = std::sin(gamma0);
  z.cosGamma0 = std::cos(gamma0);
  z.lambda0 = lambdaC + Math_ArcSin(Math_Sinh(z.B * QC + z.C) * z.sinGamma0 / z.cosGamma0) / z.B;
  z.AkcOverB = z.A * kc / z.B;
  z.AkcOverA = z.A * kc / a;
  return z;
}

namespace {

// Convergence and scale factor of the forward steps 7 and 8.
void ConvergenceAndScale(const OmZone& z, double phi, double S, double T, double V, double cosD,
                         double u, double& convergence, double& scaleFactor) {
  const double K = z.AkcOverB;
  // Reduced to -pi..pi: an azimuth given as 323 degrees instead of -37
  // would otherwise leave a full turn in the convergence.
  convergence = ReduceAngle(
      std::atan((z.sinGamma0 - z.cosGamma0 * S * V) / (z.cosGamma0 * T * cosD)) - z.alphaC);
  const double s = std::sin(phi);
  scaleFactor =
      z.AkcOverA * std::sqrt(1.0 - z.e * z.e * s * s) * std::cos(u / K) / (std::cos(phi) * cosD);
}

}  // namespace

GridPoint OM_GeographicToGrid(const OmZone& z, double phi, double lambda) {
  const double K = z.AkcOverB;
  const double D = z.B * ReduceAngle(lambda - z.lambda0);
  const double V = std::sin(D);
  const double cosD = std::cos(D);
  const double Q = Lambert_IsometricLatitude(phi, z.e);
  const double x = std::exp(z.B * Q + z.C);
  const double S = (x - 1.0 / x) / 2.0;  // sinh(B Q + C)
  const double T = (x + 1.0 / x) / 2.0;  // cosh(B Q + C)
  const double u = K * std::atan((S * z.cosGamma0 - V * z.sinGamma0) / cosD);
  const double v = (K / 2.0) * std::log((T - S * z.sinGamma0 - V * z.cosGamma0) /
                                        (T + S * z.sinGamma0 + V * z.cosGamma0));
  GridPoint g;
  g.northing = u * z.cosAlphaC - v * z.sinAlphaC + z.N0;
  g.easting = v * z.cosAlphaC + u * z.sinAlphaC + z.E0;
  ConvergenceAndScale(z, phi, S, T, V, cosD, u, g.convergence, g.scaleFactor);
  return g;
}

GeographicPoint OM_GridToGeographic(const OmZone& z, double northing, double easting) {
  const double K = z.AkcOverB;
  const double dN = northing - z.N0;
  const double dE = easting - z.E0;
  const double u = dN * z.cosAlphaC + dE * z.sinAlphaC;
  const double v = dE * z.cosAlphaC - dN * z.sinAlphaC;
  const double x = std::exp(v / K);
  const double Sp = (x - 1.0 / x) / 2.0;
  const double Tp = (x + 1.0 / x) / 2.0;
  const double Vp = std::sin(u / K);
  const double Q = (std::log((Tp - z.sinGamma0 * Sp + z.cosGamma0 * Vp) /
                             (Tp + z.sinGamma0 * Sp - z.cosGamma0 * Vp)) /
                        2.0 -
                    z.C) /
                   z.B;
  const double eQ = std::exp(Q);
  const double chi = 2.0 * std::atan((eQ - 1.0) / (eQ + 1.0));
  const double sc = std::sin(chi);
  const double cc = std::cos(chi);
  const double cc2 = cc * cc;
  GeographicPoint p;
  p.phi = chi + sc * cc * (z.d0 + cc2 * (z.d2 + cc2 * (z.d4 + cc2 * z.d6)));
  p.lambda = NormalizeWestLongitude(
      z.lambda0 - std::atan((z.sinGamma0 * Vp + z.cosGamma0 * Sp) / std::cos(u / K)) / z.B);

  // Step 7: convergence and scale factor of the forward at the result.
  const GridPoint g = OM_GeographicToGrid(z, p.phi, p.lambda);
  p.convergence = g.convergence;
  p.scaleFactor = g.scaleFactor;
  return p;
}

}  // namespace zv
