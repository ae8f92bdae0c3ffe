#pragma once
// frmManualCoordEntry: one point typed by hand, geographic or plane as the
// set-up says. Accepted (exec() returns QDialog::Accepted) once the checks of
// ValidateManualEntry pass and the point is filled.

#include <QDialog>

#include "geodesy/ConversionForm.h"

class QComboBox;
class QLineEdit;

namespace zv {

class ManualEntryDialog : public QDialog {
  Q_OBJECT

 public:
  ManualEntryDialog(Ui& ui, ManualEntrySetup setup, SurveyPoint& point, QWidget* parent = nullptr);

 private:
  ManualEntryFields fields() const;
  QLineEdit* box(ManualField field) const;
  void ok();

  Ui& ui_;
  ManualEntrySetup setup_;
  SurveyPoint& point_;
  QLineEdit* name_;
  QLineEdit* latitude_;
  QLineEdit* longitude_;
  QComboBox* latitudeDirection_;
  QComboBox* longitudeDirection_;
  QLineEdit* northing_;
  QLineEdit* easting_;
  QLineEdit* height_;
};

}  // namespace zv
