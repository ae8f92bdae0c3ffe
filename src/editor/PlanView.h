#pragma once
// frmPlanView: the plan of a control, points-and-chains or project file.
// Points are drawn as symbols with their names, chains as lines through
// their points, with a north arrow and a scale bar. Drag or the arrow keys
// pan, the wheel zooms about the pointer, + and - zoom, F fits the whole
// file, L switches the names; a click on a point shows its record.

#include <QMainWindow>
#include <QVector>
#include <QWidget>
#include <cstdint>
#include <string>
#include <vector>

#include "survey/PlanModel.h"

class QAction;
class QLabel;
class QLineF;
class QPainter;
class QPlainTextEdit;

namespace zv {

class Ui;

// The drawing surface.
class PlanView : public QWidget {
  Q_OBJECT

 public:
  explicit PlanView(QWidget* parent = nullptr);

  void setModel(PlanModel model);
  const PlanModel& model() const { return model_; }

  // The current view; the transform's size follows the widget.
  PlanTransform transform() const;
  void setView(double centerX, double centerY, double scale);
  void fitAll();
  void zoomBy(double factor);  // about the middle of the view
  void setLabels(bool on);
  bool labels() const { return labels_; }
  // True when the last frame drew symbols, false when it drew the coarse mask.
  bool lastFrameDetailed() const { return frame_.detailed; }

  // Draws the plan of `view` (its width and height are the target's).
  void render(QPainter& painter, const PlanTransform& view, PlanFrame& frame);
  // The current view drawn at another size, keeping its centre and showing
  // at least the same extent.
  PlanTransform viewFor(int width, int height) const;
  QImage toImage(int width, int height);
  bool exportPng(const QString& path);
  bool exportPdf(const QString& path, const QString& title);

  // More points than this in view are drawn as a mask without names.
  static constexpr std::size_t kDetailLimit = 10000;

 signals:
  void pointClicked(std::uint32_t planIndex);
  void pointerMoved(double x, double y);
  void labelsChanged(bool on);

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;
  void wheelEvent(QWheelEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  // The view with the widget's current size.
  PlanTransform& current();
  void drawChains(QPainter& p, const PlanTransform& view);
  void drawPoints(QPainter& p, const PlanTransform& view, const PlanFrame& frame);
  void drawNorthArrow(QPainter& p, const PlanTransform& view);
  void drawScaleBar(QPainter& p, const PlanTransform& view);

  PlanModel model_;
  PlanTransform view_;
  PlanFrame frame_;
  QVector<QLineF> lines_;  // chain segments of a frame, reused
  bool labels_ = true;
  bool keepFitted_ = true;  // the whole plan follows the size until the view is moved
  bool dragging_ = false;
  QPointF pressAt_, lastAt_;
};

// The window around the view: menus, a record panel and a status bar.
class PlanWindow : public QMainWindow {
  Q_OBJECT

 public:
  enum class Records { None, Control, Chains };

  PlanWindow(Ui& ui, PlanModel model, const QString& path, Records records,
             QWidget* parent = nullptr);

  PlanView* view() const { return view_; }
  QPlainTextEdit* recordPanel() const { return record_; }
  // The record view text of a point, or its name and position.
  QString recordText(std::uint32_t planIndex);
  void showRecord(std::uint32_t planIndex);
  void exportPng();
  void exportPdf();

 private:
  void exportTo(bool pdf);

  Ui& ui_;
  PlanView* view_;
  QPlainTextEdit* record_;
  QLabel* position_;
  QString path_;
  Records records_;
  bool spansRead_ = false;
  std::vector<RecordSpan> spans_;
};

// The tagged file behind an editor path (".rec" and ".lst" of the listing
// views removed).
std::string PlanSourcePath(const std::string& editorPath);

// True for the files a plan can be drawn of: control, points-and-chains and
// project files (extensions in any letter case).
bool HasPlanView(const std::string& path);

// Reads the file with the reader of its extension and opens a plan window
// on it, shown at once and deleted when closed; nullptr (the reader has
// shown why) when the file cannot be read.
QWidget* OpenPlanView(Ui& ui, const std::string& path);

}  // namespace zv
