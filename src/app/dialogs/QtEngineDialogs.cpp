#include "app/dialogs/QtEngineDialogs.h"

#include "app/AppContext.h"
#include "coordui/CatalogEditorDialogs.h"
#include "coordui/CoordinateConversionDialog.h"
#include "coordui/CoordinateResultsDialog.h"
#include "coordui/ManualEntryDialog.h"
#include "platform/qt/BackgroundRun.h"
#include "platform/qt/GuiThread.h"
#include "tools/dialogs/GridToLocalDialog.h"
#include "tools/dialogs/LocalToGridDialog.h"
#include "userformats/dialogs/FlexDialogs.h"

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
    dialog.setCatalogEditor(
        [&](CatalogKind kind) { OpenCatalogEditor(ctx.ui, ctx.appFolder, kind, &dialog); });
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

bool QtEngineDialogs::flexIn(AppContext& ctx, const std::string& path) {
  return OnGuiThread([&] {
    UserWait wait;
    FlexInDialog dialog(ctx.ui, ctx.appFolder, ctx.work, *ctx.settings, path, wait.owner());
    dialog.exec();
    return dialog.succeeded();
  });
}

bool QtEngineDialogs::flexOut(AppContext& ctx, const std::string& path) {
  return OnGuiThread([&] {
    UserWait wait;
    FlexOutDialog dialog(ctx.ui, ctx.appFolder, ctx.work, *ctx.settings, path, wait.owner());
    dialog.exec();
    return dialog.succeeded();
  });
}

bool QtEngineDialogs::gridToLocal(AppContext& ctx, const std::string& input,
                                  const std::string& output, const GridToLocalRunner& run) {
  return OnGuiThread([&] {
    UserWait wait;
    GridToLocalDialog dialog(ctx.ui, input, output, run, wait.owner());
    return dialog.exec() == QDialog::Accepted;
  });
}

bool QtEngineDialogs::localToGrid(AppContext& ctx, const RecordedGridReference& recorded,
                                  const std::string& input, const std::string& output,
                                  const LocalToGridRunner& run) {
  return OnGuiThread([&] {
    UserWait wait;
    LocalToGridDialog dialog(ctx.ui, ctx.appFolder, recorded, input, output, run, wait.owner());
    return dialog.exec() == QDialog::Accepted;
  });
}

}  // namespace zv
