#pragma once
// The one numeric test and the number formatters every format shares.
// Numbers are read and written with "." as the decimal point.

#include <optional>
#include <string>
#include <string_view>

namespace zv {

// A signed decimal number (optional exponent) with surrounding blanks allowed.
bool IsNumeric(std::string_view text);
// The value of a text that passes IsNumeric; nullopt otherwise.
std::optional<double> ToNumber(std::string_view text);

// Fixed notation with exactly `decimals` digits after the point, a leading
// zero, a minus sign for negatives and no digit grouping; never "-0.00".
std::string FormatFixed(double value, int decimals);
void AppendFixed(std::string& out, double value, int decimals);
// The same text into a buffer of at least 400 characters; returns its length.
size_t FormatFixedTo(char* buffer, double value, int decimals);

// The value of FormatFixed(value, decimals) read back as a double.
double RoundToDecimals(double value, int decimals);

// The shortest text that reads back as the same double, without exponent
// (an exponent form is expanded into leading or trailing zeros).
std::string FormatPlainDecimal(double value);

// Whole part zero-filled to at least `intDigits` digits, exactly `decimals`
// decimals: the "00.0000" patterns.
std::string FormatPadded(double value, int intDigits, int decimals);

// Fixed notation with "," digit grouping in the whole part.
std::string FormatGrouped(double value, int decimals);

}  // namespace zv

namespace zv {
// The no-value marker of every numeric field.
inline constexpr double kNoValue = -99999.0;
inline constexpr float kNoValueF = -99999.0f;
}  // namespace zv
