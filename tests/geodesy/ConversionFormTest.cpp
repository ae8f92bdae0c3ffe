// The Coordinate Conversion form without widgets: list cascades, enabling
// rules, the OK checks in their order, remembered and preset settings, the
// unattended settings check, the manual entry checks and the OK flow.

#include <gtest/gtest.h>

#include <cmath>
#include <map>

#include "geodesy/Angles.h"
#include "geodesy/ConversionForm.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using V = std::vector<std::string>;
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

// A complete, valid choice over Grid B (whose zone selects nothing itself).
const std::map<std::string, std::string> kValid = {
    {"Input Coordinate System", "Grid B"},
    {"Input Zone", "East"},
    {"Input Horizontal Datum", "NAD 83"},
    {"Input Horizontal Units", "Meters"},
    {"Input Vertical Datum", "NAVD 88"},
    {"Input Vertical Units", "Meters"},
    {"Output Coordinate System", "Grid B"},
    {"Output Zone", "East"},
    {"Output Horizontal Datum", "NAD 83"},
    {"Output Horizontal Units", "International Feet"},
    {"Output Vertical Datum", "NAVD 88"},
    {"Output Vertical Units", "U.S. Survey Feet"},
    {"Scale Factor", "1"},
    {"Convergence Angle", "0"},
    {"Lat Long", "1"},
    {"Geoid Heights", "0"},
    {"Geoid Model", "GEOID09"}};

class ConversionFormTest : public ::testing::Test {
 protected:
  ConversionFormTest() {
    app.write("zones.ini", test::Ini(kZones));
    app.write("datums.ini", test::Ini(kDatums));
  }

  // The store with the valid choice, changed by `changes`.
  MemorySettings store(const std::map<std::string, std::string>& changes = {}) {
    MemorySettings s;
    std::map<std::string, std::string> values = kValid;
    for (const auto& [key, value] : changes) values[key] = value;
    for (const auto& [key, value] : values) s.save(kConversionSection, key, value);
    return s;
  }

  ConversionForm loaded(const std::map<std::string, std::string>& changes = {},
                        const ConversionSettings* preset = nullptr) {
    ConversionForm form(app.path());
    form.load(store(changes), preset);
    return form;
  }

  test::TempDir app;
  ScriptedUi ui;
};

TEST_F(ConversionFormTest, LoadOffersTheSystemsAndStartsWithTheGeoidControlsOff) {
  ConversionForm form(app.path());
  form.load(MemorySettings{});
  for (FormSide side : {In, Out}) {
    EXPECT_EQ(form.list(side, CoordinateSystem).items, (V{"Grid A", "Grid B", kGeo}));
    for (FormField f : {CoordinateSystem, Zone, HorizontalDatum, VerticalUnits})
      EXPECT_EQ(form.list(side, f).selected, "");
  }
  EXPECT_FALSE(form.geoid().enabled);
  EXPECT_FALSE(form.list(In, GeoidModel).enabled);
  EXPECT_EQ(form.list(Out, GeoidModel).items, (V{"GEOID99", "GEOID03", "GEOID06", "GEOID09"}));
  EXPECT_EQ(form.validate()->text, "You must specify the input Coordinate System.");
}

TEST_F(ConversionFormTest, ChoosingASystemRefillsTheListsOfItsSide) {
  struct Case {
    FormSide side;
    std::string system;
    V zones;
    bool zoneEnabled;
    V horizontalUnits, horizontalDatums, verticalDatums;
  };
  const Case cases[] = {
      {In, "Grid A", {"North"}, true, kUnits, {"NAD 27", "NAD 83"}, {"None", "NAVD 88", "NGVD 29"}},
      {Out, "Grid A", {"South"}, true, kUnits, {"NAD 27", "NAD 83"}, {"None", "NAVD 88"}},
      {In,
       kGeo,
       {},
       false,
       kAngles,
       {"NAD 27", "NAD 83", "ITRF"},
       {"None", "NAVD 88", "NGVD 29", "ITRF"}},
      {Out, kGeo, {}, false, kAngles, {"NAD 27", "NAD 83", "ITRF"}, {"None", "NAVD 88", "ITRF"}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.system + (c.side == In ? " in" : " out"));
    ConversionForm form = loaded();  // Grid B with every field chosen
    form.choose(c.side, CoordinateSystem, c.system);
    EXPECT_EQ(form.list(c.side, Zone).items, c.zones);
    EXPECT_EQ(form.list(c.side, Zone).enabled, c.zoneEnabled);
    EXPECT_EQ(form.list(c.side, HorizontalUnits).items, c.horizontalUnits);
    EXPECT_EQ(form.list(c.side, HorizontalDatum).items, c.horizontalDatums);
    EXPECT_EQ(form.list(c.side, VerticalDatum).items, c.verticalDatums);
    EXPECT_EQ(form.list(c.side, VerticalUnits).items, kUnits);
    for (FormField f : {Zone, HorizontalDatum, HorizontalUnits, VerticalDatum, VerticalUnits})
      EXPECT_EQ(form.list(c.side, f).selected, "") << ConversionKey(c.side, f);
    // The other side keeps its choices.
    const FormSide other = c.side == In ? Out : In;
    EXPECT_EQ(form.list(other, Zone).selected, "East");
  }
}

TEST_F(ConversionFormTest, AZoneSelectsItsDatumsAndUnitsWhereItsSideOffersThem) {
  ConversionForm form(app.path());
  form.load(MemorySettings{});
  form.choose(In, CoordinateSystem, "Grid A");
  form.choose(In, Zone, "North");
  form.choose(Out, CoordinateSystem, "Grid A");
  form.choose(Out, Zone, "South");
  const std::pair<FormSide, V> expected[] = {
      {In, {"NAD 83", "U.S. Survey Feet", "NAVD 88", "U.S. Survey Feet"}},
      // NGVD 29 is not offered on the output side: nothing is selected there.
      {Out, {"NAD 27", "Meters", "", "Meters"}}};
  for (const auto& [side, values] : expected) {
    EXPECT_EQ(
        (V{form.list(side, HorizontalDatum).selected, form.list(side, HorizontalUnits).selected,
           form.list(side, VerticalDatum).selected, form.list(side, VerticalUnits).selected}),
        values);
  }
  // A zone the list does not hold changes nothing.
  form.choose(In, Zone, "South");
  EXPECT_EQ(form.list(In, Zone).selected, "North");
  EXPECT_EQ(form.list(In, HorizontalDatum).selected, "NAD 83");
}

TEST_F(ConversionFormTest, OptionsFollowBothSystemsInEitherOrder) {
  struct Case {
    std::string in, out;
    bool scaleAndConvergence, latLong;
  };
  const Case cases[] = {{"Grid A", "Grid B", true, true},
                        {"Grid A", kGeo, true, false},
                        {kGeo, "Grid B", true, false},
                        {kGeo, kGeo, false, false}};
  for (const Case& c : cases) {
    for (bool inputFirst : {true, false}) {
      SCOPED_TRACE(c.in + " to " + c.out + (inputFirst ? ", input first" : ", output first"));
      ConversionForm form(app.path());
      form.load(MemorySettings{});
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
  ConversionForm form = loaded({{"Output Coordinate System", kGeo}});
  EXPECT_TRUE(form.latLong().checked);
  EXPECT_FALSE(form.settings().OutputLatLong);
  EXPECT_TRUE(form.settings().OutputScaleFactor);
}

TEST_F(ConversionFormTest, InputVerticalDatumNoneHoldsTheVerticalOutputAndTheGeoid) {
  ConversionForm form = loaded({{"Geoid Heights", "1"}});
  const ManualEntrySetup grid = form.manualEntrySetup();
  EXPECT_EQ((V{grid.heightType, grid.horizontalUnits, grid.angleFormat}),
            (V{"Orthometric", "Meters", ""}));
  EXPECT_TRUE(grid.heightWanted && !grid.geographic);
  EXPECT_TRUE(form.geoid().enabled);
  EXPECT_TRUE(form.list(In, GeoidModel).enabled);
  form.setGeoid(false);
  EXPECT_FALSE(form.list(In, GeoidModel).enabled);
  form.setGeoid(true);

  form.choose(In, VerticalDatum, "None");
  EXPECT_EQ(form.list(Out, VerticalDatum).selected, "None");
  EXPECT_FALSE(form.list(Out, VerticalDatum).enabled);
  EXPECT_FALSE(form.list(Out, VerticalUnits).enabled);
  EXPECT_FALSE(form.geoid().enabled);
  EXPECT_FALSE(form.list(In, GeoidModel).enabled);
  EXPECT_FALSE(form.manualEntrySetup().heightWanted);
  // A new output system keeps the output vertical datum at "None".
  form.choose(Out, CoordinateSystem, kGeo);
  EXPECT_EQ(form.list(Out, VerticalDatum).selected, "None");

  ConversionSettings s = form.settings();
  EXPECT_EQ(s.outputVerticalDatum, "None");
  EXPECT_EQ(s.outputVerticalUnits, "Meters");  // the input's
  EXPECT_FALSE(s.OutputGeoid);
  EXPECT_EQ(s.geoidModel, "");

  // Also over a remembered output datum, loaded after the input's.
  EXPECT_EQ(loaded({{"Input Vertical Datum", "None"}}).settings().outputVerticalDatum, "None");

  form.choose(In, VerticalDatum, "NGVD 29");
  EXPECT_TRUE(form.list(Out, VerticalDatum).enabled);
  EXPECT_TRUE(form.list(Out, VerticalUnits).enabled);
  EXPECT_TRUE(form.geoid().enabled);
  EXPECT_TRUE(form.list(In, GeoidModel).enabled);
  EXPECT_EQ(form.settings().geoidModel, "GEOID09");
}

// Each row spoils the valid choice; the first refusal names its list and,
// unattended, the key to mend.
TEST_F(ConversionFormTest, OkChecksRunInOrderAndNameTheField) {
  using Changes = std::map<std::string, std::string>;
  // "title: text [key]" of the first refusal; empty when accepted.
  const std::pair<Changes, std::string> cases[] = {
      {{}, ""},
      {{{"Input Coordinate System", ""}},
       "Coordinate System Required: You must specify the input Coordinate System. "
       "[Input Coordinate System]"},
      {{{"Input Coordinate System", "Grid C"}},
       "Coordinate System Required: You must specify the input Coordinate System. "
       "[Input Coordinate System]"},
      {{{"Input Zone", ""}}, "Zone Required: You must specify the input Zone. [Input Zone]"},
      {{{"Input Zone", ""},
        {"Input Coordinate System", kGeo},
        {"Input Horizontal Units", kFormatDecimal}},
       ""},
      {{{"Input Horizontal Datum", "NGVD 29"}},
       "Horizontal Datum Requied: You must specify the input Horizonal Datum. "
       "[Input Horizontal Datum]"},
      {{{"Input Horizontal Units", kFormatDecimal}},
       "Horizontal Units Required: You must specify the input Horizontal Units. "
       "[Input Horizontal Units]"},
      {{{"Input Vertical Units", ""}},
       "Vertical Units Required: You must specify the Vertical Units. [Input Vertical Units]"},
      {{{"Input Vertical Units", ""},
        {"Input Vertical Datum", "None"},
        {"Output Vertical Units", ""}},
       ""},
      {{{"Input Horizontal Units", ""}, {"Output Coordinate System", ""}},
       "Horizontal Units Required: You must specify the input Horizontal Units. "
       "[Input Horizontal Units]"},
      {{{"Output Coordinate System", ""}},
       "Coordinate System Required: You must specify the output Coordinate System. "
       "[Output Coordinate System]"},
      {{{"Output Zone", "North"}},
       "Zone Required: You must specify the output Zone. [Output Zone]"},
      {{{"Output Horizontal Datum", ""}},
       "Horizontal Datum Requied: You must specify the output Horizonal Datum. "
       "[Output Horizontal Datum]"},
      {{{"Output Horizontal Units", ""}},
       "Horizontal Units Required: You must specify the output Horizontal Units. "
       "[Output Horizontal Units]"},
      {{{"Output Vertical Datum", "NGVD 29"}},
       "Vertical Datum Required: You must specify the output Vertical Datum. "
       "[Output Vertical Datum]"},
      {{{"Output Vertical Units", ""}},
       "Vertical Units Required: You must specify the output Vertical Units. "
       "[Output Vertical Units]"},
      {{{"Geoid Heights", "1"}, {"Geoid Model", "GEOID12"}},
       "Geoid Model Required: You must specfiy the Geoid Model to use in order to Compute Geoid "
       "Heights. [Geoid Model]"},
      {{{"Geoid Heights", "1"}, {"Geoid Model", ""}, {"Input Vertical Datum", "None"}}, ""},
  };
  for (const auto& [changes, expected] : cases) {
    std::string trace;
    for (const auto& [key, value] : changes) trace += key + "=" + value + "; ";
    SCOPED_TRACE(trace);
    std::optional<FormRefusal> r = loaded(changes).validate();
    ui.boxes.clear();
    const bool accepted =
        SettingsFromStore(ui, app.path(), store(changes), nullptr, "'jobs.ini'").has_value();
    const std::string key = r ? ConversionKey(r->side, r->field) : "";
    EXPECT_EQ(r ? r->title + ": " + r->text + " [" + key + "]" : "", expected);
    EXPECT_EQ(accepted, !r);
    ASSERT_EQ(ui.boxes.size(), r ? 1u : 0u);
    if (!r) continue;
    // Unattended, the same box names the key to mend.
    EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
    EXPECT_EQ(ui.boxes[0].title + ": " + ui.boxes[0].text,
              r->title + ": " + r->text + "\r\nKey \"" + key +
                  "\" of section \"Coordinate Conversion\" in 'jobs.ini'.");
  }
}

TEST_F(ConversionFormTest, RemembersEveryKeyAndLoadsItBack) {
  ConversionForm form = loaded();
  form.setConvergence(true);
  form.setLatLong(false);
  MemorySettings remembered;
  form.remember(remembered);
  std::map<std::string, std::string> expected = kValid;
  expected["Convergence Angle"] = "1";
  expected["Lat Long"] = "0";
  for (const auto& [key, value] : expected)
    EXPECT_EQ(remembered.get(kConversionSection, key, "<missing>"), value) << key;

  // Loaded back, the form remembers the same again.
  ConversionForm again(app.path());
  again.load(remembered);
  MemorySettings second;
  again.remember(second);
  for (const auto& [key, value] : expected)
    EXPECT_EQ(second.get(kConversionSection, key, "<missing>"), value) << key;
}

TEST_F(ConversionFormTest, APresetTakesThePlaceOfTheRememberedInputSide) {
  struct Case {
    std::string name;
    ConversionSettings preset;
    V input;  // system, zone, horizontal datum and units, vertical datum and units
  };
  ConversionSettings zoneOnly;
  zoneOnly.inputCoordinateSystem = "Grid A";
  zoneOnly.inputZone = "North";
  ConversionSettings withDatum = zoneOnly;
  withDatum.inputHorizontalDatum = "NAD 27";
  withDatum.inputVerticalUnits = "Meters";
  ConversionSettings unlisted = zoneOnly;
  unlisted.inputZone = "South";  // output-only zone
  const Case cases[] = {
      {"empty preset: remembered", {}, {"Grid B", "East", "NAD 83", "Meters", "NAVD 88", "Meters"}},
      {"the zone fills the rest",
       zoneOnly,
       {"Grid A", "North", "NAD 83", "U.S. Survey Feet", "NAVD 88", "U.S. Survey Feet"}},
      {"preset fields after the zone",
       withDatum,
       {"Grid A", "North", "NAD 27", "U.S. Survey Feet", "NAVD 88", "Meters"}},
      {"unlisted zone", unlisted, {"Grid A", "", "", "", "", ""}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    ConversionForm form = loaded({}, &c.preset);
    const ConversionSettings s = form.settings();
    EXPECT_EQ((V{s.inputCoordinateSystem, s.inputZone, s.inputHorizontalDatum,
                 s.inputHorizontalUnits, s.inputVerticalDatum, s.inputVerticalUnits}),
              c.input);
    EXPECT_EQ(s.outputHorizontalUnits, "International Feet");  // the output side is remembered
  }
  ui.boxes.clear();
  EXPECT_FALSE(SettingsFromStore(ui, app.path(), store(), &unlisted, "settings"));
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].text,
            "You must specify the input Zone.\r\nKey \"Input Zone\" of section \"Coordinate "
            "Conversion\" in settings.");
}

TEST_F(ConversionFormTest, AListThatCannotBeFilledIsReportedWithItsFunction) {
  struct Case {
    const char* zones;
    const char* datums;
    std::string text;
  };
  const Case cases[] = {
      {"[Grid A~North]|[Broken]", kDatums,
       "Error: Error loading coordinate systems.\r\nFunction: modMisc.LOAD_CS_ComboBoxList"},
      {kZones, "[NAD 83]|Type=Horizontal|Show In=yes",
       "Error: Type mismatch\r\nFunction: modMisc.LoadDatumList"},
  };
  for (const Case& c : cases) {
    app.write("zones.ini", test::Ini(c.zones));
    app.write("datums.ini", test::Ini(c.datums));
    ui.boxes.clear();
    EXPECT_FALSE(SettingsFromStore(ui, app.path(), store(), nullptr, "settings"));
    ASSERT_EQ(ui.boxes.size(), 1u);
    EXPECT_EQ(ui.boxes[0].text, c.text);
    EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
  }
}

TEST(ManualEntryTest, ChecksRunInOrderWithBlanksAllowedInAngles) {
  ManualEntrySetup geo{true, true, "Meters", "Orthometric", kFormatDMS, ""};
  ManualEntrySetup plane{false, true, "Meters", "Orthometric", "", "Meters"};
  ManualEntrySetup planeNoHeight = plane;
  planeNoHeight.heightWanted = false;
  struct Case {
    const ManualEntrySetup& setup;
    ManualEntryFields fields;
    std::string title;  // empty: accepted
    ManualField field;
  };
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
  const ManualField Lat = ManualField::Latitude, Lon = ManualField::Longitude,
                    N = ManualField::Northing, E = ManualField::Easting, H = ManualField::Height;
  const Case cases[] = {
      {geo, g("45 30 15.25", " 93  15 0 ", "12.5"), "", Lat},
      {geo, g("", ""), "Latitude Required", Lat},
      {geo, g("   ", "93"), "Latitude Required", Lat},
      {geo, g("45 3O 15", "93"), "Invalid Latitude", Lat},
      {geo, g("45", ""), "Longitude Required", Lon},
      {geo, g("45", "93 15 OO"), "Invalid Longitude", Lon},
      {geo, g("45", "93", "1 2"), "Invalid Height", H},
      {geo, g("x", "", "y"), "Invalid Latitude", Lat},
      {plane, p("1000.5", "2000", " 12 "), "", N},
      {plane, p("", "2000"), "Northing Required", N},
      {plane, p("1 000", "2000"), "Invalid Northing", N},
      {plane, p("1000", ""), "Easting Required", E},
      {plane, p("1000", "2e"), "Invalid Easting", E},
      {plane, p("1000", "2000", "tall"), "Invalid Height", H},
      {planeNoHeight, p("1000", "2000", "tall"), "", N},
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
  for (const Case& c : cases) {
    SCOPED_TRACE(c.fields.latitude + "|" + c.fields.longitude + "|" + c.fields.northing + "|" +
                 c.fields.easting + "|" + c.fields.height);
    std::optional<ManualRefusal> r = ValidateManualEntry(c.setup, c.fields);
    if (c.title.empty()) {
      EXPECT_FALSE(r) << r->title;
      continue;
    }
    ASSERT_TRUE(r);
    EXPECT_EQ(r->title, c.title);
    EXPECT_EQ(r->text, texts.at(c.title));
    EXPECT_EQ(r->field, c.field);
  }
}

TEST(ManualEntryTest, FillsTheResetPointInTheConfiguredFormat) {
  constexpr double kDeg = kDegreesToRadians;
  const double lat = (45 + 30.0 / 60 + 15.25 / 3600) * kDeg;
  const double lon = (93 + 15.0 / 60) * kDeg;
  struct Case {
    std::string format, latitude, longitude, heightType;
    bool elevation;  // the height lands in Elevation, else EllipsoidHeight
  };
  const Case cases[] = {
      {kFormatDMS, " 45  30 15.25", "93 15 00 ", "Orthometric", true},
      {kFormatPacked, "45.30 1525", "93.15", "Ellipsoid", false},
      {kFormatDM, "45 30.254166666666667", "93 15", "Ellipsoid", false},
      {kFormatDecimal, "45.504236111111111", "93.25", "Orthometric", true},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.format);
    ScriptedUi ui;
    ManualEntrySetup setup{true, true, "U.S. Survey Feet", c.heightType, c.format, ""};
    ManualEntryFields f;
    f.pointName = " CP 7 ";
    f.latitude = c.latitude, f.longitude = c.longitude;
    f.latitudeDirection = "S", f.longitudeDirection = "E";
    f.height = "101.5";
    SurveyPoint point;
    point.Northing = 5;  // an earlier run's value
    point.RecordCode = "RC";
    ASSERT_TRUE(FillManualPoint(ui, setup, f, point));
    EXPECT_TRUE(ui.boxes.empty());
    EXPECT_EQ(point.PointName, "CP 7");
    EXPECT_NEAR(point.Latitude, lat, 1e-12);
    EXPECT_NEAR(point.Longitude, lon, 1e-12);
    EXPECT_EQ(point.LatitudeHemisphere + point.LongitudeHemisphere, "SE");
    EXPECT_EQ(point.Elevation, c.elevation ? 101.5 : kNoValue);
    EXPECT_EQ(point.EllipsoidHeight, c.elevation ? kNoValue : 101.5);
    EXPECT_EQ(point.Northing, kNoValue);
    EXPECT_EQ(point.RecordCode, "RC");
    EXPECT_EQ(point.HorizontalUnits, c.format);
    EXPECT_EQ(point.VerticalUnits, "U.S. Survey Feet");
  }

  ScriptedUi ui;
  ManualEntrySetup plane{false, false, "Meters", "Orthometric", "", "International Feet"};
  ManualEntryFields f;
  f.northing = "1000.25", f.easting = " 2000 ", f.height = "ignored";
  SurveyPoint point;
  ASSERT_TRUE(FillManualPoint(ui, plane, f, point));
  EXPECT_EQ(point.Northing, 1000.25);
  EXPECT_EQ(point.Easting, 2000.0);
  EXPECT_EQ(point.Elevation, kNoValue);  // no height wanted
  EXPECT_EQ(point.HorizontalUnits, "International Feet");
  EXPECT_EQ(point.PointName, SurveyPoint{}.PointName);
}

TEST(ManualEntryTest, AnAngleThatCannotBeReadKeepsTheDialogOpen) {
  struct Case {
    std::string format, latitude, longitude;
    std::string box;  // "title: text"
    bool latitudeFailed;
  };
  const Case cases[] = {
      {kFormatDMS, "45 60 00", "93",
       "Invalid Angle: Invalid Angle '45 60 00'. Minutes portion must be positive and not "
       "exceed 59.",
       true},
      {kFormatDMS, "45 30 00", "93 30 x", "Invalid Longitude: Longitude must be a numeric value.",
       false},
      {"DDD", "45", "93",
       "Invalid Angular Format: Unknown Angular Format. Can not convert angle "
       "to radians.",
       true},
  };
  for (const Case& c : cases) {
    ScriptedUi ui;
    ManualEntrySetup setup{true, false, "Meters", "Ellipsoid", c.format, ""};
    ManualEntryFields f;
    f.latitude = c.latitude, f.longitude = c.longitude;
    SurveyPoint point;
    EXPECT_FALSE(FillManualPoint(ui, setup, f, point));
    ASSERT_EQ(ui.boxes.size(), 1u);
    EXPECT_EQ(ui.boxes[0].title + ": " + ui.boxes[0].text, c.box);
    EXPECT_EQ(point.Latitude == kNoValue, c.latitudeFailed);
  }
}

// The OK flow over the shipped catalogs: a typed point from geographic
// coordinates into a zone, without any NGS program.
class AcceptConversionTest : public ::testing::Test {
 protected:
  AcceptConversionTest() {
    test::InstallCatalogs(app.path());
    state.now = [] { return std::tm{7, 5, 9, 4, 2, 126, 0, 0, 0, 0, nullptr}; };
    const std::map<std::string, std::string> values = {
        {"Input Coordinate System", kGeo},
        {"Input Horizontal Datum", "NAD 83"},
        {"Input Horizontal Units", kFormatDMS},
        {"Input Vertical Datum", "NAVD 88"},
        {"Input Vertical Units", "Meters"},
        {"Output Coordinate System", "State Plane 1983"},
        {"Output Zone", "Alabama East 0101"},
        {"Output Vertical Units", "U.S. Survey Feet"},
        {"Scale Factor", "1"}};
    for (const auto& [key, value] : values) remembered.save(kConversionSection, key, value);
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
  MemorySettings remembered;
  MemorySettings saved;
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
  EXPECT_TRUE(ui.boxes.empty()) << ui.boxes[0].text;
  ASSERT_EQ(asked.size(), 1u);
  EXPECT_TRUE(asked[0].geographic);
  EXPECT_EQ(asked[0].heightType, "Orthometric");
  EXPECT_EQ(asked[0].angleFormat, kFormatDMS);
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
  EXPECT_EQ(saved.get(kConversionSection, "Output Zone", ""), "Alabama East 0101");
  EXPECT_EQ(saved.get(kConversionSection, "Scale Factor", ""), "1");
}

TEST_F(AcceptConversionTest, CancelledOrFailedRunsConvertNothingAndRememberNothing) {
  struct Case {
    std::string name;
    bool singlePoint;
    std::string outputDatum;
    bool cancelEntry;
    std::string box;
  };
  const Case cases[] = {
      {"entry cancelled", true, "", true, ""},
      {"no datum transformation", true, "NAD 27", false,
       "No datum transformation exists for 'NAD 83' to 'NAD 27'."},
      {"file run", false, "NAD 27", false,
       "No datum transformation exists for 'NAD 83' to 'NAD 27'."},
  };
  app.write("datums.ini", test::Ini("[NAD 83]|Type=Horizontal|Ellipsoid=GRS 80|Show In=1|"
                                    "Show Out=1|[NAD 27]|Type=Horizontal|Ellipsoid=Clarke 1866|"
                                    "Show In=1|Show Out=1|[NAVD 88]|Type=Vertical|Show In=1|"
                                    "Show Out=1"));
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    ui.boxes.clear();
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
    EXPECT_EQ(ui.boxes.empty() ? "" : ui.boxes.back().text, c.box);
    EXPECT_TRUE(shown.empty());
    EXPECT_EQ(saved.get(kConversionSection, "Output Zone", "<none>"), "<none>");
  }
}

}  // namespace
}  // namespace zv
