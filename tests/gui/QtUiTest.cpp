#include <gtest/gtest.h>

#include <QAbstractButton>
#include <QApplication>
#include <QMessageBox>
#include <QProgressDialog>
#include <QThread>
#include <QTimer>
#include <chrono>
#include <thread>

#include "app/dialogs/GuiMain.h"
#include "platform/qt/BackgroundRun.h"
#include "platform/qt/QtUi.h"

namespace zv {
namespace {

TEST(QtUiTest, NameFiltersMatchEitherLetterCase) {
  EXPECT_EQ(QtNameFilters("VORN Control Files (*.CTL)|*.CTL"),
            QStringList{"VORN Control Files (*.CTL *.ctl)"});
  EXPECT_EQ(QtNameFilters("Translation/Filter Files (*.TRN)|*.trn"),
            QStringList{"Translation/Filter Files (*.trn *.TRN)"});
  EXPECT_EQ(QtNameFilters("User-Defined ASCII Files (*.*)|*.*|Out File (*.OUT)|*.OUT"),
            (QStringList{"User-Defined ASCII Files (*)", "Out File (*.OUT *.out)"}));
  EXPECT_EQ(QtNameFilters("Available Point Numbers|"), QStringList{"Available Point Numbers (*)"});
  EXPECT_EQ(FilterSuffix("VORN Control Files (*.CTL *.ctl)"), "CTL");
  EXPECT_EQ(FilterSuffix("User-Defined ASCII Files (*)"), "");
}

TEST(QtUiTest, UnattendedRunsUseQtOnlyWithADisplay) {
  using M = StartMode;
  EXPECT_EQ(ChooseUi(M::Unattended, "", true, ""), UiKind::Qt);
  EXPECT_EQ(ChooseUi(M::Unattended, "", false, "offscreen"), UiKind::Console);
  EXPECT_EQ(ChooseUi(M::Unattended, "qt", false, ""), UiKind::Qt);
  EXPECT_EQ(ChooseUi(M::Interactive, "console", true, ""), UiKind::Console);
  EXPECT_EQ(ChooseUi(M::Interactive, "", false, "offscreen"), UiKind::Qt);
  EXPECT_EQ(ChooseUi(M::Preset, "", false, ""), UiKind::Console);
  EXPECT_EQ(ChooseUi(M::WrongCount, "", false, "offscreen"), UiKind::Console);
}

// Answers the next message box once it is up, recording what it showed.
struct BoxAnswer {
  QString title, text;
  QMessageBox::Icon icon = QMessageBox::NoIcon;
  QMessageBox::StandardButtons buttons;
  bool onGuiThread = false;
};

void AnswerNextBox(BoxAnswer& seen, QMessageBox::StandardButton press) {
  auto* timer = new QTimer(qApp);
  QObject::connect(timer, &QTimer::timeout, timer, [timer, &seen, press] {
    auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
    if (!box) return;
    seen.title = box->windowTitle();
    seen.text = box->text();
    seen.icon = box->icon();
    seen.buttons = box->standardButtons();
    seen.onGuiThread = box->thread() == qApp->thread();
    box->button(press)->click();
    timer->deleteLater();
  });
  timer->start(20);
}

TEST(QtUiTest, BoxesAskedForByAWorkerAreShownByTheGuiThread) {
  QtUi ui;
  BoxAnswer seen;
  AnswerNextBox(seen, QMessageBox::No);
  Answer answer = Answer::Ok;
  const bool result = RunInBackground(nullptr, "Working", [&] {
    answer = ui.message("Overwrite it?\r\nReally?", Icon::None, Buttons::YesNo, "");
    return true;
  });
  EXPECT_TRUE(result);
  EXPECT_EQ(answer, Answer::No);
  EXPECT_EQ(seen.title, "VORN Zurevazidu");
  EXPECT_EQ(seen.text, "Overwrite it?\nReally?");
  EXPECT_EQ(seen.icon, QMessageBox::NoIcon);
  EXPECT_EQ(seen.buttons, QMessageBox::Yes | QMessageBox::No);
  EXPECT_TRUE(seen.onGuiThread);

  AnswerNextBox(seen, QMessageBox::Ok);
  ui.exclaim("Can not convert to X", "Invalid Format");
  EXPECT_EQ(seen.title, "Invalid Format");
  EXPECT_EQ(seen.icon, QMessageBox::Warning);
}

// A long run keeps the event loop turning and shows that it is working.
TEST(QtUiTest, LongWorkKeepsTheWindowsAliveAndShowsProgress) {
  int ticks = 0;
  bool progressShown = false;
  QTimer ticker;
  QObject::connect(&ticker, &QTimer::timeout, [&] {
    ++ticks;
    for (QWidget* w : QApplication::topLevelWidgets())
      if (qobject_cast<QProgressDialog*>(w) && w->isVisible()) progressShown = true;
  });
  ticker.start(25);
  QThread* worker = nullptr;
  const bool result = RunInBackground(nullptr, "Translating...", [&] {
    worker = QThread::currentThread();
    std::this_thread::sleep_for(std::chrono::milliseconds(900));
    return false;
  });
  EXPECT_FALSE(result);
  EXPECT_NE(worker, qApp->thread());
  EXPECT_GT(ticks, 10);
  EXPECT_TRUE(progressShown);

  // An error raised by the work reaches the caller on the GUI thread.
  EXPECT_THROW(RunInBackground(nullptr, "Translating...",
                               []() -> bool { throw std::runtime_error("disk full"); }),
               std::runtime_error);
}

// A question asked in the first moments of a run stays in front: the busy
// window neither covers it nor blocks it, and comes back after the answer.
TEST(QtUiTest, BusyWindowStepsAsideForAQuestion) {
  QtUi ui;
  auto busyShown = [] {
    for (QWidget* w : QApplication::topLevelWidgets())
      if (qobject_cast<BusyProgress*>(w) && w->isVisible()) return true;
    return false;
  };
  bool coveredWhileAsking = false, shownAfterwards = false;
  int polls = 0;
  QTimer poll;
  QObject::connect(&poll, &QTimer::timeout, [&] {
    auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
    if (box) {
      coveredWhileAsking = coveredWhileAsking || busyShown();
      if (++polls == 40) box->button(QMessageBox::Yes)->click();  // after 800 ms
    } else if (polls >= 40) {
      shownAfterwards = shownAfterwards || busyShown();
    }
  });
  poll.start(20);
  Answer answer = Answer::No;
  RunInBackground(nullptr, "Translating...", [&] {
    answer = ui.message("Overwrite it?", Icon::Question, Buttons::YesNo, "");
    std::this_thread::sleep_for(std::chrono::milliseconds(900));
    return true;
  });
  EXPECT_EQ(answer, Answer::Yes);
  EXPECT_FALSE(coveredWhileAsking);
  EXPECT_TRUE(shownAfterwards);
}

}  // namespace
}  // namespace zv
