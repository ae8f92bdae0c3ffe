#pragma once
// Readers and writers of the VORN tagged formats. A reader fills the input
// side of the work area only when it succeeds; a writer writes the output
// side. Both show their own messages and return true on success.

#include <fstream>
#include <istream>
#include <string>
#include <string_view>
#include <vector>

#include "platform/Ui.h"
#include "survey/SurveyIo.h"
#include "survey/SurveyModel.h"

namespace zv {

bool ReadControlFile(Ui& ui, WorkArea& work, const std::string& path);
bool WriteControlFile(Ui& ui, WorkArea& work, const std::string& path);

bool ReadPointsChainsFile(Ui& ui, WorkArea& work, const std::string& path);
bool WritePointsChainsFile(Ui& ui, WorkArea& work, const std::string& path);

bool ReadProjectFile(Ui& ui, WorkArea& work, const std::string& path);
bool WriteProjectFile(Ui& ui, WorkArea& work, const std::string& path);

// Stream forms used by the file forms above, by tests and by fuzzers; `path`
// is only used in messages.
bool ReadControlStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path);
bool ReadPointsChainsStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path);
bool ReadProjectStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path);

}  // namespace zv
