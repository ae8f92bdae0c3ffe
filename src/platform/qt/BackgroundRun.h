#pragma once
// Long work off the GUI thread: the windows keep painting, and a progress
// window says that the work goes on when it takes longer than a moment.

#include <QProgressDialog>
#include <QString>
#include <QTimer>
#include <functional>

class QWidget;

namespace zv {

// The "working" window of a background run. It is shown only after a short
// delay and steps aside (hidden, delay restarted afterwards) while the run
// waits for the user: it must never cover or block a message or question.
class BusyProgress : public QProgressDialog {
  Q_OBJECT

 public:
  BusyProgress(const QString& label, QWidget* owner);
  void startDelay();
  void pause();   // a window that needs the user comes up
  void resume();  // it is gone again
  void setRunning(bool on);

 private:
  QTimer showLater_;
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

// Runs `work` on a worker thread and returns its result once it has ended;
// an exception it throws is thrown again here. Message boxes the work asks
// for are shown by the GUI thread (QtUi).
bool RunInBackground(QWidget* owner, const QString& label, const std::function<bool()>& work);

}  // namespace zv
