#include "platform/qt/QtUi.h"

#include <QApplication>
#include <QEventLoop>
#include <QFileDialog>
#include <QFontMetrics>
#include <QGridLayout>
#include <QInputDialog>
#include <QMessageBox>
#include <QPointer>
#include <QRegularExpression>

#include "platform/qt/BackgroundRun.h"
#include "platform/qt/GuiThread.h"

namespace zv {

namespace {

QString Title(const std::string& title) {
  return QString::fromStdString(title.empty() ? std::string(kAppTitle) : title);
}

QString Text(const std::string& text) {
  QString s = QString::fromStdString(text);
  s.replace("\r\n", "\n");
  return s;
}

// A message box is as wide as its text; a short text would cut its title
// ("Conversion Complete") in the title bar.
void KeepTitleWhole(QMessageBox& box) {
  constexpr int kTitleBarButtons = 160;
  const int width =
      QFontMetrics(QApplication::font("QWorkspaceTitleBar")).horizontalAdvance(box.windowTitle()) +
      kTitleBarButtons;
  if (auto* grid = qobject_cast<QGridLayout*>(box.layout())) {
    grid->addItem(new QSpacerItem(width, 0, QSizePolicy::Minimum, QSizePolicy::Expanding),
                  grid->rowCount(), 0, 1, grid->columnCount());
  }
}

}  // namespace

QStringList QtNameFilters(const std::string& filter) {
  const QStringList parts = QString::fromStdString(filter).split('|');
  static const QRegularExpression kTrailingGroup(R"(\s*\([^()]*\)\s*$)");
  QStringList filters;
  for (qsizetype i = 0; i + 1 < parts.size(); i += 2) {
    QString description = parts[i];
    description.remove(kTrailingGroup);
    QStringList patterns;
    for (const QString& p : parts[i + 1].split(';', Qt::SkipEmptyParts)) {
      const QString pattern = p.trimmed();
      if (pattern == "*.*" || pattern == "*") {
        patterns << "*";
        continue;
      }
      for (const QString& variant : {pattern, pattern.toUpper(), pattern.toLower()})
        if (!patterns.contains(variant)) patterns << variant;
    }
    if (patterns.isEmpty()) patterns << "*";
    filters << description + " (" + patterns.join(' ') + ")";
  }
  return filters;
}

QString FilterSuffix(const QString& nameFilter) {
  static const QRegularExpression kFirstPattern(R"(\(\*\.([^ *?)]+)[ )])");
  const QRegularExpressionMatch match = kFirstPattern.match(nameFilter);
  return match.hasMatch() ? match.captured(1) : QString();
}

Answer QtUi::message(const std::string& text, Icon icon, Buttons buttons,
                     const std::string& title) {
  return OnGuiThread([&] {
    UserWait wait;
    QMessageBox box(wait.owner());
    box.setWindowTitle(Title(title));
    box.setTextFormat(Qt::PlainText);
    box.setText(Text(text));
    switch (icon) {
      case Icon::Information:
        box.setIcon(QMessageBox::Information);
        break;
      case Icon::Exclamation:
        box.setIcon(QMessageBox::Warning);
        break;
      case Icon::Critical:
        box.setIcon(QMessageBox::Critical);
        break;
      case Icon::Question:
        box.setIcon(QMessageBox::Question);
        break;
      case Icon::None:
        box.setIcon(QMessageBox::NoIcon);
        break;
    }
    switch (buttons) {
      case Buttons::Ok:
        box.setStandardButtons(QMessageBox::Ok);
        break;
      case Buttons::OkCancel:
        box.setStandardButtons(QMessageBox::Ok | QMessageBox::Cancel);
        box.setEscapeButton(QMessageBox::Cancel);
        break;
      case Buttons::YesNo:
        box.setStandardButtons(QMessageBox::Yes | QMessageBox::No);
        box.setDefaultButton(QMessageBox::Yes);
        box.setEscapeButton(QMessageBox::No);
        break;
      case Buttons::YesNoCancel:
        box.setStandardButtons(QMessageBox::Yes | QMessageBox::No | QMessageBox::Cancel);
        box.setDefaultButton(QMessageBox::Yes);
        box.setEscapeButton(QMessageBox::Cancel);
        break;
    }
    // Last: setting the icon or the buttons lays the box out again.
    KeepTitleWhole(box);
    switch (box.exec()) {
      case QMessageBox::Yes:
        return Answer::Yes;
      case QMessageBox::No:
        return Answer::No;
      case QMessageBox::Ok:
        return Answer::Ok;
      default:
        // A box closed without a button gives the safe answer.
        return buttons == Buttons::YesNo ? Answer::No
               : buttons == Buttons::Ok  ? Answer::Ok
                                         : Answer::Cancel;
    }
  });
}

std::optional<std::string> QtUi::input(const std::string& prompt, const std::string& title,
                                       const std::string& defaultText) {
  return OnGuiThread([&]() -> std::optional<std::string> {
    UserWait wait;
    bool ok = false;
    QString answer =
        QInputDialog::getText(wait.owner(), Title(title), Text(prompt), QLineEdit::Normal,
                              QString::fromStdString(defaultText), &ok);
    if (!ok) return std::nullopt;
    return answer.toStdString();
  });
}

void QtUi::viewText(const std::string& path, const std::string& typeDescription) {
  OnGuiThread([&] {
    UserWait wait;
    QPointer<QWidget> viewer =
        openEditor_ ? openEditor_(*this, path, typeDescription, EditorMode::Viewer) : nullptr;
    // Wait for the viewer to close while every window keeps working.
    if (!viewer) return;
    QEventLoop loop;
    QObject::connect(viewer, &QObject::destroyed, &loop, &QEventLoop::quit);
    loop.exec();
  });
}

bool QtUi::openEditor(const std::string& path, const std::string& typeDescription,
                      EditorMode mode) {
  return OnGuiThread(
      [&] { return openEditor_ && openEditor_(*this, path, typeDescription, mode); });
}

std::optional<std::string> QtUi::chooseFile(const FileDialogRequest& request) {
  return OnGuiThread([&]() -> std::optional<std::string> {
    UserWait wait;
    QFileDialog dialog(wait.owner(), QString::fromStdString(request.title),
                       QString::fromStdString(request.folder));
    dialog.setNameFilters(QtNameFilters(request.filter));
    if (request.kind == FileDialogKind::Open) {
      dialog.setAcceptMode(QFileDialog::AcceptOpen);
      dialog.setFileMode(QFileDialog::ExistingFile);
    } else {
      dialog.setAcceptMode(QFileDialog::AcceptSave);
      dialog.setFileMode(QFileDialog::AnyFile);
      // A name without an extension gets the chosen type's.
      auto useSuffixOf = [&dialog](const QString& nameFilter) {
        dialog.setDefaultSuffix(FilterSuffix(nameFilter));
      };
      if (!dialog.nameFilters().isEmpty()) useSuffixOf(dialog.nameFilters().front());
      QObject::connect(&dialog, &QFileDialog::filterSelected, &dialog, useSuffixOf);
    }
    if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty()) {
      return std::nullopt;
    }
    return dialog.selectedFiles().front().toStdString();
  });
}

RunProgress* QtUi::progress() {
  RunProgress* run = CurrentRunProgress();
  return run ? run : &signalStop_;
}

void QtUi::setBusy(bool on) {
  OnGuiThread([&] {
    if (on == busy_) return;
    busy_ = on;
    if (on) {
      QApplication::setOverrideCursor(Qt::WaitCursor);
    } else {
      QApplication::restoreOverrideCursor();
    }
  });
}

}  // namespace zv
