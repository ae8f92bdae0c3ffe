#include "survey/NgsDataSheet.h"

#include <fstream>
#include <string_view>
#include <vector>

#include "geodesy/Angles.h"
#include "platform/Error.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"
#include "survey/SurveyIo.h"

namespace zv {

namespace {

constexpr std::string_view kSheetStart = "1        National Geodetic Survey,   Retrieval Date =";
constexpr std::string_view kAccuracyHeading =
    "------- Accuracy Estimates (at 95% Confidence Level in cm) --------";
constexpr const char* kInvalidTitle = "Invalid NGS Data Sheet";
// 95 % confidence in centimetres to one sigma in metres.
constexpr double kAccuracyDivisor = 195.99;

// Columns are counted from 1; parts beyond the end of the line are empty.
std::string_view Cols(std::string_view line, size_t first, size_t last) {
  if (first > line.size()) return {};
  return line.substr(first - 1, last - first + 1);
}

std::string_view From(std::string_view line, size_t first) {
  if (first > line.size()) return {};
  return line.substr(first - 1);
}

char Col(std::string_view line, size_t column) {
  return column <= line.size() ? line[column - 1] : '\0';
}

bool IsSheetStart(std::string_view line) {
  return line.substr(0, kSheetStart.size()) == kSheetStart;
}

void AppendTagged(CompactText& field, std::string_view prefix, std::string_view value) {
  if (!field.empty()) field += "\r\n";
  field.append(prefix, value);
}

class NgsReader {
 public:
  NgsReader(Ui& ui, std::istream& in, const std::string& path)
      : ui_(ui), in_(in), reader_(in, ui.progress()), path_(path) {}

  bool read(WorkArea& work) {
    std::string_view line;
    while (nextLine(line)) {
      if (!examine(line)) return false;
    }
    if (failed_) return false;
    if (in_.bad()) return fail("The file could not be read to its end.");
    if (counter_ < 0) {
      ui_.message("Invalid NGS Data Sheet '" + path_ + "'.\r\nThe file holds no data sheet.",
                  Icon::Exclamation, Buttons::Ok, kInvalidTitle);
      return false;
    }
    points_.push_back(std::move(point_));
    header_.CoordinateSystem = kGeographicCoordinates;
    header_.HorizontalUnits = kFormatDMS;
    header_.VerticalUnits = kMeters;
    work.InputHeader = std::move(header_);
    work.InputPoints = std::move(points_);
    return true;
  }

 private:
  // The next line, or a line handed back by a step that read ahead.
  bool nextLine(std::string_view& line) {
    if (failed_) return false;
    if (heldBack_) {
      heldBack_ = false;
      line = held_;
      return true;
    }
    if (!reader_.next(line)) return false;
    ++lineNumber_;
    if (line.find('\0') != std::string_view::npos) {
      fail("The line holds binary data.");
      return false;
    }
    return true;
  }

  // Reads the line after the current one for a step that needs it; a sheet
  // start is never taken: it is held back for the main loop.
  bool readAhead(std::string_view& line) {
    if (!nextLine(line)) return false;
    if (IsSheetStart(line)) {
      held_ = line;
      heldBack_ = true;
      return false;
    }
    return true;
  }

  bool fail(const std::string& rule) {
    failed_ = true;
    ui_.message("Invalid NGS Data Sheet '" + path_ + "'.\r\nError on line " +
                    std::to_string(lineNumber_) + ".\r\n" + rule,
                Icon::Exclamation, Buttons::Ok, kInvalidTitle);
    return false;
  }

  // An empty field leaves the value absent.
  bool number(std::string_view text, double& value, const char* what) {
    if (text.empty()) return true;
    std::optional<double> parsed = ToNumber(text);
    if (!parsed) return fail(std::string(what) + " must be numeric.");
    value = *parsed;
    return true;
  }

  bool angle(std::string_view text, double& value, const char* what) {
    try {
      value = Angles_TextToRadians(ui_, text, kFormatDMS);
    } catch (const ZvError&) {
      return fail(std::string(what) + " must be numeric.");
    }
    return true;
  }

  bool examine(std::string_view input) {
    // Steps that read ahead move the reader's buffer: work on a copy.
    current_.assign(input);
    std::string_view line = current_;
    if (IsSheetStart(line)) startSheet(line);
    if (inSheet_ && Col(line, 22) == '-') keyword(line);
    if (Col(line, 8) == '*') {
      if (Col(line, 22) == '-') {
        if (!horizontal(Trim(Cols(line, 10, 21)), Cols(line, 24, 38), Cols(line, 40, 40),
                        Cols(line, 45, 60), Cols(line, 62, 62), From(line, 69)))
          return false;
      } else if (Col(line, 26) == '-') {
        if (!horizontal(Trim(Cols(line, 10, 25)), Cols(line, 28, 42), Cols(line, 44, 44),
                        Cols(line, 46, 61), Cols(line, 63, 63), From(line, 69)))
          return false;
      }
    }
    if (Cols(line, 10, 21) == "ELLIP HEIGHT") {
      if (!number(Trim(Cols(line, 24, 38)), point_.EllipsoidHeight, "Ellipsoid Height"))
        return false;
      std::string_view source = Trim(From(line, 69));
      if (source != "ADJUSTED")
        AppendTagged(point_.ExtraLines, "CM:ELLIPSOID HEIGHT SOURCE = ", source);
    }
    if (Cols(line, 10, 76) == kAccuracyHeading) return accuracy();
    return !failed_;
  }

  void startSheet(std::string_view line) {
    if (counter_ >= 0) points_.push_back(std::move(point_));
    ResetPoint(point_);
    point_.GridMissing = true;
    point_.HorizontalUnits = kFormatDMS;
    point_.VerticalUnits = kMeters;
    ++counter_;
    AppendTagged(point_.ExtraLines, "CM:", From(line, 38));
    inSheet_ = true;
  }

  void keyword(std::string_view line) {
    std::string_view key = Trim(Cols(line, 10, 21));
    if (key == "CORS_ID") {
      AppendTagged(point_.DescriptionLines, "PD:CORS_ID = ", Trim(From(line, 25)));
      point_.NorthingError = point_.EastingError = point_.ElevationError = 0.0001f;
    } else if (key == "DESIGNATION") {
      AppendTagged(point_.DescriptionLines, "NM:", Trim(From(line, 25)));
    } else if (key == "PID") {
      point_.PointName = Trim(From(line, 25));
    } else {
      AppendTagged(point_.ExtraLines, "CM:", Trim(From(line, 23)));
    }
  }

  bool horizontal(std::string_view label, std::string_view latitude, std::string_view latHemisphere,
                  std::string_view longitude, std::string_view lonHemisphere,
                  std::string_view source) {
    // Lines before the first sheet only fill the point that the first sheet
    // start replaces; they neither set nor question the file's datum.
    if (counter_ >= 0) {
      // A file whose earlier sheets had no position takes the first datum
      // it meets rather than reporting a conflict with nothing.
      if (counter_ == 0 || header_.HorizontalDatum.empty()) header_.HorizontalDatum = label;
      if (label != header_.HorizontalDatum) {
        if (!conflictAccepted_) {
          Answer answer = ui_.message(
              "A Horizontal Datum conflict exists in the file.  Point '" + point_.PointName +
                  "' does not match the Horizontal Datum of previous points in the file.  Click "
                  "'OK' to import using the previous points horizontal datum or click 'Cancel' "
                  "to stop the import.",
              Icon::None, Buttons::OkCancel, "Horizontal Datum Conflict");
          if (answer != Answer::Ok) {
            failed_ = true;
            return false;
          }
          conflictAccepted_ = true;
        }
        // Every point whose datum differs keeps its own label, the first one too.
        AppendTagged(point_.ExtraLines, "CM:HORIZONTAL DATUM = ", label);
      }
    }
    if (!angle(Trim(latitude), point_.Latitude, "Latitude")) return false;
    if (!angle(Trim(longitude), point_.Longitude, "Longitude")) return false;
    point_.LatitudeHemisphere = Trim(latHemisphere);
    point_.LongitudeHemisphere = Trim(lonHemisphere);
    source = Trim(source);
    if (source != "ADJUSTED")
      AppendTagged(point_.ExtraLines, "CM:HORIZONTAL POSITION SOURCE = ", source);

    std::string_view line;
    if (!readAhead(line)) return !failed_;
    return vertical(line);
  }

  bool vertical(std::string_view line) {
    std::string_view label = Trim(Cols(line, 10, 21));
    std::string_view height = Trim(Cols(line, 24, 38));
    std::string_view source = Trim(From(line, 69));
    bool adjusted = source == "ADJUSTED";
    if (adjusted) {
      if (counter_ >= 0 && header_.VerticalDatum.empty()) header_.VerticalDatum = label;
    } else if (header_.VerticalDatum.empty()) {
      return true;  // no vertical datum known yet: the height is left out
    }
    if (!number(height, point_.Elevation, "Orthometric Height")) return false;
    if (!adjusted) AppendTagged(point_.ExtraLines, "CM:ORTHOMETRIC HEIGHT SOURCE = ", source);
    // A height in another datum than the file's keeps its label.
    if (label != header_.VerticalDatum && !header_.VerticalDatum.empty())
      AppendTagged(point_.ExtraLines, "CM:VERTICAL DATUM = ", label);
    return true;
  }

  bool accuracy() {
    std::string_view line;
    for (int i = 0; i < 3; ++i) {
      if (!readAhead(line)) return !failed_;
    }
    double north = kNoValue, east = kNoValue, ellipsoid = kNoValue;
    if (!number(Trim(Cols(line, 57, 62)), north, "North Accuracy Estimate") ||
        !number(Trim(Cols(line, 64, 69)), east, "East Accuracy Estimate") ||
        !number(Trim(Cols(line, 71, 76)), ellipsoid, "Ellipsoid Accuracy Estimate"))
      return false;
    if (north != kNoValue) point_.NorthingError = static_cast<float>(north / kAccuracyDivisor);
    if (east != kNoValue) point_.EastingError = static_cast<float>(east / kAccuracyDivisor);
    if (ellipsoid != kNoValue)
      point_.ElevationError = static_cast<float>(ellipsoid / kAccuracyDivisor);
    if (Cols(line, 10, 14) == "LOCAL")
      AppendTagged(point_.ExtraLines, "CM:LOCAL ERROR ESTIMATES", "");
    return true;
  }

  Ui& ui_;
  std::istream& in_;
  LineReader reader_;
  const std::string& path_;
  size_t lineNumber_ = 0;
  std::string current_;
  std::string_view held_;
  bool heldBack_ = false;
  bool failed_ = false;

  FileHeader header_;
  std::vector<SurveyPoint> points_;
  SurveyPoint point_;
  long counter_ = -1;
  bool inSheet_ = false;
  bool conflictAccepted_ = false;
};

}  // namespace

bool ReadNgsDataSheetStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path) {
  NgsReader reader(ui, in, path);
  return reader.read(work);
}

bool ReadNgsDataSheet(Ui& ui, WorkArea& work, const std::string& path) {
  if (!FileExists(path)) {
    ui.message("The file '" + path + "' does not exist.", Icon::Exclamation, Buttons::Ok,
               "File Does Not Exist");
    return false;
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) {
    ui.message("The file '" + path + "' could not be opened.", Icon::Exclamation, Buttons::Ok,
               kInvalidTitle);
    return false;
  }
  if (RefuseUtf16(ui, path)) return false;
  return ReadNgsDataSheetStream(ui, work, in, path);
}

}  // namespace zv
