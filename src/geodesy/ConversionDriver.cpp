#include "geodesy/ConversionDriver.h"

#include <cmath>
#include <cstdio>

#include "geodesy/Angles.h"
#include "geodesy/CatalogStore.h"
#include "geodesy/Catalogs.h"
#include "geodesy/NgsPrograms.h"
#include "geodesy/Projection.h"
#include "platform/Error.h"
#include "platform/Numbers.h"
#include "platform/Strings.h"

namespace zv {

namespace {

// Copied as strings: assigning the literals trips a false -Wrestrict of
// GCC 12 at -O3.
const std::string kNorth = "N";
const std::string kWest = "W";

// A present length in another unit; false when a unit is unknown.
bool ConvertLength(double& value, const std::string& from, const std::string& to) {
  if (value == kNoValue) return true;
  double converted = Distances_Convert(value, from, to);
  if (converted == kNoValue) return false;
  value = converted;
  return true;
}

bool ConvertLength(float& value, const std::string& from, const std::string& to) {
  if (value == kNoValueF) return true;
  double v = value;
  if (!ConvertLength(v, from, to)) return false;
  value = static_cast<float>(v);
  return true;
}

bool UnitsError(Ui& ui, const SurveyPoint& p, const std::string& from, const std::string& to) {
  ui.exclaim("The lengths of point '" + p.PointName + "' can not be converted from '" + from +
                 "' to '" + to + "'.",
             "Unknown Units");
  return false;
}

// The zone set up for projecting; false (reported) when it cannot be used.
bool PrepareZone(Ui& ui, const std::string& appFolder, const std::string& coordinateSystem,
                 const std::string& zone, ProjectionZone& prepared) {
  try {
    prepared = Projection_SetZone(ResolveZone(ui, appFolder, coordinateSystem, zone));
  } catch (const ZvError& e) {
    ui.exclaim("Error: " + e.description() + "\r\nFunction: " + e.source());
    return false;
  }
  if (prepared.status == ProjectionStatus::MappingRadius) {
    ui.message(kMappingRadiusMessage, Icon::None, Buttons::Ok, kAppTitle);
    return false;
  }
  return prepared.status == ProjectionStatus::Ok;
}

void Detail(std::string& r, const char* label, int tabs, const std::string& value) {
  r += "\r\n     ";
  r += label;
  r.append(static_cast<size_t>(tabs), '\t');
  r += value;
}

// An angle in one of the four formats, symbols on: 5 decimals, or 9 for
// decimal degrees.
std::string FormatAngle(Ui& ui, double radians, const std::string& format) {
  if (format == kFormatPacked) return Angles_RadiansToPacked(ui, radians, 5);
  if (format == kFormatDMS) return Angles_RadiansToDMS(ui, radians, 5, true);
  if (format == kFormatDM) return Angles_RadiansToDM(radians, 5, true);
  return Angles_RadiansToDecimal(radians, 9, true);
}

std::string Length(double value, int decimals, const std::string& units) {
  return FormatGrouped(value, decimals) + " (" + units + ")";
}

void SideLines(std::string& r, const std::string& system, const std::string& zone,
               const std::string& horizontalDatum, const std::string& verticalDatum) {
  Detail(r, "Coordinate System: ", 1, system);
  if (!zone.empty()) Detail(r, "Zone: ", 3, zone);
  Detail(r, "Horizontal Datum: ", 2, horizontalDatum);
  Detail(r, "Vertical Datum: ", 2, verticalDatum);
}

// Latitude and longitude without sign, with their hemisphere letters.
void GeographicLines(Ui& ui, std::string& r, const SurveyPoint& p, const std::string& format) {
  double lat = Angles_ConvertHemisphere(p.Latitude, p.LatitudeHemisphere, "N");
  double lon = Angles_ConvertHemisphere(p.Longitude, p.LongitudeHemisphere, "W");
  if (lon > kPi) lon -= kFullCircle;
  Detail(r, "Latitude: ", 3, FormatAngle(ui, std::fabs(lat), format) + (lat < 0 ? " (S)" : " (N)"));
  Detail(r, "Longitude: ", 2,
         FormatAngle(ui, std::fabs(lon), format) + (lon < 0 ? " (E)" : " (W)"));
}

void HeightLines(std::string& r, const SurveyPoint& p, bool withGeoid) {
  if (p.Elevation != kNoValue)
    Detail(r, "Orthometric Height: ", 1, Length(p.Elevation, 3, p.VerticalUnits));
  if (withGeoid && p.GeoidHeight != kNoValue) {
    std::string label = "Geoid Height (" + p.Text19 + "): ";
    Detail(r, label.c_str(), 1, Length(p.GeoidHeight, 3, p.VerticalUnits));
  }
  if (p.EllipsoidHeight != kNoValue)
    Detail(r, "Ellipsoid Height: ", 2, Length(p.EllipsoidHeight, 3, p.VerticalUnits));
}

}  // namespace

std::tm LocalNow() {
  std::time_t t = std::time(nullptr);
  std::tm local{};
  localtime_r(&t, &local);
  return local;
}

std::string FormatDate(const std::tm& t) {
  char text[32];
  std::snprintf(text, sizeof text, "%02d/%02d/%04d", t.tm_mon + 1, t.tm_mday, t.tm_year + 1900);
  return text;
}

std::string FormatTime(const std::tm& t) {
  char text[32];
  std::snprintf(text, sizeof text, "%d:%02d:%02d", t.tm_hour, t.tm_min, t.tm_sec);
  return text;
}

bool HorizontalDatumTransformation(Ui& ui, const std::string& appFolder,
                                   std::vector<SurveyPoint>& points, const std::string& from,
                                   const std::string& to) {
  const DatumStore datums = DatumStore::In(appFolder);
  const std::string method = datums.method(from, to);
  if (method.empty()) {
    auto ellipsoidOf = [&](const std::string& name) {
      const std::optional<DatumRecord> datum = datums.load(name);
      return datum ? datum->ellipsoid : std::string();
    };
    if (ellipsoidOf(from) == ellipsoidOf(to)) {
      return ui.askYesNo(
          "No datum transformation exists for '" + from + "' to '" + to +
              "' but these datums share the same ellipsoid.  The coordiantes can be converted "
              "without a datum transformation but this may introduce errors.  Do you want to "
              "convert the coordinates without applying a datum transformation?",
          "Convert Coordiantes Without Datum Transformation?");
    }
    ui.exclaim("No datum transformation exists for '" + from + "' to '" + to + "'.",
               "No Datum Transformation");
    return false;
  }
  if (Trim(method.substr(0, 6)) == "NADCON") return Nadcon_Run(ui, appFolder, points, method);
  return true;
}

bool VerticalDatumTransformation(Ui& ui, const std::string& appFolder,
                                 std::vector<SurveyPoint>& points, const std::string& from,
                                 const std::string& to) {
  const std::string method = DatumStore::In(appFolder).method(from, to);
  if (method.empty()) {
    ui.exclaim("No datum transformation exists for '" + from + "' to '" + to + "'.",
               "No Datum Transformation");
    return false;
  }
  const auto& vertcon = VertconMethodNames();
  if (method == vertcon[0]) return Vertcon_Run(ui, appFolder, points, true);
  if (method == vertcon[1]) return Vertcon_Run(ui, appFolder, points, false);
  for (const std::string& geoid : GeoidMethodNames()) {
    if (method == geoid) return Geoid_Run(ui, appFolder, points, method);
  }
  ui.exclaim("Unknown vertical transformation method '" + method + "'.",
             "Unknown Transformation Method");
  return false;
}

namespace {

// With a geoid height N, the missing one of the orthometric height H and the
// ellipsoid height h: H = h - N, h = H + N.
void FillMissingHeight(std::vector<SurveyPoint>& points) {
  for (SurveyPoint& p : points) {
    if (p.GeoidHeight == kNoValue) continue;
    if (p.Elevation == kNoValue && p.EllipsoidHeight != kNoValue) {
      p.Elevation = p.EllipsoidHeight - p.GeoidHeight;
    } else if (p.EllipsoidHeight == kNoValue && p.Elevation != kNoValue) {
      p.EllipsoidHeight = p.Elevation + p.GeoidHeight;
    }
  }
}

}  // namespace

bool VerticalStep(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                  const ConversionSettings& s) {
  if (s.inputVerticalDatum != s.outputVerticalDatum &&
      !VerticalDatumTransformation(ui, appFolder, points, s.inputVerticalDatum,
                                   s.outputVerticalDatum)) {
    return false;
  }
  if (s.OutputGeoid) {
    if (!Geoid_Run(ui, appFolder, points, s.geoidModel)) return false;
    FillMissingHeight(points);
  }
  const std::string& to = s.outputVerticalUnits;
  for (SurveyPoint& p : points) {
    const std::string from = p.VerticalUnits;
    if (!ConvertLength(p.Elevation, from, to) || !ConvertLength(p.ElevationError, from, to) ||
        !ConvertLength(p.EllipsoidHeight, from, to) || !ConvertLength(p.GeoidHeight, from, to)) {
      return UnitsError(ui, p, from, to);
    }
    p.VerticalUnits = to;
  }
  return true;
}

bool GridToGeographic(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                      const std::string& coordinateSystem, const std::string& zone,
                      const std::string& horizontalDatum) {
  (void)horizontalDatum;  // the zone's own datum fixes the ellipsoid
  ProjectionZone prepared;
  if (!PrepareZone(ui, appFolder, coordinateSystem, zone, prepared)) return false;
  const std::string unit = prepared.usSurveyFeet ? kUsSurveyFeet : kMeters;
  for (SurveyPoint& p : points) {
    if (p.Northing == kNoValue || p.Easting == kNoValue) continue;
    const std::string from = p.HorizontalUnits;
    if (!ConvertLength(p.Northing, from, unit) || !ConvertLength(p.Easting, from, unit) ||
        !ConvertLength(p.NorthingError, from, unit) || !ConvertLength(p.EastingError, from, unit)) {
      return UnitsError(ui, p, from, unit);
    }
    p.HorizontalUnits = unit;
    GeographicPoint g = Projection_GridToGeographic(prepared, p.Northing, p.Easting);
    p.Latitude = g.phi;
    p.Longitude = g.lambda;
    p.LatitudeHemisphere = kNorth;
    p.LongitudeHemisphere = kWest;
    p.Convergence = g.convergence;
    p.ScaleFactor = g.scaleFactor;
  }
  return true;
}

bool GeographicToGrid(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                      const std::string& coordinateSystem, const std::string& zone,
                      const std::string& horizontalDatum, const std::string& outputUnits) {
  (void)horizontalDatum;
  ProjectionZone prepared;
  if (!PrepareZone(ui, appFolder, coordinateSystem, zone, prepared)) return false;
  const std::string unit = prepared.usSurveyFeet ? kUsSurveyFeet : kMeters;
  for (SurveyPoint& p : points) {
    if (p.Latitude == kNoValue || p.Longitude == kNoValue) continue;
    double lat = Angles_ConvertHemisphere(p.Latitude, p.LatitudeHemisphere, "N");
    double lon = Angles_ConvertHemisphere(p.Longitude, p.LongitudeHemisphere, "W");
    if (lat == kNoValue || lon == kNoValue) continue;
    p.Latitude = lat;
    p.Longitude = lon;
    p.LatitudeHemisphere = kNorth;
    p.LongitudeHemisphere = kWest;
    GridPoint g = Projection_GeographicToGrid(prepared, lat, lon);
    p.Northing = g.northing;
    p.Easting = g.easting;
    p.Convergence = g.convergence;
    p.ScaleFactor = g.scaleFactor;
    p.GridMissing = false;
    if (!ConvertLength(p.Northing, unit, outputUnits) ||
        !ConvertLength(p.Easting, unit, outputUnits)) {
      return UnitsError(ui, p, unit, outputUnits);
    }
    if (!ConvertLength(p.NorthingError, p.HorizontalUnits, outputUnits) ||
        !ConvertLength(p.EastingError, p.HorizontalUnits, outputUnits)) {
      return UnitsError(ui, p, p.HorizontalUnits, outputUnits);
    }
    p.HorizontalUnits = outputUnits;
  }
  return true;
}

bool ConvertPoints(Ui& ui, const std::string& appFolder, ConversionState& state) {
  state.report = state.points.empty() ? "" : ReportInputPart(ui, state);
  const ConversionSettings& s = state.settings;
  auto& points = state.points;
  const bool geographicIn = s.inputCoordinateSystem == kGeographicCoordinates;
  const bool geographicOut = s.outputCoordinateSystem == kGeographicCoordinates;
  auto datumShift = [&] {
    return s.inputHorizontalDatum == s.outputHorizontalDatum ||
           HorizontalDatumTransformation(ui, appFolder, points, s.inputHorizontalDatum,
                                         s.outputHorizontalDatum);
  };
  if (!geographicIn && !GridToGeographic(ui, appFolder, points, s.inputCoordinateSystem,
                                         s.inputZone, s.inputHorizontalDatum)) {
    return false;
  }
  if (!datumShift()) return false;
  if (!geographicOut &&
      !GeographicToGrid(ui, appFolder, points, s.outputCoordinateSystem, s.outputZone,
                        s.outputHorizontalDatum, s.outputHorizontalUnits)) {
    return false;
  }
  if (!VerticalStep(ui, appFolder, points, s)) return false;
  if (state.singlePoint && !points.empty()) state.report += ReportOutputPart(ui, state);
  return true;
}

std::string ReportInputPart(Ui& ui, const ConversionState& state) {
  const SurveyPoint& p = state.points.at(0);
  const ConversionSettings& s = state.settings;
  const std::tm now = state.now();
  std::string r = std::string(kTitleAndVersion) + "\t\t" + FormatDate(now) + " " + FormatTime(now) +
                  "\r\n\r\nSingle Point Conversion";
  if (!p.PointName.empty()) r += "\t\tPoint Name: " + p.PointName;
  r += "\r\n\r\nInput:";
  SideLines(r, s.inputCoordinateSystem, s.inputZone, s.inputHorizontalDatum, s.inputVerticalDatum);
  if (s.inputCoordinateSystem != kGeographicCoordinates) {
    Detail(r, "Northing: ", 3, Length(p.Northing, 4, p.HorizontalUnits));
    Detail(r, "Easting: ", 3, Length(p.Easting, 4, p.HorizontalUnits));
  } else {
    Detail(r, "Latitude: ", 3,
           FormatAngle(ui, p.Latitude, s.inputHorizontalUnits) + " (" + p.LatitudeHemisphere + ")");
    Detail(
        r, "Longitude: ", 2,
        FormatAngle(ui, p.Longitude, s.inputHorizontalUnits) + " (" + p.LongitudeHemisphere + ")");
  }
  if (p.EllipsoidHeight != kNoValue)
    Detail(r, "Ellipsoid Height: ", 2, Length(p.EllipsoidHeight, 3, p.VerticalUnits));
  if (p.Elevation != kNoValue)
    Detail(r, "Orthometric Height: ", 1, Length(p.Elevation, 3, p.VerticalUnits));
  return r;
}

std::string ReportOutputPart(Ui& ui, const ConversionState& state) {
  const SurveyPoint& p = state.points.at(0);
  const ConversionSettings& s = state.settings;
  std::string r = "\r\n\r\nOutput:";
  SideLines(r, s.outputCoordinateSystem, s.outputZone, s.outputHorizontalDatum,
            s.outputVerticalDatum);
  if (s.outputCoordinateSystem != kGeographicCoordinates) {
    Detail(r, "Northing (Y): ", 2, Length(p.Northing, 4, p.HorizontalUnits));
    Detail(r, "Easting (X): ", 2, Length(p.Easting, 4, p.HorizontalUnits));
    if (s.OutputLatLong) GeographicLines(ui, r, p, kFormatDMS);
    HeightLines(r, p, s.OutputGeoid);
    if (s.OutputConvergence)
      Detail(r, "Convergence Angle: ", 1, Angles_RadiansToDMS(ui, p.Convergence, 1, true));
    if (s.OutputScaleFactor) Detail(r, "Scale Factor: ", 2, FormatFixed(p.ScaleFactor, 8));
  } else {
    GeographicLines(ui, r, p, s.outputHorizontalUnits);
    HeightLines(r, p, s.OutputGeoid);
  }
  return r;
}

}  // namespace zv
