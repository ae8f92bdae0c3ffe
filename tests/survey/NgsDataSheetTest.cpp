#include <gtest/gtest.h>

#include <sstream>

#include "platform/ScriptedUi.h"
#include "survey/NgsDataSheet.h"
#include "survey/SurveyTestSupport.h"

namespace zv {
namespace {

using test::Dms;
using test::Fixture;
using test::SplitCrLf;

// Builders of sheet lines in the reader's columns.
std::string Pad(std::string s, size_t width) {
  if (s.size() < width) s.resize(width, ' ');
  return s;
}
std::string Right(const std::string& s, size_t width) {
  return std::string(width > s.size() ? width - s.size() : 0, ' ') + s;
}
std::string Start() {
  return "1        National Geodetic Survey,   Retrieval Date = MAY 2, 2024";
}
std::string Keyword(const std::string& pid, const std::string& key, const std::string& value) {
  return " " + pid + "  " + Pad(key, 12) + "-  " + value;
}
std::string Position(const std::string& pid, const std::string& label, const std::string& lat,
                     const std::string& lon, const std::string& source) {
  return Pad(" " + pid + "* " + Pad(label, 12) + "- " + Right(lat, 15) + "(N)   " + Right(lon, 16) +
                 "(W)",
             68) +
         source;
}
std::string Height(const std::string& pid, const std::string& label, const std::string& height,
                   const std::string& source) {
  return Pad(" " + pid + "* " + Pad(label, 12) + "- " + Right(height, 15) + " (meters)", 68) +
         source;
}
std::string Sheet(const std::vector<std::string>& lines) {
  std::string text;
  for (const auto& l : lines) text += l + "\r\n";
  return text;
}

bool HasLine(const std::string& field, const std::string& line) {
  for (const auto& l : SplitCrLf(field)) {
    if (l == line) return true;
  }
  return false;
}

bool HasLineStarting(const std::string& field, const std::string& start) {
  for (const auto& l : SplitCrLf(field)) {
    if (l.rfind(start, 0) == 0) return true;
  }
  return false;
}

class NgsDataSheet : public ::testing::Test {
 protected:
  bool read(const std::string& name) { return ReadNgsDataSheet(ui, work, Fixture("ngs/" + name)); }
  bool readText(const std::string& text) {
    std::istringstream in(text);
    return ReadNgsDataSheetStream(ui, work, in, "mem.DS");
  }
  std::string invalid(int line, const std::string& rule) {
    return "Invalid NGS Data Sheet 'mem.DS'.\r\nError on line " + std::to_string(line) + ".\r\n" +
           rule;
  }

  ScriptedUi ui;
  WorkArea work;
};

TEST_F(NgsDataSheet, CorsMarkWithLongDatumLabel) {
  ASSERT_TRUE(read("cors_mark.ds"));
  EXPECT_TRUE(ui.boxes.empty());
  const FileHeader& h = work.InputHeader;
  EXPECT_EQ(h.CoordinateSystem, "Geographic Coordinates");
  EXPECT_EQ(h.HorizontalUnits, "DDD MM SS.ssss");
  EXPECT_EQ(h.VerticalUnits, "Meters");
  EXPECT_EQ(h.HorizontalDatum, "NAD 83(CORS96)");
  EXPECT_EQ(h.VerticalDatum, "NAVD 88");
  EXPECT_EQ(h.Zone, "");
  EXPECT_EQ(h.ProjectLine, "");

  ASSERT_EQ(work.InputPoints.size(), 1u);
  const SurveyPoint& p = work.InputPoints[0];
  EXPECT_EQ(p.PointName, "KX4417");
  EXPECT_EQ(p.DescriptionLines, "NM:LAKEVIEW CORS ARP\r\nPD:CORS_ID = LKVW");
  EXPECT_FLOAT_EQ(p.NorthingError, 0.0001f);
  EXPECT_FLOAT_EQ(p.EastingError, 0.0001f);
  EXPECT_FLOAT_EQ(p.ElevationError, 0.0001f);
  EXPECT_NEAR(p.Latitude, Dms(43, 4, 23.51234), 1e-12);
  EXPECT_NEAR(p.Longitude, Dms(89, 23, 14.90210), 1e-12);
  EXPECT_EQ(p.LatitudeHemisphere, "N");
  EXPECT_EQ(p.LongitudeHemisphere, "W");
  EXPECT_DOUBLE_EQ(p.Elevation, 262.118);
  EXPECT_DOUBLE_EQ(p.EllipsoidHeight, 227.341);
  EXPECT_EQ(p.Northing, kNoValue);
  EXPECT_EQ(p.Easting, kNoValue);
  EXPECT_TRUE(p.GridMissing);
  EXPECT_EQ(p.HorizontalUnits, "DDD MM SS.ssss");
  EXPECT_EQ(p.VerticalUnits, "Meters");
  std::vector<std::string> extra = SplitCrLf(p.ExtraLines);
  ASSERT_FALSE(extra.empty());
  EXPECT_EQ(extra[0], "CM:Retrieval Date = MARCH 14, 2024");
  EXPECT_TRUE(HasLine(p.ExtraLines, "CM:WI/DANE"));
  EXPECT_TRUE(HasLine(p.ExtraLines, "CM:US"));
  // The ELLIP HEIGHT line is a keyword line too; adjusted sources add nothing.
  EXPECT_TRUE(HasLineStarting(p.ExtraLines, "CM:227.341 (meters)"));
  EXPECT_FALSE(HasLineStarting(p.ExtraLines, "CM:HORIZONTAL POSITION SOURCE"));
  EXPECT_FALSE(HasLineStarting(p.ExtraLines, "CM:ELLIPSOID HEIGHT SOURCE"));
}

TEST_F(NgsDataSheet, HeightsThatAreNotAdjusted) {
  ASSERT_TRUE(read("non_adjusted_height.ds"));
  ASSERT_EQ(work.InputPoints.size(), 3u);
  const auto& pts = work.InputPoints;
  // First sheet: no vertical datum known yet, so its GPS OBS height is left out.
  EXPECT_EQ(pts[0].Elevation, kNoValue);
  EXPECT_FALSE(HasLineStarting(pts[0].ExtraLines, "CM:ORTHOMETRIC HEIGHT SOURCE"));
  // Second sheet: adjusted height sets the file's vertical datum.
  EXPECT_EQ(work.InputHeader.VerticalDatum, "NAVD 88");
  EXPECT_DOUBLE_EQ(pts[1].Elevation, 279.553);
  EXPECT_DOUBLE_EQ(pts[1].EllipsoidHeight, 245.02);
  EXPECT_TRUE(HasLine(pts[1].ExtraLines, "CM:ELLIPSOID HEIGHT SOURCE = GPS OBS"));
  // Third sheet: a VERTCON height is kept with its source; scaled position too.
  EXPECT_DOUBLE_EQ(pts[2].Elevation, 284.12);
  EXPECT_TRUE(HasLine(pts[2].ExtraLines, "CM:ORTHOMETRIC HEIGHT SOURCE = VERTCON"));
  EXPECT_TRUE(HasLine(pts[2].ExtraLines, "CM:HORIZONTAL POSITION SOURCE = SCALED"));
  EXPECT_NEAR(pts[2].Latitude, Dms(42, 58, 1), 1e-12);
  EXPECT_FALSE(HasLineStarting(pts[2].ExtraLines, "CM:VERTICAL DATUM"));
  // The short-label position line also matches the keyword rule.
  EXPECT_TRUE(
      HasLine(pts[1].ExtraLines, "CM:42 57 40.11923(N)    089 19 58.20036(W)     ADJUSTED"));
}

TEST_F(NgsDataSheet, DatumConflictAcceptedMarksEveryDifferingPoint) {
  ui.answers.push_back(Answer::Ok);
  ASSERT_TRUE(read("two_datums.ds"));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Horizontal Datum Conflict");
  EXPECT_EQ(ui.boxes[0].buttons, Buttons::OkCancel);
  EXPECT_EQ(ui.boxes[0].text,
            "A Horizontal Datum conflict exists in the file.  Point 'RT2202' does not match the "
            "Horizontal Datum of previous points in the file.  Click 'OK' to import using the "
            "previous points horizontal datum or click 'Cancel' to stop the import.");
  EXPECT_EQ(work.InputHeader.HorizontalDatum, "NAD 83(1986)");
  ASSERT_EQ(work.InputPoints.size(), 3u);
  EXPECT_FALSE(HasLineStarting(work.InputPoints[0].ExtraLines, "CM:HORIZONTAL DATUM"));
  // The point that raised the question keeps its datum as well as later ones.
  EXPECT_TRUE(HasLine(work.InputPoints[1].ExtraLines, "CM:HORIZONTAL DATUM = NAD 83(2011)"));
  EXPECT_TRUE(HasLine(work.InputPoints[2].ExtraLines, "CM:HORIZONTAL DATUM = NAD 83(2011)"));
  // An adjusted height in another vertical datum is kept with its label.
  EXPECT_DOUBLE_EQ(work.InputPoints[1].Elevation, 373.361);
  EXPECT_TRUE(HasLine(work.InputPoints[1].ExtraLines, "CM:VERTICAL DATUM = NGVD 29"));
  EXPECT_FALSE(HasLineStarting(work.InputPoints[2].ExtraLines, "CM:VERTICAL DATUM"));
}

TEST_F(NgsDataSheet, DatumConflictCancelledStoresNothing) {
  work.InputPoints.resize(2);
  work.InputHeader.Zone = "kept";
  ui.answers.push_back(Answer::Cancel);
  EXPECT_FALSE(read("two_datums.ds"));
  EXPECT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputHeader.Zone, "kept");
}

TEST_F(NgsDataSheet, AccuracyEstimatesBecomeOneSigmaMetres) {
  ASSERT_TRUE(read("accuracy_block.ds"));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  const SurveyPoint& a = work.InputPoints[0];
  EXPECT_FLOAT_EQ(a.NorthingError, static_cast<float>(0.51 / 195.99));
  EXPECT_FLOAT_EQ(a.EastingError, static_cast<float>(0.44 / 195.99));
  EXPECT_FLOAT_EQ(a.ElevationError, static_cast<float>(1.28 / 195.99));
  EXPECT_FALSE(HasLine(a.ExtraLines, "CM:LOCAL ERROR ESTIMATES"));
  const SurveyPoint& b = work.InputPoints[1];
  EXPECT_FLOAT_EQ(b.NorthingError, static_cast<float>(0.98 / 195.99));
  EXPECT_TRUE(HasLine(b.ExtraLines, "CM:LOCAL ERROR ESTIMATES"));
  EXPECT_EQ(b.PointName, "MN5511");
}

TEST_F(NgsDataSheet, SampleInTheApplicationFolderReads) {
  ASSERT_TRUE(
      ReadNgsDataSheet(ui, work, std::string(ZV_SOURCE_DIR) + "/appdata/samples/sample.ds"));
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(work.InputPoints.size(), 12u);
  for (const SurveyPoint& p : work.InputPoints) {
    EXPECT_NE(p.Latitude, kNoValue);
    EXPECT_NE(p.EllipsoidHeight, kNoValue);
  }
}

TEST_F(NgsDataSheet, LinesBeforeTheFirstSheet) {
  std::string text =
      Sheet({Keyword("AA0001", "PID", "AA0001"),
             Position("AA0001", "NAD 27", "40 00 00.0", "090 00 00.0", "ADJUSTED"),
             Height("AA0001", "NGVD 29", "100.0", "ADJUSTED"), Start(),
             Keyword("AA0002", "PID", "AA0002"),
             Position("AA0002", "NAD 83(1986)", "41 00 00.0", "091 00 00.0", "ADJUSTED"),
             Height("AA0002", "NAVD 88", "200.0", "ADJUSTED")});
  ASSERT_TRUE(readText(text));
  EXPECT_TRUE(ui.boxes.empty());
  ASSERT_EQ(work.InputPoints.size(), 1u);
  EXPECT_EQ(work.InputPoints[0].PointName, "AA0002");
  EXPECT_EQ(work.InputHeader.HorizontalDatum, "NAD 83(1986)");
  EXPECT_EQ(work.InputHeader.VerticalDatum, "NAVD 88");
  EXPECT_DOUBLE_EQ(work.InputPoints[0].Elevation, 200.0);
}

TEST_F(NgsDataSheet, FirstDatumComesFromTheFirstSheetWithAPosition) {
  // A first sheet without a position is no reason to report a conflict.
  std::string text = Sheet(
      {Start(), Keyword("AA0001", "PID", "AA0001"), Start(), Keyword("AA0002", "PID", "AA0002"),
       Position("AA0002", "NAD 83(2011)", "41 00 00.0", "091 00 00.0", "ADJUSTED"),
       Height("AA0002", "NAVD 88", "200.0", "ADJUSTED")});
  ASSERT_TRUE(readText(text));
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(work.InputHeader.HorizontalDatum, "NAD 83(2011)");
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_FALSE(HasLineStarting(work.InputPoints[1].ExtraLines, "CM:HORIZONTAL DATUM"));
}

TEST_F(NgsDataSheet, SheetStartAfterAPositionIsNotTakenAsItsHeight) {
  std::string text =
      Sheet({Start(), Keyword("AA0001", "PID", "AA0001"),
             Position("AA0001", "NAD 83(2011)", "41 00 00.0", "091 00 00.0", "ADJUSTED"), Start(),
             Keyword("AA0002", "PID", "AA0002")});
  ASSERT_TRUE(readText(text));
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputPoints[0].PointName, "AA0001");
  EXPECT_EQ(work.InputPoints[1].PointName, "AA0002");
}

TEST_F(NgsDataSheet, TruncatedSheetsReadWhatIsThere) {
  std::string text =
      Sheet({Start(), Keyword("AA0001", "PID", "AA0001"),
             Position("AA0001", "NAD 83(2011)", "41 00 00.0", "091 00 00.0", "ADJUSTED")});
  ASSERT_TRUE(readText(text));
  EXPECT_NEAR(work.InputPoints.at(0).Latitude, Dms(41, 0, 0), 1e-12);

  std::string accuracy = Sheet({Start(),
                                " AA0001  ------- Accuracy Estimates (at 95% Confidence "
                                "Level in cm) --------",
                                " AA0001  Type"});
  ASSERT_TRUE(readText(accuracy));
  EXPECT_EQ(work.InputPoints.at(0).NorthingError, kNoValueF);
}

TEST_F(NgsDataSheet, BadInputIsReportedWithItsLine) {
  std::string height =
      Sheet({Start(), Keyword("AA0001", "PID", "AA0001"),
             Position("AA0001", "NAD 83(2011)", "41 00 00.0", "091 00 00.0", "ADJUSTED"),
             Height("AA0001", "NAVD 88", "12O.5", "ADJUSTED")});
  EXPECT_FALSE(readText(height));
  EXPECT_EQ(ui.onlyText(), invalid(4, "Orthometric Height must be numeric."));
  EXPECT_EQ(ui.boxes[0].title, "Invalid NGS Data Sheet");
  EXPECT_TRUE(work.InputPoints.empty());

  ui.boxes.clear();
  std::string latitude =
      Sheet({Start(), Position("AA0001", "NAD 83(2011)", "41 00", "091 00 00.0", "ADJUSTED")});
  EXPECT_FALSE(readText(latitude));
  EXPECT_EQ(ui.onlyText(), invalid(2, "Latitude must be numeric."));

  ui.boxes.clear();
  std::string binary = Sheet({Start(), std::string("\x89PNG\0\x1a", 6)});
  EXPECT_FALSE(readText(binary));
  EXPECT_EQ(ui.onlyText(), invalid(2, "The line holds binary data."));

  ui.boxes.clear();
  EXPECT_FALSE(readText("just some text\r\nwith no data sheet\r\n"));
  EXPECT_EQ(ui.onlyText(), "Invalid NGS Data Sheet 'mem.DS'.\r\nThe file holds no data sheet.");
}

TEST_F(NgsDataSheet, AngleOutOfRangeIsReportedAndLeftAbsent) {
  std::string text =
      Sheet({Start(), Position("AA0001", "NAD 83(2011)", "41 61 00.0", "091 00 00.0", "ADJUSTED")});
  ASSERT_TRUE(readText(text));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
  EXPECT_EQ(work.InputPoints.at(0).Latitude, kNoValue);
}

TEST_F(NgsDataSheet, MissingFile) {
  EXPECT_FALSE(ReadNgsDataSheet(ui, work, "/nonexistent/x.ds"));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "File Does Not Exist");
  EXPECT_EQ(ui.boxes[0].text, "The file '/nonexistent/x.ds' does not exist.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
}

}  // namespace
}  // namespace zv
