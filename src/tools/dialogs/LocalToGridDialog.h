#pragma once
// frmLocal2Grid: the horizontal datum, the zone and the combined factor of a
// local file, preset from what the file recorded; OK runs the tool and
// closes the dialog once it did its job.

#include <QDialog>

#include "tools/Localization.h"

class QComboBox;
class QLineEdit;

namespace zv {

class LocalToGridDialog : public QDialog {
  Q_OBJECT

 public:
  // The lists come from appFolder (the datum years and Pintrel/zones.txt).
  LocalToGridDialog(Ui& ui, const std::string& appFolder, const RecordedGridReference& recorded,
                    std::string input, std::string output, LocalToGridRunner run,
                    QWidget* parent = nullptr);

 protected:
  // Enter in a list whose text was typed selects by number; on an entry as
  // shown it goes on to OK.
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  // Enter in a list: the entry whose item data is the number typed.
  void selectTyped(QComboBox* box, LocalList& list);
  void ok();

  Ui& ui_;
  std::string input_, output_;
  LocalToGridRunner run_;
  LocalToGridForm form_;
  QComboBox* datums_;
  QComboBox* zones_;
  QLineEdit* factor_;
};

}  // namespace zv
