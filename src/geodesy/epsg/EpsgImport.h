#pragma once
// Zones imported from the EPSG registry through PROJ's database: the
// projected systems matching a code or a few words of a name, and a zone
// record filled from one of them. Only Transverse Mercator, Lambert (one and
// two parallels) and Hotine oblique Mercator (variant A) are offered.

#include <cstddef>
#include <string>
#include <vector>

#include "geodesy/CatalogStore.h"

namespace zv {

struct EpsgCandidate {
  std::string code;  // "2288"
  std::string name;  // "NAD83 / Wisconsin Central (ftUS)"
  // Empty when the system can be imported, else why not (an unsupported
  // projection, unit, prime meridian or parameter set). Datum and ellipsoid
  // are checked by ZoneFromEpsg, against the catalogs.
  std::string refusal;
};

struct EpsgSearch {
  // Empty when the search ran; else why it could not (no PROJ database).
  std::string error;
  std::vector<EpsgCandidate> candidates;
};

// Projected systems whose code equals `query`, or whose name holds every
// word of it (letter case aside; deprecated systems only by code); at most
// `limit` of them, by name.
EpsgSearch SearchEpsg(const std::string& query, std::size_t limit = 200);

struct EpsgZone {
  std::string error;      // empty on success
  ZoneRecord zone;        // coordinate system and zone left to the caller
  std::string datumNote;  // what the datum and ellipsoid were matched to, for the user
};

// The zone record of an EPSG projected system: projection, origin, parallels
// or scale, azimuth, false origin in the system's unit, datum, ellipsoid and
// units; the name and "(EPSG:<code>)" in "Full Name". The datum is matched
// against the horizontal datums of the application folder's datums.ini, the
// ellipsoid against ellipsoids.ini.
EpsgZone ZoneFromEpsg(const std::string& code, const std::string& appFolder);

}  // namespace zv
