// Forward and inverse points per second of every projection form, and PROJ's
// proj_trans_generic on the same points and the same zone (+proj string) in
// the same run. Ratios: items_per_second of zv over that of proj.

#include <benchmark/benchmark.h>
#include <proj.h>

#include <cmath>
#include <string>
#include <vector>

#include "geodesy/Projection.h"

namespace zv {
namespace {

constexpr double kDeg = 3.14159265358979323846 / 180.0;
constexpr double kUsFoot = 1200.0 / 3937.0;
constexpr int kSide = 100;  // 100 x 100 points per zone

struct Form {
  const char* name;
  ZoneParameters zone;
  std::string proj;                 // the same zone for PROJ, meters or U.S. survey feet
  double south, north, west, east;  // sample area, degrees east-positive
};

ZoneParameters Zone(const char* projection, bool clarke) {
  ZoneParameters z{};
  z.projection = projection;
  z.a = clarke ? 6378206.4 : 6378137.0;
  z.e = clarke ? 0.08227185422300323 : 0.0818191910428158;
  return z;
}

std::vector<Form> Forms() {
  std::vector<Form> forms;
  ZoneParameters tm = Zone(kTransverseMercator, false);
  tm.phi0 = 31 * kDeg;
  tm.lambda0 = 106.25 * kDeg;
  tm.falseEasting = 500000;
  tm.k0 = 0.9999;
  forms.push_back({"TM", tm,
                   "+proj=tmerc +lat_0=31 +lon_0=-106.25 +k_0=0.9999 +x_0=500000 +ellps=GRS80", 31,
                   37, -107.75, -104.75});

  ZoneParameters tm27 = Zone(kTransverseMercatorNad27, true);
  tm27.phi0 = 31 * kDeg;
  tm27.lambda0 = 106.25 * kDeg;
  tm27.falseEasting = 500000;
  tm27.k0 = 0.9999;
  forms.push_back({"TM27", tm27,
                   "+proj=tmerc +lat_0=31 +lon_0=-106.25 +k_0=0.9999 +x_0=152400.3048006096 "
                   "+ellps=clrk66 +units=us-ft",
                   31, 37, -107.75, -104.75});

  ZoneParameters ak = Zone(kTransverseMercatorNad27, true);
  ak.phi0 = 54 * kDeg;
  ak.lambda0 = 150 * kDeg;
  ak.falseEasting = 500000;
  ak.k0 = 0.9999;
  forms.push_back({"AK27", ak,
                   "+proj=tmerc +lat_0=54 +lon_0=-150 +k_0=0.9999 +x_0=152400.3048006096 "
                   "+ellps=clrk66 +units=us-ft",
                   59, 64, -152, -148});

  ZoneParameters l2 = Zone(kLambertTwoParallels, false);
  l2.phiS = 28.383333333333333 * kDeg;
  l2.phiN = 30.283333333333333 * kDeg;
  l2.phi0 = 27.833333333333333 * kDeg;
  l2.lambda0 = 99 * kDeg;
  l2.falseNorthing = 4000000;
  l2.falseEasting = 600000;
  forms.push_back({"Lambert2", l2,
                   "+proj=lcc +lat_1=28.383333333333333 +lat_2=30.283333333333333 "
                   "+lat_0=27.833333333333333 +lon_0=-99 +x_0=600000 +y_0=4000000 +ellps=GRS80",
                   27.8, 30.6, -102, -95.5});

  ZoneParameters l1 = Zone(kLambertOneParallel, false);
  l1.phi0 = 40 * kDeg;
  l1.lambda0 = 100 * kDeg;
  l1.falseEasting = 500000;
  l1.k0 = 0.9999;
  forms.push_back({"Lambert1", l1,
                   "+proj=lcc +lat_1=40 +lat_0=40 +lon_0=-100 +k_0=0.9999 +x_0=500000 +ellps=GRS80",
                   38.5, 41.5, -103, -97});

  ZoneParameters l27 = Zone(kLambertNad27, true);
  l27.phiS = 28.383333333333333 * kDeg;
  l27.phiN = 30.283333333333333 * kDeg;
  l27.phi0 = 27.833333333333333 * kDeg;
  l27.lambda0 = 99 * kDeg;
  l27.falseEasting = 2000000;
  forms.push_back({"Lambert27", l27,
                   "+proj=lcc +lat_1=28.383333333333333 +lat_2=30.283333333333333 "
                   "+lat_0=27.833333333333333 +lon_0=-99 +x_0=609601.2192024384 +ellps=clrk66 "
                   "+units=us-ft",
                   27.8, 30.6, -102, -95.5});

  ZoneParameters om = Zone(kObliqueMercator, false);
  om.phi0 = 57 * kDeg;
  om.lambda0 = (133 + 40.0 / 60.0) * kDeg;
  om.falseNorthing = -5000000;
  om.falseEasting = 5000000;
  om.k0 = 0.9999;
  om.azimuth = 2 * 3.14159265358979323846 + std::atan(-0.75);
  forms.push_back({"ObliqueMercator", om,
                   "+proj=omerc +no_uoff +lat_0=57 +lonc=-133.66666666666667 "
                   "+alpha=323.13010235415598 +k_0=0.9999 +x_0=5000000 +y_0=-5000000 "
                   "+ellps=GRS80",
                   54.5, 60, -141, -130});
  return forms;
}

// The sample points: geographic (radians, west-positive for zv, east-positive
// for PROJ) and their grid coordinates in the zone's units.
struct Points {
  std::vector<double> phi, lambdaWest, lambdaEast, northing, easting;
};

Points MakePoints(const Form& form, const ProjectionZone& zone) {
  Points p;
  for (int i = 0; i < kSide; ++i) {
    for (int j = 0; j < kSide; ++j) {
      const double lat = form.south + (form.north - form.south) * i / (kSide - 1);
      const double lon = form.west + (form.east - form.west) * j / (kSide - 1);
      p.phi.push_back(lat * kDeg);
      p.lambdaEast.push_back(lon * kDeg);
      p.lambdaWest.push_back(-lon * kDeg);
      const GridPoint g = Projection_GeographicToGrid(zone, lat * kDeg, -lon * kDeg);
      p.northing.push_back(g.northing);
      p.easting.push_back(g.easting);
    }
  }
  return p;
}

void ZvForward(benchmark::State& state, const Form& form) {
  const ProjectionZone zone = Projection_SetZone(form.zone);
  const Points p = MakePoints(form, zone);
  for (auto _ : state) {
    for (size_t i = 0; i < p.phi.size(); ++i) {
      benchmark::DoNotOptimize(Projection_GeographicToGrid(zone, p.phi[i], p.lambdaWest[i]));
    }
  }
  state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(p.phi.size()));
}

void ZvInverse(benchmark::State& state, const Form& form) {
  const ProjectionZone zone = Projection_SetZone(form.zone);
  const Points p = MakePoints(form, zone);
  for (auto _ : state) {
    for (size_t i = 0; i < p.phi.size(); ++i) {
      benchmark::DoNotOptimize(Projection_GridToGeographic(zone, p.northing[i], p.easting[i]));
    }
  }
  state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(p.phi.size()));
}

// PROJ on arrays, in place: the inputs are copied back before each pass.
void Proj(benchmark::State& state, const Form& form, PJ_DIRECTION direction) {
  const ProjectionZone zone = Projection_SetZone(form.zone);
  const Points p = MakePoints(form, zone);
  PJ_CONTEXT* ctx = proj_context_create();
  PJ* pj = proj_create(ctx, form.proj.c_str());
  if (pj == nullptr) {
    state.SkipWithError("proj_create failed");
    proj_context_destroy(ctx);
    return;
  }
  const std::vector<double>& inX = direction == PJ_FWD ? p.lambdaEast : p.easting;
  const std::vector<double>& inY = direction == PJ_FWD ? p.phi : p.northing;
  std::vector<double> x = inX, y = inY;
  const size_t n = x.size();
  for (auto _ : state) {
    x = inX;
    y = inY;
    proj_trans_generic(pj, direction, x.data(), sizeof(double), n, y.data(), sizeof(double), n,
                       nullptr, 0, 0, nullptr, 0, 0);
    benchmark::DoNotOptimize(x.data());
    benchmark::DoNotOptimize(y.data());
  }
  state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(n));
  proj_destroy(pj);
  proj_context_destroy(ctx);
}

const std::vector<Form>& AllForms() {
  static const std::vector<Form> forms = Forms();
  return forms;
}

int Register() {
  for (const Form& form : AllForms()) {
    const std::string name = form.name;
    benchmark::RegisterBenchmark(("Forward/" + name + "/zv").c_str(), ZvForward, form);
    benchmark::RegisterBenchmark(("Forward/" + name + "/proj").c_str(), Proj, form, PJ_FWD);
    benchmark::RegisterBenchmark(("Inverse/" + name + "/zv").c_str(), ZvInverse, form);
    benchmark::RegisterBenchmark(("Inverse/" + name + "/proj").c_str(), Proj, form, PJ_INV);
  }
  return 0;
}

const int kRegistered = Register();

}  // namespace
}  // namespace zv

BENCHMARK_MAIN();
