#include "platform/qt/BackgroundRun.h"

#include <QApplication>
#include <QEventLoop>
#include <QFontMetrics>
#include <QPointer>
#include <QThread>
#include <algorithm>
#include <exception>
#include <limits>
#include <memory>

#include "platform/Ui.h"

namespace zv {

namespace {
constexpr int kShowProgressAfterMs = 400;
constexpr int kFollowEveryMs = 100;
thread_local RunProgress* t_runProgress = nullptr;
}  // namespace

void SharedProgress::step(RunStage stage, std::uintmax_t done, std::uintmax_t total) {
  stage_ = static_cast<int>(stage);
  permille_ =
      total == 0 ? 0 : static_cast<int>(std::min<std::uintmax_t>(done, total) * 1000 / total);
  if (stop_) throw RunCancelled{};
}

RunProgress* CurrentRunProgress() {
  return t_runProgress;
}

BusyProgress::BusyProgress(const QString& label, QWidget* owner, SharedProgress* progress)
    : QProgressDialog(label, QString(), 0, 0, owner), label_(label), progress_(progress) {
  setObjectName("frmBusy");
  setWindowTitle(kAppTitle);
  // Wide enough for the whole title beside the title bar's buttons.
  setMinimumWidth(
      QFontMetrics(QApplication::font("QWorkspaceTitleBar")).horizontalAdvance(windowTitle()) +
      160);
  setWindowModality(Qt::WindowModal);
  if (progress_) {
    setCancelButtonText("Cancel");
    connect(this, &QProgressDialog::canceled, this, [this] {
      progress_->requestStop();
      setLabelText(label_ + "\nStopping at the next point...");
    });
    connect(&follow_, &QTimer::timeout, this, &BusyProgress::follow);
  } else {
    setCancelButton(nullptr);
  }
  setAutoClose(false);
  setAutoReset(false);
  // QProgressDialog shows itself after its own minimum duration: keep it
  // hidden until our timer says so.
  setMinimumDuration(std::numeric_limits<int>::max());
  reset();
  showLater_.setSingleShot(true);
  connect(&showLater_, &QTimer::timeout, this, [this] {
    if (running_ && paused_ == 0) show();
  });
}

void BusyProgress::follow() {
  if (!progress_ || progress_->stage() < 0 || wasCanceled()) return;
  if (maximum() != 1000) setRange(0, 1000);
  setValue(progress_->permille());
  const bool reading = progress_->stage() == static_cast<int>(RunStage::Reading);
  setLabelText(label_ + (reading ? "\nReading the input" : "\nWriting the output"));
}

void BusyProgress::startDelay() {
  showLater_.start(kShowProgressAfterMs);
}

void BusyProgress::setRunning(bool on) {
  running_ = on;
  if (on) {
    startDelay();
    if (progress_) follow_.start(kFollowEveryMs);
  } else {
    showLater_.stop();
    follow_.stop();
    hide();
  }
}

void BusyProgress::pause() {
  ++paused_;
  showLater_.stop();
  hide();
}

void BusyProgress::resume() {
  if (paused_ > 0 && --paused_ == 0 && running_) startDelay();
}

BusyPause::BusyPause() {
  for (QWidget* w : QApplication::topLevelWidgets()) {
    auto* busy = qobject_cast<BusyProgress*>(w);
    if (!busy) continue;
    if (!owner_) owner_ = busy->parentWidget();
    busy->pause();
    paused_ << busy;
  }
  if (!owner_) owner_ = QApplication::activeModalWidget();
  if (!owner_) owner_ = QApplication::activeWindow();
}

BusyPause::~BusyPause() {
  for (BusyProgress* busy : paused_) busy->resume();
}

UserWait::UserWait() {
  while (const QCursor* cursor = QApplication::overrideCursor()) {
    cursors_.prepend(*cursor);
    QApplication::restoreOverrideCursor();
  }
}

UserWait::~UserWait() {
  for (const QCursor& cursor : cursors_) QApplication::setOverrideCursor(cursor);
}

bool RunInBackground(QWidget* owner, const QString& label, const std::function<bool()>& work) {
  bool result = false;
  std::exception_ptr failure;
  SharedProgress shared;
  std::unique_ptr<QThread> thread(QThread::create([&] {
    t_runProgress = &shared;
    try {
      result = work();
    } catch (...) {
      failure = std::current_exception();
    }
    t_runProgress = nullptr;
  }));
  QEventLoop loop;
  QObject::connect(thread.get(), &QThread::finished, &loop, &QEventLoop::quit);

  BusyProgress progress(label, owner, &shared);
  thread->start();
  progress.setRunning(true);
  // The finished signal is queued to this thread, so it cannot be missed.
  loop.exec();
  progress.setRunning(false);
  thread->wait();
  if (failure) std::rethrow_exception(failure);
  return result;
}

}  // namespace zv
