#include "app/dialogs/GuiMain.h"

#include <QApplication>
#include <cstdlib>
#include <iostream>

#include "app/AppContext.h"
#include "app/dialogs/QtEngineDialogs.h"
#include "app/dialogs/TranslateWindow.h"
#include "editor/TextEditorWindow.h"
#include "platform/ConsoleUi.h"
#include "platform/qt/QtSettings.h"
#include "platform/qt/QtUi.h"

namespace zv {

namespace {

std::string Env(const char* name) {
  const char* value = std::getenv(name);
  return value ? value : "";
}

}  // namespace

UiKind ChooseUi(StartMode mode, const std::string& forced, bool displayAvailable,
                const std::string& qtPlatform) {
  if (forced == "console") return UiKind::Console;
  if (forced == "qt" || displayAvailable) return UiKind::Qt;
  const bool interactive = mode == StartMode::Interactive || mode == StartMode::Preset;
  return interactive && !qtPlatform.empty() ? UiKind::Qt : UiKind::Console;
}

bool DisplayAvailable() {
  return (!Env("DISPLAY").empty() || !Env("WAYLAND_DISPLAY").empty()) &&
         Env("QT_QPA_PLATFORM") != "offscreen";
}

int RunWithChosenUi(int& argc, char** argv, const std::string& argumentText) {
  const StartMode mode = ParseCommandLine(argumentText).mode;
  if (ChooseUi(mode, Env("ZUREVAZIDU_UI"), DisplayAvailable(), Env("QT_QPA_PLATFORM")) ==
      UiKind::Console) {
    ConsoleUi ui(std::cin, std::cout, std::cerr);
    AppContext ctx(ui, ExecutableFolder());
    // The settings the user last accepted in the window.
    QtSettings settings;
    ctx.settings = &settings;
    WindowOpener needsDisplay = [](AppContext& c) {
      c.ui.exclaim(
          "The Translate window needs a display (DISPLAY or WAYLAND_DISPLAY).\r\n"
          "Run a translation without it with -t|definition|input|output (see --help).");
      return 1;
    };
    int status = RunProgram(ctx, argumentText, needsDisplay, std::cout);
    // The run is over: end without freeing a work area of perhaps millions of
    // points one by one.
    std::cout.flush();
    std::cerr.flush();
    std::_Exit(status);
  }
  QApplication app(argc, argv);
  QApplication::setApplicationName(kAppTitle);
  QtUi ui(OpenTextEditor);
  AppContext ctx(ui, ExecutableFolder());
  QtSettings settings;
  ctx.settings = &settings;
  QtEngineDialogs dialogs(ui);
  ctx.dialogs = &dialogs;
  WindowOpener openWindow = [&app](AppContext& c) {
    TranslateWindow window(c);
    // Closing the main window ends the program: the other windows close too
    // (each may ask to save its changes).
    QObject::connect(
        &window, &TranslateWindow::ended, &app, [] { QApplication::closeAllWindows(); },
        Qt::QueuedConnection);
    window.start();
    return QApplication::exec();
  };
  return RunProgram(ctx, argumentText, openWindow, std::cout);
}

}  // namespace zv
