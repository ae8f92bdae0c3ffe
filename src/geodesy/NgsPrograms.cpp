#include "geodesy/NgsPrograms.h"

#include <algorithm>
#include <filesystem>
#include <optional>

#include "geodesy/Angles.h"
#include "platform/Numbers.h"
#include "platform/Process.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace fs = std::filesystem;

namespace {

struct Area {
  const char* text;
  const char* code;
  const char* suffix;
};

#define DEG "\xC2\xB0"
constexpr Area kAreas[] = {
    {"Alabama", "AL", ""},
    {"Arkansas", "AR", ""},
    {"Arizona", "AZ", ""},
    {"California", "CN", " (Above 37" DEG " Latitude)"},
    {"California", "CS", " (Below 37" DEG " Latitude)"},
    {"Colorado", "CO", ""},
    {"Florida", "FL", ""},
    {"Georgia", "GA", ""},
    {"Guam", "GU", ""},
    {"Hawaii", "HI", ""},
    {"Idaho-Montana", "EM", " (East of 133" DEG " Longitude)"},
    {"Idaho-Montana", "WM", " (West of 133" DEG " Longitude)"},
    {"Iowa", "IA", ""},
    {"Illinois", "IL", ""},
    {"Indiana", "IN", ""},
    {"Kansas", "KS", ""},
    {"Kentucky", "KY", ""},
    {"Louisiana", "LA", ""},
    {"Maryland-Delaware", "MD", ""},
    {"Maine", "ME", ""},
    {"Michigan", "MI", ""},
    {"Minnesota", "MN", ""},
    {"Mississippi", "MS", ""},
    {"Missouri", "MO", ""},
    {"Nebraska", "NB", ""},
    {"Nevada", "NV", ""},
    {"New England", "NE", " (CT, MA, NH, RI, VT)"},
    {"New Jersey", "NJ", ""},
    {"New Mexico", "NM", ""},
    {"New York", "NY", ""},
    {"North Carolina", "NC", ""},
    {"North Dakota", "ND", ""},
    {"Ohio", "OH", ""},
    {"Oklahoma", "OK", ""},
    {"Pennsylvania", "PA", ""},
    {"Puerto Rico-Virgin Islands", "PV", ""},
    {"Samoa (Eastern Islands)", "ES", ""},
    {"Samoa (Western Islands)", "WS", ""},
    {"South Carolina", "SC", ""},
    {"South Dakota", "SD", ""},
    {"Tennessee", "TN", ""},
    {"Texas", "ET", " (East of 100" DEG " Longitude)"},
    {"Texas", "WT", " (West of 100" DEG " Longitude)"},
    {"Utah", "UT", ""},
    {"Virginia", "VA", ""},
    {"Washington-Oregon", "WO", ""},
    {"West Virginia", "WV", ""},
    {"Wisconsin", "WI", ""},
    {"Wyoming", "WY", ""},
};
#undef DEG

// One NGS program: its folder under the application folder, the stem of its
// files and the command of its batch file.
struct Program {
  const char* title;
  const char* folder;
  const char* stem;
  const char* executable;
  const char* command;
};

constexpr Program kNadcon{"NADCON", "NGS/NADCON", "nadcon", "ndcon210",
                          "ndcon210 <nadcon.con >junk"};
constexpr Program kVertcon{"VERTCON", "NGS/VERTCON", "vertcon", "vertcon",
                           "vertcon oht <vertcon.con >junk"};
constexpr Program kGeoid{"GEOID", "NGS/GEOID", "geoid", "intg", "intg <geoid.con >junk"};

std::string_view Columns(std::string_view line, size_t first, size_t count) {
  if (line.size() < first) return {};
  return line.substr(first - 1, count);
}

// The files of one run in folder F.
struct RunFiles {
  std::string folder, control, batch, input, output, junk;
  RunFiles(const std::string& appFolder, const Program& p)
      : folder(appFolder + "/" + p.folder),
        control(folder + "/" + p.stem + ".con"),
        batch(folder + "/" + p.stem + ".bat"),
        input(folder + "/" + p.stem + ".inp"),
        output(folder + "/" + p.stem + ".out"),
        junk(folder + "/junk") {}
  void removeAll() const {
    std::error_code ec;
    for (const std::string* f : {&control, &batch, &input, &junk, &output}) fs::remove(*f, ec);
  }
};

// The program's "ERROR: " lines from its screen output, at most ten.
std::string Diagnostics(const RunFiles& files) {
  std::vector<std::string> lines;
  if (!ReadTextLines(files.junk, lines)) return "";
  std::string text;
  size_t shown = 0, more = 0;
  const std::string_view prefix = kNgsErrorPrefix;
  for (const std::string& l : lines) {
    if (l.compare(0, prefix.size(), prefix) != 0) continue;
    if (shown == 10) {
      ++more;
      continue;
    }
    text += "\r\n" + l.substr(prefix.size());
    ++shown;
  }
  if (more) text += "\r\n(and " + std::to_string(more) + " more)";
  return text.empty() ? text : "\r\n" + text;
}

std::string ErrorTitle(const Program& p) {
  return std::string(p.title) + " Error";
}

// The input line of a point: latitude north-positive and longitude
// west-positive in decimal degrees with 9 decimals, the name in column 42.
std::optional<std::string> InputLine(const SurveyPoint& p) {
  if (p.Latitude == kNoValue || p.Longitude == kNoValue) return std::nullopt;
  double lat = Angles_ConvertHemisphere(p.Latitude, p.LatitudeHemisphere, "N");
  double lon = Angles_ConvertHemisphere(p.Longitude, p.LongitudeHemisphere, "W");
  if (lat == kNoValue || lon == kNoValue) return std::nullopt;
  std::string line =
      Angles_RadiansToDecimal(lat, 9, false) + " " + Angles_RadiansToDecimal(lon, 9, false);
  if (line.size() < 41) line.append(41 - line.size(), ' ');
  line += p.PointName;
  return line;
}

struct RunOutput {
  std::vector<std::string> lines;  // the output file
  std::string diagnostics;         // the program's "ERROR: " lines, for messages
};

// Runs the common sequence up to reading the output: the points written
// are marked in `written`. nullopt when the program is missing or wrote no
// output (reported); the files are removed in every case.
std::optional<RunOutput> RunProgram(Ui& ui, const std::string& appFolder, const Program& p,
                                    const std::vector<std::string>& control,
                                    const std::vector<SurveyPoint>& points,
                                    std::vector<bool>& written) {
  RunFiles files(appFolder, p);
  const std::string executable = files.folder + "/" + p.executable;
  if (!IsExecutableFile(executable)) {
    ui.exclaim(std::string("The ") + p.title + " program '" + p.executable +
                   "' was not found in '" + files.folder + "'.",
               ErrorTitle(p));
    return std::nullopt;
  }
  std::error_code ec;
  fs::remove(files.junk, ec);
  fs::remove(files.output, ec);

  written.assign(points.size(), false);
  std::string error;
  bool ok = WriteTextLines(files.control, control, &error) &&
            WriteTextLines(files.batch,
                           {std::string("del ") + p.stem + ".out", "del junk", p.command}, &error);
  if (ok) {
    TextFileWriter input(files.input);
    ok = input.open();
    for (size_t i = 0; ok && i < points.size(); ++i) {
      if (std::optional<std::string> line = InputLine(points[i])) {
        input.line(*line);
        written[i] = true;
      }
    }
    ok = ok && input.commit();
    if (!ok) error = input.error();
  }
  if (!ok) {
    ui.exclaim(std::string("The files for ") + p.title + " could not be written in '" +
                   files.folder + "'.\r\n" + error,
               ErrorTitle(p));
    files.removeAll();
    return std::nullopt;
  }

  ProcessResult run = RunBatchFile(files.batch, ConsoleWindow{0, "", 0, 0, 640, 320, 7});
  RunOutput out;
  if (!run.started || !ReadTextLines(files.output, out.lines)) {
    std::string why = run.started ? Diagnostics(files) : "\r\n\r\n" + run.error;
    ui.exclaim(std::string(p.title) + " wrote no output file '" + files.output + "'." + why,
               ErrorTitle(p));
    files.removeAll();
    return std::nullopt;
  }
  out.diagnostics = Diagnostics(files);
  files.removeAll();
  return out;
}

// Finds output lines' points by name among the eligible points, resuming
// after the last match and wrapping around once.
class NameSearch {
 public:
  NameSearch(const std::vector<SurveyPoint>& points, const std::vector<bool>& eligible)
      : points_(points), eligible_(eligible) {}
  std::optional<size_t> find(const std::string& name) {
    const size_t n = points_.size();
    for (size_t k = 1; k <= n; ++k) {
      size_t i = (last_ + k) % n;
      if (eligible_[i] && points_[i].PointName == name) {
        last_ = i;
        return i;
      }
    }
    return std::nullopt;
  }

 private:
  const std::vector<SurveyPoint>& points_;
  const std::vector<bool>& eligible_;
  size_t last_ = static_cast<size_t>(-1);
};

// Fails with a message naming the eligible points that got no result.
bool AllMatched(Ui& ui, const Program& p, const std::vector<SurveyPoint>& points,
                const std::vector<bool>& eligible, const std::vector<bool>& matched,
                const std::string& diagnostics) {
  std::vector<std::string> missing;
  size_t count = 0;
  for (size_t i = 0; i < points.size(); ++i) {
    if (!eligible[i] || matched[i]) continue;
    if (++count <= 10) missing.push_back("'" + points[i].PointName + "'");
  }
  if (count == 0) return true;
  std::string text = std::string(p.title) + " returned no result for ";
  if (count == 1) {
    text += "point " + missing.front() + ".";
  } else {
    text += std::to_string(count) + " points: ";
    for (size_t i = 0; i < missing.size(); ++i) text += (i ? ", " : "") + missing[i];
    text += count > missing.size() ? ", ..." : ".";
  }
  ui.exclaim(text + diagnostics, ErrorTitle(p));
  return false;
}

// A length in metres from an NGS output file in the point's vertical units;
// false (reported) when the units are unknown.
bool HeightInUnits(Ui& ui, const Program& p, const SurveyPoint& point, double metres,
                   double& value) {
  value = Distances_Convert(metres, kMeters, point.VerticalUnits);
  if (value != kNoValue || metres == kNoValue) return true;
  ui.exclaim("The vertical units '" + point.VerticalUnits + "' of point '" + point.PointName +
                 "' are not known.",
             ErrorTitle(p));
  return false;
}

// Length of the UTF-8 sequence at text[i]; 0 when there is none.
size_t Utf8Length(std::string_view text, size_t i) {
  const auto c = static_cast<unsigned char>(text[i]);
  size_t length = 0;
  if (c < 0x80) return 1;
  if (c >= 0xC2 && c <= 0xDF) {
    length = 2;
  } else if ((c & 0xF0) == 0xE0) {
    length = 3;
  } else if (c >= 0xF0 && c <= 0xF4) {
    length = 4;
  } else {
    return 0;
  }
  if (i + length > text.size()) return 0;
  for (size_t k = 1; k < length; ++k) {
    if ((static_cast<unsigned char>(text[i + k]) & 0xC0) != 0x80) return 0;
  }
  return length;
}

// Catalog text as UTF-8: text that is not valid UTF-8 is read as Latin-1
// (older catalogs hold the degree sign as the single byte 176).
std::string AsUtf8(std::string_view text) {
  size_t i = 0;
  for (size_t length; i < text.size() && (length = Utf8Length(text, i)) != 0;) i += length;
  if (i == text.size()) return std::string(text);
  std::string utf8;
  for (const char ch : text) {
    const auto c = static_cast<unsigned char>(ch);
    if (c < 0x80) {
      utf8 += ch;
    } else {
      utf8 += static_cast<char>(0xC0 | (c >> 6));
      utf8 += static_cast<char>(0x80 | (c & 0x3F));
    }
  }
  return utf8;
}

std::vector<std::string> NadconControl(const NadconMethod& m) {
  std::vector<std::string> lines(4, "");
  switch (m.shift) {
    case NadconShift::Nad27ToNad83:
    case NadconShift::Nad83ToNad27:
      lines.insert(lines.end(), {"", "", m.shift == NadconShift::Nad27ToNad83 ? "Y" : "N"});
      break;
    case NadconShift::Nad83ToHpgn:
    case NadconShift::HpgnToNad83:
      lines.insert(lines.end(),
                   {"A", m.areaCode, "", m.shift == NadconShift::Nad83ToHpgn ? "Y" : "N"});
      break;
  }
  lines.insert(lines.end(), {"nadcon.out", "Y", "nadcon.inp", "2", "N", "Q"});
  return lines;
}

}  // namespace

const std::vector<NadconMethod>& NadconMethods() {
  static const std::vector<NadconMethod> methods = [] {
    std::vector<NadconMethod> list{{"NADCON NAD 27 to NAD 83", NadconShift::Nad27ToNad83, ""},
                                   {"NADCON NAD 83 to NAD 27", NadconShift::Nad83ToNad27, ""}};
    for (const Area& a : kAreas) {
      std::string area = a.text;
      list.push_back({"NADCON NAD 83 (1986) to " + area + " HPGN" + a.suffix,
                      NadconShift::Nad83ToHpgn, a.code});
      std::string back = area == "Alabama" ? " to NAD 83 (1996)" : " to NAD 83 (1986)";
      list.push_back(
          {"NADCON " + area + " HPGN" + back + a.suffix, NadconShift::HpgnToNad83, a.code});
    }
    return list;
  }();
  return methods;
}

const std::vector<std::string>& VertconMethodNames() {
  static const std::vector<std::string> names{"VERTCON NGVD 29 to NAVD 88",
                                              "VERTCON NAVD 88 to NGVD 29"};
  return names;
}

const std::vector<std::string>& GeoidMethodNames() {
  static const std::vector<std::string> names{
      "GEOID99 NAD 83 to NAVD 88", "GEOID03 NAD 83 to NAVD 88", "GEOID06 NAD 83 to NAVD 88",
      "GEOID09 NAD 83 to NAVD 88", "GEOID99 NAVD 88 to NAD 83", "GEOID03 NAVD 88 to NAD 83",
      "GEOID06 NAVD 88 to NAD 83", "GEOID09 NAVD 88 to NAD 83"};
  return names;
}

bool Nadcon_Run(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                const std::string& method) {
  const auto& methods = NadconMethods();
  const std::string name = AsUtf8(method);
  auto m = std::find_if(methods.begin(), methods.end(),
                        [&](const NadconMethod& x) { return x.name == name; });
  if (m == methods.end()) {
    ui.exclaim("Unkown NADCON Conversion.", "Unkown NADCON Conversion");
    return false;
  }
  std::vector<bool> written;
  auto run = RunProgram(ui, appFolder, kNadcon, NadconControl(*m), points, written);
  if (!run) return false;
  const std::vector<std::string>& lines = run->lines;

  NameSearch search(points, written);
  std::vector<bool> matched(points.size(), false);
  for (size_t k = 1; k < lines.size(); ++k) {
    std::string_view line = lines[k];
    std::optional<double> lat = ToNumber(Columns(line, 1, 14));
    std::optional<double> lon = ToNumber(Columns(line, 17, 14));
    if (!lat || !lon) continue;
    std::optional<size_t> i =
        search.find(std::string(Trim(Columns(line, 41, std::string_view::npos))));
    if (!i) continue;
    SurveyPoint& p = points[*i];
    p.Latitude = Angles_ConvertHemisphere(*lat * kDegreesToRadians, "N", p.LatitudeHemisphere);
    p.Longitude = Angles_ConvertHemisphere(*lon * kDegreesToRadians, "W", p.LongitudeHemisphere);
    matched[*i] = true;
  }
  return AllMatched(ui, kNadcon, points, written, matched, run->diagnostics);
}

bool Vertcon_Run(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                 bool forward) {
  std::vector<bool> written;
  auto run = RunProgram(ui, appFolder, kVertcon, {"Y", "2", "vertcon.inp", "N", "vertcon.out"},
                        points, written);
  if (!run) return false;
  const std::vector<std::string>& lines = run->lines;

  // Only points with an elevation need a shift.
  std::vector<bool> needed = written;
  for (size_t i = 0; i < points.size(); ++i)
    needed[i] = written[i] && points[i].Elevation != kNoValue;
  const double sign = forward ? 1.0 : -1.0;
  NameSearch search(points, written);
  std::vector<bool> matched(points.size(), false);
  for (size_t k = 1; k < lines.size(); ++k) {
    std::string_view line = lines[k];
    std::optional<double> shift = ToNumber(Columns(line, 33, 7));
    if (!shift) continue;
    std::optional<size_t> i =
        search.find(std::string(Trim(Columns(line, 41, std::string_view::npos))));
    if (!i) continue;
    matched[*i] = true;
    SurveyPoint& p = points[*i];
    if (p.Elevation == kNoValue) continue;
    double value = 0;
    if (!HeightInUnits(ui, kVertcon, p, *shift, value)) return false;
    p.Elevation += sign * value;
  }
  return AllMatched(ui, kVertcon, points, needed, matched, run->diagnostics);
}

bool Geoid_Run(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
               const std::string& request) {
  const std::string model = request.substr(0, 7);
  static constexpr std::pair<const char*, const char*> kModels[] = {
      {"GEOID99", "1"}, {"GEOID03", "3"}, {"GEOID06", "5"}, {"GEOID09", "7"}};
  const char* number = nullptr;
  for (const auto& [name, code] : kModels)
    if (model == name) number = code;
  if (!number) {
    ui.exclaim("Unknown geoid model '" + model + "'.", "Unknown Geoid Model");
    return false;
  }
  std::vector<bool> written;
  auto run = RunProgram(ui, appFolder, kGeoid,
                        {"", "", "", number, "", "2", "2", "2", "geoid.inp", "geoid.out"}, points,
                        written);
  if (!run) return false;
  const std::vector<std::string>& lines = run->lines;

  NameSearch search(points, written);
  std::vector<bool> matched(points.size(), false);
  for (const std::string& line : lines) {
    std::optional<double> height = ToNumber(Columns(line, 33, 8));
    if (!height) continue;
    std::optional<size_t> i =
        search.find(std::string(Trim(Columns(line, 41, std::string_view::npos))));
    if (!i) continue;
    SurveyPoint& p = points[*i];
    double value = 0;
    if (!HeightInUnits(ui, kGeoid, p, *height, value)) return false;
    p.Text19 = request;
    p.GeoidHeight = value;
    matched[*i] = true;
  }
  if (!AllMatched(ui, kGeoid, points, written, matched, run->diagnostics)) return false;
  if (request == model) return true;

  const std::string source(Trim(request.size() > 8 ? request.substr(8, 7) : ""));
  if (source == "NAD 83") {
    for (SurveyPoint& p : points) {
      bool present = p.EllipsoidHeight != kNoValue && p.GeoidHeight != kNoValue;
      p.Elevation = present ? p.EllipsoidHeight - p.GeoidHeight : kNoValue;
    }
  } else if (source == "NAVD 88") {
    for (SurveyPoint& p : points) {
      bool present = p.Elevation != kNoValue && p.GeoidHeight != kNoValue;
      p.EllipsoidHeight = present ? p.Elevation + p.GeoidHeight : kNoValue;
    }
  } else {
    ui.exclaim("Can not perform vertical datum transformation '" + request + "'.",
               "Aborting Datum Transformation");
    return false;
  }
  return true;
}

}  // namespace zv
