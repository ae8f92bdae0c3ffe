// Local.EXE: grid coordinates of a VORN tagged file to local (ground)
// coordinates and back, as TRANS.JOB in the current folder asks. It writes
// its output at the job's output path plus the input's extension, and for a
// computed factor the report LATLONG.OUT in the current folder. A failure
// writes its message to LOCAL.ERR (and standard error), leaves no output and
// ends with status 1.

#include <filesystem>
#include <iostream>
#include <string>
#include <vector>

#include "app/AppContext.h"
#include "pintrel/Localizer.h"
#include "platform/TextIo.h"

namespace {

int Fail(const std::string& message) {
  std::cerr << message << '\n';
  zv::WriteTextLines("LOCAL.ERR", {message});
  return 1;
}

}  // namespace

int main() {
  std::error_code ec;
  std::filesystem::remove("LOCAL.ERR", ec);
  std::vector<std::string> lines;
  if (!zv::ReadTextLines("TRANS.JOB", lines)) {
    return Fail("The job file TRANS.JOB can not be read in '" +
                std::filesystem::current_path(ec).string() + "'.");
  }
  std::string error;
  const std::optional<zv::local::LocalJob> job = zv::local::ParseJob(lines, error);
  if (!job) return Fail(error);
  // The tool lives in Pintrel of the application folder.
  const std::string appFolder =
      std::filesystem::path(zv::ExecutableFolder()).parent_path().string();
  error = zv::local::RunJob(*job, appFolder, "LATLONG.OUT");
  if (!error.empty()) return Fail(error);
  return 0;
}
