#pragma once
// Helpers shared by the survey format tests.

#include <iomanip>
#include <sstream>
#include <string>
#include <vector>

#include "geodesy/Angles.h"
#include "survey/NgsDataSheet.h"
#include "survey/SrvFile.h"
#include "survey/SurveyFiles.h"
#include "survey/SurveyModel.h"
#include "survey/WsiFile.h"

namespace zv::test {

inline std::string Fixture(const std::string& name) {
  return std::string(ZV_FIXTURES) + "/" + name;
}

// An angle given in degrees, minutes and seconds, in radians.
inline double Dms(double degrees, double minutes, double seconds) {
  return (degrees + minutes / 60 + seconds / 3600) * kDegreesToRadians;
}

// The lines of a text written with CR LF line ends (none may be empty).
inline std::vector<std::string> SplitCrLf(const std::string& text) {
  std::vector<std::string> lines;
  size_t start = 0;
  while (start < text.size()) {
    size_t end = text.find("\r\n", start);
    if (end == std::string::npos) end = text.size();
    lines.push_back(text.substr(start, end - start));
    start = end + 2;
  }
  return lines;
}

// The version line of the tagged formats, without its tag.
inline std::string Version() {
  return "VORN Zurevazidu " + std::to_string(kVersionMajor) + "." + std::to_string(kVersionMinor) +
         "." + std::to_string(kVersionRevision);
}

using FileFn = bool (*)(Ui&, WorkArea&, const std::string&);
struct Format {
  const char* name;
  const char* folder;  // of its fixtures
  FileFn read;
  FileFn write;
};
inline const Format kCtl{"CTL", "control/", ReadControlFile, WriteControlFile};
inline const Format kPac{"PAC", "pac/", ReadPointsChainsFile, WritePointsChainsFile};
inline const Format kPrj{"PRJ", "project/", ReadProjectFile, WriteProjectFile};
inline const Format kWsi{"WSI", "wsi/", ReadWsiFile, WriteWsiFile};
inline const Format kSrv{"SRV", "srv/", ReadSrvFile, WriteSrvFile};
inline const Format kNgs{"DS", "ngs/", ReadNgsDataSheet, nullptr};
inline const Format* const kWriters[] = {&kCtl, &kPac, &kPrj, &kWsi, &kSrv};

inline SurveyPoint Point(const std::string& name, double n, double e, double z,
                         const std::string& unit = kMeters) {
  SurveyPoint p;
  p.PointName = name;
  p.Northing = n;
  p.Easting = e;
  p.Elevation = z;
  p.HorizontalUnits = p.VerticalUnits = unit;
  return p;
}

// The input side in short, a line per record: the fields that are set, CR LF
// shown as '|'. The header comes first when `header` is set.
inline std::string Describe(const WorkArea& work, bool header = true) {
  std::ostringstream s;
  s.precision(10);
  auto text = [&](std::vector<std::string> keysAndValues) {
    for (size_t i = 0; i < keysAndValues.size(); i += 2) {
      std::string& v = keysAndValues[i + 1];
      for (size_t at; (at = v.find("\r\n")) != std::string::npos;) v.replace(at, 2, 1, '|');
      if (!v.empty()) s << " " << keysAndValues[i] << "=" << v;
    }
  };
  auto num = [&](double v, double scale = 1) -> std::ostream& {
    return v == kNoValue ? (s << "-") : (s << v / scale);
  };
  auto units = [&](const std::string& h, const std::string& v) {
    if (!h.empty() || !v.empty()) s << " u=" << h << "/" << v;
  };
  if (header) {
    const FileHeader& h = work.InputHeader;
    s << "H";
    text({"pr", h.ProjectLine, "hx", h.HeaderExtraLines, "cs", h.CoordinateSystem, "zn", h.Zone,
          "hd", h.HorizontalDatum, "vd", h.VerticalDatum});
    units(h.HorizontalUnits, h.VerticalUnits);
    s << "\n";
  }
  for (const SurveyPoint& p : work.InputPoints) {
    s << p.PointName << " ";
    num(p.Northing) << ",";
    num(p.Easting) << ",";
    num(p.Elevation);
    if (p.HorizontalIsControl) s << " hc";
    if (p.ElevationIsControl) s << " ec";
    if (p.Latitude != kNoValue || p.Longitude != kNoValue) {
      s << " ll=";
      num(p.Latitude, kDegreesToRadians) << "/";
      num(p.Longitude, kDegreesToRadians);
    }
    if (p.LatitudeHemisphere + p.LongitudeHemisphere != "NW")
      s << " hem=" << p.LatitudeHemisphere << p.LongitudeHemisphere;
    if (p.EllipsoidHeight != kNoValue) s << " eh=" << p.EllipsoidHeight;
    if (p.NorthingError != kNoValueF || p.EastingError != kNoValueF ||
        p.ElevationError != kNoValueF)
      s << std::setprecision(6) << " s=" << p.NorthingError << "/" << p.EastingError << "/"
        << p.ElevationError << std::setprecision(10);
    if (p.GridMissing) s << " grid-missing";
    if (p.ScaleFactor != kNoValue) s << " sf=" << p.ScaleFactor;
    if (p.Convergence != kNoValue) s << " ca=" << p.Convergence / kDegreesToRadians;
    text({"rc", p.RecordCode, "gm", p.Geometry == "P" ? "" : p.Geometry, "cl", p.CodeLetter, "ia",
          p.IntegerAttribute, "fe", p.FeatureCode, "gr", p.GRText});
    units(p.HorizontalUnits, p.VerticalUnits);
    text({"pd", p.DescriptionLines, "x", p.ExtraLines});
    s << "\n";
  }
  for (const SurveyChain& c : work.InputChains) {
    s << "chain";
    text({"n",  c.ChainName, "cl", c.CodeLetter,     "ia", c.IntegerAttribute,
          "st", c.Station,   "fe", c.FeatureCode,    "cd", c.Description,
          "fg", c.FGText,    "pl", c.PointListLines, "ch", c.ChainLines,
          "x",  c.ExtraLines});
    s << (c.Open ? "\n" : " closed\n");
  }
  return s.str();
}

}  // namespace zv::test
