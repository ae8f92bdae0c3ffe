#include "geodesy/Catalogs.h"

#include <algorithm>
#include <cctype>

#include "geodesy/Angles.h"
#include "platform/Error.h"
#include "platform/Numbers.h"
#include "platform/Profile.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

// A list flag ("Show", "Show In", "Show Out") read as a number.
bool FlagIsOne(const std::string& value, const char* source) {
  std::optional<double> v = ToNumber(value);
  if (!v) throw ZvError(13, "Type mismatch", source);
  return *v == 1;
}

constexpr const char* kResolveSource = "modMisc.ResolveZone";

[[noreturn]] void ZoneError(const std::string& description) {
  throw ZvError(1, description, kResolveSource);
}

}  // namespace

std::string ZonesPath(const std::string& appFolder) {
  return appFolder + "/zones.ini";
}
std::string DatumsPath(const std::string& appFolder) {
  return appFolder + "/datums.ini";
}
std::string EllipsoidsPath(const std::string& appFolder) {
  return appFolder + "/ellipsoids.ini";
}

std::vector<std::string> ProjectionNames() {
  return {kTransverseMercator,  kLambertOneParallel, kTransverseMercatorNad27,
          kLambertTwoParallels, kLambertNad27,       kObliqueMercator};
}

std::vector<std::string> LOAD_CS_ComboBoxList(const std::string& appFolder) {
  std::vector<std::string> list;
  for (const std::string& name : ReadProfileSections(ZonesPath(appFolder))) {
    size_t tilde = name.find('~');
    if (tilde == std::string::npos) {
      throw ZvError(1, "Error loading coordinate systems.", "modMisc.LOAD_CS_ComboBoxList");
    }
    std::string system(Trim(std::string_view(name).substr(0, tilde)));
    if (std::find(list.begin(), list.end(), system) == list.end()) list.push_back(system);
  }
  return list;
}

std::vector<std::string> LOAD_Zones_ComboBoxList(const std::string& appFolder, bool inputSide,
                                                 const std::string& coordinateSystem) {
  static constexpr const char* kSource = "modMisc.LOAD_Zones_ComboBoxList";
  const std::string path = ZonesPath(appFolder);
  const ProfileSnapshot zones(path);
  std::vector<std::string> list;
  for (const std::string& name : ReadProfileSections(path)) {
    size_t tilde = name.find('~');
    if (tilde == std::string::npos) throw ZvError(1, "Error loading zones.", kSource);
    if (Trim(std::string_view(name).substr(0, tilde)) != coordinateSystem) continue;
    std::string flag = zones.value(name, inputSide ? "Show In" : "Show Out", "1");
    if (FlagIsOne(flag, kSource)) list.emplace_back(Trim(std::string_view(name).substr(tilde + 1)));
  }
  return list;
}

std::vector<std::string> LoadDatumList(const std::string& appFolder, bool inputSide,
                                       bool horizontalList, bool geographic,
                                       bool threeDimensionalOnly) {
  static constexpr const char* kSource = "modMisc.LoadDatumList";
  const std::string path = DatumsPath(appFolder);
  const ProfileSnapshot datums(path);
  std::vector<std::string> list;
  for (const std::string& name : ReadProfileSections(path)) {
    std::string type = datums.value(name, "Type", "");
    std::string flag = datums.value(name, inputSide ? "Show In" : "Show Out", "");
    if (!FlagIsOne(flag, kSource)) continue;
    bool add;
    if (horizontalList) {
      add = geographic ? type != "Vertical" : type == "Horizontal";
    } else if (!geographic) {
      add = type == "Vertical";
    } else {
      add = threeDimensionalOnly ? type == "3D" : type != "Horizontal";
    }
    if (add) list.push_back(name);
  }
  if (!horizontalList) list.insert(list.begin(), "None");
  return list;
}

std::vector<std::string> LoadEllipsoidList(const std::string& appFolder) {
  const std::string path = EllipsoidsPath(appFolder);
  const ProfileSnapshot ellipsoids(path);
  std::vector<std::string> list;
  for (const std::string& name : ReadProfileSections(path)) {
    if (FlagIsOne(ellipsoids.value(name, "Show", ""), "modEllipsoids.LoadEllipsoidList")) {
      list.push_back(name);
    }
  }
  return list;
}

std::string FindZoneSection(const std::string& appFolder, const std::string& coordinateSystem,
                            const std::string& zone) {
  for (const std::string& name : ReadProfileSections(ZonesPath(appFolder))) {
    size_t tilde = name.find('~');
    if (tilde == std::string::npos) continue;
    std::string_view view(name);
    if (EqualsNoCase(Trim(view.substr(0, tilde)), Trim(coordinateSystem)) &&
        EqualsNoCase(Trim(view.substr(tilde + 1)), Trim(zone))) {
      return name;
    }
  }
  return {};
}

ZoneDatumsAndUnits ReadZoneDatumsAndUnits(const std::string& appFolder,
                                          const std::string& coordinateSystem,
                                          const std::string& zone) {
  ZoneDatumsAndUnits out;
  std::string section = FindZoneSection(appFolder, coordinateSystem, zone);
  if (section.empty()) return out;
  const ProfileSnapshot zones(ZonesPath(appFolder));
  out.horizontalDatum = zones.value(section, "Horizontal Datum", "");
  out.verticalDatum = zones.value(section, "Vertical Datum", "");
  out.linearUnits = zones.value(section, "Linear Units", "");
  return out;
}

std::vector<std::pair<std::string, int>> LoadDatumYearList() {
  std::vector<std::pair<std::string, int>> list = {{"NAD 1927", 1927}, {"NAD 1983", 1983}};
  for (int year = 1984; year <= 2025; ++year) {
    list.emplace_back("HPGN " + std::to_string(year), year);
  }
  return list;
}

std::vector<std::pair<std::string, int>> LoadToolZoneList(const std::string& directory) {
  std::vector<std::string> lines;
  if (!ReadTextLines(directory + "/Pintrel/zones.txt", lines)) {
    throw ZvError(53, "File not found", "modMisc.LoadToolZoneList");
  }
  std::vector<std::pair<std::string, int>> list;
  for (const std::string& line : lines) {
    if (line.empty() || line.front() == '#') continue;
    if (line.find_first_not_of(" \t") == std::string::npos) continue;
    // The number the first four characters start with (0 when none).
    std::string_view code = std::string_view(line).substr(0, 4);
    size_t i = code.find_first_not_of(' ');
    int value = 0;
    bool negative = false;
    if (i != std::string_view::npos && (code[i] == '-' || code[i] == '+')) {
      negative = code[i++] == '-';
    }
    for (; i < code.size() && code[i] >= '0' && code[i] <= '9'; ++i) {
      value = value * 10 + (code[i] - '0');
    }
    list.emplace_back(line, negative ? -value : value);
  }
  return list;
}

namespace {

class ZoneReader {
 public:
  ZoneReader(Ui& ui, const std::string& path, std::string section)
      : ui_(ui), zones_(path), section_(std::move(section)) {}

  std::string text(const char* key) const { return zones_.value(section_, key, ""); }

  std::string required(const char* key) const {
    std::string value = text(key);
    if (value.empty()) ZoneError("Zone '" + section_ + "' has no " + key + ".");
    return value;
  }

  double number(const char* key) const {
    std::string value = required(key);
    std::optional<double> v = ToNumber(value);
    if (!v) ZoneError("Zone '" + section_ + "': the " + key + " '" + value + "' is not a number.");
    return *v;
  }

  // A packed "DDD.MMSSssss" angle in radians, in the zone's own direction.
  double angle(const char* key) const {
    std::string value = required(key);
    double r = kNoValue;
    try {
      r = Angles_PackedToRadians(ui_, value);
    } catch (const ZvError&) {
      r = kNoValue;
    }
    if (r == kNoValue) {
      ZoneError("Zone '" + section_ + "': the " + key + " '" + value + "' is not a valid angle.");
    }
    return r;
  }

  const std::string& section() const { return section_; }

 private:
  Ui& ui_;
  ProfileSnapshot zones_;
  std::string section_;
};

bool UsesScaleFactor(const std::string& p) {
  return p == kTransverseMercator || p == kLambertOneParallel || p == kTransverseMercatorNad27 ||
         p == kObliqueMercator;
}

bool UsesParallels(const std::string& p) {
  return p == kLambertTwoParallels || p == kLambertNad27;
}

bool IsNad27Form(const std::string& p) {
  return p == kTransverseMercatorNad27 || p == kLambertNad27;
}

}  // namespace

ZoneParameters ResolveZone(Ui& ui, const std::string& appFolder,
                           const std::string& coordinateSystem, const std::string& zone) {
  std::string section = FindZoneSection(appFolder, coordinateSystem, zone);
  if (section.empty()) {
    ZoneError("Zone '" + zone + "' of coordinate system '" + coordinateSystem +
              "' was not found in zones.ini.");
  }
  ZoneReader z(ui, ZonesPath(appFolder), section);
  ZoneParameters p;
  p.fullName = z.text("Full Name");
  p.horizontalDatum = z.text("Horizontal Datum");
  p.verticalDatum = z.text("Vertical Datum");

  p.projection = z.text("Projection");
  std::vector<std::string> names = ProjectionNames();
  if (std::find(names.begin(), names.end(), p.projection) == names.end()) {
    ZoneError("Zone '" + section + "' has an unknown Projection '" + p.projection + "'.");
  }

  // The ellipsoid: the zone's own, or that of its horizontal datum.
  p.ellipsoid = z.text("Computational Ellipsoid");
  if (p.ellipsoid.empty()) {
    const ProfileSnapshot datums(DatumsPath(appFolder));
    if (p.horizontalDatum.empty()) ZoneError("Zone '" + section + "' has no Horizontal Datum.");
    if (!datums.has(p.horizontalDatum)) {
      ZoneError("The Horizontal Datum '" + p.horizontalDatum + "' of zone '" + section +
                "' was not found in datums.ini.");
    }
    p.ellipsoid = datums.value(p.horizontalDatum, "Ellipsoid", "");
    if (p.ellipsoid.empty()) {
      ZoneError("The Horizontal Datum '" + p.horizontalDatum + "' of zone '" + section +
                "' has no Ellipsoid.");
    }
  }
  const ProfileSnapshot ellipsoids(EllipsoidsPath(appFolder));
  if (!ellipsoids.has(p.ellipsoid)) {
    ZoneError("The ellipsoid '" + p.ellipsoid + "' of zone '" + section +
              "' was not found in ellipsoids.ini.");
  }
  auto ellipsoidValue = [&](const char* key) {
    std::string value = ellipsoids.value(p.ellipsoid, key, "");
    std::optional<double> v = ToNumber(value);
    if (!v) {
      ZoneError("The ellipsoid '" + p.ellipsoid + "' has no valid " + key + " ('" + value + "').");
    }
    return *v;
  };
  p.a = ellipsoidValue("Semimajor Axis");
  p.e = ellipsoidValue("Eccentricity");

  std::string latDir = z.text("Positive Latitude Direction");
  std::string lonDir = z.text("Positive Longitude Direction");
  if (latDir != "N" && latDir != "S") {
    ZoneError("Zone '" + section + "': the Positive Latitude Direction must be N or S.");
  }
  if (lonDir != "E" && lonDir != "W") {
    ZoneError("Zone '" + section + "': the Positive Longitude Direction must be E or W.");
  }
  auto latitude = [&](const char* key) {
    return Angles_ConvertHemisphere(z.angle(key), latDir, "N");
  };
  p.phi0 = latitude("Central Latitude");
  p.lambda0 = Angles_ConvertHemisphere(z.angle("Central Longitude"), lonDir, "W");

  p.linearUnits = z.text("Linear Units");
  if (Distances_Convert(1, p.linearUnits, kMeters) == kNoValue) {
    ZoneError("Zone '" + section + "' has unknown Linear Units '" + p.linearUnits + "'.");
  }
  const char* unit = IsNad27Form(p.projection) ? kUsSurveyFeet : kMeters;
  p.falseNorthing = Distances_Convert(z.number("False Northing"), p.linearUnits, unit);
  p.falseEasting = Distances_Convert(z.number("False Easting"), p.linearUnits, unit);

  p.k0 = UsesScaleFactor(p.projection) ? z.number("Scale Factor") : kNoValue;
  p.phiN = UsesParallels(p.projection) ? latitude("Northern Parallel") : kNoValue;
  p.phiS = UsesParallels(p.projection) ? latitude("Southern Parallel") : kNoValue;
  p.azimuth = p.projection == kObliqueMercator ? z.angle("Azimuth") : kNoValue;
  return p;
}

}  // namespace zv
