#include "app/WindowRoutines.h"

#include <filesystem>
#include <vector>

#include "app/AppContext.h"
#include "app/ToolJobs.h"
#include "platform/TextIo.h"
#include "tools/Localization.h"
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

// The Coordinate Conversion dialog asks for the point, converts it and
// shows the report; no completion message follows.
bool RunSinglePoint(WindowRun& run) {
  ConversionState& state = run.ctx.conversion;
  state.singlePoint = true;
  state.accepted = false;
  state.points.assign(1, SurveyPoint{});
  run.ctx.ui.setBusy(false);
  return run.ctx.dialogs->coordinateConversion(run.ctx, state, /*presetInput=*/false);
}

bool RunMultiPoint(WindowRun& run) {
  if (!RunLong(run, [&] { return ReadForReprojection(run.ctx, run.call); })) return false;
  run.ctx.ui.setBusy(false);
  run.ctx.dialogs->coordinateConversion(run.ctx, run.ctx.conversion, /*presetInput=*/true);
  run.ctx.ui.setBusy(true);
  if (!RunLong(run, [&] { return WriteReprojection(run.ctx, run.call); })) return false;
  Complete(run, kTranslationComplete, kAppTitle);
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

// The tools' console opens centred below the window.
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
bool RunTool(WindowRun& run, const ToolRoutine& tool) {
  if (tool.configuration && !CheckConfiguration(run)) return false;
  ToolAnswers answers;
  if (!AskToolQuestion(run.ctx.ui, tool, answers)) return false;
  const ToolPlace place = PlaceOf(run);
  if (!RunLong(run, [&] { return tool.job(run.ctx.ui, run.call, answers, place); })) return false;
  const std::string report = ToolReportPath(tool, place);
  switch (tool.report) {
    case ToolReport::None:
      Complete(run, kTranslationComplete, kAppTitle);
      return true;
    case ToolReport::NoMatchCodes:
      if (!FileExists(report)) {
        Complete(run, kTranslationComplete, kAppTitle);
        return true;
      }
      run.ctx.ui.setBusy(false);
      run.ctx.ui.inform(kNoMatchText);
      ShowAndDeleteReport(run.ctx.ui, report, ToolReportType(tool));
      return true;
    case ToolReport::FreePointNumbers:
      if (!FileExists(report)) {
        run.ctx.ui.setBusy(false);
        run.ctx.ui.inform("The Translation appears to have failed.");
        return false;
      }
      Complete(run, kTranslationComplete, kAppTitle);
      ShowAndDeleteReport(run.ctx.ui, report, ToolReportType(tool));
      return true;
  }
  return false;
}

// "Local.EXE": the file's direction and its dialog, whose OK writes the
// tool's job and runs it; then the tool's report and the output. A run that
// fails removes the empty output made for the tool.
bool RunLocalize(WindowRun& run) {
  Ui& ui = run.ctx.ui;
  const std::string& output = run.call.outputPath;
  const bool existed = FileExists(output);
  auto checked = [&](bool done) {
    std::error_code ec;
    if (!done && !existed && std::filesystem::file_size(output, ec) == 0) {
      std::filesystem::remove(output, ec);
    }
    return done;
  };
  auto place = [&](int left, int top) { return PintrelPlace(run.ctx.appFolder, left, top); };
  const GridToLocalRunner toLocal = [&](const GridToLocalRequest& r) {
    const ToolPlace p = place(r.consoleLeft, r.consoleTop);
    return checked(LocalGridToLocalJob(ui, r.input, r.output, r.mode, r.modeText, p) &&
                   LocalRunChecked(ui, p, r.input, r.output));
  };
  const LocalToGridRunner toGrid = [&](const LocalToGridRequest& r) {
    const ToolPlace p = place(r.consoleLeft, r.consoleTop);
    return checked(
        LocalLocalToGridJob(ui, r.input, r.output, r.datumYear, r.zoneCode, r.factor, p) &&
        LocalRunChecked(ui, p, r.input, r.output));
  };
  EngineDialogs& dialogs = *run.ctx.dialogs;
  const LocalizeDialogs localize{
      [&](const std::string& in, const std::string& out) {
        return dialogs.gridToLocal(run.ctx, in, out, toLocal);
      },
      [&](const RecordedGridReference& recorded, const std::string& in, const std::string& out) {
        return dialogs.localToGrid(run.ctx, recorded, in, out, toGrid);
      }};
  ui.setBusy(false);
  const bool done = Localize(ui, run.call.inputPath, output, localize);
  const std::string report = LatLongReportPath(place(0, 0));
  if (FileExists(report)) ShowAndDeleteReport(ui, report, "Out File (*.OUT)");
  if (done) ViewOutput(run);
  return done;
}

std::vector<WindowRoutine> MakeWindowRoutines() {
  std::vector<WindowRoutine> routines = {
      {"ConvertFile", RunConvertFile}, {"Replace", RunReplace},    {"SinglePoint", RunSinglePoint},
      {"MultiPoint", RunMultiPoint},   {"Local.EXE", RunLocalize},
  };
  for (const ToolRoutine& tool : ToolRoutines()) routines.push_back({tool.program, nullptr, &tool});
  return routines;
}

}  // namespace

bool WindowRoutine::run(WindowRun& r) const {
  return tool ? RunTool(r, *tool) : fn(r);
}

const WindowRoutine* FindWindowRoutine(std::string_view program) {
  static const std::vector<WindowRoutine> kRoutines = MakeWindowRoutines();
  for (const auto& r : kRoutines)
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
