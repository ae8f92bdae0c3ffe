#pragma once
// A read-only view of a text file of any size. The file is memory-mapped,
// its lines are indexed by a background thread, and only the lines in sight
// are decoded and painted, so the first screen shows at once. A line is
// UTF-8 when it is valid UTF-8, else Latin-1; tabs stop every 8 columns.

#include <QAbstractScrollArea>
#include <QTimer>
#include <atomic>
#include <compare>
#include <memory>
#include <optional>
#include <string>
#include <thread>

#include "platform/LineIndex.h"

class QPrinter;

namespace zv {

class RunProgress;

class LineView : public QAbstractScrollArea {
  Q_OBJECT

 public:
  // A place in the text: a line and a character of it, both from 0.
  struct Position {
    qint64 line = 0;
    qsizetype column = 0;
    auto operator<=>(const Position&) const = default;
  };

  explicit LineView(QWidget* parent = nullptr);
  ~LineView() override;

  // Shows the file from its first line; false with the system's reason.
  bool open(const QString& path, QString& error);
  void close();

  // Lines indexed so far (all once indexed()); an empty text has none.
  qint64 lineCount() const;
  bool indexed() const;
  // Indexes the rest now, on this thread.
  void finishIndex();
  // The whole line, decoded.
  QString lineText(qint64 line) const;

  Position caret() const { return caret_; }
  Position anchor() const { return anchor_; }
  bool hasSelection() const { return caret_ != anchor_; }
  // Selects from anchor to caret and scrolls the caret into sight.
  void setSelection(Position anchor, Position caret);
  QString selectedText() const;
  void selectAll();
  void copy() const;

  // The next occurrence at or after `from` (UTF-16 comparison, whole words
  // bounded by characters that are not letters or digits), or nullopt.
  // Reports the bytes searched to the progress, which may stop it.
  std::optional<Position> search(const QString& needle, Position from, bool matchCase,
                                 bool wholeWords, RunProgress* progress) const;

  // Writes every line with CR LF; false with the writer's error.
  bool write(const std::string& path, std::string& error) const;
  void printTo(QPrinter& printer) const;

 signals:
  void caretMoved();

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;

 private:
  void stopIndexing();
  void updateScrollBars();
  int lineHeight() const;
  int charWidth() const;
  int visibleLines() const;
  Position clamp(Position p) const;
  Position positionAt(const QPoint& point) const;
  void moveCaret(Position to, bool extend);
  void ensureCaretVisible();

  MappedFile file_;
  std::unique_ptr<LineIndex> index_;
  std::thread indexer_;
  std::atomic<bool> stop_{false};
  QTimer follow_;  // takes in the lines indexed meanwhile
  Position caret_;
  Position anchor_;
};

// The first occurrence of needle in text at or after `from`, -1 when none.
// A whole word is bounded by characters that are not letters or digits.
qsizetype FindInLine(const QString& text, const QString& needle, qsizetype from,
                     Qt::CaseSensitivity cs, bool wholeWords);

}  // namespace zv
