#include "editor/FindReplaceDialog.h"

#include <QCheckBox>
#include <QGridLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QTextBlock>
#include <QTextDocument>
#include <QVBoxLayout>

#include "editor/LineView.h"
#include "platform/Ui.h"
#include "platform/qt/BackgroundRun.h"

namespace zv {

FindReplaceDialog::FindReplaceDialog(Ui& ui, QWidget* parent) : QDialog(parent), ui_(ui) {
  setObjectName("frmFindReplace");
  setModal(false);
  auto* findLabel = new QLabel("Fi&nd what:", this);
  findText_ = new QLineEdit(this);
  findText_->setObjectName("txtFRFind");
  findLabel->setBuddy(findText_);
  replaceLabel_ = new QLabel("Re&place with:", this);
  replaceText_ = new QLineEdit(this);
  replaceText_->setObjectName("txtFRReplace");
  replaceLabel_->setBuddy(replaceText_);
  matchWord_ = new QCheckBox("Match &whole word only", this);
  matchWord_->setObjectName("chkFRMatchWord");
  matchCase_ = new QCheckBox("Match &case", this);
  matchCase_->setObjectName("chkFRMatchCase");

  auto button = [this](const char* name, const QString& text) {
    auto* b = new QPushButton(text, this);
    b->setObjectName(name);
    return b;
  };
  findButton_ = button("cmdFRFind", "&Find Next");
  replaceButton_ = button("cmdFRReplace", "&Replace");
  replaceAllButton_ = button("cmdFRReplaceAll", "Replace &All");
  showReplaceButton_ = button("cmdFRShowReplace", "R&eplace...");
  QPushButton* cancel = button("cmdFRCancel", "Cancel");

  auto* grid = new QGridLayout(this);
  grid->addWidget(findLabel, 0, 0);
  grid->addWidget(findText_, 0, 1);
  grid->addWidget(replaceLabel_, 1, 0);
  grid->addWidget(replaceText_, 1, 1);
  grid->addWidget(matchWord_, 2, 0, 1, 2);
  grid->addWidget(matchCase_, 3, 0, 1, 2);
  auto* buttons = new QVBoxLayout;
  for (QPushButton* b :
       {findButton_, replaceButton_, replaceAllButton_, showReplaceButton_, cancel})
    buttons->addWidget(b);
  buttons->addStretch();
  grid->addLayout(buttons, 0, 2, 5, 1);
  grid->setRowStretch(4, 1);

  connect(findButton_, &QPushButton::clicked, this, [this] { find(); });
  connect(replaceButton_, &QPushButton::clicked, this, [this] { replace(); });
  connect(replaceAllButton_, &QPushButton::clicked, this, [this] { replaceAll(); });
  connect(showReplaceButton_, &QPushButton::clicked, this, &FindReplaceDialog::showReplace);
  connect(cancel, &QPushButton::clicked, this, &QDialog::close);
}

void FindReplaceDialog::setTarget(QPlainTextEdit* target) {
  target_ = target;
  view_ = nullptr;
}

void FindReplaceDialog::setTarget(LineView* target) {
  view_ = target;
  target_ = nullptr;
}

void FindReplaceDialog::setReplaceMode(bool on) {
  setWindowTitle(on ? "Replace" : "Find");
  replaceLabel_->setVisible(on);
  replaceText_->setVisible(on);
  replaceButton_->setVisible(on);
  replaceAllButton_->setVisible(on);
  showReplaceButton_->setVisible(!on);
  findButton_->setDefault(!on);
  replaceButton_->setDefault(on);
  adjustSize();
}

void FindReplaceDialog::showFind() {
  setReplaceMode(false);
  show();
  raise();
  activateWindow();
  findText_->setFocus();
}

void FindReplaceDialog::showReplace() {
  setReplaceMode(true);
  show();
  raise();
  activateWindow();
  findText_->setFocus();
}

void FindReplaceDialog::hideShowReplace(bool hide) {
  showReplaceButton_->setEnabled(!hide);
}

bool FindReplaceDialog::selectionMatches(const QTextCursor& cursor) const {
  if (!cursor.hasSelection()) return false;
  const Qt::CaseSensitivity cs = matchCase_->isChecked() ? Qt::CaseSensitive : Qt::CaseInsensitive;
  return cursor.selectedText().compare(findText_->text(), cs) == 0;
}

// The next occurrence after the cursor's caret, or after its selection when
// that is already the search text, so that repeated steps go through the
// text. Null when there is none.
QTextCursor FindReplaceDialog::search(const QTextCursor& cursor) const {
  QTextDocument::FindFlags flags;
  if (matchCase_->isChecked()) flags |= QTextDocument::FindCaseSensitively;
  if (matchWord_->isChecked()) flags |= QTextDocument::FindWholeWords;
  const int from = selectionMatches(cursor) ? cursor.selectionEnd() : cursor.position();
  const QString needle = findText_->text();
  if (needle.isEmpty()) return {};
  return cursor.document()->find(needle, from, flags);
}

bool FindReplaceDialog::findNext() {
  if (view_) return findInView();
  if (!target_) return false;
  const QTextCursor hit = search(target_->textCursor());
  if (hit.isNull()) {
    ui_.inform("Search String Not Found.");
    return false;
  }
  target_->setTextCursor(hit);
  target_->setFocus();
  return true;
}

bool FindReplaceDialog::find() {
  return findNext();
}

// Searches a large file off the GUI thread behind a progress window with
// Cancel; a cancelled search says nothing.
bool FindReplaceDialog::findInView() {
  const QString needle = findText_->text();
  if (needle.isEmpty()) return false;
  const Qt::CaseSensitivity cs = matchCase_->isChecked() ? Qt::CaseSensitive : Qt::CaseInsensitive;
  // After a selection that is the search text, else from the caret.
  LineView::Position from = std::max(view_->anchor(), view_->caret());
  if (!view_->hasSelection() || view_->anchor().line != view_->caret().line ||
      view_->selectedText().compare(needle, cs) != 0)
    from = view_->caret();
  std::optional<LineView::Position> hit;
  LineView* view = view_;
  const bool wholeWords = matchWord_->isChecked();
  // The view and this dialog take no input until the search has ended; the
  // window keeps its file meanwhile (searching()).
  QWidget* window = view->window();
  view->setEnabled(false);
  setEnabled(false);
  searching_ = true;
  bool cancelled = false;
  try {
    RunInBackground(window, "Searching...", [&] {
      hit = view->search(needle, from, cs == Qt::CaseSensitive, wholeWords, CurrentRunProgress());
      return true;
    });
  } catch (const RunCancelled&) {
    cancelled = true;
  }
  searching_ = false;
  setEnabled(true);
  view->setEnabled(true);
  if (cancelled) return false;
  if (!hit) {
    ui_.inform("Search String Not Found.");
    return false;
  }
  view->setSelection(*hit, {hit->line, hit->column + needle.size()});
  view->setFocus();
  return true;
}

bool FindReplaceDialog::replace() {
  if (!target_) return false;
  QTextCursor cursor = target_->textCursor();
  if (selectionMatches(cursor)) {
    cursor.insertText(replaceText_->text());
    target_->setTextCursor(cursor);
  }
  return findNext();
}

// The occurrences are found in one pass over the text and replaced in one
// edit (one undo step), each in place: rebuilding the whole text would cost
// far more than the edits. Each search goes on after the replaced text, so a
// replacement that holds the search text is not found again.
int FindReplaceDialog::replaceAll() {
  if (!target_) return 0;
  const int caret = target_->textCursor().position();
  const QString needle = findText_->text();
  const QString with = replaceText_->text();
  const Qt::CaseSensitivity cs = matchCase_->isChecked() ? Qt::CaseSensitive : Qt::CaseInsensitive;
  const bool wholeWords = matchWord_->isChecked();
  int count = 0;
  if (!needle.isEmpty()) {
    // Raw text: one character per document position (U+2029 between blocks).
    const QString text = target_->document()->toRawText();
    QTextCursor edit(target_->document());
    qsizetype shift = 0;
    for (qsizetype at = FindInLine(text, needle, 0, cs, wholeWords); at >= 0;
         at = FindInLine(text, needle, at + needle.size(), cs, wholeWords)) {
      if (count++ == 0) edit.beginEditBlock();
      edit.setPosition(static_cast<int>(at + shift));
      edit.setPosition(static_cast<int>(at + shift + needle.size()), QTextCursor::KeepAnchor);
      edit.insertText(with);
      shift += with.size() - needle.size();
    }
    if (count > 0) edit.endEditBlock();
  }
  QTextCursor restore(target_->document());
  restore.setPosition(std::min(caret, target_->document()->characterCount() - 1));
  target_->setTextCursor(restore);
  ui_.inform("Replaced '" + needle.toStdString() + "' with '" + with.toStdString() + "' " +
             std::to_string(count) + " time(s).");
  return count;
}

}  // namespace zv
