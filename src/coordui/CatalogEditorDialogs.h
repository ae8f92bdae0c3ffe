#pragma once
// frmEllipsoids, frmDatums and frmZones: the catalog editors over their
// logic (CatalogEditors.h). Controls carry their names as object names.

#include <QDialog>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "coordui/CoordinateConversionDialog.h"
#include "geodesy/CatalogEditors.h"

class QComboBox;
class QGroupBox;
class QTableWidget;

namespace zv {

// Opens the editor of a catalog modally and returns when it is closed.
void OpenCatalogEditor(Ui& ui, const std::string& appFolder, CatalogKind kind,
                       QWidget* parent = nullptr);

// A zone record from elsewhere (EPSG): nullopt when nothing was chosen.
using ZoneImporter = std::function<std::optional<ZoneRecord>(QWidget* parent)>;

// The bindings of one editor's controls to its logic (CatalogEditorDialogs.cpp).
template <class Editor, class Field>
class EditorBinder;

// What the three dialogs share: OK, Cancel, New, Delete and the close
// question.
class CatalogEditorDialog : public QDialog {
  Q_OBJECT

 public:
  void reject() override;

 protected:
  explicit CatalogEditorDialog(QWidget* parent) : QDialog(parent) {}
  // The logic's buttons; each refreshes the controls afterwards.
  virtual bool okEntry() = 0;
  virtual bool closeEntry() = 0;
  virtual void newEntry() = 0;
  virtual void deleteEntry() = 0;
  // OK, Cancel, New and Delete in a row, named with the prefix ("Zones").
  QLayout* makeButtons(const char* prefix);
};

class EllipsoidEditorDialog : public CatalogEditorDialog {
  Q_OBJECT

 public:
  EllipsoidEditorDialog(Ui& ui, const std::string& appFolder, QWidget* parent = nullptr);
  ~EllipsoidEditorDialog() override;
  const EllipsoidEditor& editor() const { return editor_; }

 private:
  bool okEntry() override;
  bool closeEntry() override;
  void newEntry() override;
  void deleteEntry() override;

  EllipsoidEditor editor_;
  std::unique_ptr<EditorBinder<EllipsoidEditor, EllipsoidField>> bind_;
};

class DatumEditorDialog : public CatalogEditorDialog {
  Q_OBJECT

 public:
  DatumEditorDialog(Ui& ui, const std::string& appFolder, QWidget* parent = nullptr);
  ~DatumEditorDialog() override;
  const DatumEditor& editor() const { return editor_; }

 private:
  bool okEntry() override;
  bool closeEntry() override;
  void newEntry() override;
  void deleteEntry() override;
  void showRows();

  DatumEditor editor_;
  std::unique_ptr<EditorBinder<DatumEditor, DatumField>> bind_;
  QTableWidget* grid_;
  QComboBox* target_;
  QComboBox* method_;
};

class ZoneEditorDialog : public CatalogEditorDialog {
  Q_OBJECT

 public:
  ZoneEditorDialog(Ui& ui, const std::string& appFolder, ZoneImporter importer = {},
                   QWidget* parent = nullptr);
  ~ZoneEditorDialog() override;
  const ZoneEditor& editor() const { return editor_; }

 private:
  bool okEntry() override;
  bool closeEntry() override;
  void newEntry() override;
  void deleteEntry() override;
  void import();

  ZoneEditor editor_;
  ZoneImporter importer_;
  std::unique_ptr<EditorBinder<ZoneEditor, ZoneField>> bind_;
  QGroupBox* panels_[3];
};

}  // namespace zv
