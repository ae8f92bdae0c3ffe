#pragma once
// The point conversion driver: turns the conversion points from one
// coordinate reference (coordinate system, zone, horizontal datum and units,
// vertical datum and units) into another by chaining inverse projection,
// datum shifts through the NGS programs, geoid heights, forward projection
// and unit conversion. Every step works in place on the points; -99999
// marks an absent value and passes through.

#include <ctime>
#include <string>
#include <vector>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

// What the Coordinate Conversion window fills. For a geographic side the
// horizontal units hold an angle format name.
struct ConversionSettings {
  std::string inputCoordinateSystem, inputZone, inputHorizontalDatum, inputHorizontalUnits,
      inputVerticalDatum, inputVerticalUnits;
  std::string outputCoordinateSystem, outputZone, outputHorizontalDatum, outputHorizontalUnits,
      outputVerticalDatum, outputVerticalUnits;
  bool OutputScaleFactor = false;
  bool OutputConvergence = false;
  bool OutputLatLong = false;
  bool OutputGeoid = false;
  std::string geoidModel;
};

// Local time now; the clock of the report and of tccout.tmp.
std::tm LocalNow();

// The conversion points with the settings and flags that go with them.
struct ConversionState {
  std::vector<SurveyPoint> points;
  ConversionSettings settings;
  bool singlePoint = false;  // a typed single point: the run builds the report
  bool accepted = false;     // set by the Coordinate Conversion window
  bool batchGrid = false;    // the exchange answer holds grid coordinates
  std::string report;        // the single-point report text
  std::tm (*now)() = LocalNow;
};

// Converts the points with state.settings; true when every step succeeded.
// With singlePoint set, a successful run leaves the finished report in
// state.report for the results window.
bool ConvertPoints(Ui& ui, const std::string& appFolder, ConversionState& state);

// Through the method of datums.ini (key `to` in section `from`): NADCON, or
// no shift for any other method; without a method the user is asked when
// both datums have the same ellipsoid. True to go on.
bool HorizontalDatumTransformation(Ui& ui, const std::string& appFolder,
                                   std::vector<SurveyPoint>& points, const std::string& from,
                                   const std::string& to);
// VERTCON or GEOID by the method of datums.ini. True to go on.
bool VerticalDatumTransformation(Ui& ui, const std::string& appFolder,
                                 std::vector<SurveyPoint>& points, const std::string& from,
                                 const std::string& to);
// Vertical datum transformation when the datums differ, geoid heights when
// asked, then every height in the output vertical units.
bool VerticalStep(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                  const ConversionSettings& settings);

// Inverse projection of the zone: northing and easting (with their errors)
// go into the projection's unit, latitude and longitude come out
// north- and west-positive with convergence and scale factor. False
// (reported) when the zone cannot be used.
bool GridToGeographic(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                      const std::string& coordinateSystem, const std::string& zone,
                      const std::string& horizontalDatum);
// Forward projection of the zone; northing and easting (and their errors)
// end in the output horizontal units.
bool GeographicToGrid(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                      const std::string& coordinateSystem, const std::string& zone,
                      const std::string& horizontalDatum, const std::string& outputUnits);

// The report parts: the header and input section from point 0 before the
// conversion, and the output section after it.
std::string ReportInputPart(Ui& ui, const ConversionState& state);
std::string ReportOutputPart(Ui& ui, const ConversionState& state);

// "MM/dd/yyyy" and "h:mm:ss".
std::string FormatDate(const std::tm& t);
std::string FormatTime(const std::tm& t);

}  // namespace zv
