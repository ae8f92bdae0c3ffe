#include "app/EngineDialogs.h"

#include <ostream>

#include "app/AppContext.h"

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
  std::string text = report;
  for (size_t at = text.find('\r'); at != std::string::npos; at = text.find('\r', at))
    text.erase(at, 1);
  out_ << "view: Coordinate Conversion Results\n" << text << '\n';
}

}  // namespace zv
