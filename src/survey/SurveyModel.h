#pragma once
// The survey model: point, chain and header records and the work area that
// readers fill and writers consume.

#include <cstdint>
#include <istream>
#include <string>
#include <vector>

#include "platform/Numbers.h"

namespace zv {

// The coordinate system of latitudes and longitudes, beside the grid systems
// of the zone catalog.
inline constexpr const char* kGeographicCoordinates = "Geographic Coordinates";

struct SurveyPoint {
  std::string PointName;
  std::string Text2;  // not used by the survey formats; carried through
  std::string Geometry = "P";
  std::string CodeLetter;
  std::string FeatureCode;
  std::string IntegerAttribute;
  std::string Text7;
  std::string DescriptionLines;  // whole "PD:" lines joined by CR LF
  double Northing = kNoValue;
  double Easting = kNoValue;
  double Elevation = kNoValue;
  float NorthingError = kNoValueF;
  float EastingError = kNoValueF;
  float ElevationError = kNoValueF;
  double Latitude = kNoValue;
  double Longitude = kNoValue;
  double EllipsoidHeight = kNoValue;
  double GeoidHeight = kNoValue;
  std::string Text19;
  double Convergence = kNoValue;
  double ScaleFactor = kNoValue;
  bool GridMissing = false;
  std::string ExtraLines;  // whole lines with unknown tags, joined by CR LF
  bool NotYetWritten = true;
  bool HorizontalIsControl = false;
  bool ElevationIsControl = false;
  std::string Text27;
  std::string HorizontalUnits;
  std::string VerticalUnits;
  std::string LatitudeHemisphere = "N";
  std::string LongitudeHemisphere = "W";
  std::string RecordCode;  // kept by ResetPoint
  std::string Text33;      // kept by ResetPoint
  std::string GRText;
};

// Sets every field to its initial value except RecordCode and Text33.
void ResetPoint(SurveyPoint& point);

struct SurveyChain {
  std::string ChainName;
  std::string CodeLetter;
  std::string IntegerAttribute;
  std::string FeatureCode;
  std::string Description;  // whole "CD:" lines joined by CR LF
  std::string FGText;
  std::string PointListLines;  // whole "PL:" lines joined by CR LF
  std::string ChainLines;      // whole "CH:" lines joined by CR LF
  std::string ExtraLines;
  bool Open = false;
  std::string Station;
};

// Clears the text fields of a chain and sets Open.
void StartChain(SurveyChain& chain);

struct FileHeader {
  std::string ProjectLine;
  std::string HeaderExtraLines;
  std::string CoordinateSystem;
  std::string Zone;
  std::string HorizontalDatum;
  std::string HorizontalUnits;
  std::string VerticalDatum;
  std::string VerticalUnits;
};

struct WorkArea {
  FileHeader InputHeader;
  std::vector<SurveyPoint> InputPoints;
  std::vector<SurveyChain> InputChains;
  FileHeader OutputHeader;
  std::vector<SurveyPoint> OutputPoints;
  std::vector<SurveyChain> OutputChains;
  bool OutputScaleFactor = false;
  bool OutputConvergence = false;
  bool OutputLatLong = false;
  bool OutputGeoid = false;
  bool ConversionOptionsActive = false;

  // Clears the input side (header strings, points, chains).
  void clearInput();
  // Output side := input side. With `moveInput` the points and chains are
  // moved rather than copied (for runs that never look at the input again).
  void copyInputToOutput(bool moveInput = false);
};

// Makes room for `count` points at once (a large list is then faulted in by
// huge pages where the system offers them). Memory reserved beyond the points
// stored is never touched; a reservation that cannot be had is skipped.
void ReservePoints(std::vector<SurveyPoint>& points, std::uintmax_t count);
// The bytes between the read position of a stream and its end (0 when the
// stream cannot tell).
std::uintmax_t BytesLeft(std::istream& in);

// Appends a line to a CR LF-joined text field.
void AppendLine(std::string& field, std::string_view line);

// Category of a two-letter record code: "Bearing", "PointID", "Angle",
// "Seconds", "Math" or "".
std::string RecordCodeCategory(std::string_view code);

}  // namespace zv
