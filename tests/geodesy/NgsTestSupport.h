#pragma once
// Catalog texts, synthetic NGS grids in the real file layouts, and
// application folders with the shipped catalogs and the stand-in NGS
// programs of the build (also used by bench/conversion).

#include <filesystem>
#include <fstream>
#include <functional>
#include <string>

#include "ngs/NgsGrids.h"

namespace zv::test {

// An ini text from lines separated by '|', with CR LF line ends.
inline std::string Ini(const std::string& lines) {
  std::string text;
  for (char c : lines) text += c == '|' ? std::string("\r\n") : std::string(1, c);
  return text + "\r\n";
}

// A grid of nc x nr nodes from (xmin, ymin) with spacing step; f gives the
// value at (x, y).
inline ShiftGrid MakeShiftGrid(double xmin, double ymin, double step, int nc, int nr,
                               const std::function<double(double, double)>& f) {
  ShiftGrid g{nc, nr, xmin, step, ymin, step, {}};
  for (int r = 0; r < nr; ++r)
    for (int c = 0; c < nc; ++c)
      g.values.push_back(static_cast<float>(f(xmin + c * step, ymin + r * step)));
  return g;
}

// A geoid grid from (south, west) (west in 0-360 east) with spacing step.
inline GeoidGrid MakeGeoidGrid(double south, double west, double step, int nla, int nlo,
                               const std::function<double(double, double)>& f) {
  GeoidGrid g{south, west, step, step, nla, nlo, {}};
  for (int r = 0; r < nla; ++r)
    for (int c = 0; c < nlo; ++c)
      g.values.push_back(static_cast<float>(f(south + r * step, west + c * step)));
  return g;
}

inline void SaveShiftGrid(const std::string& path, const ShiftGrid& grid) {
  std::filesystem::create_directories(std::filesystem::path(path).parent_path());
  std::ofstream out(path, std::ios::binary);
  WriteShiftGrid(out, grid);
}

inline void SaveGeoidGrid(const std::string& path, const GeoidGrid& grid, bool bigEndian = false) {
  std::filesystem::create_directories(std::filesystem::path(path).parent_path());
  std::ofstream out(path, std::ios::binary);
  WriteGeoidGrid(out, grid, bigEndian);
}

// Copies NGS/<folder>/<name> of the build's application folder (a stand-in
// program) into the same place under appFolder.
inline void InstallStandIn(const std::string& appFolder, const std::string& folder,
                           const std::string& name) {
  namespace fs = std::filesystem;
  fs::create_directories(appFolder + "/NGS/" + folder);
  fs::copy_file(std::string(ZV_APP_DIR) + "/NGS/" + folder + "/" + name,
                appFolder + "/NGS/" + folder + "/" + name, fs::copy_options::overwrite_existing);
}

inline void InstallAllStandIns(const std::string& appFolder) {
  InstallStandIn(appFolder, "NADCON", "ndcon210");
  InstallStandIn(appFolder, "VERTCON", "vertcon");
  InstallStandIn(appFolder, "GEOID", "intg");
}

// Copies the shipped catalogs into appFolder.
inline void InstallCatalogs(const std::string& appFolder) {
  for (const char* name : {"zones.ini", "datums.ini", "ellipsoids.ini"}) {
    std::filesystem::copy_file(std::string(ZV_APP_DIR) + "/" + name, appFolder + "/" + name,
                               std::filesystem::copy_options::overwrite_existing);
  }
}

}  // namespace zv::test
