#include "userformats/FlexIn.h"

#include <cfloat>
#include <charconv>
#include <cmath>
#include <fstream>

#include "geodesy/Angles.h"
#include "platform/Error.h"
#include "platform/ForwardingUi.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

constexpr const char* kFileKind = "User-Defined ASCII File";
constexpr int kMaxPosition = 32767;

bool IsBlankText(std::string_view s) {
  return s.find_first_not_of(" \t") == std::string_view::npos;
}

bool IsAngleFormat(const std::string& name) {
  return name == kFormatDMS || name == kFormatPacked || name == kFormatDecimal || name == kFormatDM;
}

// A format column resolved for reading.
struct ReadColumn {
  std::string name;
  std::optional<FlexColumn> column;  // empty: not in the vocabulary, ignored
  size_t start = 0;                  // 0-based start for fixed positions
};

// Checks the format and resolves its columns; shows the message and returns
// false when the format cannot be read with.
bool PrepareColumns(Ui& ui, const FlexInFormat& format, bool fixed,
                    std::vector<ReadColumn>& columns) {
  if (format.delimiter.empty()) {
    ui.exclaim("A Delimiter is required.", "Delimiter Required");
    return false;
  }
  if (format.columns.empty()) {
    ui.exclaim("You must specify at least one column to import.", "Specify Columns");
    return false;
  }
  columns.clear();
  for (size_t r = 0; r < format.columns.size(); ++r) {
    ReadColumn c;
    c.name = format.columns[r];
    c.column = FlexColumnFromName(c.name);
    if (fixed) {
      std::string_view cell = r < format.order.size() ? Trim(format.order[r]) : "";
      if (cell.empty()) {
        ui.exclaim("You must specify the column for '" + c.name + "'.", "Specify Column");
        return false;
      }
      int pos = 0;
      auto [ptr, ec] = std::from_chars(cell.data(), cell.data() + cell.size(), pos);
      if (ec != std::errc() || ptr != cell.data() + cell.size() || pos < 1 || pos > kMaxPosition) {
        ui.exclaim("The position '" + std::string(cell) + "' of the column '" + c.name +
                       "' is not a whole number from 1 to " + std::to_string(kMaxPosition) + ".",
                   "Invalid Column Position");
        return false;
      }
      c.start = static_cast<size_t>(pos - 1);
      if (!columns.empty() && c.start <= columns.back().start) {
        ui.exclaim("The column positions must be ascending: '" + c.name + "' at position " +
                       std::to_string(pos) + " does not start after '" + columns.back().name +
                       "' at position " + std::to_string(columns.back().start + 1) + ".",
                   "Invalid Column Position");
        return false;
      }
    }
    columns.push_back(std::move(c));
  }
  return true;
}

// Reads the lines of one file; keeps the state of the record being built.
class FlexReader {
 public:
  FlexReader(Ui& ui, const std::string& path, const std::string& angleFormat)
      : ui_(ui), path_(path), angleFormat_(angleFormat), angles_(IsAngleFormat(angleFormat)) {}

  // Stores one field; false (after the message) when it cannot be converted.
  bool store(SurveyPoint& p, const ReadColumn& c, std::string_view field, size_t lineNo);
  void lineError(size_t lineNo, const std::string& message) {
    ui_.exclaim("Invalid " + std::string(kFileKind) + " '" + path_ + "'.\r\nError on line " +
                    std::to_string(lineNo) + ".\r\n" + message,
                "Invalid " + std::string(kFileKind));
  }

 private:
  bool number(double& target, const ReadColumn& c, std::string_view field, size_t lineNo);
  bool single(float& target, const ReadColumn& c, std::string_view field, size_t lineNo);
  bool angle(double& target, const ReadColumn& c, std::string_view field, size_t lineNo);

  Ui& ui_;
  const std::string& path_;
  const std::string& angleFormat_;
  bool angles_;
};

bool FlexReader::number(double& target, const ReadColumn& c, std::string_view field,
                        size_t lineNo) {
  if (IsBlankText(field)) return true;  // no value
  std::optional<double> v = ToNumber(field);
  if (!v) {
    lineError(lineNo, "The " + c.name + " '" + std::string(field) + "' is not a number.");
    return false;
  }
  target = *v;
  return true;
}

bool FlexReader::single(float& target, const ReadColumn& c, std::string_view field, size_t lineNo) {
  double v = kNoValue;
  if (!number(v, c, field, lineNo)) return false;
  if (std::fabs(v) > FLT_MAX) {
    lineError(lineNo, "The " + c.name + " '" + std::string(field) + "' is out of range.");
    return false;
  }
  target = static_cast<float>(v);
  return true;
}

bool FlexReader::angle(double& target, const ReadColumn& c, std::string_view field, size_t lineNo) {
  if (!angles_) return true;  // plane coordinates: angle columns keep no value
  std::string_view text = Trim(field);
  if (text.empty()) return true;
  try {
    // Out-of-range minutes or seconds: the parser reports and gives -99999.
    LineNoteUi noted(ui_, lineNo);
    target = Angles_TextToRadians(noted, text, angleFormat_);
  } catch (const std::exception&) {
    lineError(lineNo, "The " + c.name + " '" + std::string(field) + "' is not an angle in the " +
                          angleFormat_ + " format.");
    return false;
  }
  return true;
}

bool FlexReader::store(SurveyPoint& p, const ReadColumn& c, std::string_view field, size_t lineNo) {
  if (!c.column) return true;
  switch (*c.column) {
    case FlexColumn::PointId:
      p.PointName.assign(field);
      return true;
    case FlexColumn::FeatureCode:
      p.FeatureCode.assign(field);
      return true;
    case FlexColumn::Geometry:
      p.Geometry.assign(field);
      return true;
    case FlexColumn::PointDescription:
      p.DescriptionLines = "PD:";
      p.DescriptionLines.append(field);
      return true;
    case FlexColumn::Attribute:
      if (!p.ExtraLines.empty()) p.ExtraLines += "\r\n";
      p.ExtraLines += "CM:";
      p.ExtraLines.append(field);
      return true;
    case FlexColumn::Northing:
      return number(p.Northing, c, field, lineNo);
    case FlexColumn::Easting:
      return number(p.Easting, c, field, lineNo);
    case FlexColumn::OrthometricHeight:
      return number(p.Elevation, c, field, lineNo);
    case FlexColumn::EllipsoidHeight:
      return number(p.EllipsoidHeight, c, field, lineNo);
    case FlexColumn::GeoidHeight:
      return number(p.GeoidHeight, c, field, lineNo);
    case FlexColumn::ScaleFactor:
      return number(p.ScaleFactor, c, field, lineNo);
    case FlexColumn::NorthingError:
      return single(p.NorthingError, c, field, lineNo);
    case FlexColumn::EastingError:
      return single(p.EastingError, c, field, lineNo);
    case FlexColumn::HeightError:
      return single(p.ElevationError, c, field, lineNo);
    case FlexColumn::Latitude:
      return angle(p.Latitude, c, field, lineNo);
    case FlexColumn::Longitude:
      return angle(p.Longitude, c, field, lineNo);
    case FlexColumn::ConvergenceAngle:
      return angle(p.Convergence, c, field, lineNo);
  }
  return true;
}

}  // namespace

bool ReadFlexInStream(Ui& ui, std::istream& in, const std::string& path, const FlexInFormat& format,
                      const std::string& angleFormat, FileHeader& header,
                      std::vector<SurveyPoint>& points) {
  const bool fixed = format.delimiter == kColumnSpecific;
  std::vector<ReadColumn> columns;
  if (!PrepareColumns(ui, format, fixed, columns)) return false;
  const std::string delimiter = ResolveDelimiter(format.delimiter);

  FlexReader reader(ui, path, angleFormat);
  std::vector<SurveyPoint> list;
  std::string projectHeader;
  SurveyPoint point;
  ResetPoint(point);

  // The size of the input: once the first lines show how long a line is,
  // the list makes room for all points at once (growing a list of a million
  // points step by step copies it and touches twice the memory).
  std::streamoff remaining = -1;
  if (const std::streampos here = in.tellg(); here != std::streampos(-1)) {
    if (in.seekg(0, std::ios::end)) remaining = in.tellg() - here;
    in.clear();
    in.seekg(here);
  }
  constexpr size_t kSampleLines = 1000;
  size_t sampleBytes = 0;

  LineReader lines(in, ui.progress());
  if (lines.isUtf16()) {
    ui.exclaim(Utf16Refusal(path), kUtf16Title);
    return false;
  }
  std::string_view line;
  size_t lineNo = 0;
  while (lines.next(line)) {
    ++lineNo;
    if (lineNo <= kSampleLines) {
      sampleBytes += line.size() + 1;
      if (lineNo == kSampleLines && remaining > 0) {
        const double perLine = static_cast<double>(sampleBytes) / kSampleLines;
        list.reserve(static_cast<size_t>(static_cast<double>(remaining) / perLine * 1.02) + 16);
      }
    }
    // Lines of blanks only hold no data; they are skipped like empty lines.
    if (IsBlankText(line)) continue;
    if (!format.headerPrefix.empty() && line.starts_with(format.headerPrefix)) {
      AppendLine(projectHeader, line);
      continue;
    }
    if (!format.ignorePrefix.empty() && line.starts_with(format.ignorePrefix)) continue;

    if (fixed) {
      for (size_t r = 0; r < columns.size(); ++r) {
        size_t start = columns[r].start;
        size_t end = r + 1 < columns.size() ? columns[r + 1].start : line.size();
        std::string_view field;
        if (start < line.size()) field = line.substr(start, std::min(end, line.size()) - start);
        // A text field is padded to its width: the blanks are not part of it.
        if (columns[r].column && IsFlexTextColumn(*columns[r].column)) field = Trim(field);
        if (!reader.store(point, columns[r], field, lineNo)) return false;
      }
    } else {
      size_t start = 0;
      size_t index = 0;
      for (;;) {
        size_t hit = line.find(delimiter, start);
        std::string_view field = line.substr(
            start, hit == std::string_view::npos ? std::string_view::npos : hit - start);
        if (index < columns.size()) {
          if (!reader.store(point, columns[index], field, lineNo)) return false;
        } else if (!IsBlankText(field)) {
          // A field without a column would be lost: refuse the file.
          size_t fieldCount = index + 1;
          for (size_t at = hit; at != std::string_view::npos;
               at = line.find(delimiter, at + delimiter.size())) {
            ++fieldCount;
          }
          reader.lineError(lineNo, "The line has " + std::to_string(fieldCount) +
                                       " fields but the format has " +
                                       std::to_string(columns.size()) + " columns.");
          return false;
        }
        if (hit == std::string_view::npos) break;
        start = hit + delimiter.size();
        ++index;
      }
    }
    list.push_back(std::move(point));
    ResetPoint(point);
  }
  if (!lines.atEnd()) {
    ui.exclaim("The file '" + path + "' could not be read to its end.", "Read Error");
    return false;
  }
  if (list.empty()) {
    ui.exclaim("No points were found in '" + path +
                   "'.\r\nEvery line is empty, a project-header line or an ignored line.",
               "No Points Found");
    return false;
  }
  header = FileHeader{};
  header.HeaderExtraLines = std::move(projectHeader);
  points = std::move(list);
  return true;
}

bool FlexIn(Ui& ui, WorkArea& work, const std::string& appFolder, const std::string& path,
            const FlexInChoices& choices) {
  FlexInFormat format;
  if (choices.format) {
    format = *choices.format;
  } else {
    FlexStore store = FlexStore::Input(appFolder);
    if (!store.checkFormat(ui, choices.formatName)) return false;
    format = store.loadInput(choices.formatName);
  }
  if (!FileExists(path)) {
    ui.exclaim("The file '" + path + "' can not be found.", "File Not Found");
    return false;
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) {
    ui.exclaim("The file '" + path + "' can not be opened.", "File Not Found");
    return false;
  }
  FileHeader header;
  std::vector<SurveyPoint> points;
  if (!ReadFlexInStream(ui, in, path, format, choices.horizontalUnits, header, points)) {
    return false;
  }

  header.CoordinateSystem = choices.coordinateSystem;
  header.Zone = choices.zone;
  header.HorizontalDatum = choices.horizontalDatum;
  header.HorizontalUnits = choices.horizontalUnits;
  header.VerticalDatum = choices.verticalDatum;
  header.VerticalUnits = choices.verticalUnits;

  // The values stand in the chosen units and hemisphere conventions; the
  // writers convert from what each point carries.
  const bool geographic = format.coordinateType == kGeographic;
  const bool latitudeOk = choices.latitudeDirection == "N" || choices.latitudeDirection == "S";
  const bool longitudeOk = choices.longitudeDirection == "W" || choices.longitudeDirection == "E";
  for (auto& p : points) {
    p.HorizontalUnits = choices.horizontalUnits;
    p.VerticalUnits = choices.verticalUnits;
    if (geographic && latitudeOk) p.LatitudeHemisphere = choices.latitudeDirection;
    if (geographic && longitudeOk) p.LongitudeHemisphere = choices.longitudeDirection;
  }
  work.InputHeader = std::move(header);
  work.InputPoints = std::move(points);
  return true;
}

}  // namespace zv
