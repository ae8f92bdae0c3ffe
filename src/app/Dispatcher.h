#pragma once
// The unattended dispatcher: checks a translation job and runs the routine
// its definition names. Every failure and question goes through the UI.

#include <string>

namespace zv {

struct AppContext;

struct TranslationJob {
  std::string definitionPath;
  std::string inputPath;
  std::string outputPath;
  std::string configurationPath;
};

// True when the exchange files name the batch coordinate conversion.
bool IsExchangeCall(const TranslationJob& job);

// Runs the job; true when it did its job, false when it stopped on a
// refusal, an error or a "No".
bool Translate(AppContext& ctx, const TranslationJob& job);

}  // namespace zv
