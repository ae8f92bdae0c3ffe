#pragma once
// The FlexIn reader: turns a user-defined delimited or fixed-position text
// file into survey points.

#include <istream>
#include <optional>
#include <string>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"
#include "userformats/FlexStore.h"

namespace zv {

// What the FlexIn dialog collects.
struct FlexInChoices {
  // The format shown in the dialog; used for messages and, when `format` is
  // empty, to load the stored format of that name from flexin.ini.
  std::string formatName;
  // The format as shown (possibly edited and not saved).
  std::optional<FlexInFormat> format;
  std::string latitudeDirection = "N";
  std::string longitudeDirection = "W";
  std::string coordinateSystem;
  std::string zone;
  std::string horizontalDatum;
  // A linear unit name, or for geographic coordinates one of the four angle
  // format names (the format of "Latitude", "Longitude", "Convergance Angle").
  std::string horizontalUnits;
  std::string verticalDatum;
  std::string verticalUnits;
};

// Reads the file with the chosen format. On success replaces InputPoints and
// InputHeader: the header's HeaderExtraLines holds the project-header lines,
// its coordinate reference the choices; every point carries the chosen units
// (and, for geographic formats, the chosen hemisphere letters). On failure
// shows one message and changes nothing.
bool FlexIn(Ui& ui, WorkArea& work, const std::string& appFolder, const std::string& path,
            const FlexInChoices& choices);

// The reader proper, on a stream. `path` is only used in messages;
// `angleFormat` is the text of the horizontal-units choice. On success fills
// `header` (HeaderExtraLines only) and `points`.
bool ReadFlexInStream(Ui& ui, std::istream& in, const std::string& path, const FlexInFormat& format,
                      const std::string& angleFormat, FileHeader& header,
                      std::vector<SurveyPoint>& points);

}  // namespace zv
