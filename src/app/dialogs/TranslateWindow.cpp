#include "app/dialogs/TranslateWindow.h"

#include <QCheckBox>
#include <QCloseEvent>
#include <QComboBox>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTabWidget>
#include <QVBoxLayout>

#include "app/AppContext.h"
#include "editor/PlanView.h"
#include "platform/TextIo.h"
#include "platform/qt/BackgroundRun.h"
#include "platform/qt/Controls.h"

namespace zv {

namespace {

void ShowList(QComboBox* box, const ChoiceList& list) {
  SetItems(box, list.items);
  box->setCurrentIndex(list.selected);
}

}  // namespace

TranslateWindow::TranslateWindow(AppContext& ctx, QWidget* parent)
    : QDialog(parent), ctx_(ctx), logic_(ctx) {
  setObjectName("frmTranslate");
  setWindowTitle(QString::fromStdString(TranslateLogic::Caption()));
  tab_ = new QTabWidget(this);
  tab_->setObjectName("tabTranslate");
  auto* page = new QWidget(tab_);
  tab_->addTab(page, "Translate");
  auto* pageLayout = new QVBoxLayout(page);

  // A frame with its type list and a location group below it.
  auto frame = [&](const char* name, const QString& title, QComboBox*& list, const char* listName,
                   Group& group, const char* label, const char* text, const QString& caption,
                   const char* browse, const QString& browseText, const QString& typeCaption) {
    auto* box = new QGroupBox(title, page);
    box->setObjectName(name);
    list = MakeList(box, listName, 36);
    group.label = new QLabel(caption, box);
    group.label->setObjectName(label);
    group.text = new QLineEdit(box);
    group.text->setObjectName(text);
    group.text->setMinimumWidth(360);
    group.label->setBuddy(group.text);
    group.buttons = {MakeButton(box, browse, browseText)};
    auto* grid = new QGridLayout(box);
    auto* typeLabel = new QLabel(typeCaption, box);
    typeLabel->setBuddy(list);
    grid->addWidget(typeLabel, 0, 0);
    grid->addWidget(list, 0, 1, 1, 2);
    grid->addWidget(group.label, 1, 0);
    grid->addWidget(group.text, 1, 1);
    grid->addWidget(group.buttons[0], 1, 2);
    grid->setColumnStretch(1, 1);
    pageLayout->addWidget(box);
    return std::make_pair(box, grid);
  };
  frame("fraInput", "Input", inputType_, "cmbInputType", input_, "lblInputLocation",
        "txtInputLocation", "&File:", "cmdInputBrowse", "&Browse...", "&Input type:");
  frame("fraOutput", "Output", outputType_, "cmbOutputType", output_, "lblOutputLocation",
        "txtOutputLocation", "Fi&le:", "cmdOutputBrowse", "Brow&se...", "O&utput type:");
  auto [actionBox, actionGrid] =
      frame("fraAction", "Action", action_, "cmbAction", configuration_, "lblActionLocation",
            "txtActionLocation", "&Configuration:", "cmdActionBrowse", "B&rowse...", "&Action:");
  default_ = new QCheckBox("Store as the action's &default", actionBox);
  default_->setObjectName("chkActionDefault");
  QPushButton* newButton = MakeButton(actionBox, "cmdActionNew", "&New...");
  QPushButton* editButton = MakeButton(actionBox, "cmdActionEdit", "&Edit...");
  configuration_.buttons.insert(configuration_.buttons.end(), {newButton, editButton, default_});
  auto* row = new QHBoxLayout;
  row->addWidget(default_);
  row->addStretch();
  row->addWidget(newButton);
  row->addWidget(editButton);
  actionGrid->addLayout(row, 2, 1, 1, 2);
  pageLayout->addStretch();

  plan_ = MakeButton(this, "cmdPlanView", "&Plan View...");
  plan_->setToolTip("Draws the output file: its points, names and chains.");
  ok_ = MakeButton(this, "cmdTranslateOK", "OK");
  ok_->setDefault(true);
  cancel_ = MakeButton(this, "cmdTranslateCancel", "Cancel");
  auto* buttons = new QHBoxLayout;
  buttons->addWidget(plan_);
  buttons->addStretch();
  buttons->addWidget(ok_);
  buttons->addWidget(cancel_);
  auto* layout = new QVBoxLayout(this);
  layout->addWidget(tab_);
  layout->addLayout(buttons);

  logic_.setLongRunner([this](const std::function<bool()>& work) {
    return RunInBackground(this, "Translating...", work);
  });
  logic_.setFrameSource([this] {
    const QRect frame = frameGeometry();
    return WindowFrame{frame.x(), frame.y(), frame.width(), frame.height()};
  });
  bind();
  sync();
}

void TranslateWindow::bind() {
  auto onList = [this](QComboBox* box, void (TranslateLogic::*select)(int)) {
    connect(box, &QComboBox::currentIndexChanged, this, [this, select](int index) {
      if (syncing_ || index < 0) return;
      (logic_.*select)(index);
      sync();
    });
  };
  onList(inputType_, &TranslateLogic::selectInputType);
  onList(outputType_, &TranslateLogic::selectOutputType);
  onList(action_, &TranslateLogic::selectAction);
  auto onText = [this](QLineEdit* box, LocationGroup& group) {
    connect(box, &QLineEdit::textChanged, this, [this, &group](const QString& text) {
      if (!syncing_) group.text = text.toStdString();
    });
  };
  onText(input_.text, logic_.input);
  onText(output_.text, logic_.output);
  onText(configuration_.text, logic_.configuration);
  connect(default_, &QCheckBox::toggled, this, [this](bool on) {
    if (!syncing_) logic_.storeDefault = on;
  });
  auto onButton = [this](QWidget* button, void (TranslateLogic::*op)()) {
    connect(static_cast<QPushButton*>(button), &QPushButton::clicked, this, [this, op] {
      if (running_) return;
      (logic_.*op)();
      sync();
    });
  };
  onButton(input_.buttons[0], &TranslateLogic::browseInput);
  onButton(output_.buttons[0], &TranslateLogic::browseOutput);
  onButton(configuration_.buttons[0], &TranslateLogic::browseConfiguration);
  onButton(configuration_.buttons[1], &TranslateLogic::newConfiguration);
  onButton(configuration_.buttons[2], &TranslateLogic::editConfiguration);
  connect(ok_, &QPushButton::clicked, this, &TranslateWindow::translate);
  connect(cancel_, &QPushButton::clicked, this, &TranslateWindow::cancel);
  connect(plan_, &QPushButton::clicked, this,
          [this] { OpenPlanView(ctx_.ui, logic_.makeCall().outputPath); });
}

void TranslateWindow::sync() {
  syncing_ = true;
  ShowList(inputType_, logic_.inputTypes);
  ShowList(outputType_, logic_.outputTypes);
  ShowList(action_, logic_.actions);
  auto showGroup = [](const Group& g, const LocationGroup& state) {
    g.label->setEnabled(state.enabled);
    g.text->setEnabled(state.enabled);
    for (QWidget* b : g.buttons) b->setEnabled(state.enabled);
    const QString text = QString::fromStdString(state.text);
    if (g.text->text() != text) g.text->setText(text);  // caret at the end
  };
  showGroup(input_, logic_.input);
  showGroup(output_, logic_.output);
  showGroup(configuration_, logic_.configuration);
  default_->setChecked(logic_.storeDefault);
  // A tagged output that exists (the one just written) can be drawn.
  const std::string output = logic_.output.enabled ? logic_.makeCall().outputPath : "";
  plan_->setEnabled(!output.empty() && HasPlanView(output) && FileExists(output));
  syncing_ = false;
}

void TranslateWindow::start() {
  logic_.load();
  sync();
  show();
  inputType_->setFocus();
}

void TranslateWindow::updateConfigFile(const QString& path) {
  logic_.updateConfigFile(path.toStdString());
  sync();
}

void TranslateWindow::translate() {
  if (running_) return;
  running_ = true;
  logic_.translate();
  running_ = false;
  sync();
}

void TranslateWindow::cancel() {
  if (running_) return;
  logic_.cancel();
  close();
}

void TranslateWindow::reject() {
  close();
}

void TranslateWindow::closeEvent(QCloseEvent* event) {
  if (running_) {
    event->ignore();
    return;
  }
  event->accept();
  emit ended();
}

}  // namespace zv
