// Throughput of the batch exchange (100,000 grid points to geographic
// coordinates, no datum shift) and of a NADCON shift of 100,000 points
// through the stand-in program, each in a private application folder.
//
// Run with --benchmark_repetitions=5 --benchmark_report_aggregates_only=true
// for the medians.

#include <benchmark/benchmark.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <random>

#include "geodesy/Angles.h"
#include "geodesy/BatchExchange.h"
#include "geodesy/NgsPrograms.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/ScriptedUi.h"

namespace {

namespace fs = std::filesystem;

constexpr int kPoints = 100'000;

class AppFolder {
 public:
  AppFolder() {
    std::string pattern = (fs::temp_directory_path() / "zvbench-XXXXXX").string();
    path_ = mkdtemp(pattern.data());
  }
  ~AppFolder() {
    std::error_code ec;
    fs::remove_all(path_, ec);
  }
  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

void BM_BatchExchangeGridToGeographic(benchmark::State& state) {
  AppFolder app;
  zv::test::InstallCatalogs(app.path());
  {
    // New Mexico Central (Transverse Mercator, U.S. survey feet).
    std::ofstream in(app.path() + "/tccin.tmp", std::ios::binary);
    in << "Bench\r\n1\r\nAutomatic\r\nPlane\r\nState Plane 1983\r\nNew Mexico Central 3002\r\n"
          "83\r\n88\r\nF\r\nF\r\nOrthometric\r\n\r\n";
    std::mt19937 rng(7);
    std::uniform_real_distribution<double> n(200000, 1500000), e(1200000, 2100000);
    char line[128];
    for (int i = 0; i < kPoints; ++i) {
      std::snprintf(line, sizeof line, "P%d,%.4f,%.4f,%.3f,0.02,0.02,0.03\r\n", i, n(rng), e(rng),
                    5000.0 + i % 100);
      in << line;
    }
  }
  zv::ScriptedUi ui;
  for (auto _ : state) {
    zv::ConversionState conversion;
    if (!zv::BatchExchange(ui, app.path(), conversion, nullptr)) {
      state.SkipWithError("the exchange failed");
      break;
    }
  }
  state.SetItemsProcessed(state.iterations() * kPoints);
}
BENCHMARK(BM_BatchExchangeGridToGeographic)->Unit(benchmark::kMillisecond)->UseRealTime();

void BM_NadconShiftThroughStandIn(benchmark::State& state) {
  AppFolder app;
  zv::test::InstallCatalogs(app.path());
  zv::test::InstallStandIn(app.path(), "NADCON", "ndcon210");
  // A grid of the size of the conus grid (273 x 121 nodes, 0.25 degree).
  auto las = [](double x, double y) { return 0.3 + 0.01 * (x + 131) - 0.02 * (y - 20); };
  auto los = [](double x, double y) { return -1.0 + 0.05 * (x + 131) + 0.01 * (y - 20); };
  const std::string folder = app.path() + "/NGS/NADCON/";
  zv::test::SaveShiftGrid(folder + "conus.las",
                          zv::test::MakeShiftGrid(-131, 20, 0.25, 273, 121, las));
  zv::test::SaveShiftGrid(folder + "conus.los",
                          zv::test::MakeShiftGrid(-131, 20, 0.25, 273, 121, los));

  std::vector<zv::SurveyPoint> points(kPoints);
  std::mt19937 rng(11);
  std::uniform_real_distribution<double> lat(25, 49), lon(67, 124);
  for (int i = 0; i < kPoints; ++i) {
    points[i].PointName = 'P' + std::to_string(i);
    points[i].Latitude = lat(rng) * zv::kDegreesToRadians;
    points[i].Longitude = lon(rng) * zv::kDegreesToRadians;
  }
  zv::ScriptedUi ui;
  bool forward = true;
  for (auto _ : state) {
    // There and back in turn, so every run shifts the same kind of points.
    if (!zv::Nadcon_Run(ui, app.path(), points,
                        forward ? "NADCON NAD 27 to NAD 83" : "NADCON NAD 83 to NAD 27")) {
      state.SkipWithError("NADCON failed");
      break;
    }
    forward = !forward;
  }
  state.SetItemsProcessed(state.iterations() * kPoints);
}
BENCHMARK(BM_NadconShiftThroughStandIn)->Unit(benchmark::kMillisecond)->UseRealTime();

}  // namespace

BENCHMARK_MAIN();
