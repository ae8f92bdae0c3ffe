#include "editor/TextEditorWindow.h"

#include <QAction>
#include <QApplication>
#include <QCloseEvent>
#include <QFile>
#include <QFileInfo>
#include <QLabel>
#include <QMenu>
#include <QMenuBar>
#include <QPlainTextEdit>
#include <QPrintDialog>
#include <QPrintPreviewDialog>
#include <QPrinter>
#include <QProgressDialog>
#include <QStackedWidget>
#include <QStatusBar>
#include <QStringDecoder>
#include <QTextBlock>
#include <filesystem>

#include "editor/FindReplaceDialog.h"
#include "editor/LineView.h"
#include "editor/PlanView.h"
#include "platform/TextIo.h"
#include "platform/Ui.h"
#include "platform/qt/BackgroundRun.h"
#include "platform/qt/Controls.h"
#include "survey/Listing.h"

namespace zv {

namespace {

// Larger files would take minutes and gigabytes in a text box.
constexpr qint64 kLargestEdited = qint64{32} << 20;
// A viewer shows larger files in a LineView.
constexpr qint64 kLargestInTextBox = qint64{1} << 20;

const char* kAskToSave = "Changes have been made.  Would you like to save them?";

std::string Std(const QString& s) {
  return s.toStdString();
}

QString FolderOf(const QString& path) {
  return path.isEmpty() ? QString() : QFileInfo(path).absolutePath();
}

// A complete sentence from the listing routines, or a system reason.
QString WriteError(const QString& path, const std::string& error) {
  if (!error.empty() && error.back() == '.') return QString::fromStdString(error);
  return "The file '" + path + "' could not be written: " + QString::fromStdString(error) + ".";
}

}  // namespace

QString EditorFilter(const QString& typeText) {
  const qsizetype open = typeText.indexOf('(');
  const qsizetype close = typeText.indexOf(')', open + 1);
  QString pattern = open >= 0 && close > open ? typeText.mid(open + 1, close - open - 1) : "";
  return typeText + "|" + pattern;
}

bool HasListingViews(const QString& path) {
  static const QStringList kEndings = {"PRJ", "EDI", "CAL", "PAC", "CTL", "ALI"};
  return kEndings.contains(path.right(3).toUpper());
}

TextEditorWindow::TextEditorWindow(Ui& ui, QWidget* parent) : QMainWindow(parent), ui_(ui) {
  setObjectName("frmTextEditor");
  text_ = new QPlainTextEdit(this);
  text_->setObjectName("rtbTextEditor");
  text_->setLineWrapMode(QPlainTextEdit::NoWrap);
  QFont mono("Monospace");
  mono.setStyleHint(QFont::TypeWriter);
  text_->setFont(mono);
  view_ = new LineView(this);
  pages_ = new QStackedWidget(this);
  pages_->addWidget(text_);
  pages_->addWidget(view_);
  setCentralWidget(pages_);

  QStatusBar* bar = statusBar();
  bar->setObjectName("sbrTextEditor");
  lineLabel_ = new QLabel(bar);
  lineLabel_->setObjectName("Line");
  columnLabel_ = new QLabel(bar);
  columnLabel_->setObjectName("Column");
  bar->addWidget(lineLabel_, 1);
  bar->addWidget(columnLabel_, 1);

  buildMenus();
  connect(text_, &QPlainTextEdit::textChanged, this, [this] { changed_ = true; });
  connect(text_, &QPlainTextEdit::cursorPositionChanged, this, &TextEditorWindow::updateStatus);
  connect(text_, &QPlainTextEdit::selectionChanged, this, &TextEditorWindow::updateStatus);
  connect(view_, &LineView::caretMoved, this, &TextEditorWindow::updateStatus);
  resize(760, 560);
  setCaption("VORN Text Editor");
  updateStatus();
}

TextEditorWindow::~TextEditorWindow() {
  if (find_) delete find_;
}

void TextEditorWindow::buildMenus() {
  auto add = [this](QMenu* menu, const char* name, const QString& text, auto slot,
                    QKeySequence keys = {}) {
    return AddAction(menu, this, name, text, slot, keys);
  };
  QMenu* file = menuBar()->addMenu("&File");
  file->setObjectName("mnuFile");
  add(file, "mnuFileNew", "&New", &TextEditorWindow::fileNew, QKeySequence::New);
  add(file, "mnuFileOpen", "&Open...", &TextEditorWindow::fileOpen, QKeySequence::Open);
  add(file, "mnuFileClose", "&Close", &TextEditorWindow::fileClose);
  file->addSeparator()->setObjectName("mnuFileSep1");
  add(file, "mnuFileSave", "&Save", &TextEditorWindow::fileSave, QKeySequence::Save);
  add(file, "mnuFileSaveAs", "Save &As...", &TextEditorWindow::fileSaveAs);
  file->addSeparator();
  add(file, "mnuFilePrint", "&Print...", &TextEditorWindow::filePrint, QKeySequence::Print);
  add(file, "mnuFilePrintPreview", "Print Pre&view...", &TextEditorWindow::filePrintPreview);
  file->addSeparator();
  add(file, "mnuFileExit", "E&xit", &QWidget::close);

  QMenu* edit = menuBar()->addMenu("&Edit");
  edit->setObjectName("mnuEdit");
  add(
      edit, "mnuEditCut", "Cu&t", [this] { text_->cut(); }, QKeySequence::Cut);
  add(
      edit, "mnuEditCopy", "&Copy", [this] { large_ ? view_->copy() : text_->copy(); },
      QKeySequence::Copy);
  add(
      edit, "mnuEditPaste", "&Paste", [this] { text_->paste(); }, QKeySequence::Paste);
  add(edit, "mnuEditClear", "Cle&ar", &TextEditorWindow::editClear);
  edit->addSeparator();
  add(
      edit, "mnuEditSelectAll", "Select A&ll",
      [this] { large_ ? view_->selectAll() : text_->selectAll(); }, QKeySequence::SelectAll);
  edit->addSeparator();
  add(edit, "mnuEditFind", "&Find...", &TextEditorWindow::showFind, QKeySequence::Find);
  add(edit, "mnuEditReplace", "&Replace...", &TextEditorWindow::showReplace, QKeySequence::Replace);
  for (QWidget* box : {static_cast<QWidget*>(text_), static_cast<QWidget*>(view_)}) {
    box->setContextMenuPolicy(Qt::CustomContextMenu);
    connect(box, &QWidget::customContextMenuRequested, this,
            [box, edit](const QPoint& at) { edit->exec(box->mapToGlobal(at)); });
  }

  viewMenu_ = menuBar()->addMenu("&View");
  viewMenu_->setObjectName("mnuView");
  viewListAction_ = add(viewMenu_, "mnuViewList", "&List", &TextEditorWindow::viewList);
  viewRecordAction_ = add(viewMenu_, "mnuViewRecord", "&Record", &TextEditorWindow::viewRecord);
  viewMenu_->addSeparator();
  add(viewMenu_, "mnuViewPlan", "&Plan View", [this] { OpenPlanView(ui_, Std(path_)); });
  viewListAction_->setCheckable(true);
  viewRecordAction_->setCheckable(true);
  setViewChecks();
  viewMenu_->menuAction()->setVisible(false);
}

void TextEditorWindow::setViewOnly(bool viewOnly) {
  viewOnly_ = viewOnly;
  text_->setReadOnly(viewOnly);
  for (const char* name :
       {"mnuEditReplace", "mnuEditCut", "mnuEditPaste", "mnuEditClear", "mnuFileNew", "mnuFileOpen",
        "mnuFileClose", "mnuFileSave", "mnuFileSep1"}) {
    if (auto* a = findChild<QAction*>(name)) {
      a->setVisible(!viewOnly);
      a->setEnabled(!viewOnly);  // no shortcut either
    }
  }
  if (find_) find_->hideShowReplace(viewOnly);
}

void TextEditorWindow::showLargeFile(bool large) {
  large_ = large;
  if (!large) view_->close();
  pages_->setCurrentWidget(large ? static_cast<QWidget*>(view_) : text_);
  if (find_) large ? find_->setTarget(view_) : find_->setTarget(text_);
  updateStatus();
}

bool TextEditorWindow::showTextEditor(const QString& path, const QString& typeText, bool viewOnly) {
  setViewOnly(viewOnly);
  filter_ = EditorFilter(typeText);
  viewMenu_->menuAction()->setVisible(HasListingViews(path));
  recordView_ = false;
  setViewChecks();
  path_ = path;
  const bool loaded = load(path);
  changed_ = false;
  setCaption("VORN File Viewer");
  return loaded;
}

void TextEditorWindow::showNew(const QString& typeText) {
  setViewOnly(false);
  filter_ = EditorFilter(typeText);
  path_.clear();
  showLargeFile(false);
  text_->clear();
  changed_ = false;
  setCaption("VORN Text Editor");
}

FindReplaceDialog* TextEditorWindow::findDialog() {
  if (!find_) {
    find_ = new FindReplaceDialog(ui_, this);
    large_ ? find_->setTarget(view_) : find_->setTarget(text_);
    find_->hideShowReplace(viewOnly_);
  }
  return find_;
}

void TextEditorWindow::setCaption(const QString& prefix) {
  setWindowTitle(path_.isEmpty() ? prefix : prefix + " - " + path_);
}

bool TextEditorWindow::load(const QString& path) {
  if (find_ && find_->searching()) return false;  // the view is being read
  if (path.isEmpty()) {
    showLargeFile(false);
    text_->clear();
    return true;
  }
  QFile file(path);
  if (!QFileInfo(path).isFile() || !file.open(QIODevice::ReadOnly)) {
    ui_.exclaim("The file '" + Std(path) + "' doesn't exist.");
    return false;
  }
  if (!viewOnly_ && file.size() > kLargestEdited) {
    ui_.inform("The file '" + Std(path) + "' is too large to be edited here (" +
               std::to_string(file.size() >> 20) + " MB; at most " +
               std::to_string(kLargestEdited >> 20) + " MB).  It is opened for viewing only.");
    setViewOnly(true);
  }
  if (viewOnly_ && file.size() > kLargestInTextBox) {
    QString error;
    if (!view_->open(path, error)) {
      ui_.exclaim("The file '" + Std(path) + "' could not be read: " + Std(error) + ".");
      return false;
    }
    text_->clear();
    showLargeFile(true);
    changed_ = false;
    return true;
  }
  showLargeFile(false);
  QByteArray bytes = file.readAll();
  // CR LF pairs become single line breaks; other bytes stay.
  qsizetype kept = 0;
  for (qsizetype i = 0; i < bytes.size(); ++i) {
    if (bytes[i] == '\r' && i + 1 < bytes.size() && bytes[i + 1] == '\n') continue;
    bytes[kept++] = bytes[i];
  }
  bytes.truncate(kept);
  QStringDecoder utf8(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
  QString text = utf8(bytes);
  latin1_ = utf8.hasError();
  if (latin1_) text = QString::fromLatin1(bytes);
  setText(text);
  text_->setReadOnly(viewOnly_);
  changed_ = false;
  return true;
}

// A long text goes in piece by piece behind a progress window, so that the
// windows keep painting.
void TextEditorWindow::setText(const QString& text) {
  constexpr qsizetype kPiece = 1 << 18;
  if (text.size() <= 4 * kPiece) {
    text_->setPlainText(text);
    return;
  }
  QProgressDialog progress("Loading " + path_ + "...", QString(), 0, 1000, this);
  progress.setWindowTitle(kAppTitle);
  progress.setWindowModality(Qt::WindowModal);
  progress.setCancelButton(nullptr);
  progress.setMinimumDuration(300);
  QApplication::setOverrideCursor(Qt::WaitCursor);
  text_->clear();
  QTextDocument* doc = text_->document();
  doc->setUndoRedoEnabled(false);
  QTextCursor cursor(doc);
  for (qsizetype at = 0; at < text.size();) {
    qsizetype end = text.indexOf('\n', std::min(at + kPiece, text.size()));
    end = end < 0 ? text.size() : end + 1;
    cursor.movePosition(QTextCursor::End);
    cursor.insertText(text.mid(at, end - at));
    at = end;
    progress.setValue(static_cast<int>(at * 1000 / text.size()));
    QApplication::processEvents(QEventLoop::ExcludeUserInputEvents);
  }
  doc->setUndoRedoEnabled(true);
  QApplication::restoreOverrideCursor();
  text_->moveCursor(QTextCursor::Start);
}

bool TextEditorWindow::writeText(const QString& path) {
  if (large_) {
    std::string error;
    const bool ok = view_->write(Std(path), error);
    if (!ok) ui_.exclaim(Std(WriteError(path, error)));
    return ok;
  }
  const QByteArray bytes =
      latin1_ ? text_->toPlainText().toLatin1() : text_->toPlainText().toUtf8();
  TextFileWriter writer(Std(path));
  bool ok = writer.open();
  if (ok) {
    std::string& out = writer.buffer();
    out.reserve(static_cast<size_t>(bytes.size()) + static_cast<size_t>(bytes.count('\n')));
    for (char c : bytes) {
      if (c == '\n') out += '\r';
      out += c;
    }
    ok = writer.commit();
  }
  if (!ok) ui_.exclaim(Std(WriteError(path, writer.error())));
  return ok;
}

bool TextEditorWindow::askToSave() {
  if (!changed_) return true;
  if (!ui_.askYesNo(kAskToSave)) return true;
  return fileSave();
}

void TextEditorWindow::closeEvent(QCloseEvent* event) {
  if (find_ && find_->searching()) {
    event->ignore();
    return;
  }
  if (changed_) {
    // Cancel, or a save that did not happen, keeps the window and its text.
    Answer a = ui_.message(kAskToSave, Icon::None, Buttons::YesNoCancel, kAppTitle);
    if (a == Answer::Cancel || (a == Answer::Yes && !fileSave())) {
      event->ignore();
      return;
    }
  }
  if (find_) find_->close();
  event->accept();
}

void TextEditorWindow::fileNew() {
  if (!askToSave()) return;
  path_.clear();
  showLargeFile(false);
  text_->clear();
  changed_ = false;
  viewMenu_->menuAction()->setVisible(false);
  recordView_ = false;
  setViewChecks();
  setCaption("VORN Text Editor");
}

void TextEditorWindow::fileOpen() {
  if (!askToSave()) return;
  auto chosen = ui_.chooseFile({FileDialogKind::Open, "Open", Std(filter_), Std(FolderOf(path_))});
  if (!chosen) return;
  path_ = QString::fromStdString(*chosen);
  load(path_);
  changed_ = false;
  viewMenu_->menuAction()->setVisible(HasListingViews(path_));
  recordView_ = false;
  setViewChecks();
  setCaption("VORN Text Editor");
}

void TextEditorWindow::fileClose() {
  if (!askToSave()) return;
  load(path_);
  changed_ = false;
}

bool TextEditorWindow::fileSave() {
  if (path_.isEmpty()) return fileSaveAs();
  if (!writeText(path_)) return false;
  changed_ = false;
  setCaption("VORN Text Editor");
  return true;
}

bool TextEditorWindow::fileSaveAs() {
  auto chosen =
      ui_.chooseFile({FileDialogKind::Save, "Save As", Std(filter_), Std(FolderOf(path_))});
  if (!chosen) return false;
  const QString path = QString::fromStdString(*chosen);
  if (!writeText(path)) return false;
  path_ = path;
  load(path_);
  changed_ = false;
  setCaption("VORN Text Editor");
  return true;
}

void TextEditorWindow::printTo(QPrinter& printer) {
  printer.setFullPage(true);  // margins measured from the paper's edge
  printer.setPageMargins(QMarginsF(1, 1, 1, 1), QPageLayout::Inch);
  large_ ? view_->printTo(printer) : text_->print(&printer);
}

void TextEditorWindow::filePrint() {
  QPrinter printer;
  QPrintDialog dialog(&printer, this);
  if (dialog.exec() == QDialog::Accepted) printTo(printer);
}

void TextEditorWindow::filePrintPreview() {
  QPrinter printer;
  QPrintPreviewDialog preview(&printer, this);
  connect(&preview, &QPrintPreviewDialog::paintRequested, this,
          [this](QPrinter* p) { printTo(*p); });
  preview.exec();
}

void TextEditorWindow::editClear() {
  text_->clear();
  changed_ = true;
}

void TextEditorWindow::showFind() {
  FindReplaceDialog* d = findDialog();
  d->showFind();
}

void TextEditorWindow::showReplace() {
  FindReplaceDialog* d = findDialog();
  d->showReplace();
}

void TextEditorWindow::setViewChecks() {
  viewListAction_->setChecked(!recordView_);
  viewRecordAction_->setChecked(recordView_);
}

void TextEditorWindow::viewList() {
  if (recordView_ && showListView()) recordView_ = false;
  setViewChecks();
  text_->setReadOnly(viewOnly_);
}

void TextEditorWindow::viewRecord() {
  if (!recordView_ && showRecordView()) recordView_ = true;
  setViewChecks();
}

// The working files are named after the file: N.lst and N.rec. Only these
// two are written or deleted.
bool TextEditorWindow::showRecordView() {
  const std::string stem = ListingStem(Std(path_));
  const QString list = QString::fromStdString(stem + ".lst");
  const QString record = QString::fromStdString(stem + ".rec");
  if (!writeText(list)) return false;
  std::string error;
  const bool ok = convert(
      [&] { return ConvertListToRecord(Std(list), Std(record), error, CurrentRunProgress()); });
  std::error_code ec;
  std::filesystem::remove(Std(list), ec);
  if (!ok) {
    if (!error.empty()) ui_.exclaim(Std(WriteError(record, error)));
    return false;
  }
  path_ = record;
  load(path_);
  setCaption("VORN File Viewer");
  return true;
}

bool TextEditorWindow::showListView() {
  std::string name = Std(path_);
  if (name.ends_with(".rec")) name.resize(name.size() - 4);
  const std::string stem = ListingStem(name);
  const QString record = QString::fromStdString(stem + ".rec");
  const QString list = QString::fromStdString(stem + ".lst");
  if (!writeText(record)) return false;
  std::string error;
  const bool ok = convert(
      [&] { return ConvertRecordToList(Std(record), Std(list), error, CurrentRunProgress()); });
  std::error_code ec;
  std::filesystem::remove(Std(record), ec);
  if (!ok) {
    if (!error.empty()) ui_.exclaim(Std(WriteError(list, error)));
    return false;
  }
  path_ = list;
  load(path_);
  setCaption("VORN File Viewer");
  return true;
}

// False without an error when the user stopped it.
bool TextEditorWindow::convert(const std::function<bool()>& work) {
  if (!large_) return work();
  try {
    return RunInBackground(this, "Converting...", work);
  } catch (const RunCancelled&) {
    return false;
  }
}

void TextEditorWindow::updateStatus() {
  qint64 line = 0, column = 0;
  if (large_) {
    line = view_->caret().line;
    column = view_->caret().column;
  } else {
    const QTextCursor c = text_->textCursor();
    line = c.blockNumber();
    column = c.positionInBlock();
  }
  lineLabel_->setText("Line Number: " + QString::number(line + 1));
  columnLabel_->setText("Column Number: " + QString::number(column + 1));
}

QWidget* OpenTextEditor(Ui& ui, const std::string& path, const std::string& type, EditorMode mode) {
  auto* editor = new TextEditorWindow(ui);
  editor->setAttribute(Qt::WA_DeleteOnClose);
  // Shown first: a long file then fills a visible window behind its progress.
  editor->show();
  if (path.empty() && mode == EditorMode::Editor) {
    editor->showNew(QString::fromStdString(type));
  } else if (!editor->showTextEditor(QString::fromStdString(path), QString::fromStdString(type),
                                     mode == EditorMode::Viewer)) {
    // No empty window is left behind a file that could not be shown.
    editor->close();
    return nullptr;
  }
  return editor;
}

}  // namespace zv
