#pragma once
// Long work off the GUI thread: the windows keep painting, and a progress
// window says that the work goes on when it takes longer than a moment.

#include <QString>
#include <functional>

class QWidget;

namespace zv {

// Runs `work` on a worker thread and returns its result once it has ended;
// an exception it throws is thrown again here. Message boxes the work asks
// for are shown by the GUI thread (QtUi).
bool RunInBackground(QWidget* owner, const QString& label, const std::function<bool()>& work);

}  // namespace zv
