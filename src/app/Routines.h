#pragma once
// The routine table: each Program name of a translation definition with the
// routine that carries it out. Both dispatchers use it.

#include <functional>
#include <string>
#include <string_view>

namespace zv {

struct AppContext;
class Ui;

// What a routine is called with.
struct RoutineCall {
  std::string inputPath;
  std::string outputPath;
  std::string configurationPath;
  std::string inputType;
  std::string outputType;
  std::string action;
};

using RoutineFn = bool (*)(AppContext&, const RoutineCall&);
struct ToolRoutine;

// A routine of the unattended dispatcher: one of its own or an external tool.
struct Routine {
  std::string_view program;
  RoutineFn fn = nullptr;
  const ToolRoutine* tool = nullptr;
  // True when the routine did its job.
  bool run(AppContext& ctx, const RoutineCall& call) const;
};

// The unattended dispatcher's routines, then the tools it offers.
const Routine* FindUnattendedRoutine(std::string_view program);

// Runs a routine of either dispatcher. An error raised below it ends the run
// here, where it is shown (the busy pointer off first); so does a stop asked
// for by the user ("Translation cancelled."). False then.
bool RunShowingErrors(Ui& ui, const std::function<bool()>& routine);

// Reads the input with its type's reader and writes it with the output
// type's writer. A reader that fails ends the run.
bool ConvertFile(AppContext& ctx, const RoutineCall& call);
// The same without dialogs: a user-defined file is read or written with the
// format that the configuration names (else the one last used in the
// window) and the reference stored with it or remembered.
bool ConvertFileUnattended(AppContext& ctx, const RoutineCall& call);
// True when the configuration of an unattended run names a user format
// rather than a file: "ConvertFile" from or to a user-defined file.
bool ConfigurationNamesFormat(std::string_view program, const RoutineCall& call);
// Filters the input into the output under the configuration's commands.
bool ReplaceRoutine(AppContext& ctx, const RoutineCall& call);

// Reprojection, in three steps shared by both dispatchers. The first reads
// the input: its header's coordinate reference becomes the input side of the
// conversion settings, its points the conversion points.
bool ReadForReprojection(AppContext& ctx, const RoutineCall& call);
// The second converts the points with the settings of the configuration file
// (a "Coordinate Conversion" section), or else those last accepted in the
// Coordinate Conversion dialog; settings the dialog would refuse are refused
// alike, naming the key.
bool ConvertWithStoredSettings(AppContext& ctx, const RoutineCall& call);
// The third fills the output side from the input header and the conversion,
// and, when the conversion was accepted, writes it.
bool WriteReprojection(AppContext& ctx, const RoutineCall& call);
// The unattended reprojection: all three.
bool MultiPointRoutine(AppContext& ctx, const RoutineCall& call);

}  // namespace zv
