#pragma once
// frmFindReplace: the modeless find and replace dialog of an editor window.

#include <QDialog>
#include <QPointer>

class QCheckBox;
class QLabel;
class QLineEdit;
class QPlainTextEdit;
class QPushButton;
class QTextCursor;

namespace zv {

class LineView;
class Ui;

class FindReplaceDialog : public QDialog {
  Q_OBJECT

 public:
  FindReplaceDialog(Ui& ui, QWidget* parent = nullptr);

  // SET_Type: the text box searched, or the view of a large file.
  void setTarget(QPlainTextEdit* target);
  void setTarget(LineView* target);
  void showFind();
  void showReplace();
  // HideShowReplace: a viewer cannot switch to replace mode.
  void hideShowReplace(bool hide);

  // The buttons. find() and replace() return false when no further
  // occurrence was found; replaceAll() returns the count replaced.
  bool find();
  bool replace();
  int replaceAll();
  // True while a search of a large file runs (its window must stay).
  bool searching() const { return searching_; }

 private:
  bool selectionMatches(const QTextCursor& cursor) const;
  QTextCursor search(const QTextCursor& cursor) const;
  bool findNext();
  bool findInView();
  void setReplaceMode(bool on);

  Ui& ui_;
  QPointer<QPlainTextEdit> target_;
  QPointer<LineView> view_;
  QLineEdit* findText_;
  QLineEdit* replaceText_;
  QLabel* replaceLabel_;
  QCheckBox* matchWord_;
  QCheckBox* matchCase_;
  QPushButton* findButton_;
  QPushButton* replaceButton_;
  QPushButton* replaceAllButton_;
  QPushButton* showReplaceButton_;
  bool searching_ = false;
};

}  // namespace zv
