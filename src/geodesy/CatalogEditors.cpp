#include "geodesy/CatalogEditors.h"

#include <algorithm>
#include <cstdio>

#include "geodesy/Angles.h"
#include "geodesy/Catalogs.h"
#include "geodesy/Ellipsoids.h"
#include "geodesy/NgsPrograms.h"
#include "platform/Error.h"
#include "platform/Numbers.h"
#include "platform/ProfileDocument.h"
#include "platform/Strings.h"

namespace zv {

namespace {

bool ContainsNoCase(const std::vector<std::string>& names, std::string_view name) {
  return std::any_of(names.begin(), names.end(),
                     [&](const std::string& n) { return EqualsNoCase(n, name); });
}

std::string Trimmed(const std::string& text) {
  return std::string(Trim(text));
}

// A list flag shown as a check box: "1" or "0".
std::string FlagText(const CatalogFlag& flag) {
  return flag.isOne().value_or(false) ? "1" : "0";
}

// The inverse flattening shown for a flattening; a sphere shows 0.
std::string InverseText(double f) {
  return f == 0 ? "0" : PlainValue(1 / f);
}

// Answers every box silently: angles are rewritten without messages.
class QuietUi : public Ui {
 public:
  Answer message(const std::string&, Icon, Buttons buttons, const std::string&) override {
    return buttons == Buttons::Ok ? Answer::Ok : Answer::No;
  }
  std::optional<std::string> input(const std::string&, const std::string&,
                                   const std::string&) override {
    return std::nullopt;
  }
  void viewText(const std::string&, const std::string&) override {}
};

}  // namespace

std::string PlainValue(double value) {
  char buffer[64];
  std::snprintf(buffer, sizeof buffer, "%.15g", value);
  std::optional<double> rounded = ToNumber(buffer);
  return FormatPlainDecimal(rounded ? *rounded : value);
}

// ---- common -------------------------------------------------------------

template <class Field>
void CatalogEditor<Field>::edit(Field f, std::string text) {
  if (text != stored_[Index(f)]) changed_ = true;
  text_[Index(f)] = std::move(text);
}

template <class Field>
void CatalogEditor<Field>::put(Field f, std::string text) {
  stored_[Index(f)] = text;
  text_[Index(f)] = std::move(text);
}

template <class Field>
void CatalogEditor<Field>::clearFields() {
  for (size_t i = 0; i < kFields; ++i) {
    text_[i].clear();
    stored_[i].clear();
  }
}

template <class Field>
bool CatalogEditor<Field>::select(const std::string& name) {
  if (changed_ && !save()) return false;
  changed_ = false;
  isNew_ = false;
  loadEntry(name);
  return true;
}

template <class Field>
bool CatalogEditor<Field>::newEntry() {
  if (changed_ && !save()) return false;
  clearEntry();
  selected_.clear();
  changed_ = false;
  isNew_ = true;
  focus_ = Field::ShortName;
  return true;
}

template <class Field>
bool CatalogEditor<Field>::ok() {
  if (changed_ && !save()) return false;
  changed_ = false;
  return true;
}

template <class Field>
bool CatalogEditor<Field>::close() {
  if (!changed_) return true;
  std::string title = "Save ";
  title.append(words_.title).append(" Changes?");
  std::string text = "Changes were made to the current ";
  text.append(words_.word).append(".  Would you like to save them?");
  switch (ui_.message(text, Icon::None, Buttons::YesNoCancel, title)) {
    case Answer::Yes:
      return save();
    case Answer::No:
      return true;
    default:
      return false;
  }
}

template <class Field>
bool CatalogEditor<Field>::remove() {
  if (selected_.empty() || !mayRemove()) return false;
  std::string title = "Delete ";
  title.append(words_.title).append("?");
  std::string text = "Are you sure you want to permanently delete the '";
  text.append(selected_).append("' ").append(words_.word).append("?");
  if (!ui_.askYesNo(text, title)) return false;
  if (!removeEntry(selected_)) return false;
  loadList();
  selected_.clear();
  changed_ = false;
  isNew_ = true;
  return true;
}

template <class Field>
bool CatalogEditor<Field>::refuse(Field f, const std::string& text) {
  std::string title = "Invalid ";
  title.append(words_.title);
  ui_.exclaim(text, title);
  focus_ = f;
  return false;
}

template <class Field>
bool CatalogEditor<Field>::confirmOverwrite(const std::string& name, bool exists) {
  if (!exists) return true;
  std::string title, text;
  if (isNew_) {
    title.append("Overwrite ").append(words_.title).append("?");
    text.append(words_.article).append(" ").append(words_.word);
    text.append(" with the short name '").append(name);
    text.append("' already exists. Would you like to overwrite it?");
  } else {
    title.append("Save ").append(words_.title).append(" Changes?");
    text.append("Save changes made to existing ").append(words_.word);
    text.append(" '").append(name).append("'?");
  }
  if (ui_.askYesNo(text, title)) return true;
  focus_ = Field::ShortName;
  return false;
}

template <class Field>
bool CatalogEditor<Field>::writeFailed(const CatalogFile& store) {
  std::string text = "The catalog '";
  text.append(store.path()).append("' could not be written.");
  if (!store.error().empty()) text.append("\r\n").append(store.error());
  ui_.exclaim(text);
  return false;
}

template <class Field>
void CatalogEditor<Field>::saved(const std::string& name) {
  loadList();
  loadEntry(name);
  changed_ = false;
  isNew_ = false;
}

template class CatalogEditor<EllipsoidField>;
template class CatalogEditor<DatumField>;
template class CatalogEditor<ZoneField>;

// ---- ellipsoids ---------------------------------------------------------

namespace {

struct Parameter {
  char letter;
  EllipsoidField field;
  const char* invalid;   // the "Non-numeric Value" text
  const char* required;  // the save refusal of an empty field
  const char* numeric;   // the save refusal of a non-numeric one
};

constexpr Parameter kParameters[] = {
    {'a', EllipsoidField::SemimajorAxis, "Invalid Semimajor axis.",
     "Can not save Ellipsoid.  A Semimajor Axis is required.",
     "Can not save Ellipsoid.  The Semimajor Axis is not a numeric value."},
    {'b', EllipsoidField::SemiminorAxis, "Invalid Semiminor axis.",
     "Can not save Ellipsoid.  A Semiminor Axis is required.",
     "Can not save Ellipsoid.  The Semiminor Axis is not a numeric value."},
    {'f', EllipsoidField::Flattening, "Invalid Flattening.",
     "Can not save Ellipsoid.  A Flattening is required.",
     "Can not save Ellipsoid.  The Flattening is not a numeric value."},
    {'e', EllipsoidField::Eccentricity, "Invalid Eccentricity.",
     "Can not save Ellipsoid.  An Eccentricity is required.",
     "Can not save Ellipsoid.  The Eccentricity is not a numeric value."}};

}  // namespace

EllipsoidEditor::EllipsoidEditor(Ui& ui, const std::string& appFolder)
    : CatalogEditor(ui, {"Ellipsoid", "ellipsoid", "An"}), store_(EllipsoidStore::In(appFolder)) {}

void EllipsoidEditor::load() {
  loadList();
  selected_.clear();
  changed_ = false;
  isNew_ = true;
}

void EllipsoidEditor::loadList() {
  clearEntry();
  entries_ = store_.sections();
}

void EllipsoidEditor::clearEntry() {
  clearFields();
  put(EllipsoidField::Show, "1");
}

void EllipsoidEditor::loadEntry(const std::string& name) {
  clearEntry();
  std::optional<EllipsoidRecord> r = store_.load(name);
  if (!r) return;
  selected_ = r->name;
  put(EllipsoidField::ShortName, r->name);
  put(EllipsoidField::FullName, r->fullName);
  put(EllipsoidField::SemimajorAxis, r->semimajorAxis.text);
  put(EllipsoidField::SemiminorAxis, r->semiminorAxis.text);
  std::optional<double> f = r->flattening.value();
  put(EllipsoidField::Flattening, f ? InverseText(*f) : r->flattening.text);
  put(EllipsoidField::Eccentricity, r->eccentricity.text);
  put(EllipsoidField::Show, r->show.text.empty() ? "1" : FlagText(r->show));
}

bool EllipsoidEditor::removeEntry(const std::string& name) {
  return store_.remove(name) || writeFailed(store_);
}

bool EllipsoidEditor::save() {
  const std::string name = Trimmed(text(EllipsoidField::ShortName));
  if (name.empty()) {
    return refuse(EllipsoidField::ShortName, "Can not save Ellipsoid.  A Short Name is required.");
  }
  if (!IsValidSectionName(name)) {
    return refuse(EllipsoidField::ShortName,
                  "Can not save Ellipsoid.  The Short Name can not contain the ']' character.");
  }
  if (!confirmOverwrite(name, ContainsNoCase(entries_, name))) return true;
  for (const Parameter& p : kParameters) {
    if (Trim(text(p.field)).empty()) return refuse(p.field, p.required);
  }
  double values[4];
  for (int i = 0; i < 4; ++i) {
    std::optional<double> v = ToNumber(text(kParameters[i].field));
    if (!v) return refuse(kParameters[i].field, kParameters[i].numeric);
    values[i] = *v;
  }
  EllipsoidRecord r;
  r.name = name;
  r.fullName = text(EllipsoidField::FullName);
  r.semimajorAxis.text = Trimmed(text(EllipsoidField::SemimajorAxis));
  r.semiminorAxis.text = Trimmed(text(EllipsoidField::SemiminorAxis));
  r.flattening.text = values[2] == 0 ? "0" : PlainValue(1 / values[2]);
  r.eccentricity.text = Trimmed(text(EllipsoidField::Eccentricity));
  r.show = CatalogFlag::Of(checked(EllipsoidField::Show));
  if (!store_.save(r)) return writeFailed(store_);
  saved(name);
  return true;
}

void EllipsoidEditor::leaveParameter(char parameter) {
  const Parameter* changed = nullptr;
  for (const Parameter& p : kParameters) {
    if (p.letter == parameter) changed = &p;
  }
  if (!changed) {
    ui_.critical("Can not compute ellipsoid parameters. Received an unknown parameter.",
                 "Unknown Ellipsoid Parameter");
    return;
  }
  if (Trim(text(changed->field)).empty()) return;
  // The value of a parameter field: f for the flattening field's 1/f.
  auto value = [this](const Parameter& p) -> std::optional<double> {
    std::optional<double> v = ToNumber(text(p.field));
    if (!v) {
      ui_.critical(p.invalid, "Non-numeric Value");
      focus_ = p.field;
    } else if (p.letter == 'f' && *v != 0) {
      *v = 1 / *v;
    }
    return v;
  };
  std::optional<double> own = value(*changed);
  if (!own) return;
  const Parameter* other = nullptr;
  for (const Parameter& p : kParameters) {
    if (&p != changed && !other && !Trim(text(p.field)).empty()) other = &p;
  }
  if (!other) return;
  std::optional<double> second = value(*other);
  if (!second) return;

  double v[4] = {kEllipsoidUnknown, kEllipsoidUnknown, kEllipsoidUnknown, kEllipsoidUnknown};
  v[changed - kParameters] = *own;
  v[other - kParameters] = *second;
  try {
    Ellipsoids_GET_Parameters(v[0], v[1], v[2], v[3]);
  } catch (const ZvError& e) {
    std::string message = e.description();
    message.append("\r\n\r\nFunction: ").append(e.source());
    ui_.exclaim(message, "Ellipsoid Parameter Error");
    return;
  }
  put(EllipsoidField::SemimajorAxis, PlainValue(v[0]));
  put(EllipsoidField::SemiminorAxis, PlainValue(v[1]));
  put(EllipsoidField::Flattening, InverseText(v[2]));
  put(EllipsoidField::Eccentricity, PlainValue(v[3]));
}

// ---- datums -------------------------------------------------------------

namespace {

std::vector<std::string> ShownEllipsoids(const std::string& appFolder) {
  std::vector<std::string> names;
  for (const EllipsoidRecord& e : EllipsoidStore::In(appFolder).loadAll()) {
    if (e.show.isOne().value_or(false)) names.push_back(e.name);
  }
  return names;
}

}  // namespace

DatumEditor::DatumEditor(Ui& ui, const std::string& appFolder)
    : CatalogEditor(ui, {"Datum", "datum", "A"}),
      appFolder_(appFolder),
      store_(DatumStore::In(appFolder)) {}

void DatumEditor::load() {
  ellipsoids_ = ShownEllipsoids(appFolder_);
  loadList();
  selected_.clear();
  changed_ = false;
  isNew_ = true;
}

void DatumEditor::loadList() {
  clearEntry();
  entries_ = store_.sections();
}

void DatumEditor::clearEntry() {
  clearFields();
  put(DatumField::ShowIn, "1");
  put(DatumField::ShowOut, "1");
  rows_.clear();
  row_ = -1;
  methods_.clear();
}

void DatumEditor::loadEntry(const std::string& name) {
  clearEntry();
  std::optional<DatumRecord> r = store_.load(name);
  if (!r) return;
  selected_ = r->name;
  put(DatumField::ShortName, r->name);
  put(DatumField::FullName, r->fullName);
  put(DatumField::Type, r->type);
  put(DatumField::Ellipsoid, r->ellipsoid);
  put(DatumField::ShowIn, FlagText(r->showIn));
  put(DatumField::ShowOut, FlagText(r->showOut));
  for (const auto& [datum, method] : r->transformations) rows_.push_back({datum, method});
  fillMethods(true);
}

bool DatumEditor::removeEntry(const std::string& name) {
  return store_.remove(name) || writeFailed(store_);
}

void DatumEditor::chooseType(const std::string& type) {
  edit(DatumField::Type, type);
  fillMethods(true);
}

void DatumEditor::fillMethods(bool tell) {
  const std::string& type = text(DatumField::Type);
  methods_.clear();
  if (type == "Horizontal") {
    for (const NadconMethod& m : NadconMethods()) methods_.push_back(m.name);
  } else if (type == "Vertical" || type == "3D") {
    if (type == "Vertical") methods_ = VertconMethodNames();
    const std::vector<std::string>& geoid = GeoidMethodNames();
    methods_.insert(methods_.end(), geoid.begin(), geoid.end());
  } else if (!type.empty() && tell) {
    ui_.exclaim("Unknown Datum Type Selected. Can not load Transformation Methods.",
                "Unknown Datum Type");
  }
}

std::vector<std::string> DatumEditor::targets() const {
  const std::string& type = text(DatumField::Type);
  const std::string self = Trimmed(text(DatumField::ShortName));
  std::vector<std::string> names;
  for (const DatumRecord& d : store_.loadAll()) {
    if (EqualsNoCase(d.name, self)) continue;
    const bool suits = type == "Horizontal" ? d.type == "Horizontal"
                       : type == "Vertical" ? d.type == "Vertical" || d.type == "3D"
                       : type == "3D"       ? d.type == "Vertical"
                                            : false;
    if (suits) names.push_back(d.name);
  }
  return names;
}

void DatumEditor::selectRow(int row) {
  row_ = row >= 0 && row < static_cast<int>(rows_.size()) ? row : -1;
}

void DatumEditor::addRow() {
  rows_.push_back({});
  row_ = static_cast<int>(rows_.size()) - 1;
  changed_ = true;
}

void DatumEditor::removeRow() {
  if (row_ < 0) return;
  rows_.erase(rows_.begin() + row_);
  row_ = std::min(row_, static_cast<int>(rows_.size()) - 1);
  changed_ = true;
}

void DatumEditor::chooseTarget(const std::string& datum) {
  if (row_ < 0 || rows_[row_].datum == datum) return;
  for (int i = 0; i < static_cast<int>(rows_.size()); ++i) {
    if (i != row_ && EqualsNoCase(rows_[i].datum, datum)) {
      std::string text = "A transformation to the '";
      text.append(datum).append("' datum has already been defined.");
      ui_.inform(text, "Transformation Already Exists");
      return;
    }
  }
  rows_[row_].datum = datum;
  changed_ = true;
}

void DatumEditor::chooseMethod(const std::string& method) {
  if (row_ < 0 || rows_[row_].method == method) return;
  rows_[row_].method = method;
  changed_ = true;
}

bool DatumEditor::save() {
  const std::string name = Trimmed(text(DatumField::ShortName));
  if (name.empty())
    return refuse(DatumField::ShortName, "Can not save datum. A short name is required.");
  if (!IsValidSectionName(name)) {
    return refuse(DatumField::ShortName,
                  "Can not save datum. The short name can not contain the ']' character.");
  }
  if (!confirmOverwrite(name, ContainsNoCase(entries_, name))) return true;
  const std::string& type = text(DatumField::Type);
  if (type.empty())
    return refuse(DatumField::Type, "Can not save datum. A datum type is required.");
  if (type != "Vertical" && text(DatumField::Ellipsoid).empty()) {
    return refuse(DatumField::Ellipsoid, "Can not save datum. An ellipsoid is required.");
  }
  for (const Transformation& t : rows_) {
    if (t.datum.empty() || t.method.empty()) {
      return refuse(DatumField::Grid, "Can not save datum. Transformations are not fully defined.");
    }
  }
  DatumRecord r;
  r.name = name;
  r.fullName = text(DatumField::FullName);
  r.type = type;
  if (type != "Vertical") r.ellipsoid = text(DatumField::Ellipsoid);
  r.showIn = CatalogFlag::Of(checked(DatumField::ShowIn));
  r.showOut = CatalogFlag::Of(checked(DatumField::ShowOut));
  for (const Transformation& t : rows_) r.transformations.emplace_back(t.datum, t.method);
  if (!store_.save(r)) return writeFailed(store_);
  saved(name);
  return true;
}

// ---- zones --------------------------------------------------------------

namespace {

struct ZoneParameter {
  ZoneField field;
  const char* name;     // "Central Latitude"
  const char* article;  // "A" or "An"
  bool angle;
};

constexpr ZoneParameter kZoneParameters[] = {
    {ZoneField::CentralLatitude, "Central Latitude", "A", true},
    {ZoneField::CentralLongitude, "Central Longitude", "A", true},
    {ZoneField::FalseNorthing, "False Northing", "A", false},
    {ZoneField::FalseEasting, "False Easting", "A", false},
    {ZoneField::ScaleFactor, "Scale Factor", "A", false},
    {ZoneField::NorthernParallel, "Northern Parallel", "A", true},
    {ZoneField::SouthernParallel, "Southern Parallel", "A", true},
    {ZoneField::Azimuth, "Azimuth", "An", true}};

const ZoneParameter& ParameterOf(ZoneField f) {
  for (const ZoneParameter& p : kZoneParameters) {
    if (p.field == f) return p;
  }
  return kZoneParameters[0];
}

constexpr ZoneField kAngleFields[] = {ZoneField::CentralLatitude, ZoneField::CentralLongitude,
                                      ZoneField::NorthernParallel, ZoneField::SouthernParallel,
                                      ZoneField::Azimuth};

// An angle as text in one of the four formats.
std::string FormatAngle(Ui& ui, double radians, const std::string& format) {
  if (format == kFormatDMS) return Angles_RadiansToDMS(ui, radians, 5, false);
  if (format == kFormatDecimal) return Angles_RadiansToDecimal(radians, 9, false);
  if (format == kFormatDM) return Angles_RadiansToDM(radians, 7, false);
  return Angles_RadiansToPacked(ui, radians, 5);
}

bool IsAngleFormat(const std::string& format) {
  const std::vector<std::string> names = AngleFormatNames();
  return std::find(names.begin(), names.end(), format) != names.end();
}

// "Can not save Zone.  The <part> can not contain the '<c>' character."
std::string NameRefusal(const char* part, char c) {
  std::string text = "Can not save Zone.  The ";
  text.append(part).append(" can not contain the '");
  text.push_back(c);
  text.append("' character.");
  return text;
}

}  // namespace

const std::vector<ZoneField>& PanelFields(int panel) {
  using F = ZoneField;
  static const std::vector<ZoneField> kNone;
  static const std::vector<ZoneField> kPanels[] = {
      {F::CentralLatitude, F::CentralLongitude, F::FalseNorthing, F::FalseEasting, F::ScaleFactor},
      {F::CentralLatitude, F::CentralLongitude, F::FalseNorthing, F::FalseEasting,
       F::NorthernParallel, F::SouthernParallel},
      {F::CentralLatitude, F::CentralLongitude, F::FalseNorthing, F::FalseEasting, F::ScaleFactor,
       F::Azimuth}};
  return panel >= 1 && panel <= 3 ? kPanels[panel - 1] : kNone;
}

int ProjectionPanel(const std::string& projection) {
  if (projection == kTransverseMercator || projection == kLambertOneParallel ||
      projection == kTransverseMercatorNad27) {
    return 1;
  }
  if (projection == kLambertTwoParallels || projection == kLambertNad27) return 2;
  if (projection == kObliqueMercator) return 3;
  return 0;
}

ZoneEditor::ZoneEditor(Ui& ui, const std::string& appFolder)
    : CatalogEditor(ui, {"Zone", "zone", "A"}), store_(ZoneStore::In(appFolder)) {
  for (const DatumRecord& d : DatumStore::In(appFolder).loadAll()) {
    if (!d.showIn.isOne().value_or(false)) continue;
    if (d.type == "Horizontal" || d.type == "3D") hDatums_.push_back(d.name);
    if (d.type == "Vertical" || d.type == "3D") vDatums_.push_back(d.name);
  }
  vDatums_.insert(vDatums_.begin(), std::string());
  ellipsoids_ = ShownEllipsoids(appFolder);
  ellipsoids_.insert(ellipsoids_.begin(), std::string());
}

void ZoneEditor::load() {
  loadList();
  selected_.clear();
  changed_ = false;
  isNew_ = true;
}

void ZoneEditor::loadList() {
  systems_.clear();
  try {
    systems_ = store_.coordinateSystems();
  } catch (const ZvError& e) {
    ui_.exclaim(e.description(), "Error");
  }
  if (std::find(systems_.begin(), systems_.end(), listed_) != systems_.end()) {
    listZones(listed_);
  } else {
    listed_.clear();
    entries_.clear();
  }
  clearEntry();
}

void ZoneEditor::listZones(const std::string& system) {
  listed_ = system;
  entries_.clear();
  try {
    entries_ = store_.zones(system);
  } catch (const ZvError& e) {
    ui_.exclaim(e.description(), "Error");
  }
}

void ZoneEditor::clearEntry() {
  clearFields();
  loadedSystem_.clear();
  put(ZoneField::CoordinateSystem, listed_);
  put(ZoneField::ShowIn, "1");
  put(ZoneField::ShowOut, "1");
  put(ZoneField::LatitudeDirection, "N");
  put(ZoneField::LongitudeDirection, "W");
  put(ZoneField::LinearUnits, kMeters);
  put(ZoneField::AngularUnits, kFormatPacked);
}

void ZoneEditor::loadEntry(const std::string& name) {
  clearEntry();
  std::optional<ZoneRecord> r = store_.load(listed_, name);
  if (!r) return;
  auto or_ = [](const std::string& text, const char* fallback) {
    return text.empty() ? std::string(fallback) : text;
  };
  selected_ = r->zone;
  loadedSystem_ = r->coordinateSystem;
  put(ZoneField::CoordinateSystem, r->coordinateSystem);
  put(ZoneField::ShortName, r->zone);
  put(ZoneField::FullName, r->fullName);
  put(ZoneField::HorizontalDatum, r->horizontalDatum);
  put(ZoneField::Ellipsoid, r->computationalEllipsoid);
  put(ZoneField::VerticalDatum, r->verticalDatum);
  put(ZoneField::Projection, r->projection);
  put(ZoneField::ShowIn, FlagText(r->showIn));
  put(ZoneField::ShowOut, FlagText(r->showOut));
  put(ZoneField::CentralLatitude, r->centralLatitude.text);
  put(ZoneField::CentralLongitude, r->centralLongitude.text);
  put(ZoneField::FalseNorthing, r->falseNorthing.text);
  put(ZoneField::FalseEasting, r->falseEasting.text);
  put(ZoneField::ScaleFactor, r->scaleFactor.text);
  put(ZoneField::NorthernParallel, r->northernParallel.text);
  put(ZoneField::SouthernParallel, r->southernParallel.text);
  put(ZoneField::Azimuth, r->azimuth.text);
  put(ZoneField::LatitudeDirection, or_(r->latitudeDirection, "N"));
  put(ZoneField::LongitudeDirection, or_(r->longitudeDirection, "W"));
  put(ZoneField::LinearUnits, or_(r->linearUnits, kMeters));
}

bool ZoneEditor::mayRemove() {
  if (Trim(text(ZoneField::CoordinateSystem)) == loadedSystem_) return true;
  ui_.inform("Can not delete zone. The coordinate system has changed.", "Can not Delete Zone");
  return false;
}

bool ZoneEditor::removeEntry(const std::string& name) {
  return store_.remove(loadedSystem_, name) || writeFailed(store_);
}

bool ZoneEditor::chooseCoordinateSystem(const std::string& system) {
  if (isNew_ && changed_) {
    listZones(system);
    edit(ZoneField::CoordinateSystem, system);
    return true;
  }
  if (changed_ && !save()) return false;
  listZones(system);
  clearEntry();
  selected_.clear();
  changed_ = false;
  isNew_ = true;
  return true;
}

std::vector<std::string> ZoneEditor::choices(ZoneField f) const {
  switch (f) {
    case ZoneField::CoordinateSystem:
      return systems_;
    case ZoneField::ShortName:
      return entries_;
    case ZoneField::HorizontalDatum:
      return hDatums_;
    case ZoneField::Ellipsoid:
      return ellipsoids_;
    case ZoneField::VerticalDatum:
      return vDatums_;
    case ZoneField::Projection:
      return ProjectionNames();
    case ZoneField::LatitudeDirection:
      return {"N", "S"};
    case ZoneField::LongitudeDirection:
      return {"E", "W"};
    case ZoneField::LinearUnits:
      return LinearUnitNames();
    case ZoneField::AngularUnits:
      return AngleFormatNames();
    default:
      return {};
  }
}

void ZoneEditor::chooseAngularUnits(const std::string& format) {
  const std::string old = text(ZoneField::AngularUnits);
  edit(ZoneField::AngularUnits, format);
  if (old == format || !IsAngleFormat(old) || !IsAngleFormat(format)) return;
  QuietUi quiet;
  for (ZoneField f : kAngleFields) {
    const std::string shown = Trimmed(text(f));
    if (shown.empty()) continue;
    try {
      const double r = Angles_TextToRadians(quiet, shown, old);
      if (r != kNoValue) edit(f, FormatAngle(quiet, r, format));
    } catch (const ZvError&) {
      // Not an angle in the old format: left for the save to refuse.
    }
  }
}

void ZoneEditor::leaveScaleFactor() {
  const std::string shown = Trimmed(text(ZoneField::ScaleFactor));
  if (shown.rfind("1:", 0) != 0) return;
  std::optional<double> n = ToNumber(shown.substr(2));
  if (!n || *n == 0) {
    ui_.exclaim("The Scale Factor must be a numeric value or a ratio in the format of '1:25000'",
                "Invalid Scale Factor");
    focus_ = ZoneField::ScaleFactor;
    return;
  }
  edit(ZoneField::ScaleFactor, PlainValue(1 - 1 / *n));
}

bool ZoneEditor::importZone(const ZoneRecord& z) {
  const std::string system = text(ZoneField::CoordinateSystem);
  if (changed_ && !save()) return false;
  clearEntry();
  selected_.clear();
  changed_ = false;
  isNew_ = true;
  edit(ZoneField::CoordinateSystem, z.coordinateSystem.empty() ? system : z.coordinateSystem);
  edit(ZoneField::ShortName, z.zone);
  edit(ZoneField::FullName, z.fullName);
  edit(ZoneField::HorizontalDatum, z.horizontalDatum);
  edit(ZoneField::Ellipsoid, z.computationalEllipsoid);
  edit(ZoneField::VerticalDatum, z.verticalDatum);
  edit(ZoneField::Projection, z.projection);
  edit(ZoneField::ShowIn, FlagText(z.showIn));
  edit(ZoneField::ShowOut, FlagText(z.showOut));
  edit(ZoneField::CentralLatitude, z.centralLatitude.text);
  edit(ZoneField::CentralLongitude, z.centralLongitude.text);
  edit(ZoneField::FalseNorthing, z.falseNorthing.text);
  edit(ZoneField::FalseEasting, z.falseEasting.text);
  edit(ZoneField::ScaleFactor, z.scaleFactor.text);
  edit(ZoneField::NorthernParallel, z.northernParallel.text);
  edit(ZoneField::SouthernParallel, z.southernParallel.text);
  edit(ZoneField::Azimuth, z.azimuth.text);
  if (!z.latitudeDirection.empty()) edit(ZoneField::LatitudeDirection, z.latitudeDirection);
  if (!z.longitudeDirection.empty()) edit(ZoneField::LongitudeDirection, z.longitudeDirection);
  if (!z.linearUnits.empty()) edit(ZoneField::LinearUnits, z.linearUnits);
  changed_ = true;
  return true;
}

bool ZoneEditor::save() {
  const std::string system = Trimmed(text(ZoneField::CoordinateSystem));
  const std::string zone = Trimmed(text(ZoneField::ShortName));
  using F = ZoneField;
  if (system.empty())
    return refuse(F::CoordinateSystem, "Can not save Zone.  A Coordinate System is required.");
  if (system.find('~') != std::string::npos) {
    return refuse(F::CoordinateSystem, NameRefusal("Coordinate System", '~'));
  }
  if (zone.empty()) return refuse(F::ShortName, "Can not save Zone.  A Short Name is required.");
  if (zone.find('~') != std::string::npos)
    return refuse(F::ShortName, NameRefusal("Short Name", '~'));
  if (!IsValidSectionName(system))
    return refuse(F::CoordinateSystem, NameRefusal("Coordinate System", ']'));
  if (!IsValidSectionName(zone)) return refuse(F::ShortName, NameRefusal("Short Name", ']'));
  if (!confirmOverwrite(zone, !store_.findSection(system, zone).empty())) return true;
  if (text(F::HorizontalDatum).empty()) {
    return refuse(F::HorizontalDatum, "Can not save Zone.  A Horizontal Datum is required.");
  }
  if (!text(F::Ellipsoid).empty() &&
      !ui_.askYesNo("Specifying a computational ellipsoid will override the ellipsoid defined by "
                    "the horizontal datum.  Are you sure you want to do this?",
                    "Override Datum Ellipsoid?")) {
    focus_ = F::Ellipsoid;
    return false;
  }
  const std::string& projection = text(F::Projection);
  if (projection.empty())
    return refuse(F::Projection, "Can not save Zone.  A Projection is required.");
  const int panelNumber = ProjectionPanel(projection);
  if (panelNumber == 0) {
    ui_.exclaim("Unkown Projection Type.  Can not save parameters.", "Unknown Projection Type");
    focus_ = F::Projection;
    return false;
  }

  ZoneRecord r;
  r.coordinateSystem = system;
  r.zone = zone;
  r.fullName = text(F::FullName);
  r.horizontalDatum = text(F::HorizontalDatum);
  r.computationalEllipsoid = text(F::Ellipsoid);
  r.verticalDatum = text(F::VerticalDatum);
  r.projection = projection;
  r.showIn = CatalogFlag::Of(checked(F::ShowIn));
  r.showOut = CatalogFlag::Of(checked(F::ShowOut));
  const std::string& format = text(F::AngularUnits);
  for (ZoneField f : PanelFields(panelNumber)) {
    const ZoneParameter& p = ParameterOf(f);
    const std::string value = Trimmed(text(f));
    if (value.empty()) {
      std::string refusal = "Can not save Zone.  ";
      refusal.append(p.article).append(" ").append(p.name).append(" is required.");
      return refuse(f, refusal);
    }
    std::string notNumeric = "Can not save Zone.  The ";
    notNumeric.append(p.name).append(" is not a numeric value.");
    if (!p.angle || format.empty()) {
      if (!IsNumeric(value)) return refuse(f, notNumeric);
    }
    if (!p.angle) {
      CatalogNumber number{value};
      if (f == F::FalseNorthing) r.falseNorthing = number;
      if (f == F::FalseEasting) r.falseEasting = number;
      if (f == F::ScaleFactor) r.scaleFactor = number;
      continue;
    }
    if (format.empty()) continue;  // refused below
    double radians = kNoValue;
    try {
      radians = Angles_TextToRadians(ui_, value, format);
    } catch (const ZvError&) {
      return refuse(f, notNumeric);
    }
    if (radians == kNoValue) {
      focus_ = f;
      return false;
    }
    CatalogAngle angle = CatalogAngle::Of(ui_, radians);
    if (f == F::CentralLatitude) r.centralLatitude = angle;
    if (f == F::CentralLongitude) r.centralLongitude = angle;
    if (f == F::NorthernParallel) r.northernParallel = angle;
    if (f == F::SouthernParallel) r.southernParallel = angle;
    if (f == F::Azimuth) r.azimuth = angle;
  }
  if (text(F::LatitudeDirection).empty()) {
    return refuse(F::LatitudeDirection,
                  "Can not save Zone.  A Positive Latitude Direction is required.");
  }
  if (text(F::LongitudeDirection).empty()) {
    return refuse(F::LongitudeDirection,
                  "Can not save Zone.  A Positive Longitude Direction is required.");
  }
  if (text(F::LinearUnits).empty())
    return refuse(F::LinearUnits, "Can not save Zone.  Linear Units are required.");
  if (format.empty())
    return refuse(F::AngularUnits, "Can not save Zone.  Angular Units are required.");
  r.latitudeDirection = text(F::LatitudeDirection);
  r.longitudeDirection = text(F::LongitudeDirection);
  r.linearUnits = text(F::LinearUnits);
  if (!store_.save(r)) return writeFailed(store_);
  if (std::optional<ZoneRecord> written = store_.load(system, zone)) {
    listed_ = written->coordinateSystem;
  }
  saved(zone);
  return true;
}

}  // namespace zv
