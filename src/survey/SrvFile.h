#pragma once
// CAiCE SRV files (*.SRV): blank-separated point lines, chains as BEGIN ...
// END blocks and header values in "#" comment lines.

#include <istream>
#include <string>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

// Fills InputHeader, InputPoints and InputChains when the whole file was read.
bool ReadSrvFile(Ui& ui, WorkArea& work, const std::string& path);
// The same from a stream; `path` is only used in messages.
bool ReadSrvFileStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path);

// Writes OutputHeader, OutputPoints and OutputChains; false (after a message)
// when refused.
bool WriteSrvFile(Ui& ui, WorkArea& work, const std::string& path);

// The point line of `point` with its lengths converted to `outputUnit` (and
// stored back), or "" when the point has already been written.
std::string SrvPointLine(SurveyPoint& point, const std::string& outputUnit);

}  // namespace zv
