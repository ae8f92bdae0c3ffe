#pragma once
// Search and replace over a VORN tagged file, driven by a command file
// (".TRN"): each command either replaces tag lines that hold a given value
// or changes the value of every line with a tag by arithmetic suited to the
// tag's record-code category.

#include <istream>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/Ui.h"

namespace zv {

enum class ReplaceCategory { None, Bearing, PointId, Angle, Seconds, Math };

// One parsed command line.
struct ReplaceCommand {
  std::string text;    // the command line as written
  size_t lineNo = 0;   // its line in the command file
  std::string tag;     // first word up to and including its first ":"
  std::string search;  // the rest of the first word
  bool arithmetic = false;
  char op = 0;                // '+', '-', '*' or '/'
  double operand = -99999.0;  // the number after the operator
  double angleOperand = 0;    // the operand as a packed angle, radians (Angle, Bearing)
  ReplaceCategory category = ReplaceCategory::None;
  std::string replacement;  // replacement commands: the new text
};

// Parses one command line; shows the "Invalid TRN." message and returns
// false when the command is invalid.
bool ParseReplaceCommand(Ui& ui, std::string_view line, size_t lineNo, ReplaceCommand& command);

// The new value text of an arithmetic command on `value`; the operand is
// given as written in the command. nullopt when the operand or the value is
// not what the category needs (nothing shown then, except the messages of
// the angle parsers). A point name that would grow past 8 characters shows
// "Point ID Assignment Error." and keeps its value.
std::optional<std::string> ApplyArithmetic(Ui& ui, std::string_view value,
                                           std::string_view operandText, std::string_view category,
                                           char op);

// The "Replace" routine: filters the input file through the command file
// into the output file (temporary file, then renamed into place). Shows its
// messages; false when nothing was written.
bool SearchAndReplace(Ui& ui, const std::string& inputPath, const std::string& outputPath,
                      const std::string& commandFilePath);

// The same on streams, appending the output lines (CR LF) to `output`; the
// paths are only used in messages.
bool SearchAndReplaceStreams(Ui& ui, std::istream& input, std::istream& commands,
                             std::string& output, const std::string& inputPath,
                             const std::string& commandFilePath);

}  // namespace zv
