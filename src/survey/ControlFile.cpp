// VORN control files (.CTL): control points, tags XC, YC, ZC; no chains.

#include "survey/SurveyFiles.h"
#include "survey/TaggedFile.h"

namespace zv {

namespace {

constexpr TagRule kControlRules[] = {
    {"XC", TagAction::Easting, ControlFlag::Set},
    {"YC", TagAction::Northing, ControlFlag::Set},
    {"ZC", TagAction::Elevation, ControlFlag::Set},
    {"XX", TagAction::Refuse},
    {"YY", TagAction::Refuse},
    {"ZZ", TagAction::Refuse},
};

constexpr TaggedFormat kControlFormat = {
    .name = "VORN Control File",
    .blankLineRule = "An VORN Control File can not contain blank lines.",
    .coordinateRule = "An VORN Control File can not contain computed coordinates.",
    .fieldErrorsAsLineRule = true,
    .hasChains = false,
    .projectSectionKeepsPoint = true,
    .pointRecordCodes = false,
    .rules = kControlRules,
    .pointOpening = "AC:OS",
    .coordinates = CoordinateTags::Control,
    .writesGeometry = false,
};

}  // namespace

bool ReadControlFile(Ui& ui, WorkArea& work, const std::string& path) {
  return ReadTaggedFile(ui, work, path, kControlFormat);
}

bool ReadControlStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path) {
  return ReadTaggedStream(ui, work, in, path, kControlFormat);
}

bool WriteControlFile(Ui& ui, WorkArea& work, const std::string& path) {
  return WriteTaggedFile(ui, work, path, kControlFormat);
}

}  // namespace zv
