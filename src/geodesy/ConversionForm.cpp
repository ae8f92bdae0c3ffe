#include "geodesy/ConversionForm.h"

#include <algorithm>
#include <array>
#include <span>

#include "geodesy/Angles.h"
#include "geodesy/CatalogStore.h"
#include "geodesy/Catalogs.h"
#include "platform/Numbers.h"
#include "platform/Strings.h"

namespace zv {

namespace {

constexpr const char* kNone = "None";
constexpr std::array kSideFields = {FormField::CoordinateSystem, FormField::Zone,
                                    FormField::HorizontalDatum,  FormField::HorizontalUnits,
                                    FormField::VerticalDatum,    FormField::VerticalUnits};
constexpr std::array kSides = {FormSide::Input, FormSide::Output};

bool Holds(const FormList& list, const std::string& value) {
  return std::find(list.items.begin(), list.items.end(), value) != list.items.end();
}

void Refill(FormList& list, std::vector<std::string> items) {
  list.items = std::move(items);
  list.selected.clear();
}

// The field of one side of the settings.
std::string& SettingsField(ConversionSettings& s, FormSide side, FormField field) {
  const bool in = side == FormSide::Input;
  switch (field) {
    case FormField::CoordinateSystem:
      return in ? s.inputCoordinateSystem : s.outputCoordinateSystem;
    case FormField::Zone:
      return in ? s.inputZone : s.outputZone;
    case FormField::HorizontalDatum:
      return in ? s.inputHorizontalDatum : s.outputHorizontalDatum;
    case FormField::HorizontalUnits:
      return in ? s.inputHorizontalUnits : s.outputHorizontalUnits;
    case FormField::VerticalDatum:
      return in ? s.inputVerticalDatum : s.outputVerticalDatum;
    case FormField::VerticalUnits:
      return in ? s.inputVerticalUnits : s.outputVerticalUnits;
    case FormField::GeoidModel:
      break;
  }
  return s.geoidModel;
}

const std::string& SettingsField(const ConversionSettings& s, FormSide side, FormField field) {
  return SettingsField(const_cast<ConversionSettings&>(s), side, field);
}

}  // namespace

std::string ConversionKey(FormSide side, FormField field) {
  static const char* kNames[] = {"Coordinate System", "Zone",           "Horizontal Datum",
                                 "Horizontal Units",  "Vertical Datum", "Vertical Units",
                                 "Geoid Model"};
  if (field == FormField::GeoidModel) return "Geoid Model";
  return std::string(side == FormSide::Input ? "Input " : "Output ") +
         kNames[static_cast<int>(field)];
}

std::vector<std::string> GeoidModelNames() {
  return {"GEOID99", "GEOID03", "GEOID06", "GEOID09"};
}

void ShowListError(Ui& ui, const ZvError& error) {
  ui.exclaim("Error: " + error.description() + "\r\nFunction: " + error.source());
}

ConversionForm::ConversionForm(std::string appFolder) : appFolder_(std::move(appFolder)) {}

FormList& ConversionForm::at(FormSide side, FormField field) {
  // One geoid model list serves both sides.
  if (field == FormField::GeoidModel) side = FormSide::Input;
  return lists_[static_cast<int>(side)][static_cast<int>(field)];
}

const FormList& ConversionForm::list(FormSide side, FormField field) const {
  return const_cast<ConversionForm*>(this)->at(side, field);
}

void ConversionForm::load(const SettingsStore& store, const ConversionSettings* preset) {
  for (auto& side : lists_)
    for (FormList& list : side) list = FormList{};
  scaleFactor_ = convergence_ = latLong_ = geoid_ = FormOption{};
  FormList& geoidModels = at(FormSide::Input, FormField::GeoidModel);
  geoidModels.items = GeoidModelNames();
  geoid_.enabled = geoidModels.enabled = false;
  std::vector<std::string> systems = LOAD_CS_ComboBoxList(appFolder_);
  if (std::find(systems.begin(), systems.end(), kGeographicCoordinates) == systems.end())
    systems.push_back(kGeographicCoordinates);
  at(FormSide::Input, FormField::CoordinateSystem).items = systems;
  at(FormSide::Output, FormField::CoordinateSystem).items = systems;

  bool usePreset = false;
  if (preset)
    for (FormField f : kSideFields)
      usePreset |= !SettingsField(*preset, FormSide::Input, f).empty();
  for (FormSide side : kSides) {
    for (FormField f : kSideFields) {
      choose(side, f,
             side == FormSide::Input && usePreset
                 ? SettingsField(*preset, side, f)
                 : store.get(kConversionSection, ConversionKey(side, f), ""));
    }
  }
  auto ticked = [&](const char* key) { return store.get(kConversionSection, key, "0") == "1"; };
  setScaleFactor(ticked("Scale Factor"));
  setConvergence(ticked("Convergence Angle"));
  setLatLong(ticked("Lat Long"));
  setGeoid(ticked("Geoid Heights"));
  choose(FormSide::Input, FormField::GeoidModel,
         store.get(kConversionSection, ConversionKey(FormSide::Input, FormField::GeoidModel), ""));
}

void ConversionForm::choose(FormSide side, FormField field, const std::string& value) {
  FormList& list = at(side, field);
  if (value.empty() || !Holds(list, value)) return;
  list.selected = value;
  switch (field) {
    case FormField::CoordinateSystem:
      chooseSystem(side);
      break;
    case FormField::Zone:
      chooseZone(side);
      break;
    case FormField::VerticalDatum:
      // An output datum chosen while the input's is "None" gives way to it.
      applyInputVerticalDatum();
      break;
    default:
      break;
  }
}

void ConversionForm::chooseSystem(FormSide side) {
  const FormSide other = side == FormSide::Input ? FormSide::Output : FormSide::Input;
  const bool geographic =
      list(side, FormField::CoordinateSystem).selected == kGeographicCoordinates;
  const bool otherGeographic =
      list(other, FormField::CoordinateSystem).selected == kGeographicCoordinates;
  const bool input = side == FormSide::Input;
  FormList& zone = at(side, FormField::Zone);
  Refill(zone, {});
  zone.enabled = !geographic;
  if (geographic) {
    Refill(at(side, FormField::HorizontalUnits), AngleFormatNames());
    latLong_.enabled = false;
    if (otherGeographic) scaleFactor_.enabled = convergence_.enabled = false;
  } else {
    Refill(at(side, FormField::HorizontalUnits), LinearUnitNames());
    scaleFactor_.enabled = convergence_.enabled = true;
    if (!otherGeographic) latLong_.enabled = true;
  }
  // The lists are cleared before a failing fill can throw.
  Refill(at(side, FormField::HorizontalDatum), {});
  Refill(at(side, FormField::VerticalDatum), {});
  Refill(at(side, FormField::VerticalUnits), LinearUnitNames());
  if (!geographic) {
    zone.items = LOAD_Zones_ComboBoxList(appFolder_, input,
                                         list(side, FormField::CoordinateSystem).selected);
  }
  at(side, FormField::HorizontalDatum).items =
      LoadDatumList(appFolder_, input, true, geographic, false);
  at(side, FormField::VerticalDatum).items =
      LoadDatumList(appFolder_, input, false, geographic, false);
  // The output vertical datum stays "None" while the input's is.
  if (!input) applyInputVerticalDatum();
}

void ConversionForm::chooseZone(FormSide side) {
  const ZoneDatumsAndUnits zone =
      ReadZoneDatumsAndUnits(appFolder_, list(side, FormField::CoordinateSystem).selected,
                             list(side, FormField::Zone).selected);
  choose(side, FormField::HorizontalDatum, zone.horizontalDatum);
  choose(side, FormField::VerticalDatum, zone.verticalDatum);
  choose(side, FormField::HorizontalUnits, zone.linearUnits);
  choose(side, FormField::VerticalUnits, zone.linearUnits);
}

void ConversionForm::applyInputVerticalDatum() {
  const std::string& datum = list(FormSide::Input, FormField::VerticalDatum).selected;
  FormList& outDatum = at(FormSide::Output, FormField::VerticalDatum);
  FormList& outUnits = at(FormSide::Output, FormField::VerticalUnits);
  if (datum == kNone) {
    if (Holds(outDatum, kNone)) outDatum.selected = kNone;
    outDatum.enabled = outUnits.enabled = geoid_.enabled = false;
  } else if (!datum.empty()) {
    at(FormSide::Input, FormField::VerticalUnits).enabled = true;
    outDatum.enabled = outUnits.enabled = geoid_.enabled = true;
  }
  followGeoid();
}

void ConversionForm::followGeoid() {
  at(FormSide::Input, FormField::GeoidModel).enabled = geoid_.enabled && geoid_.checked;
}

void ConversionForm::setScaleFactor(bool checked) {
  scaleFactor_.checked = checked;
}
void ConversionForm::setConvergence(bool checked) {
  convergence_.checked = checked;
}
void ConversionForm::setLatLong(bool checked) {
  latLong_.checked = checked;
}
void ConversionForm::setGeoid(bool checked) {
  geoid_.checked = checked;
  followGeoid();
}

std::optional<FormRefusal> ConversionForm::validate() const {
  const bool inGeographic =
      list(FormSide::Input, FormField::CoordinateSystem).selected == kGeographicCoordinates;
  const bool outGeographic =
      list(FormSide::Output, FormField::CoordinateSystem).selected == kGeographicCoordinates;
  const bool vertical = list(FormSide::Input, FormField::VerticalDatum).selected != kNone;
  const bool geoid = geoid_.enabled && geoid_.checked;
  struct Check {
    bool applies;
    FormSide side;
    FormField field;
    const char* title;
    const char* text;
  };
  using enum FormField;
  constexpr FormSide in = FormSide::Input, out = FormSide::Output;
  const Check checks[] = {
      {true, in, CoordinateSystem, "Coordinate System Required",
       "You must specify the input Coordinate System."},
      {!inGeographic, in, Zone, "Zone Required", "You must specify the input Zone."},
      {true, in, HorizontalDatum, "Horizontal Datum Requied",
       "You must specify the input Horizonal Datum."},
      {true, in, HorizontalUnits, "Horizontal Units Required",
       "You must specify the input Horizontal Units."},
      {vertical, in, VerticalUnits, "Vertical Units Required",
       "You must specify the Vertical Units."},
      {true, out, CoordinateSystem, "Coordinate System Required",
       "You must specify the output Coordinate System."},
      {!outGeographic, out, Zone, "Zone Required", "You must specify the output Zone."},
      {true, out, HorizontalDatum, "Horizontal Datum Requied",
       "You must specify the output Horizonal Datum."},
      {true, out, HorizontalUnits, "Horizontal Units Required",
       "You must specify the output Horizontal Units."},
      {vertical, out, VerticalDatum, "Vertical Datum Required",
       "You must specify the output Vertical Datum."},
      {vertical, out, VerticalUnits, "Vertical Units Required",
       "You must specify the output Vertical Units."},
      {geoid, in, GeoidModel, "Geoid Model Required",
       "You must specfiy the Geoid Model to use in order to Compute Geoid Heights."},
  };
  for (const Check& c : checks) {
    if (c.applies && list(c.side, c.field).selected.empty())
      return FormRefusal{c.title, c.text, c.side, c.field};
  }
  return std::nullopt;
}

ConversionSettings ConversionForm::settings() const {
  ConversionSettings s;
  for (FormSide side : kSides)
    for (FormField f : kSideFields) SettingsField(s, side, f) = list(side, f).selected;
  if (s.inputVerticalDatum == kNone) s.outputVerticalUnits = s.inputVerticalUnits;
  auto on = [](const FormOption& o) { return o.enabled && o.checked; };
  s.OutputScaleFactor = on(scaleFactor_);
  s.OutputConvergence = on(convergence_);
  s.OutputLatLong = on(latLong_);
  s.OutputGeoid = on(geoid_);
  if (s.OutputGeoid) s.geoidModel = list(FormSide::Input, FormField::GeoidModel).selected;
  return s;
}

std::string ConversionForm::heightType() const {
  const std::string& datum = list(FormSide::Input, FormField::VerticalDatum).selected;
  if (datum.empty() || datum == kNone) return "Ellipsoid";
  const std::optional<DatumRecord> record = DatumStore::In(appFolder_).load(datum);
  return record && record->type == "Vertical" ? "Orthometric" : "Ellipsoid";
}

ManualEntrySetup ConversionForm::manualEntrySetup() const {
  ManualEntrySetup setup;
  const std::string& units = list(FormSide::Input, FormField::HorizontalUnits).selected;
  setup.geographic =
      list(FormSide::Input, FormField::CoordinateSystem).selected == kGeographicCoordinates;
  setup.heightWanted = list(FormSide::Input, FormField::VerticalDatum).selected != kNone;
  setup.verticalUnits = list(FormSide::Input, FormField::VerticalUnits).selected;
  setup.heightType = heightType();
  (setup.geographic ? setup.angleFormat : setup.horizontalUnits) = units;
  return setup;
}

void ConversionForm::remember(SettingsStore& store) const {
  for (FormSide side : kSides)
    for (FormField f : kSideFields)
      store.save(kConversionSection, ConversionKey(side, f), list(side, f).selected);
  const std::pair<const char*, const FormOption*> options[] = {{"Scale Factor", &scaleFactor_},
                                                               {"Convergence Angle", &convergence_},
                                                               {"Lat Long", &latLong_},
                                                               {"Geoid Heights", &geoid_}};
  for (const auto& [key, option] : options)
    store.save(kConversionSection, key, option->checked ? "1" : "0");
  store.save(kConversionSection, ConversionKey(FormSide::Input, FormField::GeoidModel),
             list(FormSide::Input, FormField::GeoidModel).selected);
}

bool AcceptConversion(Ui& ui, const std::string& appFolder, const ConversionForm& form,
                      ConversionState& state, SettingsStore& store,
                      const ConversionDialogs& dialogs) {
  state.settings = form.settings();
  if (state.singlePoint) {
    SurveyPoint point = state.points.empty() ? SurveyPoint{} : state.points.front();
    if (!dialogs.enterPoint || !dialogs.enterPoint(form.manualEntrySetup(), point)) return false;
    state.points.assign(1, point);
  }
  state.accepted = false;
  if (!ConvertPoints(ui, appFolder, state)) return false;
  if (state.singlePoint && dialogs.showReport) dialogs.showReport(state.report);
  state.accepted = true;
  form.remember(store);
  return true;
}

std::optional<ConversionSettings> SettingsFromStore(Ui& ui, const std::string& appFolder,
                                                    const SettingsStore& store,
                                                    const ConversionSettings* preset,
                                                    const std::string& storeName) {
  ConversionForm form(appFolder);
  try {
    form.load(store, preset);
  } catch (const ZvError& e) {
    ShowListError(ui, e);
    return std::nullopt;
  }
  std::optional<FormRefusal> refusal = form.validate();
  if (!refusal) return form.settings();
  std::string text = refusal->text;
  text.append("\r\nKey \"")
      .append(ConversionKey(refusal->side, refusal->field))
      .append("\" of section \"")
      .append(kConversionSection)
      .append("\" in ")
      .append(storeName)
      .append(".");
  ui.message(text, Icon::Exclamation, Buttons::Ok, refusal->title);
  return std::nullopt;
}

namespace {

struct ManualCheck {
  ManualField field;
  const std::string& text;
  bool blanksRemoved;  // the spaced angle formats separate their fields with blanks
  const char* requiredTitle;
  const char* requiredText;
  const char* invalidTitle;
  const char* invalidText;
};

const char* const kInvalidLatitude[] = {"Invalid Latitude", "Latitude must be a numeric value."};
const char* const kInvalidLongitude[] = {"Invalid Longitude", "Longitude must be a numeric value."};

std::string WithoutBlanks(std::string_view text) {
  std::string out;
  for (char c : text)
    if (c != ' ' && c != '\t') out += c;
  return out;
}

// The angle in radians; -99999 after a message when it cannot be read.
double ReadAngle(Ui& ui, const std::string& text, const std::string& format,
                 const char* const invalid[2]) {
  const bool spaced = format == kFormatDMS || format == kFormatDM;
  const std::string angle = spaced ? std::string(Trim(text)) : WithoutBlanks(text);
  try {
    return Angles_TextToRadians(ui, angle, format);
  } catch (const ZvError&) {
    ui.message(invalid[1], Icon::Exclamation, Buttons::Ok, invalid[0]);
    return kNoValue;
  }
}

}  // namespace

std::optional<ManualRefusal> ValidateManualEntry(const ManualEntrySetup& setup,
                                                 const ManualEntryFields& fields) {
  const ManualCheck geographic[] = {
      {ManualField::Latitude, fields.latitude, true, "Latitude Required",
       "You must enter a Latitude.", kInvalidLatitude[0], kInvalidLatitude[1]},
      {ManualField::Longitude, fields.longitude, true, "Longitude Required",
       "You must enter a Longitude.", kInvalidLongitude[0], kInvalidLongitude[1]}};
  const ManualCheck plane[] = {
      {ManualField::Northing, fields.northing, false, "Northing Required",
       "You must enter a Northing.", "Invalid Northing", "Northing must be a numeric value."},
      {ManualField::Easting, fields.easting, false, "Easting Required",
       "You must enter an Easting.", "Invalid Easting", "Easting must be a numeric value."}};
  for (const ManualCheck& c : setup.geographic ? std::span(geographic) : std::span(plane)) {
    if (Trim(c.text).empty()) return ManualRefusal{c.requiredTitle, c.requiredText, c.field};
    if (!IsNumeric(c.blanksRemoved ? WithoutBlanks(c.text) : c.text))
      return ManualRefusal{c.invalidTitle, c.invalidText, c.field};
  }
  if (setup.heightWanted && !Trim(fields.height).empty() && !IsNumeric(fields.height))
    return ManualRefusal{"Invalid Height", "Height must be a numeric value.", ManualField::Height};
  return std::nullopt;
}

bool FillManualPoint(Ui& ui, const ManualEntrySetup& setup, const ManualEntryFields& fields,
                     SurveyPoint& point) {
  ResetPoint(point);
  const std::string name(Trim(fields.pointName));
  if (!name.empty()) point.PointName = name;
  point.VerticalUnits = setup.verticalUnits;
  std::optional<double> height;
  if (setup.heightWanted) height = ToNumber(fields.height);
  if (!setup.geographic) {
    point.HorizontalUnits = setup.horizontalUnits;
    point.Northing = ToNumber(fields.northing).value_or(kNoValue);
    point.Easting = ToNumber(fields.easting).value_or(kNoValue);
    if (height) point.Elevation = *height;
    return true;
  }
  point.HorizontalUnits = setup.angleFormat;
  point.GridMissing = true;
  point.LatitudeHemisphere = fields.latitudeDirection;
  point.LongitudeHemisphere = fields.longitudeDirection;
  point.Latitude = ReadAngle(ui, fields.latitude, setup.angleFormat, kInvalidLatitude);
  if (point.Latitude == kNoValue) return false;
  point.Longitude = ReadAngle(ui, fields.longitude, setup.angleFormat, kInvalidLongitude);
  if (point.Longitude == kNoValue) return false;
  if (height) (setup.heightType == "Ellipsoid" ? point.EllipsoidHeight : point.Elevation) = *height;
  return true;
}

}  // namespace zv
