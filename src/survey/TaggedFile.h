#pragma once
// The reading and writing rules that the VORN tagged formats (control,
// points-and-chains and project files) share. Each format is a table: the
// tags it knows beyond the shared ones, its messages and its layout choices.

#include <cstdint>
#include <istream>
#include <span>
#include <string>
#include <string_view>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

// What a tag does when a line carrying it is read.
enum class TagAction : std::uint8_t {
  Unknown,  // kept whole among the extra lines of the current section
  Ignore,
  ProjectLine,
  Section,
  PointName,
  Easting,
  Northing,
  Elevation,
  EastingError,
  NorthingError,
  ElevationError,
  Latitude,
  Longitude,
  Convergence,
  EllipsoidHeight,
  GeoidHeight,
  ScaleFactor,
  Description,
  FeatureCode,
  Geometry,
  GRText,
  CoordinateSystem,
  Zone,
  HorizontalDatum,
  VerticalDatum,
  Units,
  EndChain,
  ChainDescription,
  ChainFG,
  ChainPointList,
  ChainLines,
  Refuse,  // the format's coordinate rule error
};

// What a coordinate tag does to the point's control flag.
enum class ControlFlag : std::uint8_t { Keep, Set, Clear };

struct TagRule {
  char tag[3];  // two capital letters
  TagAction action;
  ControlFlag flag = ControlFlag::Keep;
};

// The tags a writer puts on the coordinate lines of a point.
enum class CoordinateTags : std::uint8_t { Control, Computed, ByFlags };

struct TaggedFormat {
  std::string_view name;            // "VORN Control File"; the F of the messages
  std::string_view blankLineRule;   // rule message for an empty line
  std::string_view coordinateRule;  // rule message for a TagAction::Refuse tag
  bool fieldErrorsAsLineRule;       // field errors use the line-rule layout
  bool hasChains;                   // AC:CH sections, BG/EG/CP lines, chain list
  // Point tags inside a project section carry into the next point instead of
  // being stored at the next AC line; without it, PD lines there are header
  // lines.
  bool projectSectionKeepsPoint;
  bool pointRecordCodes;           // the AC value of a point is its RecordCode
  std::span<const TagRule> rules;  // the tags beyond the shared ones
  std::string_view pointOpening;   // "AC:OS"; empty: "AC:" + RecordCode
  CoordinateTags coordinates;
  bool writesGeometry;
};

// Reads a whole tagged file into the input side of the work area. On any
// error it shows one message, leaves the work area untouched and returns false.
// `sizeHint`, the input size in bytes when known, lets the point list be sized
// once.
bool ReadTaggedStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path,
                      const TaggedFormat& format, std::uintmax_t sizeHint = 0);
bool ReadTaggedFile(Ui& ui, WorkArea& work, const std::string& path, const TaggedFormat& format);

// Writes the output side of the work area, storing the converted values back
// into the output points and the unit code into the output header.
bool WriteTaggedFile(Ui& ui, WorkArea& work, const std::string& path, const TaggedFormat& format);

// The CP value for a local time: "mm/dd/yyyy h:mm:ss".
std::string ChainListDate(std::int64_t unixTime);

}  // namespace zv
