#include <gtest/gtest.h>

#include <QAction>
#include <QApplication>
#include <QImage>
#include <QPlainTextEdit>
#include <QTest>
#include <QWheelEvent>
#include <cmath>
#include <numbers>
#include <set>
#include <sstream>

#include "editor/PlanView.h"
#include "editor/TextEditorWindow.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/PlanModel.h"
#include "survey/SurveyFiles.h"

namespace zv {
namespace {

using test::CrLf;

const QRgb kPoint = qRgb(200, 30, 30);
const QRgb kChain = qRgb(30, 90, 200);
const QRgb kPaper = qRgb(255, 255, 255);

SurveyPoint Grid(const std::string& name, double east, double north) {
  SurveyPoint p;
  p.PointName = name;
  p.Easting = east;
  p.Northing = north;
  return p;
}

SurveyPoint Geo(const std::string& name, double latDeg, const char* latHemi, double lonDeg,
                const char* lonHemi) {
  SurveyPoint p;
  p.PointName = name;
  p.Latitude = latDeg * std::numbers::pi / 180;
  p.Longitude = lonDeg * std::numbers::pi / 180;
  p.LatitudeHemisphere = latHemi;
  p.LongitudeHemisphere = lonHemi;
  return p;
}

SurveyChain ListedChain(const std::string& lines) {
  SurveyChain c;
  c.PointListLines = lines;
  return c;
}

FileHeader Header(const std::string& system, const std::string& units = "Meters") {
  FileHeader h;
  h.CoordinateSystem = system;
  h.HorizontalUnits = units;
  return h;
}

// The file indices of plan indices.
std::vector<std::uint32_t> Sources(const PlanModel& m, const std::vector<std::uint32_t>& plan) {
  std::vector<std::uint32_t> out;
  for (std::uint32_t i : plan) out.push_back(m.sourceIndex(i));
  return out;
}

// A square lattice of n x n points one unit apart, from (0, 0).
PlanModel Lattice(int n) {
  std::vector<SurveyPoint> points;
  for (int i = 0; i < n * n; ++i) {
    std::string name = "P";
    points.push_back(Grid(name.append(std::to_string(i)), i % n, i / n));
  }
  return PlanModel::Build(Header("State Plane 1983"), points, {});
}

TEST(PlanModelTest, NiceLengthsAndTheirLabels) {
  const struct {
    double max, nice;
  } lengths[] = {{7, 5},         {1, 1},   {1000, 1000},  {999.9, 500},    {0.3, 0.2},
                 {0.0999, 0.05}, {19, 10}, {2, 2},        {4.99e-7, 2e-7}, {123456, 100000},
                 {0, 0},         {-5, 0},  {INFINITY, 0}, {NAN, 0}};
  for (const auto& c : lengths) EXPECT_DOUBLE_EQ(NiceLength(c.max), c.nice) << c.max;

  const struct {
    double length;
    const char* unit;
    const char* text;
  } labels[] = {{0.05, "m", "0.05 m"}, {200, "US ft", "200 US ft"}, {0.001, "deg", "0.001 deg"},
                {5, "", "5"},          {0.2, "ft", "0.2 ft"},       {1e-6, "deg", "0.000001 deg"}};
  for (const auto& c : labels) EXPECT_EQ(ScaleLabel(c.length, c.unit), c.text);
}

TEST(PlanModelTest, KeepsPointsWithPlanCoordinatesInTheFilesFrame) {
  SurveyPoint missing = Grid("GM", 5, 5);
  missing.GridMissing = true;
  const std::vector<SurveyPoint> grid = {Grid("A", 10, 20), Grid("NO_E", kNoValue, 3), missing,
                                         Grid("NO_N", 4, kNoValue), Grid("B", -5, 40)};
  PlanModel g = PlanModel::Build(Header("State Plane 1983", "U.S. Survey Feet"), grid, {});
  ASSERT_EQ(g.size(), 2u);
  const PlanRect b = g.bounds();
  EXPECT_EQ((std::vector{b.minX, b.minY, b.maxX, b.maxY}), (std::vector<double>{-5, 20, 10, 40}));
  EXPECT_FALSE(g.geographic());
  EXPECT_EQ(g.unit() + "|" + PlanModel::Build(Header("X", "International Feet"), grid, {}).unit() +
                "|" + PlanModel::Build(Header("X", ""), grid, {}).unit(),
            "US ft|ft|");

  // Geographic: x is the east longitude and y the north latitude, in degrees.
  const struct {
    SurveyPoint point;
    double x, y;
  } geo[] = {{Geo("W", 45, "N", 90, "W"), -90, 45},
             {Geo("E", 10, "S", 10, "E"), 10, -10},
             {Geo("W350", 1, "N", 350, "W"), 10, 1},
             {Geo("E270", 0, "N", 270, "E"), -90, 0}};
  for (const auto& c : geo) {
    SCOPED_TRACE(c.point.PointName);
    PlanModel m = PlanModel::Build(Header(kGeographicCoordinates), {c.point}, {});
    ASSERT_EQ(m.size(), 1u);
    EXPECT_NEAR(m.x(0), c.x, 1e-9);
    EXPECT_NEAR(m.y(0), c.y, 1e-9);
    EXPECT_EQ(m.unit(), "deg");
  }
  // A grid point without latitude is not drawn in a geographic file.
  EXPECT_EQ(PlanModel::Build(Header(kGeographicCoordinates), grid, {}).size(), 0u);
}

TEST(PlanModelTest, ChainsFollowTheirPointListsThroughDrawnPoints) {
  SurveyPoint undrawn = Grid("U", kNoValue, kNoValue);
  const std::vector<SurveyPoint> points = {Grid("A", 0, 0), Grid("B", 1, 0), Grid("C", 1, 1),
                                           undrawn, Grid("A", 9, 9)};
  const std::vector<SurveyChain> chains = {
      ListedChain("PL:C,B\r\nPL:A,Z,U"),  // Z unknown, U has no position
      ListedChain("PL:Z"),                // nothing drawn: left out
      ListedChain("PL:B,,A,")};
  PlanModel m = PlanModel::Build(Header("X"), points, chains);
  ASSERT_EQ(m.chains().size(), 2u);
  // The first of two points named A counts.
  EXPECT_EQ(Sources(m, m.chains()[0].points), (std::vector<std::uint32_t>{2, 1, 0}));
  EXPECT_EQ(Sources(m, m.chains()[1].points), (std::vector<std::uint32_t>{1, 0}));
  const PlanRect b = m.chains()[0].bounds;
  EXPECT_EQ((std::vector{b.minX, b.minY, b.maxX, b.maxY}), (std::vector<double>{0, 0, 1, 1}));
}

TEST(PlanModelTest, LevelOfDetailListsTheViewOrMarksItsPixels) {
  const PlanModel m = Lattice(100);
  // Brute force: the points inside a view widened by the margin.
  auto inside = [&](const PlanTransform& t, double margin) {
    std::set<std::uint32_t> s;
    const PlanRect r = t.visible(margin);
    for (std::uint32_t i = 0; i < m.size(); ++i)
      if (r.contains(m.x(i), m.y(i))) s.insert(i);
    return s;
  };
  const struct {
    PlanTransform view;
    std::size_t limit;
    double margin;
    bool detailed;
  } cases[] = {
      {{50, 50, 10, 100, 80}, 1000, 0, true},     // 10 x 8 units: 11 x 9 points
      {{50, 50, 10, 100, 80}, 98, 0, false},      // one short
      {{50, 50, 10, 100, 80}, 99, 0, true},       // exactly the limit
      {{50, 50, 10, 100, 80}, 1000, 10, true},    // one unit more on every side
      {{-20, -20, 10, 100, 80}, 10, 0, true},     // outside: nothing
      {{99.5, 0, 20, 40, 40}, 1000, 0, true},     // a corner of the lattice
      {{50, 50, 0.5, 200, 200}, 1000, 0, false},  // all of it, cells under a pixel
      {{50, 50, 3, 400, 400}, 1000, 0, false},    // all of it, cells over a pixel
  };
  PlanFrame frame;
  for (const auto& c : cases) {
    SCOPED_TRACE(testing::Message()
                 << c.view.centerX << "," << c.view.scale << " limit " << c.limit);
    m.query(c.view, c.limit, c.margin, frame);
    EXPECT_EQ(frame.detailed, c.detailed);
    const std::set<std::uint32_t> expected = inside(c.view, c.margin);
    if (c.detailed) {
      EXPECT_EQ(std::set<std::uint32_t>(frame.points.begin(), frame.points.end()), expected);
      EXPECT_EQ(frame.points.size(), expected.size());  // no point twice
      continue;
    }
    ASSERT_EQ(frame.stride % 4, 0);
    ASSERT_EQ(frame.mask.size(), static_cast<size_t>(frame.stride) * c.view.height);
    // Every marked pixel holds a point; every point's pixel is marked where
    // a cell is larger than a pixel, and at least one pixel near it otherwise.
    std::set<std::pair<int, int>> pixels;
    for (std::uint32_t i : expected) {
      const int x = static_cast<int>(std::floor(c.view.screenX(m.x(i))));
      const int y = static_cast<int>(std::floor(c.view.screenY(m.y(i))));
      if (x < c.view.width && y < c.view.height) pixels.insert({x, y});
    }
    int marked = 0;
    for (int y = 0; y < c.view.height; ++y) {
      for (int x = 0; x < c.view.width; ++x) {
        if (!frame.mask[static_cast<size_t>(y) * frame.stride + x]) continue;
        ++marked;
        EXPECT_TRUE(pixels.count({x, y})) << x << "," << y;
      }
    }
    if (c.view.scale >= 1) {
      EXPECT_EQ(marked, static_cast<int>(pixels.size()));
      continue;
    }
    // Cells under a pixel: a mark within a pixel of every point.
    for (auto [px, py] : pixels) {
      bool near = false;
      for (int y = std::max(py - 1, 0); y <= std::min(py + 1, c.view.height - 1); ++y)
        for (int x = std::max(px - 1, 0); x <= std::min(px + 1, c.view.width - 1); ++x)
          near = near || frame.mask[static_cast<size_t>(y) * frame.stride + x];
      EXPECT_TRUE(near) << px << "," << py;
    }
  }
}

TEST(PlanModelTest, HitTestFindsTheNearestPointWithinTheRadius) {
  // Y comes first in the file, after O and X in the index (cells by rows from the south).
  const std::vector<SurveyPoint> points = {Grid("Y", 0, 10), Grid("X", 10, 0), Grid("D1", 10, 10),
                                           Grid("D2", 10, 10), Grid("O", 0, 0)};
  const PlanModel m = PlanModel::Build(Header("X"), points, {});
  const struct {
    double x, y, radius;
    int source;  // -1: none
  } cases[] = {{1, 1, 2, 4},
               {5, 0, 2, -1},
               {9, 9, 3, 2} /* D1 before D2 */,
               {6, 0, 5, 1},
               {3, 4, 5, 4} /* on the circle */,
               {-40, 5, 3, -1},
               {5, 5, 100, 0} /* all equally near */,
               {0, 8.5, 1, -1},
               {0, 8.5, 1.5, 0}};
  for (const auto& c : cases) {
    auto hit = m.hit(c.x, c.y, c.radius);
    EXPECT_EQ(hit ? static_cast<int>(m.sourceIndex(*hit)) : -1, c.source)
        << c.x << "," << c.y << " r " << c.radius;
  }
  EXPECT_FALSE(PlanModel().hit(0, 0, 1));
}

TEST(PlanModelTest, TransformZoomsAboutThePointerAndFitsTheBounds) {
  PlanTransform t{100, 200, 2, 300, 200};
  EXPECT_DOUBLE_EQ(t.screenX(110), 170);
  EXPECT_DOUBLE_EQ(t.screenY(210), 80);  // north is up
  t.zoomAbout(30, 40, 4);
  EXPECT_DOUBLE_EQ(t.scale, 8);
  EXPECT_NEAR(t.worldX(30), 100 + (30 - 150) / 2.0, 1e-9);
  EXPECT_NEAR(t.worldY(40), 200 + (100 - 40) / 2.0, 1e-9);
  const double wx = t.worldX(10), wy = t.worldY(10);
  t.panBy(5, -3);  // the drawing follows the pointer
  EXPECT_NEAR(t.screenX(wx), 15, 1e-9);
  EXPECT_NEAR(t.screenY(wy), 7, 1e-9);

  const struct {
    PlanRect bounds;
    double scale, cx, cy;
  } fits[] = {{{0, 0, 100, 50}, 2, 50, 25},   // the height binds
              {{0, 0, 100, 10}, 2.2, 50, 5},  // the width binds
              {{4, 0, 4, 50}, 2, 4, 25},      // no width: the height
              {{7, 3, 7, 3}, 220, 7, 3}};     // one point: a unit wide
  for (const auto& f : fits) {
    PlanTransform v{0, 0, 1, 240, 120};
    v.fit(f.bounds, 10);
    EXPECT_EQ((std::vector{v.scale, v.centerX, v.centerY}), (std::vector{f.scale, f.cx, f.cy}));
  }
}

// The record spans agree with the readers' point lists, and each gives the
// record view of its point.
TEST(PlanModelTest, RecordSpansFollowTheReadersSectionRules) {
  const struct {
    const char* name;
    std::vector<std::string> lines;
    bool chains;
    std::vector<std::string> records;  // record view per point, lines joined by "|"
  } cases[] = {
      {"control",
       {"AC:PR", "UL:M", "AC:OS", "PN:1", "YC:1", "AC:OS", "PN:2", "XC:2", "PD:LONG"},
       false,
       {"AC:OS  PN:1  YC:1", "AC:OS  PN:2  XC:2  PD:LONG"}},
      {"no project section", {"PR:Job", "AC:OS", "PN:1"}, false, {"PR:Job", "AC:OS  PN:1"}},
      {"no AC lines", {"PN:7", "YC:1"}, false, {"PN:7  YC:1"}},
      {"control AC:CH is a point",
       {"AC:PR", "AC:OS", "PN:1", "AC:CH", "PN:2"},
       false,
       {"AC:OS  PN:1", "AC:CH  PN:2"}},
      {"chains",
       {"AC:PR", "AC:PD", "PN:1", "AC:PD", "PN:2", "BG:BEGIN CHAIN LIST", "AC:CH", "PL:1,2",
        "EG:END CHAIN LIST", "CP:01/02/2026 9:00:00"},
       true,
       {"AC:PD  PN:1", "AC:PD  PN:2"}},
      {"point after a chain",
       {"AC:PR", "AC:SS", "PN:1", "AC:CH", "PL:1,2", "AC:SS", "PN:2"},
       true,
       {"AC:SS  PN:1", "AC:SS  PN:2"}},
  };
  test::TempDir dir;
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    const std::string text = CrLf(c.lines);
    std::istringstream in(text);
    const std::vector<RecordSpan> spans = PointRecordSpans(in, c.chains);

    ScriptedUi ui;
    WorkArea work;
    std::istringstream again(text);
    ASSERT_TRUE(c.chains ? ReadProjectStream(ui, work, again, "f")
                         : ReadControlStream(ui, work, again, "f"));
    EXPECT_EQ(spans.size(), work.InputPoints.size());

    const std::string path = dir.write("f.txt", text);
    std::vector<std::string> records;
    for (const RecordSpan& s : spans) {
      std::string r = RecordViewText(path, s);
      for (char& ch : r) ch = ch == '\n' ? '|' : ch;
      records.push_back(r);
    }
    EXPECT_EQ(records, c.records);
  }
}

// ---- The widget and its window ----

class PlanViewTest : public ::testing::Test {
 protected:
  // Draws `m` at one pixel per unit on a 200 x 100 view centred on (0, 0).
  QImage Draw(PlanModel m, double cx = 0, double cy = 0, double scale = 1) {
    view.setModel(std::move(m));
    view.resize(200, 100);
    view.setView(cx, cy, scale);
    return view.toImage(200, 100);
  }
  std::string Write(const std::string& name, const std::vector<std::string>& lines) {
    return dir.write(name, CrLf(lines));
  }
  static std::vector<QWidget*> PlanWindows() {
    std::vector<QWidget*> out;
    for (QWidget* w : QApplication::topLevelWidgets())
      if (w->objectName() == "frmPlanView" && !w->testAttribute(Qt::WA_WState_Hidden))
        out.push_back(w);
    return out;
  }
  void TearDown() override {
    for (QWidget* w : PlanWindows()) delete w;
  }

  test::TempDir dir;
  ScriptedUi ui;
  PlanView view;
};

TEST_F(PlanViewTest, PointsAndTheirChainLandOnTheExpectedPixels) {
  // (10, 20) -> pixel (110, 30); (-50, -10) -> pixel (50, 60). Names off.
  view.setLabels(false);
  const QImage image = Draw(PlanModel::Build(Header("X"), {Grid("A", 10, 20), Grid("B", -50, -10)},
                                             {ListedChain("PL:A,B")}));
  ASSERT_EQ(image.size(), QSize(200, 100));
  for (QPoint at : {QPoint(110, 30), QPoint(108, 28), QPoint(112, 32), QPoint(50, 60)})
    EXPECT_EQ(image.pixel(at), kPoint) << at.x() << "," << at.y();
  // Along the segment between the symbols, and off it.
  for (double t = 0.1; t < 0.95; t += 0.1) {
    const QPointF p = QPointF(110, 30) * (1 - t) + QPointF(50, 60) * t;
    const int x = static_cast<int>(p.x()), y = static_cast<int>(std::lround(p.y()));
    const bool onLine = image.pixel(x, y) == kChain || image.pixel(x, y - 1) == kChain ||
                        image.pixel(x, y + 1) == kChain;
    EXPECT_TRUE(onLine) << "t=" << t;
    EXPECT_EQ(image.pixel(x, y + 12), kPaper) << "t=" << t;
  }

  // Names sit to the right of their symbols.
  auto inked = [](const QImage& im) {
    int n = 0;
    for (int y = 15; y < 35; ++y)
      for (int x = 115; x < 160; ++x) n += qGray(im.pixel(x, y)) < 128;
    return n;
  };
  EXPECT_EQ(inked(image), 0);
  view.setLabels(true);
  EXPECT_GT(inked(view.toImage(200, 100)), 0);
}

TEST_F(PlanViewTest, GeographicFilesHaveWestOnTheLeft) {
  const QImage image =
      Draw(PlanModel::Build(Header(kGeographicCoordinates),
                            {Geo("W", 45, "N", 90, "W"), Geo("E", 45, "N", 89, "W")}, {}),
           -89.5, 45, 100);
  EXPECT_EQ(image.pixel(50, 50), kPoint);   // 90 W
  EXPECT_EQ(image.pixel(150, 50), kPoint);  // 89 W
}

TEST_F(PlanViewTest, ManyPointsInViewAreDrawnAsAMask) {
  view.setModel(Lattice(120));  // 14,400 points
  view.resize(300, 300);
  view.fitAll();
  const QImage image = view.grab().toImage();
  EXPECT_FALSE(view.lastFrameDetailed());
  // 1.8 pixels apart: a pixel of its own for every point.
  int marked = 0;
  for (int y = 0; y < image.height(); ++y)
    for (int x = 0; x < image.width(); ++x) marked += image.pixel(x, y) == kPoint;
  EXPECT_EQ(marked, 120 * 120);
  view.setView(60, 60, 30);  // 10 x 10 units
  view.grab();
  EXPECT_TRUE(view.lastFrameDetailed());
}

TEST_F(PlanViewTest, WheelZoomsAboutThePointerKeysPanAndFit) {
  view.setModel(Lattice(11));
  view.resize(400, 300);
  view.show();
  view.setView(5, 5, 10);
  const QPointF at(40, 30);
  const double wx = view.transform().worldX(at.x()), wy = view.transform().worldY(at.y());
  QWheelEvent wheel(at, view.mapToGlobal(at), {}, {0, 240}, Qt::NoButton, Qt::NoModifier,
                    Qt::NoScrollPhase, false);
  QApplication::sendEvent(&view, &wheel);
  EXPECT_NEAR(view.transform().scale, 10 * 1.25 * 1.25, 1e-9);
  EXPECT_NEAR(view.transform().worldX(at.x()), wx, 1e-9);
  EXPECT_NEAR(view.transform().worldY(at.y()), wy, 1e-9);

  const struct {
    Qt::Key key;
    double dx, dy;  // the move of the view's centre, in pixels
  } keys[] = {{Qt::Key_Left, -50, 0},
              {Qt::Key_Right, 50, 0},
              {Qt::Key_Up, 0, 37.5},
              {Qt::Key_Down, 0, -37.5}};
  for (const auto& k : keys) {
    const PlanTransform before = view.transform();
    QTest::keyClick(&view, k.key);
    EXPECT_NEAR((view.transform().centerX - before.centerX) * before.scale, k.dx, 1e-9) << k.key;
    EXPECT_NEAR((view.transform().centerY - before.centerY) * before.scale, k.dy, 1e-9) << k.key;
  }
  const double scale = view.transform().scale;
  for (Qt::Key k : {Qt::Key_Plus, Qt::Key_Plus, Qt::Key_Minus}) QTest::keyClick(&view, k);
  EXPECT_NEAR(view.transform().scale, scale * 1.5, 1e-9);
  QTest::keyClick(&view, Qt::Key_F);
  EXPECT_NEAR(view.transform().centerX, 5, 1e-9);
  EXPECT_NEAR(view.transform().scale, 18, 1e-9);  // 10 units in 300 - 2 x 60 pixels

  // A drag moves the drawing with the pointer.
  const double before = view.transform().screenX(0);
  QTest::mousePress(&view, Qt::LeftButton, {}, QPoint(100, 50));
  QMouseEvent move(QEvent::MouseMove, QPointF(130, 50), view.mapToGlobal(QPointF(130, 50)),
                   Qt::NoButton, Qt::LeftButton, Qt::NoModifier);
  QApplication::sendEvent(&view, &move);
  QTest::mouseRelease(&view, Qt::LeftButton, {}, QPoint(130, 50));
  EXPECT_NEAR(view.transform().screenX(0), before + 30, 1e-9);
}

TEST_F(PlanViewTest, OpenReadsWithTheReaderOfTheExtension) {
  const std::string blank = Write("blank.CTL", {"AC:PR", "", "AC:OS"});
  const std::string gone = dir.file("gone.PAC");
  const struct {
    std::string path;
    std::string message;  // "" for a window
  } cases[] = {
      {gone, "The file '" + gone + "' can not be found."},
      {blank, "Invalid VORN Control File '" + blank +
                  "'.\r\nError on line 2.\r\nAn VORN Control File can not contain blank lines."},
      {Write("job.OUT", {"AC:PR"}),
       "There is no plan view of the file '" + dir.file("job.OUT") + "'."},
      {Write("job.ctl", {"AC:PR", "AC:OS", "PN:1", "YC:1", "XC:2"}), ""},
      {Write("job.PAC.rec", {"unused"}) + "",
       "The file '" + dir.file("job.PAC") + "' can not be found."},
  };
  for (const auto& c : cases) {
    ui.boxes.clear();
    QWidget* w = OpenPlanView(ui, c.path);
    EXPECT_EQ(ui.boxes.empty() ? "" : ui.onlyText(), c.message) << c.path;
    EXPECT_EQ(w != nullptr, c.message.empty()) << c.path;
    delete w;
  }
  EXPECT_TRUE(PlanWindows().empty());
}

TEST_F(PlanViewTest, ClickShowsThePointsRecordAndExportsWriteFiles) {
  const std::string path =
      Write("site.PAC", {"AC:PR", "UL:M", "AC:PD", "PN:CP1", "YY:100.0", "XX:200.0", "PD:IRON PIN",
                         "AC:PD", "PN:CP2", "YY:140.0", "XX:260.0", "FE:BM", "BG:BEGIN CHAIN LIST",
                         "AC:CH", "PL:CP1,CP2", "EG:END CHAIN LIST"});
  auto* window = qobject_cast<PlanWindow*>(OpenPlanView(ui, path));
  ASSERT_NE(window, nullptr);
  PlanView* plan = window->view();
  QApplication::processEvents();
  ASSERT_EQ(plan->model().chains().size(), 1u);

  const PlanTransform t = plan->transform();
  const QPoint cp2(static_cast<int>(t.screenX(260)), static_cast<int>(t.screenY(140)));
  QTest::mouseClick(plan, Qt::LeftButton, {}, cp2 + QPoint(2, -2));
  EXPECT_TRUE(window->recordPanel()->isVisible());
  EXPECT_EQ(window->recordPanel()->toPlainText(), "AC:PD  PN:CP2  YY:140.0  XX:260.0  FE:BM");
  QTest::mouseClick(plan, Qt::LeftButton, {}, QPoint(2, 2));  // nothing there: kept
  EXPECT_EQ(window->recordPanel()->toPlainText(), "AC:PD  PN:CP2  YY:140.0  XX:260.0  FE:BM");

  ui.files = {dir.file("plan.png"), dir.file("plan.pdf"), std::nullopt};
  window->exportPng();
  window->exportPdf();
  window->exportPng();  // cancelled
  ASSERT_EQ(ui.fileDialogs.size(), 3u);
  EXPECT_EQ(ui.fileDialogs[0].title + "|" + ui.fileDialogs[0].filter,
            "Export PNG|PNG Images (*.png)|*.png");
  EXPECT_EQ(ui.fileDialogs[1].filter, "PDF Files (*.pdf)|*.pdf");
  const QImage png(QString::fromStdString(dir.file("plan.png")));
  ASSERT_FALSE(png.isNull());
  EXPECT_EQ(png.size(), plan->size());
  // The panel took room: the plan was fitted again.
  const PlanTransform shown = plan->transform();
  EXPECT_EQ(png.pixel(static_cast<int>(shown.screenX(260)), static_cast<int>(shown.screenY(140))),
            kPoint);
  EXPECT_EQ(test::ReadFile(dir.file("plan.pdf")).substr(0, 5), "%PDF-");
  EXPECT_TRUE(ui.boxes.empty());

  ui.files = {dir.file("no/such/folder/plan.png")};
  window->exportPng();
  EXPECT_EQ(ui.onlyText(),
            "The file '" + dir.file("no/such/folder/plan.png") + "' could not be written.");
}

TEST_F(PlanViewTest, EditorViewMenuOpensThePlanOfItsFileInBothViews) {
  const std::string path = Write("job.CTL", {"AC:PR", "AC:OS", "PN:1", "YC:1", "XC:2"});
  TextEditorWindow editor(ui);
  editor.showTextEditor(QString::fromStdString(path), "VORN Control Files (*.CTL)", true);
  auto* plan = editor.findChild<QAction*>("mnuViewPlan");
  ASSERT_NE(plan, nullptr);
  EXPECT_EQ(plan->text(), "&Plan View");
  plan->trigger();
  editor.viewRecord();
  plan->trigger();
  const std::vector<QWidget*> windows = PlanWindows();
  ASSERT_EQ(windows.size(), 2u);
  for (QWidget* w : windows)
    EXPECT_EQ(w->windowTitle(), "Plan View - " + QString::fromStdString(path));
  EXPECT_TRUE(ui.boxes.empty());
}

}  // namespace
}  // namespace zv
