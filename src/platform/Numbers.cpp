#include "platform/Numbers.h"

#include <charconv>
#include <cmath>
#include <cstring>

#include "platform/Strings.h"

namespace zv {

namespace {

bool IsDigit(char c) {
  return c >= '0' && c <= '9';
}

constexpr double kPow10[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,  1e8,  1e9,  1e10, 1e11,
                             1e12, 1e13, 1e14, 1e15, 1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};

// Plain decimals of at most 15 digits ("-1234.5678"): the digits and the
// power of ten are exact doubles, so one correctly rounded division gives the
// double nearest to the text (Clinger, "How to read floating point numbers
// accurately", 1990, the fast path). False for anything else.
bool QuickDecimal(std::string_view s, double& value) {
  size_t i = 0;
  const bool negative = !s.empty() && s[0] == '-';
  if (!s.empty() && (s[0] == '-' || s[0] == '+')) ++i;
  long long digits = 0;
  int count = 0;
  int decimals = 0;
  bool point = false;
  for (; i < s.size(); ++i) {
    const char c = s[i];
    if (IsDigit(c)) {
      if (++count > 15) return false;
      digits = digits * 10 + (c - '0');
      decimals += point;
    } else if (c == '.' && !point) {
      point = true;
    } else {
      return false;
    }
  }
  if (count == 0) return false;
  value = static_cast<double>(digits) / kPow10[decimals];
  if (negative) value = -value;
  return true;
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
  double quick = 0;
  if (QuickDecimal(Trim(text), quick)) return quick;
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

namespace {

// The integer nearest to value x 10^decimals, rounded as the exact decimal
// expansion of the double rounds. The product is formed in extended
// precision, whose error stays far below the guard band around a tie; near a
// tie, or out of range, it answers false and the caller takes the exact path.
bool ScaledRound(double value, int decimals, long long& rounded) {
  if (decimals < 0 || decimals > 22 || !std::isfinite(value)) return false;
  // Below 2^36 a double product is off by at most 2^-17.
  double quick = value * kPow10[decimals];
  if (quick > -68719476736.0 && quick < 68719476736.0) {
    double magnitude = std::fabs(quick);
    double whole = std::floor(magnitude);
    double fraction = magnitude - whole;
    if (std::fabs(fraction - 0.5) < 2e-4) return false;
    long long m = static_cast<long long>(whole) + (fraction > 0.5 ? 1 : 0);
    rounded = quick < 0 ? -m : m;
    return true;
  }
  long double scaled = static_cast<long double>(value) * kPow10[decimals];
  long double magnitude = scaled < 0 ? -scaled : scaled;
  if (magnitude >= 1e15L) return false;
  long double whole = std::floor(magnitude);
  long double fraction = magnitude - whole;
  if (std::fabs(fraction - 0.5L) < 2e-4L) return false;
  long long m = static_cast<long long>(whole) + (fraction > 0.5L ? 1 : 0);
  rounded = scaled < 0 ? -m : m;
  return true;
}

}  // namespace

size_t FormatFixedTo(char* buffer, double value, int decimals) {
  long long r = 0;
  if (decimals <= 18 && ScaledRound(value, decimals, r)) {
    char* p = buffer;
    if (r < 0) *p++ = '-';  // a value that rounds to zero has no sign
    unsigned long long m = r < 0 ? static_cast<unsigned long long>(-r) : r;
    char digits[24];
    int n = 0;
    do {
      digits[n++] = static_cast<char>('0' + m % 10);
      m /= 10;
    } while (m > 0);
    while (n <= decimals) digits[n++] = '0';  // at least one whole digit
    for (int i = n - 1; i >= decimals; --i) *p++ = digits[i];
    if (decimals > 0) {
      *p++ = '.';
      for (int i = decimals - 1; i >= 0; --i) *p++ = digits[i];
    }
    return static_cast<size_t>(p - buffer);
  }
  auto [ptr, ec] = std::to_chars(buffer, buffer + 400, value, std::chars_format::fixed, decimals);
  if (ec != std::errc()) {
    buffer[0] = '0';
    return 1;
  }
  size_t len = static_cast<size_t>(ptr - buffer);
  if (buffer[0] == '-' &&
      std::string_view(buffer, len).find_first_of("123456789") == std::string_view::npos) {
    std::memmove(buffer, buffer + 1, --len);  // no negative zero
  }
  return len;
}

void AppendFixed(std::string& out, double value, int decimals) {
  char buf[400];
  out.append(buf, FormatFixedTo(buf, value, decimals));
}

double RoundToDecimals(double value, int decimals) {
  long long r = 0;
  // r and 10^decimals are exact doubles, so one correctly rounded division
  // gives the double nearest to the decimal text.
  if (ScaledRound(value, decimals, r)) return static_cast<double>(r) / kPow10[decimals];
  char buf[400];
  size_t len = FormatFixedTo(buf, value, decimals);
  double out = 0;
  std::from_chars(buf, buf + len, out);
  return out;
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
