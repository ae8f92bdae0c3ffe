#include "tools/dialogs/GridToLocalDialog.h"

#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLineEdit>
#include <QPushButton>
#include <QRadioButton>
#include <QVBoxLayout>

#include "platform/qt/Controls.h"
#include "tools/dialogs/ToolDialog.h"

namespace zv {

namespace {

QRadioButton* MakeOption(QWidget* parent, const char* name, const QString& text) {
  auto* option = new QRadioButton(text, parent);
  option->setObjectName(name);
  return option;
}

QLineEdit* MakeBox(QWidget* parent, const char* name) {
  auto* box = new QLineEdit(parent);
  box->setObjectName(name);
  box->setMinimumWidth(140);
  return box;
}

}  // namespace

GridToLocalDialog::GridToLocalDialog(Ui& ui, std::string input, std::string output,
                                     GridToLocalRunner run, QWidget* parent)
    : QDialog(parent),
      ui_(ui),
      input_(std::move(input)),
      output_(std::move(output)),
      run_(std::move(run)) {
  setObjectName("frmGrid2Local");
  setWindowTitle("Grid to Local Coordinates");

  auto* frame = new QGroupBox("Combined Factor", this);
  frame->setObjectName("fraCombinedFactor");
  allPoints_ = MakeOption(frame, "optAllXYZ", "&Mean of all points (from X, Y and Z)");
  userDefined_ = MakeOption(frame, "optUserDefined", "&User defined factor:");
  pointNumber_ = MakeOption(frame, "optPointNumber", "Factor at &point number:");
  factorBox_ = MakeBox(frame, "txtUserDefined");
  pointBox_ = MakeBox(frame, "txtPointNumber");
  auto* grid = new QGridLayout(frame);
  grid->addWidget(allPoints_, 0, 0, 1, 2);
  grid->addWidget(userDefined_, 1, 0);
  grid->addWidget(factorBox_, 1, 1);
  grid->addWidget(pointNumber_, 2, 0);
  grid->addWidget(pointBox_, 2, 1);

  QPushButton* okButton = MakeButton(this, "cmdOK", "OK");
  okButton->setDefault(true);
  QPushButton* cancelButton = MakeButton(this, "cmdCancel", "Cancel");
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  buttons->addWidget(okButton);
  buttons->addWidget(cancelButton);
  auto* layout = new QVBoxLayout(this);
  layout->addWidget(frame);
  layout->addLayout(buttons);

  connect(allPoints_, &QRadioButton::toggled, this, [this](bool on) {
    if (on) choose(GridToLocalForm::Option::AllPoints);
  });
  connect(userDefined_, &QRadioButton::toggled, this, [this](bool on) {
    if (on) choose(GridToLocalForm::Option::UserDefined);
  });
  connect(pointNumber_, &QRadioButton::toggled, this, [this](bool on) {
    if (on) choose(GridToLocalForm::Option::PointNumber);
  });
  connect(factorBox_, &QLineEdit::textEdited, this, [this](const QString& text) {
    form_.setText(GridToLocalForm::Control::UserDefined, text.toStdString());
  });
  connect(pointBox_, &QLineEdit::textEdited, this, [this](const QString& text) {
    form_.setText(GridToLocalForm::Control::PointNumber, text.toStdString());
  });
  connect(okButton, &QPushButton::clicked, this, &GridToLocalDialog::ok);
  connect(cancelButton, &QPushButton::clicked, this, &QDialog::reject);
  allPoints_->setChecked(true);
  choose(GridToLocalForm::Option::AllPoints);
}

void GridToLocalDialog::choose(GridToLocalForm::Option option) {
  form_.choose(option);
  const LocalTextBox& factor = form_.box(GridToLocalForm::Control::UserDefined);
  const LocalTextBox& point = form_.box(GridToLocalForm::Control::PointNumber);
  factorBox_->setEnabled(factor.enabled);
  factorBox_->setText(QString::fromStdString(factor.text));
  pointBox_->setEnabled(point.enabled);
  pointBox_->setText(QString::fromStdString(point.text));
}

void GridToLocalDialog::ok() {
  const ConsolePlace console = ConsoleBelowDialog(*this);
  GridToLocalForm::Control refused = GridToLocalForm::Control::UserDefined;
  switch (form_.ok(ui_, input_, output_, console.left, console.top, run_, refused)) {
    case LocalOk::Refused: {
      QLineEdit* box = refused == GridToLocalForm::Control::UserDefined ? factorBox_ : pointBox_;
      box->setFocus();
      box->selectAll();
      return;
    }
    case LocalOk::Failed:
      return;
    case LocalOk::Done:
      CloseAfterRun(*this);
      return;
  }
}

}  // namespace zv
