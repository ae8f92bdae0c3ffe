#pragma once
// The one context object of a run: the UI, the application folder, the work
// area, the start-up settings and the translation catalogue.

#include <string>

#include "app/Catalogue.h"
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

  // appFolder + "/" + relative
  std::string appPath(const std::string& relative) const { return appFolder + "/" + relative; }

  Ui& ui;
  std::string appFolder;
  WorkArea work;
  StartupSettings startup;
  Catalogue catalogue;
};

// The folder of the running executable.
std::string ExecutableFolder();

}  // namespace zv
