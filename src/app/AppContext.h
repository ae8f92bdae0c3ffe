#pragma once
// The one context object of a run: the UI, the dialogs the engine opens, the
// per-user settings, the application folder, the work area, the start-up
// settings and the translation catalogue.

#include <iostream>
#include <string>

#include "app/Catalogue.h"
#include "app/EngineDialogs.h"
#include "platform/Settings.h"
#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

struct StartupSettings {
  bool viewOutput = false;
  std::string defaultInputFolder;
  std::string defaultOutputFolder;
  std::string configurationFolder;
  std::string fileStem;
};

struct AppContext {
  AppContext(Ui& ui, std::string appFolder) : ui(ui), appFolder(std::move(appFolder)) {}
  AppContext(const AppContext&) = delete;
  AppContext& operator=(const AppContext&) = delete;

  // appFolder + "/" + relative
  std::string appPath(const std::string& relative) const { return appFolder + "/" + relative; }

  Ui& ui;
  // The defaults keep settings for the run only and have no windows; the
  // window and the tests set their own.
  MemorySettings runSettings;
  ConsoleDialogs consoleDialogs{std::cout};
  SettingsStore* settings = &runSettings;
  EngineDialogs* dialogs = &consoleDialogs;
  std::string appFolder;
  WorkArea work;
  StartupSettings startup;
  Catalogue catalogue;
  // The conversion points and settings: they keep the last run's until the
  // next run replaces them.
  ConversionState conversion;
};

// The folder of the running executable.
std::string ExecutableFolder();

}  // namespace zv
