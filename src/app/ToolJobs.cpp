#include "app/ToolJobs.h"

#include <filesystem>
#include <fstream>
#include <vector>

#include "app/AppContext.h"
#include "geodesy/BatchExchange.h"
#include "platform/Numbers.h"
#include "platform/Process.h"
#include "platform/TextIo.h"

namespace zv {

namespace fs = std::filesystem;

namespace {

struct ToolSpec {
  const char* name;
  const char* title;
};

constexpr ToolSpec kConvert{"CONVERT.EXE", "CHANGE"};
constexpr ToolSpec kPcpt2Pi{"PCPT2PI.EXE", "Converting PCPT Alignment"};
constexpr ToolSpec kPi2Pcpt{"PI2PCPT.EXE", "Converting PI Alignment"};
constexpr ToolSpec kExtract{"EXTRACT.EXE", "Extracting Data"};
constexpr ToolSpec kCtl2Are{"CTL2ARE.EXE", "VORN Coordinates to Geodimeter Area"};
constexpr ToolSpec kAli2Fla{"ALI2FLA.EXE", "VORN Alignment to Geodimeter Alignment"};
constexpr ToolSpec kLlev{"LLEV.EXE", "Convert Leica Leveling File"};
constexpr ToolSpec kSort{"SORT.EXE", "Sort Points and Display Unused Point Numbers"};
constexpr ToolSpec kLocal{"Local.EXE", "LOCAL"};

std::string ToolPath(const ToolPlace& place, const ToolSpec& tool) {
  return place.toolFolder + "/" + tool.name;
}

std::string JobPath(const ToolPlace& place) {
  return place.jobFolder + "/" + kJobFileName;
}

// The text without its last four characters (a three-letter extension and
// its period).
std::string WithoutExtension(const std::string& path) {
  return path.size() > 4 ? path.substr(0, path.size() - 4) : std::string();
}

bool ToolPresent(Ui& ui, const ToolPlace& place, const ToolSpec& tool) {
  std::error_code ec;
  if (fs::is_regular_file(ToolPath(place, tool), ec)) return true;
  ui.exclaim(
      std::string("The program '") + tool.name + "' was not found in '" + place.toolFolder + "'.",
      "Program Not Found");
  return false;
}

// The empty output file a tool is given; `created` tells whether this job
// made it, so that a tool that never starts leaves nothing behind.
bool CreateEmptyOutput(Ui& ui, const std::string& output, bool& created) {
  created = false;
  if (IsNonRegularFile(output)) {
    ui.exclaim("The output file '" + output + "' can not be written.\r\n" + kNotRegularFile);
    return false;
  }
  if (FileExists(output)) return true;
  std::ofstream file(output, std::ios::binary);
  if (file) {
    created = true;
    return true;
  }
  ui.exclaim("The output file '" + output + "' could not be created.");
  return false;
}

// The configuration path as the tool needs it: absolute, since the tool runs
// in its own folder, and without its extension.
std::string ConfigurationStem(const std::string& configuration) {
  if (configuration.empty()) return "";
  std::error_code ec;
  fs::path absolute = fs::absolute(configuration, ec);
  return WithoutExtension(ec ? configuration : absolute.lexically_normal().string());
}

bool WriteJobFile(Ui& ui, const ToolPlace& place, const std::vector<std::string>& lines) {
  std::string error;
  if (WriteTextLines(JobPath(place), lines, &error)) return true;
  ui.exclaim("The job file '" + JobPath(place) + "' could not be written.\r\n" + error);
  return false;
}

// Runs the tool in its job folder, waits, and removes the job file. The
// empty output made for a tool that does not start is removed as well.
bool RunTool(Ui& ui, const ToolPlace& place, const ToolSpec& tool,
             const std::string& madeOutput = "", int* exitCode = nullptr) {
  ConsoleWindow window{1, tool.title, place.left, place.top, 640, 125, 240};
  ProcessResult run = RunAndWait(ToolPath(place, tool), {}, place.jobFolder, window);
  if (exitCode) *exitCode = run.exitCode;
  std::error_code ec;
  fs::remove(JobPath(place), ec);
  if (!run.started) {
    if (!madeOutput.empty()) fs::remove(madeOutput, ec);
    ui.exclaim("The program '" + ToolPath(place, tool) + "' could not be started: " + run.error,
               "Program Not Started");
    return false;
  }
  return true;
}

// Removes an empty output this job made; false.
bool Unmake(const std::string& output, bool made) {
  std::error_code ec;
  if (made) fs::remove(output, ec);
  return false;
}

// Tools that read the input and write the output with both paths in the
// job file.
bool TwoPathJob(Ui& ui, const ToolSpec& tool, const std::string& input, const std::string& output,
                const ToolPlace& place) {
  bool made = false;
  if (!ToolPresent(ui, place, tool) || !CreateEmptyOutput(ui, output, made)) return false;
  if (!WriteJobFile(ui, place, {ShortPath(input), ShortPath(output)})) return Unmake(output, made);
  return RunTool(ui, place, tool, made ? output : "");
}

}  // namespace

ToolPlace PintrelPlace(const std::string& appFolder, int left, int top) {
  return {appFolder + "/Pintrel", appFolder + "/Pintrel", left, top};
}

bool ConvertToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const std::string& configuration, const ToolPlace& place) {
  bool made = false;
  if (!ToolPresent(ui, place, kConvert) || !CreateEmptyOutput(ui, output, made)) return false;
  if (!WriteJobFile(ui, place,
                    {ShortPath(input), ShortPath(output), ConfigurationStem(configuration)})) {
    return Unmake(output, made);
  }
  return RunTool(ui, place, kConvert, made ? output : "");
}

bool Pcpt2PiToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place) {
  return TwoPathJob(ui, kPcpt2Pi, input, output, place);
}

bool Pi2PcptToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place) {
  return TwoPathJob(ui, kPi2Pcpt, input, output, place);
}

bool ExtractToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const std::string& configuration, bool anyMatch, const ToolPlace& place) {
  bool made = false;
  if (!ToolPresent(ui, place, kExtract) || !CreateEmptyOutput(ui, output, made)) return false;
  if (!WriteJobFile(ui, place,
                    {ShortPath(input), ShortPath(output), ConfigurationStem(configuration),
                     anyMatch ? "Y" : "N"})) {
    return Unmake(output, made);
  }
  return RunTool(ui, place, kExtract, made ? output : "");
}

bool Ctl2AreToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place) {
  return TwoPathJob(ui, kCtl2Are, input, output, place);
}

bool Ali2FlaToolJob(Ui& ui, const std::string& input, const std::string& output,
                    const ToolPlace& place) {
  return TwoPathJob(ui, kAli2Fla, input, output, place);
}

bool LlevToolJob(Ui& ui, const std::string& input, const std::string& output, double upperLimit,
                 const ToolPlace& place) {
  if (!ToolPresent(ui, place, kLlev)) return false;
  const std::string shortInput = ShortPath(input);
  if (!WriteJobFile(ui, place, {shortInput, FormatPlainDecimal(upperLimit)})) return false;
  if (!RunTool(ui, place, kLlev)) return false;

  // The tool writes its result next to the input, ending in "prj". An input
  // that already ends so is no result: it is never copied nor deleted.
  const std::string result =
      shortInput.size() >= 3 ? shortInput.substr(0, shortInput.size() - 3) + "prj" : "";
  std::error_code ec;
  if (result.empty() || result == shortInput || fs::equivalent(result, input, ec) ||
      !fs::is_regular_file(result, ec)) {
    ui.exclaim("LLEV.EXE left no result file '" + result + "'.");
    return false;
  }
  if (IsNonRegularFile(output)) {
    ui.exclaim("The result of LLEV.EXE could not be copied to '" + output + "'.\r\n" +
               kNotRegularFile);
    return false;
  }
  // An output path naming the result itself keeps it.
  if (fs::equivalent(result, output, ec)) return true;
  if (!fs::copy_file(result, output, fs::copy_options::overwrite_existing, ec)) {
    ui.exclaim("The result of LLEV.EXE could not be copied to '" + output + "'.\r\n" +
               ec.message());
    return false;
  }
  fs::remove(result, ec);
  return true;
}

bool SortToolJob(Ui& ui, const std::string& input, const std::string& output,
                 const ToolPlace& place) {
  if (!ToolPresent(ui, place, kSort)) return false;
  if (!WriteJobFile(ui, place, {ShortPath(input), output})) return false;
  return RunTool(ui, place, kSort);
}

bool LocalGridToLocalJob(Ui& ui, const std::string& input, const std::string& output, short mode,
                         const std::string& modeText, const ToolPlace& place) {
  bool made = false;
  if (!ToolPresent(ui, place, kLocal) || !CreateEmptyOutput(ui, output, made)) return false;
  return WriteJobFile(
      ui, place,
      {ShortPath(input), WithoutExtension(ShortPath(output)), std::to_string(mode), modeText});
}

bool LocalLocalToGridJob(Ui& ui, const std::string& input, const std::string& output,
                         const std::string& text1, const std::string& text2,
                         const std::string& text3, const ToolPlace& place) {
  bool made = false;
  if (!ToolPresent(ui, place, kLocal) || !CreateEmptyOutput(ui, output, made)) return false;
  return WriteJobFile(ui, place,
                      {ShortPath(input), WithoutExtension(ShortPath(output)), text1, text2, text3});
}

bool LocalRun(Ui& ui, const ToolPlace& place) {
  if (!ToolPresent(ui, place, kLocal)) return false;
  return RunTool(ui, place, kLocal);
}

std::string LocalResultPath(const std::string& input, const std::string& output) {
  return WithoutExtension(ShortPath(output)) + fs::path(ShortPath(input)).extension().string();
}

std::string LocalErrorPath(const ToolPlace& place) {
  return place.jobFolder + "/LOCAL.ERR";
}

std::string LatLongReportPath(const ToolPlace& place) {
  return place.jobFolder + "/LATLONG.OUT";
}

bool LocalRunChecked(Ui& ui, const ToolPlace& place, const std::string& input,
                     const std::string& output) {
  if (!ToolPresent(ui, place, kLocal)) return false;
  // Only this run's message and report count.
  std::error_code ec;
  fs::remove(LocalErrorPath(place), ec);
  fs::remove(LatLongReportPath(place), ec);
  const std::string result = LocalResultPath(input, output);
  int exitCode = 0;
  if (!RunTool(ui, place, kLocal, "", &exitCode)) return false;
  std::vector<std::string> message;
  if (ReadTextLines(LocalErrorPath(place), message) && !message.empty()) {
    fs::remove(LocalErrorPath(place), ec);
    std::string text;
    for (const std::string& line : message) text.append(text.empty() ? "" : "\r\n").append(line);
    ui.exclaim(text, "Local.EXE");
    return false;
  }
  if (exitCode != 0 || !fs::is_regular_file(result, ec) || fs::file_size(result, ec) == 0) {
    ui.exclaim("Local.EXE did not write '" + result + "'.", "Local.EXE");
    return false;
  }
  return true;
}

std::string ConvertReportPath(const ToolPlace& place) {
  return place.jobFolder + "/Convert.out";
}

std::string SortReportPath(const ToolPlace& place) {
  return place.jobFolder + "/PTNUM.INF";
}

bool AskAnyMatch(Ui& ui) {
  return ui.askYesNo("Is extract by any match?", "Any Match?");
}

std::optional<double> AskLlevLimit(Ui& ui) {
  std::optional<std::string> answer =
      ui.input("Upper limit point number used to exclude points from VORN Project File:",
               "Enter Point Number", "");
  if (!answer || answer->empty()) return 0.0;
  std::optional<double> number = ToNumber(*answer);
  if (!number) ui.exclaim("You must enter a numeric point number.");
  return number;
}

namespace {

// clang-format off
constexpr ToolRoutine kToolRoutines[] = {
    {"CONVERT.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers&, const ToolPlace& p) {
       return ConvertToolJob(ui, c.inputPath, c.outputPath, c.configurationPath, p); },
     true, ToolQuestion::None, ToolReport::NoMatchCodes, true},
    {"PCPT2PI.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers&, const ToolPlace& p) {
       return Pcpt2PiToolJob(ui, c.inputPath, c.outputPath, p); },
     false, ToolQuestion::None, ToolReport::None, true},
    {"PI2PCPT.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers&, const ToolPlace& p) {
       return Pi2PcptToolJob(ui, c.inputPath, c.outputPath, p); },
     false, ToolQuestion::None, ToolReport::None, true},
    {"EXTRACT.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers& a, const ToolPlace& p) {
       return ExtractToolJob(ui, c.inputPath, c.outputPath, c.configurationPath, a.anyMatch, p); },
     true, ToolQuestion::AnyMatch, ToolReport::None, true},
    {"LLEV.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers& a, const ToolPlace& p) {
       return LlevToolJob(ui, c.inputPath, c.outputPath, a.upperLimit, p); },
     false, ToolQuestion::UpperLimit, ToolReport::None, true},
    {"SORT.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers&, const ToolPlace& p) {
       return SortToolJob(ui, c.inputPath, c.outputPath, p); },
     false, ToolQuestion::None, ToolReport::FreePointNumbers, true},
    {"CTL2ARE.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers&, const ToolPlace& p) {
       return Ctl2AreToolJob(ui, c.inputPath, c.outputPath, p); },
     false, ToolQuestion::None, ToolReport::None, false},
    {"ALI2FLA.EXE", [](Ui& ui, const RoutineCall& c, const ToolAnswers&, const ToolPlace& p) {
       return Ali2FlaToolJob(ui, c.inputPath, c.outputPath, p); },
     false, ToolQuestion::None, ToolReport::None, false},
};
// clang-format on

}  // namespace

std::span<const ToolRoutine> ToolRoutines() {
  return kToolRoutines;
}

const ToolRoutine* FindToolRoutine(std::string_view program) {
  for (const auto& t : kToolRoutines)
    if (t.program == program) return &t;
  return nullptr;
}

bool AskToolQuestion(Ui& ui, const ToolRoutine& tool, ToolAnswers& answers) {
  switch (tool.question) {
    case ToolQuestion::None:
      return true;
    case ToolQuestion::AnyMatch:
      answers.anyMatch = AskAnyMatch(ui);
      return true;
    case ToolQuestion::UpperLimit: {
      const std::optional<double> limit = AskLlevLimit(ui);
      answers.upperLimit = limit.value_or(0.0);
      return limit.has_value();
    }
  }
  return false;
}

std::string ToolReportPath(const ToolRoutine& tool, const ToolPlace& place) {
  switch (tool.report) {
    case ToolReport::None:
      return {};
    case ToolReport::NoMatchCodes:
      return ConvertReportPath(place);
    case ToolReport::FreePointNumbers:
      return SortReportPath(place);
  }
  return {};
}

const char* ToolReportType(const ToolRoutine& tool) {
  return tool.report == ToolReport::FreePointNumbers ? "Available Point Numbers"
                                                     : "Out File (*.OUT)";
}

bool RunToolUnattended(AppContext& ctx, const ToolRoutine& tool, const RoutineCall& call) {
  ToolAnswers answers;
  if (!AskToolQuestion(ctx.ui, tool, answers)) return false;
  const ToolPlace place = PintrelPlace(ctx.appFolder);
  if (!tool.job(ctx.ui, call, answers, place)) return false;
  const std::string report = ToolReportPath(tool, place);
  if (report.empty() || !FileExists(report)) return true;
  if (tool.report == ToolReport::NoMatchCodes) ctx.ui.inform(kNoMatchText);
  ctx.ui.viewText(report, ToolReportType(tool));
  // The list of free numbers is removed once seen; the unmatched codes stay.
  if (tool.report == ToolReport::FreePointNumbers) {
    std::error_code ec;
    fs::remove(report, ec);
  }
  return true;
}

bool CoordConvertRoutine(AppContext& ctx, const RoutineCall&) {
  // An answer left by an earlier run, perhaps one that was killed, must not
  // pass for the answer of this one.
  std::error_code ec;
  fs::remove(ctx.appPath(kExchangeOutput), ec);
  ConversionState& state = ctx.conversion;
  state = ConversionState{};
  // The manual mode: the Coordinate Conversion dialog with the request as
  // its input side.
  return BatchExchange(ctx.ui, ctx.appFolder, state, [&ctx](ConversionState& s) {
    return ctx.dialogs->coordinateConversion(ctx, s, /*presetInput=*/true);
  });
}

}  // namespace zv
