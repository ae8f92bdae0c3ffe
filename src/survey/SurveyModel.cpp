#include "survey/SurveyModel.h"

namespace zv {

void ResetPoint(SurveyPoint& point) {
  std::string recordCode = std::move(point.RecordCode);
  std::string text33 = std::move(point.Text33);
  point = SurveyPoint{};
  point.RecordCode = std::move(recordCode);
  point.Text33 = std::move(text33);
}

void StartChain(SurveyChain& chain) {
  chain.FeatureCode.clear();
  chain.Description.clear();
  chain.FGText.clear();
  chain.PointListLines.clear();
  chain.ChainLines.clear();
  chain.ExtraLines.clear();
  chain.Station.clear();
  chain.Open = true;
}

void WorkArea::clearInput() {
  InputHeader = FileHeader{};
  InputPoints.clear();
  InputPoints.shrink_to_fit();
  InputChains.clear();
  InputChains.shrink_to_fit();
}

void WorkArea::copyInputToOutput(bool moveInput) {
  OutputHeader = InputHeader;
  if (moveInput) {
    OutputPoints = std::move(InputPoints);
    OutputChains = std::move(InputChains);
    InputPoints.clear();
    InputChains.clear();
  } else {
    OutputPoints = InputPoints;
    OutputChains = InputChains;
  }
}

void AppendLine(std::string& field, std::string_view line) {
  if (!field.empty()) field += "\r\n";
  field.append(line);
}

}  // namespace zv
