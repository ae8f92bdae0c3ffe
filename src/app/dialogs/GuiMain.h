#pragma once
// The entry of the program built with the Qt user interface: picks the Qt or
// the console UI and opens the Translate window in the interactive modes.

#include <string>

#include "app/Startup.h"

namespace zv {

enum class UiKind { Console, Qt };

// `forced` is ZUREVAZIDU_UI ("console" or "qt" force one). Otherwise a display
// gives Qt; the interactive modes also use Qt when a Qt platform is named
// (QT_QPA_PLATFORM, e.g. offscreen); everything else uses the console.
UiKind ChooseUi(StartMode mode, const std::string& forced, bool displayAvailable,
                const std::string& qtPlatform);

// DISPLAY or WAYLAND_DISPLAY is set and QT_QPA_PLATFORM is not "offscreen".
bool DisplayAvailable();

// Runs the program for the argument text with the chosen UI; the exit status.
int RunWithChosenUi(int& argc, char** argv, const std::string& argumentText);

}  // namespace zv
