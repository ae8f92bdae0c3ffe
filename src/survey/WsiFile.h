#pragma once
// Wisconsin Summary Index files (*.WSI): a header of tagged lines and groups
// of points printed as fixed-column tables. Always metric plane coordinates.

#include <istream>
#include <string>
#include <string_view>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

// Fills InputHeader and InputPoints when the whole file was read.
bool ReadWsiFile(Ui& ui, WorkArea& work, const std::string& path);
// The same from a stream; `path` is only used in messages.
bool ReadWsiFileStream(Ui& ui, WorkArea& work, std::istream& in, const std::string& path);

// Writes OutputHeader and OutputPoints; false (after a message) when refused.
bool WriteWsiFile(Ui& ui, WorkArea& work, const std::string& path);

// The last line of the CR LF-joined `text` that begins with `tag`: the whole
// line, or the line from its fourth character on. With `remove` every such
// line is taken out of `text`. An empty text or tag gives "".
std::string TakeTaggedLine(std::string& text, std::string_view tag, bool wholeLine, bool remove);
std::string TakeTaggedLine(CompactText& text, std::string_view tag, bool wholeLine, bool remove);

}  // namespace zv
