// The user format dialogs' rules without widgets, the unattended choice of
// format and reference, and user-defined files through both dispatchers.

#include <gtest/gtest.h>

#include <filesystem>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "app/Routines.h"
#include "geodesy/Angles.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/ScriptedUi.h"
#include "platform/Strings.h"
#include "support/Boxes.h"
#include "support/TempDir.h"
#include "survey/SurveyFiles.h"
#include "userformats/FlexForm.h"
#include "userformats/FlexUnattended.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::Take;

const std::string kUser = "User-Defined ASCII Files (*.*)";
const std::string kCtl = "VORN Control Files (*.CTL)";

// An application folder with the shipped catalogs, user formats and samples.
class FlexFixture : public ::testing::Test {
 protected:
  FlexFixture() {
    test::InstallCatalogs(app.path());
    for (const char* name : {"flexin.ini", "flexout.ini"})
      fs::copy_file(std::string(ZV_APP_DIR) + "/" + name, app.file(name));
    fs::copy(std::string(ZV_APP_DIR) + "/samples", app.file("samples"));
  }
  std::string sample(const std::string& name) const { return app.file("samples/" + name); }
  test::TempDir app;
  ScriptedUi ui;
  MemorySettings settings;
};

std::string Rows(const FlexForm& form) {
  std::string all;
  for (const FlexRow& r : form.rows()) all += r.name + "=" + r.order + "/" + r.decimals + ";";
  return all;
}

class FlexFormTest : public FlexFixture {
 protected:
  FlexForm in{FlexDirection::In, ui, app.path()};
  FlexForm out{FlexDirection::Out, ui, app.path()};
};

TEST_F(FlexFormTest, LoadingAFormatShowsItAloneAndUnchanged) {
  in.open();
  EXPECT_EQ(in.formats(), (std::vector<std::string>{"PNEZD Comma", "PNEZD Space", "PNEZD Fixed",
                                                    "Geographic PLLHD"}));
  EXPECT_FALSE(in.columnsEnabled());
  in.loadFormat("PNEZD Fixed", settings);
  EXPECT_EQ(Rows(in),
            "Point ID=1/;Northing=11/;Easting=25/;Orthometric Height=39/;Feature Code=49/;");
  EXPECT_EQ(in.gridHeading(), "Column Position");
  EXPECT_EQ(in.projectHeaderPrefix + "|" + in.ignorePrefix, "PRJ|#");
  EXPECT_TRUE(in.columnsEnabled());
  EXPECT_FALSE(in.changed());
  // A second format replaces the first one's columns and order cells.
  in.loadFormat("Geographic PLLHD", settings);
  EXPECT_EQ(Rows(in), "Point ID=1/;Latitude=2/;Longitude=3/;Ellipsoid Height=4/;Feature Code=5/;");
  EXPECT_EQ(in.gridHeading(), "Column Order");

  out.open();
  out.loadFormat("PNEZD Comma", settings);
  EXPECT_EQ(Rows(out),
            "Point ID=1/;Northing=2/3;Easting=3/3;Orthometric Height=4/3;Feature Code=5/;");
  EXPECT_TRUE(out.writeHeader);
  EXPECT_EQ(out.headerPrefix, "#");
}

TEST_F(FlexFormTest, ColumnsAndCellsFollowTheGridRules) {
  out.open();
  out.setDelimiter("Comma");
  EXPECT_TRUE(out.changed());
  for (const char* name : {"Point ID", "Attribute", "Northing", "Attribute", "Northing"})
    out.addColumn(name);
  EXPECT_EQ(Rows(out), "Point ID=1/;Attribute=2/;Northing=3/;Attribute=4/;");
  out.removeColumn(0);  // the others keep their numbers
  EXPECT_EQ(Rows(out), "Attribute=2/;Northing=3/;Attribute=4/;");
  out.typeInCell(1, 1, CellKey::Digit, '7');
  out.typeInCell(1, 2, CellKey::Digit, '3');
  out.typeInCell(1, 2, CellKey::KeypadDigit, '1');
  out.typeInCell(0, 1, CellKey::Backspace);
  out.typeInCell(2, 1, CellKey::Delete);
  EXPECT_TRUE(Take(ui).empty());
  // Text columns take no decimals from the main keyboard; the keypad is not checked.
  out.typeInCell(0, 2, CellKey::Digit, '2');
  EXPECT_EQ(Take(ui),
            "I Decimal Places Not Applicable: Decimal Places not applicable to 'Attribute'.");
  out.typeInCell(0, 2, CellKey::KeypadDigit, '2');
  EXPECT_EQ(Rows(out), "Attribute=/2;Northing=37/31;Attribute=/;");

  // Fixed positions leave the new row's position for the user.
  in.open();
  in.setDelimiter(kColumnSpecific);
  in.addColumn("Point ID");
  EXPECT_EQ(Rows(in), "Point ID=/;");
}

TEST_F(FlexFormTest, CoordinateTypeOffersItsColumnsAndTheRememberedReference) {
  settings.save("FlexIn", "Coordinate System", "State Plane 1983");
  settings.save("FlexIn", "Zone", "Wisconsin South 4803");
  settings.save("FlexIn", "Vertical Datum", "None");
  settings.save("FlexIn", "Latitude Direction", "S");
  in.open();
  in.chooseCoordinateType(kPlane, settings);
  auto selected = [&] {
    std::string all;
    for (FlexList l : kFlexLists)
      all += in.list(l).selected + (in.list(l).enabled ? "" : "(off)") + "|";
    return all;
  };
  // The zone brings its datums and units; the remembered "None" overrides its datum.
  EXPECT_EQ(selected(),
            "State Plane 1983|Wisconsin South 4803|NAD 83|U.S. Survey Feet|None|U.S. Survey "
            "Feet(off)|(off)|(off)|");
  EXPECT_EQ(in.offeredColumns()[1], "Northing");
  in.chooseCoordinateType(kGeographic, settings);
  EXPECT_EQ(selected(), "Geographic Coordinates|(off)|||None|(off)|S|W|");
  EXPECT_EQ(in.list(FlexList::HorizontalUnits).items, AngleFormatNames());
  EXPECT_EQ(in.offeredColumns()[1], "Latitude");
  in.choose(FlexList::VerticalDatum, "NAD 83 Ellipsoid");
  EXPECT_TRUE(in.list(FlexList::VerticalUnits).enabled);
}

TEST_F(FlexFormTest, OkChecksInOrderAndNamesTheControl) {
  in.open();
  std::vector<std::string> titles;
  auto step = [&] {
    std::optional<FlexRefusal> r = in.validate();
    titles.push_back(r ? r->title + (r->row >= 0 ? "@" + std::to_string(r->row) : "") : "pass");
  };
  step();
  in.setDelimiter(kColumnSpecific);
  step();
  in.chooseCoordinateType(kGeographic, settings);
  step();
  in.addColumn("Point ID");
  in.addColumn("Latitude");
  step();
  in.typeInCell(0, 1, CellKey::Digit, '1');
  in.typeInCell(1, 1, CellKey::Digit, '9');
  in.choose(FlexList::LatitudeDirection, "N");
  in.choose(FlexList::LongitudeDirection, "W");
  step();
  in.choose(FlexList::HorizontalDatum, "NAD 83");
  step();
  in.choose(FlexList::HorizontalUnits, kFormatDMS);
  step();
  in.choose(FlexList::VerticalDatum, "None");  // disables the vertical units: none needed
  step();
  EXPECT_EQ(titles, (std::vector<std::string>{
                        "Delimiter Required", "Specify Coordiante Type", "Specify Columns",
                        "Specify Column@0", "Specify Horizontal Datum", "Specify Horizontal Units",
                        "Specify Vertical Datum", "pass"}));
}

TEST_F(FlexFormTest, OkAsksAboutChangesThenReadsAndRemembers) {
  WorkArea work;
  FlexRefusal focus;
  const std::string csv = sample("sample-pnezd.csv");
  settings.save("FlexIn", "Coordinate System", "State Plane 1983");
  settings.save("FlexIn", "Zone", "Wisconsin South 4803");
  in.open();
  in.loadFormat("PNEZD Comma", settings);
  in.addColumn("Attribute");
  in.newFormat();
  // Yes with no name: nothing read, the focus on the name.
  ui.answers = {Answer::Yes};
  EXPECT_FALSE(in.accept(work, settings, csv, focus));
  EXPECT_EQ(Take(ui),
            "  Save Changes?: Changes have been made to the format. Do you wish to save them?\n"
            "I Format Name Required: A Name is required to save the format.  Please specify a "
            "format name.");
  EXPECT_EQ(focus.control, FlexControl::FormatName);
  ui.answers = {Answer::Cancel};
  EXPECT_FALSE(in.accept(work, settings, csv, focus));
  EXPECT_TRUE(work.InputPoints.empty());
  // Saved under a new name, read, and the choices remembered.
  in.setFormatName("With Notes");
  ui.answers = {Answer::Yes};
  ASSERT_TRUE(in.accept(work, settings, csv, focus)) << test::Boxes(ui);
  EXPECT_EQ(in.formats().back(), "With Notes");
  EXPECT_EQ(FlexStore::Input(app.path()).loadInput("With Notes").columns.back(), "Attribute");
  ASSERT_FALSE(work.InputPoints.empty());
  EXPECT_EQ(work.InputHeader.Zone + "|" + work.InputPoints[0].HorizontalUnits,
            "Wisconsin South 4803|U.S. Survey Feet");
  EXPECT_EQ(
      settings.get("FlexIn", "Format", "") + "|" + settings.get("FlexIn", "Horizontal Datum", ""),
      "With Notes|NAD 83");

  // A prefix edited alone is used without the question.
  ui.boxes.clear();
  in.loadFormat("PNEZD Comma", settings);
  in.ignorePrefix = "";
  EXPECT_FALSE(in.accept(work, settings, csv, focus));
  const std::string boxes = Take(ui);
  EXPECT_NE(boxes.find("is not a number."), std::string::npos) << boxes;
  EXPECT_EQ(boxes.find("Save Changes?"), std::string::npos) << boxes;

  // Delete asks first.
  in.setFormatName("With Notes");
  ui.answers = {Answer::No};
  EXPECT_FALSE(in.deleteFormat());
  ui.answers = {Answer::Yes};
  EXPECT_TRUE(in.deleteFormat());
  EXPECT_EQ(Take(ui),
            "  Delete Format?: Are you sure you want to permanently delete the 'With Notes' "
            "format?\n  Delete Format?: Are you sure you want to permanently delete the 'With "
            "Notes' format?");
  EXPECT_FALSE(FlexStore::Input(app.path()).hasFormat("With Notes"));
  EXPECT_EQ(in.formatName(), "");
}

// The unattended choice: the format named (else remembered), each reference
// value from the format's section, else (output) the points' header, else
// remembered.
TEST_F(FlexFixture, UnattendedChoicesComeFromTheFormatThenTheRememberedValues) {
  const FlexStore store = FlexStore::Output(app.path());
  store.writeValue("PNEZD Space", "Vertical Units", "");
  store.writeValue("PNEZD Space", "Horizontal Units", "Feet");
  store.writeValue("PNEZD Comma", "Horizontal Units", "");
  // The zone and datums of the points' own header; the units of the format.
  FileHeader header;
  header.CoordinateSystem = "State Plane 1983";
  header.Zone = "Wisconsin Central 4802";
  header.VerticalDatum = "NAVD 88";
  header.HorizontalUnits = "Meters";
  std::optional<FlexOutChoices> c =
      UnattendedFlexOutChoices(ui, app.path(), settings, "PNEZD Fixed", &header);
  ASSERT_TRUE(c);
  EXPECT_EQ(c->formatName + "|" + c->zone + "|" + c->horizontalUnits + "|" + c->verticalDatum,
            "PNEZD Fixed|Wisconsin Central 4802|U.S. Survey Feet|NAVD 88");
  c = UnattendedFlexOutChoices(ui, app.path(), settings, "Geographic PLLHD", &header);
  ASSERT_TRUE(c);
  EXPECT_EQ(c->coordinateSystem + "|" + c->zone, "Geographic Coordinates|");
  settings.save("FlexOut", "Horizontal Units", "Meters");
  settings.save("FlexOut", "Format", "PNEZD Comma");
  c = UnattendedFlexOutChoices(ui, app.path(), settings, "");
  ASSERT_TRUE(c);
  EXPECT_EQ(c->formatName + "|" + c->horizontalUnits, "PNEZD Comma|Meters");
  EXPECT_TRUE(ui.boxes.empty());

  const std::string path = store.path();
  const std::pair<std::string, std::string> refused[] = {
      {"PNEZD Space",
       "E Invalid Horizontal Units: The Horizontal Units 'Feet' of the format 'PNEZD Space' of '" +
           path + "' must be 'Meters', 'U.S. Survey Feet' or 'International Feet'."},
      {"Nothing Like It",
       "E Format Not Found: The format 'Nothing Like It' can not be found in '" + path + "'."},
  };
  for (const auto& [name, box] : refused) {
    EXPECT_FALSE(UnattendedFlexOutChoices(ui, app.path(), settings, name));
    EXPECT_EQ(Take(ui), box);
  }
  store.writeValue("PNEZD Space", "Horizontal Units", "Meters");
  EXPECT_FALSE(UnattendedFlexOutChoices(ui, app.path(), settings, "PNEZD Space"));
  EXPECT_EQ(Take(ui),
            "E Specify Vertical Units: You must specify the Vertical Units.\r\nThe format "
            "'PNEZD Space' of '" +
                path +
                "' has no key \"Vertical Units\", and none is remembered under "
                "\"FlexOut\".");
  MemorySettings fresh;
  EXPECT_FALSE(UnattendedFlexInChoices(ui, app.path(), fresh, ""));
  EXPECT_EQ(ui.boxes.at(0).title, "Format Required");
}

// Records the dialogs opened by the window's conversion.
class RecordingDialogs : public EngineDialogs {
 public:
  bool coordinateConversion(AppContext&, ConversionState&, bool) override { return false; }
  bool enterPoint(const ManualEntrySetup&, SurveyPoint&) override { return false; }
  void showReport(const std::string&) override {}
  bool flexIn(AppContext&, const std::string& path) override {
    calls.push_back("in " + path);
    return false;
  }
  std::vector<std::string> calls;
};

class FlexRunTest : public FlexFixture {
 protected:
  FlexRunTest() : ctx(ui, app.path()) {
    ctx.settings = &settings;
    ctx.dialogs = &dialogs;
    fs::copy(std::string(ZV_APP_DIR) + "/UTIFiles", app.file("UTIFiles"));
  }
  bool translate(const std::string& definition, const std::string& in, const std::string& out,
                 const std::string& format = "") {
    return Translate(ctx, {app.file("UTIFiles/" + definition + ".uti"), in, out, format});
  }
  RecordingDialogs dialogs;
  AppContext ctx;
};

// Every shipped format reads its sample into a control file, and writes a
// control file that reads back the same.
TEST_F(FlexRunTest, UnattendedRunsUseTheNamedFormatBothWays) {
  const std::pair<std::string, std::string> formats[] = {
      {"PNEZD Comma", "sample-pnezd.csv"},
      {"PNEZD Space", "sample-pnezd.txt"},
      {"PNEZD Fixed", "sample-pnezd-fixed.txt"},
      {"Geographic PLLHD", "sample-geographic.csv"}};
  for (const auto& [format, file] : formats) {
    SCOPED_TRACE(format);
    ASSERT_TRUE(translate("FLEX2CTL", sample(file), app.file(format + ".ctl"), format));
    EXPECT_TRUE(ui.boxes.empty()) << test::Boxes(ui);
  }
  for (const auto& [format, file] : formats) {
    SCOPED_TRACE(format);
    const bool geographic = format == "Geographic PLLHD";
    const std::string ctl = app.file(geographic ? format + ".ctl" : "PNEZD Comma.ctl");
    const std::string back = app.file(format + ".back");
    ASSERT_TRUE(translate("CTL2FLEX", ctl, back, format)) << test::Boxes(ui);
    EXPECT_TRUE(ui.boxes.empty()) << test::Boxes(ui);
    WorkArea first, second;
    ASSERT_TRUE(ReadControlFile(ui, first, ctl));
    const std::optional<FlexInChoices> choices =
        UnattendedFlexInChoices(ui, app.path(), settings, format);
    ASSERT_TRUE(choices && FlexIn(ui, second, app.path(), back, *choices)) << test::Boxes(ui);
    ASSERT_EQ(first.InputPoints.size(), second.InputPoints.size());
    ASSERT_GE(first.InputPoints.size(), 4u);
    const SurveyPoint &a = first.InputPoints[1], &b = second.InputPoints[1];
    // (a fixed-position ID again with its blanks)
    EXPECT_EQ(a.PointName + "|" + a.FeatureCode,
              std::string(Trim(b.PointName)) + "|" + b.FeatureCode);
    EXPECT_NEAR(geographic ? a.Latitude : a.Northing, geographic ? b.Latitude : b.Northing,
                geographic ? 1e-9 : 0.0005);
    EXPECT_EQ(first.InputHeader.Zone, geographic ? "" : "Wisconsin South 4803");
  }
  // The format last used in the window, when none is named; none at all is refused.
  settings.save("FlexIn", "Format", "PNEZD Comma");
  EXPECT_TRUE(translate("FLEX2CTL", sample("sample-pnezd.csv"), app.file("last.ctl")));
  MemorySettings fresh;
  ctx.settings = &fresh;
  EXPECT_FALSE(translate("CTL2FLEX", app.file("last.ctl"), app.file("none.csv")));
  EXPECT_EQ(ui.boxes.at(0).title, "Format Required");
  EXPECT_FALSE(fs::exists(app.file("none.csv")));
  EXPECT_TRUE(dialogs.calls.empty());
}

TEST_F(FlexRunTest, TheWindowReadsThroughTheDialog) {
  RoutineCall call{sample("sample-pnezd.csv"), app.file("out.ctl"), "", kUser, kCtl, "x"};
  EXPECT_FALSE(ConvertFile(ctx, call));
  EXPECT_EQ(dialogs.calls, std::vector<std::string>{"in " + call.inputPath});
  EXPECT_FALSE(fs::exists(call.outputPath));
}

}  // namespace
}  // namespace zv
