#pragma once
// frmTextEditor: a plain-text editor window, opened as a viewer (read-only,
// editing menus hidden) or as an editor. For VORN tagged files its View menu
// switches between the list view (the file itself) and the record view.
// A viewer shows a file over 1 MB in a LineView (any size, at once); an
// editor takes files up to 32 MB and opens larger ones as a viewer.

#include <QMainWindow>
#include <QPointer>
#include <QString>
#include <functional>

class QAction;
class QLabel;
class QMenu;
class QPlainTextEdit;
class QPrinter;
class QStackedWidget;

namespace zv {

class FindReplaceDialog;
class LineView;
class Ui;
enum class EditorMode;

class TextEditorWindow : public QMainWindow {
  Q_OBJECT

 public:
  explicit TextEditorWindow(Ui& ui, QWidget* parent = nullptr);
  ~TextEditorWindow() override;

  // Show_TextEditor: loads the file as a viewer (`viewOnly`) or an editor;
  // typeText such as "Out File (*.OUT)" gives the open and save filter.
  // False (the reason shown) when the file cannot be shown.
  bool showTextEditor(const QString& path, const QString& typeText, bool viewOnly);
  // Show_New: an empty editor.
  void showNew(const QString& typeText);

  QString path() const { return path_; }
  bool changed() const { return changed_; }
  bool viewOnly() const { return viewOnly_; }
  QPlainTextEdit* textBox() const { return text_; }
  LineView* lineView() const { return view_; }
  // True when the file is shown by lineView() instead of the text box.
  bool showsLargeFile() const { return large_; }
  FindReplaceDialog* findDialog();

  // Renders the whole text onto the printer's pages, one-inch margins.
  void printTo(QPrinter& printer);

  // The menu commands, also used by tests.
  void fileNew();
  void fileOpen();
  void fileClose();
  bool fileSave();
  bool fileSaveAs();
  void filePrint();
  void filePrintPreview();
  void editClear();
  void showFind();
  void showReplace();
  void viewList();
  void viewRecord();

 protected:
  void closeEvent(QCloseEvent* event) override;

 private:
  void buildMenus();
  bool load(const QString& path);
  void setViewOnly(bool viewOnly);
  void showLargeFile(bool large);
  void setText(const QString& text);
  bool writeText(const QString& path);
  // Asks to save changes; false when the operation must not go on.
  bool askToSave();
  void updateStatus();
  void setCaption(const QString& prefix);
  bool showRecordView();
  bool showListView();
  // A listing conversion, off the GUI thread for a large file.
  bool convert(const std::function<bool()>& work);
  void setViewChecks();

  Ui& ui_;
  QStackedWidget* pages_;
  QPlainTextEdit* text_;
  LineView* view_;
  QLabel* lineLabel_;
  QLabel* columnLabel_;
  QMenu* viewMenu_;
  QAction* viewListAction_;
  QAction* viewRecordAction_;
  QPointer<FindReplaceDialog> find_;
  QString path_;
  QString filter_;  // "Out File (*.OUT)|*.OUT"
  bool viewOnly_ = false;
  bool changed_ = false;
  bool recordView_ = false;
  bool large_ = false;
  bool latin1_ = false;  // the file was not UTF-8: written back byte for byte
};

// The dialog filter of a type text: the text, "|" and the pattern between
// its "(" and ")".
QString EditorFilter(const QString& typeText);
// True when the View menu applies: the path ends in PRJ, EDI, CAL, PAC, CTL
// or ALI (letter case as written).
bool HasListingViews(const QString& path);

// A new editor window on the file (a new text when the path is empty in the
// editing mode), shown at once and deleted when closed.
QWidget* OpenTextEditor(Ui& ui, const std::string& path, const std::string& typeDescription,
                        EditorMode mode);

}  // namespace zv
