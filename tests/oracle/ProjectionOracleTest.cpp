// Cross-check of the projection forms against PROJ: for each zone, a grid of
// points over its area of use, forward and inverse, convergence and scale
// factor. The reference is PROJ on a +proj string built from the very same
// parameters. When the zone names an EPSG code, that reference is compared
// with PROJ's EPSG definition too, which checks the catalog's parameters.

#include <gtest/gtest.h>
#include <proj.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <string>
#include <vector>

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

// Largest differences of one form (or of one zone).
struct Worst {
  double position = 0.0;     // meters: grid position (forward), ground position (inverse)
  double convergence = 0.0;  // arc seconds
  double scale = 0.0;        // parts per million
  std::string positionAt, convergenceAt, scaleAt;

  static void Note(double& slot, std::string& where, double value, const std::string& at) {
    if (!(value <= slot)) {  // NaN counts as worst
      slot = value;
      where = at;
    }
  }
  void Add(const Worst& other) {
    Note(position, positionAt, other.position, other.positionAt);
    Note(convergence, convergenceAt, other.convergence, other.convergenceAt);
    Note(scale, scaleAt, other.scale, other.scaleAt);
  }
};

// One form's summary: over the whole areas of use, over the part where the
// form is fit (InFitArea), and the catalog's agreement with EPSG.
struct FormSummary {
  Worst all, fit;
  double epsg = 0.0;  // meters, PROJ on the catalog's parameters against PROJ's EPSG zone
  std::string epsgAt;
  int zones = 0, points = 0;
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

// The +proj string of the zone, in meters, with the same parameters.
std::string ProjString(const OracleZone& z, const ProjectionZone& zone) {
  const ZoneParameters& d = z.definition;
  const double toMeters = zone.usSurveyFeet ? kUsFootMeters : 1.0;
  const std::string ellipsoid = " +a=" + Fixed(d.a) + " +es=" + Fixed(d.e * d.e);
  const std::string falseOrigin =
      " +x_0=" + Fixed(d.falseEasting * toMeters) + " +y_0=" + Fixed(d.falseNorthing * toMeters);
  const std::string lon0 = Fixed(EastDegrees(d.lambda0));
  const std::string p = d.projection;
  if (p == kTransverseMercator || p == kTransverseMercatorNad27) {
    return "+proj=tmerc +lat_0=" + Fixed(d.phi0 / kDeg) + " +lon_0=" + lon0 +
           " +k_0=" + Fixed(d.k0) + falseOrigin + ellipsoid + " +units=m";
  }
  if (p == kLambertTwoParallels || p == kLambertNad27) {
    return "+proj=lcc +lat_1=" + Fixed(d.phiS / kDeg) + " +lat_2=" + Fixed(d.phiN / kDeg) +
           " +lat_0=" + Fixed(d.phi0 / kDeg) + " +lon_0=" + lon0 + falseOrigin + ellipsoid +
           " +units=m";
  }
  if (p == kLambertOneParallel) {
    return "+proj=lcc +lat_1=" + Fixed(d.phi0 / kDeg) + " +lat_0=" + Fixed(d.phi0 / kDeg) +
           " +lon_0=" + lon0 + " +k_0=" + Fixed(d.k0) + falseOrigin + ellipsoid + " +units=m";
  }
  return "+proj=omerc +no_uoff +lat_0=" + Fixed(d.phi0 / kDeg) + " +lonc=" + lon0 +
         " +alpha=" + Fixed(d.azimuth / kDeg) + " +k_0=" + Fixed(d.k0) + falseOrigin + ellipsoid +
         " +units=m";
}

// PROJ's EPSG projected CRS from its own geographic base: lon/lat degrees in,
// easting/northing in meters out.
struct EpsgReference {
  PJ* op = nullptr;
  double toMeters = 1.0;
  double west = 0, south = 0, east = 0, north = 0;
  bool hasArea = false;
};

EpsgReference MakeEpsgReference(PJ_CONTEXT* ctx, int code) {
  EpsgReference r;
  PJ* crs = proj_create(ctx, ("EPSG:" + std::to_string(code)).c_str());
  if (crs == nullptr) return r;
  r.hasArea = proj_get_area_of_use(ctx, crs, &r.west, &r.south, &r.east, &r.north, nullptr) != 0;
  PJ* cs = proj_crs_get_coordinate_system(ctx, crs);
  if (cs != nullptr) {
    proj_cs_get_axis_info(ctx, cs, 0, nullptr, nullptr, nullptr, &r.toMeters, nullptr, nullptr,
                          nullptr);
    proj_destroy(cs);
  }
  PJ* base = proj_crs_get_geodetic_crs(ctx, crs);
  PJ* op = proj_create_crs_to_crs_from_pj(ctx, base, crs, nullptr, nullptr);
  if (op != nullptr) {
    r.op = proj_normalize_for_visualization(ctx, op);
    proj_destroy(op);
  }
  proj_destroy(base);
  proj_destroy(crs);
  return r;
}

struct Sample {
  double latDeg, lonDeg;
};

std::vector<Sample> Samples(double west, double south, double east, double north) {
  if (east < west) east += 360.0;  // across the 180th meridian
  constexpr int kSteps = 8;        // 8 x 8 = 64 points
  std::vector<Sample> samples;
  for (int i = 0; i < kSteps; ++i) {
    for (int j = 0; j < kSteps; ++j) {
      const double lat = south + (north - south) * i / (kSteps - 1);
      double lon = west + (east - west) * j / (kSteps - 1);
      if (lon > 180.0) lon -= 360.0;
      samples.push_back({lat, lon});
    }
  }
  return samples;
}

// The EPSG code in a "Full Name" such as "Alabama East 0101 (EPSG:26929)"; 0 when none.
int EpsgCode(const std::string& fullName) {
  const size_t at = fullName.find("EPSG:");
  if (at == std::string::npos) return 0;
  return std::atoi(fullName.c_str() + at + 5);
}

// The goal of each form in its fit area: positions (meters), convergence
// (arc seconds), scale factor (ppm); and the catalog against EPSG (meters,
// foot-rounded false origins and the rounded azimuth of Alaska zone 1).
struct Goal {
  double position, convergence, scale, epsg;
};

Goal GoalOf(const std::string& form) {
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

class Oracle {
 public:
  Oracle() : ctx_(proj_context_create()) {}
  ~Oracle() { proj_context_destroy(ctx_); }
  Oracle(const Oracle&) = delete;
  Oracle& operator=(const Oracle&) = delete;

  // Checks one zone; adds its differences to the summary of its form.
  void Check(const OracleZone& z) {
    const ProjectionZone zone = Projection_SetZone(z.definition);
    ASSERT_EQ(zone.status, ProjectionStatus::Ok) << z.name;

    const std::string definition = ProjString(z, zone);
    PJ* ref = proj_create(ctx_, definition.c_str());
    ASSERT_NE(ref, nullptr) << z.name << ": " << definition;

    EpsgReference epsg;
    if (z.epsg != 0) {
      epsg = MakeEpsgReference(ctx_, z.epsg);
      EXPECT_NE(epsg.op, nullptr) << z.name << ": EPSG:" << z.epsg;
      const std::string& units = z.definition.linearUnits;
      EXPECT_DOUBLE_EQ(epsg.toMeters, units == "Meters"               ? 1.0
                                      : units == "International Feet" ? 0.3048
                                                                      : kUsFootMeters)
          << z.name << ": " << units;
    }
    double west = z.west, south = z.south, east = z.east, north = z.north;
    if (z.epsg != 0) {
      EXPECT_TRUE(epsg.hasArea) << z.name << ": no area of use";
      west = epsg.west;
      south = epsg.south;
      east = epsg.east;
      north = epsg.north;
    }

    Worst all, fit;
    double epsgWorst = 0.0;
    std::string epsgAt;
    const double unit = zone.usSurveyFeet ? kUsFootMeters : 1.0;
    const double a = z.definition.a;
    const std::vector<Sample> samples = Samples(west, south, east, north);
    for (const Sample& s : samples) {
      const double phi = s.latDeg * kDeg;
      const double lambda = WestRadians(s.lonDeg);
      const PJ_COORD in = proj_coord(s.lonDeg * kDeg, phi, 0, 0);
      const PJ_COORD out = proj_trans(ref, PJ_FWD, in);
      const PJ_FACTORS f = proj_factors(ref, in);
      const double refE = out.xy.x, refN = out.xy.y;
      const std::string at = z.name + " at " + Fixed(s.latDeg) + "," + Fixed(s.lonDeg);

      // Forward, and the inverse of PROJ's grid position.
      const GridPoint g = Projection_GeographicToGrid(zone, phi, lambda);
      const GeographicPoint p = Projection_GridToGeographic(zone, refN / unit, refE / unit);
      Worst point;
      Worst::Note(point.position, point.positionAt,
                  std::hypot(g.easting * unit - refE, g.northing * unit - refN), at);
      Worst::Note(point.position, point.positionAt,
                  std::hypot(a * (p.phi - phi), a * std::cos(phi) * ReduceAngle(p.lambda - lambda)),
                  at);
      for (const double convergence : {g.convergence, p.convergence}) {
        Worst::Note(point.convergence, point.convergenceAt,
                    std::fabs(convergence - f.meridian_convergence) / kDeg * 3600.0, at);
      }
      for (const double scale : {g.scaleFactor, p.scaleFactor}) {
        Worst::Note(point.scale, point.scaleAt, std::fabs(scale - f.meridional_scale) * 1e6, at);
      }
      all.Add(point);
      if (InFitArea(z.definition, zone, phi)) fit.Add(point);

      // The catalog's parameters against the EPSG definition of the zone.
      if (epsg.op != nullptr) {
        const PJ_COORD e = proj_trans(epsg.op, PJ_FWD, proj_coord(s.lonDeg, s.latDeg, 0, 0));
        Worst::Note(epsgWorst, epsgAt,
                    std::hypot(refE - e.xy.x * epsg.toMeters, refN - e.xy.y * epsg.toMeters), at);
      }
    }
    proj_destroy(ref);
    if (epsg.op != nullptr) proj_destroy(epsg.op);

    std::printf("  %-50s %.1e m (fit area %.1e m)  %.1e\"  %.1e ppm  EPSG %.1e m\n", z.name.c_str(),
                all.position, fit.position, all.convergence, all.scale, epsgWorst);
    FormSummary& summary = summaries_[FormName(z)];
    ++summary.zones;
    summary.points += static_cast<int>(samples.size());
    summary.all.Add(all);
    summary.fit.Add(fit);
    Worst::Note(summary.epsg, summary.epsgAt, epsgWorst, epsgAt);
  }

  void ExpectGoals() const {
    for (const auto& [form, s] : summaries_) {
      const Goal goal = GoalOf(form);
      EXPECT_LE(s.fit.position, goal.position) << form << ": " << s.fit.positionAt;
      EXPECT_LE(s.fit.convergence, goal.convergence) << form << ": " << s.fit.convergenceAt;
      EXPECT_LE(s.fit.scale, goal.scale) << form << ": " << s.fit.scaleAt;
      EXPECT_LE(s.epsg, goal.epsg) << form << ": " << s.epsgAt;
    }
  }

  void Print() const {
    std::printf("\nLargest differences from PROJ %s per form (forward and inverse):\n",
                proj_info().version);
    for (const auto& [form, s] : summaries_) {
      std::printf("  %s: %d zones, %d points\n", form.c_str(), s.zones, s.points);
      const auto line = [](const char* label, const Worst& w) {
        std::printf("    %-10s position %.3e m, convergence %.2e\", scale %.2e ppm\n", label,
                    w.position, w.convergence, w.scale);
        std::printf("               worst at %s\n", w.positionAt.c_str());
      };
      line("all", s.all);
      line("fit area", s.fit);
      std::printf("    catalog against EPSG %.3e m (%s)\n", s.epsg, s.epsgAt.c_str());
    }
  }

 private:
  PJ_CONTEXT* ctx_;
  std::map<std::string, FormSummary> summaries_;
};

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
  Oracle oracle;
  oracle.Check(z);
  oracle.ExpectGoals();
}

TEST(ProjectionOracle, EveryShippedZone) {
  const std::string appFolder = std::string(ZV_SOURCE_DIR) + "/appdata";
  const std::vector<std::string> sections = ReadProfileSections(ZonesPath(appFolder));
  ASSERT_FALSE(sections.empty());
  Oracle oracle;
  for (const std::string& section : sections) {
    SCOPED_TRACE(section);
    const size_t tilde = section.find('~');
    ASSERT_NE(tilde, std::string::npos);
    ScriptedUi ui;
    OracleZone z;
    z.name = section;
    z.definition = ResolveZone(ui, appFolder, section.substr(0, tilde), section.substr(tilde + 1));
    EXPECT_TRUE(ui.boxes.empty()) << ui.onlyText();
    z.epsg = EpsgCode(z.definition.fullName);
    EXPECT_NE(z.epsg, 0) << "no EPSG code in the Full Name " << z.definition.fullName;
    oracle.Check(z);
  }
  oracle.Print();
  oracle.ExpectGoals();
}

}  // namespace
}  // namespace zv::oracle
