#include "geodesy/BatchExchange.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <vector>

#include "geodesy/Angles.h"
#include "geodesy/CatalogStore.h"
#include "geodesy/Catalogs.h"
#include "platform/Error.h"
#include "platform/Numbers.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

constexpr const char* kRefusalTitle = "Invalid Coordinate Request";

// The full unit name of a code or name; empty when it is neither.
std::string UnitName(const std::string& text) {
  for (const std::string& name : LinearUnitNames()) {
    if (Distances_Convert(1, text, name) == 1 && Distances_Convert(1, name, text) == 1) return name;
  }
  return "";
}

std::string UnitCode(const std::string& name) {
  if (name == kMeters) return "M";
  if (name == kUsSurveyFeet) return "F";
  if (name == kInternationalFeet) return "I";
  return name;
}

std::vector<std::string_view> SplitFields(std::string_view line) {
  std::vector<std::string_view> fields;
  size_t start = 0;
  for (;;) {
    size_t comma = line.find(',', start);
    fields.push_back(line.substr(start, comma - start));
    if (comma == std::string_view::npos) return fields;
    start = comma + 1;
  }
}

// Reads point lines; each refusal names the line.
class PointLineReader {
 public:
  PointLineReader(Ui& ui, size_t lineNumber, std::string_view line)
      : ui_(ui), number_(lineNumber), line_(line) {}

  bool refuse(const std::string& what) {
    ui_.exclaim(
        "Line " + std::to_string(number_) + " of tccin.tmp " + what + "\r\n" + std::string(line_),
        kRefusalTitle);
    return false;
  }

  // A number, or kNoValue for an empty optional field.
  bool number(std::string_view field, const char* what, bool required, double& value) {
    std::string text(Trim(field));
    if (text.empty() && !required) {
      value = kNoValue;
      return true;
    }
    std::optional<double> v = ToNumber(text);
    if (!v) return refuse(std::string("gives the ") + what + " '" + text + "', not a number.");
    value = *v;
    return true;
  }

  bool number(std::string_view field, const char* what, float& value) {
    double v = 0;
    if (!number(field, what, false, v)) return false;
    value = v == kNoValue ? kNoValueF : static_cast<float>(v);
    return true;
  }

  // A packed "DDD.MMSSssss" angle, north- or west-positive.
  bool angle(std::string_view field, const char* what, double& value) {
    std::string text(Trim(field));
    if (!IsNumeric(text)) {
      return refuse(std::string("gives the ") + what + " '" + text + "', not a number.");
    }
    try {
      value = Angles_PackedToRadians(ui_, text);
    } catch (const ZvError&) {
      value = kNoValue;
    }
    if (value == kNoValue) {
      return refuse(std::string("gives the ") + what + " '" + text + "', not a valid angle.");
    }
    return true;
  }

 private:
  Ui& ui_;
  size_t number_;
  std::string_view line_;
};

bool ReadPoint(Ui& ui, const ExchangeRequest& request, size_t lineNumber, std::string_view line,
               SurveyPoint& p) {
  PointLineReader reader(ui, lineNumber, line);
  std::vector<std::string_view> f = SplitFields(line);
  ResetPoint(p);
  double height = kNoValue;
  if (request.grid) {
    if (f.size() < 7) {
      return reader.refuse("has " + std::to_string(f.size()) +
                           " fields; a grid point needs 7: name, northing, easting, height, "
                           "northing error, easting error and elevation error.");
    }
    if (!reader.number(f[1], "northing", true, p.Northing) ||
        !reader.number(f[2], "easting", true, p.Easting) ||
        !reader.number(f[3], "height", false, height) ||
        !reader.number(f[4], "northing error", p.NorthingError) ||
        !reader.number(f[5], "easting error", p.EastingError) ||
        !reader.number(f[6], "elevation error", p.ElevationError)) {
      return false;
    }
  } else {
    if (f.size() < 4) {
      return reader.refuse("has " + std::to_string(f.size()) +
                           " fields; a geographic point needs 4: name, latitude, longitude and "
                           "height.");
    }
    if (!reader.angle(f[1], "latitude", p.Latitude) ||
        !reader.angle(f[2], "longitude", p.Longitude) ||
        !reader.number(f[3], "height", false, height)) {
      return false;
    }
    p.GridMissing = true;
  }
  p.PointName = std::string(f[0]);
  p.HorizontalUnits = request.horizontalUnits;
  p.VerticalUnits = request.verticalUnits;
  if (height != kNoValue) {
    if (request.heightType == "Orthometric") {
      p.Elevation = height;
    } else if (request.heightType == "Ellipsoid") {
      p.EllipsoidHeight = height;
    } else {
      return reader.refuse(
          "gives a height, but line 11 names no height type (\"Orthometric\" "
          "or \"Ellipsoid\").");
    }
  }
  return true;
}

bool IsBlank(std::string_view line) {
  return line.find_first_not_of(" \t") == std::string_view::npos;
}

}  // namespace

bool ReadExchangeRequest(Ui& ui, std::istream& in, ExchangeRequest& request,
                         ConversionState& state) {
  LineReader reader(in);
  std::vector<std::string> header;
  std::string_view line;
  while (header.size() < 12 && reader.next(line)) header.emplace_back(line);
  if (header.size() < 12) {
    ui.exclaim("tccin.tmp holds " + std::to_string(header.size()) +
                   " lines; a coordinate request starts with 12 header lines.",
               kRefusalTitle);
    return false;
  }
  request.automatic = header[2] == "Automatic";
  request.grid = header[3] == "Plane";
  request.coordinateSystem = header[4];
  request.zone = header[5];
  request.horizontalDatum = header[6] == "83" ? "NAD 83" : header[6] == "27" ? "NAD 27" : header[6];
  request.verticalDatum = header[7] == "88" ? "NAVD 88" : header[7] == "29" ? "NGVD 29" : header[7];
  request.horizontalUnits = UnitName(header[8]);
  if (request.horizontalUnits.empty()) {
    ui.exclaim("Line 9 of tccin.tmp gives the horizontal units '" + header[8] +
                   "'; they must be F, M or I.",
               kRefusalTitle);
    return false;
  }
  request.verticalUnits = UnitName(header[9]);
  if (request.verticalUnits.empty() && !header[9].empty()) {
    ui.exclaim("Line 10 of tccin.tmp gives the vertical units '" + header[9] +
                   "'; they must be F, M or I.",
               kRefusalTitle);
    return false;
  }
  request.heightType = header[10];
  request.geoidModel = header[11];

  // The lines first, so that the (large) point records are made in place.
  std::vector<std::pair<size_t, std::string>> lines;
  for (size_t number = 13; reader.next(line); ++number) {
    if (!IsBlank(line)) lines.emplace_back(number, line);
  }
  state.points.clear();
  state.points.resize(lines.size());
  for (size_t i = 0; i < lines.size(); ++i) {
    if (!ReadPoint(ui, request, lines[i].first, lines[i].second, state.points[i])) {
      state.points.clear();
      return false;
    }
  }
  return true;
}

std::string FindExchangeZone(const std::string& appFolder, const std::string& coordinateSystem,
                             const std::string& zone, const std::string& horizontalDatum) {
  const auto zones = ZoneStore::In(appFolder).loadAll();
  if (!coordinateSystem.empty() && !zone.empty()) {
    const std::string wanted = coordinateSystem + "~" + zone;
    auto same = [&](const auto& z) { return EqualsNoCase(z.first, wanted); };
    auto found = std::find_if(zones.begin(), zones.end(), same);
    if (found != zones.end() && found->second.horizontalDatum == horizontalDatum) {
      return found->first;
    }
  }
  std::string fallback;
  for (const auto& [section, record] : zones) {
    if (section.find(zone) == std::string::npos) continue;
    const std::string& datum = record.horizontalDatum;
    if (datum == horizontalDatum) return section;
    if (datum.find(horizontalDatum) == std::string::npos) continue;
    if (!fallback.empty()) return "";
    fallback = section;
  }
  return fallback;
}

bool WriteExchangeAnswer(Ui& ui, const std::string& path, const ConversionState& state,
                         bool automatic) {
  const ConversionSettings& s = state.settings;
  TextFileWriter out(path);
  if (!out.open()) {
    ui.exclaim("The answer file '" + path + "' could not be written.\r\n" + out.error());
    return false;
  }
  const std::tm now = state.now();
  out.line(kTitleAndVersion);
  out.line(FormatDate(now) + " " + FormatTime(now));
  out.line(automatic ? "Automatic" : "Manual");
  out.line(state.batchGrid ? "Plane" : "Geographic");
  out.line(s.outputCoordinateSystem);
  out.line(s.outputZone);
  out.line(s.outputHorizontalDatum);
  out.line(s.outputVerticalDatum);
  out.line(UnitCode(s.outputHorizontalUnits));
  out.line(s.outputVerticalUnits);
  out.line("");
  out.line(s.geoidModel);

  // Lengths are answered in the output units whatever unit a step left
  // them in; a unit pair that does not convert leaves them as held.
  auto length = [](std::string& line, double value, std::string_view from, std::string_view to) {
    line += ',';
    if (value == kNoValue) return;
    double converted = Distances_Convert(value, from, to);
    AppendFixed(line, converted == kNoValue ? value : converted, 4);
  };
  auto single = [](float v) { return v == kNoValueF ? kNoValue : static_cast<double>(v); };
  for (const SurveyPoint& p : state.points) {
    std::string& line = out.buffer();
    std::string_view hu = p.HorizontalUnits;
    std::string_view vu = p.VerticalUnits;
    line += p.PointName;
    length(line, p.Northing, hu, s.outputHorizontalUnits);
    length(line, p.Easting, hu, s.outputHorizontalUnits);
    length(line, p.Elevation, vu, s.outputVerticalUnits);
    length(line, single(p.NorthingError), hu, s.outputHorizontalUnits);
    length(line, single(p.EastingError), hu, s.outputHorizontalUnits);
    length(line, single(p.ElevationError), vu, s.outputVerticalUnits);
    line += ',';
    if (s.OutputConvergence && p.Convergence != kNoValue)
      line += Angles_RadiansToPacked(ui, p.Convergence, 1);
    line += ',';
    if (s.OutputScaleFactor && p.ScaleFactor != kNoValue) AppendFixed(line, p.ScaleFactor, 8);
    if (s.OutputGeoid) {
      length(line, p.GeoidHeight, vu, s.outputVerticalUnits);
    } else {
      line += ',';
    }
    line += ',';
    if (s.OutputLatLong && p.Latitude != kNoValue)
      line += Angles_RadiansToPacked(ui, p.Latitude, 5);
    line += ',';
    if (s.OutputLatLong && p.Longitude != kNoValue)
      line += Angles_RadiansToPacked(ui, p.Longitude, 5);
    length(line, p.EllipsoidHeight, vu, s.outputVerticalUnits);
    out.lineDone();
  }
  if (!out.commit()) {
    ui.exclaim("The answer file '" + path + "' could not be written.\r\n" + out.error());
    return false;
  }
  return true;
}

bool BatchExchange(Ui& ui, const std::string& appFolder, ConversionState& state,
                   const ManualConversion& manual) {
  const std::string inputPath = appFolder + "/" + kExchangeInput;
  const std::string outputPath = appFolder + "/" + kExchangeOutput;
  auto fail = [&] {
    std::error_code ec;
    std::filesystem::remove(outputPath, ec);
    return false;
  };
  std::ifstream in(inputPath, std::ios::binary);
  if (!in) {
    ui.exclaim("The coordinate request file '" + inputPath + "' does not exist.", kRefusalTitle);
    return fail();
  }
  ExchangeRequest request;
  bool read = ReadExchangeRequest(ui, in, request, state);
  in.close();
  if (!read) return fail();
  state.batchGrid = request.grid;
  state.singlePoint = false;

  const std::string section =
      FindExchangeZone(appFolder, request.coordinateSystem, request.zone, request.horizontalDatum);
  if (section.empty()) {
    ui.message(
        "Unable to determine Coordinate System and Zone. Can not compute Latitude, Longitude, "
        "Scale Factor, or Convergence Angle.",
        Icon::Information, Buttons::Ok, "VORN Zurevazidu Error");
    return fail();
  }
  ConversionSettings& s = state.settings;
  const size_t tilde = section.find('~');
  s.inputCoordinateSystem = Trim(std::string_view(section).substr(0, tilde));
  s.inputZone = tilde == std::string::npos ? "" : Trim(std::string_view(section).substr(tilde + 1));
  const std::optional<ZoneRecord> found = ZoneStore::In(appFolder).loadSection(section);
  s.inputHorizontalDatum = found ? found->horizontalDatum : "";
  const std::vector<std::string> datums = DatumStore::In(appFolder).sections();
  s.inputVerticalDatum =
      std::find(datums.begin(), datums.end(), request.verticalDatum) != datums.end()
          ? request.verticalDatum
          : "";
  s.inputHorizontalUnits = request.horizontalUnits;
  s.inputVerticalUnits = request.verticalUnits;

  if (!request.automatic) {
    if (!manual) {
      ui.exclaim(
          "The coordinate request in tccin.tmp asks for the manual mode (its line 3 is not "
          "\"Automatic\"), which needs the Coordinate Conversion window. That window is not "
          "available in this run.");
      return fail();
    }
    // Geographic points are offered as what they are: latitudes and
    // longitudes in the packed format of the request.
    if (!request.grid) {
      s.inputCoordinateSystem = kGeographicCoordinates;
      s.inputZone.clear();
      s.inputHorizontalUnits = kFormatPacked;
    }
    state.accepted = manual(state);
    if (!state.accepted) return fail();
  } else {
    s.outputHorizontalDatum = s.inputHorizontalDatum;
    s.outputHorizontalUnits = s.inputHorizontalUnits;
    s.outputVerticalDatum = s.inputVerticalDatum;
    s.outputVerticalUnits = s.inputVerticalUnits;
    s.OutputScaleFactor = true;
    s.OutputConvergence = true;
    if (request.grid) {
      s.outputCoordinateSystem = kGeographicCoordinates;
      s.outputZone.clear();
      s.OutputLatLong = true;
      s.OutputGeoid = false;
      s.geoidModel.clear();
    } else {
      s.outputCoordinateSystem = s.inputCoordinateSystem;
      s.outputZone = s.inputZone;
      s.inputCoordinateSystem = kGeographicCoordinates;
      s.inputZone.clear();
      s.OutputLatLong = false;
      s.OutputGeoid = !request.geoidModel.empty();
      s.geoidModel = request.geoidModel;
      state.batchGrid = true;
    }
    if (!ConvertPoints(ui, appFolder, state)) return fail();
  }
  if (!WriteExchangeAnswer(ui, outputPath, state, request.automatic)) return fail();
  return true;
}

}  // namespace zv
