#include "userformats/FlexUnattended.h"

#include <algorithm>

#include "geodesy/Angles.h"
#include "platform/ProfileDocument.h"
#include "userformats/FlexForm.h"

namespace zv {

namespace {

// The format's name and its eight reference values, in FlexList order.
struct Reference {
  std::string name;
  std::string values[8];
  std::string& operator[](FlexList l) { return values[static_cast<int>(l)]; }
  const std::string& operator[](FlexList l) const { return values[static_cast<int>(l)]; }
};

std::string JoinedOr(const std::vector<std::string>& items) {
  std::string text;
  for (size_t i = 0; i < items.size(); ++i) {
    if (i > 0) text.append(i + 1 == items.size() ? " or " : ", ");
    text.append("'").append(items[i]).append("'");
  }
  return text;
}

// The reference value of a list that the file's header gives; empty for
// units and directions, which are the format's choice.
std::string FromHeader(const FileHeader* file, FlexList l) {
  if (!file) return "";
  switch (l) {
    case FlexList::CoordinateSystem:
      return file->CoordinateSystem;
    case FlexList::Zone:
      return file->Zone;
    case FlexList::HorizontalDatum:
      return file->HorizontalDatum;
    case FlexList::VerticalDatum:
      return file->VerticalDatum;
    default:
      return "";
  }
}

std::optional<Reference> Resolve(Ui& ui, FlexDirection direction, const std::string& appFolder,
                                 const SettingsStore& remembered, const std::string& formatName,
                                 const FileHeader* file) {
  const bool in = direction == FlexDirection::In;
  const char* section = FlexSection(direction);
  const FlexStore store = in ? FlexStore::Input(appFolder) : FlexStore::Output(appFolder);
  Reference r;
  r.name = formatName.empty() ? remembered.get(section, kFlexFormatKey, "") : formatName;
  if (r.name.empty()) {
    ui.exclaim(std::string("No user-defined ") + (in ? "input" : "output") +
                   " format was named.\r\nName a format of '" + store.path() +
                   "' as the configuration (the fifth field of -t), or use one in the window "
                   "first.",
               "Format Required");
    return std::nullopt;
  }
  if (!store.checkFormat(ui, r.name)) return std::nullopt;
  const ProfileDocument doc = ProfileDocument::Load(store.path());
  const bool geographic = doc.value(r.name, "Coordinate Type", "") == kGeographic;
  bool fromFormat[8] = {};
  for (FlexList l : kFlexLists) {
    std::string value = doc.value(r.name, FlexListKey(l), "");
    fromFormat[static_cast<int>(l)] = !value.empty();
    if (value.empty()) value = FromHeader(file, l);
    if (value.empty()) value = remembered.get(section, FlexListKey(l), FlexListDefault(l));
    r[l] = value;
  }
  if (geographic && !fromFormat[static_cast<int>(FlexList::CoordinateSystem)]) {
    r[FlexList::CoordinateSystem] = kGeographicCoordinates;
    r[FlexList::Zone].clear();
  }

  struct Check {
    FlexList list;
    bool applies;
    std::vector<std::string> allowed;
    const char* title;
    const char* text;
  };
  const Check checks[] = {
      {FlexList::HorizontalUnits, true, geographic ? AngleFormatNames() : LinearUnitNames(),
       "Specify Horizontal Units", "You must specify the Horizontal Units."},
      {FlexList::VerticalUnits, r[FlexList::VerticalDatum] != "None", LinearUnitNames(),
       "Specify Vertical Units", "You must specify the Vertical Units."},
      {FlexList::LatitudeDirection,
       geographic,
       {"N", "S"},
       "Specify Latitude Direction",
       "You must specify a Latitude Direction."},
      {FlexList::LongitudeDirection,
       geographic,
       {"E", "W"},
       "Specify Longitude Direction",
       "You must specify a Longitude Direction."},
  };
  for (const Check& c : checks) {
    const std::string& value = r[c.list];
    if (!c.applies) continue;
    const std::string key = FlexListKey(c.list);
    if (value.empty()) {
      ui.exclaim(std::string(c.text) + "\r\nThe format '" + r.name + "' of '" + store.path() +
                     "' has no key \"" + key + "\", and none is remembered under \"" + section +
                     "\".",
                 c.title);
      return std::nullopt;
    }
    if (std::find(c.allowed.begin(), c.allowed.end(), value) == c.allowed.end()) {
      const std::string where = fromFormat[static_cast<int>(c.list)]
                                    ? "of the format '" + r.name + "' of '" + store.path() + "'"
                                    : std::string("remembered under \"") + section + "\"";
      ui.exclaim(
          "The " + key + " '" + value + "' " + where + " must be " + JoinedOr(c.allowed) + ".",
          "Invalid " + key);
      return std::nullopt;
    }
  }
  return r;
}

// The reference as the reader's or writer's choices.
template <typename Choices>
void FillChoices(const Reference& r, Choices& c) {
  c.formatName = r.name;
  c.coordinateSystem = r[FlexList::CoordinateSystem];
  c.zone = r[FlexList::Zone];
  c.horizontalDatum = r[FlexList::HorizontalDatum];
  c.horizontalUnits = r[FlexList::HorizontalUnits];
  c.verticalDatum = r[FlexList::VerticalDatum];
  c.verticalUnits = r[FlexList::VerticalUnits];
  c.latitudeDirection = r[FlexList::LatitudeDirection];
  c.longitudeDirection = r[FlexList::LongitudeDirection];
}

}  // namespace

std::optional<FlexInChoices> UnattendedFlexInChoices(Ui& ui, const std::string& appFolder,
                                                     const SettingsStore& remembered,
                                                     const std::string& formatName) {
  std::optional<Reference> r =
      Resolve(ui, FlexDirection::In, appFolder, remembered, formatName, nullptr);
  if (!r) return std::nullopt;
  FlexInChoices c;
  FillChoices(*r, c);
  return c;
}

std::optional<FlexOutChoices> UnattendedFlexOutChoices(Ui& ui, const std::string& appFolder,
                                                       const SettingsStore& remembered,
                                                       const std::string& formatName,
                                                       const FileHeader* file) {
  std::optional<Reference> r =
      Resolve(ui, FlexDirection::Out, appFolder, remembered, formatName, file);
  if (!r) return std::nullopt;
  FlexOutChoices c;
  FillChoices(*r, c);
  return c;
}

}  // namespace zv
