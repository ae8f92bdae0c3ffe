#pragma once
// Angles in the four text formats, hemisphere conventions and linear units.
// Angles are double-precision radians; -99999 is the no-value marker and
// passes through every routine.

#include <string>
#include <string_view>
#include <vector>

#include "platform/Numbers.h"
#include "platform/Ui.h"

namespace zv {

inline constexpr double kPi = 3.14159265358979;
inline constexpr double kDegreesToRadians = 0.017453292519943278;
inline constexpr double kRadiansToDegrees = 57.29577951308238;
inline constexpr double kFullCircle = 6.28318530717958;
// The degree sign (character 176) as the program writes it: UTF-8.
inline constexpr const char* kDegreeSign = "\xC2\xB0";

inline constexpr const char* kFormatDMS = "DDD MM SS.ssss";
inline constexpr const char* kFormatPacked = "DDD.MMSSssss";
inline constexpr const char* kFormatDecimal = "DDD.dddddd";
inline constexpr const char* kFormatDM = "DDD MM.mmmm";

inline constexpr const char* kMeters = "Meters";
inline constexpr const char* kUsSurveyFeet = "U.S. Survey Feet";
inline constexpr const char* kInternationalFeet = "International Feet";

// The four format names and the three unit names, in list order.
std::vector<std::string> AngleFormatNames();
std::vector<std::string> LinearUnitNames();

// Parsers. Limit violations show their "Invalid Angle" message through the
// UI and return -99999. A field that is missing or not a number throws
// ZvError (the caller reports it).
double Angles_TextToRadians(Ui& ui, std::string_view text, std::string_view format);
double Angles_DMSToRadians(Ui& ui, std::string_view text);
double Angles_PackedToRadians(Ui& ui, std::string_view text);
double Angles_DecimalToRadians(std::string_view text);
double Angles_DMToRadians(Ui& ui, std::string_view text);

// Formatters. Seconds (or the minutes of the DM form) that round to 60 at
// the requested decimals carry into the next field (45 30 00.0000, never
// 45 29 60.0000), and an angle that rounds to zero prints without "-".
std::string Angles_RadiansToDecimal(double radians, int decimals, bool withSymbols);
std::string Angles_RadiansToDM(double radians, int decimals, bool withSymbols);
std::string Angles_RadiansToDMS(Ui& ui, double radians, int decimals, bool withSymbols);
std::string Angles_RadiansToPacked(Ui& ui, double radians, int decimals);

double Angles_ConvertHemisphere(double radians, std::string_view from, std::string_view to);
double Distances_Convert(double value, std::string_view fromUnit, std::string_view toUnit);

}  // namespace zv
