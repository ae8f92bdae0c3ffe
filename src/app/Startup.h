#pragma once
// The entry routine: single-instance guard, command line, the three modes.

#include <functional>
#include <iosfwd>
#include <string>
#include <vector>

namespace zv {

struct AppContext;

enum class StartMode { Interactive, Preset, Unattended, WrongCount, InvalidArgument };

struct ParsedCommandLine {
  StartMode mode = StartMode::Interactive;
  std::vector<std::string> fields;
};

// Splits the argument text at every "|" and picks the mode.
ParsedCommandLine ParseCommandLine(const std::string& argumentText);

// The -s view field: "True"/"False" in any case, or a number (0 is false).
// False when the text is neither.
bool ParseTruthValue(const std::string& text, bool& value);

// argv[1..] joined by single blanks.
std::string ArgumentText(int argc, char** argv);

// The private folder of this user that holds the instance locks (mode 0700,
// owned by the user, not a link): /tmp/zurevazidu-<uid>, or
// ~/.cache/zurevazidu when that name is taken. A descriptor, or -1.
int OpenLockFolder();

// Holds the lock of one running instance per user and application folder.
class InstanceLock {
 public:
  explicit InstanceLock(const std::string& appFolder);
  ~InstanceLock();
  InstanceLock(const InstanceLock&) = delete;
  InstanceLock& operator=(const InstanceLock&) = delete;
  // False when another instance holds it.
  bool acquired() const { return acquired_; }

 private:
  std::string name_;
  int folder_ = -1;
  int fd_ = -1;
  bool owner_ = false;
  bool acquired_ = true;
};

// Opens the Translate window and returns the exit status when it closes.
using WindowOpener = std::function<int(AppContext&)>;

// Runs the program for the argument text; returns the exit status: 0 done,
// 1 refused, failed or cancelled, 2 command-line error.
int RunProgram(AppContext& ctx, const std::string& argumentText, const WindowOpener& openWindow,
               std::ostream& out);

}  // namespace zv
