// Read and write times of the SRV and WSI formats on 1,000,000 generated
// points (every tenth point in a chain of ten for SRV). Run with
// --benchmark_repetitions to get medians.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <string>

#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "survey/SrvFile.h"
#include "survey/WsiFile.h"

namespace zv {
namespace {

constexpr int kPoints = 1000000;

std::string TempPath(const std::string& name) {
  return (std::filesystem::temp_directory_path() /
          ("zv-bench-formats-" + std::to_string(getpid()) + "-" + name))
      .string();
}

// Points of a highway corridor: names, codes, short descriptions, groups.
void Generate(WorkArea& work, bool chains) {
  static const char* kCodes[] = {"EP", "CL", "MH", "TREE", "IP", "HYD"};
  static const char* kGroups[] = {"CONTROL POINTS", "BENCH MARKS", ""};
  work.OutputHeader = FileHeader{};
  work.OutputHeader.CoordinateSystem = "WISCRS";
  work.OutputHeader.Zone = "Dane County";
  work.OutputHeader.HorizontalDatum = "NAD 83(2011)";
  work.OutputHeader.VerticalDatum = "NAVD 88";
  work.OutputHeader.HorizontalUnits = kMeters;
  work.OutputHeader.VerticalUnits = kMeters;
  work.OutputPoints.clear();
  work.OutputPoints.reserve(kPoints);
  work.OutputChains.clear();
  for (int i = 0; i < kPoints; ++i) {
    SurveyPoint p;
    p.PointName = std::to_string(1000000 + i);
    p.Easting = 254871.334 + i * 0.137;
    p.Northing = 131208.102 + i * 0.291;
    p.Elevation = 263.115 + (i % 1000) * 0.011;
    p.FeatureCode = kCodes[i % 6];
    if (i % 4 == 0) p.DescriptionLines = "PD:IRON PIN";
    p.GRText = kGroups[i % 3];
    p.HorizontalUnits = kMeters;
    p.VerticalUnits = kMeters;
    work.OutputPoints.push_back(std::move(p));
  }
  if (!chains) return;
  for (int start = 0; start + 10 <= kPoints; start += 100) {
    SurveyChain c;
    StartChain(c);
    c.ChainName = "EP" + std::to_string(start);
    c.FeatureCode = "EP";
    c.PointListLines = "PL:";
    for (int i = start; i < start + 10; ++i) {
      if (i > start) c.PointListLines += ',';
      c.PointListLines += work.OutputPoints[i].PointName;
    }
    work.OutputChains.push_back(std::move(c));
  }
}

using Writer = bool (*)(Ui&, WorkArea&, const std::string&);
using Reader = bool (*)(Ui&, WorkArea&, const std::string&);

void Write(benchmark::State& state, Writer write, bool chains, const char* name) {
  ScriptedUi ui;
  WorkArea work;
  Generate(work, chains);
  std::string path = TempPath(name);
  for (auto _ : state) {
    if (!write(ui, work, path)) state.SkipWithError("write failed");
  }
  state.counters["MB"] = static_cast<double>(std::filesystem::file_size(path)) / 1e6;
  std::remove(path.c_str());
}

void Read(benchmark::State& state, Writer write, Reader read, bool chains, const char* name) {
  ScriptedUi ui;
  WorkArea work;
  Generate(work, chains);
  std::string path = TempPath(name);
  write(ui, work, path);
  work = WorkArea{};
  for (auto _ : state) {
    if (!read(ui, work, path)) state.SkipWithError("read failed");
    state.PauseTiming();
    if (work.InputPoints.size() != static_cast<size_t>(kPoints))
      state.SkipWithError("wrong point count");
    work.clearInput();
    state.ResumeTiming();
  }
  std::remove(path.c_str());
}

void BM_SrvWrite(benchmark::State& s) {
  Write(s, WriteSrvFile, true, "w.srv");
}
void BM_SrvRead(benchmark::State& s) {
  Read(s, WriteSrvFile, ReadSrvFile, true, "r.srv");
}
void BM_WsiWrite(benchmark::State& s) {
  Write(s, WriteWsiFile, false, "w.wsi");
}
void BM_WsiRead(benchmark::State& s) {
  Read(s, WriteWsiFile, ReadWsiFile, false, "r.wsi");
}

BENCHMARK(BM_SrvWrite)->Unit(benchmark::kMillisecond)->Iterations(1)->UseRealTime();
BENCHMARK(BM_SrvRead)->Unit(benchmark::kMillisecond)->Iterations(1)->UseRealTime();
BENCHMARK(BM_WsiWrite)->Unit(benchmark::kMillisecond)->Iterations(1)->UseRealTime();
BENCHMARK(BM_WsiRead)->Unit(benchmark::kMillisecond)->Iterations(1)->UseRealTime();

}  // namespace
}  // namespace zv

BENCHMARK_MAIN();
