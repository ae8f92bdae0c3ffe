#pragma once
// Decorators of the UI seam. ForwardingUi passes every call to the UI it
// wraps; a decorator derives from it and overrides only what it changes, so
// no call is dropped.

#include <string>

#include "platform/Ui.h"

namespace zv {

class ForwardingUi : public Ui {
 public:
  explicit ForwardingUi(Ui& inner) : inner_(inner) {}

  Answer message(const std::string& text, Icon icon, Buttons buttons,
                 const std::string& title) override {
    return inner_.message(text, icon, buttons, title);
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
  void setBusy(bool on) override { inner_.setBusy(on); }
  bool hasWindows() const override { return inner_.hasWindows(); }
  RunProgress* progress() override { return inner_.progress(); }

 protected:
  Ui& inner() { return inner_; }

 private:
  Ui& inner_;
};

// Adds the line being read to every message box of the routines it is
// handed to, such as the angle parsers.
class LineNoteUi : public ForwardingUi {
 public:
  LineNoteUi(Ui& inner, size_t lineNo) : ForwardingUi(inner), lineNo_(lineNo) {}
  Answer message(const std::string& text, Icon icon, Buttons buttons,
                 const std::string& title) override {
    return inner().message(text + "\r\nError on line " + std::to_string(lineNo_) + ".", icon,
                           buttons, title);
  }

 private:
  size_t lineNo_;
};

}  // namespace zv
