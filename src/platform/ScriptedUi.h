#pragma once
// Scripted implementation of the UI seam for tests: records every box and
// answers from queues (the safe answer when a queue is empty).

#include <deque>
#include <string>
#include <vector>

#include "platform/Ui.h"

namespace zv {

struct RecordedBox {
  std::string text;
  Icon icon;
  Buttons buttons;
  std::string title;
};

class ScriptedUi : public Ui {
 public:
  Answer message(const std::string& text, Icon icon, Buttons buttons,
                 const std::string& title) override {
    boxes.push_back({text, icon, buttons, title.empty() ? kAppTitle : title});
    if (buttons == Buttons::Ok) return Answer::Ok;
    if (!answers.empty()) {
      Answer a = answers.front();
      answers.pop_front();
      return a;
    }
    return buttons == Buttons::YesNo ? Answer::No : Answer::Cancel;
  }
  std::optional<std::string> input(const std::string& prompt, const std::string& title,
                                   const std::string&) override {
    inputPrompts.push_back(title + ": " + prompt);
    if (inputs.empty()) return std::nullopt;
    std::optional<std::string> a = inputs.front();
    inputs.pop_front();
    return a;
  }
  void viewText(const std::string& path, const std::string& typeDescription) override {
    viewed.push_back(typeDescription + ": " + path);
  }

  bool openEditor(const std::string& path, const std::string& typeDescription,
                  EditorMode mode) override {
    editors.push_back(std::string(mode == EditorMode::Viewer ? "viewer" : "editor") + ": " +
                      typeDescription + ": " + path);
    return true;
  }
  std::optional<std::string> chooseFile(const FileDialogRequest& request) override {
    fileDialogs.push_back(request);
    if (files.empty()) return std::nullopt;
    std::optional<std::string> a = files.front();
    files.pop_front();
    return a;
  }

  // The text of the only box shown, or a note that there was not exactly one.
  std::string onlyText() const {
    if (boxes.size() == 1) return boxes.front().text;
    std::string note = "<";
    note += std::to_string(boxes.size());
    note += " boxes>";
    return note;
  }

  std::vector<RecordedBox> boxes;
  std::deque<Answer> answers;
  std::deque<std::optional<std::string>> inputs;
  std::vector<std::string> inputPrompts;
  std::vector<std::string> viewed;
  std::vector<std::string> editors;  // "viewer|editor: type: path"
  std::vector<FileDialogRequest> fileDialogs;
  std::deque<std::optional<std::string>> files;  // answers to file dialogs
};

}  // namespace zv
