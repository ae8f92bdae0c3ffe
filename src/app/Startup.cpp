#include "app/Startup.h"

#include <sys/file.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <ostream>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "platform/Numbers.h"

namespace zv {

ParsedCommandLine ParseCommandLine(const std::string& argumentText) {
  ParsedCommandLine parsed;
  if (argumentText.empty()) return parsed;
  size_t start = 0;
  for (;;) {
    size_t bar = argumentText.find('|', start);
    parsed.fields.push_back(argumentText.substr(start, bar - start));
    if (bar == std::string::npos) break;
    start = bar + 1;
  }
  const std::string& first = parsed.fields.front();
  const size_t count = parsed.fields.size();
  if (first == "-t") {
    parsed.mode = (count == 4 || count == 5) ? StartMode::Unattended : StartMode::WrongCount;
  } else if (first == "-s") {
    parsed.mode = count == 5 ? StartMode::Preset : StartMode::WrongCount;
  } else {
    parsed.mode = StartMode::InvalidArgument;
  }
  return parsed;
}

bool ParseTruthValue(const std::string& text, bool& value) {
  std::string lower = text;
  std::transform(lower.begin(), lower.end(), lower.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  if (lower == "true" || lower == "false") {
    value = lower == "true";
    return true;
  }
  if (auto number = ToNumber(text)) {
    value = *number != 0;
    return true;
  }
  return false;
}

std::string ArgumentText(int argc, char** argv) {
  std::string text;
  for (int i = 1; i < argc; ++i) {
    if (i > 1) text += ' ';
    text += argv[i];
  }
  return text;
}

InstanceLock::InstanceLock(const std::string& appFolder) {
  const char* runtime = std::getenv("XDG_RUNTIME_DIR");
  std::string folder = runtime && *runtime ? runtime : "/tmp";
  std::error_code ec;
  std::string canonical = std::filesystem::weakly_canonical(appFolder, ec).string();
  if (ec) canonical = appFolder;
  std::string name = folder + "/zurevazidu-" + std::to_string(getuid()) + "-" +
                     std::to_string(std::hash<std::string>{}(canonical)) + ".lock";
  fd_ = ::open(name.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
  // Without a lock file the guard cannot work; the program still runs.
  if (fd_ < 0) return;
  acquired_ = ::flock(fd_, LOCK_EX | LOCK_NB) == 0;
}

InstanceLock::~InstanceLock() {
  if (fd_ >= 0) ::close(fd_);
}

int RunProgram(AppContext& ctx, const std::string& argumentText, const WindowOpener& openWindow,
               std::ostream& out) {
  InstanceLock lock(ctx.appFolder);
  if (!lock.acquired()) {
    ctx.ui.inform("An instance of VORN Zurevazidu is already running.", kAppTitle);
    return 1;
  }
  ParsedCommandLine parsed = ParseCommandLine(argumentText);
  const auto& f = parsed.fields;
  StartupSettings& s = ctx.startup;
  s.configurationFolder = ctx.appPath("TRNFiles");
  switch (parsed.mode) {
    case StartMode::WrongCount:
      ctx.ui.inform("Incorrect Number of Command Line Arguments.");
      return 2;
    case StartMode::InvalidArgument:
      ctx.ui.inform("Invalid Command Line Argument.");
      return 2;
    case StartMode::Unattended: {
      TranslationJob job;
      if (f.size() == 4) {
        job.definitionPath = f[1].empty() ? "" : ctx.appPath("UTIFiles/" + f[1] + ".uti");
      } else {
        job.definitionPath = ctx.appPath("UTIFiles/" + f[1] + ".uti");
        job.configurationPath = f[4];
      }
      job.inputPath = f[2];
      job.outputPath = f[3];
      return Translate(ctx, job) ? 0 : 1;
    }
    case StartMode::Preset:
      if (!ParseTruthValue(f[1], s.viewOutput)) {
        ctx.ui.inform("Invalid Command Line Argument.\r\nThe view field '" + f[1] +
                      "' must be True, False or a number.");
        return 2;
      }
      s.defaultInputFolder = f[2];
      s.defaultOutputFolder = f[3];
      s.fileStem = f[4];
      break;
    case StartMode::Interactive: {
      std::error_code ec;
      std::string cwd = std::filesystem::current_path(ec).string();
      s.defaultInputFolder = cwd;
      s.defaultOutputFolder = cwd;
      break;
    }
  }
  if (!openWindow) {
    out << "The Translate window is not available in this build; run a translation with "
           "-t|definition|input|output (see --help).\n";
    return 1;
  }
  return openWindow(ctx);
}

std::string ExecutableFolder() {
  std::error_code ec;
  auto exe = std::filesystem::read_symlink("/proc/self/exe", ec);
  if (ec) return std::filesystem::current_path().string();
  return exe.parent_path().string();
}

}  // namespace zv
