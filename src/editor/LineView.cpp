#include "editor/LineView.h"

#include <QApplication>
#include <QClipboard>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QPainter>
#include <QPrinter>
#include <QScrollBar>
#include <QStringDecoder>
#include <algorithm>
#include <limits>

#include "platform/Progress.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

constexpr size_t kFirstStep = size_t{1} << 20;  // indexed before the first screen
constexpr size_t kStep = size_t{8} << 20;
constexpr size_t kShownBytes = size_t{1} << 20;  // of a line, on screen
constexpr size_t kPrintedBytes = 4096;
constexpr int kMargin = 4;
constexpr int kTabStop = 8;
constexpr qsizetype kLineEnd = std::numeric_limits<qsizetype>::max();

// At most `limit` bytes, cut before a UTF-8 sequence.
QString Decode(std::string_view bytes, size_t limit) {
  if (bytes.size() > limit) {
    size_t cut = limit;
    for (int i = 0; i < 3 && cut > 0 && (static_cast<unsigned char>(bytes[cut]) & 0xC0) == 0x80;
         ++i)
      --cut;
    bytes = bytes.substr(0, cut);
  }
  const auto size = static_cast<qsizetype>(bytes.size());
  QStringDecoder utf8(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
  QString text = utf8(QByteArrayView(bytes.data(), size));
  return utf8.hasError() ? QString::fromLatin1(bytes.data(), size) : text;
}

QString ExpandTabs(const QString& line) {
  if (!line.contains('\t')) return line;
  QString shown;
  for (QChar c : line) {
    if (c != '\t') {
      shown += c;
      continue;
    }
    do shown += ' ';
    while (shown.size() % kTabStop != 0);
  }
  return shown;
}

// The screen column of character `index`, and back.
qsizetype ScreenColumn(const QString& line, qsizetype index) {
  const qsizetype inLine = std::min(index, line.size());
  if (!line.contains('\t')) return index;
  qsizetype column = 0;
  for (qsizetype i = 0; i < inLine; ++i)
    column = line[i] == '\t' ? (column / kTabStop + 1) * kTabStop : column + 1;
  return column + (index - inLine);
}

qsizetype IndexAtScreenColumn(const QString& line, qsizetype column) {
  qsizetype at = 0;
  for (qsizetype i = 0; i < line.size(); ++i) {
    if (column <= at) return i;
    at = line[i] == '\t' ? (at / kTabStop + 1) * kTabStop : at + 1;
  }
  return line.size();
}

bool IsAscii(const QString& s) {
  return std::all_of(s.begin(), s.end(), [](QChar c) { return c.unicode() < 0x80; });
}

char AsciiLower(char c) {
  return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

// False only when the ASCII needle cannot occur in the line (a line with
// other bytes is decoded and searched in full).
bool MayHold(std::string_view line, std::string_view needle, bool matchCase) {
  if (matchCase) return line.find(needle) != std::string_view::npos;
  if (std::any_of(line.begin(), line.end(), [](char c) { return c & 0x80; })) return true;
  return std::search(line.begin(), line.end(), needle.begin(), needle.end(),
                     [](char a, char b) { return AsciiLower(a) == AsciiLower(b); }) != line.end();
}

}  // namespace

qsizetype FindInLine(const QString& text, const QString& needle, qsizetype from,
                     Qt::CaseSensitivity cs, bool wholeWords) {
  for (qsizetype at = text.indexOf(needle, from, cs); at >= 0;
       at = text.indexOf(needle, at + 1, cs)) {
    const qsizetype end = at + needle.size();
    if (!wholeWords || ((at == 0 || !text[at - 1].isLetterOrNumber()) &&
                        (end == text.size() || !text[end].isLetterOrNumber())))
      return at;
  }
  return -1;
}

LineView::LineView(QWidget* parent) : QAbstractScrollArea(parent) {
  setObjectName("rtbTextViewer");
  QFont mono("Monospace");
  mono.setStyleHint(QFont::TypeWriter);
  setFont(mono);
  setFocusPolicy(Qt::StrongFocus);
  viewport()->setCursor(Qt::IBeamCursor);
  follow_.setInterval(100);
  connect(&follow_, &QTimer::timeout, this, [this] {
    if (indexed()) follow_.stop();
    updateScrollBars();
    viewport()->update();
  });
  index_ = std::make_unique<LineIndex>(std::string_view());
}

LineView::~LineView() {
  stopIndexing();
}

void LineView::stopIndexing() {
  stop_ = true;
  if (indexer_.joinable()) indexer_.join();
  stop_ = false;
  follow_.stop();
}

bool LineView::open(const QString& path, QString& error) {
  close();
  if (!file_.open(path.toStdString())) {
    error = QString::fromStdString(file_.error());
    return false;
  }
  index_ = std::make_unique<LineIndex>(file_.bytes());
  if (!index_->build(kFirstStep)) {
    indexer_ = std::thread([this, index = index_.get()] {
      while (!stop_ && !index->build(kStep)) {
      }
    });
    follow_.start();
  }
  updateScrollBars();
  viewport()->update();
  emit caretMoved();
  return true;
}

void LineView::close() {
  stopIndexing();
  index_ = std::make_unique<LineIndex>(std::string_view());
  file_.close();
  caret_ = anchor_ = {};
  verticalScrollBar()->setValue(0);
  horizontalScrollBar()->setValue(0);
  updateScrollBars();
  viewport()->update();
}

qint64 LineView::lineCount() const {
  return static_cast<qint64>(index_->lineCount());
}

bool LineView::indexed() const {
  return index_->complete();
}

void LineView::finishIndex() {
  if (indexed()) return;
  index_->build();
  updateScrollBars();
}

QString LineView::lineText(qint64 line) const {
  return Decode(index_->line(static_cast<size_t>(line)), std::numeric_limits<size_t>::max());
}

int LineView::lineHeight() const {
  return std::max(1, fontMetrics().lineSpacing());
}

int LineView::charWidth() const {
  return std::max(1, fontMetrics().horizontalAdvance(QLatin1Char('x')));
}

int LineView::visibleLines() const {
  return std::max(1, viewport()->height() / lineHeight());
}

void LineView::updateScrollBars() {
  const qint64 lines = lineCount();
  QScrollBar* v = verticalScrollBar();
  v->setRange(0, static_cast<int>(std::clamp<qint64>(lines - visibleLines(), 0,
                                                     std::numeric_limits<int>::max())));
  v->setPageStep(visibleLines());
  v->setSingleStep(1);
  QScrollBar* h = horizontalScrollBar();
  const qint64 widest = static_cast<qint64>(std::min(index_->longestLine(), kShownBytes));
  const qint64 width = widest * charWidth() + 2 * kMargin;
  h->setRange(0, static_cast<int>(std::clamp<qint64>(width - viewport()->width(), 0,
                                                     std::numeric_limits<int>::max())));
  h->setPageStep(viewport()->width());
  h->setSingleStep(charWidth());
}

void LineView::resizeEvent(QResizeEvent* event) {
  QAbstractScrollArea::resizeEvent(event);
  updateScrollBars();
}

void LineView::paintEvent(QPaintEvent*) {
  QPainter painter(viewport());
  painter.fillRect(viewport()->rect(), palette().base());
  painter.setFont(font());
  const QFontMetrics metrics(font());
  const int h = lineHeight();
  const int w = charWidth();
  const qint64 first = verticalScrollBar()->value();
  const int x0 = kMargin - horizontalScrollBar()->value();  // screen column 0
  const qsizetype firstColumn = std::max(0, -x0 / w);
  const qsizetype columns = viewport()->width() / w + 2;
  const Position from = std::min(anchor_, caret_);
  const Position to = std::max(anchor_, caret_);
  for (int row = 0; row * h < viewport()->height(); ++row) {
    const qint64 line = first + row;
    if (line >= lineCount()) break;
    const QString text = Decode(index_->line(static_cast<size_t>(line)), kShownBytes);
    const QString shown = ExpandTabs(text).mid(firstColumn, columns);
    const int y = row * h;
    const int baseline = y + metrics.ascent();
    const int textX = x0 + static_cast<int>(firstColumn) * w;
    painter.setPen(palette().color(QPalette::Text));
    painter.drawText(textX, baseline, shown);
    if (from != to && line >= from.line && line <= to.line) {
      const qsizetype a = line == from.line ? ScreenColumn(text, from.column) : 0;
      const qsizetype b =
          line == to.line ? ScreenColumn(text, to.column) : ScreenColumn(text, text.size()) + 1;
      const qsizetype left = std::max(a, firstColumn);
      const qsizetype right = std::min(b, firstColumn + columns);
      if (right > left) {
        const QRect band(x0 + static_cast<int>(left) * w, y, static_cast<int>(right - left) * w, h);
        painter.fillRect(band, palette().highlight());
        painter.save();
        painter.setClipRect(band);
        painter.setPen(palette().color(QPalette::HighlightedText));
        painter.drawText(textX, baseline, shown);
        painter.restore();
      }
    }
    if (line == caret_.line && hasFocus()) {
      const int x = x0 + static_cast<int>(ScreenColumn(text, caret_.column)) * w;
      painter.fillRect(QRect(x, y, 1, h), palette().color(QPalette::Text));
    }
  }
}

LineView::Position LineView::clamp(Position p) const {
  const qint64 last = std::max<qint64>(0, lineCount() - 1);
  p.line = std::clamp<qint64>(p.line, 0, last);
  if (p.column > 0) p.column = std::min(p.column, lineText(p.line).size());
  p.column = std::max<qsizetype>(0, p.column);
  return p;
}

LineView::Position LineView::positionAt(const QPoint& point) const {
  const qint64 line = verticalScrollBar()->value() + std::max(0, point.y()) / lineHeight();
  Position p = clamp({line, 0});
  const int x = point.x() - kMargin + horizontalScrollBar()->value();
  const QString text = Decode(index_->line(static_cast<size_t>(p.line)), kShownBytes);
  p.column = IndexAtScreenColumn(text, std::max(0, x + charWidth() / 2) / charWidth());
  return p;
}

void LineView::ensureCaretVisible() {
  QScrollBar* v = verticalScrollBar();
  if (caret_.line < v->value()) {
    v->setValue(static_cast<int>(caret_.line));
  } else if (caret_.line >= v->value() + visibleLines()) {
    updateScrollBars();
    v->setValue(static_cast<int>(caret_.line - visibleLines() + 1));
  }
  QScrollBar* h = horizontalScrollBar();
  const QString text = Decode(index_->line(static_cast<size_t>(caret_.line)), kShownBytes);
  const qint64 x = ScreenColumn(text, caret_.column) * charWidth();
  const int room = viewport()->width() - 2 * kMargin;
  if (x < h->value()) {
    h->setValue(static_cast<int>(std::max<qint64>(0, x - room / 4)));
  } else if (x > h->value() + room) {
    h->setValue(static_cast<int>(std::min<qint64>(x - room + room / 4, h->maximum())));
  }
}

void LineView::setSelection(Position anchor, Position caret) {
  anchor_ = anchor;
  caret_ = caret;
  ensureCaretVisible();
  viewport()->update();
  emit caretMoved();
}

void LineView::moveCaret(Position to, bool extend) {
  setSelection(extend ? anchor_ : to, to);
}

void LineView::selectAll() {
  finishIndex();
  const qint64 last = std::max<qint64>(0, lineCount() - 1);
  setSelection({}, clamp({last, kLineEnd}));
}

QString LineView::selectedText() const {
  const Position from = std::min(anchor_, caret_);
  const Position to = std::max(anchor_, caret_);
  QString text;
  for (qint64 line = from.line; line <= to.line && line < lineCount(); ++line) {
    const QString whole = lineText(line);
    const qsizetype a = line == from.line ? from.column : 0;
    if (line > from.line) text += '\n';
    text += line == to.line ? whole.mid(a, to.column - a) : whole.mid(a);
  }
  return text;
}

void LineView::copy() const {
  if (hasSelection()) QApplication::clipboard()->setText(selectedText());
}

void LineView::keyPressEvent(QKeyEvent* event) {
  const bool extend = event->modifiers() & Qt::ShiftModifier;
  const bool control = event->modifiers() & Qt::ControlModifier;
  Position to = caret_;
  switch (event->key()) {
    case Qt::Key_Up:
      to.line -= 1;
      break;
    case Qt::Key_Down:
      to.line += 1;
      break;
    case Qt::Key_PageUp:
      to.line -= visibleLines();
      break;
    case Qt::Key_PageDown:
      to.line += visibleLines();
      break;
    case Qt::Key_Left:
      if (to.column > 0) {
        to.column -= 1;
      } else if (to.line > 0) {
        to = {to.line - 1, kLineEnd};
      }
      break;
    case Qt::Key_Right:
      if (to.column < lineText(to.line).size()) {
        to.column += 1;
      } else if (to.line + 1 < lineCount()) {
        to = {to.line + 1, 0};
      }
      break;
    case Qt::Key_Home:
      to = control ? Position{} : Position{to.line, 0};
      break;
    case Qt::Key_End:
      if (control) finishIndex();
      to = {control ? lineCount() - 1 : to.line, kLineEnd};
      break;
    default:
      QAbstractScrollArea::keyPressEvent(event);
      return;
  }
  moveCaret(clamp(to), extend);
}

void LineView::mousePressEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return;
  setFocus();
  moveCaret(positionAt(event->position().toPoint()), event->modifiers() & Qt::ShiftModifier);
}

void LineView::mouseMoveEvent(QMouseEvent* event) {
  if (event->buttons() & Qt::LeftButton) moveCaret(positionAt(event->position().toPoint()), true);
}

std::optional<LineView::Position> LineView::search(const QString& needle, Position from,
                                                   bool matchCase, bool wholeWords,
                                                   RunProgress* progress) const {
  if (needle.isEmpty()) return std::nullopt;
  index_->build();
  const Qt::CaseSensitivity cs = matchCase ? Qt::CaseSensitive : Qt::CaseInsensitive;
  const bool ascii = IsAscii(needle);
  const std::string bytes = needle.toStdString();
  const size_t total = index_->text().size();
  const qint64 lines = lineCount();
  for (qint64 line = std::max<qint64>(0, from.line); line < lines; ++line) {
    if (progress && (line & 4095) == 0)
      progress->step(RunStage::Reading, index_->lineStart(static_cast<size_t>(line)), total);
    const std::string_view raw = index_->line(static_cast<size_t>(line));
    if (ascii && !MayHold(raw, bytes, matchCase)) continue;
    const QString text = Decode(raw, std::numeric_limits<size_t>::max());
    const qsizetype at =
        FindInLine(text, needle, line == from.line ? from.column : 0, cs, wholeWords);
    if (at >= 0) return Position{line, at};
  }
  return std::nullopt;
}

bool LineView::write(const std::string& path, std::string& error) const {
  index_->build();
  TextFileWriter writer(path);
  bool ok = writer.open();
  const size_t lines = index_->lineCount();
  for (size_t i = 0; ok && i < lines; ++i) writer.line(index_->line(i));
  ok = ok && writer.commit();
  if (!ok) error = writer.error();
  return ok;
}

void LineView::printTo(QPrinter& printer) const {
  index_->build();
  QPainter painter(&printer);
  const QFont printed(font(), &printer);
  painter.setFont(printed);
  const QFontMetrics metrics(printed, &printer);
  const QRect page = printer.pageLayout().paintRectPixels(printer.resolution());
  painter.setClipRect(page);
  const qint64 perPage = std::max(1, page.height() / std::max(1, metrics.lineSpacing()));
  const qint64 lines = lineCount();
  for (qint64 line = 0; line < lines; ++line) {
    const qint64 row = line % perPage;
    if (line > 0 && row == 0) {
      printer.newPage();
      painter.setClipRect(page);
    }
    const QString text = Decode(index_->line(static_cast<size_t>(line)), kPrintedBytes);
    painter.drawText(page.left(),
                     page.top() + static_cast<int>(row) * metrics.lineSpacing() + metrics.ascent(),
                     ExpandTabs(text));
  }
}

}  // namespace zv
