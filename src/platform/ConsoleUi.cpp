#include "platform/ConsoleUi.h"

#include <algorithm>
#include <cctype>
#include <fstream>
#include <istream>
#include <ostream>

#include "platform/Strings.h"

namespace zv {

namespace {

const char* IconName(Icon icon) {
  switch (icon) {
    case Icon::Information:
      return "information";
    case Icon::Exclamation:
      return "exclamation";
    case Icon::Critical:
      return "critical";
    case Icon::Question:
      return "question";
    case Icon::None:
      break;
  }
  return "none";
}

// The answer without blanks and line end, in lower case.
std::string Lower(std::string s) {
  while (!s.empty() && s.back() == '\r') s.pop_back();
  return ToLower(Trim(s));
}

}  // namespace

ConsoleUi::ConsoleUi(std::istream& in, std::ostream& out, std::ostream& err)
    : in_(in), out_(out), err_(err) {}

Answer ConsoleUi::message(const std::string& text, Icon icon, Buttons buttons,
                          const std::string& title) {
  err_ << IconName(icon) << ": " << (title.empty() ? kAppTitle : title) << '\n'
       << WithLineBreaks(text) << "\n\n";
  if (buttons == Buttons::Ok) {
    err_.flush();
    return Answer::Ok;
  }
  const char* prompt = buttons == Buttons::YesNo      ? "[Yes/No]? "
                       : buttons == Buttons::OkCancel ? "[OK/Cancel]? "
                                                      : "[Yes/No/Cancel]? ";
  const Answer safe = buttons == Buttons::YesNo ? Answer::No : Answer::Cancel;
  for (int attempt = 0; attempt < 3; ++attempt) {
    err_ << prompt;
    err_.flush();
    std::string line;
    if (!std::getline(in_, line)) return safe;
    const std::string a = Lower(line);
    const bool yesNo = buttons == Buttons::YesNo || buttons == Buttons::YesNoCancel;
    const bool hasCancel = buttons != Buttons::YesNo;
    if (yesNo && (a == "y" || a == "yes")) return Answer::Yes;
    if (yesNo && (a == "n" || a == "no")) return Answer::No;
    if (buttons == Buttons::OkCancel && (a == "o" || a == "ok")) return Answer::Ok;
    if (hasCancel && (a == "c" || a == "cancel")) return Answer::Cancel;
  }
  return safe;
}

std::optional<std::string> ConsoleUi::input(const std::string& prompt, const std::string& title,
                                            const std::string& defaultText) {
  err_ << "input: " << (title.empty() ? kAppTitle : title) << '\n' << WithLineBreaks(prompt);
  if (!defaultText.empty()) err_ << " [" << defaultText << "]";
  err_ << "\n> ";
  err_.flush();
  std::string line;
  if (!std::getline(in_, line)) return std::nullopt;
  if (!line.empty() && line.back() == '\r') line.pop_back();
  return line;
}

void ConsoleUi::viewText(const std::string& path, const std::string& typeDescription) {
  out_ << "view: " << typeDescription << ": " << path << '\n';
  std::ifstream file(path, std::ios::binary);
  std::string line;
  while (std::getline(file, line)) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    out_ << line << '\n';
  }
  out_.flush();
}

bool ConsoleUi::openEditor(const std::string& path, const std::string& typeDescription,
                           EditorMode mode) {
  if (mode == EditorMode::Viewer && !path.empty()) {
    viewText(path, typeDescription);
    return true;
  }
  message("The text editor needs a display." + std::string(path.empty() ? "" : "\r\n" + path),
          Icon::Exclamation, Buttons::Ok, kAppTitle);
  return false;
}

std::optional<std::string> ConsoleUi::chooseFile(const FileDialogRequest& request) {
  message("The file dialog \"" + request.title + "\" needs a display.", Icon::Exclamation,
          Buttons::Ok, kAppTitle);
  return std::nullopt;
}

// Each CR LF of a message becomes a line break.
std::string WithLineBreaks(const std::string& text) {
  std::string out;
  out.reserve(text.size());
  for (size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '\r' && i + 1 < text.size() && text[i + 1] == '\n') continue;
    out += text[i];
  }
  return out;
}

}  // namespace zv
