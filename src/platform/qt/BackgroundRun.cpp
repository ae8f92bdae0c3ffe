#include "platform/qt/BackgroundRun.h"

#include <QApplication>
#include <QEventLoop>
#include <QPointer>
#include <QThread>
#include <exception>
#include <limits>
#include <memory>

#include "platform/Ui.h"

namespace zv {

namespace {
constexpr int kShowProgressAfterMs = 400;
}

BusyProgress::BusyProgress(const QString& label, QWidget* owner)
    : QProgressDialog(label, QString(), 0, 0, owner) {
  setObjectName("frmBusy");
  setWindowTitle(kAppTitle);
  setWindowModality(Qt::WindowModal);
  setCancelButton(nullptr);
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

void BusyProgress::startDelay() {
  showLater_.start(kShowProgressAfterMs);
}

void BusyProgress::setRunning(bool on) {
  running_ = on;
  if (on) {
    startDelay();
  } else {
    showLater_.stop();
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

bool RunInBackground(QWidget* owner, const QString& label, const std::function<bool()>& work) {
  bool result = false;
  std::exception_ptr failure;
  std::unique_ptr<QThread> thread(QThread::create([&] {
    try {
      result = work();
    } catch (...) {
      failure = std::current_exception();
    }
  }));
  QEventLoop loop;
  QObject::connect(thread.get(), &QThread::finished, &loop, &QEventLoop::quit);

  BusyProgress progress(label, owner);
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
