#pragma once
// The FlexOut writer: writes OutputPoints as a user-defined delimited or
// fixed-position text file.

#include <ctime>
#include <optional>
#include <string>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"
#include "userformats/FlexStore.h"

namespace zv {

// What the FlexOut dialog collects.
struct FlexOutChoices {
  // The format shown; empty writes "UNDEFINED FORMAT" in the header. When
  // `format` is empty the stored format of this name is used.
  std::string formatName;
  std::optional<FlexOutFormat> format;
  // A linear unit name, or for geographic output one of the four angle
  // format names (used for "Latitude", "Longitude", "Convergance Angle").
  std::string horizontalUnits;
  std::string verticalUnits;
  std::string latitudeDirection = "N";
  std::string longitudeDirection = "W";
  // "Geographic Coordinates" disables the zone (no "ZN:" header line).
  std::string coordinateSystem;
  std::string zone;
  std::string horizontalDatum;
  // "None" disables the vertical units (no "VD:" line, one "UL:" line).
  std::string verticalDatum;
  // The time written in the header; empty: now.
  std::optional<std::tm> timestamp;
};

// One output column as the writer uses it.
struct FlexOutColumn {
  std::string name;
  int position = 0;  // position (fixed) or order (delimited)
  int decimals = 0;
};

// Writes the file (temporary file, then renamed into place). Converted
// values are stored back into OutputPoints. Shows a message and returns
// false when the format is unusable, there are no points, or the file cannot
// be written; warns after writing when fields had to be cut to their column
// positions or contain the delimiter.
bool FlexOut(Ui& ui, WorkArea& work, const std::string& appFolder, const std::string& path,
             const FlexOutChoices& choices);

}  // namespace zv
