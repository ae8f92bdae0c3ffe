#pragma once
// The routine table: each Program name of a translation definition with the
// routine that carries it out. Both dispatchers use it.

#include <span>
#include <string>
#include <string_view>

namespace zv {

struct AppContext;

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

struct Routine {
  std::string_view program;
  RoutineFn run;  // true when the routine did its job
};

std::span<const Routine> UnattendedRoutines();
const Routine* FindUnattendedRoutine(std::string_view program);

// Reads the input with its type's reader and writes it with the output
// type's writer. A reader that fails ends the run.
bool ConvertFile(AppContext& ctx, const RoutineCall& call);
// Filters the input into the output under the configuration's commands.
bool ReplaceRoutine(AppContext& ctx, const RoutineCall& call);

}  // namespace zv
