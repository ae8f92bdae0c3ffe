#pragma once
// What the Translate window does, without widgets: the three cascading lists,
// the location groups and their enabling, the browse buttons, the checks of
// OK in their order and the dispatch on the definition's Program. The window
// binds its controls to this state and calls these operations.

#include <functional>
#include <string>
#include <vector>

#include "app/WindowRoutines.h"

namespace zv {

struct AppContext;

// The type that stands for points typed by hand: it has no file.
inline constexpr const char* kManualEntryType = "Coordinate Conversion Manual Entry";

// A drop-down list: its entries and the selected index (-1: none).
struct ChoiceList {
  std::vector<std::string> items;
  int selected = -1;

  // The selected entry; "" when none.
  std::string current() const;
  int find(const std::string& item) const;
  void clear();
  // Fills the list from a query result: the pieces between "|" in order,
  // without empty entries and without entries equal to an earlier one.
  void fill(const std::string& queryResult);
};

// Where a window stands on the screen, in pixels.
struct WindowFrame {
  int left = 0, top = 0, width = 0, height = 0;
};

// The 640-pixel-wide tool console, centred below the window.
ConsolePlace ConsoleBelow(const WindowFrame& window);

// A label, a path box and its buttons, enabled or disabled as a whole.
struct LocationGroup {
  bool enabled = false;
  std::string text;
};

class TranslateLogic {
 public:
  explicit TranslateLogic(AppContext& ctx);

  // Loads the catalogue, fills the input list and selects the last-used
  // definition. False (after "No valid translations were found!") when
  // there is no definition.
  bool load();
  // "VORN Zurevazidu - major.minor.revision"
  static std::string Caption();

  // Selecting an entry cascades to the lists below it.
  void selectInputType(int index);
  void selectOutputType(int index);
  void selectAction(int index);

  void browseInput();
  void browseOutput();
  void browseConfiguration();
  void newConfiguration();
  void editConfiguration();
  // Puts a configuration file into the path box (TRfrm_UpdateConfigFile).
  void updateConfigFile(const std::string& path);

  // OK: checks the choices, then runs the definition's routine. True when
  // the routine did its job.
  bool translate();
  // Cancel: records the last-used definition.
  void cancel();

  // How the long part of a routine runs (inline when not set).
  void setLongRunner(LongRunner runner) { runLong_ = std::move(runner); }
  // Where the window stands, asked at every OK (for the tool console).
  void setFrameSource(std::function<WindowFrame()> source) { frame_ = std::move(source); }

  ChoiceList inputTypes, outputTypes, actions;
  LocationGroup input, output, configuration;
  bool storeDefault = false;  // chkActionDefault; enabled with the configuration group

  // The translation as the controls now describe it (paths made absolute).
  RoutineCall makeCall() const;

 private:
  bool validate();
  void resetConfiguration();

  AppContext& ctx_;
  LongRunner runLong_;
  std::function<WindowFrame()> frame_;
};

}  // namespace zv
