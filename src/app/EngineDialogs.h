#pragma once
// The dialogs the engine opens (the Coordinate Conversion dialog with its
// manual entry and results dialogs), behind one interface carried in the
// application context: Qt dialogs in the window, a console version without a
// display, scripted ones in tests.

#include <iosfwd>
#include <string>

#include "geodesy/ConversionDriver.h"
#include "geodesy/ConversionForm.h"
#include "survey/SurveyModel.h"
#include "tools/Localization.h"

namespace zv {

struct AppContext;

class EngineDialogs {
 public:
  virtual ~EngineDialogs() = default;
  // The Coordinate Conversion dialog, modal, over the conversion points of
  // `state`; with presetInput the input side of state.settings fills the
  // dialog's input side. Its OK converts the points (a single-point run asks
  // for the point first and shows the report). Returns the accepted flag.
  virtual bool coordinateConversion(AppContext& ctx, ConversionState& state, bool presetInput) = 0;
  // The manual entry dialog; false when cancelled or closed.
  virtual bool enterPoint(const ManualEntrySetup& setup, SurveyPoint& point) = 0;
  // The results dialog with the report text, modal.
  virtual void showReport(const std::string& report) = 0;
  // The FlexIn dialog over the input file: true when its OK read the file
  // into the input side. Without a display it says so and fails.
  virtual bool flexIn(AppContext& ctx, const std::string& path);
  // The FlexOut dialog over the output file (the output side filled): true
  // when its OK wrote the file. Without a display it says so and fails.
  virtual bool flexOut(AppContext& ctx, const std::string& path);
  // The grid-to-local and local-to-grid dialogs, modal; their OK runs the
  // localization tool through `run`. True when a run succeeded. Without a
  // display they say so and fail.
  virtual bool gridToLocal(AppContext& ctx, const std::string& input, const std::string& output,
                           const GridToLocalRunner& run);
  virtual bool localToGrid(AppContext& ctx, const RecordedGridReference& recorded,
                           const std::string& input, const std::string& output,
                           const LocalToGridRunner& run);
};

// Without a display: the dialogs that need one say so and fail; a report is
// written to the output stream.
class ConsoleDialogs : public EngineDialogs {
 public:
  explicit ConsoleDialogs(std::ostream& out) : out_(out) {}
  bool coordinateConversion(AppContext& ctx, ConversionState& state, bool presetInput) override;
  bool enterPoint(const ManualEntrySetup& setup, SurveyPoint& point) override;
  void showReport(const std::string& report) override;

 private:
  std::ostream& out_;
};

}  // namespace zv
