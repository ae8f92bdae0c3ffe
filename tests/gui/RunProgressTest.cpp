// The progress window of a background run: a determinate bar that follows
// the run, and Cancel stopping the run at its next step.

#include <gtest/gtest.h>

#include <QAbstractButton>
#include <QApplication>
#include <QTimer>
#include <chrono>
#include <thread>

#include "platform/qt/BackgroundRun.h"
#include "platform/qt/QtUi.h"

namespace zv {
namespace {

TEST(RunProgressTest, BarFollowsTheRunAndCancelStopsItAtTheNextStep) {
  int seenValue = -1, seenMaximum = -1;
  QTimer watch;
  QObject::connect(&watch, &QTimer::timeout, [&] {
    for (QWidget* w : QApplication::topLevelWidgets()) {
      auto* busy = qobject_cast<BusyProgress*>(w);
      if (!busy || !busy->isVisible() || busy->value() < 100) continue;
      seenValue = busy->value();
      seenMaximum = busy->maximum();
      for (auto* button : busy->findChildren<QAbstractButton*>())
        if (button->text() == "Cancel") button->click();
    }
  });
  watch.start(20);
  int steps = 0;
  QtUi ui;
  EXPECT_THROW(RunInBackground(nullptr, "Translating...",
                               [&] {
                                 for (; steps < 100000; ++steps) {
                                   ui.progress()->step(RunStage::Reading, steps, 1000);
                                   std::this_thread::sleep_for(std::chrono::milliseconds(2));
                                 }
                                 return true;
                               }),
               RunCancelled);
  EXPECT_EQ(seenMaximum, 1000);
  EXPECT_GE(seenValue, 100);
  EXPECT_LT(steps, 100000);
  // Outside a background run the UI has no window to report to.
  EXPECT_NO_THROW(ui.progress()->step(RunStage::Writing, 1, 2));
}

}  // namespace
}  // namespace zv
