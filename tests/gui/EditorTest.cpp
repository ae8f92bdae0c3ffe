#include <gtest/gtest.h>

#include <QAction>
#include <QApplication>
#include <QCheckBox>
#include <QClipboard>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMenuBar>
#include <QPlainTextEdit>
#include <QPrinter>
#include <QPushButton>
#include <QTest>
#include <QTextBlock>
#include <filesystem>

#include "editor/FindReplaceDialog.h"
#include "editor/LineView.h"
#include "editor/TextEditorWindow.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::Take;

class EditorTest : public ::testing::Test {
 protected:
  EditorTest() : editor(ui) {}

  QAction* action(const char* name) { return editor.findChild<QAction*>(name); }
  QString status(const char* panel) { return editor.findChild<QLabel*>(panel)->text(); }
  QPlainTextEdit* text() { return editor.findChild<QPlainTextEdit*>("rtbTextEditor"); }
  FindReplaceDialog* find(const QString& what, const QString& with = {}) {
    FindReplaceDialog* d = editor.findDialog();
    d->findChild<QLineEdit*>("txtFRFind")->setText(what);
    d->findChild<QLineEdit*>("txtFRReplace")->setText(with);
    return d;
  }
  void typeAtEnd(const QString& s) {
    QTextCursor c = text()->textCursor();
    c.movePosition(QTextCursor::End);
    c.insertText(s);
  }
  void caretAt(int position) {
    QTextCursor c = text()->textCursor();
    c.setPosition(position);
    text()->setTextCursor(c);
  }

  test::TempDir dir;
  ScriptedUi ui;
  TextEditorWindow editor;
};

TEST_F(EditorTest, ViewerHidesTheEditingMenusAndShowsViewsForTaggedFiles) {
  const std::string path = dir.write("job.CTL", CrLf({"AC:PR", "AC:OS", "PN:1"}));
  editor.showTextEditor(QString::fromStdString(path), "VORN Control Files (*.CTL)", true);
  EXPECT_TRUE(text()->isReadOnly());
  EXPECT_EQ(text()->toPlainText(), "AC:PR\nAC:OS\nPN:1\n");
  EXPECT_FALSE(editor.changed());
  EXPECT_EQ(editor.windowTitle(), "VORN File Viewer - " + QString::fromStdString(path));
  for (const char* hidden :
       {"mnuEditReplace", "mnuEditCut", "mnuEditPaste", "mnuEditClear", "mnuFileNew", "mnuFileOpen",
        "mnuFileClose", "mnuFileSave", "mnuFileSep1"})
    EXPECT_FALSE(action(hidden)->isVisible()) << hidden;
  for (const char* shown : {"mnuFileSaveAs", "mnuFilePrint", "mnuEditCopy", "mnuEditFind"})
    EXPECT_TRUE(action(shown)->isVisible()) << shown;
  EXPECT_TRUE(editor.findChild<QMenu*>("mnuView")->menuAction()->isVisible());
  EXPECT_FALSE(editor.findDialog()->findChild<QPushButton*>("cmdFRShowReplace")->isEnabled());

  // Endings compare with their letter case; other types have no views.
  EXPECT_TRUE(HasListingViews("/a/b.PRJ") && HasListingViews("/a/b.ctl"));
  EXPECT_FALSE(HasListingViews("/a/b.OUT"));
  EXPECT_EQ(EditorFilter("Out File (*.OUT)"), "Out File (*.OUT)|*.OUT");

  // Save As in a viewer offers the type's filter.
  editor.fileSaveAs();
  const auto& dialog = ui.fileDialogs.at(0);
  EXPECT_EQ(dialog.title + "|" + dialog.filter + "|" + dialog.folder,
            "Save As|VORN Control Files (*.CTL)|*.CTL|" + dir.path());
}

TEST_F(EditorTest, MissingFileIsReportedAndStatusBarFollowsTheCaret) {
  EXPECT_FALSE(editor.showTextEditor(QString::fromStdString(dir.file("gone.OUT")),
                                     "Out File (*.OUT)", false));
  EXPECT_EQ(Take(ui), "E VORN Zurevazidu: The file '" + dir.file("gone.OUT") + "' doesn't exist.");
  // Opened as a window of its own, a file that cannot be shown leaves none behind.
  EXPECT_EQ(OpenTextEditor(ui, dir.file("gone.OUT"), "Out File (*.OUT)", EditorMode::Viewer),
            nullptr);
  QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  for (QWidget* w : QApplication::topLevelWidgets())
    EXPECT_FALSE(qobject_cast<TextEditorWindow*>(w) && w->isVisible() && w != &editor);
  EXPECT_EQ(Take(ui), "E VORN Zurevazidu: The file '" + dir.file("gone.OUT") + "' doesn't exist.");
  // Too large to edit: said so, and shown for viewing.
  const std::string large = dir.write("large.CTL", "");
  std::filesystem::resize_file(large, (std::uintmax_t{33} << 20) + 1);
  auto* opened = qobject_cast<TextEditorWindow*>(
      OpenTextEditor(ui, large, "VORN Control Files (*.CTL)", EditorMode::Editor));
  ASSERT_NE(opened, nullptr);
  EXPECT_TRUE(opened->viewOnly() && opened->showsLargeFile());
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: The file '" + large +
                          "' is too large to be edited here (33 MB; at most 32 MB).  It is "
                          "opened for viewing only.");
  opened->close();
  EXPECT_FALSE(text()->isReadOnly());

  text()->setPlainText("first\nsecond line\nthird");
  caretAt(0);
  EXPECT_EQ(status("Line") + " " + status("Column"), "Line Number: 1 Column Number: 1");
  caretAt(6 + 7);  // "second |line"
  EXPECT_EQ(status("Line") + " " + status("Column"), "Line Number: 2 Column Number: 8");
}

TEST_F(EditorTest, FindStepsThroughOccurrencesWithTheOptions) {
  editor.showNew("Out File (*.OUT)");
  text()->setPlainText("Tree tree treetop TREE");
  caretAt(0);
  FindReplaceDialog* d = find("tree");
  // Where each find leaves the selection, -1 when it finds nothing.
  auto next = [&] { return d->find() ? text()->textCursor().selectionStart() : -1; };
  EXPECT_EQ((std::vector{next(), next()}), (std::vector{0, 5}));
  d->findChild<QCheckBox*>("chkFRMatchWord")->setChecked(true);
  EXPECT_EQ((std::vector{next(), next()}), (std::vector{18, -1}));  // skips "treetop"
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: Search String Not Found.");
  d->findChild<QCheckBox*>("chkFRMatchWord")->setChecked(false);
  d->findChild<QCheckBox*>("chkFRMatchCase")->setChecked(true);
  caretAt(0);
  EXPECT_EQ((std::vector{next(), next()}), (std::vector{5, 10}));
}

TEST_F(EditorTest, ReplaceAndReplaceAllCountWhatTheyChanged) {
  editor.showNew("Out File (*.OUT)");
  text()->setPlainText("FE:TREE\nFE:POLE\nFE:TREE\n");
  caretAt(3);
  FindReplaceDialog* d = find("TREE", "OAK");
  // Replace on no selection only finds; then replaces the found text.
  EXPECT_TRUE(d->replace());
  EXPECT_EQ(text()->toPlainText(), "FE:TREE\nFE:POLE\nFE:TREE\n");
  EXPECT_TRUE(d->replace());
  EXPECT_EQ(text()->toPlainText(), "FE:OAK\nFE:POLE\nFE:TREE\n");
  EXPECT_EQ(text()->textCursor().selectedText(), "TREE");
  EXPECT_FALSE(d->replace());
  EXPECT_EQ(text()->toPlainText(), "FE:OAK\nFE:POLE\nFE:OAK\n");
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: Search String Not Found.");

  // A replacement holding the search text is not replaced again; undo takes
  // back the whole Replace All.
  caretAt(5);
  d = find("OAK", "OAK TREE OAK");
  EXPECT_EQ(d->replaceAll(), 2);
  EXPECT_EQ(text()->toPlainText(), "FE:OAK TREE OAK\nFE:POLE\nFE:OAK TREE OAK\n");
  EXPECT_EQ(Take(ui).substr(1), " VORN Zurevazidu: Replaced 'OAK' with 'OAK TREE OAK' 2 time(s).");
  EXPECT_EQ(text()->textCursor().position(), 5);
  EXPECT_TRUE(editor.changed());
  text()->undo();
  EXPECT_EQ(text()->toPlainText(), "FE:OAK\nFE:POLE\nFE:OAK\n");
  text()->redo();

  caretAt(9);
  d = find("ELM", "X");
  EXPECT_EQ(d->replaceAll(), 0);
  EXPECT_EQ(ui.onlyText(), "Replaced 'ELM' with 'X' 0 time(s).");
  EXPECT_EQ(text()->textCursor().position(), 9);

  // Whole words: a part of a word is passed over, also just before a word.
  text()->setPlainText(QString::fromUtf8("OAKS,OAK oak\xC2\xA0OAK"));
  d = find("oak", "ELM");
  d->findChild<QCheckBox*>("chkFRMatchWord")->setChecked(true);
  EXPECT_EQ(d->replaceAll(), 3);
  EXPECT_EQ(text()->toPlainText(), "OAKS,ELM ELM ELM");
}

TEST_F(EditorTest, SavingWritesCrLfAndTheQuestionGuardsChanges) {
  const std::string path = dir.write("codes.TRN", "FE:TREE FE:OAK\r\n");
  editor.showTextEditor(QString::fromStdString(path), "Translation/Filter File (*.TRN)", false);
  typeAtEnd("FE:POLE FE:MAST\n");
  EXPECT_TRUE(editor.changed());
  ASSERT_TRUE(editor.fileSave());
  EXPECT_EQ(ReadFile(path), "FE:TREE FE:OAK\r\nFE:POLE FE:MAST\r\n");
  EXPECT_FALSE(editor.changed());
  EXPECT_EQ(editor.windowTitle(), "VORN Text Editor - " + QString::fromStdString(path));

  // New asks first; No discards.
  typeAtEnd("scratch");
  ui.answers.push_back(Answer::No);
  editor.fileNew();
  EXPECT_EQ(Take(ui), "  VORN Zurevazidu: Changes have been made.  Would you like to save them?");
  EXPECT_EQ(text()->toPlainText(), "");
  EXPECT_EQ(editor.windowTitle(), "VORN Text Editor");

  // A new text saved with Yes goes through Save As; cancelling Save As
  // keeps the window and the text.
  text()->setPlainText("kept");
  editor.show();
  ui.answers.push_back(Answer::Yes);
  ui.files.push_back(std::nullopt);
  EXPECT_FALSE(editor.close());
  EXPECT_EQ(ui.boxes[0].buttons, Buttons::YesNoCancel);
  EXPECT_TRUE(editor.isVisible());
  EXPECT_EQ(text()->toPlainText(), "kept");
  ui.answers.push_back(Answer::Yes);
  ui.files.push_back(dir.file("new.TRN"));
  EXPECT_TRUE(editor.close());
  EXPECT_EQ(ReadFile(dir.file("new.TRN")), "kept");
}

TEST_F(EditorTest, CloseReloadsFromDiskAndBytesThatAreNotUtf8SurviveASave) {
  const std::string latin = "PD:CAF\xE9\r\nPN:1\r\n";
  const std::string path = dir.write("old.CTL", latin);
  editor.showTextEditor(QString::fromStdString(path), "VORN Control Files (*.CTL)", false);
  EXPECT_EQ(text()->toPlainText(), QString::fromUtf8("PD:CAF\xC3\xA9\nPN:1\n"));
  ASSERT_TRUE(editor.fileSave());
  EXPECT_EQ(ReadFile(path), latin);

  text()->setPlainText("edited");
  ui.answers.push_back(Answer::No);
  editor.fileClose();
  EXPECT_EQ(text()->toPlainText(), QString::fromUtf8("PD:CAF\xC3\xA9\nPN:1\n"));
  EXPECT_FALSE(editor.changed());
}

TEST_F(EditorTest, RecordAndListViewsRoundTripThroughTheirWorkingFiles) {
  const std::string control =
      CrLf({"AC:PR", "CS:State Plane 1983", "AC:OS", "PN:CP100", "YC:247795.6047",
            "XC:2072520.8575", "ZC:1102.3400", "PD:IRON PIN FOUND", "AC:OS", "PN:CP101", "YC:1.0"});
  const std::string path = dir.write("job.CTL", control);
  editor.showTextEditor(QString::fromStdString(path), "VORN Control Files (*.CTL)", true);
  action("mnuViewRecord")->trigger();
  EXPECT_TRUE(action("mnuViewRecord")->isChecked() && !action("mnuViewList")->isChecked());
  EXPECT_TRUE(ui.boxes.empty()) << ui.onlyText();
  const QString record = text()->toPlainText();
  EXPECT_TRUE(
      record.contains("\nAC:OS  PN:CP100  YC:247795.6047  XC:2072520.8575  ZC:1102.3400\n"
                      "       PD:IRON PIN FOUND\n\nAC:OS  PN:CP101  YC:1.0"))
      << record.toStdString();
  EXPECT_EQ(editor.path(), QString::fromStdString(path + ".rec"));
  EXPECT_FALSE(std::filesystem::exists(path + ".lst"));
  EXPECT_TRUE(text()->isReadOnly());
  action("mnuViewRecord")->trigger();  // the checked entry again does nothing
  EXPECT_TRUE(action("mnuViewRecord")->isChecked());
  EXPECT_EQ(text()->toPlainText(), record);

  action("mnuViewList")->trigger();
  EXPECT_TRUE(action("mnuViewList")->isChecked() && text()->isReadOnly());
  std::string listed = control;
  std::erase(listed, '\r');
  EXPECT_EQ(text()->toPlainText().toStdString(), listed);
  EXPECT_EQ(editor.path(), QString::fromStdString(path + ".lst"));
  EXPECT_FALSE(std::filesystem::exists(path + ".rec"));
  EXPECT_EQ(ReadFile(path), control);
}

// About 1.4 MB: more than a viewer's text box takes.
std::string LargeControlFile(int records) {
  std::string text;
  for (int i = 0; i < records; ++i) {
    text.append("AC:OS\r\nPN:").append(std::to_string(i)).append("\r\nPD:OAK\r\n");
  }
  return text.append("PD:Tree treetop\r\nPD:TREE");  // no end on the last line
}

TEST_F(EditorTest, ViewerShowsALargeFileFindsInItAndSwitchesItsViews) {
  constexpr int kRecords = 70000;
  const std::string path = dir.write("big.CTL", LargeControlFile(kRecords));
  ASSERT_TRUE(
      editor.showTextEditor(QString::fromStdString(path), "VORN Control Files (*.CTL)", true));
  ASSERT_TRUE(editor.showsLargeFile());
  LineView* view = editor.lineView();
  EXPECT_EQ(view->lineText(1), "PN:0");
  view->finishIndex();
  const qint64 last = 3 * kRecords + 1;
  EXPECT_EQ(view->lineCount(), last + 1);
  EXPECT_EQ(status("Line") + " " + status("Column"), "Line Number: 1 Column Number: 1");

  // Find goes through the whole file; where each find leaves the selection.
  FindReplaceDialog* d = find("tree");
  auto next = [&] {
    if (!d->find()) return std::string("none");
    return std::to_string(view->caret().line) + ":" + std::to_string(view->anchor().column) + "-" +
           std::to_string(view->caret().column);
  };
  const std::string atTree = std::to_string(last - 1) + ":3-7";
  const std::string atTreetop = std::to_string(last - 1) + ":8-12";
  const std::string atTREE = std::to_string(last) + ":3-7";
  EXPECT_EQ((std::vector{next(), next(), next()}), (std::vector{atTree, atTreetop, atTREE}));
  EXPECT_EQ(status("Line") + " " + status("Column"),
            QString("Line Number: %1 Column Number: 8").arg(last + 1));
  EXPECT_EQ(view->selectedText(), "TREE");
  EXPECT_EQ(next(), "none");
  EXPECT_EQ(Take(ui), "I VORN Zurevazidu: Search String Not Found.");
  d->findChild<QCheckBox*>("chkFRMatchWord")->setChecked(true);
  view->setSelection({}, {});
  EXPECT_EQ((std::vector{next(), next()}), (std::vector{atTree, atTREE}));
  d->findChild<QCheckBox*>("chkFRMatchCase")->setChecked(true);
  view->setSelection({}, {});
  EXPECT_EQ(next(), "none");
  ui.boxes.clear();

  // Save As writes every line with CR LF.
  ui.files.push_back(dir.file("copy.CTL"));
  ASSERT_TRUE(editor.fileSaveAs());
  EXPECT_EQ(ReadFile(dir.file("copy.CTL")), LargeControlFile(kRecords) + "\r\n");

  // The record view and back.
  editor.viewRecord();
  EXPECT_TRUE(ui.boxes.empty()) << ui.onlyText();
  EXPECT_EQ(editor.path(), QString::fromStdString(dir.file("copy.CTL.rec")));
  const QString record =
      editor.showsLargeFile() ? view->lineText(2) : text()->document()->findBlockByNumber(2).text();
  EXPECT_EQ(record, "AC:OS  PN:1  PD:OAK");
  editor.viewList();
  ASSERT_TRUE(editor.showsLargeFile());
  view->finishIndex();
  EXPECT_EQ(view->lineCount(), last + 1);
  EXPECT_EQ(view->lineText(last), "PD:TREE");
}

TEST_F(EditorTest, LargeFileViewMovesTheCaretWithTheKeysAndCopiesTheSelection) {
  LineView view;
  QString error;
  ASSERT_TRUE(
      view.open(QString::fromStdString(dir.write("t.OUT", "PN:1\tA\r\nPD:long line\rX")), error));
  auto at = [&] {
    return std::to_string(view.caret().line) + ":" + std::to_string(view.caret().column);
  };
  std::vector<std::string> seen;
  for (auto [key, modifiers] : {std::pair{Qt::Key_End, Qt::NoModifier},
                                {Qt::Key_Down, Qt::NoModifier},
                                {Qt::Key_Down, Qt::ShiftModifier},
                                {Qt::Key_Right, Qt::ShiftModifier},
                                {Qt::Key_Left, Qt::ShiftModifier}}) {
    QTest::keyClick(&view, key, modifiers);
    seen.push_back(at());
  }
  EXPECT_EQ(seen, (std::vector<std::string>{"0:6", "1:6", "2:1", "2:1", "2:0"}));
  QTest::keyClick(&view, Qt::Key_Right, Qt::ShiftModifier);
  view.copy();
  EXPECT_EQ(QApplication::clipboard()->text(), "g line\nX");
  QTest::keyClick(&view, Qt::Key_Home, Qt::ControlModifier);
  EXPECT_EQ(at(), "0:0");
  EXPECT_FALSE(view.hasSelection());
}

TEST_F(EditorTest, PrintsEveryPageToAPdf) {
  editor.showNew("Out File (*.OUT)");
  QString lines;
  for (int i = 1; i <= 200; ++i) lines += QString("PN:%1\n").arg(i);
  text()->setPlainText(lines);
  QPrinter printer;
  printer.setOutputFormat(QPrinter::PdfFormat);
  printer.setOutputFileName(QString::fromStdString(dir.file("out.pdf")));
  editor.printTo(printer);
  const std::string pdf = ReadFile(dir.file("out.pdf"));
  ASSERT_TRUE(pdf.starts_with("%PDF"));
  // 200 lines do not fit on one page within one-inch margins.
  size_t pages = 0;
  for (size_t at = pdf.find("/Type /Page"); at != std::string::npos;
       at = pdf.find("/Type /Page", at + 1))
    if (pdf.compare(at, 12, "/Type /Pages") != 0) ++pages;
  EXPECT_GE(pages, 3u);
}

}  // namespace
}  // namespace zv
