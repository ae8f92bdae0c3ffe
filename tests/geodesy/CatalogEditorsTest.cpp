// The editor logic over small catalogs: refusal order and focus, the two
// flags, the duplicate questions, the ellipsoid solver, transformations,
// ratio scale factors, angle formats and deletes that keep every other byte.

#include <gtest/gtest.h>

#include "geodesy/Angles.h"
#include "geodesy/CatalogEditors.h"
#include "geodesy/Catalogs.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::Take;

const std::string kEllipsoids = CrLf(
    {"[GRS 80]", "Full Name=GRS 1980", "Semimajor Axis=6378137", "Semiminor Axis=6356752.31414036",
     "Flattening=0.00335281068118232", "Eccentricity=0.0818191910428158", "Show=1", "",
     "[Clarke 1866]", "Semimajor Axis=6378206.4", "Semiminor Axis=6356583.8",
     "Flattening=0.0033900753039", "Eccentricity=0.08227185422", "Show=1", "[Hidden]", "Show=0"});
const std::string kDatums = CrLf({"; hand-made",
                                  "[NAD 83]",
                                  "Full Name=North American 1983",
                                  "Type=Horizontal",
                                  "Ellipsoid=GRS 80",
                                  "Show In=1",
                                  "Show Out=1",
                                  "NAD 27=NADCON NAD 83 to NAD 27",
                                  "[NAD 27]",
                                  "Type=Horizontal",
                                  "Ellipsoid=Clarke 1866",
                                  "Show In=1",
                                  "Show Out=1",
                                  "NAD 83=NADCON NAD 27 to NAD 83",
                                  "[NAVD 88]",
                                  "Type=Vertical",
                                  "Show In=1",
                                  "Show Out=1",
                                  "[NGVD 29]",
                                  "Type=Vertical",
                                  "Show In=0",
                                  "Show Out=1",
                                  "[NAD 83 3D]",
                                  "Type=3D",
                                  "Ellipsoid=GRS 80",
                                  "Show In=1",
                                  "Show Out=1"});
const std::string kZones = CrLf({"[State Plane 1983~East]",
                                 "Full Name=East Zone",
                                 "Horizontal Datum=NAD 83",
                                 "Computational Ellipsoid=",
                                 "Vertical Datum=NAVD 88",
                                 "Projection=Transverse Mercator",
                                 "Show In=1",
                                 "Show Out=1",
                                 "Central Latitude=36.400000000",
                                 "Central Longitude=88.200000000",
                                 "False Northing=0",
                                 "False Easting=250000",
                                 "Scale Factor=0.99996",
                                 "Positive Latitude Direction=N",
                                 "Positive Longitude Direction=W",
                                 "Linear Units=U.S. Survey Feet",
                                 "",
                                 "[State Plane 1983 ~ West]",
                                 "Horizontal Datum=NAD 83",
                                 "Projection=Lambert Conformal Conic - Two Parallels",
                                 "[UTM~16 North]",
                                 "Horizontal Datum=NAD 83",
                                 "Projection=Transverse Mercator"});

class CatalogEditorsTest : public ::testing::Test {
 protected:
  CatalogEditorsTest() {
    app.write("ellipsoids.ini", kEllipsoids);
    app.write("datums.ini", kDatums);
    app.write("zones.ini", kZones);
  }
  template <class Editor>
  static void Fill(
      Editor& e, std::initializer_list<std::pair<typename Editor::FieldType, const char*>> fields) {
    for (const auto& [f, text] : fields) e.edit(f, text);
  }
  std::string file(const char* name) const { return ReadFile(app.file(name)); }

  test::TempDir app;
  ScriptedUi ui;
};

// ---- ellipsoids ----------------------------------------------------------

TEST_F(CatalogEditorsTest, EllipsoidSaveRefusesInOrderWithTheFocusOnTheField) {
  using F = EllipsoidField;
  struct Case {
    std::initializer_list<std::pair<F, const char*>> fields;
    const char* text;
    F focus;
  };
  const Case cases[] = {
      {{{F::FullName, "x"}}, "A Short Name is required.", F::ShortName},
      {{{F::ShortName, "New"}}, "A Semimajor Axis is required.", F::SemimajorAxis},
      {{{F::ShortName, "New"}, {F::SemimajorAxis, "6378000"}},
       "A Semiminor Axis is required.",
       F::SemiminorAxis},
      {{{F::ShortName, "New"}, {F::SemimajorAxis, "6378000"}, {F::SemiminorAxis, "6357000"}},
       "A Flattening is required.",
       F::Flattening},
      {{{F::ShortName, "New"},
        {F::SemimajorAxis, "6378000"},
        {F::SemiminorAxis, "6357000"},
        {F::Flattening, "300"}},
       "An Eccentricity is required.",
       F::Eccentricity},
      {{{F::ShortName, "New"},
        {F::SemimajorAxis, "637800O"},
        {F::SemiminorAxis, "6357000"},
        {F::Flattening, "300"},
        {F::Eccentricity, "0.08"}},
       "The Semimajor Axis is not a numeric value.",
       F::SemimajorAxis},
      {{{F::ShortName, "Bad]Name"}},
       "The Short Name can not contain the ']' character.",
       F::ShortName}};
  for (const Case& c : cases) {
    EllipsoidEditor e(ui, app.path());
    e.load();
    Fill(e, c.fields);
    EXPECT_FALSE(e.ok()) << c.text;
    EXPECT_EQ(Take(ui), std::string("E Invalid Ellipsoid: Can not save Ellipsoid.  ") + c.text);
    EXPECT_EQ(e.takeFocus(), c.focus) << c.text;
    EXPECT_EQ(file("ellipsoids.ini"), kEllipsoids);
  }
}

TEST_F(CatalogEditorsTest, EllipsoidFlagsDuplicateQuestionsAndInverseFlattening) {
  using F = EllipsoidField;
  EllipsoidEditor e(ui, app.path());
  e.load();
  EXPECT_TRUE(e.isNew());
  EXPECT_FALSE(e.changed());
  EXPECT_EQ(e.entries(), (std::vector<std::string>{"GRS 80", "Clarke 1866", "Hidden"}));
  ASSERT_TRUE(e.select("GRS 80"));
  EXPECT_FALSE(e.isNew());
  EXPECT_EQ(e.text(F::Flattening), "298.257222101");
  e.edit(F::FullName, "GRS 1980");  // the loaded text: no change
  EXPECT_FALSE(e.changed());
  e.edit(F::FullName, "Geodetic Reference System 1980");
  EXPECT_TRUE(e.changed());

  // Loaded entry: "Save changes"; No abandons the edit and lets the selection go on.
  ASSERT_TRUE(e.select("Clarke 1866"));
  EXPECT_EQ(Take(ui),
            "  Save Ellipsoid Changes?: Save changes made to existing ellipsoid 'GRS 80'?");
  EXPECT_EQ(file("ellipsoids.ini"), kEllipsoids);

  // New entry under an existing name (any letter case): "Overwrite"; Yes writes f itself.
  ASSERT_TRUE(e.newEntry());
  EXPECT_EQ(e.takeFocus(), F::ShortName);
  Fill(e, {{F::ShortName, "clarke 1866"},
           {F::SemimajorAxis, "6378206.4"},
           {F::SemiminorAxis, "6356583.8"},
           {F::Flattening, "294.978698213898"},
           {F::Eccentricity, "0.082271854"}});
  e.check(F::Show, false);
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(e.ok());
  EXPECT_EQ(Take(ui),
            "  Overwrite Ellipsoid?: An ellipsoid with the short name 'clarke 1866' already "
            "exists. Would you like to overwrite it?");
  EXPECT_NE(file("ellipsoids.ini")
                .find("[Clarke 1866]\r\nFull Name=\r\nSemimajor Axis=6378206.4"
                      "\r\nSemiminor Axis=6356583.8\r\nFlattening="
                      "0.00339007530392879\r\nEccentricity=0.082271854\r\n"
                      "Show=0\r\n"),
            std::string::npos)
      << file("ellipsoids.ini");
}

TEST_F(CatalogEditorsTest, CloseQuestionAndDelete) {
  using F = EllipsoidField;
  EllipsoidEditor e(ui, app.path());
  e.load();
  EXPECT_FALSE(e.remove());  // nothing selected: nothing asked
  EXPECT_EQ(Take(ui), "");
  e.edit(F::ShortName, "Sphere");
  ui.answers = {Answer::Cancel};
  EXPECT_FALSE(e.close());
  ui.answers = {Answer::Yes};  // Yes runs the save, which refuses: stay
  EXPECT_FALSE(e.close());
  EXPECT_EQ(e.takeFocus(), F::SemimajorAxis);
  ui.answers = {Answer::No};
  EXPECT_TRUE(e.close());
  EXPECT_EQ(Take(ui),
            "  Save Ellipsoid Changes?: Changes were made to the current ellipsoid.  Would you "
            "like to save them?\n"
            "  Save Ellipsoid Changes?: Changes were made to the current ellipsoid.  Would you "
            "like to save them?\n"
            "E Invalid Ellipsoid: Can not save Ellipsoid.  A Semimajor Axis is required.\n"
            "  Save Ellipsoid Changes?: Changes were made to the current ellipsoid.  Would you "
            "like to save them?");

  e.load();
  ASSERT_TRUE(e.select("Clarke 1866"));
  EXPECT_FALSE(e.remove());  // No
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(e.remove());
  EXPECT_EQ(Take(ui),
            "  Delete Ellipsoid?: Are you sure you want to permanently delete the 'Clarke 1866' "
            "ellipsoid?\n"
            "  Delete Ellipsoid?: Are you sure you want to permanently delete the 'Clarke 1866' "
            "ellipsoid?");
  const size_t from = kEllipsoids.find("[Clarke"), to = kEllipsoids.find("[Hidden]");
  EXPECT_EQ(file("ellipsoids.ini"), kEllipsoids.substr(0, from) + kEllipsoids.substr(to));
  EXPECT_TRUE(e.isNew());
  EXPECT_EQ(e.entries(), (std::vector<std::string>{"GRS 80", "Hidden"}));
}

TEST_F(CatalogEditorsTest, SolverCompletesFromTheLeftFieldAndTheFirstOther) {
  struct Case {
    const char *a, *b, *f, *e;
    char leave;
    const char* result;  // "a|b|1/f|e" afterwards, or the box
  };
  const Case cases[] = {
      {"6378137", "", "", "0.0818191910428158", 'e',
       "6378137|6356752.31414036|298.257222101|0.0818191910428158"},
      {"6378137", "6356752.314245", "999", "", 'a',
       "6378137|6356752.314245|298.25722356049|0.0818191908429654"},
      {"6378137", "", "298.257223563", "", 'f',
       "6378137|6356752.31424518|298.257223563|0.0818191908426215"},
      {"6370000", "6370000", "", "", 'b', "6370000|6370000|0|0"},
      {"", "", "", "0.08", 'e', "|||0.08"},
      {"637x", "6356000", "", "", 'a', "C Non-numeric Value: Invalid Semimajor axis."},
      {"6356000", "6378000", "", "", 'b',
       "E Ellipsoid Parameter Error: Can not compute the Ellipsoid Flattening. The Semimajor "
       "Axis must be greater than the Semiminor Axis.\r\n\r\nFunction: "
       "modEllipsoids.Ellipsoids_GET_fab"},
      {"", "", "298", "0.08", 'f',
       "E Ellipsoid Parameter Error: Can not compute ellipsoid parameters. Two ellipsoidal "
       "parameters are required in any combination other than Flattening and "
       "Eccentricity.\r\n\r\nFunction: modEllipsoids.Ellipsoids_GET_Parameters"},
      {"6378137", "", "-298", "", 'f',
       "E Ellipsoid Parameter Error: The computed Ellipsoid Semiminor Axis is greater than the "
       "Semimajor Axis.  Check the other ellipsoid parameters.\r\n\r\nFunction: "
       "modEllipsoids.Ellipsoids_GET_baf"},
      {"1", "", "", "", 'x',
       "C Unknown Ellipsoid Parameter: Can not compute ellipsoid parameters. Received an "
       "unknown parameter."}};
  using F = EllipsoidField;
  for (const Case& c : cases) {
    EllipsoidEditor e(ui, app.path());
    e.load();
    Fill(e, {{F::SemimajorAxis, c.a},
             {F::SemiminorAxis, c.b},
             {F::Flattening, c.f},
             {F::Eccentricity, c.e}});
    e.leaveParameter(c.leave);
    std::string got = Take(ui);
    if (got.empty()) {
      got = e.text(F::SemimajorAxis) + "|" + e.text(F::SemiminorAxis) + "|" +
            e.text(F::Flattening) + "|" + e.text(F::Eccentricity);
    }
    EXPECT_EQ(got, c.result) << c.a << " " << c.b << " " << c.f << " " << c.e;
  }
}

// ---- datums --------------------------------------------------------------

TEST_F(CatalogEditorsTest, DatumTypesMethodsAndTargets) {
  using F = DatumField;
  DatumEditor d(ui, app.path());
  d.load();
  EXPECT_EQ(d.ellipsoids(), (std::vector<std::string>{"GRS 80", "Clarke 1866"}));
  d.edit(F::ShortName, "NAD 83");
  d.chooseType("Horizontal");
  EXPECT_EQ(d.methods().size(), 100u);
  EXPECT_EQ(d.methods().front(), "NADCON NAD 27 to NAD 83");
  EXPECT_EQ(d.targets(), (std::vector<std::string>{"NAD 27"}));
  d.chooseType("Vertical");
  EXPECT_FALSE(d.ellipsoidEnabled());
  EXPECT_EQ(d.methods().size(), 10u);
  EXPECT_EQ(d.methods().front(), "VERTCON NGVD 29 to NAVD 88");
  EXPECT_EQ(d.targets(), (std::vector<std::string>{"NAVD 88", "NGVD 29", "NAD 83 3D"}));
  d.chooseType("3D");
  EXPECT_EQ(d.methods().front(), "GEOID99 NAD 83 to NAVD 88");
  EXPECT_EQ(d.targets(), (std::vector<std::string>{"NAVD 88", "NGVD 29"}));
  d.chooseType("Geocentric");
  EXPECT_TRUE(d.methods().empty());
  EXPECT_EQ(Take(ui),
            "E Unknown Datum Type: Unknown Datum Type Selected. Can not load Transformation "
            "Methods.");
}

TEST_F(CatalogEditorsTest, DatumSaveOrderRowsAndRemovedRowsLoseTheirKeys) {
  using F = DatumField;
  DatumEditor d(ui, app.path());
  d.load();
  const std::pair<const char*, F> refusals[] = {
      {"A short name is required.", F::ShortName},
      {"A datum type is required.", F::Type},
      {"An ellipsoid is required.", F::Ellipsoid},
      {"Transformations are not fully defined.", F::Grid}};
  d.edit(F::FullName, "Test");
  for (const auto& [text, focus] : refusals) {
    EXPECT_FALSE(d.save());
    EXPECT_EQ(Take(ui), std::string("E Invalid Datum: Can not save datum. ") + text);
    EXPECT_EQ(d.takeFocus(), focus);
    if (focus == F::ShortName) d.edit(F::ShortName, "HPGN TN");
    if (focus == F::Type) d.chooseType("Horizontal");
    if (focus == F::Ellipsoid) {
      d.edit(F::Ellipsoid, "GRS 80");
      d.addRow();
      d.chooseTarget("NAD 83");
    }
  }
  EXPECT_EQ(file("datums.ini"), kDatums);
  d.chooseMethod("NADCON HPGN TN to NAD 83");
  d.addRow();
  d.chooseTarget("nad 83");  // already there: refused with a note
  EXPECT_EQ(Take(ui),
            "I Transformation Already Exists: A transformation to the 'nad 83' datum has already "
            "been defined.");
  d.removeRow();
  EXPECT_TRUE(d.ok());
  EXPECT_EQ(file("datums.ini"),
            kDatums + "\r\n" +
                CrLf({"[HPGN TN]", "Full Name=Test", "Type=Horizontal", "Ellipsoid=GRS 80",
                      "Show In=1", "Show Out=1", "NAD 83=NADCON HPGN TN to NAD 83"}));

  // Loading shows the rows; a removed row erases its key, a vertical datum has no ellipsoid.
  ASSERT_TRUE(d.select("NAD 83"));
  EXPECT_EQ(d.rows(), (std::vector<Transformation>{{"NAD 27", "NADCON NAD 83 to NAD 27"}}));
  d.selectRow(0);
  d.removeRow();
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(d.save());
  EXPECT_EQ(file("datums.ini").find("NADCON NAD 83 to NAD 27"), std::string::npos);
  ASSERT_TRUE(d.select("NAVD 88"));
  d.edit(F::Ellipsoid, "GRS 80");
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(d.save());
  EXPECT_NE(file("datums.ini")
                .find("[NAVD 88]\r\nFull Name=\r\nType=Vertical\r\nShow In=1\r\n"
                      "Show Out=1\r\n[NGVD 29]"),
            std::string::npos);
}

// ---- zones ---------------------------------------------------------------

TEST_F(CatalogEditorsTest, ZoneListsAndTheSectionWithoutTilde) {
  ZoneEditor z(ui, app.path());
  z.load();
  EXPECT_EQ(z.coordinateSystems(), (std::vector<std::string>{"State Plane 1983", "UTM"}));
  ASSERT_TRUE(z.chooseCoordinateSystem("State Plane 1983"));
  EXPECT_EQ(z.entries(), (std::vector<std::string>{"East", "West"}));
  EXPECT_EQ(z.choices(ZoneField::HorizontalDatum),
            (std::vector<std::string>{"NAD 83", "NAD 27", "NAD 83 3D"}));
  EXPECT_EQ(z.choices(ZoneField::VerticalDatum),
            (std::vector<std::string>{"", "NAVD 88", "NAD 83 3D"}));
  EXPECT_FALSE(z.changed());
  EXPECT_EQ(Take(ui), "");

  app.write("zones.ini", kZones + CrLf({"[Loose]", "Projection=Transverse Mercator"}));
  ZoneEditor broken(ui, app.path());
  broken.load();
  EXPECT_EQ(Take(ui), "E Error: Error loading coordinate systems.");
}

TEST_F(CatalogEditorsTest, ZoneSaveRefusesInOrder) {
  using F = ZoneField;
  ZoneEditor z(ui, app.path());
  z.load();
  z.edit(F::FullName, "New");
  z.edit(F::Projection, kObliqueMercator);
  const std::tuple<const char*, F, const char*> steps[] = {
      {"A Coordinate System is required.", F::CoordinateSystem, "A~B"},
      {"The Coordinate System can not contain the '~' character.", F::CoordinateSystem, "Test"},
      {"A Short Name is required.", F::ShortName, "x~y"},
      {"The Short Name can not contain the '~' character.", F::ShortName, "Skew"},
      {"A Horizontal Datum is required.", F::HorizontalDatum, "NAD 83"},
      {"A Central Latitude is required.", F::CentralLatitude, "57.00"},
      {"A Central Longitude is required.", F::CentralLongitude, "133.4"},
      {"A False Northing is required.", F::FalseNorthing, "-5000000"},
      {"A False Easting is required.", F::FalseEasting, "5OOOOOO"},
      {"The False Easting is not a numeric value.", F::FalseEasting, "5000000"},
      {"A Scale Factor is required.", F::ScaleFactor, "0.9999"},
      {"An Azimuth is required.", F::Azimuth, "abc"},
      {"The Azimuth is not a numeric value.", F::Azimuth, "323.07483685"},
      {"A Positive Latitude Direction is required.", F::LatitudeDirection, "N"},
      {"Linear Units are required.", F::LinearUnits, "Meters"},
      {"Angular Units are required.", F::AngularUnits, kFormatPacked}};
  z.edit(F::LatitudeDirection, "");
  z.edit(F::LinearUnits, "");
  z.edit(F::AngularUnits, "");
  for (const auto& [text, focus, value] : steps) {
    EXPECT_FALSE(z.save()) << text;
    EXPECT_EQ(Take(ui), std::string("E Invalid Zone: Can not save Zone.  ") + text);
    EXPECT_EQ(z.takeFocus(), focus) << text;
    z.edit(focus, value);
  }
  EXPECT_EQ(file("zones.ini"), kZones);
  // A computational ellipsoid asks first; No stops the save.
  z.edit(F::Ellipsoid, "Clarke 1866");
  EXPECT_FALSE(z.save());
  EXPECT_EQ(z.takeFocus(), F::Ellipsoid);
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(z.save());
  EXPECT_EQ(Take(ui),
            "  Override Datum Ellipsoid?: Specifying a computational ellipsoid will override the "
            "ellipsoid defined by the horizontal datum.  Are you sure you want to do this?\n"
            "  Override Datum Ellipsoid?: Specifying a computational ellipsoid will override the "
            "ellipsoid defined by the horizontal datum.  Are you sure you want to do this?");
  EXPECT_EQ(file("zones.ini"),
            kZones + "\r\n" +
                CrLf({"[Test~Skew]", "Full Name=New", "Horizontal Datum=NAD 83",
                      "Computational Ellipsoid=Clarke 1866", "Vertical Datum=",
                      "Projection=Oblique Mercator - Hotine", "Show In=1", "Show Out=1",
                      "Central Latitude=57.000000000", "Central Longitude=133.040000000",
                      "False Northing=-5000000", "False Easting=5000000", "Scale Factor=0.9999",
                      "Azimuth=323.074836850", "Positive Latitude Direction=N",
                      "Positive Longitude Direction=W", "Linear Units=Meters"}));
  EXPECT_EQ(z.listedSystem(), "Test");
  EXPECT_EQ(z.selected(), "Skew");
  EXPECT_FALSE(z.isNew());
}

TEST_F(CatalogEditorsTest, ZoneRatioScaleFactorsAndAngleFormats) {
  using F = ZoneField;
  ZoneEditor z(ui, app.path());
  z.load();
  ASSERT_TRUE(z.chooseCoordinateSystem("State Plane 1983"));
  ASSERT_TRUE(z.select("East"));
  EXPECT_EQ(z.panel(), 1);
  for (const auto& [typed, shown] :
       {std::pair{"1:25000", "0.99996"}, {"1:10000", "0.9999"}, {"0.9996", "0.9996"}}) {
    z.edit(F::ScaleFactor, typed);
    z.leaveScaleFactor();
    EXPECT_EQ(z.text(F::ScaleFactor), shown);
  }
  z.edit(F::ScaleFactor, "1:ten");
  z.leaveScaleFactor();
  EXPECT_EQ(Take(ui),
            "E Invalid Scale Factor: The Scale Factor must be a numeric value or a ratio in the "
            "format of '1:25000'");
  EXPECT_EQ(z.takeFocus(), F::ScaleFactor);
  z.edit(F::ScaleFactor, "1:25000");
  z.leaveScaleFactor();

  // The shown angles follow the format; storage is always packed.
  z.chooseAngularUnits(kFormatDMS);
  EXPECT_EQ(z.text(F::CentralLatitude), "36 40 00.00000");
  z.chooseAngularUnits(kFormatDecimal);
  EXPECT_EQ(z.text(F::CentralLongitude), "88.333333333");
  z.edit(F::CentralLatitude, "36.5");
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(z.ok());
  const std::string written = file("zones.ini");
  EXPECT_NE(written.find("Central Latitude=36.300000000\r\nCentral Longitude=88.200000000\r\n"
                         "False Northing=0\r\nFalse Easting=250000\r\nScale Factor=0.99996\r\n"),
            std::string::npos)
      << written;
  EXPECT_EQ(written.substr(written.find("\r\n\r\n")), kZones.substr(kZones.find("\r\n\r\n")));
}

TEST_F(CatalogEditorsTest, ZoneDeleteRefusedAfterTheCoordinateSystemChanged) {
  using F = ZoneField;
  ZoneEditor z(ui, app.path());
  z.load();
  ASSERT_TRUE(z.chooseCoordinateSystem("State Plane 1983"));
  ASSERT_TRUE(z.select("West"));
  z.edit(F::CoordinateSystem, "State Plane 1927");
  EXPECT_FALSE(z.remove());
  EXPECT_EQ(Take(ui),
            "I Can not Delete Zone: Can not delete zone. The coordinate system has changed.");
  z.edit(F::CoordinateSystem, "State Plane 1983");
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(z.remove());
  EXPECT_EQ(Take(ui),
            "  Delete Zone?: Are you sure you want to permanently delete the 'West' zone?");
  const size_t from = kZones.find("[State Plane 1983 ~"), to = kZones.find("[UTM");
  EXPECT_EQ(file("zones.ini"), kZones.substr(0, from) + kZones.substr(to));
  EXPECT_EQ(z.entries(), (std::vector<std::string>{"East"}));
  EXPECT_EQ(z.text(F::CoordinateSystem), "State Plane 1983");
  EXPECT_EQ(z.text(F::LinearUnits), "Meters");
}

}  // namespace
}  // namespace zv
