#include "userformats/FlexForm.h"

#include <algorithm>

#include "geodesy/Angles.h"
#include "geodesy/Catalogs.h"
#include "platform/Error.h"

namespace zv {

namespace {

constexpr const char* kNone = "None";
constexpr const char* kAttribute = "Attribute";

bool Holds(const std::vector<std::string>& items, const std::string& value) {
  return std::find(items.begin(), items.end(), value) != items.end();
}

void Refill(FormList& list, std::vector<std::string> items, bool enabled = true) {
  list.items = std::move(items);
  list.selected.clear();
  list.enabled = enabled;
}

FlexStore StoreOf(FlexDirection direction, const std::string& appFolder) {
  return direction == FlexDirection::In ? FlexStore::Input(appFolder)
                                        : FlexStore::Output(appFolder);
}

}  // namespace

std::string FlexListDefault(FlexList list) {
  if (list == FlexList::LatitudeDirection) return "N";
  if (list == FlexList::LongitudeDirection) return "W";
  return "";
}

const char* FlexSection(FlexDirection direction) {
  return direction == FlexDirection::In ? "FlexIn" : "FlexOut";
}

const char* FlexListKey(FlexList list) {
  static const char* const kKeys[] = {
      "Coordinate System", "Zone",           "Horizontal Datum",   "Horizontal Units",
      "Vertical Datum",    "Vertical Units", "Latitude Direction", "Longitude Direction"};
  return kKeys[static_cast<int>(list)];
}

FlexForm::FlexForm(FlexDirection direction, Ui& ui, std::string appFolder)
    : direction_(direction), ui_(ui), appFolder_(std::move(appFolder)) {}

std::vector<std::string> FlexForm::coordinateTypes() {
  return {kPlane, kGeographic};
}

void FlexForm::open() {
  formats_ = StoreOf(direction_, appFolder_).listFormats();
  formatName_.clear();
  delimiter_.clear();
  coordinateType_.clear();
  offered_.clear();
  rows_.clear();
  for (FormList& l : lists_) l = FormList{};
  Refill(at(FlexList::LatitudeDirection), {"N", "S"}, false);
  Refill(at(FlexList::LongitudeDirection), {"E", "W"}, false);
  projectHeaderPrefix.clear();
  ignorePrefix.clear();
  writeHeader = false;
  headerPrefix.clear();
  columnsEnabled_ = false;
  changed_ = false;
}

void FlexForm::setDelimiter(std::string delimiter) {
  delimiter_ = std::move(delimiter);
  changed_ = true;
}

bool FlexForm::fixedPositions() const {
  return delimiter_ == kColumnSpecific;
}

std::string FlexForm::gridHeading() const {
  return fixedPositions() ? "Column Position" : "Column Order";
}

void FlexForm::showListError(const ZvError& error) {
  ui_.message("Error: " + error.description() + "\r\nFunction: " + error.source(), Icon::None,
              Buttons::Ok, kAppTitle);
}

void FlexForm::chooseCoordinateType(const std::string& type, const SettingsStore& remembered) {
  if (type != kPlane && type != kGeographic) return;
  changed_ = true;
  coordinateType_ = type;
  offered_ = FlexColumnNames(type);
  const bool geographic = type == kGeographic;
  std::vector<std::string> systems;
  try {
    systems = LOAD_CS_ComboBoxList(appFolder_);
  } catch (const ZvError& e) {
    showListError(e);
  }
  if (geographic && !Holds(systems, kGeographicCoordinates))
    systems.push_back(kGeographicCoordinates);
  // The lists below the coordinate system wait for its choice.
  Refill(at(FlexList::CoordinateSystem), std::move(systems));
  for (FlexList l : {FlexList::Zone, FlexList::HorizontalDatum, FlexList::HorizontalUnits,
                     FlexList::VerticalDatum, FlexList::VerticalUnits})
    Refill(at(l), {});
  at(FlexList::LatitudeDirection).enabled = geographic;
  at(FlexList::LongitudeDirection).enabled = geographic;
  auto recall = [&](FlexList l) {
    choose(l, remembered.get(FlexSection(direction_), FlexListKey(l), FlexListDefault(l)));
  };
  if (geographic) {
    choose(FlexList::CoordinateSystem, kGeographicCoordinates);
    recall(FlexList::LatitudeDirection);
    recall(FlexList::LongitudeDirection);
  } else {
    recall(FlexList::CoordinateSystem);
    recall(FlexList::Zone);
  }
  for (FlexList l : {FlexList::HorizontalDatum, FlexList::HorizontalUnits, FlexList::VerticalDatum,
                     FlexList::VerticalUnits})
    recall(l);
}

void FlexForm::select(FlexList list, const std::string& value) {
  FormList& l = at(list);
  if (!value.empty() && Holds(l.items, value)) l.selected = value;
}

void FlexForm::choose(FlexList list, const std::string& value) {
  if (value.empty() || !Holds(at(list).items, value)) return;
  at(list).selected = value;
  switch (list) {
    case FlexList::CoordinateSystem:
      chooseSystem();
      break;
    case FlexList::Zone:
      chooseZone();
      break;
    case FlexList::VerticalDatum:
      at(FlexList::VerticalUnits).enabled = value != kNone;
      break;
    default:
      break;
  }
}

void FlexForm::chooseSystem() {
  const std::string& system = list(FlexList::CoordinateSystem).selected;
  const bool geographic = system == kGeographicCoordinates;
  const bool inputSide = direction_ == FlexDirection::In;
  std::vector<std::string> zones, horizontal, vertical;
  try {
    if (!geographic) zones = LOAD_Zones_ComboBoxList(appFolder_, inputSide, system);
    horizontal = LoadDatumList(appFolder_, inputSide, true, geographic, false);
    vertical = LoadDatumList(appFolder_, inputSide, false, geographic, false);
  } catch (const ZvError& e) {
    showListError(e);
    return;
  }
  Refill(at(FlexList::Zone), std::move(zones), !geographic);
  Refill(at(FlexList::HorizontalUnits), geographic ? AngleFormatNames() : LinearUnitNames());
  Refill(at(FlexList::HorizontalDatum), std::move(horizontal));
  Refill(at(FlexList::VerticalDatum), std::move(vertical));
  Refill(at(FlexList::VerticalUnits), LinearUnitNames());
}

void FlexForm::chooseZone() {
  const ZoneDatumsAndUnits zone = ReadZoneDatumsAndUnits(
      appFolder_, list(FlexList::CoordinateSystem).selected, list(FlexList::Zone).selected);
  choose(FlexList::HorizontalDatum, zone.horizontalDatum);
  choose(FlexList::VerticalDatum, zone.verticalDatum);
  choose(FlexList::HorizontalUnits, zone.linearUnits);
  choose(FlexList::VerticalUnits, zone.linearUnits);
}

void FlexForm::addColumn(const std::string& name) {
  if (name.empty()) return;
  if (name != kAttribute &&
      std::any_of(rows_.begin(), rows_.end(), [&](const FlexRow& r) { return r.name == name; }))
    return;
  rows_.push_back({name, fixedPositions() ? "" : std::to_string(rows_.size() + 1), ""});
  changed_ = true;
}

void FlexForm::removeColumn(int row) {
  if (row < 0 || row >= static_cast<int>(rows_.size())) return;
  rows_.erase(rows_.begin() + row);
  changed_ = true;
}

void FlexForm::typeInCell(int row, int cell, CellKey key, char digit) {
  const int cells = direction_ == FlexDirection::Out ? 2 : 1;
  if (row < 0 || row >= static_cast<int>(rows_.size()) || cell < 1 || cell > cells) return;
  FlexRow& r = rows_[row];
  std::string& text = cell == 1 ? r.order : r.decimals;
  switch (key) {
    case CellKey::Digit:
    case CellKey::KeypadDigit:
      if (digit < '0' || digit > '9') return;
      if (key == CellKey::Digit && cell == 2) {
        const std::optional<FlexColumn> column = FlexColumnFromName(r.name);
        if (column && IsFlexTextColumn(*column)) {
          ui_.message("Decimal Places not applicable to '" + r.name + "'.", Icon::Information,
                      Buttons::Ok, "Decimal Places Not Applicable");
          return;
        }
      }
      text += digit;
      break;
    case CellKey::Backspace:
      if (!text.empty()) text.pop_back();
      break;
    case CellKey::Delete:
      text.clear();
      break;
  }
  changed_ = true;
}

void FlexForm::loadFormat(const std::string& name, const SettingsStore& remembered) {
  const FlexStore store = StoreOf(direction_, appFolder_);
  FlexInFormat in;
  FlexOutFormat out;
  std::vector<std::string> columns, order, decimals;
  std::string type;
  if (direction_ == FlexDirection::In) {
    in = store.loadInput(name);
    delimiter_ = in.delimiter;
    type = in.coordinateType;
    columns = in.columns;
    order = in.order;
  } else {
    out = store.loadOutput(name);
    delimiter_ = out.delimiter;
    type = out.coordinateType;
    columns = out.columns;
    order = out.order;
    decimals = out.decimalPlaces;
  }
  formatName_ = name;
  // A format chosen after another starts from an empty grid: the earlier
  // format's columns would otherwise stay and take this one's order cells.
  rows_.clear();
  coordinateType_.clear();
  offered_.clear();
  chooseCoordinateType(type, remembered);
  for (const std::string& column : columns) addColumn(column);
  for (size_t i = 0; i < order.size() && i < rows_.size(); ++i) rows_[i].order = order[i];
  if (direction_ == FlexDirection::In) {
    projectHeaderPrefix = in.headerPrefix;
    ignorePrefix = in.ignorePrefix;
  } else {
    for (size_t i = 0; i < decimals.size() && i < rows_.size(); ++i)
      rows_[i].decimals = decimals[i];
    writeHeader = out.writeHeader;
    headerPrefix = out.headerPrefix;
  }
  columnsEnabled_ = true;
  changed_ = false;
}

bool FlexForm::saveFormat() {
  const FlexStore store = StoreOf(direction_, appFolder_);
  if (!IsValidFormatName(formatName_)) {
    ui_.exclaim("The name '" + formatName_ +
                    "' can not be used for a format: it may not contain \"]\" or a line break, "
                    "nor begin or end with a blank.",
                "Invalid Format Name");
    return false;
  }
  const bool saved = direction_ == FlexDirection::In ? store.save(formatName_, inFormat())
                                                     : store.save(formatName_, outFormat());
  if (!saved) {
    ui_.exclaim("The format '" + formatName_ + "' could not be saved in '" + store.path() + "'.",
                "Format Not Saved");
    return false;
  }
  formats_ = store.listFormats();
  changed_ = false;
  return true;
}

void FlexForm::newFormat() {
  formatName_.clear();
  changed_ = true;
}

bool FlexForm::deleteFormat() {
  if (formatName_.empty()) return false;
  if (!ui_.askYesNo("Are you sure you want to permanently delete the '" + formatName_ + "' format?",
                    "Delete Format?")) {
    return false;
  }
  const FlexStore store = StoreOf(direction_, appFolder_);
  if (store.hasFormat(formatName_) && !store.deleteFormat(formatName_)) {
    ui_.exclaim(
        "The format '" + formatName_ + "' could not be deleted from '" + store.path() + "'.",
        "Format Not Deleted");
    return false;
  }
  formats_ = store.listFormats();
  formatName_.clear();
  changed_ = false;
  return true;
}

std::optional<FlexRefusal> FlexForm::validate() const {
  if (delimiter_.empty())
    return FlexRefusal{"Delimiter Required", "A Delimiter is required.", FlexControl::Delimiter};
  if (coordinateType_.empty())
    return FlexRefusal{"Specify Coordiante Type", "The Coordinate Type must be specified.",
                       FlexControl::CoordinateType};
  if (rows_.empty())
    return FlexRefusal{"Specify Columns", "You must specify at least one column to import.",
                       FlexControl::Columns};
  for (size_t i = 0; i < rows_.size(); ++i) {
    if (rows_[i].order.empty())
      return FlexRefusal{"Specify Column",
                         "You must specify the column for '" + rows_[i].name + "'.",
                         FlexControl::Grid, FlexList::CoordinateSystem, static_cast<int>(i)};
  }
  struct Check {
    FlexList list;
    const char* title;
    const char* text;
  };
  // A disabled list needs no choice (a vertical datum of "None" disables
  // the vertical units, which could then never be chosen).
  const Check checks[] = {
      {FlexList::LatitudeDirection, "Specify Latitude Direction",
       "You must specify a Latitude Direction."},
      {FlexList::LongitudeDirection, "Specify Longitude Direction",
       "You must specify a Longitude Direction."},
      {FlexList::CoordinateSystem, "Specify Coordinate System",
       "You must specify a Coordiante System."},
      {FlexList::Zone, "Specify Zone", "You must specify a Zone"},
      {FlexList::HorizontalDatum, "Specify Horizontal Datum",
       "You must specify a Horizontal Datum."},
      {FlexList::HorizontalUnits, "Specify Horizontal Units",
       "You must specify the Horizontal Units."},
      {FlexList::VerticalDatum, "Specify Vertical Datum", "You must specify a Vertical Datum."},
      {FlexList::VerticalUnits, "Specify Vertical Units", "You must specify the Vertical Units."},
  };
  for (const Check& c : checks) {
    const FormList& l = list(c.list);
    if (l.enabled && l.selected.empty())
      return FlexRefusal{c.title, c.text, FlexControl::List, c.list};
  }
  return std::nullopt;
}

bool FlexForm::accept(WorkArea& work, SettingsStore& remembered, const std::string& path,
                      FlexRefusal& focus) {
  focus = FlexRefusal{};
  if (std::optional<FlexRefusal> refusal = validate()) {
    ui_.message(refusal->text, Icon::Exclamation, Buttons::Ok, refusal->title);
    focus = *refusal;
    return false;
  }
  if (changed_) {
    const Answer answer =
        ui_.message("Changes have been made to the format. Do you wish to save them?", Icon::None,
                    Buttons::YesNoCancel, "Save Changes?");
    if (answer == Answer::Cancel) return false;
    if (answer == Answer::Yes) {
      if (formatName_.empty()) {
        ui_.message("A Name is required to save the format.  Please specify a format name.",
                    Icon::Information, Buttons::Ok, "Format Name Required");
        focus.control = FlexControl::FormatName;
        return false;
      }
      if (!saveFormat()) {
        focus.control = FlexControl::FormatName;
        return false;
      }
    }
  }
  const bool done = direction_ == FlexDirection::In
                        ? FlexIn(ui_, work, appFolder_, path, inChoices())
                        : FlexOut(ui_, work, appFolder_, path, outChoices());
  if (!done) return false;
  remember(remembered);
  return true;
}

FlexInFormat FlexForm::inFormat() const {
  FlexInFormat f;
  f.delimiter = delimiter_;
  f.coordinateType = coordinateType_;
  for (const FlexRow& r : rows_) {
    f.columns.push_back(r.name);
    f.order.push_back(r.order);
  }
  f.headerPrefix = projectHeaderPrefix;
  f.ignorePrefix = ignorePrefix;
  return f;
}

FlexOutFormat FlexForm::outFormat() const {
  FlexOutFormat f;
  f.delimiter = delimiter_;
  f.coordinateType = coordinateType_;
  for (const FlexRow& r : rows_) {
    f.columns.push_back(r.name);
    f.order.push_back(r.order);
    f.decimalPlaces.push_back(r.decimals);
  }
  f.writeHeader = writeHeader;
  f.headerPrefix = headerPrefix;
  return f;
}

FlexInChoices FlexForm::inChoices() const {
  FlexInChoices c;
  c.formatName = formatName_;
  c.format = inFormat();
  auto pick = [&](FlexList l) {
    const std::string& s = list(l).selected;
    return s.empty() ? FlexListDefault(l) : s;
  };
  c.latitudeDirection = pick(FlexList::LatitudeDirection);
  c.longitudeDirection = pick(FlexList::LongitudeDirection);
  c.coordinateSystem = pick(FlexList::CoordinateSystem);
  c.zone = pick(FlexList::Zone);
  c.horizontalDatum = pick(FlexList::HorizontalDatum);
  c.horizontalUnits = pick(FlexList::HorizontalUnits);
  c.verticalDatum = pick(FlexList::VerticalDatum);
  c.verticalUnits = pick(FlexList::VerticalUnits);
  return c;
}

FlexOutChoices FlexForm::outChoices() const {
  const FlexInChoices in = inChoices();
  FlexOutChoices c;
  c.formatName = formatName_;
  c.format = outFormat();
  c.horizontalUnits = in.horizontalUnits;
  c.verticalUnits = in.verticalUnits;
  c.latitudeDirection = in.latitudeDirection;
  c.longitudeDirection = in.longitudeDirection;
  c.coordinateSystem = in.coordinateSystem;
  c.zone = in.zone;
  c.horizontalDatum = in.horizontalDatum;
  c.verticalDatum = in.verticalDatum;
  return c;
}

void FlexForm::remember(SettingsStore& store) const {
  const char* section = FlexSection(direction_);
  for (FlexList l : kFlexLists) {
    // Plane coordinates have no directions: the remembered ones stay.
    if (!list(l).enabled && (l == FlexList::LatitudeDirection || l == FlexList::LongitudeDirection))
      continue;
    store.save(section, FlexListKey(l), list(l).selected);
  }
  if (!formatName_.empty() && StoreOf(direction_, appFolder_).hasFormat(formatName_))
    store.save(section, kFlexFormatKey, formatName_);
}

}  // namespace zv
