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
#include "editor/TextEditorWindow.h"
#include "platform/qt/BackgroundRun.h"
#include "platform/qt/QtUi.h"

namespace zv {
namespace {

TEST(QtUiTest, NameFiltersMatchEitherLetterCaseAndUiKindFollowsTheDisplay) {
  EXPECT_EQ(QtNameFilters("VORN Control Files (*.CTL)|*.CTL"),
            QStringList{"VORN Control Files (*.CTL *.ctl)"});
  EXPECT_EQ(QtNameFilters("Translation/Filter Files (*.TRN)|*.trn"),
            QStringList{"Translation/Filter Files (*.trn *.TRN)"});
  EXPECT_EQ(QtNameFilters("User-Defined ASCII Files (*.*)|*.*|Out File (*.OUT)|*.OUT"),
            (QStringList{"User-Defined ASCII Files (*)", "Out File (*.OUT *.out)"}));
  EXPECT_EQ(QtNameFilters("Available Point Numbers|"), QStringList{"Available Point Numbers (*)"});
  EXPECT_EQ(FilterSuffix("VORN Control Files (*.CTL *.ctl)"), "CTL");
  EXPECT_EQ(FilterSuffix("User-Defined ASCII Files (*)"), "");
  // Unattended runs use Qt only with a display.
  using M = StartMode;
  EXPECT_EQ(ChooseUi(M::Unattended, "", true, ""), UiKind::Qt);
  EXPECT_EQ(ChooseUi(M::Unattended, "", false, "offscreen"), UiKind::Console);
  EXPECT_EQ(ChooseUi(M::Unattended, "qt", false, ""), UiKind::Qt);
  EXPECT_EQ(ChooseUi(M::Interactive, "console", true, ""), UiKind::Console);
  EXPECT_EQ(ChooseUi(M::Interactive, "", false, "offscreen"), UiKind::Qt);
  EXPECT_EQ(ChooseUi(M::Preset, "", false, ""), UiKind::Console);
  EXPECT_EQ(ChooseUi(M::WrongCount, "", false, "offscreen"), UiKind::Console);
}

// Answers the next message box once it is up, noting "title|text|icon|buttons"
// and whether the GUI thread shows it.
void AnswerNextBox(QString& seen, QMessageBox::StandardButton press) {
  auto* timer = new QTimer(qApp);
  QObject::connect(timer, &QTimer::timeout, timer, [timer, &seen, press] {
    auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
    if (!box) return;
    seen = QString("%1|%2|%3|%4|%5")
               .arg(box->windowTitle(), box->text())
               .arg(box->icon())
               .arg(box->standardButtons().toInt())
               .arg(box->thread() == qApp->thread() ? "gui" : "worker");
    box->button(press)->click();
    timer->deleteLater();
  });
  timer->start(20);
}

TEST(QtUiTest, BoxesAskedForByAWorkerAreShownByTheGuiThread) {
  QtUi ui(OpenTextEditor);
  QString seen;
  AnswerNextBox(seen, QMessageBox::No);
  Answer answer = Answer::Ok;
  EXPECT_TRUE(RunInBackground(nullptr, "Working", [&] {
    answer = ui.message("Overwrite it?\r\nReally?", Icon::None, Buttons::YesNo, "");
    return true;
  }));
  EXPECT_EQ(answer, Answer::No);
  const int yesNo = (QMessageBox::Yes | QMessageBox::No).toInt();
  EXPECT_EQ(seen, QString("VORN Zurevazidu|Overwrite it?\nReally?|%1|%2|gui")
                      .arg(QMessageBox::NoIcon)
                      .arg(yesNo));
  AnswerNextBox(seen, QMessageBox::Ok);
  ui.exclaim("Can not convert to X", "Invalid Format");
  EXPECT_EQ(seen, QString("Invalid Format|Can not convert to X|%1|%2|gui")
                      .arg(QMessageBox::Warning)
                      .arg(QMessageBox::Ok));
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
  EXPECT_FALSE(RunInBackground(nullptr, "Translating...", [&] {
    worker = QThread::currentThread();
    std::this_thread::sleep_for(std::chrono::milliseconds(900));
    return false;
  }));
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
  QtUi ui(OpenTextEditor);
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
