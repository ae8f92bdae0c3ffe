// intg stand-in: geoid heights of the GEOID99, GEOID03, GEOID06 and GEOID09
// models from the .bin grid files of the current folder (g1999*.bin,
// g2003*.bin, g2006*.bin or geoid06*.bin, g2009*.bin); the first file whose
// extent holds the point is used. GEOID99 and GEOID03 interpolate
// biquadratically, GEOID06 and GEOID09 with splines, as the NGS programs of
// those models do.
//
// Keyboard answers (standard input): three empty lines, the model number
// (1 GEOID99, 3 GEOID03, 5 GEOID06, 7 GEOID09), an empty line, 2, 2, 2, the
// input file name, the output file name.

#include <algorithm>
#include <cmath>
#include <filesystem>
#include <iostream>

#include "StandIn.h"
#include "ngs/NgsGrids.h"

namespace zv::ngs {
namespace {

struct Model {
  const char* number;
  const char* name;
  std::vector<std::string> prefixes;
  bool spline;
};

const Model kModels[] = {
    {"1", "GEOID99", {"g1999"}, false},
    {"3", "GEOID03", {"g2003"}, false},
    {"5", "GEOID06", {"g2006", "geoid06"}, true},
    {"7", "GEOID09", {"g2009"}, true},
};

struct File {
  std::string name;
  GeoidGrid grid;  // header; values once used
  bool loaded = false;
};

int Run() {
  std::vector<std::string> answers = ReadAnswers(std::cin);
  if (answers.size() < 10) {
    Report("The keyboard answers do not name the model, the input and the output file.");
    return 1;
  }
  const Model* model = nullptr;
  for (const Model& m : kModels)
    if (answers[3] == m.number) model = &m;
  if (!model) {
    Report("The geoid model number '" + answers[3] + "' is not 1, 3, 5 or 7.");
    return 1;
  }
  const std::string folder = CurrentFolder();
  std::vector<File> files;
  std::error_code ec;
  for (const auto& entry : std::filesystem::directory_iterator(folder, ec)) {
    std::string name = entry.path().filename().string();
    if (!EndsWithNoCase(name, ".bin")) continue;
    for (const std::string& prefix : model->prefixes) {
      if (StartsWithNoCase(name, prefix)) {
        files.push_back({name, {}, false});
        break;
      }
    }
  }
  std::sort(files.begin(), files.end(),
            [](const File& a, const File& b) { return a.name < b.name; });
  if (files.empty()) {
    Report(std::string("No ") + model->name + " grid files (" + model->prefixes.front() +
           "*.bin) were found in '" + folder + "'.");
    return 1;
  }
  std::string names;
  for (File& f : files) {
    std::string error;
    if (!ReadGeoidGridFile(folder + "/" + f.name, f.grid, error, true)) {
      Report("The grid file '" + f.name + "' in '" + folder + "' can not be read: " + error + ".");
      return 1;
    }
    names += (names.empty() ? "" : ", ") + f.name;
  }

  std::vector<InputPoint> points;
  if (!ReadInputPoints(answers[8], points)) return 1;
  std::vector<std::string> lines;
  lines.reserve(points.size());
  int failures = 0;
  for (const InputPoint& p : points) {
    double lon = std::fmod(360.0 - p.lonWest, 360.0);
    if (lon < 0) lon += 360.0;
    File* file = nullptr;
    for (File& f : files) {
      if (f.grid.covers(p.lat, lon)) {
        file = &f;
        break;
      }
    }
    if (!file) {
      Report("Point " + Describe(p) + " lies outside the " + model->name + " grids in '" + folder +
             "' (" + names + ").");
      ++failures;
      continue;
    }
    if (!file->loaded) {
      std::string error;
      if (!ReadGeoidGridFile(folder + "/" + file->name, file->grid, error)) {
        Report("The grid file '" + file->name + "' in '" + folder + "' can not be read: " + error +
               ".");
        return 1;
      }
      file->loaded = true;
    }
    double n = model->spline ? InterpolateSpline(file->grid, p.lat, lon)
                             : InterpolateBiquadratic(file->grid, p.lat, lon);
    char value[32];
    std::snprintf(value, sizeof value, "  %8.3f", n);
    lines.push_back(Coordinates(p.lat, p.lonWest) + value + p.name);
  }
  if (!WriteOutput(answers[9], lines)) return 1;
  return failures ? 2 : 0;
}

}  // namespace
}  // namespace zv::ngs

int main() {
  return zv::ngs::Run();
}
