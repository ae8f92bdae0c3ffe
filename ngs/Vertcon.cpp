// vertcon stand-in: VERTCON 2.1 height shifts NAVD 88 minus NGVD 29 from
// the grids vertconw.94, vertconc.94 and vertcone.94 of the current folder
// (searched in that order), in metres.
//
// Keyboard answers (standard input): Y, 2, the input file name, N, the
// output file name.

#include <filesystem>
#include <iostream>

#include "StandIn.h"
#include "ngs/NgsGrids.h"

namespace zv::ngs {
namespace {

struct Grid {
  std::string file;
  ShiftGrid grid;
};

int Run() {
  std::vector<std::string> answers = ReadAnswers(std::cin);
  if (answers.size() < 5 || answers[2].empty() || answers[4].empty()) {
    Report("The keyboard answers do not name the input and the output file.");
    return 1;
  }
  const std::string folder = CurrentFolder();
  std::vector<Grid> grids;
  std::string searched, missing;
  for (const char* file : {"vertconw.94", "vertconc.94", "vertcone.94"}) {
    const std::string path = folder + "/" + file;
    if (!std::filesystem::exists(path)) {
      missing += (missing.empty() ? "" : ", ") + std::string(file);
      continue;
    }
    Grid& g = grids.emplace_back();
    g.file = file;
    std::string error;
    if (!ReadShiftGridFile(path, g.grid, error)) {
      Report("The grid file '" + g.file + "' in '" + folder + "' can not be read: " + error + ".");
      return 1;
    }
    searched += (searched.empty() ? "" : ", ") + g.file;
  }
  if (grids.empty()) {
    Report("The VERTCON grid files (" + missing + ") were not found in '" + folder + "'.");
    return 1;
  }
  const std::string missingNote = missing.empty() ? "" : "; not found: " + missing;

  std::vector<InputPoint> points;
  if (!ReadInputPoints(answers[2], points)) return 1;
  std::vector<std::string> lines{"VERTCON 2.1 stand-in: NAVD 88 minus NGVD 29 (m), name"};
  lines.reserve(points.size() + 1);
  int failures = 0;
  for (const InputPoint& p : points) {
    std::optional<double> shift;
    for (const Grid& g : grids) {
      shift = InterpolateBilinear(g.grid, EastLongitude(p.lonWest), p.lat, kVertconNoData);
      if (shift) break;
    }
    if (!shift) {
      Report("Point " + Describe(p) + " lies outside the VERTCON grids in '" + folder + "' (" +
             searched + missingNote + ").");
      ++failures;
      continue;
    }
    char value[32];
    std::snprintf(value, sizeof value, "  %7.3f ", *shift / 1000.0);
    lines.push_back(Coordinates(p.lat, p.lonWest) + value + p.name);
  }
  if (!WriteOutput(answers[4], lines)) return 1;
  return failures ? 2 : 0;
}

}  // namespace
}  // namespace zv::ngs

int main(int, char**) {
  return zv::ngs::Run();
}
