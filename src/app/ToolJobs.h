#pragma once
// The external survey tools of the Pintrel folder. None takes arguments:
// each reads a job file TRANS.JOB in its working folder. A tool job writes
// that file, runs the tool and waits for it, then removes the file.
//
// Every job first checks that the tool is there: a missing tool, or one that
// cannot be started, is reported by name and the job returns false. Errors
// creating the empty output file or the job file are reported the same way.

#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "app/Routines.h"
#include "platform/Ui.h"

namespace zv {

struct AppContext;

// Where a tool runs: its folder, the folder of its job file and the console
// window position.
struct ToolPlace {
  std::string toolFolder;
  std::string jobFolder;
  int left = 0;
  int top = 0;
};

// Tool and job folder appFolder + "/Pintrel".
ToolPlace PintrelPlace(const std::string& appFolder, int left = 0, int top = 0);

inline constexpr const char* kJobFileName = "TRANS.JOB";

// The tool jobs; true when the tool ran (whatever it did).
bool ConvertToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const std::string& configuration, const ToolPlace& place);
bool Pcpt2PiToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place);
bool Pi2PcptToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place);
bool ExtractToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const std::string& configuration, bool anyMatch, const ToolPlace& place);
bool Ctl2AreToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place);
bool Ali2FlaToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place);
// Also copies the tool's result (the input path ending in "prj") to the
// output path and deletes it; a missing result is reported.
bool LlevToolJob(Ui& ui, const std::string& input, const std::string& output, double upperLimit,
                 const ToolPlace& place);
bool SortToolJob(Ui& ui, const std::string& input, const std::string& output,
                 const ToolPlace& place);

// "Local.EXE" in two parts: a job writer per direction, then the run.
bool LocalGridToLocalJob(Ui& ui, const std::string& input, const std::string& output, short mode,
                         const std::string& modeText, const ToolPlace& place);
bool LocalLocalToGridJob(Ui& ui, const std::string& input, const std::string& output,
                         const std::string& text1, const std::string& text2,
                         const std::string& text3, const ToolPlace& place);
bool LocalRun(Ui& ui, const ToolPlace& place);
// Where Local.EXE writes its result: the output path without its last four
// characters, with the input's extension (the tool keeps the file's format).
std::string LocalResultPath(const std::string& input, const std::string& output);
// What Local.EXE leaves in its job folder: the message of a failure, and the
// report of the points of a computed factor.
std::string LocalErrorPath(const ToolPlace& place);
std::string LatLongReportPath(const ToolPlace& place);
// Runs Local.EXE on the job written, then checks that it did its job: the
// tool's message, or that it left no result, is reported; false then.
bool LocalRunChecked(Ui& ui, const ToolPlace& place, const std::string& input,
                     const std::string& output);

// Report files the tools leave in their job folder: the codes CONVERT.EXE
// found no match for, and the free point numbers of SORT.EXE.
std::string ConvertReportPath(const ToolPlace& place);
std::string SortReportPath(const ToolPlace& place);
inline constexpr const char* kNoMatchText = "The following codes had no match.";

// The questions asked before EXTRACT.EXE and LLEV.EXE run. The limit is 0
// for an empty or cancelled answer, nullopt (reported) for one that is not
// a number.
bool AskAnyMatch(Ui& ui);
std::optional<double> AskLlevLimit(Ui& ui);

// The external tools a definition's Program can name, one row each; both
// dispatchers run them from this table.
enum class ToolQuestion { None, AnyMatch, UpperLimit };
enum class ToolReport { None, NoMatchCodes, FreePointNumbers };

struct ToolAnswers {
  bool anyMatch = false;
  double upperLimit = 0.0;
};

using ToolJobFn = bool (*)(Ui&, const RoutineCall&, const ToolAnswers&, const ToolPlace&);

struct ToolRoutine {
  std::string_view program;  // also the tool's file name
  ToolJobFn job;
  bool configuration;  // takes the configuration file
  ToolQuestion question;
  ToolReport report;
  bool unattended;  // offered by the unattended dispatcher as well as the window
};

std::span<const ToolRoutine> ToolRoutines();
const ToolRoutine* FindToolRoutine(std::string_view program);

// Asks the routine's question before the tool runs; false when the answer
// stops the run.
bool AskToolQuestion(Ui& ui, const ToolRoutine& tool, ToolAnswers& answers);
// The report file a routine's tool leaves, and the type it is shown with;
// empty for none.
std::string ToolReportPath(const ToolRoutine& tool, const ToolPlace& place);
const char* ToolReportType(const ToolRoutine& tool);

// The unattended run of a tool (Pintrel of the application folder, console
// at 0, 0): question, job, and its report shown in a viewer.
bool RunToolUnattended(AppContext& ctx, const ToolRoutine& tool, const RoutineCall& call);

// The batch coordinate conversion through tccin.tmp and tccout.tmp of the
// application folder.
bool CoordConvertRoutine(AppContext& ctx, const RoutineCall& call);

}  // namespace zv
