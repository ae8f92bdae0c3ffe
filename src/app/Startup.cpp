#include "app/Startup.h"

#include <fcntl.h>
#include <pwd.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <ostream>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "platform/Numbers.h"
#include "platform/Progress.h"
#include "platform/Strings.h"

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
  const std::string lower = ToLower(text);
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

namespace {

// Opens folder as a private folder of the user: created with mode 0700 when
// missing; refused when it is a link or belongs to someone else. Returns
// the descriptor of the folder, or -1.
int OpenPrivateFolder(const std::string& folder) {
  ::mkdir(folder.c_str(), 0700);
  int fd = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
  if (fd < 0) return -1;
  struct stat st {};
  if (::fstat(fd, &st) != 0 || !S_ISDIR(st.st_mode) || st.st_uid != ::getuid() ||
      ((st.st_mode & 077) != 0 && ::fchmod(fd, 0700) != 0)) {
    ::close(fd);
    return -1;
  }
  return fd;
}

}  // namespace

int OpenLockFolder() {
  // Chosen by the user id alone, so that every run of one user finds the
  // same lock whatever its environment.
  const std::string uid = std::to_string(::getuid());
  int fd = OpenPrivateFolder("/tmp/zurevazidu-" + uid);
  if (fd >= 0) return fd;
  // Someone else holds that name: a folder in the user's home instead.
  const passwd* pw = ::getpwuid(::getuid());
  if (!pw || !pw->pw_dir || !*pw->pw_dir) return -1;
  std::error_code ec;
  std::filesystem::create_directories(std::string(pw->pw_dir) + "/.cache", ec);
  return OpenPrivateFolder(std::string(pw->pw_dir) + "/.cache/zurevazidu");
}

InstanceLock::InstanceLock(const std::string& appFolder) {
  std::error_code ec;
  std::string canonical = std::filesystem::weakly_canonical(appFolder, ec).string();
  if (ec) canonical = appFolder;
  // The same name for the same folder in every run.
  name_ = "instance-" + StableHashHex(canonical) + ".lock";
  folder_ = OpenLockFolder();
  // Without a lock file the guard cannot work; the program still runs.
  if (folder_ < 0) return;
  for (int attempt = 0; attempt < 5; ++attempt) {
    fd_ = ::openat(folder_, name_.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC, 0600);
    if (fd_ < 0) {
      // Only this user can have put a link here: it is removed, not followed.
      if (errno == ELOOP && ::unlinkat(folder_, name_.c_str(), 0) == 0) continue;
      return;
    }
    if (::flock(fd_, LOCK_EX | LOCK_NB) != 0) {
      acquired_ = false;
      return;
    }
    // The holder before removes the file when it ends: the lock counts only
    // while it is still on the file of that name.
    struct stat held {
    }, named{};
    if (::fstat(fd_, &held) == 0 &&
        ::fstatat(folder_, name_.c_str(), &named, AT_SYMLINK_NOFOLLOW) == 0 &&
        held.st_dev == named.st_dev && held.st_ino == named.st_ino) {
      owner_ = true;
      return;
    }
    ::close(fd_);
    fd_ = -1;
  }
}

InstanceLock::~InstanceLock() {
  if (owner_) ::unlinkat(folder_, name_.c_str(), 0);
  if (fd_ >= 0) ::close(fd_);
  if (folder_ >= 0) ::close(folder_);
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
      // SIGINT and SIGTERM stop the run at the next point, as Cancel does.
      StopOnSignals();
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
