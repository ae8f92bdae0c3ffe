// Grid and local coordinates: the header scan, the recorded grid reference,
// the choice of dialog, and the two dialogs' rules without widgets.

#include <gtest/gtest.h>

#include <sstream>

#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"
#include "tools/Localization.h"

namespace zv {
namespace {

using test::CrLf;
using test::Take;

TEST(LocalizationTest, HeaderScanStopsAtTheFirstPoint) {
  struct Case {
    std::vector<std::string> lines;
    bool datum, zone;
  };
  const Case cases[] = {
      {{"AC:PR", "CS:State Plane 1983", "ZN:Wisconsin Central 4802", "HD:NAD 83", "AC:OS"},
       true,
       true},
      {{"AC:PR", "HD:NAD 83", "AC:OS", "PN:1"}, true, false},
      // Lines after the first point are never examined.
      {{"AC:PR", "AC:OS", "HD:NAD 83", "ZN:X"}, false, false},
      // Only exactly "AC:PR" keeps the header open.
      {{"AC:PR ", "HD:NAD 83", "ZN:X"}, false, false},
      {{"PR:job", "ZN:X", "HD:NAD 27"}, true, true},
      {{}, false, false},
  };
  for (const Case& c : cases) {
    std::istringstream in(CrLf(c.lines));
    const HeaderScan scan = ScanHeader(in);
    EXPECT_EQ(scan.horizontalDatum, c.datum) << CrLf(c.lines);
    EXPECT_EQ(scan.zone, c.zone) << CrLf(c.lines);
  }
}

TEST(LocalizationTest, RecordedGridReferenceTakesTheLastOfEachLine) {
  std::istringstream in(
      CrLf({"AC:PR", "CM:ORIGINAL HD:NAD 83", "CM:ORIGINAL HD:NAD 27", "CM:ORIGINAL ZN:4802",
            "CM:COMB. FACTOR =   0.99991234", "CM:other", "AC:OS", "CM:ORIGINAL ZN:0101"}));
  const RecordedGridReference r = ReadRecordedGridReference(in);
  EXPECT_EQ(r.horizontalDatum, "1927");
  EXPECT_EQ(r.zone, "4802");
  EXPECT_EQ(r.combinedFactor, "0.99991234");

  std::istringstream none(CrLf({"AC:PR", "UL:F", "AC:OS"}));
  const RecordedGridReference empty = ReadRecordedGridReference(none);
  EXPECT_EQ(empty.horizontalDatum + empty.zone + empty.combinedFactor, "");
}

TEST(LocalizationTest, LocalizeOpensTheDialogOfTheFilesDirection) {
  test::TempDir dir;
  ScriptedUi ui;
  std::string opened;
  RecordedGridReference seen;
  const LocalizeDialogs dialogs{
      [&](const std::string& in, const std::string& out) {
        opened = "grid " + in + " " + out;
        return true;
      },
      [&](const RecordedGridReference& r, const std::string& in, const std::string&) {
        opened = "local " + in;
        seen = r;
        return false;
      }};
  const std::string grid = dir.write("g.ctl", CrLf({"AC:PR", "ZN:Z", "HD:NAD 83", "AC:OS"}));
  EXPECT_TRUE(Localize(ui, grid, "o.ctl", dialogs));
  EXPECT_EQ(opened, "grid " + grid + " o.ctl");
  // An HD line without a ZN line: local.
  const std::string local =
      dir.write("l.ctl", CrLf({"AC:PR", "HD:NAD 83", "CM:ORIGINAL HD:X 05", "AC:OS"}));
  EXPECT_FALSE(Localize(ui, local, "o.ctl", dialogs));
  EXPECT_EQ(opened, "local " + local);
  EXPECT_EQ(seen.horizontalDatum, "1905");
  EXPECT_TRUE(ui.boxes.empty());

  EXPECT_FALSE(Localize(ui, dir.file("missing.ctl"), "o.ctl", dialogs));
  EXPECT_EQ(Take(ui), std::string("E VORN Zurevazidu: The file '").append(dir.file("missing.ctl")) +
                          "' can not be read.");
}

TEST(LocalizationTest, GridToLocalFormEnablesOneBoxAndChecksIt) {
  using Option = GridToLocalForm::Option;
  using Control = GridToLocalForm::Control;
  GridToLocalForm form;
  EXPECT_FALSE(form.box(Control::UserDefined).enabled);
  EXPECT_FALSE(form.box(Control::PointNumber).enabled);
  form.choose(Option::UserDefined);
  form.setText(Control::UserDefined, "0.9999");
  form.setText(Control::PointNumber, "12");  // disabled: ignored
  EXPECT_TRUE(form.box(Control::UserDefined).enabled);
  EXPECT_EQ(form.box(Control::PointNumber).text, "");
  form.choose(Option::PointNumber);
  EXPECT_EQ(form.box(Control::UserDefined).text, "");
  EXPECT_FALSE(form.box(Control::UserDefined).enabled);

  ScriptedUi ui;
  std::vector<GridToLocalRequest> runs;
  bool succeed = true;
  const GridToLocalRunner run = [&](const GridToLocalRequest& r) {
    runs.push_back(r);
    return succeed;
  };
  Control refused = Control::UserDefined;
  form.setText(Control::PointNumber, "P12");
  EXPECT_EQ(form.ok(ui, "in", "out", 1, 2, run, refused), LocalOk::Refused);
  EXPECT_EQ(refused, Control::PointNumber);
  EXPECT_EQ(Take(ui), "E VORN Zurevazidu: The specified point number is not a valid number.");
  form.choose(Option::UserDefined);
  form.setText(Control::UserDefined, "1,0002");
  EXPECT_EQ(form.ok(ui, "in", "out", 1, 2, run, refused), LocalOk::Refused);
  EXPECT_EQ(refused, Control::UserDefined);
  EXPECT_EQ(Take(ui), "E VORN Zurevazidu: The specified combined factor is not a valid number.");
  EXPECT_TRUE(runs.empty());

  form.setText(Control::UserDefined, " 1.0002 ");
  EXPECT_EQ(form.ok(ui, "in", "out", 1, 2, run, refused), LocalOk::Done);
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: Translation Complete");
  ASSERT_EQ(runs.size(), 1u);
  EXPECT_EQ(runs[0].mode, 2);
  EXPECT_EQ(runs[0].modeText, " 1.0002 ");
  EXPECT_EQ(runs[0].consoleLeft * 10 + runs[0].consoleTop, 12);
  // All points: no mode text whatever was typed before; a failed run shows
  // no completion.
  form.choose(Option::AllPoints);
  succeed = false;
  EXPECT_EQ(form.ok(ui, "in", "out", 0, 0, run, refused), LocalOk::Failed);
  EXPECT_EQ(runs.back().mode, 1);
  EXPECT_EQ(runs.back().modeText, "");
  EXPECT_TRUE(ui.boxes.empty());
}

class LocalToGridFormTest : public ::testing::Test {
 protected:
  LocalToGridFormTest() {
    app.write("Pintrel/zones.txt", CrLf({"# zones", "0401 California Zone 1", "4802 Wisconsin"}));
  }
  test::TempDir app;
  LocalToGridForm form;
  ScriptedUi ui;
};

TEST_F(LocalToGridFormTest, LoadPresetsWhatTheFileRecorded) {
  form.load(app.path(), {"1927", "4802", "0.9998"});
  ASSERT_EQ(form.datums().items.size(), 44u);
  EXPECT_EQ(form.datums().items[form.datums().selected].second, 1927);
  EXPECT_EQ(form.zones().items[form.zones().selected].first, "4802 Wisconsin");
  EXPECT_EQ(form.factor(), "0.9998");
  // A year the list does not hold, a zone that is no number: nothing chosen.
  form.load(app.path(), {"1905", "Wisconsin Central 4802", ""});
  EXPECT_EQ(form.datums().selected, -1);
  EXPECT_EQ(form.zones().selected, -1);
  EXPECT_EQ(form.factor(), "");
  // Enter in a list: the entry of the number typed, else no change.
  EXPECT_TRUE(form.zones().selectNumber("401"));
  EXPECT_FALSE(form.zones().selectNumber("4803"));
  EXPECT_EQ(form.zones().selected, 0);
}

TEST_F(LocalToGridFormTest, OkChecksInOrderThenRuns) {
  using Control = LocalToGridForm::Control;
  form.load(app.path(), {});
  std::vector<LocalToGridRequest> runs;
  const LocalToGridRunner run = [&](const LocalToGridRequest& r) {
    runs.push_back(r);
    return true;
  };
  struct Step {
    std::function<void()> change;
    const char* message;
    Control control;
  };
  const Step steps[] = {
      {[] {}, "You must select a horizontal datum.", Control::HorizontalDatum},
      {[&] { form.datums().selectNumber("1983"); }, "You must select a zone.", Control::Zone},
      {[&] { form.zones().selectNumber("401"); }, "You must specify a combined factor.",
       Control::CombinedFactor},
      {[&] { form.factor().append("x"); },
       "You specified an invalid value for the combined factor.", Control::CombinedFactor},
  };
  for (const Step& s : steps) {
    s.change();
    Control refused = Control::HorizontalDatum;
    EXPECT_EQ(form.ok(ui, "in", "out", 0, 0, run, refused), LocalOk::Refused);
    EXPECT_EQ(Take(ui), std::string("E VORN Zurevazidu: ") + s.message);
    EXPECT_EQ(refused, s.control) << s.message;
  }
  form.factor().assign(std::string_view("0.99993"));
  Control refused = Control::HorizontalDatum;
  EXPECT_EQ(form.ok(ui, "in", "out", 0, 0, run, refused), LocalOk::Done);
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: Translation Complete.");
  ASSERT_EQ(runs.size(), 1u);
  EXPECT_EQ(runs[0].datumYear + "|" + runs[0].zoneCode + "|" + runs[0].factor, "1983|0401|0.99993");
}

}  // namespace
}  // namespace zv
