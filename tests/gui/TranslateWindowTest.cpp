// The window shows the state of its logic (tested on its own) and calls it.

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

const std::string kCtl = "VORN Control Files (*.CTL)";
const std::string kPac = "VORN Points and Chains Files (*.PAC)";
const std::string kManual = "Coordinate Conversion Manual Entry";

class TranslateWindowTest : public ::testing::Test {
 protected:
  TranslateWindowTest() : ctx(ui, dir.path()) {
    dir.write("UTIFiles/A1.uti", CrLf({"ConvertFile", "To PAC", kCtl, kPac}));
    dir.write("UTIFiles/A3.uti", CrLf({"Replace", "Filter", kCtl, kCtl, "CODES.TRN"}));
    dir.write("UTIFiles/A4.uti", CrLf({"ConvertFile", "Copy", kCtl, kCtl}));
    dir.write("UTIFiles/B1.uti", CrLf({"ConvertFile", "To CTL", kPac, kCtl}));
    dir.write("UTIFiles/C1.uti", CrLf({"MultiPoint", "Typed", kManual, kManual}));
    dir.write("TRNFiles/CODES.TRN", CrLf({"FE:TREE FE:OAK"}));
    input = dir.write("data/job.ctl", CrLf({"AC:PR", "AC:OS", "PN:CP1", "YC:1000.0", "XC:2000.0",
                                            "AC:OS", "PN:CP2", "YC:1100.25"}));
    ctx.startup.defaultInputFolder = dir.file("data/");
    ctx.startup.defaultOutputFolder = dir.file("out/");
    ctx.startup.configurationFolder = dir.file("TRNFiles");
    std::filesystem::create_directories(dir.file("out"));
    w.start();
  }

  template <typename T>
  T* child(const char* name) {
    T* c = w.findChild<T*>(name);
    EXPECT_NE(c, nullptr) << name;
    return c;
  }
  void select(const char* list, const std::string& item) {
    QComboBox* box = child<QComboBox>(list);
    ASSERT_GE(box->findText(QString::fromStdString(item)), 0) << item;
    box->setCurrentIndex(box->findText(QString::fromStdString(item)));
  }
  void setText(const char* box, const std::string& text) {
    child<QLineEdit>(box)->setText(QString::fromStdString(text));
  }
  std::string text(const char* box) { return child<QLineEdit>(box)->text().toStdString(); }
  void click(const char* button) { QTest::mouseClick(child<QPushButton>(button), Qt::LeftButton); }

  // "inputs / outputs / actions / enabled groups", types by their extension
  // and the current entries starred, then the configuration box and the
  // default check box when set. A group is enabled as a whole.
  std::string state() {
    std::string s;
    for (const char* name : {"cmbInputType", "cmbOutputType", "cmbAction"}) {
      if (!s.empty()) s += " / ";
      const QComboBox* box = child<QComboBox>(name);
      for (int i = 0; i < box->count(); ++i) {
        const std::string item = box->itemText(i).toStdString();
        const size_t ext = item.find("(*.");
        s += std::string(i ? "," : "") + (i == box->currentIndex() ? "*" : "") +
             (ext == std::string::npos ? item : item.substr(ext + 3, 3));
      }
    }
    s += " /";
    const std::pair<const char*, std::vector<const char*>> groups[] = {
        {" in", {"lblInputLocation", "txtInputLocation", "cmdInputBrowse"}},
        {" out", {"lblOutputLocation", "txtOutputLocation", "cmdOutputBrowse"}},
        {" config",
         {"lblActionLocation", "txtActionLocation", "cmdActionBrowse", "cmdActionNew",
          "cmdActionEdit", "chkActionDefault"}}};
    for (const auto& [label, names] : groups) {
      size_t on = 0;
      for (const char* n : names) on += child<QWidget>(n)->isEnabled();
      EXPECT_TRUE(on == 0 || on == names.size()) << label;
      if (on) s += label;
    }
    if (!text("txtActionLocation").empty()) s.append(1, ' ').append(text("txtActionLocation"));
    return s + (child<QCheckBox>("chkActionDefault")->isChecked() ? " default" : "");
  }

  test::TempDir dir;
  ScriptedUi ui;
  AppContext ctx;
  std::string input;
  TranslateWindow w{ctx};
};

TEST_F(TranslateWindowTest, ListsCascadeAndLocationGroupsFollowTheChoices) {
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(w.focusWidget(), child<QComboBox>("cmbInputType"));
  EXPECT_EQ(state(), "*CTL,PAC," + kManual + " / *PAC,CTL / *To PAC / in out");
  select("cmbOutputType", kCtl);
  EXPECT_EQ(state(), "*CTL,PAC," + kManual + " / PAC,*CTL / *Filter,Copy / in out config " +
                         dir.file("TRNFiles/CODES.TRN") + " default");
  select("cmbAction", "Copy");
  EXPECT_EQ(state(), "*CTL,PAC," + kManual + " / PAC,*CTL / Filter,*Copy / in out");
  select("cmbInputType", kManual);
  EXPECT_EQ(state(), "CTL,PAC,*" + kManual + " / *" + kManual + " / *Typed /");
  EXPECT_EQ(text("txtInputLocation"), "");
  select("cmbInputType", kPac);
  EXPECT_EQ(text("txtInputLocation"), dir.file("data/"));
}

TEST_F(TranslateWindowTest, OkChecksWhatTheBoxesHoldThenRunsAndViews) {
  ctx.startup.viewOutput = true;
  setText("txtInputLocation", dir.file("data/none.ctl"));
  click("cmdTranslateOK");
  setText("txtInputLocation", input);
  setText("txtOutputLocation", dir.file("DATA/JOB.CTL"));
  click("cmdTranslateOK");
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[0].text + "|" + ui.boxes[1].text,
            "The specified input file does not exist.|"
            "The input and output files can not be the same.");
  EXPECT_EQ(text("txtOutputLocation"), dir.file("DATA/JOB.CTL"));  // kept as typed

  const std::string output = dir.file("out/job.pac");
  setText("txtOutputLocation", output);
  // The output can be drawn once it exists.
  EXPECT_FALSE(child<QPushButton>("cmdPlanView")->isEnabled());
  ui.boxes.clear();
  click("cmdTranslateOK");
  EXPECT_TRUE(child<QPushButton>("cmdPlanView")->isEnabled());
  EXPECT_EQ(ui.onlyText(), "Conversion Complete.");
  EXPECT_NE(ReadFile(output).find("PN:CP2\r\nYY:1100.2500\r\n"), std::string::npos);
  EXPECT_EQ(ui.editors, std::vector<std::string>{"viewer: " + kPac + ": " + output});
  EXPECT_TRUE(w.isVisible());
}

TEST_F(TranslateWindowTest, CancelRecordsTheLastUsedDefinitionClosingDoesNot) {
  QSignalSpy ended(&w, &TranslateWindow::ended);
  select("cmbOutputType", kCtl);
  select("cmbAction", "Copy");
  setText("txtInputLocation", input);
  setText("txtOutputLocation", dir.file("out/copy.ctl"));
  click("cmdTranslateOK");  // the definition that ran is recorded
  click("cmdTranslateCancel");
  EXPECT_FALSE(w.isVisible());
  EXPECT_EQ(ended.count(), 1);
  EXPECT_EQ(ReadFile(dir.file("Quorvane.cfg")), CrLf({dir.file("UTIFiles/A4.uti")}));
  std::filesystem::remove(dir.file("Quorvane.cfg"));
  TranslateWindow again(ctx);
  again.start();
  again.close();
  EXPECT_FALSE(std::filesystem::exists(dir.file("Quorvane.cfg")));
}

TEST_F(TranslateWindowTest, BrowseAndEditButtonsReachTheBoxes) {
  select("cmbOutputType", kCtl);
  ui.files = {dir.file("data/other.ctl"), dir.file("out/x.ctl"), dir.file("TRNFiles/B.TRN")};
  for (const char* button : {"cmdInputBrowse", "cmdOutputBrowse", "cmdActionBrowse"}) click(button);
  EXPECT_EQ(text("txtInputLocation") + "|" + text("txtOutputLocation"),
            dir.file("data/other.ctl") + "|" + dir.file("out/x.ctl"));
  EXPECT_EQ(state(), "*CTL,PAC," + kManual + " / PAC,*CTL / *Filter,Copy / in out config " +
                         dir.file("TRNFiles/B.TRN"));
  ASSERT_EQ(ui.fileDialogs.size(), 3u);
  const auto& dialog = ui.fileDialogs[2];
  EXPECT_EQ(dialog.title + "|" + dialog.filter + "|" + dialog.folder,
            "Select a Configuration File:|Translation/Filter Files (*.TRN)|*.trn|" +
                dir.file("TRNFiles"));
  w.updateConfigFile("/elsewhere/C.TRN");
  click("cmdActionEdit");
  EXPECT_EQ(ui.onlyText(), "The file '/elsewhere/C.TRN' does not exist.");
}

}  // namespace
}  // namespace zv
