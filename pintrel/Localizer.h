#pragma once
// The localization tool's computation: grid coordinates of a VORN tagged
// file to local (ground) coordinates by a combined factor, and back.
//
// Grid to local divides every northing and easting by the factor; the header
// loses its HD and ZN lines and records them, with the factor, in three
// comment lines, so that local to grid (which multiplies) restores the grid
// file. The factor of a point is the grid scale factor of the zone's
// projection there times the elevation factor R / (R + h), R = sqrt(M N) of
// the zone's ellipsoid at the point's latitude and h its ellipsoid height.
// The file's format is kept: only the coordinate and header lines change.

#include <optional>
#include <string>
#include <vector>

#include "ngs/NgsGrids.h"

namespace zv::local {

// TRANS.JOB as the program writes it: input, output without its extension,
// then the mode and its text (grid to local) or the datum year, the zone
// code and the factor (local to grid).
struct LocalJob {
  bool gridToLocal = true;
  std::string input, outputStem;
  int mode = 1;  // 1 all points, 2 the factor given, 3 the factor at a point
  std::string modeText;
  std::string datumYear, zoneCode, factor;

  // The output stem with the input's extension.
  std::string outputPath() const;
};

// nullopt, with the reason, when the lines are no job.
std::optional<LocalJob> ParseJob(const std::vector<std::string>& lines, std::string& error);

// The geometric mean radius of curvature sqrt(M N) at latitude phi (radians)
// and the elevation factor R / (R + h).
double MeanRadius(double a, double e, double phi);
double ElevationFactor(double a, double e, double phi, double h);

// The factors of a grid position (northing and easting in the zone's linear
// units) at ellipsoid height h (metres), in a zone of zones.ini; latitude
// and west longitude in radians. nullopt when the zone or the position does
// not compute.
struct PointFactors {
  double latitude = 0, longitude = 0;
  double gridScale = 0, elevationFactor = 0, combined = 0;
};
std::optional<PointFactors> FactorsAt(const std::string& appFolder, const std::string& system,
                                      const std::string& zone, double northing, double easting,
                                      double h);

// Where a point's ellipsoid height came from.
enum class HeightSource { Ellipsoid, FileGeoid, GeoidGrid, Elevation, None };

// The geoid heights of the GEOID grids in one folder (GEOID09, 06, 03, 99:
// the newest model that covers a point answers).
class GeoidGrids {
 public:
  explicit GeoidGrids(const std::string& folder);
  // Metres at latitude and west longitude (radians), with the model's name;
  // nullopt outside every grid (or when a grid cannot be read).
  std::optional<double> height(double phi, double lambdaWest, std::string& model);

 private:
  struct File {
    std::string path, model;
    bool spline = false;  // GEOID06 and GEOID09
    GeoidGrid grid;       // the header; the values once used
    bool loaded = false, broken = false;
  };
  std::vector<File> files_;
};

// Runs the job: the output file (through a temporary file, so a failure
// leaves none) and, for a computed factor, the report of the points at
// reportPath. The application folder holds zones.ini, datums.ini,
// ellipsoids.ini and NGS/GEOID. Returns the message of a failure, empty on
// success.
std::string RunJob(const LocalJob& job, const std::string& appFolder,
                   const std::string& reportPath);

}  // namespace zv::local
