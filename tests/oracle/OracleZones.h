#pragma once
// Zones for the PROJ cross-check: the shipped catalog when it exists, and a
// built-in list of representative zones of every form.

#include <string>
#include <vector>

#include "geodesy/Projection.h"

namespace zv::oracle {

struct OracleZone {
  std::string name;
  ZoneParameters definition{};
  int epsg = 0;  // 0: none; its area of use gives the sample points
  // Sample extent in degrees (east-positive) when there is no EPSG area.
  bool hasExtent = false;
  double west = 0.0, south = 0.0, east = 0.0, north = 0.0;
};

std::vector<OracleZone> RepresentativeZones();

}  // namespace zv::oracle
