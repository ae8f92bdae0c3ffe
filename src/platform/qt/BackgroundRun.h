#pragma once
// Long work off the GUI thread: the windows keep painting, and a progress
// window says that the work goes on when it takes longer than a moment.

#include <QCursor>
#include <QList>
#include <QProgressDialog>
#include <QString>
#include <QTimer>
#include <atomic>
#include <functional>

#include "platform/Progress.h"

class QWidget;

namespace zv {

// The progress of a background run, written by the worker and read by its
// window; a stop request makes the worker's next step throw RunCancelled.
class SharedProgress : public RunProgress {
 public:
  void step(RunStage stage, std::uintmax_t done, std::uintmax_t total) override;
  void requestStop() { stop_ = true; }
  // -1 before the first step, else the RunStage.
  int stage() const { return stage_; }
  int permille() const { return permille_; }

 private:
  std::atomic<int> stage_{-1};
  std::atomic<int> permille_{0};
  std::atomic<bool> stop_{false};
};

// The progress of the background run on this thread; nullptr elsewhere.
RunProgress* CurrentRunProgress();

// The "working" window of a background run: a bar for the share of the input
// read, then of the output written, and Cancel. It is shown only after a
// short delay and steps aside (hidden, delay restarted afterwards) while the
// run waits for the user: it must never cover or block a message or question.
class BusyProgress : public QProgressDialog {
  Q_OBJECT

 public:
  // Without a shared progress the bar only says that the work goes on.
  BusyProgress(const QString& label, QWidget* owner, SharedProgress* progress = nullptr);
  void startDelay();
  void pause();   // a window that needs the user comes up
  void resume();  // it is gone again
  void setRunning(bool on);

 private:
  void follow();
  QString label_;
  SharedProgress* progress_;
  QTimer showLater_;
  QTimer follow_;
  int paused_ = 0;
  bool running_ = false;
};

// Hides every busy window while it lives (GUI thread only); owner() is the
// window a new dialog belongs to.
class BusyPause {
 public:
  BusyPause();
  ~BusyPause();
  BusyPause(const BusyPause&) = delete;
  BusyPause& operator=(const BusyPause&) = delete;
  QWidget* owner() const { return owner_; }

 private:
  QList<BusyProgress*> paused_;
  QWidget* owner_ = nullptr;
};

// While a window waits for the user (GUI thread only): no busy window over
// it and the normal pointer; both come back afterwards. owner() is the
// window it belongs to.
class UserWait {
 public:
  UserWait();
  ~UserWait();
  UserWait(const UserWait&) = delete;
  UserWait& operator=(const UserWait&) = delete;
  QWidget* owner() const { return pause_.owner(); }

 private:
  BusyPause pause_;
  QList<QCursor> cursors_;
};

// Runs `work` on a worker thread and returns its result once it has ended;
// an exception it throws is thrown again here. Message boxes the work asks
// for are shown by the GUI thread (QtUi).
bool RunInBackground(QWidget* owner, const QString& label, const std::function<bool()>& work);

}  // namespace zv
