#pragma once
// What the grid/local dialogs share around their tool run.

#include <QDialog>

#include "app/TranslateLogic.h"

namespace zv {

// The tool's console goes below the dialog, as below the Translate window.
inline ConsolePlace ConsoleBelowDialog(const QWidget& dialog) {
  const QRect f = dialog.frameGeometry();
  return ConsoleBelow({f.x(), f.y(), f.width(), f.height()});
}

// Closes the dialog after a run. The completion box closed over it just
// before: some window managers then leave no window with the keyboard focus.
inline void CloseAfterRun(QDialog& dialog) {
  dialog.accept();
  if (dialog.parentWidget()) dialog.parentWidget()->activateWindow();
}

}  // namespace zv
