#pragma once
// frmCoordinateResults: the single-point report, read-only in a fixed-pitch
// font with tab stops every eight characters, and its printout.

#include <QDialog>
#include <string>

class QPlainTextEdit;
class QPrinter;

namespace zv {

class CoordinateResultsDialog : public QDialog {
  Q_OBJECT

 public:
  explicit CoordinateResultsDialog(const std::string& report, QWidget* parent = nullptr);

  // A preview of the printout, from which it goes to the printer.
  void print();
  // The text line by line in the text box's font, tabs expanded to the same
  // columns, pages as they fill; one document. False when the printer could
  // not be opened.
  bool printTo(QPrinter& printer) const;

 private:
  QPlainTextEdit* text_;
};

}  // namespace zv
