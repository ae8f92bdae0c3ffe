#include "userformats/dialogs/FlexDialogs.h"

#include <QCheckBox>
#include <QComboBox>
#include <QEvent>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTableWidget>
#include <QVBoxLayout>

#include "platform/qt/Controls.h"

namespace zv {

namespace {

// Control names after the dialog's prefix: cmbFlexInCS, cmbFlexOutCS, ...
constexpr const char* kListNames[] = {"CS",     "Zone",   "HDatum", "HUnits",
                                      "VDatum", "VUnits", "LatDir", "LongDir"};
constexpr const char* kCaptions[] = {
    "Coordinate &System:", "&Zone:",           "&Horizontal Datum:",   "Horizontal &Units:",
    "&Vertical Datum:",    "V&ertical Units:", "Latitude Dire&ction:", "L&ongitude Direction:"};

QString Q(const std::string& s) {
  return QString::fromStdString(s);
}

void ShowList(QComboBox* box, const FormList& list) {
  SetItems(box, list.items);
  box->setCurrentIndex(box->findText(Q(list.selected), Qt::MatchExactly));
  box->setEnabled(list.enabled);
}

// An editable box: its entries, and the text only when it differs (so that
// the caret of a user typing stays where it is).
void ShowEditable(QComboBox* box, const std::vector<std::string>& items, const std::string& text) {
  SetItems(box, items);
  const int index = box->findText(Q(text), Qt::MatchExactly);
  if (box->currentIndex() != index) box->setCurrentIndex(index);
  if (box->currentText() != Q(text)) box->setEditText(Q(text));
}

void ShowText(QLineEdit* box, const std::string& text) {
  if (box->text() != Q(text)) box->setText(Q(text));
}

}  // namespace

FlexDialog::FlexDialog(FlexDirection direction, Ui& ui, std::string appFolder, WorkArea& work,
                       SettingsStore& settings, std::string path, QWidget* parent)
    : QDialog(parent),
      work_(work),
      settings_(settings),
      path_(std::move(path)),
      form_(direction, ui, std::move(appFolder)) {
  const bool in = direction == FlexDirection::In;
  const QString p = in ? "FlexIn" : "FlexOut";
  setObjectName("frm" + p);
  setWindowTitle(in ? "User-Defined Input Format" : "User-Defined Output Format");

  auto* formatFrame = new QGroupBox("Format", this);
  formatFrame->setObjectName("fra" + p + "Format");
  formats_ = MakeList(formatFrame, "cmb" + p + "Formats", 30);
  formats_->setEditable(true);
  formats_->setInsertPolicy(QComboBox::NoInsert);
  QPushButton* newButton =
      MakeButton(formatFrame, in ? "cmdFlexInFormatNew" : "cmdFlexOutNew", "&New");
  QPushButton* deleteButton =
      MakeButton(formatFrame, in ? "cmdFlexInFormatDelete" : "cmdFlexOutDelete", "De&lete");
  delimiter_ = MakeList(formatFrame, "cmb" + p + "Delimiter", 16);
  delimiter_->setEditable(true);
  delimiter_->setInsertPolicy(QComboBox::NoInsert);
  coordinateType_ = MakeList(formatFrame, "cmb" + p + "CoordType", 12);
  auto* formatGrid = new QGridLayout(formatFrame);
  auto addRow = [&](int row, const QString& caption, QWidget* w) {
    auto* label = new QLabel(caption, formatFrame);
    label->setBuddy(w);
    formatGrid->addWidget(label, row, 0);
    formatGrid->addWidget(w, row, 1);
  };
  addRow(0, "&Format:", formats_);
  formatGrid->addWidget(newButton, 0, 2);
  formatGrid->addWidget(deleteButton, 0, 3);
  addRow(1, "&Delimiter:", delimiter_);
  addRow(2, "Coordinate &Type:", coordinateType_);
  int row = 3;
  if (in) {
    projectHeader_ = new QLineEdit(formatFrame);
    projectHeader_->setObjectName("txtFlexInProjHeader");
    ignore_ = new QLineEdit(formatFrame);
    ignore_->setObjectName("txtFlexInIgnore");
    addRow(row++, "&Project Header Prefix:", projectHeader_);
    addRow(row++, "&Ignore Lines Beginning With:", ignore_);
  } else {
    writeHeader_ = new QCheckBox("&Write Header", formatFrame);
    writeHeader_->setObjectName("chkFlexOutHeader");
    headerPrefix_ = new QLineEdit(formatFrame);
    headerPrefix_->setObjectName("txtFlexOutHeader");
    headerLabel_ = new QLabel("Header &Prefix:", formatFrame);
    headerLabel_->setObjectName("lblFlexOutHeader");
    headerLabel_->setBuddy(headerPrefix_);
    formatGrid->addWidget(writeHeader_, row++, 1);
    formatGrid->addWidget(headerLabel_, row, 0);
    formatGrid->addWidget(headerPrefix_, row++, 1);
  }
  formatGrid->setColumnStretch(1, 1);

  columnsFrame_ = new QGroupBox("Columns", this);
  columnsFrame_->setObjectName("fra" + p + "Columns");
  columns_ = MakeList(columnsFrame_, "cmb" + p + "Columns", 24);
  const QByteArray name = p.toLatin1();
  QPushButton* removeButton =
      MakeButton(columnsFrame_, ("cmd" + name + "Remove").constData(), "&Remove");
  grid_ = new QTableWidget(0, in ? 2 : 3, columnsFrame_);
  grid_->setObjectName("grd" + p);
  grid_->setSelectionMode(QAbstractItemView::SingleSelection);
  grid_->setEditTriggers(QAbstractItemView::NoEditTriggers);
  grid_->verticalHeader()->setVisible(false);
  grid_->horizontalHeader()->setStretchLastSection(true);
  grid_->installEventFilter(this);
  auto* columnRow = new QHBoxLayout;
  auto* addLabel = new QLabel("&Add Column:", columnsFrame_);
  addLabel->setBuddy(columns_);
  columnRow->addWidget(addLabel);
  columnRow->addWidget(columns_, 1);
  columnRow->addWidget(removeButton);
  auto* columnLayout = new QVBoxLayout(columnsFrame_);
  columnLayout->addLayout(columnRow);
  columnLayout->addWidget(grid_);

  auto* referenceFrame = new QGroupBox("Coordinates", this);
  referenceFrame->setObjectName("fra" + p + "Coordinates");
  auto* referenceGrid = new QGridLayout(referenceFrame);
  for (FlexList l : kFlexLists) {
    const int i = static_cast<int>(l);
    QComboBox* box = MakeList(referenceFrame, "cmb" + p + kListNames[i], 24);
    auto* label = new QLabel(kCaptions[i], referenceFrame);
    label->setBuddy(box);
    referenceGrid->addWidget(label, i, 0);
    referenceGrid->addWidget(box, i, 1);
    lists_[i] = box;
  }
  referenceGrid->setColumnStretch(1, 1);

  QPushButton* okButton = MakeButton(this, ("cmd" + name + "OK").constData(), "OK");
  okButton->setDefault(true);
  QPushButton* cancelButton = MakeButton(this, ("cmd" + name + "Cancel").constData(), "Cancel");
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  buttons->addWidget(okButton);
  buttons->addWidget(cancelButton);

  auto* left = new QVBoxLayout;
  left->addWidget(formatFrame);
  left->addWidget(columnsFrame_, 1);
  auto* sides = new QHBoxLayout;
  sides->addLayout(left, 1);
  sides->addWidget(referenceFrame);
  auto* layout = new QVBoxLayout(this);
  layout->addLayout(sides);
  layout->addLayout(buttons);

  connect(newButton, &QPushButton::clicked, this, [this] {
    form_.newFormat();
    sync();
    formats_->setFocus();
  });
  connect(deleteButton, &QPushButton::clicked, this, [this] {
    form_.deleteFormat();
    sync();
  });
  connect(removeButton, &QPushButton::clicked, this, [this] {
    form_.removeColumn(grid_->currentRow());
    sync();
  });
  connect(okButton, &QPushButton::clicked, this, &FlexDialog::ok);
  connect(cancelButton, &QPushButton::clicked, this, &QDialog::reject);
  delimiter_->installEventFilter(this);
  if (delimiter_->lineEdit()) delimiter_->lineEdit()->installEventFilter(this);
  bind();
  form_.open();
  sync();
}

void FlexDialog::bind() {
  connect(formats_, &QComboBox::currentIndexChanged, this, [this](int index) {
    if (syncing_ || index < 0) return;
    form_.loadFormat(formats_->itemText(index).toStdString(), settings_);
    sync();
  });
  connect(formats_, &QComboBox::editTextChanged, this, [this](const QString& text) {
    if (!syncing_) form_.setFormatName(text.toStdString());
  });
  connect(delimiter_, &QComboBox::editTextChanged, this, [this](const QString& text) {
    if (syncing_) return;
    form_.setDelimiter(text.toStdString());
    sync();
  });
  connect(delimiter_, &QComboBox::activated, this, [this] {
    form_.leaveDelimiter();
    sync();
  });
  connect(coordinateType_, &QComboBox::currentIndexChanged, this, [this](int index) {
    if (syncing_ || index < 0) return;
    form_.chooseCoordinateType(coordinateType_->itemText(index).toStdString(), settings_);
    sync();
  });
  // A choice adds a row, also when the same name is chosen again.
  connect(columns_, &QComboBox::activated, this, [this](int index) {
    if (index < 0) return;
    form_.addColumn(columns_->itemText(index).toStdString());
    sync();
    grid_->resizeColumnToContents(0);
  });
  for (FlexList l : kFlexLists) {
    QComboBox* box = list(l);
    connect(box, &QComboBox::currentIndexChanged, this, [this, box, l](int index) {
      if (syncing_ || index < 0) return;
      form_.choose(l, box->itemText(index).toStdString());
      sync();
    });
  }
  if (projectHeader_) {
    connect(projectHeader_, &QLineEdit::textEdited, this,
            [this](const QString& t) { form_.projectHeaderPrefix = t.toStdString(); });
    connect(ignore_, &QLineEdit::textEdited, this,
            [this](const QString& t) { form_.ignorePrefix = t.toStdString(); });
  } else {
    connect(writeHeader_, &QCheckBox::toggled, this, [this](bool on) {
      if (syncing_) return;
      form_.writeHeader = on;
      sync();
    });
    connect(headerPrefix_, &QLineEdit::textEdited, this,
            [this](const QString& t) { form_.headerPrefix = t.toStdString(); });
  }
}

void FlexDialog::sync() {
  syncing_ = true;
  ShowEditable(formats_, form_.formats(), form_.formatName());
  ShowEditable(delimiter_, FlexDelimiterNames(), form_.delimiter());
  SetItems(coordinateType_, FlexForm::coordinateTypes());
  coordinateType_->setCurrentIndex(coordinateType_->findText(Q(form_.coordinateType())));
  SetItems(columns_, form_.offeredColumns());
  columns_->setCurrentIndex(-1);
  columnsFrame_->setEnabled(form_.columnsEnabled());

  const bool out = form_.direction() == FlexDirection::Out;
  QStringList headings{"Column Name", Q(form_.gridHeading())};
  if (out) headings << "Decimal Places";
  grid_->setHorizontalHeaderLabels(headings);
  const auto& rows = form_.rows();
  const int current = grid_->currentRow(), currentColumn = grid_->currentColumn();
  grid_->setRowCount(static_cast<int>(rows.size()));
  for (int r = 0; r < static_cast<int>(rows.size()); ++r) {
    const std::string* cells[] = {&rows[r].name, &rows[r].order, &rows[r].decimals};
    for (int c = 0; c < grid_->columnCount(); ++c) {
      QTableWidgetItem* item = grid_->item(r, c);
      if (!item) {
        item = new QTableWidgetItem;
        item->setFlags(Qt::ItemIsSelectable | Qt::ItemIsEnabled);
        grid_->setItem(r, c, item);
      }
      item->setText(Q(*cells[c]));
    }
  }
  if (current >= 0 && current < grid_->rowCount()) grid_->setCurrentCell(current, currentColumn);
  grid_->resizeColumnToContents(0);

  for (FlexList l : kFlexLists) ShowList(list(l), form_.list(l));
  if (out) {
    writeHeader_->setChecked(form_.writeHeader);
    headerPrefix_->setEnabled(form_.writeHeader);
    headerLabel_->setEnabled(form_.writeHeader);
    ShowText(headerPrefix_, form_.headerPrefix);
  } else {
    ShowText(projectHeader_, form_.projectHeaderPrefix);
    ShowText(ignore_, form_.ignorePrefix);
  }
  syncing_ = false;
}

bool FlexDialog::eventFilter(QObject* watched, QEvent* event) {
  if (watched == grid_ && event->type() == QEvent::KeyPress) {
    auto* key = static_cast<QKeyEvent*>(event);
    const int k = key->key();
    if ((k >= Qt::Key_0 && k <= Qt::Key_9) || k == Qt::Key_Backspace || k == Qt::Key_Delete) {
      typeKey(k, key->modifiers().testFlag(Qt::KeypadModifier));
      return true;
    }
  } else if ((watched == delimiter_ || watched == delimiter_->lineEdit()) &&
             event->type() == QEvent::FocusOut) {
    form_.leaveDelimiter();
    sync();
  }
  return QDialog::eventFilter(watched, event);
}

void FlexDialog::typeKey(int key, bool keypad) {
  const int row = grid_->currentRow(), cell = grid_->currentColumn();
  if (row < 0 || cell < 1) return;
  if (key == Qt::Key_Backspace) {
    form_.typeInCell(row, cell, CellKey::Backspace);
  } else if (key == Qt::Key_Delete) {
    form_.typeInCell(row, cell, CellKey::Delete);
  } else {
    form_.typeInCell(row, cell, keypad ? CellKey::KeypadDigit : CellKey::Digit,
                     static_cast<char>('0' + (key - Qt::Key_0)));
  }
  sync();
}

void FlexDialog::focusOn(const FlexRefusal& refusal) {
  switch (refusal.control) {
    case FlexControl::None:
      return;
    case FlexControl::FormatName:
      formats_->setFocus();
      return;
    case FlexControl::Delimiter:
      delimiter_->setFocus();
      return;
    case FlexControl::CoordinateType:
      coordinateType_->setFocus();
      return;
    case FlexControl::Columns:
      columns_->setFocus();
      return;
    case FlexControl::Grid:
      grid_->setCurrentCell(refusal.row, 1);
      grid_->setFocus();
      return;
    case FlexControl::List:
      list(refusal.list)->setFocus();
      return;
  }
}

void FlexDialog::ok() {
  FlexRefusal focus;
  succeeded_ = form_.accept(work_, settings_, path_, focus);
  sync();
  if (succeeded_) {
    accept();
    return;
  }
  focusOn(focus);
}

}  // namespace zv
