// VORN project files (.PRJ, .EDI, .CAL): control and computed coordinates,
// a record code per point, and a chain list.

#include "survey/SurveyFiles.h"
#include "survey/TaggedFile.h"

namespace zv {

namespace {

constexpr TagRule kProjectRules[] = {
    {"XC", TagAction::Easting, ControlFlag::Set},
    {"YC", TagAction::Northing, ControlFlag::Set},
    {"ZC", TagAction::Elevation, ControlFlag::Set},
    {"XX", TagAction::Easting},
    {"YY", TagAction::Northing},
    {"ZZ", TagAction::Elevation},
    {"CP", TagAction::Ignore},
    {"BG", TagAction::Ignore},
    {"EG", TagAction::EndChain},
    {"CD", TagAction::ChainDescription},
    {"FG", TagAction::ChainFG},
    {"PL", TagAction::ChainPointList},
    {"CH", TagAction::ChainLines},
};

constexpr TaggedFormat kProjectFormat = {
    .name = "VORN File",
    .blankLineRule = "An VORN Points and Chains File can not contain blank lines.",
    .coordinateRule = "",
    .fieldErrorsAsLineRule = false,
    .hasChains = true,
    .projectSectionKeepsPoint = false,
    .pointRecordCodes = true,
    .rules = kProjectRules,
    .pointOpening = "",
    .coordinates = CoordinateTags::ByFlags,
    .writesGeometry = true,
};

}  // namespace

bool ReadProjectFile(Ui& ui, WorkArea& work, const std::string& path) {
  return ReadTaggedFile(ui, work, path, kProjectFormat);
}

bool ReadProjectStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path) {
  return ReadTaggedStream(ui, work, in, path, kProjectFormat);
}

bool WriteProjectFile(Ui& ui, WorkArea& work, const std::string& path) {
  return WriteTaggedFile(ui, work, path, kProjectFormat);
}

}  // namespace zv
