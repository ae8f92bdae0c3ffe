#pragma once
// The message boxes a scripted UI recorded, in short.

#include <string>

#include "platform/ScriptedUi.h"

namespace zv::test {

// One line per box: the icon's letter (' ', I, E, C or Q), the title and the
// text, as "E Title: text".
inline std::string Boxes(const ScriptedUi& ui) {
  std::string all;
  for (const RecordedBox& b : ui.boxes) {
    if (!all.empty()) all += '\n';
    all += std::string(1, " IECQ"[static_cast<int>(b.icon)]) + " " + b.title + ": " + b.text;
  }
  return all;
}

// Boxes(), then forgets them.
inline std::string Take(ScriptedUi& ui) {
  std::string all = Boxes(ui);
  ui.boxes.clear();
  return all;
}

}  // namespace zv::test
