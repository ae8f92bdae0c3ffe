#pragma once
// The logic of the coordinate conversion dialogs, without widgets: the
// Coordinate Conversion form (its lists, enabling rules, validation, the
// settings it stores and remembers) and the manual entry form (one typed
// point). The Qt dialogs bind their controls to these classes; the
// unattended reprojection uses the same rules on stored settings.

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "geodesy/ConversionDriver.h"
#include "platform/Error.h"
#include "platform/Settings.h"
#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

inline constexpr const char* kConversionSection = "Coordinate Conversion";

enum class FormSide { Input, Output };
enum class FormField {
  CoordinateSystem,
  Zone,
  HorizontalDatum,
  HorizontalUnits,
  VerticalDatum,
  VerticalUnits,
  GeoidModel
};

// The persisted key of a field of one side ("Input Zone", "Output Vertical
// Units", "Geoid Model").
std::string ConversionKey(FormSide side, FormField field);

// One list of the form: its entries, the selected text (empty when none)
// and whether it is enabled.
struct FormList {
  std::vector<std::string> items;
  std::string selected;
  bool enabled = true;
};

struct FormOption {
  bool checked = false;
  bool enabled = true;
};

// A validation failure: the box's title and text, and the field that gets
// the focus.
struct FormRefusal {
  std::string title;
  std::string text;
  FormSide side = FormSide::Input;
  FormField field = FormField::CoordinateSystem;
};

// What the manual entry form is configured with before it is shown.
struct ManualEntrySetup {
  bool geographic = false;   // latitude and longitude, else northing and easting
  bool heightWanted = true;  // the height field is offered
  std::string verticalUnits;
  std::string heightType;       // "Orthometric" or "Ellipsoid"
  std::string angleFormat;      // the input horizontal units of a geographic side
  std::string horizontalUnits;  // the input horizontal units of a grid side
};

// The geoid models the GEOID program knows, in list order.
std::vector<std::string> GeoidModelNames();

// How the form shows a list that could not be filled: "Error: " + the
// description + CR LF + "Function: " + the source (exclamation icon).
void ShowListError(Ui& ui, const ZvError& error);

class ConversionForm {
 public:
  explicit ConversionForm(std::string appFolder);

  // Fills both coordinate-system lists (with "Geographic Coordinates"),
  // disables the geoid controls, and selects the remembered values of the
  // store's "Coordinate Conversion" section, each only when its list holds
  // it, in cascade order (a zone after its coordinate system, a datum after
  // its zone). When `preset` (the input side of a file's header or an
  // exchange request) has a non-empty input field, its non-empty input
  // fields take the place of the whole remembered input side, so the zone's
  // own datums and units fill what the preset leaves empty. A list that
  // cannot be filled throws ZvError (the form keeps what was filled).
  void load(const SettingsStore& store, const ConversionSettings* preset = nullptr);

  // A choice in a list, as a click does: the cascades and enabling rules.
  // An entry the list does not hold changes nothing. A list the cascade
  // cannot fill throws ZvError.
  void choose(FormSide side, FormField field, const std::string& value);
  // The option boxes; the geoid model list follows the geoid box.
  void setScaleFactor(bool checked);
  void setConvergence(bool checked);
  void setLatLong(bool checked);
  void setGeoid(bool checked);

  const FormList& list(FormSide side, FormField field) const;
  const FormOption& scaleFactor() const { return scaleFactor_; }
  const FormOption& convergence() const { return convergence_; }
  const FormOption& latLong() const { return latLong_; }
  const FormOption& geoid() const { return geoid_; }

  // The first failure of the OK checks, in their order; nullopt when all pass.
  std::optional<FormRefusal> validate() const;
  // The settings as the form holds them (after a passed validation). A
  // disabled option counts as not ticked; the geoid model goes with geoid
  // heights only; with input vertical datum "None" the output vertical units
  // are the input's.
  ConversionSettings settings() const;
  // "Orthometric" or "Ellipsoid", from the input vertical datum's type.
  std::string heightType() const;
  // The manual entry set-up for the current input side.
  ManualEntrySetup manualEntrySetup() const;
  // Writes every key of the "Coordinate Conversion" section: the lists as
  // they are selected, the boxes as ticked ("1" or "0").
  void remember(SettingsStore& store) const;

 private:
  FormList& at(FormSide side, FormField field);
  void chooseSystem(FormSide side);
  void chooseZone(FormSide side);
  // The input vertical datum rule: "None" holds the output vertical datum at
  // "None" and disables the vertical output and the geoid option.
  void applyInputVerticalDatum();
  void followGeoid();

  std::string appFolder_;
  FormList lists_[2][7];  // by side and field; the one geoid model list is the input's
  FormOption scaleFactor_, convergence_, latLong_, geoid_;
};

// What OK runs once the form validated: stores the settings into the state,
// asks for the point of a single-point run (false from enterPoint ends with
// false, nothing converted), converts the points, shows a single point's
// report, and on success sets the accepted flag and remembers the settings.
struct ConversionDialogs {
  std::function<bool(const ManualEntrySetup&, SurveyPoint&)> enterPoint;
  std::function<void(const std::string&)> showReport;
};
bool AcceptConversion(Ui& ui, const std::string& appFolder, const ConversionForm& form,
                      ConversionState& state, SettingsStore& store,
                      const ConversionDialogs& dialogs);

// The settings a dialog would accept from the store's "Coordinate
// Conversion" section (with `preset` as for load): nullopt and the
// refusal's message, naming the persisted key, when they would be refused.
std::optional<ConversionSettings> SettingsFromStore(Ui& ui, const std::string& appFolder,
                                                    const SettingsStore& store,
                                                    const ConversionSettings* preset,
                                                    const std::string& storeName);

// The manual entry form's fields as typed.
struct ManualEntryFields {
  std::string pointName;
  std::string latitude, longitude, latitudeDirection = "N", longitudeDirection = "W";
  std::string northing, easting;
  std::string height;
};
enum class ManualField { PointName, Latitude, Longitude, Northing, Easting, Height };
struct ManualRefusal {
  std::string title;
  std::string text;
  ManualField field = ManualField::Latitude;
};

// The OK checks of the manual entry form; nullopt when they pass.
std::optional<ManualRefusal> ValidateManualEntry(const ManualEntrySetup& setup,
                                                 const ManualEntryFields& fields);
// Resets the point and fills it from the checked fields: latitude and
// longitude in the set-up's angle format (blanks are separators of the
// spaced formats and are dropped from the others). False, after a message,
// when an angle cannot be read; the point's Latitude (or, when only that
// failed, Longitude) is then -99999.
bool FillManualPoint(Ui& ui, const ManualEntrySetup& setup, const ManualEntryFields& fields,
                     SurveyPoint& point);

}  // namespace zv
