#include "app/FileTypes.h"

#include "app/AppContext.h"
#include "survey/NgsDataSheet.h"
#include "survey/SrvFile.h"
#include "survey/SurveyFiles.h"
#include "survey/WsiFile.h"

namespace zv {

namespace {

template <bool (*Fn)(Ui&, WorkArea&, const std::string&)>
bool Adapt(AppContext& ctx, const std::string& path) {
  return Fn(ctx.ui, ctx.work, path);
}

// User-defined files are read and written through the FlexIn and FlexOut
// dialogs (an unattended run resolves the format itself, see Routines).
bool ReadThroughFlexDialog(AppContext& ctx, const std::string& path) {
  return ctx.dialogs->flexIn(ctx, path);
}

bool WriteThroughFlexDialog(AppContext& ctx, const std::string& path) {
  return ctx.dialogs->flexOut(ctx, path);
}

constexpr FileType kTypes[] = {
    {"NGS Data Sheets (*.DS)", Adapt<ReadNgsDataSheet>, nullptr, nullptr},
    {"VORN Control Files (*.CTL)", Adapt<ReadControlFile>, Adapt<WriteControlFile>,
     Adapt<WriteControlFile>},
    {"VORN Project Files (*.PRJ)", Adapt<ReadProjectFile>, nullptr, Adapt<WriteProjectFile>},
    {"VORN Edited Project Files (*.EDI)", Adapt<ReadProjectFile>, nullptr, Adapt<WriteProjectFile>},
    {"VORN Calculated Files (*.CAL)", Adapt<ReadProjectFile>, nullptr, Adapt<WriteProjectFile>},
    {"VORN Points and Chains Files (*.PAC)", Adapt<ReadPointsChainsFile>,
     Adapt<WritePointsChainsFile>, Adapt<WritePointsChainsFile>},
    {"Wisconsin Summary Index Files (*.WSI)", Adapt<ReadWsiFile>, Adapt<WriteWsiFile>,
     Adapt<WriteWsiFile>},
    {"CAiCE SRV Files (*.SRV)", Adapt<ReadSrvFile>, Adapt<WriteSrvFile>, Adapt<WriteSrvFile>},
    {kUserDefinedType, ReadThroughFlexDialog, WriteThroughFlexDialog, nullptr},
};

}  // namespace

std::span<const FileType> FileTypes() {
  return kTypes;
}

const FileType* FindFileType(std::string_view name) {
  for (const auto& t : kTypes)
    if (t.name == name) return &t;
  return nullptr;
}

std::string TypePattern(std::string_view name) {
  size_t open = name.find('(');
  size_t close = name.find(')', open == std::string_view::npos ? 0 : open);
  if (open == std::string_view::npos || close == std::string_view::npos) return {};
  return std::string(name.substr(open + 1, close - open - 1));
}

}  // namespace zv
