#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <map>

#include "geodesy/Angles.h"
#include "geodesy/Catalogs.h"
#include "platform/Error.h"
#include "platform/Profile.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::TempDir;

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
              CrLf({"[Clarke 1866]", "Full Name=Clarke 1866", "Semimajor Axis=6378206.4",
                    "Semiminor Axis=6356583.8", "Flattening=0.0033900753039287908",
                    "Eccentricity=0.08227185422300377", "Show=1", "[GRS 80]", "Full Name=GRS 80",
                    "Semimajor Axis=6378137", "Semiminor Axis=6356752.314140356",
                    "Flattening=0.003352810681182319", "Eccentricity=0.08181919104281517", "Show=1",
                    "[Hidden]", "Semimajor Axis=1", "Eccentricity=0", "Show=0"}));
    dir.write("datums.ini",
              CrLf({"[NAD 27]",         "Type=Horizontal", "Ellipsoid=Clarke 1866",
                    "Show In=1",        "Show Out=1",      "NAD 83=NADCON NAD 27 to NAD 83",
                    "[NAD 83]",         "Type=Horizontal", "Ellipsoid=GRS 80",
                    "Show In=1",        "Show Out=0",      "[NGVD 29]",
                    "Type=Vertical",    "Show In=1",       "Show Out=1",
                    "[NAVD 88]",        "Type=Vertical",   "Show In=1",
                    "Show Out=1",       "[NAD 83 3D]",     "Type=3D",
                    "Ellipsoid=GRS 80", "Show In=1",       "Show Out=1"}));
    dir.write("zones.ini", CrLf({"[State Plane 1983~North]",
                                 "Full Name=North Zone",
                                 "Horizontal Datum=NAD 83",
                                 "Computational Ellipsoid=",
                                 "Vertical Datum=NAVD 88",
                                 "Projection=Transverse Mercator",
                                 "Show In=1",
                                 "Show Out=0",
                                 "Central Latitude=36.400000000",
                                 "Central Longitude=88.200000000",
                                 "False Northing=0",
                                 "False Easting=250000",
                                 "Scale Factor=0.99996",
                                 "Positive Latitude Direction=N",
                                 "Positive Longitude Direction=W",
                                 "Linear Units=U.S. Survey Feet",
                                 "[State Plane 1983 ~South]",
                                 "Horizontal Datum=NAD 27",
                                 "Computational Ellipsoid=GRS 80",
                                 "Projection=Lambert Conformal Conic - Two Parallels",
                                 "Central Latitude=-27.500000000",
                                 "Central Longitude=99.000000000",
                                 "False Northing=1000",
                                 "False Easting=2000",
                                 "Northern Parallel=-30.170000000",
                                 "Southern Parallel=-28.230000000",
                                 "Positive Latitude Direction=S",
                                 "Positive Longitude Direction=E",
                                 "Linear Units=International Feet",
                                 "[Old System~Texas]",
                                 "Horizontal Datum=NAD 27",
                                 "Projection=Lambert Conformal Conic - NAD 27 Equations",
                                 "Central Latitude=27.500000000",
                                 "Central Longitude=99.000000000",
                                 "False Northing=0",
                                 "False Easting=600000",
                                 "Northern Parallel=30.170000000",
                                 "Southern Parallel=28.230000000",
                                 "Positive Latitude Direction=N",
                                 "Positive Longitude Direction=W",
                                 "Linear Units=Meters"}));
  }

  TempDir dir;
  ScriptedUi ui;
};

TEST_F(CatalogFolder, CoordinateSystemsAreTrimmedAndDistinct) {
  EXPECT_EQ(LOAD_CS_ComboBoxList(dir.path()),
            (std::vector<std::string>{"State Plane 1983", "Old System"}));
}

TEST_F(CatalogFolder, ZoneListsFollowTheShowFlags) {
  EXPECT_EQ(LOAD_Zones_ComboBoxList(dir.path(), true, "State Plane 1983"),
            (std::vector<std::string>{"North", "South"}));
  EXPECT_EQ(LOAD_Zones_ComboBoxList(dir.path(), false, "State Plane 1983"),
            (std::vector<std::string>{"South"}));
  EXPECT_TRUE(LOAD_Zones_ComboBoxList(dir.path(), true, "state plane 1983").empty());
}

TEST_F(CatalogFolder, SectionWithoutTildeStopsBothLists) {
  WriteProfileValue(dir.file("zones.ini"), "Broken", "Projection", "Transverse Mercator");
  ZvError e = Thrown([&] { LOAD_CS_ComboBoxList(dir.path()); });
  EXPECT_EQ(e.number(), 1);
  EXPECT_EQ(e.description(), "Error loading coordinate systems.");
  EXPECT_EQ(e.source(), "modMisc.LOAD_CS_ComboBoxList");
  e = Thrown([&] { LOAD_Zones_ComboBoxList(dir.path(), true, "Old System"); });
  EXPECT_EQ(e.description(), "Error loading zones.");
  EXPECT_EQ(e.source(), "modMisc.LOAD_Zones_ComboBoxList");
}

TEST_F(CatalogFolder, MissingCatalogsGiveEmptyLists) {
  TempDir empty;
  EXPECT_TRUE(LOAD_CS_ComboBoxList(empty.path()).empty());
  EXPECT_TRUE(LoadDatumList(empty.path(), true, true, false, false).empty());
  EXPECT_EQ(LoadDatumList(empty.path(), true, false, false, false),
            std::vector<std::string>{"None"});
}

TEST_F(CatalogFolder, DatumListsByKind) {
  using V = std::vector<std::string>;
  EXPECT_EQ(LoadDatumList(dir.path(), true, true, false, false), (V{"NAD 27", "NAD 83"}));
  EXPECT_EQ(LoadDatumList(dir.path(), false, true, false, false), (V{"NAD 27"}));
  EXPECT_EQ(LoadDatumList(dir.path(), true, true, true, false),
            (V{"NAD 27", "NAD 83", "NAD 83 3D"}));
  EXPECT_EQ(LoadDatumList(dir.path(), true, false, false, false),
            (V{"None", "NGVD 29", "NAVD 88"}));
  EXPECT_EQ(LoadDatumList(dir.path(), true, false, true, true), (V{"None", "NAD 83 3D"}));
  EXPECT_EQ(LoadDatumList(dir.path(), true, false, true, false),
            (V{"None", "NGVD 29", "NAVD 88", "NAD 83 3D"}));
}

TEST_F(CatalogFolder, BadShowFlagsAreTypeMismatches) {
  WriteProfileValue(dir.file("datums.ini"), "NGVD 29", "Show Out", "yes");
  EXPECT_EQ(Thrown([&] { LoadDatumList(dir.path(), false, false, false, false); }).number(), 13);
  WriteProfileValue(dir.file("datums.ini"), "NGVD 29", "Show Out", "");
  EXPECT_EQ(Thrown([&] { LoadDatumList(dir.path(), false, false, false, false); }).number(), 13);
  EXPECT_EQ(LoadEllipsoidList(dir.path()), (std::vector<std::string>{"Clarke 1866", "GRS 80"}));
  WriteProfileValue(dir.file("ellipsoids.ini"), "Extra", "Full Name", "no Show key");
  EXPECT_EQ(Thrown([&] { LoadEllipsoidList(dir.path()); }).number(), 13);
}

TEST_F(CatalogFolder, ZoneDatumsAndUnits) {
  ZoneDatumsAndUnits z = ReadZoneDatumsAndUnits(dir.path(), "State Plane 1983", "North");
  EXPECT_EQ(z.horizontalDatum, "NAD 83");
  EXPECT_EQ(z.verticalDatum, "NAVD 88");
  EXPECT_EQ(z.linearUnits, "U.S. Survey Feet");
  // The section "State Plane 1983 ~South" is found from the trimmed names.
  z = ReadZoneDatumsAndUnits(dir.path(), "State Plane 1983", "South");
  EXPECT_EQ(z.horizontalDatum, "NAD 27");
  EXPECT_EQ(z.verticalDatum, "");
  z = ReadZoneDatumsAndUnits(dir.path(), "State Plane 1983", "West");
  EXPECT_EQ(z.horizontalDatum, "");
}

TEST(CatalogValues, ReadLikeTheProfileFunctions) {
  // Odd spacing, letter case, repeated sections and keys, "=" in a value.
  TempDir dir;
  const std::string path =
      dir.write("zones.ini",
                CrLf({"; comment", "Linear Units=stray", "[ sp~z ]", "  horizontal DATUM  = A=B ",
                      "Horizontal Datum=second", "Vertical Datum=", "\tLinear Units\t=\tM",
                      "[SP~Z]", "Vertical Datum=later section"}));
  ZoneDatumsAndUnits z = ReadZoneDatumsAndUnits(dir.path(), "SP", "z");
  EXPECT_EQ(z.horizontalDatum, ReadProfileValue(path, "sp~z", "Horizontal Datum", ""));
  EXPECT_EQ(z.horizontalDatum, "A=B");
  EXPECT_EQ(z.verticalDatum, ReadProfileValue(path, "sp~z", "Vertical Datum", ""));
  EXPECT_EQ(z.verticalDatum, "");
  EXPECT_EQ(z.linearUnits, ReadProfileValue(path, "sp~z", "Linear Units", ""));
  EXPECT_EQ(z.linearUnits, "M");
}

TEST_F(CatalogFolder, ResolvesTransverseMercatorFromTheDatumEllipsoid) {
  ZoneParameters p = ResolveZone(ui, dir.path(), "State Plane 1983", "North");
  EXPECT_EQ(p.projection, "Transverse Mercator");
  EXPECT_EQ(p.ellipsoid, "GRS 80");
  EXPECT_EQ(p.a, 6378137);
  EXPECT_EQ(p.e, 0.08181919104281517);
  EXPECT_NEAR(p.phi0, Deg(36, 40), 1e-14);
  EXPECT_NEAR(p.lambda0, Deg(88, 20), 1e-14);
  EXPECT_NEAR(p.falseEasting, 250000 * 0.3048006096012192, 1e-9);  // metres
  EXPECT_EQ(p.falseNorthing, 0);
  EXPECT_EQ(p.k0, 0.99996);
  EXPECT_EQ(p.phiN, kNoValue);
  EXPECT_EQ(p.azimuth, kNoValue);
  EXPECT_EQ(p.fullName, "North Zone");
  EXPECT_EQ(p.horizontalDatum, "NAD 83");
  EXPECT_EQ(p.verticalDatum, "NAVD 88");
  EXPECT_EQ(p.linearUnits, "U.S. Survey Feet");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(CatalogFolder, ResolvesDirectionsUnitsAndTheComputationalEllipsoid) {
  ZoneParameters p = ResolveZone(ui, dir.path(), "State Plane 1983", "South");
  EXPECT_EQ(p.ellipsoid, "GRS 80");  // overrides NAD 27's Clarke 1866
  EXPECT_EQ(p.a, 6378137);
  // South-positive -27 50 is 27 50 north; east-positive 99 is 261 west.
  EXPECT_NEAR(p.phi0, Deg(27, 50), 1e-14);
  EXPECT_NEAR(p.lambda0, kFullCircle - Deg(99), 1e-14);
  EXPECT_NEAR(p.phiN, Deg(30, 17), 1e-14);
  EXPECT_NEAR(p.phiS, Deg(28, 23), 1e-14);
  EXPECT_DOUBLE_EQ(p.falseNorthing, 304.8);
  EXPECT_DOUBLE_EQ(p.falseEasting, 609.6);
  EXPECT_EQ(p.k0, kNoValue);
}

TEST_F(CatalogFolder, Nad27FormsKeepFalseOriginsInSurveyFeet) {
  ZoneParameters p = ResolveZone(ui, dir.path(), "Old System", "Texas");
  EXPECT_EQ(p.ellipsoid, "Clarke 1866");
  EXPECT_DOUBLE_EQ(p.falseEasting, 600000 * 3.2808333333333333);
}

TEST_F(CatalogFolder, ResolveErrorsNameWhatIsWrong) {
  const std::string zones = dir.file("zones.ini");
  auto description = [&](const std::string& cs, const std::string& zone) {
    ZvError e = Thrown([&] { ResolveZone(ui, dir.path(), cs, zone); });
    EXPECT_EQ(e.source(), "modMisc.ResolveZone");
    return e.description();
  };
  EXPECT_EQ(description("State Plane 1983", "East"),
            "Zone 'East' of coordinate system 'State Plane 1983' was not found in zones.ini.");

  WriteProfileValue(zones, "Old System~Texas", "Computational Ellipsoid", "Bessel");
  EXPECT_EQ(description("Old System", "Texas"),
            "The ellipsoid 'Bessel' of zone 'Old System~Texas' was not found in ellipsoids.ini.");
  WriteProfileValue(zones, "Old System~Texas", "Computational Ellipsoid", "");
  WriteProfileValue(zones, "Old System~Texas", "Horizontal Datum", "NAD 99");
  EXPECT_EQ(description("Old System", "Texas"),
            "The Horizontal Datum 'NAD 99' of zone 'Old System~Texas' was not found in "
            "datums.ini.");
  WriteProfileValue(zones, "Old System~Texas", "Horizontal Datum", "NAD 27");

  WriteProfileValue(zones, "Old System~Texas", "Central Latitude", "27.6000");
  EXPECT_EQ(description("Old System", "Texas"),
            "Zone 'Old System~Texas': the Central Latitude '27.6000' is not a valid angle.");
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
  WriteProfileValue(zones, "Old System~Texas", "Central Latitude", "27.3x");
  EXPECT_EQ(description("Old System", "Texas"),
            "Zone 'Old System~Texas': the Central Latitude '27.3x' is not a valid angle.");
  WriteProfileValue(zones, "Old System~Texas", "Central Latitude", "27.3");

  WriteProfileValue(zones, "Old System~Texas", "Linear Units", "Yards");
  EXPECT_EQ(description("Old System", "Texas"),
            "Zone 'Old System~Texas' has unknown Linear Units 'Yards'.");
  WriteProfileValue(zones, "Old System~Texas", "Linear Units", "M");
  WriteProfileValue(zones, "Old System~Texas", "False Easting", "");
  EXPECT_EQ(description("Old System", "Texas"), "Zone 'Old System~Texas' has no False Easting.");
  WriteProfileValue(zones, "Old System~Texas", "False Easting", "0");
  WriteProfileValue(zones, "Old System~Texas", "Positive Longitude Direction", "w");
  EXPECT_EQ(description("Old System", "Texas"),
            "Zone 'Old System~Texas': the Positive Longitude Direction must be E or W.");
  WriteProfileValue(zones, "Old System~Texas", "Positive Longitude Direction", "W");
  WriteProfileValue(zones, "Old System~Texas", "Projection", "Mercator");
  EXPECT_EQ(description("Old System", "Texas"),
            "Zone 'Old System~Texas' has an unknown Projection 'Mercator'.");
}

TEST(CatalogLists, DatumYears) {
  auto years = LoadDatumYearList();
  ASSERT_EQ(years.size(), 44u);
  EXPECT_EQ(years[0], (std::pair<std::string, int>{"NAD 1927", 1927}));
  EXPECT_EQ(years[1], (std::pair<std::string, int>{"NAD 1983", 1983}));
  EXPECT_EQ(years[2], (std::pair<std::string, int>{"HPGN 1984", 1984}));
  EXPECT_EQ(years.back(), (std::pair<std::string, int>{"HPGN 2025", 2025}));
}

TEST(CatalogLists, ToolZones) {
  TempDir dir;
  dir.write("Pintrel/zones.txt",
            CrLf({"# zone list", "4801 Wisconsin North", "", "0101 Alabama East", "#4802"}));
  auto zones = LoadToolZoneList(dir.path());
  ASSERT_EQ(zones.size(), 2u);
  EXPECT_EQ(zones[0], (std::pair<std::string, int>{"4801 Wisconsin North", 4801}));
  EXPECT_EQ(zones[1], (std::pair<std::string, int>{"0101 Alabama East", 101}));
  EXPECT_EQ(Thrown([] { LoadToolZoneList("/nonexistent-folder"); }).number(), 53);
}

// The catalogs shipped in the application folder.
class ShippedCatalogs : public ::testing::Test {
 protected:
  std::string app = std::string(ZV_SOURCE_DIR) + "/appdata";
  ScriptedUi ui;
};

TEST_F(ShippedCatalogs, EveryZoneResolves) {
  std::map<std::string, int> counts;
  for (const std::string& cs : LOAD_CS_ComboBoxList(app)) {
    std::vector<std::string> zones = LOAD_Zones_ComboBoxList(app, true, cs);
    EXPECT_EQ(LOAD_Zones_ComboBoxList(app, false, cs), zones);
    for (const std::string& zone : zones) {
      ++counts[cs];
      SCOPED_TRACE(cs + "~" + zone);
      ZoneParameters p = ResolveZone(ui, app, cs, zone);
      EXPECT_GT(p.a, 6377000);
      EXPECT_LT(p.a, 6379000);
      EXPECT_GT(p.e, 0.08);
      EXPECT_GT(p.phi0, -0.01);
      EXPECT_LT(p.phi0, Deg(72));
      EXPECT_GT(p.lambda0, Deg(60));
      EXPECT_LT(p.lambda0, Deg(190));  // UTM 59N: 171 E
      bool nad27 = p.projection.find("NAD 27") != std::string::npos;
      if (nad27) {
        EXPECT_EQ(p.linearUnits, "U.S. Survey Feet");
        EXPECT_EQ(p.horizontalDatum, "NAD 27");
        // The NAD 27 equations add no false northing.
        EXPECT_EQ(p.falseNorthing, 0);
      }
      if (p.k0 != kNoValue) {
        EXPECT_GT(p.k0, 0.9990);
        EXPECT_LE(p.k0, 1.0);
      }
      if (p.phiN != kNoValue) {
        EXPECT_GT(p.phiN, p.phiS);
      }
      EXPECT_NE(p.fullName.find("(EPSG:"), std::string::npos);
    }
  }
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(counts["State Plane 1983"], 124);
  EXPECT_EQ(counts["State Plane 1927"], 132);
  EXPECT_EQ(counts["UTM NAD 83"], 22);
  EXPECT_EQ(counts["UTM NAD 27"], 22);
}

TEST_F(ShippedCatalogs, KnownZoneDefinitions) {
  // Wisconsin Central: Lambert, false easting 600000 m in U.S. survey feet.
  ZoneParameters p = ResolveZone(ui, app, "State Plane 1983", "Wisconsin Central 4802");
  EXPECT_EQ(p.projection, "Lambert Conformal Conic - Two Parallels");
  EXPECT_EQ(p.linearUnits, "U.S. Survey Feet");
  EXPECT_NEAR(p.falseEasting, 600000, 1e-6);
  EXPECT_NEAR(p.phiN, Deg(45, 30), 1e-14);
  EXPECT_NEAR(p.phiS, Deg(44, 15), 1e-14);
  EXPECT_NEAR(p.phi0, Deg(43, 50), 1e-14);
  EXPECT_NEAR(p.lambda0, Deg(90), 1e-14);

  // Alaska zone 1: oblique Mercator with the azimuth atan(-3/4).
  p = ResolveZone(ui, app, "State Plane 1983", "Alaska Zone 1 5001");
  EXPECT_EQ(p.projection, "Oblique Mercator - Hotine");
  EXPECT_NEAR(p.azimuth, Deg(323, 7, 48.36847), 1e-14);
  EXPECT_NEAR(p.azimuth, 2 * M_PI + std::atan(-0.75), 1e-10);
  EXPECT_EQ(p.falseEasting, 5000000);
  EXPECT_EQ(p.falseNorthing, -5000000);

  p = ResolveZone(ui, app, "State Plane 1927", "Alaska Zone 1 5001");
  EXPECT_EQ(p.projection, "Oblique Mercator - Hotine");
  EXPECT_EQ(p.ellipsoid, "Clarke 1866");
  EXPECT_NEAR(p.falseEasting, 5000000, 0.01);

  p = ResolveZone(ui, app, "State Plane 1927", "Alaska Zone 5 5005");
  EXPECT_EQ(p.projection, "Transverse Mercator - NAD 27 Equations");
  EXPECT_EQ(p.k0, 0.9999);

  p = ResolveZone(ui, app, "State Plane 1927", "Texas South Central 4204");
  EXPECT_EQ(p.projection, "Lambert Conformal Conic - NAD 27 Equations");
  EXPECT_EQ(p.falseEasting, 2000000);
  EXPECT_NEAR(p.phi0, Deg(27, 50), 1e-14);

  // International feet for Arizona, metres for Alabama.
  p = ResolveZone(ui, app, "State Plane 1983", "Arizona Central 0202");
  EXPECT_EQ(p.linearUnits, "International Feet");
  EXPECT_NEAR(p.falseEasting, 213360, 1e-6);
  p = ResolveZone(ui, app, "State Plane 1983", "Alabama East 0101");
  EXPECT_EQ(p.linearUnits, "Meters");
  EXPECT_EQ(p.falseEasting, 200000);

  p = ResolveZone(ui, app, "UTM NAD 83", "Zone 15N");
  EXPECT_EQ(p.k0, 0.9996);
  EXPECT_NEAR(p.lambda0, Deg(93), 1e-14);
  // The western Aleutians: central meridians east of Greenwich.
  p = ResolveZone(ui, app, "UTM NAD 27", "Zone 59N");
  EXPECT_NEAR(p.lambda0, Deg(360 - 171), 1e-13);
  EXPECT_EQ(p.ellipsoid, "Clarke 1866");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST_F(ShippedCatalogs, DatumsAndEllipsoidsFitTogether) {
  const std::string datums = DatumsPath(app);
  std::vector<std::string> ellipsoids = LoadEllipsoidList(app);
  for (const char* name : {"Clarke 1866", "GRS 80", "WGS 84"}) {
    EXPECT_NE(std::find(ellipsoids.begin(), ellipsoids.end(), name), ellipsoids.end()) << name;
  }
  std::vector<std::string> horizontal = LoadDatumList(app, true, true, false, false);
  EXPECT_GE(horizontal.size(), 51u);  // NAD 27, NAD 83 and the 49 HPGN areas
  for (const std::string& d : horizontal) {
    std::string ellipsoid = ReadProfileValue(datums, d, "Ellipsoid", "");
    EXPECT_NE(std::find(ellipsoids.begin(), ellipsoids.end(), ellipsoid), ellipsoids.end()) << d;
  }
  EXPECT_EQ(LoadDatumList(app, true, false, false, false),
            (std::vector<std::string>{"None", "NGVD 29", "NAVD 88"}));
  EXPECT_EQ(LoadDatumList(app, true, false, true, true).size(), 2u);

  EXPECT_EQ(ReadProfileValue(datums, "NAD 27", "NAD 83", ""), "NADCON NAD 27 to NAD 83");
  EXPECT_EQ(ReadProfileValue(datums, "NAD 83", "NAD 27", ""), "NADCON NAD 83 to NAD 27");
  EXPECT_EQ(ReadProfileValue(datums, "Alabama HPGN", "NAD 83", ""),
            "NADCON Alabama HPGN to NAD 83 (1996)");
  EXPECT_EQ(ReadProfileValue(datums, "NAD 83", "Texas HPGN (West of 100\xC2\xB0 Longitude)", ""),
            "NADCON NAD 83 (1986) to Texas HPGN (West of 100\xC2\xB0 Longitude)");
  EXPECT_EQ(ReadProfileValue(datums, "NGVD 29", "NAVD 88", ""), "VERTCON NGVD 29 to NAVD 88");
  EXPECT_EQ(ReadProfileValue(datums, "NAVD 88", "NGVD 29", ""), "VERTCON NAVD 88 to NGVD 29");
}

TEST_F(ShippedCatalogs, EllipsoidsAreConsistent) {
  const std::string path = EllipsoidsPath(app);
  for (const std::string& name : LoadEllipsoidList(app)) {
    SCOPED_TRACE(name);
    double a = *ToNumber(ReadProfileValue(path, name, "Semimajor Axis", ""));
    double b = *ToNumber(ReadProfileValue(path, name, "Semiminor Axis", ""));
    std::string fText = ReadProfileValue(path, name, "Flattening", "");
    EXPECT_EQ(fText.find_first_of("eE"), std::string::npos);
    double f = *ToNumber(fText);
    double e = *ToNumber(ReadProfileValue(path, name, "Eccentricity", ""));
    EXPECT_NEAR((a - b) / a, f, 1e-15);
    EXPECT_NEAR(std::sqrt(2 * f - f * f), e, 3e-15);
  }
}

}  // namespace
}  // namespace zv
