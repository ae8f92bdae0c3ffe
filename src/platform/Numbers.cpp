#include "platform/Numbers.h"

#include <charconv>
#include <cmath>
#include <cstring>

namespace zv {

namespace {

bool IsBlank(char c) {
  return c == ' ' || c == '\t';
}

std::string_view Trim(std::string_view s) {
  while (!s.empty() && IsBlank(s.front())) s.remove_prefix(1);
  while (!s.empty() && IsBlank(s.back())) s.remove_suffix(1);
  return s;
}

bool IsDigit(char c) {
  return c >= '0' && c <= '9';
}

}  // namespace

bool IsNumeric(std::string_view text) {
  std::string_view s = Trim(text);
  size_t i = 0;
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) ++i;
  size_t digits = 0;
  while (i < s.size() && IsDigit(s[i])) ++i, ++digits;
  if (i < s.size() && s[i] == '.') {
    ++i;
    while (i < s.size() && IsDigit(s[i])) ++i, ++digits;
  }
  if (digits == 0) return false;
  if (i < s.size() && (s[i] == 'e' || s[i] == 'E')) {
    ++i;
    if (i < s.size() && (s[i] == '+' || s[i] == '-')) ++i;
    size_t expDigits = 0;
    while (i < s.size() && IsDigit(s[i])) ++i, ++expDigits;
    if (expDigits == 0) return false;
  }
  return i == s.size();
}

std::optional<double> ToNumber(std::string_view text) {
  if (!IsNumeric(text)) return std::nullopt;
  std::string_view s = Trim(text);
  if (!s.empty() && s.front() == '+') s.remove_prefix(1);
  double value = 0;
  auto [ptr, ec] = std::from_chars(s.data(), s.data() + s.size(), value);
  if (ec == std::errc::result_out_of_range) {
    // Underflow reads as zero; overflow is not a usable number.
    bool negativeExponent =
        s.find("e-") != std::string_view::npos || s.find("E-") != std::string_view::npos;
    if (negativeExponent) return 0.0;
    return std::nullopt;
  }
  if (ec != std::errc() || ptr != s.data() + s.size()) return std::nullopt;
  return value;
}

void AppendFixed(std::string& out, double value, int decimals) {
  char buf[400];
  auto [ptr, ec] = std::to_chars(buf, buf + sizeof buf, value, std::chars_format::fixed, decimals);
  if (ec != std::errc()) {
    out += "0";
    return;
  }
  std::string_view text(buf, static_cast<size_t>(ptr - buf));
  if (text.front() == '-' && text.find_first_of("123456789") == std::string_view::npos) {
    text.remove_prefix(1);  // no negative zero
  }
  out.append(text);
}

std::string FormatFixed(double value, int decimals) {
  std::string out;
  AppendFixed(out, value, decimals);
  return out;
}

std::string FormatPlainDecimal(double value) {
  char buf[400];
  auto [ptr, ec] = std::to_chars(buf, buf + sizeof buf, value, std::chars_format::fixed);
  if (ec != std::errc()) return "0";
  std::string text(buf, static_cast<size_t>(ptr - buf));
  if (text == "-0") text = "0";
  return text;
}

std::string FormatPadded(double value, int intDigits, int decimals) {
  std::string text = FormatFixed(value, decimals);
  bool negative = !text.empty() && text.front() == '-';
  if (negative) text.erase(0, 1);
  size_t point = text.find('.');
  size_t whole = point == std::string::npos ? text.size() : point;
  if (whole < static_cast<size_t>(intDigits)) text.insert(0, intDigits - whole, '0');
  return negative ? "-" + text : text;
}

std::string FormatGrouped(double value, int decimals) {
  std::string text = FormatFixed(value, decimals);
  size_t start = (!text.empty() && text.front() == '-') ? 1 : 0;
  size_t point = text.find('.');
  size_t end = point == std::string::npos ? text.size() : point;
  std::string out(text, 0, start);
  for (size_t i = start; i < end; ++i) {
    if (i > start && (end - i) % 3 == 0) out += ',';
    out += text[i];
  }
  out.append(text, end, std::string::npos);
  return out;
}

}  // namespace zv
