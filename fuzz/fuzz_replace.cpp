// libFuzzer target for the search-and-replace command parser and filter.
// The input is a command file, a NUL byte, and the file to filter. Any input
// must filter or be refused with a message, never crash or hang. Seeds in
// tests/fixtures/replace/fuzz-seeds hold both parts.

#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>

#include "platform/ScriptedUi.h"
#include "tools/SearchReplace.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  std::string all(reinterpret_cast<const char*>(data), size);
  size_t split = all.find('\0');
  if (split == std::string::npos) return 0;
  std::istringstream commands(all.substr(0, split));
  std::istringstream input(all.substr(split + 1));
  zv::ScriptedUi ui;
  std::string output;
  bool ok = zv::SearchAndReplaceStreams(ui, input, commands, output, "in.ctl", "cmd.TRN");
  if (!ok && ui.boxes.empty()) std::abort();  // a refusal always says why
  if (!ok && !output.empty()) std::abort();   // nothing is written on a refusal
  if (ok && output.empty()) std::abort();     // an empty input is refused
  return 0;
}
