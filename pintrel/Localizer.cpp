#include "pintrel/Localizer.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string_view>

#include "geodesy/Angles.h"
#include "geodesy/CatalogStore.h"
#include "geodesy/Catalogs.h"
#include "geodesy/Projection.h"
#include "platform/Error.h"
#include "platform/Numbers.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv::local {

namespace fs = std::filesystem;

namespace {

constexpr const char* kOriginalDatum = "CM:ORIGINAL HD:";
constexpr const char* kOriginalZone = "CM:ORIGINAL ZN:";
constexpr const char* kFactorLine = "CM:COMB. FACTOR =";
constexpr int kFactorDecimals = 10;
// Points listed one by one in the report; the rest are counted.
constexpr size_t kReportedPoints = 1000;

// A failure: its message goes to the user, no output is written.
struct Failure {
  std::string message;
};

// Messages of the catalog routines (an angle out of its limits) become the
// failure's text.
class CollectingUi : public Ui {
 public:
  Answer message(const std::string& text, Icon, Buttons, const std::string&) override {
    if (!text_.empty()) text_.append("\r\n");
    text_.append(text);
    return Answer::Ok;
  }
  std::optional<std::string> input(const std::string&, const std::string&,
                                   const std::string&) override {
    return std::nullopt;
  }
  void viewText(const std::string&, const std::string&) override {}
  const std::string& text() const { return text_; }

 private:
  std::string text_;
};

bool StartsWith(std::string_view line, std::string_view prefix) {
  return line.substr(0, prefix.size()) == prefix;
}

// The two-letter tag of a line as one number (Tag('A', 'C') for "AC:"); 0
// for a line without one.
constexpr int Tag(char a, char b) {
  return a << 8 | b;
}
int TagOf(std::string_view line) {
  return line.size() >= 3 && line[2] == ':' ? Tag(line[0], line[1]) : 0;
}

bool IsRecordedLine(std::string_view line) {
  return StartsWith(line, kOriginalDatum) || StartsWith(line, kOriginalZone) ||
         StartsWith(line, kFactorLine);
}

// "19" + the last two characters, as the dialog reads a recorded datum.
std::string DatumYearOf(std::string_view datum) {
  return std::string("19").append(datum.substr(datum.size() < 2 ? 0 : datum.size() - 2));
}

// The four-digit SPCS code a zone name ends in; empty when none.
std::string CodeOf(std::string_view zone) {
  zone = Trim(zone);
  if (zone.size() < 4) return "";
  const std::string_view code = zone.substr(zone.size() - 4);
  if (!std::all_of(code.begin(), code.end(), [](char c) { return c >= '0' && c <= '9'; })) {
    return "";
  }
  if (zone.size() > 4 && zone[zone.size() - 5] != ' ') return "";
  return std::string(code);
}

std::string UnitOfCode(std::string_view code) {
  if (code == "M") return kMeters;
  if (code == "F") return kUsSurveyFeet;
  if (code == "I") return kInternationalFeet;
  return "";
}

std::string Fixed(double value, int decimals) {
  return FormatFixed(value, decimals);
}

// A zone of zones.ini, resolved for the projection.
struct Zone {
  std::string coordinateSystem, name;
  ZoneParameters parameters;
  ProjectionZone projection;
};

Zone ResolveFor(const std::string& appFolder, const std::string& system, const std::string& zone) {
  CollectingUi ui;
  Zone z;
  z.coordinateSystem = system;
  z.name = zone;
  try {
    z.parameters = ResolveZone(ui, appFolder, system, zone);
  } catch (const ZvError& e) {
    std::string text = e.description();
    if (!ui.text().empty()) text.append("\r\n").append(ui.text());
    throw Failure{text};
  }
  if (!ui.text().empty()) throw Failure{ui.text()};
  z.projection = Projection_SetZone(z.parameters);
  if (z.projection.status != ProjectionStatus::Ok) {
    throw Failure{"The projection of zone '" + zone + "' of '" + system + "' can not be computed."};
  }
  return z;
}

// The State Plane system of a datum year: 1927, else 1983 (NAD 83 and its
// HPGN realisations share the zones).
std::string SystemOfYear(std::string_view year) {
  return year == "1927" ? "State Plane 1927" : "State Plane 1983";
}

// The zone short name of an SPCS code in a coordinate system; empty when none.
std::string ZoneOfCode(const ZoneStore& store, const std::string& system, const std::string& code) {
  for (const std::string& zone : store.zones(system)) {
    if (CodeOf(zone) == code || Trim(zone) == code) return zone;
  }
  return "";
}

// The zone of a grid file's header: its coordinate system and zone, else the
// zone of that name in any system (the one on the file's datum first), else
// the SPCS code the zone name ends in.
Zone ZoneOfHeader(const std::string& appFolder, const std::string& path, const std::string& system,
                  const std::string& zone, const std::string& datum) {
  const ZoneStore store = ZoneStore::In(appFolder);
  try {
    if (!system.empty() && !store.findSection(system, zone).empty()) {
      return ResolveFor(appFolder, system, zone);
    }
    std::string found;
    for (const std::string& cs : store.coordinateSystems()) {
      const std::optional<ZoneRecord> record = store.load(cs, zone);
      if (!record) continue;
      if (found.empty() || EqualsNoCase(record->horizontalDatum, datum)) found = cs;
      if (EqualsNoCase(record->horizontalDatum, datum)) break;
    }
    if (!found.empty()) return ResolveFor(appFolder, found, zone);
    const std::string code = CodeOf(zone);
    if (!code.empty()) {
      const std::string cs = SystemOfYear(DatumYearOf(Trim(datum)));
      const std::string name = ZoneOfCode(store, cs, code);
      if (!name.empty()) return ResolveFor(appFolder, cs, name);
    }
  } catch (const ZvError& e) {
    throw Failure{e.description()};
  }
  throw Failure{"The zone '" + zone + "' of '" + path + "' is not in zones.ini."};
}

// A positive factor from its text.
double FactorOf(const std::string& text) {
  const std::optional<double> factor = ToNumber(text);
  if (!factor || !std::isfinite(*factor) || *factor <= 0.0) {
    throw Failure{"The combined factor '" + text + "' is not a positive number."};
  }
  return *factor;
}

// The header of a tagged file: its lines up to the first point.
struct Header {
  std::string system, zone, datum, unit;
  std::string recordedDatum;  // the text of "CM:ORIGINAL HD:"
  bool hasZone = false, hasDatum = false;
};

bool IsPointStart(std::string_view line) {
  return TagOf(line) == Tag('A', 'C') && line != "AC:PR";
}

std::ifstream OpenInput(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in) throw Failure{"The file '" + path + "' can not be read."};
  return in;
}

Header ReadHeader(const std::string& path) {
  std::ifstream in = OpenInput(path);
  LineReader reader(in);
  if (reader.isUtf16()) throw Failure{Utf16Refusal(path)};
  Header h;
  std::string_view line;
  bool more = false;
  while ((more = reader.next(line)) && !IsPointStart(line)) {
    const int tag = TagOf(line);
    const std::string value(line.substr(std::min<size_t>(3, line.size())));
    if (tag == Tag('C', 'S')) h.system = value;
    if (tag == Tag('Z', 'N')) h.zone = value, h.hasZone = true;
    if (tag == Tag('H', 'D')) h.datum = value, h.hasDatum = true;
    if (tag == Tag('U', 'L')) h.unit = UnitOfCode(value);
    if (StartsWith(line, kOriginalDatum)) h.recordedDatum = std::string(line.substr(15));
  }
  if (!more && !reader.atEnd()) throw Failure{"The file '" + path + "' can not be read."};
  return h;
}

// One point as the factor needs it, values in the file's units.
struct Point {
  std::string name;
  double northing = kNoValue, easting = kNoValue, elevation = kNoValue;
  double ellipsoidHeight = kNoValue, geoidHeight = kNoValue;
};

double NumberOf(std::string_view line, const std::string& path, long long lineNumber) {
  // The plain form the writers write is read directly; anything else goes
  // through the full numeric test.
  const std::string_view text = line.substr(3);
  if (!text.empty() && (std::isdigit(static_cast<unsigned char>(text[0])) || text[0] == '-')) {
    double plain = 0;
    const auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), plain);
    if (ec == std::errc() && end == text.data() + text.size() && std::isfinite(plain)) {
      return plain;
    }
  }
  const std::optional<double> value = ToNumber(text);
  if (!value) {
    throw Failure{std::string("Line ").append(std::to_string(lineNumber)) + " of '" + path +
                  "' ('" + std::string(line) + "') does not hold a number."};
  }
  return *value;
}

// Calls f for every point of the file (chains are no points).
template <class F>
void ForEachPoint(const std::string& path, F f) {
  std::ifstream in = OpenInput(path);
  LineReader reader(in);
  std::string_view line;
  Point p;
  bool inPoint = false;
  long long n = 0;
  while (reader.next(line)) {
    ++n;
    const int tag = TagOf(line);
    if (tag == Tag('A', 'C')) {
      if (inPoint) f(p);
      inPoint = line != "AC:PR" && line != "AC:CH";
      p = Point{};
      continue;
    }
    if (!inPoint) continue;
    switch (tag) {
      case Tag('P', 'N'):
        p.name = std::string(line.substr(3));
        break;
      case Tag('Y', 'C'):
      case Tag('Y', 'Y'):
        p.northing = NumberOf(line, path, n);
        break;
      case Tag('X', 'C'):
      case Tag('X', 'X'):
        p.easting = NumberOf(line, path, n);
        break;
      case Tag('Z', 'C'):
      case Tag('Z', 'Z'):
        p.elevation = NumberOf(line, path, n);
        break;
      case Tag('H', 'E'):
        p.ellipsoidHeight = NumberOf(line, path, n);
        break;
      case Tag('H', 'G'):
        p.geoidHeight = NumberOf(line, path, n);
        break;
    }
  }
  if (!reader.atEnd()) throw Failure{"The file '" + path + "' can not be read."};
  if (inPoint) f(p);
}

bool SamePointName(std::string_view name, std::string_view wanted) {
  name = Trim(name);
  wanted = Trim(wanted);
  if (name == wanted) return true;
  const std::optional<double> a = ToNumber(name), b = ToNumber(wanted);
  return a && b && *a == *b;
}

const char* SourceText(HeightSource source) {
  switch (source) {
    case HeightSource::Ellipsoid:
      return "ellipsoid height";
    case HeightSource::FileGeoid:
      return "elevation + geoid height of the file";
    case HeightSource::GeoidGrid:
      return "elevation + geoid height of the grid";
    case HeightSource::Elevation:
      return "elevation (no geoid height)";
    case HeightSource::None:
      break;
  }
  return "no height: 0 used";
}

// The factor of points of one zone, and the lines of the report.
class FactorComputer {
 public:
  FactorComputer(Zone zone, const std::string& fileUnit, const std::string& geoidFolder)
      : zone_(std::move(zone)), geoids_(geoidFolder) {
    unit_ = fileUnit.empty() ? zone_.parameters.linearUnits : fileUnit;
    toMetres_ = Distances_Convert(1.0, unit_, kMeters);
    // The projection's own unit: metres, or U.S. survey feet for the NAD 27 forms.
    toProjection_ = zone_.projection.usSurveyFeet ? toMetres_ * kMetersToUsFeet : toMetres_;
  }

  // False for a point without grid coordinates.
  bool add(const Point& p) {
    if (p.northing == kNoValue || p.easting == kNoValue) return false;
    const GeographicPoint g = Projection_GridToGeographic(
        zone_.projection, p.northing * toProjection_, p.easting * toProjection_);
    if (g.phi == kNoValue || !std::isfinite(g.scaleFactor) || g.scaleFactor <= 0.0) return false;
    std::string model;
    HeightSource source = HeightSource::None;
    double h = 0.0;
    if (p.ellipsoidHeight != kNoValue) {
      h = p.ellipsoidHeight * toMetres_, source = HeightSource::Ellipsoid;
    } else if (p.elevation != kNoValue && p.geoidHeight != kNoValue) {
      h = (p.elevation + p.geoidHeight) * toMetres_, source = HeightSource::FileGeoid;
    } else if (p.elevation != kNoValue) {
      h = p.elevation * toMetres_, source = HeightSource::Elevation;
      if (std::optional<double> n = geoids_.height(g.phi, g.lambda, model)) {
        h += *n, source = HeightSource::GeoidGrid;
      }
    }
    const ZoneParameters& z = zone_.parameters;
    const double elevationFactor = ElevationFactor(z.a, z.e, g.phi, h);
    const double combined = g.scaleFactor * elevationFactor;
    sum_ += combined;
    ++count_;
    ++bySource_[static_cast<int>(source)];
    if (source == HeightSource::GeoidGrid && models_.find(model) == std::string::npos) {
      models_.append(models_.empty() ? "" : ", ").append(model);
    }
    last_ = combined;
    if (lines_.size() < kReportedPoints) {
      char line[256];
      std::snprintf(line, sizeof line, "%-10s %14.9f %15.9f %12.3f %13.10f %13.10f %13.10f  %s%s%s",
                    p.name.c_str(), g.phi * kRadiansToDegrees, g.lambda * kRadiansToDegrees, h,
                    g.scaleFactor, elevationFactor, combined, SourceText(source),
                    model.empty() ? "" : " ", model.c_str());
      lines_.push_back(line);
    }
    return true;
  }

  size_t count() const { return count_; }
  double mean() const { return sum_ / static_cast<double>(count_); }
  double last() const { return last_; }

  std::vector<std::string> report(const LocalJob& job, const std::string& output,
                                  const std::string& how, double factor) const {
    const ZoneParameters& z = zone_.parameters;
    std::vector<std::string> r = {"Local.EXE: grid to local coordinates",
                                  "Input:  " + job.input,
                                  "Output: " + output,
                                  "Zone:   " + zone_.coordinateSystem + " / " + zone_.name + " (" +
                                      z.projection + ", " + z.ellipsoid + ")",
                                  "Units:  " + unit_ + "; heights below in metres",
                                  ""};
    char head[160];
    std::snprintf(head, sizeof head, "%-10s %14s %15s %12s %13s %13s %13s  %s", "Point",
                  "Latitude N", "Longitude W", "Ell. height", "Grid scale", "Elev. factor",
                  "Combined", "Height from");
    r.push_back(head);
    r.insert(r.end(), lines_.begin(), lines_.end());
    if (count_ > lines_.size()) {
      r.push_back(std::string("... and ").append(std::to_string(count_ - lines_.size())) +
                  " more points.");
    }
    r.push_back("");
    r.push_back(std::string("Points used: ").append(std::to_string(count_)));
    for (int s = 0; s < 5; ++s) {
      if (bySource_[s] == 0) continue;
      std::string line = "  height from ";
      line.append(SourceText(static_cast<HeightSource>(s)));
      if (s == static_cast<int>(HeightSource::GeoidGrid)) line.append(" (").append(models_) += ')';
      line.append(": ").append(std::to_string(bySource_[s]));
      r.push_back(line);
    }
    std::string last = kFactorLine;
    last.append(" ").append(Fixed(factor, kFactorDecimals)).append(" (").append(how) += ')';
    r.push_back(last);
    return r;
  }

 private:
  Zone zone_;
  GeoidGrids geoids_;
  std::string unit_;
  double toMetres_ = 1.0, toProjection_ = 1.0;
  double sum_ = 0.0, last_ = 0.0;
  size_t count_ = 0;
  size_t bySource_[5] = {};
  std::string models_;
  std::vector<std::string> lines_;
};

// Decimals of a number's text, at least 4 (the writers' own).
int DecimalsOf(std::string_view value) {
  const size_t dot = value.find('.');
  if (dot == std::string_view::npos) return 4;
  size_t digits = 0;
  while (dot + 1 + digits < value.size() && value[dot + 1 + digits] >= '0' &&
         value[dot + 1 + digits] <= '9') {
    ++digits;
  }
  return std::max(4, static_cast<int>(std::min<size_t>(digits, 12)));
}

// Copies the file with its northings and eastings divided (or multiplied)
// by the factor. The header's HD, ZN and recorded lines are left out, and
// `reference` takes the place of the first of them (or ends the header).
void Rewrite(const std::string& input, const std::string& output, double factor, bool divide,
             const std::vector<std::string>& reference, const std::string& system) {
  std::ifstream in = OpenInput(input);
  LineReader reader(in);
  TextFileWriter out(output);
  if (!out.open())
    throw Failure{"The output file '" + output + "' can not be written: " + out.error()};
  std::string_view line;
  bool header = true, placed = false;
  long long n = 0;
  auto place = [&] {
    for (const std::string& r : reference) out.line(r);
    placed = true;
  };
  while (reader.next(line)) {
    ++n;
    const int tag = TagOf(line);
    if (header && IsPointStart(line)) {
      header = false;
      if (!placed) place();
    }
    if (header) {
      if (tag == Tag('H', 'D') || tag == Tag('Z', 'N') || IsRecordedLine(line)) {
        if (!placed) place();
        continue;
      }
      if (tag == Tag('C', 'S') && !system.empty()) {
        out.buffer().append("CS:").append(system);
        out.lineDone();
        continue;
      }
      out.line(line);
      continue;
    }
    if (tag == Tag('Y', 'C') || tag == Tag('Y', 'Y') || tag == Tag('X', 'C') ||
        tag == Tag('X', 'X')) {
      const double value = NumberOf(line, input, n);
      if (value != kNoValue) {
        std::string& b = out.buffer();
        b.append(line.substr(0, 3));
        AppendFixed(b, divide ? value / factor : value * factor, DecimalsOf(line.substr(3)));
        out.lineDone();
        continue;
      }
    }
    out.line(line);
  }
  if (!reader.atEnd()) throw Failure{"The file '" + input + "' can not be read."};
  if (!placed) place();
  if (!out.commit()) {
    throw Failure{"The output file '" + output + "' can not be written: " + out.error()};
  }
}

void GridToLocal(const LocalJob& job, const std::string& appFolder, const std::string& reportPath) {
  const Header h = ReadHeader(job.input);
  if (!h.hasDatum || !h.hasZone) {
    throw Failure{"The file '" + job.input +
                  "' holds no grid coordinates: its header has no HD and ZN lines."};
  }
  const std::string output = job.outputPath();
  double factor = 0.0;
  std::vector<std::string> report;
  if (job.mode == 2) {
    factor = FactorOf(job.modeText);
  } else if (job.mode == 1 || job.mode == 3) {
    FactorComputer computer(ZoneOfHeader(appFolder, job.input, h.system, h.zone, h.datum), h.unit,
                            appFolder + "/NGS/GEOID");
    bool found = false, computed = false;
    ForEachPoint(job.input, [&](const Point& p) {
      if (job.mode == 1) {
        computer.add(p);
      } else if (!found && SamePointName(p.name, job.modeText)) {
        found = true;
        computed = computer.add(p);
      }
    });
    if (job.mode == 3 && !found) {
      throw Failure{"The point '" + job.modeText + "' is not in '" + job.input + "'."};
    }
    if (job.mode == 3 && !computed) {
      throw Failure{"The point '" + job.modeText + "' of '" + job.input +
                    "' has no grid coordinates in its zone."};
    }
    if (computer.count() == 0) {
      throw Failure{"The file '" + job.input + "' holds no point with grid coordinates."};
    }
    factor = job.mode == 1 ? computer.mean() : computer.last();
    factor = RoundToDecimals(factor, kFactorDecimals);
    if (!(factor > 0.0))
      throw Failure{"The combined factor of '" + job.input + "' is not positive."};
    report = computer.report(job, output,
                             job.mode == 1 ? "mean over the points"
                                           : std::string("at point ").append(Trim(job.modeText)),
                             factor);
  } else {
    throw Failure{std::string("The mode ").append(std::to_string(job.mode)) +
                  " of the job is not 1, 2 or 3."};
  }
  const std::string code = CodeOf(h.zone);
  const std::vector<std::string> reference = {
      std::string(kOriginalZone).append(code.empty() ? h.zone : code), kOriginalDatum + h.datum,
      std::string(kFactorLine) + " " + Fixed(factor, kFactorDecimals)};
  Rewrite(job.input, output, factor, true, reference, "");
  if (!report.empty()) WriteTextLines(reportPath, report);
}

void LocalToGrid(const LocalJob& job, const std::string& appFolder) {
  const double factor = FactorOf(job.factor);
  const std::string system = SystemOfYear(job.datumYear);
  std::string zone, datum;
  try {
    const ZoneStore store = ZoneStore::In(appFolder);
    zone = ZoneOfCode(store, system, job.zoneCode);
    if (zone.empty()) {
      throw Failure{"The zone code " + job.zoneCode + " is not a zone of " + system +
                    " in zones.ini."};
    }
    const std::optional<ZoneRecord> record = store.load(system, zone);
    datum = record ? record->horizontalDatum : "";
  } catch (const ZvError& e) {
    throw Failure{e.description()};
  }
  // The datum the file recorded, when it is of the year chosen.
  const Header h = ReadHeader(job.input);
  const bool hpgnYear = job.datumYear != "1927" && job.datumYear != "1983";
  if (!h.recordedDatum.empty() &&
      (DatumYearOf(h.recordedDatum) == job.datumYear ||
       (hpgnYear && h.recordedDatum.find("HPGN") != std::string::npos))) {
    datum = h.recordedDatum;
  }
  Rewrite(job.input, job.outputPath(), factor, false, {"ZN:" + zone, "HD:" + datum}, system);
}

}  // namespace

std::string LocalJob::outputPath() const {
  return outputStem + fs::path(input).extension().string();
}

std::optional<LocalJob> ParseJob(const std::vector<std::string>& lines, std::string& error) {
  LocalJob job;
  if (lines.size() < 3 || lines.size() > 5) {
    error = std::string("The job file does not hold a localization job (")
                .append(std::to_string(lines.size())) +
            " lines).";
    return std::nullopt;
  }
  job.input = lines[0];
  job.outputStem = lines[1];
  if (job.input.empty() || job.outputStem.empty()) {
    error = "The job file names no input or no output file.";
    return std::nullopt;
  }
  job.gridToLocal = lines.size() <= 4;
  if (job.gridToLocal) {
    const std::optional<double> mode = ToNumber(lines[2]);
    if (!mode || (*mode != 1 && *mode != 2 && *mode != 3)) {
      error = "The mode '" + lines[2] + "' of the job is not 1, 2 or 3.";
      return std::nullopt;
    }
    job.mode = static_cast<int>(*mode);
    if (lines.size() == 4) job.modeText = lines[3];
  } else {
    job.datumYear = std::string(Trim(lines[2]));
    job.zoneCode = std::string(Trim(lines[3]));
    job.factor = lines[4];
  }
  return job;
}

double MeanRadius(double a, double e, double phi) {
  const double s = std::sin(phi);
  const double w2 = 1.0 - e * e * s * s;
  // M = a (1 - e^2) / W^3, N = a / W: sqrt(M N) = a sqrt(1 - e^2) / W^2.
  return a * std::sqrt(1.0 - e * e) / w2;
}

double ElevationFactor(double a, double e, double phi, double h) {
  const double r = MeanRadius(a, e, phi);
  return r / (r + h);
}

std::optional<PointFactors> FactorsAt(const std::string& appFolder, const std::string& system,
                                      const std::string& zone, double northing, double easting,
                                      double h) {
  try {
    const Zone z = ResolveFor(appFolder, system, zone);
    const double toProjection = Distances_Convert(1.0, z.parameters.linearUnits, kMeters) *
                                (z.projection.usSurveyFeet ? kMetersToUsFeet : 1.0);
    const GeographicPoint g =
        Projection_GridToGeographic(z.projection, northing * toProjection, easting * toProjection);
    if (g.phi == kNoValue) return std::nullopt;
    const double ef = ElevationFactor(z.parameters.a, z.parameters.e, g.phi, h);
    return PointFactors{g.phi, g.lambda, g.scaleFactor, ef, g.scaleFactor * ef};
  } catch (const Failure&) {
    return std::nullopt;
  }
}

GeoidGrids::GeoidGrids(const std::string& folder) {
  struct Model {
    const char* name;
    std::vector<std::string> prefixes;
    bool spline;
  };
  const Model models[] = {{"GEOID09", {"g2009"}, true},
                          {"GEOID06", {"g2006", "geoid06"}, true},
                          {"GEOID03", {"g2003"}, false},
                          {"GEOID99", {"g1999"}, false}};
  std::vector<std::string> names;
  std::error_code ec;
  for (const auto& entry : fs::directory_iterator(folder, ec)) {
    names.push_back(entry.path().filename().string());
  }
  std::sort(names.begin(), names.end());
  for (const Model& m : models) {
    for (const std::string& name : names) {
      const std::string lower = ToLower(name);
      if (lower.size() < 4 || lower.substr(lower.size() - 4) != ".bin") continue;
      for (const std::string& prefix : m.prefixes) {
        if (lower.compare(0, prefix.size(), prefix) != 0) continue;
        File f{folder + "/" + name, m.name, m.spline, {}, false, false};
        std::string error;
        if (ReadGeoidGridFile(f.path, f.grid, error, true)) files_.push_back(std::move(f));
        break;
      }
    }
  }
}

std::optional<double> GeoidGrids::height(double phi, double lambdaWest, std::string& model) {
  const double lat = phi * kRadiansToDegrees;
  double lon = std::fmod(360.0 - lambdaWest * kRadiansToDegrees, 360.0);
  if (lon < 0) lon += 360.0;
  for (File& f : files_) {
    if (f.broken || !f.grid.covers(lat, lon)) continue;
    if (!f.loaded) {
      std::string error;
      f.loaded = ReadGeoidGridFile(f.path, f.grid, error);
      f.broken = !f.loaded;
      if (f.broken) continue;
    }
    model = f.model;
    return f.spline ? InterpolateSpline(f.grid, lat, lon)
                    : InterpolateBiquadratic(f.grid, lat, lon);
  }
  return std::nullopt;
}

std::string RunJob(const LocalJob& job, const std::string& appFolder,
                   const std::string& reportPath) {
  try {
    if (job.gridToLocal) {
      GridToLocal(job, appFolder, reportPath);
    } else {
      LocalToGrid(job, appFolder);
    }
  } catch (const Failure& f) {
    return f.message;
  } catch (const ZvError& e) {
    return e.description();
  }
  return "";
}

}  // namespace zv::local
