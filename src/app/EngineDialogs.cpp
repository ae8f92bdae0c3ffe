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

void ConsoleDialogs::showReport(const std::string& report) {
  out_ << "view: Coordinate Conversion Results\n" << WithLineBreaks(report) << '\n';
}

}  // namespace zv
