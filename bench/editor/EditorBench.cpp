// The viewer on a large file and Replace All in the editor. Run with
// QT_QPA_PLATFORM=offscreen (the default here); the file size in MB is the
// argument of the view benchmarks.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <QApplication>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>

#include "editor/FindReplaceDialog.h"
#include "editor/LineView.h"
#include "platform/LineIndex.h"
#include "platform/ScriptedUi.h"

namespace zv {
namespace {

// A control file of about `mb` MB whose last line is "PD:NEEDLE".
const std::string& LargeFile(int mb) {
  static std::string path;
  static int made = 0;
  if (made == mb) return path;
  path = (std::filesystem::temp_directory_path() /
          ("zv-bench-editor-" + std::to_string(getpid()) + ".ctl"))
             .string();
  std::ofstream out(path, std::ios::binary);
  std::string chunk;
  char line[96];
  const size_t target = static_cast<size_t>(mb) << 20;
  for (size_t written = 0, i = 0; written < target; ++i) {
    const int n = std::snprintf(line, sizeof line,
                                "AC:OS\r\nPN:%zu\r\nYC:%zu.1234\r\nXC:%zu.5678\r\nPD:IRON PIN\r\n",
                                i, 200000 + i, 700000 + i);
    chunk.append(line, static_cast<size_t>(n));
    if (chunk.size() > (1 << 20)) {
      out << chunk;
      written += chunk.size();
      chunk.clear();
    }
  }
  out << chunk << "PD:NEEDLE";
  made = mb;
  return path;
}

// Opening: the mapping, the first step of the index and the first screen.
void BM_ViewerOpen(benchmark::State& state) {
  const QString path = QString::fromStdString(LargeFile(static_cast<int>(state.range(0))));
  LineView view;
  view.resize(800, 600);
  view.show();
  for (auto _ : state) {
    QString error;
    if (!view.open(path, error)) state.SkipWithError("open failed");
    view.viewport()->repaint();
    QApplication::processEvents();
  }
}
BENCHMARK(BM_ViewerOpen)->Arg(100)->Unit(benchmark::kMillisecond)->UseRealTime();

void BM_LineIndexWholeFile(benchmark::State& state) {
  MappedFile file;
  file.open(LargeFile(static_cast<int>(state.range(0))));
  for (auto _ : state) {
    LineIndex index(file.bytes());
    index.build();
    benchmark::DoNotOptimize(index.lineCount());
  }
  state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * file.bytes().size()));
}
BENCHMARK(BM_LineIndexWholeFile)->Arg(100)->Unit(benchmark::kMillisecond);

// Find of the last line from the first, without and with letter case.
void BM_ViewerFindLastLine(benchmark::State& state) {
  LineView view;
  QString error;
  view.open(QString::fromStdString(LargeFile(static_cast<int>(state.range(0)))), error);
  view.finishIndex();
  const bool matchCase = state.range(1) != 0;
  for (auto _ : state) {
    const bool found = view.search("needle", {}, matchCase, false, nullptr).has_value();
    if (found == matchCase) state.SkipWithError("unexpected result");
  }
}
BENCHMARK(BM_ViewerFindLastLine)->Args({100, 0})->Args({100, 1})->Unit(benchmark::kMillisecond);

// Replace All of 300,000 occurrences in the editor's text box.
void BM_ReplaceAll(benchmark::State& state) {
  const int hits = static_cast<int>(state.range(0));
  QString text;
  for (int i = 0; i < hits; ++i) text += QString("PN:%1\nFE:TREE\n").arg(i);
  ScriptedUi ui;
  QPlainTextEdit box;
  box.resize(800, 600);
  box.show();
  FindReplaceDialog dialog(ui);
  dialog.setTarget(&box);
  dialog.findChild<QLineEdit*>("txtFRFind")->setText("TREE");
  dialog.findChild<QLineEdit*>("txtFRReplace")->setText("OAK");
  for (auto _ : state) {
    state.PauseTiming();
    box.setPlainText(text);
    state.ResumeTiming();
    if (dialog.replaceAll() != hits) state.SkipWithError("wrong count");
    QApplication::processEvents();  // the text box takes in the change
  }
}
BENCHMARK(BM_ReplaceAll)->Arg(300000)->Unit(benchmark::kMillisecond)->UseRealTime();

}  // namespace
}  // namespace zv

int main(int argc, char** argv) {
  if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  QApplication app(argc, argv);
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  std::error_code ec;
  std::filesystem::remove(std::filesystem::temp_directory_path() /
                              ("zv-bench-editor-" + std::to_string(getpid()) + ".ctl"),
                          ec);
  return 0;
}
