#pragma once
// Qt implementation of the UI seam: message boxes, the input box, file
// dialogs, the busy pointer and text editor windows (made by the opener it is
// given). It may be called from a worker thread: every window is then shown
// by the GUI thread while the worker waits.

#include <QStringList>
#include <QWidget>
#include <functional>

#include "platform/Ui.h"

namespace zv {

class QtUi : public Ui {
 public:
  // Opens a text editor window that deletes itself when closed; nullptr
  // when none could be opened.
  using EditorOpener = std::function<QWidget*(Ui& ui, const std::string& path,
                                              const std::string& typeDescription, EditorMode)>;
  explicit QtUi(EditorOpener openEditor = {}) : openEditor_(std::move(openEditor)) {}

  Answer message(const std::string& text, Icon icon, Buttons buttons,
                 const std::string& title) override;
  std::optional<std::string> input(const std::string& prompt, const std::string& title,
                                   const std::string& defaultText) override;
  void viewText(const std::string& path, const std::string& typeDescription) override;
  bool openEditor(const std::string& path, const std::string& typeDescription,
                  EditorMode mode) override;
  std::optional<std::string> chooseFile(const FileDialogRequest& request) override;
  void setBusy(bool on) override;
  bool hasWindows() const override { return true; }
  // The progress window of the background run on this thread; elsewhere a
  // stop after SIGINT or SIGTERM.
  RunProgress* progress() override;

 private:
  EditorOpener openEditor_;
  SignalStop signalStop_;
  bool busy_ = false;  // GUI thread only
};

// The name filters of a "description|pattern|..." filter: patterns match
// without regard to letter case; "*.*" and a missing pattern match every file.
QStringList QtNameFilters(const std::string& filter);

// The extension of a name filter's first pattern ("CTL" of
// "VORN Control Files (*.CTL *.ctl)"); empty when it matches every file.
QString FilterSuffix(const QString& nameFilter);

}  // namespace zv
