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

#include "platform/Ui.h"

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

bool FindReplaceDialog::replace() {
  if (!target_) return false;
  QTextCursor cursor = target_->textCursor();
  if (selectionMatches(cursor)) {
    cursor.insertText(replaceText_->text());
    target_->setTextCursor(cursor);
  }
  return findNext();
}

int FindReplaceDialog::replaceAll() {
  if (!target_) return 0;
  const int caret = target_->textCursor().position();
  QTextCursor cursor(target_->document());
  int count = 0;
  cursor.beginEditBlock();
  // Each search goes on after the inserted text, so a replacement that
  // holds the search text is not found again.
  for (QTextCursor hit = search(cursor); !hit.isNull(); hit = search(hit)) {
    hit.insertText(replaceText_->text());
    ++count;
  }
  cursor.endEditBlock();
  QTextCursor restore(target_->document());
  restore.setPosition(std::min(caret, target_->document()->characterCount() - 1));
  target_->setTextCursor(restore);
  ui_.inform("Replaced '" + findText_->text().toStdString() + "' with '" +
             replaceText_->text().toStdString() + "' " + std::to_string(count) + " time(s).");
  return count;
}

}  // namespace zv
