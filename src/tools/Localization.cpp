#include "tools/Localization.h"

#include <cstdio>
#include <fstream>

#include "geodesy/Catalogs.h"
#include "platform/Numbers.h"
#include "platform/TextIo.h"

namespace zv {

namespace {

std::string_view TagOf(std::string_view line) {
  return line.substr(0, line.find(':'));
}

bool StartsWith(std::string_view line, std::string_view prefix) {
  return line.substr(0, prefix.size()) == prefix;
}

// Calls f for every header line; the header ends before the first "AC" line
// that is not exactly "AC:PR".
template <class F>
void ForEachHeaderLine(std::istream& in, F f) {
  LineReader reader(in);
  std::string_view line;
  while (reader.next(line)) {
    if (TagOf(line) == "AC" && line != "AC:PR") return;
    f(line);
  }
}

// Runs a tool job under the busy pointer; the completion message only when
// the tool did its job.
template <typename Request, typename Run>
LocalOk RunJob(Ui& ui, Request r, int consoleLeft, int consoleTop, const Run& run,
               const char* completion) {
  r.consoleLeft = consoleLeft;
  r.consoleTop = consoleTop;
  ui.setBusy(true);
  const bool done = run(r);
  ui.setBusy(false);
  if (!done) return LocalOk::Failed;
  ui.inform(completion);
  return LocalOk::Done;
}

}  // namespace

HeaderScan ScanHeader(std::istream& in) {
  HeaderScan scan;
  ForEachHeaderLine(in, [&](std::string_view line) {
    const std::string_view tag = TagOf(line);
    if (tag == "HD") scan.horizontalDatum = true;
    if (tag == "ZN") scan.zone = true;
  });
  return scan;
}

RecordedGridReference ReadRecordedGridReference(std::istream& in) {
  RecordedGridReference recorded;
  ForEachHeaderLine(in, [&](std::string_view line) {
    if (TagOf(line) != "CM") return;
    if (StartsWith(line, kOriginalZonePrefix)) {
      recorded.zone = std::string(line.substr(15));
    } else if (StartsWith(line, kOriginalDatumPrefix)) {
      const std::string_view datum = line.substr(15);
      recorded.horizontalDatum =
          std::string("19").append(datum.substr(datum.size() < 2 ? 0 : datum.size() - 2));
    } else if (StartsWith(line, kCombinedFactorPrefix)) {
      const std::string_view factor = line.substr(17);
      const size_t first = factor.find_first_not_of(' ');
      recorded.combinedFactor =
          first == std::string_view::npos ? std::string() : std::string(factor.substr(first));
    }
  });
  return recorded;
}

RecordedGridReference ReadRecordedGridReference(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return in ? ReadRecordedGridReference(in) : RecordedGridReference{};
}

bool Localize(Ui& ui, const std::string& input, const std::string& output,
              const LocalizeDialogs& dialogs) {
  std::ifstream in(input, std::ios::binary);
  if (!in) {
    ui.exclaim("The file '" + input + "' can not be read.");
    return false;
  }
  const HeaderScan scan = ScanHeader(in);
  if (scan.horizontalDatum && scan.zone) return dialogs.gridToLocal(input, output);
  in.clear();
  in.seekg(0);
  return dialogs.localToGrid(ReadRecordedGridReference(in), input, output);
}

void GridToLocalForm::choose(Option option) {
  option_ = option;
  userDefined_.enabled = option == Option::UserDefined;
  pointNumber_.enabled = option == Option::PointNumber;
  if (!userDefined_.enabled) userDefined_.text.clear();
  if (!pointNumber_.enabled) pointNumber_.text.clear();
}

void GridToLocalForm::setText(Control control, std::string text) {
  LocalTextBox& box = control == Control::UserDefined ? userDefined_ : pointNumber_;
  if (box.enabled) box.text = std::move(text);
}

GridToLocalRequest GridToLocalForm::request(const std::string& input,
                                            const std::string& output) const {
  GridToLocalRequest r{input, output, 1, {}, 0, 0};
  if (option_ == Option::UserDefined) {
    r.mode = 2;
    r.modeText = userDefined_.text;
  } else if (option_ == Option::PointNumber) {
    r.mode = 3;
    r.modeText = pointNumber_.text;
  }
  return r;
}

LocalOk GridToLocalForm::ok(Ui& ui, const std::string& input, const std::string& output,
                            int consoleLeft, int consoleTop, const GridToLocalRunner& run,
                            Control& refused) const {
  if (option_ == Option::UserDefined && !IsNumeric(userDefined_.text)) {
    ui.exclaim("The specified combined factor is not a valid number.");
    refused = Control::UserDefined;
    return LocalOk::Refused;
  }
  if (option_ == Option::PointNumber && !IsNumeric(pointNumber_.text)) {
    ui.exclaim("The specified point number is not a valid number.");
    refused = Control::PointNumber;
    return LocalOk::Refused;
  }
  return RunJob(ui, request(input, output), consoleLeft, consoleTop, run, "Translation Complete");
}

bool LocalList::selectNumber(const std::string& text) {
  const std::optional<double> number = ToNumber(text);
  if (!number) return false;
  for (size_t i = 0; i < items.size(); ++i) {
    if (items[i].second == *number) {
      selected = static_cast<int>(i);
      return true;
    }
  }
  return false;
}

void LocalToGridForm::load(const std::string& appFolder, const RecordedGridReference& recorded) {
  datums_ = {LoadDatumYearList(), -1};
  zones_ = {};
  factor_.clear();
  if (!recorded.horizontalDatum.empty()) datums_.selectNumber(recorded.horizontalDatum);
  if (!recorded.combinedFactor.empty()) factor_ = recorded.combinedFactor;
  zones_.items = LoadToolZoneList(appFolder);
  if (!recorded.zone.empty()) zones_.selectNumber(recorded.zone);
}

LocalToGridRequest LocalToGridForm::request(const std::string& input,
                                            const std::string& output) const {
  LocalToGridRequest r{input, output, {}, {}, factor_, 0, 0};
  if (datums_.selected >= 0) r.datumYear = std::to_string(datums_.items[datums_.selected].second);
  if (zones_.selected >= 0) {
    char code[16];
    std::snprintf(code, sizeof code, "%04d", zones_.items[zones_.selected].second);
    r.zoneCode = code;
  }
  return r;
}

LocalOk LocalToGridForm::ok(Ui& ui, const std::string& input, const std::string& output,
                            int consoleLeft, int consoleTop, const LocalToGridRunner& run,
                            Control& refused) const {
  auto refuse = [&](const char* text, Control control) {
    ui.exclaim(text);
    refused = control;
    return LocalOk::Refused;
  };
  if (datums_.selected < 0) {
    return refuse("You must select a horizontal datum.", Control::HorizontalDatum);
  }
  if (zones_.selected < 0) return refuse("You must select a zone.", Control::Zone);
  if (factor_.empty()) {
    return refuse("You must specify a combined factor.", Control::CombinedFactor);
  }
  if (!IsNumeric(factor_)) {
    return refuse("You specified an invalid value for the combined factor.",
                  Control::CombinedFactor);
  }
  return RunJob(ui, request(input, output), consoleLeft, consoleTop, run, "Translation Complete.");
}

}  // namespace zv
