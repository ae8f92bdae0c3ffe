#pragma once
// frmCoordinateConversion: the conversion settings of a run. The controls
// carry their names as object names; the rules are in ConversionForm.

#include <QDialog>
#include <functional>
#include <string>

#include "geodesy/ConversionForm.h"

class QCheckBox;
class QComboBox;
class QLabel;
class QPushButton;
class QRadioButton;

namespace zv {

enum class CatalogKind { Zones, Datums, Ellipsoids };

class CoordinateConversionDialog : public QDialog {
  Q_OBJECT

 public:
  CoordinateConversionDialog(Ui& ui, std::string appFolder, ConversionState& state,
                             SettingsStore& store, ConversionDialogs dialogs,
                             QWidget* parent = nullptr);

  // Fills the lists and selects the remembered (or preset) choices. A list
  // that cannot be filled is reported; the dialog shows what was filled.
  void load(const ConversionSettings* preset = nullptr);
  // The catalog editors, opened modally by Edit Parameters; without one the
  // user is told that the editor is not available.
  void setCatalogEditor(std::function<void(CatalogKind)> editor) { editor_ = std::move(editor); }
  const ConversionForm& form() const { return form_; }

 private:
  QComboBox* list(FormSide side, FormField field) const;
  void bind();
  // Shows the form's state in the controls.
  void sync();
  void ok();
  void edit();

  Ui& ui_;
  std::string appFolder_;
  ConversionState& state_;
  SettingsStore& store_;
  ConversionDialogs dialogs_;
  ConversionForm form_;
  std::function<void(CatalogKind)> editor_;
  QComboBox* lists_[2][6];
  QComboBox* geoidModel_;
  QLabel* geoidLabel_;
  QCheckBox* scaleFactor_;
  QCheckBox* convergence_;
  QCheckBox* latLong_;
  QCheckBox* geoid_;
  QRadioButton* editZones_;
  QRadioButton* editDatums_;
  QRadioButton* editEllipsoids_;
  bool syncing_ = false;
};

}  // namespace zv
