#include "platform/qt/BackgroundRun.h"

#include <QEventLoop>
#include <QProgressDialog>
#include <QThread>
#include <QTimer>
#include <exception>
#include <memory>

#include "platform/Ui.h"

namespace zv {

namespace {
constexpr int kShowProgressAfterMs = 400;
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

  QProgressDialog progress(label, QString(), 0, 0, owner);
  progress.setWindowTitle(kAppTitle);
  progress.setWindowModality(Qt::WindowModal);
  progress.setCancelButton(nullptr);
  progress.setMinimumDuration(kShowProgressAfterMs);
  progress.reset();  // shown by the timer below only
  QTimer showLater;
  showLater.setSingleShot(true);
  QObject::connect(&showLater, &QTimer::timeout, &progress, [&] {
    if (thread->isRunning()) progress.show();
  });

  thread->start();
  showLater.start(kShowProgressAfterMs);
  // The finished signal is queued to this thread, so it cannot be missed.
  loop.exec();
  thread->wait();
  if (failure) std::rethrow_exception(failure);
  return result;
}

}  // namespace zv
