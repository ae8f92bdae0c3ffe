#pragma once
// Runs a function on the GUI thread and returns its result; called from a
// worker thread, the worker waits for it.

#include <QCoreApplication>
#include <QThread>
#include <type_traits>

namespace zv {

template <typename F>
auto OnGuiThread(F&& f) -> std::invoke_result_t<F> {
  using R = std::invoke_result_t<F>;
  if (QThread::currentThread() == qApp->thread()) return f();
  if constexpr (std::is_void_v<R>) {
    QMetaObject::invokeMethod(qApp, f, Qt::BlockingQueuedConnection);
  } else {
    R result{};
    QMetaObject::invokeMethod(
        qApp, [&] { result = f(); }, Qt::BlockingQueuedConnection);
    return result;
  }
}

}  // namespace zv
