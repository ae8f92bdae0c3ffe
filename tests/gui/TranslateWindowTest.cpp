#include <gtest/gtest.h>

#include <QCheckBox>
#include <QComboBox>
#include <QLineEdit>
#include <QPushButton>
#include <QSignalSpy>
#include <QTest>
#include <filesystem>

#include "app/AppContext.h"
#include "app/dialogs/TranslateWindow.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;

const QString kCtl = "VORN Control Files (*.CTL)";
const QString kPac = "VORN Points and Chains Files (*.PAC)";
const QString kManual = "Coordinate Conversion Manual Entry";

QStringList Items(const QComboBox* box) {
  QStringList items;
  for (int i = 0; i < box->count(); ++i) items << box->itemText(i);
  return items;
}

class TranslateWindowTest : public ::testing::Test {
 protected:
  TranslateWindowTest() : ctx(ui, dir.path()) {
    const std::string ctl = kCtl.toStdString(), pac = kPac.toStdString();
    const std::string manual = kManual.toStdString();
    dir.write("UTIFiles/A1.uti", CrLf({"ConvertFile", "To PAC", ctl, pac}));
    dir.write("UTIFiles/A3.uti", CrLf({"Replace", "Filter", ctl, ctl, "CODES.TRN"}));
    dir.write("UTIFiles/A4.uti", CrLf({"ConvertFile", "Copy", ctl, ctl}));
    dir.write("UTIFiles/B1.uti", CrLf({"ConvertFile", "To CTL", pac, ctl}));
    dir.write("UTIFiles/C1.uti", CrLf({"MultiPoint", "Typed", manual, manual}));
    dir.write("TRNFiles/CODES.TRN", CrLf({"FE:TREE FE:OAK"}));
    input = dir.write("data/job.ctl", CrLf({"AC:PR", "AC:OS", "PN:CP1", "YC:1000.0", "XC:2000.0",
                                            "AC:OS", "PN:CP2", "YC:1100.25"}));
    ctx.startup.defaultInputFolder = dir.file("data/");
    ctx.startup.defaultOutputFolder = dir.file("out/");
    ctx.startup.configurationFolder = dir.file("TRNFiles");
    std::filesystem::create_directories(dir.file("out"));
  }

  template <typename T>
  T* child(const TranslateWindow& w, const char* name) {
    T* c = w.findChild<T*>(name);
    EXPECT_NE(c, nullptr) << name;
    return c;
  }
  void select(const TranslateWindow& w, const char* list, const QString& item) {
    QComboBox* box = child<QComboBox>(w, list);
    ASSERT_GE(box->findText(item), 0) << item.toStdString();
    box->setCurrentIndex(box->findText(item));
  }
  void setText(const TranslateWindow& w, const char* box, const std::string& text) {
    child<QLineEdit>(w, box)->setText(QString::fromStdString(text));
  }
  std::string text(const TranslateWindow& w, const char* box) {
    return child<QLineEdit>(w, box)->text().toStdString();
  }
  void click(const TranslateWindow& w, const char* button) {
    QTest::mouseClick(child<QPushButton>(w, button), Qt::LeftButton);
  }
  // A group is enabled as a whole.
  bool groupEnabled(const TranslateWindow& w, std::initializer_list<const char*> names) {
    int on = 0;
    for (const char* n : names) on += child<QWidget>(w, n)->isEnabled();
    EXPECT_TRUE(on == 0 || on == int(names.size())) << *names.begin();
    return on > 0;
  }

  test::TempDir dir;
  ScriptedUi ui;
  AppContext ctx;
  std::string input;
};

const auto kInputGroup = {"lblInputLocation", "txtInputLocation", "cmdInputBrowse"};
const auto kOutputGroup = {"lblOutputLocation", "txtOutputLocation", "cmdOutputBrowse"};
const auto kConfigGroup = {"lblActionLocation", "txtActionLocation", "cmdActionBrowse",
                           "cmdActionNew",      "cmdActionEdit",     "chkActionDefault"};

// The window shows the state of its logic (tested on its own) and calls it.
TEST_F(TranslateWindowTest, ListsCascadeAndLocationGroupsFollowTheChoices) {
  TranslateWindow w(ctx);
  w.start();
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(w.windowTitle().toStdString(), TranslateLogic::Caption());
  EXPECT_EQ(w.focusWidget(), child<QComboBox>(w, "cmbInputType"));
  EXPECT_NE(child<QWidget>(w, "tabTranslate"), nullptr);
  EXPECT_EQ(Items(child<QComboBox>(w, "cmbInputType")), (QStringList{kCtl, kPac, kManual}));
  EXPECT_EQ(Items(child<QComboBox>(w, "cmbOutputType")), (QStringList{kPac, kCtl}));
  EXPECT_EQ(child<QComboBox>(w, "cmbAction")->currentText(), "To PAC");
  EXPECT_TRUE(groupEnabled(w, kInputGroup) && groupEnabled(w, kOutputGroup));
  EXPECT_FALSE(groupEnabled(w, kConfigGroup));

  select(w, "cmbOutputType", kCtl);
  EXPECT_EQ(Items(child<QComboBox>(w, "cmbAction")), (QStringList{"Filter", "Copy"}));
  EXPECT_TRUE(groupEnabled(w, kConfigGroup));
  EXPECT_EQ(text(w, "txtActionLocation"), dir.file("TRNFiles/CODES.TRN"));
  EXPECT_TRUE(child<QCheckBox>(w, "chkActionDefault")->isChecked());
  select(w, "cmbAction", "Copy");
  EXPECT_FALSE(groupEnabled(w, kConfigGroup));
  EXPECT_FALSE(child<QCheckBox>(w, "chkActionDefault")->isChecked());

  select(w, "cmbInputType", kManual);
  EXPECT_FALSE(groupEnabled(w, kInputGroup) || groupEnabled(w, kOutputGroup));
  EXPECT_EQ(text(w, "txtInputLocation"), "");
  EXPECT_EQ(Items(child<QComboBox>(w, "cmbAction")), QStringList{"Typed"});
  select(w, "cmbInputType", kPac);
  EXPECT_EQ(text(w, "txtInputLocation"), dir.file("data/"));
}

TEST_F(TranslateWindowTest, OkChecksWhatTheBoxesHoldThenRunsAndViews) {
  ctx.startup.viewOutput = true;
  TranslateWindow w(ctx);
  w.start();
  setText(w, "txtInputLocation", dir.file("data/none.ctl"));
  click(w, "cmdTranslateOK");
  setText(w, "txtInputLocation", input);
  setText(w, "txtOutputLocation", dir.file("DATA/JOB.CTL"));
  click(w, "cmdTranslateOK");
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[0].text + "|" + ui.boxes[1].text,
            "The specified input file does not exist.|"
            "The input and output files can not be the same.");
  EXPECT_EQ(text(w, "txtOutputLocation"), dir.file("DATA/JOB.CTL"));  // kept as typed

  const std::string output = dir.file("out/job.pac");
  setText(w, "txtOutputLocation", output);
  ui.boxes.clear();
  click(w, "cmdTranslateOK");
  EXPECT_EQ(ui.onlyText(), "Conversion Complete.");
  EXPECT_NE(ReadFile(output).find("PN:CP2\r\nYY:1100.2500\r\n"), std::string::npos);
  EXPECT_EQ(ui.editors,
            (std::vector<std::string>{"viewer: " + kPac.toStdString() + ": " + output}));
  EXPECT_TRUE(w.isVisible());
}

TEST_F(TranslateWindowTest, CancelRecordsTheLastUsedDefinitionClosingDoesNot) {
  {
    TranslateWindow w(ctx);
    w.start();
    QSignalSpy ended(&w, &TranslateWindow::ended);
    select(w, "cmbOutputType", kCtl);
    select(w, "cmbAction", "Copy");
    setText(w, "txtInputLocation", input);
    setText(w, "txtOutputLocation", dir.file("out/copy.ctl"));
    click(w, "cmdTranslateOK");  // the definition that ran is recorded
    click(w, "cmdTranslateCancel");
    EXPECT_FALSE(w.isVisible());
    EXPECT_EQ(ended.count(), 1);
  }
  EXPECT_EQ(ReadFile(dir.file("Quorvane.cfg")), CrLf({dir.file("UTIFiles/A4.uti")}));
  std::filesystem::remove(dir.file("Quorvane.cfg"));
  TranslateWindow again(ctx);
  again.start();
  again.close();
  EXPECT_FALSE(std::filesystem::exists(dir.file("Quorvane.cfg")));
}

TEST_F(TranslateWindowTest, BrowseAndEditButtonsReachTheBoxes) {
  TranslateWindow w(ctx);
  w.start();
  select(w, "cmbOutputType", kCtl);
  ui.files = {dir.file("data/other.ctl"), dir.file("out/x.ctl"), dir.file("TRNFiles/B.TRN")};
  for (const char* button : {"cmdInputBrowse", "cmdOutputBrowse", "cmdActionBrowse"})
    click(w, button);
  EXPECT_EQ(
      text(w, "txtInputLocation") + "|" + text(w, "txtOutputLocation") + "|" +
          text(w, "txtActionLocation"),
      dir.file("data/other.ctl") + "|" + dir.file("out/x.ctl") + "|" + dir.file("TRNFiles/B.TRN"));
  EXPECT_FALSE(child<QCheckBox>(w, "chkActionDefault")->isChecked());
  ASSERT_EQ(ui.fileDialogs.size(), 3u);
  const auto& dialog = ui.fileDialogs[2];
  EXPECT_EQ(dialog.title + "|" + dialog.filter + "|" + dialog.folder,
            "Select a Configuration File:|Translation/Filter Files (*.TRN)|*.trn|" +
                dir.file("TRNFiles"));
  w.updateConfigFile("/elsewhere/C.TRN");
  EXPECT_EQ(text(w, "txtActionLocation"), "/elsewhere/C.TRN");
  click(w, "cmdActionEdit");
  EXPECT_EQ(ui.onlyText(), "The file '/elsewhere/C.TRN' does not exist.");
}

}  // namespace
}  // namespace zv
