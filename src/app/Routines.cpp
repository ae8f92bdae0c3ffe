#include "app/Routines.h"

#include "app/AppContext.h"
#include "app/FileTypes.h"
#include "app/ToolJobs.h"
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

// clang-format off
constexpr Routine kUnattended[] = {
    {"ConvertFile", ConvertFile},
    {"Replace", ReplaceRoutine},
    {"CoordConvert", CoordConvertRoutine},
    {"CONVERT.EXE", ConvertToolRoutine},
    {"PCPT2PI.EXE", Pcpt2PiToolRoutine},
    {"PI2PCPT.EXE", Pi2PcptToolRoutine},
    {"EXTRACT.EXE", ExtractToolRoutine},
    {"LLEV.EXE", LlevToolRoutine},
    {"SORT.EXE", SortToolRoutine},
};
// clang-format on

}  // namespace

std::span<const Routine> UnattendedRoutines() {
  return kUnattended;
}

const Routine* FindUnattendedRoutine(std::string_view program) {
  for (const auto& r : kUnattended)
    if (r.program == program) return &r;
  return nullptr;
}

}  // namespace zv
