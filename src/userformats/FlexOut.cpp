#include "userformats/FlexOut.h"

#include <charconv>

#include "Version.h"
#include "geodesy/Angles.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"
#include "survey/SurveyFiles.h"

namespace zv {

namespace {

constexpr int kMaxPosition = 32767;
constexpr int kMaxDecimals = 15;

std::optional<int> WholeNumber(std::string_view cell, int low, int high) {
  int v = 0;
  auto [ptr, ec] = std::from_chars(cell.data(), cell.data() + cell.size(), v);
  if (ec != std::errc() || ptr != cell.data() + cell.size() || v < low || v > high) {
    return std::nullopt;
  }
  return v;
}

// The grid rows as column entries, sorted by position or order (stable:
// equal numbers keep their grid order).
bool BuildColumns(Ui& ui, const FlexOutFormat& format, std::vector<FlexOutColumn>& columns) {
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
    FlexOutColumn c;
    c.name = format.columns[r];
    std::string_view cell = r < format.order.size() ? Trim(format.order[r]) : "";
    if (cell.empty()) {
      ui.exclaim("You must specify the column for '" + c.name + "'.", "Specify Column");
      return false;
    }
    auto pos = WholeNumber(cell, 1, kMaxPosition);
    if (!pos) {
      ui.exclaim("The position '" + std::string(cell) + "' of the column '" + c.name +
                     "' is not a whole number from 1 to " + std::to_string(kMaxPosition) + ".",
                 "Invalid Column Position");
      return false;
    }
    c.position = *pos;
    std::string_view places = r < format.decimalPlaces.size() ? Trim(format.decimalPlaces[r]) : "";
    if (!places.empty()) {
      auto d = WholeNumber(places, 0, kMaxDecimals);
      if (!d) {
        ui.exclaim("The decimal places '" + std::string(places) + "' of the column '" + c.name +
                       "' are not a whole number from 0 to " + std::to_string(kMaxDecimals) + ".",
                   "Invalid Decimal Places");
        return false;
      }
      c.decimals = *d;
    }
    columns.push_back(std::move(c));
  }
  // Bubble sort, swapping neighbours only when the first is strictly greater.
  for (size_t pass = 0; pass + 1 < columns.size(); ++pass) {
    for (size_t i = 0; i + 1 < columns.size() - pass; ++i) {
      if (columns[i].position > columns[i + 1].position) std::swap(columns[i], columns[i + 1]);
    }
  }
  return true;
}

std::string TwoDigits(int v) {
  std::string s = std::to_string(v);
  return s.size() < 2 ? "0" + s : s;
}

std::string HeaderTime(const FlexOutChoices& choices) {
  std::tm t{};
  if (choices.timestamp) {
    t = *choices.timestamp;
  } else {
    std::time_t now = std::time(nullptr);
    localtime_r(&now, &t);
  }
  return TwoDigits(t.tm_mon + 1) + "/" + TwoDigits(t.tm_mday) + "/" +
         std::to_string(t.tm_year + 1900) + " " + std::to_string(t.tm_hour) + ":" +
         TwoDigits(t.tm_min) + ":" + TwoDigits(t.tm_sec);
}

std::string ReplaceLineBreaks(const std::string& text) {
  std::string out;
  out.reserve(text.size());
  for (size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '\r' && i + 1 < text.size() && text[i + 1] == '\n') {
      out += "  ";
      ++i;
    } else {
      out += text[i];
    }
  }
  return out;
}

// The values of a point before any conversion, so that a column that
// appears twice is not converted twice.
struct Originals {
  double northing, easting, elevation, ellipsoidHeight, geoidHeight, latitude, longitude;
  float northingError, eastingError, elevationError;
};

class FieldMaker {
 public:
  FieldMaker(Ui& ui, const FlexOutChoices& choices)
      : ui_(ui),
        c_(choices),
        angleFormat_(
            choices.horizontalUnits == kFormatDMS || choices.horizontalUnits == kFormatPacked ||
            choices.horizontalUnits == kFormatDecimal || choices.horizontalUnits == kFormatDM) {}

  void field(SurveyPoint& p, const Originals& o, const FlexOutColumn& col, std::string& out);

 private:
  double linear(double value, const std::string& fromUnit, const std::string& toUnit) {
    if (value == kNoValue) return value;
    return Distances_Convert(value, fromUnit, toUnit);
  }
  void angle(double radians, int decimals, std::string& out);

  Ui& ui_;
  const FlexOutChoices& c_;
  bool angleFormat_;
};

void FieldMaker::angle(double radians, int decimals, std::string& out) {
  if (!angleFormat_) return;
  if (radians == kNoValue) {
    out += "-99999";
    return;
  }
  const std::string& f = c_.horizontalUnits;
  if (f == kFormatDMS) {
    out += Angles_RadiansToDMS(ui_, radians, decimals, false);
  } else if (f == kFormatPacked) {
    out += Angles_RadiansToPacked(ui_, radians, decimals);
  } else if (f == kFormatDecimal) {
    out += Angles_RadiansToDecimal(radians, decimals, false);
  } else {
    out += Angles_RadiansToDM(radians, decimals, false);
  }
}

void FieldMaker::field(SurveyPoint& p, const Originals& o, const FlexOutColumn& col,
                       std::string& out) {
  auto column = FlexColumnFromName(col.name);
  if (!column) return;
  const int d = col.decimals;
  switch (*column) {
    case FlexColumn::PointId:
      out += p.PointName;
      return;
    case FlexColumn::FeatureCode:
      out += p.FeatureCode;
      return;
    case FlexColumn::Geometry:
      out += p.Geometry;
      return;
    case FlexColumn::PointDescription:
      out += ReplaceLineBreaks(p.DescriptionLines);
      return;
    case FlexColumn::Attribute:
      out += ReplaceLineBreaks(p.ExtraLines);
      return;
    case FlexColumn::Northing:
      p.Northing = linear(o.northing, p.HorizontalUnits, c_.horizontalUnits);
      AppendFixed(out, p.Northing, d);
      return;
    case FlexColumn::Easting:
      p.Easting = linear(o.easting, p.HorizontalUnits, c_.horizontalUnits);
      AppendFixed(out, p.Easting, d);
      return;
    case FlexColumn::NorthingError:
      p.NorthingError =
          static_cast<float>(linear(o.northingError, p.HorizontalUnits, c_.horizontalUnits));
      AppendFixed(out, p.NorthingError, d);
      return;
    case FlexColumn::EastingError:
      p.EastingError =
          static_cast<float>(linear(o.eastingError, p.HorizontalUnits, c_.horizontalUnits));
      AppendFixed(out, p.EastingError, d);
      return;
    case FlexColumn::OrthometricHeight:
      p.Elevation = linear(o.elevation, p.VerticalUnits, c_.verticalUnits);
      AppendFixed(out, p.Elevation, d);
      return;
    case FlexColumn::EllipsoidHeight:
      p.EllipsoidHeight = linear(o.ellipsoidHeight, p.VerticalUnits, c_.verticalUnits);
      AppendFixed(out, p.EllipsoidHeight, d);
      return;
    case FlexColumn::GeoidHeight:
      p.GeoidHeight = linear(o.geoidHeight, p.VerticalUnits, c_.verticalUnits);
      AppendFixed(out, p.GeoidHeight, d);
      return;
    case FlexColumn::HeightError:
      p.ElevationError =
          static_cast<float>(linear(o.elevationError, p.VerticalUnits, c_.verticalUnits));
      AppendFixed(out, p.ElevationError, d);
      return;
    case FlexColumn::ScaleFactor:
      AppendFixed(out, p.ScaleFactor, d);
      return;
    case FlexColumn::Latitude:
      if (!angleFormat_) return;
      p.Latitude =
          o.latitude == kNoValue
              ? o.latitude
              : Angles_ConvertHemisphere(o.latitude, p.LatitudeHemisphere, c_.latitudeDirection);
      angle(p.Latitude, d, out);
      return;
    case FlexColumn::Longitude:
      if (!angleFormat_) return;
      p.Longitude =
          o.longitude == kNoValue
              ? o.longitude
              : Angles_ConvertHemisphere(o.longitude, p.LongitudeHemisphere, c_.longitudeDirection);
      angle(p.Longitude, d, out);
      return;
    case FlexColumn::ConvergenceAngle:
      angle(p.Convergence, d, out);
      return;
  }
}

// The first place where written text will not read back as it stands.
struct Trouble {
  size_t count = 0;
  size_t line = 0;
  std::string column;
  void note(size_t lineNo, const std::string& name) {
    if (count++ == 0) {
      line = lineNo;
      column = name;
    }
  }
};

}  // namespace

bool FlexOut(Ui& ui, WorkArea& work, const std::string& appFolder, const std::string& path,
             const FlexOutChoices& choices) {
  FlexOutFormat format;
  if (choices.format) {
    format = *choices.format;
  } else {
    FlexStore store = FlexStore::Output(appFolder);
    if (!store.checkFormat(ui, choices.formatName)) return false;
    format = store.loadOutput(choices.formatName);
  }
  std::vector<FlexOutColumn> columns;
  if (!BuildColumns(ui, format, columns)) return false;
  if (work.OutputPoints.empty()) {
    ui.exclaim("There are no points to write. The file '" + path + "' was not written.",
               "No Points");
    return false;
  }
  const bool fixed = format.delimiter == kColumnSpecific;
  const std::string delimiter = ResolveDelimiter(format.delimiter);

  TextFileWriter out(path);
  if (!out.open()) {
    ReportWriteFailure(ui, path, out.error());
    return false;
  }
  size_t lineNo = 0;
  if (format.writeHeader) {
    const std::string& p = format.headerPrefix;
    auto header = [&](const std::string& text) {
      out.line(p + text);
      ++lineNo;
    };
    header(VersionLine());
    header("CM:" + HeaderTime(choices));
    header(choices.formatName.empty() ? "CM:FLEXED OUT USING UNDEFINED FORMAT"
                                      : "CM:FLEXED OUT USING " + choices.formatName);
    header("CS:" + choices.coordinateSystem);
    if (choices.coordinateSystem != kGeographicCoordinates) header("ZN:" + choices.zone);
    header("HD:" + choices.horizontalDatum);
    const bool verticalUnitsEnabled = choices.verticalDatum != "None";
    if (verticalUnitsEnabled) header("VD:" + choices.verticalDatum);
    if (verticalUnitsEnabled && choices.verticalUnits != choices.horizontalUnits) {
      header("CM:HORIZONTAL UNITS - " + choices.horizontalUnits);
      header("CM:VERTICAL UNITS - " + choices.verticalUnits);
    } else {
      header("UL:" + choices.horizontalUnits);
    }
    const std::string& extra = work.OutputHeader.HeaderExtraLines;
    if (!extra.empty()) {
      size_t start = 0;
      for (;;) {
        size_t br = extra.find("\r\n", start);
        header(extra.substr(start, br == std::string::npos ? std::string::npos : br - start));
        if (br == std::string::npos) break;
        start = br + 2;
      }
    }
  }

  FieldMaker maker(ui, choices);
  Trouble cut;
  Trouble split;
  std::string line;
  std::string fieldText;
  size_t done = 0;
  for (SurveyPoint& p : work.OutputPoints) {
    StepItems(ui.progress(), RunStage::Writing, done++, work.OutputPoints.size());
    ++lineNo;
    const Originals o{p.Northing,     p.Easting,       p.Elevation, p.EllipsoidHeight,
                      p.GeoidHeight,  p.Latitude,      p.Longitude, p.NorthingError,
                      p.EastingError, p.ElevationError};
    line.clear();
    for (size_t i = 0; i < columns.size(); ++i) {
      fieldText.clear();
      maker.field(p, o, columns[i], fieldText);
      if (fixed) {
        size_t want = static_cast<size_t>(columns[i].position - 1);
        if (line.size() > want) {
          if (line.find_first_not_of(' ', want) != std::string::npos) {
            cut.note(lineNo, columns[i - 1].name);
          }
          line.resize(want);
        } else {
          line.resize(want, ' ');
        }
      } else {
        if (i > 0) line += delimiter;
        if (fieldText.find(delimiter) != std::string::npos) split.note(lineNo, columns[i].name);
      }
      line += fieldText;
    }
    out.line(line);
  }
  if (!out.commit()) {
    ReportWriteFailure(ui, path, out.error());
    return false;
  }

  if (cut.count > 0 || split.count > 0) {
    std::string text = "The file '" + path + "' was written, but:";
    if (cut.count > 0) {
      text += "\r\n" + std::to_string(cut.count) +
              " field(s) were cut short by the next column's position (first on line " +
              std::to_string(cut.line) + ", column '" + cut.column + "').";
    }
    if (split.count > 0) {
      text += "\r\n" + std::to_string(split.count) +
              " field(s) contain the delimiter and will not read back as one field (first on "
              "line " +
              std::to_string(split.line) + ", column '" + split.column + "').";
    }
    ui.exclaim(text, "Check Output File");
  }
  return true;
}

}  // namespace zv
