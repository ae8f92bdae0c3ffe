#include "tools/SearchReplace.h"

#include <charconv>
#include <cmath>
#include <fstream>

#include "geodesy/Angles.h"
#include "platform/ForwardingUi.h"
#include "platform/Numbers.h"
#include "platform/TextIo.h"
#include "survey/SurveyFiles.h"
#include "survey/SurveyModel.h"

namespace zv {

namespace {

constexpr double kHalfPi = 1.570796326794895;
constexpr double kThreeHalfPi = 4.712388980384685;
constexpr double kSecondsToRadians = kDegreesToRadians / 3600;
constexpr size_t kMaxPointName = 8;
// The longest tail of a point name tried as a number: names have at most 8
// characters, so this only bounds the work on values that are not names.
constexpr size_t kMaxNumericTail = 64;

ReplaceCategory CategoryFromText(std::string_view text) {
  if (text == "Bearing") return ReplaceCategory::Bearing;
  if (text == "PointID") return ReplaceCategory::PointId;
  if (text == "Angle") return ReplaceCategory::Angle;
  if (text == "Seconds") return ReplaceCategory::Seconds;
  if (text == "Math") return ReplaceCategory::Math;
  return ReplaceCategory::None;
}

double Combine(double a, char op, double b) {
  switch (op) {
    case '+':
      return a + b;
    case '-':
      return a - b;
    case '*':
      return a * b;
    default:
      return a / b;
  }
}

// Up to 15 significant digits, no trailing zeros, exponent form ("1E+15")
// only for very large or very small magnitudes.
void AppendGeneral(std::string& out, double value) {
  char buf[64];
  auto [ptr, ec] = std::to_chars(buf, buf + sizeof buf, value, std::chars_format::general, 15);
  std::string_view text(buf, ec == std::errc() ? static_cast<size_t>(ptr - buf) : 0);
  if (text == "-0") text = "0";
  size_t at = out.size();
  out.append(text);
  for (size_t i = at; i < out.size(); ++i) {
    if (out[i] == 'e') out[i] = 'E';
  }
}

// The operand as the text a packed-angle parser reads: as written when it
// is plain decimal notation (trailing zeros count there: 0.30 is 30
// minutes), otherwise the number's own text.
std::string PackedOperandText(std::string_view written, double operand) {
  if (!written.empty() && written.front() == '+') written.remove_prefix(1);
  if (written.find_first_of("eE") == std::string_view::npos) return std::string(written);
  std::string text;
  AppendGeneral(text, operand);
  return text;
}

// A packed angle in radians, or nullopt when the text is not one (the
// parser reports out-of-range minutes and seconds itself).
std::optional<double> PackedAngle(Ui& ui, std::string_view text) {
  try {
    double r = Angles_PackedToRadians(ui, text);
    if (r == kNoValue || !std::isfinite(r)) return std::nullopt;
    return r;
  } catch (const std::exception&) {
    return std::nullopt;
  }
}

struct Arithmetic {
  ReplaceCategory category = ReplaceCategory::None;
  char op = '+';
  double operand = 0;
  double angleOperand = 0;
};

enum class Outcome { Changed, BadValue, BadResult };

// True for the no-value marker, also when written with decimals
// ("-99999.0000", as the tagged writers put absent grid coordinates).
bool IsNoValueText(std::string_view v) {
  size_t first = v.find_first_not_of(" \t");
  if (first == std::string_view::npos || v[first] != '-') return false;
  return ToNumber(v) == kNoValue;
}

bool IsDigit(char c) {
  return c >= '0' && c <= '9';
}

// The length of the longest tail of `v` that is a number, trying tails of
// 1, 2, 3 ... characters and stopping at the first that is not; its value
// in `n`.
size_t NumericTail(std::string_view v, double& n) {
  // Common case: a run of digits after a character that cannot extend a
  // number (a letter), or digits only.
  size_t digits = 0;
  while (digits < v.size() && IsDigit(v[v.size() - 1 - digits])) ++digits;
  if (digits > 0 && digits <= 15 &&
      (digits == v.size() ||
       std::string_view("+-. \t").find(v[v.size() - 1 - digits]) == std::string_view::npos)) {
    std::string_view run = v.substr(v.size() - digits);
    std::from_chars(run.data(), run.data() + run.size(), n);
    return digits;
  }
  size_t tail = 0;
  for (size_t k = 1; k <= v.size() && k <= kMaxNumericTail; ++k) {
    auto number = ToNumber(v.substr(v.size() - k));
    if (!number) break;
    tail = k;
    n = *number;
  }
  return tail;
}

// Appends the new value of `v` to `out`. BadValue and BadResult append
// nothing.
Outcome ApplyTo(Ui& ui, std::string_view v, const Arithmetic& a, std::string& out) {
  if (IsNoValueText(v)) {
    out.append(v);
    return Outcome::Changed;
  }
  switch (a.category) {
    case ReplaceCategory::PointId: {
      double n = 0;
      size_t tail = NumericTail(v, n);
      if (tail == 0) {
        out.append(v);
        return Outcome::Changed;
      }
      double r = std::nearbyint(Combine(std::nearbyint(n), a.op, a.operand));
      char digits[400];
      auto [end, ec] = std::to_chars(digits, digits + sizeof digits, r, std::chars_format::fixed);
      std::string_view text(digits, static_cast<size_t>(end - digits));
      if (text == "-0") text = "0";
      size_t length = v.size() - tail + text.size();
      if (!std::isfinite(r) || ec != std::errc() || length > kMaxPointName) {
        ui.exclaim("Point ID Assignment Error.", "Invalid Point ID");
        out.append(v);
        return Outcome::Changed;
      }
      out.append(v.substr(0, v.size() - tail));
      out.append(text);
      return Outcome::Changed;
    }
    case ReplaceCategory::Angle: {
      auto angle = PackedAngle(ui, v);
      if (!angle) return Outcome::BadValue;
      double r = Combine(*angle, a.op, a.angleOperand);
      if (!std::isfinite(r)) return Outcome::BadResult;
      if (r > kFullCircle) {
        // As subtracting full circles while above one: the result is in
        // (0, full circle].
        r = std::fmod(r, kFullCircle);
        if (r == 0) r = kFullCircle;
      }
      std::string text = Angles_RadiansToPacked(ui, r, 1);
      if (text == "-99999") return Outcome::BadResult;
      out += text;
      return Outcome::Changed;
    }
    case ReplaceCategory::Bearing: {
      if (v.size() < 3) return Outcome::BadValue;
      char first = v.front();
      char last = v.back();
      if ((first != 'N' && first != 'S') || (last != 'E' && last != 'W')) {
        return Outcome::BadValue;
      }
      auto angle = PackedAngle(ui, v.substr(1, v.size() - 2));
      if (!angle) return Outcome::BadValue;
      double z = *angle;
      if (first == 'N' && last == 'W') {
        z = kFullCircle - z;
      } else if (first == 'S' && last == 'E') {
        z = kPi - z;
      } else if (first == 'S' && last == 'W') {
        z = z + kPi;
      }
      z = Combine(z, a.op, a.angleOperand);
      if (!std::isfinite(z)) return Outcome::BadResult;
      // Into [0, full circle): due north is N0E.
      z = std::fmod(z, kFullCircle);
      if (z < 0) z += kFullCircle;
      if (z >= kFullCircle) z = 0;
      // Quadrants; the boundaries go to N90E (east), S0E (south) and N90W
      // (west).
      char n1 = 'N';
      char n2 = 'E';
      double q = z;
      if (z >= kThreeHalfPi) {
        n2 = 'W';
        q = kFullCircle - z;
      } else if (z > kPi) {
        n1 = 'S';
        n2 = 'W';
        q = z - kPi;
      } else if (z > kHalfPi) {
        n1 = 'S';
        q = kPi - z;
      }
      std::string text = Angles_RadiansToPacked(ui, q, 1);
      if (text == "-99999") return Outcome::BadResult;
      out += n1;
      out += text;
      out += n2;
      return Outcome::Changed;
    }
    case ReplaceCategory::Seconds: {
      auto number = ToNumber(v);
      if (!number) return Outcome::BadValue;
      double r = Combine(*number * kSecondsToRadians, a.op, a.operand * kSecondsToRadians);
      r = r * kRadiansToDegrees * 3600;
      if (!std::isfinite(r)) return Outcome::BadResult;
      AppendFixed(out, r, 3);
      return Outcome::Changed;
    }
    case ReplaceCategory::Math: {
      auto number = ToNumber(v);
      if (!number) return Outcome::BadValue;
      double r = Combine(*number, a.op, a.operand);
      if (!std::isfinite(r)) return Outcome::BadResult;
      AppendGeneral(out, r);
      return Outcome::Changed;
    }
    case ReplaceCategory::None:
      break;
  }
  return Outcome::BadValue;
}

const char* ValueNeeded(ReplaceCategory category) {
  switch (category) {
    case ReplaceCategory::Angle:
      return "The value is not a packed angle (DDD.MMSSssss).";
    case ReplaceCategory::Bearing:
      return "The value is not a quadrant bearing such as N45.3000E.";
    default:
      return "The value is not a number.";
  }
}

// Prepares the operand of an arithmetic command; an empty reason when it is
// usable.
std::string PrepareOperand(Ui& ui, std::string_view written, Arithmetic& a) {
  auto number = ToNumber(written);
  if (!number) return "The operand after the operator must be a number.";
  a.operand = *number;
  double divisor = a.operand;
  if (a.category == ReplaceCategory::Angle || a.category == ReplaceCategory::Bearing) {
    auto angle = PackedAngle(ui, PackedOperandText(written, a.operand));
    if (!angle) return "The operand is not a packed angle (DDD.MMSSssss).";
    a.angleOperand = *angle;
    divisor = a.angleOperand;
  }
  if (a.op == '/' && divisor == 0) return "The command divides by zero.";
  return {};
}

void ReportInvalid(Ui& ui, std::string_view line, size_t lineNo, const std::string& reason) {
  ui.exclaim("Invalid TRN.  The line '" + std::string(line) + "' is invalid.\r\nError on line " +
                 std::to_string(lineNo) + ".\r\n" + reason,
             "Invalid Search and Replace Command");
}

template <class Sink>
bool RunCommands(Ui& ui, std::istream& input, const std::string& inputPath,
                 const std::vector<ReplaceCommand>& commands, Sink& sink) {
  std::vector<Arithmetic> arithmetic(commands.size());
  for (size_t i = 0; i < commands.size(); ++i) {
    arithmetic[i] = {commands[i].category, commands[i].op, commands[i].operand,
                     commands[i].angleOperand};
  }
  LineReader reader(input, ui.progress());
  if (reader.isUtf16()) {
    ui.exclaim(Utf16Refusal(inputPath), kUtf16Title);
    return false;
  }
  std::string_view line;
  std::string buffers[2];
  std::string* owner = nullptr;  // the buffer the current entry lives in, if any
  size_t lineNo = 0;
  size_t written = 0;
  while (reader.next(line)) {
    ++lineNo;
    if (line.empty()) continue;
    std::string_view entry = line;
    owner = nullptr;
    for (size_t i = 0; i < commands.size(); ++i) {
      const ReplaceCommand& c = commands[i];
      if (entry.empty() || entry.front() != c.tag.front() || !entry.starts_with(c.tag)) continue;
      std::string_view rest = entry.substr(c.tag.size());
      if (!c.arithmetic) {
        if (rest == c.search) {
          entry = c.replacement;
          owner = nullptr;
        }
        continue;
      }
      std::string& target = owner == &buffers[0] ? buffers[1] : buffers[0];
      target.assign(c.tag);
      LineNoteUi noted(ui, lineNo);
      Outcome outcome = ApplyTo(noted, rest, arithmetic[i], target);
      if (outcome != Outcome::Changed) {
        ui.exclaim("The command '" + c.text + "' can not be applied to line " +
                       std::to_string(lineNo) + " of '" + inputPath + "':\r\n" +
                       std::string(entry) + "\r\n" +
                       (outcome == Outcome::BadValue ? ValueNeeded(c.category)
                                                     : "The result is out of range."),
                   "Invalid Search and Replace Value");
        return false;
      }
      entry = target;
      owner = &target;
    }
    sink.line(entry);
    ++written;
  }
  if (!reader.atEnd()) {
    ui.exclaim("The file '" + inputPath + "' could not be read to its end.", "Read Error");
    return false;
  }
  if (written == 0) {
    ui.exclaim("The file '" + inputPath + "' holds no lines.", "Empty File");
    return false;
  }
  return true;
}

bool ParseCommands(Ui& ui, std::istream& in, const std::string& path,
                   std::vector<ReplaceCommand>& commands) {
  LineReader reader(in);
  if (reader.isUtf16()) {
    ui.exclaim(Utf16Refusal(path), kUtf16Title);
    return false;
  }
  std::string_view line;
  size_t lineNo = 0;
  while (reader.next(line)) {
    ++lineNo;
    if (line.empty()) continue;
    ReplaceCommand c;
    if (!ParseReplaceCommand(ui, line, lineNo, c)) return false;
    commands.push_back(std::move(c));
  }
  if (!reader.atEnd()) {
    ui.exclaim("The file '" + path + "' could not be read to its end.", "Read Error");
    return false;
  }
  if (commands.empty()) {
    ui.exclaim("Invalid TRN.  The file '" + path + "' holds no commands.",
               "Invalid Search and Replace Command");
    return false;
  }
  return true;
}

struct StringSink {
  std::string& out;
  void line(std::string_view text) {
    out.append(text);
    out += "\r\n";
  }
};

}  // namespace

bool ParseReplaceCommand(Ui& ui, std::string_view line, size_t lineNo, ReplaceCommand& c) {
  c = ReplaceCommand{};
  c.text.assign(line);
  c.lineNo = lineNo;
  std::vector<std::string_view> words;
  for (size_t start = 0;;) {
    size_t blank = line.find(' ', start);
    words.push_back(line.substr(start, blank == std::string_view::npos ? blank : blank - start));
    if (blank == std::string_view::npos) break;
    start = blank + 1;
  }
  size_t colon = words[0].find(':');
  if (colon == std::string_view::npos) {
    ReportInvalid(ui, line, lineNo, "The first word must begin with a tag such as PN:.");
    return false;
  }
  c.tag.assign(words[0].substr(0, colon + 1));
  c.search.assign(words[0].substr(colon + 1));

  if (words.size() >= 2 && !words[1].empty() &&
      std::string_view("+-*/").find(words[1].front()) != std::string_view::npos) {
    c.arithmetic = true;
    c.op = words[1].front();
    std::string_view written = words[1].substr(1);
    if (!ToNumber(written)) {
      ReportInvalid(ui, line, lineNo, "The operand after the operator must be a number.");
      return false;
    }
    if (words.size() != 2) {
      ReportInvalid(ui, line, lineNo, "An arithmetic command must have exactly two words.");
      return false;
    }
    std::string categoryText = RecordCodeCategory(std::string_view(c.tag).substr(0, 2));
    c.category = CategoryFromText(categoryText);
    if (c.category == ReplaceCategory::None) {
      ReportInvalid(ui, line, lineNo, "The tag " + c.tag + " takes no arithmetic.");
      return false;
    }
    Arithmetic a{c.category, c.op, 0, 0};
    LineNoteUi noted(ui, lineNo);
    std::string reason = PrepareOperand(noted, written, a);
    if (!reason.empty()) {
      ReportInvalid(ui, line, lineNo, reason);
      return false;
    }
    c.operand = a.operand;
    c.angleOperand = a.angleOperand;
    return true;
  }

  if (words.size() < 2) {
    ReportInvalid(ui, line, lineNo,
                  "The command has no replacement text (end it with a blank to replace the "
                  "line by an empty line).");
    return false;
  }
  for (size_t i = 1; i < words.size(); ++i) {
    if (i > 1) c.replacement += words[i].size() >= 3 && words[i][2] == ':' ? "\r\n" : " ";
    c.replacement.append(words[i]);
  }
  return true;
}

std::optional<std::string> ApplyArithmetic(Ui& ui, std::string_view value,
                                           std::string_view operandText, std::string_view category,
                                           char op) {
  Arithmetic a;
  a.category = CategoryFromText(category);
  a.op = op;
  if (a.category == ReplaceCategory::None ||
      std::string_view("+-*/").find(op) == std::string_view::npos) {
    return std::nullopt;
  }
  if (!PrepareOperand(ui, operandText, a).empty()) return std::nullopt;
  std::string out;
  if (ApplyTo(ui, value, a, out) != Outcome::Changed) return std::nullopt;
  return out;
}

bool SearchAndReplaceStreams(Ui& ui, std::istream& input, std::istream& commands,
                             std::string& output, const std::string& inputPath,
                             const std::string& commandFilePath) {
  std::vector<ReplaceCommand> parsed;
  if (!ParseCommands(ui, commands, commandFilePath, parsed)) return false;
  std::string result;
  StringSink sink{result};
  if (!RunCommands(ui, input, inputPath, parsed, sink)) return false;
  output += result;
  return true;
}

bool SearchAndReplace(Ui& ui, const std::string& inputPath, const std::string& outputPath,
                      const std::string& commandFilePath) {
  for (const std::string* path : {&inputPath, &commandFilePath}) {
    if (!FileExists(*path)) {
      ui.exclaim("The file '" + *path + "' can not be found.", "File Not Found");
      return false;
    }
  }
  std::vector<ReplaceCommand> commands;
  {
    std::ifstream in(commandFilePath, std::ios::binary);
    if (!in) {
      ui.exclaim("The file '" + commandFilePath + "' can not be opened.", "File Not Found");
      return false;
    }
    if (!ParseCommands(ui, in, commandFilePath, commands)) return false;
  }
  std::ifstream in(inputPath, std::ios::binary);
  if (!in) {
    ui.exclaim("The file '" + inputPath + "' can not be opened.", "File Not Found");
    return false;
  }
  TextFileWriter out(outputPath);
  if (!out.open()) {
    ReportWriteFailure(ui, outputPath, out.error());
    return false;
  }
  ui.setBusy(true);
  bool ok = RunCommands(ui, in, inputPath, commands, out);
  ui.setBusy(false);
  if (!ok) return false;  // the temporary file is removed with `out`
  if (!out.commit()) {
    ReportWriteFailure(ui, outputPath, out.error());
    return false;
  }
  return true;
}

}  // namespace zv
