// The catalog editors' windows over the shipped catalogs: opened from Edit
// Parameters, a zone added and one deleted with every other byte kept, the
// focus on a refused field, the solver on leaving a field, the datum grid.

#include <gtest/gtest.h>

#include <QApplication>
#include <QComboBox>
#include <QFocusEvent>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QTableWidget>
#include <QTest>
#include <QTimer>
#include <filesystem>

#include "coordui/CatalogEditorDialogs.h"
#include "coordui/CoordinateConversionDialog.h"
#include "coordui/EpsgImportDialog.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::ReadFile;
using test::Take;

template <typename T>
T* Child(const QWidget* w, const char* name) {
  T* c = w->findChild<T*>(name);
  EXPECT_NE(c, nullptr) << name;
  return c;
}

void Select(const QWidget* w, const char* list, const QString& item) {
  QComboBox* box = Child<QComboBox>(w, list);
  ASSERT_GE(box->findText(item), 0) << item.toStdString();
  box->setCurrentIndex(box->findText(item));
}

void Click(const QWidget* w, const char* button) {
  QTest::mouseClick(Child<QAbstractButton>(w, button), Qt::LeftButton);
}

// Types as the user does (replacing the text), optionally leaving the field.
void Type(const QWidget* w, const char* name, const QString& text, bool leave = false) {
  auto* edit = Child<QLineEdit>(w, name);
  edit->selectAll();
  QTest::keyClicks(edit, text);
  if (leave) {
    QFocusEvent out(QEvent::FocusOut, Qt::TabFocusReason);
    QApplication::sendEvent(edit, &out);
  }
}

QString Text(const QWidget* w, const char* name) {
  return Child<QLineEdit>(w, name)->text();
}

class CatalogEditorsDialogTest : public ::testing::Test {
 protected:
  CatalogEditorsDialogTest() {
    for (const char* name : {"zones.ini", "datums.ini", "ellipsoids.ini"}) {
      std::filesystem::copy_file(std::string(ZV_APP_DIR) + "/" + name, app.file(name));
    }
    zones = ReadFile(app.file("zones.ini"));
  }

  // Adds the zone "Test Zone" to State Plane 1983 in an open zone editor.
  static void AddZone(QWidget* w) {
    Select(w, "cmbZonesCS", "State Plane 1983");
    Click(w, "cmdZonesNew");
    Type(w, "txtZonesShortName", "Test Zone");
    Select(w, "cmbZonesHDatum", "NAD 83");
    Select(w, "cmbZonesProjection", "Transverse Mercator");
    EXPECT_TRUE(Child<QGroupBox>(w, "fraZonesParameters1")->isVisibleTo(w));
    EXPECT_FALSE(Child<QGroupBox>(w, "fraZonesParameters2")->isVisibleTo(w));
    Type(w, "txtZonesCentralLat1", "30.3");
    Type(w, "txtZonesCentralLong1", "85.5");
    Type(w, "txtZonesFalseNorthing1", "0");
    Type(w, "txtZonesFalseEasting1", "200000");
    Type(w, "txtZonesScaleFactor1", "1:25000", true);
    EXPECT_EQ(Text(w, "txtZonesScaleFactor1"), "0.99996");
    Click(w, "cmdZonesOK");
  }

  test::TempDir app;
  ScriptedUi ui;
  std::string zones;
};

TEST_F(CatalogEditorsDialogTest, EditParametersOpensTheEditorAndTheListsFollow) {
  MemorySettings store;
  store.save(kConversionSection, "Output Coordinate System", "State Plane 1983");
  store.save(kConversionSection, "Output Zone", "Alabama East 0101");
  ConversionState state;
  CoordinateConversionDialog d(ui, app.path(), state, store, ConversionDialogs{});
  d.load();
  d.setCatalogEditor([&](CatalogKind kind) { OpenCatalogEditor(ui, app.path(), kind, &d); });
  bool edited = false;
  QTimer::singleShot(0, [&] {
    QWidget* w = QApplication::activeModalWidget();
    ASSERT_NE(w, nullptr);
    EXPECT_EQ(w->objectName(), "frmZones");
    AddZone(w);
    edited = true;
    if (w->isVisible()) w->close();
  });
  ui.answers = {Answer::Ok};
  Click(&d, "cmdConvertFEdit");
  ASSERT_TRUE(edited);
  EXPECT_EQ(Take(ui),
            "  Edit Parameters?: Changing any of the values on the following dialog can result in "
            "incorrect coordinate values. Are you sure you want to proceed?");
  const std::string written = ReadFile(app.file("zones.ini"));
  EXPECT_EQ(written.substr(0, zones.size()), zones);
  EXPECT_NE(written.find("[State Plane 1983~Test Zone]\r\n"), std::string::npos);
  EXPECT_NE(written.find("Central Latitude=30.300000000\r\nCentral Longitude=85.500000000\r\n"
                         "False Northing=0\r\nFalse Easting=200000\r\nScale Factor=0.99996\r\n"),
            std::string::npos);
  auto* zoneOut = Child<QComboBox>(&d, "cmbConvertFZoneOut");
  EXPECT_GE(zoneOut->findText("Test Zone"), 0);
  EXPECT_EQ(zoneOut->currentText(), "Alabama East 0101");
}

TEST_F(CatalogEditorsDialogTest, DeleteKeepsEveryOtherByteAndRefusalsFocusTheField) {
  ZoneEditorDialog d(ui, app.path());
  Select(&d, "cmbZonesCS", "State Plane 1983");
  Select(&d, "cmbZones", "Alabama West 0102");
  EXPECT_EQ(Text(&d, "txtZonesShortName"), "Alabama West 0102");
  ui.answers = {Answer::Yes};
  Click(&d, "cmdZonesDelete");
  EXPECT_EQ(Take(ui),
            "  Delete Zone?: Are you sure you want to permanently delete the 'Alabama West 0102' "
            "zone?");
  const size_t from = zones.find("[State Plane 1983~Alabama West 0102]");
  const size_t to = zones.find("\n[", from) + 1;
  EXPECT_EQ(ReadFile(app.file("zones.ini")), zones.substr(0, from) + zones.substr(to));
  EXPECT_EQ(Child<QComboBox>(&d, "cmbZones")->findText("Alabama West 0102"), -1);

  Type(&d, "txtZonesFullName", "Nameless");
  Click(&d, "cmdZonesOK");
  EXPECT_EQ(Take(ui), "E Invalid Zone: Can not save Zone.  A Short Name is required.");
  EXPECT_EQ(d.focusWidget(), Child<QLineEdit>(&d, "txtZonesShortName"));
  EXPECT_EQ(d.result(), QDialog::Rejected);
}

TEST_F(CatalogEditorsDialogTest, AnImportedZoneFillsANewEntry) {
  ZoneImporter importer = [](QWidget*) {
    ZoneRecord z;
    z.zone = "Wisconsin Central (ftUS)";
    z.fullName = "EPSG:2288 NAD83 / Wisconsin Central (ftUS)";
    z.horizontalDatum = "NAD 83";
    z.projection = "Lambert Conformal Conic - Two Parallels";
    z.centralLatitude.text = "43.500000000";
    z.northernParallel.text = "45.300000000";
    z.linearUnits = "U.S. Survey Feet";
    return std::optional<ZoneRecord>(z);
  };
  ZoneEditorDialog d(ui, app.path(), importer);
  Select(&d, "cmbZonesCS", "State Plane 1983");
  Click(&d, "cmdZonesImport");
  EXPECT_EQ(Text(&d, "txtZonesShortName"), "Wisconsin Central (ftUS)");
  EXPECT_EQ(Text(&d, "txtZonesNorthParallel2"), "45.300000000");
  EXPECT_TRUE(Child<QGroupBox>(&d, "fraZonesParameters2")->isVisibleTo(&d));
  EXPECT_EQ(Child<QComboBox>(&d, "cmbZonesCS")->currentText(), "State Plane 1983");
  EXPECT_EQ(Child<QComboBox>(&d, "cmbZonesLinearUnits2")->currentText(), "U.S. Survey Feet");
  EXPECT_TRUE(d.editor().changed() && d.editor().isNew());
}

TEST_F(CatalogEditorsDialogTest, TheImportDialogListsCandidatesWithTheirRefusals) {
  EpsgImportDialog d;
  Type(&d, "txtEpsgQuery", "Wisconsin Central");
  Click(&d, "cmdEpsgSearch");
  auto* list = Child<QListWidget>(&d, "lstEpsgCandidates");
  if (list->count() == 0) GTEST_SKIP() << Child<QLabel>(&d, "lblEpsgStatus")->text().toStdString();
  ASSERT_TRUE(d.chosen().has_value());
  EXPECT_NE(d.chosen()->name.find("Wisconsin Central"), std::string::npos);
  for (int i = 0; i < list->count(); ++i) {
    // Refused systems are shown with their reason and cannot be chosen.
    EXPECT_EQ(list->item(i)->text().endsWith(")") && list->item(i)->text().contains("  ("),
              list->item(i)->flags() == Qt::NoItemFlags);
  }
}

TEST_F(CatalogEditorsDialogTest, EllipsoidSolverOnLeavingAndDatumGrid) {
  EllipsoidEditorDialog e(ui, app.path());
  Click(&e, "cmdEllipsoidsNew");
  Type(&e, "txtEllipsoidsSemimajor", "6378137");
  Type(&e, "txtEllipsoidsEccentricity", "0.0818191910428158", true);
  EXPECT_EQ(Text(&e, "txtEllipsoidsSemiminor"), "6356752.31414036");
  EXPECT_EQ(Text(&e, "txtEllipsoidsFlattening"), "298.257222101");
  ui.answers = {Answer::No};
  Click(&e, "cmdEllipsoidsCancel");  // the close question; No closes unsaved
  EXPECT_EQ(Take(ui),
            "  Save Ellipsoid Changes?: Changes were made to the current ellipsoid.  Would you "
            "like to save them?");
  EXPECT_EQ(ReadFile(app.file("ellipsoids.ini")),
            ReadFile(std::string(ZV_APP_DIR) + "/ellipsoids.ini"));

  DatumEditorDialog d(ui, app.path());
  Select(&d, "cmbDatums", "NAD 27");
  auto* grid = Child<QTableWidget>(&d, "grdDatumsTrans");
  ASSERT_GE(grid->rowCount(), 1);
  EXPECT_EQ(grid->item(0, 0)->text() + "|" + grid->item(0, 1)->text(),
            "NAD 83|NADCON NAD 27 to NAD 83");
  Click(&d, "cmdDatumsTransAdd");
  EXPECT_TRUE(Child<QComboBox>(&d, "cmbDatumsTransDatum")->isEnabled());
  Select(&d, "cmbDatumsTransDatum", "NAD 83");
  EXPECT_EQ(Take(ui),
            "I Transformation Already Exists: A transformation to the 'NAD 83' datum has already "
            "been defined.");
  Click(&d, "cmdDatumsOK");  // No to the save question abandons the edit
  EXPECT_EQ(Take(ui), "  Save Datum Changes?: Save changes made to existing datum 'NAD 27'?");
  EXPECT_EQ(d.result(), QDialog::Accepted);
  EXPECT_EQ(ReadFile(app.file("datums.ini")), ReadFile(std::string(ZV_APP_DIR) + "/datums.ini"));
}

}  // namespace
}  // namespace zv
