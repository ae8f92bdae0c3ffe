#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <map>

#include "geodesy/Angles.h"
#include "geodesy/Catalogs.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/Error.h"
#include "platform/Profile.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::Ini;
using test::TempDir;
using V = std::vector<std::string>;

ZvError Thrown(const std::function<void()>& fn) {
  try {
    fn();
  } catch (const ZvError& e) {
    return e;
  }
  return ZvError(0, "", "");
}

double Deg(double d, double m = 0, double s = 0) {
  return (d + m / 60 + s / 3600) * kDegreesToRadians;
}

// A small application folder with the three catalogs.
class CatalogFolder : public ::testing::Test {
 protected:
  void SetUp() override {
    dir.write("ellipsoids.ini",
              Ini("[Clarke 1866]|Semimajor Axis=6378206.4|Eccentricity=0.08227185422300377|Show=1|"
                  "[GRS 80]|Semimajor Axis=6378137|Eccentricity=0.08181919104281517|Show=1|"
                  "[Hidden]|Show=0"));
    dir.write("datums.ini",
              Ini("[NAD 27]|Type=Horizontal|Ellipsoid=Clarke 1866|Show In=1|Show Out=1|"
                  "[NAD 83]|Type=Horizontal|Ellipsoid=GRS 80|Show In=1|Show Out=0|"
                  "[NGVD 29]|Type=Vertical|Show In=1|Show Out=1|"
                  "[NAVD 88]|Type=Vertical|Show In=1|Show Out=1|"
                  "[NAD 83 3D]|Type=3D|Ellipsoid=GRS 80|Show In=1|Show Out=1"));
    dir.write(
        "zones.ini",
        Ini("[State Plane 1983~North]|Full Name=North Zone|Horizontal Datum=NAD 83|"
            "Computational Ellipsoid=|Vertical Datum=NAVD 88|Projection=Transverse Mercator|"
            "Show In=1|Show Out=0|Central Latitude=36.400000000|"
            "Central Longitude=88.200000000|False Northing=0|False Easting=250000|"
            "Scale Factor=0.99996|Positive Latitude Direction=N|"
            "Positive Longitude Direction=W|Linear Units=U.S. Survey Feet|"
            "[State Plane 1983 ~South]|Horizontal Datum=NAD 27|Computational Ellipsoid=GRS 80|"
            "Projection=Lambert Conformal Conic - Two Parallels|Central Latitude=-27.500000000|"
            "Central Longitude=99.000000000|False Northing=1000|False Easting=2000|"
            "Northern Parallel=-30.170000000|Southern Parallel=-28.230000000|"
            "Positive Latitude Direction=S|Positive Longitude Direction=E|"
            "Linear Units=International Feet|"
            "[Old System~Texas]|Horizontal Datum=NAD 27|"
            "Projection=Lambert Conformal Conic - NAD 27 Equations|"
            "Central Latitude=27.500000000|Central Longitude=99.000000000|False Northing=0|"
            "False Easting=600000|Northern Parallel=30.170000000|"
            "Southern Parallel=28.230000000|Positive Latitude Direction=N|"
            "Positive Longitude Direction=W|Linear Units=Meters"));
  }

  TempDir dir;
  ScriptedUi ui;
};

TEST_F(CatalogFolder, ListsFollowTheShowFlagsAndKinds) {
  EXPECT_EQ(LOAD_CS_ComboBoxList(dir.path()), (V{"State Plane 1983", "Old System"}));
  EXPECT_EQ(LOAD_Zones_ComboBoxList(dir.path(), true, "State Plane 1983"), (V{"North", "South"}));
  EXPECT_EQ(LOAD_Zones_ComboBoxList(dir.path(), false, "State Plane 1983"), V{"South"});
  EXPECT_TRUE(LOAD_Zones_ComboBoxList(dir.path(), true, "state plane 1983").empty());
  EXPECT_EQ(LoadDatumList(dir.path(), true, true, false, false), (V{"NAD 27", "NAD 83"}));
  EXPECT_EQ(LoadDatumList(dir.path(), false, true, false, false), V{"NAD 27"});
  EXPECT_EQ(LoadDatumList(dir.path(), true, true, true, false),
            (V{"NAD 27", "NAD 83", "NAD 83 3D"}));
  EXPECT_EQ(LoadDatumList(dir.path(), true, false, true, true), (V{"None", "NAD 83 3D"}));
  EXPECT_EQ(LoadDatumList(dir.path(), true, false, true, false),
            (V{"None", "NGVD 29", "NAVD 88", "NAD 83 3D"}));
  EXPECT_EQ(LoadEllipsoidList(dir.path()), (V{"Clarke 1866", "GRS 80"}));
  TempDir empty;
  EXPECT_TRUE(LOAD_CS_ComboBoxList(empty.path()).empty());
  EXPECT_TRUE(LoadDatumList(empty.path(), true, true, false, false).empty());
  EXPECT_EQ(LoadDatumList(empty.path(), true, false, false, false), V{"None"});
}

TEST_F(CatalogFolder, BrokenCatalogsStopTheLists) {
  WriteProfileValue(dir.file("zones.ini"), "Broken", "Projection", "Transverse Mercator");
  const auto text = [](const ZvError& e) {
    return std::to_string(e.number()) + " " + e.source() + ": " + e.description();
  };
  EXPECT_EQ(text(Thrown([&] { LOAD_CS_ComboBoxList(dir.path()); })),
            "1 modMisc.LOAD_CS_ComboBoxList: Error loading coordinate systems.");
  EXPECT_EQ(text(Thrown([&] { LOAD_Zones_ComboBoxList(dir.path(), true, "Old System"); })),
            "1 modMisc.LOAD_Zones_ComboBoxList: Error loading zones.");

  for (const char* flag : {"yes", ""}) {
    WriteProfileValue(dir.file("datums.ini"), "NGVD 29", "Show Out", flag);
    EXPECT_EQ(Thrown([&] { LoadDatumList(dir.path(), false, false, false, false); }).number(), 13);
  }
  WriteProfileValue(dir.file("ellipsoids.ini"), "Extra", "Full Name", "no Show key");
  EXPECT_EQ(Thrown([&] { LoadEllipsoidList(dir.path()); }).number(), 13);
}

TEST(CatalogValues, ReadLikeTheProfileFunctions) {
  // Odd spacing, letter case, repeated sections and keys, "=" in a value.
  TempDir dir;
  dir.write("zones.ini",
            CrLf({"; comment", "Linear Units=stray", "[ sp~z ]", "  horizontal DATUM  = A=B ",
                  "Horizontal Datum=second", "Vertical Datum=", "\tLinear Units\t=\tM", "[SP~Z]",
                  "Vertical Datum=later section", "[SP ~Y]", "Linear Units=F"}));
  const ZoneDatumsAndUnits z = ReadZoneDatumsAndUnits(dir.path(), "SP", "z");
  EXPECT_EQ(z.horizontalDatum + "|" + z.verticalDatum + "|" + z.linearUnits, "A=B||M");
  EXPECT_EQ(ReadZoneDatumsAndUnits(dir.path(), "SP", "Y").linearUnits, "F");  // names trimmed
  EXPECT_EQ(ReadZoneDatumsAndUnits(dir.path(), "SP", "X").linearUnits, "");
}

TEST_F(CatalogFolder, ResolvesDirectionsUnitsAndEllipsoids) {
  ZoneParameters p = ResolveZone(ui, dir.path(), "State Plane 1983", "North");
  // The datum's ellipsoid.
  EXPECT_EQ(p.projection + "|" + p.ellipsoid + "|" + p.fullName + "|" + p.verticalDatum + "|" +
                p.linearUnits,
            "Transverse Mercator|GRS 80|North Zone|NAVD 88|U.S. Survey Feet");
  EXPECT_TRUE(p.a == 6378137 && p.e == 0.08181919104281517 && p.k0 == 0.99996);
  EXPECT_NEAR(p.phi0, Deg(36, 40), 1e-14);
  EXPECT_NEAR(p.lambda0, Deg(88, 20), 1e-14);
  EXPECT_NEAR(p.falseEasting, 250000 * 0.3048006096012192, 1e-9);  // metres
  EXPECT_TRUE(p.phiN == kNoValue && p.azimuth == kNoValue);

  p = ResolveZone(ui, dir.path(), "State Plane 1983", "South");
  EXPECT_EQ(p.ellipsoid, "GRS 80");  // overrides NAD 27's Clarke 1866
  // South-positive -27 50 is 27 50 north; east-positive 99 is 261 west.
  EXPECT_NEAR(p.phi0, Deg(27, 50), 1e-14);
  EXPECT_NEAR(p.lambda0, kFullCircle - Deg(99), 1e-14);
  EXPECT_NEAR(p.phiN, Deg(30, 17), 1e-14);
  EXPECT_NEAR(p.phiS, Deg(28, 23), 1e-14);
  EXPECT_DOUBLE_EQ(p.falseNorthing, 304.8);
  EXPECT_DOUBLE_EQ(p.falseEasting, 609.6);
  EXPECT_EQ(p.k0, kNoValue);

  // The NAD 27 forms keep false origins in U.S. survey feet.
  p = ResolveZone(ui, dir.path(), "Old System", "Texas");
  EXPECT_EQ(p.ellipsoid, "Clarke 1866");
  EXPECT_DOUBLE_EQ(p.falseEasting, 600000 * 3.2808333333333333);
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(CatalogFolder, ResolveErrorsNameWhatIsWrong) {
  const auto description = [&](const std::string& cs, const std::string& zone) {
    const ZvError e = Thrown([&] { ResolveZone(ui, dir.path(), cs, zone); });
    EXPECT_EQ(e.source(), "modMisc.ResolveZone");
    return e.description();
  };
  EXPECT_EQ(description("State Plane 1983", "East"),
            "Zone 'East' of coordinate system 'State Plane 1983' was not found in zones.ini.");
  const std::string zone = "Zone 'Old System~Texas'";
  const struct {
    const char *key, *bad, *good;
    std::string message;
  } cases[] = {
      {"Computational Ellipsoid", "Bessel", "",
       "The ellipsoid 'Bessel' of zone 'Old System~Texas' was not found in ellipsoids.ini."},
      {"Horizontal Datum", "NAD 99", "NAD 27",
       "The Horizontal Datum 'NAD 99' of zone 'Old System~Texas' was not found in datums.ini."},
      {"Central Latitude", "27.6000", "27.3",
       zone + ": the Central Latitude '27.6000' is not a valid angle."},
      {"Central Latitude", "27.3x", "27.3",
       zone + ": the Central Latitude '27.3x' is not a valid angle."},
      {"Linear Units", "Yards", "M", zone + " has unknown Linear Units 'Yards'."},
      {"False Easting", "", "0", zone + " has no False Easting."},
      {"Positive Longitude Direction", "w", "W",
       zone + ": the Positive Longitude Direction must be E or W."},
      {"Projection", "Mercator", "Lambert Conformal Conic - NAD 27 Equations",
       zone + " has an unknown Projection 'Mercator'."},
  };
  for (const auto& c : cases) {
    WriteProfileValue(dir.file("zones.ini"), "Old System~Texas", c.key, c.bad);
    EXPECT_EQ(description("Old System", "Texas"), c.message);
    WriteProfileValue(dir.file("zones.ini"), "Old System~Texas", c.key, c.good);
  }
  // The angle's own message comes first.
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
}

TEST(CatalogLists, ToolZones) {
  TempDir dir;
  dir.write("Pintrel/zones.txt",
            CrLf({"# zone list", "4801 Wisconsin North", "", "0101 Alabama East", "#4802"}));
  EXPECT_EQ(LoadToolZoneList(dir.path()),
            (std::vector<std::pair<std::string, int>>{{"4801 Wisconsin North", 4801},
                                                      {"0101 Alabama East", 101}}));
  EXPECT_EQ(Thrown([] { LoadToolZoneList("/nonexistent-folder"); }).number(), 53);
}

// The catalogs shipped in the application folder; tests/oracle checks each
// zone's parameters and units against its EPSG definition.
TEST(ShippedCatalogs, EveryZoneResolvesAndTheCatalogsFitTogether) {
  const std::string app = std::string(ZV_SOURCE_DIR) + "/appdata";
  ScriptedUi ui;
  std::map<std::string, int> counts;
  for (const std::string& cs : LOAD_CS_ComboBoxList(app)) {
    const V zones = LOAD_Zones_ComboBoxList(app, true, cs);
    EXPECT_EQ(LOAD_Zones_ComboBoxList(app, false, cs), zones);
    for (const std::string& zone : zones) {
      ++counts[cs];
      SCOPED_TRACE(cs + "~" + zone);
      // Each zone's EPSG code, units and parameters: tests/oracle.
      const ZoneParameters p = ResolveZone(ui, app, cs, zone);
      if (p.projection.find("NAD 27") != std::string::npos) {
        EXPECT_EQ(p.horizontalDatum, "NAD 27");
        EXPECT_EQ(p.falseNorthing, 0);  // the NAD 27 equations add none
      }
      // Alaska zone 1: the exact azimuth atan(-3/4), not EPSG's rounded one.
      EXPECT_TRUE(p.azimuth == kNoValue ||
                  std::fabs(p.azimuth - kFullCircle - std::atan(-0.75)) < 1e-10);
    }
  }
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(counts, (std::map<std::string, int>{{"State Plane 1983", 124},
                                                {"State Plane 1927", 132},
                                                {"UTM NAD 83", 22},
                                                {"UTM NAD 27", 22}}));

  const std::string ellipsoidsPath = EllipsoidsPath(app);
  const V ellipsoids = LoadEllipsoidList(app);
  for (const std::string& name : ellipsoids) {
    SCOPED_TRACE(name);
    const auto value = [&](const char* key) {
      const std::string text = ReadProfileValue(ellipsoidsPath, name, key, "");
      EXPECT_EQ(text.find_first_of("eE"), std::string::npos) << key;
      return *ToNumber(text);
    };
    const double a = value("Semimajor Axis"), b = value("Semiminor Axis");
    const double f = value("Flattening"), e = value("Eccentricity");
    EXPECT_NEAR((a - b) / a, f, 1e-15);
    EXPECT_NEAR(std::sqrt(2 * f - f * f), e, 3e-15);
  }
  const V horizontal = LoadDatumList(app, true, true, false, false);
  EXPECT_GE(horizontal.size(), 51u);  // NAD 27, NAD 83 and the 49 HPGN areas
  for (const std::string& d : horizontal) {
    const std::string ellipsoid = ReadProfileValue(DatumsPath(app), d, "Ellipsoid", "");
    EXPECT_NE(std::find(ellipsoids.begin(), ellipsoids.end(), ellipsoid), ellipsoids.end()) << d;
  }
}

}  // namespace
}  // namespace zv
