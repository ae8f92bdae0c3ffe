// Read and write throughput of the tagged formats on generated points.
// Arguments are point counts; the counters report MB/s of file text.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <string>

#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "survey/SurveyFiles.h"

namespace zv {

std::string TempPath(const std::string& name) {
  return (std::filesystem::temp_directory_path() /
          ("zv-bench-survey-" + std::to_string(getpid()) + "-" + name))
      .string();
}

namespace {

// N control points that carry every value a control file writes.
void Generate(WorkArea& work, int count) {
  work.OutputHeader = FileHeader{};
  work.OutputHeader.ProjectLine = "PR:Benchmark";
  work.OutputHeader.CoordinateSystem = "SPC";
  work.OutputHeader.Zone = "4801";
  work.OutputHeader.HorizontalDatum = "NAD83";
  work.OutputHeader.HorizontalUnits = kMeters;
  work.OutputHeader.VerticalUnits = kMeters;
  work.OutputPoints.clear();
  work.OutputPoints.reserve(count);
  for (int i = 0; i < count; ++i) {
    SurveyPoint p;
    p.PointName = std::to_string(10000000 + i);
    p.Northing = 1234567.1234 + i * 0.37;
    p.Easting = 7654321.4321 - i * 0.29;
    p.Elevation = 234.5678 + (i % 1000) * 0.01;
    p.Latitude = (45.5 + (i % 5000) * 1e-5) * kDegreesToRadians;
    p.Longitude = (93.25 + (i % 7000) * 1e-5) * kDegreesToRadians;
    p.EllipsoidHeight = 210.125;
    p.GeoidHeight = -24.875;
    p.FeatureCode = "IP";
    p.ScaleFactor = 0.99991234;
    p.Convergence = 0.0087;
    p.GRText = std::string(1, 'A');
    p.NorthingError = 0.01f;
    p.EastingError = 0.02f;
    p.ElevationError = 0.03f;
    p.HorizontalUnits = kMeters;
    p.VerticalUnits = kMeters;
    p.HorizontalIsControl = true;
    p.ElevationIsControl = true;
    work.OutputPoints.push_back(std::move(p));
  }
}

// Writes a control file of `count` points once; returns its path.
std::string ControlFileOf(int count) {
  std::string path = TempPath("input-" + std::to_string(count) + ".CTL");
  if (!std::filesystem::exists(path)) {
    ScriptedUi ui;
    WorkArea work;
    Generate(work, count);
    WriteControlFile(ui, work, path);
  }
  return path;
}

void SetThroughput(benchmark::State& state, std::uintmax_t bytes) {
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * bytes));
  state.counters["file_MB"] = static_cast<double>(bytes) / 1e6;
}

void BM_WriteControl(benchmark::State& state) {
  ScriptedUi ui;
  WorkArea work;
  Generate(work, static_cast<int>(state.range(0)));
  std::string path = TempPath("write.CTL");
  for (auto _ : state) {
    if (!WriteControlFile(ui, work, path)) state.SkipWithError("write failed");
  }
  SetThroughput(state, std::filesystem::file_size(path));
  std::remove(path.c_str());
}

void BM_ReadControl(benchmark::State& state) {
  std::string path = ControlFileOf(static_cast<int>(state.range(0)));
  ScriptedUi ui;
  for (auto _ : state) {
    WorkArea work;
    if (!ReadControlFile(ui, work, path)) state.SkipWithError("read failed");
    benchmark::DoNotOptimize(work.InputPoints.data());
  }
  SetThroughput(state, std::filesystem::file_size(path));
}

// The translation a user runs: control file in, points-and-chains file out.
void BM_ControlToPointsChains(benchmark::State& state) {
  std::string path = ControlFileOf(static_cast<int>(state.range(0)));
  std::string out = TempPath("out.PAC");
  ScriptedUi ui;
  for (auto _ : state) {
    WorkArea work;
    if (!ReadControlFile(ui, work, path)) state.SkipWithError("read failed");
    work.copyInputToOutput(true);
    if (!WritePointsChainsFile(ui, work, out)) state.SkipWithError("write failed");
  }
  SetThroughput(state, std::filesystem::file_size(path));
  std::remove(out.c_str());
}

BENCHMARK(BM_WriteControl)->Arg(100000)->Arg(1000000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_ReadControl)->Arg(100000)->Arg(1000000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_ControlToPointsChains)->Arg(1000000)->Unit(benchmark::kMillisecond);

}  // namespace
}  // namespace zv

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  for (int count : {100000, 1000000}) {
    std::remove(zv::TempPath("input-" + std::to_string(count) + ".CTL").c_str());
  }
  return 0;
}
