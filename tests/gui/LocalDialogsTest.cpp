// The grid-to-local and local-to-grid dialogs over their logic (tested on
// its own): control names, enabling, presets, Enter in a list, focus after a
// refusal, and the request OK hands to the tool.

#include <gtest/gtest.h>

#include <QComboBox>
#include <QLineEdit>
#include <QRadioButton>
#include <QTest>
#include <cmath>

#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"
#include "tools/dialogs/GridToLocalDialog.h"
#include "tools/dialogs/LocalToGridDialog.h"

namespace zv {
namespace {

using test::Take;

template <typename T>
T* Child(const QWidget* w, const char* name) {
  T* c = w->findChild<T*>(name);
  EXPECT_NE(c, nullptr) << name;
  return c;
}

void Click(const QWidget* w, const char* name) {
  QTest::mouseClick(Child<QAbstractButton>(w, name), Qt::LeftButton);
}

TEST(LocalDialogs, GridToLocalEnablesTheChosenBoxAndSendsItsText) {
  ScriptedUi ui;
  std::vector<GridToLocalRequest> runs;
  GridToLocalDialog dialog(ui, "in.ctl", "out.ctl", [&](const GridToLocalRequest& r) {
    runs.push_back(r);
    return true;
  });
  dialog.show();
  auto* factor = Child<QLineEdit>(&dialog, "txtUserDefined");
  auto* point = Child<QLineEdit>(&dialog, "txtPointNumber");
  EXPECT_TRUE(Child<QRadioButton>(&dialog, "optAllXYZ")->isChecked());
  EXPECT_FALSE(factor->isEnabled() || point->isEnabled());

  Click(&dialog, "optPointNumber");
  EXPECT_TRUE(point->isEnabled());
  QTest::keyClicks(point, "12");
  Click(&dialog, "optUserDefined");
  EXPECT_FALSE(point->isEnabled());
  EXPECT_EQ(point->text(), "");
  QTest::keyClicks(factor, "0.99x");
  Click(&dialog, "cmdOK");
  EXPECT_EQ(Take(ui), "E VORN Zurevazidu: The specified combined factor is not a valid number.");
  EXPECT_EQ(dialog.focusWidget(), factor);
  EXPECT_TRUE(runs.empty());

  factor->clear();
  QTest::keyClicks(factor, "0.9999");
  Click(&dialog, "cmdOK");
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: Translation Complete");
  ASSERT_EQ(runs.size(), 1u);
  EXPECT_EQ(runs[0].mode, 2);
  EXPECT_EQ(runs[0].modeText, "0.9999");
  // The console centred below the dialog.
  const QRect frame = dialog.frameGeometry();
  EXPECT_EQ(runs[0].consoleLeft, std::lround(frame.x() + frame.width() / 2.0) - 320);
  EXPECT_EQ(runs[0].consoleTop, frame.y() + frame.height());
  EXPECT_EQ(dialog.result(), QDialog::Accepted);
}

TEST(LocalDialogs, LocalToGridPresetsTheRecordedReference) {
  test::TempDir app;
  app.write("Pintrel/zones.txt", "# zones\r\n0401 California Zone 1\r\n4802 Wisconsin\r\n");
  ScriptedUi ui;
  std::vector<LocalToGridRequest> runs;
  LocalToGridDialog dialog(ui, app.path(), {"1983", "4802", ""}, "in.ctl", "out.ctl",
                           [&](const LocalToGridRequest& r) {
                             runs.push_back(r);
                             return false;  // the tool failed: the dialog stays
                           });
  dialog.show();
  auto* zones = Child<QComboBox>(&dialog, "cmbZones");
  auto* factor = Child<QLineEdit>(&dialog, "txtCombinedFactor");
  EXPECT_EQ(Child<QComboBox>(&dialog, "cmbHorDatum")->currentText(), "NAD 1983");
  EXPECT_EQ(zones->currentText(), "4802 Wisconsin");
  EXPECT_EQ(factor->text(), "");

  Click(&dialog, "cmdOK");
  EXPECT_EQ(Take(ui), "E VORN Zurevazidu: You must specify a combined factor.");
  EXPECT_EQ(dialog.focusWidget(), factor);

  // Enter selects the entry of the number typed.
  zones->lineEdit()->selectAll();
  QTest::keyClicks(zones->lineEdit(), "401");
  QTest::keyClick(zones->lineEdit(), Qt::Key_Return);
  EXPECT_EQ(zones->currentText(), "0401 California Zone 1");
  EXPECT_TRUE(runs.empty());
  QTest::keyClicks(factor, "1.00012");
  // Enter on the entry as shown answers the dialog.
  QTest::keyClick(zones->lineEdit(), Qt::Key_Return);
  ASSERT_EQ(runs.size(), 1u);
  EXPECT_EQ(runs[0].datumYear + "|" + runs[0].zoneCode + "|" + runs[0].factor, "1983|0401|1.00012");
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_TRUE(dialog.isVisible());
}

}  // namespace
}  // namespace zv
