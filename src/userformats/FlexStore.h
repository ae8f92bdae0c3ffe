#pragma once
// User-defined ("flex") formats: the column vocabulary, delimiter names and
// the two format stores flexin.ini and flexout.ini (one section per format).

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

inline constexpr const char* kFlexInStoreName = "flexin.ini";
inline constexpr const char* kFlexOutStoreName = "flexout.ini";

inline constexpr const char* kColumnSpecific = "Column Specific";
inline constexpr const char* kPlane = "Plane";
inline constexpr const char* kGeographic = "Geographic";

// The columns a format may use. The names (FlexColumnName) are both the
// texts shown and the keys stored, "Convergance Angle" included.
enum class FlexColumn {
  PointId,
  Northing,
  Easting,
  OrthometricHeight,
  Latitude,
  Longitude,
  EllipsoidHeight,
  FeatureCode,
  PointDescription,
  Attribute,
  Geometry,
  NorthingError,
  EastingError,
  HeightError,
  GeoidHeight,
  ConvergenceAngle,
  ScaleFactor,
};

const char* FlexColumnName(FlexColumn column);
// The column of a name (exact, case-sensitive); nullopt for other names.
std::optional<FlexColumn> FlexColumnFromName(std::string_view name);
// The names offered for "Plane" or "Geographic": "Point ID", the three
// coordinate columns of that type, then the columns offered for both.
std::vector<std::string> FlexColumnNames(std::string_view coordinateType);
// Columns that hold text (no decimal places apply).
bool IsFlexTextColumn(FlexColumn column);

// The delimiter list of the dialogs, in list order.
std::vector<std::string> FlexDelimiterNames();
// "Comma", "Space", "Tab", "Semicolon" to their character; any other text
// is itself the delimiter. Not meaningful for "Column Specific".
std::string ResolveDelimiter(const std::string& delimiterName);

// Splits a stored list at ","; an empty text is an empty list.
std::vector<std::string> SplitList(std::string_view text);
std::string JoinList(const std::vector<std::string>& items);

// An input format as stored in flexin.ini; `order` holds the cells of the
// "Column Order" grid column (sequence numbers, or start positions for a
// "Column Specific" format), possibly fewer than there are columns.
struct FlexInFormat {
  std::string delimiter;
  std::string coordinateType;
  std::vector<std::string> columns;
  std::vector<std::string> order;
  std::string headerPrefix;
  std::string ignorePrefix;
};

// An output format as stored in flexout.ini.
struct FlexOutFormat {
  std::string delimiter;
  std::string coordinateType;
  std::vector<std::string> columns;
  std::vector<std::string> order;
  std::vector<std::string> decimalPlaces;
  bool writeHeader = false;
  std::string headerPrefix;
};

// One store file. Every call reads the file once; a save writes the whole
// format with one write of the file, keeping the other formats byte for byte.
class FlexStore {
 public:
  explicit FlexStore(std::string path) : path_(std::move(path)) {}
  static FlexStore Input(const std::string& appFolder);
  static FlexStore Output(const std::string& appFolder);

  const std::string& path() const { return path_; }

  // Format names in file order.
  std::vector<std::string> listFormats() const;
  // True when a format of that name (letter case aside) exists.
  bool hasFormat(const std::string& name) const;
  // hasFormat, with a "Format Not Found" message when it is false.
  bool checkFormat(Ui& ui, const std::string& name) const;
  // The stored value, or the default when missing or empty.
  std::string readValue(const std::string& format, const std::string& key,
                        const std::string& defaultValue = "") const;
  bool writeValue(const std::string& format, const std::string& key,
                  const std::string& value) const;
  bool deleteFormat(const std::string& format) const;

  FlexInFormat loadInput(const std::string& name) const;
  FlexOutFormat loadOutput(const std::string& name) const;
  // False when the name cannot be a section name (IsValidFormatName) or the
  // file cannot be written.
  bool save(const std::string& name, const FlexInFormat& format) const;
  bool save(const std::string& name, const FlexOutFormat& format) const;

 private:
  std::string path_;
};

// A name that reads back as the same section: not empty, no "]", no line
// break, no blanks at either end.
bool IsValidFormatName(std::string_view name);

}  // namespace zv
