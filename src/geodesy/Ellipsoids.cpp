#include "geodesy/Ellipsoids.h"

#include <cmath>
#include <string>

#include "platform/Error.h"

namespace zv {

namespace {

const char* const kAxesMessage = "The Semimajor Axis must be greater than the Semiminor Axis.";
const char* const kSemiminorMessage =
    "The computed Ellipsoid Semiminor Axis is greater than the Semimajor Axis.  Check the other "
    "ellipsoid parameters.";
const char* const kSemimajorMessage =
    "The computed Ellipsoid Semimajor Axis is less than the Semiminor Axis.  Check the other "
    "ellipsoid parameters.";

std::string Source(const char* routine) {
  return std::string("modEllipsoids.") + routine;
}

[[noreturn]] void Fail(const std::string& description, const char* routine) {
  throw ZvError(1, description, Source(routine));
}

double Sqrt(double x, const char* routine) {
  if (!(x >= 0)) throw ZvError(5, "Invalid procedure call or argument", Source(routine));
  return std::sqrt(x);
}

double Divide(double x, double y, const char* routine) {
  if (y == 0) throw ZvError(11, "Division by zero", Source(routine));
  return x / y;
}

bool Known(double v) {
  return v != kEllipsoidUnknown;
}

}  // namespace

double Ellipsoids_GET_fab(double a, double b) {
  if (a < b)
    Fail(std::string("Can not compute the Ellipsoid Flattening. ") + kAxesMessage,
         "Ellipsoids_GET_fab");
  return Divide(a - b, a, "Ellipsoids_GET_fab");
}

double Ellipsoids_GET_eab(double a, double b) {
  if (a < b)
    Fail(std::string("Can not compute the Ellipsoid Eccentricity. ") + kAxesMessage,
         "Ellipsoids_GET_eab");
  return Divide(Sqrt(a * a - b * b, "Ellipsoids_GET_eab"), a, "Ellipsoids_GET_eab");
}

double Ellipsoids_GET_baf(double a, double f) {
  double b = a - a * f;
  if (b > a) Fail(kSemiminorMessage, "Ellipsoids_GET_baf");
  return b;
}

double Ellipsoids_GET_bae(double a, double e) {
  double b = Sqrt(a * a - e * e * a * a, "Ellipsoids_GET_bae");
  if (b > a) Fail(kSemiminorMessage, "Ellipsoids_GET_bae");
  return b;
}

double Ellipsoids_GET_abf(double b, double f) {
  double a = Divide(b, 1 - f, "Ellipsoids_GET_abf");
  if (a < b) Fail(kSemimajorMessage, "Ellipsoids_GET_abf");
  return a;
}

double Ellipsoids_GET_abe(double b, double e) {
  double a = Sqrt(Divide(b * b, 1 - e * e, "Ellipsoids_GET_abe"), "Ellipsoids_GET_abe");
  if (a < b) Fail(kSemimajorMessage, "Ellipsoids_GET_abe");
  return a;
}

double Ellipsoids_GET_ef(double f) {
  return Sqrt(2 * f - f * f, "Ellipsoids_GET_ef");
}

double Ellipsoids_GET_fe(double e) {
  return 1 - Sqrt(1 - e * e, "Ellipsoids_GET_fe");
}

void Ellipsoids_GET_Parameters(double& a, double& b, double& f, double& e) {
  if (Known(a) && Known(b)) {
    double nf = Ellipsoids_GET_fab(a, b);
    double ne = Ellipsoids_GET_eab(a, b);
    f = nf;
    e = ne;
  } else if (Known(a) && Known(f)) {
    double nb = Ellipsoids_GET_baf(a, f);
    double ne = Ellipsoids_GET_ef(f);
    b = nb;
    e = ne;
  } else if (Known(a) && Known(e)) {
    double nb = Ellipsoids_GET_bae(a, e);
    double nf = Ellipsoids_GET_fe(e);
    b = nb;
    f = nf;
  } else if (Known(b) && Known(f)) {
    double na = Ellipsoids_GET_abf(b, f);
    double ne = Ellipsoids_GET_ef(f);
    a = na;
    e = ne;
  } else if (Known(b) && Known(e)) {
    double na = Ellipsoids_GET_abe(b, e);
    double nf = Ellipsoids_GET_fe(e);
    a = na;
    f = nf;
  } else {
    Fail(
        "Can not compute ellipsoid parameters. Two ellipsoidal parameters are required in any "
        "combination other than Flattening and Eccentricity.",
        "Ellipsoids_GET_Parameters");
  }
}

}  // namespace zv
