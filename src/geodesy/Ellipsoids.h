#pragma once
// Ellipsoid parameters: any two of semimajor axis a, semiminor axis b,
// flattening f = (a - b) / a and first eccentricity e = sqrt(a^2 - b^2) / a
// (other than f with e) fix the other two.
//
// Failures throw ZvError: number 1 with the description and the source
// "modEllipsoids.<routine>" for a failed check; number 5 ("Invalid procedure
// call or argument") when a square root of a negative number would be taken
// and 11 ("Division by zero") when a divisor is zero. The completion routine
// passes them on unchanged and then leaves its four values as they were.

namespace zv {

// The marker of an unknown parameter in Ellipsoids_GET_Parameters.
inline constexpr double kEllipsoidUnknown = -1;

double Ellipsoids_GET_fab(double a, double b);  // fails when a < b
double Ellipsoids_GET_eab(double a, double b);  // fails when a < b
double Ellipsoids_GET_baf(double a, double f);  // fails when the computed b > a
double Ellipsoids_GET_bae(double a, double e);  // fails when the computed b > a
double Ellipsoids_GET_abf(double b, double f);  // fails when the computed a < b
double Ellipsoids_GET_abe(double b, double e);  // fails when the computed a < b
double Ellipsoids_GET_ef(double f);
double Ellipsoids_GET_fe(double e);

// Completes the four parameters from the known ones (those that are not -1):
// a and b, a and f, a and e, b and f, b and e, checked in this order. The two
// derived values are written only when both derivations succeed; when all
// four are given, a and b win. Throws ZvError(1, ...,
// "modEllipsoids.Ellipsoids_GET_Parameters") when no such pair is known.
void Ellipsoids_GET_Parameters(double& a, double& b, double& f, double& e);

}  // namespace zv
