// The coordinate conversion dialogs over their logic (tested on its own):
// controls and focus, Edit Parameters, the manual entry, dialogs asked for by
// a worker, and the printout. The whole flow from the window is driven by
// tests/scenarios/coordinate-conversion.sh.

#include <gtest/gtest.h>

#include <QApplication>
#include <QCheckBox>
#include <QComboBox>
#include <QEventLoop>
#include <QFontMetricsF>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QPrinter>
#include <QPushButton>
#include <QRadioButton>
#include <QRegularExpression>
#include <QTest>
#include <QThread>
#include <QTimer>
#include <filesystem>
#include <functional>
#include <memory>
#include <sstream>

#include "app/dialogs/QtEngineDialogs.h"
#include "coordui/CoordinateConversionDialog.h"
#include "coordui/CoordinateResultsDialog.h"
#include "coordui/ManualEntryDialog.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::Boxes;
using test::ReadFile;
using test::Take;

template <typename T>
T* Child(const QWidget* w, const char* name) {
  T* c = w->findChild<T*>(name);
  EXPECT_NE(c, nullptr) << name;
  return c;
}

QStringList Items(const QComboBox* box) {
  QStringList items;
  for (int i = 0; i < box->count(); ++i) items << box->itemText(i);
  return items;
}

void Select(const QWidget* w, const char* list, const QString& item) {
  QComboBox* box = Child<QComboBox>(w, list);
  ASSERT_GE(box->findText(item), 0) << item.toStdString();
  box->setCurrentIndex(box->findText(item));
}

void Click(const QWidget* w, const char* button) {
  QTest::mouseClick(Child<QAbstractButton>(w, button), Qt::LeftButton);
}

// Runs `step` once the modal dialog named `name` is up; gives up (closing
// every dialog) after a while so that a missing dialog fails the test.
void OnModal(const QString& name, std::function<void(QWidget*)> step) {
  auto* timer = new QTimer(qApp);
  auto* waited = new int(0);
  QObject::connect(timer, &QTimer::timeout, [=] {
    QWidget* w = QApplication::activeModalWidget();
    if (++*waited > 1000) {
      ADD_FAILURE() << "no dialog " << name.toStdString();
      if (w) w->close();
    } else if (!w || w->objectName() != name) {
      return;
    } else {
      step(w);
    }
    timer->stop();
    timer->deleteLater();
    delete waited;
  });
  timer->start(10);
}

class CoordDialogsTest : public ::testing::Test {
 protected:
  CoordDialogsTest() {
    for (const char* name : {"zones.ini", "datums.ini", "ellipsoids.ini"}) {
      std::filesystem::copy_file(std::string(ZV_APP_DIR) + "/" + name, app.file(name));
    }
    store.save(kConversionSection, "Output Coordinate System", "State Plane 1983");
    store.save(kConversionSection, "Output Zone", "Alabama East 0101");
  }

  // Types "name=text|..." into the line edits of `w`.
  static void Type(const QWidget* w, const std::string& fields) {
    std::istringstream in(fields);
    for (std::string kv; std::getline(in, kv, '|');) {
      Child<QLineEdit>(w, kv.substr(0, kv.find('=')).c_str())
          ->setText(QString::fromStdString(kv.substr(kv.find('=') + 1)));
    }
  }

  test::TempDir app;
  ScriptedUi ui;
  MemorySettings store;
  ConversionState state;
};

TEST_F(CoordDialogsTest, ConversionDialogBindsTheFormAndFocusesTheRefusedList) {
  MemorySettings empty;
  CoordinateConversionDialog d(ui, app.path(), state, empty, ConversionDialogs{});
  d.load();
  auto* geoid = Child<QCheckBox>(&d, "chkConvertFGeoid");
  EXPECT_EQ(Items(Child<QComboBox>(&d, "cmbConvertFCSIn")).last(), "Geographic Coordinates");
  EXPECT_FALSE(geoid->isEnabled() || Child<QComboBox>(&d, "cmbConvertFGeoid")->isEnabled());

  Select(&d, "cmbConvertFCSIn", "State Plane 1983");
  Select(&d, "cmbConvertFZoneIn", "Alabama West 0102");
  EXPECT_EQ(Child<QComboBox>(&d, "cmbConvertFHDatumIn")->currentText() + "|" +
                Child<QComboBox>(&d, "cmbConvertFVUnitsIn")->currentText(),
            "NAD 83|Meters");
  EXPECT_TRUE(geoid->isEnabled());
  Select(&d, "cmbConvertFCSIn", "Geographic Coordinates");
  EXPECT_FALSE(Child<QComboBox>(&d, "cmbConvertFZoneIn")->isEnabled());
  EXPECT_EQ(Items(Child<QComboBox>(&d, "cmbConvertFHUnitsIn")),
            (QStringList{"DDD MM SS.ssss", "DDD.MMSSssss", "DDD.dddddd", "DDD MM.mmmm"}));
  Select(&d, "cmbConvertFVDatumIn", "None");
  EXPECT_FALSE(Child<QComboBox>(&d, "cmbConvertFVDatumOut")->isEnabled());

  Click(&d, "cmdConvertFOK");
  EXPECT_EQ(Boxes(ui), "E Horizontal Datum Requied: You must specify the input Horizonal Datum.");
  EXPECT_EQ(d.focusWidget(), Child<QComboBox>(&d, "cmbConvertFHDatumIn"));
  EXPECT_EQ(d.result(), QDialog::Rejected);
  EXPECT_EQ(empty.get(kConversionSection, "Input Coordinate System", "<none>"), "<none>");
}

TEST_F(CoordDialogsTest, EditParametersAsksFirstAndNamesTheMissingEditor) {
  CoordinateConversionDialog d(ui, app.path(), state, store, ConversionDialogs{});
  d.load();
  const std::string question =
      "  Edit Parameters?: Changing any of the values on the following dialog can result in "
      "incorrect coordinate values. Are you sure you want to proceed?";
  const struct {
    const char* option;
    Answer answer;
    std::string note;  // the box after the question
  } cases[] = {
      {"optConvertFDatums", Answer::Ok,
       "\nI Edit Parameters: The datum editor is not available in this version."},
      {"optConvertFEllipsoids", Answer::Ok,
       "\nI Edit Parameters: The ellipsoid editor is not available in this version."},
      {"optConvertFZones", Answer::Cancel, ""},
  };
  for (const auto& c : cases) {
    ui.answers = {c.answer};
    Click(&d, c.option);
    Click(&d, "cmdConvertFEdit");
    EXPECT_EQ(ui.boxes.at(0).buttons, Buttons::OkCancel);
    EXPECT_EQ(Take(ui), question + c.note);
  }
  // With an editor the lists are filled afresh, the choices kept.
  std::vector<CatalogKind> opened;
  d.setCatalogEditor([&](CatalogKind kind) { opened.push_back(kind); });
  ui.answers = {Answer::Ok};
  Click(&d, "cmdConvertFEdit");
  EXPECT_EQ(opened, std::vector<CatalogKind>{CatalogKind::Zones});
  EXPECT_EQ(Take(ui), question);
  EXPECT_EQ(Child<QComboBox>(&d, "cmbConvertFZoneOut")->currentText(), "Alabama East 0101");
}

TEST_F(CoordDialogsTest, ManualEntryChecksEachFieldAndPutsTheFocusBack) {
  const ManualEntrySetup geo{true, true, "Meters", "Ellipsoid", "DDD MM SS.ssss", ""};
  const ManualEntrySetup plane{false, true, "Meters", "Orthometric", "", "Meters"};
  const struct {
    const ManualEntrySetup& setup;
    std::string typed;  // "field=text|..."
    std::string box;    // empty: accepted
    const char* focus;  // the field the box sends the user back to
  } cases[] = {
      {geo, "txtManualLatitude=45 3O", "E Invalid Latitude: Latitude must be a numeric value.",
       "txtManualLatitude"},
      {geo, "txtManualLatitude=45 30 00|txtManualLongitude=93 00 00|txtManualGeoHeight=1O",
       "E Invalid Height: Height must be a numeric value.", "txtManualGeoHeight"},
      {geo, "txtManualLatitude=45 30 00|txtManualLongitude=93 61 00",
       "E Invalid Angle: Invalid Angle '93 61 00'. Minutes portion must be positive and not "
       "exceed 59.",
       "txtManualLongitude"},
      {geo,
       "txtManualGeoName=CP1|txtManualLatitude=45 30 00|txtManualLongitude=93 00 00|"
       "txtManualGeoHeight=10",
       "", nullptr},
      {plane, "txtManualEasting=2000", "E Northing Required: You must enter a Northing.",
       "txtManualNorthing"},
      {plane, "txtManualNorthing=1000|txtManualEasting=2000", "", nullptr},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.typed);
    SurveyPoint point;
    ManualEntryDialog d(ui, c.setup, point);
    EXPECT_EQ(Child<QWidget>(&d, "fraManualGeographic")->isVisibleTo(&d), c.setup.geographic);
    EXPECT_EQ(Child<QWidget>(&d, "fraManualPlane")->isVisibleTo(&d), !c.setup.geographic);
    EXPECT_EQ(Child<QComboBox>(&d, "cmbManualLatitudeDir")->currentText() +
                  Child<QComboBox>(&d, "cmbManualLongitudeDir")->currentText(),
              "NW");
    Type(&d, c.typed);
    Click(&d, "cmdManualOK");
    EXPECT_EQ(Take(ui), c.box);
    EXPECT_EQ(d.result(), c.box.empty() ? QDialog::Accepted : QDialog::Rejected);
    if (c.focus) {
      EXPECT_EQ(d.focusWidget(), Child<QWidget>(&d, c.focus));
    }
  }
}

// A routine that runs on a worker thread gets its dialogs from the GUI thread.
TEST_F(CoordDialogsTest, AWorkersDialogsAreShownByTheGuiThread) {
  QtEngineDialogs dialogs(ui);
  std::vector<QThread*> shownOn;
  OnModal("frmManualCoordEntry", [&](QWidget* w) {
    shownOn.push_back(w->thread());
    Type(w, "txtManualNorthing=1000|txtManualEasting=2000");
    Click(w, "cmdManualOK");
  });
  OnModal("frmCoordinateResults", [&](QWidget* w) {
    shownOn.push_back(w->thread());
    Click(w, "cmdCoordResultsOK");
  });
  SurveyPoint point;
  bool entered = false;
  std::unique_ptr<QThread> worker(QThread::create([&] {
    entered = dialogs.enterPoint(ManualEntrySetup{}, point);
    dialogs.showReport("Report");
  }));
  QEventLoop loop;
  QObject::connect(worker.get(), &QThread::finished, &loop, &QEventLoop::quit);
  worker->start();
  loop.exec();
  EXPECT_TRUE(entered);
  EXPECT_EQ(point.Easting, 2000);
  EXPECT_EQ(shownOn, (std::vector<QThread*>{qApp->thread(), qApp->thread()}));
}

TEST_F(CoordDialogsTest, ResultsKeepTheReportsColumnsOnScreenAndOnPaper) {
  std::string tall;
  for (int i = 0; i < 300; ++i) tall += "\r\n     Line: \t\t" + std::to_string(i);
  // One document, with as many pages as the lines need.
  for (const std::string& report :
       {std::string("Title\t\t03/04/2026\r\n\r\n     Zone: \t\t\tEast"), tall}) {
    CoordinateResultsDialog d(report);
    Child<QPushButton>(&d, "cmdCoordResultsPrint");
    auto* text = Child<QPlainTextEdit>(&d, "txtCoordResults");
    EXPECT_TRUE(text->isReadOnly());
    EXPECT_EQ(text->toPlainText(), QString::fromStdString(report).replace("\r\n", "\n"));
    const QFontMetricsF metrics(text->font());  // every character as wide as a blank
    for (QChar c : QString("iW0.:"))
      EXPECT_DOUBLE_EQ(metrics.horizontalAdvance(c), metrics.horizontalAdvance(' '))
          << c.toLatin1();
    EXPECT_DOUBLE_EQ(text->tabStopDistance(), 8 * metrics.horizontalAdvance(QChar(' ')));

    QPrinter printer(QPrinter::HighResolution);
    printer.setOutputFormat(QPrinter::PdfFormat);
    printer.setOutputFileName(QString::fromStdString(app.file("results.pdf")));
    ASSERT_TRUE(d.printTo(printer));
    const QString pdf = QString::fromLatin1(ReadFile(app.file("results.pdf")));
    EXPECT_TRUE(pdf.startsWith("%PDF-"));
    const QRegularExpressionMatch count = QRegularExpression(R"(/Count (\d+))").match(pdf);
    ASSERT_TRUE(count.hasMatch());
    const int pages = count.captured(1).toInt();
    EXPECT_TRUE(report == tall ? pages > 2 : pages == 1) << pages;
  }
}

}  // namespace
}  // namespace zv
