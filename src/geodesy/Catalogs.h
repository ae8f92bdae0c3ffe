#pragma once
// The coordinate-system catalogs of the application folder: zones.ini,
// datums.ini and ellipsoids.ini (profile files), the lists the dialogs offer
// from them, and the resolution of a zone entry into projection parameters.
// Every call reads the files afresh. Failures throw ZvError; the caller shows
// its description and source.

#include <string>
#include <utility>
#include <vector>

#include "platform/Ui.h"

namespace zv {

// appFolder + "/zones.ini", "/datums.ini", "/ellipsoids.ini".
std::string ZonesPath(const std::string& appFolder);
std::string DatumsPath(const std::string& appFolder);
std::string EllipsoidsPath(const std::string& appFolder);

// The projection names of the "Projection" key.
inline constexpr const char* kTransverseMercator = "Transverse Mercator";
inline constexpr const char* kLambertOneParallel = "Lambert Conformal Conic - One Parallel";
inline constexpr const char* kTransverseMercatorNad27 = "Transverse Mercator - NAD 27 Equations";
inline constexpr const char* kLambertTwoParallels = "Lambert Conformal Conic - Two Parallels";
inline constexpr const char* kLambertNad27 = "Lambert Conformal Conic - NAD 27 Equations";
inline constexpr const char* kObliqueMercator = "Oblique Mercator - Hotine";
// The six names in the order the zone editor offers them.
std::vector<std::string> ProjectionNames();

// The distinct coordinate-system names of zones.ini (text before the first
// "~" of each section name, trimmed), in file order. A section name without
// "~" throws ZvError(1, "Error loading coordinate systems.",
// "modMisc.LOAD_CS_ComboBoxList").
std::vector<std::string> LOAD_CS_ComboBoxList(const std::string& appFolder);

// The zone short names of one coordinate system, in file order, whose
// "Show In" (input side) or "Show Out" flag is 1 (missing counts as 1).
// A section name without "~" throws ZvError(1, "Error loading zones.",
// "modMisc.LOAD_Zones_ComboBoxList"); a flag that is not a number throws
// ZvError 13.
std::vector<std::string> LOAD_Zones_ComboBoxList(const std::string& appFolder, bool inputSide,
                                                 const std::string& coordinateSystem);

// The datums of datums.ini offered in a horizontal or vertical datum list
// (a vertical list starts with "None"). A missing or non-numeric "Show In" /
// "Show Out" throws ZvError 13 "Type mismatch".
std::vector<std::string> LoadDatumList(const std::string& appFolder, bool inputSide,
                                       bool horizontalList, bool geographic,
                                       bool threeDimensionalOnly);

// The section names of ellipsoids.ini whose "Show" is 1, in file order.
// A missing or non-numeric "Show" throws ZvError 13 "Type mismatch".
std::vector<std::string> LoadEllipsoidList(const std::string& appFolder);

struct ZoneDatumsAndUnits {
  std::string horizontalDatum;
  std::string verticalDatum;
  std::string linearUnits;
};
// Empty texts when the zone or a key is missing.
ZoneDatumsAndUnits ReadZoneDatumsAndUnits(const std::string& appFolder,
                                          const std::string& coordinateSystem,
                                          const std::string& zone);

// The zones.ini section of a coordinate system and zone: the section whose
// name, split at the first "~" and trimmed, matches both (letter case aside).
// Empty when there is none.
std::string FindZoneSection(const std::string& appFolder, const std::string& coordinateSystem,
                            const std::string& zone);

// "NAD 1927" (1927), "NAD 1983" (1983), "HPGN 1984" ... "HPGN 2025" (the year).
std::vector<std::pair<std::string, int>> LoadDatumYearList();

// The lines of directory + "/Pintrel/zones.txt" that are not comments ("#")
// or blank, each with the number its first four characters start with.
// A missing file throws ZvError(53, "File not found", "modMisc.LoadToolZoneList").
std::vector<std::pair<std::string, int>> LoadToolZoneList(const std::string& directory);

// Projection parameters of one zone, ready for the projection routines.
struct ZoneParameters {
  std::string projection;
  double a, e;  // semimajor axis (metres) and first eccentricity
  // Radians, north-positive latitude, west-positive longitude.
  double phi0, lambda0;
  // Metres, or U.S. survey feet for the two NAD 27 forms.
  double falseNorthing, falseEasting;
  // Radians (k0 a ratio); kNoValue when the projection has no such key.
  double k0, phiN, phiS, azimuth;
  std::string linearUnits, horizontalDatum, verticalDatum, ellipsoid, fullName;
};

// Reads the zone's entry, its ellipsoid ("Computational Ellipsoid", or else
// the "Ellipsoid" of its horizontal datum) and converts angles, directions
// and false origins. Angles that break the limits show their "Invalid Angle"
// message through the UI. Anything missing or unusable throws ZvError(1,
// <what is wrong>, "modMisc.ResolveZone").
ZoneParameters ResolveZone(Ui& ui, const std::string& appFolder,
                           const std::string& coordinateSystem, const std::string& zone);

}  // namespace zv
