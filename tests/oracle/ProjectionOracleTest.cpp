// Cross-check of the projection forms against PROJ: for each zone, a grid of
// points over its area of use, forward and inverse, convergence and scale
// factor. The reference is PROJ on a +proj string built from the very same
// parameters. When the zone names an EPSG code, that reference is compared
// with PROJ's EPSG definition too, which checks the catalog's parameters.

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdio>
#include <map>
#include <optional>

#include "EpsgZone.h"
#include "geodesy/Projection.h"
#include "platform/Profile.h"
#include "platform/ScriptedUi.h"

namespace zv::oracle {
namespace {

constexpr double kUsFootMeters = 1200.0 / 3937.0;
constexpr double kDeg = 3.14159265358979323846 / 180.0;

struct OracleZone {
  std::string name;
  ZoneParameters definition{};
  int epsg = 0;  // 0: none; its area of use gives the sample points
  // Sample extent in degrees (east-positive) when there is no EPSG area.
  double west = 0.0, south = 0.0, east = 0.0, north = 0.0;
};

// Position (metres), convergence (arc seconds), scale factor (ppm), and the
// catalog against EPSG (metres).
enum { kPosition, kConvergence, kScale, kEpsg };
const char* const kWhat[] = {"position", "convergence", "scale", "catalog against EPSG"};
using Values = std::array<double, 4>;

// The largest differences of a form, where they were found, and the largest
// position difference over the whole areas of use.
struct Worst {
  Values value{};
  std::string at[4];
  double wholeArea = 0.0;
  int zones = 0;
  void note(int what, double v, const std::string& where) {
    if (!(v <= value[what])) {  // NaN counts as worst
      value[what] = v;
      at[what] = where;
    }
  }
};

std::string Fixed(double v) {
  char buffer[64];
  std::snprintf(buffer, sizeof buffer, "%.17g", v);
  return buffer;
}

double EastDegrees(double westRadians) {
  double d = -westRadians / kDeg;
  while (d > 180.0) d -= 360.0;
  while (d <= -180.0) d += 360.0;
  return d;
}

double WestRadians(double eastDegrees) {
  double w = -eastDegrees * kDeg;
  while (w < 0.0) w += 2.0 * 3.14159265358979323846;
  return w;
}

// The +proj string of the zone, in metres, with the same parameters.
std::string ProjString(const ZoneParameters& d, bool usSurveyFeet) {
  const double toMeters = usSurveyFeet ? kUsFootMeters : 1.0;
  const std::string tail = " +x_0=" + Fixed(d.falseEasting * toMeters) +
                           " +y_0=" + Fixed(d.falseNorthing * toMeters) + " +a=" + Fixed(d.a) +
                           " +es=" + Fixed(d.e * d.e) + " +units=m";
  const std::string origin = " +lat_0=" + Fixed(d.phi0 / kDeg);
  const std::string lon0 = Fixed(EastDegrees(d.lambda0)), k0 = " +k_0=" + Fixed(d.k0);
  const std::string p = d.projection;
  if (p == kTransverseMercator || p == kTransverseMercatorNad27)
    return "+proj=tmerc" + origin + " +lon_0=" + lon0 + k0 + tail;
  if (p == kLambertTwoParallels || p == kLambertNad27) {
    return "+proj=lcc +lat_1=" + Fixed(d.phiS / kDeg) + " +lat_2=" + Fixed(d.phiN / kDeg) + origin +
           " +lon_0=" + lon0 + tail;
  }
  if (p == kLambertOneParallel)
    return "+proj=lcc +lat_1=" + Fixed(d.phi0 / kDeg) + origin + " +lon_0=" + lon0 + k0 + tail;
  return "+proj=omerc +no_uoff" + origin + " +lonc=" + lon0 + " +alpha=" + Fixed(d.azimuth / kDeg) +
         k0 + tail;
}

// The goal of each form in its fit area, in the order of Values (foot-rounded
// false origins and the rounded azimuth of Alaska zone 1 against EPSG).
Values GoalOf(const std::string& form) {
  // The Transverse Mercator scale series stops at L^4: 0.008 ppm at the edge
  // of the Michigan zones of 1934, 4.8 degrees from their central meridian.
  if (form == kTransverseMercatorNad27) return {0.001, 0.001, 0.01, 0.002};
  if (form == kLambertNad27) return {0.01, 1e-4, 0.001, 0.002};
  // The one-parallel scale series stops at s^4: 0.24 ppm three degrees of
  // latitude from the standard parallel.
  if (form == kLambertOneParallel) return {0.001, 0.001, 0.5, 0.002};
  return {0.001, 0.001, 0.005, 0.002};
}

// Where the NAD 27 Lambert equations are fit: their series in the meridian
// distance hold within a degree of latitude of the standard parallels. The
// other forms are fit over the whole area of use.
bool InFitArea(const ZoneParameters& d, const ProjectionZone& zone, double phi) {
  if (std::holds_alternative<Lambert27Zone>(zone.record)) {
    return phi >= std::min(d.phiS, d.phiN) - kDeg && phi <= std::max(d.phiS, d.phiN) + kDeg;
  }
  return true;
}

// The family a zone is summed up in: its form, the NAD 27 Alaska zones 2 to 9
// (EPSG 26732 to 26739) apart.
std::string FormName(const OracleZone& z) {
  if (z.epsg >= 26732 && z.epsg <= 26739) return "Alaska zones 2-9 (NAD 27)";
  return z.definition.projection;
}

// Checks one zone on 8 x 8 points; adds its differences to its form's.
void Check(std::map<std::string, Worst>& forms, const OracleZone& z) {
  const ProjectionZone zone = Projection_SetZone(z.definition);
  ASSERT_EQ(zone.status, ProjectionStatus::Ok) << z.name;
  const std::string definition = ProjString(z.definition, zone.usSurveyFeet);
  PJ* ref = proj_create(nullptr, definition.c_str());
  ASSERT_NE(ref, nullptr) << z.name << ": " << definition;

  std::optional<test::EpsgZone> epsg;
  double west = z.west, south = z.south, east = z.east, north = z.north;
  if (z.epsg != 0) {
    epsg.emplace(z.epsg);
    EXPECT_TRUE(epsg->ok() && epsg->hasArea) << z.name << ": EPSG:" << z.epsg;
    const std::string& units = z.definition.linearUnits;
    EXPECT_DOUBLE_EQ(epsg->toMeters, units == "Meters"               ? 1.0
                                     : units == "International Feet" ? 0.3048
                                                                     : kUsFootMeters)
        << z.name << ": " << units;
    west = epsg->west, south = epsg->south, east = epsg->east, north = epsg->north;
  }
  if (east < west) east += 360.0;  // across the 180th meridian

  Worst& form = forms[FormName(z)];
  ++form.zones;
  const double unit = zone.usSurveyFeet ? kUsFootMeters : 1.0, a = z.definition.a;
  for (int i = 0; i < 64; ++i) {
    const double latDeg = south + (north - south) * (i / 8) / 7;
    double lonDeg = west + (east - west) * (i % 8) / 7;
    if (lonDeg > 180.0) lonDeg -= 360.0;
    const double phi = latDeg * kDeg, lambda = WestRadians(lonDeg);
    const PJ_COORD in = proj_coord(lonDeg * kDeg, phi, 0, 0);
    const PJ_XY r = proj_trans(ref, PJ_FWD, in).xy;
    const PJ_FACTORS f = proj_factors(ref, in);
    const std::string at = z.name + " at " + Fixed(latDeg) + "," + Fixed(lonDeg);

    // Forward, and the inverse of PROJ's grid position.
    const GridPoint g = Projection_GeographicToGrid(zone, phi, lambda);
    const GeographicPoint p = Projection_GridToGeographic(zone, r.y / unit, r.x / unit);
    Worst point;
    point.note(kPosition, std::hypot(g.easting * unit - r.x, g.northing * unit - r.y), at);
    point.note(kPosition,
               std::hypot(a * (p.phi - phi), a * std::cos(phi) * ReduceAngle(p.lambda - lambda)),
               at);
    for (const double c : {g.convergence, p.convergence})
      point.note(kConvergence, std::fabs(c - f.meridian_convergence) / kDeg * 3600.0, at);
    for (const double s : {g.scaleFactor, p.scaleFactor})
      point.note(kScale, std::fabs(s - f.meridional_scale) * 1e6, at);
    if (epsg && epsg->ok()) {
      const PJ_XY e = epsg->forward(latDeg, lonDeg);
      point.note(kEpsg, std::hypot(r.x - e.x * epsg->toMeters, r.y - e.y * epsg->toMeters), at);
    }
    if (!(point.value[kPosition] <= form.wholeArea)) form.wholeArea = point.value[kPosition];
    const bool fit = InFitArea(z.definition, zone, phi);
    for (int k = 0; k < 4; ++k) {
      if (fit || k == kEpsg) form.note(k, point.value[k], point.at[k]);
    }
  }
  proj_destroy(ref);
}

void ExpectGoals(const std::map<std::string, Worst>& forms) {
  std::printf("\nLargest differences from PROJ %s (fit area; forward and inverse):\n",
              proj_info().version);
  for (const auto& [name, w] : forms) {
    std::printf("  %s, %d zones: %.3e m (whole area %.3e m), %.2e\", %.2e ppm, EPSG %.3e m\n",
                name.c_str(), w.zones, w.value[kPosition], w.wholeArea, w.value[kConvergence],
                w.value[kScale], w.value[kEpsg]);
    const Values goal = GoalOf(name);
    for (int k = 0; k < 4; ++k)
      EXPECT_LE(w.value[k], goal[k]) << name << ": " << kWhat[k] << " at " << w.at[k];
  }
}

// No shipped zone uses the one-parallel cone: a made-up zone 6 degrees tall.
TEST(ProjectionOracle, OneParallelCone) {
  OracleZone z{"One parallel 40 N", {}, 0, -104, 37, -96, 43};
  ZoneParameters& d = z.definition;
  d.projection = kLambertOneParallel;
  d.a = 6378137.0;
  d.e = std::sqrt(2.0 / 298.257222101 - 1.0 / (298.257222101 * 298.257222101));
  d.phi0 = 40 * kDeg;
  d.lambda0 = 100 * kDeg;
  d.k0 = 0.9999;
  d.falseNorthing = 100000;
  d.falseEasting = 500000;
  std::map<std::string, Worst> forms;
  Check(forms, z);
  ExpectGoals(forms);
}

TEST(ProjectionOracle, EveryShippedZone) {
  const std::string appFolder = std::string(ZV_SOURCE_DIR) + "/appdata";
  const std::vector<std::string> sections = ReadProfileSections(ZonesPath(appFolder));
  ASSERT_FALSE(sections.empty());
  std::map<std::string, Worst> forms;
  for (const std::string& section : sections) {
    SCOPED_TRACE(section);
    const size_t tilde = section.find('~');
    ASSERT_NE(tilde, std::string::npos);
    ScriptedUi ui;
    OracleZone z;
    z.name = section;
    z.definition = ResolveZone(ui, appFolder, section.substr(0, tilde), section.substr(tilde + 1));
    EXPECT_TRUE(ui.boxes.empty()) << ui.onlyText();
    z.epsg = test::EpsgCode(z.definition.fullName);
    EXPECT_NE(z.epsg, 0) << "no EPSG code in the Full Name " << z.definition.fullName;
    Check(forms, z);
  }
  ExpectGoals(forms);
}

}  // namespace
}  // namespace zv::oracle
