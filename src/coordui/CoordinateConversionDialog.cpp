#include "coordui/CoordinateConversionDialog.h"

#include <QCheckBox>
#include <QComboBox>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QRadioButton>
#include <QVBoxLayout>

#include "platform/qt/Controls.h"

namespace zv {

namespace {

constexpr FormSide kSides[] = {FormSide::Input, FormSide::Output};
constexpr FormField kFields[] = {FormField::CoordinateSystem, FormField::Zone,
                                 FormField::HorizontalDatum,  FormField::HorizontalUnits,
                                 FormField::VerticalDatum,    FormField::VerticalUnits};
// Control names without the side: cmbConvertFCSIn, cmbConvertFCSOut, ...
constexpr const char* kListNames[] = {"cmbConvertFCS",     "cmbConvertFZone",
                                      "cmbConvertFHDatum", "cmbConvertFHUnits",
                                      "cmbConvertFVDatum", "cmbConvertFVUnits"};
constexpr const char* kCaptions[] = {
    "Coordinate &System:", "&Zone:",           "&Horizontal Datum:",
    "Horizontal &Units:",  "&Vertical Datum:", "V&ertical Units:"};

void ShowList(QComboBox* box, const FormList& list) {
  SetItems(box, list.items);
  box->setCurrentIndex(box->findText(QString::fromStdString(list.selected), Qt::MatchExactly));
  box->setEnabled(list.enabled);
}

void ShowOption(QCheckBox* box, const FormOption& option) {
  box->setChecked(option.checked);
  box->setEnabled(option.enabled);
}

}  // namespace

CoordinateConversionDialog::CoordinateConversionDialog(Ui& ui, std::string appFolder,
                                                       ConversionState& state, SettingsStore& store,
                                                       ConversionDialogs dialogs, QWidget* parent)
    : QDialog(parent),
      ui_(ui),
      appFolder_(std::move(appFolder)),
      state_(state),
      store_(store),
      dialogs_(std::move(dialogs)),
      form_(appFolder_) {
  setObjectName("frmCoordinateConversion");
  setWindowTitle("Coordinate Conversion");

  auto* sides = new QHBoxLayout;
  for (FormSide side : kSides) {
    const bool in = side == FormSide::Input;
    auto* frame = new QGroupBox(in ? "Input" : "Output", this);
    frame->setObjectName(in ? "fraConvertFIn" : "fraConvertFOut");
    auto* grid = new QGridLayout(frame);
    for (int f = 0; f < 6; ++f) {
      QComboBox* box =
          MakeList(frame, QString(kListNames[f]) + (in ? QString("In") : QString("Out")), 28);
      auto* label = new QLabel(kCaptions[f], frame);
      label->setBuddy(box);
      grid->addWidget(label, f, 0);
      grid->addWidget(box, f, 1);
      lists_[static_cast<int>(side)][f] = box;
    }
    grid->setColumnStretch(1, 1);
    sides->addWidget(frame);
  }

  auto* options = new QGroupBox("Options", this);
  options->setObjectName("fraConvertFOptions");
  auto check = [options](const char* name, const QString& text) {
    auto* box = new QCheckBox(text, options);
    box->setObjectName(name);
    return box;
  };
  scaleFactor_ = check("chkConvertFScaleFactor", "Compute Scale &Factor");
  convergence_ = check("chkConvertFConvAngle", "Compute &Convergence Angle");
  latLong_ = check("chkConvertFLatLong", "Add &Latitude/Longitude");
  geoid_ = check("chkConvertFGeoid", "Compute &Geoid Heights");
  geoidModel_ = MakeList(options, "cmbConvertFGeoid", 28);
  geoidModel_->setMinimumContentsLength(12);
  geoidLabel_ = new QLabel("Geoid &Model:", options);
  geoidLabel_->setObjectName("lblConvertFGeoid");
  geoidLabel_->setBuddy(geoidModel_);
  auto* optionGrid = new QGridLayout(options);
  optionGrid->addWidget(scaleFactor_, 0, 0);
  optionGrid->addWidget(convergence_, 1, 0);
  optionGrid->addWidget(latLong_, 0, 1);
  optionGrid->addWidget(geoid_, 1, 1);
  optionGrid->addWidget(geoidLabel_, 0, 2);
  optionGrid->addWidget(geoidModel_, 1, 2);

  auto* editFrame = new QGroupBox("Edit Parameters", this);
  editFrame->setObjectName("fraConvertFEdit");
  auto radio = [editFrame](const char* name, const QString& text) {
    auto* button = new QRadioButton(text, editFrame);
    button->setObjectName(name);
    return button;
  };
  editZones_ = radio("optConvertFZones", "Zo&nes");
  editDatums_ = radio("optConvertFDatums", "&Datums");
  editEllipsoids_ = radio("optConvertFEllipsoids", "Elli&psoids");
  editZones_->setChecked(true);
  QPushButton* editButton = MakeButton(editFrame, "cmdConvertFEdit", "Ed&it...");
  auto* editRow = new QHBoxLayout(editFrame);
  editRow->addWidget(editZones_);
  editRow->addWidget(editDatums_);
  editRow->addWidget(editEllipsoids_);
  editRow->addStretch();
  editRow->addWidget(editButton);

  QPushButton* okButton = MakeButton(this, "cmdConvertFOK", "OK");
  okButton->setDefault(true);
  QPushButton* cancelButton = MakeButton(this, "cmdConvertFCancel", "Cancel");
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  buttons->addWidget(okButton);
  buttons->addWidget(cancelButton);

  auto* layout = new QVBoxLayout(this);
  layout->addLayout(sides);
  layout->addWidget(options);
  layout->addWidget(editFrame);
  layout->addLayout(buttons);

  connect(okButton, &QPushButton::clicked, this, &CoordinateConversionDialog::ok);
  connect(cancelButton, &QPushButton::clicked, this, &QDialog::reject);
  connect(editButton, &QPushButton::clicked, this, &CoordinateConversionDialog::edit);
  bind();
  sync();
}

QComboBox* CoordinateConversionDialog::list(FormSide side, FormField field) const {
  if (field == FormField::GeoidModel) return geoidModel_;
  return lists_[static_cast<int>(side)][static_cast<int>(field)];
}

void CoordinateConversionDialog::bind() {
  auto onList = [this](QComboBox* box, FormSide side, FormField field) {
    connect(box, &QComboBox::currentIndexChanged, this, [this, box, side, field](int index) {
      if (syncing_ || index < 0) return;
      try {
        form_.choose(side, field, box->itemText(index).toStdString());
      } catch (const ZvError& e) {
        ShowListError(ui_, e);
      }
      sync();
    });
  };
  for (FormSide side : kSides)
    for (FormField field : kFields) onList(list(side, field), side, field);
  onList(geoidModel_, FormSide::Input, FormField::GeoidModel);
  auto onOption = [this](QCheckBox* box, void (ConversionForm::*set)(bool)) {
    connect(box, &QCheckBox::toggled, this, [this, set](bool on) {
      if (syncing_) return;
      (form_.*set)(on);
      sync();
    });
  };
  onOption(scaleFactor_, &ConversionForm::setScaleFactor);
  onOption(convergence_, &ConversionForm::setConvergence);
  onOption(latLong_, &ConversionForm::setLatLong);
  onOption(geoid_, &ConversionForm::setGeoid);
}

void CoordinateConversionDialog::sync() {
  syncing_ = true;
  for (FormSide side : kSides)
    for (FormField field : kFields) ShowList(list(side, field), form_.list(side, field));
  ShowList(geoidModel_, form_.list(FormSide::Input, FormField::GeoidModel));
  geoidLabel_->setEnabled(geoidModel_->isEnabled());
  ShowOption(scaleFactor_, form_.scaleFactor());
  ShowOption(convergence_, form_.convergence());
  ShowOption(latLong_, form_.latLong());
  ShowOption(geoid_, form_.geoid());
  syncing_ = false;
}

void CoordinateConversionDialog::load(const ConversionSettings* preset) {
  try {
    form_.load(store_, preset);
  } catch (const ZvError& e) {
    ShowListError(ui_, e);
  }
  sync();
  list(FormSide::Input, FormField::CoordinateSystem)->setFocus();
}

void CoordinateConversionDialog::ok() {
  if (std::optional<FormRefusal> refusal = form_.validate()) {
    ui_.message(refusal->text, Icon::Exclamation, Buttons::Ok, refusal->title);
    list(refusal->side, refusal->field)->setFocus();
    return;
  }
  if (AcceptConversion(ui_, appFolder_, form_, state_, store_, dialogs_)) accept();
}

void CoordinateConversionDialog::edit() {
  if (ui_.message("Changing any of the values on the following dialog can result in incorrect "
                  "coordinate values. Are you sure you want to proceed?",
                  Icon::None, Buttons::OkCancel, "Edit Parameters?") != Answer::Ok) {
    return;
  }
  const CatalogKind kind = editZones_->isChecked()    ? CatalogKind::Zones
                           : editDatums_->isChecked() ? CatalogKind::Datums
                                                      : CatalogKind::Ellipsoids;
  if (!editor_) {
    static const char* const kNotAvailable[] = {
        "The zone editor is not available in this version.",
        "The datum editor is not available in this version.",
        "The ellipsoid editor is not available in this version."};
    ui_.inform(kNotAvailable[static_cast<int>(kind)], "Edit Parameters");
    return;
  }
  editor_(kind);
  // The catalog may have changed: fill the lists afresh, keeping the choices.
  MemorySettings choices;
  form_.remember(choices);
  try {
    form_.load(choices);
  } catch (const ZvError& e) {
    ShowListError(ui_, e);
  }
  sync();
}

}  // namespace zv
