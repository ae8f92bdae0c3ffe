#include "survey/SrvFile.h"

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <limits>
#include <new>
#include <string_view>
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

constexpr size_t kEmptyRow = std::numeric_limits<size_t>::max();

bool EqualsUpper(std::string_view token, std::string_view upper) {
  if (token.size() != upper.size()) return false;
  for (size_t i = 0; i < token.size(); ++i) {
    char c = token[i];
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
    if (c != upper[i]) return false;
  }
  return true;
}

bool IsCodeLetter(std::string_view token) {
  return token == "F" || token == "G" || token == "X" || token == "U";
}

// A number whose text is the text of its whole-number value: "12", "-3",
// "0"; not "012", "-0", "+5" or "12.0".
bool IsIntegerText(std::string_view token) {
  std::string_view digits = token;
  if (!digits.empty() && digits.front() == '-') digits.remove_prefix(1);
  if (digits.empty()) return false;
  for (char c : digits) {
    if (c < '0' || c > '9') return false;
  }
  if (digits.size() > 1 && digits.front() == '0') return false;
  return !(digits == "0" && token.size() > 1);
}

// Adds a word to a description kept as one tagged line.
void AddWords(CompactText& field, std::string_view tag, std::string_view words) {
  if (field.empty()) {
    field.append(tag);
  } else {
    field += ' ';
  }
  field.append(words);
}

const char* UnitName(std::string_view code) {
  if (code == "M") return kMeters;
  if (code == "F") return kUsSurveyFeet;
  if (code == "I") return kInternationalFeet;
  return nullptr;
}

std::string UnitCode(std::string_view name) {
  if (name == kMeters) return "M";
  if (name == kUsSurveyFeet) return "F";
  if (name == kInternationalFeet) return "I";
  return {};
}

// A point or output without a unit name is taken as it is, rather than
// losing its coordinates to an unknown-unit -99999.
double ConvertLength(double value, const std::string& from, const std::string& to) {
  if (from.empty() || to.empty()) return value;
  return Distances_Convert(value, from, to);
}

class SrvReader {
 public:
  SrvReader(Ui& ui, std::istream& in, const std::string& path)
      : ui_(ui), in_(in), reader_(in, ui.progress()), path_(path) {}

  bool read(WorkArea& work) {
    ReservePoints(points_, BytesLeft(in_) / 32);
    std::string_view line;
    while (reader_.next(line)) {
      ++lineNumber_;
      if (line.find('\0') != std::string_view::npos)
        return fail("Invalid Line", ".  The line holds binary data.");
      if (line.empty()) continue;
      if (pending_) storePending();
      split(line);
      if (!parse(line)) return false;
    }
    if (in_.bad()) return fail("Invalid Line", ".  The file could not be read to its end.");
    if (pending_) storePending();
    if (inChain_) chains_.push_back(std::move(chain_));
    work.InputHeader = std::move(header_);
    work.InputPoints = std::move(points_);
    work.InputChains = std::move(chains_);
    return true;
  }

 private:
  bool fail(const char* title, const char* rule) {
    ui_.message("Invalid CAiCE SRV File '" + path_ + ".  An error occurred on line '" +
                    std::to_string(lineNumber_) + rule,
                Icon::Exclamation, Buttons::Ok, title);
    return false;
  }

  void split(std::string_view line) {
    tokens_.clear();
    size_t start = 0;
    for (;;) {
      size_t blank = line.find(' ', start);
      if (blank == std::string_view::npos) {
        tokens_.push_back(line.substr(start));
        return;
      }
      tokens_.push_back(line.substr(start, blank - start));
      start = blank + 1;
    }
  }

  std::string_view token(size_t i) const {
    return i < tokens_.size() ? tokens_[i] : std::string_view();
  }

  void storePending() {
    if (!header_.HorizontalUnits.empty()) {
      point_.HorizontalUnits = header_.HorizontalUnits;
      point_.VerticalUnits = header_.HorizontalUnits;
    }
    points_.push_back(std::move(point_));
    ResetPoint(point_);
    pending_ = false;
  }

  bool parse(std::string_view line) {
    bool first = true;
    for (size_t i = 0; i < tokens_.size(); ++i) {
      std::string_view t = tokens_[i];
      if (t.empty()) continue;
      if (EqualsUpper(t, "BEGIN")) return begin(i);
      if (EqualsUpper(t, "END")) {
        // An END without an open chain would store the last chain again.
        if (inChain_) {
          chains_.push_back(std::move(chain_));
          inChain_ = false;
        }
      } else if (EqualsUpper(t, "P") || EqualsUpper(t, "C")) {
        point_.Geometry = t;
      } else if (EqualsUpper(t, "F") || EqualsUpper(t, "G") || EqualsUpper(t, "X") ||
                 EqualsUpper(t, "U")) {
        (inChain_ ? chain_.CodeLetter : point_.CodeLetter) = t;
      } else if (std::optional<double> value = ToNumber(t); !value) {
        // Only a line that starts with "#" is a header line, so a
        // description word such as "#5" stays a word.
        if (first && t.front() == '#') {
          headerLine(line);
          return true;
        }
        AddWords(point_.DescriptionLines, "PD:", t);
      } else if (IsIntegerText(t)) {
        (inChain_ ? chain_.IntegerAttribute : point_.IntegerAttribute) = t;
      } else {
        return pointFields(line, i, *value);
      }
      first = false;
    }
    return true;
  }

  bool begin(size_t i) {
    // A chain left open by a missing END is kept, not overwritten.
    if (inChain_) chains_.push_back(std::move(chain_));
    chain_ = SurveyChain{};
    StartChain(chain_);
    std::string_view name = token(i + 1);
    if (name.empty()) return fail("Invalid Chain Name", ".  A chain must have a name.");
    chain_.ChainName = name;
    bool haveFeature = false;
    for (size_t j = i + 2; j < tokens_.size(); ++j) {
      std::string_view t = tokens_[j];
      if (t.empty()) continue;
      if (IsCodeLetter(t)) {
        chain_.CodeLetter = t;
      } else if (ToNumber(t)) {
        if (IsIntegerText(t)) chain_.IntegerAttribute = t;
      } else if (t.find('+') != std::string_view::npos) {
        chain_.Station = t;
      } else if (!haveFeature) {
        chain_.FeatureCode = t;
        haveFeature = true;
      } else {
        AddWords(chain_.Description, "CD:", t);
      }
    }
    inChain_ = true;
    return true;
  }

  bool pointFields(std::string_view line, size_t i, double easting) {
    std::optional<double> northing = ToNumber(token(i + 1));
    if (!northing) return fail("Invalid Northing", ".  The northing coordinate must be numeric.");
    std::optional<double> elevation = ToNumber(token(i + 2));
    if (!elevation) return fail("Invalid Elevation", ".  The elevation must be numeric.");
    std::string_view feature = token(i + 3);
    if (feature.empty()) return fail("Invalid Feature Code", ".  A feature code is required.");
    std::string_view name = token(i + 4);
    if (name.empty()) return fail("Invalid Point ID", ".  A point id is required.");
    point_.Easting = easting;
    point_.Northing = *northing;
    point_.Elevation = *elevation;
    point_.FeatureCode = feature;
    point_.PointName = name;
    if (inChain_) {
      if (chain_.PointListLines.empty()) {
        chain_.PointListLines = "PL:";
      } else {
        chain_.PointListLines += ',';
      }
      chain_.PointListLines.append(name);
    }
    // Everything after the point id is its description, taken as text:
    // words such as "END", "P" or "12" in a description are not keywords.
    size_t restAt = static_cast<size_t>(name.data() - line.data()) + name.size();
    std::string_view rest = Trim(line.substr(restAt));
    if (!rest.empty()) AddWords(point_.DescriptionLines, "PD:", rest);
    pending_ = true;
    return true;
  }

  void headerLine(std::string_view line) {
    std::string_view tag = line.substr(0, 4);
    std::string_view value = line.substr(std::min<size_t>(4, line.size()));
    if (tag == "#CS:") {
      header_.CoordinateSystem = value;
    } else if (tag == "#HD:") {
      header_.HorizontalDatum = value;
    } else if (tag == "#ZN:") {
      header_.Zone = value;
    } else if (tag == "#VD:") {
      header_.VerticalDatum = value;
    } else if (tag == "#UL:" && UnitName(value)) {
      header_.HorizontalUnits = UnitName(value);
      header_.VerticalUnits = header_.HorizontalUnits;
    } else {
      AppendLine(header_.HeaderExtraLines, line.substr(1));
    }
  }

  Ui& ui_;
  std::istream& in_;
  LineReader reader_;
  const std::string& path_;
  size_t lineNumber_ = 0;
  std::vector<std::string_view> tokens_;

  FileHeader header_;
  std::vector<SurveyPoint> points_;
  std::vector<SurveyChain> chains_;
  SurveyPoint point_;
  SurveyChain chain_;
  bool pending_ = false;
  bool inChain_ = false;
};

void AppendField(std::string& out, const std::string& field) {
  if (field.empty()) return;
  out += field;
  out += ' ';
}

// The description text: every "PD:" removed, line breaks become blanks.
void AppendDescription(std::string& out, std::string_view text) {
  size_t i = 0;
  while (i < text.size()) {
    if (text.compare(i, 3, "PD:") == 0) {
      i += 3;
    } else if (text.compare(i, 2, "\r\n") == 0) {
      out += ' ';
      i += 2;
    } else {
      out += text[i++];
    }
  }
}

bool HasBreak(std::string_view text) {
  return text.find_first_of(" \r\n") != std::string_view::npos;
}

// Names and codes must stay one token of their line: blanks become "_".
void AppendOneToken(std::string& out, std::string_view text) {
  size_t from = out.size();
  out += text;
  for (size_t i = from; i < out.size(); ++i) {
    if (out[i] == ' ' || out[i] == '\r' || out[i] == '\n') out[i] = '_';
  }
}

std::string OneToken(std::string_view text) {
  std::string token;
  AppendOneToken(token, text);
  return token;
}

void AppendPointLine(std::string& out, SurveyPoint& p, const std::string& unit) {
  p.Easting = ConvertLength(p.Easting, p.HorizontalUnits, unit);
  p.Northing = ConvertLength(p.Northing, p.HorizontalUnits, unit);
  p.Elevation = ConvertLength(p.Elevation, p.VerticalUnits, unit);
  AppendField(out, p.Geometry);
  AppendField(out, p.CodeLetter);
  AppendField(out, p.IntegerAttribute);
  AppendFixed(out, p.Easting, 4);
  out += ' ';
  AppendFixed(out, p.Northing, 4);
  out += ' ';
  AppendFixed(out, p.Elevation, 4);
  out += ' ';
  AppendOneToken(out,
                 p.FeatureCode.empty() ? std::string_view("-1") : std::string_view(p.FeatureCode));
  out += ' ';
  AppendOneToken(out, p.PointName);
  out += ' ';
  AppendDescription(out, p.DescriptionLines);
}

class SrvWriter {
 public:
  SrvWriter(Ui& ui, WorkArea& work, const std::string& path)
      : ui_(ui), work_(work), path_(path), out_(path) {}

  bool write() {
    FileHeader& header = work_.OutputHeader;
    if (header.CoordinateSystem == kGeographicCoordinates) {
      ui_.message("A Caice SRV File must contain plane coordinates.", Icon::Exclamation,
                  Buttons::Ok, "Plane Coordiantes Required");
      return false;
    }
    if (!checkPoints()) return false;
    // Output unit: the horizontal unit, or the vertical one for an angle format.
    unit_ = header.HorizontalUnits;
    if (unit_.rfind("DDD", 0) == 0) unit_ = header.VerticalUnits;
    std::string code = UnitCode(unit_);
    if (!code.empty()) header.HorizontalUnits = code;

    if (!out_.open()) {
      ReportWriteFailure(ui_, path_, out_.error());
      return false;
    }
    writeHeader(header, code.empty() ? unit_ : code);
    for (SurveyPoint& p : work_.OutputPoints) p.NotYetWritten = true;
    std::vector<Block> blocks = prepareBlocks();
    size_t done = 0;
    for (SurveyPoint& p : work_.OutputPoints) {
      StepItems(ui_.progress(), RunStage::Writing, done++, work_.OutputPoints.size());
      if (!p.NotYetWritten) continue;
      AppendPointLine(out_.buffer(), p, unit_);
      out_.lineDone();
    }
    for (const Block& block : blocks) writeBlock(block);
    if (!out_.commit()) {
      ReportWriteFailure(ui_, path_, out_.error());
      return false;
    }
    notes_.show(ui_, path_);
    return true;
  }

 private:
  struct Block {
    size_t chain;
    std::string name;
    std::vector<size_t> rows;  // point indexes; kEmptyRow for a point already written
  };

  // A point id must not be empty; blanks in ids and feature codes are
  // written as "_" so that each stays one token.
  bool checkPoints() {
    const std::vector<SurveyPoint>& points = work_.OutputPoints;
    for (size_t i = 0; i < points.size(); ++i) {
      const SurveyPoint& p = points[i];
      if (p.PointName.empty()) {
        ui_.message("Point " + std::to_string(i + 1) +
                        " has no point id and can not be written to a CAiCE SRV File.",
                    Icon::Exclamation, Buttons::Ok, kAppTitle);
        return false;
      }
      if (HasBreak(p.PointName) || HasBreak(p.FeatureCode)) {
        notes_.add("had blanks in their point id or feature code, written as \"_\"", p.PointName);
      }
    }
    return true;
  }

  void writeHeader(const FileHeader& header, const std::string& unitText) {
    if (!header.ProjectLine.empty()) commented("#", header.ProjectLine);
    commented("#", VersionLine());
    std::string_view extra = header.HeaderExtraLines;
    while (!extra.empty()) {
      size_t end = extra.find("\r\n");
      commented("#", extra.substr(0, end));
      if (end == std::string_view::npos) break;
      extra.remove_prefix(end + 2);
    }
    if (!header.CoordinateSystem.empty()) commented("#CS:", header.CoordinateSystem);
    if (!header.Zone.empty()) commented("#ZN:", header.Zone);
    if (!header.HorizontalDatum.empty()) commented("#HD:", header.HorizontalDatum);
    if (!header.VerticalDatum.empty() && header.VerticalDatum != "None")
      commented("#VD:", header.VerticalDatum);
    if (!unitText.empty()) commented("#UL:", unitText);
  }

  // A header line: its mark, then the text.
  void commented(std::string_view mark, std::string_view text) {
    std::string& b = out_.buffer();
    b.append(mark);
    b.append(text);
    out_.lineDone();
  }

  std::string chainName(const SurveyChain& chain) {
    if (!chain.ChainName.empty()) return OneToken(chain.ChainName);
    if (!chain.FGText.empty()) return OneToken(chain.FGText);
    if (!chain.ChainLines.empty()) return OneToken(chain.ChainLines);
    return "CH" + std::to_string(++unnamed_);
  }

  std::vector<Block> prepareBlocks() {
    std::vector<Block> blocks;
    std::vector<SurveyPoint>& points = work_.OutputPoints;
    std::unordered_map<std::string_view, size_t> byName;
    std::string ids;
    for (size_t c = 0; c < work_.OutputChains.size(); ++c) {
      SurveyChain& chain = work_.OutputChains[c];
      if (!chain.Open) continue;
      // The point list: "PL:" removed, lines joined with ",", split at ",".
      ids.clear();
      std::string_view text = chain.PointListLines;
      for (size_t i = 0; i < text.size();) {
        if (text.compare(i, 3, "PL:") == 0) {
          i += 3;
        } else if (text.compare(i, 2, "\r\n") == 0) {
          ids += ',';
          i += 2;
        } else {
          ids += text[i++];
        }
      }
      if (ids.find(',') == std::string::npos) {
        chain.Open = false;  // fewer than two points: not a chain to write
        continue;
      }
      if (byName.empty()) {
        byName.reserve(points.size());
        for (size_t i = 0; i < points.size(); ++i) byName.try_emplace(points[i].PointName, i);
      }
      Block block{c, chainName(chain), {}};
      std::string_view rest = ids;
      for (;;) {
        size_t comma = rest.find(',');
        auto found = byName.find(rest.substr(0, comma));
        if (found != byName.end()) {
          SurveyPoint& p = points[found->second];
          block.rows.push_back(p.NotYetWritten ? found->second : kEmptyRow);
          p.NotYetWritten = false;
        }
        if (comma == std::string_view::npos) break;
        rest.remove_prefix(comma + 1);
      }
      blocks.push_back(std::move(block));
    }
    return blocks;
  }

  void writeBlock(const Block& block) {
    const SurveyChain& chain = work_.OutputChains[block.chain];
    std::string& b = out_.buffer();
    b += "BEGIN ";
    b += block.name;
    b += ' ';
    AppendField(b, chain.CodeLetter);
    AppendField(b, chain.IntegerAttribute);
    AppendField(b, chain.Station);
    AppendField(b, chain.FeatureCode);
    if (!chain.Description.empty()) {
      std::string_view text = chain.Description;
      for (size_t i = 0; i < text.size();) {
        if (text.compare(i, 3, "CD:") == 0) {
          i += 3;
        } else if (text.compare(i, 2, "\r\n") == 0) {
          b += ' ';
          i += 2;
        } else {
          b += text[i++];
        }
      }
      b += ' ';
    }
    out_.lineDone();
    for (size_t row : block.rows) {
      if (row != kEmptyRow) AppendPointLine(out_.buffer(), work_.OutputPoints[row], unit_);
      out_.lineDone();
    }
    out_.line("END");
  }

  Ui& ui_;
  WorkArea& work_;
  const std::string& path_;
  TextFileWriter out_;
  std::string unit_;
  int unnamed_ = 0;
  OutputNotes notes_;
};

}  // namespace

std::string SrvPointLine(SurveyPoint& point, const std::string& outputUnit) {
  std::string line;
  if (point.NotYetWritten) AppendPointLine(line, point, outputUnit);
  return line;
}

bool ReadSrvFileStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path) {
  SrvReader reader(ui, in, path);
  return reader.read(work);
}

bool ReadSrvFile(Ui& ui, WorkArea& work, const std::string& path) {
  std::ifstream in;
  if (!OpenSurveyInput(ui, path, in)) return false;
  return ReadSrvFileStream(ui, work, in, path);
}

bool WriteSrvFile(Ui& ui, WorkArea& work, const std::string& path) {
  SrvWriter writer(ui, work, path);
  return writer.write();
}

}  // namespace zv
