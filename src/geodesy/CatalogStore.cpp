#include "geodesy/CatalogStore.h"

#include <algorithm>

#include "geodesy/Angles.h"
#include "geodesy/Catalogs.h"
#include "platform/Error.h"
#include "platform/Numbers.h"
#include "platform/Strings.h"

namespace zv {

namespace {

// The two parts of a zone section name; nullopt without "~".
std::optional<std::pair<std::string, std::string>> SplitZoneSection(std::string_view section) {
  size_t tilde = section.find('~');
  if (tilde == std::string_view::npos) return std::nullopt;
  return std::make_pair(std::string(Trim(section.substr(0, tilde))),
                        std::string(Trim(section.substr(tilde + 1))));
}

std::string ZoneSectionName(const std::string& coordinateSystem, const std::string& zone) {
  return coordinateSystem + "~" + zone;
}

bool IsValidZoneName(const std::string& part) {
  return !Trim(part).empty() && part.find('~') == std::string::npos &&
         part.find_first_of("]\r\n") == std::string::npos;
}

bool ContainsNoCase(const std::vector<std::string>& names, std::string_view name) {
  return std::any_of(names.begin(), names.end(),
                     [&](const std::string& n) { return EqualsNoCase(n, name); });
}

std::string FindZone(const ProfileDocument& doc, const std::string& coordinateSystem,
                     const std::string& zone) {
  for (const std::string& name : doc.sectionNames()) {
    auto parts = SplitZoneSection(name);
    if (parts && EqualsNoCase(parts->first, Trim(coordinateSystem)) &&
        EqualsNoCase(parts->second, Trim(zone))) {
      return name;
    }
  }
  return {};
}

ZoneRecord ReadZone(const ProfileDocument& doc, const std::string& section) {
  ZoneRecord z;
  if (auto parts = SplitZoneSection(section)) {
    std::tie(z.coordinateSystem, z.zone) = *parts;
  } else {
    z.coordinateSystem = section;
  }
  auto text = [&](const char* key) { return doc.value(section, key, ""); };
  z.fullName = text("Full Name");
  z.horizontalDatum = text("Horizontal Datum");
  z.computationalEllipsoid = text("Computational Ellipsoid");
  z.verticalDatum = text("Vertical Datum");
  z.projection = text("Projection");
  z.showIn.text = doc.value(section, "Show In", "1");
  z.showOut.text = doc.value(section, "Show Out", "1");
  z.centralLatitude.text = text("Central Latitude");
  z.centralLongitude.text = text("Central Longitude");
  z.falseNorthing.text = text("False Northing");
  z.falseEasting.text = text("False Easting");
  z.scaleFactor.text = text("Scale Factor");
  z.northernParallel.text = text("Northern Parallel");
  z.southernParallel.text = text("Southern Parallel");
  z.azimuth.text = text("Azimuth");
  z.latitudeDirection = text("Positive Latitude Direction");
  z.longitudeDirection = text("Positive Longitude Direction");
  z.linearUnits = text("Linear Units");
  return z;
}

ProfileKeys ZoneKeys(const ZoneRecord& z) {
  ProfileKeys keys = {{"Full Name", z.fullName},
                      {"Horizontal Datum", z.horizontalDatum},
                      {"Computational Ellipsoid", z.computationalEllipsoid},
                      {"Vertical Datum", z.verticalDatum},
                      {"Projection", z.projection},
                      {"Show In", z.showIn.text},
                      {"Show Out", z.showOut.text},
                      {"Central Latitude", z.centralLatitude.text},
                      {"Central Longitude", z.centralLongitude.text},
                      {"False Northing", z.falseNorthing.text},
                      {"False Easting", z.falseEasting.text}};
  // A known projection writes its own keys; an unknown one what it has.
  const bool known = IsKnownProjection(z.projection);
  auto own = [&](bool uses, const char* key, const std::string& text) {
    if (known ? uses : !text.empty()) keys.emplace_back(key, text);
  };
  own(ProjectionUsesScaleFactor(z.projection), "Scale Factor", z.scaleFactor.text);
  own(ProjectionUsesParallels(z.projection), "Northern Parallel", z.northernParallel.text);
  own(ProjectionUsesParallels(z.projection), "Southern Parallel", z.southernParallel.text);
  own(ProjectionUsesAzimuth(z.projection), "Azimuth", z.azimuth.text);
  keys.emplace_back("Positive Latitude Direction", z.latitudeDirection);
  keys.emplace_back("Positive Longitude Direction", z.longitudeDirection);
  keys.emplace_back("Linear Units", z.linearUnits);
  return keys;
}

const std::vector<std::string> kDatumKeys = {"Full Name", "Type", "Ellipsoid", "Show In",
                                             "Show Out"};

DatumRecord ReadDatum(const ProfileDocument& doc, const std::string& name,
                      const std::vector<std::string>& catalog) {
  DatumRecord d;
  d.name = name;
  d.fullName = doc.value(name, "Full Name", "");
  d.type = doc.value(name, "Type", "");
  d.ellipsoid = doc.value(name, "Ellipsoid", "");
  d.showIn.text = doc.value(name, "Show In", "");
  d.showOut.text = doc.value(name, "Show Out", "");
  for (auto& [key, method] : doc.keys(name)) {
    if (method.empty() || EqualsNoCase(key, name) || !ContainsNoCase(catalog, key)) continue;
    if (!d.method(key).empty()) continue;  // the first of a repeated key
    d.transformations.emplace_back(std::move(key), std::move(method));
  }
  return d;
}

EllipsoidRecord ReadEllipsoid(const ProfileDocument& doc, const std::string& name) {
  EllipsoidRecord e;
  e.name = name;
  e.fullName = doc.value(name, "Full Name", "");
  e.semimajorAxis.text = doc.value(name, "Semimajor Axis", "");
  e.semiminorAxis.text = doc.value(name, "Semiminor Axis", "");
  e.flattening.text = doc.value(name, "Flattening", "");
  e.eccentricity.text = doc.value(name, "Eccentricity", "");
  e.show.text = doc.value(name, "Show", "");
  return e;
}

}  // namespace

std::optional<double> CatalogNumber::value() const {
  return ToNumber(text);
}

CatalogNumber CatalogNumber::Of(double value) {
  return {FormatPlainDecimal(value)};
}

std::optional<double> CatalogAngle::radians(Ui& ui) const {
  double r = kNoValue;
  try {
    r = Angles_PackedToRadians(ui, text);
  } catch (const ZvError&) {
    return std::nullopt;
  }
  if (r == kNoValue) return std::nullopt;
  return r;
}

CatalogAngle CatalogAngle::Of(Ui& ui, double radians) {
  return {Angles_RadiansToPacked(ui, radians, 5)};
}

std::optional<bool> CatalogFlag::isOne() const {
  std::optional<double> v = ToNumber(text);
  if (!v) return std::nullopt;
  return *v == 1;
}

bool ProjectionUsesScaleFactor(std::string_view p) {
  return p == kTransverseMercator || p == kLambertOneParallel || p == kTransverseMercatorNad27 ||
         p == kObliqueMercator;
}

bool ProjectionUsesParallels(std::string_view p) {
  return p == kLambertTwoParallels || p == kLambertNad27;
}

bool ProjectionUsesAzimuth(std::string_view p) {
  return p == kObliqueMercator;
}

bool IsKnownProjection(std::string_view p) {
  return ProjectionUsesScaleFactor(p) || ProjectionUsesParallels(p);
}

std::string DatumRecord::method(std::string_view target) const {
  for (const auto& [datum, name] : transformations) {
    if (EqualsNoCase(datum, target)) return name;
  }
  return {};
}

std::vector<std::string> CatalogFile::sections() const {
  return read().sectionNames();
}

bool CatalogFile::write(const ProfileDocument& doc) const {
  error_.clear();
  return doc.save(path_, &error_);
}

bool CatalogFile::renameSection(const std::string& from, const std::string& to) const {
  ProfileDocument doc = read();
  return doc.renameSection(from, to) && write(doc);
}

bool CatalogFile::removeSection(const std::string& section) const {
  ProfileDocument doc = read();
  return doc.removeSection(section) && write(doc);
}

ZoneStore ZoneStore::In(const std::string& appFolder) {
  return ZoneStore(ZonesPath(appFolder));
}

std::vector<std::string> ZoneStore::coordinateSystems() const {
  std::vector<std::string> list;
  for (const std::string& name : sections()) {
    auto parts = SplitZoneSection(name);
    if (!parts) {
      throw ZvError(1, "Error loading coordinate systems.", "modMisc.LOAD_CS_ComboBoxList");
    }
    if (std::find(list.begin(), list.end(), parts->first) == list.end()) {
      list.push_back(parts->first);
    }
  }
  return list;
}

std::vector<std::string> ZoneStore::zones(const std::string& coordinateSystem,
                                          ZoneSide side) const {
  static constexpr const char* kSource = "modMisc.LOAD_Zones_ComboBoxList";
  const ProfileDocument doc = read();
  std::vector<std::string> list;
  for (const std::string& name : doc.sectionNames()) {
    auto parts = SplitZoneSection(name);
    if (!parts) throw ZvError(1, "Error loading zones.", kSource);
    if (parts->first != coordinateSystem) continue;
    if (side != ZoneSide::Any) {
      const CatalogFlag flag{
          doc.value(name, side == ZoneSide::Input ? "Show In" : "Show Out", "1")};
      std::optional<bool> shown = flag.isOne();
      if (!shown) throw ZvError(13, "Type mismatch", kSource);
      if (!*shown) continue;
    }
    list.push_back(parts->second);
  }
  return list;
}

std::string ZoneStore::findSection(const std::string& coordinateSystem,
                                   const std::string& zone) const {
  return FindZone(read(), coordinateSystem, zone);
}

std::optional<ZoneRecord> ZoneStore::load(const std::string& coordinateSystem,
                                          const std::string& zone, std::string* section) const {
  const ProfileDocument doc = read();
  std::string name = FindZone(doc, coordinateSystem, zone);
  if (section) *section = name;
  if (name.empty()) return std::nullopt;
  return ReadZone(doc, name);
}

std::optional<ZoneRecord> ZoneStore::loadSection(const std::string& section) const {
  const ProfileDocument doc = read();
  if (!doc.has(section)) return std::nullopt;
  return ReadZone(doc, section);
}

std::vector<std::pair<std::string, ZoneRecord>> ZoneStore::loadAll() const {
  const ProfileDocument doc = read();
  std::vector<std::pair<std::string, ZoneRecord>> all;
  for (const std::string& name : doc.sectionNames()) all.emplace_back(name, ReadZone(doc, name));
  return all;
}

bool ZoneStore::save(const ZoneRecord& zone) const {
  if (!IsValidZoneName(zone.coordinateSystem) || !IsValidZoneName(zone.zone)) return false;
  ProfileDocument doc = read();
  std::string section = FindZone(doc, zone.coordinateSystem, zone.zone);
  if (section.empty()) section = ZoneSectionName(zone.coordinateSystem, zone.zone);
  if (!IsValidSectionName(section)) return false;
  doc.writeSection(section, ZoneKeys(zone), {std::begin(kZoneKeys), std::end(kZoneKeys)});
  return write(doc);
}

bool ZoneStore::rename(const std::string& coordinateSystem, const std::string& zone,
                       const std::string& newCoordinateSystem, const std::string& newZone) const {
  if (!IsValidZoneName(newCoordinateSystem) || !IsValidZoneName(newZone)) return false;
  ProfileDocument doc = read();
  const std::string section = FindZone(doc, coordinateSystem, zone);
  if (section.empty()) return false;
  const std::string taken = FindZone(doc, newCoordinateSystem, newZone);
  if (!taken.empty() && !EqualsNoCase(taken, section)) return false;
  return doc.renameSection(section, ZoneSectionName(newCoordinateSystem, newZone)) && write(doc);
}

bool ZoneStore::remove(const std::string& coordinateSystem, const std::string& zone) const {
  ProfileDocument doc = read();
  const std::string section = FindZone(doc, coordinateSystem, zone);
  return !section.empty() && doc.removeSection(section) && write(doc);
}

DatumStore DatumStore::In(const std::string& appFolder) {
  return DatumStore(DatumsPath(appFolder));
}

std::optional<DatumRecord> DatumStore::load(const std::string& name) const {
  const ProfileDocument doc = read();
  if (!doc.has(name)) return std::nullopt;
  return ReadDatum(doc, doc.spelling(name), doc.sectionNames());
}

std::vector<DatumRecord> DatumStore::loadAll() const {
  const ProfileDocument doc = read();
  const std::vector<std::string> names = doc.sectionNames();
  std::vector<DatumRecord> all;
  for (const std::string& name : names) all.push_back(ReadDatum(doc, name, names));
  return all;
}

std::string DatumStore::method(const std::string& from, const std::string& to) const {
  return read().value(from, to, "");
}

bool DatumStore::save(const DatumRecord& d) const {
  if (!IsValidSectionName(d.name)) return false;
  ProfileDocument doc = read();
  ProfileKeys keys = {{"Full Name", d.fullName}, {"Type", d.type}};
  if (d.type != "Vertical") keys.emplace_back("Ellipsoid", d.ellipsoid);
  keys.emplace_back("Show In", d.showIn.text);
  keys.emplace_back("Show Out", d.showOut.text);
  // Rows removed from the record lose their keys; empty ones stay as they are.
  std::vector<std::string> managed = kDatumKeys;
  for (const std::string& other : doc.sectionNames()) {
    if (!EqualsNoCase(other, d.name) && !doc.value(d.name, other, "").empty()) {
      managed.push_back(other);
    }
  }
  for (const auto& [target, method] : d.transformations) {
    keys.emplace_back(target, method);
    managed.push_back(target);
  }
  doc.writeSection(d.name, keys, managed);
  return write(doc);
}

bool DatumStore::rename(const std::string& name, const std::string& newName) const {
  return renameSection(name, newName);
}

bool DatumStore::remove(const std::string& name) const {
  return removeSection(name);
}

EllipsoidStore EllipsoidStore::In(const std::string& appFolder) {
  return EllipsoidStore(EllipsoidsPath(appFolder));
}

std::optional<EllipsoidRecord> EllipsoidStore::load(const std::string& name) const {
  const ProfileDocument doc = read();
  if (!doc.has(name)) return std::nullopt;
  return ReadEllipsoid(doc, doc.spelling(name));
}

std::vector<EllipsoidRecord> EllipsoidStore::loadAll() const {
  const ProfileDocument doc = read();
  std::vector<EllipsoidRecord> all;
  for (const std::string& name : doc.sectionNames()) all.push_back(ReadEllipsoid(doc, name));
  return all;
}

bool EllipsoidStore::save(const EllipsoidRecord& e) const {
  if (!IsValidSectionName(e.name)) return false;
  ProfileDocument doc = read();
  doc.writeSection(
      e.name,
      {{"Full Name", e.fullName},
       {"Semimajor Axis", e.semimajorAxis.text},
       {"Semiminor Axis", e.semiminorAxis.text},
       {"Flattening", e.flattening.text},
       {"Eccentricity", e.eccentricity.text},
       {"Show", e.show.text}},
      {"Full Name", "Semimajor Axis", "Semiminor Axis", "Flattening", "Eccentricity", "Show"});
  return write(doc);
}

bool EllipsoidStore::rename(const std::string& name, const std::string& newName) const {
  return renameSection(name, newName);
}

bool EllipsoidStore::remove(const std::string& name) const {
  return removeSection(name);
}

}  // namespace zv
