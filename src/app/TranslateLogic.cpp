#include "app/TranslateLogic.h"

#include <algorithm>
#include <cctype>
#include <cmath>
#include <filesystem>

#include "app/AppContext.h"
#include "app/FileTypes.h"
#include "platform/Error.h"
#include "platform/Strings.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

// Equal apart from letter case, or two names of one existing file (a
// relative and an absolute path, a link): writing the output must never
// replace the input.
bool SameFile(const std::string& a, const std::string& b) {
  if (EqualsNoCase(a, b)) return true;
  std::error_code ec;
  return std::filesystem::equivalent(a, b, ec) && !ec;
}

// Paths typed relative to the current folder are fixed when OK is pressed,
// so a routine that changes the current folder cannot redirect them.
std::string Absolute(const std::string& path) {
  if (path.empty()) return path;
  std::error_code ec;
  auto full = std::filesystem::absolute(path, ec);
  return ec ? path : full.string();
}

// "description|pattern" for a type name; "*.*" for user-defined files.
std::string TypeFilter(const std::string& typeName) {
  std::string pattern = typeName == kUserDefinedType ? "*.*" : TypePattern(typeName);
  return typeName + "|" + pattern;
}

}  // namespace

std::string ChoiceList::current() const {
  if (selected < 0 || static_cast<size_t>(selected) >= items.size()) return {};
  return items[static_cast<size_t>(selected)];
}

int ChoiceList::find(const std::string& item) const {
  auto it = std::find(items.begin(), items.end(), item);
  return it == items.end() ? -1 : static_cast<int>(it - items.begin());
}

void ChoiceList::clear() {
  items.clear();
  selected = -1;
}

void ChoiceList::fill(const std::string& queryResult) {
  clear();
  size_t start = 0;
  while (start < queryResult.size()) {
    size_t bar = queryResult.find('|', start);
    if (bar == std::string::npos) bar = queryResult.size();
    std::string piece = queryResult.substr(start, bar - start);
    if (!piece.empty() && find(piece) < 0) items.push_back(std::move(piece));
    start = bar + 1;
  }
}

TranslateLogic::TranslateLogic(AppContext& ctx) : ctx_(ctx) {}

std::string TranslateLogic::Caption() {
  return std::string(kAppTitle) + " - " + kVersionText;
}

bool TranslateLogic::load() {
  if (!ctx_.catalogue.load(ctx_.appFolder)) {
    ctx_.ui.critical("No valid translations were found!");
    return false;
  }
  inputTypes.fill(ctx_.catalogue.query("Input"));
  if (!inputTypes.items.empty()) selectInputType(0);
  const std::string last = ctx_.catalogue.readLastUsed(ctx_.appFolder);
  if (last.empty()) return true;
  const size_t bar1 = last.find('|');
  const size_t bar2 = last.find('|', bar1 + 1);
  int i = inputTypes.find(last.substr(0, bar1));
  if (i >= 0) selectInputType(i);
  i = outputTypes.find(last.substr(bar1 + 1, bar2 - bar1 - 1));
  if (i >= 0) selectOutputType(i);
  i = actions.find(last.substr(bar2 + 1));
  if (i >= 0) selectAction(i);
  return true;
}

void TranslateLogic::resetConfiguration() {
  configuration = {};
  storeDefault = false;
}

void TranslateLogic::selectInputType(int index) {
  inputTypes.selected = index;
  const std::string type = inputTypes.current();
  outputTypes.clear();
  actions.clear();
  resetConfiguration();
  output.enabled = false;
  input.enabled = true;
  const StartupSettings& s = ctx_.startup;
  input.text = DefaultPath(s.defaultInputFolder, s.fileStem, type);
  outputTypes.fill(ctx_.catalogue.query("Output", type));
  if (!outputTypes.items.empty()) selectOutputType(0);
  if (type == kManualEntryType) input = {};
}

void TranslateLogic::selectOutputType(int index) {
  outputTypes.selected = index;
  const std::string type = outputTypes.current();
  actions.clear();
  resetConfiguration();
  output.enabled = true;
  const StartupSettings& s = ctx_.startup;
  output.text = DefaultPath(s.defaultOutputFolder, s.fileStem, type);
  actions.fill(ctx_.catalogue.query("Action", inputTypes.current(), type));
  if (!actions.items.empty()) selectAction(0);
  if (type == kManualEntryType) output = {};
}

void TranslateLogic::selectAction(int index) {
  actions.selected = index;
  std::string config = ctx_.catalogue.query("ConfigFile", inputTypes.current(),
                                            outputTypes.current(), actions.current());
  configuration.enabled = !config.empty();
  configuration.text = config;
  storeDefault = !config.empty();
}

void TranslateLogic::browseInput() {
  auto path = ctx_.ui.chooseFile({FileDialogKind::Open,
                                  "Select the Input File:", TypeFilter(inputTypes.current()),
                                  ctx_.startup.defaultInputFolder});
  if (path) input.text = *path;
}

void TranslateLogic::browseOutput() {
  auto path = ctx_.ui.chooseFile({FileDialogKind::Save,
                                  "Output to File:", TypeFilter(outputTypes.current()),
                                  ctx_.startup.defaultOutputFolder});
  if (path) output.text = *path;
}

void TranslateLogic::browseConfiguration() {
  auto path =
      ctx_.ui.chooseFile({FileDialogKind::Open,
                          "Select a Configuration File:", "Translation/Filter Files (*.TRN)|*.trn",
                          ctx_.startup.configurationFolder});
  if (!path) return;
  configuration.text = *path;
  storeDefault = false;
}

void TranslateLogic::newConfiguration() {
  ctx_.ui.openEditor("", "Translation/Filter Files (*.TRN)", EditorMode::Editor);
}

void TranslateLogic::editConfiguration() {
  const std::string& path = configuration.text;
  if (!FileExists(path)) {
    ctx_.ui.exclaim("The file '" + path + "' does not exist.");
    return;
  }
  ctx_.ui.openEditor(path, "Translation/Filter File (*.TRN)", EditorMode::Editor);
}

void TranslateLogic::updateConfigFile(const std::string& path) {
  configuration.text = path;
}

void TranslateLogic::cancel() {
  ctx_.catalogue.writeLastUsed(ctx_.appFolder);
}

bool TranslateLogic::validate() {
  Ui& ui = ctx_.ui;
  if (inputTypes.selected < 0) {
    ui.exclaim("You must select an input type");
    return false;
  }
  if (input.enabled && input.text.empty()) {
    ui.exclaim("You must enter an input file location and name.");
    return false;
  }
  if (input.enabled && !FileExists(input.text)) {
    ui.exclaim("The specified input file does not exist.");
    return false;
  }
  if (outputTypes.selected < 0) {
    ui.exclaim("You must select an output type");
    return false;
  }
  if (output.enabled && output.text.empty()) {
    ui.exclaim("You must enter an output file location and name.");
    return false;
  }
  if (input.enabled && output.enabled && SameFile(input.text, output.text)) {
    ui.exclaim("The input and output files can not be the same.", "Incompatible Files");
    return false;
  }
  if (actions.selected < 0) {
    ui.exclaim("You must select an action type");
    return false;
  }
  if (configuration.enabled && !FileExists(configuration.text)) {
    ui.exclaim("The specified translation/filter file does not exist.");
    return false;
  }
  return true;
}

ConsolePlace ConsoleBelow(const WindowFrame& window) {
  constexpr int kConsoleWidth = 640;
  return {static_cast<int>(std::lround(window.left + window.width / 2.0)) - kConsoleWidth / 2,
          window.top + window.height};
}

RoutineCall TranslateLogic::makeCall() const {
  RoutineCall call;
  call.inputPath = input.enabled ? Absolute(input.text) : std::string();
  call.outputPath = output.enabled ? Absolute(output.text) : std::string();
  call.configurationPath = Absolute(configuration.text);
  call.inputType = inputTypes.current();
  call.outputType = outputTypes.current();
  call.action = actions.current();
  return call;
}

bool TranslateLogic::translate() {
  if (!validate()) return false;
  ctx_.work.ConversionOptionsActive = false;
  const RoutineCall call = makeCall();
  // The query also makes this definition the current one.
  const std::string program =
      ctx_.catalogue.query("Program", call.inputType, call.outputType, call.action);
  ctx_.ui.setBusy(true);
  bool done = false;
  if (const WindowRoutine* routine = FindWindowRoutine(program)) {
    WindowRun run{ctx_, call, storeDefault && configuration.enabled, runLong_,
                  frame_ ? ConsoleBelow(frame_()) : ConsolePlace{}};
    done = RunShowingErrors(ctx_.ui, [&] { return routine->run(run); });
  } else {
    ctx_.ui.setBusy(false);
    ctx_.ui.exclaim("Could not perform translation.");
  }
  ctx_.ui.setBusy(false);
  return done;
}

}  // namespace zv
