#include "coordui/CatalogEditorDialogs.h"

#include <QCheckBox>
#include <QComboBox>
#include <QEvent>
#include <QFocusEvent>
#include <QFormLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLineEdit>
#include <QPushButton>
#include <QTableWidget>
#include <QTimer>
#include <QVBoxLayout>
#include <algorithm>

#include "platform/qt/Controls.h"
#ifdef ZV_EPSG
#include "coordui/EpsgImportDialog.h"
#endif

namespace zv {

namespace {

QString Q(const std::string& text) {
  return QString::fromStdString(text);
}

// Shows the text as the list's choice; a text the list does not offer is
// added, so that what the catalog holds is shown and kept.
void ShowChoice(QComboBox* box, std::vector<std::string> items, const std::string& text) {
  if (!text.empty() && std::find(items.begin(), items.end(), text) == items.end()) {
    items.push_back(text);
  }
  SetItems(box, items);
  box->setCurrentIndex(box->findText(Q(text), Qt::MatchExactly));
}

// Runs a call when the watched control gains or loses the focus by the
// user's doing (not when a message box takes it away).
class FocusWatcher : public QObject {
 public:
  FocusWatcher(QWidget* watched, QEvent::Type type, std::function<void()> call)
      : QObject(watched), type_(type), call_(std::move(call)) {
    watched->installEventFilter(this);
  }
  bool eventFilter(QObject*, QEvent* event) override {
    if (event->type() == type_) {
      const Qt::FocusReason reason = static_cast<QFocusEvent*>(event)->reason();
      if (reason != Qt::ActiveWindowFocusReason && reason != Qt::PopupFocusReason) call_();
    }
    return false;
  }

 private:
  QEvent::Type type_;
  std::function<void()> call_;
};

}  // namespace

// Binds controls to the fields of an editor: a user's edit goes to the
// logic, sync() shows the logic's state, refresh() also moves the focus
// where the logic asks.
template <class Editor, class Field>
class EditorBinder {
 public:
  EditorBinder(Editor& editor, QWidget* dialog) : e_(editor), dialog_(dialog) {}

  QLineEdit* text(QWidget* parent, const char* name, Field f) {
    auto* w = new QLineEdit(parent);
    w->setObjectName(name);
    QObject::connect(w, &QLineEdit::textEdited, dialog_,
                     [this, f](const QString& t) { e_.edit(f, t.toStdString()); });
    shows_.push_back([this, w, f] {
      if (w->text() != Q(e_.text(f))) w->setText(Q(e_.text(f)));
    });
    widgets_.emplace_back(f, w);
    return w;
  }

  QCheckBox* check(QWidget* parent, const char* name, const QString& caption, Field f) {
    auto* w = new QCheckBox(caption, parent);
    w->setObjectName(name);
    QObject::connect(w, &QCheckBox::clicked, dialog_, [this, f](bool on) { e_.check(f, on); });
    shows_.push_back([this, w, f] { w->setChecked(e_.checked(f)); });
    widgets_.emplace_back(f, w);
    return w;
  }

  // A list whose choice is the field's text; `choose` runs instead of a
  // plain edit.
  QComboBox* list(QWidget* parent, const char* name, Field f,
                  std::function<std::vector<std::string>()> items,
                  std::function<void(const std::string&)> choose = {}) {
    QComboBox* w = MakeList(parent, name, 24);
    onChoice(w, [this, f, choose](const std::string& t) {
      if (choose) {
        choose(t);
      } else {
        e_.edit(f, t);
      }
    });
    shows_.push_back([this, w, f, items] { ShowChoice(w, items(), e_.text(f)); });
    widgets_.emplace_back(f, w);
    return w;
  }

  // The list of entries: a choice loads the entry (after saving a changed one).
  QComboBox* entries(QWidget* parent, const char* name) {
    QComboBox* w = MakeList(parent, name, 28);
    onChoice(w, [this](const std::string& t) { e_.select(t); });
    shows_.push_back([this, w] { ShowChoice(w, e_.entries(), e_.selected()); });
    return w;
  }

  // A user's choice in a list runs `choose`, then the controls follow.
  void onChoice(QComboBox* w, std::function<void(const std::string&)> choose) {
    QObject::connect(w, &QComboBox::currentIndexChanged, dialog_, [this, w, choose](int index) {
      if (syncing_ || index < 0) return;
      choose(w->itemText(index).toStdString());
      refresh();
    });
  }

  void also(std::function<void()> show) { shows_.push_back(std::move(show)); }
  void focusable(Field f, QWidget* w) { widgets_.emplace_back(f, w); }

  // Runs a logic call when the control loses the focus.
  void onLeave(QWidget* w, std::function<void()> call) {
    new FocusWatcher(w, QEvent::FocusOut, [this, call] {
      if (syncing_) return;
      call();
      sync();
      // The focus moves back once the focus change under way is done.
      if (std::optional<Field> f = e_.takeFocus()) {
        QTimer::singleShot(0, dialog_, [this, f] { focus(*f); });
      }
    });
  }

  void sync() {
    syncing_ = true;
    for (auto& show : shows_) show();
    syncing_ = false;
  }
  void refresh() {
    sync();
    if (std::optional<Field> f = e_.takeFocus()) focus(*f);
  }
  bool syncing() const { return syncing_; }

 private:
  // The field's control; of several, the one shown.
  void focus(Field f) {
    QWidget* target = nullptr;
    for (const auto& [field, w] : widgets_) {
      if (field != f) continue;
      if (!target || w->isVisibleTo(dialog_)) target = w;
      if (w->isVisibleTo(dialog_)) break;
    }
    if (target) target->setFocus();
  }

  Editor& e_;
  QWidget* dialog_;
  std::vector<std::function<void()>> shows_;
  std::vector<std::pair<Field, QWidget*>> widgets_;
  bool syncing_ = false;
};

// ---- common -------------------------------------------------------------

void CatalogEditorDialog::reject() {
  if (closeEntry()) QDialog::reject();
}

QLayout* CatalogEditorDialog::makeButtons(const char* prefix) {
  auto name = [prefix](const char* what) { return QByteArray("cmd").append(prefix).append(what); };
  QPushButton* ok = MakeButton(this, name("OK").constData(), "OK");
  ok->setDefault(true);
  QPushButton* cancel = MakeButton(this, name("Cancel").constData(), "Cancel");
  QPushButton* add = MakeButton(this, name("New").constData(), "&New");
  QPushButton* remove = MakeButton(this, name("Delete").constData(), "&Delete");
  connect(ok, &QPushButton::clicked, this, [this] {
    if (okEntry()) accept();
  });
  connect(cancel, &QPushButton::clicked, this, &CatalogEditorDialog::reject);
  connect(add, &QPushButton::clicked, this, [this] { newEntry(); });
  connect(remove, &QPushButton::clicked, this, [this] { deleteEntry(); });
  auto* row = new QHBoxLayout;
  row->addWidget(add);
  row->addWidget(remove);
  row->addStretch();
  row->addWidget(ok);
  row->addWidget(cancel);
  return row;
}

// ---- ellipsoids ---------------------------------------------------------

EllipsoidEditorDialog::EllipsoidEditorDialog(Ui& ui, const std::string& appFolder, QWidget* parent)
    : CatalogEditorDialog(parent),
      editor_(ui, appFolder),
      bind_(std::make_unique<EditorBinder<EllipsoidEditor, EllipsoidField>>(editor_, this)) {
  setObjectName("frmEllipsoids");
  setWindowTitle("Ellipsoids");
  using F = EllipsoidField;
  auto* form = new QFormLayout;
  form->addRow("&Ellipsoid:", bind_->entries(this, "cmbEllipsoids"));
  form->addRow("&Short Name:", bind_->text(this, "txtEllipsoidsShortName", F::ShortName));
  form->addRow("&Full Name:", bind_->text(this, "txtEllipsoidsFullName", F::FullName));
  const struct {
    const char* caption;
    const char* name;
    F field;
    char letter;
  } parameters[] = {{"Semimajor &Axis (a):", "txtEllipsoidsSemimajor", F::SemimajorAxis, 'a'},
                    {"Semiminor A&xis (b):", "txtEllipsoidsSemiminor", F::SemiminorAxis, 'b'},
                    {"&Inverse Flattening (1/f):", "txtEllipsoidsFlattening", F::Flattening, 'f'},
                    {"E&ccentricity (e):", "txtEllipsoidsEccentricity", F::Eccentricity, 'e'}};
  for (const auto& p : parameters) {
    QLineEdit* field = bind_->text(this, p.name, p.field);
    const char letter = p.letter;
    bind_->onLeave(field, [this, letter] { editor_.leaveParameter(letter); });
    form->addRow(p.caption, field);
  }
  form->addRow(bind_->check(this, "chkEllipsoidsShow", "S&how in lists", F::Show));
  auto* layout = new QVBoxLayout(this);
  layout->addLayout(form);
  layout->addLayout(makeButtons("Ellipsoids"));
  editor_.load();
  bind_->sync();
}

EllipsoidEditorDialog::~EllipsoidEditorDialog() = default;

bool EllipsoidEditorDialog::okEntry() {
  const bool done = editor_.ok();
  bind_->refresh();
  return done;
}

bool EllipsoidEditorDialog::closeEntry() {
  const bool done = editor_.close();
  bind_->refresh();
  return done;
}

void EllipsoidEditorDialog::newEntry() {
  editor_.newEntry();
  bind_->refresh();
}

void EllipsoidEditorDialog::deleteEntry() {
  editor_.remove();
  bind_->refresh();
}

// ---- datums -------------------------------------------------------------

DatumEditorDialog::DatumEditorDialog(Ui& ui, const std::string& appFolder, QWidget* parent)
    : CatalogEditorDialog(parent),
      editor_(ui, appFolder),
      bind_(std::make_unique<EditorBinder<DatumEditor, DatumField>>(editor_, this)) {
  setObjectName("frmDatums");
  setWindowTitle("Datums");
  using F = DatumField;
  auto* form = new QFormLayout;
  form->addRow("&Datum:", bind_->entries(this, "cmbDatums"));
  form->addRow("&Short Name:", bind_->text(this, "txtDatumsShortName", F::ShortName));
  form->addRow("&Full Name:", bind_->text(this, "txtDatumsFullName", F::FullName));
  form->addRow("&Type:", bind_->list(
                             this, "cmbDatumsType", F::Type,
                             [] {
                               return std::vector<std::string>{"Horizontal", "Vertical", "3D"};
                             },
                             [this](const std::string& t) { editor_.chooseType(t); }));
  QComboBox* ellipsoid = bind_->list(this, "cmbDatumsEllipsoid", F::Ellipsoid,
                                     [this] { return editor_.ellipsoids(); });
  bind_->also([this, ellipsoid] { ellipsoid->setEnabled(editor_.ellipsoidEnabled()); });
  form->addRow("&Ellipsoid:", ellipsoid);
  auto* flags = new QHBoxLayout;
  flags->addWidget(bind_->check(this, "chkDatumsShowIn", "Show &In", F::ShowIn));
  flags->addWidget(bind_->check(this, "chkDatumsShowOut", "Show &Out", F::ShowOut));
  form->addRow(flags);

  auto* frame = new QGroupBox("Transformations", this);
  frame->setObjectName("fraDatumsTrans");
  grid_ = new QTableWidget(0, 2, frame);
  grid_->setObjectName("grdDatumsTrans");
  grid_->setHorizontalHeaderLabels({"Datum", "Method"});
  grid_->horizontalHeader()->setSectionResizeMode(0, QHeaderView::ResizeToContents);
  grid_->horizontalHeader()->setStretchLastSection(true);
  grid_->verticalHeader()->hide();
  grid_->setWordWrap(false);
  grid_->setEditTriggers(QAbstractItemView::NoEditTriggers);
  grid_->setSelectionBehavior(QAbstractItemView::SelectRows);
  grid_->setSelectionMode(QAbstractItemView::SingleSelection);
  bind_->focusable(F::Grid, grid_);
  target_ = MakeList(frame, "cmbDatumsTransDatum", 16);
  method_ = MakeList(frame, "cmbDatumsTransMethod", 28);
  QPushButton* add = MakeButton(frame, "cmdDatumsTransAdd", "&Add");
  QPushButton* remove = MakeButton(frame, "cmdDatumsTransRemove", "&Remove");
  auto* editRow = new QHBoxLayout;
  editRow->addWidget(target_);
  editRow->addWidget(method_, 1);
  editRow->addWidget(add);
  editRow->addWidget(remove);
  auto* frameLayout = new QVBoxLayout(frame);
  frameLayout->addWidget(grid_);
  frameLayout->addLayout(editRow);
  connect(grid_, &QTableWidget::itemSelectionChanged, this, [this] {
    if (bind_->syncing()) return;
    editor_.selectRow(grid_->currentRow());
    bind_->refresh();
  });
  bind_->onChoice(target_, [this](const std::string& t) { editor_.chooseTarget(t); });
  bind_->onChoice(method_, [this](const std::string& t) { editor_.chooseMethod(t); });
  connect(add, &QPushButton::clicked, this, [this] {
    editor_.addRow();
    bind_->refresh();
  });
  connect(remove, &QPushButton::clicked, this, [this] {
    editor_.removeRow();
    bind_->refresh();
  });
  bind_->also([this] { showRows(); });

  auto* layout = new QVBoxLayout(this);
  layout->addLayout(form);
  layout->addWidget(frame, 1);
  layout->addLayout(makeButtons("Datums"));
  editor_.load();
  bind_->sync();
}

DatumEditorDialog::~DatumEditorDialog() = default;

void DatumEditorDialog::showRows() {
  const std::vector<Transformation>& rows = editor_.rows();
  grid_->setRowCount(static_cast<int>(rows.size()));
  for (int r = 0; r < grid_->rowCount(); ++r) {
    grid_->setItem(r, 0, new QTableWidgetItem(Q(rows[r].datum)));
    grid_->setItem(r, 1, new QTableWidgetItem(Q(rows[r].method)));
  }
  const int row = editor_.selectedRow();
  if (row >= 0) {
    grid_->selectRow(row);
  } else {
    grid_->clearSelection();
  }
  // The target list is read afresh: the catalog may have other datums now.
  ShowChoice(target_, row >= 0 ? editor_.targets() : std::vector<std::string>{},
             row >= 0 ? rows[row].datum : std::string());
  ShowChoice(method_, row >= 0 ? editor_.methods() : std::vector<std::string>{},
             row >= 0 ? rows[row].method : std::string());
  target_->setEnabled(row >= 0);
  method_->setEnabled(row >= 0);
}

bool DatumEditorDialog::okEntry() {
  const bool done = editor_.ok();
  bind_->refresh();
  return done;
}

bool DatumEditorDialog::closeEntry() {
  const bool done = editor_.close();
  bind_->refresh();
  return done;
}

void DatumEditorDialog::newEntry() {
  editor_.newEntry();
  bind_->refresh();
}

void DatumEditorDialog::deleteEntry() {
  editor_.remove();
  bind_->refresh();
}

// ---- zones --------------------------------------------------------------

namespace {

// Control names of the panel fields (the panel's number is appended).
const char* PanelName(ZoneField f) {
  switch (f) {
    case ZoneField::CentralLatitude:
      return "txtZonesCentralLat";
    case ZoneField::CentralLongitude:
      return "txtZonesCentralLong";
    case ZoneField::FalseNorthing:
      return "txtZonesFalseNorthing";
    case ZoneField::FalseEasting:
      return "txtZonesFalseEasting";
    case ZoneField::ScaleFactor:
      return "txtZonesScaleFactor";
    case ZoneField::NorthernParallel:
      return "txtZonesNorthParallel";
    case ZoneField::SouthernParallel:
      return "txtZonesSouthParallel";
    default:
      return "txtZonesAzimuth";
  }
}

const char* PanelCaption(ZoneField f) {
  switch (f) {
    case ZoneField::CentralLatitude:
      return "Central &Latitude:";
    case ZoneField::CentralLongitude:
      return "Central Lon&gitude:";
    case ZoneField::FalseNorthing:
      return "False Nor&thing:";
    case ZoneField::FalseEasting:
      return "False &Easting:";
    case ZoneField::ScaleFactor:
      return "Scale &Factor:";
    case ZoneField::NorthernParallel:
      return "Northern &Parallel:";
    case ZoneField::SouthernParallel:
      return "Southern Pa&rallel:";
    default:
      return "A&zimuth:";
  }
}

QByteArray Numbered(const char* name, int panel) {
  return QByteArray(name).append(QByteArray::number(panel));
}

}  // namespace

ZoneEditorDialog::ZoneEditorDialog(Ui& ui, const std::string& appFolder, ZoneImporter importer,
                                   QWidget* parent)
    : CatalogEditorDialog(parent),
      editor_(ui, appFolder),
      importer_(std::move(importer)),
      bind_(std::make_unique<EditorBinder<ZoneEditor, ZoneField>>(editor_, this)) {
  setObjectName("frmZones");
  setWindowTitle("Zones");
  using F = ZoneField;

  // The coordinate system: picked from the list, or typed for a new one.
  QComboBox* systems = MakeList(this, "cmbZonesCS", 28);
  systems->setEditable(true);
  systems->setInsertPolicy(QComboBox::NoInsert);
  systems->setCompleter(nullptr);  // the typed text is the coordinate system
  bind_->onChoice(systems, [this](const std::string& s) { editor_.chooseCoordinateSystem(s); });
  connect(systems->lineEdit(), &QLineEdit::textEdited, this,
          [this](const QString& t) { editor_.edit(F::CoordinateSystem, t.toStdString()); });
  bind_->also([this, systems] {
    const std::string& system = editor_.text(F::CoordinateSystem);
    SetItems(systems, editor_.coordinateSystems());
    systems->setCurrentIndex(systems->findText(Q(system), Qt::MatchExactly));
    if (systems->currentText() != Q(system)) systems->setEditText(Q(system));
  });
  bind_->focusable(F::CoordinateSystem, systems);

  auto* form = new QFormLayout;
  form->addRow("&Coordinate System:", systems);
  form->addRow("&Zone:", bind_->entries(this, "cmbZones"));
  form->addRow("&Short Name:", bind_->text(this, "txtZonesShortName", F::ShortName));
  form->addRow("&Full Name:", bind_->text(this, "txtZonesFullName", F::FullName));
  auto choices = [this](F f) { return [this, f] { return editor_.choices(f); }; };
  form->addRow("&Horizontal Datum:", bind_->list(this, "cmbZonesHDatum", F::HorizontalDatum,
                                                 choices(F::HorizontalDatum)));
  form->addRow("Computational &Ellipsoid:",
               bind_->list(this, "cmbZonesEllipsoid", F::Ellipsoid, choices(F::Ellipsoid)));
  form->addRow("&Vertical Datum:",
               bind_->list(this, "cmbZonesVDatum", F::VerticalDatum, choices(F::VerticalDatum)));
  form->addRow("Pro&jection:",
               bind_->list(this, "cmbZonesProjection", F::Projection, choices(F::Projection)));
  auto* flags = new QHBoxLayout;
  flags->addWidget(bind_->check(this, "chkZonesShowIn", "Show &In", F::ShowIn));
  flags->addWidget(bind_->check(this, "chkZonesShowOut", "Show &Out", F::ShowOut));
  form->addRow(flags);

  auto* layout = new QVBoxLayout(this);
  layout->addLayout(form);
  for (int p = 1; p <= 3; ++p) {
    auto* panel = new QGroupBox("Parameters", this);
    panel->setObjectName(Numbered("fraZonesParameters", p));
    auto* panelForm = new QFormLayout(panel);
    for (F f : PanelFields(p)) {
      QLineEdit* field = bind_->text(panel, Numbered(PanelName(f), p).constData(), f);
      if (f == F::ScaleFactor) bind_->onLeave(field, [this] { editor_.leaveScaleFactor(); });
      panelForm->addRow(PanelCaption(f), field);
    }
    const struct {
      const char* caption;
      const char* name;
      F field;
    } lists[] = {{"Positive Latitude Direction:", "cmbZonesLatDirection", F::LatitudeDirection},
                 {"Positive Longitude Direction:", "cmbZonesLongDirection", F::LongitudeDirection},
                 {"Linear &Units:", "cmbZonesLinearUnits", F::LinearUnits},
                 {"&Angular Units:", "cmbZonesAngularUnits", F::AngularUnits}};
    for (const auto& l : lists) {
      std::function<void(const std::string&)> choose;
      if (l.field == F::AngularUnits) {
        choose = [this](const std::string& t) { editor_.chooseAngularUnits(t); };
      }
      panelForm->addRow(l.caption, bind_->list(panel, Numbered(l.name, p).constData(), l.field,
                                               choices(l.field), choose));
    }
    panels_[p - 1] = panel;
    layout->addWidget(panel);
  }
  bind_->also([this] {
    for (int p = 0; p < 3; ++p) panels_[p]->setVisible(editor_.panel() == p + 1);
  });

  QLayout* buttons = makeButtons("Zones");
  if (importer_) {
    QPushButton* importButton = MakeButton(this, "cmdZonesImport", "I&mport from EPSG...");
    connect(importButton, &QPushButton::clicked, this, &ZoneEditorDialog::import);
    static_cast<QHBoxLayout*>(buttons)->insertWidget(2, importButton);
  }
  layout->addLayout(buttons);
  editor_.load();
  bind_->sync();
}

ZoneEditorDialog::~ZoneEditorDialog() = default;

void ZoneEditorDialog::import() {
  if (std::optional<ZoneRecord> zone = importer_(this)) editor_.importZone(*zone);
  bind_->refresh();
}

bool ZoneEditorDialog::okEntry() {
  const bool done = editor_.ok();
  bind_->refresh();
  return done;
}

bool ZoneEditorDialog::closeEntry() {
  const bool done = editor_.close();
  bind_->refresh();
  return done;
}

void ZoneEditorDialog::newEntry() {
  editor_.newEntry();
  bind_->refresh();
}

void ZoneEditorDialog::deleteEntry() {
  editor_.remove();
  bind_->refresh();
}

void OpenCatalogEditor(Ui& ui, const std::string& appFolder, CatalogKind kind, QWidget* parent) {
  switch (kind) {
    case CatalogKind::Zones: {
      ZoneImporter importer;
#ifdef ZV_EPSG
      importer = [&ui, &appFolder](QWidget* owner) { return ImportEpsgZone(ui, appFolder, owner); };
#endif
      ZoneEditorDialog dialog(ui, appFolder, std::move(importer), parent);
      dialog.exec();
      break;
    }
    case CatalogKind::Datums: {
      DatumEditorDialog dialog(ui, appFolder, parent);
      dialog.exec();
      break;
    }
    case CatalogKind::Ellipsoids: {
      EllipsoidEditorDialog dialog(ui, appFolder, parent);
      dialog.exec();
      break;
    }
  }
}

}  // namespace zv
