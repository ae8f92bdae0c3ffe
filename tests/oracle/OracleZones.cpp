#include "OracleZones.h"

#include <cmath>

namespace zv::oracle {

namespace {

constexpr double kGrs80A = 6378137.0;
const double kGrs80E = std::sqrt(2.0 / 298.257222101 - 1.0 / (298.257222101 * 298.257222101));
constexpr double kClarkeA = 6378206.4;
constexpr double kClarkeE = 0.08227185422300323;
constexpr double kUsFeetPerMeter = 3937.0 / 1200.0;

// Degrees and minutes to radians; longitudes given as degrees west.
double Dm(double degrees, double minutes = 0.0) {
  return (degrees + minutes / 60.0) * 3.14159265358979323846 / 180.0;
}

OracleZone Tm(std::string name, int epsg, bool nad27, double phi0, double lambda0West, double k0,
              double falseNorthing, double falseEasting) {
  OracleZone z;
  z.name = std::move(name);
  z.epsg = epsg;
  ZoneParameters& d = z.definition;
  d.projection = nad27 ? kTransverseMercatorNad27 : kTransverseMercator;
  d.a = nad27 ? kClarkeA : kGrs80A;
  d.e = nad27 ? kClarkeE : kGrs80E;
  d.phi0 = phi0;
  d.lambda0 = lambda0West;
  d.k0 = k0;
  d.falseNorthing = falseNorthing;
  d.falseEasting = falseEasting;
  return z;
}

OracleZone Lcc(std::string name, int epsg, bool nad27, double phiS, double phiN, double phiB,
               double lambda0West, double falseNorthing, double falseEasting) {
  OracleZone z;
  z.name = std::move(name);
  z.epsg = epsg;
  ZoneParameters& d = z.definition;
  d.projection = nad27 ? kLambertNad27 : kLambertTwoParallels;
  d.a = nad27 ? kClarkeA : kGrs80A;
  d.e = nad27 ? kClarkeE : kGrs80E;
  d.phiS = phiS;
  d.phiN = phiN;
  d.phi0 = phiB;
  d.lambda0 = lambda0West;
  d.falseNorthing = falseNorthing;
  d.falseEasting = falseEasting;
  return z;
}

OracleZone WithExtent(OracleZone z, double west, double south, double east, double north) {
  z.hasExtent = true;
  z.west = west;
  z.south = south;
  z.east = east;
  z.north = north;
  return z;
}

OracleZone Alaska1(bool nad27) {
  OracleZone z;
  z.name = nad27 ? "NAD 27 Alaska zone 1" : "NAD 83 Alaska zone 1";
  z.epsg = nad27 ? 26731 : 26931;
  ZoneParameters& d = z.definition;
  d.projection = kObliqueMercator;
  d.a = nad27 ? kClarkeA : kGrs80A;
  d.e = nad27 ? kClarkeE : kGrs80E;
  d.phi0 = Dm(57);
  d.lambda0 = Dm(133, 40);
  d.k0 = 0.9999;
  d.azimuth = 2.0 * 3.14159265358979323846 + std::atan(-3.0 / 4.0);
  d.falseNorthing = -5000000.0;
  d.falseEasting = 5000000.0;
  return z;
}

}  // namespace

std::vector<OracleZone> RepresentativeZones() {
  std::vector<OracleZone> zones;
  // Transverse Mercator (meters).
  zones.push_back(Tm("NAD 83 UTM 14", 26914, false, 0, Dm(99), 0.9996, 0, 500000));
  zones.push_back(
      Tm("NAD 83 New Mexico Central", 32113, false, Dm(31), Dm(106, 15), 0.9999, 0, 500000));
  zones.push_back(
      Tm("NAD 83 Florida East", 26958, false, Dm(24, 20), Dm(81), 0.999941177, 0, 200000));
  // Transverse Mercator, NAD 27 equations (feet).
  zones.push_back(
      Tm("NAD 27 New Mexico Central", 32013, true, Dm(31), Dm(106, 15), 0.9999, 0, 500000));
  zones.push_back(
      Tm("NAD 27 Illinois East", 26771, true, Dm(36, 40), Dm(88, 20), 0.999975, 0, 500000));
  zones.push_back(Tm("NAD 27 UTM 14 (NAD 27 equations)", 26714, true, 0, Dm(99), 0.9996, 0,
                     500000 * kUsFeetPerMeter));
  // Alaska zones 2 to 9 (NAD 27).
  for (int zone = 2; zone <= 9; ++zone) {
    zones.push_back(Tm("NAD 27 Alaska zone " + std::to_string(zone), 26730 + zone, true, Dm(54),
                       Dm(142 + 4 * (zone - 2)), 0.9999, 0,
                       zone == 7   ? 700000
                       : zone == 9 ? 600000
                                   : 500000));
  }
  // Lambert, two parallels (meters).
  zones.push_back(Lcc("NAD 83 North Dakota North", 32120, false, Dm(47, 26), Dm(48, 44), Dm(47),
                      Dm(100, 30), 0, 600000));
  zones.push_back(Lcc("NAD 83 Texas South Central", 32140, false, Dm(28, 23), Dm(30, 17),
                      Dm(27, 50), Dm(99), 4000000, 600000));
  zones.push_back(Lcc("NAD 83 Alaska zone 10", 26940, false, Dm(51, 50), Dm(53, 50), Dm(51),
                      Dm(176), 0, 1000000));
  // Lambert, NAD 27 equations (feet).
  zones.push_back(Lcc("NAD 27 Texas South Central", 32040, true, Dm(28, 23), Dm(30, 17), Dm(27, 50),
                      Dm(99), 0, 2000000));
  zones.push_back(Lcc("NAD 27 California VII", 26799, true, Dm(33, 52), Dm(34, 25), Dm(34, 8),
                      Dm(118, 20), 4160926.74, 4186692.58));
  zones.push_back(Lcc("NAD 27 Alaska zone 10", 26740, true, Dm(51, 50), Dm(53, 50), Dm(51), Dm(176),
                      0, 3000000));
  // Lambert, one parallel (no EPSG zone: a made-up zone 6 degrees tall).
  OracleZone one;
  one.name = "One parallel 40 N";
  one.definition.projection = kLambertOneParallel;
  one.definition.a = kGrs80A;
  one.definition.e = kGrs80E;
  one.definition.phi0 = Dm(40);
  one.definition.lambda0 = Dm(100);
  one.definition.k0 = 0.9999;
  one.definition.falseNorthing = 100000;
  one.definition.falseEasting = 500000;
  zones.push_back(WithExtent(one, -104, 37, -96, 43));
  // Oblique Mercator.
  zones.push_back(Alaska1(false));
  zones.push_back(Alaska1(true));
  return zones;
}

}  // namespace zv::oracle
