#include "app/WindowRoutines.h"

#include "app/AppContext.h"
#include "platform/TextIo.h"
#include "tools/SearchReplace.h"

namespace zv {

namespace {

bool RunLong(WindowRun& run, const std::function<bool()>& work) {
  return run.runLong ? run.runLong(work) : work();
}

// The normal pointer comes back before the last message.
void Complete(WindowRun& run, const std::string& text, const std::string& title) {
  run.ctx.ui.setBusy(false);
  run.ctx.ui.inform(text, title);
  ViewOutput(run);
}

bool RunConvertFile(WindowRun& run) {
  if (!RunLong(run, [&] { return ConvertFile(run.ctx, run.call); })) return false;
  Complete(run, "Conversion Complete.", "Conversion Complete");
  return true;
}

bool RunReplace(WindowRun& run) {
  if (!CheckConfiguration(run)) return false;
  const RoutineCall& c = run.call;
  if (!RunLong(run, [&] {
        return SearchAndReplace(run.ctx.ui, c.inputPath, c.outputPath, c.configurationPath);
      })) {
    return false;
  }
  Complete(run, "Translation Complete.", kAppTitle);
  return true;
}

constexpr WindowRoutine kWindowRoutines[] = {
    {"ConvertFile", RunConvertFile},
    {"Replace", RunReplace},
};

}  // namespace

std::span<const WindowRoutine> WindowRoutines() {
  return kWindowRoutines;
}

const WindowRoutine* FindWindowRoutine(std::string_view program) {
  for (const auto& r : kWindowRoutines)
    if (r.program == program) return &r;
  return nullptr;
}

bool CheckConfiguration(WindowRun& run) {
  const std::string& path = run.call.configurationPath;
  if (path.empty()) {
    run.ctx.ui.setBusy(false);
    run.ctx.ui.exclaim("You must specify a configuration file to use for this translation.");
    return false;
  }
  if (!FileExists(path)) {
    run.ctx.ui.setBusy(false);
    run.ctx.ui.exclaim("The specified configuration file does not exist.");
    return false;
  }
  if (run.storeDefaultConfiguration && !run.ctx.catalogue.updateDefaultConfiguration(path)) {
    // The translation itself can still run; the user learns that the default stayed.
    const TranslationDefinition* def = run.ctx.catalogue.current();
    run.ctx.ui.exclaim("The default configuration file could not be stored in '" +
                       (def ? def->DefinitionPath : std::string()) + "'.");
  }
  return true;
}

void ViewOutput(WindowRun& run) {
  if (run.ctx.startup.viewOutput && FileExists(run.call.outputPath)) {
    run.ctx.ui.openEditor(run.call.outputPath, run.call.outputType, EditorMode::Viewer);
  }
}

}  // namespace zv
