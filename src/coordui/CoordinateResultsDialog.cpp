#include "coordui/CoordinateResultsDialog.h"

#include <QFontDatabase>
#include <QFontMetricsF>
#include <QHBoxLayout>
#include <QPainter>
#include <QPlainTextEdit>
#include <QPrintPreviewDialog>
#include <QPrinter>
#include <QPushButton>
#include <QVBoxLayout>

namespace zv {

namespace {

constexpr int kTabColumns = 8;

// Tabs as blanks up to the next stop, so a fixed-pitch printout keeps the
// report's columns.
QString ExpandTabs(const QString& line) {
  QString out;
  for (QChar c : line) {
    if (c == '\t') {
      out += QString(kTabColumns - out.size() % kTabColumns, ' ');
    } else {
      out += c;
    }
  }
  return out;
}

}  // namespace

CoordinateResultsDialog::CoordinateResultsDialog(const std::string& report, QWidget* parent)
    : QDialog(parent) {
  setObjectName("frmCoordinateResults");
  setWindowTitle("Coordinate Conversion Results");
  text_ = new QPlainTextEdit(this);
  text_->setObjectName("txtCoordResults");
  text_->setReadOnly(true);
  text_->setLineWrapMode(QPlainTextEdit::NoWrap);
  text_->setFont(QFontDatabase::systemFont(QFontDatabase::FixedFont));
  text_->setTabStopDistance(kTabColumns *
                            QFontMetricsF(text_->font()).horizontalAdvance(QChar(' ')));
  QString shown = QString::fromStdString(report);
  shown.replace("\r\n", "\n");
  text_->setPlainText(shown);
  const QFontMetricsF metrics(text_->font());
  text_->setMinimumSize(int(metrics.horizontalAdvance(QChar(' ')) * 84),
                        int(metrics.lineSpacing() * 26));

  auto* okButton = new QPushButton("OK", this);
  okButton->setObjectName("cmdCoordResultsOK");
  okButton->setDefault(true);
  auto* printButton = new QPushButton("&Print...", this);
  printButton->setObjectName("cmdCoordResultsPrint");
  printButton->setAutoDefault(false);
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  buttons->addWidget(okButton);
  buttons->addWidget(printButton);
  auto* layout = new QVBoxLayout(this);
  layout->addWidget(text_);
  layout->addLayout(buttons);
  connect(okButton, &QPushButton::clicked, this, &QDialog::accept);
  connect(printButton, &QPushButton::clicked, this, &CoordinateResultsDialog::print);
  okButton->setFocus();
}

void CoordinateResultsDialog::print() {
  QPrinter printer(QPrinter::HighResolution);
  printer.setDocName(windowTitle());
  QPrintPreviewDialog preview(&printer, this);
  connect(&preview, &QPrintPreviewDialog::paintRequested, this,
          [this](QPrinter* target) { printTo(*target); });
  preview.exec();
}

bool CoordinateResultsDialog::printTo(QPrinter& printer) const {
  QPainter painter;
  if (!painter.begin(&printer)) return false;
  // The text box's font name and size, measured on the printer.
  QFont font(text_->font().family());
  font.setPointSizeF(QFontInfo(text_->font()).pointSizeF());
  font.setStyleHint(QFont::TypeWriter);
  painter.setFont(font);
  const QFontMetricsF metrics(painter.font(), &printer);
  const double pageHeight = printer.height();
  double y = 0;
  for (const QString& line : text_->toPlainText().split('\n')) {
    if (y > 0 && y + metrics.lineSpacing() > pageHeight) {
      printer.newPage();
      y = 0;
    }
    painter.drawText(QPointF(0, y + metrics.ascent()), ExpandTabs(line));
    y += metrics.lineSpacing();
  }
  return painter.end();
}

}  // namespace zv
