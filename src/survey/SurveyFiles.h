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

// Opens an input file; a missing file shows "File Not Found", one that cannot
// be opened "File Not Read". False after either message.
bool OpenSurveyInput(Ui& ui, const std::string& path, std::ifstream& in);

// The message a writer shows when its output cannot be written.
void ReportWriteFailure(Ui& ui, const std::string& path, const std::string& reason);

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
