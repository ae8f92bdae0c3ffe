#pragma once
// The logic of the FlexIn and FlexOut dialogs, without widgets: the format
// on screen (delimiter, coordinate type, column grid, prefixes), the
// coordinate-reference lists with their cascades, the changed flag, the
// format store operations (load, save, new, delete) and OK with its checks
// in their order. The Qt dialogs bind their controls to this class.

#include <optional>
#include <string>
#include <vector>

#include "geodesy/ConversionForm.h"
#include "platform/Settings.h"
#include "platform/Ui.h"
#include "survey/SurveyModel.h"
#include "userformats/FlexIn.h"
#include "userformats/FlexOut.h"

namespace zv {

enum class FlexDirection { In, Out };

// The per-user settings section of a direction: "FlexIn" or "FlexOut".
const char* FlexSection(FlexDirection direction);
// The key under which the format last used in the window is remembered.
inline constexpr const char* kFlexFormatKey = "Format";

// The coordinate-reference lists, in the order of their remembered keys.
enum class FlexList {
  CoordinateSystem,
  Zone,
  HorizontalDatum,
  HorizontalUnits,
  VerticalDatum,
  VerticalUnits,
  LatitudeDirection,
  LongitudeDirection,
};
inline constexpr FlexList kFlexLists[] = {
    FlexList::CoordinateSystem,  FlexList::Zone,
    FlexList::HorizontalDatum,   FlexList::HorizontalUnits,
    FlexList::VerticalDatum,     FlexList::VerticalUnits,
    FlexList::LatitudeDirection, FlexList::LongitudeDirection};
// "Coordinate System", "Zone", ..., "Latitude Direction", "Longitude Direction".
const char* FlexListKey(FlexList list);
// The value of a list when nothing is remembered: "N", "W", else empty.
std::string FlexListDefault(FlexList list);

// The control that gets the focus after a refusal.
enum class FlexControl {
  None,
  FormatName,
  Delimiter,
  CoordinateType,
  Columns,
  Grid,
  List,  // the list `FlexRefusal::list`
};

struct FlexRefusal {
  std::string title;
  std::string text;
  FlexControl control = FlexControl::None;
  FlexList list = FlexList::CoordinateSystem;
  int row = -1;  // the grid row, for FlexControl::Grid
};

// One grid row: the column name, its position or order, and (output only)
// its decimal places.
struct FlexRow {
  std::string name;
  std::string order;
  std::string decimals;
};

// A key typed into a grid cell.
enum class CellKey { Digit, KeypadDigit, Backspace, Delete };

class FlexForm {
 public:
  FlexForm(FlexDirection direction, Ui& ui, std::string appFolder);

  // Lists the formats, fills the delimiter and coordinate-type lists,
  // disables the columns frame and the direction lists, clears the grid and
  // the changed flag.
  void open();

  FlexDirection direction() const { return direction_; }
  const std::vector<std::string>& formats() const { return formats_; }
  static std::vector<std::string> coordinateTypes();

  // The format name box as typed (no change to the format).
  const std::string& formatName() const { return formatName_; }
  void setFormatName(std::string name) { formatName_ = std::move(name); }

  const std::string& delimiter() const { return delimiter_; }
  void setDelimiter(std::string delimiter);
  // Leaving the delimiter box enables the columns frame.
  void leaveDelimiter() { columnsEnabled_ = true; }
  bool columnsEnabled() const { return columnsEnabled_; }
  bool fixedPositions() const;
  // "Column Position" for fixed positions, else "Column Order".
  std::string gridHeading() const;

  const std::string& coordinateType() const { return coordinateType_; }
  // Marks the format changed, offers the type's columns and fills the
  // reference lists, selecting the values remembered in `remembered`.
  void chooseCoordinateType(const std::string& type, const SettingsStore& remembered);
  const std::vector<std::string>& offeredColumns() const { return offered_; }

  // A choice in a reference list, with its cascade. An entry the list does
  // not hold changes nothing; a list that cannot be filled is reported and
  // the lists stay as they are.
  void choose(FlexList list, const std::string& value);
  const FormList& list(FlexList list) const { return lists_[static_cast<int>(list)]; }

  const std::vector<FlexRow>& rows() const { return rows_; }
  // A new last row unless a row of that name exists (only "Attribute" may
  // repeat); its order is its row number, left empty for fixed positions.
  void addColumn(const std::string& name);
  void removeColumn(int row);
  // Typing into cell 1 (position or order) or 2 (decimal places) of a row.
  // A digit of the main keyboard in the decimal places of a text column is
  // refused with a note.
  void typeInCell(int row, int cell, CellKey key, char digit = 0);

  // The input prefixes and the output header settings; editing them does not
  // mark the format changed.
  std::string projectHeaderPrefix;
  std::string ignorePrefix;
  bool writeHeader = false;
  std::string headerPrefix;

  bool changed() const { return changed_; }

  // Loads the stored format into the form (the grid emptied first).
  void loadFormat(const std::string& name, const SettingsStore& remembered);
  // Saves the format on screen under the format name; false after a message.
  bool saveFormat();
  // Empties the name and marks the format changed; the rest stays.
  void newFormat();
  // Asks, then deletes the format shown and lists the formats again. True
  // when it was deleted.
  bool deleteFormat();

  // The first failure of the OK checks, in their order.
  std::optional<FlexRefusal> validate() const;
  // OK: the checks, the question about unsaved changes, then the reader or
  // writer on `path`; on success the remembered settings are saved. True
  // when the dialog closes with success; otherwise `focus` names the
  // control to return to (None: stay as it is).
  bool accept(WorkArea& work, SettingsStore& remembered, const std::string& path,
              FlexRefusal& focus);

  FlexInFormat inFormat() const;
  FlexOutFormat outFormat() const;
  FlexInChoices inChoices() const;
  FlexOutChoices outChoices() const;
  // The eight reference choices, and the format name when it is a stored one.
  void remember(SettingsStore& store) const;

 private:
  FormList& at(FlexList list) { return lists_[static_cast<int>(list)]; }
  void chooseSystem();
  void chooseZone();
  void select(FlexList list, const std::string& value);
  void showListError(const ZvError& error);

  FlexDirection direction_;
  Ui& ui_;
  std::string appFolder_;
  std::vector<std::string> formats_;
  std::string formatName_;
  std::string delimiter_;
  std::string coordinateType_;
  std::vector<std::string> offered_;
  std::vector<FlexRow> rows_;
  FormList lists_[8];
  bool columnsEnabled_ = false;
  bool changed_ = false;
};

}  // namespace zv
