#include "survey/TaggedFile.h"

#include <algorithm>
#include <cerrno>
#include <cfloat>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <exception>
#include <filesystem>
#include <fstream>
#include <optional>
#include <vector>

#include "Version.h"
#include "geodesy/Angles.h"
#include "platform/Numbers.h"
#include "platform/TextIo.h"
#include "survey/SurveyFiles.h"

namespace zv {

namespace {

constexpr std::string_view kCrLf = "\r\n";

// The tags every tagged format knows.
constexpr TagRule kSharedRules[] = {
    {"PR", TagAction::ProjectLine},
    {"AC", TagAction::Section},
    {"PN", TagAction::PointName},
    {"SX", TagAction::EastingError},
    {"SY", TagAction::NorthingError},
    {"SZ", TagAction::ElevationError},
    {"LT", TagAction::Latitude},
    {"LG", TagAction::Longitude},
    {"CA", TagAction::Convergence},
    {"HE", TagAction::EllipsoidHeight},
    {"HG", TagAction::GeoidHeight},
    {"SF", TagAction::ScaleFactor},
    {"PD", TagAction::Description},
    {"FE", TagAction::FeatureCode},
    {"GM", TagAction::Geometry},
    {"GR", TagAction::GRText},
    {"CS", TagAction::CoordinateSystem},
    {"ZN", TagAction::Zone},
    {"HD", TagAction::HorizontalDatum},
    {"VD", TagAction::VerticalDatum},
    {"UL", TagAction::Units},
};

constexpr int kTagCount = 26 * 26;
constexpr size_t kEstimateAfter = 4096;  // points read before the list is sized

int TagIndex(char first, char second) {
  if (first < 'A' || first > 'Z' || second < 'A' || second > 'Z') return -1;
  return (first - 'A') * 26 + (second - 'A');
}

std::string_view FieldMessage(TagAction action) {
  switch (action) {
    case TagAction::Easting:
      return "Easting Coordinate must be numeric.";
    case TagAction::Northing:
      return "Northing Coordinate must be numeric.";
    case TagAction::Elevation:
      return "Elevation Coordinate must be numeric.";
    case TagAction::EastingError:
      return "Easting Error Estimate must be numeric.";
    case TagAction::NorthingError:
      return "Northing Error Estimate must be numeric.";
    case TagAction::ElevationError:
      return "Elevation Error Estimate must be numeric.";
    case TagAction::Latitude:
      return "Latitude must be numeric.";
    case TagAction::Longitude:
      return "Longitude must be numeric.";
    case TagAction::EllipsoidHeight:
      return "Ellipsoid Height must be numeric.";
    case TagAction::GeoidHeight:
      return "Geoid Height must be numeric.";
    case TagAction::Convergence:
      return "Convergance Angle must be numeric.";
    case TagAction::ScaleFactor:
      return "Scale Factor must be numeric.";
    case TagAction::PointName:
      return "Point Name can not exceeed 8 characters.";
    default:
      return "";
  }
}

// True when a reader has put any value into the working point.
bool HoldsData(const SurveyPoint& p) {
  return !p.PointName.empty() || p.Geometry != "P" || !p.FeatureCode.empty() ||
         !p.DescriptionLines.empty() || !p.ExtraLines.empty() || !p.GRText.empty() ||
         p.Northing != kNoValue || p.Easting != kNoValue || p.Elevation != kNoValue ||
         p.NorthingError != kNoValueF || p.EastingError != kNoValueF ||
         p.ElevationError != kNoValueF || p.Latitude != kNoValue || p.Longitude != kNoValue ||
         p.EllipsoidHeight != kNoValue || p.GeoidHeight != kNoValue || p.Convergence != kNoValue ||
         p.ScaleFactor != kNoValue || p.HorizontalIsControl || p.ElevationIsControl;
}

class TaggedReader {
 public:
  TaggedReader(Ui& ui, const TaggedFormat& format, const std::string& path)
      : ui_(ui), format_(format), path_(path) {
    for (auto& a : actions_) a = TagAction::Unknown;
    for (auto& f : flags_) f = ControlFlag::Keep;
    addRules(kSharedRules);
    addRules(format.rules);
    points_.emplace_back();
  }

  // `sizeHint` is the size of the input in bytes when known (0 otherwise).
  bool read(std::istream& in, std::uintmax_t sizeHint) {
    LineReader reader(in, ui_.progress());
    std::string_view line;
    std::uintmax_t bytesRead = 0;
    while (reader.next(line)) {
      ++lineNumber_;
      if (!handle(line)) return false;
      bytesRead += line.size() + 2;
      if (points_.size() == kEstimateAfter && sizeHint > bytesRead) {
        // Size the list once from the density so far, rather than moving
        // every point at each doubling.
        double perPoint = static_cast<double>(bytesRead) / kEstimateAfter;
        ReservePoints(points_, static_cast<size_t>(static_cast<double>(sizeHint) / perPoint * 1.1) +
                                   kEstimateAfter);
      }
    }
    if (in.bad()) {
      ReportReadFailure(ui_, path_, "The input ended with a read error.");
      return false;
    }
    finishPoint();
    if (inChain_) chains_.push_back(std::move(chain_));
    return true;
  }

  void storeInto(WorkArea& work) {
    work.InputHeader = std::move(header_);
    work.InputPoints = std::move(points_);
    if (format_.hasChains) work.InputChains = std::move(chains_);
  }

 private:
  void addRules(std::span<const TagRule> rules) {
    for (const TagRule& r : rules) {
      int i = TagIndex(r.tag[0], r.tag[1]);
      actions_[i] = r.action;
      flags_[i] = r.flag;
    }
  }

  bool handle(std::string_view line) {
    if (line.empty()) return lineRule(format_.blankLineRule);
    // A NUL byte is never part of a text file: binary input is refused
    // rather than carried along as unknown lines.
    if (std::memchr(line.data(), '\0', line.size())) {
      return lineRule("An " + std::string(format_.name) + " can not contain binary data.");
    }
    TagAction action = TagAction::Unknown;
    ControlFlag flag = ControlFlag::Keep;
    if (line.size() >= 3 && line[2] == ':') {
      int i = TagIndex(line[0], line[1]);
      if (i >= 0) {
        action = actions_[i];
        flag = flags_[i];
      }
    }
    std::string_view value = line.size() > 3 ? line.substr(3) : std::string_view();
    SurveyPoint& p = points_.back();
    switch (action) {
      case TagAction::Unknown:
        unknown(line);
        return true;
      case TagAction::Ignore:
        return true;
      case TagAction::ProjectLine:
        header_.ProjectLine.assign(line);
        return true;
      case TagAction::Section:
        section(value);
        return true;
      case TagAction::PointName:
        if (value.size() > 8) return fieldError(action);
        p.PointName.assign(value);
        return true;
      case TagAction::Easting:
        setFlag(p.HorizontalIsControl, flag);
        return number(value, p.Easting, action);
      case TagAction::Northing:
        setFlag(p.HorizontalIsControl, flag);
        return number(value, p.Northing, action);
      case TagAction::Elevation:
        setFlag(p.ElevationIsControl, flag);
        return number(value, p.Elevation, action);
      case TagAction::EastingError:
        return single(value, p.EastingError, action);
      case TagAction::NorthingError:
        return single(value, p.NorthingError, action);
      case TagAction::ElevationError:
        return single(value, p.ElevationError, action);
      case TagAction::Latitude:
        return angle(value, p.Latitude, action);
      case TagAction::Longitude:
        return angle(value, p.Longitude, action);
      case TagAction::Convergence:
        return angle(value, p.Convergence, action);
      case TagAction::EllipsoidHeight:
        return number(value, p.EllipsoidHeight, action);
      case TagAction::GeoidHeight:
        return number(value, p.GeoidHeight, action);
      case TagAction::ScaleFactor:
        return number(value, p.ScaleFactor, action);
      case TagAction::Description:
        // A project section's PD lines describe the file, not a point.
        if (inProject_ && !format_.projectSectionKeepsPoint) {
          unknown(line);
        } else {
          AppendLine(p.DescriptionLines, line);
        }
        return true;
      case TagAction::FeatureCode:
        (inChain_ ? chain_.FeatureCode : p.FeatureCode).assign(value);
        return true;
      case TagAction::Geometry:
        p.Geometry.assign(value);
        return true;
      case TagAction::GRText:
        p.GRText.assign(value);
        return true;
      case TagAction::CoordinateSystem:
        header_.CoordinateSystem.assign(value);
        return true;
      case TagAction::Zone:
        header_.Zone.assign(value);
        return true;
      case TagAction::HorizontalDatum:
        header_.HorizontalDatum.assign(value);
        return true;
      case TagAction::VerticalDatum:
        header_.VerticalDatum.assign(value);
        return true;
      case TagAction::Units:
        if (value == "M") header_.HorizontalUnits = kMeters;
        if (value == "F") header_.HorizontalUnits = kUsSurveyFeet;
        if (value == "I") header_.HorizontalUnits = kInternationalFeet;
        header_.VerticalUnits = header_.HorizontalUnits;
        return true;
      case TagAction::EndChain:
        // A stray EG (no chain open) adds nothing.
        if (inChain_) {
          chains_.push_back(std::move(chain_));
          chain_ = SurveyChain{};
        }
        inChain_ = false;
        return true;
      case TagAction::ChainDescription:
        chainLine(chain_.Description, line);
        return true;
      case TagAction::ChainFG:
        if (inChain_) {
          chain_.FGText.assign(value);
        } else {
          unknown(line);
        }
        return true;
      case TagAction::ChainPointList:
        chainLine(chain_.PointListLines, line);
        return true;
      case TagAction::ChainLines:
        chainLine(chain_.ChainLines, line);
        return true;
      case TagAction::Refuse:
        return lineRule(format_.coordinateRule);
    }
    return true;
  }

  void section(std::string_view value) {
    std::string_view code = value.substr(0, 2);
    if (code == "PR") {
      // The point before a project section is stored here, before the
      // section's UL line can change the units it was read in.
      if (!inProject_ && HoldsData(points_.back())) storePoint();
      inProject_ = true;
      return;
    }
    if (format_.hasChains && code == "CH") {
      if (inChain_) chains_.push_back(std::move(chain_));
      chain_ = SurveyChain{};
      StartChain(chain_);
      inChain_ = true;
      inProject_ = false;
      return;
    }
    if (format_.projectSectionKeepsPoint) {
      if (!inProject_) storePoint();
    } else {
      if (!inProject_ || HoldsData(points_.back())) {
        storePoint();
      } else {
        ResetPoint(points_.back());
      }
      if (format_.pointRecordCodes) points_.back().RecordCode.assign(value);
    }
    inProject_ = false;
  }

  // The working point is the last of the list. Storing it gives it the
  // header's units and starts a new working point, to which RecordCode and
  // Text33 carry over.
  void finishPoint() {
    SurveyPoint& p = points_.back();
    if (horizontalUnits_ != header_.HorizontalUnits) horizontalUnits_ = header_.HorizontalUnits;
    if (verticalUnits_ != header_.VerticalUnits) verticalUnits_ = header_.VerticalUnits;
    p.HorizontalUnits = horizontalUnits_;
    p.VerticalUnits = verticalUnits_;
  }
  void storePoint() {
    finishPoint();
    points_.emplace_back();
    const SurveyPoint& stored = points_[points_.size() - 2];
    SurveyPoint& next = points_.back();
    if (!stored.RecordCode.empty()) next.RecordCode = stored.RecordCode;
    if (!stored.Text33.empty()) next.Text33 = stored.Text33;
  }

  void unknown(std::string_view line) {
    if (inProject_) {
      AppendLine(header_.HeaderExtraLines, line);
    } else if (inChain_) {
      AppendLine(chain_.ExtraLines, line);
    } else {
      AppendLine(points_.back().ExtraLines, line);
    }
  }

  // Chain lines outside a chain section are kept as unknown lines rather
  // than collected into a chain that is never stored.
  void chainLine(CompactText& field, std::string_view line) {
    if (inChain_) {
      AppendLine(field, line);
    } else {
      unknown(line);
    }
  }

  static void setFlag(bool& target, ControlFlag flag) {
    if (flag == ControlFlag::Set) target = true;
    if (flag == ControlFlag::Clear) target = false;
  }

  bool number(std::string_view value, double& target, TagAction action) {
    std::optional<double> v = ToNumber(value);
    if (!v) return fieldError(action);
    target = *v;
    return true;
  }

  bool single(std::string_view value, float& target, TagAction action) {
    std::optional<double> v = ToNumber(value);
    if (!v || std::fabs(*v) > FLT_MAX) return fieldError(action);
    target = static_cast<float>(*v);
    return true;
  }

  bool angle(std::string_view value, double& target, TagAction action) {
    if (!IsNumeric(value)) return fieldError(action);
    try {
      target = Angles_PackedToRadians(ui_, value);
    } catch (const std::exception&) {
      return fieldError(action);
    }
    return true;
  }

  std::string heading(bool fieldLayout) const {
    std::string n = std::to_string(lineNumber_);
    std::string text = "Invalid " + std::string(format_.name);
    if (fieldLayout) return text + ": '" + path_ + "'" + std::string(kCrLf) + "Error on Line: " + n;
    return text + " '" + path_ + "'." + std::string(kCrLf) + "Error on line " + n + ".";
  }

  bool show(bool fieldLayout, std::string_view message) {
    ui_.message(heading(fieldLayout) + std::string(kCrLf) + std::string(message), Icon::Exclamation,
                Buttons::Ok, "Invalid " + std::string(format_.name));
    return false;
  }

  bool lineRule(std::string_view rule) { return show(false, rule); }
  bool fieldError(TagAction action) {
    return show(!format_.fieldErrorsAsLineRule, FieldMessage(action));
  }

  Ui& ui_;
  const TaggedFormat& format_;
  const std::string& path_;
  TagAction actions_[kTagCount];
  ControlFlag flags_[kTagCount];

  std::int64_t lineNumber_ = 0;
  FileHeader header_;
  CompactText horizontalUnits_, verticalUnits_;  // the header's, shared by the points
  std::vector<SurveyPoint> points_;              // the last one is the working point
  std::vector<SurveyChain> chains_;
  SurveyChain chain_;
  bool inProject_ = false;
  bool inChain_ = false;
};

// Appends each line of a CR LF-joined field; empty lines are never written.
void WriteLines(TextFileWriter& out, std::string_view text) {
  while (!text.empty()) {
    size_t lf = text.find('\n');
    std::string_view line = text.substr(0, lf);
    if (lf == std::string_view::npos) {
      text = {};
    } else {
      text.remove_prefix(lf + 1);
      if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
    }
    if (!line.empty()) out.line(line);
  }
}

// The unit code of a unit name, or nullptr.
const char* UnitCode(std::string_view unit) {
  if (unit == kMeters) return "M";
  if (unit == kUsSurveyFeet) return "F";
  if (unit == kInternationalFeet) return "I";
  return nullptr;
}

// True when values in `from` can be expressed in `to`.
bool Convertible(std::string_view from, std::string_view to) {
  return from == to || Distances_Convert(1.0, from, to) != kNoValue;
}

float ToSingle(double v) {
  if (v > FLT_MAX) return FLT_MAX;
  if (v < -FLT_MAX) return -FLT_MAX;
  return static_cast<float>(v);
}

class TaggedWriter {
 public:
  TaggedWriter(Ui& ui, TextFileWriter& out, const TaggedFormat& format, const WorkArea& work,
               std::string unit)
      : ui_(ui), out_(out), format_(format), unit_(unit) {
    bool all = !work.ConversionOptionsActive;
    latLong_ = all || work.OutputLatLong;
    convergence_ = all || work.OutputConvergence;
    scaleFactor_ = all || work.OutputScaleFactor;
  }

  void header(const FileHeader& h) {
    WriteLines(out_, h.ProjectLine);
    out_.line("AC:PR");
    out_.line(VersionLine());
    WriteLines(out_, h.HeaderExtraLines);
    text("CS:", h.CoordinateSystem);
    text("ZN:", h.Zone);
    text("HD:", h.HorizontalDatum);
    if (h.VerticalDatum != "None") text("VD:", h.VerticalDatum);
    if (!unit_.empty()) tagged("UL:", h.HorizontalUnits);
  }

  void point(SurveyPoint& p) {
    if (p.PointName.size() > 8) {
      notes_.add("have names longer than 8 characters and will not read back", p.PointName);
    }
    convert(p);
    std::string& b = out_.buffer();
    if (format_.pointOpening.empty()) {
      b += "AC:";
      b += p.RecordCode;
    } else {
      b += format_.pointOpening;
    }
    out_.lineDone();
    tagged("PN:", p.PointName);

    bool controlH = format_.coordinates == CoordinateTags::Control ||
                    (format_.coordinates == CoordinateTags::ByFlags && p.HorizontalIsControl);
    bool controlZ = format_.coordinates == CoordinateTags::Control ||
                    (format_.coordinates == CoordinateTags::ByFlags && p.ElevationIsControl);
    const char* n = controlH ? "YC:" : "YY:";
    const char* e = controlH ? "XC:" : "XX:";
    const char* z = controlZ ? "ZC:" : "ZZ:";
    if (p.GridMissing) {
      tagged(n, "-99999");
      tagged(e, "-99999");
      if (p.Elevation != kNoValue) {
        fixed(z, p.Elevation, 4);
      } else {
        tagged(z, "-99999");
      }
    } else {
      fixed(n, p.Northing, 4);
      fixed(e, p.Easting, 4);
      fixed(z, p.Elevation, 4);
    }

    if (latLong_) {
      angle("LT:", p.Latitude, p.LatitudeHemisphere, "N");
      angle("LG:", p.Longitude, p.LongitudeHemisphere, "W");
    }
    optional("HE:", p.EllipsoidHeight, 3);
    WriteLines(out_, p.DescriptionLines);
    text("FE:", p.FeatureCode);
    if (format_.writesGeometry) text("GM:", p.Geometry);
    optional("HG:", p.GeoidHeight, 3);
    if (scaleFactor_) optional("SF:", p.ScaleFactor, 8);
    if (convergence_ && p.Convergence != kNoValue) {
      tagged("CA:", Angles_RadiansToPacked(ui_, p.Convergence, 1));
    }
    text("GR:", p.GRText);
    WriteLines(out_, p.ExtraLines);
    optional("SY:", p.NorthingError, 4);
    optional("SX:", p.EastingError, 4);
    optional("SZ:", p.ElevationError, 4);
  }

  void chains(const std::vector<SurveyChain>& chains) {
    out_.line("BG:BEGIN CHAIN LIST");
    for (const SurveyChain& c : chains) {
      out_.line("AC:CH");
      text("FE:", c.FeatureCode);
      WriteLines(out_, c.Description);
      text("FG:", c.FGText);
      WriteLines(out_, c.PointListLines);
      WriteLines(out_, c.ChainLines);
      WriteLines(out_, c.ExtraLines);
    }
    out_.line("EG:END CHAIN LIST");
    tagged("CP:", ChainListDate(std::time(nullptr)));
  }

  const OutputNotes& notes() const { return notes_; }

 private:
  // Converts the linear values of the point into the output unit and stores
  // them back. A value whose unit cannot be converted stays as it is (and
  // keeps its unit) rather than turning into the no-value marker.
  void convert(SurveyPoint& p) {
    if (Convertible(p.HorizontalUnits, unit_)) {
      std::string_view from = p.HorizontalUnits;
      p.Northing = Distances_Convert(p.Northing, from, unit_);
      p.Easting = Distances_Convert(p.Easting, from, unit_);
      p.NorthingError = ToSingle(Distances_Convert(p.NorthingError, from, unit_));
      p.EastingError = ToSingle(Distances_Convert(p.EastingError, from, unit_));
      p.ElevationError = ToSingle(Distances_Convert(p.ElevationError, from, unit_));
      if (p.HorizontalUnits != unit_) p.HorizontalUnits = unit_;
    }
    if (Convertible(p.VerticalUnits, unit_)) {
      std::string_view from = p.VerticalUnits;
      p.Elevation = Distances_Convert(p.Elevation, from, unit_);
      p.EllipsoidHeight = Distances_Convert(p.EllipsoidHeight, from, unit_);
      p.GeoidHeight = Distances_Convert(p.GeoidHeight, from, unit_);
      if (p.VerticalUnits != unit_) p.VerticalUnits = unit_;
    }
  }

  void angle(const char* tag, double& value, CompactText& hemisphere, const char* to) {
    double v = Angles_ConvertHemisphere(value, hemisphere, to);
    if (v == kNoValue) return;
    value = v;
    if (hemisphere != to) hemisphere = to;
    tagged(tag, Angles_RadiansToPacked(ui_, v, 5));
  }

  void tagged(std::string_view tag, std::string_view value) {
    std::string& b = out_.buffer();
    b += tag;
    b += value;
    out_.lineDone();
  }
  void text(std::string_view tag, std::string_view value) {
    if (!value.empty()) tagged(tag, value);
  }
  void fixed(std::string_view tag, double value, int decimals) {
    std::string& b = out_.buffer();
    b += tag;
    AppendFixed(b, value, decimals);
    out_.lineDone();
  }
  void optional(std::string_view tag, double value, int decimals) {
    if (value != kNoValue) fixed(tag, value, decimals);
  }

  Ui& ui_;
  TextFileWriter& out_;
  const TaggedFormat& format_;
  CompactText unit_;  // shared by the converted points
  bool latLong_;
  bool convergence_;
  bool scaleFactor_;
  OutputNotes notes_;
};

}  // namespace

bool ReadTaggedStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path,
                      const TaggedFormat& format, std::uintmax_t sizeHint) {
  TaggedReader reader(ui, format, path);
  if (!reader.read(in, sizeHint)) return false;
  reader.storeInto(work);
  return true;
}

bool ReadTaggedFile(Ui& ui, WorkArea& work, const std::string& path, const TaggedFormat& format) {
  std::ifstream in;
  if (!OpenSurveyInput(ui, path, in)) return false;
  std::error_code ec;
  std::uintmax_t size = std::filesystem::file_size(path, ec);
  return ReadTaggedStream(ui, work, in, path, format, ec ? 0 : size);
}

bool WriteTaggedFile(Ui& ui, WorkArea& work, const std::string& path, const TaggedFormat& format) {
  FileHeader& h = work.OutputHeader;
  std::string unit = h.HorizontalUnits.starts_with("DDD") ? h.VerticalUnits : h.HorizontalUnits;
  if (const char* code = UnitCode(unit)) h.HorizontalUnits = std::string(code);

  TextFileWriter out(path);
  if (!out.open()) {
    ReportWriteFailure(ui, path, out.error());
    return false;
  }
  TaggedWriter writer(ui, out, format, work, unit);
  writer.header(h);
  RunProgress* progress = ui.progress();
  const size_t count = work.OutputPoints.size();
  for (size_t i = 0; i < count; ++i) {
    StepItems(progress, RunStage::Writing, i, count);
    writer.point(work.OutputPoints[i]);
  }
  if (format.hasChains && !work.OutputChains.empty()) writer.chains(work.OutputChains);
  if (!out.commit()) {
    ReportWriteFailure(ui, path, out.error());
    return false;
  }
  writer.notes().show(ui, path);
  return true;
}

std::string ChainListDate(std::int64_t unixTime) {
  std::time_t t = static_cast<std::time_t>(unixTime);
  std::tm local{};
  localtime_r(&t, &local);
  char buf[64];
  std::snprintf(buf, sizeof buf, "%02d/%02d/%04d %d:%02d:%02d", local.tm_mon + 1, local.tm_mday,
                local.tm_year + 1900, local.tm_hour, local.tm_min, local.tm_sec);
  return buf;
}

}  // namespace zv
