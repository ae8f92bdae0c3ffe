#pragma once
// The plan of a survey file without widgets: the points and chain polylines
// in plan coordinates, a grid index over the points with its level-of-detail
// query, the hit test of a click, the world-to-screen transform and the
// scale-bar length. Grid files are drawn with x = easting, y = northing;
// geographic files with x = east longitude and y = north latitude in degrees,
// so that west lies to the left.

#include <cstddef>
#include <cstdint>
#include <istream>
#include <optional>
#include <string>
#include <vector>

#include "survey/SurveyModel.h"

namespace zv {

struct PlanRect {
  double minX = 0, minY = 0, maxX = -1, maxY = -1;  // empty when max < min

  bool empty() const { return maxX < minX || maxY < minY; }
  bool contains(double x, double y) const {
    return x >= minX && x <= maxX && y >= minY && y <= maxY;
  }
  bool intersects(const PlanRect& o) const {
    return !empty() && !o.empty() && o.minX <= maxX && o.maxX >= minX && o.minY <= maxY &&
           o.maxY >= minY;
  }
  void add(double x, double y);
};

// World (plan) coordinates to the pixels of a viewport of width x height:
// the world point (centerX, centerY) lies in the middle, `scale` pixels per
// world unit, y upwards in the world and downwards on the screen.
struct PlanTransform {
  double centerX = 0, centerY = 0;
  double scale = 1;
  int width = 1, height = 1;

  double screenX(double x) const { return (x - centerX) * scale + width / 2.0; }
  double screenY(double y) const { return height / 2.0 - (y - centerY) * scale; }
  double worldX(double sx) const { return (sx - width / 2.0) / scale + centerX; }
  double worldY(double sy) const { return (height / 2.0 - sy) / scale + centerY; }
  // The world rectangle the viewport shows, widened by `marginPixels`.
  PlanRect visible(double marginPixels = 0) const;

  // Moves the view by a screen distance (the drawing follows the pointer).
  void panBy(double dx, double dy);
  // Zooms by `factor` keeping the world point under (sx, sy) in place.
  void zoomAbout(double sx, double sy, double factor);
  // The whole rectangle in view with a margin of `marginPixels` on each side.
  void fit(const PlanRect& bounds, double marginPixels);

  static constexpr double kMinScale = 1e-9;
  static constexpr double kMaxScale = 1e9;
};

// The largest length 1, 2 or 5 x 10^n not above `maxLength` (0 when
// `maxLength` is not a positive finite number).
double NiceLength(double maxLength);
// A nice length as text, "0.05", "200", with the unit after a blank
// (none when the unit is empty).
std::string ScaleLabel(double length, const std::string& unit);

// The buffers of one drawn frame, reused from frame to frame.
struct PlanFrame {
  bool detailed = false;              // true: `points`; false: `mask`
  std::vector<std::uint32_t> points;  // plan indices of the points in view
  std::vector<std::uint8_t> mask;     // one byte per pixel, 1 where occupied
  int stride = 0;                     // bytes per mask row (a multiple of 4)
};

class PlanModel {
 public:
  struct Chain {
    std::vector<std::uint32_t> points;  // plan indices in chain order
    PlanRect bounds;
  };

  PlanModel() = default;
  // The points of the file with plan coordinates (others are left out) and
  // the chains through them; a point-list name that matches no such point is
  // skipped (the first point of a name counts).
  static PlanModel Build(const FileHeader& header, const std::vector<SurveyPoint>& points,
                         const std::vector<SurveyChain>& chains);

  bool geographic() const { return geographic_; }
  // The unit of plan lengths: "m", "US ft", "ft", "deg" or "".
  const std::string& unit() const { return unit_; }

  std::size_t size() const { return x_.size(); }
  double x(std::uint32_t i) const { return x_[i]; }
  double y(std::uint32_t i) const { return y_[i]; }
  const std::string& name(std::uint32_t i) const { return names_[i]; }
  // The index of the point in the file's point list.
  std::uint32_t sourceIndex(std::uint32_t i) const { return source_[i]; }

  const std::vector<Chain>& chains() const { return chains_; }
  const PlanRect& bounds() const { return bounds_; }

  // Level of detail: the points within the view (its rectangle widened by
  // `marginPixels`) when there are at most `limit`, else a mask of the
  // viewport with one pixel per occupied grid cell (one per point where the
  // cells are larger than a pixel).
  void query(const PlanTransform& view, std::size_t limit, double marginPixels,
             PlanFrame& frame) const;

  // The point nearest to (x, y) within `radius` world units; the lower
  // file index wins a tie.
  std::optional<std::uint32_t> hit(double x, double y, double radius) const;

 private:
  void buildIndex();
  int column(double x) const;
  int row(double y) const;
  // Calls f(begin, end) for the plan-index runs of the cells meeting r.
  template <typename F>
  void forCells(const PlanRect& r, F&& f) const;

  bool geographic_ = false;
  std::string unit_;
  std::vector<double> x_, y_;
  std::vector<std::string> names_;
  std::vector<std::uint32_t> source_;
  std::vector<Chain> chains_;
  PlanRect bounds_;
  // Grid index: points are stored cell by cell (row-major); the points of
  // cell c are the plan indices cellStart_[c] .. cellStart_[c + 1] - 1.
  int columns_ = 0, rows_ = 0;
  double cellWidth_ = 1, cellHeight_ = 1;
  std::vector<std::uint32_t> cellStart_;
};

// Where each point of a tagged file is written: the bytes of the AC record
// that holds it, for every point the reader stores, in file order. With
// `chainSections` (points-and-chains and project files) "AC:CH" opens a chain
// rather than a point. A point stored before any point record (a file
// without "AC:PR") gets the lines before the first AC line.
struct RecordSpan {
  std::uint64_t begin = 0, end = 0;
};
std::vector<RecordSpan> PointRecordSpans(std::istream& in, bool chainSections);
// The record view of the bytes of one span of a file ("" when unreadable).
std::string RecordViewText(const std::string& path, const RecordSpan& span);

}  // namespace zv
