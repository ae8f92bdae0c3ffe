#pragma once
// Finds a projected system of the EPSG registry by code or words of its
// name and makes a zone record of it for the zone editor.

#include <QDialog>
#include <optional>
#include <string>
#include <vector>

#include "geodesy/epsg/EpsgImport.h"
#include "platform/Ui.h"

class QLabel;
class QLineEdit;
class QListWidget;

namespace zv {

class EpsgImportDialog : public QDialog {
  Q_OBJECT

 public:
  explicit EpsgImportDialog(QWidget* parent = nullptr);
  // The candidate chosen in the list; nullopt when none (or a refused one).
  std::optional<EpsgCandidate> chosen() const;

 private:
  void search();

  QLineEdit* query_;
  QListWidget* list_;
  QLabel* status_;
  std::vector<EpsgCandidate> candidates_;
};

// The dialog, then the zone record of the chosen system with a short name
// proposed from its name. Nullopt when cancelled, or after a message when
// the system cannot be imported.
std::optional<ZoneRecord> ImportEpsgZone(Ui& ui, const std::string& appFolder, QWidget* parent);

}  // namespace zv
