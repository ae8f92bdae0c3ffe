#include "survey/PlanModel.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <fstream>
#include <limits>
#include <numbers>
#include <string_view>
#include <unordered_map>

#include "survey/Listing.h"

namespace zv {

void PlanRect::add(double x, double y) {
  if (empty()) {
    minX = maxX = x;
    minY = maxY = y;
    return;
  }
  minX = std::min(minX, x);
  maxX = std::max(maxX, x);
  minY = std::min(minY, y);
  maxY = std::max(maxY, y);
}

PlanRect PlanTransform::visible(double marginPixels) const {
  const double m = marginPixels / scale;
  return {worldX(0) - m, worldY(height) - m, worldX(width) + m, worldY(0) + m};
}

void PlanTransform::panBy(double dx, double dy) {
  centerX -= dx / scale;
  centerY += dy / scale;
}

void PlanTransform::zoomAbout(double sx, double sy, double factor) {
  const double wx = worldX(sx), wy = worldY(sy);
  scale = std::clamp(scale * factor, kMinScale, kMaxScale);
  centerX = wx - (sx - width / 2.0) / scale;
  centerY = wy + (sy - height / 2.0) / scale;
}

void PlanTransform::fit(const PlanRect& bounds, double marginPixels) {
  if (bounds.empty()) return;
  centerX = (bounds.minX + bounds.maxX) / 2;
  centerY = (bounds.minY + bounds.maxY) / 2;
  const double w = std::max(1.0, width - 2 * marginPixels);
  const double h = std::max(1.0, height - 2 * marginPixels);
  const double dx = bounds.maxX - bounds.minX, dy = bounds.maxY - bounds.minY;
  // A single point gets a view one unit wide.
  const double inf = std::numeric_limits<double>::infinity();
  double s = std::min(dx > 0 ? w / dx : inf, dy > 0 ? h / dy : inf);
  if (s == inf) s = w;
  scale = std::clamp(s, kMinScale, kMaxScale);
}

double NiceLength(double maxLength) {
  if (!std::isfinite(maxLength) || maxLength <= 0) return 0;
  double power = std::pow(10.0, std::floor(std::log10(maxLength)));
  // log10 may land one decade off at exact powers of ten.
  if (power > maxLength) power /= 10;
  if (power * 10 <= maxLength) power *= 10;
  for (double step : {5.0, 2.0, 1.0})
    if (step * power <= maxLength * (1 + 1e-12)) return step * power;
  return power;
}

std::string ScaleLabel(double length, const std::string& unit) {
  // Enough decimals for the leading digit of a nice length, no trailing zeros.
  const int decimals =
      length > 0 && length < 1 ? static_cast<int>(std::ceil(-std::log10(length) - 1e-9)) : 0;
  char text[64];
  std::snprintf(text, sizeof text, "%.*f", std::min(decimals, 20), length);
  std::string out = text;
  if (!unit.empty()) out.append(1, ' ').append(unit);
  return out;
}

namespace {

constexpr std::uint32_t kNoPoint = UINT32_MAX;

std::string UnitAbbreviation(const std::string& unitName) {
  if (unitName == "Meters") return "m";
  if (unitName == "U.S. Survey Feet") return "US ft";
  if (unitName == "International Feet") return "ft";
  return {};
}

// An angle in radians to degrees in (-180, 180].
double Degrees180(double radians) {
  double d = std::fmod(radians * 180 / std::numbers::pi, 360.0);
  if (d > 180) d -= 360;
  if (d <= -180) d += 360;
  return d;
}

// The names of a chain's point list: "PL:" lines joined by CR LF, names
// separated by ",".
template <typename F>
void ForEachListedName(std::string_view text, F&& f) {
  while (!text.empty()) {
    size_t eol = text.find("\r\n");
    std::string_view line = text.substr(0, eol);
    text = eol == std::string_view::npos ? std::string_view() : text.substr(eol + 2);
    if (line.starts_with("PL:")) line.remove_prefix(3);
    while (!line.empty()) {
      size_t comma = line.find(',');
      std::string_view name = line.substr(0, comma);
      if (!name.empty()) f(name);
      if (comma == std::string_view::npos) break;
      line.remove_prefix(comma + 1);
    }
  }
}

}  // namespace

PlanModel PlanModel::Build(const FileHeader& header, const std::vector<SurveyPoint>& points,
                           const std::vector<SurveyChain>& chains) {
  PlanModel m;
  m.geographic_ = header.CoordinateSystem == kGeographicCoordinates;
  m.unit_ = m.geographic_ ? "deg" : UnitAbbreviation(header.HorizontalUnits);
  m.x_.reserve(points.size());
  m.y_.reserve(points.size());
  m.source_.reserve(points.size());
  for (size_t i = 0; i < points.size(); ++i) {
    const SurveyPoint& p = points[i];
    double x, y;
    if (m.geographic_) {
      if (p.Latitude == kNoValue || p.Longitude == kNoValue) continue;
      y = Degrees180(p.LatitudeHemisphere == "S" ? -p.Latitude : p.Latitude);
      x = Degrees180(p.LongitudeHemisphere == "E" ? p.Longitude : -p.Longitude);
    } else {
      if (p.GridMissing || p.Northing == kNoValue || p.Easting == kNoValue) continue;
      x = p.Easting;
      y = p.Northing;
    }
    if (!std::isfinite(x) || !std::isfinite(y)) continue;
    m.x_.push_back(x);
    m.y_.push_back(y);
    m.source_.push_back(static_cast<std::uint32_t>(i));
    m.bounds_.add(x, y);
  }

  // Chains are resolved to the kept points in file order; buildIndex then
  // renumbers them.
  if (!chains.empty()) {
    std::unordered_map<std::string_view, std::uint32_t> byName;
    byName.reserve(m.source_.size());
    for (std::uint32_t k = 0; k < m.source_.size(); ++k)
      byName.try_emplace(points[m.source_[k]].PointName, k);
    for (const SurveyChain& c : chains) {
      Chain chain;
      ForEachListedName(c.PointListLines, [&](std::string_view name) {
        auto found = byName.find(name);
        if (found != byName.end()) chain.points.push_back(found->second);
      });
      if (!chain.points.empty()) m.chains_.push_back(std::move(chain));
    }
  }
  std::vector<std::string> names;
  names.reserve(m.source_.size());
  for (std::uint32_t s : m.source_) names.push_back(points[s].PointName);
  m.names_ = std::move(names);
  m.buildIndex();
  return m;
}

// About four points to a cell, at most 1024 cells a side; the points are
// then reordered cell by cell.
void PlanModel::buildIndex() {
  const size_t n = x_.size();
  if (n == 0) {
    columns_ = rows_ = 0;
    cellStart_.assign(1, 0);
    return;
  }
  const double w = bounds_.maxX - bounds_.minX, h = bounds_.maxY - bounds_.minY;
  const double cells = std::clamp(n / 4.0, 1.0, 1024.0 * 1024.0);
  double side = w > 0 && h > 0 ? std::sqrt(w * h / cells) : std::max(w, h) / cells;
  if (!(side > 0)) side = 1;
  columns_ = static_cast<int>(std::clamp(std::ceil(w / side), 1.0, 1024.0));
  rows_ = static_cast<int>(std::clamp(std::ceil(h / side), 1.0, 1024.0));
  cellWidth_ = w > 0 ? w / columns_ : 1;
  cellHeight_ = h > 0 ? h / rows_ : 1;

  const size_t cellCount = static_cast<size_t>(columns_) * rows_;
  std::vector<std::uint32_t> cellOf(n);
  cellStart_.assign(cellCount + 1, 0);
  for (size_t i = 0; i < n; ++i) {
    cellOf[i] = static_cast<std::uint32_t>(row(y_[i]) * columns_ + column(x_[i]));
    ++cellStart_[cellOf[i] + 1];
  }
  for (size_t c = 0; c < cellCount; ++c) cellStart_[c + 1] += cellStart_[c];
  // A stable counting sort: old index -> new index.
  std::vector<std::uint32_t> next(cellStart_.begin(), cellStart_.end() - 1);
  std::vector<std::uint32_t> newIndex(n);
  for (size_t i = 0; i < n; ++i) newIndex[i] = next[cellOf[i]]++;
  auto permute = [&](auto& v) {
    std::remove_reference_t<decltype(v)> out(n);
    for (size_t i = 0; i < n; ++i) out[newIndex[i]] = std::move(v[i]);
    v = std::move(out);
  };
  permute(x_);
  permute(y_);
  permute(names_);
  permute(source_);
  for (Chain& c : chains_) {
    for (std::uint32_t& p : c.points) {
      p = newIndex[p];
      c.bounds.add(x_[p], y_[p]);
    }
  }
}

int PlanModel::column(double x) const {
  return static_cast<int>(std::clamp(std::floor((x - bounds_.minX) / cellWidth_), 0.0,
                                     static_cast<double>(columns_ - 1)));
}

int PlanModel::row(double y) const {
  return static_cast<int>(std::clamp(std::floor((y - bounds_.minY) / cellHeight_), 0.0,
                                     static_cast<double>(rows_ - 1)));
}

template <typename F>
void PlanModel::forCells(const PlanRect& r, F&& f) const {
  if (columns_ == 0 || !r.intersects(bounds_)) return;
  const int c0 = column(r.minX), c1 = column(r.maxX);
  const int r0 = row(r.minY), r1 = row(r.maxY);
  for (int rr = r0; rr <= r1; ++rr) {
    const size_t first = static_cast<size_t>(rr) * columns_;
    if (!f(first + c0, first + c1 + 1)) return;
  }
}

void PlanModel::query(const PlanTransform& view, std::size_t limit, double marginPixels,
                      PlanFrame& frame) const {
  const PlanRect r = view.visible(marginPixels);
  frame.points.clear();
  frame.detailed = true;
  // The points in view, until there are more than the limit.
  forCells(r, [&](size_t cellBegin, size_t cellEnd) {
    for (std::uint32_t i = cellStart_[cellBegin]; i < cellStart_[cellEnd]; ++i) {
      if (!r.contains(x_[i], y_[i])) continue;
      if (frame.points.size() == limit) {
        frame.detailed = false;
        return false;
      }
      frame.points.push_back(i);
    }
    return true;
  });
  if (frame.detailed) return;

  frame.points.clear();
  frame.stride = (std::max(view.width, 0) + 3) & ~3;
  frame.mask.assign(static_cast<size_t>(frame.stride) * std::max(view.height, 0), 0);
  auto mark = [&](std::uint32_t i) {
    const double sx = std::floor(view.screenX(x_[i])), sy = std::floor(view.screenY(y_[i]));
    if (sx >= 0 && sy >= 0 && sx < view.width && sy < view.height)
      frame.mask[static_cast<size_t>(sy) * frame.stride + static_cast<size_t>(sx)] = 1;
  };
  // Cells no larger than a pixel show their first point only.
  const bool perCell = cellWidth_ * view.scale <= 1 && cellHeight_ * view.scale <= 1;
  forCells(r, [&](size_t cellBegin, size_t cellEnd) {
    if (perCell) {
      for (size_t c = cellBegin; c < cellEnd; ++c)
        if (cellStart_[c] != cellStart_[c + 1]) mark(cellStart_[c]);
    } else {
      for (std::uint32_t i = cellStart_[cellBegin]; i < cellStart_[cellEnd]; ++i) mark(i);
    }
    return true;
  });
}

std::optional<std::uint32_t> PlanModel::hit(double x, double y, double radius) const {
  std::uint32_t best = kNoPoint;
  double bestDistance = radius * radius;
  forCells({x - radius, y - radius, x + radius, y + radius}, [&](size_t cellBegin, size_t cellEnd) {
    for (std::uint32_t i = cellStart_[cellBegin]; i < cellStart_[cellEnd]; ++i) {
      const double dx = x_[i] - x, dy = y_[i] - y, d = dx * dx + dy * dy;
      if (d < bestDistance ||
          (d == bestDistance && (best == kNoPoint || source_[i] < source_[best]))) {
        best = i;
        bestDistance = d;
      }
    }
    return true;
  });
  if (best == kNoPoint) return std::nullopt;
  return best;
}

std::vector<RecordSpan> PointRecordSpans(std::istream& in, bool chainSections) {
  std::vector<RecordSpan> spans;
  RecordSpan open;  // the record the working point was read from
  bool ended = false;
  bool inProject = false;
  std::uint64_t at = 0;
  std::string line;
  auto close = [&] {
    if (!ended) open.end = at;
    ended = true;
  };
  while (std::getline(in, line)) {
    const std::uint64_t next = at + line.size() + (in.eof() ? 0 : 1);
    std::string_view l(line);
    if (l.ends_with('\r')) l.remove_suffix(1);
    if (l.starts_with("AC:")) {
      close();
      std::string_view code = l.substr(3);
      if (code.starts_with("PR")) {
        inProject = true;
      } else if (!(chainSections && code.starts_with("CH"))) {
        if (!inProject) spans.push_back(open);
        open = {at, at};
        ended = false;
        inProject = false;
      } else {
        inProject = false;
      }
    } else if (l.starts_with("BG:") || l.starts_with("EG:")) {
      close();
    }
    at = next;
  }
  close();
  spans.push_back(open);
  return spans;
}

std::string RecordViewText(const std::string& path, const RecordSpan& span) {
  std::ifstream in(path, std::ios::binary);
  if (!in || span.end <= span.begin) return {};
  in.seekg(static_cast<std::streamoff>(span.begin));
  std::string bytes(span.end - span.begin, '\0');
  if (!in.read(bytes.data(), static_cast<std::streamsize>(bytes.size()))) return {};
  std::vector<std::string> lines;
  std::string_view rest = bytes;
  while (!rest.empty()) {
    size_t eol = rest.find('\n');
    std::string_view l = rest.substr(0, eol);
    if (l.ends_with('\r')) l.remove_suffix(1);
    lines.emplace_back(l);
    if (eol == std::string_view::npos) break;
    rest.remove_prefix(eol + 1);
  }
  std::string text;
  for (const std::string& l : ListToRecord(lines)) {
    if (!text.empty()) text += '\n';
    text += l;
  }
  return text;
}

}  // namespace zv
