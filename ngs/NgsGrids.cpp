#include "ngs/NgsGrids.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>
#include <fstream>
#include <istream>
#include <ostream>

namespace zv {

namespace {

uint32_t Load32(const unsigned char* p, bool bigEndian) {
  if (bigEndian) {
    return uint32_t{p[0]} << 24 | uint32_t{p[1]} << 16 | uint32_t{p[2]} << 8 | p[3];
  }
  return uint32_t{p[3]} << 24 | uint32_t{p[2]} << 16 | uint32_t{p[1]} << 8 | p[0];
}

uint64_t Load64(const unsigned char* p, bool bigEndian) {
  uint64_t hi = Load32(bigEndian ? p : p + 4, bigEndian);
  uint64_t lo = Load32(bigEndian ? p + 4 : p, bigEndian);
  return hi << 32 | lo;
}

int32_t LoadInt(const unsigned char* p, bool bigEndian) {
  return static_cast<int32_t>(Load32(p, bigEndian));
}
float LoadFloat(const unsigned char* p, bool bigEndian) {
  return std::bit_cast<float>(Load32(p, bigEndian));
}
double LoadDouble(const unsigned char* p, bool bigEndian) {
  return std::bit_cast<double>(Load64(p, bigEndian));
}

void Store32(std::string& out, uint32_t v, bool bigEndian) {
  for (int i = 0; i < 4; ++i) {
    int shift = bigEndian ? 24 - 8 * i : 8 * i;
    out += static_cast<char>((v >> shift) & 0xff);
  }
}
void StoreFloat(std::string& out, float v, bool bigEndian = false) {
  Store32(out, std::bit_cast<uint32_t>(v), bigEndian);
}
void StoreDouble(std::string& out, double v, bool bigEndian) {
  uint64_t bits = std::bit_cast<uint64_t>(v);
  uint32_t hi = static_cast<uint32_t>(bits >> 32), lo = static_cast<uint32_t>(bits);
  Store32(out, bigEndian ? hi : lo, bigEndian);
  Store32(out, bigEndian ? lo : hi, bigEndian);
}

bool ReadBytes(std::istream& in, unsigned char* buffer, size_t count) {
  in.read(reinterpret_cast<char*>(buffer), static_cast<std::streamsize>(count));
  return static_cast<size_t>(in.gcount()) == count;
}

// Grids larger than this are not NGS grids (the largest have about 10^7 nodes).
constexpr int64_t kMaxNodes = 200'000'000;

// Parabola through f(-1), f(0), f(1), evaluated at t.
double Parabola(double fm, double f0, double fp, double t) {
  return f0 + t * (fp - fm) / 2.0 + t * t * (fp - 2.0 * f0 + fm) / 2.0;
}

// Natural cubic spline through n equidistant values (unit spacing) at x in
// 0..n-1 (Numerical Recipes, eq. 3.3.7 with zero end second derivatives).
double NaturalSpline(const double* y, int n, double x) {
  double m[6] = {0, 0, 0, 0, 0, 0};
  double c[6] = {0, 0, 0, 0, 0, 0};
  // Tridiagonal system m[i-1] + 4 m[i] + m[i+1] = 6 (y[i+1] - 2 y[i] + y[i-1]).
  double d[6] = {0, 0, 0, 0, 0, 0};
  for (int i = 1; i < n - 1; ++i) {
    double rhs = 6.0 * (y[i + 1] - 2.0 * y[i] + y[i - 1]);
    double diag = 4.0 - (i > 1 ? c[i - 1] : 0.0);
    c[i] = 1.0 / diag;
    d[i] = (rhs - (i > 1 ? d[i - 1] : 0.0)) / diag;
  }
  for (int i = n - 2; i >= 1; --i) m[i] = d[i] - c[i] * m[i + 1];
  int k = std::clamp(static_cast<int>(std::floor(x)), 0, n - 2);
  double t = x - k, u = 1.0 - t;
  return u * y[k] + t * y[k + 1] + ((u * u * u - u) * m[k] + (t * t * t - t) * m[k + 1]) / 6.0;
}

double BilinearGeoid(const GeoidGrid& g, double lat, double lon) {
  double xg = (lon - g.west) / g.dlon, yg = (lat - g.south) / g.dlat;
  int j = std::clamp(static_cast<int>(std::floor(xg)), 0, std::max(g.nlo - 2, 0));
  int i = std::clamp(static_cast<int>(std::floor(yg)), 0, std::max(g.nla - 2, 0));
  int j1 = std::min(j + 1, g.nlo - 1), i1 = std::min(i + 1, g.nla - 1);
  double tx = xg - j, ty = yg - i;
  double south = g.at(i, j) + (g.at(i, j1) - g.at(i, j)) * tx;
  double north = g.at(i1, j) + (g.at(i1, j1) - g.at(i1, j)) * tx;
  return south + (north - south) * ty;
}

}  // namespace

bool ReadShiftGrid(std::istream& in, ShiftGrid& grid, std::string& error) {
  unsigned char head[96];
  if (!ReadBytes(in, head, 96)) {
    error = "the file is shorter than its header";
    return false;
  }
  int nc = LoadInt(head + 64, false), nr = LoadInt(head + 68, false);
  if (nc < 2 || nr < 2 || int64_t{nc} * nr > kMaxNodes) {
    error =
        "the header gives " + std::to_string(nc) + " columns and " + std::to_string(nr) + " rows";
    return false;
  }
  ShiftGrid g;
  g.nc = nc;
  g.nr = nr;
  g.xmin = LoadFloat(head + 76, false);
  g.dx = LoadFloat(head + 80, false);
  g.ymin = LoadFloat(head + 84, false);
  g.dy = LoadFloat(head + 88, false);
  if (!(g.dx > 0) || !(g.dy > 0)) {
    error = "the header gives no positive grid spacing";
    return false;
  }
  const size_t record = 4 * (static_cast<size_t>(nc) + 1);
  // The header record is padded to the record length (at least 96 bytes).
  if (record > 96) in.ignore(static_cast<std::streamsize>(record - 96));
  std::vector<unsigned char> row(record);
  g.values.resize(static_cast<size_t>(nc) * nr);
  for (int r = 0; r < nr; ++r) {
    if (!ReadBytes(in, row.data(), record)) {
      error = "the file ends in row " + std::to_string(r + 1) + " of " + std::to_string(nr);
      return false;
    }
    for (int c = 0; c < nc; ++c)
      g.values[static_cast<size_t>(r) * nc + c] = LoadFloat(row.data() + 4 * (c + 1), false);
  }
  grid = std::move(g);
  return true;
}

bool ReadShiftGridFile(const std::string& path, ShiftGrid& grid, std::string& error) {
  std::ifstream in(path, std::ios::binary);
  if (!in) {
    error = "the file cannot be opened";
    return false;
  }
  return ReadShiftGrid(in, grid, error);
}

void WriteShiftGrid(std::ostream& out, const ShiftGrid& grid, const std::string& identifier,
                    const std::string& program) {
  const size_t record = 4 * (static_cast<size_t>(grid.nc) + 1);
  std::string head(56, ' ');
  head.replace(0, std::min<size_t>(identifier.size(), 56), identifier, 0, 56);
  std::string name(8, ' ');
  name.replace(0, std::min<size_t>(program.size(), 8), program, 0, 8);
  head += name;
  Store32(head, static_cast<uint32_t>(grid.nc), false);
  Store32(head, static_cast<uint32_t>(grid.nr), false);
  Store32(head, 1, false);
  StoreFloat(head, static_cast<float>(grid.xmin));
  StoreFloat(head, static_cast<float>(grid.dx));
  StoreFloat(head, static_cast<float>(grid.ymin));
  StoreFloat(head, static_cast<float>(grid.dy));
  StoreFloat(head, 0.0f);
  head.resize(std::max(record, head.size()), '\0');
  out.write(head.data(), static_cast<std::streamsize>(head.size()));
  std::string row;
  for (int r = 0; r < grid.nr; ++r) {
    row.clear();
    Store32(row, 0, false);
    for (int c = 0; c < grid.nc; ++c) StoreFloat(row, grid.at(r, c));
    out.write(row.data(), static_cast<std::streamsize>(row.size()));
  }
}

std::optional<double> InterpolateBilinear(const ShiftGrid& grid, double x, double y,
                                          std::optional<float> noData) {
  if (!(x > grid.xmin && x < grid.xmax() && y > grid.ymin && y < grid.ymax())) {
    return std::nullopt;
  }
  double xg = (x - grid.xmin) / grid.dx, yg = (y - grid.ymin) / grid.dy;
  int col = std::min(static_cast<int>(xg), grid.nc - 2);
  int row = std::min(static_cast<int>(yg), grid.nr - 2);
  double dx = xg - col, dy = yg - row;
  float t1 = grid.at(row, col), t2 = grid.at(row + 1, col);
  float t3 = grid.at(row, col + 1), t4 = grid.at(row + 1, col + 1);
  if (noData && (t1 == *noData || t2 == *noData || t3 == *noData || t4 == *noData)) {
    return std::nullopt;
  }
  double a = t1, b = t3 - t1, c = t2 - t1, d = t4 - t3 - t2 + t1;
  return a + b * dx + c * dy + d * dx * dy;
}

namespace {

std::optional<LatLon> Shift(const NadconArea& area, LatLon p) {
  std::optional<double> las = InterpolateBilinear(area.las, p.lon, p.lat);
  std::optional<double> los = InterpolateBilinear(area.los, p.lon, p.lat);
  if (!las || !los) return std::nullopt;
  return LatLon{*las / 3600.0, -*los / 3600.0};
}

}  // namespace

std::optional<LatLon> NadconForward(const NadconArea& area, LatLon p) {
  std::optional<LatLon> s = Shift(area, p);
  if (!s) return std::nullopt;
  return LatLon{p.lat + s->lat, p.lon + s->lon};
}

std::optional<LatLon> NadconReverse(const NadconArea& area, LatLon p) {
  std::optional<LatLon> s = Shift(area, p);
  if (!s) return std::nullopt;
  LatLon estimate{p.lat - s->lat, p.lon - s->lon};
  for (int i = 0; i < 10; ++i) {
    std::optional<LatLon> forward = NadconForward(area, estimate);
    if (!forward) return std::nullopt;
    double dlat = p.lat - forward->lat, dlon = p.lon - forward->lon;
    estimate.lat += dlat;
    estimate.lon += dlon;
    if (std::fabs(dlat) <= 1e-9 && std::fabs(dlon) <= 1e-9) break;
  }
  return estimate;
}

bool GeoidGrid::covers(double lat, double lon) const {
  return lat >= south && lat <= north() && lon >= west && lon <= east();
}

bool ReadGeoidGrid(std::istream& in, GeoidGrid& grid, std::string& error, bool headerOnly) {
  unsigned char head[44];
  if (!ReadBytes(in, head, 44)) {
    error = "the file is shorter than its header";
    return false;
  }
  bool big = LoadInt(head + 40, false) != 1;
  if (big && LoadInt(head + 40, true) != 1) {
    error = "the header does not mark 4-byte real values";
    return false;
  }
  GeoidGrid g;
  g.south = LoadDouble(head, big);
  g.west = LoadDouble(head + 8, big);
  g.dlat = LoadDouble(head + 16, big);
  g.dlon = LoadDouble(head + 24, big);
  g.nla = LoadInt(head + 32, big);
  g.nlo = LoadInt(head + 36, big);
  if (g.nla < 2 || g.nlo < 2 || int64_t{g.nla} * g.nlo > kMaxNodes || !(g.dlat > 0) ||
      !(g.dlon > 0)) {
    error = "the header does not describe a grid";
    return false;
  }
  if (headerOnly) {
    grid = std::move(g);
    return true;
  }
  const size_t count = static_cast<size_t>(g.nla) * g.nlo;
  std::vector<unsigned char> data(count * 4);
  if (!ReadBytes(in, data.data(), data.size())) {
    error = "the file ends before its last row";
    return false;
  }
  g.values.resize(count);
  for (size_t i = 0; i < count; ++i) g.values[i] = LoadFloat(data.data() + 4 * i, big);
  grid = std::move(g);
  return true;
}

bool ReadGeoidGridFile(const std::string& path, GeoidGrid& grid, std::string& error,
                       bool headerOnly) {
  std::ifstream in(path, std::ios::binary);
  if (!in) {
    error = "the file cannot be opened";
    return false;
  }
  return ReadGeoidGrid(in, grid, error, headerOnly);
}

void WriteGeoidGrid(std::ostream& out, const GeoidGrid& grid, bool bigEndian) {
  std::string bytes;
  StoreDouble(bytes, grid.south, bigEndian);
  StoreDouble(bytes, grid.west, bigEndian);
  StoreDouble(bytes, grid.dlat, bigEndian);
  StoreDouble(bytes, grid.dlon, bigEndian);
  Store32(bytes, static_cast<uint32_t>(grid.nla), bigEndian);
  Store32(bytes, static_cast<uint32_t>(grid.nlo), bigEndian);
  Store32(bytes, 1, bigEndian);
  for (float v : grid.values) StoreFloat(bytes, v, bigEndian);
  out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
}

double InterpolateBiquadratic(const GeoidGrid& g, double lat, double lon) {
  if (g.nla < 3 || g.nlo < 3) return BilinearGeoid(g, lat, lon);
  double xg = (lon - g.west) / g.dlon, yg = (lat - g.south) / g.dlat;
  // The node nearest the point, kept one node inside the grid.
  int j = std::clamp(static_cast<int>(std::lround(xg)), 1, g.nlo - 2);
  int i = std::clamp(static_cast<int>(std::lround(yg)), 1, g.nla - 2);
  double t = xg - j, s = yg - i;
  double rows[3];
  for (int r = 0; r < 3; ++r) {
    int row = i - 1 + r;
    rows[r] = Parabola(g.at(row, j - 1), g.at(row, j), g.at(row, j + 1), t);
  }
  return Parabola(rows[0], rows[1], rows[2], s);
}

double InterpolateSpline(const GeoidGrid& g, double lat, double lon) {
  constexpr int kWindow = 6;
  if (g.nla < kWindow || g.nlo < kWindow) return BilinearGeoid(g, lat, lon);
  double xg = (lon - g.west) / g.dlon, yg = (lat - g.south) / g.dlat;
  // The window holds the two nodes around the point and two more on each
  // side, shifted to stay inside the grid.
  int j0 = std::clamp(static_cast<int>(std::floor(xg)) - 2, 0, g.nlo - kWindow);
  int i0 = std::clamp(static_cast<int>(std::floor(yg)) - 2, 0, g.nla - kWindow);
  double rows[kWindow], y[kWindow];
  for (int r = 0; r < kWindow; ++r) {
    for (int c = 0; c < kWindow; ++c) y[c] = g.at(i0 + r, j0 + c);
    rows[r] = NaturalSpline(y, kWindow, xg - j0);
  }
  return NaturalSpline(rows, kWindow, yg - i0);
}

double EastLongitude(double westDegrees) {
  double east = -westDegrees;
  east -= 360.0 * std::floor((east + 180.0) / 360.0);
  return east;
}

}  // namespace zv
