// The GUI tests share one QApplication on the offscreen platform.

#include <gtest/gtest.h>

#include <QApplication>
#include <QStandardPaths>

namespace {

QtMessageHandler gQtHandler = nullptr;

// The offscreen platform notes on every window that it ignores size hints.
void QuietHandler(QtMsgType type, const QMessageLogContext& context, const QString& text) {
  if (text.contains("propagateSizeHints") || !gQtHandler) return;
  gQtHandler(type, context, text);
}

}  // namespace

int main(int argc, char** argv) {
  if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  gQtHandler = qInstallMessageHandler(QuietHandler);
  QApplication app(argc, argv);
  // Per-user settings go to a test location, not the user's own.
  QStandardPaths::setTestModeEnabled(true);
  ::testing::InitGoogleTest(&argc, argv);
  return RUN_ALL_TESTS();
}
