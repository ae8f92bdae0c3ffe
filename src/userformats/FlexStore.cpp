#include "userformats/FlexStore.h"

#include <array>
#include <cctype>

#include "platform/Profile.h"
#include "platform/ProfileDocument.h"
#include "platform/Strings.h"

namespace zv {

namespace {

struct ColumnInfo {
  FlexColumn column;
  const char* name;
};

// Vocabulary order: the order of the offered lists.
constexpr std::array<ColumnInfo, 17> kColumns = {{
    {FlexColumn::PointId, "Point ID"},
    {FlexColumn::Northing, "Northing"},
    {FlexColumn::Easting, "Easting"},
    {FlexColumn::OrthometricHeight, "Orthometric Height"},
    {FlexColumn::Latitude, "Latitude"},
    {FlexColumn::Longitude, "Longitude"},
    {FlexColumn::EllipsoidHeight, "Ellipsoid Height"},
    {FlexColumn::FeatureCode, "Feature Code"},
    {FlexColumn::PointDescription, "Point Description"},
    {FlexColumn::Attribute, "Attribute"},
    {FlexColumn::Geometry, "Geometry"},
    {FlexColumn::NorthingError, "Northing Error Estimate"},
    {FlexColumn::EastingError, "Easting Error Estimate"},
    {FlexColumn::HeightError, "Height Error Estimate"},
    {FlexColumn::GeoidHeight, "Geoid Height"},
    {FlexColumn::ConvergenceAngle, "Convergance Angle"},
    {FlexColumn::ScaleFactor, "Scale Factor"},
}};

}  // namespace

const char* FlexColumnName(FlexColumn column) {
  for (const auto& info : kColumns) {
    if (info.column == column) return info.name;
  }
  return "";
}

std::optional<FlexColumn> FlexColumnFromName(std::string_view name) {
  for (const auto& info : kColumns) {
    if (name == info.name) return info.column;
  }
  return std::nullopt;
}

std::vector<std::string> FlexColumnNames(std::string_view coordinateType) {
  std::vector<std::string> names;
  bool geographic = coordinateType == kGeographic;
  for (const auto& info : kColumns) {
    switch (info.column) {
      case FlexColumn::Northing:
      case FlexColumn::Easting:
      case FlexColumn::OrthometricHeight:
        if (geographic) continue;
        break;
      case FlexColumn::Latitude:
      case FlexColumn::Longitude:
      case FlexColumn::EllipsoidHeight:
        if (!geographic) continue;
        break;
      default:
        break;
    }
    names.emplace_back(info.name);
  }
  return names;
}

bool IsFlexTextColumn(FlexColumn column) {
  return column == FlexColumn::PointId || column == FlexColumn::FeatureCode ||
         column == FlexColumn::PointDescription || column == FlexColumn::Attribute ||
         column == FlexColumn::Geometry;
}

std::vector<std::string> FlexDelimiterNames() {
  return {"Comma", kColumnSpecific, "Space", "Tab", "Semicolon"};
}

std::string ResolveDelimiter(const std::string& delimiterName) {
  if (delimiterName == "Comma") return ",";
  if (delimiterName == "Space") return " ";
  if (delimiterName == "Tab") return "\t";
  if (delimiterName == "Semicolon") return ";";
  return delimiterName;
}

std::vector<std::string> SplitList(std::string_view text) {
  std::vector<std::string> items;
  if (text.empty()) return items;
  size_t start = 0;
  for (;;) {
    size_t comma = text.find(',', start);
    if (comma == std::string_view::npos) {
      items.emplace_back(text.substr(start));
      return items;
    }
    items.emplace_back(text.substr(start, comma - start));
    start = comma + 1;
  }
}

std::string JoinList(const std::vector<std::string>& items) {
  std::string text;
  for (size_t i = 0; i < items.size(); ++i) {
    if (i > 0) text += ',';
    text += items[i];
  }
  return text;
}

FlexStore FlexStore::Input(const std::string& appFolder) {
  return FlexStore(appFolder + "/" + kFlexInStoreName);
}

FlexStore FlexStore::Output(const std::string& appFolder) {
  return FlexStore(appFolder + "/" + kFlexOutStoreName);
}

std::vector<std::string> FlexStore::listFormats() const {
  return ProfileDocument::Load(path_).sectionNames();
}

bool FlexStore::checkFormat(Ui& ui, const std::string& name) const {
  if (hasFormat(name)) return true;
  ui.exclaim("The format '" + name + "' can not be found in '" + path_ + "'.", "Format Not Found");
  return false;
}

bool FlexStore::hasFormat(const std::string& name) const {
  for (const auto& section : listFormats()) {
    if (EqualsNoCase(section, name)) return true;
  }
  return false;
}

std::string FlexStore::readValue(const std::string& format, const std::string& key,
                                 const std::string& defaultValue) const {
  return ReadProfileValue(path_, format, key, defaultValue);
}

bool FlexStore::writeValue(const std::string& format, const std::string& key,
                           const std::string& value) const {
  return WriteProfileValue(path_, format, key, value);
}

bool FlexStore::deleteFormat(const std::string& format) const {
  return DeleteProfileSection(path_, format);
}

FlexInFormat FlexStore::loadInput(const std::string& name) const {
  const ProfileDocument doc = ProfileDocument::Load(path_);
  auto value = [&](const char* key) { return doc.value(name, key, ""); };
  FlexInFormat f;
  f.delimiter = value("Delimiter");
  f.coordinateType = value("Coordinate Type");
  f.columns = SplitList(value("Columns"));
  f.order = SplitList(value("Column Order"));
  f.headerPrefix = value("Header");
  f.ignorePrefix = value("Ignore");
  return f;
}

FlexOutFormat FlexStore::loadOutput(const std::string& name) const {
  const ProfileDocument doc = ProfileDocument::Load(path_);
  auto value = [&](const char* key) { return doc.value(name, key, ""); };
  FlexOutFormat f;
  f.delimiter = value("Delimiter");
  f.coordinateType = value("Coordinate Type");
  f.columns = SplitList(value("Columns"));
  f.order = SplitList(value("Column Order"));
  f.decimalPlaces = SplitList(value("Decimal Places"));
  // Anything but "1" (missing, "0" or not a number) leaves the header off.
  f.writeHeader = value("Write Header") == "1";
  f.headerPrefix = value("Header Prefix");
  return f;
}

namespace {

// One format section, written with one write of the file.
bool SaveFormat(const std::string& path, const std::string& name, const ProfileKeys& keys) {
  if (!IsValidFormatName(name)) return false;
  std::vector<std::string> managed;
  for (const auto& key : keys) managed.push_back(key.first);
  ProfileDocument doc = ProfileDocument::Load(path);
  doc.writeSection(name, keys, managed);
  return doc.save(path);
}

}  // namespace

bool FlexStore::save(const std::string& name, const FlexInFormat& f) const {
  return SaveFormat(path_, name,
                    {{"Delimiter", f.delimiter},
                     {"Coordinate Type", f.coordinateType},
                     {"Columns", JoinList(f.columns)},
                     {"Column Order", JoinList(f.order)},
                     {"Header", f.headerPrefix},
                     {"Ignore", f.ignorePrefix}});
}

bool FlexStore::save(const std::string& name, const FlexOutFormat& f) const {
  return SaveFormat(path_, name,
                    {{"Delimiter", f.delimiter},
                     {"Coordinate Type", f.coordinateType},
                     {"Columns", JoinList(f.columns)},
                     {"Column Order", JoinList(f.order)},
                     {"Decimal Places", JoinList(f.decimalPlaces)},
                     {"Write Header", f.writeHeader ? "1" : "0"},
                     {"Header Prefix", f.headerPrefix}});
}

bool IsValidFormatName(std::string_view name) {
  return IsValidSectionName(name);
}

}  // namespace zv
