#pragma once
// frmFlexIn and frmFlexOut: choose, edit, save and delete user formats and
// read or write one file with them. The controls carry their names as
// object names; the rules are in FlexForm.

#include <QDialog>
#include <string>

#include "userformats/FlexForm.h"

class QCheckBox;
class QComboBox;
class QGroupBox;
class QLabel;
class QLineEdit;
class QTableWidget;

namespace zv {

class FlexDialog : public QDialog {
  Q_OBJECT

 public:
  // `path` is the file to read (FlexIn) or write (FlexOut); a read fills the
  // input side of `work`, a write takes its output side.
  FlexDialog(FlexDirection direction, Ui& ui, std::string appFolder, WorkArea& work,
             SettingsStore& settings, std::string path, QWidget* parent = nullptr);

  // True after an OK that read or wrote the file; false when cancelled or
  // closed.
  bool succeeded() const { return succeeded_; }
  const FlexForm& form() const { return form_; }

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  QComboBox* list(FlexList l) const { return lists_[static_cast<int>(l)]; }
  void bind();
  // Shows the form's state in the controls.
  void sync();
  void typeKey(int key, bool keypad);
  void ok();
  void focusOn(const FlexRefusal& refusal);

  WorkArea& work_;
  SettingsStore& settings_;
  std::string path_;
  FlexForm form_;
  bool succeeded_ = false;
  bool syncing_ = false;
  QComboBox* formats_;
  QComboBox* delimiter_;
  QComboBox* coordinateType_;
  QGroupBox* columnsFrame_;
  QComboBox* columns_;
  QTableWidget* grid_;
  QLineEdit* projectHeader_ = nullptr;
  QLineEdit* ignore_ = nullptr;
  QCheckBox* writeHeader_ = nullptr;
  QLabel* headerLabel_ = nullptr;
  QLineEdit* headerPrefix_ = nullptr;
  QComboBox* lists_[8];
};

class FlexInDialog : public FlexDialog {
  Q_OBJECT

 public:
  FlexInDialog(Ui& ui, std::string appFolder, WorkArea& work, SettingsStore& settings,
               std::string path, QWidget* parent = nullptr)
      : FlexDialog(FlexDirection::In, ui, std::move(appFolder), work, settings, std::move(path),
                   parent) {}
};

class FlexOutDialog : public FlexDialog {
  Q_OBJECT

 public:
  FlexOutDialog(Ui& ui, std::string appFolder, WorkArea& work, SettingsStore& settings,
                std::string path, QWidget* parent = nullptr)
      : FlexDialog(FlexDirection::Out, ui, std::move(appFolder), work, settings, std::move(path),
                   parent) {}
};

}  // namespace zv
