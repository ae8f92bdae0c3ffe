#include "app/dialogs/QtEngineDialogs.h"

#include "app/AppContext.h"
#include "coordui/CoordinateConversionDialog.h"
#include "coordui/CoordinateResultsDialog.h"
#include "coordui/ManualEntryDialog.h"
#include "platform/qt/BackgroundRun.h"
#include "platform/qt/GuiThread.h"

namespace zv {

bool QtEngineDialogs::coordinateConversion(AppContext& ctx, ConversionState& state,
                                           bool presetInput) {
  return OnGuiThread([&] {
    UserWait wait;
    ConversionDialogs dialogs{[this](const ManualEntrySetup& setup, SurveyPoint& point) {
                                return enterPoint(setup, point);
                              },
                              [this](const std::string& report) { showReport(report); }};
    CoordinateConversionDialog dialog(ctx.ui, ctx.appFolder, state, *ctx.settings,
                                      std::move(dialogs), wait.owner());
    // The preset is copied: OK replaces the settings it came from.
    const ConversionSettings preset = state.settings;
    dialog.load(presetInput ? &preset : nullptr);
    dialog.exec();
    return state.accepted;
  });
}

bool QtEngineDialogs::enterPoint(const ManualEntrySetup& setup, SurveyPoint& point) {
  return OnGuiThread([&] {
    UserWait wait;
    ManualEntryDialog dialog(ui_, setup, point, wait.owner());
    return dialog.exec() == QDialog::Accepted;
  });
}

void QtEngineDialogs::showReport(const std::string& report) {
  OnGuiThread([&] {
    UserWait wait;
    CoordinateResultsDialog dialog(report, wait.owner());
    dialog.exec();
  });
}

}  // namespace zv
