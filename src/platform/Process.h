#pragma once
// The runner for external programs: starts a program as a child process and
// waits for it without a time limit. There is no console window here: the
// window settings are accepted and ignored, and the child's standard streams
// are connected to /dev/null (its own redirections still work).

#include <string>
#include <vector>

namespace zv {

// The console window a caller asks for (show mode, title, position, size,
// fill attribute).
struct ConsoleWindow {
  short showMode = 1;
  std::string title;
  int left = 0, top = 0, width = 640, height = 125;
  int fillAttribute = 240;
};

struct ProcessResult {
  bool started = false;  // false: the program could not be started (see error)
  int exitCode = -1;     // the exit status, or 128 + signal number
  std::string error;     // why it could not be started
};

// Runs program with the arguments (argv[1..]) in the working folder (empty:
// the caller's current folder, which is never changed) and waits for it.
ProcessResult RunAndWait(const std::string& program, const std::vector<std::string>& arguments,
                         const std::string& workingFolder, const ConsoleWindow& window);

// Runs a batch file of CR LF lines ("del name", "prog <in >out") through
// /bin/sh in the batch file's folder, with "del" defined as "rm -f" and the
// folder first on the search path, and waits for it.
ProcessResult RunBatchFile(const std::string& batchPath, const ConsoleWindow& window);

// The path the external programs are given for an existing file: the
// absolute path; empty when no such file exists.
std::string ShortPath(const std::string& path);

// True when path names a regular file that may be executed.
bool IsExecutableFile(const std::string& path);

}  // namespace zv
