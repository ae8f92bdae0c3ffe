#pragma once
// Reader of NGS data sheet files (*.DS): one point with geographic
// coordinates per sheet. There is no writer for this format.

#include <istream>
#include <string>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

// Fills InputHeader and InputPoints when the whole file was read; shows its
// own messages and leaves the work area alone otherwise.
bool ReadNgsDataSheet(Ui& ui, WorkArea& work, const std::string& path);
// The same from a stream; `path` is only used in messages.
bool ReadNgsDataSheetStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path);

}  // namespace zv
