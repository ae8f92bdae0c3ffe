// libFuzzer target for one tagged-file reader (chosen by ZV_FUZZ_FORMAT:
// 0 control, 1 points-and-chains, 2 project). Any input must read cleanly or
// be refused with a message; a file that reads is written and read back and
// must keep its points and chains.

#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "survey/SurveyFiles.h"

namespace {

using StreamReader = bool (*)(zv::Ui&, zv::WorkArea&, std::istream&, const std::string&);
using FileFunction = bool (*)(zv::Ui&, zv::WorkArea&, const std::string&);

struct Format {
  StreamReader readStream;
  FileFunction readFile;
  FileFunction write;
};

constexpr Format kFormats[] = {
    {zv::ReadControlStream, zv::ReadControlFile, zv::WriteControlFile},
    {zv::ReadPointsChainsStream, zv::ReadPointsChainsFile, zv::WritePointsChainsFile},
    {zv::ReadProjectStream, zv::ReadProjectFile, zv::WriteProjectFile},
};
constexpr const Format& kFormat = kFormats[ZV_FUZZ_FORMAT];

// A private folder for the written files, removed at exit.
std::string* g_folder = nullptr;

const std::string& OutputPath() {
  static const std::string path = [] {
    std::string pattern = (std::filesystem::temp_directory_path() / "zv-fuzz-XXXXXX").string();
    if (!mkdtemp(pattern.data())) std::abort();
    g_folder = new std::string(pattern);
    std::atexit([] {
      std::error_code ec;
      std::filesystem::remove_all(*g_folder, ec);
    });
    return pattern + "/out.txt";
  }();
  return path;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  std::istringstream in(std::string(reinterpret_cast<const char*>(data), size));
  zv::ScriptedUi ui;
  zv::WorkArea work;
  if (!kFormat.readStream(ui, work, in, "fuzz")) {
    if (ui.boxes.empty()) std::abort();  // a refusal always tells why
    return 0;
  }
  std::vector<std::string> names;
  for (const auto& p : work.InputPoints) {
    // Degrees are a 16-bit field: an angle within a rounding of 32768 degrees
    // is written as 32768 and refused when read back. Not a concern here.
    for (double a : {p.Latitude, p.Longitude, p.Convergence}) {
      if (a != zv::kNoValue && std::fabs(a) * zv::kRadiansToDegrees >= 32767) return 0;
    }
    names.push_back(p.PointName);
  }
  size_t chains = work.InputChains.size();

  work.copyInputToOutput(true);
  if (!kFormat.write(ui, work, OutputPath())) std::abort();
  zv::WorkArea again;
  if (!kFormat.readFile(ui, again, OutputPath())) std::abort();
  if (again.InputPoints.size() != names.size() || again.InputChains.size() != chains) std::abort();
  for (size_t i = 0; i < names.size(); ++i) {
    if (again.InputPoints[i].PointName != names[i]) std::abort();
  }
  return 0;
}
