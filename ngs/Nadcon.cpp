// ndcon210 stand-in: NADCON 2.10 datum shifts between NAD 27 and NAD 83
// (the area grids conus, alaska, hawaii, prvi, stlrnc, stgeorge, stpaul) and
// between NAD 83 and the state HPGN networks (xxhpgn), read from the .las
// and .los grid files of the current folder.
//
// Keyboard answers (standard input): four empty lines; then either two
// empty lines and Y (NAD 27 to NAD 83) or N (back), or A, the area code, an
// empty line and Y (NAD 83 to HPGN) or N (back); then the output file name,
// Y, the input file name, 2, N, Q.

#include <cctype>
#include <filesystem>
#include <iostream>

#include "StandIn.h"
#include "ngs/NgsGrids.h"

namespace zv::ngs {
namespace {

struct Request {
  bool forward = true;
  std::string areaCode;  // empty: NAD 27 / NAD 83
  std::string output, input;
};

bool ParseAnswers(const std::vector<std::string>& a, Request& r) {
  size_t next = 0;
  if (a.size() > 7 && a[4] == "A") {
    r.areaCode = a[5];
    r.forward = a[7] == "Y";
    next = 8;
  } else if (a.size() > 6) {
    r.forward = a[6] == "Y";
    next = 7;
  } else {
    return false;
  }
  if (a.size() < next + 3) return false;
  r.output = a[next];
  r.input = a[next + 2];
  return !r.output.empty() && !r.input.empty();
}

// Loads name.las and name.los; false (reported) when they cannot be read.
bool LoadArea(const std::string& folder, const std::string& name, NadconArea& area) {
  area.name = name;
  for (auto [ext, grid] : {std::pair{".las", &area.las}, std::pair{".los", &area.los}}) {
    const std::string file = name + ext;
    std::string error;
    if (!std::filesystem::exists(folder + "/" + file)) {
      Report("The grid file '" + file + "' was not found in '" + folder + "'.");
      return false;
    }
    if (!ReadShiftGridFile(folder + "/" + file, *grid, error)) {
      Report("The grid file '" + file + "' in '" + folder + "' can not be read: " + error + ".");
      return false;
    }
  }
  return true;
}

int Run() {
  Request request;
  if (!ParseAnswers(ReadAnswers(std::cin), request)) {
    Report("The keyboard answers do not name the conversion, the input and the output file.");
    return 1;
  }
  const std::string folder = CurrentFolder();
  std::vector<NadconArea> areas;
  if (!request.areaCode.empty()) {
    std::string name = request.areaCode + "hpgn";
    for (char& c : name) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    if (!LoadArea(folder, name, areas.emplace_back())) return 1;
  } else {
    for (const char* name : {"conus", "alaska", "hawaii", "prvi", "stlrnc", "stgeorge", "stpaul"}) {
      if (!std::filesystem::exists(folder + "/" + name + ".las")) continue;
      if (!LoadArea(folder, name, areas.emplace_back())) return 1;
    }
    if (areas.empty()) {
      Report("The NADCON grid files (conus.las and conus.los) were not found in '" + folder + "'.");
      return 1;
    }
  }
  std::string names;
  for (const NadconArea& a : areas) names += (names.empty() ? "" : ", ") + a.name;

  std::vector<InputPoint> points;
  if (!ReadInputPoints(request.input, points)) return 1;
  std::vector<std::string> lines{"NADCON 2.10 stand-in: latitude, longitude (west), name"};
  lines.reserve(points.size() + 1);
  int failures = 0;
  for (const InputPoint& p : points) {
    LatLon from{p.lat, EastLongitude(p.lonWest)};
    std::optional<LatLon> to;
    for (const NadconArea& area : areas) {
      to = request.forward ? NadconForward(area, from) : NadconReverse(area, from);
      if (to) break;
    }
    if (!to) {
      Report("Point " + Describe(p) + " lies outside the NADCON grids in '" + folder + "' (" +
             names + ").");
      ++failures;
      continue;
    }
    lines.push_back(Coordinates(to->lat, -to->lon) + std::string(10, ' ') + p.name);
  }
  if (!WriteOutput(request.output, lines)) return 1;
  return failures ? 2 : 0;
}

}  // namespace
}  // namespace zv::ngs

int main() {
  return zv::ngs::Run();
}
