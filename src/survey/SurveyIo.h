#pragma once
// What every survey reader and writer shares around its file: opening the
// input, the write-failure message and the one warning about points a
// writer had to change.

#include <fstream>
#include <string>
#include <string_view>
#include <vector>

#include "platform/Ui.h"

namespace zv {

// The readers take UTF-8 or ANSI text: a UTF-16 file is refused by name
// (before its NUL bytes are taken for binary data). True when refused.
bool RefuseUtf16(Ui& ui, const std::string& path);

// Opens an input file; a missing file shows "File Not Found", one that cannot
// be opened "File Not Read", a UTF-16 one is refused. False after the message.
bool OpenSurveyInput(Ui& ui, const std::string& path, std::ifstream& in);

// The message a reader shows when its input cannot be read.
void ReportReadFailure(Ui& ui, const std::string& path, const std::string& reason);

// The message a writer shows when its output cannot be written.
void ReportWriteFailure(Ui& ui, const std::string& path, const std::string& reason);

// "VR:" and the program's name and version, the version line of written files.
std::string VersionLine();

// The points a writer had to change to fit its format, by reason; shown as
// one "Check Output File" warning once the file is written.
class OutputNotes {
 public:
  // `reason` completes "n point(s) ...", e.g. "were taken as metres".
  void add(std::string_view reason, const std::string& pointName);
  bool empty() const { return notes_.empty(); }
  void show(Ui& ui, const std::string& path) const;

 private:
  struct Note {
    std::string reason;
    size_t count = 0;
    std::vector<std::string> names;  // the first few
  };
  std::vector<Note> notes_;
};

}  // namespace zv
