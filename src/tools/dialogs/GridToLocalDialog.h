#pragma once
// frmGrid2Local: how the combined factor of a grid file is found (all
// points, a factor given, or the factor at a point); OK runs the tool and
// closes the dialog once it did its job.

#include <QDialog>

#include "tools/Localization.h"

class QLineEdit;
class QRadioButton;

namespace zv {

class GridToLocalDialog : public QDialog {
  Q_OBJECT

 public:
  GridToLocalDialog(Ui& ui, std::string input, std::string output, GridToLocalRunner run,
                    QWidget* parent = nullptr);

 private:
  void choose(GridToLocalForm::Option option);
  void ok();

  Ui& ui_;
  std::string input_, output_;
  GridToLocalRunner run_;
  GridToLocalForm form_;
  QRadioButton* allPoints_;
  QRadioButton* userDefined_;
  QRadioButton* pointNumber_;
  QLineEdit* factorBox_;
  QLineEdit* pointBox_;
};

}  // namespace zv
