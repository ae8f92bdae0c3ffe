#include "app/Dispatcher.h"

#include "app/AppContext.h"
#include "app/Catalogue.h"
#include "app/Routines.h"
#include "platform/TextIo.h"

namespace zv {

bool IsExchangeCall(const TranslationJob& job) {
  return job.definitionPath.empty() && job.inputPath == "tccin.tmp" &&
         job.outputPath == "tccout.tmp";
}

bool Translate(AppContext& ctx, const TranslationJob& job) {
  RoutineCall call{job.inputPath, job.outputPath, job.configurationPath, "", "", ""};
  std::string program;
  if (IsExchangeCall(job)) {
    program = "CoordConvert";
    call.configurationPath.clear();
  } else {
    if (!FileExists(job.definitionPath)) {
      ctx.ui.exclaim("The specified translation file '" + job.definitionPath + "' does not exist.");
      return false;
    }
    if (!FileExists(job.inputPath)) {
      ctx.ui.exclaim("The specified input file '" + job.inputPath + "' does not exist.");
      return false;
    }
    if (FileExists(job.outputPath) &&
        !ctx.ui.askYesNo("The specified output file '" + job.outputPath +
                         "' already exists.  Overwrite it?")) {
      return false;
    }
    TranslationDefinition def;
    if (!ReadDefinitionFile(job.definitionPath, def)) {
      ctx.ui.exclaim("The translation file '" + job.definitionPath +
                     "' can not be used: it must hold at least four lines (routine, action, "
                     "input type and output type).");
      return false;
    }
    program = def.Program;
    call.action = def.Action;
    call.inputType = def.Input;
    call.outputType = def.Output;
    if (call.configurationPath.empty()) call.configurationPath = def.ConfigFile;
  }
  // A user-defined file's configuration is the name of its format.
  if (!call.configurationPath.empty() && !ConfigurationNamesFormat(program, call) &&
      !FileExists(call.configurationPath)) {
    ctx.ui.exclaim("The specified Translation/Filter file '" + call.configurationPath +
                   "' does not exist.");
    return false;
  }
  const Routine* routine = FindUnattendedRoutine(program);
  if (!routine) {
    ctx.ui.exclaim("Unknown Translation Routine. Could not perform translation.",
                   "Unknown Routine");
    return false;
  }
  return RunShowingErrors(ctx.ui, [&] { return routine->run(ctx, call); });
}

}  // namespace zv
