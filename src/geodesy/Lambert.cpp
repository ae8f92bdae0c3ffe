#include "geodesy/Lambert.h"

#include <cmath>

#include "geodesy/Nad27Tables.h"

namespace zv {

namespace {

// The cone of two standard parallels: sin phi0 and the mapping radius K at
// the equator, computed from each parallel (NOS NGS 5, Lambert set-up).
struct Cone {
  double sinPhi0 = 0.0;
  double phi0 = 0.0;
  double q0 = 0.0;
  double w0 = 0.0;
  double K = 0.0;
  bool ok = false;
};

// The two values of K agree when rounded to single precision (about seven
// significant digits). NaN (equal parallels) never agrees.
bool MappingRadiiAgree(double K, double KPrime) {
  constexpr double kFloatRange = 1e38;
  if (!(std::fabs(K) < kFloatRange && std::fabs(KPrime) < kFloatRange)) return false;
  return static_cast<float>(K) == static_cast<float>(KPrime);
}

Cone MakeCone(double phiS, double phiN, double a, double e) {
  Cone c;
  const double qS = Lambert_IsometricLatitude(phiS, e);
  const double wS = Lambert_W(phiS, e);
  const double qN = Lambert_IsometricLatitude(phiN, e);
  const double wN = Lambert_W(phiN, e);
  c.sinPhi0 = std::log(wN * std::cos(phiS) / (wS * std::cos(phiN))) / (qN - qS);
  c.phi0 = Math_ArcSin(c.sinPhi0);
  c.q0 = Lambert_IsometricLatitude(c.phi0, e);
  c.w0 = Lambert_W(c.phi0, e);
  c.K = a * std::cos(phiS) * std::exp(qS * c.sinPhi0) / (wS * c.sinPhi0);
  const double KPrime = a * std::cos(phiN) * std::exp(qN * c.sinPhi0) / (wN * c.sinPhi0);
  c.ok = MappingRadiiAgree(c.K, KPrime);
  return c;
}

// Latitude from its isometric latitude: three Newton steps on sin phi,
// starting from the sphere (NOS NGS 5, Lambert inverse).
double LatitudeFromIsometric(double q, double e) {
  const double e2 = e * e;
  const double x = std::exp(2.0 * q);
  double s = (x - 1.0) / (x + 1.0);
  for (int i = 0; i < 3; ++i) {
    const double f1 =
        (std::log((1.0 + s) / (1.0 - s)) - e * std::log((1.0 + e * s) / (1.0 - e * s))) / 2.0 - q;
    const double f2 = 1.0 / (1.0 - s * s) - e2 / (1.0 - e2 * s * s);
    s = s - f1 / f2;
  }
  return Math_ArcSin(s);
}

}  // namespace

// ---- Two standard parallels ----

Lambert2Zone Lambert2_SetZone(double phiS, double phiN, double phiB, double lambda0, double Nb,
                              double Eb, double a, double e) {
  Lambert2Zone z;
  z.a = a;
  z.e = e;
  z.lambda0 = lambda0;
  z.Nb = Nb;
  z.Eb = Eb;
  const Cone cone = MakeCone(phiS, phiN, a, e);
  z.mappingRadiusOk = cone.ok;
  if (!cone.ok) return z;
  z.sinPhi0 = cone.sinPhi0;
  z.K = cone.K;
  z.Rb = z.K / std::exp(Lambert_IsometricLatitude(phiB, e) * z.sinPhi0);
  z.R0 = z.K / std::exp(cone.q0 * z.sinPhi0);
  z.k0 = cone.w0 * std::tan(cone.phi0) * z.R0 / a;
  z.N0 = z.Rb + Nb - z.R0;
  return z;
}

GridPoint Lambert2_GeographicToGrid(const Lambert2Zone& z, double phi, double lambda) {
  const double s = std::sin(phi);
  const double R = z.K / std::exp(Lambert_IsometricLatitude(phi, z.e) * z.sinPhi0);
  const double gamma = ReduceAngle(z.lambda0 - lambda) * z.sinPhi0;
  GridPoint g;
  g.convergence = gamma;
  g.northing = z.Rb + z.Nb - R * std::cos(gamma);
  g.easting = z.Eb + R * std::sin(gamma);
  g.scaleFactor = std::sqrt(1.0 - z.e * z.e * s * s) * R * z.sinPhi0 / (z.a * std::cos(phi));
  return g;
}

GeographicPoint Lambert2_GridToGeographic(const Lambert2Zone& z, double northing, double easting) {
  const double Rp = z.Rb - northing + z.Nb;
  const double Ep = easting - z.Eb;
  const double gamma = std::atan(Ep / Rp);
  GeographicPoint p;
  p.convergence = gamma;
  p.lambda = NormalizeWestLongitude(z.lambda0 - gamma / z.sinPhi0);
  const double R = std::sqrt(Rp * Rp + Ep * Ep);
  const double q = std::log(z.K / R) / z.sinPhi0;
  p.phi = LatitudeFromIsometric(q, z.e);
  const double s = std::sin(p.phi);
  p.scaleFactor = std::sqrt(1.0 - z.e * z.e * s * s) * R * z.sinPhi0 / (z.a * std::cos(p.phi));
  return p;
}

// ---- One standard parallel (polynomial form) ----

namespace {

// Meridian arc from the equator, M = a (A0 phi - A2 sin 2phi + A4 sin 4phi -
// A6 sin 6phi), and its derivative a (A0 - 2A2 cos 2phi + 4A4 cos 4phi -
// 6A6 cos 6phi); the multiple angles come from sin 2phi and cos 2phi.
struct Arc {
  double M, dM;
};

Arc MeridianArcAndDerivative(const Lambert1Zone& z, double phi) {
  const double s2 = std::sin(2.0 * phi);
  const double c2 = std::cos(2.0 * phi);
  const double s4 = 2.0 * s2 * c2;
  const double c4 = 1.0 - 2.0 * s2 * s2;
  const double s6 = s2 * c4 + c2 * s4;
  const double c6 = c2 * c4 - s2 * s4;
  return {z.a * (z.A0 * phi - z.A2 * s2 + z.A4 * s4 - z.A6 * s6),
          z.a * (z.A0 - 2.0 * z.A2 * c2 + 4.0 * z.A4 * c4 - 6.0 * z.A6 * c6)};
}

double MeridianArc(const Lambert1Zone& z, double phi) {
  return MeridianArcAndDerivative(z, phi).M;
}

// The five higher terms T3..T7 of the series u / k0 = s + T3 + ... + T7.
struct SeriesTerms {
  double T3, T4, T5, T6, T7;
};

SeriesTerms Terms(const Lambert1Zone& z, double s) {
  const double s2 = s * s;
  const double s3 = s2 * s;
  return {z.L3 * s3, z.L4 * s3 * s, z.L5 * s3 * s2, z.L6 * s3 * s3, z.L7 * s3 * s3 * s};
}

}  // namespace

Lambert1Zone Lambert1_SetZone(double a, double e, double phi0, double lambda0, double N0, double E0,
                              double k0) {
  Lambert1Zone z;
  z.a = a;
  z.e = e;
  z.phi0 = phi0;
  z.lambda0 = lambda0;
  z.N0 = N0;
  z.E0 = E0;
  z.k0 = k0;
  const double e2 = e * e;
  const double e4 = e2 * e2;
  const double e6 = e4 * e2;
  z.ep2 = e2 / (1.0 - e2);
  const double s = std::sin(phi0);
  const double w2 = 1.0 - e2 * s * s;
  z.nu0 = a / std::sqrt(w2);
  z.rho0 = a * (1.0 - e2) / std::pow(w2, 1.5);
  z.R0 = k0 * z.nu0 / std::tan(phi0);
  z.A0 = 1.0 - e2 / 4.0 - 3.0 * e4 / 64.0 - 5.0 * e6 / 256.0;
  z.A2 = (3.0 / 8.0) * (e2 + e4 / 4.0 + 15.0 * e6 / 128.0);
  z.A4 = (15.0 / 256.0) * (e4 + 3.0 * e6 / 4.0);
  z.A6 = 35.0 * e6 / 3072.0;
  z.M0 = MeridianArc(z, phi0);

  // Coefficients of s^3 .. s^7 in u / k0 and of s^2 .. s^4 in k / k0.
  const double t0 = std::tan(phi0);
  const double t02 = t0 * t0;
  const double c02 = std::cos(phi0) * std::cos(phi0);
  const double rho = z.rho0;
  const double nu = z.nu0;
  z.sinPhi0 = s;
  z.L3 = 1.0 / (6.0 * rho * nu);
  z.L4 = t0 * (1.0 - 4.0 * z.ep2 * c02) / (24.0 * rho * nu * nu);
  z.L5 = (5.0 + 3.0 * t02 - 3.0 * z.ep2 - z.ep2 * c02) / (120.0 * rho * rho * nu * nu);
  z.L6 = t0 * (7.0 + 4.0 * t02) / (240.0 * rho * rho * nu * nu * nu);
  z.L7 = (61.0 + 180.0 * t02 + 60.0 * t02 * t02) / (5040.0 * rho * rho * rho * nu * nu * nu);
  z.F2 = 1.0 / (2.0 * rho * nu);
  z.F3 = t0 / (6.0 * rho * nu * nu);
  z.F4 = (5.0 + 3.0 * t02) / (24.0 * rho * rho * nu * nu);
  return z;
}

double Lambert1_ScaleFactor(const Lambert1Zone& z, double phi) {
  const double s = MeridianArc(z, phi) - z.M0;
  return z.k0 * (1.0 + s * s * (z.F2 + s * (z.F3 + s * z.F4)));
}

GridPoint Lambert1_GeographicToGrid(const Lambert1Zone& z, double phi, double lambda) {
  const double s = MeridianArc(z, phi) - z.M0;
  const SeriesTerms t = Terms(z, s);
  const double u = z.k0 * (s + t.T3 + t.T4 + t.T5 + t.T6 + t.T7);
  const double theta = ReduceAngle(z.lambda0 - lambda) * z.sinPhi0;
  const double R = z.R0 - u;
  GridPoint g;
  g.convergence = theta;
  g.easting = z.E0 + R * std::sin(theta);
  g.northing = z.N0 + u + (g.easting - z.E0) * std::tan(theta / 2.0);
  g.scaleFactor = Lambert1_ScaleFactor(z, phi);
  return g;
}

GeographicPoint Lambert1_GridToGeographic(const Lambert1Zone& z, double northing, double easting) {
  const double Ep = easting - z.E0;
  const double Rp = z.R0 - northing + z.N0;
  const double theta = std::atan(Ep / Rp);
  GeographicPoint p;
  p.convergence = theta;
  p.lambda = NormalizeWestLongitude(z.lambda0 - theta / z.sinPhi0);
  const double u = northing - z.N0 - Ep * std::tan(theta / 2.0);

  // s from u by Newton's method on the series (a cap on the steps keeps a
  // non-finite input from looping).
  const double target = u / z.k0;
  double s = target;
  if (std::fabs(s) >= 5e-05) {
    for (int i = 0; i < 50; ++i) {
      const SeriesTerms t = Terms(z, s);
      const double correction =
          (target - s - t.T3 - t.T4 - t.T5 - t.T6 - t.T7) /
          (1.0 + (3.0 * t.T3 + 4.0 * t.T4 + 5.0 * t.T5 + 6.0 * t.T6 + 7.0 * t.T7) / s);
      s += correction;
      if (!(std::fabs(correction) >= 5e-05)) break;
    }
  }

  // phi from the meridian arc M0 + s by Newton's method.
  const double arc = z.M0 + s;
  double phi = arc / (z.a * z.A0);
  for (int i = 0; i < 50; ++i) {
    const Arc m = MeridianArcAndDerivative(z, phi);
    const double correction = (arc - m.M) / m.dM;
    phi += correction;
    if (!(std::fabs(correction) >= 5e-07)) break;
  }
  p.phi = phi;
  p.scaleFactor = Lambert1_ScaleFactor(z, phi);
  return p;
}

// ---- NAD 27 equations ----

Lambert27Zone Lambert27_SetZone(double phiS, double phiN, double phiB, double lambda0, double Nb,
                                double E0, double a, double e) {
  Lambert27Zone z;
  z.a = a;
  z.e = e;
  z.Nb = Nb;
  z.E0 = E0;
  z.lambda0Seconds = lambda0 * kSecondsPerRadian;
  const Cone cone = MakeCone(phiS, phiN, a, e);
  z.mappingRadiusOk = cone.ok;
  if (!cone.ok) return z;
  z.sinPhi0 = cone.sinPhi0;

  const double R0Meters = cone.K / std::exp(cone.q0 * cone.sinPhi0);
  z.R0 = R0Meters * kMetersToUsFeet;
  z.Rb = cone.K / std::exp(Lambert_IsometricLatitude(phiB, e) * cone.sinPhi0) * kMetersToUsFeet;
  const double t0 = std::tan(cone.phi0);
  z.k0 = t0 * cone.w0 * R0Meters / a;

  const double c = std::cos(cone.phi0);
  const double omega0 = cone.phi0 * kSecondsPerRadian - nad27::RectifyReduction(cone.sinPhi0, c);
  z.M0 = std::trunc(omega0 / 60.0);
  z.S0 = omega0 - 60.0 * z.M0;

  const double e2 = e * e;
  const double w2 = 1.0 - e2 * cone.sinPhi0 * cone.sinPhi0;
  const double rho0 = kMetersToUsFeet * a * (1.0 - e2) / std::pow(w2, 1.5);
  const double nu0 = kMetersToUsFeet * a / std::sqrt(w2);
  z.C3 = 1e16 / (6.0 * rho0 * nu0);
  z.C4 = 1e24 * t0 / (24.0 * std::pow(rho0 * nu0, 1.5));
  z.C5 = 1e32 * (5.0 + 3.0 * t0 * t0) / (120.0 * rho0 * nu0 * nu0 * nu0);
  return z;
}

namespace {

double Lambert27Scale(const Lambert27Zone& z, double phi, double R) {
  const double s = std::sin(phi);
  return z.sinPhi0 * R * std::sqrt(1.0 - nad27::kE2 * s * s) /
         (nad27::kSemimajorFeet * std::cos(phi));
}

}  // namespace

GridPoint Lambert27_GeographicToGrid(const Lambert27Zone& z, double phi, double lambda) {
  // Feet of meridian from the central parallel, positive to the south.
  const double phiSeconds = phi * kSecondsPerRadian;
  const double M1 = std::trunc(phiSeconds / 60.0);
  const double S1 = phiSeconds - 60.0 * M1;
  const double s = nad27::kFeetPerSecond * (60.0 * (z.M0 - M1) + z.S0 - S1 +
                                            nad27::RectifyReduction(std::sin(phi), std::cos(phi)));
  const double p = s / 1e8;
  const double R = z.R0 + z.k0 * s * (1.0 + p * p * (z.C3 - p * z.C4 + p * p * z.C5));

  const double theta = ReduceSecondsDifference(z.lambda0Seconds - lambda * kSecondsPerRadian) *
                       z.sinPhi0 * kRadiansPerSecond;
  const double half = std::sin(theta / 2.0);
  GridPoint g;
  g.convergence = theta;
  g.northing = z.Rb - R + 2.0 * R * half * half + z.Nb;
  g.easting = z.E0 + R * std::sin(theta);
  g.scaleFactor = Lambert27Scale(z, phi, R);
  return g;
}

GeographicPoint Lambert27_GridToGeographic(const Lambert27Zone& z, double northing,
                                           double easting) {
  const double n = northing - z.Nb;
  const double theta = std::atan((easting - z.E0) / (z.Rb - n));
  GeographicPoint p;
  p.convergence = theta;
  p.lambda = NormalizeWestLongitude((z.lambda0Seconds - theta * kSecondsPerRadian / z.sinPhi0) *
                                    kRadiansPerSecond);

  const double R = (z.Rb - n) / std::cos(theta);
  const double half = std::sin(theta / 2.0);
  const double s0 = (z.Rb - z.R0 - n + 2.0 * R * half * half) / z.k0;
  double s = s0;
  for (int i = 0; i < 3; ++i) {
    const double q = s / 1e8;
    s = s0 / (1.0 + q * q * (z.C3 - q * z.C4 + q * q * z.C5));
  }

  // Rectified arc of the point, then the latitude.
  const double omegaSeconds = 60.0 * z.M0 + z.S0 - nad27::kSecondsPerFoot * s;
  const double phiSeconds =
      omegaSeconds + nad27::InverseReduction(omegaSeconds * kRadiansPerSecond);
  p.phi = phiSeconds * kRadiansPerSecond;
  p.scaleFactor = Lambert27Scale(z, p.phi, R);
  return p;
}

}  // namespace zv
