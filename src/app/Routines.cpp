#include "app/Routines.h"

#include <vector>

#include "app/AppContext.h"
#include "app/FileTypes.h"
#include "app/ToolJobs.h"
#include "platform/Error.h"
#include "tools/SearchReplace.h"

namespace zv {

bool ConvertFile(AppContext& ctx, const RoutineCall& call) {
  const FileType* in = FindFileType(call.inputType);
  if (!in || !in->reader) {
    ctx.ui.exclaim("Can not convert from " + call.inputType, "Invalid Format");
    return false;
  }
  ctx.work.clearInput();
  if (!in->reader(ctx, call.inputPath)) return false;
  const FileType* out = FindFileType(call.outputType);
  if (!out || !out->writer) {
    ctx.ui.exclaim("Can not convert to " + call.outputType, "Invalid Format");
    return false;
  }
  // The input side is not looked at again before the next run clears it.
  ctx.work.copyInputToOutput(/*moveInput=*/true);
  return out->writer(ctx, call.outputPath);
}

bool ReplaceRoutine(AppContext& ctx, const RoutineCall& call) {
  return SearchAndReplace(ctx.ui, call.inputPath, call.outputPath, call.configurationPath);
}

namespace {

std::vector<Routine> MakeUnattendedRoutines() {
  std::vector<Routine> routines = {
      {"ConvertFile", ConvertFile},
      {"Replace", ReplaceRoutine},
      {"CoordConvert", CoordConvertRoutine},
  };
  for (const ToolRoutine& tool : ToolRoutines())
    if (tool.unattended) routines.push_back({tool.program, nullptr, &tool});
  return routines;
}

}  // namespace

bool RunShowingErrors(Ui& ui, const std::function<bool()>& routine) {
  try {
    return routine();
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
