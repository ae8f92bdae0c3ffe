#pragma once
// A UI that adds a note (the line being read) to every message box of the
// routines it is handed to, such as the angle parsers.

#include <string>

#include "platform/Ui.h"

namespace zv {

class LineNoteUi : public Ui {
 public:
  LineNoteUi(Ui& inner, size_t lineNo) : inner_(inner), lineNo_(lineNo) {}
  Answer message(const std::string& text, Icon icon, Buttons buttons,
                 const std::string& title) override {
    return inner_.message(text + "\r\nError on line " + std::to_string(lineNo_) + ".", icon,
                          buttons, title);
  }
  std::optional<std::string> input(const std::string& prompt, const std::string& title,
                                   const std::string& defaultText) override {
    return inner_.input(prompt, title, defaultText);
  }
  void viewText(const std::string& path, const std::string& typeDescription) override {
    inner_.viewText(path, typeDescription);
  }
  bool openEditor(const std::string& path, const std::string& typeDescription,
                  EditorMode mode) override {
    return inner_.openEditor(path, typeDescription, mode);
  }
  std::optional<std::string> chooseFile(const FileDialogRequest& request) override {
    return inner_.chooseFile(request);
  }

 private:
  Ui& inner_;
  size_t lineNo_;
};

}  // namespace zv
