#pragma once
// The NGS datum-shift programs NADCON (horizontal shifts between NAD 27,
// NAD 83 and the state HPGN networks), VERTCON (NGVD 29 / NAVD 88 heights)
// and GEOID (intg: geoid heights). Each run writes the program's keyboard
// answers (.con), the points (.inp) and a batch file (.bat) into the
// program's folder under NGS/, runs the batch file and waits, reads the
// output (.out) back into the points and deletes every file it made.
//
// Only points written to the input file (those with latitude and
// longitude) take part. A run fails with a message when the program is
// missing, leaves no output, or returns no result for one of those points;
// the messages quote the program's own "ERROR: " lines (a missing grid file,
// a point outside every grid).

#include <string>
#include <vector>

#include "platform/Ui.h"
#include "survey/SurveyModel.h"

namespace zv {

// The prefix of the lines in which a program states why a point got no
// result; the programs write them to their standard output (file junk).
inline constexpr const char* kNgsErrorPrefix = "ERROR: ";

enum class NadconShift { Nad27ToNad83, Nad83ToNad27, Nad83ToHpgn, HpgnToNad83 };

struct NadconMethod {
  std::string name;
  NadconShift shift;
  std::string areaCode;  // two letters for the HPGN methods, else empty
};

// The 100 NADCON method names of datums.ini in the order the datum editor
// offers them: NAD 27 to NAD 83, NAD 83 to NAD 27, then for each of the 49
// HPGN areas the way there and back.
const std::vector<NadconMethod>& NadconMethods();
// The two VERTCON methods and the eight GEOID methods, in list order.
const std::vector<std::string>& VertconMethodNames();
const std::vector<std::string>& GeoidMethodNames();

// Shifts latitude and longitude of the points by the method of datums.ini.
bool Nadcon_Run(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                const std::string& method);
// Shifts Elevation: forward is NGVD 29 to NAVD 88.
bool Vertcon_Run(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
                 bool forward);
// Fills GeoidHeight and field 19 for a model name ("GEOID09"); for a GEOID
// method of datums.ini also the orthometric or the ellipsoid height.
bool Geoid_Run(Ui& ui, const std::string& appFolder, std::vector<SurveyPoint>& points,
               const std::string& request);

}  // namespace zv
