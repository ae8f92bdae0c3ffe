#include "geodesy/Angles.h"

#include <charconv>
#include <cmath>

#include "platform/Error.h"
#include "platform/Strings.h"

namespace zv {

namespace {

constexpr const char* kInvalidAngleTitle = "Invalid Angle";
constexpr double kMaxSeconds = 59.9999999999999;

bool IsDigit(char c) {
  return c >= '0' && c <= '9';
}

[[noreturn]] void TypeMismatch(const char* routine) {
  throw ZvError(13, "Type mismatch", std::string("modAngles.") + routine);
}

// A whole-number field ([+-]digits) that must fit in 16 bits.
int ParseWhole(std::string_view s, const char* routine) {
  size_t i = 0;
  bool negative = false;
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) negative = s[i++] == '-';
  if (i == s.size()) TypeMismatch(routine);
  long value = 0;
  for (; i < s.size(); ++i) {
    if (!IsDigit(s[i])) TypeMismatch(routine);
    value = value * 10 + (s[i] - '0');
    if (value > 32768) throw ZvError(6, "Overflow", std::string("modAngles.") + routine);
  }
  if (negative) value = -value;
  if (value > 32767) throw ZvError(6, "Overflow", std::string("modAngles.") + routine);
  return static_cast<int>(value);
}

// A decimal-number field ([+-]digits[.digits][e[+-]digits]).
double ParseDecimal(std::string_view s, const char* routine) {
  std::optional<double> v = ToNumber(s);
  if (!v) TypeMismatch(routine);
  return *v;
}

// Rounds to 15 significant digits (the precision the angle arithmetic keeps).
double Round15(double v) {
  if (v == 0 || !std::isfinite(v)) return v;
  // 15 significant digits are 14 - (decimal exponent) decimals.
  static constexpr double kPowers[] = {1e0, 1e1, 1e2, 1e3, 1e4, 1e5, 1e6, 1e7, 1e8};
  double magnitude = std::abs(v);
  int exponent = 0;
  if (magnitude >= 1 && magnitude < 1e8) {
    while (magnitude >= kPowers[exponent + 1]) ++exponent;
  } else {
    exponent = static_cast<int>(std::floor(std::log10(magnitude)));
    if (magnitude >= std::pow(10.0, exponent + 1)) ++exponent;
    if (magnitude < std::pow(10.0, exponent)) --exponent;
  }
  int decimals = 14 - exponent;
  if (decimals >= 0 && decimals <= 22) return RoundToDecimals(v, decimals);
  char buf[40];
  auto res = std::to_chars(buf, buf + sizeof buf, v, std::chars_format::scientific, 14);
  double out = v;
  std::from_chars(buf, res.ptr, out);
  return out;
}

// A double as the message boxes quote it: at most 15 significant digits.
std::string QuoteValue(double v) {
  char buf[40];
  auto res = std::to_chars(buf, buf + sizeof buf, v, std::chars_format::general, 15);
  return std::string(buf, res.ptr);
}

bool CheckLimits(Ui& ui, std::string_view quoted, double minutes, double seconds) {
  if (!(minutes >= 0 && minutes <= 59)) {
    ui.message("Invalid Angle '" + std::string(quoted) +
                   "'. Minutes portion must be positive and not exceed 59.",
               Icon::Exclamation, Buttons::Ok, kInvalidAngleTitle);
    return false;
  }
  if (!(seconds >= 0 && seconds <= kMaxSeconds)) {
    ui.message("Invalid Angle '" + std::string(quoted) +
                   "'. Seconds portion must be positive and not exceed 59.9999999999999.",
               Icon::Exclamation, Buttons::Ok, kInvalidAngleTitle);
    return false;
  }
  return true;
}

double ToRadians(bool negative, int degrees, double minutes, double seconds) {
  double d = Round15(std::abs(degrees) + minutes / 60 + seconds / 3600) * kDegreesToRadians;
  return negative ? -d : d;
}

// Splits at blanks (runs of blanks count as one); at most `count` fields.
int SplitFields(std::string_view text, std::string_view* fields, int count) {
  std::string_view s = Trim(text);
  int n = 0;
  while (!s.empty() && n < count) {
    size_t blank = s.find(' ');
    fields[n++] = s.substr(0, blank);
    if (blank == std::string_view::npos) break;
    s = Trim(s.substr(blank));
  }
  return n;
}

// The degrees field: its value and whether a leading "-" makes the angle
// negative (also for "-0").
int ParseDegrees(std::string_view field, bool& negative, const char* routine) {
  negative = !field.empty() && field.front() == '-';
  return ParseWhole(field, routine);
}

// An angle broken into the printed fields of the DMS and packed forms.
struct DmsText {
  bool ok = true;
  bool negative = false;
  double degrees = 0;  // whole degrees (magnitude)
  int minutes = 0;     // whole minutes
  char seconds[64];    // seconds, "00." pattern with the requested decimals
  size_t secondsLength = 0;
};

// The degrees of step "decimal text with decimals + 4 digits, read back".
double RoundedDegrees(double radians, int decimals) {
  return RoundToDecimals(radians * kRadiansToDegrees, decimals + 4);
}

// Zero-filled to two integer digits with exactly `decimals` decimals.
size_t FormatTwoDigits(char* out, size_t size, double value, int decimals) {
  char buf[400];
  size_t len = FormatFixedTo(buf, value, decimals);
  size_t whole = 0;
  while (whole < len && IsDigit(buf[whole])) ++whole;
  size_t n = 0;
  for (size_t i = whole; i < 2 && n < size; ++i) out[n++] = '0';
  for (size_t i = 0; i < len && n < size; ++i) out[n++] = buf[i];
  return n;
}

bool IsSixty(const char* text, size_t len) {
  return len >= 2 && text[0] == '6' && text[1] == '0' && (len == 2 || text[2] == '.');
}

bool AllZero(const char* text, size_t len) {
  for (size_t i = 0; i < len; ++i) {
    if (text[i] >= '1' && text[i] <= '9') return false;
  }
  return true;
}

DmsText SplitDms(Ui& ui, double radians, int decimals) {
  DmsText t;
  if (decimals < 0) decimals = 0;
  if (decimals > 30) decimals = 30;
  double d = RoundedDegrees(radians, decimals);
  t.negative = d < 0;
  double ad = std::abs(d);
  double whole = std::trunc(ad);
  double m = (ad - whole) * 60;
  double wm = std::trunc(m);
  double s = (m - wm) * 60;
  bool minutesOk = wm >= 0 && wm <= 59;
  bool secondsOk = s >= 0 && s <= kMaxSeconds;
  if (!(minutesOk && secondsOk) && !CheckLimits(ui, QuoteValue(minutesOk ? s : wm), wm, s)) {
    t.ok = false;
    return t;
  }
  t.degrees = whole;
  t.minutes = static_cast<int>(wm);
  t.secondsLength = FormatTwoDigits(t.seconds, sizeof t.seconds, s, decimals);
  // Seconds that round to 60 carry into the minutes, and those into the degrees.
  if (IsSixty(t.seconds, t.secondsLength)) {
    t.secondsLength = FormatTwoDigits(t.seconds, sizeof t.seconds, 0.0, decimals);
    if (++t.minutes == 60) {
      t.minutes = 0;
      t.degrees += 1;
    }
  }
  if (t.negative && t.degrees == 0 && t.minutes == 0 && AllZero(t.seconds, t.secondsLength)) {
    t.negative = false;
  }
  return t;
}

void AppendWholeDegrees(std::string& out, double degrees) {
  if (degrees < 1e15) {
    char buf[24];
    auto res = std::to_chars(buf, buf + sizeof buf, static_cast<long long>(degrees));
    out.append(buf, res.ptr);
  } else {
    AppendFixed(out, degrees, 0);
  }
}

void AppendTwoDigitInt(std::string& out, int v) {
  out += static_cast<char>('0' + v / 10);
  out += static_cast<char>('0' + v % 10);
}

}  // namespace

std::vector<std::string> AngleFormatNames() {
  return {kFormatDMS, kFormatPacked, kFormatDecimal, kFormatDM};
}

std::vector<std::string> LinearUnitNames() {
  return {kMeters, kUsSurveyFeet, kInternationalFeet};
}

double Angles_TextToRadians(Ui& ui, std::string_view text, std::string_view format) {
  if (format == kFormatDMS) return Angles_DMSToRadians(ui, text);
  if (format == kFormatPacked) return Angles_PackedToRadians(ui, text);
  if (format == kFormatDecimal) return Angles_DecimalToRadians(text);
  if (format == kFormatDM) return Angles_DMToRadians(ui, text);
  ui.message("Unknown Angular Format. Can not convert angle to radians.", Icon::Exclamation,
             Buttons::Ok, "Invalid Angular Format");
  return kNoValue;
}

double Angles_DMSToRadians(Ui& ui, std::string_view text) {
  static constexpr const char* kRoutine = "Angles_DMSToRadians";
  std::string_view f[3];
  if (SplitFields(text, f, 3) < 3) TypeMismatch(kRoutine);
  bool negative = false;
  int degrees = ParseDegrees(f[0], negative, kRoutine);
  int minutes = ParseWhole(f[1], kRoutine);
  double seconds = ParseDecimal(f[2], kRoutine);
  if (!CheckLimits(ui, text, minutes, seconds)) return kNoValue;
  return ToRadians(negative, degrees, minutes, seconds);
}

double Angles_DMToRadians(Ui& ui, std::string_view text) {
  static constexpr const char* kRoutine = "Angles_DMToRadians";
  std::string_view f[2];
  if (SplitFields(text, f, 2) < 2) TypeMismatch(kRoutine);
  bool negative = false;
  int degrees = ParseDegrees(f[0], negative, kRoutine);
  double m = ParseDecimal(f[1], kRoutine);
  double minutes = std::trunc(m);
  double seconds = Round15((m - minutes) * 60);
  if (!CheckLimits(ui, text, minutes, seconds)) return kNoValue;
  return ToRadians(negative, degrees, minutes, seconds);
}

double Angles_PackedToRadians(Ui& ui, std::string_view text) {
  static constexpr const char* kRoutine = "Angles_PackedToRadians";
  std::string_view s = Trim(text);
  size_t point = s.find('.');
  bool negative = false;
  int degrees = ParseDegrees(s.substr(0, point), negative, kRoutine);
  int minutes = 0;
  double seconds = 0;
  if (point != std::string_view::npos) {
    std::string_view rest = s.substr(point + 1);
    std::string_view mm = rest.substr(0, 2);
    for (char c : mm) {
      if (!IsDigit(c)) TypeMismatch(kRoutine);
      minutes = minutes * 10 + (c - '0');
    }
    if (rest.size() >= 4) {
      // Seconds: the third and fourth digits, a point, and all the rest.
      char buf[128];
      if (rest.size() > sizeof buf - 1) TypeMismatch(kRoutine);
      size_t n = 0;
      for (size_t i = 2; i < rest.size(); ++i) {
        if (!IsDigit(rest[i])) TypeMismatch(kRoutine);
        if (i == 4) buf[n++] = '.';
        buf[n++] = rest[i];
      }
      std::from_chars(buf, buf + n, seconds);
    }
  }
  if (!CheckLimits(ui, text, minutes, seconds)) return kNoValue;
  return ToRadians(negative, degrees, minutes, seconds);
}

double Angles_DecimalToRadians(std::string_view text) {
  return ParseDecimal(Trim(text), "Angles_DecimalToRadians") * kDegreesToRadians;
}

std::string Angles_RadiansToDecimal(double radians, int decimals, bool withSymbols) {
  std::string out = FormatGrouped(radians * kRadiansToDegrees, decimals < 0 ? 0 : decimals);
  if (withSymbols) out += kDegreeSign;
  return out;
}

std::string Angles_RadiansToDM(double radians, int decimals, bool withSymbols) {
  if (decimals < 0) decimals = 0;
  if (decimals > 30) decimals = 30;
  double d = RoundedDegrees(radians, decimals);
  bool negative = d < 0;
  double ad = std::abs(d);
  double whole = std::trunc(ad);
  char minutes[64];
  size_t len = FormatTwoDigits(minutes, sizeof minutes, (ad - whole) * 60, decimals);
  // Minutes that round to 60 carry into the degrees.
  if (IsSixty(minutes, len)) {
    whole += 1;
    len = FormatTwoDigits(minutes, sizeof minutes, 0.0, decimals);
  }
  if (negative && whole == 0 && AllZero(minutes, len)) negative = false;
  std::string out;
  if (negative) out += '-';
  AppendWholeDegrees(out, whole);
  if (withSymbols) out += kDegreeSign;
  out += ' ';
  out.append(minutes, len);
  if (withSymbols) out += '\'';
  return out;
}

std::string Angles_RadiansToDMS(Ui& ui, double radians, int decimals, bool withSymbols) {
  DmsText t = SplitDms(ui, radians, decimals);
  if (!t.ok) return "-99999";
  std::string out;
  if (t.negative) out += '-';
  AppendWholeDegrees(out, t.degrees);
  if (withSymbols) out += kDegreeSign;
  out += ' ';
  AppendTwoDigitInt(out, t.minutes);
  if (withSymbols) out += '\'';
  out += ' ';
  out.append(t.seconds, t.secondsLength);
  if (withSymbols) out += '"';
  return out;
}

std::string Angles_RadiansToPacked(Ui& ui, double radians, int decimals) {
  DmsText t = SplitDms(ui, radians, decimals);
  if (!t.ok) return "-99999";
  std::string out;
  if (t.negative) out += '-';
  AppendWholeDegrees(out, t.degrees);
  out += '.';
  AppendTwoDigitInt(out, t.minutes);
  for (size_t i = 0; i < t.secondsLength; ++i) {
    if (t.seconds[i] != '.') out += t.seconds[i];
  }
  return out;
}

double Angles_ConvertHemisphere(double radians, std::string_view from, std::string_view to) {
  if (from == to) return radians;
  if (radians == kNoValue) return kNoValue;
  if ((from == "N" && to == "S") || (from == "S" && to == "N")) return -radians;
  if ((from == "E" && to == "W") || (from == "W" && to == "E")) return kFullCircle - radians;
  return kNoValue;
}

namespace {

// 0 meters, 1 U.S. survey feet, 2 international feet, -1 unknown.
int UnitClass(std::string_view unit) {
  if (unit == kMeters || unit == "M") return 0;
  if (unit == kUsSurveyFeet || unit == "F") return 1;
  if (unit == kInternationalFeet || unit == "I") return 2;
  return -1;
}

}  // namespace

double Distances_Convert(double value, std::string_view fromUnit, std::string_view toUnit) {
  if (fromUnit == toUnit) return value;
  if (value == kNoValue) return kNoValue;
  // Factors from row unit to column unit: meters, U.S. survey feet,
  // international feet. 3.2808333333333333 is 3937/1200; the two truncated
  // factors are kept as the catalogs and files have always used them.
  static constexpr double kFactor[3][3] = {
      {1, 3.2808333333333333, 3.280839895},
      {0.3048006096012192, 1, 1.000002},
      {0.3048, 0.999998, 1},
  };
  int from = UnitClass(fromUnit);
  int to = UnitClass(toUnit);
  if (from < 0 || to < 0) return kNoValue;
  return value * kFactor[from][to];
}

}  // namespace zv
