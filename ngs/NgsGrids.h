#pragma once
// The NGS grid files behind the datum-shift programs and their
// interpolation: NADCON (.las/.los) and VERTCON (.94) share one layout,
// GEOID models (.bin) have their own. Layouts follow the NGS program
// documentation (NADCON 2.1, VERTCON 2.0, INTG for GEOID99 to GEOID09).
// Longitudes here are degrees, east-positive; latitudes degrees north.

#include <cstdint>
#include <iosfwd>
#include <optional>
#include <string>
#include <vector>

namespace zv {

// A NADCON or VERTCON grid. File: little-endian records of 4 x (nc + 1)
// bytes; record 1 is the header (char[56] identifier, char[8] program name,
// int32 nc, nr, nz, float32 xmin, dx, ymin, dy, angle); each further record
// is an int32 and one row of nc float32 values, south row first.
struct ShiftGrid {
  int nc = 0, nr = 0;
  double xmin = 0, dx = 0, ymin = 0, dy = 0;
  std::vector<float> values;  // nr rows of nc values, south row first

  float at(int row, int col) const { return values[static_cast<size_t>(row) * nc + col]; }
  double xmax() const { return xmin + (nc - 1) * dx; }
  double ymax() const { return ymin + (nr - 1) * dy; }
};

// False, with the reason, when the stream does not hold such a grid.
bool ReadShiftGrid(std::istream& in, ShiftGrid& grid, std::string& error);
bool ReadShiftGridFile(const std::string& path, ShiftGrid& grid, std::string& error);
void WriteShiftGrid(std::ostream& out, const ShiftGrid& grid,
                    const std::string& identifier = "NADCON EXTRACTED REGION",
                    const std::string& program = "NADGRD");

// Bilinear interpolation (NADCON subroutine INTRP): nullopt for a point on
// or outside the outer edge, or (with noData) when a corner holds it.
std::optional<double> InterpolateBilinear(const ShiftGrid& grid, double x, double y,
                                          std::optional<float> noData = std::nullopt);

// A NADCON area: its latitude (.las) and longitude (.los) shift grids in
// arc-seconds; the longitude shift is positive west.
struct NadconArea {
  std::string name;
  ShiftGrid las, los;
};

struct LatLon {
  double lat = 0, lon = 0;  // degrees, longitude east-positive
};

// NAD 27 to NAD 83 (or NAD 83 to HPGN): lat + las / 3600, lon - los / 3600.
std::optional<LatLon> NadconForward(const NadconArea& area, LatLon p);
// The reverse by iteration: subtract the shift, then correct by the
// difference of the forward shift until both components change by at most
// 1e-9 degree (at most 10 iterations).
std::optional<LatLon> NadconReverse(const NadconArea& area, LatLon p);

// VERTCON value 9999 marks no data.
inline constexpr float kVertconNoData = 9999.0f;

// A GEOID model file: float64 south latitude, west longitude (0-360 east),
// latitude and longitude spacing, int32 nla, nlo, ikind (1: float32), then
// nla rows of nlo float32 metres, south row first. Either byte order; the
// order is the one in which ikind reads as 1.
struct GeoidGrid {
  double south = 0, west = 0, dlat = 0, dlon = 0;
  int nla = 0, nlo = 0;
  std::vector<float> values;

  float at(int row, int col) const { return values[static_cast<size_t>(row) * nlo + col]; }
  double north() const { return south + (nla - 1) * dlat; }
  double east() const { return west + (nlo - 1) * dlon; }
  // lon in 0-360 east-positive.
  bool covers(double lat, double lon) const;
};

// With headerOnly the values are not read (values stays empty).
bool ReadGeoidGrid(std::istream& in, GeoidGrid& grid, std::string& error, bool headerOnly = false);
bool ReadGeoidGridFile(const std::string& path, GeoidGrid& grid, std::string& error,
                       bool headerOnly = false);
void WriteGeoidGrid(std::ostream& out, const GeoidGrid& grid, bool bigEndian = false);

// GEOID99/GEOID03 (INTG 2.x): a parabola through the three nodes nearest the
// point in each direction, first along the rows, then across them.
double InterpolateBiquadratic(const GeoidGrid& grid, double lat, double lon);
// GEOID06/GEOID09 (INTG 3.x): natural cubic splines over the 6 x 6 nodes
// around the point, first along the rows, then across them.
double InterpolateSpline(const GeoidGrid& grid, double lat, double lon);

// A west-positive longitude in degrees brought to east-positive -180..180.
double EastLongitude(double westDegrees);

}  // namespace zv
