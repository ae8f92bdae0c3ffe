#pragma once
// The routine table of the Translate window: each Program name with what the
// window runs for it, including the completion message and the view of the
// output. Programs missing from the table cannot be run from the window.

#include <functional>
#include <span>
#include <string>
#include <string_view>

#include "app/Routines.h"

namespace zv {

struct AppContext;

// Runs the long part of a routine (reading, converting, writing) and returns
// its result. The window runs it on a worker thread with a progress window.
using LongRunner = std::function<bool(const std::function<bool()>&)>;

// The top left corner of the tool console window, in pixels.
struct ConsolePlace {
  int left = 0, top = 0;
};

struct WindowRun {
  AppContext& ctx;
  RoutineCall call;
  bool storeDefaultConfiguration = false;  // the "default" check box is ticked
  LongRunner runLong;
  ConsolePlace console;
};

using WindowRoutineFn = bool (*)(WindowRun&);

// A routine of the window: one of its own or an external tool.
struct WindowRoutine {
  std::string_view program;
  WindowRoutineFn fn = nullptr;
  const ToolRoutine* tool = nullptr;
  // True when the routine did its job.
  bool run(WindowRun& run) const;
};

// The window's routines, then the external tools.
const WindowRoutine* FindWindowRoutine(std::string_view program);

// The check made by the routines that take a configuration file; stores the
// file as the definition's default when asked to. False when refused.
bool CheckConfiguration(WindowRun& run);

// Opens the output in a viewer when the start-up settings ask for it.
void ViewOutput(WindowRun& run);

}  // namespace zv
