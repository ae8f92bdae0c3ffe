// VORN points-and-chains files (.PAC): computed points, tags XX, YY, ZZ,
// and a chain list.

#include "survey/SurveyFiles.h"
#include "survey/TaggedFile.h"

namespace zv {

namespace {

constexpr TagRule kPointsChainsRules[] = {
    {"XX", TagAction::Easting, ControlFlag::Clear},
    {"YY", TagAction::Northing, ControlFlag::Clear},
    {"ZZ", TagAction::Elevation, ControlFlag::Clear},
    {"XC", TagAction::Refuse},
    {"YC", TagAction::Refuse},
    {"ZC", TagAction::Refuse},
    {"CP", TagAction::Ignore},
    {"BG", TagAction::Ignore},
    {"EG", TagAction::EndChain},
    {"CD", TagAction::ChainDescription},
    {"FG", TagAction::ChainFG},
    {"PL", TagAction::ChainPointList},
    {"CH", TagAction::ChainLines},
};

constexpr TaggedFormat kPointsChainsFormat = {
    .name = "VORN Points and Chains File",
    .blankLineRule = "An VORN Points and Chains File can not contain blank lines.",
    .coordinateRule = "An VORN Points and Chains File can not contain control coordinates.",
    .fieldErrorsAsLineRule = false,
    .hasChains = true,
    .projectSectionKeepsPoint = false,
    .pointRecordCodes = false,
    .rules = kPointsChainsRules,
    .pointOpening = "AC:PD",
    .coordinates = CoordinateTags::Computed,
    .writesGeometry = true,
};

}  // namespace

bool ReadPointsChainsFile(Ui& ui, WorkArea& work, const std::string& path) {
  return ReadTaggedFile(ui, work, path, kPointsChainsFormat);
}

bool ReadPointsChainsStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path) {
  return ReadTaggedStream(ui, work, in, path, kPointsChainsFormat);
}

bool WritePointsChainsFile(Ui& ui, WorkArea& work, const std::string& path) {
  return WriteTaggedFile(ui, work, path, kPointsChainsFormat);
}

}  // namespace zv
