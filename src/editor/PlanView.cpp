#include "editor/PlanView.h"

#include <QAction>
#include <QApplication>
#include <QFileInfo>
#include <QKeyEvent>
#include <QLabel>
#include <QMenu>
#include <QMenuBar>
#include <QMouseEvent>
#include <QPageSize>
#include <QPainter>
#include <QPainterPath>
#include <QPdfWriter>
#include <QPlainTextEdit>
#include <QScrollBar>
#include <QSplitter>
#include <QStatusBar>
#include <QWheelEvent>
#include <algorithm>
#include <cmath>
#include <fstream>

#include "app/AppContext.h"
#include "app/FileTypes.h"
#include "platform/Ui.h"
#include "platform/qt/Controls.h"

namespace zv {

namespace {

const QColor kBackground(255, 255, 255);
const QColor kPointColour(200, 30, 30);
const QColor kChainColour(30, 90, 200);
const QColor kTextColour(0, 0, 0);
constexpr int kSymbol = 5;            // side of a point symbol in pixels
constexpr double kMarginPixels = 60;  // room for a name: fitting, and drawing beyond the view
constexpr double kHitPixels = 6;
constexpr double kClickSlop = 3;  // a press that moves less is a click
constexpr double kZoomStep = 1.5;

// Cuts the segment a-b to the rectangle; false when nothing is left.
bool ClipSegment(QPointF& a, QPointF& b, const QRectF& r) {
  double t0 = 0, t1 = 1;
  const double dx = b.x() - a.x(), dy = b.y() - a.y();
  const double p[4] = {-dx, dx, -dy, dy};
  const double q[4] = {a.x() - r.left(), r.right() - a.x(), a.y() - r.top(), r.bottom() - a.y()};
  for (int i = 0; i < 4; ++i) {
    if (p[i] == 0) {
      if (q[i] < 0) return false;
      continue;
    }
    const double t = q[i] / p[i];
    if (p[i] < 0) {
      if (t > t1) return false;
      t0 = std::max(t0, t);
    } else {
      if (t < t0) return false;
      t1 = std::min(t1, t);
    }
  }
  const QPointF start = a;
  a = start + QPointF(dx, dy) * t0;
  b = start + QPointF(dx, dy) * t1;
  return true;
}

QString CoordinateText(double v, bool geographic) {
  return QString::number(v, 'f', geographic ? 6 : 3);
}

}  // namespace

PlanView::PlanView(QWidget* parent) : QWidget(parent) {
  setMouseTracking(true);
  setFocusPolicy(Qt::StrongFocus);
  setAttribute(Qt::WA_OpaquePaintEvent);
  setMinimumSize(120, 90);
}

void PlanView::setModel(PlanModel model) {
  model_ = std::move(model);
  fitAll();
}

PlanTransform PlanView::transform() const {
  PlanTransform t = view_;
  t.width = width();
  t.height = height();
  return t;
}

PlanTransform& PlanView::current() {
  view_.width = width();
  view_.height = height();
  return view_;
}

void PlanView::setView(double centerX, double centerY, double scale) {
  current();
  view_.centerX = centerX;
  view_.centerY = centerY;
  view_.scale = std::clamp(scale, PlanTransform::kMinScale, PlanTransform::kMaxScale);
  keepFitted_ = false;
  update();
}

void PlanView::fitAll() {
  current().fit(model_.bounds(), kMarginPixels);
  keepFitted_ = true;
  update();
}

void PlanView::zoomBy(double factor) {
  current().zoomAbout(width() / 2.0, height() / 2.0, factor);
  keepFitted_ = false;
  update();
}

void PlanView::setLabels(bool on) {
  if (labels_ == on) return;
  labels_ = on;
  emit labelsChanged(on);
  update();
}

void PlanView::resizeEvent(QResizeEvent*) {
  // Until the user moves the view, it follows the window's size.
  if (keepFitted_) current().fit(model_.bounds(), kMarginPixels);
}

void PlanView::paintEvent(QPaintEvent*) {
  QPainter p(this);
  render(p, current(), frame_);
}

void PlanView::render(QPainter& p, const PlanTransform& view, PlanFrame& frame) {
  p.fillRect(QRect(0, 0, view.width, view.height), kBackground);
  if (model_.size() == 0) {
    p.setPen(kTextColour);
    p.drawText(QRect(0, 0, view.width, view.height), Qt::AlignCenter,
               "No points with coordinates to draw.");
    return;
  }
  model_.query(view, kDetailLimit, kMarginPixels, frame);
  p.setRenderHint(QPainter::Antialiasing, false);
  drawChains(p, view);
  drawPoints(p, view, frame);
  p.setRenderHint(QPainter::Antialiasing, true);
  drawNorthArrow(p, view);
  drawScaleBar(p, view);
}

void PlanView::drawChains(QPainter& p, const PlanTransform& view) {
  const PlanRect visible = view.visible(kMarginPixels);
  const QRectF clip(-kMarginPixels, -kMarginPixels, view.width + 2 * kMarginPixels,
                    view.height + 2 * kMarginPixels);
  lines_.clear();
  for (const PlanModel::Chain& chain : model_.chains()) {
    if (!chain.bounds.intersects(visible)) continue;
    for (size_t k = 1; k < chain.points.size(); ++k) {
      const std::uint32_t i = chain.points[k - 1], j = chain.points[k];
      QPointF a(view.screenX(model_.x(i)), view.screenY(model_.y(i)));
      QPointF b(view.screenX(model_.x(j)), view.screenY(model_.y(j)));
      if (ClipSegment(a, b, clip)) lines_.append(QLineF(a, b));
    }
  }
  p.setPen(QPen(kChainColour, 2));
  p.drawLines(lines_);
}

void PlanView::drawPoints(QPainter& p, const PlanTransform& view, const PlanFrame& frame) {
  if (!frame.detailed) {
    // The mask as an image with a two-colour table, without a copy.
    QImage mask(frame.mask.data(), view.width, view.height, frame.stride, QImage::Format_Indexed8);
    mask.setColorTable({qRgba(0, 0, 0, 0), kPointColour.rgba()});
    p.drawImage(0, 0, mask);
    return;
  }
  for (std::uint32_t i : frame.points) {
    const int sx = static_cast<int>(std::floor(view.screenX(model_.x(i))));
    const int sy = static_cast<int>(std::floor(view.screenY(model_.y(i))));
    p.fillRect(sx - kSymbol / 2, sy - kSymbol / 2, kSymbol, kSymbol, kPointColour);
  }
  if (!labels_) return;
  p.setPen(kTextColour);
  const QFontMetrics metrics(p.font());
  for (std::uint32_t i : frame.points) {
    const int sx = static_cast<int>(std::floor(view.screenX(model_.x(i))));
    const int sy = static_cast<int>(std::floor(view.screenY(model_.y(i))));
    p.drawText(sx + kSymbol, sy - kSymbol + metrics.ascent() / 2,
               QString::fromStdString(model_.name(i)));
  }
}

void PlanView::drawNorthArrow(QPainter& p, const PlanTransform& view) {
  const double x = view.width - 28, top = 14, bottom = 58;
  QPainterPath head;
  head.moveTo(x, top + 14);
  head.lineTo(x - 8, top + 26);
  head.lineTo(x, top);
  head.lineTo(x + 8, top + 26);
  head.closeSubpath();
  p.setPen(QPen(kTextColour, 1.5));
  p.drawLine(QPointF(x, top + 14), QPointF(x, bottom));
  p.setBrush(kTextColour);
  p.drawPath(head);
  p.setBrush(Qt::NoBrush);
  QFont bold = p.font();
  bold.setBold(true);
  p.save();
  p.setFont(bold);
  p.drawText(QRectF(x - 20, bottom, 40, 20), Qt::AlignHCenter | Qt::AlignTop, "N");
  p.restore();
}

void PlanView::drawScaleBar(QPainter& p, const PlanTransform& view) {
  const double length = NiceLength(view.width / 4.0 / view.scale);
  if (length <= 0) return;
  const double pixels = length * view.scale;
  const double x = 16, y = view.height - 16;
  p.setPen(QPen(kTextColour, 2));
  p.drawLine(QPointF(x, y), QPointF(x + pixels, y));
  p.drawLine(QPointF(x, y - 5), QPointF(x, y + 3));
  p.drawLine(QPointF(x + pixels, y - 5), QPointF(x + pixels, y + 3));
  p.drawText(QPointF(x, y - 8), QString::fromStdString(ScaleLabel(length, model_.unit())));
}

PlanTransform PlanView::viewFor(int w, int h) const {
  PlanTransform t = transform();
  if (t.width > 0 && t.height > 0) t.scale *= std::min(double(w) / t.width, double(h) / t.height);
  t.width = w;
  t.height = h;
  return t;
}

QImage PlanView::toImage(int width, int height) {
  QImage image(width, height, QImage::Format_ARGB32_Premultiplied);
  QPainter p(&image);
  PlanFrame frame;
  render(p, viewFor(width, height), frame);
  return image;
}

bool PlanView::exportPng(const QString& path) {
  return toImage(width(), height()).save(path, "PNG");
}

bool PlanView::exportPdf(const QString& path, const QString& title) {
  QPdfWriter writer(path);
  writer.setTitle(title);
  writer.setCreator(kAppTitle);
  writer.setPageSize(QPageSize(QPageSize::A4));
  writer.setPageOrientation(width() >= height() ? QPageLayout::Landscape : QPageLayout::Portrait);
  writer.setResolution(150);
  QPainter p;
  if (!p.begin(&writer)) return false;
  const QRect page = writer.pageLayout().paintRectPixels(writer.resolution());
  PlanFrame frame;
  render(p, viewFor(page.width(), page.height()), frame);
  return p.end();
}

void PlanView::mousePressEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return;
  pressAt_ = lastAt_ = event->position();
  dragging_ = false;
}

void PlanView::mouseMoveEvent(QMouseEvent* event) {
  const QPointF at = event->position();
  current();
  emit pointerMoved(view_.worldX(at.x()), view_.worldY(at.y()));
  if (!(event->buttons() & Qt::LeftButton)) return;
  if (!dragging_ && (at - pressAt_).manhattanLength() < kClickSlop) return;
  dragging_ = true;
  view_.panBy(at.x() - lastAt_.x(), at.y() - lastAt_.y());
  lastAt_ = at;
  keepFitted_ = false;
  setCursor(Qt::ClosedHandCursor);
  update();
}

void PlanView::mouseReleaseEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return;
  unsetCursor();
  if (dragging_) {
    dragging_ = false;
    return;
  }
  const QPointF at = event->position();
  current();
  if (auto i = model_.hit(view_.worldX(at.x()), view_.worldY(at.y()), kHitPixels / view_.scale))
    emit pointClicked(*i);
}

void PlanView::wheelEvent(QWheelEvent* event) {
  const double steps = event->angleDelta().y() / 120.0;
  if (steps == 0) return;
  const QPointF at = event->position();
  current().zoomAbout(at.x(), at.y(), std::pow(1.25, steps));
  keepFitted_ = false;
  update();
}

void PlanView::keyPressEvent(QKeyEvent* event) {
  const double stepX = width() / 8.0, stepY = height() / 8.0;
  current();
  switch (event->key()) {
    case Qt::Key_Left:
      view_.panBy(stepX, 0);
      break;
    case Qt::Key_Right:
      view_.panBy(-stepX, 0);
      break;
    case Qt::Key_Up:
      view_.panBy(0, stepY);
      break;
    case Qt::Key_Down:
      view_.panBy(0, -stepY);
      break;
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      zoomBy(kZoomStep);
      return;
    case Qt::Key_Minus:
      zoomBy(1 / kZoomStep);
      return;
    case Qt::Key_F:
    case Qt::Key_Home:
      fitAll();
      return;
    case Qt::Key_L:
      setLabels(!labels_);
      return;
    default:
      QWidget::keyPressEvent(event);
      return;
  }
  keepFitted_ = false;
  update();
}

PlanWindow::PlanWindow(Ui& ui, PlanModel model, const QString& path, Records records,
                       QWidget* parent)
    : QMainWindow(parent), ui_(ui), path_(path), records_(records) {
  setObjectName("frmPlanView");
  setWindowTitle("Plan View - " + path);
  view_ = new PlanView(this);
  view_->setObjectName("picPlan");
  record_ = new QPlainTextEdit(this);
  record_->setObjectName("txtPlanRecord");
  record_->setReadOnly(true);
  record_->setLineWrapMode(QPlainTextEdit::NoWrap);
  QFont mono("Monospace");
  mono.setStyleHint(QFont::TypeWriter);
  record_->setFont(mono);
  record_->hide();
  auto* split = new QSplitter(this);
  split->addWidget(view_);
  split->addWidget(record_);
  split->setStretchFactor(0, 1);
  setCentralWidget(split);

  position_ = new QLabel(statusBar());
  position_->setObjectName("lblPlanPosition");
  statusBar()->addWidget(position_, 1);
  auto* count = new QLabel(statusBar());
  count->setText(QString::number(model.size()) + " points");
  statusBar()->addPermanentWidget(count);

  const bool geographic = model.geographic();
  view_->setModel(std::move(model));

  auto add = [this](QMenu* menu, const char* name, const QString& text, auto slot,
                    QKeySequence keys = {}) {
    return AddAction(menu, this, name, text, slot, keys);
  };
  QMenu* file = menuBar()->addMenu("&File");
  add(file, "mnuPlanExportPng", "Export &PNG...", &PlanWindow::exportPng);
  add(file, "mnuPlanExportPdf", "Export P&DF...", &PlanWindow::exportPdf);
  file->addSeparator();
  add(file, "mnuPlanClose", "&Close", &QWidget::close, QKeySequence::Close);
  QMenu* viewMenu = menuBar()->addMenu("&View");
  add(
      viewMenu, "mnuPlanFit", "&Fit", [this] { view_->fitAll(); }, QKeySequence(Qt::Key_F));
  add(
      viewMenu, "mnuPlanZoomIn", "Zoom &In", [this] { view_->zoomBy(kZoomStep); },
      QKeySequence(Qt::Key_Plus));
  add(
      viewMenu, "mnuPlanZoomOut", "Zoom &Out", [this] { view_->zoomBy(1 / kZoomStep); },
      QKeySequence(Qt::Key_Minus));
  QAction* labels = add(
      viewMenu, "mnuPlanLabels", "Point &Names", [this](bool on) { view_->setLabels(on); },
      QKeySequence(Qt::Key_L));
  labels->setCheckable(true);
  labels->setChecked(view_->labels());
  connect(view_, &PlanView::labelsChanged, labels, &QAction::setChecked);

  connect(view_, &PlanView::pointClicked, this, &PlanWindow::showRecord);
  connect(view_, &PlanView::pointerMoved, this, [this, geographic](double x, double y) {
    position_->setText(
        geographic
            ? "Longitude " + CoordinateText(x, true) + "  Latitude " + CoordinateText(y, true)
            : "Easting " + CoordinateText(x, false) + "  Northing " + CoordinateText(y, false));
  });
  resize(1100, 700);
  view_->setFocus();
}

QString PlanWindow::recordText(std::uint32_t planIndex) {
  const PlanModel& m = view_->model();
  const std::uint32_t source = m.sourceIndex(planIndex);
  if (records_ != Records::None && !spansRead_) {
    spansRead_ = true;
    std::ifstream in(path_.toStdString(), std::ios::binary);
    if (in) spans_ = PointRecordSpans(in, records_ == Records::Chains);
  }
  if (source < spans_.size()) {
    const std::string text = RecordViewText(path_.toStdString(), spans_[source]);
    if (!text.empty()) return QString::fromStdString(text);
  }
  const bool geographic = m.geographic();
  return QString::fromStdString(m.name(planIndex)) + "\n" +
         CoordinateText(m.x(planIndex), geographic) + "  " +
         CoordinateText(m.y(planIndex), geographic);
}

void PlanWindow::showRecord(std::uint32_t planIndex) {
  record_->setPlainText(recordText(planIndex));
  if (record_->isHidden()) {
    record_->show();
    auto* split = static_cast<QSplitter*>(centralWidget());
    // Room for a record line (under 80 characters), at most half the window.
    const int total = split->width();
    const int wanted = QFontMetrics(record_->font()).horizontalAdvance(QString(81, '0')) +
                       record_->verticalScrollBar()->sizeHint().width() + 4 * record_->frameWidth();
    const int panel = std::min(wanted, total / 2);
    split->setSizes({total - panel, panel});
  }
}

void PlanWindow::exportPng() {
  exportTo(false);
}

void PlanWindow::exportPdf() {
  exportTo(true);
}

void PlanWindow::exportTo(bool pdf) {
  const QFileInfo info(path_);
  auto chosen = ui_.chooseFile({FileDialogKind::Save, pdf ? "Export PDF" : "Export PNG",
                                pdf ? "PDF Files (*.pdf)|*.pdf" : "PNG Images (*.png)|*.png",
                                info.absolutePath().toStdString()});
  if (!chosen) return;
  const QString out = QString::fromStdString(*chosen);
  const bool ok = pdf ? view_->exportPdf(out, windowTitle()) : view_->exportPng(out);
  if (!ok) ui_.exclaim("The file '" + *chosen + "' could not be written.");
}

std::string PlanSourcePath(const std::string& editorPath) {
  std::string_view p(editorPath);
  if (p.ends_with(".rec") || p.ends_with(".lst")) p.remove_suffix(4);
  return std::string(p);
}

namespace {

PlanWindow::Records RecordsOf(const QString& extension) {
  if (extension == "CTL") return PlanWindow::Records::Control;
  if (extension == "PAC" || extension == "PRJ" || extension == "EDI" || extension == "CAL")
    return PlanWindow::Records::Chains;
  return PlanWindow::Records::None;
}

QString UpperSuffix(const std::string& path) {
  return QFileInfo(QString::fromStdString(path)).suffix().toUpper();
}

}  // namespace

bool HasPlanView(const std::string& path) {
  return RecordsOf(UpperSuffix(PlanSourcePath(path))) != PlanWindow::Records::None;
}

QWidget* OpenPlanView(Ui& ui, const std::string& editorPath) {
  const std::string path = PlanSourcePath(editorPath);
  const QString extension = UpperSuffix(path);
  const PlanWindow::Records records = RecordsOf(extension);
  const FileType* type = nullptr;
  for (const FileType& t : FileTypes())
    if (records != PlanWindow::Records::None && t.reader &&
        QString::fromStdString(TypePattern(t.name)).toUpper() == "*." + extension)
      type = &t;
  if (!type) {
    ui.exclaim("There is no plan view of the file '" + path + "'.");
    return nullptr;
  }
  PlanModel model;
  {
    // The work area holds whole point records: it goes once the plan is made.
    AppContext ctx(ui, std::string());
    ui.setBusy(true);
    const bool read = type->reader(ctx, path);
    if (read)
      model = PlanModel::Build(ctx.work.InputHeader, ctx.work.InputPoints, ctx.work.InputChains);
    ui.setBusy(false);
    if (!read) return nullptr;
  }
  auto* window = new PlanWindow(ui, std::move(model), QString::fromStdString(path), records);
  window->setAttribute(Qt::WA_DeleteOnClose);
  window->show();
  return window;
}

}  // namespace zv
