#include "tools/dialogs/LocalToGridDialog.h"

#include <QComboBox>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>
#include <utility>

#include "geodesy/ConversionForm.h"
#include "platform/Error.h"
#include "platform/qt/Controls.h"
#include "tools/dialogs/ToolDialog.h"

namespace zv {

namespace {

// An editable list whose typed text is never added as an entry.
QComboBox* MakeTypedList(QWidget* parent, const char* name, const LocalList& list) {
  QComboBox* box = MakeList(parent, name, 30);
  box->setEditable(true);
  box->setInsertPolicy(QComboBox::NoInsert);
  for (const LocalListItem& item : list.items) {
    box->addItem(QString::fromStdString(item.first), item.second);
  }
  box->setCurrentIndex(list.selected);
  return box;
}

}  // namespace

LocalToGridDialog::LocalToGridDialog(Ui& ui, const std::string& appFolder,
                                     const RecordedGridReference& recorded, std::string input,
                                     std::string output, LocalToGridRunner run, QWidget* parent)
    : QDialog(parent),
      ui_(ui),
      input_(std::move(input)),
      output_(std::move(output)),
      run_(std::move(run)) {
  setObjectName("frmLocal2Grid");
  setWindowTitle("Local to Grid Coordinates");
  try {
    form_.load(appFolder, recorded);
  } catch (const ZvError& e) {
    ShowListError(ui_, e);
  }

  datums_ = MakeTypedList(this, "cmbHorDatum", form_.datums());
  zones_ = MakeTypedList(this, "cmbZones", form_.zones());
  factor_ = new QLineEdit(QString::fromStdString(form_.factor()), this);
  factor_->setObjectName("txtCombinedFactor");
  auto* fields = new QFormLayout;
  fields->addRow("&Horizontal Datum:", datums_);
  fields->addRow("&Zone:", zones_);
  fields->addRow("&Combined Factor:", factor_);

  auto* okButton = MakeButton(this, "cmdOK", "OK");
  okButton->setDefault(true);
  auto* cancelButton = MakeButton(this, "cmdCancel", "Cancel");
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  buttons->addWidget(okButton);
  buttons->addWidget(cancelButton);
  auto* layout = new QVBoxLayout(this);
  layout->addLayout(fields);
  layout->addLayout(buttons);

  connect(datums_, &QComboBox::currentIndexChanged, this,
          [this](int index) { form_.datums().selected = index; });
  connect(zones_, &QComboBox::currentIndexChanged, this,
          [this](int index) { form_.zones().selected = index; });
  datums_->lineEdit()->installEventFilter(this);
  zones_->lineEdit()->installEventFilter(this);
  connect(factor_, &QLineEdit::textChanged, this,
          [this](const QString& text) { form_.factor() = text.toStdString(); });
  connect(okButton, &QPushButton::clicked, this, &LocalToGridDialog::ok);
  connect(cancelButton, &QPushButton::clicked, this, &QDialog::reject);
}

bool LocalToGridDialog::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::KeyPress) {
    const int key = static_cast<QKeyEvent*>(event)->key();
    if (key == Qt::Key_Return || key == Qt::Key_Enter) {
      for (auto [box, list] : {std::pair{datums_, &form_.datums()}, {zones_, &form_.zones()}}) {
        if (watched == box->lineEdit() &&
            box->currentText() != box->itemText(box->currentIndex())) {
          selectTyped(box, *list);
          return true;
        }
      }
    }
  }
  return QDialog::eventFilter(watched, event);
}

void LocalToGridDialog::selectTyped(QComboBox* box, LocalList& list) {
  list.selectNumber(box->currentText().toStdString());
  box->setCurrentIndex(list.selected);
  // No entry of that number: the entry chosen before stays, as it was shown.
  box->setEditText(list.selected < 0 ? QString() : box->itemText(list.selected));
}

void LocalToGridDialog::ok() {
  const ConsolePlace console = ConsoleBelowDialog(*this);
  LocalToGridForm::Control refused = LocalToGridForm::Control::HorizontalDatum;
  switch (form_.ok(ui_, input_, output_, console.left, console.top, run_, refused)) {
    case LocalOk::Refused:
      switch (refused) {
        case LocalToGridForm::Control::HorizontalDatum:
          datums_->setFocus();
          break;
        case LocalToGridForm::Control::Zone:
          zones_->setFocus();
          break;
        case LocalToGridForm::Control::CombinedFactor:
          factor_->setFocus();
          factor_->selectAll();
          break;
      }
      return;
    case LocalOk::Failed:
      return;
    case LocalOk::Done:
      CloseAfterRun(*this);
      return;
  }
}

}  // namespace zv
