#pragma once
// The catalog store: zones.ini, datums.ini and ellipsoids.ini as typed
// records. Every operation reads its file once; a save, rename or delete
// writes it once through a temporary file renamed into place, keeping every
// other section, key, comment, blank line and line end byte for byte.
// Numbers and angles keep the text the file holds, so a record that is
// loaded and saved unchanged leaves the file as it was.

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/ProfileDocument.h"
#include "platform/Ui.h"

namespace zv {

// A number as stored.
struct CatalogNumber {
  std::string text;
  // nullopt when the text is not a number.
  std::optional<double> value() const;
  // Plain decimal text without exponent.
  static CatalogNumber Of(double value);
  bool operator==(const CatalogNumber&) const = default;
};

// An angle as stored, in "DDD.MMSSssss" form.
struct CatalogAngle {
  std::string text;
  // Radians; nullopt when the text is no valid angle (an angle that breaks
  // the limits shows its "Invalid Angle" message through the UI first).
  std::optional<double> radians(Ui& ui) const;
  // The storage form: 5 decimals of seconds.
  static CatalogAngle Of(Ui& ui, double radians);
  bool operator==(const CatalogAngle&) const = default;
};

// A list flag ("Show", "Show In", "Show Out") as stored.
struct CatalogFlag {
  std::string text;
  // True when the text reads as the number 1; nullopt when it is no number.
  std::optional<bool> isOne() const;
  static CatalogFlag Of(bool on) { return {on ? "1" : "0"}; }
  bool operator==(const CatalogFlag&) const = default;
};

// One section of zones.ini, named coordinateSystem + "~" + zone. A load
// gives missing keys as empty texts, except the two flags ("1").
struct ZoneRecord {
  std::string coordinateSystem;
  std::string zone;
  std::string fullName;
  std::string horizontalDatum;
  std::string computationalEllipsoid;  // empty: the horizontal datum's ellipsoid
  std::string verticalDatum;
  std::string projection;
  CatalogFlag showIn{"1"};
  CatalogFlag showOut{"1"};
  CatalogAngle centralLatitude;
  CatalogAngle centralLongitude;  // positive in longitudeDirection
  CatalogNumber falseNorthing;    // in linearUnits
  CatalogNumber falseEasting;
  CatalogNumber scaleFactor;      // TM, one-parallel Lambert, oblique Mercator
  CatalogAngle northernParallel;  // two-parallel and NAD 27 Lambert
  CatalogAngle southernParallel;
  CatalogAngle azimuth;            // oblique Mercator
  std::string latitudeDirection;   // "N" or "S"
  std::string longitudeDirection;  // "E" or "W"
  std::string linearUnits;
  bool operator==(const ZoneRecord&) const = default;
};

// The keys of a zone section in the order they are written.
inline constexpr const char* kZoneKeys[] = {"Full Name",
                                            "Horizontal Datum",
                                            "Computational Ellipsoid",
                                            "Vertical Datum",
                                            "Projection",
                                            "Show In",
                                            "Show Out",
                                            "Central Latitude",
                                            "Central Longitude",
                                            "False Northing",
                                            "False Easting",
                                            "Scale Factor",
                                            "Northern Parallel",
                                            "Southern Parallel",
                                            "Azimuth",
                                            "Positive Latitude Direction",
                                            "Positive Longitude Direction",
                                            "Linear Units"};

// The projection's own keys: which of "Scale Factor", "Northern Parallel",
// "Southern Parallel" and "Azimuth" it uses. An unknown projection name uses
// none (a save then writes those that are not empty).
bool ProjectionUsesScaleFactor(std::string_view projection);
bool ProjectionUsesParallels(std::string_view projection);
bool ProjectionUsesAzimuth(std::string_view projection);
bool IsKnownProjection(std::string_view projection);

// One section of datums.ini. Missing keys load as empty texts.
struct DatumRecord {
  std::string name;
  std::string fullName;
  std::string type;       // "Horizontal", "Vertical" or "3D"
  std::string ellipsoid;  // not written for "Vertical"
  CatalogFlag showIn;
  CatalogFlag showOut;
  // Target datum and method: the keys named after another datum of the
  // catalog, with a value, in file order.
  ProfileKeys transformations;
  // The method to a target datum (letter case aside); empty when none.
  std::string method(std::string_view target) const;
  bool operator==(const DatumRecord&) const = default;
};

// One section of ellipsoids.ini. Missing keys load as empty texts.
struct EllipsoidRecord {
  std::string name;
  std::string fullName;
  CatalogNumber semimajorAxis;
  CatalogNumber semiminorAxis;
  CatalogNumber flattening;  // f itself, not 1/f
  CatalogNumber eccentricity;
  CatalogFlag show;
  bool operator==(const EllipsoidRecord&) const = default;
};

// What the stores share: the file and its section-level operations.
class CatalogFile {
 public:
  explicit CatalogFile(std::string path) : path_(std::move(path)) {}
  const std::string& path() const { return path_; }
  // Section names in file order; a missing file has none.
  std::vector<std::string> sections() const;
  // The reason of the last failed write ("" after success).
  const std::string& error() const { return error_; }

 protected:
  ProfileDocument read() const { return ProfileDocument::Load(path_); }
  bool write(const ProfileDocument& doc) const;
  bool renameSection(const std::string& from, const std::string& to) const;
  bool removeSection(const std::string& section) const;

 private:
  std::string path_;
  mutable std::string error_;
};

enum class ZoneSide { Any, Input, Output };

class ZoneStore : public CatalogFile {
 public:
  using CatalogFile::CatalogFile;
  static ZoneStore In(const std::string& appFolder);

  // The distinct coordinate systems (text before the first "~", trimmed),
  // in file order. A section name without "~" throws ZvError(1, "Error
  // loading coordinate systems.", "modMisc.LOAD_CS_ComboBoxList").
  std::vector<std::string> coordinateSystems() const;
  // The zone short names (text after the first "~", trimmed) of a coordinate
  // system (compared exactly), in file order; for a side only those whose
  // "Show In" / "Show Out" reads as 1. A section name without "~" throws
  // ZvError(1, "Error loading zones.", "modMisc.LOAD_Zones_ComboBoxList"), a
  // flag that is no number ZvError(13, "Type mismatch", the same source).
  std::vector<std::string> zones(const std::string& coordinateSystem,
                                 ZoneSide side = ZoneSide::Any) const;
  // The section of a coordinate system and zone: both parts trimmed and
  // compared without regard to letter case. Empty when there is none.
  std::string findSection(const std::string& coordinateSystem, const std::string& zone) const;

  // The zone found as findSection does; `section` receives its name.
  std::optional<ZoneRecord> load(const std::string& coordinateSystem, const std::string& zone,
                                 std::string* section = nullptr) const;
  // The record of a section by its name (a name without "~" is all
  // coordinate system).
  std::optional<ZoneRecord> loadSection(const std::string& section) const;
  // Every section with its record, in file order.
  std::vector<std::pair<std::string, ZoneRecord>> loadAll() const;

  // Writes the record into its section (found as findSection does), or
  // appends a new one. False when a name is empty or holds "~", "]" or a
  // line break, or when the file cannot be written.
  bool save(const ZoneRecord& zone) const;
  // False when the zone is missing, the new names are invalid or name
  // another zone.
  bool rename(const std::string& coordinateSystem, const std::string& zone,
              const std::string& newCoordinateSystem, const std::string& newZone) const;
  // False when the zone is missing or the file cannot be written.
  bool remove(const std::string& coordinateSystem, const std::string& zone) const;
};

class DatumStore : public CatalogFile {
 public:
  using CatalogFile::CatalogFile;
  static DatumStore In(const std::string& appFolder);

  std::optional<DatumRecord> load(const std::string& name) const;
  std::vector<DatumRecord> loadAll() const;
  // The method from one datum to another: the key named `to` in section
  // `from`, whether or not `to` is in the catalog. Empty when none.
  std::string method(const std::string& from, const std::string& to) const;
  // False for an invalid name or when the file cannot be written. The keys
  // named after other datums of the catalog are the transformations: those
  // not in the record are removed.
  bool save(const DatumRecord& datum) const;
  bool rename(const std::string& name, const std::string& newName) const;
  bool remove(const std::string& name) const;
};

class EllipsoidStore : public CatalogFile {
 public:
  using CatalogFile::CatalogFile;
  static EllipsoidStore In(const std::string& appFolder);

  std::optional<EllipsoidRecord> load(const std::string& name) const;
  std::vector<EllipsoidRecord> loadAll() const;
  bool save(const EllipsoidRecord& ellipsoid) const;
  bool rename(const std::string& name, const std::string& newName) const;
  bool remove(const std::string& name) const;
};

}  // namespace zv
