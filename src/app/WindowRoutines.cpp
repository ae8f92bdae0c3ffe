#include "app/WindowRoutines.h"

#include <filesystem>

#include "app/AppContext.h"
#include "app/ToolJobs.h"
#include "platform/TextIo.h"
#include "tools/SearchReplace.h"

namespace zv {

namespace {

constexpr const char* kTranslationComplete = "Translation Complete.";

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
  Complete(run, kTranslationComplete, kAppTitle);
  return true;
}

// The window has no console position of its own yet: tools open at 0, 0.
ToolPlace PlaceOf(const WindowRun& run) {
  return PintrelPlace(run.ctx.appFolder, run.console.left, run.console.top);
}

// A tool's report in a viewer window, then deleted. A report no window
// could show stays for the user to find.
void ShowAndDeleteReport(Ui& ui, const std::string& path, const std::string& type) {
  if (!ui.openEditor(path, type, EditorMode::Viewer)) return;
  std::error_code ec;
  std::filesystem::remove(path, ec);
}

// A tool failing to run has shown its own message; no completion follows.
bool RunConvertTool(WindowRun& run) {
  if (!CheckConfiguration(run)) return false;
  const RoutineCall& c = run.call;
  const ToolPlace place = PlaceOf(run);
  if (!RunLong(run, [&] {
        return ConvertToolJob(run.ctx.ui, c.inputPath, c.outputPath, c.configurationPath, place);
      })) {
    return false;
  }
  const std::string report = ConvertReportPath(place);
  if (FileExists(report)) {
    run.ctx.ui.setBusy(false);
    run.ctx.ui.inform(kNoMatchText);
    ShowAndDeleteReport(run.ctx.ui, report, "Out File (*.OUT)");
  } else {
    Complete(run, kTranslationComplete, kAppTitle);
  }
  return true;
}

using TwoPathToolJob = bool (*)(Ui&, const std::string&, const std::string&, const ToolPlace&);

template <TwoPathToolJob job>
bool RunTwoPathTool(WindowRun& run) {
  const RoutineCall& c = run.call;
  if (!RunLong(run, [&] { return job(run.ctx.ui, c.inputPath, c.outputPath, PlaceOf(run)); })) {
    return false;
  }
  Complete(run, kTranslationComplete, kAppTitle);
  return true;
}

bool RunExtractTool(WindowRun& run) {
  if (!CheckConfiguration(run)) return false;
  const bool anyMatch = AskAnyMatch(run.ctx.ui);
  const RoutineCall& c = run.call;
  if (!RunLong(run, [&] {
        return ExtractToolJob(run.ctx.ui, c.inputPath, c.outputPath, c.configurationPath, anyMatch,
                              PlaceOf(run));
      })) {
    return false;
  }
  Complete(run, kTranslationComplete, kAppTitle);
  return true;
}

bool RunLlevTool(WindowRun& run) {
  const std::optional<double> limit = AskLlevLimit(run.ctx.ui);
  if (!limit) return false;
  const RoutineCall& c = run.call;
  if (!RunLong(run, [&] {
        return LlevToolJob(run.ctx.ui, c.inputPath, c.outputPath, *limit, PlaceOf(run));
      })) {
    return false;
  }
  Complete(run, kTranslationComplete, kAppTitle);
  return true;
}

bool RunSortTool(WindowRun& run) {
  const RoutineCall& c = run.call;
  const ToolPlace place = PlaceOf(run);
  if (!RunLong(run, [&] { return SortToolJob(run.ctx.ui, c.inputPath, c.outputPath, place); })) {
    return false;
  }
  const std::string report = SortReportPath(place);
  if (!FileExists(report)) {
    run.ctx.ui.setBusy(false);
    run.ctx.ui.inform("The Translation appears to have failed.");
    return false;
  }
  Complete(run, kTranslationComplete, kAppTitle);
  ShowAndDeleteReport(run.ctx.ui, report, "Available Point Numbers");
  return true;
}

constexpr WindowRoutine kWindowRoutines[] = {
    {"CONVERT.EXE", RunConvertTool},
    {"PCPT2PI.EXE", RunTwoPathTool<Pcpt2PiToolJob>},
    {"PI2PCPT.EXE", RunTwoPathTool<Pi2PcptToolJob>},
    {"EXTRACT.EXE", RunExtractTool},
    {"LLEV.EXE", RunLlevTool},
    {"SORT.EXE", RunSortTool},
    {"CTL2ARE.EXE", RunTwoPathTool<Ctl2AreToolJob>},
    {"ALI2FLA.EXE", RunTwoPathTool<Ali2FlaToolJob>},
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
