#include "app/EngineDialogs.h"

#include <ostream>

#include "app/AppContext.h"
#include "platform/ConsoleUi.h"

namespace zv {

bool ConsoleDialogs::coordinateConversion(AppContext& ctx, ConversionState& state, bool) {
  state.accepted = false;
  ctx.ui.exclaim("The Coordinate Conversion dialog needs a display (DISPLAY or WAYLAND_DISPLAY).");
  return false;
}

bool ConsoleDialogs::enterPoint(const ManualEntrySetup&, SurveyPoint&) {
  return false;
}

bool EngineDialogs::flexIn(AppContext& ctx, const std::string&) {
  ctx.ui.exclaim("The user format dialogs need a display (DISPLAY or WAYLAND_DISPLAY).");
  return false;
}

bool EngineDialogs::flexOut(AppContext& ctx, const std::string& path) {
  return EngineDialogs::flexIn(ctx, path);
}

bool EngineDialogs::gridToLocal(AppContext& ctx, const std::string&, const std::string&,
                                const GridToLocalRunner&) {
  ctx.ui.exclaim("The grid to local dialog needs a display (DISPLAY or WAYLAND_DISPLAY).");
  return false;
}

bool EngineDialogs::localToGrid(AppContext& ctx, const RecordedGridReference&, const std::string&,
                                const std::string&, const LocalToGridRunner&) {
  ctx.ui.exclaim("The local to grid dialog needs a display (DISPLAY or WAYLAND_DISPLAY).");
  return false;
}

void ConsoleDialogs::showReport(const std::string& report) {
  out_ << "view: Coordinate Conversion Results\n" << WithLineBreaks(report) << '\n';
}

}  // namespace zv
