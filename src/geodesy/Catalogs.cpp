#include "geodesy/Catalogs.h"

#include <algorithm>
#include <cctype>

#include "geodesy/Angles.h"
#include "geodesy/CatalogStore.h"
#include "platform/Error.h"
#include "platform/Numbers.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

// A list flag ("Show", "Show In", "Show Out") read as a number.
bool FlagIsOne(const CatalogFlag& flag, const char* source) {
  std::optional<bool> one = flag.isOne();
  if (!one) throw ZvError(13, "Type mismatch", source);
  return *one;
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
  return ZoneStore::In(appFolder).coordinateSystems();
}

std::vector<std::string> LOAD_Zones_ComboBoxList(const std::string& appFolder, bool inputSide,
                                                 const std::string& coordinateSystem) {
  return ZoneStore::In(appFolder).zones(coordinateSystem,
                                        inputSide ? ZoneSide::Input : ZoneSide::Output);
}

std::vector<std::string> LoadDatumList(const std::string& appFolder, bool inputSide,
                                       bool horizontalList, bool geographic,
                                       bool threeDimensionalOnly) {
  std::vector<std::string> list;
  for (const DatumRecord& d : DatumStore::In(appFolder).loadAll()) {
    if (!FlagIsOne(inputSide ? d.showIn : d.showOut, "modMisc.LoadDatumList")) continue;
    bool add;
    if (horizontalList) {
      add = geographic ? d.type != "Vertical" : d.type == "Horizontal";
    } else if (!geographic) {
      add = d.type == "Vertical";
    } else {
      add = threeDimensionalOnly ? d.type == "3D" : d.type != "Horizontal";
    }
    if (add) list.push_back(d.name);
  }
  if (!horizontalList) list.insert(list.begin(), "None");
  return list;
}

std::vector<std::string> LoadEllipsoidList(const std::string& appFolder) {
  std::vector<std::string> list;
  for (const EllipsoidRecord& e : EllipsoidStore::In(appFolder).loadAll()) {
    if (FlagIsOne(e.show, "modEllipsoids.LoadEllipsoidList")) list.push_back(e.name);
  }
  return list;
}

std::string FindZoneSection(const std::string& appFolder, const std::string& coordinateSystem,
                            const std::string& zone) {
  return ZoneStore::In(appFolder).findSection(coordinateSystem, zone);
}

ZoneDatumsAndUnits ReadZoneDatumsAndUnits(const std::string& appFolder,
                                          const std::string& coordinateSystem,
                                          const std::string& zone) {
  ZoneDatumsAndUnits out;
  if (auto z = ZoneStore::In(appFolder).load(coordinateSystem, zone)) {
    out.horizontalDatum = z->horizontalDatum;
    out.verticalDatum = z->verticalDatum;
    out.linearUnits = z->linearUnits;
  }
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

// The checks of one zone record, naming the section in their messages.
class ZoneReader {
 public:
  ZoneReader(Ui& ui, std::string section) : ui_(ui), section_(std::move(section)) {}

  const std::string& required(const char* key, const std::string& value) const {
    if (value.empty()) ZoneError("Zone '" + section_ + "' has no " + key + ".");
    return value;
  }

  double number(const char* key, const CatalogNumber& n) const {
    required(key, n.text);
    std::optional<double> v = n.value();
    if (!v) ZoneError("Zone '" + section_ + "': the " + key + " '" + n.text + "' is not a number.");
    return *v;
  }

  // A packed "DDD.MMSSssss" angle in radians, in the zone's own direction.
  double angle(const char* key, const CatalogAngle& a) const {
    required(key, a.text);
    std::optional<double> r = a.radians(ui_);
    if (!r)
      ZoneError("Zone '" + section_ + "': the " + key + " '" + a.text + "' is not a valid angle.");
    return *r;
  }

 private:
  Ui& ui_;
  std::string section_;
};

bool IsNad27Form(const std::string& p) {
  return p == kTransverseMercatorNad27 || p == kLambertNad27;
}

}  // namespace

ZoneParameters ResolveZone(Ui& ui, const std::string& appFolder,
                           const std::string& coordinateSystem, const std::string& zone) {
  std::string section;
  const std::optional<ZoneRecord> record =
      ZoneStore::In(appFolder).load(coordinateSystem, zone, &section);
  if (!record) {
    ZoneError("Zone '" + zone + "' of coordinate system '" + coordinateSystem +
              "' was not found in zones.ini.");
  }
  const ZoneRecord& r = *record;
  const ZoneReader z(ui, section);
  ZoneParameters p;
  p.fullName = r.fullName;
  p.horizontalDatum = r.horizontalDatum;
  p.verticalDatum = r.verticalDatum;

  p.projection = r.projection;
  if (!IsKnownProjection(p.projection)) {
    ZoneError("Zone '" + section + "' has an unknown Projection '" + p.projection + "'.");
  }

  // The ellipsoid: the zone's own, or that of its horizontal datum.
  p.ellipsoid = r.computationalEllipsoid;
  if (p.ellipsoid.empty()) {
    if (p.horizontalDatum.empty()) ZoneError("Zone '" + section + "' has no Horizontal Datum.");
    const std::optional<DatumRecord> datum = DatumStore::In(appFolder).load(p.horizontalDatum);
    if (!datum) {
      ZoneError("The Horizontal Datum '" + p.horizontalDatum + "' of zone '" + section +
                "' was not found in datums.ini.");
    }
    p.ellipsoid = datum->ellipsoid;
    if (p.ellipsoid.empty()) {
      ZoneError("The Horizontal Datum '" + p.horizontalDatum + "' of zone '" + section +
                "' has no Ellipsoid.");
    }
  }
  const std::optional<EllipsoidRecord> ellipsoid = EllipsoidStore::In(appFolder).load(p.ellipsoid);
  if (!ellipsoid) {
    ZoneError("The ellipsoid '" + p.ellipsoid + "' of zone '" + section +
              "' was not found in ellipsoids.ini.");
  }
  auto ellipsoidValue = [&](const char* key, const CatalogNumber& n) {
    std::optional<double> v = n.value();
    if (!v) {
      ZoneError("The ellipsoid '" + p.ellipsoid + "' has no valid " + key + " ('" + n.text + "').");
    }
    return *v;
  };
  p.a = ellipsoidValue("Semimajor Axis", ellipsoid->semimajorAxis);
  p.e = ellipsoidValue("Eccentricity", ellipsoid->eccentricity);

  const std::string& latDir = r.latitudeDirection;
  const std::string& lonDir = r.longitudeDirection;
  if (latDir != "N" && latDir != "S") {
    ZoneError("Zone '" + section + "': the Positive Latitude Direction must be N or S.");
  }
  if (lonDir != "E" && lonDir != "W") {
    ZoneError("Zone '" + section + "': the Positive Longitude Direction must be E or W.");
  }
  auto latitude = [&](const char* key, const CatalogAngle& a) {
    return Angles_ConvertHemisphere(z.angle(key, a), latDir, "N");
  };
  p.phi0 = latitude("Central Latitude", r.centralLatitude);
  p.lambda0 =
      Angles_ConvertHemisphere(z.angle("Central Longitude", r.centralLongitude), lonDir, "W");

  p.linearUnits = r.linearUnits;
  if (Distances_Convert(1, p.linearUnits, kMeters) == kNoValue) {
    ZoneError("Zone '" + section + "' has unknown Linear Units '" + p.linearUnits + "'.");
  }
  const char* unit = IsNad27Form(p.projection) ? kUsSurveyFeet : kMeters;
  p.falseNorthing =
      Distances_Convert(z.number("False Northing", r.falseNorthing), p.linearUnits, unit);
  p.falseEasting =
      Distances_Convert(z.number("False Easting", r.falseEasting), p.linearUnits, unit);

  const bool parallels = ProjectionUsesParallels(p.projection);
  p.k0 =
      ProjectionUsesScaleFactor(p.projection) ? z.number("Scale Factor", r.scaleFactor) : kNoValue;
  p.phiN = parallels ? latitude("Northern Parallel", r.northernParallel) : kNoValue;
  p.phiS = parallels ? latitude("Southern Parallel", r.southernParallel) : kNoValue;
  p.azimuth = ProjectionUsesAzimuth(p.projection) ? z.angle("Azimuth", r.azimuth) : kNoValue;
  return p;
}

}  // namespace zv
