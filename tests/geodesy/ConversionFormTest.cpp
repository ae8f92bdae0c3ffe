// The Coordinate Conversion form without widgets: list cascades, enabling
// rules, the OK checks in their order, remembered and preset settings, the
// unattended settings check, the manual entry checks and the OK flow.

#include <gtest/gtest.h>

#include <cmath>
#include <map>
#include <sstream>

#include "geodesy/Angles.h"
#include "geodesy/ConversionForm.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using V = std::vector<std::string>;
using Keys = std::map<std::string, std::string>;
constexpr FormSide In = FormSide::Input;
constexpr FormSide Out = FormSide::Output;
using enum FormField;

const std::string kGeo = kGeographicCoordinates;
const V kUnits = {"Meters", "U.S. Survey Feet", "International Feet"};
const V kAngles = {"DDD MM SS.ssss", "DDD.MMSSssss", "DDD.dddddd", "DDD MM.mmmm"};

// Two grid systems (one zone listed on the input side only, one on the
// output side only, one zone without datums or units) and five datums.
const char* const kZones =
    "[Grid A~North]|Horizontal Datum=NAD 83|Vertical Datum=NAVD 88|Show Out=0|"
    "Linear Units=U.S. Survey Feet|"
    "[Grid A ~South]|Horizontal Datum=NAD 27|Vertical Datum=NGVD 29|Show In=0|"
    "Linear Units=Meters|"
    "[Grid B~East]|Show In=1";
const char* const kDatums =
    "[NAD 27]|Type=Horizontal|Ellipsoid=Clarke 1866|Show In=1|Show Out=1|"
    "[NAD 83]|Type=Horizontal|Ellipsoid=GRS 80|Show In=1|Show Out=1|"
    "[NAVD 88]|Type=Vertical|Show In=1|Show Out=1|"
    "[NGVD 29]|Type=Vertical|Show In=1|Show Out=0|"
    "[ITRF]|Type=3D|Ellipsoid=GRS 80|Show In=1|Show Out=1";

// "key=value|key=value" as keys of the section.
Keys Parse(const std::string& text) {
  Keys keys;
  std::istringstream in(text);
  for (std::string kv; std::getline(in, kv, '|');)
    keys[kv.substr(0, kv.find('='))] = kv.substr(kv.find('=') + 1);
  return keys;
}

// A complete, valid choice over Grid B (whose zone selects nothing itself).
const Keys kValid = Parse(
    "Input Coordinate System=Grid B|Input Zone=East|Input Horizontal Datum=NAD 83|"
    "Input Horizontal Units=Meters|Input Vertical Datum=NAVD 88|Input Vertical Units=Meters|"
    "Output Coordinate System=Grid B|Output Zone=East|Output Horizontal Datum=NAD 83|"
    "Output Horizontal Units=International Feet|Output Vertical Datum=NAVD 88|"
    "Output Vertical Units=U.S. Survey Feet|Scale Factor=1|Convergence Angle=0|Lat Long=1|"
    "Geoid Heights=0|Geoid Model=GEOID09");

// The selections of a side's six lists, each followed by '|'.
std::string Selected(const ConversionForm& form, FormSide side) {
  std::string s;
  for (FormField f :
       {CoordinateSystem, Zone, HorizontalDatum, HorizontalUnits, VerticalDatum, VerticalUnits})
    s += form.list(side, f).selected + "|";
  return s;
}

class ConversionFormTest : public ::testing::Test {
 protected:
  ConversionFormTest() {
    app.write("zones.ini", test::Ini(kZones));
    app.write("datums.ini", test::Ini(kDatums));
  }

  // The store with the valid choice, changed by `changes` ("key=value|...").
  MemorySettings store(const std::string& changes = "") {
    MemorySettings s;
    Keys values = kValid;
    for (const auto& [key, value] : Parse(changes)) values[key] = value;
    for (const auto& [key, value] : values) s.save(kConversionSection, key, value);
    return s;
  }
  ConversionForm loaded(const std::string& changes = "",
                        const ConversionSettings* preset = nullptr) {
    ConversionForm form(app.path());
    form.load(store(changes), preset);
    return form;
  }
  ConversionForm empty() {
    ConversionForm form(app.path());
    form.load(MemorySettings{});
    return form;
  }

  test::TempDir app;
  ScriptedUi ui;
};

TEST_F(ConversionFormTest, LoadOffersTheSystemsAndStartsWithTheGeoidControlsOff) {
  ConversionForm form = empty();
  for (FormSide side : {In, Out}) {
    EXPECT_EQ(form.list(side, CoordinateSystem).items, (V{"Grid A", "Grid B", kGeo}));
    EXPECT_EQ(Selected(form, side), "||||||");
  }
  EXPECT_FALSE(form.geoid().enabled || form.list(In, GeoidModel).enabled);
  EXPECT_EQ(form.list(Out, GeoidModel).items, (V{"GEOID99", "GEOID03", "GEOID06", "GEOID09"}));
  EXPECT_EQ(form.validate()->text, "You must specify the input Coordinate System.");
}

TEST_F(ConversionFormTest, ChoosingASystemRefillsTheListsOfItsSide) {
  const struct {
    FormSide side;
    std::string system;
    V zones, horizontalDatums, verticalDatums;
  } cases[] = {
      {In, "Grid A", {"North"}, {"NAD 27", "NAD 83"}, {"None", "NAVD 88", "NGVD 29"}},
      {Out, "Grid A", {"South"}, {"NAD 27", "NAD 83"}, {"None", "NAVD 88"}},
      {In, kGeo, {}, {"NAD 27", "NAD 83", "ITRF"}, {"None", "NAVD 88", "NGVD 29", "ITRF"}},
      {Out, kGeo, {}, {"NAD 27", "NAD 83", "ITRF"}, {"None", "NAVD 88", "ITRF"}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.system + (c.side == In ? " in" : " out"));
    const bool geo = c.system == kGeo;
    ConversionForm form = loaded();  // Grid B with every field chosen
    form.choose(c.side, CoordinateSystem, c.system);
    EXPECT_EQ(form.list(c.side, Zone).items, c.zones);
    EXPECT_EQ(form.list(c.side, Zone).enabled, !geo);
    EXPECT_EQ(form.list(c.side, HorizontalUnits).items, geo ? kAngles : kUnits);
    EXPECT_EQ(form.list(c.side, HorizontalDatum).items, c.horizontalDatums);
    EXPECT_EQ(form.list(c.side, VerticalDatum).items, c.verticalDatums);
    EXPECT_EQ(form.list(c.side, VerticalUnits).items, kUnits);
    EXPECT_EQ(Selected(form, c.side), c.system + "||||||");
    EXPECT_EQ(form.list(c.side == In ? Out : In, Zone).selected, "East");  // the other side kept
  }
}

TEST_F(ConversionFormTest, AZoneSelectsItsDatumsAndUnitsWhereItsSideOffersThem) {
  ConversionForm form = empty();
  form.choose(In, CoordinateSystem, "Grid A");
  form.choose(In, Zone, "North");
  form.choose(Out, CoordinateSystem, "Grid A");
  form.choose(Out, Zone, "South");
  EXPECT_EQ(Selected(form, In), "Grid A|North|NAD 83|U.S. Survey Feet|NAVD 88|U.S. Survey Feet|");
  // NGVD 29 is not offered on the output side: nothing is selected there.
  EXPECT_EQ(Selected(form, Out), "Grid A|South|NAD 27|Meters||Meters|");
  form.choose(In, Zone, "South");  // not in the list: nothing changes
  EXPECT_EQ(Selected(form, In), "Grid A|North|NAD 83|U.S. Survey Feet|NAVD 88|U.S. Survey Feet|");
}

TEST_F(ConversionFormTest, OptionsFollowBothSystemsInEitherOrder) {
  const struct {
    std::string in, out;
    bool scaleAndConvergence, latLong;
  } cases[] = {{"Grid A", "Grid B", true, true},
               {"Grid A", kGeo, true, false},
               {kGeo, "Grid B", true, false},
               {kGeo, kGeo, false, false}};
  for (const auto& c : cases) {
    for (bool inputFirst : {true, false}) {
      SCOPED_TRACE(c.in + " to " + c.out + (inputFirst ? ", input first" : ", output first"));
      ConversionForm form = empty();
      // Start from the opposite choices so that every rule has to act.
      form.choose(In, CoordinateSystem, c.in == kGeo ? "Grid A" : kGeo);
      form.choose(Out, CoordinateSystem, c.out == kGeo ? "Grid A" : kGeo);
      form.choose(inputFirst ? In : Out, CoordinateSystem, inputFirst ? c.in : c.out);
      form.choose(inputFirst ? Out : In, CoordinateSystem, inputFirst ? c.out : c.in);
      EXPECT_EQ(form.scaleFactor().enabled, c.scaleAndConvergence);
      EXPECT_EQ(form.convergence().enabled, c.scaleAndConvergence);
      EXPECT_EQ(form.latLong().enabled, c.latLong);
    }
  }
  // A ticked box that is disabled does not count.
  ConversionForm form = loaded("Output Coordinate System=" + kGeo);
  EXPECT_TRUE(form.latLong().checked);
  EXPECT_FALSE(form.settings().OutputLatLong);
  EXPECT_TRUE(form.settings().OutputScaleFactor);
}

TEST_F(ConversionFormTest, InputVerticalDatumNoneHoldsTheVerticalOutputAndTheGeoid) {
  ConversionForm form = loaded("Geoid Heights=1");
  // Output vertical datum; enabled: it, the output vertical units, the geoid
  // box and model; the manual entry's height.
  const auto vertical = [&form] {
    const auto on = [](bool b) { return b ? "1" : "0"; };
    return form.list(Out, VerticalDatum).selected + " " +
           on(form.list(Out, VerticalDatum).enabled) + on(form.list(Out, VerticalUnits).enabled) +
           on(form.geoid().enabled) + on(form.list(In, GeoidModel).enabled) +
           on(form.manualEntrySetup().heightWanted);
  };
  const ManualEntrySetup grid = form.manualEntrySetup();
  EXPECT_EQ((V{grid.heightType, grid.horizontalUnits, grid.angleFormat}),
            (V{"Orthometric", "Meters", ""}));
  EXPECT_FALSE(grid.geographic);
  EXPECT_EQ(vertical(), "NAVD 88 11111");
  form.setGeoid(false);
  EXPECT_FALSE(form.list(In, GeoidModel).enabled);
  form.setGeoid(true);

  form.choose(In, VerticalDatum, "None");
  EXPECT_EQ(vertical(), "None 00000");
  form.choose(Out, CoordinateSystem, kGeo);  // a new output system keeps "None"
  EXPECT_EQ(form.list(Out, VerticalDatum).selected, "None");
  const ConversionSettings s = form.settings();
  EXPECT_EQ(s.outputVerticalDatum + "|" + s.outputVerticalUnits + "|" + s.geoidModel,
            "None|Meters|");  // the input's units
  EXPECT_FALSE(s.OutputGeoid);
  // Also over a remembered output datum, loaded after the input's.
  EXPECT_EQ(loaded("Input Vertical Datum=None").settings().outputVerticalDatum, "None");

  form.choose(In, VerticalDatum, "NGVD 29");
  EXPECT_EQ(vertical().substr(5), "11111");
  EXPECT_EQ(form.settings().geoidModel, "GEOID09");
}

// Each row spoils the valid choice; the first refusal names its list and,
// unattended, the key to mend.
TEST_F(ConversionFormTest, OkChecksRunInOrderAndNameTheField) {
  const std::map<std::string, std::string> refusals = {
      {"Input Coordinate System",
       "Coordinate System Required: You must specify the input Coordinate System."},
      {"Input Zone", "Zone Required: You must specify the input Zone."},
      {"Input Horizontal Datum",
       "Horizontal Datum Requied: You must specify the input Horizonal Datum."},
      {"Input Horizontal Units",
       "Horizontal Units Required: You must specify the input Horizontal Units."},
      {"Input Vertical Units", "Vertical Units Required: You must specify the Vertical Units."},
      {"Output Coordinate System",
       "Coordinate System Required: You must specify the output Coordinate System."},
      {"Output Zone", "Zone Required: You must specify the output Zone."},
      {"Output Horizontal Datum",
       "Horizontal Datum Requied: You must specify the output Horizonal Datum."},
      {"Output Horizontal Units",
       "Horizontal Units Required: You must specify the output Horizontal Units."},
      {"Output Vertical Datum",
       "Vertical Datum Required: You must specify the output Vertical Datum."},
      {"Output Vertical Units",
       "Vertical Units Required: You must specify the output Vertical Units."},
      {"Geoid Model",
       "Geoid Model Required: You must specfiy the Geoid Model to use in order to Compute Geoid "
       "Heights."}};
  const std::string decimal = kFormatDecimal;
  // The changes and the key of the first refusal (empty: accepted).
  const std::pair<std::string, std::string> cases[] = {
      {"", ""},
      {"Input Coordinate System=", "Input Coordinate System"},
      {"Input Coordinate System=Grid C", "Input Coordinate System"},
      {"Input Zone=", "Input Zone"},
      {"Input Zone=|Input Coordinate System=" + kGeo + "|Input Horizontal Units=" + decimal, ""},
      {"Input Horizontal Datum=NGVD 29", "Input Horizontal Datum"},
      {"Input Horizontal Units=" + decimal, "Input Horizontal Units"},
      {"Input Vertical Units=", "Input Vertical Units"},
      {"Input Vertical Units=|Input Vertical Datum=None|Output Vertical Units=", ""},
      {"Input Horizontal Units=|Output Coordinate System=", "Input Horizontal Units"},
      {"Output Coordinate System=", "Output Coordinate System"},
      {"Output Zone=North", "Output Zone"},
      {"Output Horizontal Datum=", "Output Horizontal Datum"},
      {"Output Horizontal Units=", "Output Horizontal Units"},
      {"Output Vertical Datum=NGVD 29", "Output Vertical Datum"},
      {"Output Vertical Units=", "Output Vertical Units"},
      {"Geoid Heights=1|Geoid Model=GEOID12", "Geoid Model"},
      {"Geoid Heights=1|Geoid Model=|Input Vertical Datum=None", ""},
  };
  for (const auto& [changes, key] : cases) {
    SCOPED_TRACE(changes);
    const std::optional<FormRefusal> r = loaded(changes).validate();
    const std::string box = key.empty() ? "" : refusals.at(key);
    EXPECT_EQ(r ? r->title + ": " + r->text + " [" + ConversionKey(r->side, r->field) + "]" : "",
              key.empty() ? "" : box + " [" + key + "]");
    // Unattended, the same box names the key to mend.
    EXPECT_EQ(SettingsFromStore(ui, app.path(), store(changes), nullptr, "'jobs.ini'").has_value(),
              key.empty());
    EXPECT_EQ(test::Take(ui), key.empty()
                                  ? ""
                                  : "E " + box + "\r\nKey \"" + key +
                                        "\" of section \"Coordinate Conversion\" in 'jobs.ini'.");
  }
}

TEST_F(ConversionFormTest, RemembersEveryKeyAndLoadsItBack) {
  ConversionForm form = loaded();
  form.setConvergence(true);
  form.setLatLong(false);
  Keys expected = kValid;
  expected["Convergence Angle"] = "1";
  expected["Lat Long"] = "0";
  MemorySettings first, second;
  form.remember(first);
  ConversionForm again(app.path());  // loaded back, it remembers the same again
  again.load(first);
  again.remember(second);
  for (const MemorySettings* s : {&first, &second}) {
    for (const auto& [key, value] : expected)
      EXPECT_EQ(s->get(kConversionSection, key, "<missing>"), value) << key;
  }
}

TEST_F(ConversionFormTest, APresetTakesThePlaceOfTheRememberedInputSide) {
  ConversionSettings zoneOnly;
  zoneOnly.inputCoordinateSystem = "Grid A";
  zoneOnly.inputZone = "North";
  ConversionSettings withDatum = zoneOnly;
  withDatum.inputHorizontalDatum = "NAD 27";
  withDatum.inputVerticalUnits = "Meters";
  ConversionSettings unlisted = zoneOnly;
  unlisted.inputZone = "South";  // output-only zone
  const std::pair<ConversionSettings, std::string> cases[] = {
      {{}, "Grid B|East|NAD 83|Meters|NAVD 88|Meters|"},  // remembered
      {zoneOnly, "Grid A|North|NAD 83|U.S. Survey Feet|NAVD 88|U.S. Survey Feet|"},
      {withDatum, "Grid A|North|NAD 27|U.S. Survey Feet|NAVD 88|Meters|"},
      {unlisted, "Grid A||||||"},
  };
  for (const auto& [preset, input] : cases) {
    SCOPED_TRACE(input);
    const ConversionSettings s = loaded("", &preset).settings();
    EXPECT_EQ(s.inputCoordinateSystem + "|" + s.inputZone + "|" + s.inputHorizontalDatum + "|" +
                  s.inputHorizontalUnits + "|" + s.inputVerticalDatum + "|" + s.inputVerticalUnits +
                  "|",
              input);
    EXPECT_EQ(s.outputHorizontalUnits, "International Feet");  // the output side is remembered
  }
  EXPECT_FALSE(SettingsFromStore(ui, app.path(), store(), &unlisted, "settings"));
  EXPECT_EQ(test::Take(ui),
            "E Zone Required: You must specify the input Zone.\r\nKey \"Input Zone\" of section "
            "\"Coordinate Conversion\" in settings.");
}

TEST_F(ConversionFormTest, AListThatCannotBeFilledIsReportedWithItsFunction) {
  const struct {
    const char *zones, *datums;
    std::string text;
  } cases[] = {
      {"[Grid A~North]|[Broken]", kDatums,
       "Error: Error loading coordinate systems.\r\nFunction: modMisc.LOAD_CS_ComboBoxList"},
      {kZones, "[NAD 83]|Type=Horizontal|Show In=yes",
       "Error: Type mismatch\r\nFunction: modMisc.LoadDatumList"},
  };
  for (const auto& c : cases) {
    app.write("zones.ini", test::Ini(c.zones));
    app.write("datums.ini", test::Ini(c.datums));
    EXPECT_FALSE(SettingsFromStore(ui, app.path(), store(), nullptr, "settings"));
    ASSERT_EQ(ui.boxes.size(), 1u);
    EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
    EXPECT_EQ(ui.onlyText(), c.text);
    ui.boxes.clear();
  }
}

TEST(ManualEntryTest, ChecksRunInOrderWithBlanksAllowedInAngles) {
  const ManualEntrySetup geo{true, true, "Meters", "Orthometric", kFormatDMS, ""};
  const ManualEntrySetup plane{false, true, "Meters", "Orthometric", "", "Meters"};
  ManualEntrySetup planeNoHeight = plane;
  planeNoHeight.heightWanted = false;
  auto g = [](std::string lat, std::string lon, std::string height = "") {
    ManualEntryFields f;
    f.latitude = lat, f.longitude = lon, f.height = height;
    return f;
  };
  auto p = [](std::string n, std::string e, std::string height = "") {
    ManualEntryFields f;
    f.northing = n, f.easting = e, f.height = height;
    return f;
  };
  using enum ManualField;
  const struct {
    const ManualEntrySetup& setup;
    ManualEntryFields fields;
    std::string title;  // empty: accepted
    ManualField field;
  } cases[] = {
      {geo, g("45 30 15.25", " 93  15 0 ", "12.5"), "", Latitude},
      {geo, g("", ""), "Latitude Required", Latitude},
      {geo, g("   ", "93"), "Latitude Required", Latitude},
      {geo, g("45 3O 15", "93"), "Invalid Latitude", Latitude},
      {geo, g("45", ""), "Longitude Required", Longitude},
      {geo, g("45", "93 15 OO"), "Invalid Longitude", Longitude},
      {geo, g("45", "93", "1 2"), "Invalid Height", Height},
      {geo, g("x", "", "y"), "Invalid Latitude", Latitude},
      {plane, p("1000.5", "2000", " 12 "), "", Northing},
      {plane, p("", "2000"), "Northing Required", Northing},
      {plane, p("1 000", "2000"), "Invalid Northing", Northing},
      {plane, p("1000", ""), "Easting Required", Easting},
      {plane, p("1000", "2e"), "Invalid Easting", Easting},
      {plane, p("1000", "2000", "tall"), "Invalid Height", Height},
      {planeNoHeight, p("1000", "2000", "tall"), "", Northing},
  };
  const std::map<std::string, std::string> texts = {
      {"Latitude Required", "You must enter a Latitude."},
      {"Invalid Latitude", "Latitude must be a numeric value."},
      {"Longitude Required", "You must enter a Longitude."},
      {"Invalid Longitude", "Longitude must be a numeric value."},
      {"Invalid Height", "Height must be a numeric value."},
      {"Northing Required", "You must enter a Northing."},
      {"Invalid Northing", "Northing must be a numeric value."},
      {"Easting Required", "You must enter an Easting."},
      {"Invalid Easting", "Easting must be a numeric value."}};
  for (const auto& c : cases) {
    const ManualEntryFields& f = c.fields;
    SCOPED_TRACE(f.latitude + "|" + f.longitude + "|" + f.northing + "|" + f.easting + "|" +
                 f.height);
    const std::optional<ManualRefusal> r = ValidateManualEntry(c.setup, f);
    EXPECT_EQ(r ? r->title + ": " + r->text : "",
              c.title.empty() ? "" : c.title + ": " + texts.at(c.title));
    if (r) {
      EXPECT_EQ(r->field, c.field);
    }
  }
}

// A point as filled: name, hemispheres, grid position and heights, units,
// a kept field.
std::string Filled(const SurveyPoint& p) {
  std::ostringstream s;
  s << p.PointName << "|" << p.LatitudeHemisphere << p.LongitudeHemisphere << "|" << p.Northing
    << " " << p.Easting << " " << p.Elevation << " " << p.EllipsoidHeight << "|"
    << p.HorizontalUnits << "|" << p.VerticalUnits << "|" << p.RecordCode;
  return s.str();
}

// Rows that fail show their box and keep the dialog open.
TEST(ManualEntryTest, FillsTheResetPointInTheConfiguredFormat) {
  const std::string dms = kFormatDMS;
  const struct {
    std::string format, latitude, longitude, heightType;
    std::string result;  // heights (elevation, ellipsoid), or the box and the angle not read
  } cases[] = {
      {dms, " 45  30 15.25", "93 15 00 ", "Orthometric", "101.5 -99999"},
      {kFormatPacked, "45.30 1525", "93.15", "Ellipsoid", "-99999 101.5"},
      {kFormatDM, "45 30.254166666666667", "93 15", "Ellipsoid", "-99999 101.5"},
      {kFormatDecimal, "45.504236111111111", "93.25", "Orthometric", "101.5 -99999"},
      {dms, "45 60 00", "93", "Ellipsoid",
       "E Invalid Angle: Invalid Angle '45 60 00'. Minutes portion must be positive and not "
       "exceed 59. [latitude]"},
      {dms, "45 30 00", "93 30 x", "Ellipsoid",
       "E Invalid Longitude: Longitude must be a numeric value. [longitude]"},
      {"DDD", "45", "93", "Ellipsoid",
       "E Invalid Angular Format: Unknown Angular Format. Can not convert angle to radians. "
       "[latitude]"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.format + " " + c.latitude);
    ScriptedUi ui;
    ManualEntryFields f;
    f.pointName = " CP 7 ";
    f.latitude = c.latitude, f.longitude = c.longitude;
    f.latitudeDirection = "S", f.longitudeDirection = "E";
    f.height = "101.5";
    SurveyPoint point;
    point.Northing = 5;  // an earlier run's value
    point.RecordCode = "RC";
    if (!FillManualPoint(ui, {true, true, "U.S. Survey Feet", c.heightType, c.format, ""}, f,
                         point)) {
      EXPECT_EQ(test::Boxes(ui) + (point.Latitude == kNoValue ? " [latitude]" : " [longitude]"),
                c.result);
      continue;
    }
    EXPECT_EQ(test::Boxes(ui), "");
    EXPECT_NEAR(point.Latitude, (45 + 30.0 / 60 + 15.25 / 3600) * kDegreesToRadians, 1e-12);
    EXPECT_NEAR(point.Longitude, (93 + 15.0 / 60) * kDegreesToRadians, 1e-12);
    EXPECT_EQ(Filled(point),
              "CP 7|SE|-99999 -99999 " + c.result + "|" + c.format + "|U.S. Survey Feet|RC");
  }

  ScriptedUi ui;
  ManualEntryFields f;
  f.northing = "1000.25", f.easting = " 2000 ", f.height = "ignored";
  SurveyPoint point;
  ASSERT_TRUE(FillManualPoint(ui, {false, false, "Meters", "Orthometric", "", "International Feet"},
                              f, point));
  // No height wanted; the name stays as a new point's.
  const SurveyPoint fresh;
  EXPECT_EQ(Filled(point), fresh.PointName + "|" + fresh.LatitudeHemisphere +
                               fresh.LongitudeHemisphere +
                               "|1000.25 2000 -99999 -99999|International Feet|Meters|");
}

// The OK flow over the shipped catalogs: a typed point from geographic
// coordinates into a zone, without any NGS program.
class AcceptConversionTest : public ::testing::Test {
 protected:
  AcceptConversionTest() {
    test::InstallCatalogs(app.path());
    state.now = [] { return std::tm{7, 5, 9, 4, 2, 126, 0, 0, 0, 0, nullptr}; };
    for (const auto& [key, value] :
         Parse("Input Coordinate System=" + kGeo +
               "|Input Horizontal Datum=NAD 83|Input Horizontal Units=DDD MM SS.ssss|"
               "Input Vertical Datum=NAVD 88|Input Vertical Units=Meters|"
               "Output Coordinate System=State Plane 1983|Output Zone=Alabama East 0101|"
               "Output Vertical Units=U.S. Survey Feet|Scale Factor=1"))
      remembered.save(kConversionSection, key, value);
  }

  // The form as loaded; `outputDatum` replaces the zone's horizontal datum.
  ConversionForm form(const std::string& outputDatum = "") {
    ConversionForm f(app.path());
    f.load(remembered);
    if (!outputDatum.empty()) f.choose(Out, HorizontalDatum, outputDatum);
    EXPECT_FALSE(f.validate());
    return f;
  }

  test::TempDir app;
  ScriptedUi ui;
  MemorySettings remembered, saved;
  ConversionState state;
  std::vector<ManualEntrySetup> asked;
  std::vector<std::string> shown;
  ConversionDialogs dialogs{[this](const ManualEntrySetup& setup, SurveyPoint& point) {
                              asked.push_back(setup);
                              ManualEntryFields f;
                              f.pointName = "P1";
                              f.latitude = "32 30 00";
                              f.longitude = "86 00 00";
                              f.height = "100";
                              return FillManualPoint(ui, setup, f, point);
                            },
                            [this](const std::string& report) { shown.push_back(report); }};
};

TEST_F(AcceptConversionTest, ASinglePointIsEnteredConvertedAndItsReportShown) {
  state.singlePoint = true;
  state.points.assign(3, SurveyPoint{});  // only the typed point is converted
  ASSERT_TRUE(AcceptConversion(ui, app.path(), form(), state, saved, dialogs));
  EXPECT_EQ(test::Boxes(ui), "");
  ASSERT_EQ(asked.size(), 1u);
  EXPECT_TRUE(asked[0].geographic);
  EXPECT_EQ(asked[0].heightType + "|" + asked[0].angleFormat, "Orthometric|DDD MM SS.ssss");
  ASSERT_EQ(state.points.size(), 1u);
  const SurveyPoint& p = state.points[0];
  EXPECT_NEAR(p.Northing, 221800.0, 1000.0);  // metres north of the origin at 30 deg 30 min
  EXPECT_NEAR(p.Elevation, 100 / 0.3048006096012192, 1e-9);
  EXPECT_EQ(p.VerticalUnits, "U.S. Survey Feet");
  ASSERT_EQ(shown, V{state.report});
  EXPECT_NE(state.report.find("Single Point Conversion\t\tPoint Name: P1"), std::string::npos);
  EXPECT_NE(state.report.find("\r\n     Scale Factor: \t\t0.99"), std::string::npos);
  EXPECT_TRUE(state.accepted);
  EXPECT_EQ(state.settings.outputHorizontalDatum, "NAD 83");
  EXPECT_EQ(saved.get(kConversionSection, "Output Zone", "") + "|" +
                saved.get(kConversionSection, "Scale Factor", ""),
            "Alabama East 0101|1");
}

TEST_F(AcceptConversionTest, CancelledOrFailedRunsConvertNothingAndRememberNothing) {
  const std::string noTransformation =
      "E No Datum Transformation: No datum transformation exists for 'NAD 83' to 'NAD 27'.";
  const struct {
    std::string name;
    bool singlePoint;
    std::string outputDatum;
    bool cancelEntry;
    std::string boxes;
  } cases[] = {
      {"entry cancelled", true, "", true, ""},
      {"no datum transformation", true, "NAD 27", false, noTransformation},
      {"file run", false, "NAD 27", false, noTransformation},
  };
  app.write("datums.ini", test::Ini("[NAD 83]|Type=Horizontal|Ellipsoid=GRS 80|Show In=1|"
                                    "Show Out=1|[NAD 27]|Type=Horizontal|Ellipsoid=Clarke 1866|"
                                    "Show In=1|Show Out=1|[NAVD 88]|Type=Vertical|Show In=1|"
                                    "Show Out=1"));
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    asked.clear();
    state = ConversionState{};
    state.singlePoint = c.singlePoint;
    state.accepted = true;  // an earlier run's flag
    state.points.assign(1, SurveyPoint{});
    state.points[0].Latitude = 0.5;
    state.points[0].Longitude = 1.5;
    ConversionDialogs d = dialogs;
    if (c.cancelEntry) d.enterPoint = [](const ManualEntrySetup&, SurveyPoint&) { return false; };
    EXPECT_FALSE(AcceptConversion(ui, app.path(), form(c.outputDatum), state, saved, d));
    EXPECT_EQ(state.accepted, c.cancelEntry);  // cleared only when the driver ran
    EXPECT_EQ(state.report.empty(), c.cancelEntry);
    EXPECT_EQ(asked.size(), c.singlePoint && !c.cancelEntry ? 1u : 0u);
    EXPECT_EQ(test::Take(ui), c.boxes);
    EXPECT_TRUE(shown.empty());
    EXPECT_EQ(saved.get(kConversionSection, "Output Zone", "<none>"), "<none>");
  }
}

}  // namespace
}  // namespace zv
