#pragma once
// User-defined files in an unattended run, where no dialog can be shown: the
// format is named (or is the one last used in the window) and the
// coordinate reference comes from the format's own section, else from the
// choices the dialog remembers.

#include <optional>
#include <string>

#include "platform/Settings.h"
#include "platform/Ui.h"
#include "userformats/FlexIn.h"
#include "userformats/FlexOut.h"

namespace zv {

// The choices for reading with the format `formatName` of flexin.ini (empty:
// the "Format" remembered under "FlexIn"). Each reference value comes from
// the key of the remembered settings' name in the format's section when it
// is there, else from "FlexIn". A missing or unknown format and missing or
// unknown units or directions are refused with a message naming them.
std::optional<FlexInChoices> UnattendedFlexInChoices(Ui& ui, const std::string& appFolder,
                                                     const SettingsStore& remembered,
                                                     const std::string& formatName);
// The same for writing with a format of flexout.ini ("FlexOut"). The writer
// converts units only: a coordinate system, zone or datum that the format
// does not give is the one `file` (the header of the points) names, before
// the remembered one; a geographic format's system is "Geographic
// Coordinates", without a zone.
std::optional<FlexOutChoices> UnattendedFlexOutChoices(Ui& ui, const std::string& appFolder,
                                                       const SettingsStore& remembered,
                                                       const std::string& formatName,
                                                       const FileHeader* file = nullptr);

}  // namespace zv
