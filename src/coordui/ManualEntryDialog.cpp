#include "coordui/ManualEntryDialog.h"

#include <QComboBox>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>

#include "geodesy/Angles.h"
#include "platform/qt/Controls.h"

namespace zv {

namespace {

QLineEdit* MakeBox(QWidget* parent, const char* name) {
  auto* box = new QLineEdit(parent);
  box->setObjectName(name);
  box->setMinimumWidth(180);
  return box;
}

QComboBox* MakeDirections(QWidget* parent, const char* name, const QStringList& letters,
                          const QString& initial) {
  auto* list = new QComboBox(parent);
  list->setObjectName(name);
  list->addItems(letters);
  list->setCurrentText(initial);
  return list;
}

void AddRow(QGridLayout* grid, int row, const QString& caption, QWidget* box,
            QWidget* extra = nullptr) {
  auto* label = new QLabel(caption, box->parentWidget());
  label->setBuddy(box);
  grid->addWidget(label, row, 0);
  grid->addWidget(box, row, 1);
  if (extra) grid->addWidget(extra, row, 2);
}

// "Orthometric Height (Meters):"
QString HeightCaption(const ManualEntrySetup& setup, bool geographic) {
  QString caption =
      geographic ? QString::fromStdString(setup.heightType) + " &Height" : QString("&Height (Z)");
  if (!setup.verticalUnits.empty())
    caption += " (" + QString::fromStdString(setup.verticalUnits) + ")";
  return caption + ":";
}

}  // namespace

ManualEntryDialog::ManualEntryDialog(Ui& ui, ManualEntrySetup setup, SurveyPoint& point,
                                     QWidget* parent)
    : QDialog(parent), ui_(ui), setup_(std::move(setup)), point_(point) {
  setObjectName("frmManualCoordEntry");
  setWindowTitle("Coordinate Entry");

  auto* geographic = new QGroupBox("Geographic Coordinates", this);
  geographic->setObjectName("fraManualGeographic");
  auto* geoGrid = new QGridLayout(geographic);
  QLineEdit* geoName = MakeBox(geographic, "txtManualGeoName");
  latitude_ = MakeBox(geographic, "txtManualLatitude");
  longitude_ = MakeBox(geographic, "txtManualLongitude");
  latitudeDirection_ = MakeDirections(geographic, "cmbManualLatitudeDir", {"N", "S"}, "N");
  longitudeDirection_ = MakeDirections(geographic, "cmbManualLongitudeDir", {"E", "W"}, "W");
  QLineEdit* geoHeight = MakeBox(geographic, "txtManualGeoHeight");
  const QString format = QString::fromStdString(setup_.angleFormat);
  AddRow(geoGrid, 0, "Point &Name:", geoName);
  AddRow(geoGrid, 1, "&Latitude (" + format + "):", latitude_, latitudeDirection_);
  AddRow(geoGrid, 2, "L&ongitude (" + format + "):", longitude_, longitudeDirection_);
  AddRow(geoGrid, 3, HeightCaption(setup_, true), geoHeight);

  auto* plane = new QGroupBox("Plane Coordinates", this);
  plane->setObjectName("fraManualPlane");
  auto* planeGrid = new QGridLayout(plane);
  QLineEdit* planeName = MakeBox(plane, "txtManualPlaneName");
  northing_ = MakeBox(plane, "txtManualNorthing");
  easting_ = MakeBox(plane, "txtManualEasting");
  QLineEdit* planeHeight = MakeBox(plane, "txtManualPlaneHeight");
  QString units;
  if (!setup_.horizontalUnits.empty())
    units = " (" + QString::fromStdString(setup_.horizontalUnits) + ")";
  AddRow(planeGrid, 0, "Point &Name:", planeName);
  AddRow(planeGrid, 1, "&Northing (Y)" + units + ":", northing_);
  AddRow(planeGrid, 2, "&Easting (X)" + units + ":", easting_);
  AddRow(planeGrid, 3, HeightCaption(setup_, false), planeHeight);

  geographic->setVisible(setup_.geographic);
  plane->setVisible(!setup_.geographic);
  name_ = setup_.geographic ? geoName : planeName;
  height_ = setup_.geographic ? geoHeight : planeHeight;
  height_->setEnabled(setup_.heightWanted);

  QPushButton* okButton = MakeButton(this, "cmdManualOK", "OK");
  okButton->setDefault(true);
  QPushButton* cancelButton = MakeButton(this, "cmdManualCancel", "Cancel");
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  buttons->addWidget(okButton);
  buttons->addWidget(cancelButton);

  auto* layout = new QVBoxLayout(this);
  layout->addWidget(geographic);
  layout->addWidget(plane);
  layout->addLayout(buttons);
  connect(okButton, &QPushButton::clicked, this, &ManualEntryDialog::ok);
  connect(cancelButton, &QPushButton::clicked, this, &QDialog::reject);
  name_->setFocus();
}

ManualEntryFields ManualEntryDialog::fields() const {
  ManualEntryFields f;
  f.pointName = name_->text().toStdString();
  f.latitude = latitude_->text().toStdString();
  f.longitude = longitude_->text().toStdString();
  f.latitudeDirection = latitudeDirection_->currentText().toStdString();
  f.longitudeDirection = longitudeDirection_->currentText().toStdString();
  f.northing = northing_->text().toStdString();
  f.easting = easting_->text().toStdString();
  f.height = height_->text().toStdString();
  return f;
}

QLineEdit* ManualEntryDialog::box(ManualField field) const {
  switch (field) {
    case ManualField::PointName:
      return name_;
    case ManualField::Latitude:
      return latitude_;
    case ManualField::Longitude:
      return longitude_;
    case ManualField::Northing:
      return northing_;
    case ManualField::Easting:
      return easting_;
    case ManualField::Height:
      break;
  }
  return height_;
}

void ManualEntryDialog::ok() {
  const ManualEntryFields typed = fields();
  QLineEdit* back = nullptr;
  if (std::optional<ManualRefusal> refusal = ValidateManualEntry(setup_, typed)) {
    ui_.message(refusal->text, Icon::Exclamation, Buttons::Ok, refusal->title);
    back = box(refusal->field);
  } else if (!FillManualPoint(ui_, setup_, typed, point_)) {
    back = point_.Latitude == kNoValue ? latitude_ : longitude_;
  }
  if (!back) {
    accept();
    return;
  }
  back->setFocus();
  back->selectAll();
}

}  // namespace zv
