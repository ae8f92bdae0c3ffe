#include "coordui/EpsgImportDialog.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QVBoxLayout>
#include <algorithm>

#include "platform/Strings.h"
#include "platform/qt/Controls.h"

namespace zv {

EpsgImportDialog::EpsgImportDialog(QWidget* parent) : QDialog(parent) {
  setObjectName("frmEpsgImport");
  setWindowTitle("Import from EPSG");
  query_ = new QLineEdit(this);
  query_->setObjectName("txtEpsgQuery");
  query_->setPlaceholderText("EPSG code or words of the name, e.g. 2288 or Wisconsin Central");
  QPushButton* find = MakeButton(this, "cmdEpsgSearch", "&Search");
  list_ = new QListWidget(this);
  list_->setObjectName("lstEpsgCandidates");
  list_->setMinimumSize(560, 280);
  status_ = new QLabel(this);
  status_->setObjectName("lblEpsgStatus");
  status_->setWordWrap(true);
  QPushButton* ok = MakeButton(this, "cmdEpsgOK", "OK");
  QPushButton* cancel = MakeButton(this, "cmdEpsgCancel", "Cancel");

  auto* top = new QHBoxLayout;
  top->addWidget(query_, 1);
  top->addWidget(find);
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  buttons->addWidget(ok);
  buttons->addWidget(cancel);
  auto* layout = new QVBoxLayout(this);
  layout->addLayout(top);
  layout->addWidget(list_, 1);
  layout->addWidget(status_);
  layout->addLayout(buttons);

  connect(find, &QPushButton::clicked, this, &EpsgImportDialog::search);
  connect(query_, &QLineEdit::returnPressed, this, &EpsgImportDialog::search);
  connect(ok, &QPushButton::clicked, this, [this] {
    if (chosen()) accept();
  });
  // Enter or a double click on a system takes it.
  connect(list_, &QListWidget::itemActivated, this, [this] {
    if (chosen()) accept();
  });
  connect(cancel, &QPushButton::clicked, this, &QDialog::reject);
}

void EpsgImportDialog::search() {
  list_->clear();
  const EpsgSearch found = SearchEpsg(std::string(Trim(query_->text().toStdString())));
  candidates_ = found.candidates;
  for (const EpsgCandidate& c : candidates_) {
    QString text = QString::fromStdString(c.code + "  " + c.name);
    auto* item = new QListWidgetItem(list_);
    if (!c.refusal.empty()) {
      text += QString::fromStdString("  (" + c.refusal + ")");
      item->setFlags(Qt::NoItemFlags);
    }
    item->setText(text);
  }
  if (!found.error.empty()) {
    status_->setText(QString::fromStdString(found.error));
  } else {
    status_->setText(candidates_.size() == 1
                         ? QString("1 system found.")
                         : QString("%1 systems found.").arg(candidates_.size()));
  }
  auto usable = std::find_if(candidates_.begin(), candidates_.end(),
                             [](const EpsgCandidate& c) { return c.refusal.empty(); });
  if (usable != candidates_.end()) {
    // The next Enter takes the system found.
    list_->setCurrentRow(static_cast<int>(usable - candidates_.begin()));
    list_->setFocus();
  }
}

std::optional<EpsgCandidate> EpsgImportDialog::chosen() const {
  const int row = list_->currentRow();
  if (row < 0 || row >= static_cast<int>(candidates_.size())) return std::nullopt;
  if (!candidates_[row].refusal.empty()) return std::nullopt;
  return candidates_[row];
}

std::optional<ZoneRecord> ImportEpsgZone(Ui& ui, const std::string& appFolder, QWidget* parent) {
  EpsgImportDialog dialog(parent);
  if (dialog.exec() != QDialog::Accepted) return std::nullopt;
  const std::optional<EpsgCandidate> candidate = dialog.chosen();
  if (!candidate) return std::nullopt;
  EpsgZone imported = ZoneFromEpsg(candidate->code, appFolder);
  if (!imported.error.empty()) {
    ui.exclaim(imported.error, "Import from EPSG");
    return std::nullopt;
  }
  if (imported.zone.zone.empty()) {
    // "NAD83 / Wisconsin Central (ftUS)" proposes "Wisconsin Central (ftUS)".
    const size_t slash = candidate->name.find(" / ");
    std::string name =
        slash == std::string::npos ? candidate->name : candidate->name.substr(slash + 3);
    std::replace(name.begin(), name.end(), '~', '-');
    imported.zone.zone = name;
  }
  if (!imported.datumNote.empty()) ui.inform(imported.datumNote, "Import from EPSG");
  return imported.zone;
}

}  // namespace zv
