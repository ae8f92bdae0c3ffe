#pragma once
// The progress of a long run (the input read, then the output written) and
// the user's request to stop it. Readers and writers report through the
// RunProgress of their UI; a stop request makes the next report throw
// RunCancelled, so the run ends at the next point with nothing committed.

#include <cstddef>
#include <cstdint>

namespace zv {

enum class RunStage { Reading, Writing };

// Thrown by RunProgress::step after a stop request. Not a std::exception,
// so that no handler of ordinary errors takes it for one.
struct RunCancelled {};

inline constexpr const char* kRunCancelled = "Translation cancelled.";

class RunProgress {
 public:
  virtual ~RunProgress() = default;
  // `done` of `total` (bytes or points; total 0 when unknown). Throws
  // RunCancelled once a stop was asked for.
  virtual void step(RunStage stage, std::uintmax_t done, std::uintmax_t total) = 0;
};

// Reports every 1024th of n items.
inline void StepItems(RunProgress* progress, RunStage stage, size_t i, size_t n) {
  if (progress && (i & 1023) == 0) progress->step(stage, i, n);
}

// From now on SIGINT and SIGTERM ask the run to stop instead of ending the
// process; a second signal ends it (temporary files removed).
void StopOnSignals();
// True once such a signal came.
bool StopRequested();

// The progress of an unattended run: stops after SIGINT or SIGTERM.
class SignalStop : public RunProgress {
 public:
  void step(RunStage, std::uintmax_t, std::uintmax_t) override {
    if (StopRequested()) throw RunCancelled{};
  }
};

}  // namespace zv
