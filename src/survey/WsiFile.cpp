#include "survey/WsiFile.h"

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <new>
#include <unordered_map>
#include <vector>

#if defined(__linux__)
#endif

#include "geodesy/Angles.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"
#include "survey/SurveyFiles.h"

namespace zv {

namespace {

constexpr const char* kHeading =
    "     PT ID           X              Y              Z      REMARKS         AH  AV";
constexpr const char* kUnclassified = "UNCLASSIFIED POINTS";
constexpr const char* kBenchMarks = "BENCH MARKS";

std::string_view Cols(std::string_view line, size_t first, size_t last) {
  if (first > line.size()) return {};
  return line.substr(first - 1, last - first + 1);
}

void AppendTagged(CompactText& field, std::string_view prefix, std::string_view value) {
  if (!field.empty()) field += "\r\n";
  field.append(prefix, value);
}

// A length in `unit` to metres. A point without a unit name is taken as it
// is, rather than losing its coordinates to an unknown-unit -99999.
double ToMetres(double value, const std::string& unit) {
  if (unit.empty()) return value;
  return Distances_Convert(value, unit, "M");
}

class WsiReader {
 public:
  WsiReader(Ui& ui, std::istream& in) : ui_(ui), in_(in), reader_(in, ui.progress()) {}

  bool read(WorkArea& work) {
    ReservePoints(points_, BytesLeft(in_) / 64);
    header_.HorizontalUnits = kMeters;
    header_.VerticalUnits = kMeters;
    std::string_view line;
    while (nextLine(line)) {
      if (line.empty() || line == "AC:PR") continue;
      std::string_view tag = line.substr(0, 3);
      std::string_view value = line.size() > 3 ? line.substr(3) : std::string_view();
      if (tag == "HD:") {
        header_.HorizontalDatum = value;
      } else if (tag == "CS:") {
        header_.CoordinateSystem = value;
      } else if (tag == "ZN:") {
        header_.Zone = value;
      } else if (tag == "VD:") {
        header_.VerticalDatum = value;
      } else if (tag == "HT:") {
        if (value == "ELLIP") {
          header_.VerticalDatum.clear();
          zIsEllipsoidHeight_ = true;
        }
        AppendLine(header_.HeaderExtraLines, line);
      } else if (tag == "UL:") {
        if (value != "M") {
          ui_.message("Invalid WSI File.  Units must be metric.", Icon::Exclamation, Buttons::Ok,
                      kAppTitle);
          return false;
        }
      } else if (tag == "GR:") {
        group_.assign(value);
        group();
      } else {
        AppendLine(header_.HeaderExtraLines, line);
      }
    }
    if (failed_) return false;
    if (in_.bad()) {
      ui_.message("Invalid WSI File.  The file could not be read to its end.", Icon::Exclamation,
                  Buttons::Ok, kAppTitle);
      return false;
    }
    if (havePoint_) points_.push_back(std::move(point_));
    work.InputHeader = std::move(header_);
    work.InputPoints = std::move(points_);
    return true;
  }

 private:
  bool nextLine(std::string_view& line) {
    if (failed_ || !reader_.next(line)) return false;
    ++lineNumber_;
    if (line.find('\0') != std::string_view::npos) {
      failed_ = true;
      ui_.message("Invalid WSI File.  Line " + std::to_string(lineNumber_) + " holds binary data.",
                  Icon::Exclamation, Buttons::Ok, kAppTitle);
      return false;
    }
    return true;
  }

  // The group's empty line, heading and rule are skipped; rows and their
  // lines follow until an empty line.
  void group() {
    std::string_view line;
    for (int i = 0; i < 3; ++i) {
      if (!nextLine(line)) return;
    }
    while (!line.empty() && nextLine(line)) {
      if (line.substr(0, 2) == "  ") {
        row(line);
      } else if (line.empty()) {
        break;
      } else if (!havePoint_) {
        // Nothing to attach the line to yet: keep it with the header.
        AppendLine(header_.HeaderExtraLines, line);
      } else if (line.substr(0, 3) == "PD:") {
        AppendLine(point_.DescriptionLines, line);
      } else {
        AppendLine(point_.ExtraLines, line);
      }
    }
  }

  void row(std::string_view line) {
    if (havePoint_) points_.push_back(std::move(point_));
    havePoint_ = true;
    ResetPoint(point_);
    point_.PointName = Trim(Cols(line, 3, 10));
    point_.GRText = group_;
    if (auto x = ToNumber(Trim(Cols(line, 13, 26)))) point_.Easting = *x;
    if (auto y = ToNumber(Trim(Cols(line, 29, 41)))) point_.Northing = *y;
    if (auto z = ToNumber(Trim(Cols(line, 44, 56)))) {
      (zIsEllipsoidHeight_ ? point_.EllipsoidHeight : point_.Elevation) = *z;
    }
    std::string_view remarks = Trim(Cols(line, 59, 72));
    if (!remarks.empty()) point_.FeatureCode = remarks;
    std::string_view ah = Trim(Cols(line, 75, 76));
    if (!ah.empty()) AppendTagged(point_.ExtraLines, "AH:", ah);
    std::string_view av = Trim(Cols(line, 79, 80));
    if (!av.empty()) AppendTagged(point_.ExtraLines, "AV:", av);
    point_.HorizontalUnits = header_.HorizontalUnits;
    point_.VerticalUnits = header_.VerticalUnits;
  }

  Ui& ui_;
  std::istream& in_;
  LineReader reader_;
  size_t lineNumber_ = 0;
  bool failed_ = false;

  FileHeader header_;
  std::vector<SurveyPoint> points_;
  SurveyPoint point_;
  bool havePoint_ = false;
  bool zIsEllipsoidHeight_ = false;
  std::string group_;
};

// Appends `text` aligned in `width` columns, cut to its first `width`
// characters; false when it had to be cut.
bool AppendRight(std::string& out, std::string_view text, size_t width) {
  if (text.size() < width) out.append(width - text.size(), ' ');
  out.append(text.substr(0, width));
  return text.size() <= width;
}

bool AppendLeft(std::string& out, std::string_view text, size_t width) {
  out.append(text.substr(0, width));
  if (text.size() < width) out.append(width - text.size(), ' ');
  return text.size() <= width;
}

constexpr std::string_view kCutNote = "had values cut to fit their columns";
constexpr std::string_view kNoUnitNote = "had no unit and were taken as metres";

class WsiWriter {
 public:
  WsiWriter(Ui& ui, WorkArea& work, const std::string& path)
      : ui_(ui), work_(work), path_(path), out_(path) {}

  bool write() {
    FileHeader& header = work_.OutputHeader;
    if (header.CoordinateSystem == kGeographicCoordinates) {
      ui_.message("A Wisconsin Summary Index File must contain plane coordinates.",
                  Icon::Exclamation, Buttons::Ok, "Plane Coordiantes Required");
      return false;
    }
    // Copied from a string: assigning the literal trips a false -Wrestrict of
    // GCC 12 at -O3.
    static const std::string kMetres = "M";
    header.HorizontalUnits = kMetres;
    header.VerticalUnits = kMetres;
    chooseHeightKind();
    if (!out_.open()) {
      ReportWriteFailure(ui_, path_, out_.error());
      return false;
    }
    writeHeader(header);
    writeGroups();
    if (!out_.commit()) {
      ReportWriteFailure(ui_, path_, out_.error());
      return false;
    }
    notes_.show(ui_, path_);
    return true;
  }

 private:
  // The Z column holds elevations. A file whose points carry ellipsoid
  // heights only (such as one read with HT:ELLIP) keeps them as such.
  void chooseHeightKind() {
    bool anyElevation = false, anyEllipsoid = false;
    for (const SurveyPoint& p : work_.OutputPoints) {
      anyElevation = anyElevation || p.Elevation != kNoValue;
      anyEllipsoid = anyEllipsoid || p.EllipsoidHeight != kNoValue;
    }
    ellipsoidHeights_ = !anyElevation && anyEllipsoid;
  }

  void take(std::string& extra, std::string_view tag) {
    std::string line = TakeTaggedLine(extra, tag, true, true);
    if (!line.empty()) out_.line(line);
  }

  void writeHeader(FileHeader& header) {
    std::string& extra = header.HeaderExtraLines;
    out_.line("AC:PR");
    take(extra, "ID:");
    take(extra, "CL:");
    std::string project = TakeTaggedLine(extra, "PR:", true, true);
    // A project line read from a tagged file is not among the extra lines.
    if (project.empty()) project = header.ProjectLine;
    if (!project.empty()) out_.line(project);
    take(extra, "HY:");
    take(extra, "CO:");
    for (std::string_view tag : {"AC:", "HD:", "CS:", "ZN:", "VD:", "HT:", "UL:"})
      TakeTaggedLine(extra, tag, true, true);
    if (!header.HorizontalDatum.empty()) out_.line("HD:" + header.HorizontalDatum);
    if (!header.CoordinateSystem.empty()) out_.line("CS:" + header.CoordinateSystem);
    if (!header.Zone.empty()) out_.line("ZN:" + header.Zone);
    if (!header.VerticalDatum.empty()) out_.line("VD:" + header.VerticalDatum);
    out_.line(ellipsoidHeights_ ? "HT:ELLIP" : "HT:ORTHO");
    out_.line("UL:" + header.HorizontalUnits);
    std::string version = TakeTaggedLine(extra, "VR:", true, true);
    if (version.empty()) {
      version = VersionLine();
    }
    out_.line(version);
    take(extra, "RE:");
    take(extra, "DT:");
    char tag[] = "I0:";
    for (char digit = '0'; digit <= '9'; ++digit) {
      tag[1] = digit;
      take(extra, tag);
    }
    out_.line("");
    if (!extra.empty()) out_.line(extra);
  }

  void writeGroups() {
    // Group names in order of first appearance; unnamed points last.
    std::vector<std::string_view> names;
    std::vector<std::vector<size_t>> members;
    std::vector<size_t> unnamed;
    std::unordered_map<std::string_view, size_t> index;
    std::vector<SurveyPoint>& points = work_.OutputPoints;
    for (size_t i = 0; i < points.size(); ++i) {
      std::string_view name = points[i].GRText;
      if (name.empty()) {
        unnamed.push_back(i);
        continue;
      }
      auto [it, added] = index.try_emplace(name, names.size());
      if (added) {
        names.push_back(name);
        members.emplace_back();
      }
      members[it->second].push_back(i);
    }
    for (size_t g = 0; g < names.size(); ++g) writeGroup(names[g], members[g]);
    if (!unnamed.empty()) writeGroup(kUnclassified, unnamed);
  }

  void writeGroup(std::string_view name, const std::vector<size_t>& members) {
    out_.line("");
    std::string& b = out_.buffer();
    b += "GR:";
    b += name;
    out_.lineDone();
    out_.line("");
    out_.line(kHeading);
    out_.line(std::string(80, '='));
    bool benchMarks = name == kBenchMarks;
    for (size_t i : members) {
      SurveyPoint& p = work_.OutputPoints[i];
      StepItems(ui_.progress(), RunStage::Writing, written_++, work_.OutputPoints.size());
      writeRow(p);
      if (benchMarks) {
        for (std::string_view tag : {"OW:", "TY:", "NM:"}) {
          std::string line = TakeTaggedLine(p.ExtraLines, tag, true, false);
          if (!line.empty()) out_.line(line);
        }
        if (!p.DescriptionLines.empty()) out_.line(p.DescriptionLines);
      }
    }
  }

  // A number too wide for its column loses decimals; one that does not fit
  // even without them is left blank, so that it reads back as absent rather
  // than as another number.
  bool appendNumber(std::string& b, double value, size_t width) {
    for (int decimals = 3; decimals >= 0; --decimals) {
      number_.clear();
      AppendFixed(number_, value, decimals);
      if (number_.size() <= width) {
        AppendRight(b, number_, width);
        return decimals == 3;
      }
    }
    b.append(width, ' ');
    return false;
  }

  void writeRow(SurveyPoint& p) {
    if ((p.HorizontalUnits.empty() && (p.Easting != kNoValue || p.Northing != kNoValue)) ||
        (p.VerticalUnits.empty() && (p.Elevation != kNoValue || p.EllipsoidHeight != kNoValue))) {
      notes_.add(kNoUnitNote, p.PointName);
    }
    p.Northing = ToMetres(p.Northing, p.HorizontalUnits);
    p.Easting = ToMetres(p.Easting, p.HorizontalUnits);
    double& height = ellipsoidHeights_ ? p.EllipsoidHeight : p.Elevation;
    height = ToMetres(height, p.VerticalUnits);
    std::string ah = TakeTaggedLine(p.ExtraLines, "AH:", false, true);
    std::string av = TakeTaggedLine(p.ExtraLines, "AV:", false, true);

    std::string& b = out_.buffer();
    bool fits = true;
    b += "  ";
    fits &= AppendRight(b, p.PointName, 8);
    if (p.Easting == kNoValue) {
      b.append(31, ' ');
    } else {
      b += "  ";
      fits &= appendNumber(b, p.Easting, 14);
      b += "  ";
      fits &= appendNumber(b, p.Northing, 13);
    }
    if (height == kNoValue) {
      b.append(15, ' ');
    } else {
      b += "  ";
      fits &= appendNumber(b, height, 13);
    }
    if (p.FeatureCode.empty()) {
      b.append(16, ' ');
    } else {
      b += "  ";
      fits &= AppendLeft(b, p.FeatureCode, 14);
    }
    // AH is widened to its two columns so that AV stays in columns 79-80.
    b += "  ";
    fits &= AppendLeft(b, ah, 2);
    b += "  ";
    fits &= AppendLeft(b, av, 2);
    out_.lineDone();
    if (!fits) notes_.add(kCutNote, p.PointName);
  }

  Ui& ui_;
  WorkArea& work_;
  const std::string& path_;
  TextFileWriter out_;
  size_t written_ = 0;  // rows written, for the progress
  bool ellipsoidHeights_ = false;
  std::string number_;
  OutputNotes notes_;
};

}  // namespace

std::string TakeTaggedLine(std::string& text, std::string_view tag, bool wholeLine, bool remove) {
  if (text.empty() || tag.empty()) return {};
  std::string result;
  bool found = false;
  std::string kept;
  size_t keptCount = 0;
  size_t pos = 0;
  for (;;) {
    size_t end = text.find("\r\n", pos);
    std::string_view line = std::string_view(text).substr(
        pos, end == std::string::npos ? std::string::npos : end - pos);
    if (line.substr(0, tag.size()) == tag) {
      found = true;
      if (wholeLine)
        result.assign(line);
      else
        result.assign(line.size() > 3 ? line.substr(3) : std::string_view());
    } else if (remove) {
      if (keptCount++ > 0) kept += "\r\n";
      kept.append(line);
    }
    if (end == std::string::npos) break;
    pos = end + 2;
  }
  if (remove && found) text = std::move(kept);
  return result;
}

std::string TakeTaggedLine(CompactText& text, std::string_view tag, bool wholeLine, bool remove) {
  std::string all = text;
  std::string result = TakeTaggedLine(all, tag, wholeLine, remove);
  if (all.size() != text.size()) text = all;
  return result;
}

bool ReadWsiFileStream(Ui& ui, WorkArea& work, std::istream& in, const std::string&) {
  WsiReader reader(ui, in);
  return reader.read(work);
}

bool ReadWsiFile(Ui& ui, WorkArea& work, const std::string& path) {
  std::ifstream in;
  if (!OpenSurveyInput(ui, path, in)) return false;
  return ReadWsiFileStream(ui, work, in, path);
}

bool WriteWsiFile(Ui& ui, WorkArea& work, const std::string& path) {
  WsiWriter writer(ui, work, path);
  return writer.write();
}

}  // namespace zv
