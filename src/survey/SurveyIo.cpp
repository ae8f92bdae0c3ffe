#include "survey/SurveyIo.h"

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "Version.h"
#include "platform/TextIo.h"

namespace zv {

namespace {
constexpr std::string_view kCrLf = "\r\n";
}  // namespace

void ReportReadFailure(Ui& ui, const std::string& path, const std::string& reason) {
  ui.message("The file '" + path + "' could not be read." + std::string(kCrLf) + reason,
             Icon::Exclamation, Buttons::Ok, "File Not Read");
}

bool RefuseUtf16(Ui& ui, const std::string& path) {
  if (!IsUtf16File(path)) return false;
  ui.exclaim(Utf16Refusal(path), kUtf16Title);
  return true;
}

bool OpenSurveyInput(Ui& ui, const std::string& path, std::ifstream& in) {
  if (!FileExists(path)) {
    ui.message("The file '" + path + "' can not be found.", Icon::Exclamation, Buttons::Ok,
               "File Not Found");
    return false;
  }
  in.open(path, std::ios::binary);
  if (!in) {
    ReportReadFailure(ui, path, std::strerror(errno));
    return false;
  }
  return !RefuseUtf16(ui, path);
}

void ReportWriteFailure(Ui& ui, const std::string& path, const std::string& reason) {
  ui.message("The file '" + path + "' could not be written." + std::string(kCrLf) + reason,
             Icon::Exclamation, Buttons::Ok, "File Not Written");
}

void OutputNotes::add(std::string_view reason, const std::string& pointName) {
  auto note =
      std::find_if(notes_.begin(), notes_.end(), [&](const Note& n) { return n.reason == reason; });
  if (note == notes_.end()) note = notes_.insert(notes_.end(), Note{std::string(reason), 0, {}});
  if (note->names.size() < 5) note->names.push_back(pointName);
  ++note->count;
}

void OutputNotes::show(Ui& ui, const std::string& path) const {
  if (notes_.empty()) return;
  std::string text = "The file '" + path + "' was written, but:";
  for (const Note& n : notes_) {
    text += std::string(kCrLf) + std::to_string(n.count) + " point(s) " + n.reason + ": ";
    for (size_t i = 0; i < n.names.size(); ++i) {
      if (i > 0) text += ", ";
      text += "'" + n.names[i] + "'";
    }
    text += n.count > n.names.size() ? ", ..." : ".";
  }
  ui.exclaim(text, "Check Output File");
}

std::string VersionLine() {
  return std::string("VR:") + kTitleAndVersion;
}

}  // namespace zv
