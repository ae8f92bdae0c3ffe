// The FlexIn and FlexOut dialogs over their logic (tested on its own): the
// named controls, a stored format read, the grid's keys, the header box, the
// dialog opened through the engine seam and a conversion from the window.

#include <gtest/gtest.h>

#include <QApplication>
#include <QCheckBox>
#include <QComboBox>
#include <QLineEdit>
#include <QPushButton>
#include <QTableWidget>
#include <QTest>
#include <QTimer>
#include <filesystem>

#include "app/AppContext.h"
#include "app/dialogs/QtEngineDialogs.h"
#include "app/dialogs/TranslateWindow.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"
#include "userformats/dialogs/FlexDialogs.h"

namespace zv {
namespace {

using test::Take;

template <typename T>
T* Child(const QWidget* w, const std::string& name) {
  T* c = w->findChild<T*>(QString::fromStdString(name));
  EXPECT_NE(c, nullptr) << name;
  return c;
}

void Select(const QWidget* w, const std::string& list, const QString& item) {
  QComboBox* box = Child<QComboBox>(w, list);
  ASSERT_GE(box->findText(item), 0) << item.toStdString();
  box->setCurrentIndex(box->findText(item));
}

class FlexDialogsTest : public ::testing::Test {
 protected:
  FlexDialogsTest() {
    for (const char* name :
         {"zones.ini", "datums.ini", "ellipsoids.ini", "flexin.ini", "flexout.ini"})
      std::filesystem::copy_file(std::string(ZV_APP_DIR) + "/" + name, app.file(name));
    csv = app.write("points.csv", "1,100.5,200.25,10,CP\r\n2,101,201,11,IP\r\n");
  }
  test::TempDir app;
  ScriptedUi ui;
  MemorySettings settings;
  WorkArea work;
  std::string csv;
};

TEST_F(FlexDialogsTest, FlexInReadsWithAStoredFormatAndTheChosenReference) {
  FlexInDialog d(ui, app.path(), work, settings, csv);
  EXPECT_EQ(d.objectName(), "frmFlexIn");
  for (const char* name :
       {"cmbFlexInDelimiter", "cmbFlexInCoordType", "cmbFlexInColumns", "cmbFlexInLatDir"})
    Child<QComboBox>(&d, name);
  for (const char* name : {"cmdFlexInFormatNew", "cmdFlexInFormatDelete", "cmdFlexInCancel"})
    Child<QPushButton>(&d, name);
  Child<QLineEdit>(&d, "txtFlexInIgnore");
  EXPECT_FALSE(Child<QWidget>(&d, "fraFlexInColumns")->isEnabled());

  Select(&d, "cmbFlexInFormats", "PNEZD Comma");
  auto* grid = Child<QTableWidget>(&d, "grdFlexIn");
  ASSERT_EQ(grid->rowCount(), 5);
  EXPECT_EQ(grid->horizontalHeaderItem(1)->text(), "Column Order");
  EXPECT_EQ(Child<QLineEdit>(&d, "txtFlexInProjHeader")->text(), "");
  EXPECT_TRUE(Child<QWidget>(&d, "fraFlexInColumns")->isEnabled());
  EXPECT_FALSE(Child<QComboBox>(&d, "cmbFlexInLatDir")->isEnabled());

  // Without a coordinate system OK refuses and focuses the list.
  d.show();
  QApplication::setActiveWindow(&d);
  QTest::mouseClick(Child<QPushButton>(&d, "cmdFlexInOK"), Qt::LeftButton);
  EXPECT_EQ(Take(ui), "E Specify Coordinate System: You must specify a Coordiante System.");
  EXPECT_EQ(QApplication::focusWidget(), Child<QComboBox>(&d, "cmbFlexInCS"));

  Select(&d, "cmbFlexInCS", "State Plane 1983");
  Select(&d, "cmbFlexInZone", "Wisconsin South 4803");
  EXPECT_EQ(Child<QComboBox>(&d, "cmbFlexInHUnits")->currentText(), "U.S. Survey Feet");
  QTest::mouseClick(Child<QPushButton>(&d, "cmdFlexInOK"), Qt::LeftButton);
  EXPECT_TRUE(d.succeeded()) << test::Boxes(ui);
  ASSERT_EQ(work.InputPoints.size(), 2u);
  EXPECT_EQ(work.InputPoints[1].FeatureCode, "IP");
  EXPECT_EQ(work.InputHeader.Zone, "Wisconsin South 4803");
  EXPECT_EQ(settings.get("FlexIn", "Format", ""), "PNEZD Comma");
}

TEST_F(FlexDialogsTest, FlexOutGridKeysAndHeaderBox) {
  FlexOutDialog d(ui, app.path(), work, settings, app.file("out.csv"));
  auto* header = Child<QCheckBox>(&d, "chkFlexOutHeader");
  auto* prefix = Child<QLineEdit>(&d, "txtFlexOutHeader");
  EXPECT_FALSE(prefix->isEnabled());
  header->setChecked(true);
  EXPECT_TRUE(prefix->isEnabled() && Child<QWidget>(&d, "lblFlexOutHeader")->isEnabled());

  Select(&d, "cmbFlexOutCoordType", "Plane");
  auto* columns = Child<QComboBox>(&d, "cmbFlexOutColumns");
  for (const char* name : {"Point ID", "Northing"})
    emit columns->activated(columns->findText(name));
  auto* grid = Child<QTableWidget>(&d, "grdFlexOut");
  ASSERT_EQ(grid->rowCount(), 2);
  EXPECT_EQ(grid->horizontalHeaderItem(2)->text(), "Decimal Places");
  grid->setCurrentCell(0, 2);
  QTest::keyClick(grid, Qt::Key_3);
  EXPECT_EQ(Take(ui),
            "I Decimal Places Not Applicable: Decimal Places not applicable to 'Point ID'.");
  QTest::keyClick(grid, Qt::Key_3, Qt::KeypadModifier);
  grid->setCurrentCell(1, 1);
  QTest::keyClick(grid, Qt::Key_Backspace);
  QTest::keyClick(grid, Qt::Key_4);
  EXPECT_EQ(grid->item(0, 2)->text() + "|" + grid->item(1, 1)->text(), "3|4");
  EXPECT_TRUE(d.form().changed());
  Child<QPushButton>(&d, "cmdFlexOutRemove");
}

TEST_F(FlexDialogsTest, TheEngineSeamOpensTheDialogAndCancelFails) {
  AppContext ctx(ui, app.path());
  ctx.settings = &settings;
  QtEngineDialogs dialogs(ui);
  bool seen = false;
  QTimer::singleShot(50, [&] {
    QWidget* w = QApplication::activeModalWidget();
    seen = w && w->objectName() == "frmFlexOut";
    if (w) QTest::mouseClick(Child<QPushButton>(w, "cmdFlexOutCancel"), Qt::LeftButton);
  });
  EXPECT_FALSE(dialogs.flexOut(ctx, app.file("out.csv")));
  EXPECT_TRUE(seen);
  EXPECT_FALSE(std::filesystem::exists(app.file("out.csv")));
}

// The window's conversion reads a user-defined file through the FlexIn dialog.
TEST_F(FlexDialogsTest, TheWindowConvertsAUserDefinedFileThroughTheDialog) {
  std::filesystem::create_directories(app.file("UTIFiles"));
  std::filesystem::copy_file(std::string(ZV_APP_DIR) + "/UTIFiles/FLEX2CTL.uti",
                             app.file("UTIFiles/FLEX2CTL.uti"));
  AppContext ctx(ui, app.path());
  ctx.settings = &settings;
  QtEngineDialogs dialogs(ui);
  ctx.dialogs = &dialogs;
  TranslateWindow w(ctx);
  w.start();
  Child<QLineEdit>(&w, "txtInputLocation")->setText(QString::fromStdString(csv));
  Child<QLineEdit>(&w, "txtOutputLocation")->setText(QString::fromStdString(app.file("out.ctl")));
  int polls = 0;
  auto* timer = new QTimer(&w);
  QObject::connect(timer, &QTimer::timeout, [&] {
    QWidget* d = QApplication::activeModalWidget();
    if (++polls > 500 || (d && d->objectName() == "frmFlexIn")) timer->stop();
    if (!d || d->objectName() != "frmFlexIn") return;
    Select(d, "cmbFlexInFormats", "PNEZD Comma");
    Select(d, "cmbFlexInCS", "State Plane 1983");
    Select(d, "cmbFlexInZone", "Wisconsin South 4803");
    QTest::mouseClick(Child<QPushButton>(d, "cmdFlexInOK"), Qt::LeftButton);
  });
  timer->start(10);
  QTest::mouseClick(Child<QPushButton>(&w, "cmdTranslateOK"), Qt::LeftButton);
  EXPECT_EQ(ui.onlyText(), "Conversion Complete.");
  EXPECT_NE(test::ReadFile(app.file("out.ctl")).find("ZN:Wisconsin South 4803\r\n"),
            std::string::npos);
}

}  // namespace
}  // namespace zv
