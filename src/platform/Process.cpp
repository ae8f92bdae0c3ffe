#include "platform/Process.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>

extern char** environ;

namespace zv {

namespace fs = std::filesystem;

namespace {

// posix_spawn attributes and file actions, released on every path.
class SpawnSetup {
 public:
  SpawnSetup() { ok_ = posix_spawn_file_actions_init(&actions_) == 0; }
  ~SpawnSetup() {
    if (ok_) posix_spawn_file_actions_destroy(&actions_);
  }
  SpawnSetup(const SpawnSetup&) = delete;
  SpawnSetup& operator=(const SpawnSetup&) = delete;
  bool ok() const { return ok_; }
  posix_spawn_file_actions_t* actions() { return &actions_; }

 private:
  posix_spawn_file_actions_t actions_{};
  bool ok_ = false;
};

}  // namespace

ProcessResult RunAndWait(const std::string& program, const std::vector<std::string>& arguments,
                         const std::string& workingFolder, const ConsoleWindow& window) {
  (void)window;  // no console window on this platform
  ProcessResult result;
  // Checked here as well: not every posix_spawn reports a failed exec.
  if (::access(program.c_str(), X_OK) != 0) {
    result.error = std::strerror(errno);
    return result;
  }
  SpawnSetup setup;
  if (!setup.ok()) {
    result.error = std::strerror(errno);
    return result;
  }
  posix_spawn_file_actions_t* actions = setup.actions();
  posix_spawn_file_actions_addopen(actions, 0, "/dev/null", O_RDONLY, 0);
  posix_spawn_file_actions_addopen(actions, 1, "/dev/null", O_WRONLY, 0);
  posix_spawn_file_actions_addopen(actions, 2, "/dev/null", O_WRONLY, 0);
  if (!workingFolder.empty()) posix_spawn_file_actions_addchdir_np(actions, workingFolder.c_str());

  std::vector<char*> argv;
  argv.push_back(const_cast<char*>(program.c_str()));
  for (const std::string& a : arguments) argv.push_back(const_cast<char*>(a.c_str()));
  argv.push_back(nullptr);

  pid_t pid = 0;
  int rc = posix_spawn(&pid, program.c_str(), actions, nullptr, argv.data(), environ);
  if (rc != 0) {
    result.error = std::strerror(rc);
    return result;
  }
  result.started = true;
  int status = 0;
  while (waitpid(pid, &status, 0) < 0) {
    if (errno != EINTR) {
      result.error = std::strerror(errno);
      return result;
    }
  }
  if (WIFEXITED(status)) {
    result.exitCode = WEXITSTATUS(status);
  } else if (WIFSIGNALED(status)) {
    result.exitCode = 128 + WTERMSIG(status);
  }
  return result;
}

ProcessResult RunBatchFile(const std::string& batchPath, const ConsoleWindow& window) {
  // $0 is the batch file; its folder goes first on the search path, as a
  // command interpreter finds programs in the current folder first. The CRs
  // of the CR LF lines are dropped before the lines run.
  static const char* kScript =
      "del() { rm -f -- \"$@\"; }\n"
      "PATH=\"${0%/*}:$PATH\"\n"
      "eval \"$(tr -d '\\r' <\"$0\")\"\n";
  std::string absolute = fs::absolute(batchPath).string();
  std::string folder = fs::path(absolute).parent_path().string();
  return RunAndWait("/bin/sh", {"-c", kScript, absolute}, folder, window);
}

std::string ShortPath(const std::string& path) {
  if (path.empty()) return "";
  std::error_code ec;
  if (!fs::exists(path, ec)) return "";
  fs::path absolute = fs::absolute(path, ec);
  if (ec) return "";
  return absolute.lexically_normal().string();
}

bool IsExecutableFile(const std::string& path) {
  struct stat st {};
  if (::stat(path.c_str(), &st) != 0 || !S_ISREG(st.st_mode)) return false;
  return ::access(path.c_str(), X_OK) == 0;
}

}  // namespace zv
