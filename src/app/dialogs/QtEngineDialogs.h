#pragma once
// The dialogs the engine opens, as Qt windows: the Coordinate Conversion
// dialog with its manual entry and results dialogs. Each is modal over the
// active window; a call from a worker thread is shown by the GUI thread
// while the worker waits.

#include "app/EngineDialogs.h"

namespace zv {

class QtEngineDialogs : public EngineDialogs {
 public:
  // The manual entry dialog shows its messages through `ui`.
  explicit QtEngineDialogs(Ui& ui) : ui_(ui) {}

  bool coordinateConversion(AppContext& ctx, ConversionState& state, bool presetInput) override;
  bool enterPoint(const ManualEntrySetup& setup, SurveyPoint& point) override;
  void showReport(const std::string& report) override;
  bool flexIn(AppContext& ctx, const std::string& path) override;
  bool flexOut(AppContext& ctx, const std::string& path) override;
  bool gridToLocal(AppContext& ctx, const std::string& input, const std::string& output,
                   const GridToLocalRunner& run) override;
  bool localToGrid(AppContext& ctx, const RecordedGridReference& recorded, const std::string& input,
                   const std::string& output, const LocalToGridRunner& run) override;

 private:
  Ui& ui_;
};

}  // namespace zv
