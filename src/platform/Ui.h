#pragma once
// The UI seam: every message box, question, input box and text viewer of the
// program goes through this interface (Qt, console and scripted versions).

#include <optional>
#include <string>

#include "Version.h"
#include "platform/Progress.h"

namespace zv {

enum class Icon { None, Information, Exclamation, Critical, Question };
enum class Buttons { Ok, OkCancel, YesNo, YesNoCancel };
enum class Answer { Ok, Cancel, Yes, No };
enum class FileDialogKind { Open, Save };
enum class EditorMode { Viewer, Editor };

// A common open or save file dialog. The filter is "description|pattern"
// pairs joined by "|", e.g. "VORN Control Files (*.CTL)|*.CTL".
struct FileDialogRequest {
  FileDialogKind kind = FileDialogKind::Open;
  std::string title;
  std::string filter;
  std::string folder;  // initial folder
};

class Ui {
 public:
  virtual ~Ui() = default;

  // A modal message box. Texts use CR LF between lines.
  virtual Answer message(const std::string& text, Icon icon, Buttons buttons,
                         const std::string& title) = 0;
  // A text entry box; nullopt when cancelled.
  virtual std::optional<std::string> input(const std::string& prompt, const std::string& title,
                                           const std::string& defaultText) = 0;
  // Shows a text file and returns when the viewer is closed.
  virtual void viewText(const std::string& path, const std::string& typeDescription) = 0;
  // A text editor window on the file (a new, empty text when the path is
  // empty) that stays open on its own; returns at once. False when no window
  // could be opened.
  virtual bool openEditor(const std::string& path, const std::string& typeDescription,
                          EditorMode mode) {
    (void)path, (void)typeDescription, (void)mode;
    return false;
  }
  // The chosen file's path; nullopt when cancelled or not possible.
  virtual std::optional<std::string> chooseFile(const FileDialogRequest& request) {
    (void)request;
    return std::nullopt;
  }
  // Busy pointer on or off.
  virtual void setBusy(bool) {}
  // False when the implementation cannot show windows (the console).
  virtual bool hasWindows() const { return false; }
  // Where the running routine reports its progress and learns of a stop
  // request; nullptr when nobody listens.
  virtual RunProgress* progress() { return nullptr; }

  // Shorthands for the common boxes.
  void inform(const std::string& text, const std::string& title = kAppTitle) {
    message(text, Icon::Information, Buttons::Ok, title);
  }
  void exclaim(const std::string& text, const std::string& title = kAppTitle) {
    message(text, Icon::Exclamation, Buttons::Ok, title);
  }
  void critical(const std::string& text, const std::string& title = kAppTitle) {
    message(text, Icon::Critical, Buttons::Ok, title);
  }
  bool askYesNo(const std::string& text, const std::string& title = kAppTitle) {
    return message(text, Icon::None, Buttons::YesNo, title) == Answer::Yes;
  }
};

}  // namespace zv
