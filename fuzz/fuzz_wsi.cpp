// libFuzzer target: the WSI reader on arbitrary bytes, and what it reads
// written and read again.

#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <sstream>
#include <string>

#include "platform/ScriptedUi.h"
#include "survey/WsiFile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  zv::ScriptedUi ui;
  zv::WorkArea work;
  std::istringstream in(std::string(reinterpret_cast<const char*>(data), size));
  if (!zv::ReadWsiFileStream(ui, work, in, "fuzz.WSI")) return 0;
  static const std::string path =
      (std::filesystem::temp_directory_path() / ("zv-fuzz-" + std::to_string(getpid()) + ".WSI"))
          .string();
  work.copyInputToOutput();
  if (zv::WriteWsiFile(ui, work, path)) {
    zv::ReadWsiFile(ui, work, path);
    std::remove(path.c_str());
  }
  return 0;
}
