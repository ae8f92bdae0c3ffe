#pragma once
// The survey model: point, chain and header records and the work area that
// readers fill and writers consume. Point and chain texts are CompactText
// fields (eight bytes each), so that a million points stay near 250 MB.

#include <cstdint>
#include <istream>
#include <string>
#include <vector>

#include "platform/CompactText.h"
#include "platform/Numbers.h"

namespace zv {

// The coordinate system of latitudes and longitudes, beside the grid systems
// of the zone catalog.
inline constexpr const char* kGeographicCoordinates = "Geographic Coordinates";

struct SurveyPoint {
  CompactText PointName;
  CompactText Text2;  // not used by the survey formats; carried through
  CompactText Geometry = "P";
  CompactText CodeLetter;
  CompactText FeatureCode;
  CompactText IntegerAttribute;
  CompactText Text7;
  CompactText DescriptionLines;  // whole "PD:" lines joined by CR LF
  double Northing = kNoValue;
  double Easting = kNoValue;
  double Elevation = kNoValue;
  float NorthingError = kNoValueF;
  float EastingError = kNoValueF;
  float ElevationError = kNoValueF;
  // The flags fill the gap after the three floats.
  bool GridMissing = false;
  bool NotYetWritten = true;
  bool HorizontalIsControl = false;
  bool ElevationIsControl = false;
  double Latitude = kNoValue;
  double Longitude = kNoValue;
  double EllipsoidHeight = kNoValue;
  double GeoidHeight = kNoValue;
  CompactText Text19;
  double Convergence = kNoValue;
  double ScaleFactor = kNoValue;
  CompactText ExtraLines;  // whole lines with unknown tags, joined by CR LF
  CompactText Text27;
  CompactText HorizontalUnits;
  CompactText VerticalUnits;
  CompactText LatitudeHemisphere = "N";
  CompactText LongitudeHemisphere = "W";
  CompactText RecordCode;  // kept by ResetPoint
  CompactText Text33;      // kept by ResetPoint
  CompactText GRText;
};

// Sets every field to its initial value except RecordCode and Text33.
void ResetPoint(SurveyPoint& point);

struct SurveyChain {
  CompactText ChainName;
  CompactText CodeLetter;
  CompactText IntegerAttribute;
  CompactText FeatureCode;
  CompactText Description;  // whole "CD:" lines joined by CR LF
  CompactText FGText;
  CompactText PointListLines;  // whole "PL:" lines joined by CR LF
  CompactText ChainLines;      // whole "CH:" lines joined by CR LF
  CompactText ExtraLines;
  bool Open = false;
  CompactText Station;
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
