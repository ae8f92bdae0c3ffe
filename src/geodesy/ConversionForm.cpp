#include "geodesy/ConversionForm.h"

// Placeholder: the form logic is being written.

namespace zv {

std::string ConversionKey(FormSide side, FormField field) {
  static const char* kNames[] = {"Coordinate System", "Zone",           "Horizontal Datum",
                                 "Horizontal Units",  "Vertical Datum", "Vertical Units",
                                 "Geoid Model"};
  if (field == FormField::GeoidModel) return "Geoid Model";
  return std::string(side == FormSide::Input ? "Input " : "Output ") +
         kNames[static_cast<int>(field)];
}

ConversionForm::ConversionForm(std::string appFolder) : appFolder_(std::move(appFolder)) {}
void ConversionForm::load(const SettingsStore&, const ConversionSettings*) {}
void ConversionForm::choose(FormSide, FormField, const std::string&) {}
void ConversionForm::setScaleFactor(bool) {}
void ConversionForm::setConvergence(bool) {}
void ConversionForm::setLatLong(bool) {}
void ConversionForm::setGeoid(bool) {}
const FormList& ConversionForm::list(FormSide side, FormField field) const {
  return lists_[static_cast<int>(side)][static_cast<int>(field)];
}
std::optional<FormRefusal> ConversionForm::validate() const { return std::nullopt; }
ConversionSettings ConversionForm::settings() const { return {}; }
std::string ConversionForm::heightType() const { return "Ellipsoid"; }
ManualEntrySetup ConversionForm::manualEntrySetup() const { return {}; }
void ConversionForm::remember(SettingsStore&) const {}

bool AcceptConversion(Ui&, const std::string&, const ConversionForm&, ConversionState&,
                      SettingsStore&, const ConversionDialogs&) {
  return false;
}

std::optional<ConversionSettings> SettingsFromStore(Ui& ui, const std::string&,
                                                    const SettingsStore&,
                                                    const ConversionSettings*,
                                                    const std::string&) {
  ui.exclaim("Conversion settings are not available yet.");
  return std::nullopt;
}

std::optional<ManualRefusal> ValidateManualEntry(const ManualEntrySetup&,
                                                 const ManualEntryFields&) {
  return std::nullopt;
}
void FillManualPoint(Ui&, const ManualEntrySetup&, const ManualEntryFields&, SurveyPoint&) {}

}  // namespace zv
