#pragma once
// frmTranslate: the main window. The controls carry their names as object
// names; what they do is in TranslateLogic.

#include <QDialog>

#include "app/TranslateLogic.h"

class QCheckBox;
class QComboBox;
class QLabel;
class QLineEdit;
class QPushButton;
class QTabWidget;

namespace zv {

struct AppContext;

class TranslateWindow : public QDialog {
  Q_OBJECT

 public:
  explicit TranslateWindow(AppContext& ctx, QWidget* parent = nullptr);

  // Loads the catalogue and shows the window on the last-used definition.
  void start();
  // TRfrm_UpdateConfigFile
  void updateConfigFile(const QString& path);
  TranslateLogic& logic() { return logic_; }

 signals:
  // The window has closed: the program ends.
  void ended();

 protected:
  void closeEvent(QCloseEvent* event) override;
  void reject() override;

 private:
  struct Group {
    QLabel* label;
    QLineEdit* text;
    std::vector<QWidget*> buttons;
  };
  void bind();
  // Shows the logic's state in the controls.
  void sync();
  void translate();
  void cancel();

  AppContext& ctx_;
  TranslateLogic logic_;
  QTabWidget* tab_;
  QComboBox* inputType_;
  QComboBox* outputType_;
  QComboBox* action_;
  Group input_, output_, configuration_;
  QCheckBox* default_;
  QPushButton* plan_;
  QPushButton* ok_;
  QPushButton* cancel_;
  bool syncing_ = false;
  bool running_ = false;
};

}  // namespace zv
