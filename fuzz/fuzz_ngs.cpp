// libFuzzer target: the NGS data sheet reader on arbitrary bytes.

#include <cstddef>
#include <cstdint>
#include <sstream>
#include <string>

#include "platform/ScriptedUi.h"
#include "survey/NgsDataSheet.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  zv::ScriptedUi ui;
  ui.answers.push_back(zv::Answer::Ok);  // accept a datum conflict, read on
  zv::WorkArea work;
  std::istringstream in(std::string(reinterpret_cast<const char*>(data), size));
  zv::ReadNgsDataSheetStream(ui, work, in, "fuzz.DS");
  return 0;
}
