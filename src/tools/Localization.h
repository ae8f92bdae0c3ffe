#pragma once
// Grid and local (ground) coordinates of a VORN tagged file: the choice of
// direction from the file's header, the grid reference a local file records,
// and the logic of the two dialogs without widgets (their enabling rules,
// checks and OK). The computation itself is the Local.EXE tool's; a dialog's
// OK hands the request to a runner that writes the tool's job and runs it.

#include <functional>
#include <istream>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "platform/Ui.h"

namespace zv {

// What the header of a tagged file (its lines up to the first "AC" line
// other than exactly "AC:PR") holds.
struct HeaderScan {
  bool horizontalDatum = false;  // an "HD" line
  bool zone = false;             // a "ZN" line
};
HeaderScan ScanHeader(std::istream& in);

// The grid reference a local file records in its header comments.
struct RecordedGridReference {
  std::string horizontalDatum;  // "19" + the last two characters of the datum
  std::string zone;
  std::string combinedFactor;
};
RecordedGridReference ReadRecordedGridReference(std::istream& in);
// Empty when the file cannot be read.
RecordedGridReference ReadRecordedGridReference(const std::string& path);

inline constexpr const char* kOriginalDatumPrefix = "CM:ORIGINAL HD:";
inline constexpr const char* kOriginalZonePrefix = "CM:ORIGINAL ZN:";
inline constexpr const char* kCombinedFactorPrefix = "CM:COMB. FACTOR =";

// What the dialogs hand to the tool, with the console position below them.
struct GridToLocalRequest {
  std::string input, output;
  short mode = 1;  // 1 all points, 2 the user's factor, 3 the factor at a point
  std::string modeText;
  int consoleLeft = 0, consoleTop = 0;
};
struct LocalToGridRequest {
  std::string input, output;
  std::string datumYear, zoneCode, factor;
  int consoleLeft = 0, consoleTop = 0;
};
// Runs the tool for a request: true when it left its result (a failure has
// been reported).
using GridToLocalRunner = std::function<bool(const GridToLocalRequest&)>;
using LocalToGridRunner = std::function<bool(const LocalToGridRequest&)>;

// The two dialogs, shown modally; true when a run succeeded.
struct LocalizeDialogs {
  std::function<bool(const std::string& input, const std::string& output)> gridToLocal;
  std::function<bool(const RecordedGridReference&, const std::string& input,
                     const std::string& output)>
      localToGrid;
};

// A file with both an HD and a ZN line in its header holds grid coordinates
// and opens the grid-to-local dialog; any other the local-to-grid dialog
// with its recorded grid reference. An input that cannot be read is
// reported; false.
bool Localize(Ui& ui, const std::string& input, const std::string& output,
              const LocalizeDialogs& dialogs);

// How a dialog's OK ended.
enum class LocalOk {
  Refused,  // a check failed: the focus goes to the control concerned
  Failed,   // the tool did not do its job (reported); the dialog stays
  Done      // the tool ran and the completion was shown: the dialog closes
};

struct LocalTextBox {
  std::string text;
  bool enabled = false;
};

class GridToLocalForm {
 public:
  enum class Option { AllPoints, UserDefined, PointNumber };
  enum class Control { UserDefined, PointNumber };

  // The option's own box is enabled, the other disabled and emptied.
  void choose(Option option);
  void setText(Control control, std::string text);

  Option option() const { return option_; }
  const LocalTextBox& box(Control control) const {
    return control == Control::UserDefined ? userDefined_ : pointNumber_;
  }
  GridToLocalRequest request(const std::string& input, const std::string& output) const;

  // The checks, then the tool run and "Translation Complete"; `refused` is
  // the box that gets the focus.
  LocalOk ok(Ui& ui, const std::string& input, const std::string& output, int consoleLeft,
             int consoleTop, const GridToLocalRunner& run, Control& refused) const;

 private:
  Option option_ = Option::AllPoints;
  LocalTextBox userDefined_, pointNumber_;
};

// An entry of the datum-year or zone list and its item data.
using LocalListItem = std::pair<std::string, int>;

struct LocalList {
  std::vector<LocalListItem> items;
  int selected = -1;
  // Selects the entry whose item data equals the number in `text`; false
  // (selection unchanged) when the text is no number or no entry has it.
  bool selectNumber(const std::string& text);
};

class LocalToGridForm {
 public:
  enum class Control { HorizontalDatum, Zone, CombinedFactor };

  // Fills the datum years and the tool's zones (appFolder/Pintrel/zones.txt)
  // and takes the recorded values that match. A zone list that cannot be
  // read throws ZvError; the datum years are filled by then.
  void load(const std::string& appFolder, const RecordedGridReference& recorded);

  LocalList& datums() { return datums_; }
  LocalList& zones() { return zones_; }
  const LocalList& datums() const { return datums_; }
  const LocalList& zones() const { return zones_; }
  std::string& factor() { return factor_; }
  const std::string& factor() const { return factor_; }

  // The year of the datum, the zone code as four digits ("0401").
  LocalToGridRequest request(const std::string& input, const std::string& output) const;

  LocalOk ok(Ui& ui, const std::string& input, const std::string& output, int consoleLeft,
             int consoleTop, const LocalToGridRunner& run, Control& refused) const;

 private:
  LocalList datums_, zones_;
  std::string factor_;
};

}  // namespace zv
