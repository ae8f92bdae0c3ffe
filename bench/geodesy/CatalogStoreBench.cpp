// The catalog store on the shipped zones.ini (300 zones): the lists the
// conversion dialogs load and the save of one zone record. Each must stay
// well under 50 ms; the medians of 15 repetitions are reported.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <string>

#include "geodesy/CatalogStore.h"
#include "geodesy/Catalogs.h"

namespace zv {
namespace {

// A copy of the shipped zones.ini in a folder of its own.
class ZonesCopy {
 public:
  ZonesCopy() {
    std::string pattern = (std::filesystem::temp_directory_path() / "zvbench-XXXXXX").string();
    folder_ = mkdtemp(pattern.data()) ? pattern : std::string();
    std::filesystem::copy_file(std::string(ZV_SOURCE_DIR) + "/appdata/zones.ini",
                               folder_ + "/zones.ini");
  }
  ~ZonesCopy() {
    std::error_code ec;
    std::filesystem::remove_all(folder_, ec);
  }
  const std::string& folder() const { return folder_; }

 private:
  std::string folder_;
};

void BM_LoadAllZoneRecords(benchmark::State& state) {
  ZonesCopy copy;
  const ZoneStore store = ZoneStore::In(copy.folder());
  for (auto _ : state) {
    auto all = store.loadAll();
    if (all.size() != 300) state.SkipWithError("expected 300 zones");
    benchmark::DoNotOptimize(all);
  }
}

// The coordinate-system list, then the zone list of every system.
void BM_ZoneLists(benchmark::State& state) {
  ZonesCopy copy;
  for (auto _ : state) {
    size_t zones = 0;
    for (const std::string& cs : LOAD_CS_ComboBoxList(copy.folder())) {
      zones += LOAD_Zones_ComboBoxList(copy.folder(), true, cs).size();
    }
    if (zones != 300) state.SkipWithError("expected 300 zones");
  }
}

void BM_SaveOneZone(benchmark::State& state) {
  ZonesCopy copy;
  const ZoneStore store = ZoneStore::In(copy.folder());
  ZoneRecord a = *store.load("State Plane 1927", "Texas North 4201");
  ZoneRecord b = a;
  b.fullName += " (edited)";
  bool flip = false;
  for (auto _ : state) {
    flip = !flip;
    if (!store.save(flip ? b : a)) state.SkipWithError("save failed");
  }
}

BENCHMARK(BM_LoadAllZoneRecords)
    ->Unit(benchmark::kMillisecond)
    ->Repetitions(15)
    ->ReportAggregatesOnly(true);
BENCHMARK(BM_ZoneLists)->Unit(benchmark::kMillisecond)->Repetitions(15)->ReportAggregatesOnly(true);
BENCHMARK(BM_SaveOneZone)
    ->Unit(benchmark::kMillisecond)
    ->Repetitions(15)
    ->ReportAggregatesOnly(true);

}  // namespace
}  // namespace zv

BENCHMARK_MAIN();
