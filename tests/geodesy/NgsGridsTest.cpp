// Grid files of the NGS programs: layouts and interpolation, checked
// against values worked by hand.

#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <sstream>

#include "geodesy/NgsGrids.h"
#include "geodesy/NgsTestSupport.h"

namespace zv {
namespace {

using test::MakeGeoidGrid;
using test::MakeShiftGrid;

int32_t Int32At(const std::string& bytes, size_t offset) {
  int32_t v;
  std::memcpy(&v, bytes.data() + offset, 4);
  return v;
}
float FloatAt(const std::string& bytes, size_t offset) {
  float v;
  std::memcpy(&v, bytes.data() + offset, 4);
  return v;
}

TEST(NgsGridsTest, ShiftGridFileHasFortranRecordsOfOneRowEach) {
  ShiftGrid g =
      MakeShiftGrid(-131.0, 20.0, 0.25, 30, 4, [](double x, double y) { return x + 1000 * y; });
  std::ostringstream out;
  WriteShiftGrid(out, g);
  const std::string bytes = out.str();
  const size_t record = 4 * 31;
  ASSERT_EQ(bytes.size(), record * 5);
  EXPECT_EQ(bytes.substr(0, 23), "NADCON EXTRACTED REGION");
  EXPECT_EQ(bytes.substr(56, 8), "NADGRD  ");
  EXPECT_EQ(Int32At(bytes, 64), 30);
  EXPECT_EQ(Int32At(bytes, 68), 4);
  EXPECT_EQ(Int32At(bytes, 72), 1);
  EXPECT_EQ(FloatAt(bytes, 76), -131.0f);
  EXPECT_EQ(FloatAt(bytes, 80), 0.25f);
  EXPECT_EQ(FloatAt(bytes, 84), 20.0f);
  // Row 2 (second from the south), column 3: after the row's leading int32.
  EXPECT_EQ(FloatAt(bytes, 2 * record + 4 + 4 * 2), static_cast<float>(-130.5 + 20250.0));

  std::istringstream in(bytes);
  ShiftGrid back;
  std::string error;
  ASSERT_TRUE(ReadShiftGrid(in, back, error)) << error;
  EXPECT_EQ(back.nc, 30);
  EXPECT_EQ(back.xmax(), -131.0 + 29 * 0.25);
  EXPECT_EQ(back.values, g.values);

  std::istringstream cut(bytes.substr(0, bytes.size() - 10));
  EXPECT_FALSE(ReadShiftGrid(cut, back, error));
  EXPECT_EQ(error, "the file ends in row 4 of 4");
}

TEST(NgsGridsTest, BilinearInterpolationInsideTheOuterEdgeOnly) {
  // South row 0 1 2, middle row 10 20 30, north row 5 5 5.
  const float rows[3][3] = {{0, 1, 2}, {10, 20, 30}, {5, 5, 5}};
  ShiftGrid g = MakeShiftGrid(-100, 40, 1, 3, 3, [&](double x, double y) {
    return rows[static_cast<int>(y - 40)][static_cast<int>(x + 100)];
  });
  // Cell SW 0, NW 10, SE 1, NE 20 at dx 0.25, dy 0.5:
  // 0 + 1 * 0.25 + 10 * 0.5 + (20 - 1 - 10 + 0) * 0.125 = 6.375.
  EXPECT_DOUBLE_EQ(*InterpolateBilinear(g, -99.75, 40.5), 6.375);
  // Upper right cell: SW 20, NW 5, SE 30, NE 5 at dx 0.5, dy 0.5 -> 15.
  EXPECT_DOUBLE_EQ(*InterpolateBilinear(g, -98.5, 41.5), 15.0);
  // On or outside the outer edge.
  EXPECT_FALSE(InterpolateBilinear(g, -100.0, 40.5));
  EXPECT_FALSE(InterpolateBilinear(g, -98.0, 40.5));
  EXPECT_FALSE(InterpolateBilinear(g, -99.5, 42.0));
  EXPECT_FALSE(InterpolateBilinear(g, -99.5, 39.99));

  g.values[4] = kVertconNoData;  // the middle node
  EXPECT_FALSE(InterpolateBilinear(g, -99.75, 40.5, kVertconNoData));
  EXPECT_TRUE(InterpolateBilinear(g, -99.75, 40.5));
}

TEST(NgsGridsTest, NadconShiftsAndItsIteratedReverse) {
  // Shifts in arc-seconds that vary across the grid.
  NadconArea area;
  area.las = MakeShiftGrid(-112, 45, 0.25, 9, 9, [](double x, double y) {
    return 0.5 + 0.75 * (x + 112) - 0.5 * (y - 45) + 0.25 * (x + 112) * (y - 45);
  });
  area.los = MakeShiftGrid(-112, 45, 0.25, 9, 9,
                           [](double x, double y) { return 3.0 - 0.25 * (x + 112) + (y - 45); });
  // The shift functions are bilinear in each cell, so interpolation is exact.
  LatLon nad27{45.7626543, -111.1864197};
  double dx = 0.8135803, dy = 0.7626543;
  double las = 0.5 + 0.75 * dx - 0.5 * dy + 0.25 * dx * dy;
  double los = 3.0 - 0.25 * dx + dy;
  std::optional<LatLon> nad83 = NadconForward(area, nad27);
  ASSERT_TRUE(nad83);
  EXPECT_NEAR(nad83->lat, nad27.lat + las / 3600, 1e-12);
  EXPECT_NEAR(nad83->lon, nad27.lon - los / 3600, 1e-12);

  std::optional<LatLon> back = NadconReverse(area, *nad83);
  ASSERT_TRUE(back);
  EXPECT_NEAR(back->lat, nad27.lat, 1e-9);
  EXPECT_NEAR(back->lon, nad27.lon, 1e-9);

  EXPECT_FALSE(NadconForward(area, {44.9, -111.5}));
}

TEST(NgsGridsTest, GeoidFilesReadInEitherByteOrder) {
  GeoidGrid g = MakeGeoidGrid(24.0, 230.0, 1.0 / 60, 5, 7,
                              [](double lat, double lon) { return -30.0 + lat - lon / 100; });
  for (bool big : {false, true}) {
    std::ostringstream out;
    WriteGeoidGrid(out, g, big);
    ASSERT_EQ(out.str().size(), 44u + 4 * 35);
    std::istringstream in(out.str());
    GeoidGrid back;
    std::string error;
    ASSERT_TRUE(ReadGeoidGrid(in, back, error)) << error;
    EXPECT_EQ(back.south, 24.0);
    EXPECT_EQ(back.west, 230.0);
    EXPECT_EQ(back.dlon, 1.0 / 60);
    EXPECT_EQ(back.nla, 5);
    EXPECT_EQ(back.nlo, 7);
    EXPECT_EQ(back.values, g.values);
  }
  std::istringstream junk(std::string(60, 'x'));
  GeoidGrid back;
  std::string error;
  EXPECT_FALSE(ReadGeoidGrid(junk, back, error));
  EXPECT_EQ(error, "the header does not mark 4-byte real values");
}

TEST(NgsGridsTest, GeoidInterpolationReproducesWhatItsPolynomialsHold) {
  // The 3 x 3 parabolas hold any product of quadratics in latitude and
  // longitude; the natural splines hold any bilinear surface, also in the
  // cells at the edge where the 6 x 6 window is shifted inward.
  auto quadratic = [](double lat, double lon) {
    double y = lat - 40, x = lon - 260;
    return -28.0 + 3 * y - 2 * x + 5 * y * y - 4 * x * x + 6 * x * y + 2 * x * x * y * y;
  };
  auto bilinear = [](double lat, double lon) {
    double y = lat - 40, x = lon - 260;
    return -28.0 + 3 * y - 2 * x + 6 * x * y;
  };
  const double step = 0.25;
  GeoidGrid q = MakeGeoidGrid(40, 260, step, 10, 12, quadratic);
  GeoidGrid b = MakeGeoidGrid(40, 260, step, 10, 12, bilinear);
  for (auto [lat, lon] : {std::pair{41.1, 261.3}, std::pair{40.05, 260.02}, std::pair{42.2, 262.7},
                          std::pair{41.0, 261.0}}) {
    EXPECT_NEAR(InterpolateBiquadratic(q, lat, lon), quadratic(lat, lon), 1e-4) << lat;
    EXPECT_NEAR(InterpolateSpline(b, lat, lon), bilinear(lat, lon), 1e-4) << lat;
  }
  EXPECT_TRUE(b.covers(42.25, 262.75));
  EXPECT_FALSE(b.covers(42.26, 262.0));

  // On a smooth surface of a real geoid's size the two methods agree within
  // a centimetre.
  auto smooth = [](double lat, double lon) {
    return -30.0 + 8 * std::sin(lat * 0.7) * std::cos(lon * 0.9);
  };
  GeoidGrid s = MakeGeoidGrid(40, 260, 1.0 / 60, 30, 30, smooth);
  EXPECT_NEAR(InterpolateSpline(s, 40.2345, 260.3456), InterpolateBiquadratic(s, 40.2345, 260.3456),
              0.01);
  EXPECT_NEAR(InterpolateSpline(s, 40.2345, 260.3456), smooth(40.2345, 260.3456), 0.001);
}

}  // namespace
}  // namespace zv
