#include "app/Routines.h"

#include <vector>

#include "app/AppContext.h"
#include "app/FileTypes.h"
#include "app/ToolJobs.h"
#include "geodesy/ConversionForm.h"
#include "platform/Error.h"
#include "platform/Settings.h"
#include "tools/SearchReplace.h"
#include "userformats/FlexUnattended.h"

namespace zv {

namespace {

bool ReadFlexUnattended(AppContext& ctx, const RoutineCall& call) {
  const std::optional<FlexInChoices> choices =
      UnattendedFlexInChoices(ctx.ui, ctx.appFolder, *ctx.settings, call.configurationPath);
  return choices && FlexIn(ctx.ui, ctx.work, ctx.appFolder, call.inputPath, *choices);
}

bool WriteFlexUnattended(AppContext& ctx, const RoutineCall& call) {
  const std::optional<FlexOutChoices> choices = UnattendedFlexOutChoices(
      ctx.ui, ctx.appFolder, *ctx.settings, call.configurationPath, &ctx.work.OutputHeader);
  return choices && FlexOut(ctx.ui, ctx.work, ctx.appFolder, call.outputPath, *choices);
}

bool Convert(AppContext& ctx, const RoutineCall& call, bool unattended) {
  const FileType* in = FindFileType(call.inputType);
  if (!in || !in->reader) {
    ctx.ui.exclaim("Can not convert from " + call.inputType, "Invalid Format");
    return false;
  }
  ctx.work.clearInput();
  const bool read = unattended && in->name == kUserDefinedType ? ReadFlexUnattended(ctx, call)
                                                               : in->reader(ctx, call.inputPath);
  if (!read) return false;
  const FileType* out = FindFileType(call.outputType);
  if (!out || !out->writer) {
    ctx.ui.exclaim("Can not convert to " + call.outputType, "Invalid Format");
    return false;
  }
  // The input side is not looked at again before the next run clears it.
  ctx.work.copyInputToOutput(/*moveInput=*/true);
  if (unattended && out->name == kUserDefinedType) return WriteFlexUnattended(ctx, call);
  return out->writer(ctx, call.outputPath);
}

}  // namespace

bool ConvertFile(AppContext& ctx, const RoutineCall& call) {
  return Convert(ctx, call, /*unattended=*/false);
}

bool ConvertFileUnattended(AppContext& ctx, const RoutineCall& call) {
  return Convert(ctx, call, /*unattended=*/true);
}

bool ConfigurationNamesFormat(std::string_view program, const RoutineCall& call) {
  return program == "ConvertFile" &&
         (call.inputType == kUserDefinedType || call.outputType == kUserDefinedType);
}

bool ReplaceRoutine(AppContext& ctx, const RoutineCall& call) {
  return SearchAndReplace(ctx.ui, call.inputPath, call.outputPath, call.configurationPath);
}

bool ReadForReprojection(AppContext& ctx, const RoutineCall& call) {
  ConversionState& state = ctx.conversion;
  state.singlePoint = false;
  state.accepted = false;
  ctx.work.ConversionOptionsActive = true;
  ctx.work.clearInput();
  const FileType* in = FindFileType(call.inputType);
  // User-defined files carry no coordinate reference to start from.
  if (!in || !in->reader || in->name == kUserDefinedType) {
    ctx.ui.exclaim("Can not reproject " + call.inputType, "Invalid Format");
    return false;
  }
  if (!in->reader(ctx, call.inputPath)) return false;
  const FileHeader& h = ctx.work.InputHeader;
  ConversionSettings& s = state.settings;
  s.inputCoordinateSystem = h.CoordinateSystem;
  s.inputZone = h.Zone;
  s.inputHorizontalDatum = h.HorizontalDatum;
  s.inputHorizontalUnits = h.HorizontalUnits;
  s.inputVerticalDatum = h.VerticalDatum;
  s.inputVerticalUnits = h.VerticalUnits;
  state.points = std::move(ctx.work.InputPoints);
  ctx.work.InputPoints.clear();
  return true;
}

bool ConvertWithStoredSettings(AppContext& ctx, const RoutineCall& call) {
  ConversionState& state = ctx.conversion;
  const ConversionSettings fromFile = state.settings;
  std::optional<ConversionSettings> settings;
  if (!call.configurationPath.empty()) {
    const ProfileSettings store(call.configurationPath);
    settings = SettingsFromStore(ctx.ui, ctx.appFolder, store, &fromFile,
                                 "'" + call.configurationPath + "'");
  } else {
    settings = SettingsFromStore(ctx.ui, ctx.appFolder, *ctx.settings, &fromFile,
                                 "the settings last accepted in the Coordinate Conversion dialog");
  }
  if (!settings) return false;
  state.settings = *settings;
  state.accepted = false;
  if (!ConvertPoints(ctx.ui, ctx.appFolder, state)) return false;
  state.accepted = true;
  return true;
}

bool WriteReprojection(AppContext& ctx, const RoutineCall& call) {
  WorkArea& w = ctx.work;
  ConversionState& state = ctx.conversion;
  const ConversionSettings& s = state.settings;
  w.OutputHeader = w.InputHeader;
  w.OutputHeader.CoordinateSystem = s.outputCoordinateSystem;
  w.OutputHeader.Zone = s.outputZone;
  w.OutputHeader.HorizontalDatum = s.outputHorizontalDatum;
  w.OutputHeader.HorizontalUnits = s.outputHorizontalUnits;
  w.OutputHeader.VerticalDatum = s.outputVerticalDatum;
  w.OutputHeader.VerticalUnits = s.outputVerticalUnits;
  // Neither is looked at again before the next run replaces it.
  w.OutputPoints = std::move(state.points);
  state.points.clear();
  w.OutputChains = std::move(w.InputChains);
  w.InputChains.clear();
  w.OutputScaleFactor = s.OutputScaleFactor;
  w.OutputConvergence = s.OutputConvergence;
  w.OutputLatLong = s.OutputLatLong;
  w.OutputGeoid = s.OutputGeoid;
  if (!state.accepted) return false;
  const FileType* out = FindFileType(call.outputType);
  if (!out || !out->reprojectWriter) {
    ctx.ui.exclaim("Can not write the reprojected file to " + call.outputType, "Invalid Format");
    return false;
  }
  return out->reprojectWriter(ctx, call.outputPath);
}

bool MultiPointRoutine(AppContext& ctx, const RoutineCall& call) {
  return ReadForReprojection(ctx, call) && ConvertWithStoredSettings(ctx, call) &&
         WriteReprojection(ctx, call);
}

namespace {

std::vector<Routine> MakeUnattendedRoutines() {
  std::vector<Routine> routines = {
      {"ConvertFile", ConvertFileUnattended},
      {"Replace", ReplaceRoutine},
      {"CoordConvert", CoordConvertRoutine},
      {"MultiPoint", MultiPointRoutine},
  };
  for (const ToolRoutine& tool : ToolRoutines())
    if (tool.unattended) routines.push_back({tool.program, nullptr, &tool});
  return routines;
}

}  // namespace

bool RunShowingErrors(Ui& ui, const std::function<bool()>& routine) {
  try {
    return routine();
  } catch (const RunCancelled&) {
    ui.setBusy(false);
    ui.inform(kRunCancelled);
  } catch (const ZvError& e) {
    ui.setBusy(false);
    ui.exclaim(e.description(), e.source());
  } catch (const std::exception& e) {
    ui.setBusy(false);
    ui.exclaim(std::string("The translation stopped: ") + e.what());
  }
  return false;
}

bool Routine::run(AppContext& ctx, const RoutineCall& call) const {
  return tool ? RunToolUnattended(ctx, *tool, call) : fn(ctx, call);
}

const Routine* FindUnattendedRoutine(std::string_view program) {
  static const std::vector<Routine> kRoutines = MakeUnattendedRoutines();
  for (const auto& r : kRoutines)
    if (r.program == program) return &r;
  return nullptr;
}

}  // namespace zv
