// zv_screenshots: opens the Translate window on an application folder,
// translates a sample and shows the output in the viewer, saving a PNG of
// each window. usage: zv_screenshots appFolder input.ctl outputFolder pngFolder

#include <QApplication>
#include <QComboBox>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QTest>
#include <cstdio>

#include "app/AppContext.h"
#include "app/dialogs/TranslateWindow.h"
#include "editor/FindReplaceDialog.h"
#include "editor/TextEditorWindow.h"
#include "platform/ScriptedUi.h"

namespace {

bool Save(QWidget& w, const QString& folder, const QString& name) {
  QApplication::processEvents();
  QTest::qWait(200);
  const QString path = folder + "/" + name;
  const bool ok = w.grab().save(path);
  std::printf("%s %s\n", ok ? "wrote" : "could not write", qPrintable(path));
  return ok;
}

}  // namespace

int main(int argc, char** argv) {
  if (argc != 5) {
    std::fprintf(stderr, "usage: zv_screenshots appFolder input.ctl outputFolder pngFolder\n");
    return 2;
  }
  QApplication app(argc, argv);
  const QString input = argv[2], outFolder = argv[3], pngs = argv[4];
  zv::ScriptedUi ui;  // no message boxes in the way
  zv::AppContext ctx(ui, argv[1]);
  ctx.startup.defaultInputFolder = QFileInfo(input).absolutePath().toStdString() + "/";
  ctx.startup.defaultOutputFolder = outFolder.toStdString() + "/";
  ctx.startup.configurationFolder = ctx.appPath("TRNFiles");

  zv::TranslateWindow window(ctx);
  window.start();
  auto* inputType = window.findChild<QComboBox*>("cmbInputType");
  inputType->setCurrentIndex(inputType->findText("VORN Control Files (*.CTL)"));
  auto* output = window.findChild<QComboBox*>("cmbOutputType");
  output->setCurrentIndex(output->findText("VORN Points and Chains Files (*.PAC)"));
  window.findChild<QLineEdit*>("txtInputLocation")->setText(input);
  const QString pac = outFolder + "/sample.PAC";
  window.findChild<QLineEdit*>("txtOutputLocation")->setText(pac);
  bool ok = Save(window, pngs, "translate-window.png");

  QTest::mouseClick(window.findChild<QPushButton*>("cmdTranslateOK"), Qt::LeftButton);
  for (const auto& box : ui.boxes) std::printf("message: %s\n", box.text.c_str());

  zv::TextEditorWindow viewer(ui);
  viewer.showTextEditor(pac, "VORN Points and Chains Files (*.PAC)", true);
  viewer.show();
  ok = Save(viewer, pngs, "editor-list-view.png") && ok;
  viewer.viewRecord();
  ok = Save(viewer, pngs, "editor-record-view.png") && ok;
  viewer.viewList();

  zv::TextEditorWindow editor(ui);
  editor.showTextEditor(input, "VORN Control Files (*.CTL)", false);
  editor.resize(640, 420);
  editor.show();
  zv::FindReplaceDialog* find = editor.findDialog();
  find->showReplace();
  find->findChild<QLineEdit*>("txtFRFind")->setText("CTLMON");
  find->findChild<QLineEdit*>("txtFRReplace")->setText("CONTROL");
  find->find();
  ok = Save(editor, pngs, "editor-find.png") && ok;
  ok = Save(*find, pngs, "find-replace.png") && ok;
  return ok ? 0 : 1;
}
