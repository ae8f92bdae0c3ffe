#pragma once
// Console implementation of the UI seam for runs without a display.
// Boxes go to the error stream, answers come from the input stream,
// viewed files go to the output stream.

#include <iosfwd>

#include "platform/Ui.h"

namespace zv {

// Each CR LF of a text becomes a line break.
std::string WithLineBreaks(const std::string& text);

class ConsoleUi : public Ui {
 public:
  ConsoleUi(std::istream& in, std::ostream& out, std::ostream& err);

  Answer message(const std::string& text, Icon icon, Buttons buttons,
                 const std::string& title) override;
  std::optional<std::string> input(const std::string& prompt, const std::string& title,
                                   const std::string& defaultText) override;
  void viewText(const std::string& path, const std::string& typeDescription) override;
  // A viewer writes the file as viewText does; an editor needs a display.
  bool openEditor(const std::string& path, const std::string& typeDescription,
                  EditorMode mode) override;
  // Reports that a file dialog needs a display; always nullopt.
  std::optional<std::string> chooseFile(const FileDialogRequest& request) override;
  // Stops the run after SIGINT or SIGTERM once StopOnSignals was called.
  RunProgress* progress() override { return &stop_; }

 private:
  SignalStop stop_;
  std::istream& in_;
  std::ostream& out_;
  std::ostream& err_;
};

}  // namespace zv
