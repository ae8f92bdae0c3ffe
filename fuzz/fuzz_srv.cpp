// libFuzzer target: the SRV reader on arbitrary bytes, and what it reads
// written and read again.

#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <sstream>
#include <string>

#include "platform/ScriptedUi.h"
#include "survey/SrvFile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  zv::ScriptedUi ui;
  zv::WorkArea work;
  std::istringstream in(std::string(reinterpret_cast<const char*>(data), size));
  if (!zv::ReadSrvFileStream(ui, work, in, "fuzz.SRV")) return 0;
  static const std::string path =
      (std::filesystem::temp_directory_path() / ("zv-fuzz-" + std::to_string(getpid()) + ".SRV"))
          .string();
  work.copyInputToOutput();
  if (zv::WriteSrvFile(ui, work, path)) {
    zv::ReadSrvFile(ui, work, path);
    std::remove(path.c_str());
  }
  return 0;
}
