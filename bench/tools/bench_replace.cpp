// "Replace" over a control file of 1,000,000 points (about 200 MB) with
// three commands: a point-number offset, an elevation shift and a feature
// code replacement. The file is generated into a temporary folder that is
// removed at the end.
#include <benchmark/benchmark.h>

#include <cstdio>
#include <filesystem>
#include <string>

#include "platform/Ui.h"
#include "tools/SearchReplace.h"

namespace {

class QuietUi : public zv::Ui {
 public:
  zv::Answer message(const std::string&, zv::Icon, zv::Buttons, const std::string&) override {
    ++boxes;
    return zv::Answer::Ok;
  }
  std::optional<std::string> input(const std::string&, const std::string&,
                                   const std::string&) override {
    return std::nullopt;
  }
  void viewText(const std::string&, const std::string&) override {}
  int boxes = 0;
};

struct Files {
  std::filesystem::path dir;
  std::string input, output, commands;
  Files() {
    dir = std::filesystem::temp_directory_path() / "zv-bench-replace";
    std::filesystem::create_directories(dir);
    input = (dir / "big.ctl").string();
    output = (dir / "out.ctl").string();
    commands = (dir / "bench.TRN").string();
    std::FILE* c = std::fopen(commands.c_str(), "wb");
    std::fputs("PN: +1000\r\nZC: +100.5\r\nFE:CTLMON FE:CONTROL CM:RENAMED\r\n", c);
    std::fclose(c);
    std::FILE* f = std::fopen(input.c_str(), "wb");
    std::fputs(
        "PR:Benchmark job\r\nAC:PR\r\nCS:State Plane 1983\r\nZN:Wisconsin Central\r\n"
        "HD:NAD 83\r\nVD:NAVD 88\r\nUL:F\r\n",
        f);
    for (long i = 0; i < 1000000; ++i) {
      double north = 240000.0 + (i % 1000) * 12.3456;
      double east = 2070000.0 + (i / 1000) * 9.8765;
      int sec = static_cast<int>(i % 60);
      std::fprintf(f,
                   "AC:OS\r\nPN:%ld\r\nYC:%.4f\r\nXC:%.4f\r\nZC:%.4f\r\nLT:44.30%02d12345\r\n"
                   "LG:89.36%02d54321\r\nHE:%.3f\r\nHG:-108.270\r\nPD:IRON PIN %ld\r\nFE:CTLMON\r\n"
                   "SY:0.0394\r\nSX:0.0328\r\nSZ:0.0656\r\n",
                   i, north, east, 1100.0 + (i % 97) * 0.25, sec, sec, 990.0 + (i % 97) * 0.25, i);
    }
    std::fclose(f);
  }
  ~Files() {
    std::error_code ec;
    std::filesystem::remove_all(dir, ec);
  }
};

void BM_ReplaceMillionPoints(benchmark::State& state) {
  static Files files;
  QuietUi ui;
  for (auto _ : state) {
    bool ok = zv::SearchAndReplace(ui, files.input, files.output, files.commands);
    if (!ok || ui.boxes != 0) state.SkipWithError("replace failed");
  }
  state.SetBytesProcessed(state.iterations() *
                          static_cast<int64_t>(std::filesystem::file_size(files.input)));
}
BENCHMARK(BM_ReplaceMillionPoints)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime()
    ->Iterations(1)
    ->Repetitions(5)
    ->ReportAggregatesOnly(true);

}  // namespace

BENCHMARK_MAIN();
